// The controller's flash subsystem behind one OEM command (network function 0x3A, command 0xF0).
//
// Request: operation code, 0, 0, length of the payload, payload elements.
// Response: completion code, operation code, result flag, 0, length of what follows, elements.
#pragma once

#include "host/bmc/answer.h"
#include "host/bmc/elements.h"
#include "host/bmc/message.h"
#include "host/bmc/transaction.h"

#include <string>
#include <vector>

namespace velkhost::bmc {

struct FlashOperation;

// A request as far as it can be understood.
struct FlashRequest {
    std::uint8_t completion = kCompleted;  // anything else: it cannot be served
    const FlashOperation *operation = nullptr;
    std::vector<Element> elements;

    [[nodiscard]] std::string name() const;   // "create"; "unknown" for an unknown operation
    [[nodiscard]] std::string words() const;  // "open 5 optfw 128"
};

FlashRequest read_flash_request(const Bytes &data);

// The well-formed answer that says no: everything but the result flag is as usual.
Answer refusal(std::uint8_t operation_code);

class FlashService {
  public:
    // `secure_mode` is the text of the variable of that name; one with "yes" in it, in any letter
    // case, selects secure mode.
    FlashService(std::string secure_mode, std::uint32_t first_handle);

    Answer serve(const FlashRequest &request);

    [[nodiscard]] TransactionState state() const { return transaction_.state(); }

  private:
    Answer create(const FlashRequest &request);
    Answer get_variable(const FlashRequest &request);
    Answer open(const FlashRequest &request);
    Answer step(const FlashRequest &request);

    const std::string secure_mode_;
    Transaction transaction_;

    friend struct FlashOperation;
};

}  // namespace velkhost::bmc
