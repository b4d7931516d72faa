#include "foundation/host_paths.h"
#include "foundation/logger.h"
#include "fuzz/fuzz.h"

#include <filesystem>
#include <fstream>

namespace fuzz {

namespace {

class Drain : public cimple::VLN_LoggerInterface {
public:
    void log(cimple::sint32, const char*, cimple::uint32, const char* text) override {
        FUZZ_CHECK(text != nullptr);
    }
    void open() override {}
    void close() override {}
    void clear() override {}
};

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

void listen_to_log() {
    static Drain& drain = *new Drain; // lines come until the very end of the process
    cimple::CLogger::instance().set_enabled();
    cimple::CLogger::instance().add_logger(&drain);
}

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

namespace cimple {

const char* host_root() {
    return fuzz::folder().c_str();
}

} // namespace cimple
