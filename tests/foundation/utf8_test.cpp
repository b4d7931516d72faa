#include "foundation/utf8.h"

#include <gtest/gtest.h>

namespace cimple {

namespace {

constexpr const char* BAD = "\xEF\xBF\xBD"; // U+FFFD

// In `expected`, '?' stands for a byte that was replaced.
struct Case {
    const char* what;
    std::string bytes;
    std::string expected;
};

std::string with_replacements(std::string expected) {
    for (std::size_t at = 0; (at = expected.find('?', at)) != std::string::npos; at += 3)
        expected.replace(at, 1, BAD);
    return expected;
}

TEST(Utf8, EachByteThatIsNoTextIsReplaced) {
    const Case cases[] = {
        {"nothing", "", ""},
        {"ASCII over several words", "VORLAN  ARRAY 0001", "VORLAN  ARRAY 0001"},
        {"a zero", std::string("a\0b", 3), std::string("a\0b", 3)},
        {"smallest of each length", "\xC2\x80 \xE0\xA0\x80 \xF0\x90\x80\x80",
         "\xC2\x80 \xE0\xA0\x80 \xF0\x90\x80\x80"},
        {"largest of each length", "\xDF\xBF \xEF\xBF\xBF \xF4\x8F\xBF\xBF",
         "\xDF\xBF \xEF\xBF\xBF \xF4\x8F\xBF\xBF"},
        {"around the surrogates", "\xED\x9F\xBF \xEE\x80\x80", "\xED\x9F\xBF \xEE\x80\x80"},
        {"surrogates", "\xED\xA0\x80 \xED\xBF\xBF", "??? ???"},
        {"overlong forms", "\xC0\x80 \xC1\xBF \xE0\x9F\xBF \xF0\x8F\xBF\xBF", "?? ?? ??? ????"},
        {"above the last character", "\xF4\x90\x80\x80 \xF5 \xFE \xFF", "???? ? ? ?"},
        {"tails alone", "a\x80\xBF z", "a?? z"},
        {"cut at the end", "a\xE2\x82", "a??"},
        {"cut by another character",
         "\xF0\x9F\x98"
         "A\xE2\x82\xAC",
         "???A\xE2\x82\xAC"},
        {"the last byte of a word",
         "1234567\xFF"
         "12345678",
         "1234567?12345678"},
        {"the first byte of a word",
         "12345678\xFF"
         "1234567",
         "12345678?1234567"},
    };
    for (const Case& row : cases) {
        const std::string expected = with_replacements(row.expected);
        EXPECT_EQ(to_utf8(row.bytes), expected) << row.what;
        EXPECT_EQ(is_utf8(row.bytes), row.bytes == expected) << row.what;
        EXPECT_TRUE(is_utf8(to_utf8(row.bytes))) << row.what;
    }
}

} // namespace

} // namespace cimple
