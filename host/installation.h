// Where the files of the object manager lie, seen from the running program.
#ifndef HOST_INSTALLATION_H
#define HOST_INSTALLATION_H

#include <string>

namespace host {

// The folder of the running program, without a slash at its end.
std::string program_folder();

// The class catalogue: beside an installed program in ../share, else in the source tree.
std::string catalogue_path();

// The registration of the module, beside an installed program in ../share, else in the build's
// ../share; "" where there is none.
std::string registration_path();

} // namespace host

#endif // HOST_INSTALLATION_H
