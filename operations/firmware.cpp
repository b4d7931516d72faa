// Firmware of an adapter: installing it, what is on flash, and the reset.
#include "cimple/guard.h"
#include "device/library/attribute_buffer.h"
#include "operations/operation_frame.h"

#include <cerrno>
#include <sys/stat.h>

namespace cimple {

namespace {

// Smaller than that of a scan: the library is asked for one text alone.
constexpr uint32 FLASH_ATTRIBUTES_SIZE = 2048;

bool isThere(const char* file) {
    struct stat found {};
    if (file && stat(file, &found) == 0)
        return true;
    if (!file || errno == ENOENT)
        VLN_LOG(VLN_ERR, "\nERROR: vlncimDownloadFW: FW file not found");
    else
        VLN_LOG(VLN_ERR, "\nERROR: vlncimDownloadFW: Can't stat FW file");
    return false;
}

void logDownload(AX_STATUS status) {
    switch (status) {
    case AX_STATUS_OK:
        break;
    case AX_STATUS_MAILBOX_FAILED:
        VLN_LOG(VLN_ERR, "\nERROR: AX_DownloadFirmware: Mailbox failed; Internal Driver Error.\n");
        break;
    case AX_STATUS_MAILBOX_TIMEOUT:
        VLN_LOG(VLN_ERR, "\nERROR: AX_DownloadFirmware: Mailbox timed out.\n");
        break;
    case AX_STATUS_MAILBOX_BUSY:
        VLN_LOG(VLN_ERR, "\nERROR: AX_DownloadFirmware: Mailbox busy; retry.\n");
        break;
    default:
        VLN_LOG(VLN_ERR, "\nERROR: AX_DownloadFirmware: status = %d", status);
    }
}

AX_STATUS install(const HBA_WWN* name, const char* file) {
    if (VLN_MethodWrapper::Validatewwpn(name) != 0) {
        VLN_LOG(VLN_ERR, "INVALID wwpn");
        return AX_STATUS_ERROR;
    }
    if (!isThere(file))
        return AX_STATUS_ERROR;
    if (const AX_STATUS status = AX_ImportHBAFileA(file))
        return status;
    if (const AX_STATUS status = AX_VerifyFirmwareA(0, 0, wwnOf(name), file))
        return status;
    const AX_STATUS status = AX_DownloadFirmware(wwnOf(name), file, 0);
    logDownload(status);
    return status;
}

} // namespace

AX_STATUS VLN_MethodWrapper::vlncimDownloadFW(const HBA_WWN* name, const char* file) {
    Operation_Frame frame("Entering VLN_MethodWrapper::vlncimDownloadFW()");
    const AX_STATUS status = install(name, file);
    if (status != AX_STATUS_OK)
        logStatus(status);
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimReset(const HBA_WWN* name) {
    Operation_Frame frame("Entering VLN_MethodWrapper::vlncimReset()");
    const AX_STATUS status = AX_ResetHBA(wwnOf(name));
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "ERROR: AX_ResetHBA returned with code %d", status);
        return status;
    }
    char text[HBA_NAME_SIZE] = "";
    HBAName2Str(text, name);
    VLN_LOG(VLN_DBG, "WWN %s is reset", text);
    return status;
}

AX_STATUS VLN_MethodWrapper::GetFirmwareOnFlash(const HBA_WWN* name, std::string* version) {
    Operation_Frame frame("Entering VLN_MethodWrapper::UpdateFirmwareOnFlash()");
    if (!frame.given(version))
        return frame.status();
    AX_STATUS status = AX_STATUS_ERROR;
    const bool complete = run_guarded([&] {
        Attribute_Buffer buffer(FLASH_ATTRIBUTES_SIZE);
        uint32 size = buffer.size();
        status = AX_GetHBAAttributes(wwnOf(name), buffer.data(), &size);
        if (status != AX_STATUS_OK) {
            VLN_OPERATION_FAILED(status, "ERROR: AX_GetHBAAttributes call failed (%d)", status);
            return;
        }
        Attribute_Text text;
        getAdapterAttributeText(text, buffer, AX_HA_FIRMWARE_ON_FLASH, "_FirmwareOnFlash");
        *version = text;
    });
    if (!complete)
        VLN_LOG(VLN_ERR, "Unable to allocate the memory for the adapter attributes");
    return complete && status == AX_STATUS_OK ? AX_STATUS_OK : AX_STATUS_ERROR;
}

} // namespace cimple
