// Where the files of the object manager lie, seen from the running program: its folder is "bin" of
// an installation, or of a build, whose folders are laid out more plainly.
#ifndef HOST_INSTALLATION_H
#define HOST_INSTALLATION_H

#include <string>

namespace host {

// The provider module, and the folder of its simulated twin with the libraries that it needs.
std::string module_path();
std::string simulator_folder();
// The folder of the simulator's scenarios.
std::string scenario_folder();
// The class catalogue, which has the platform's classes too, and the registration of the module.
std::string catalogue_path();
std::string registration_path();

} // namespace host

#endif // HOST_INSTALLATION_H
