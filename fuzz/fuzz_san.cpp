// What the HBA API answers to a scan of the SAN: target mappings, SCSI responses and statuses.
#include "device/fcoe_adapter.h"
#include "fuzz/fuzz.h"

using namespace cimple;

namespace {

fuzz::Input input;

// Mostly success, else one of the statuses that the scan tells apart.
HBA_STATUS status() {
    constexpr HBA_STATUS OTHERS[] = {1, 7, 8, 9};
    const std::uint8_t choice = input.byte();
    return choice < 192 ? HBA_STATUS_OK : OTHERS[choice % 4];
}

HBA_HANDLE open_adapter(char*) {
    return 1;
}

HBA_STATUS get_mapping(HBA_HANDLE, HBA_FCPTARGETMAPPING* mapping) {
    const HBA_UINT32 room = mapping->NumberOfEntries;
    const HBA_STATUS result = status();
    const HBA_UINT32 choice = input.byte();
    const HBA_UINT32 count = choice > 250   ? input.word()
                             : choice > 240 ? 200 + choice // beyond the first room
                                            : choice % 5;
    // A few entries, so that an input of some kilobytes reaches the commands behind.
    for (HBA_UINT32 i = 0; i < std::min({room, count, HBA_UINT32{4}}); ++i)
        input.fill(&mapping->entry[i], sizeof mapping->entry[i]);
    mapping->NumberOfEntries = count;
    return result;
}

HBA_STATUS answer(void* response, HBA_UINT32 size, void* sense, HBA_UINT32 sense_size) {
    const HBA_STATUS result = status();
    input.fill(response, std::min<std::size_t>(size, input.byte()));
    input.fill(sense, std::min<std::size_t>(sense_size, 4));
    return result;
}

HBA_STATUS send_inquiry(HBA_HANDLE, HBA_WWN, HBA_UINT64, HBA_UINT8, HBA_UINT32, void* response,
                        HBA_UINT32 size, void* sense, HBA_UINT32 sense_size) {
    return answer(response, size, sense, sense_size);
}

HBA_STATUS send_read_capacity(HBA_HANDLE, HBA_WWN, HBA_UINT64, void* response, HBA_UINT32 size,
                              void* sense, HBA_UINT32 sense_size) {
    return answer(response, size, sense, sense_size);
}

AX_STATUS get_attributes(AX_WWN, void*, uint32_t*) {
    return AX_STATUS_OK;
}

void* get_value(void* buffer, uint16_t identifier, uint16_t* length, AX_STATUS* result) {
    constexpr uint16_t NUMBER_OF_PORTS = 553;
    if (identifier != NUMBER_OF_PORTS)
        return nullptr;
    const uint32_t one = 1;
    std::memcpy(buffer, &one, sizeof one);
    *length = sizeof one;
    *result = AX_STATUS_OK;
    return buffer;
}

const fuzz::Symbol LIBRARY[] = {
    fuzz::symbol("HBA_OpenAdapter", open_adapter),
    fuzz::symbol("HBA_GetFcpTargetMapping", get_mapping),
    fuzz::symbol("HBA_SendScsiInquiry", send_inquiry),
    fuzz::symbol("HBA_SendReadCapacity", send_read_capacity),
    fuzz::symbol("AX_GetHBAAttributes", get_attributes),
    fuzz::symbol("AX_GetPortAttributes", get_attributes),
    fuzz::symbol("AX_GetAttributeValue", get_value),
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::listen_to_log();
    fuzz::play_libraries(LIBRARY, std::size(LIBRARY));
    static FCoEAdapter adapter("Vorlan", 0, HBAIdentifier{}, LocalHBAInfoV4{});
    FUZZ_CHECK(adapter.getPortCount() == 1);
    input = fuzz::Input(data, size);
    adapter.rescanTargets();
    for (const auto& target : adapter.getPort(0)->getTargets()) {
        FUZZ_CHECK(target->nodeWWN.size() == 16 && target->portWWN.size() == 16);
        FUZZ_CHECK(target->osDeviceName.size() <= 256);
        FUZZ_CHECK(target->vendor.size() <= 8 && target->product.size() <= 16);
        FUZZ_CHECK(target->revision.size() <= 4 || target->revision == "Unknown");
        FUZZ_CHECK(target->serialNumber.size() <= 251);
        FUZZ_CHECK(target->deviceType < 32 && target->descriptor.deviceType < 32);
        FUZZ_CHECK(descriptorText(target->descriptor).size() <= 32);
    }
    return 0;
}
