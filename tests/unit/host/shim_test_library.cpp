// A library to be opened.
extern "C" __attribute__((visibility("default"))) int velkshim_test_answer() {
    return 42;
}
