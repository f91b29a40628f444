// What a service's job says of an install, and what that means for the package. A service's texts
// are a vocabulary: rows that are tried in order, compared whole and with regard to case.
#pragma once

#include <cmpi/cmpidt.h>

#include <span>
#include <string_view>

#include "velk/status_report.h"

namespace velk {

struct Verdict {
    enum Next { kWait, kInstalled, kFailed };

    int code;
    const char *message;
    Next next;
};

struct VocabularyRow {
    std::string_view job_text;
    Verdict verdict;
};

// The verdict on a text that no vocabulary knows, and on a job that gives none.
inline constexpr Verdict kInstallErrorVerdict = {
    status_code::kInstallError, "Package installation error happened.", Verdict::kFailed};

// Reports a call that started no job, with the message of its status, and rejects the package.
void report_not_started(int index, const CMPIStatus &status);

inline Verdict judge(std::span<const VocabularyRow> vocabulary, std::string_view text) {
    for (const VocabularyRow &row : vocabulary) {
        if (row.job_text == text) {
            return row.verdict;
        }
    }
    return kInstallErrorVerdict;
}

}  // namespace velk
