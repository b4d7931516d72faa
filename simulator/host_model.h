// The simulated host: what a scenario describes and what the library calls read and change.
//
// Plain data. It is built by scenario.h and lives in the Simulator (simulator.h), under its mutex.
#ifndef VLNSIM_HOST_MODEL_H
#define VLNSIM_HOST_MODEL_H

#include "device/library/axapi.h"
#include "simulator/iscsi_model.h"

#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace vlnsim {

using Bytes = std::vector<std::uint8_t>;

// A value as the library hands it out. Of a text the terminating NUL is not counted in length, but
// it is always there.
struct Attribute {
    Bytes bytes;
    std::uint16_t length = 0;

    static Attribute of_number(std::uint32_t number);
    static Attribute of_wide(std::uint64_t number);
    static Attribute of_text(const std::string& text);
    static Attribute of_bytes(Bytes bytes);

    std::uint32_t number() const; // 0 for anything shorter
    std::uint64_t wide() const;   // the same
    std::string text() const;
};
using Attribute_Map = std::map<std::uint16_t, Attribute>;

// One logical unit and how it answers SCSI commands.
struct Unit {
    std::uint64_t fcp_lun = 0; // the eight bytes of the LUN as SAM lays them out, as a memory image
    std::uint32_t os_lun = 0;
    std::string os_device_name;
    Bytes inquiry;                      // standard inquiry data, SPC
    std::optional<Bytes> serial_page;   // page 0x80
    std::optional<Bytes> identity_page; // page 0x83
    std::optional<Bytes> capacity;      // READ CAPACITY(10), SBC
    std::uint32_t check_conditions = 0; // so many answers to each command come first
    bool silent = false;                // every command fails
    bool reported = true;               // by the target, to a virtual port that asks for its units
    std::uint32_t from_call = 1;        // of the target mapping: before it the unit is not listed
    std::array<std::uint32_t, 4> checks_given{};
};

struct Target {
    std::uint32_t fc_id = 0;
    std::uint64_t node_wwn = 0;
    std::uint64_t port_wwn = 0;
    std::uint32_t bus = 0;
    std::uint32_t number = 0;
    std::vector<Unit> units;
};

struct Virtual_Machine {
    std::string id;
    std::string name;
    std::string operating_system;
};

// A port with names of its own behind a function's, and what it sees.
struct Virtual_Port {
    AX_VPort names{};
    AX_VPortAttributes attributes{};
    std::optional<Virtual_Machine> machine; // that uses it
    std::vector<Target> targets;
};

// A parameter of a driver.
struct Driver_Parameter {
    AX_DriverParam record{};
    std::uint32_t kept = 0;          // the value that the host's next start brings
    AX_STATUS status = AX_STATUS_OK; // of a change that is in order otherwise

    std::string name() const; // of the record, which needs no NUL
};
using Driver_Parameters = std::vector<Driver_Parameter>;

// The logical units that have priority.
using Unit_Priorities = std::vector<AX_OASLun>;

using Trace_Settings = std::vector<AX_EventLogModule>;

// What an adapter keeps of its firmware's dumps. Its functions have the same.
struct Dumps {
    std::string directory; // on the host
    std::uint32_t retention = 0;
    std::uint32_t stored = 0; // in the adapter's memory, not yet fetched
    AX_STATUS core_dump = AX_STATUS_OK;
    AX_EventLogConfig log{}; // its head
    Trace_Settings modules;
    Trace_Settings factory;
};

// How the diagnostic tests of a function go. Times are in milliseconds; 0 and 1 are no and yes.
struct Diagnostics {
    std::uint32_t pending_time = 500;
    std::uint32_t cycle_time = 50;
    std::uint32_t endless = 0;
    std::uint32_t busy = 0; // with somebody else's test
    std::uint32_t plug = 0; // for the external loopback
    std::uint32_t result = 0;
    std::uint32_t fails_at = 0; // the cycle that shows the errors; 0: the last
    std::uint32_t error_cycles = 0;
    std::uint32_t transmit_errors = 0;
    std::uint32_t receive_errors = 0;
    AX_STATUS running_status = AX_STATUS_DIAG_IN_PROGRESS;
    std::uint32_t end_state = AX_DIAG_COMPLETE;
    AX_STATUS cancel_status = AX_STATUS_OK;
    std::uint32_t cancel_time = 500;
    std::array<std::uint32_t, 4> pair_state{}; // of the cable, as AX_CableResults
    std::array<std::uint32_t, 4> pair_length{};
};

