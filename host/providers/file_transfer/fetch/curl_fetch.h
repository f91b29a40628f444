// One fetch with libcurl.
#pragma once

#include "host/providers/file_transfer/fetch/frame_writer.h"
#include "host/providers/file_transfer/fetch_protocol.h"

namespace velkhost::fetch {

// Fetches into `out`, all but the last frame. An SSH server is trusted if the request's known hosts
// have its key, and never otherwise. The user's own configuration, keys and proxies do not count.
providers::FetchOutcome fetch(const providers::FetchRequest &request, FrameWriter &out);

}  // namespace velkhost::fetch
