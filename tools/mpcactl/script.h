// Commands one a line, all over one session: from a file, from standard input, or typed.
#ifndef MPCACTL_SCRIPT_H
#define MPCACTL_SCRIPT_H

#include "tools/mpcactl/session.h"

#include <string>
#include <string_view>
#include <vector>

namespace mpcactl {

// The words of a line, quoted and escaped as in a shell; a word that begins with # ends the line.
// Throws Usage_Error for a quote that is not closed.
std::vector<std::string> split_words(std::string_view line);

// Runs the command of the settings: what it throws is told on standard error, behind the place if
// there is one, and faults of the provider are reported. The exit status.
int run_guarded(Session& session, const Command& command, const std::string& place = "");

// Runs the lines of the command's script. The status of the first line that failed.
int run_script(Session& session, const Command& command);

// Asks for lines on the terminal until their end. The status of the first line that failed.
int run_prompt(Session& session, const Command& defaults);

} // namespace mpcactl

#endif // MPCACTL_SCRIPT_H
