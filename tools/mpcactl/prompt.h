// Lines from a terminal, with editing, history and completion where the library for it is there.
#ifndef MPCACTL_PROMPT_H
#define MPCACTL_PROMPT_H

#include <string>
#include <vector>

namespace mpcactl {

// One at a time.
class Prompt {
public:
    // The words are those that the tabulator completes.
    explicit Prompt(std::vector<std::string> words);
    ~Prompt();
    Prompt(const Prompt&) = delete;
    Prompt& operator=(const Prompt&) = delete;

    // False at the end of the input.
    bool read(const char* prompt, std::string& line);
};

} // namespace mpcactl

#endif // MPCACTL_PROMPT_H
