#include "tests/device/fake_model_library.h"

#include "operations/operation_frame.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

Fake_Model_Library fake_library;

namespace {

void count(const char* function) {
    ++fake_library.calls[function];
}

template <class Status>
Status next(std::deque<Status>& script) {
    if (script.empty())
        return 0;
    const Status status = script.front();
    script.pop_front();
    return status;
}

Fake_Instance* by_name(AX_WWN wwn) {
    for (Fake_Instance& instance : fake_library.instances)
        if (std::memcmp(instance.info.portWWN, &wwn, sizeof wwn) == 0)
            return &instance;
    return nullptr;
}

Fake_Instance* by_identifier(const HBAIdentifier* identifier) {
    fake_library.askedRecords.push_back(identifier->instance);
    return identifier->instance < fake_library.instances.size()
               ? &fake_library.instances[identifier->instance]
               : nullptr;
}

// Entries of identifier, length and bytes, closed by a zero identifier.
AX_STATUS fill(const Values& values, void* buffer, uint32_t size) {
    std::string bytes;
    for (const auto& [identifier, value] : values) {
        const auto length = static_cast<uint16_t>(value.size());
        bytes.append(reinterpret_cast<const char*>(&identifier), sizeof identifier);
        bytes.append(reinterpret_cast<const char*>(&length), sizeof length);
        bytes.append(value);
    }
    bytes.append(2, '\0');
    std::memcpy(buffer, bytes.data(), std::min<std::size_t>(bytes.size(), size));
    return bytes.size() <= size ? AX_STATUS_OK : AX_STATUS_ERROR;
}

Fake_Hba* by_handle(HBA_HANDLE handle) {
    return handle >= 1 && handle <= fake_library.hbas.size() ? &fake_library.hbas[handle - 1]
                                                             : nullptr;
}

} // namespace

std::string number(uint32_t value) {
    return {reinterpret_cast<const char*>(&value), sizeof value};
}

std::string counter(uint64_t value) {
    return {reinterpret_cast<const char*>(&value), sizeof value};
}

Fake_Instance& Fake_Model_Library::add(uint8_t low, uint32_t features, const char* model) {
    Fake_Instance& instance = instances.emplace_back();
    const uint8_t port[8] = {0x10, 0x00, 0x00, 0x90, 0xFA, 0x00, 0x00, low};
    const uint8_t node[8] = {0x20, 0x00, 0x00, 0x90, 0xFA, 0x00, 0x00, low};
    std::memcpy(instance.info.portWWN, port, sizeof port);
    std::memcpy(instance.info.nodeWWN, node, sizeof node);
    std::snprintf(instance.info.model, sizeof instance.info.model, "%s", model);
    instance.info.subAdapterNumber = low;
    instance.info.SpecialFeatures = features;
    return instance;
}

Fake_Hba& Fake_Model_Library::addHba(const char* name, uint8_t low) {
    Fake_Hba& hba = hbas.emplace_back();
    hba.name = name;
    hba.attributes.NumberOfPorts = 1;
    HBA_PORTATTRIBUTES& port = hba.ports.emplace_back();
    const uint8_t wwn[8] = {0x10, 0x00, 0x00, 0x90, 0xFA, 0x00, 0x00, low};
    std::memcpy(port.PortWWN.wwn, wwn, sizeof wwn);
    return hba;
}

// ---- The management library ----

AX_STATUS AX_GetAllLocalHBAInstances(uint32_t* room, uint32_t* table) {
    count(__func__);
    if (fake_library.onListing)
        fake_library.onListing(fake_library.calls[__func__]);
    if (!fake_library.listings.empty()) {
        const Fake_Listing listing = fake_library.listings.front();
        fake_library.listings.pop_front();
        *room = listing.count;
        return listing.status;
    }
    const auto have = static_cast<uint32_t>(fake_library.instances.size());
    const bool fits = have <= *room;
    for (uint32_t i = 0; fits && i < have; ++i)
        table[i] = i;
    *room = have;
    return fits ? AX_STATUS_OK : AX_STATUS_MORE_DATA;
}

AX_STATUS AX_GetLocalHBAInfoV4(const HBAIdentifier* identifier, LocalHBAInfoV4* info) {
    count(__func__);
    Fake_Instance* instance = by_identifier(identifier);
    const AX_STATUS status = instance ? next(instance->v4) : AX_STATUS(AX_STATUS_ERROR);
    if (status == AX_STATUS_OK)
        *info = instance->info;
    return status;
}

AX_STATUS AX_GetLocalHBAInfoV3(const HBAIdentifier* identifier, LocalHBAInfoV3* info) {
    count(__func__);
    Fake_Instance* instance = by_identifier(identifier);
    const AX_STATUS status = instance ? next(instance->v3) : AX_STATUS(AX_STATUS_ERROR);
    if (status == AX_STATUS_OK)
        std::memcpy(info, &instance->info, sizeof *info);
    return status;
}

