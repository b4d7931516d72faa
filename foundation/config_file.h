// The two tuning files of the provider.
#ifndef FOUNDATION_CONFIG_FILE_H
#define FOUNDATION_CONFIG_FILE_H

#include "cimple/thread.h"

#include <string>

namespace cimple {

// The tuning file: read at start-up, changed in memory at run time, written back when the object is
// destroyed. Each access takes the lock of its own.
class VlnConfigFile {
public:
    static constexpr uint32 MIN_CACHE_TIMEOUT = 1; // minutes
    static constexpr uint32 MAX_CACHE_TIMEOUT = 30;

    VlnConfigFile() = default;
    ~VlnConfigFile(); // saves

    // Takes over what the file holds and remembers the path. Lines that are not understood, and a
    // file that is not there, leave the values as they are.
    void load(const char* path);
    // Rewrites the file; does nothing before a load.
    void save();

    uint32 get_cache_timeout() const; // minutes
    bool get_refresh_adapter() const;
    bool get_refresh_san() const;

    // 0, or -1 for a value that is not accepted. The file is not written.
    sint32 set_cache_timeout(sint32 value);
    sint32 set_refresh_adapter(sint32 value);
    sint32 set_refresh_san(sint32 value);

private:
    struct Keys_Seen;
    void take_line(const std::string& line, Keys_Seen& seen);

    bool refresh_adapter_data = false;
    bool refresh_san_data = true;
    uint32 cache_timeout = 10;
    std::string path;
    mutable Mutex lock{true, 0, "VlnConfigFile"};
};

// The web-launch address: the first line of the file that is neither empty nor a comment. Empty if
// there is none.
std::string readWebLaunchURL(const char* path);

} // namespace cimple

#endif // FOUNDATION_CONFIG_FILE_H
