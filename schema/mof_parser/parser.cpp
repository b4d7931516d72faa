#include "schema/mof_parser/lexer.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace mof {

namespace {

// Deeper than any sensible set of files; keeps a chain of includes from exhausting memory.
constexpr std::size_t MAX_INCLUDE_DEPTH = 16;
constexpr std::uint64_t MAX_ARRAY_LENGTH = 32767;

std::string shown(const Token& token) {
    switch (token.kind) {
    case Token::Kind::end:
        return "the end of the file";
    case Token::Kind::text:
        return "a text";
    case Token::Kind::integer:
    case Token::Kind::real:
        return "a number";
    case Token::Kind::character:
        return "a character";
    default:
        return "'" + token.text + "'";
    }
}

// ---- Fitting a value to its type ----

constexpr Integer_Range INTEGER_RANGES[] = {
    {Type::uint8, 0xFF},        {Type::sint8, 0x7F, 0x80},
    {Type::uint16, 0xFFFF},     {Type::sint16, 0x7FFF, 0x8000},
    {Type::uint32, 0xFFFFFFFF}, {Type::sint32, 0x7FFFFFFF, 0x80000000},
    {Type::uint64, ~0ull},      {Type::sint64, ~0ull >> 1, 1ull << 63},
};

} // namespace

const Integer_Range* integer_range(Type type) {
    for (const Integer_Range& range : INTEGER_RANGES)
        if (range.type == type)
            return &range;
    return nullptr;
}

namespace {

// 25 characters: yyyymmddhhmmss.mmmmmmsutc or ddddddddhhmmss.mmmmmm:000, with '*' for an unknown
// digit.
bool is_datetime(const std::string& text) {
    if (text.size() != 25 || text[14] != '.' ||
        std::string_view("+-:").find(text[21]) == std::string_view::npos)
        return false;
    for (std::size_t i = 0; i < text.size(); i++)
        if (i != 14 && i != 21 && text[i] != '*' && (text[i] < '0' || text[i] > '9'))
            return false;
    return text[21] != ':' || text.substr(22) == "000";
}

void fit_integer(Value& value, Type type) {
    if (value.kind != Value::Kind::integer)
        throw Error(value.position, std::string("expected a number of type ") + type_name(type));
    const Integer_Range& range = *integer_range(type);
    if (value.magnitude == 0)
        value.negative = false;
    if (value.magnitude > (value.negative ? range.below : range.max))
        throw Error(value.position, std::string("number out of the range of ") + type_name(type));
}

void fit_scalar(Value& value, Type type) {
    using Kind = Value::Kind;
    if (value.kind == Kind::null)
        return;
    if (integer_range(type)) {
        fit_integer(value, type);
        return;
    }
    switch (type) {
    case Type::boolean:
        if (value.kind != Kind::boolean)
            throw Error(value.position, "expected true or false");
        return;
    case Type::real32:
    case Type::real64:
        if (value.kind == Kind::integer) {
            value.real = static_cast<double>(value.magnitude) * (value.negative ? -1 : 1);
            value.kind = Kind::real;
        }
        if (value.kind != Kind::real)
            throw Error(value.position, "expected a number");
        if (type == Type::real32 && std::abs(value.real) > std::numeric_limits<float>::max())
            throw Error(value.position, "number out of the range of real32");
        return;
    case Type::char16:
        if (value.kind == Kind::integer && !value.negative && value.magnitude <= 0xFFFF)
            value.kind = Kind::character;
        if (value.kind != Kind::character)
            throw Error(value.position, "expected a 16-bit character");
        return;
    case Type::datetime:
        if (value.kind != Kind::text || !is_datetime(value.text))
            throw Error(value.position, "expected a datetime of 25 characters");
        return;
    case Type::string:
        if (value.kind != Kind::text)
            throw Error(value.position, "expected a text");
        return;
    default:
        throw Error(value.position, "a reference can have no default but null");
    }
}

void fit(Value& value, Type type, int array) {
    if (value.kind == Value::Kind::null)
        return;
    if (array == scalar) {
        if (value.kind == Value::Kind::array)
            throw Error(value.position, "a list of values for something that is no array");
        fit_scalar(value, type);
        return;
    }
    if (value.kind != Value::Kind::array)
        throw Error(value.position, "expected a list of values in braces");
    if (array > 0 && value.elements.size() > static_cast<std::size_t>(array))
        throw Error(value.position, "more values than the array has elements");
    for (Value& element : value.elements)
        fit_scalar(element, type);
}

// ---- The parser ----

class Parser {
public:
    explicit Parser(const Reader& reader) : _reader(reader) {}

