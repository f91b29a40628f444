// The lines that the views and the result table are made of.
#pragma once

#include "host/cli/report.h"
#include "host/cli/terminal.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace velkhost::cli {

inline constexpr std::size_t kUnlimited = static_cast<std::size_t>(-1);

// The columns that the ids need.
std::size_t widest(const std::vector<std::string> &ids);

// "2 packages for esxi-01.example.com, virtual clock, scenario default.toml".
std::string title_line(const RequestReport &request, std::size_t packages);

// "job VELK-1: 7 Completed"; "job VELK-1" while its state is not known.
std::string job_line(const JobReport &job);

// "[+00:00:31] zeb_fw_rxc  62  Updating ...", in at most `width` columns.
std::string change_line(const Terminal &terminal, std::int64_t at_us, std::size_t id_width,
                        const rig::PackageStatus &status, std::size_t width);

// The ink that a status is shown in.
Ink ink_of(const rig::PackageStatus &status);

// One character that says the same without colour.
std::string symbol_of(const Terminal &terminal, Outcome outcome);

}  // namespace velkhost::cli
