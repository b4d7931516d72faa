// The operations over the management library: the one place where the services talk to it.
//
// VLN_MethodWrapper turns a request into bound calls: it converts identifiers, tests for the
// feature needed, allocates the library's buffers, repeats a call whose buffer was too small, logs
// the outcome and returns the library's status. The operations are static, hold no lock and may run
// on any thread at the same time; they must not touch the device model, so what they need of it
// their callers hand in. They fail by return value and throw nothing. A family of operations has a
// file of its own, and all are written in the frame of operation_frame.h.
//
// Statuses that the operations return by themselves: 0 success; 1 general failure; 4 null output
// pointer; 8 out of memory; 251 the adapter lacks the feature.
#ifndef OPERATIONS_METHOD_WRAPPER_H
#define OPERATIONS_METHOD_WRAPPER_H

#include "cimple/types.h"
#include "device/library/identifiers.h"
#include "operations/bridging_rules.h"

#include <optional>
#include <string>
#include <vector>

namespace cimple {

// How an FCoE port looks for its forwarder, in the texts of a console. To set, what is empty or not
// there stays as it is.
struct VLN_FIPParams {
    std::string primaryFabricName; // "XX:XX:XX:XX:XX:XX:XX:XX"
    std::string primarySwitchName;
    std::string vlanId; // decimal, or "Any"; to set, in any base that C knows
    std::string fcMap;  // "0x0EFCXX"
    std::optional<uint32> cinVlanId;
};

// How the event log of an adapter's firmware is laid out, and what each module writes to it.
struct VLN_EventLogSettings {
    uint32 maxLogEntries = 0;
    uint32 logEntrySize = 0;
    uint32 logType = 0; // a bit for each AX_LOG_MODE_
    std::vector<AX_EventLogModule> modules;
};

// The name servers (iSNS) of an iSCSI function.
struct VLN_NameServers {
    uint32 enabled = 0; // whether they are asked
    std::vector<AX_IPAddress> list;
};

// What a logical unit answered to a virtual port.
struct VLN_VPortUnit {
    uint32 deviceType = 0; // peripheral device type of SPC
    std::string vendor;    // at most 8 bytes, 16 and 4; any bytes
    std::string product;
    std::string revision;
    uint64 lastLBA = 0;
    uint64 blockLength = 0; // bytes
};

class VLN_MethodWrapper : public VLN_Identifiers {
public:
    // Bytes of the name of the host's system with its end mark.
    static constexpr std::size_t TARGET_OS_SIZE = 41;

    // The object brackets the lifetime of the library; the ProviderAgent owns the only one. The
    // constructor initialises the library once in this process, over POSIX named semaphores whose
    // names go with the last object, and
    // throws std::exception when the library refuses. It waits, without end, for an
    // initialisation that is under way on another thread.
    VLN_MethodWrapper();
    ~VLN_MethodWrapper();
    // At the end of the process: the names go, whoever may still have the semaphores open.
    static void removeSemaphores() noexcept;
    VLN_MethodWrapper(const VLN_MethodWrapper&) = delete;
    VLN_MethodWrapper& operator=(const VLN_MethodWrapper&) = delete;

    // ---- Library and features (library_queries.cpp) ----

    // The version text of the management library. The argument is the library asked for, which
    // makes no difference: they are released as one. 8 when out of memory.
    static AX_STATUS GetLibraryVersion(const char* library, std::string* text);
    static AX_STATUS GetNIMALibVersion(std::string* text);
    // What system the host runs, as the library tells it; text has room for TARGET_OS_SIZE.
    static AX_STATUS getTargetOS_info(char* text);
    // True for the Tessel generation; false also when the adapter can't be asked.
    static bool IsTesselCNA(const HBA_WWN* name);
    // What the port does beside Ethernet. On failure the flags are as far as they were found, and
    // isNicOnly is false.
    static AX_STATUS GetCNAType(const HBA_WWN* name, bool& isNicOnly, bool& isISCSI, bool& isFCoE,
                                bool& isRoCe);
    // list: AX_FEATURE_LIST_SIZE bytes, one per feature.
    static AX_STATUS GetHBAFeatureList(const HBA_WWN* name, uint8* list);

    // ---- iSCSI discovery (iscsi_discovery.cpp) ----
    //
    // The library's lists of what an iSCSI port sees. On success the caller frees the list with
    // free(); its count is never beyond its entries.

