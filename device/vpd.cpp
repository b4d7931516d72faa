#include "device/vpd.h"

#include "device/library/identifiers.h"
#include "foundation/common.h"
#include "foundation/log.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <iterator>
#include <memory>

namespace cimple {

namespace {

enum class Value_Form : uint8 {
    TEXT,
    UUID,     // 16 binary bytes
    NUMBER,   // the first byte
    FIRMWARE, // a text whose parts count by themselves as well
};

struct Tag_Row {
    char tag[3];
    const char* text;
    Value_Form form;
    uint16 offset; // of the field in the record
    uint16 size;
};

#define FIELD(name) offsetof(FRUVPD, name), sizeof FRUVPD::name

// The adapter's tags are those of PCI's vital product data and some of its own. Others are skipped.
constexpr Tag_Row TAGS[] = {
    {"PA", "Product Name", Value_Form::TEXT, FIELD(productName)},
    {"SN", "Serial Number", Value_Form::TEXT, FIELD(serialNumber)},
    {"PN", "Part Number", Value_Form::TEXT, FIELD(partNumber)},
    {"MN", "Manufacturer", Value_Form::TEXT, FIELD(manufacturer)},
    {"DM", "Date (WWYY format)", Value_Form::TEXT, FIELD(date)},
    {"UU", "UUID", Value_Form::UUID, FIELD(uuid)},
    {"CF", "Card Function", Value_Form::NUMBER, FIELD(cardFunction)},
    {"RI", "Revision ID", Value_Form::NUMBER, FIELD(revisionId)},
    {"FN", "FRU Number", Value_Form::TEXT, FIELD(fruNumber)},
    {"FW", "Firmware", Value_Form::FIRMWARE, FIELD(firmware)},
};

#undef FIELD

struct Text_Row {
    uint32 value;
    const char* text;
};

constexpr Text_Row CARD_FUNCTIONS[] = {
    {0, "Reserved"}, {16, "Infiniband"}, {64, "Ethernet"}, {80, "Fibre Channel"}, {96, "iSCSI"},
};

constexpr Text_Row CLASSIFICATIONS[] = {
    {2, "Driver"},
    {10, "Firmware"},
    {11, "BIOD/Fcode"}, // spelt so for the consoles that compare it
    {32775, "CIM Provider"},
};

template <std::size_t N>
uint32 look_up(const Text_Row (&rows)[N], uint32 value, std::string& text) {
    const auto* row = std::find_if(std::begin(rows), std::end(rows),
                                   [value](const Text_Row& r) { return r.value == value; });
    if (row == std::end(rows))
        return VLN_NOT_FOUND;
    text = row->text;
    return 0;
}

// One entry as the library copies it out, terminated whatever it writes.
struct Entry {
    char tag[AX_VPD_TAG_SIZE + 1];
    char value[AX_VPD_VALUE_SIZE + 1];
};

// As strncpy: cut to the field, and zeros up to its end.
void store_text(char* field, std::size_t size, const char* text) {
    const std::size_t length = strnlen(text, size);
    std::memcpy(field, text, length);
    std::memset(field + length, 0, size - length);
}

void store_uuid(char* field, const char* value) {
    constexpr int UUID_BYTES = 16;
    for (int i = 0; i < UUID_BYTES; ++i)
        std::snprintf(field + 2 * i, 3, "%02x", static_cast<uint8>(value[i]));
}

void store_firmware_parts(FRUVPD& record, char* value) {
    char* place = nullptr;
    for (char* token = VLN_Common::nextToken(value, ",", &place); token;
         token = VLN_Common::nextToken(nullptr, ",", &place)) {
        if (std::strncmp(token, "V:", 2) == 0)
            store_text(record.firmwareVersion, sizeof record.firmwareVersion, token + 2);
        else if (std::strncmp(token, "D:", 2) == 0)
            store_text(record.firmwareDate, sizeof record.firmwareDate, token + 2);
    }
}

void store(FRUVPD& record, Entry& entry) {
    const auto* row = std::find_if(std::begin(TAGS), std::end(TAGS), [&](const Tag_Row& r) {
        return std::strncmp(r.tag, entry.tag, 2) == 0;
    });
    if (row == std::end(TAGS))
        return;
    char* field = reinterpret_cast<char*>(&record) + row->offset;
    switch (row->form) {
    case Value_Form::TEXT:
        store_text(field, row->size, entry.value);
        break;
    case Value_Form::UUID:
        store_uuid(field, entry.value);
        break;
    case Value_Form::NUMBER: {
        const uint32 number = static_cast<uint8>(entry.value[0]);
        std::memcpy(field, &number, sizeof number);
        break;
    }
    case Value_Form::FIRMWARE:
        store_text(field, row->size, entry.value);
        store_firmware_parts(record, entry.value);
        break;
    }
    if (row->form == Value_Form::NUMBER)
        VLN_LOG(VLN_DBG, "%s: %d", row->text, static_cast<uint8>(entry.value[0]));
    else
        VLN_LOG(VLN_DBG, "%s: %.*s", row->text, row->size, field);
}

// An entry that starts in the buffer may claim to reach past its end, and the library follows it.
// So there is room behind for the longest one, all zero, which also ends a list without an end.
constexpr std::size_t ROOM_BEHIND = AX_VPD_TAG_SIZE + AX_VPD_VALUE_SIZE;

template <class Take>
void walk(char* buffer, Take take) {
    char* cursor = buffer;
    while (cursor < buffer + AX_VPD_BUFFER_SIZE) {
        Entry entry{};
        void* next =
            AX_GetNextVpdEntry(cursor, entry.tag, AX_VPD_TAG_SIZE, entry.value, AX_VPD_VALUE_SIZE);
        // The last entry may come with the end of the list.
        if (next || entry.tag[0] != '\0')
            take(entry);
        if (!next)
            return;
        // Only forward, and not out of the buffer, whatever the library answers.
        const auto step =
            reinterpret_cast<std::uintptr_t>(next) - reinterpret_cast<std::uintptr_t>(cursor);
        if (step == 0 || step > ROOM_BEHIND)
            return;
        cursor += step;
    }
}

// Reads the data with call(wwn, buffer, size) and hands each entry to take(entry).
template <class Call, class Take>
AX_STATUS read_entries(const char* deviceId, const char* function, Call call, Take take) {
    HBA_WWN name{};
    if (!nameOfDeviceId(deviceId, name, "", VLN_DBG))
        return AX_STATUS_ERROR;
    const auto buffer = std::make_unique<char[]>(AX_VPD_BUFFER_SIZE + ROOM_BEHIND);
    uint32 size = AX_VPD_BUFFER_SIZE;
    const AX_STATUS status = call(AX_WwnOf(&name), buffer.get(), &size);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_DBG, "ERROR: %s call failed : %d", function, status);
        return status;
    }
    walk(buffer.get(), take);
    return AX_STATUS_OK;
}

