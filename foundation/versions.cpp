// VLN_Common: firmware and product versions.
#include "cimple/guard.h"
#include "foundation/common.h"

#include "foundation/log.h"

#include <cctype>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace cimple {

namespace {

bool is_digit(char c) {
    return std::isdigit(static_cast<unsigned char>(c)) != 0;
}

bool is_letter(char c) {
    return std::isalpha(static_cast<unsigned char>(c)) != 0;
}

uint16 digit_value(char c) {
    return static_cast<uint16>(c - '0');
}

bool has_version_form(const char* text) {
    return is_digit(text[0]) && text[1] == '.' && is_digit(text[2]) && is_digit(text[3]) &&
           is_letter(text[4]) && is_digit(text[5]);
}

sint32 invalid_firmware_text() {
    VLN_LOG(VLN_DBG, "parseVersion Error: Invalid Firmware String");
    return VLN_GENERAL_ERROR;
}

sint32 parse(const char* text, VLN_FirmwareVersion& out) {
    const std::size_t length = std::strlen(text);
    if (length < 6 || !has_version_form(text))
        return invalid_firmware_text();
    VLN_LOG(VLN_DBG, "Parsed the major, minor, revision & build numbers");

    // islower answers a class mask and never the code of "r", so no suffix is taken for a test
    // release. That is meant: consoles compare the versions of test and released firmware.
    constexpr int CODE_OF_R = 114;
    if (length > 7 && text[6] != ' ' &&
        std::islower(static_cast<unsigned char>(text[6])) == CODE_OF_R) {
        if (!is_digit(text[7]))
            return invalid_firmware_text();
        VLN_LOG(VLN_DBG, "parseVersion: This seems to be a Test Release Firmware...");
        out.testRevision += 'r';
        out.testRevision += text[7];
    }
    VLN_LOG(VLN_DBG, "Parsed the revision for Test Firmwares");

    out.major = digit_value(text[0]);
    out.minor = digit_value(text[2]);
    out.revision = digit_value(text[3]);
    out.build = digit_value(text[5]);
    VLN_LOG(VLN_DBG, "Filled Major, Minor, Revision & Build Numbers");
    out.releaseType += text[4];
    VLN_LOG(VLN_DBG, "Filled ReleaseType");
    VLN_LOG(VLN_DBG, "parseVersion: Version parsing success");
    return 0;
}

} // namespace

sint32 VLN_Common::parseVersion(const char* text, VLN_FirmwareVersion& out) {
    if (!text) {
        VLN_LOG(VLN_DBG, "parseVersion Error: Input FirmwareVersion is Null");
        return VLN_GENERAL_ERROR;
    }
    VLN_LOG(VLN_DBG, "Input Version String: [%s]", text);
    sint32 status = VLN_GENERAL_ERROR;
    if (run_guarded([&] { status = parse(text, out); }))
        return status;
    VLN_LOG(VLN_ERR, "parseVersion: error occurred while parsing...");
    return VLN_GENERAL_ERROR;
}

sint32 VLN_Common::versionFourNumbers(const char* text, uint16 (&out)[4]) {
    if (!text)
        return VLN_GENERAL_ERROR;
    char copy[64];
    std::snprintf(copy, sizeof copy, "%s", text);
    std::memset(out, 0, sizeof out);

    char* place = nullptr;
    char* token = nextToken(copy, ".", &place);
    for (int i = 0; i < 4 && token; ++i) {
        out[i] = static_cast<uint16>(std::strtol(token, nullptr, 10));
        token = nextToken(nullptr, ".", &place);
    }
    VLN_LOG(VLN_DBG, "%d, %d, %d, %d", out[0], out[1], out[2], out[3]);
    return 0;
}

} // namespace cimple
