// A SAN scan in a process of its own: prints which HBA API library answered it and all targets.
//
//   real_hba_child simulated|real SCENARIO-FILE
//
// real: the machine's own libHBAAPI.so.2 with the simulator's vendor library underneath, which it
// finds through an hba.conf of our own. That file lies in a mount namespace, so the machine's /etc
// stays as it is. Exit status 77, with the reason in one line, where that cannot be done.
#include "tests/road/scan_host.h"

#include <dlfcn.h>
#include <link.h>
#include <sched.h>
#include <sys/mount.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace fs = std::filesystem;

namespace {

constexpr int SKIPPED = 77;
constexpr const char* HBA_LIBRARY = "libHBAAPI.so.2";

// What keeps the scan from being run.
struct Missing : std::runtime_error {
    using std::runtime_error::runtime_error;
};

// In a mount namespace of this process /etc becomes a folder with the hba.conf in it.
void put_configuration_in_place() {
    if (unshare(CLONE_NEWUSER | CLONE_NEWNS) != 0)
        throw Missing(std::string("this machine allows no user and mount namespaces: ") +
                      std::strerror(errno));
    const fs::path folder = fs::current_path() / "etc";
    fs::create_directories(folder);
    std::ofstream(folder / "hba.conf") << "org.vorlan.simulated " VLN_VENDOR_LIBRARY "\n";
    std::error_code ignored; // the loader finds the standard folders without its cache too
    fs::copy_file("/etc/ld.so.cache", folder / "ld.so.cache", fs::copy_options::overwrite_existing,
                  ignored);
    if (mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
        mount(folder.c_str(), "/etc", nullptr, MS_BIND, nullptr) != 0)
        throw Missing(std::string("nothing can be mounted over /etc: ") + std::strerror(errno));
}

void look_for_the_library() {
    void* library = dlopen(HBA_LIBRARY, RTLD_LAZY);
    if (!library)
        throw Missing(std::string("this machine has no HBA API library of this word size: ") +
                      dlerror());
    dlclose(library);
}

std::string path_of_the_library() {
    void* library = dlopen(HBA_LIBRARY, RTLD_LAZY | RTLD_NOLOAD);
    link_map* map = nullptr;
    if (!library || dlinfo(library, RTLD_DI_LINKMAP, &map) != 0)
        return "none";
    std::string path = map->l_name;
    dlclose(library);
    return path;
}

void scan(const std::string& scenario) {
    road::Scan_Host host(scenario);
    host.adapter_scan();
    const road::Calls calls = host.san_scan();
    std::printf("%s\n", path_of_the_library().c_str());
    for (const std::string& line : host.targets())
        std::printf("%s\n", line.c_str());
    for (const auto& [function, count] : calls)
        if (!function.starts_with("HBA_Get")) // the common library asks for names by itself
            std::printf("%s %lu\n", function.c_str(), count);
    std::printf("%zu breaches of contract\n", vlnsim_violations());
}

} // namespace

int main(int argc, char** argv) {
    try {
        if (argc != 3)
            throw std::runtime_error("usage: real_hba_child simulated|real SCENARIO-FILE");
        std::string libraries;
        if (std::strcmp(argv[1], "real") == 0) {
            put_configuration_in_place();
            look_for_the_library();
            libraries = R"(, "libraries": {"hba": {"present": false}})";
        }
        scan(R"({"include": ")" + std::string(argv[2]) + "\"" + libraries + "}");
        return 0;
    } catch (const Missing& missing) {
        std::printf("%s\n", missing.what());
        return SKIPPED;
    } catch (const std::exception& error) {
        std::printf("%s\n", error.what());
        return 1;
    }
}
