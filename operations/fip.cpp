// How an FCoE port finds its forwarder: what it is set to look for, and what it has found.
#include "operations/fip_texts.h"
#include "operations/operation_frame.h"

#include <cstdio>
#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr uint32 FEATURE_FCOE = 403;
constexpr AX_STATUS NO_FCOE_CARD = 2;
constexpr uint32 FIRST_FORWARDERS = 8;

// ---- To texts ----

std::string nameText(const AX_NAME& name) {
    HBA_WWN wwn{};
    std::memcpy(wwn.wwn, name.byte, sizeof wwn.wwn);
    char text[VLN_MethodWrapper::HBA_NAME_SIZE] = "";
    VLN_MethodWrapper::HBAName2Str(text, &wwn);
    return text;
}

std::string mapText(const uint8 (&map)[3]) {
    char text[12];
    std::snprintf(text, sizeof text, "0x%02X%02X%02X", map[0], map[1], map[2]);
    return text;
}

void formatConnectList(const AX_FCFConnectList& list, VLN_FIPParams& params) {
    params.primaryFabricName = nameText(list.fabricName);
    params.primarySwitchName = nameText(list.switchName);
    params.vlanId = list.flags & AX_FCF_VLAN_VALID ? std::to_string(list.vlanID) : "Any";
    params.fcMap = mapText(list.fcMap);
}

// ---- From texts ----

// The records as they are to be written, and whether there is anything for the first of them.
struct Fip_Change {
    AX_FCFConnectList connect{};
    AX_FIPParams params{};
    bool connectGiven = false;
};

AX_STATUS refuse(const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return AX_STATUS_INVALID_ARGUMENT;
}

AX_STATUS takeName(const std::string& text, const char* invalid, AX_NAME& name,
                   Fip_Change& change) {
    if (text.empty())
        return AX_STATUS_OK;
    HBA_WWN wwn{};
    if (VLN_MethodWrapper::str2HBAName(&wwn, text.c_str()) != 0)
        return refuse("pfabric value must be in the format XX:XX:XX:XX:XX:XX:XX:XX");
    if (AX_ValidateWwn(wwnOf(&wwn)) != AX_STATUS_OK)
        return refuse(invalid);
    std::memcpy(name.byte, wwn.wwn, sizeof name.byte);
    change.connectGiven = true;
    return AX_STATUS_OK;
}

// "Any" is written as no other VLAN: one that the adapter has stays.
AX_STATUS takeVlan(const std::string& text, Fip_Change& change) {
    if (text.empty())
        return AX_STATUS_OK;
    const Read_Vlan vlan = readVlan(text.c_str());
    if (vlan.refusal)
        return refuse(vlan.refusal);
    if (!vlan.any) {
        change.connect.vlanID = vlan.id;
        change.connect.flags |= AX_FCF_VLAN_VALID;
    }
    change.connectGiven = true;
    return AX_STATUS_OK;
}

// A number that is no FC map is left out with a line, and is no reason to leave out the rest.
AX_STATUS takeMap(const std::string& text, Fip_Change& change) {
    constexpr char INVALID[] = "Invalid fcmap value";
    if (text.empty())
        return AX_STATUS_OK;
    const std::optional<uint32> number = numberOfText(text.c_str());
    if (!number)
        return refuse(INVALID);
    if (!isFCMap(*number)) {
        VLN_LOG(VLN_ERR, "%s", INVALID);
        return AX_STATUS_OK;
    }
    uint32 shift = 16;
    for (uint8& byte : change.connect.fcMap) {
        byte = static_cast<uint8>(*number >> shift);
        shift -= 8;
    }
    change.connectGiven = true;
    return AX_STATUS_OK;
}

AX_STATUS takeCinVlan(std::optional<uint32> id, Fip_Change& change) {
    if (!id)
        return AX_STATUS_OK;
    if (*id > MAX_VLAN_ID)
        return refuse("CIN VLAN ID value must be between 0 and 4095");
    VLN_LOG(VLN_DBG, "Valid CIN VLAN ID value");
    change.params.cinVlanID = *id;
    return AX_STATUS_OK;
}

// The first rule that is broken ends it.
AX_STATUS takeParams(const VLN_FIPParams& wanted, Fip_Change& change) {
    if (const AX_STATUS status =
            takeName(wanted.primaryFabricName,
                     "Invalid World Wide Port Name entered for primary fabric name",
                     change.connect.fabricName, change))
        return status;
    if (const AX_STATUS status = takeName(
            wanted.primarySwitchName, "Invalid World Wide Port Name entered for switch fabric name",
            change.connect.switchName, change))
        return status;
    if (const AX_STATUS status = takeVlan(wanted.vlanId, change))
        return status;
    if (const AX_STATUS status = takeMap(wanted.fcMap, change))
        return status;
    return takeCinVlan(wanted.cinVlanId, change);
}

