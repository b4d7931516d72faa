// Texts of map builders.
#ifndef VLN_AGENT_TEXT_H
#define VLN_AGENT_TEXT_H

#include "cimple/string.h"

#include <string>

namespace cimple {

inline String text(const std::string& characters) {
    return String(characters.data(), characters.size());
}

// As printf, of any length.
__attribute__((format(printf, 1, 2))) String format_text(const char* format, ...);

} // namespace cimple

#endif // VLN_AGENT_TEXT_H