    void open(std::string name, std::string text);
    Document run();

private:
    struct Source {
        std::string name;
        std::string text;
        Lexer lexer;
        Source(std::string file, std::string contents)
            : name(file), text(std::move(contents)),
              lexer(text, std::make_shared<const std::string>(std::move(file))) {}
    };

    void advance() { _token = _sources.back()->lexer.next(); }
    bool is_sign(char c) const { return _token.kind == Token::Kind::sign && _token.text[0] == c; }
    bool is_word(std::string_view word) const {
        return _token.kind == Token::Kind::word && same_name(_token.text, word);
    }
    bool take_sign(char c);
    void expect_sign(char c, const char* after);
    Token expect_word(const char* what);
    [[noreturn]] void refuse(const std::string& expected) const;

    void pragma();
    void include(const Token& name);
    void qualifier_declaration();
    std::vector<std::string> word_list(const char* what);
    Qualifiers qualifiers();
    void flavors();
    void class_declaration();
    Feature feature();
    std::vector<Parameter> parameters();
    void type_and_name(Declaration& declaration, const char* what);
    void subscript(Declaration& declaration);
    static void embedded_target(Declaration& declaration);
    Value scalar_value();
    Value value();
    std::string joined_text();
    // From a token's first byte to the end of the present one, which is a sign.
    std::string text_since(std::size_t start) const {
        return _sources.back()->text.substr(start, _token.offset + 1 - start);
    }

