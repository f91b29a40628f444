// A controller on a UNIX socket to which QEMU connects ("-chardev socket,path=...,reconnect=1").
#pragma once

#include "host/bmc/controller.h"

#include <filesystem>

namespace velkhost::bmc {

// A descriptor that closes itself.
class OwnedDescriptor {
  public:
    explicit OwnedDescriptor(int descriptor = -1) : descriptor_(descriptor) {}
    ~OwnedDescriptor();
    OwnedDescriptor(OwnedDescriptor &&other) noexcept;
    OwnedDescriptor &operator=(OwnedDescriptor &&other) noexcept;

    [[nodiscard]] int get() const { return descriptor_; }
    [[nodiscard]] bool is_open() const { return descriptor_ >= 0; }

  private:
    int descriptor_;
};

class QemuServer {
  public:
    // Listens at once; a socket file that is left over from an earlier run is replaced. Throws
    // std::system_error, with ENAMETOOLONG for a path that no socket can have.
    QemuServer(std::filesystem::path socket, Controller &controller);
    ~QemuServer();
    QemuServer(const QemuServer &) = delete;
    QemuServer &operator=(const QemuServer &) = delete;

    // Serves one connection after the other until `stop` becomes readable.
    void run(int stop);

  private:
    bool accept_one(int stop);
    bool serve_one(int stop);

    const std::filesystem::path socket_;
    Controller &controller_;
    OwnedDescriptor listener_;
    OwnedDescriptor connection_;
};

}  // namespace velkhost::bmc
