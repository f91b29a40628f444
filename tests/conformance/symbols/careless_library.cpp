// What the shipped library must not be like; the checks have to say so.

#include <cstdlib>
#include <iostream>
#include <stdexcept>

extern "C" {

__attribute__((visibility("default"))) int expected_function = 0;  // data under a function's name

extern int name_of_the_host();
extern int native_clone_CMPIContext();

__attribute__((visibility("default"))) int surplus_function() {
    std::cout << "careless\n";
    if (std::getenv("HOME") == nullptr) {
        throw std::runtime_error("careless");
    }
    return expected_function + name_of_the_host() + native_clone_CMPIContext();
}
}
