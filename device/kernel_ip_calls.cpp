// The host's own kernel.
#include "device/ip_interface.h"

#include <sys/ioctl.h>
#include <sys/socket.h>
#include <unistd.h>

namespace cimple {

const IP_Calls kernel_ip_calls = {
    ::socket,
    [](int descriptor, unsigned long request, void* argument) {
        return ::ioctl(descriptor, request, argument);
    },
    ::close,
};

} // namespace cimple
