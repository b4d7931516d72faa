// The tuning file and the web-launch file.
#include "foundation/config_file.h"
#include "fuzz/fuzz.h"

using namespace cimple;

namespace {

struct Values {
    uint32 timeout;
    bool adapter;
    bool san;
    bool operator==(const Values&) const = default;
};

// What the file is read as; it is rewritten on the way out.
Values read_and_save(const std::string& path) {
    VlnConfigFile file;
    file.load(path.c_str());
    return {file.get_cache_timeout(), file.get_refresh_adapter(), file.get_refresh_san()};
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::listen_to_log();
    static const std::string path = fuzz::folder() + "/tuning.conf";
    fuzz::write_file(path, fuzz::Input(data, size).rest());
    const std::string address = readWebLaunchURL(path.c_str());
    FUZZ_CHECK(address.find('\n') == std::string::npos);
    const Values values = read_and_save(path);
    FUZZ_CHECK(values.timeout >= VlnConfigFile::MIN_CACHE_TIMEOUT &&
               values.timeout <= VlnConfigFile::MAX_CACHE_TIMEOUT);
    FUZZ_CHECK(read_and_save(path) == values);
    return 0;
}
