// How a command ends that does not succeed, and the exit status that goes with it.
#ifndef MPCACTL_FAILURE_H
#define MPCACTL_FAILURE_H

#include "host/scalar_text.h"
#include "host/value.h"

#include <stdexcept>
#include <string>

namespace mpcactl {

inline constexpr int EXIT_FINE = 0;
inline constexpr int EXIT_CIM = 1;   // the provider answered an error, or made faults
inline constexpr int EXIT_USAGE = 2; // the command line or a file named there is wrong

// Wrong usage; the text says what is known instead.
class Usage_Error : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// An error that the object manager or the provider answered.
class Cim_Error : public std::runtime_error {
public:
    explicit Cim_Error(const host::Status& status)
        : std::runtime_error(
              host::rc_name(status.rc) + ": " +
              (status.message.empty() ? host::rc_sentence(status.rc) : status.message)) {}
};

// A word of the user's as messages show it: an empty one can be seen, a long one is cut.
inline std::string shown(const std::string& word) {
    return word.empty() ? "\"\"" : host::cut(word);
}

} // namespace mpcactl

#endif // MPCACTL_FAILURE_H
