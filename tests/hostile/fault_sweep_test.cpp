// Every call into the libraries that a refresh makes fails once in each way, one failure a refresh.
//
// The rule that is checked: what does not depend on the failed call is still shown. A call that
// names a port may cost that physical port's objects, a call that lists or starts everything may
// cost whatever belongs to adapters, and any other call costs no port. The platform's objects and
// the settings stay in any case but one: without initialisation nothing is answered at all.
#include "tests/road/road.h"

#include <set>

#include <signal.h>
#include <unistd.h>

using road::Road;

namespace {

// The two-port card with two units behind each FCoE and each iSCSI port, and behind a virtual port.
const std::string SCENARIO = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
    "cards": [{"use": "cna", "features": {"Feature10GBaseT": 1, "Counters10GBaseT": 1},
        "ports": 2, "functions": [{"use": "nic"},
        {"use": "iscsi", "iscsiTargets": {"name": "iqn.2010-04.com.example:t-{port}", "luns": 2,
            "sessions": {"targetPortal": "198.51.100.20{port}"}}},
        {"use": "fcoe", "targets": {"luns": 2, "wwpn": "50:25:64:C{port}:00:00:00:{target:02X}"},
            "virtualPorts": [{"wwpn": "10:00:02:56:4C:00:{port:02X}:F0", "machine": {"name": "guest"},
                              "targets": {"luns": 2, "wwpn": "50:25:64:C{port}:00:00:00:00"}}],
            "unitPriorities": [{"initiator": "10:00:02:56:4C:00:{port:02X}:F0",
                                "target": "50:25:64:C{port}:00:00:00:00"}]}]}]})";

