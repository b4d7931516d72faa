#include "device/attribute_table.h"

#include "foundation/log.h"

namespace cimple {

void readValue(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, uint32& number) {
    getAttributeNumber(family, buffer, identifier, label, &number);
}

void readValue(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, bool& flag) {
    uint32 value = 0;
    if (getAttributeNumber(family, buffer, identifier, label, &value) == AX_STATUS_OK)
        flag = value != 0;
}

void readValue(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, std::string& text) {
    Attribute_Text raw;
    getAttributeText(family, raw, buffer, identifier, label);
    text = raw;
}

void readValue(const Attribute_Family&, Attribute_Buffer& buffer, uint16 identifier,
               const char* label, Fc4_Types& types) {
    AX_STATUS status = AX_STATUS_OK;
    if (!buffer.readUpTo(identifier, types.data(), types.size(), status)) {
        VLN_LOG(VLN_DBG, "ERROR: AX_GetPortAttributes HA_%s call failed (%d)", label, status);
        return;
    }
    for (uint8 byte : types)
        VLN_LOG(VLN_DBG, "PA_PORT_SERVICE_TYPE: [ %d ]", byte);
}

void readRawAddress(const Attribute_Family& family, Attribute_Buffer& buffer, uint16 identifier,
                    const char* label, std::string& text) {
    constexpr std::size_t ADDRESS_SIZE = 6;
    Attribute_Text raw;
    if (getAttributeText(family, raw, buffer, identifier, label) == AX_STATUS_OK)
        text = colonText(reinterpret_cast<const uint8*>(raw), ADDRESS_SIZE);
    else
        text.clear();
}

} // namespace cimple
