#include "foundation/host_paths.h"
#include "foundation/logger.h"
#include "fuzz/fuzz.h"

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

} // namespace

void listen_to_log() {
    static Drain& drain = *new Drain; // lines come until the very end of the process
    cimple::CLogger::instance().set_enabled();
    cimple::CLogger::instance().add_logger(&drain);
}

} // namespace fuzz

namespace cimple {

const char* host_root() {
    return fuzz::folder().c_str();
}

} // namespace cimple