    static AX_STATUS ListiSCSITargets(const HBA_WWN* name, AX_iSCSI_TargetList** targets);
    static AX_STATUS ListiSCSISessions(const HBA_WWN* name, const char* target,
                                       AX_iSCSI_SessionList** sessions);
    static AX_STATUS GetiSCSILuns(const HBA_WWN* name, const char* target, AX_iSCSI_LunList** luns);

    // ---- iSCSI settings (iscsi_settings.cpp) ----

    // An IPv4 address as a client writes it, with a port; false for any other text.
    static bool addressOf(const char* text, uint16 tcpPort, AX_IPAddress& address);
    static AX_STATUS GetIscsiInitiatorProps(const HBA_WWN* name,
                                            AX_iSCSI_InitiatorProperties* properties);
    static AX_STATUS SetInitiatorProperties(const HBA_WWN* name,
                                            const AX_iSCSI_InitiatorProperties& properties);
    static AX_STATUS GetIscsiPortStatistics(const HBA_WWN* name,
                                            AX_iSCSI_PortStatistics* statistics);
    // Whether the host boots over the function: 0 or 1.
    static AX_STATUS SetiSCSIBoot(const HBA_WWN* name, uint32 enabled);
    // 0 also for an address that refuses to answer; 1 for a text that is no address.
    static AX_STATUS Ping(const HBA_WWN* name, const char* ipAddress, uint16 tcpPort);

    static AX_STATUS GetiSNSServer(const HBA_WWN* name, VLN_NameServers* servers);
    // Adds the server, whether it answers or not, and sets whether servers are asked. 1 for a text
    // that is no address.
    static AX_STATUS UpdateiSNSServer(const HBA_WWN* name, const char* ipAddress, uint16 tcpPort,
                                      uint32 enable);
    static AX_STATUS DeleteiSNSServer(const HBA_WWN* name, const AX_IPAddress& server);

    // AX_STATUS_PORTAL_EXISTS: properties hold those that the portal stands with.
    static AX_STATUS AddTargetPortal(const HBA_WWN* name, const AX_IPAddress& portal,
                                     AX_iSCSI_LoginProperties* properties);
    static AX_STATUS RemoveTargetPortal(const HBA_WWN* name, const AX_IPAddress& portal);
    static AX_STATUS GetTargetPortalProperties(const HBA_WWN* name, const AX_IPAddress& portal,
                                               AX_iSCSI_LoginProperties* properties);
    static AX_STATUS SetTargetPortalProperties(const HBA_WWN* name, const AX_IPAddress& portal,
                                               const AX_iSCSI_LoginProperties& properties);

    static AX_STATUS AddTarget(const HBA_WWN* name, const char* target, const AX_IPAddress& portal,
                               const AX_iSCSI_LoginProperties& properties, bool login, bool boot);
    static AX_STATUS RemoveTarget(const HBA_WWN* name, const char* target);
    static AX_STATUS TargetLogin(const HBA_WWN* name, const char* target,
                                 const AX_IPAddress& portal,
                                 const AX_iSCSI_LoginProperties& properties);
    // portal: null for any.
    static AX_STATUS TargetLogout(const HBA_WWN* name, const char* target,
                                  const AX_IPAddress* portal, uint32 sessionId);
    static AX_STATUS GetTargetLoginAuthProperties(const HBA_WWN* name, const char* target,
                                                  AX_iSCSI_LoginProperties* properties);
    static AX_STATUS SetTargetLoginAuthProperties(const HBA_WWN* name, const char* target,
                                                  const AX_iSCSI_LoginProperties& properties);
    // Seconds.
    static AX_STATUS SetTargetProperties(const HBA_WWN* name, const char* target,
                                         uint32 extendedTimeOut);
    // address: null for any.
    static AX_STATUS SetBootTargetSession(const HBA_WWN* name, const char* target,
                                          const AX_IPAddress* address, uint32 enable);

    // ---- Port speed and PHY (phy.cpp) ----
    // ---- The IP stack of an iSCSI port (ip_tables.cpp) ----

    // 4 for a null port; 8 when out of memory.
    static AX_STATUS discoverARPTable(const HBA_WWN* port, std::vector<AX_ARPEntry>* entries);
    static AX_STATUS discoverRoute(const HBA_WWN* port, std::vector<AX_RouteEntry>* entries);
    static AX_STATUS AddARPTableEntry(const HBA_WWN* port, const AX_ARPEntry& entry);
    static AX_STATUS DeleteARPTableEntry(const HBA_WWN* port, const AX_ARPEntry& entry);
    static AX_STATUS AddRouteTableEntry(const HBA_WWN* port, const AX_RouteEntry& entry);
    static AX_STATUS DeleteRouteTableEntry(const HBA_WWN* port, const AX_RouteEntry& entry);
    static AX_STATUS SetNetworkSettings(const HBA_WWN* port,
                                        const AX_Ini_NetworkProperties& settings);

