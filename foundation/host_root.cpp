#include "foundation/host_paths.h"

namespace cimple {

const char* host_root() {
    return "";
}

} // namespace cimple
