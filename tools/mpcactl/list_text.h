// Lists on the command line: a,b,"c, d" and lists of object paths.
#ifndef MPCACTL_LIST_TEXT_H
#define MPCACTL_LIST_TEXT_H

#include <string>
#include <string_view>
#include <vector>

namespace mpcactl {

// The elements of a list, between its commas. Those in double quotes and those between the keys of
// an object path belong to their element. An element that is quoted as a whole loses its quotes,
// and with them the backslashes before quotes and backslashes. Throws Usage_Error.
std::vector<std::string> split_list(std::string_view text);

} // namespace mpcactl

#endif // MPCACTL_LIST_TEXT_H