    // ---- Port speed (phy.cpp) ----

    // How the speed of the physical port is set. What the adapter does not tell is 0 or empty.
    static AX_STATUS GetPhyPortSpeedAttributesValues(const HBA_WWN* name,
                                                     AX_PhyPortSpeed* settings);
    // speed: one that the port tells, "" where mode leaves it to the adapter. cableLength: metres,
    // -1 for none.
    static AX_STATUS SetPhyPortSpeed(const HBA_WWN* name, const char* speed, uint32 mode,
                                     sint32 cableLength);
    // The velocity of propagation in the cable, 1 to 100 percent of light's; 1 for another value.
    static AX_STATUS SetCableNVP(const HBA_WWN* name, uint32 percent);
    // Has the PHY advertise the rate of that number, 0 to 3; 0 stands for all. 1 for another one.
    static AX_STATUS SetLineRateAdvertised(const HBA_WWN* name, uint32 rate);

    // ---- Firmware (firmware.cpp) ----

    // Has the adapter install the image of a file: AX_STATUS_REBOOT_NEEDED when it took and a
    // reboot is needed. Nothing is tried twice.
    static AX_STATUS vlncimDownloadFW(const HBA_WWN* name, const char* file);
    static AX_STATUS vlncimReset(const HBA_WWN* name);
    // The version on the adapter's flash, empty if it does not tell. 0 or 1.
    static AX_STATUS GetFirmwareOnFlash(const HBA_WWN* name, std::string* version);

    // ---- Switches of a port (port_state.cpp) ----

    // dynamic: how the change comes into force; 5 after a reset of the adapter.
    static AX_STATUS SetPortEnabled(const char* deviceId, bool enabled, uint32* dynamic);
    // 1 on, 0 off, in force after a reboot. 2 when the profile in force forbids it, 4 when
    // multichannel does.
    static AX_STATUS SetSRIOVEnabledState(const HBA_WWN* name, uint32 state);
    // As the port tells it, in force or not.
    static AX_STATUS GetSRIOVState(const HBA_WWN* name, uint32* state);

    // ---- Network boot and quality of service (nic_settings.cpp) ----

    // How an adapter boots over the network.
    enum Boot_Method : uint32 { BOOT_UNKNOWN = 0, BOOT_PXE = 1, BOOT_IBFT = 2, BOOT_NONE = 3 };
    // hasSeveral: iBFT is offered beside PXE. state: 1 on, 0 off.
    static AX_STATUS GetNICNetworkBootParams(const HBA_WWN* name, Boot_Method* method,
                                             bool* hasSeveral, uint32* state);
    // control: "E" to switch the boot on, with that method, "D" to switch it off; 1 for another
    // word. An adapter that does not tell its method has its boot code switched.
    static AX_STATUS SetNICNetworkBootParams(const HBA_WWN* name, const char* control,
                                             Boot_Method method);
    // What the function of the kind that qos tells is limited to. 1 beyond what that kind takes.
    static AX_STATUS SetQOSParams(const HBA_WWN* name, const AX_QoS* qos);
    static AX_STATUS GetQosInfo(const HBA_WWN* name, AX_QoS* qos);

    // ---- Virtual functions (virtual_functions.cpp) ----

    // The names of the virtual functions of a port.
    static AX_STATUS GetVirtualFuncList(const HBA_WWN* name, std::vector<AX_NAME>* functions);
    static AX_STATUS GetVirtualFuncPropertyList(const HBA_WWN* name, const AX_NAME& function,
                                                AX_VirtualFunctionProperties* properties);

    // ---- Virtual ports (virtual_ports.cpp) ----
    //
    // Of the port name, and the virtual port that it carries.