// A diagnostic test under way, or one that has ended and may be asked for.
struct Test {
    enum class Kind : std::uint8_t { cycles, cable };
    Kind kind = Kind::cycles;
    std::uint32_t cycles = 0;
    bool halts = false; // with the first error
    std::uint64_t wwpn = 0;
    std::uint32_t card = 0;
    std::uint16_t sub_adapter = 0;
    Diagnostics model{};
    std::uint64_t start = 0; // microseconds
    std::optional<std::uint64_t> cancelled{};
};

// How an FCoE port finds its forwarder, and those that it has found.
struct Fip {
    AX_FCFConnectList connect{};
    AX_FIPParams params{};
    std::vector<AX_Fcf> forwarders;
};

struct Name_Pair {
    std::uint64_t wwpn = 0;
    std::uint64_t wwnn = 0;

    friend bool operator==(const Name_Pair&, const Name_Pair&) = default;
};

// What a port's names can be. In force are those of its function; what it is configured to have is
// the volatile set where there is one, else the other.
struct Name_Management {
    std::uint32_t capability = 0; // AX_WWN_ bits
    Name_Pair factory;
    std::uint32_t busy = 0; // calls that change names and are answered "in progress" yet
};

struct Virtual_Function {
    std::uint64_t name = 0;
    AX_VirtualFunctionProperties properties{};
};

// A feature's answer: a value, or a status alone.
struct Feature {
    std::uint32_t value = 0;
    AX_STATUS status = AX_STATUS_OK;
};

// The profiles of an adapter that has profile management. The active one is that of its
// configuration, if it has one.
struct Profiles {
    std::uint32_t active = 0;
    std::vector<AX_Profile> list;
};

// When a change comes into force.
enum class Effect : std::uint8_t { once, reset, reboot };

// Statuses that the simulated library answers beside those of axapi.h.
enum : AX_STATUS {
    ip_entry_exists = 131,
    ip_no_such_entry = 132,
    ip_gateway_unreachable = 133,
    firmware_unreadable = 140,
    firmware_no_image = 141,
    firmware_damaged = 142,
    firmware_of_other_model = 143,
    configuration_refused = 144,
    boot_code_enabled = 221,
    parameter_unknown = 161,
    parameter_out_of_range = 162,
    parameter_fixed = 163,
    parameter_not_while_running = 164,
    unit_not_seen = 165,
    name_in_use = 94,
};

// How AX_SetPortEnabled tells it.
enum : std::uint32_t { dynamic_at_once = 1, dynamic_at_reset = 5 };

// One instance of the management library: a PCI function of a card.
struct Function {
    std::uint32_t instance = 0;
    std::uint32_t card = 0;
    std::uint64_t wwpn = 0;
    std::uint64_t wwnn = 0;
    std::uint64_t fabric = 0;
    std::uint32_t flags = 0;
    std::uint32_t special_features = 0;
    std::uint16_t sub_adapter = 0;
    std::string model;
    bool dead = false;
    bool v4_record = true;
    bool v3_record = true;

