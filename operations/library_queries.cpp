// What the library and the adapters are: versions, features, port types, status texts.
#include "operations/operation_frame.h"

#include <cstring>
#include <new>

namespace cimple {

namespace {

// Features of AX_GetHBAFeature that this file asks for.
constexpr uint32 FEATURE_TESSEL = 201;
constexpr uint32 FEATURE_ISCSI = 401;
constexpr uint32 FEATURE_FCOE = 403;
constexpr uint32 FEATURE_FCOE_TOO = 412;
constexpr uint32 FEATURE_ISCSI_TOO = 413;
constexpr uint32 FEATURE_ROCE = 439;

constexpr uint32 VERSION_SIZE = 64;

// The lines of a version query are at level 5: a library that has no version is no fault.
struct Version_Query {
    AX_STATUS (*call)(char* text, uint32_t* size);
    bool fixedSize;
    const char* failure; // in front of the status
    const char* success; // in front of the text
    const char* noMemory;
};

// Copies what the buffer holds to the output, up to its end mark, on failure too.
AX_STATUS queryVersion(const Version_Query& query, std::string& text) {
    Reply reply;
    const Reply_Shape shape{.head = 0,
                            .entry = 1,
                            .first = VERSION_SIZE,
                            .fixed = query.fixedSize,
                            .tooSmall = AX_STATUS_BUFFER_TOO_SMALL,
                            .tooSmallToo = AX_STATUS_BUFFER_TOO_SMALL};
    const No_Memory noMemory{query.noMemory, AX_STATUS_NO_MEMORY};
    const AX_STATUS status = reply.fetch(shape, noMemory, [&query](void* buffer, uint32& size) {
        return query.call(static_cast<char*>(buffer), &size);
    });
    text.clear();
    if (const char* version = static_cast<const char*>(reply.data()))
        text.assign(version, strnlen(version, reply.room()));
    if (status != AX_STATUS_OK)
        VLN_LOG(VLN_DBG, "%s%d", query.failure, status);
    else
        VLN_LOG(VLN_DBG, "%s%s", query.success, text.c_str());
    return status;
}

AX_STATUS queryVersion(const Version_Query& query, const char* entry, std::string* text) {
    Operation_Frame frame(entry);
    if (!frame.given(text))
        return frame.status();
    try {
        return queryVersion(query, *text);
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "%s", query.noMemory);
        return AX_STATUS_NO_MEMORY;
    }
}

} // namespace

AX_STATUS VLN_MethodWrapper::GetLibraryVersion(const char*, std::string* text) {
    static constexpr Version_Query QUERY{
        AX_GetVersion, false, "ERROR: Failed to get LIBVersion, returned with code ",
        "LIBVersion: ", "Unable to allocate the memory for pLibVerBuf"};
    return queryVersion(QUERY, "VLN_MethodWrapper::GetLibraryVersion", text);
}

AX_STATUS VLN_MethodWrapper::GetNIMALibVersion(std::string* text) {
    static constexpr Version_Query QUERY{
        AX_NimaVersion, true, "ERROR: Failed to get NIMALibVersion, returned with code ",
        "NIMALibVersion: ", "Unable to allocate the memory for pNIMALibVerBuf"};
    return queryVersion(QUERY, "VLN_MethodWrapper::GetNIMALibVersion", text);
}

AX_STATUS VLN_MethodWrapper::getTargetOS_info(char* text) {
    Operation_Frame frame("VLN_MethodWrapper::getTargetOS_info");
    if (!frame.given(text))
        return frame.status();
    AX_ServerAttributes server{};
    static_assert(sizeof server.targetOS == TARGET_OS_SIZE);
    const AX_STATUS status = AX_GetServerAttributes(&server);
    std::memcpy(text, server.targetOS, TARGET_OS_SIZE);
    text[TARGET_OS_SIZE - 1] = '\0';
    return status;
}

bool VLN_MethodWrapper::IsTesselCNA(const HBA_WWN* name) {
    Operation_Frame frame("VLN_MethodWrapper::IsTesselCNA");
    uint32 value = 0;
    const AX_STATUS status = AX_GetHBAFeature(wwnOf(name), FEATURE_TESSEL, &value);
    if (status != AX_STATUS_OK || value != 1)
        return false;
    VLN_LOG(VLN_DBG, "Tessel CNA Port ");
    return true;
}

AX_STATUS VLN_MethodWrapper::GetCNAType(const HBA_WWN* name, bool& isNicOnly, bool& isISCSI,
                                        bool& isFCoE, bool& isRoCe) {
    Operation_Frame frame("Entering the GetCNAType", "Exiting the GetCNAType");
    isNicOnly = true;
    isISCSI = isFCoE = isRoCe = false;
    const struct {
        uint32 feature;
        bool& flag;
    } functions[] = {{FEATURE_FCOE, isFCoE},
                     {FEATURE_FCOE_TOO, isFCoE},
                     {FEATURE_ISCSI, isISCSI},
                     {FEATURE_ISCSI_TOO, isISCSI},
                     {FEATURE_ROCE, isRoCe}};
    for (const auto& function : functions) {
        uint32 value = 0;
        const AX_STATUS status = AX_GetHBAFeature(wwnOf(name), function.feature, &value);
        if (status != AX_STATUS_OK) {
            VLN_LOG(VLN_ERR, "AX_GetHBAFeature call failed with %d", status);
            isNicOnly = false;
            return status;
        }
        if (value != 0) {
            function.flag = true;
            isNicOnly = false;
        }
    }
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::GetHBAFeatureList(const HBA_WWN* name, uint8* list) {
    Operation_Frame frame("VLN_MethodWrapper::Entered GetHBAFeatureList",
                          "VLN_MethodWrapper::Exiting GetHBAFeatureList");
    if (!frame.given(list, "Invalid output pointer"))
        return frame.status();
    std::memset(list, 0, AX_FEATURE_LIST_SIZE);
    const AX_STATUS status = AX_GetHBAFeatureList(wwnOf(name), AX_FEATURE_LIST_SIZE, list);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "Failed to get the HBA List, exited with the error code %d",
                             status);
    for (int i = 0; i < AX_FEATURE_LIST_SIZE; i += 32)
        VLN_LOG(VLN_DBG, "VLN_MethodWrapper::Features: %d->%u", i, list[i]);
    return status;
}

void VLN_MethodWrapper::logStatus(AX_STATUS status) {
    char text[256] = {};
    AX_StatusString(status, text, sizeof text);
    text[sizeof text - 1] = '\0';
    if (text[0] != '\0')
        VLN_LOG(VLN_DBG, "Status: <%d>:%s", status, text);
    else
        VLN_LOG(VLN_DBG, "Status: <%d>", status);
}

} // namespace cimple
