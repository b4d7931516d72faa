#include "tools/mpcactl/script.h"

#include "tools/mpcactl/commands.h"
#include "tools/mpcactl/prompt.h"

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iostream>

namespace mpcactl {

namespace {

constexpr const char* PROMPT = "mpcactl> ";

void complain(const std::string& place, const std::string& what) {
    std::fflush(stdout);
    std::fprintf(stderr, "mpcactl: %s%s%s\n", place.c_str(), place.empty() ? "" : ": ",
                 what.c_str());
}

// Reads a word from a position that is no blank, and leaves the position behind it.
std::string read_word(std::string_view line, std::size_t& at) {
    std::string word;
    char quote = 0;
    for (; at < line.size(); ++at) {
        const char c = line[at];
        const bool escapes = c == '\\' && quote != '\'' && at + 1 < line.size() &&
                             (quote == 0 || line[at + 1] == '"' || line[at + 1] == '\\');
        if (escapes)
            word += line[++at];
        else if (quote != 0 && c == quote)
            quote = 0;
        else if (quote == 0 && (c == '"' || c == '\''))
            quote = c;
        else if (quote == 0 && (c == ' ' || c == '\t'))
            break;
        else
            word += c;
    }
    if (quote != 0)
        throw Usage_Error(std::string("the quote ") + quote + " is not closed");
    return word;
}

// Where lines come from. get reads the next one, whose number counts from 1; more: it goes on with
// the line before.
struct Lines {
    std::string name; // "": a terminal, where nobody needs to be told the place
    std::function<bool(std::string& line, bool more)> get;
};

// A command with the lines that it goes on over, which end in a backslash.
bool read_command(const Lines& lines, std::size_t& number, std::string& shown, std::string& text) {
    if (!lines.get(text, false))
        return false;
    for (++number, shown = text; text.ends_with('\\'); ++number) {
        std::string next;
        if (!lines.get(next, true))
            break;
        shown += "\n" + next;
        text.replace(text.size() - 1, 1, next);
    }
    return true;
}

struct Manner {
    bool echo = false; // lines before their output
    bool stop = false; // at the first failure
};

// Runs one line; done: it asks for the end.
int run_line(Session& session, const Command& defaults, const std::string& place,
             const std::string& text, bool& done) {
    Command command;
    try {
        const std::vector<std::string> words = split_words(text);
        done = !words.empty() && (words.front() == "quit" || words.front() == "exit");
        if (words.empty() || done || !read_line(words, defaults, command))
            return EXIT_FINE;
    } catch (const Usage_Error& error) {
        complain(place, error.what());
        return EXIT_USAGE;
    }
    return run_guarded(session, command, place);
}

// What would not end well on a terminal is not worth a try as a command either.
bool is_text(const std::string& line) {
    return std::all_of(line.begin(), line.end(), [](char c) {
        return static_cast<unsigned char>(c) >= ' ' || c == '\t' || c == '\n';
    });
}

bool is_command(const std::string& text) {
    const std::size_t start = text.find_first_not_of(" \t");
    return start != std::string::npos && text[start] != '#';
}

int run_lines(Session& session, const Command& defaults, const Lines& lines, Manner manner) {
    int first_failure = EXIT_FINE;
    bool done = false, any = false;
    std::size_t number = 0, start = 1;
    for (std::string shown, text; !done && read_command(lines, number, shown, text);
         start = number + 1) {
        if (!is_command(text))
            continue;
        const std::string place =
            lines.name.empty() ? "" : lines.name + ":" + std::to_string(start);
        if (!is_text(shown)) {
            complain(place, "this is no text, and so no script");
            return first_failure == EXIT_FINE ? EXIT_USAGE : first_failure;
        }
        if (manner.echo)
            std::printf("%s%s%s\n", any ? "\n" : "", PROMPT, shown.c_str());
        any = true;
        const int status = run_line(session, defaults, place, text, done);
        if (first_failure == EXIT_FINE)
            first_failure = status;
        if (manner.stop && status != EXIT_FINE)
            break;
    }
    return first_failure;
}

// Lines may end as on any system.
bool get_line(std::istream& stream, std::string& line) {
    if (!std::getline(stream, line))
        return false;
    if (line.ends_with('\r'))
        line.pop_back();
    return true;
}

} // namespace

std::vector<std::string> split_words(std::string_view line) {
    std::vector<std::string> words;
    for (std::size_t at = 0;;) {
        at = line.find_first_not_of(" \t", at);
        if (at == std::string_view::npos || line[at] == '#')
            return words;
        words.push_back(read_word(line, at));
    }
}

int run_guarded(Session& session, const Command& command, const std::string& place) {
    int status = EXIT_FINE;
    try {
        status = run_command(session, command);
    } catch (const Cim_Error& error) {
        complain(place, error.what());
        status = EXIT_CIM;
    } catch (const Usage_Error& error) {
        complain(place, error.what());
        status = EXIT_USAGE;
    }
    return std::max(status, session.report());
}

int run_script(Session& session, const Command& command) {
    Command defaults;
    defaults.name_space = command.name_space;
    defaults.format = command.format;
    defaults.wide = command.wide;
    const Manner manner{!command.quiet, command.stop};
    if (command.script == "-")
        return run_lines(
            session, defaults,
            {"standard input", [](std::string& line, bool) { return get_line(std::cin, line); }},
            manner);
    std::ifstream file(command.script);
    if (!file || std::filesystem::is_directory(command.script)) // a folder can be opened
        throw Usage_Error("the script " + shown(command.script) + " cannot be read");
    return run_lines(
        session, defaults,
        {command.script, [&](std::string& line, bool) { return get_line(file, line); }}, manner);
}

int run_prompt(Session& session, const Command& defaults) {
    std::vector<std::string> words = command_names();
    words.insert(words.end(), {"help", "quit"});
    for (const auto& known : session.classes().classes())
        words.push_back(known->name);
    Prompt prompt(std::move(words));
    return run_lines(session, defaults,
                     {"",
                      [&](std::string& line, bool more) {
                          std::fflush(stdout);
                          return prompt.read(more ? "> " : PROMPT, line);
                      }},
                     {});
}

} // namespace mpcactl
