// Splits MOF text into tokens, and what numbers the types hold. Internal to the parser.
#ifndef SCHEMA_MOF_PARSER_LEXER_H
#define SCHEMA_MOF_PARSER_LEXER_H

#include "schema/mof_parser/mof.h"

namespace mof {

struct Token {
    enum class Kind : std::uint8_t { end, word, integer, real, text, character, sign };
    Kind kind = Kind::end;
    std::string text;            // a word or sign as written; the characters of a text
    bool negative = false;       // integer
    std::uint64_t magnitude = 0; // integer; the code of a character
    double real = 0;
    std::size_t offset = 0; // of the first byte
    Position position;
};

// The text must outlive the lexer.
class Lexer {
public:
    Lexer(std::string_view text, std::shared_ptr<const std::string> file)
        : _text(text), _file(std::move(file)) {}

    // The next token; the end again and again once it is reached. Throws Error.
    Token next();
    const std::string& file() const { return *_file; }

private:
    bool at_end() const { return _at >= _text.size(); }
    char peek(std::size_t ahead = 0) const {
        return _at + ahead < _text.size() ? _text[_at + ahead] : '\0';
    }
    char take();
    Position here() const { return {_file, _line, _column}; }
    void skip_blanks();
    Token read();
    void skip_comment();
    Token word();
    Token number();
    void integer(Token& token, std::string_view digits, unsigned base) const;
    Token text();
    Token character();
    std::uint32_t escape(); // the code behind a backslash
    std::uint32_t code_point(const Position& start);

    std::string_view _text;
    std::shared_ptr<const std::string> _file;
    std::size_t _at = 0;
    std::uint32_t _line = 1;
    std::uint32_t _column = 1;
};

struct Integer_Range {
    Type type;
    std::uint64_t max;       // largest value
    std::uint64_t below = 0; // magnitude of the smallest
};
// Null for a type that is no integer.
const Integer_Range* integer_range(Type type);

} // namespace mof

#endif // SCHEMA_MOF_PARSER_LEXER_H
