// The log's settings file. Its second line is the path of a log, which the fuzzer may choose only
// within its own folder.
#include "foundation/host_paths.h"
#include "foundation/logger.h"
#include "fuzz/fuzz.h"

#include <filesystem>
#include <unistd.h>

using namespace cimple;
namespace fs = std::filesystem;

namespace {

// Where the logs go: the working folder, emptied every time.
const std::string& log_folder() {
    static const std::string path = [] {
        const std::string logs = fuzz::folder() + "/logs";
        for (const char* name : {"/etc", "/var/log", "/opt/ibm/platform/log", "/logs"})
            fs::create_directories(fuzz::folder() + name);
        FUZZ_CHECK(chdir(logs.c_str()) == 0);
        return logs;
    }();
    return path;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string& logs = log_folder();
    std::string text = fuzz::Input(data, size).rest();
    std::replace(text.begin(), text.end(), '/', '_');
    fuzz::write_file(host_path(Host_File::LOG_SETTINGS), text);
    fuzz::write_file(host_path(Host_File::LOG_SETTINGS_VAR), text);
    {
        Provider_Loggers loggers;
        fuzz::listen_to_log();
        loggers.start();
        CLogger& logger = CLogger::instance();
        const auto held = [&] {
            FUZZ_CHECK(logger.get_mode() >= LOG_MODE_NONE && logger.get_mode() <= LOG_MODE_BOTH);
            FUZZ_CHECK(logger.get_level() >= 0 && logger.get_level() <= VLN_DBG);
        };
        held();
        VLN_LOG(VLN_CRIT, "%s", text.c_str());
        for (const VLN_CIMLogEntry& entry : loggers.ring().entries())
            FUZZ_CHECK(std::memchr(entry.message, 0, sizeof entry.message) != nullptr);
        const sint32 mode = logger.get_mode();
        logger.save_config();
        logger.load_config();
        held();
        FUZZ_CHECK(logger.get_mode() == mode);
    }
    for (const auto& entry : fs::directory_iterator(logs))
        fs::remove_all(entry.path());
    return 0;
}
