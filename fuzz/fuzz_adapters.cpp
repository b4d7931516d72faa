// What the management library answers to a scan of the adapters: records, attribute buffers and the
// values in them, statistics.
#include "cimple/thread.h"
#include "device/data.h"
#include "fuzz/fuzz.h"

using namespace cimple;

namespace {

fuzz::Input input;

AX_STATUS status() {
    return input.byte() < 240 ? AX_STATUS_OK : input.byte();
}

AX_STATUS list_instances(uint32_t* count, uint32_t* table) {
    const uint32_t room = *count;
    const AX_STATUS result = status();
    *count = input.byte() > 250 ? input.word() : input.byte() % 4;
    if (result == AX_STATUS_OK)
        input.fill(table, sizeof *table * std::min(room, *count));
    return *count > room ? AX_STATUS_MORE_DATA : result;
}

AX_STATUS read_record(const HBAIdentifier*, LocalHBAInfoV4* info) {
    const AX_STATUS result = status();
    input.fill(info->portWWN, sizeof info->portWWN);
    input.fill(info->model, sizeof info->model);
    info->subAdapterNumber = static_cast<uint16_t>(input.word());
    info->SpecialFeatures = input.byte();
    return result;
}

AX_STATUS fill_buffer(AX_WWN, void* buffer, uint32_t* size) {
    const AX_STATUS result = status();
    input.fill(buffer, std::min<uint32_t>(*size, 64));
    return result;
}

AX_STATUS fill_statistics(AX_WWN, void* buffer, uint32_t size) {
    return fill_buffer({}, buffer, &size);
}

// Mostly a value in the buffer, at times one outside of it, none, or one of a wrong length.
void* get_value(void* buffer, uint16_t, uint16_t* length, AX_STATUS* result) {
    const uint32_t choice = input.byte();
    *result = choice < 200 ? AX_STATUS_OK : choice;
    *length = static_cast<uint16_t>(choice & 1 ? 4 : input.word());
    if (choice % 8 == 7)
        return nullptr;
    const std::size_t offset = choice % 16 == 5 ? input.word() : input.below(64);
    return reinterpret_cast<void*>(reinterpret_cast<std::uintptr_t>(buffer) + offset);
}

AX_STATUS get_number(AX_WWN, uint32_t* value) {
    const AX_STATUS result = status();
    *value = input.word();
    return result;
}

AX_STATUS get_initiator(AX_WWN, AX_iSCSI_InitiatorProperties* properties) {
    input.fill(properties, sizeof *properties);
    return status();
}

AX_STATUS get_network(AX_WWN, AX_Ini_NetworkProperties* properties) {
    input.fill(properties, sizeof *properties);
    return status();
}

HBA_UINT32 hba_count() {
    return input.byte() % 3;
}

HBA_STATUS hba_name(HBA_UINT32, char* name) {
    input.fill(name, 256);
    return status();
}

HBA_STATUS hba_attributes(HBA_HANDLE, HBA_ADAPTERATTRIBUTES* attributes) {
    attributes->NumberOfPorts = input.byte() % 3;
    return status();
}

const fuzz::Symbol LIBRARY[] = {
    fuzz::symbol("AX_GetAllLocalHBAInstances", list_instances),
    fuzz::symbol("AX_GetLocalHBAInfoV4", read_record),
    fuzz::symbol("AX_GetHBAAttributes", fill_buffer),
    fuzz::symbol("AX_GetPortAttributes", fill_buffer),
    fuzz::symbol("AX_GetPortStatistics", fill_statistics),
    fuzz::symbol("AX_GetAttributeValue", get_value),
    fuzz::symbol("AX_GetDriverType", get_number),
    fuzz::symbol("AX_iSCSI_GetInitiatorProperties", get_initiator),
    fuzz::symbol("AX_Ini_GetNetworkProperties", get_network),
    fuzz::symbol("HBA_GetNumberOfAdapters", hba_count),
    fuzz::symbol("HBA_GetAdapterName", hba_name),
    fuzz::symbol("HBA_GetAdapterAttributes", hba_attributes),
};

constexpr Time::Clock NO_SLEEP = {[] { return uint64{0}; }, [](uint64) {}};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::listen_to_log();
    fuzz::play_libraries(LIBRARY, std::size(LIBRARY));
    Time::replace_clock(&NO_SLEEP);
    input = fuzz::Input(data, size);
    VLN_Data model;
    model.buildAdapterData();
    for (const auto& adapter : model.adapters) {
        FUZZ_CHECK(adapter->getAdapterAttributes() != nullptr);
        for (const auto& port : adapter->getPorts()) {
            FUZZ_CHECK(port->getPortName().size() == 16);
            FUZZ_CHECK(port->getPortAttributes() != nullptr);
            try {
                port->getPortStatistics();
            } catch (const std::exception&) {
                // Counters that cannot be read.
            }
        }
    }
    model.buildSANData();
    return 0;
}
