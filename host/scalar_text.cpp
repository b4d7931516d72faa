#include "host/scalar_text.h"

#include "host/datetime.h"
#include "host/text.h"

#include <charconv>
#include <cmath>

namespace host {

namespace {

std::string real_to_text(CMPIType type, double value) {
    if (std::isnan(value))
        return "NaN";
    if (std::isinf(value))
        return value < 0 ? "-INF" : "INF";
    char text[64];
    const auto end = type == CMPI_real32
                         ? std::to_chars(text, text + sizeof text, static_cast<float>(value))
                         : std::to_chars(text, text + sizeof text, value);
    std::string shortest(text, end.ptr);
    if (shortest.find_first_of(".e") == std::string::npos)
        shortest += ".0";
    return shortest;
}

template <class Number>
bool parse_number(std::string_view text, Number& number) {
    int base = 10;
    if (text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X')) {
        base = 16;
        text.remove_prefix(2);
    }
    const auto end = std::from_chars(text.data(), text.data() + text.size(), number, base);
    return end.ec == std::errc() && end.ptr == text.data() + text.size() && !text.empty();
}

std::string out_of_range(CMPIType type, std::string_view text) {
    return "\"" + cut(text) + "\" is no " + type_name(type);
}

Value integer_from_text(CMPIType type, std::string_view text, std::string& error) {
    std::uint64_t magnitude = 0;
    std::int64_t number = 0;
    if (is_signed(type)) {
        if (parse_number(text, number) && fits_signed(type, number))
            return Value::signed_number(type, number);
    } else if (parse_number(text, magnitude) && fits_unsigned(type, magnitude)) {
        return Value::unsigned_number(type, magnitude);
    }
    error = out_of_range(type, text);
    return Value::null(type);
}

Value real_from_text(CMPIType type, std::string_view text, std::string& error) {
    double number = 0;
    const auto end = std::from_chars(text.data(), text.data() + text.size(), number);
    if (text.empty() || end.ec != std::errc() || end.ptr != text.data() + text.size()) {
        error = out_of_range(type, text);
        return Value::null(type);
    }
    return Value::real(type, type == CMPI_real32 ? static_cast<float>(number) : number);
}

} // namespace

std::string number_to_text(const Value& value) {
    if (value.type == CMPI_boolean)
        return value.as_boolean() ? "TRUE" : "FALSE";
    if (is_real(value.type))
        return real_to_text(value.type, value.as_real());
    if (is_signed(value.type))
        return std::to_string(value.as_signed());
    return std::to_string(value.as_unsigned());
}

Value scalar_from_text(CMPIType type, std::string_view text, std::string& error) {
    switch (type) {
    case CMPI_boolean:
        if (same_name(text, "true") || same_name(text, "false"))
            return Value::boolean(same_name(text, "true"));
        error = "\"" + cut(text) + "\" is neither TRUE nor FALSE";
        return Value::null(type);
    case CMPI_string:
        return Value::text(std::string(text));
    case CMPI_dateTime:
        if (!parse_datetime(text))
            error = "\"" + cut(text) +
                    "\" is no datetime (yyyymmddhhmmss.mmmmmm+UTC or ddddddddhhmmss.mmmmmm:000)";
        return Value::datetime(std::string(text));
    case CMPI_real32:
    case CMPI_real64:
        return real_from_text(type, text, error);
    case CMPI_ref:
    case CMPI_instance:
        error = "an object cannot be read from this text";
        return Value::null(type);
    default:
        return integer_from_text(type, text, error);
    }
}

std::string cut(std::string_view text) {
    constexpr std::size_t LONGEST = 200;
    return text.size() > LONGEST ? std::string(text.substr(0, LONGEST)) + "..."
                                 : std::string(text);
}

} // namespace host