    static AX_STATUS ListVPorts(const HBA_WWN* name, std::vector<AX_VPort>* ports);
    static AX_STATUS ListVPortAttributes(const HBA_WWN* name, const HBA_WWN* vport,
                                         AX_VPortAttributes* attributes);
    // What the host knows the virtual port to see: logical units, those of a target one by one.
    static AX_STATUS ListVPortTargets(const HBA_WWN* name, const HBA_WWN* vport,
                                      std::vector<AX_VPortTarget>* units);
    // The numbers of the units that a target tells the virtual port of.
    static AX_STATUS ListVPortLuns(const HBA_WWN* name, const HBA_WWN* vport, const AX_NAME& target,
                                   std::vector<uint32>* luns);
    // What a unit tells of itself. A check condition may be over with the next attempt; there are
    // three.
    static AX_STATUS VPortLunAttr(const HBA_WWN* name, const HBA_WWN* vport,
                                  const AX_VPortTarget& unit, VLN_VPortUnit* answer);
    // The name of the virtual machine that uses the virtual port; 251 for none.
    static AX_STATUS ListVMfromVPort(const HBA_WWN* name, const HBA_WWN* vport,
                                     std::string* machine);

    // ---- Driver parameters (driver_parameters.cpp) ----

    // What the driver is set to: for the port with that device identifier or, global, for all of
    // its ports. 1 for a bad identifier, 8 when out of memory.
    static AX_STATUS FCoEGetDriverParam(const char* port, bool global,
                                        std::vector<AX_DriverParam>* parameters);
    // How far a change of a parameter reaches, and how long it holds.
    enum Parameter_Scope : uint32 { PARAMETER_LOCAL, PARAMETER_GLOBAL };
    enum Parameter_Duration : uint32 { PARAMETER_TEMPORARY, PARAMETER_PERSISTENT };
    // deviceId is for the log. 1 for an adapter that is not local, a bad scope or duration, a null
    // text, or a name that no parameter can have.
    static AX_STATUS vlncimSetDriverParam(const char* deviceId, const HBA_WWN* name, uint32 scope,
                                          uint32 duration, const char* parameter,
                                          const char* value);
    // Turns the priority of a logical unit that vport sees on (1) or off (0), through the port
    // initiator; the unit AX_OAS_ALL_LUNS stands for all of the target. option: AX_OAS_. 1 for an
    // identifier or a number of a unit that is none.
    static AX_STATUS SetOASLunState(const char* initiator, const char* vport, const char* target,
                                    const char* lun, uint32 state, uint32 option);
    // The units with priority that the port and its virtual ports see.
    static AX_STATUS GetOASLunList(const HBA_WWN* name, uint32 option,
                                   std::vector<AX_OASLun>* units);

    // ---- Files from and to other hosts (curl_transfer.cpp) ----

    // Makes a local file of a URI. A path, "file:///..." or "file://localhost/..." that is there is
    // answered as a path. Anything else libcurl fetches into a file of the object manager's
    // working folder: fetched is true then, and the file is the caller's to remove. return_code is
    // 0 or libcurl's code; 0 is no promise that the file exists, since without libcurl the path
    // comes back as it is. Within seconds of stop going up libcurl gives up.
    static void downloadFileUsingCurl(const char* uri, const bool& stop, std::string& local_path,
                                      int& return_code, bool& fetched);
    // Sends a file to where the URI says; 0, or -1 after a line of the log.
    static int uploadFileUsingCurl(const char* uri, const char* file);

    // ---- Dumps (dump.cpp) ----

    // Where a dump of an adapter that works is taken from.
    enum Snapshot_Mode : sint32 { SNAPSHOT_TESSEL = -1, SNAPSHOT_FLASH = 0, SNAPSHOT_RAM = 1 };
    static AX_STATUS vlncimDumpDiagnostic(const HBA_WWN* name, Snapshot_Mode mode);
    // Also of a port whose firmware has failed, by the name that GetDeadNICPorts gives it.
    static AX_STATUS vlncimGetCoreDump(const HBA_WWN* name, const char* options);
    // Fetches what an adapter keeps in its memory; with a null name, what all of the host keep.
    static AX_STATUS vlncimRetrieveFATDump(const HBA_WWN* name);
    static AX_STATUS GetDumpFileNames(const HBA_WWN* name, std::vector<std::string>* files);
    static AX_STATUS vlncimDeleteDumpFiles(const HBA_WWN* name);
    static AX_STATUS vlncimGetDumpDirectory(const HBA_WWN* name, std::string* directory);
    static AX_STATUS vlncimSetDumpDirectory(const HBA_WWN* name, const char* directory);
    // How many dump files are kept: 1 to 20, else 1 is answered.
    static AX_STATUS vlncimGetRetentionCount(const HBA_WWN* name, uint32* count);
    static AX_STATUS vlncimSetRetentionCount(const HBA_WWN* name, uint32 count);
    // The ports whose firmware has failed.
    static AX_STATUS GetDeadNICPorts(std::vector<AX_DeadNicPort>* ports);

