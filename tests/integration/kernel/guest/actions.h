// What the guest can be told to do, one word each, with arguments behind colons.
#pragma once

#include <string_view>

namespace velkguest {

// Does one action and prints "velk: ACTION RESULT":
//
//   open, close               connect_kcs, disconnect_kcs
//   start, status, end        the three operations of a session, on one handle
//   type                      get_bmc_type on the open channel
//   request:NETFN:CMD         send_IPMI_command without data, on the open channel; hexadecimal
//   install:QUERIES           a session with its watcher, closed while the watcher pauses
//   hurry:SECONDS             one that is closed after a second, and how long that may take
//   channels                  how many descriptors of the device are open
//   send:ID:NETFN:CMD         the driver's own calls on the open channel; see device.h
//   wait:MS
//   fetch, fetch:CAPACITY, keep:CAPACITY   keep: with the call that does not cut
//   codes, refusals
//   swap, apart               two threads that ask at once, on one descriptor or on two
//   closed                    a descriptor that is closed under a thread that waits at it
//   unbind                    takes the driver from the controller
//   log                       prints the debug log
void act(std::string_view action);

}  // namespace velkguest
