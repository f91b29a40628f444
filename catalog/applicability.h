// Which of a package's payload files apply to which adapters. The unpacked package has a
// configuration file for that, read line by line with the scanners below; it is not parsed as XML:
//
//   <updateConfiguration>
//     <payload order="2">fw_a.bin</payload>
//       <applicability type="DFN">1234ABCD</applicability>
//     </payload>
//   </updateConfiguration>
#pragma once

#include "velk/api.h"

// Fills `PayloadDeviceIDArray` and `payloadnum` of package `idx` with the payloads for the adapters
// in its `DFNDeviceIDArray`. Returns 1 when the file was read through, also if nothing applies, and
// 0 when it is missing or a payload has no usable name; `payloadnum` then stays.
VELK_API int parsePayloadDeviceIDArray(int idx);

// Copies the configuration file's path into `buffer` of 1024 bytes. Returns 1.
VELK_API int findCfgFileName(char *buffer);

// The first character of `text` that is not a space.
VELK_API char *removeBlanks(char *text);

// Scanners of one line. Each returns a pointer into the line and stores the length found, or null
// with the length 0: the tag name after the first "<", the name of the first attribute, and the
// text between the first ">" and the next "<", line end or backspace.
VELK_API char *getProp(char *line, int *length);
VELK_API char *getSubProp(char *line, int *length);
VELK_API char *getPropValue(char *line, int *length);

// In place: removes trailing, then leading spaces and tabs; returns `text`. Traces what it does to
// standard output.
VELK_API char *trimString(char *text);

namespace velk {

// parsePayloadDeviceIDArray for `count` entries of `DFNDeviceIDArray` from `first` on.
int match_payloads(int index, int first, int count);

}  // namespace velk
