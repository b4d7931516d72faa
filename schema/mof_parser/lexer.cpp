#include "schema/mof_parser/lexer.h"

#include <cmath>
#include <cstdlib>
#include <limits>

namespace mof {

namespace {

bool is_digit(char c) {
    return c >= '0' && c <= '9';
}
bool starts_word(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}
bool continues_word(char c) {
    return starts_word(c) || is_digit(c);
}
int digit_value(char c) {
    if (is_digit(c))
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return 16;
}

// As it appears in a message: printable, so that a stray byte cannot garble a terminal.
std::string shown(char c) {
    if (c >= ' ' && c <= '~')
        return std::string("'") + c + "'";
    static constexpr char HEX[] = "0123456789ABCDEF";
    auto byte = static_cast<unsigned char>(c);
    return std::string("byte 0x") + HEX[byte >> 4] + HEX[byte & 15];
}

void append_utf8(std::string& text, std::uint32_t code) {
    auto put = [&](std::uint32_t byte) { text.push_back(static_cast<char>(byte)); };
    if (code < 0x80) {
        put(code);
    } else if (code < 0x800) {
        put(0xC0 | (code >> 6));
        put(0x80 | (code & 0x3F));
    } else {
        put(0xE0 | (code >> 12));
        put(0x80 | ((code >> 6) & 0x3F));
        put(0x80 | (code & 0x3F));
    }
}

} // namespace

char Lexer::take() {
    char c = _text[_at++];
    if (c == '\n') {
        _line++;
        _column = 1;
    } else {
        _column++;
    }
    return c;
}

void Lexer::skip_blanks() {
    while (!at_end()) {
        char c = peek();
        if (c == ' ' || c == '\t' || c == '\n' || c == '\r' || c == '\f' || c == '\v')
            take();
        else if (c == '/' && (peek(1) == '/' || peek(1) == '*'))
            skip_comment();
        else
            return;
    }
}

void Lexer::skip_comment() {
    Position start = here();
    take();
    if (take() == '/') {
        while (!at_end() && peek() != '\n')
            take();
        return;
    }
    while (!at_end()) {
        if (take() == '*' && peek() == '/') {
            take();
            return;
        }
    }
    throw Error(start, "comment without end");
}

Token Lexer::next() {
    skip_blanks();
    std::size_t start = _at;
    Token token = read();
    token.offset = start;
    return token;
}

Token Lexer::read() {
    Token token;
    token.position = here();
    if (at_end())
        return token;
    char c = peek();
    if (starts_word(c))
        return word();
    if (is_digit(c) ||
        ((c == '+' || c == '-' || c == '.') && (is_digit(peek(1)) || peek(1) == '.')))
        return number();
    if (c == '"')
        return text();
    if (c == '\'')
        return character();
    if (std::string_view("{}[]();:,=#$").find(c) == std::string_view::npos)
        throw Error(token.position, "unexpected " + shown(c));
    token.kind = Token::Kind::sign;
    token.text = take();
    return token;
}

Token Lexer::word() {
    Token token;
    token.kind = Token::Kind::word;
    token.position = here();
    while (!at_end() && continues_word(peek()))
        token.text += take();
    return token;
}

// Decimal, octal (leading 0), hexadecimal (0x) and binary (trailing b) integers, and reals.
Token Lexer::number() {
    Token token;
    token.position = here();
    std::string written;
    while (!at_end()) {
        char c = peek();
        bool exponent_sign = (c == '+' || c == '-') && !written.empty() &&
                             (written.back() == 'e' || written.back() == 'E') &&
                             written.find_first_of("xX") == std::string::npos;
        bool leading_sign = (c == '+' || c == '-') && written.empty();
        if (!continues_word(c) && c != '.' && !exponent_sign && !leading_sign)
            break;
        written += take();
    }
    std::string_view digits = written;
    if (digits[0] == '+' || digits[0] == '-') {
        token.negative = digits[0] == '-';
        digits.remove_prefix(1);
    }
    bool hexadecimal = digits.size() > 2 && digits[0] == '0' && (digits[1] | 0x20) == 'x';
    if (hexadecimal) {
        integer(token, digits.substr(2), 16);
    } else if (digits.find_first_of(".eE") != std::string_view::npos) {
        char* end = nullptr;
        token.kind = Token::Kind::real;
        token.real = std::strtod(written.c_str(), &end);
        if (*end != '\0' || digits.find_first_of("xXpPiInN") != std::string_view::npos)
            throw Error(token.position, "'" + written + "' is no number");
        if (!std::isfinite(token.real))
            throw Error(token.position, "'" + written + "' is out of range");
    } else if (digits.size() > 1 && (digits.back() | 0x20) == 'b') {
        integer(token, digits.substr(0, digits.size() - 1), 2);
    } else {
        integer(token, digits, digits.size() > 1 && digits[0] == '0' ? 8 : 10);
    }
    return token;
}

void Lexer::integer(Token& token, std::string_view digits, unsigned base) const {
    token.kind = Token::Kind::integer;
    for (char c : digits) {
        auto digit = static_cast<unsigned>(digit_value(c));
        if (digit >= base)
            throw Error(token.position,
                        shown(c) + " is no digit of a number to base " + std::to_string(base));
        if (token.magnitude > (std::numeric_limits<std::uint64_t>::max() - digit) / base)
            throw Error(token.position, "number out of range");
        token.magnitude = token.magnitude * base + digit;
    }
}

// One quoted text; the parser joins neighbours.
Token Lexer::text() {
    Token token;
    token.kind = Token::Kind::text;
    token.position = here();
    take();
    while (!at_end() && peek() != '"' && peek() != '\n') {
        Position start = here();
        char c = take();
        if (c == '\0')
            throw Error(start, "zero byte in a text");
        if (c == '\\')
            append_utf8(token.text, escape());
        else
            token.text += c;
    }
    if (at_end() || peek() == '\n')
        throw Error(token.position, "text without closing quote");
    take();
    return token;
}

Token Lexer::character() {
    Token token;
    token.kind = Token::Kind::character;
    token.position = here();
    take();
    if (at_end() || peek() == '\n' || peek() == '\'')
        throw Error(token.position, "a character is missing");
    token.magnitude = code_point(token.position);
    if (at_end() || peek() != '\'')
        throw Error(token.position, "character without closing quote");
    take();
    return token;
}

// One UTF-8 character or escape; 16 bits are all that char16 holds.
std::uint32_t Lexer::code_point(const Position& start) {
    char c = take();
    if (c == '\\')
        return escape();
    auto byte = static_cast<unsigned char>(c);
    if (byte < 0x80)
        return byte;
    int more = (byte & 0xE0) == 0xC0 ? 1 : (byte & 0xF0) == 0xE0 ? 2 : -1;
    std::uint32_t code = more == 1 ? byte & 0x1Fu : byte & 0x0Fu;
    for (int i = 0; i < more; i++) {
        if ((static_cast<unsigned char>(peek()) & 0xC0) != 0x80)
            more = -1;
        else
            code = (code << 6) | (static_cast<unsigned char>(take()) & 0x3Fu);
    }
    if (more < 0)
        throw Error(start, "no 16-bit character");
    return code;
}

std::uint32_t Lexer::escape() {
    Position start = here();
    if (at_end())
        throw Error(start, "text without closing quote");
    char c = take();
    switch (c) {
    case 'b':
        return '\b';
    case 't':
        return '\t';
    case 'n':
        return '\n';
    case 'f':
        return '\f';
    case 'r':
        return '\r';
    case '"':
    case '\'':
    case '\\':
        return static_cast<unsigned char>(c);
    case 'x':
    case 'X':
        break;
    default:
        throw Error(start, shown(c) + " is no escape");
    }
    std::uint32_t code = 0;
    int digits = 0;
    for (; digits < 4 && digit_value(peek()) < 16; digits++)
        code = code * 16 + static_cast<std::uint32_t>(digit_value(take()));
    if (digits == 0 || code == 0)
        throw Error(start, "an escape needs one to four hexadecimal digits, and not zero");
    return code;
}

} // namespace mof
