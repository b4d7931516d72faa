// What a firmware image costs that a client sends as bytes.
//
//   bench_stream BYTES
//
// Installs an image of that size, through the object manager in process.
#include "bench/bench_program.h"
#include "host/manager.h"
#include "simulator/vlnsim.h"

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>

namespace {

constexpr const char* FILE_NAME = "stream.img";

host::Value image_of(std::size_t size) {
    char error[256] = "";
    if (vlnsim_write_firmware(FILE_NAME, "VMC-2210", "10.4.255.3", size, error, sizeof error) != 0)
        fail(error);
    std::ifstream file(FILE_NAME, std::ios::binary);
    host::Value::Array elements;
    elements.reserve(size + 1024);
    for (char c = 0; file.get(c);)
        elements.push_back(host::Value::unsigned_number(CMPI_uint8, static_cast<unsigned char>(c)));
    std::remove(FILE_NAME);
    return host::Value::array(CMPI_uint8, std::move(elements));
}

} // namespace

// What is counted.
extern "C" __attribute__((noinline)) std::uint64_t vln_measured(host::Manager& manager,
                                                                const host::ObjectPath& service,
                                                                const host::Named_Values& inputs) {
    const auto reply = manager.invoke(service, "InstallFromByteStream", inputs);
    return reply.ok() ? reply.value.value.as_unsigned() : ~std::uint64_t{0};
}

int main(int argc, char** argv) {
    if (argc != 2)
        fail("usage: bench_stream BYTES");
    simulate(read_scenario("two-port-cna.json"));
    host::Options options;
    options.strict = false;
    host::Manager manager(options);
    const host::Status status = manager.load(VLN_SIMULATED_MODULE);
    if (!status.ok())
        fail(status.message);
    const auto ports = manager.enumerate_names("VLNMPCA_EthernetPort").value;
    const auto services = manager.enumerate_names("VLNMPCA_SoftwareInstallationService").value;
    if (ports.empty() || services.empty())
        fail("the host has no port or no service");
    const host::Named_Values inputs = {
        {"Image", image_of(std::strtoul(argv[1], nullptr, 10))},
        {"Target", host::Value::reference(ports.front())},
        {"InstallOptions",
         host::Value::array(CMPI_uint16, {host::Value::unsigned_number(CMPI_uint16, 32768)})},
        {"InstallOptionsValues", host::Value::array(CMPI_string, {host::Value::text(FILE_NAME)})}};
    const std::uint64_t result = vln_measured(manager, services.front(), inputs);
    if (result != 0)
        fail("the installation returned " + std::to_string(result));
    return 0;
}
