// The fixed paths that an install leaves files at.
#pragma once

namespace velk {

inline constexpr const char *kFileStore = "/var/tmp/filestore";
inline constexpr const char *kLockMarker = "/tmp/sfcb/velk.safelock";  // an install has run
inline constexpr const char *kStatusQueryRecord = "/tmp/sfcb/getVELKStatus.txt";

}  // namespace velk
