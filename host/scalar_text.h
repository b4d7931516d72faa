// Scalars as text and back, exactly: 64-bit integers, reals in their shortest form that reads back.
#ifndef HOST_SCALAR_TEXT_H
#define HOST_SCALAR_TEXT_H

#include "host/value.h"

namespace host {

// A boolean ("TRUE"), number or character code; reals have a point or an exponent.
std::string number_to_text(const Value& value);

// A scalar of the type from its text: decimal or 0x numbers, TRUE or FALSE in any case, a datetime
// in 25 characters, a string as it stands. References and objects are not read here. What is wrong
// goes to error.
Value scalar_from_text(CMPIType type, std::string_view text, std::string& error);

// A text of somebody else's as messages show it: a long one is cut.
std::string cut(std::string_view text);

} // namespace host

#endif // HOST_SCALAR_TEXT_H
