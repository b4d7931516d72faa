#include "host/installation.h"

#include <filesystem>

namespace host {

namespace fs = std::filesystem;

namespace {

// Below the folder that "bin" is in.
struct Place {
    const char* installed;
    const char* built;
};

constexpr Place MODULE = {VLN_LIBDIR "/cmpi/libvorlan_mpca_provider.so",
                          "lib/libvorlan_mpca_provider.so"};
constexpr Place SIMULATOR = {VLN_LIBDIR "/vorlan-mpca/simulator", "lib/simulator"};
constexpr Place SCENARIOS = {"share/vorlan-mpca/scenarios", "share/scenarios"};
constexpr Place CATALOGUE = {"share/vorlan-mpca/catalogue/catalogue.mof",
                             "share/catalogue/catalogue.mof"};
constexpr Place REGISTRATION = {"share/vorlan-mpca/vorlan_mpca_provider.reg",
                                "share/vorlan_mpca_provider.reg"};

// Where neither is, the name of the installed one: whoever opens it says that it is missing.
std::string find(const Place& place) {
    std::error_code error;
    const fs::path top = fs::read_symlink("/proc/self/exe", error).parent_path().parent_path();
    const bool built =
        !fs::exists(top / place.installed, error) && fs::exists(top / place.built, error);
    return (top / (built ? place.built : place.installed)).string();
}

} // namespace

std::string module_path() {
    return find(MODULE);
}

std::string simulator_folder() {
    return find(SIMULATOR);
}

std::string scenario_folder() {
    return find(SCENARIOS);
}

std::string catalogue_path() {
    return find(CATALOGUE);
}

std::string registration_path() {
    return find(REGISTRATION);
}

} // namespace host
