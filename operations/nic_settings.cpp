// How a port boots over the network, and how much bandwidth its function may use.
#include "cimple/guard.h"
#include "operations/method_wrapper.h"

#include "device/library/attribute_buffer.h"
#include "operations/operation_frame.h"

#include <cctype>
#include <cstdio>
#include <cstring>

namespace cimple {

namespace {

constexpr uint32 BOOT_ATTRIBUTES_SIZE = 2048;
constexpr uint32 STATE_OFF = 0;
constexpr uint32 STATE_ON = 1;

// ---- Network boot ----

// What the adapter tells of its boot; the texts are empty for what it does not tell.
struct Boot_Attributes {
    uint32 state = 0;
    Attribute_Text available = {};
    Attribute_Text method = {};
};

AX_STATUS fetchBootBuffer(const HBA_WWN* name, Attribute_Buffer& buffer) {
    uint32 size = buffer.size();
    const AX_STATUS status = AX_GetHBAAttributes(wwnOf(name), buffer.data(), &size);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "AX_GetHBAAttributes call failed (%d)", status);
    return status;
}

AX_STATUS readBootAttributes(const HBA_WWN* name, Boot_Attributes& attributes) {
    Attribute_Buffer buffer(BOOT_ATTRIBUTES_SIZE);
    AX_STATUS status = fetchBootBuffer(name, buffer);
    if (status != AX_STATUS_OK)
        return status;
    status = AX_STATUS_ERROR;
    if (!buffer.read(AX_HA_BOOT_CODE_ENABLED, &attributes.state, sizeof attributes.state, status)) {
        VLN_LOG(VLN_ERR, "AX_GetHBAAttributeValue HA_BOOTBIOS_STATE call failed: %u", status);
        return status != AX_STATUS_OK ? status : AX_STATUS_ERROR;
    }
    getAdapterAttributeText(attributes.available, buffer, AX_HA_BOOT_METHODS_AVAILABLE,
                            "_BootMethodsAvailable");
    getAdapterAttributeText(attributes.method, buffer, AX_HA_BOOT_METHOD, "_BootMethod");
    return AX_STATUS_OK;
}

VLN_MethodWrapper::Boot_Method methodOf(const Boot_Attributes& attributes) {
    if (attributes.method[0] == '\0')
        return attributes.state <= STATE_ON ? VLN_MethodWrapper::BOOT_PXE
                                            : VLN_MethodWrapper::BOOT_UNKNOWN;
    if (attributes.state == STATE_OFF)
        return VLN_MethodWrapper::BOOT_NONE;
    if (attributes.state == STATE_ON && std::strcmp(attributes.method, "PXE") == 0)
        return VLN_MethodWrapper::BOOT_PXE;
    if (attributes.state == STATE_ON && std::strcmp(attributes.method, "iBFT") == 0)
        return VLN_MethodWrapper::BOOT_IBFT;
    return VLN_MethodWrapper::BOOT_UNKNOWN;
}

AX_STATUS setNetboot(const HBA_WWN* name, uint32 enable, uint32 method) {
    const AX_STATUS status = AX_SetNetbootParams(wwnOf(name), enable, method);
    if (status != AX_STATUS_OK) {
        // Those who run the object manager by hand look for this line.
        std::printf("\nERROR: EnableBootCode: AX_SetNetbootParams call failed (%d)\n",
                    static_cast<int>(status));
        VLN_OPERATION_FAILED(status, "AX_SetNetbootParams call failed (%d)", status);
    }
    return status;
}

AX_STATUS setBootBios(const HBA_WWN* name, uint32 enable) {
    const AX_STATUS status = AX_SetBootBiosState(wwnOf(name), enable);
    if (status == AX_STATUS_OK)
        VLN_LOG(VLN_DBG, "BootBios State has been set");
    else
        VLN_OPERATION_FAILED(status, "AX_SetBootBiosState call failed (%d)", status);
    return status;
}

// Whether the adapter tells by which method it boots.
AX_STATUS tellsMethod(const HBA_WWN* name, bool& tells) {
    Attribute_Buffer buffer(BOOT_ATTRIBUTES_SIZE);
    const AX_STATUS status = fetchBootBuffer(name, buffer);
    Attribute_Text method;
    if (status == AX_STATUS_OK)
        tells = getAttributeText(ADAPTER_FAMILY, method, buffer, AX_HA_BOOT_METHOD,
                                 "_BootMethod") == AX_STATUS_OK;
    return status;
}

// "E" or "D"; false for another word.
bool readControl(const char* control, uint32& enable) {
    const int letter = std::tolower(static_cast<unsigned char>(control[0]));
    enable = letter == 'e' ? STATE_ON : STATE_OFF;
    return (letter == 'e' || letter == 'd') && control[1] == '\0';
}

// Runs an operation that allocates; out of memory it answers 1.
template <class Body>
AX_STATUS guarded(Body body) {
    AX_STATUS status = AX_STATUS_ERROR;
    if (!run_guarded([&] { status = body(); }))
        VLN_LOG(VLN_ERR, "Unable to allocate the memory for the adapter attributes");
    return status;
}

// ---- Quality of service ----

// What a kind of function takes.
struct QoS_Kind {
    uint32 kind;
    uint32 feature;
    const char* unknown;
    const char* absent;
    uint32 maxBytesPerSecond;
    uint32 maxIOsPerSecond;
};

constexpr QoS_Kind QOS_KINDS[] = {
    {AX_QOS_NIC, 402, "Err: Unable to determine if port is a NIC port",
     "Err: QoS is not supported on this adapter", 1000, UINT32_MAX},
    {AX_QOS_ISCSI, 401, "Err: Unable to determine if port is an iSCSI port",
     "Err: QoS is not supported on this adapter", 1280, 150},
};

const QoS_Kind* findKind(uint32 kind) {
    for (const QoS_Kind& row : QOS_KINDS)
        if (row.kind == kind)
            return &row;
    return nullptr;
}

} // namespace

