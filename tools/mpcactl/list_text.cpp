#include "tools/mpcactl/list_text.h"

#include "tools/mpcactl/failure.h"

namespace mpcactl {

namespace {

// Where a name that begins at the position ends: at the position itself if there is none.
std::size_t end_of_name(std::string_view text, std::size_t at) {
    constexpr std::string_view letters =
        "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_";
    const std::size_t end = text.find_first_not_of(letters, at);
    return end == std::string_view::npos ? text.size() : end;
}

// "Key=": what may stand behind a comma within a path.
bool begins_with_key(std::string_view text) {
    const std::size_t end = end_of_name(text, 0);
    return end > 0 && end < text.size() && text[end] == '=';
}

// "Class.Key=" or "namespace:Class.Key=".
bool is_path(std::string_view element) {
    const std::size_t quote = element.find('"');
    const std::size_t colon = element.substr(0, quote).find(':');
    const std::size_t start = colon == std::string_view::npos ? 0 : colon + 1;
    const std::size_t end = end_of_name(element, start);
    return end > start && end < element.size() && element[end] == '.' &&
           begins_with_key(element.substr(end + 1));
}

// Behind the quoted text that begins at the position.
std::size_t end_of_quoted(std::string_view text, std::size_t at) {
    for (++at; at < text.size(); ++at) {
        if (text[at] == '\\')
            ++at;
        else if (text[at] == '"')
            return at + 1;
    }
    throw Usage_Error("a quote is not closed in the list " + std::string(text.substr(0, 200)) +
                      "\nA list may be written as JSON: [\"a\", \"b\"]");
}

std::size_t end_of_element(std::string_view list, std::size_t start) {
    std::size_t at = start;
    while (at < list.size()) {
        const bool quote_opens = list[at] == '"' && (at == start || list[at - 1] == '=');
        if (quote_opens)
            at = end_of_quoted(list, at);
        else if (list[at] != ',')
            ++at;
        else if (is_path(list.substr(start, at - start)) && begins_with_key(list.substr(at + 1)))
            ++at;
        else
            break;
    }
    return at;
}

std::string unquoted(std::string_view element) {
    if (!element.starts_with('"') || end_of_quoted(element, 0) != element.size())
        return std::string(element);
    std::string text;
    for (std::size_t i = 1; i + 1 < element.size(); ++i) {
        if (element[i] == '\\' && (element[i + 1] == '"' || element[i + 1] == '\\'))
            ++i;
        text += element[i];
    }
    return text;
}

} // namespace

std::vector<std::string> split_list(std::string_view text) {
    std::vector<std::string> elements;
    for (std::size_t start = 0; !text.empty() && start <= text.size();) {
        const std::size_t end = end_of_element(text, start);
        elements.push_back(unquoted(text.substr(start, end - start)));
        start = end + 1;
    }
    return elements;
}

} // namespace mpcactl
