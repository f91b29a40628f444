// A double of the host's unzip library, for the code under test in the test program.
#pragma once

#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace velktest {

// As long as it lives; one at a time.
class UnzipDouble {
  public:
    // Archives are unpacked to `folder` wherever they are to go.
    explicit UnzipDouble(std::filesystem::path folder);
    ~UnzipDouble();
    UnzipDouble(const UnzipDouble &) = delete;
    UnzipDouble &operator=(const UnzipDouble &) = delete;

    // Where the function is to be found.
    enum class Place { kProcess, kLibrary, kOtherLibrary, kNowhere };
    Place place = Place::kProcess;

    // What an archive holds: texts by their names in it. They are unpacked whatever the result is.
    std::map<std::string, std::string> files;
    int result = 0;

    // "<archive> to <directory>" of each call.
    std::vector<std::string> calls;

    // The libraries that were opened by name.
    std::vector<std::string> opened;

    int unzip(const std::string &archive, const std::string &directory);

  private:
    std::filesystem::path folder_;
};

}  // namespace velktest
