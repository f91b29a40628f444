// The fixture of the tests of whole requests.
#pragma once

#include "tests/conformance/conformance_test.h"
#include "tests/conformance/package_files.h"
#include "velk/package_table.h"

namespace velktest {

// The texts of the management controller's jobs.
inline constexpr const char *kJobDone = "0x00|Process Completed";

class RequestTest : public ConformanceTest {
  protected:
    std::string add(const Package &package) { return write_package(host().folder(), package); }
    std::string payload(const std::string &file) {
        return payload_location(host().folder(), {.file = file});
    }

    // The controller's jobs show these, one look after the other.
    void show(const std::vector<std::string> &looks) {
        for (const std::string &look : looks) {
            host().job().show(kit::Text(look));
        }
    }
    void show_done(int packages) {
        show(std::vector<std::string>(static_cast<std::size_t>(packages), kJobDone));
    }

    const velk::PackageRecord &record(int index) {
        return host().data<velk::PackageRecord[velk::kMaxPackages]>("pkgInstance")[index];
    }

    // What the packages of the request came to: "uefi: 50: Package installation successfully.".
    std::vector<std::string> results() {
        std::vector<std::string> texts;
        for (int i = 0; i < host().value("pkgnum"); ++i) {
            texts.emplace_back(record(i).installResult);
        }
        return texts;
    }

    // Every rewrite of a status file: "10 velkstatVELK-1.txt 1|uefi: 50: ..|".
    std::vector<std::string> history() {
        std::vector<std::string> lines;
        for (const FileWrite &write : host().status_writes()) {
            lines.push_back(std::to_string(static_cast<int>(write.at)) + " " +
                            std::filesystem::path(write.path).filename().string() + " " +
                            write.text);
        }
        return lines;
    }

    // The payloads that the controller was given, in order.
    std::vector<std::string> orders() {
        std::vector<std::string> locations;
        for (const auto &order : host().controller().orders) {
            locations.push_back(order.uri);
        }
        return locations;
    }

    static std::string deletion(const std::string &location) {
        return "invokeMethod zeb/cimv2:ZEB_FileTransferService.DeleteTransferredFile(FileURI=\"" +
               location + "\")";
    }

    static std::string installed(const std::string &file) {
        return file + ": 50: Package installation successfully.";
    }
    static std::string initialized(const std::string &file) {
        return file + ": 0: Package Initialization finished";
    }
    static std::string unreadable(const std::string &file) {
        return file + ": 12: Pakcage XML can't be opened.";
    }
    static std::string unsupported(const std::string &file) {
        return file + ": 80: This package is not supported by current VELK provider.";
    }
};

}  // namespace velktest
