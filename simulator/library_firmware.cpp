// Firmware, resets, and what switches a port on and off.
#include "simulator/call.h"
#include "simulator/firmware_image.h"
#include "simulator/same_hardware.h"
#include "simulator/scenario.h"

namespace vlnsim {
namespace {

std::uint32_t number_of(const Attribute_Map& map, std::uint16_t identifier) {
    const auto found = map.find(identifier);
    return found == map.end() ? 0 : found->second.number();
}

// "V:version,D:date", of which the date stays.
void set_version(Bytes& entry, const std::string& version) {
    const std::string before(entry.begin(), entry.end());
    const std::size_t start = before.find("V:");
    if (start == before.npos)
        return;
    std::string after = before;
    after.replace(start, before.find(',', start) - start, "V:" + version);
    entry.assign(after.begin(), after.end());
}

// What is on flash runs from now on.
void start_firmware(Function& function) {
    auto& attributes = function.adapter_attributes;
    const auto flash = attributes.find(AX_HA_FIRMWARE_ON_FLASH);
    if (flash == attributes.end())
        return;
    const Attribute version = flash->second;
    attributes[AX_HA_FIRMWARE_VERSION] = version;
    attributes[AX_HA_OPERATIONAL_FIRMWARE_VERSION] = version;
    if (const auto file = attributes.find(AX_HA_IPL_FILENAME); file != attributes.end())
        file->second = Attribute::of_text("VLN-" + version.text() + ".img");
    for (auto& [tag, entry] : function.fru_vpd)
        if (tag == "FW")
            set_version(entry, version.text());
}

// States of a port, of which two wait for a reset of the adapter.
enum : std::uint32_t {
    state_up = 2,
    state_link_down = 6,
    state_up_until_reset = 20,
    state_down_until_reset = 21,
    state_disabled = 22
};

void set_state(Function& function, std::uint32_t functional, std::uint32_t physical) {
    function.port_attributes[port_functional_state] = Attribute::of_number(functional);
    function.port_attributes[port_physical_state] = Attribute::of_number(physical);
}

void settle_port(Function& function) {
    const std::uint32_t state = number_of(function.port_attributes, port_functional_state);
    if (state == state_up_until_reset)
        set_state(function, state_disabled, state_disabled);
    else if (state == state_down_until_reset)
        set_state(function, state_up, state_up);
}

bool names_wait_for_reboot(const Function& function) {
    return function.name_management &&
           (function.name_management->capability & AX_WWN_NEEDS_REBOOT) != 0;
}

AX_STATUS check_image(const Firmware_Image& image) {
    switch (image.state) {
    case Firmware_Image::State::unreadable:
        return firmware_unreadable;
    case Firmware_Image::State::no_image:
        return firmware_no_image;
    default:
        return AX_STATUS_OK;
    }
}

AX_STATUS check_image(const Firmware_Image& image, const Function& function) {
    if (const AX_STATUS status = check_image(image))
        return status;
    if (image.state != Firmware_Image::State::whole)
        return firmware_damaged;
    return image.model == function.model ? AX_STATUS_OK : firmware_of_other_model;
}

} // namespace

void reset_adapter(Host& host, const Function& asked) {
    each_of_adapter(host, asked, [&](Function& function) {
        ++function.resets;
        if (function.firmware_effect != Effect::reboot)
            start_firmware(function);
        settle_port(function);
        if (!names_wait_for_reboot(function))
            activate_names(function);
    });
}

void set_cable(Host& host, const Function& asked, bool plugged) {
    const std::uint32_t from = plugged ? state_link_down : state_up;
    const std::uint32_t to = plugged ? state_up : state_link_down;
    for (Function& function : host.functions)
        if (function.shares_port(asked) &&
            number_of(function.port_attributes, port_physical_state) == from)
            set_state(function, to, to);
}

void reboot(Host& host) {
    for (Function& function : host.functions) {
        start_firmware(function);
        settle_port(function);
        activate_names(function);
        start_configuration(function);
        restart_driver(function);
    }
}

namespace library {

AX_STATUS AX_ImportHBAFileA(const char* file) {
    return answer<AX_STATUS>(
        Entry::AX_ImportHBAFileA,
        [&](Call& call) -> AX_STATUS {
            if (call.null(file, "file"))
                return AX_STATUS_INVALID_ARGUMENT;
            return check_image(read_firmware(file));
        },
        file);
}

AX_STATUS AX_VerifyFirmwareA(uint32_t, uint32_t, AX_WWN wwn, const char* file) {
    return answer<AX_STATUS>(
        Entry::AX_VerifyFirmwareA,
        [&](Call& call) -> AX_STATUS {
            if (call.null(file, "file"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            return function ? check_image(read_firmware(file), *function) : AX_STATUS_ILLEGAL_WWN;
        },
        wwn, file);
}

AX_STATUS AX_DownloadFirmware(AX_WWN wwn, const char* file, uint32_t options) {
    return answer<AX_STATUS>(
        Entry::AX_DownloadFirmware,
        [&](Call& call) -> AX_STATUS {
            if (call.null(file, "file"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* asked = call.function(wwn);
            if (!asked)
                return AX_STATUS_ILLEGAL_WWN;
            // Whatever the caller had verified: the file may be another one now.
            const Firmware_Image image = read_firmware(file);
            if (const AX_STATUS status = check_image(image, *asked))
                return status;
            each_of_adapter(call.host, *asked, [&](Function& function) {
                function.adapter_attributes[AX_HA_FIRMWARE_ON_FLASH] =
                    Attribute::of_text(image.version);
                if (asked->firmware_effect == Effect::once)
                    start_firmware(function);
            });
            return asked->firmware_effect == Effect::reboot ? AX_STATUS_REBOOT_NEEDED
                                                            : AX_STATUS_OK;
        },
        wwn, file, options);
}

AX_STATUS AX_ResetHBA(AX_WWN wwn) {
    return answer<AX_STATUS>(
        Entry::AX_ResetHBA,
        [&](Call& call) -> AX_STATUS {
            const Function* asked = call.function(wwn);
            if (!asked)
                return AX_STATUS_ILLEGAL_WWN;
            reset_adapter(call.host, *asked);
            return AX_STATUS_OK;
        },
        wwn);
}

AX_STATUS AX_SetPortEnabled(AX_WWN wwn, uint32_t enabled, uint32_t* dynamic) {
    return answer<AX_STATUS>(
        Entry::AX_SetPortEnabled,
        [&](Call& call) -> AX_STATUS {
            if (call.null(dynamic, "dynamic"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* asked = call.function(wwn);
            if (!asked)
                return AX_STATUS_ILLEGAL_WWN;
            for (const Function& function : call.host.functions)
                if (!enabled && function.shares_port(*asked) &&
                    number_of(function.adapter_attributes, AX_HA_BOOT_CODE_ENABLED) != 0)
                    return boot_code_enabled;
            const bool waits = asked->port_effect == Effect::reset;
            for (Function& function : call.host.functions) {
                const std::uint32_t physical =
                    number_of(function.port_attributes, port_physical_state);
                if (!function.shares_port(*asked))
                    continue;
                if (waits)
                    set_state(function, enabled ? state_down_until_reset : state_up_until_reset,
                              physical);
                else
                    set_state(function, enabled ? state_up : state_disabled,
                              enabled ? state_up : state_disabled);
            }
            *dynamic = waits ? dynamic_at_reset : dynamic_at_once;
            call.out("dynamic", *dynamic);
            return AX_STATUS_OK;
        },
        wwn, enabled);
}

} // namespace library
} // namespace vlnsim
