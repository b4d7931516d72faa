// The second walk: the targets themselves, and the logical units behind them.

#include "agent/associations.h"
#include "agent/san/iscsi_instances.h"
#include "agent/san/iscsi_san_maps.h"
#include "agent/san/logical_unit_maps.h"
#include "agent/text.h"
#include "classes/VLNMPCA_iSCSITargetProtocolEndpoint.h"
#include "device/library/bound_functions.h"
#include "device/scan_end.h"
#include "foundation/utf8.h"

#include <cstdlib>
#include <cstring>

namespace cimple {

namespace {

// What a target tells of a unit, as the library passes it on.
struct Told_Unit {
    std::size_t index; // in the target's list
    uint32 number;
    std::string number_text;
    std::string words; // that follow the number
    AX_iSCSI_LunProperties properties;
};

// A unit's own text begins with its number: "5 backup pool".
void split_text(const AX_iSCSI_Lun& entry, Told_Unit& unit) {
    std::string words = fieldText(entry.text);
    char* rest = nullptr;
    const char* number = strtok_r(words.data(), " ", &rest);
    char* end = nullptr;
    const long value = number ? std::strtol(number, &end, 10) : 0;
    const bool numbered = number && end != number;
    unit.number = numbered ? static_cast<uint32>(value) : entry.number;
    unit.number_text = numbered ? number : std::to_string(entry.number);
    for (const char* word = numbered ? strtok_r(nullptr, " ", &rest) : number; word;
         word = strtok_r(nullptr, " ", &rest))
        unit.words += (unit.words.empty() ? "" : " ") + std::string(word);
}

// The texts of a unit's properties, each up to its end.
struct Told_Texts {
    std::string vendor;
    std::string product;
    std::string revision;
    std::string serial;
    std::string os_device_name;

    explicit Told_Texts(const AX_iSCSI_LunProperties& properties)
        : vendor(fieldText(properties.vendor)), product(fieldText(properties.product)),
          revision(fieldText(properties.revision)), serial(fieldText(properties.serialNumber)),
          os_device_name(fieldText(properties.osDeviceName)) {}
};

// One line for a unit, however many of its texts are none.
void warn_of_wild_bytes(const ISCSI_Target& target, const Told_Unit& unit,
                        const Told_Texts& texts) {
    if (!are_utf8({unit.words, texts.vendor, texts.product, texts.revision, texts.serial,
                   texts.os_device_name}))
        VLN_LOG(VLN_ERR, "Texts of LUN %d of target %s are no UTF-8: bytes were replaced",
                static_cast<int>(unit.number), target.name.c_str());
}

Logical_Unit logical_unit(const ISCSI_Target& target, const Told_Unit& unit) {
    const AX_iSCSI_LunProperties& properties = unit.properties;
    const Told_Texts texts(properties);
    warn_of_wild_bytes(target, unit, texts);
    const String product = format_text("%s %s Revision %s", texts.vendor.c_str(),
                                       texts.product.c_str(), texts.revision.c_str());
    return {.peripheral_type = properties.deviceType,
            .number = unit.number,
            .device_id = format_text("%zu:%zu:%s:%s", target.index, unit.index, target.name.c_str(),
                                     unit.number_text.c_str()),
            .name = format_text("%s:%s:%s:%d", texts.vendor.c_str(), texts.product.c_str(),
                                texts.serial.c_str(), static_cast<int>(unit.number)),
            .description = unit.words.empty() ? product : text(unit.words),
            .os_device_name = text(texts.os_device_name),
            .inquiry = format_text("%s Serial Number %s", product.c_str(), texts.serial.c_str()),
            .capacity = properties.blockCount * properties.blockSize,
            .block_size = properties.blockSize,
            .number_of_blocks = properties.blockCount};
}

// One from each endpoint that has a session with the target.
std::vector<Unit_Path> paths_to(const ISCSI_Target& target,
                                const VLNMPCA_iSCSITargetProtocolEndpoint* endpoint) {
    std::vector<Unit_Path> paths;
    for (const auto* initiator : target.initiators)
        paths.push_back(
            {Unit_Transport::ISCSI, initiator, endpoint,
             format_text("%s:%s", initiator->Name.value.c_str(), endpoint->Name.value.c_str())});
    return paths;
}

} // namespace

uint32 ISCSI_SAN_Maps::createTarget(const ISCSI_View& view, const ISCSI_Target& target) {
    AX_iSCSI_LunList* luns = nullptr;
    const AX_STATUS status =
        VLN_MethodWrapper::GetiSCSILuns(&view.wwn, target.raw_name.c_str(), &luns);
    const std::unique_ptr<AX_iSCSI_LunList, decltype(&std::free)> owner(luns, &std::free);
    if (status != AX_STATUS_OK)
        VLN_LOG(VLN_CRIT, "GetiSCSILuns failed for target %s", target.name.c_str());

    const String name = format_text("%s:%s", target.name.c_str(), view.port_name.c_str());
    const String failure = format_text(
        "Insert Failed : m_VLNMPCA_iSCSITargetProtocolEndpoint_map for Name = %s", name.c_str());
    auto instance = make_instance<VLNMPCA_iSCSITargetProtocolEndpoint>();
    describe_endpoint(*instance, *view.system, name,
                      target.portal_group.empty() ? String(NO_TEXT) : target.portal_group,
                      ISCSI_Role::TARGET);
    const auto* endpoint = insert_instance(_agent.m_VLNMPCA_iSCSITargetProtocolEndpoint_map,
                                           instance, failure.c_str());
    if (!endpoint ||
        !associate(_agent.m_VLNMPCA_iSCSILocalHostedAccessPoint_map, view.system, endpoint))
        return AX_STATUS_ERROR;
    if (luns)
        createUnits(view, target, *luns, endpoint);
    return AX_STATUS_OK;
}

// A unit that two ports see stands once, with a path from each. Without a usable session with the
// target there is nothing that a path could begin at.
void ISCSI_SAN_Maps::createUnits(const ISCSI_View& view, const ISCSI_Target& target,
                                 const AX_iSCSI_LunList& luns,
                                 const VLNMPCA_iSCSITargetProtocolEndpoint* target_endpoint) {
    if (target.initiators.empty())
        VLN_LOG(VLN_DBG, "No open session with target %s: its LUNs have no paths",
                target.name.c_str());
    Logical_Unit_Maps maps(_agent, view.system);
    const auto paths = paths_to(target, target_endpoint);
    for (uint32 i = 0; i < luns.count && !scan_is_to_end; ++i) {
        Told_Unit told{};
        told.index = i;
        split_text(luns.entry[i], told);
        if (AX_iSCSI_GetLunProperties(AX_WwnOf(&view.wwn), target.raw_name.c_str(),
                                      luns.entry[i].number, &told.properties) != AX_STATUS_OK) {
            VLN_LOG(VLN_DBG, "Unable to get properties for LUN %d for target %s",
                    static_cast<int>(told.number), target.name.c_str());
            continue;
        }
        VLN_LOG(VLN_DBG, "iSCSI Target %zu LUN %zu is of type %d.", target.index, told.index,
                static_cast<int>(told.properties.deviceType));
        const Logical_Unit unit = logical_unit(target, told);
        const auto device = maps.findOrMake(unit);
        for (const Unit_Path& path : paths)
            maps.joinPath(path, unit, device);
    }
}

} // namespace cimple
