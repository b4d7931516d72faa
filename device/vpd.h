// The field-replaceable-unit data of an adapter, read from its vital product data.
#ifndef DEVICE_VPD_H
#define DEVICE_VPD_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <cstddef>
#include <string>
#include <vector>

namespace cimple {

// The texts are padded with zeros, and have no terminator when they fill their field: read them
// with fieldText (foundation/field_text.h).
struct FRUVPD {
    char manufacturer[256];
    char productName[256];
    char partNumber[256];
    char serialNumber[256];
    char uuid[256];    // 32 lower-case digits
    char firmware[40]; // the whole text of the tag
    char fruNumber[16];
    char firmwareVersion[16]; // the "V:" part of the firmware's text
    char firmwareDate[16];    // the "D:" part: month, day and year in eight digits
    char unused[128];
    char date[16]; // week and year of manufacture
    uint32 cardFunction;
    uint32 revisionId;
};

static_assert(offsetof(FRUVPD, manufacturer) == 0);
static_assert(offsetof(FRUVPD, productName) == 256);
static_assert(offsetof(FRUVPD, partNumber) == 512);
static_assert(offsetof(FRUVPD, serialNumber) == 768);
static_assert(offsetof(FRUVPD, uuid) == 1024);
static_assert(offsetof(FRUVPD, firmware) == 1280);
static_assert(offsetof(FRUVPD, fruNumber) == 1320);
static_assert(offsetof(FRUVPD, firmwareVersion) == 1336);
static_assert(offsetof(FRUVPD, firmwareDate) == 1352);
static_assert(offsetof(FRUVPD, unused) == 1368);
static_assert(offsetof(FRUVPD, date) == 1496);
static_assert(offsetof(FRUVPD, cardFunction) == 1512);
static_assert(offsetof(FRUVPD, revisionId) == 1516);
static_assert(sizeof(FRUVPD) == 1520);

inline constexpr uint32 VLN_NOT_FOUND = 32768; // the system's own status of a look-up

// An entry of the PCI function's own vital product data, PCI Local Bus Specification 3.0, appendix
// I: a keyword and its value up to the first zero byte, "?" for what is no ASCII character.
struct PCI_VPD_Entry {
    std::string keyword;
    std::string value;
};

class VLN_Vpd {
public:
    VLN_Vpd();
    ~VLN_Vpd();
    VLN_Vpd(const VLN_Vpd&) = delete;
    VLN_Vpd& operator=(const VLN_Vpd&) = delete;

    // Fills the fields of a record, which the caller has zeroed, that the adapter has data for. The
    // device identifier is 16 digits. A status of the library; 4 for a null argument, 1 for an
    // identifier that is none.
    AX_STATUS GetFRUVPD(const char* deviceId, FRUVPD* record);

    // Appends the entries in the adapter's order. Statuses as above.
    AX_STATUS GetPCIVPD(const char* deviceId, std::vector<PCI_VPD_Entry>* entries);

    // The texts of a card function, PCI Local Bus Specification 3.0, appendix I, and of a software
    // classification. 0, or 32768 for a value without a text, which leaves `text` alone.
    static uint32 GetCardFunctionText(uint32 function, std::string& text);
    static uint32 GetClassificationText(uint32 classification, std::string& text);
};

} // namespace cimple

#endif // DEVICE_VPD_H
