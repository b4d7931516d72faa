// Vital product data: the buffer, the entries in it, and cursors that lead astray.
#include "device/vpd.h"
#include "foundation/field_text.h"
#include "fuzz/fuzz.h"

using namespace cimple;

namespace {

fuzz::Input input;
bool honest_cursors;

AX_STATUS get_vpd(AX_WWN, uint32_t, void* buffer, uint32_t* size) {
    input.fill(buffer, *size);
    *size = input.word();
    return AX_STATUS_OK;
}

AX_STATUS get_pci_vpd(AX_WWN wwn, void* buffer, uint32_t* size) {
    return get_vpd(wwn, 0, buffer, size);
}

// Reads as the library does, along the lengths that it finds.
void* next_entry(void* cursor, char* tag, uint32_t tag_size, char* value, uint32_t value_size) {
    auto* at = static_cast<std::uint8_t*>(cursor);
    if (*at == 0)
        return nullptr;
    const std::size_t length = at[2];
    std::memset(tag, 0xAA, tag_size);
    std::memset(value, 0xAA, value_size);
    std::memcpy(tag, at, 2);
    std::memcpy(value, at + 3, std::min<std::size_t>(length, value_size));
    if (!honest_cursors && length % 16 == 7)
        return at + static_cast<std::int8_t>(at[3]);
    return at + 3 + length;
}

const fuzz::Symbol LIBRARY[] = {
    fuzz::symbol("AX_GetVPD", get_pci_vpd),
    fuzz::symbol("AX_GetVPDV2", get_vpd),
    fuzz::symbol("AX_GetNextVpdEntry", next_entry),
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::listen_to_log();
    fuzz::play_libraries(LIBRARY, std::size(LIBRARY));
    input = fuzz::Input(data, size);
    honest_cursors = input.byte() & 1;
    FRUVPD record{};
    FUZZ_CHECK(VLN_Vpd().GetFRUVPD("10000090FA000003", &record) == AX_STATUS_OK);
    FUZZ_CHECK(record.cardFunction < 256 && record.revisionId < 256);
    FUZZ_CHECK(fieldText(record.uuid).size() % 32 == 0);
    FUZZ_CHECK(fieldText(record.fruNumber).size() <= 16);
    FUZZ_CHECK(fieldText(record.firmware).size() <= 40);
    for (char c : record.unused)
        FUZZ_CHECK(c == 0);
    std::string text;
    VLN_Vpd::GetCardFunctionText(record.cardFunction, text);

    input = fuzz::Input(data, size);
    honest_cursors = input.byte() & 1;
    std::vector<PCI_VPD_Entry> entries;
    FUZZ_CHECK(VLN_Vpd().GetPCIVPD("10000090FA000003", &entries) == AX_STATUS_OK);
    for (const PCI_VPD_Entry& entry : entries)
        FUZZ_CHECK(entry.keyword.size() <= 4 && entry.value.size() <= 256);
    return 0;
}
