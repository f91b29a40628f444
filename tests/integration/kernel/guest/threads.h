// Two threads that ask the controller at once.
#pragma once

#include <string>

namespace velkguest {

// One asks for the device id, then the other for the type; when both answers are there the other
// fetches first. "device id got CMD, type got CMD", with the commands of the answers.
std::string ask_at_once(bool on_one_descriptor);

}  // namespace velkguest
