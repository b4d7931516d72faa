#include "services/firmware/install.h"

#include "agent/hardware/port_identity.h"
#include "agent/text.h"
#include "classes/CIM_LogicalPort.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "foundation/host_paths.h"
#include "services/firmware/port_switches.h"
#include "services/method_call.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <memory>
#include <optional>
#include <sys/stat.h>

namespace cimple {

namespace {

enum Install_Result : uint32 {
    INSTALL_CANNOT_OPEN = 4,
    INSTALL_INVALID_OPTION = 5,
    INSTALL_INVALID_PARAMETER = 4097,
    INSTALL_UNREACHABLE = 4107,
};

// CIM_SoftwareInstallationService.InstallOptions that the service takes.
constexpr uint16 OPTION_RESET = 2;          // the adapter is reset after the download
constexpr uint16 OPTION_FILE_NAME = 0x8000; // of a byte stream: its value names the file
constexpr uint16 OPTIONS[] = {OPTION_RESET, 4, 5, 6, 7, 11};

bool is_option(uint16 option) {
    return std::find(std::begin(OPTIONS), std::end(OPTIONS), option) != std::end(OPTIONS);
}

// The port that an installation is for, or why there is none.
struct Target_Port {
    const CIM_LogicalPort* port;
    uint32 result;
};

Target_Port find_target(const ProviderAgent& agent, const CIM_ManagedElement* target,
                        const char* unknown) {
    if (!target) {
        VLN_LOG(VLN_ERR, "Target has a null pointer");
        return {nullptr, INSTALL_INVALID_PARAMETER};
    }
    const auto* port = cast<CIM_LogicalPort>(target);
    if (!port) {
        VLN_LOG(VLN_ERR, "Invalid Port is passed");
        return {nullptr, METHOD_INVALID_TARGET};
    }
    if (!is_known_port(agent, port->DeviceID.value)) {
        VLN_LOG(VLN_ERR, "%s", unknown);
        return {nullptr, METHOD_INVALID_TARGET};
    }
    return {port, METHOD_DONE};
}

// ---- The download ----

uint32 look_at_file(const char* file) {
    struct stat found {};
    if (stat(file, &found) == 0)
        return METHOD_DONE;
    if (errno == ENOENT) {
        VLN_LOG(VLN_ERR, "ERROR: vlncimDownloadFW: FW file not found");
        return INSTALL_UNREACHABLE;
    }
    VLN_LOG(VLN_ERR, "ERROR: vlncimDownloadFW: Can't stat FW file ");
    return INSTALL_INVALID_OPTION;
}

bool is_done(AX_STATUS status) {
    return status == AX_STATUS_OK || status == AX_STATUS_REBOOT_NEEDED;
}

void log_download(const String& device_id, AX_STATUS status) {
    if (status == AX_STATUS_OK)
        VLN_LOG(VLN_WARN, "CNA Firmware download functionality completed for target %s",
                device_id.c_str());
    else if (status == AX_STATUS_REBOOT_NEEDED)
        VLN_LOG(VLN_WARN,
                "CNA Firmware download completed for target %s Please reboot system to activate "
                "new firmware.",
                device_id.c_str());
    else
        VLN_LOG(VLN_ERR, "Error - in the firmware download functionality status=%d", status);
}

template <class Port>
void note_download(Instance_Map<Port>& ports, const String& device_id, uint32 status) {
    if (const Port* port = find_port(ports, device_id))
        change(ports, port, [status](Port& shown) { shown.FWDownloadStatus.set(status); });
}

// With the port alone, until the next refresh.
void note_download(ProviderAgent& agent, const String& device_id, AX_STATUS status) {
    const uint32 shown = METHOD_LIBRARY_STATUS + status;
    note_download(agent.m_VLNMPCA_EthernetPort_map, device_id, shown);
    note_download(agent.m_VLNMPCA_FCPort_map, device_id, shown);
}

// ---- From a URI ----

uint32 check_uri_options(const Array<uint16>& options) {
    VLN_LOG(VLN_DBG, "size of InstallOptions array = %zu, first member %u",
            std::size_t{options.size()}, options.empty() ? 0U : options[0]);
    if (std::all_of(options.begin(), options.end(), is_option))
        return METHOD_DONE;
    VLN_LOG(VLN_ERR, "invalid value of Install options");
    return INSTALL_INVALID_OPTION;
}

void remove_fetched(const std::string& file) {
    struct stat found {};
    if (stat(file.c_str(), &found) != 0)
        VLN_LOG(VLN_ERR, "vlncimDownloadFW: Can't stat file %s", file.c_str());
    else if (std::remove(file.c_str()) == 0)
        VLN_LOG(VLN_DBG, "vlncimDownloadFW: FW file %s removed successfully", file.c_str());
}

// One reset for each time that the option is given.
uint32 reset_as_asked(const Array<uint16>& options, const HBA_WWN& name) {
    for (const uint16 option : options) {
        if (option != OPTION_RESET)
            continue;
        if (const AX_STATUS status = VLN_MethodWrapper::vlncimReset(&name)) {
            VLN_LOG(VLN_ERR, "VLNMPCA_SoftwareInstallationService_Provider::vlncimResetHBA failed");
            return METHOD_LIBRARY_STATUS + status;
        }
        VLN_LOG(VLN_WARN, "Fiwmware download functionality complete with Reset on the HBA");
    }
    return METHOD_DONE;
}

// A file of the local disk, or one that was fetched for this call.
struct Image_File {
    std::string name;
    bool fetched = false;
};

uint32 find_image(const String& uri, const bool& stop, Image_File& image) {
    int error = 0;
    VLN_MethodWrapper::downloadFileUsingCurl(uri.c_str(), stop, image.name, error, image.fetched);
    if (error == 0)
        return look_at_file(image.name.c_str());
    VLN_LOG(VLN_ERR, "ERROR: CURL returned with Error :%d", error);
    return INSTALL_UNREACHABLE;
}

uint32 install_image(ProviderAgent& agent, const CIM_LogicalPort& port, const Image_File& image,
                     const Array<uint16>& options) {
    HBA_WWN name{};
    if (!adapter_name(port, name))
        return INSTALL_INVALID_PARAMETER;
    const String& device_id = port.DeviceID.value;
    const AX_STATUS status = VLN_MethodWrapper::vlncimDownloadFW(&name, image.name.c_str());
    log_download(device_id, status);
    if (!is_done(status)) {
        note_download(agent, device_id, status);
        return METHOD_LIBRARY_STATUS + status;
    }
    if (status == AX_STATUS_REBOOT_NEEDED) {
        update_firmware_on_flash(agent, device_id, name);
        note_download(agent, device_id, status);
    }
    VLN_LOG(VLN_DBG, "vlncimDownloadFW: Removing the FW file from CIMOM's repository ");
    if (image.fetched)
        remove_fetched(image.name);
    if (status == AX_STATUS_REBOOT_NEEDED)
        return METHOD_DONE;
    if (const uint32 failure = reset_as_asked(options, name))
        return failure;
    update_firmware_on_flash(agent, device_id, name);
    return METHOD_DONE;
}

// ---- From bytes ----

// The name of the file, which stands among the values where the last option for it stands among
// the options; null, with a line, for options that are not in order.
const String* find_file_name(const Array<uint16>& options, const Array<String>& values) {
    if (values.empty()) {
        VLN_LOG(VLN_ERR, "InstallOptionsValues is empty. Should have the correct firmware file "
                         "name. Returning Invalid Parameter");
        return nullptr;
    }
    std::optional<uint32> place;
    for (uint32 i = 0; i < options.size(); ++i) {
        if (options[i] == OPTION_FILE_NAME) {
            place = i;
        } else if (!is_option(options[i])) {
            VLN_LOG(VLN_ERR, "invalid value of Install options");
            return nullptr;
        }
    }
    if (!place)
        VLN_LOG(VLN_ERR, "InstallOptions does not have the value 32768");
    else if (*place >= values.size())
        VLN_LOG(VLN_ERR, "InstallOptionsValues has no file name for the value 32768");
    return place && *place < values.size() ? &values[*place] : nullptr;
}

// A file that is there as long as the call. What is no file of a disk is not ours to remove.
class Passing_File {
public:
    explicit Passing_File(const char* name) : m_name(name), m_file(std::fopen(name, "wb")) {
        struct stat found {};
        m_is_ours = m_file && fstat(fileno(m_file.get()), &found) == 0 && S_ISREG(found.st_mode);
    }
    ~Passing_File() {
        m_file.reset();
        if (m_is_ours)
            std::remove(m_name);
    }
    Passing_File(const Passing_File&) = delete;
    Passing_File& operator=(const Passing_File&) = delete;