    Attribute_Map adapter_attributes;
    Attribute_Map port_attributes;
    std::map<std::uint16_t, std::uint64_t> statistics;
    std::map<std::uint32_t, Feature> features;
    std::optional<std::uint32_t> driver_type;
    std::vector<std::pair<std::string, Bytes>> fru_vpd; // AX_GetVPDV2: tag and value, in order
    std::vector<std::pair<std::string, Bytes>> pci_vpd; // AX_GetVPD
    std::optional<AX_iSCSI_InitiatorProperties> initiator;
    std::optional<AX_Ini_NetworkProperties> network;
    std::vector<AX_ARPEntry> arp_table;
    std::vector<AX_RouteEntry> route_table;
    std::optional<AX_PCIRegisters> pci;
    std::optional<AX_SffData> sff;
    std::optional<std::uint32_t> beacon;
    std::optional<Driver_Parameters> driver_parameters;
    std::optional<Driver_Parameters> global_driver_parameters;
    std::optional<Unit_Priorities> unit_priorities;
    std::optional<Profiles> profiles;
    std::uint32_t multichannel = 0; // its type, where there is no configuration
    // How an adapter is split, how a port's link is, and how the adapter manages that. Functions of
    // one adapter, or one port, have the same.
    std::optional<AX_AdapterPortConfig> port_config;
    std::optional<AX_AdapterPortConfig> factory_port_config;
    std::optional<AX_ChannelMgmtCNAInfo> channel_management;
    std::optional<AX_ChannelMgmtPortInfo> channels;
    std::optional<AX_AdapterPersonalityInfo> personality;
    Effect firmware_effect = Effect::reset;
    Effect port_effect = Effect::once;
    std::uint32_t resets = 0;
    std::optional<Dumps> dumps;
    std::optional<Diagnostics> diagnostics;
    std::optional<AX_CEE_Params> bridging;
    bool bridging_switch = false; // the switch provides settings for those that are willing
    std::optional<Fip> fip;
    std::optional<Name_Management> name_management;
    Name_Pair non_volatile_names;
    std::optional<Name_Pair> volatile_names;
    std::vector<std::uint64_t> former_wwpns; // by which callers may still know it
    std::vector<Virtual_Port> virtual_ports;
    std::optional<AX_QoS> qos; // its kind is a set call's
    std::vector<Virtual_Function> virtual_functions;

    std::optional<std::string> hba_name; // the adapter's name in the HBA API, which then knows it
    std::uint32_t hba_ports = 1;
    std::uint32_t stale = 0; // refreshes that the target mapping waits for
    std::uint32_t mapping_calls = 0;
    bool mapping_by_unit = false; // all targets' first units first, or target by target
    std::vector<Target> targets;
    std::vector<iSCSI_Target> iscsi_targets;
    std::vector<Send_Target_Portal> send_target_portals;
    Name_Servers name_servers; // iSNS
    AX_iSCSI_PortStatistics iscsi_statistics{};
    bool takes_eto = true; // whether the operating system takes a target's extended time-out

    std::uint64_t mac_address() const;             // as a number
    bool shares_port(const Function& other) const; // the physical one
};

// What a library file of the host exports beside or without what it would by itself.
struct Library {
    bool present = true;
    std::vector<std::string> missing; // symbols
    std::vector<std::string> extra;
};

// A rule of the fault script; see vlnsim_fault.
struct Fault {
    std::string function; // or "*"
    unsigned nth = 0;     // counts down to the call that it is about; 0: every call
    int kind = 0;
    std::uint64_t value = 0;
};

struct Host {
    std::array<Library, 3> libraries; // by vlnsim_library
    AX_STATUS initialisation = AX_STATUS_OK;
    std::string axapi_version = "10.2.261.13";
    std::string nima_version = "10.2.261.13";
    AX_ServerAttributes server{};
    std::string address = "192.0.2.10"; // of the host's name; empty: cannot be resolved
    std::vector<Function> functions;
    iSCSI_Network iscsi_network;
    std::vector<Function> dead_ports;    // whose firmware has failed: no instances of the library
    std::vector<std::string> system_log; // the lines of a start of the host
    struct File {
        std::string path; // below the host root
        std::vector<std::string> lines;
    };
    std::vector<File> files;
    std::string platform; // the file with what is the platform's own, "" for none
    std::vector<Fault> faults;
};

// What the host's next start brings into force.
void reboot(Host& host);
void reset_adapter(Host& host, const Function& of);
// Takes the link of the physical port down, or up. A port that is switched off stays so.
void set_cable(Host& host, const Function& of, bool plugged);
// The same, of how a function's adapter is split and managed.
void start_configuration(Function& function);

// What the driver's next start makes of its parameters.
void restart_driver(Function& function);

// Brings the names into force that the function is configured to have.
void activate_names(Function& function);

// The eight bytes of a WWN, most significant first.
void put_name(std::uint64_t wwn, std::uint8_t* bytes);
std::uint64_t get_name(const std::uint8_t* bytes);

} // namespace vlnsim

#endif // VLNSIM_HOST_MODEL_H
