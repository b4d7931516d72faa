// A closed library of the tests. What it exports is chosen at build time: FAKE_LAX, FAKE_AX and
// FAKE_HBA. FAKE_IDENTITY goes into its answers, so that a test can tell which library answered.
#define AX_LIBRARY
#include "device/library/axapi.h"

#ifdef FAKE_LAX
extern "C" AX_API AX_STATUS LAX_GetHBAFeature(AX_WWN, uint32_t identifier, uint32_t* value);
AX_STATUS LAX_GetHBAFeature(AX_WWN wwn, uint32_t identifier, uint32_t* value) {
    *value = wwn.word[0] ^ wwn.word[1] ^ identifier;
    return FAKE_IDENTITY + 1;
}
AX_STATUS LAX_Ini_GetRouteTable(AX_WWN, AX_RouteTable*) {
    return FAKE_IDENTITY + 2;
}
#endif

#ifdef FAKE_AX
AX_STATUS AX_GetHBAFeature(AX_WWN, uint32_t, uint32_t*) {
    return FAKE_IDENTITY + 3;
}
AX_STATUS AX_ValidateWwn(AX_WWN wwn) {
    return FAKE_IDENTITY + 4 + (wwn.word[0] == 0x01020304 && wwn.word[1] == 0x05060708 ? 0 : 50);
}
// Answers the size of what it was given last, past the arguments that registers hold.
void* AX_GetNextVpdEntry(void* cursor, char*, uint32_t tagSize, char*, uint32_t valueSize) {
    return static_cast<char*>(cursor) + tagSize + valueSize;
}
#endif

#ifdef FAKE_HBA
HBA_STATUS HBA_LoadLibrary(void) {
    return FAKE_IDENTITY + 5;
}
HBA_STATUS HBA_SendReadCapacity(HBA_HANDLE, HBA_WWN wwn, HBA_UINT64 lun, void*, HBA_UINT32, void*,
                                HBA_UINT32 senseSize) {
    return FAKE_IDENTITY + wwn.wwn[7] + static_cast<HBA_UINT32>(lun >> 32) + senseSize;
}
#endif
