// Stored exchanges with a CIM server: what is sent on one connection, and what must come back.
//
//     ======> request
//     POST /cimom HTTP/1.1
//     Content-Length: *
//
//     <?xml ...
//     <====== answer
//     HTTP/1.1 200 OK
//     ...
//
// Lines of heads, and of bodies in chunks, end in CR LF on the wire. A length of "*" in a request
// is that of its body; anywhere in an answer "*" stands for any text within its line.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace velkhost::testing {

struct Exchange {
    std::string request;  // as it is sent
    std::string answer;   // as it is stored
};

// Throws std::runtime_error for a file that is none of these.
std::vector<Exchange> read_exchanges(const std::filesystem::path &file);

// Whether the bytes that came are those that are stored.
bool matches(const std::string &stored, const std::string &answer);

}  // namespace velkhost::testing