std::string ascii_text(const char* characters) {
    std::string text = characters;
    std::replace_if(
        text.begin(), text.end(), [](char c) { return c < ' ' || c > '~'; }, '?');
    return text;
}

} // namespace

VLN_Vpd::VLN_Vpd() {
    VLN_LOG(VLN_DBG, "VLN_Vpd::Constructor");
}

VLN_Vpd::~VLN_Vpd() {
    VLN_LOG(VLN_DBG, "VLN_Vpd::Destructor");
}

AX_STATUS VLN_Vpd::GetFRUVPD(const char* deviceId, FRUVPD* record) {
    VLN_LOG(VLN_DBG, "VLN_Vpd::GetFRUVPD");
    if (!deviceId || !record) {
        VLN_LOG(VLN_DBG, "Invalid Parameter");
        return AX_STATUS_INVALID_ARGUMENT;
    }
    constexpr uint32 VERSION = 1;
    return read_entries(
        deviceId, "AX_GetVPDV2",
        [](AX_WWN wwn, void* buffer, uint32_t* size) {
            return AX_GetVPDV2(wwn, VERSION, buffer, size);
        },
        [record](Entry& entry) { store(*record, entry); });
}

AX_STATUS VLN_Vpd::GetPCIVPD(const char* deviceId, std::vector<PCI_VPD_Entry>* entries) {
    if (!deviceId || !entries) {
        VLN_LOG(VLN_DBG, "Invalid Parameter");
        return AX_STATUS_INVALID_ARGUMENT;
    }
    return read_entries(deviceId, "AX_GetVPD", AX_GetVPD, [entries](const Entry& entry) {
        entries->push_back({ascii_text(entry.tag), ascii_text(entry.value)});
    });
}

uint32 VLN_Vpd::GetCardFunctionText(uint32 function, std::string& text) {
    return look_up(CARD_FUNCTIONS, function, text);
}

uint32 VLN_Vpd::GetClassificationText(uint32 classification, std::string& text) {
    return look_up(CLASSIFICATIONS, classification, text);
}

} // namespace cimple