// What the paths of adapters' objects contain: WWNs of the card and of its targets, its serial
// number, its drivers, what iSCSI and FCoE functions have in common, and so on.
constexpr const char* ADAPTER_TEXTS[] = {"100002564C",
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
const std::vector<const char*> PORT_TEXTS[2] = {
    {"100002564C0000", "VR10420117:0", "vln0p0", "0:0:0x2210", "198.51.100.12", "502564C0",
     "example:t-0", "02564c0000", "Global Driver Parameter"},
    {"100002564C0001", "VR10420117:1", "vln0p1", "1:0:0x2210", "198.51.100.13", "502564C1",
     "example:t-1", "02564c0001"},
};

// Ethernet ports by the kind of their function.
constexpr std::size_t NIC_PORTS = 2;
constexpr std::size_t ISCSI_PORTS = 2;

using Paths = std::set<std::string>;

bool contains(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

std::string function_of(const std::string& line) {
    return line.substr(0, line.find('('));
}

bool belongs_to_port(const std::string& path, int port) {
    for (const char* text : PORT_TEXTS[port])
        if (contains(path, text))
            return true;
    return false;
}

bool belongs_to_an_adapter(const std::string& path) {
    for (const char* text : ADAPTER_TEXTS)
        if (contains(path, text))
            return true;
    return false;
}

// A call that did not come back is told by name.
const char* running = "";
void too_slow(int) {
    ssize_t written = write(STDERR_FILENO, "no end to: ", 11);
    written += write(STDERR_FILENO, running, std::string_view(running).size());
    _exit(written > 0 ? 3 : 4);
}

// What there is on a host without adapters.
bool belongs_to_the_platform(const std::string& path) {
    for (const char* name :
         {"CIM_ComputerSystem.", "CIM_Chassis.", "VLNMPCA_ProviderConfigSetting."})
        if (path.starts_with(std::string("root/vorlan:") + name))
            return true;
    return false;
}

struct Fault {
    std::string function = {};
    unsigned call = VLNSIM_EVERY; // of the function, counted from 1
    vlnsim_fault_kind kind = VLNSIM_STATUS;
    std::uint64_t value = 0;
    unsigned times = 1;    // that call and those after it
    std::string line = {}; // the call as a healthy refresh makes it

    std::string text() const {
        return function + " call " + std::to_string(call) + " kind " + std::to_string(kind) +
               " value " + std::to_string(value) + ": " + line;
    }
};

// After these the product uses the HBA API although it can't be used, and that is meant: nobody
// looks whether it could be loaded, and an absent open answers the handle 1. Its other calls fail.
bool goes_on_blindly(const Fault& fault) {
    return fault.function == "HBA_LoadLibrary" ||
           (fault.function == "HBA_OpenAdapter" && fault.kind == VLNSIM_ABSENT);
}

// The card's key is what its vital product data say, or else its serial number. Which of the two
// it is does not matter here.
std::string without_card_tag(std::string path) {
    constexpr std::string_view TAG = "VLNMPCA_Card.Tag=";
    for (std::size_t at = path.find(TAG); at != std::string::npos; at = path.find(TAG, at + 1))
        path.erase(at + TAG.size(), path.find(',', at) - at - TAG.size());
    return path;
}

class Sweep : public testing::Test {
protected:
    Sweep() : road({.scenario = SCENARIO}) {
        vlnsim_record_calls(1);
        signal(SIGALRM, too_slow);
        healthy = refresh(nullptr);
        char line[512];
        for (std::size_t i = 0; vlnsim_recorded_call(i, line, sizeof line) == 0; ++i)
            lines.emplace_back(line);
        vlnsim_record_calls(0);
    }
    ~Sweep() override { alarm(0); }

    // The paths of all instances after one refresh of a fresh agent under the fault.
    Paths refresh(const Fault* fault) {
        vlnsim_restart();
        for (unsigned i = 0; fault && i < fault->times; ++i)
            EXPECT_EQ(vlnsim_fault(fault->function.c_str(), fault->call ? fault->call + i : 0,
                                   fault->kind, fault->value),
                      0);
        const std::string what = fault ? fault->text() + "\n" : "a healthy refresh\n";
        running = what.c_str();
        alarm(100);
        road.enumerate("VLNMPCA_StorageVolume"); // waits for the SAN pass
        Paths paths;
        for (const std::string& name : class_names()) {
            const auto reply = road.manager().enumerate_names(name);
            EXPECT_TRUE(reply.ok()) << name << ": " << host::rc_name(reply.status.rc);
            for (const host::ObjectPath& path : reply.value)
                paths.insert(without_card_tag(host::path_to_text(path, "")));
        }
        EXPECT_TRUE(road.manager().cleanup(true).ok());
        alarm(0);
        EXPECT_EQ(road.manager().live_object_count(), 0u) << what;
        EXPECT_EQ(road.manager().fault_count(), 0u) << what;
        char violation[256] = "";
        vlnsim_violation(0, violation, sizeof violation);
        if (!fault || !goes_on_blindly(*fault)) {
            EXPECT_EQ(vlnsim_violations(), 0u) << what << violation;
        }
        return paths;
    }

    std::size_t ports(const Paths& paths) const {
        std::size_t count = 0;
        for (const std::string& path : paths)
            count += contains(path, ":VLNMPCA_EthernetPort.") ||
                     path.starts_with("VLNMPCA_EthernetPort.");
        return count;
    }

    // The paths that are gone although the judge says that they do not depend on the failed call.
    template <class Depends>
    void expect_the_rest(const Fault& fault, Depends depends) {
        const Paths shown = refresh(&fault);
        for (const std::string& path : healthy)
            if (!shown.contains(path) && !depends(path)) {
                ADD_FAILURE() << fault.text() << "\nlost " << path;
                break;
            }
    }

    // So many calls of the function, from that one on.
    std::vector<std::string> calls_of(const std::string& function, unsigned call,
                                      unsigned times) const {
        std::vector<std::string> found;
        unsigned number = 0;
        for (const std::string& line : lines)
            if (function_of(line) == function && ++number >= call && number < call + times)
                found.push_back(line);
        return found;
    }

    Road road;
    Paths healthy;
    std::vector<std::string> lines; // all calls of a healthy refresh

private:
    // Of the classes that have instances; of all at first.
    std::vector<std::string> class_names() {
        if (_names.empty())
            for (const auto& [name, count] : road.census())
                _names.push_back(name);
        return _names;
    }
    std::vector<std::string> _names;
};

// Whether an object depends on calls of a function, given as a healthy refresh makes them.
bool depends(const std::string& path, const std::string& function,
             const std::vector<std::string>& calls) {
    if (function == "AX_InitLib")
        return true;
    if (function == "AX_GetAllLocalHBAInstances")
        return belongs_to_an_adapter(path);
    if (function.starts_with("HBA_")) // serves what is behind FCoE ports
        return contains(path, "502564C");
    bool named[2] = {false, false};
    for (const std::string& call : calls)
        for (int port = 0; port < 2; ++port)
            named[port] |= contains(call, PORT_TEXTS[port][0]);
    if (named[0] && named[1])
        return !belongs_to_the_platform(path);
    // The card's vital product data are read through one port, entry by entry.
    if (contains(path, "FRU") && (named[0] || named[1] || contains(function, "Vpd")))
        return true;
    for (int port = 0; port < 2; ++port)
        if (named[port] && belongs_to_port(path, port))
            return true;
    return false;
}

TEST_F(Sweep, EachCallFailsWithEachStatus) {
    ASSERT_EQ(ports(healthy), NIC_PORTS + ISCSI_PORTS);
    ASSERT_GT(lines.size(), 100u);
    std::map<std::string, unsigned> calls;
    for (const std::string& line : lines) {
        const std::string function = function_of(line);
        const unsigned call = ++calls[function];
        if (function == "AX_GetAttributeValue") // by identifier, below
            continue;
        for (const std::uint64_t status : {1u, 7u, 190u, 255u}) {
            // A handle is no status: an adapter that can't be opened has none.
            Fault fault{function, call, VLNSIM_STATUS, function == "HBA_OpenAdapter" ? 0 : status};
            // Nobody repeats a question for a feature: the next one is another port's.
            fault.times = status == 7 && function != "AX_GetHBAFeature" ? 2 : 1;
            fault.line = line;
            expect_the_rest(fault, [&](const std::string& path) {
                return depends(path, function, calls_of(function, call, fault.times));
            });
        }
    }
}

TEST_F(Sweep, EachValueIsMissing) {
    constexpr unsigned PERMANENT_ADDRESS = 804;
    constexpr unsigned CURRENT_ADDRESS = 817; // shown of NICs alone
    // The flash image's version is parsed late, and one without dots ends the row of cards there.
    constexpr unsigned FIRMWARE_VERSION = 522;
    const std::map<unsigned, std::size_t> fewer_ports = {{PERMANENT_ADDRESS, 0},
                                                         {CURRENT_ADDRESS, ISCSI_PORTS},
                                                         {FIRMWARE_VERSION, 1 + ISCSI_PORTS}};
    std::set<unsigned> identifiers;
    for (const std::string& line : lines)
        if (line.starts_with("AX_GetAttributeValue("))
            identifiers.insert(
                static_cast<unsigned>(std::stoul(line.substr(line.find_first_of("(") + 1))));
    ASSERT_GT(identifiers.size(), 60u);
    for (const unsigned identifier : identifiers) {
#ifdef CIMPLE_CHECK_LOCKS
        if (identifier == PERMANENT_ADDRESS || identifier == CURRENT_ADDRESS)
            continue; // ends such a build: see the test of bad addresses
#endif
        const Fault fault{"AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, identifier};
        const auto row = fewer_ports.find(identifier);
        EXPECT_EQ(ports(refresh(&fault)),
                  row == fewer_ports.end() ? NIC_PORTS + ISCSI_PORTS : row->second)
            << fault.text();
    }
}

TEST_F(Sweep, EachSymbolIsAbsent) {
    std::set<std::string> functions;
    for (const std::string& line : lines)
        functions.insert(function_of(line));
    const std::map<std::string, std::size_t> fewer_ports = {
        {"AX_InitLib", 0},
        {"AX_GetAllLocalHBAInstances", 0},
        {"AX_GetHBAAttributes", 0},
        {"AX_GetPortAttributes", 0},
        {"AX_GetAttributeValue", 0},
        {"AX_iSCSI_GetInitiatorProperties", NIC_PORTS},
        {"AX_Ini_GetNetworkProperties", NIC_PORTS}};
    for (const std::string& function : functions) {
        const Fault fault{function, VLNSIM_EVERY, VLNSIM_ABSENT};
#ifdef CIMPLE_CHECK_LOCKS
        if (function == "AX_GetAttributeValue") // no address either
            continue;
#endif
        const auto row = fewer_ports.find(function);
        EXPECT_EQ(ports(refresh(&fault)),
                  row == fewer_ports.end() ? NIC_PORTS + ISCSI_PORTS : row->second)
            << fault.text();
    }
}

} // namespace
