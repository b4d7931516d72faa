// What a rule answers that refuses a request. Rules look at values alone and know no library, no
// log and no lock: whoever asked them logs the line and answers the number.
#ifndef OPERATIONS_REFUSAL_H
#define OPERATIONS_REFUSAL_H

#include "cimple/types.h"

#include <optional>

namespace cimple {

struct Rule_Refusal {
    uint32 number;
    char line[160]; // of the log; empty for a refusal without words
};

using Refused = std::optional<Rule_Refusal>;

// As printf. A line that is too long is cut.
__attribute__((format(printf, 2, 3))) Rule_Refusal refusal(uint32 number, const char* format, ...);

} // namespace cimple

#endif // OPERATIONS_REFUSAL_H