AX_STATUS VLN_MethodWrapper::GetNICNetworkBootParams(const HBA_WWN* name, Boot_Method* method,
                                                     bool* hasSeveral, uint32* state) {
    Operation_Frame frame("VLN_MethodWrapper::GetNICNetworkBootParams");
    if (!frame.given(method) || !frame.given(hasSeveral) || !frame.given(state))
        return frame.status();
    return guarded([&] {
        Boot_Attributes attributes;
        const AX_STATUS status = readBootAttributes(name, attributes);
        if (status == AX_STATUS_OK) {
            *state = attributes.state;
            *hasSeveral = std::strcmp(attributes.available, "PXE,iBFT") == 0;
            *method = methodOf(attributes);
        }
        return status;
    });
}

AX_STATUS VLN_MethodWrapper::SetNICNetworkBootParams(const HBA_WWN* name, const char* control,
                                                     Boot_Method method) {
    Operation_Frame frame("VLN_MethodWrapper::SetNICNetworkBootParams");
    if (!frame.given(name) || !frame.given(control))
        return frame.status();
    uint32 enable = 0;
    if (!readControl(control, enable))
        return AX_STATUS_ERROR;
    return guarded([&] {
        bool tells = false;
        if (const AX_STATUS status = tellsMethod(name, tells))
            return status;
        return tells ? setNetboot(name, enable, enable ? uint32{method} : 0)
                     : setBootBios(name, enable);
    });
}

AX_STATUS VLN_MethodWrapper::SetQOSParams(const HBA_WWN* name, const AX_QoS* qos) {
    Operation_Frame frame("VLN_MethodWrapper::SetQOSParams");
    const QoS_Kind* kind = qos ? findKind(qos->kind) : nullptr;
    if (!frame.given(kind) || !frame.offers(name, {kind->feature, kind->unknown, kind->absent}))
        return frame.status();
    if (qos->maxBytesPerSecond > kind->maxBytesPerSecond) {
        VLN_LOG(VLN_ERR, "Err: Invalid value of maxBytesPerSecond specified");
        return AX_STATUS_ERROR;
    }
    if (qos->maxIOsPerSecond > kind->maxIOsPerSecond) {
        VLN_LOG(VLN_ERR, "Err: Invalid value of maxIOsPerSecond specified");
        return AX_STATUS_ERROR;
    }
    const AX_STATUS status = AX_SetQoS(wwnOf(name), qos);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "Err: SetQoSInfo Failed, exited with error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::GetQosInfo(const HBA_WWN* name, AX_QoS* qos) {
    Operation_Frame frame("VLN_MethodWrapper::GetQosInfo");
    if (!frame.given(qos))
        return frame.status();
    const AX_STATUS status = AX_GetQoS(wwnOf(name), qos);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "GetQosInfo exited with the error code %d", status);
    return status;
}

} // namespace cimple
