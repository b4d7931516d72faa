#include "fuzz/fuzz.h"

#include <filesystem>
#include <fstream>

namespace fuzz {

namespace {

// Removed with what is in it when the process ends in order.
struct Folder {
    Folder() {
        std::error_code error;
        const std::filesystem::path shared = "/dev/shm";
        const bool has_shared = std::filesystem::is_directory(shared, error);
        path = (has_shared ? shared : std::filesystem::temp_directory_path()) / "vlnfuzz-XXXXXX";
        FUZZ_CHECK(mkdtemp(path.data()) != nullptr);
    }
    ~Folder() {
        std::error_code error;
        std::filesystem::remove_all(path, error);
    }
    std::string path;
};

} // namespace

const std::string& folder() {
    static const Folder folder;
    return folder.path;
}

void write_file(const std::string& path, const std::string& text) {
    std::ofstream file(path, std::ios::binary);
    file << text;
    FUZZ_CHECK(file.good());
}

} // namespace fuzz
