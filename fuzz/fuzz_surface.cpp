// Any operation to any class through the module's entry points, over a host that has something of
// everything. A crash, a report of a sanitizer, a fault of the provider that the object manager
// sees, an object of the broker left, a breach of the libraries' contract and a hang are findings.
#include "fuzz/operations.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    constexpr unsigned MOST_OPERATIONS = 6;
    fuzz::Input input(data, size);
    fuzz::Operations& operations = fuzz::Operations::instance();
    fuzz::Simulated_Host& host = operations.host();
    operations.make(input, MOST_OPERATIONS);
    host.check();
    if (host.is_changed())
        host.restart();
    return 0;
}
