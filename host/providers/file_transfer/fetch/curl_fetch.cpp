#include "host/providers/file_transfer/fetch/curl_fetch.h"

#include <array>
#include <memory>

#include <curl/curl.h>

namespace velkhost::fetch {
namespace {

using providers::FetchOutcome;
using providers::FetchRequest;
using providers::FetchResult;

struct Cleanup {
    void operator()(CURL *handle) const { curl_easy_cleanup(handle); }
};
using Handle = std::unique_ptr<CURL, Cleanup>;

// What libcurl's callbacks share.
struct State {
    CURL *handle;
    FrameWriter &out;
    bool announced = false;
    const char *distrust = nullptr;  // why the server was not trusted
    std::array<char, CURL_ERROR_SIZE> message{};
};

bool announce(State &state) {
    if (state.announced) {
        return true;
    }
    state.announced = true;
    curl_off_t size = -1;
    curl_easy_getinfo(state.handle, CURLINFO_CONTENT_LENGTH_DOWNLOAD_T, &size);
    return size < 0 || state.out.size(static_cast<std::uint64_t>(size));
}

std::size_t take(const char *bytes, std::size_t width, std::size_t count, void *context) {
    State &state = *static_cast<State *>(context);
    const bool passed = announce(state) && state.out.data({bytes, width * count});
    return passed ? width * count : 0;
}

int judge_host_key(CURL * /*handle*/, const curl_khkey * /*known*/, const curl_khkey * /*found*/,
                   curl_khmatch match, void *context) {
    State &state = *static_cast<State *>(context);
    if (match == CURLKHMATCH_OK) {
        return CURLKHSTAT_FINE;
    }
    state.distrust = match == CURLKHMATCH_MISMATCH ? "The server's host key is not the known one"
                                                   : "The server's host key is not known";
    return CURLKHSTAT_REJECT;
}

void set_text(CURL *handle, CURLoption option, const std::string &text) {
    if (!text.empty()) {
        curl_easy_setopt(handle, option, text.c_str());
    }
}

// Only with what the request brings: without a type none of the user's own keys is tried.
void set_identity(CURL *handle, const FetchRequest &request) {
    long types = 0;
    types |= request.private_key.empty() ? 0 : CURLSSH_AUTH_PUBLICKEY;
    types |= request.password.empty() ? 0 : CURLSSH_AUTH_PASSWORD | CURLSSH_AUTH_KEYBOARD;
    curl_easy_setopt(handle, CURLOPT_SSH_AUTH_TYPES, types);
    set_text(handle, CURLOPT_USERNAME, request.user);
    set_text(handle, CURLOPT_PASSWORD, request.password);
    set_text(handle, CURLOPT_SSH_PRIVATE_KEYFILE, request.private_key);
}

void set_trust(CURL *handle, const FetchRequest &request, State &state) {
    const char *known = request.known_hosts.empty() ? "/dev/null" : request.known_hosts.c_str();
    curl_easy_setopt(handle, CURLOPT_SSH_KNOWNHOSTS, known);
    curl_easy_setopt(handle, CURLOPT_SSH_KEYFUNCTION, judge_host_key);
    curl_easy_setopt(handle, CURLOPT_SSH_KEYDATA, &state);
}

void set_limits(CURL *handle, const FetchRequest &request) {
    curl_easy_setopt(handle, CURLOPT_CONNECTTIMEOUT, static_cast<long>(request.connect_seconds));
    curl_easy_setopt(handle, CURLOPT_LOW_SPEED_LIMIT, 1L);
    curl_easy_setopt(handle, CURLOPT_LOW_SPEED_TIME, static_cast<long>(request.stall_seconds));
    curl_easy_setopt(handle, CURLOPT_TFTP_BLKSIZE, static_cast<long>(request.block_size));
}

void set_up(CURL *handle, const FetchRequest &request, State &state) {
    curl_easy_setopt(handle, CURLOPT_ERRORBUFFER, state.message.data());
    curl_easy_setopt(handle, CURLOPT_URL, request.url.c_str());
    curl_easy_setopt(handle, CURLOPT_PROTOCOLS_STR, request.scheme.c_str());
    curl_easy_setopt(handle, CURLOPT_PROXY, "");
    curl_easy_setopt(handle, CURLOPT_NOSIGNAL, 1L);
    curl_easy_setopt(handle, CURLOPT_WRITEFUNCTION, take);
    curl_easy_setopt(handle, CURLOPT_WRITEDATA, &state);
    set_identity(handle, request);
    set_trust(handle, request, state);
    set_limits(handle, request);
}

FetchResult result_of(CURLcode code) {
    switch (code) {
        case CURLE_OK:
            return FetchResult::kFetched;
        case CURLE_OPERATION_TIMEDOUT:
            return FetchResult::kTimedOut;
        case CURLE_URL_MALFORMAT:
        case CURLE_UNSUPPORTED_PROTOCOL:
            return FetchResult::kInvalid;
        default:
            return FetchResult::kFailed;
    }
}

// libcurl's longer message, but for TFTP, where it tells of a step that does not matter.
std::string text_of(CURLcode code, const FetchRequest &request, const State &state) {
    if (code == CURLE_OK) {
        return "";
    }
    if (state.distrust != nullptr) {
        return state.distrust;
    }
    const bool has_message = state.message[0] != '\0' && request.scheme != "tftp";
    return has_message ? state.message.data() : curl_easy_strerror(code);
}

}  // namespace

FetchOutcome fetch(const FetchRequest &request, FrameWriter &out) {
    const Handle handle(curl_easy_init());
    if (!handle) {
        return {FetchResult::kFailed, "libcurl cannot be used"};
    }
    State state{handle.get(), out};
    set_up(handle.get(), request, state);
    const CURLcode code = curl_easy_perform(handle.get());
    if (code == CURLE_OK) {
        announce(state);  // of an empty file
    }
    return {result_of(code), text_of(code, request, state)};
}

}  // namespace velkhost::fetch
