#include "tools/mpcactl/prompt.h"

#include "host/text.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iostream>

#ifdef MPCACTL_LINE_EDITING
#include <editline/readline.h>
#endif

namespace mpcactl {

#ifdef MPCACTL_LINE_EDITING

namespace {

// The library's calls carry no context.
std::vector<std::string>& words() {
    static std::vector<std::string> list;
    return list;
}

// The next word that goes on from the text, in memory that the library frees; state 0: the first.
char* next_word(const char* text, int state) {
    static std::size_t at = 0;
    const std::size_t length = std::strlen(text);
    for (at = state == 0 ? 0 : at; at < words().size();)
        if (const std::string& word = words()[at++];
            host::same_name(std::string_view(word).substr(0, length), text))
            return strdup(word.c_str());
    return nullptr;
}

char** complete(const char* text, int, int) {
    return rl_completion_matches(text, next_word);
}

} // namespace

Prompt::Prompt(std::vector<std::string> list) {
    words() = std::move(list);
    rl_readline_name = "mpcactl";
    rl_attempted_completion_function = complete;
    using_history();
}

Prompt::~Prompt() {
    words().clear();
}

bool Prompt::read(const char* prompt, std::string& line) {
    char* const typed = readline(prompt);
    if (!typed) {
        std::printf("\n");
        return false;
    }
    line = typed;
    std::free(typed);
    if (!line.empty())
        add_history(line.c_str());
    return true;
}

#else

Prompt::Prompt(std::vector<std::string>) {}

Prompt::~Prompt() = default;

bool Prompt::read(const char* prompt, std::string& line) {
    std::printf("%s", prompt);
    std::fflush(stdout);
    return static_cast<bool>(std::getline(std::cin, line));
}

#endif

} // namespace mpcactl
