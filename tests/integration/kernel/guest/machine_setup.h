// What the first process of the guest does before and after the run.
#pragma once

namespace velkguest {

// Mounts the kernel's file systems and loads the driver; false when the device does not appear.
bool set_up();

// Takes the controller's interface from its driver while others have it open.
void unbind_driver();

[[noreturn]] void power_off();

}  // namespace velkguest