    // False unless all of it is in the file: a part of an image is none.
    bool write(const Array<uint8>& image) {
        if (!m_file)
            return false;
        const bool complete =
            std::fwrite(image.begin(), 1, image.size(), m_file.get()) == image.size();
        return std::fclose(m_file.release()) == 0 && complete;
    }

private:
    struct Close {
        void operator()(std::FILE* file) const { std::fclose(file); }
    };

    const char* m_name;
    std::unique_ptr<std::FILE, Close> m_file;
    bool m_is_ours;
};

uint32 install_file(const CIM_LogicalPort& port, const char* file) {
    if (const uint32 failure = look_at_file(file))
        return failure;
    HBA_WWN name{};
    if (!adapter_name(port, name))
        return INSTALL_INVALID_PARAMETER;
    const AX_STATUS status = VLN_MethodWrapper::vlncimDownloadFW(&name, file);
    log_download(port.DeviceID.value, status);
    return is_done(status) ? METHOD_DONE : METHOD_LIBRARY_STATUS + status;
}

// ---- What is on flash ----

bool is_of_asic(const VLNMPCA_SoftwareIdentity& software, const String& asic) {
    const Array<String>& types = software.IdentityInfoType.value;
    const Array<String>& values = software.IdentityInfoValue.value;
    for (uint32 i = 0; i < types.size() && i < values.size(); ++i)
        if (types[i] == IDENTITY_ASIC && values[i] == asic)
            return true;
    return false;
}

template <class Port>
const String* asic_of(const Instance_Map<Port>& ports, const String& device_id) {
    const Port* port = find_port(ports, device_id);
    return port ? port_identity(*port, IDENTITY_ASIC) : nullptr;
}

} // namespace

uint32 install_from_uri(ProviderAgent& agent, const CIM_ManagedElement* target, const String& uri,
                        const Array<uint16>& options, const bool& stop) {
    const Target_Port found = find_target(
        agent, target, "VLNMPCA_SoftwareInstallationService_Provider invalid port passed");
    if (!found.port)
        return found.result;
    if (uri.empty()) {
        VLN_LOG(VLN_ERR, "Null sized URI..returning");
        return INSTALL_INVALID_PARAMETER;
    }
    if (const uint32 failure = check_uri_options(options))
        return failure;
    Image_File image;
    if (const uint32 failure = find_image(uri, stop, image))
        return failure;
    return install_image(agent, *found.port, image, options);
}

uint32 install_from_bytes(ProviderAgent& agent, const CIM_ManagedElement* target,
                          const Array<uint8>& image, const Array<uint16>& options,
                          const Array<String>& values) {
    const Target_Port found = find_target(
        agent, target, "VLNMPCA_SoftwareInstallationService_Provider::Wrong DeviceID passed");
    if (!found.port)
        return found.result;
    const String* name = find_file_name(options, values);
    if (!name)
        return INSTALL_INVALID_OPTION;
    VLN_LOG(VLN_DBG, "filename is : %s", name->c_str());
    const std::string path = working_file(name->c_str());
    Passing_File file(path.c_str());
    if (!file.write(image)) {
        VLN_LOG(VLN_ERR, "Could not open file to copy the firmware from ByteStream");
        return INSTALL_CANNOT_OPEN;
    }
    return install_file(*found.port, path.c_str());
}

void update_firmware_on_flash(ProviderAgent& agent, const String& device_id, const HBA_WWN& name) {
    std::string version;
    if (VLN_MethodWrapper::GetFirmwareOnFlash(&name, &version) != AX_STATUS_OK)
        return;
    const String* asic = asic_of(agent.m_VLNMPCA_EthernetPort_map, device_id);
    if (!asic)
        asic = asic_of(agent.m_VLNMPCA_FCPort_map, device_id);
    if (!asic)
        return;
    const String key = *asic;
    const String shown = text(version);
    auto& software = agent.m_VLNMPCA_SoftwareIdentity_map;
    for (uint32 i = 0; i < software.size(); ++i)
        if (is_of_asic(*software[i], key))
            change(software, i, [&shown](VLNMPCA_SoftwareIdentity& identity) {
                identity.FirmwareOnFlash.set(shown);
            });
}

} // namespace cimple
