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

std::string registration_path() {
    const fs::path share = fs::path(program_folder()) / "../share";
    for (const char* name :
         {"vorlan_mpca_provider/vorlan_mpca_provider.reg", "vorlan_mpca_provider.reg"}) {
        std::error_code error;
        if (fs::exists(share / name, error))
            return (share / name).string();
    }
    return "";
}

} // namespace host