    // ---- What the firmware traces (event_log.cpp) ----

    static AX_STATUS GetExtFATAdvancedData(const HBA_WWN* name, VLN_EventLogSettings* settings);
    // modes: a bit for each AX_LOG_MODE_.
    static AX_STATUS SetExtFATAdvancedData(const HBA_WWN* name, const char* module, uint32 modes,
                                           const AX_EventLogMode& values);
    // Of all modules, in the modes of those bits.
    static AX_STATUS vlncimSetAdvancedDumpTraceLevel(const HBA_WWN* name, uint32 level,
                                                     uint32 modes);
    static AX_STATUS vlncimRestoreDefaultSettings(const HBA_WWN* name);
    // How much the management library itself traces of a group of its functions.
    static AX_STATUS SetNIMATraceLevel(uint32 group, uint32 level);

    // ---- Diagnostic tests (diagnostics.cpp) ----
    //
    // A test runs in the background of the library, under the handle that its start gives.

    static AX_STATUS StartLoopBackTest(const HBA_WWN* name, uint32 type, uint32 cycles,
                                       bool haltOnError, const char* pattern, uint32* handle);
    static AX_STATUS StartEchoTest(const HBA_WWN* name, const HBA_WWN* target, uint32 cycles,
                                   bool haltOnError, const char* pattern, uint32* handle);
    // cable: where the library may write to, kept by the caller to the end of the test.
    static AX_STATUS StartCableTest(const HBA_WWN* name, AX_CableResults* cable, uint32* handle);
    // AX_STATUS_DIAG_IN_PROGRESS, with results, for a test that runs. Asked once a second, and so
    // without lines of its own.
    static AX_STATUS GetTestResults(const HBA_WWN* name, uint32 handle, AX_DiagResults* results);
    static AX_STATUS CancelDiagnostic(const HBA_WWN* name, uint32 handle);
    // AX_BEACON_OFF or AX_BEACON_ON.
    static AX_STATUS SetBeacon(const HBA_WWN* name, uint32 state);
    // ---- Data centre bridging (bridging.cpp; the rules stand in bridging_rules.h) ----

    static AX_STATUS vlncimGetCEEParams(const HBA_WWN* name, AX_CEE_Params* record);
    // Sets one parameter. With validate off the groups do not follow an application to its new
    // priority. 1, 2 or 4 when a rule is broken; 1 as well when the change was made and what the
    // adapter had before could not be read.
    static AX_STATUS vlncimSetCEEParams(const HBA_WWN* name, const char* parameter,
                                        const char* value, bool validate);
    // All groups at once, then flow control. When that fails the groups are as they were told.
    static AX_STATUS vlncimSetCeePriority(const HBA_WWN* name, uint32 pfcBitmap,
                                          const Priority_Groups& groups, bool validate);
    static AX_STATUS vlncimSetPgBW(const HBA_WWN* name, const Group_Bandwidths& bandwidths);
    // 1 on, 0 off.
    static AX_STATUS SetPfcThrottle(const HBA_WWN* name, uint32 value);

    // ---- FIP (fip.cpp) ----

    // Both answer 2 for a card without FCoE.
    static AX_STATUS vlnGetFIPParams(const HBA_WWN* name, VLN_FIPParams* params);
    // 4 for a value that cannot be: nothing is written then. 1 when a write fails; of the two that
    // it takes the first may stand by then.
    static AX_STATUS vlnSetFIPParams(const HBA_WWN* name, const VLN_FIPParams& wanted);
    // The forwarders that the port has found.
    static AX_STATUS GetFcfList(const HBA_WWN* name, std::vector<AX_Fcf>* forwarders);

    // ---- World Wide Names (wwn.cpp) ----