// ---- The library ----

AX_STATUS failed(AX_STATUS status, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    VLN_MethodWrapper::logStatus(status);
    return status;
}

AX_STATUS readForChange(const HBA_WWN* name, Fip_Change& change) {
    if (const AX_STATUS status = AX_CNA_FCOE_GetFCFConnectList(wwnOf(name), &change.connect))
        return failed(status,
                      "Error getting DCB FIP Parameters, Cannot set the specified parameter");
    if (const AX_STATUS status = AX_CNA_FCOE_GetFIPParams(wwnOf(name), &change.params))
        return failed(status,
                      "Error getting CIN FIP Parameters, Cannot set the specified parameter");
    return AX_STATUS_OK;
}

AX_STATUS write(const HBA_WWN* name, const Fip_Change& change) {
    if (change.connectGiven)
        if (const AX_STATUS status = AX_CNA_FCOE_SetFCFConnectList(wwnOf(name), &change.connect)) {
            VLN_OPERATION_FAILED(status, "Setting of DCB FIP Param Failed, exited with error %d",
                                 status);
            return AX_STATUS_ERROR;
        }
    if (const AX_STATUS status = AX_CNA_FCOE_SetFIPParams(wwnOf(name), &change.params)) {
        VLN_OPERATION_FAILED(status, "Setting of CIN FIP Param Failed,exited with error %d",
                             status);
        return AX_STATUS_ERROR;
    }
    VLN_LOG(VLN_DBG, "Setting CIN FIP Param Succeeded");
    return AX_STATUS_OK;
}

} // namespace

AX_STATUS VLN_MethodWrapper::vlnGetFIPParams(const HBA_WWN* name, VLN_FIPParams* params) {
    Operation_Frame frame("VLN_MethodWrapper::vlnGetFIPParams");
    if (!frame.given(params))
        return frame.status();
    uint32 isFCoE = 0;
    const AX_STATUS feature = AX_GetHBAFeature(wwnOf(name), FEATURE_FCOE, &isFCoE);
    if (feature == AX_STATUS_NOT_ANSWERING) {
        VLN_OPERATION_FAILED(feature, "Failed to get the feature, returned with value %d", feature);
        return feature;
    }
    if (feature != AX_STATUS_OK || isFCoE != 1) {
        VLN_LOG(VLN_WARN, "Not a valid card, Feature is not supported");
        return NO_FCOE_CARD;
    }
    AX_FCFConnectList connect{};
    if (const AX_STATUS status = AX_CNA_FCOE_GetFCFConnectList(wwnOf(name), &connect)) {
        VLN_OPERATION_FAILED(status, "Error getting DCB FIP Parameters, AX returned with value %d",
                             status);
        return status;
    }
    AX_FIPParams record{};
    if (const AX_STATUS status = AX_CNA_FCOE_GetFIPParams(wwnOf(name), &record)) {
        VLN_OPERATION_FAILED(status, "Error getting CIN FIP Parameters, AX returned with value %d",
                             status);
        return status;
    }
    try {
        formatConnectList(connect, *params);
    } catch (const std::bad_alloc&) {
        return failed(AX_STATUS_ERROR, "Unable to allocate the memory for the FIP parameters");
    }
    params->cinVlanId = record.cinVlanID;
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::vlnSetFIPParams(const HBA_WWN* name, const VLN_FIPParams& wanted) {
    Operation_Frame frame("VLN_MethodWrapper::vlnSetFIPParams");
    uint32 isFCoE = 0;
    const AX_STATUS feature = AX_GetHBAFeature(wwnOf(name), FEATURE_FCOE, &isFCoE);
    if (feature != AX_STATUS_OK || isFCoE != 1) {
        VLN_OPERATION_FAILED(feature,
                             "Failed to get FIP parameters, Unknown error, exited with error code "
                             "%d",
                             feature);
        return NO_FCOE_CARD;
    }
    Fip_Change change;
    if (const AX_STATUS status = readForChange(name, change))
        return status;
    if (const AX_STATUS status = takeParams(wanted, change))
        return status;
    return write(name, change);
}

AX_STATUS VLN_MethodWrapper::GetFcfList(const HBA_WWN* name, std::vector<AX_Fcf>* forwarders) {
    constexpr char NO_MEMORY[] = "Failed to allocate the memory for FIPFCF info";
    Operation_Frame frame("VLN_MethodWrapper::GetFcfList");
    if (!frame.given(forwarders))
        return frame.status();
    const AX_STATUS status =
        fetch_list<AX_FcfList>(forwarders, FIRST_FORWARDERS, {NO_MEMORY}, [&](AX_FcfList* list) {
            return AX_CNA_FCOE_GetFcfList(wwnOf(name), list);
        });
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "Unable to get FCF info, returned with statuscode %d", status);
    return status;
}

} // namespace cimple
