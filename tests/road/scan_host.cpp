#include "tests/road/scan_host.h"

#include "device/fcoe_adapter.h"
#include "device/library/runtime_loader.h"

#include <sstream>
#include <stdexcept>

namespace road {

using namespace cimple;

namespace {

constexpr std::uint64_t START = 1400000000ull * 1000000; // 2014-05-13, in microseconds

Calls counted() {
    Calls calls;
    vlnsim_each_call([](void* context, const char* function,
                        unsigned long count) { (*static_cast<Calls*>(context))[function] = count; },
                     &calls);
    return calls;
}

std::string line_of(const std::string& adapter, const Port& port, const Target& target) {
    std::ostringstream line;
    line << adapter << ' ' << port.getPortName() << ' ' << target.nodeWWN << ' ' << target.portWWN
         << " id=" << target.fcId << " lun=" << target.fcpLun << " os=" << target.osDeviceName
         << " bus=" << target.scsiBusNumber << " target=" << target.scsiTargetNumber
         << " oslun=" << target.scsiOSLun << " block=" << target.blockLength
         << " last=" << target.lastLBA << " type=" << target.deviceType << " [" << target.vendor
         << "][" << target.product << "][" << target.revision << "][" << target.serialNumber << "] "
         << target.descriptor.pageCode << ' ' << target.descriptor.identifierType << ' '
         << descriptorText(target.descriptor);
    return line.str();
}

} // namespace

Scan_Host::Scan_Host(const std::string& scenario) {
    char error[512] = "";
    vlnsim_reset();
    vlnsim_use_virtual_clock(START);
    const int status =
        scenario.starts_with("{")
            ? vlnsim_load_scenario_text(scenario.c_str(), "scenario", error, sizeof error)
            : vlnsim_load_scenario((std::string(VLN_SCENARIOS "/") + scenario).c_str(), error,
                                   sizeof error);
    if (status != 0 || vlnsim_open_libraries(error, sizeof error) != 0)
        throw std::runtime_error(error);
    loadRuntimeLibraries();
    _wrapper = std::make_unique<VLN_MethodWrapper>();
    _data = std::make_unique<VLN_Data>();
}

Scan_Host::~Scan_Host() {
    _data.reset();
    _wrapper.reset();
    unloadRuntimeLibraries();
    vlnsim_close_libraries();
    vlnsim_reset();
}

Calls Scan_Host::adapter_scan() {
    vlnsim_clear_calls();
    _data->buildAdapterData();
    return counted();
}

Calls Scan_Host::san_scan() {
    vlnsim_clear_calls();
    _data->buildSANData();
    return counted();
}

std::vector<std::string> Scan_Host::targets() const {
    std::vector<std::string> lines;
    for (const std::unique_ptr<Adapter>& adapter : _data->adapters) {
        const auto* fcoe = dynamic_cast<const FCoEAdapter*>(adapter.get());
        for (const std::unique_ptr<Port>& port : adapter->getPorts())
            for (const std::unique_ptr<Target>& target : port->getTargets())
                lines.push_back(line_of(fcoe ? fcoe->getHbaAdapterName() : "", *port, *target));
    }
    return lines;
}

} // namespace road
