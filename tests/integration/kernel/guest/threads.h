// Two threads at one device.
#pragma once

#include <string>

namespace velkguest {

// One asks for the device id, then the other for the type; when both answers are there the other
// fetches first. "device id got CMD, type got CMD", with the commands of the answers.
std::string ask_at_once(bool on_one_descriptor);

// One asks for the type and waits; meanwhile another closes the descriptor. How the wait ended, and
// what fetching the answer gives then.
std::string close_under_a_waiter();

}  // namespace velkguest
