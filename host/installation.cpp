#include "host/installation.h"

#include <filesystem>

namespace host {

namespace fs = std::filesystem;

std::string program_folder() {
    std::error_code error;
    const fs::path program = fs::read_symlink("/proc/self/exe", error);
    return error ? "." : program.parent_path().string();
}

std::string catalogue_path() {
    const fs::path installed =
        fs::path(program_folder()) / "../share/vorlan_mpca_provider/mof/catalogue.mof";
    std::error_code error;
    return fs::exists(installed, error) ? installed.string() : VLN_HOST_CATALOGUE;
}

} // namespace host
