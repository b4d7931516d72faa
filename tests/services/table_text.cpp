#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
// What the sanitizers add hides from the compiler that <regex> sets a member.
#pragma GCC diagnostic ignored "-Wmaybe-uninitialized"
#endif
#include "tests/services/table_text.h"

#include <filesystem>
#include <fstream>
#include <functional>
#include <map>
#include <regex>
#include <set>

namespace services {

namespace {

std::string replaced(const std::string& text, const std::regex& form,
                     const std::function<std::string(const std::smatch&)>& by) {
    std::string result;
    std::smatch found;
    for (auto at = text.begin();;) {
        if (!std::regex_search(at, text.end(), found, form))
            return result.append(at, text.end());
        result.append(at, found[0].first) += by(found);
        at = found[0].second;
    }
}

using Words = std::map<std::string, std::string>;

std::string filled_in(const std::string& text, const Words& known) {
    static const std::regex name(R"(\$(\(([A-Z0-9_]+)\)|[A-Z][A-Z0-9_]*))"),
        times(R"(\{([^{}*]*)\*(\d+)\})"), byte(R"(\\x([0-9A-F]{2}))");
    const std::string whole = replaced(text, name, [&](const std::smatch& found) {
        const auto word = known.find(found[2].matched ? found[2] : found[1]);
        return word == known.end() ? throw std::runtime_error("unknown: " + found.str())
                                   : word->second;
    });
    const std::string spelt = replaced(whole, byte, [](const std::smatch& found) {
        return std::string(1, static_cast<char>(std::stoi(found[1], nullptr, 16)));
    });
    return replaced(spelt, times, [](const std::smatch& found) {
        std::string many;
        for (int i = std::stoi(found[2]); i > 0; --i)
            many += found[1];
        return many;
    });
}

std::vector<std::string> words_of(const std::string& text) {
    std::vector<std::string> words;
    bool quoted = false, within = false;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool escaped = text[i] == '\\' && text.substr(i + 1, 1) == "\"";
        const char c = escaped ? text[++i] : text[i];
        const bool quotes = c == '"' && !escaped;
        quoted ^= quotes;
        const bool blank = !quoted && c == ' ';
        if (!blank && !within)
            words.emplace_back();
        if (!blank && !quotes)
            words.back() += c;
        within = !blank;
    }
    return words;
}

Row row_of(const std::string& place, const std::string& text) {
    Row row;
    row.place = place;
    std::size_t bar = text.find(" | ");
    row.words = words_of(text.substr(0, bar));
    while (bar != text.npos) {
        const std::size_t next = text.find(" | ", bar + 3);
        row.lines.push_back(text.substr(bar + 3, next == text.npos ? next : next - bar - 3));
        bar = next;
    }
    const auto arrow = std::find(row.words.begin(), row.words.end(), "->");
    row.is_answered = arrow != row.words.end();
    if (row.is_answered)
        row.answer.assign(arrow + 1, row.words.end());
    row.words.erase(arrow, row.words.end());
    row.verb = row.words.at(0);
    row.words.erase(row.words.begin());
    return row;
}

void read_table(const std::filesystem::path& path, std::vector<Table>& tables) {
    Words known = {{"SCENARIOS", VLN_SCENARIOS}};
    std::string host, text, line;
    int number = 0, begin = 0;
    const auto end_row = [&] {
        const std::string place = path.filename().string() + ":" + std::to_string(begin);
        const std::size_t blank = text.find(' ');
        const std::string verb = text.substr(0, blank);
        if (verb == "let") {
            const std::size_t end = text.find(' ', blank + 1);
            known[text.substr(blank + 1, end - blank - 1)] = filled_in(text.substr(end + 1), known);
        } else if (verb == "host") {
            host = filled_in(text.substr(blank + 1), known);
        } else if (verb == "test") {
            tables.push_back({path.stem().string() + "_" + text.substr(blank + 1), host, {}});
        } else if (!text.empty()) {
            tables.back().rows.push_back(row_of(place, filled_in(text, known)));
        }
        text.clear();
    };
    for (std::ifstream file(path); std::getline(file, line);) {
        ++number;
        if (line.starts_with('#'))
            continue;
        if (!line.starts_with(' ')) {
            end_row();
            begin = number;
        }
        text += line.starts_with(' ') ? line.substr(line.find_first_not_of(' ') - 1) : line;
    }
    end_row();
}

} // namespace

std::vector<Table> read_tables(const std::string& folder) {
    std::set<std::filesystem::path> files;
    for (const auto& entry : std::filesystem::directory_iterator(folder))
        files.insert(entry.path());
    std::vector<Table> tables;
    for (const auto& file : files)
        read_table(file, tables);
    return tables;
}

} // namespace services