AX_STATUS AX_GetHBAAttributes(AX_WWN wwn, void* buffer, uint32_t* size) {
    count(__func__);
    Fake_Instance* instance = by_name(wwn);
    const AX_STATUS status = instance ? next(instance->adapterStatus) : AX_STATUS(AX_STATUS_ERROR);
    return status ? status : fill(instance->adapterValues, buffer, *size);
}

AX_STATUS AX_GetPortAttributes(AX_WWN wwn, void* buffer, uint32_t* size) {
    count(__func__);
    Fake_Instance* instance = by_name(wwn);
    const AX_STATUS status = instance ? next(instance->portStatus) : AX_STATUS(AX_STATUS_ERROR);
    return status ? status : fill(instance->portValues, buffer, *size);
}

AX_STATUS AX_GetPortStatistics(AX_WWN wwn, void* buffer, uint32_t size) {
    count(__func__);
    Fake_Instance* instance = by_name(wwn);
    const AX_STATUS status =
        instance ? next(instance->statisticsStatus) : AX_STATUS(AX_STATUS_ERROR);
    return status ? status : fill(instance->statistics, buffer, size);
}

void* AX_GetAttributeValue(void* buffer, uint16_t identifier, uint16_t* length, AX_STATUS* status) {
    auto* place = static_cast<char*>(buffer);
    for (;;) {
        uint16_t head[2];
        std::memcpy(head, place, sizeof head);
        if (head[0] == 0)
            break;
        place += sizeof head;
        if (head[0] == identifier) {
            *length = head[1];
            *status = AX_STATUS_OK;
            return fake_library.onValue ? fake_library.onValue(buffer, identifier, place, length)
                                        : place;
        }
        place += head[1];
    }
    *status = AX_STATUS_NOT_SUPPORTED;
    return nullptr;
}

AX_STATUS AX_GetDriverType(AX_WWN wwn, uint32_t* type) {
    count(__func__);
    *type = 3;
    const Fake_Instance* instance = by_name(wwn);
    return instance ? instance->driverTypeStatus : AX_STATUS(AX_STATUS_ERROR);
}

AX_STATUS AX_iSCSI_GetInitiatorProperties(AX_WWN wwn, AX_iSCSI_InitiatorProperties* properties) {
    const Fake_Instance* instance = by_name(wwn);
    *properties = instance->initiator;
    return instance->initiatorStatus;
}

AX_STATUS AX_Ini_GetNetworkProperties(AX_WWN wwn, AX_Ini_NetworkProperties* properties) {
    const Fake_Instance* instance = by_name(wwn);
    *properties = instance->network;
    return instance->networkStatus;
}

// What the identifiers need beside the conversions that the model calls.
AX_STATUS AX_IsLocalHBA(AX_WWN, uint32_t*) {
    return AX_STATUS_ERROR;
}

// ---- The HBA API ----

HBA_STATUS HBA_LoadLibrary(void) {
    count(__func__);
    return HBA_STATUS_ERROR; // the model takes no notice
}

HBA_UINT32 HBA_GetNumberOfAdapters(void) {
    return fake_library.hbaCount != UINT32_MAX ? fake_library.hbaCount
                                               : static_cast<uint32_t>(fake_library.hbas.size());
}

HBA_STATUS HBA_GetAdapterName(HBA_UINT32 index, char* name) {
    count(__func__);
    if (index >= fake_library.hbas.size())
        return HBA_STATUS_ERROR_ILLEGAL_INDEX;
    const Fake_Hba& hba = fake_library.hbas[index];
    if (hba.nameStatus == HBA_STATUS_OK)
        std::strcpy(name, hba.name.c_str());
    return hba.nameStatus;
}

HBA_HANDLE HBA_OpenAdapter(char* name) {
    count(__func__);
    for (std::size_t i = 0; i < fake_library.hbas.size(); ++i)
        if (fake_library.hbas[i].name == name && fake_library.hbas[i].opens) {
            ++fake_library.openHandles;
            return static_cast<HBA_HANDLE>(i + 1);
        }
    return 0;
}

void HBA_CloseAdapter(HBA_HANDLE) {
    count(__func__);
    --fake_library.openHandles;
}

void HBA_RefreshInformation(HBA_HANDLE) {
    count(__func__);
}

HBA_STATUS HBA_GetAdapterAttributes(HBA_HANDLE handle, HBA_ADAPTERATTRIBUTES* attributes) {
    Fake_Hba* hba = by_handle(handle);
    const HBA_STATUS status =
        hba ? next(hba->attributesStatus) : HBA_STATUS(HBA_STATUS_ERROR_INVALID_HANDLE);
    if (status == HBA_STATUS_OK)
        *attributes = hba->attributes;
    return status;
}

HBA_STATUS HBA_GetAdapterPortAttributes(HBA_HANDLE handle, HBA_UINT32 index,
                                        HBA_PORTATTRIBUTES* attributes) {
    count(__func__);
    Fake_Hba* hba = by_handle(handle);
    if (!hba || index >= hba->ports.size())
        return HBA_STATUS_ERROR_ILLEGAL_INDEX;
    const HBA_STATUS status = next(hba->portStatus);
    if (status == HBA_STATUS_OK)
        *attributes = hba->ports[index];
    return status;
}
