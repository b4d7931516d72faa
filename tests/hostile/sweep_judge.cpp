// What a failed library call may cost a refresh, on the host WITH_TARGETS.
//
// What does not depend on the call is still shown. A call that names a port may cost that physical
// port's objects, a call that lists or starts everything may cost whatever belongs to adapters, and
// any other call costs no port. The platform's objects and the settings stay in any case but one:
// without initialisation nothing is answered at all.
#include "tests/hostile/sweep.h"

#include <algorithm>
#include <sstream>

namespace sweep {

// The two-port card with two units behind each FCoE and each iSCSI port, and behind a virtual port.
const std::string WITH_TARGETS = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
    "cards": [{"use": "cna", "features": {"Feature10GBaseT": 1, "Counters10GBaseT": 1},
        "ports": 2, "functions": [{"use": "nic"},
        {"use": "iscsi", "iscsiTargets": {"name": "iqn.2010-04.com.example:t-{port}", "luns": 2,
            "sessions": {"targetPortal": "198.51.100.20{port}"}}},
        {"use": "fcoe", "targets": {"luns": 2, "wwpn": "50:25:64:C{port}:00:00:00:{target:02X}"},
            "virtualPorts": [{"wwpn": "10:00:02:56:4C:00:{port:02X}:F0", "machine": {"name": "guest"},
                              "targets": {"luns": 2, "wwpn": "50:25:64:C{port}:00:00:00:00"}}],
            "unitPriorities": [{"initiator": "10:00:02:56:4C:00:{port:02X}:F0",
                                "target": "50:25:64:C{port}:00:00:00:00"}]}]}]})";

namespace {

using Texts = std::vector<const char*>;

// What the paths of adapters' objects contain: WWNs of the card and of its targets, its serial
// number, its drivers, what iSCSI and FCoE functions have in common, and so on.
const Texts ADAPTER_TEXTS = {"100002564C",
                             "502564C",
                             "VR1042",
                             "VMC-2210",
                             "02564c",
                             "vln0p",
                             ":0x2210",
                             "198.51.100.",
                             "com.example:t-",
                             "vlniscsi",
                             "vlnfcoe",
                             "Driver Record",
                             "VLNMPCA_SCSIProtocolController",
                             "VLNMPCA_DriverParameter",
                             "VLNMPCA_FCWWNService",
                             "VLNMPCA_FIPService",
                             "VLNMPCA_iSCSISettingService"};
// The first of a port's texts is the beginning of all its WWNs. The driver's global parameters are
// read through the first FCoE function.
const Texts PORT_TEXTS[2] = {
    {"100002564C0000", "VR10420117:0", "vln0p0", "0:0:0x2210", "198.51.100.12", "502564C0",
     "example:t-0", "02564c0000", "Global Driver Parameter"},
    {"100002564C0001", "VR10420117:1", "vln0p1", "1:0:0x2210", "198.51.100.13", "502564C1",
     "example:t-1", "02564c0001"},
};

// Ethernet ports: NICs, and those of iSCSI functions.
constexpr std::size_t NIC_PORTS = 2;
constexpr std::size_t PORTS = NIC_PORTS + 2;
// Of functions that are absent, and of values that are nowhere; all others cost no port. The flash
// image's version is parsed late, and one without dots ends the row of cards there.
const std::map<std::string, std::size_t> FEWER_PORTS = {{"AX_InitLib", 0},
                                                        {"AX_GetAllLocalHBAInstances", 0},
                                                        {"AX_GetHBAAttributes", 0},
                                                        {"AX_GetPortAttributes", 0},
                                                        {"AX_GetAttributeValue", 0},
                                                        {"AX_iSCSI_GetInitiatorProperties", 2},
                                                        {"AX_Ini_GetNetworkProperties", 2},
                                                        {"permanent address", 0},
                                                        {"current address of a NIC", 2},
                                                        {"firmware version", 3}};
const std::map<std::uint64_t, const char*> VALUES = {
    {804, "permanent address"}, {817, "current address of a NIC"}, {522, "firmware version"}};

bool contains(const std::string& text, const char* part) {
    return text.find(part) != std::string::npos;
}

bool contains_any(const std::string& text, const Texts& parts) {
    return std::any_of(parts.begin(), parts.end(),
                       [&](const char* part) { return contains(text, part); });
}

bool depends(const std::string& path, const Point& point) {
    if (point.function == "AX_InitLib")
        return true;
    if (point.function == "AX_GetAllLocalHBAInstances")
        return contains_any(path, ADAPTER_TEXTS);
    if (point.function.starts_with("HBA_")) // serves what is behind FCoE ports
        return contains(path, "502564C");
    // The card's vital product data are read through one port, entry by entry.
    if (contains(path, "FRU") && contains(point.function, "Vpd"))
        return true;
    for (const Texts& port : PORT_TEXTS)
        if (contains(point.line, port[0]) && (contains(path, "FRU") || contains_any(path, port)))
            return true;
    return false;
}

// The card's key is what its vital product data say, or else its serial number. Which of the two
// it is does not matter here.
std::string without_card_tag(std::string path) {
    constexpr std::string_view TAG = "VLNMPCA_Card.Tag=";
    for (std::size_t at = path.find(TAG); at != std::string::npos; at = path.find(TAG, at + 1))
        path.erase(at + TAG.size(), path.find(',', at) - at - TAG.size());
    return path;
}

std::set<std::string> paths_in(const std::string& text) {
    std::set<std::string> paths;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);)
        paths.insert(without_card_tag(line));
    return paths;
}

} // namespace

std::string judged(const Point& point, const std::string& healthy, const std::string& shown) {
    if (point.kind != CALL)
        return "";
    const std::set<std::string> paths = paths_in(shown);
    if (point.fault != VLNSIM_STATUS) {
        if (point.fault == VLNSIM_TOO_SMALL || (point.fault == VLNSIM_MISSING && point.call))
            return "";
        const auto value = VALUES.find(point.value);
        const auto row = FEWER_PORTS.find(point.fault == VLNSIM_ABSENT ? point.function
                                          : value == VALUES.end()      ? ""
                                                                       : value->second);
        const std::size_t expected = row == FEWER_PORTS.end() ? PORTS : row->second;
        const auto found = static_cast<std::size_t>(
            std::count_if(paths.begin(), paths.end(), [](const std::string& path) {
                return contains(path, ":VLNMPCA_EthernetPort.");
            }));
        return expected == found ? "" : std::to_string(found) + " Ethernet ports are shown";
    }
    if (point.function == "AX_GetAttributeValue")
        return "";
    for (const std::string& path : paths_in(healthy))
        if (!paths.contains(path) && !depends(path, point))
            return "lost " + path;
    return "";
}

} // namespace sweep
