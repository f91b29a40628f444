// Unpacking of adapter packages.
#pragma once

namespace velk::adapter {

// Unpacks the zip archive at the package location `local_uri` into the unpack directory with the
// host's unzip library. Returns 0, or another value when that failed: also for a location without
// a path and where there is no such library.
int unpack_package(const char *local_uri);

}  // namespace velk::adapter
