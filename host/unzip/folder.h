// Folders, reached part by part and never through a link, and the files that are made in them.
#pragma once

#include <span>
#include <string>

#include "host/unzip/descriptor.h"

namespace velkhost::unzip {

class Folder {
  public:
    // The folder at `path`, which is made with its parents where it is missing. Throws Failure.
    static Folder at(const std::string &path);

    // The folder that `parts` lead to from this one; each is made where it is missing. A link on
    // the way is refused. Throws Failure.
    [[nodiscard]] Folder inside(std::span<const std::string> parts) const;

    [[nodiscard]] int descriptor() const { return descriptor_.get(); }

  private:
    explicit Folder(Descriptor descriptor) : descriptor_(std::move(descriptor)) {}

    Descriptor descriptor_;
};

// A file that gets its name when it is complete; until then it has a name of no meaning, and it
// goes with this object. The folder must outlive it.
class NewFile {
  public:
    explicit NewFile(const Folder &folder);  // throws Failure
    ~NewFile();
    NewFile(const NewFile &) = delete;
    NewFile &operator=(const NewFile &) = delete;

    void write(std::span<const char> bytes);  // throws Failure

    // Ends the file and names it, in place of what had that name. Throws Failure.
    void complete(const std::string &name);

  private:
    int folder_;
    std::string temporary_name_;
    Descriptor descriptor_{-1};
};

}  // namespace velkhost::unzip