    const Reader& _reader;
    std::vector<std::unique_ptr<Source>> _sources; // the innermost include last
    Token _token;
    Document _document;
};

void Parser::open(std::string name, std::string text) {
    _document.files.push_back(name);
    _sources.push_back(std::make_unique<Source>(std::move(name), std::move(text)));
    advance();
}

Document Parser::run() {
    while (true) {
        if (_token.kind == Token::Kind::end) {
            // An include ends where its file ends: nothing of the including file is pending.
            _sources.pop_back();
            if (_sources.empty())
                return std::move(_document);
            advance();
        } else if (is_sign('#')) {
            pragma();
        } else if (is_sign('[') || is_word("class")) {
            class_declaration();
        } else if (is_word("qualifier")) {
            qualifier_declaration();
        } else if (is_word("instance")) {
            throw Error(_token.position, "instances are not read here, only classes");
        } else {
            refuse("expected a class, a qualifier declaration or a pragma");
        }
    }
}

bool Parser::take_sign(char c) {
    if (!is_sign(c))
        return false;
    advance();
    return true;
}

void Parser::expect_sign(char c, const char* after) {
    if (!take_sign(c))
        refuse(std::string("expected '") + c + "' " + after);
}

Token Parser::expect_word(const char* what) {
    if (_token.kind != Token::Kind::word)
        refuse(std::string("expected ") + what);
    Token word = std::move(_token);
    advance();
    return word;
}

void Parser::refuse(const std::string& expected) const {
    throw Error(_token.position, expected + ", found " + shown(_token));
}

void Parser::pragma() {
    advance();
    if (!is_word("pragma"))
        refuse("expected 'pragma' after '#'");
    advance();
    Token name = expect_word("the name of a pragma");
    expect_sign('(', "after the name of the pragma");
    if (_token.kind != Token::Kind::text)
        refuse("expected a text in the pragma");
    Token argument = _token;
    argument.text = joined_text();
    if (!is_sign(')'))
        refuse("expected ')' after the pragma's text");
    // The include opens before the token behind the parenthesis is read, which would be lost else.
    if (same_name(name.text, "include"))
        include(argument);
    else
        advance();
}

void Parser::include(const Token& name) {
    if (!_reader)
        throw Error(name.position, "an include cannot be followed here");
    const std::string& from = _sources.back()->name;
    std::size_t slash = from.rfind('/');
    bool beside = slash != std::string::npos && name.text.substr(0, 1) != "/";
    std::string path = beside ? from.substr(0, slash + 1) + name.text : name.text;
    for (const auto& source : _sources)
        if (source->name == path)
            throw Error(name.position, "'" + name.text + "' includes itself");
    if (_sources.size() >= MAX_INCLUDE_DEPTH)
        throw Error(name.position, "includes are nested too deep");
    std::optional<std::string> text = _reader(path);
    if (!text)
        throw Error(name.position, "cannot read '" + name.text + "'");
    open(std::move(path), std::move(*text));
}

// Qualifier Name : type [array] [= default], Scope(words) [, Flavor(words)];
void Parser::qualifier_declaration() {
    advance();
    Qualifier_Declaration declaration;
    Token name = expect_word("the name of the qualifier");
    declaration.name = name.text;
    declaration.position = name.position;
    expect_sign(':', "after the name of the qualifier");
    Declaration shape;
    Token type = expect_word("a type");
    std::optional<Type> code = type_by_name(type.text);
    if (!code || *code == Type::reference)
        throw Error(type.position, "unknown type '" + type.text + "'");
    declaration.type = shape.type = *code;
    subscript(shape);
    declaration.array = shape.array;
    if (take_sign('=')) {
        declaration.default_value = value();
        fit(*declaration.default_value, declaration.type, declaration.array);
    }
    while (take_sign(',')) {
        Token part = expect_word("'Scope' or 'Flavor'");
        if (same_name(part.text, "scope"))
            declaration.scopes = word_list("a scope");
        else if (same_name(part.text, "flavor"))
            declaration.flavors = word_list("a flavor");
        else
            throw Error(part.position, "expected 'Scope' or 'Flavor', found '" + part.text + "'");
    }
    expect_sign(';', "after the qualifier declaration");
    _document.qualifiers.push_back(std::move(declaration));
}

std::vector<std::string> Parser::word_list(const char* what) {
    std::vector<std::string> words;
    expect_sign('(', "before the list");
    do
        words.push_back(expect_word(what).text);
    while (take_sign(','));
    expect_sign(')', "after the list");
    return words;
}

// [Name, Name(value), Name{values}, Name : flavor flavor]
Qualifiers Parser::qualifiers() {
    Qualifiers list;
    advance();
    do {
        Token name = expect_word("a qualifier");
        if (find(list, name.text))
            throw Error(name.position, "qualifier '" + name.text + "' twice");
        Qualifier qualifier{name.text, {}, name.position};
        qualifier.value.kind = Value::Kind::boolean;
        qualifier.value.boolean = true;
        qualifier.value.position = name.position;
        if (take_sign('(')) {
            qualifier.value = scalar_value();
            expect_sign(')', "after the value of the qualifier");
        } else if (is_sign('{')) {
            qualifier.value = value();
        }
        if (take_sign(':'))
            flavors();
        list.push_back(std::move(qualifier));
    } while (take_sign(','));
    expect_sign(']', "after the qualifiers");
    return list;
}

// Flavours at a use are read and dropped: the rules of inheritance are fixed for what we use.
void Parser::flavors() {
    do
        expect_word("a flavor");
    while (_token.kind == Token::Kind::word);
}

void Parser::class_declaration() {
    Class declared;
    std::size_t start = _token.offset;
    if (is_sign('['))
        declared.qualifiers = qualifiers();
    if (!is_word("class"))
        refuse("expected 'class' after the qualifiers");
    advance();
    Token name = expect_word("the name of the class");
    declared.name = name.text;
    declared.position = name.position;
    if (take_sign(':')) {
        Token super = expect_word("the name of the superclass");
        declared.superclass = super.text;
        declared.superclass_position = super.position;
    }
    expect_sign('{', "before the features of the class");
    while (!is_sign('}'))
        declared.features.push_back(feature());
    advance();
    declared.text = text_since(start);
    expect_sign(';', "after the class");
    _document.classes.push_back(std::move(declared));
}

Feature Parser::feature() {
    Feature declared;
    const std::size_t start = _token.offset;
    if (is_sign('['))
        declared.qualifiers = qualifiers();
    type_and_name(declared, "a feature");
    if (declared.type == Type::reference)
        declared.kind = Feature_Kind::reference;
    if (take_sign('(')) {
        if (declared.kind == Feature_Kind::reference)
            throw Error(declared.position, "a method cannot return a reference");
        declared.kind = Feature_Kind::method;
        declared.parameters = parameters();
    } else {
        subscript(declared);
        if (take_sign('=')) {
            declared.default_value = value();
            fit(*declared.default_value, declared.type, declared.array);
        }
        embedded_target(declared);
    }
    declared.text = text_since(start);
    expect_sign(';', "after the feature");
    return declared;
}

std::vector<Parameter> Parser::parameters() {
    std::vector<Parameter> list;
    if (take_sign(')'))
        return list;
    do {
        Parameter parameter;
        if (is_sign('['))
            parameter.qualifiers = qualifiers();
        type_and_name(parameter, "a parameter");
        subscript(parameter);
        embedded_target(parameter);
        for (const Parameter& other : list)
            if (same_name(other.name, parameter.name))
                throw Error(parameter.position, "parameter '" + parameter.name + "' twice");
        list.push_back(std::move(parameter));
    } while (take_sign(','));
    expect_sign(')', "after the parameters");
    return list;
}

// "type name" or "Class ref name"
void Parser::type_and_name(Declaration& declaration, const char* what) {
    Token type = expect_word(what);
    if (is_word("ref")) {
        advance();
        declaration.type = Type::reference;
        declaration.target = type.text;
    } else {
        std::optional<Type> code = type_by_name(type.text);
        if (!code || *code == Type::reference)
            throw Error(type.position, "unknown type '" + type.text + "'");
        declaration.type = *code;
    }
    Token name = expect_word("a name");
    declaration.name = name.text;
    declaration.position = name.position;
}

void Parser::subscript(Declaration& declaration) {
    if (!take_sign('['))
        return;
    declaration.array = variable_array;
    if (_token.kind == Token::Kind::integer) {
        if (_token.negative || _token.magnitude == 0 || _token.magnitude > MAX_ARRAY_LENGTH)
            throw Error(_token.position, "an array has 1 to 32767 elements");
        declaration.array = static_cast<int>(_token.magnitude);
        advance();
    }
    expect_sign(']', "after the array");
}

void Parser::embedded_target(Declaration& declaration) {
    const Qualifier* embedded = find(declaration.qualifiers, "EmbeddedInstance");
    if (embedded) {
        if (embedded->value.kind != Value::Kind::text || embedded->value.text.empty())
            throw Error(embedded->position, "EmbeddedInstance needs the name of a class");
        declaration.target = embedded->value.text;
    }
    if (declaration.is_embedded() && declaration.type != Type::string)
        throw Error(declaration.position, "an embedded object is written as a string");
}

Value Parser::scalar_value() {
    Value result;
    result.position = _token.position;
    switch (_token.kind) {
    case Token::Kind::text:
        result.kind = Value::Kind::text;
        result.text = joined_text();
        return result;
    case Token::Kind::integer:
        result.kind = Value::Kind::integer;
        result.negative = _token.negative;
        result.magnitude = _token.magnitude;
        break;
    case Token::Kind::character:
        result.kind = Value::Kind::character;
        result.magnitude = _token.magnitude;
        break;
    case Token::Kind::real:
        result.kind = Value::Kind::real;
        result.real = _token.real;
        break;
    default:
        if (is_word("true") || is_word("false")) {
            result.kind = Value::Kind::boolean;
            result.boolean = is_word("true");
        } else if (!is_word("null")) {
            refuse("expected a value");
        }
    }
    advance();
    return result;
}

Value Parser::value() {
    if (!is_sign('{'))
        return scalar_value();
    Value result;
    result.kind = Value::Kind::array;
    result.position = _token.position;
    advance();
    if (take_sign('}'))
        return result;
    do
        result.elements.push_back(scalar_value());
    while (take_sign(','));
    expect_sign('}', "after the list of values");
    return result;
}

// Neighbouring texts are one text.
std::string Parser::joined_text() {
    std::string text;
    while (_token.kind == Token::Kind::text) {
        text += _token.text;
        advance();
    }
    return text;
}

} // namespace

Document parse_file(const std::string& path, const Reader& reader) {
    std::optional<std::string> text = reader(path);
    if (!text)
        throw Error({std::make_shared<const std::string>(path), 1, 1}, "cannot read the file");
    Parser parser(reader);
    parser.open(path, std::move(*text));
    return parser.run();
}

Document parse_text(std::string_view text, const std::string& file_name, const Reader& reader) {
    Parser parser(reader);
    parser.open(file_name, std::string(text));
    return parser.run();
}

} // namespace mof