    static AX_STATUS GetWWNCapability(const HBA_WWN* name, uint32* capability);
    // type: AX_WWN_. activation: how the names stand, AX_WWN_ACTIVATION_; 0 if that is not told.
    static AX_STATUS ReadWWN(const HBA_WWN* name, uint32 type, HBA_WWN* wwpn, HBA_WWN* wwnn,
                             uint32* activation);
    // 5 when one of them is no valid name.
    static AX_STATUS ValidateNewWWNs(const HBA_WWN* wwpn, const HBA_WWN* wwnn);
    // Where the host has one of the names already, of all that can be told from its virtual ports.
    enum WWN_Duplicate : uint32 {
        WWN_UNIQUE,
        WWN_OF_VPORT_PORT,
        WWN_OF_VPORT_NODE,
        WWN_OF_TARGET_PORT,
        WWN_OF_TARGET_NODE,
    };
    static WWN_Duplicate FindDuplicateWWN(const HBA_WWN* wwpn, const HBA_WWN* wwnn);
    // These two ask again, once a second for five minutes, while the library is still at it; no
    // longer than until stop is raised and Time::wake called. activation: what the change waits
    // for.
    static AX_STATUS ChangeWWN(const HBA_WWN* name, const HBA_WWN* wwpn, const HBA_WWN* wwnn,
                               uint32 type, uint32* activation, const bool& stop);
    static AX_STATUS RestoreWWN(const HBA_WWN* name, uint32 type, uint32* activation,
                                const bool& stop);

    // ---- Channels of a port (channels.cpp) ----

    // An adapter without channels answers 251, which is no failure.
    static AX_STATUS GetChannelMgmtCNAInfo(const HBA_WWN* name, AX_ChannelMgmtCNAInfo* info);
    // Never more channels than the record has room for.
    static AX_STATUS GetChannelMgmtPortInfo(const HBA_WWN* name, AX_ChannelMgmtPortInfo* info);
    // What mask names is written.
    static AX_STATUS SetChannelMgmtPortInfo(const HBA_WWN* name,
                                            const AX_ChannelMgmtPortInfo& info);
    // 0 for off, or the mode after the next reboot. 251 for an adapter that is configured through
    // its profiles, 1 with SR-IOV on, 2 for a mode that the adapter does not have.
    static AX_STATUS SetCMMode(const HBA_WWN* name, uint32 mode);
    static AX_STATUS SetVEPAState(const HBA_WWN* name, uint32 state);

    // ---- Configuration of an adapter (port_configuration.cpp) ----

    // What tells how an adapter can be configured.
    enum Configuration_Feature : uint32 {
        CHANGES_PERSONALITY = 422,
        HAS_SRIOV_ON = 434,
        HAS_PROFILES = 436,
        HAS_CURRENT_CHANNEL_MGMT = 438,
    };
    static AX_STATUS HasFeature(const HBA_WWN* name, Configuration_Feature feature, bool* value);

    // The record has no more ports and functions than it has room for.
    static AX_STATUS GetAdpaterPortConfig(const HBA_WWN* name, AX_AdapterPortConfig* config);
    // 0 or 4: whether the rules of its generation allow the configuration. capabilities are those
    // of the channel management.
    static AX_STATUS OrriganValidateParams(const AX_AdapterPortConfig& config, bool sriovSupported,
                                           uint32 capabilities);
    // What becomes of the partitioning into more functions (NPAR EP) with a new configuration.
    enum NPAR_Update : uint8 { NPAR_STAYS, NPAR_GOES_ON, NPAR_GOES_OFF };
    // Checks the configuration and writes it, in force after the next reboot. It gets the profile
    // that fits if it names none. etsDisabled: it has the profile without ETS. A failure leaves the
    // number of functions as far as it was set.
    static AX_STATUS SetAdpaterPortConfig(const HBA_WWN* name, AX_AdapterPortConfig* config,
                                          bool* etsDisabled, NPAR_Update npar);
    // On success the caller frees the list with free(); its count is never beyond its entries.
    static AX_STATUS ListProfiles(const HBA_WWN* name, AX_ProfileList** profiles);
    static AX_STATUS SetAriFunctionCount(const HBA_WWN* name, uint32 count);
    // The configuration that the adapter came with, after the next reboot.
    static AX_STATUS FactoryDefaults(const HBA_WWN* name);
    // Never more personalities than the record has room for.
    static AX_STATUS GetAdapterPersonalities(const HBA_WWN* name, AX_AdapterPersonalityInfo* info);
    // After the next reboot. 251 for an adapter that is configured through its profiles.
    static AX_STATUS ChangeAdapterPersonality(const HBA_WWN* name, uint32 personality);

    // Logs a status of the library with its text for it, if it has one, at level 5.
    static void logStatus(AX_STATUS status);
};

} // namespace cimple

#endif // OPERATIONS_METHOD_WRAPPER_H
