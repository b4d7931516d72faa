#include "services/phy/ten_g_base_t.h"

#include "agent/text.h"
#include "cimple/guard.h"
#include "device/library/attribute_buffer.h"
#include "foundation/log.h"

#include <new>
#include <optional>

namespace cimple {

namespace {

using Phy = VLNMPCA_PHYPhysicalComponent;

template <class Value>
struct Row {
    uint16 identifier;
    const char* label;
    Property<Value> Phy::*property;
};

constexpr Row<uint8> SHORT_NUMBERS[] = {
    {AX_PA_AUTONEG_STATUS, "AutoNegStatus", &Phy::AutoNegotiationStatus},
    {AX_PA_AUTONEG_ENABLED, "AutoNegEnable", &Phy::AutoNegotiationEnabled},
    {AX_PA_PARTNER_AUTONEG_ENABLED, "AutoNegEnable", &Phy::LinkPartnerAutoNegotiation}, // as well
};

constexpr Row<uint32> NUMBERS[] = {
    {AX_PA_PHY_TEMPERATURE, "PhyTemp", &Phy::Temperature},
    {AX_PA_ONLINE_LENGTH_ESTIMATION, "OnLineEstimation", &Phy::OnlineLengthEstimation},
    {AX_PA_PAIR_A_AVERAGE_MSE, "PairA-AvgMSE", &Phy::PairA_AverageMSE},
    {AX_PA_PAIR_B_AVERAGE_MSE, "PairB-AvgMSE", &Phy::PairB_AverageMSE},
    {AX_PA_PAIR_C_AVERAGE_MSE, "PairC-AvgMSE", &Phy::PairC_AverageMSE},
    {AX_PA_PAIR_D_AVERAGE_MSE, "PairD-AvgMSE", &Phy::PairD_AverageMSE},
    {AX_PA_CABLE_NVP, "CableNVP", &Phy::CableNVP},
};

constexpr Row<String> RATIOS[] = {
    {AX_PA_PAIR_A_SNR, "Pair-A-SNR", &Phy::PairA_SNR},
    {AX_PA_PAIR_B_SNR, "Pair-B-SNR", &Phy::PairB_SNR},
    {AX_PA_PAIR_C_SNR, "Pair-C-SNR", &Phy::PairC_SNR},
    {AX_PA_PAIR_D_SNR, "Pair-D-SNR", &Phy::PairD_SNR},
};

constexpr Row<uint64> WIDE_NUMBERS[] = {
    {AX_PA_TIME_SINCE_LINK, "TimeSinceLink", &Phy::LinkUPTime},
    {AX_PA_LDPC_ERRORS, "LDPCErrs", &Phy::LPPCFrameErrors},
    {AX_PA_PHY_CRC_ERRORS, "PHYCRCErrs", &Phy::PhyCRC8Errors},
};

constexpr Row<String> TEXTS[] = {
    {AX_PA_PHY_CONFIG_ID, "PHYConfigID", &Phy::PHYConfigCRC},
    {AX_PA_PHY_FIRMWARE_REVISION, "PHYFirmwareRev", &Phy::PHYFirmwareVersion},
};

struct Counter_Row {
    uint16 identifier;
    Property<uint64> Phy::*property;
};

constexpr Counter_Row COUNTERS[] = {
    {AX_PS_MDI_PLL_EVENTS, &Phy::MDI_PLLEvents},   {AX_PS_MDI_LINK_UP_TIME, &Phy::MDI_LinkUpTime},
    {AX_PS_EMI_10G_EVENTS, &Phy::EMI10GEvents},    {AX_PS_PHY_FRAMES, &Phy::PHYFrames},
    {AX_PS_MDI_CRC8_ERRORS, &Phy::MDI_CRC8Errors},
};

constexpr uint64 NO_VALUE = ~uint64{0};

uint32 number_of(Attribute_Buffer& buffer, uint16 identifier, const char* label) {
    uint32 value = 0;
    getPortAttributeNumber(buffer, identifier, label, &value);
    return value;
}

uint64 wide_number_of(Attribute_Buffer& buffer, uint16 identifier, const char* label) {
    uint64 value = 0;
    if (!getAttributeBytes(PORT_FAMILY, buffer, identifier, label, &value, sizeof value))
        return 0;
    VLN_LOG(VLN_DBG, "%s: [ %llu ]", label, static_cast<unsigned long long>(value));
    return value == NO_VALUE ? 0 : value;
}

void read_attributes(Attribute_Buffer& buffer, Phy& phy, Phy_Settings& settings) {
    for (const auto& row : SHORT_NUMBERS)
        (phy.*row.property).set(static_cast<uint8>(number_of(buffer, row.identifier, row.label)));
    for (const auto& row : NUMBERS)
        (phy.*row.property).set(number_of(buffer, row.identifier, row.label));
    for (const auto& row : RATIOS)
        (phy.*row.property)
            .set(signal_to_noise_text(
                static_cast<sint32>(number_of(buffer, row.identifier, row.label))));
    for (const auto& row : WIDE_NUMBERS)
        (phy.*row.property).set(wide_number_of(buffer, row.identifier, row.label));
    for (const auto& row : TEXTS) {
        Attribute_Text value;
        getPortAttributeText(value, buffer, row.identifier, row.label);
        (phy.*row.property).set(text(value));
    }
    settings.cable_nvp = phy.CableNVP.value;
    settings.line_rates = number_of(buffer, AX_PA_LINE_RATE_ADVERTISED, "LineRateAdvertised");
    VLN_LOG(VLN_DBG, "Line Rate seems to be not activated from RM layer");
}

void read_counters(Attribute_Buffer& buffer, Phy& phy) {
    for (const Counter_Row& row : COUNTERS) {
        uint64 value = 0;
        AX_STATUS status = AX_STATUS_OK;
        if (!buffer.read(row.identifier, &value, sizeof value, status))
            VLN_LOG(VLN_ERR, "ERROR: AX_GetAttributeValue call failed for Attribute ID %x (%d)",
                    row.identifier, static_cast<int>(status));
        else if (value != NO_VALUE)
            (phy.*row.property).set(value);
    }
}

// None, with the line, when the object manager is out of memory.
std::optional<Attribute_Buffer> reply_buffer(uint32 size, const char* no_memory) {
    try {
        return std::optional<Attribute_Buffer>(std::in_place, size);
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "%s", no_memory);
        return std::nullopt;
    }
}

uint32 fetch_attributes(const HBA_WWN* name, Attribute_Buffer& buffer) {
    const AX_STATUS status = fetchPortAttributes(wwnOf(name), buffer);
    if (status == AX_STATUS_OK)
        return PHY_OK;
    VLN_LOG(VLN_ERR, "AX_GetPortAttributes call failed, exited with error code : %d",
            static_cast<int>(status));
    return PHY_CALL_FAILED;
}

bool given(const void* name, const void* phy) {
    if (name && phy)
        return true;
    VLN_LOG(VLN_ERR, "Invalid Phy argument");
    return false;
}

} // namespace

// The library's code is offset binary of 16 bits in a field of 32.
String signal_to_noise_text(sint32 code) {
    constexpr sint32 OFFSET = 0x8000;
    constexpr double TENTHS = 10;
    if (code > 0)
        return format_text("%.1f dB", (code ^ OFFSET) / TENTHS);
    return format_text("-%.1f dB", ((code ^ (OFFSET - 1)) + 1) / TENTHS);
}

uint32 VLNMPCA_TenGBaseT::GetCableNVP(const char* device_id, uint32& value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_TenGBaseT::GetCableNVP");
    HBA_WWN name{};
    if (!nameOfDeviceId(device_id, name, "VLNMPCA_TenGBaseT::", VLN_ERR))
        return PHY_UNKNOWN;
    auto buffer =
        reply_buffer(AX_PORT_ATTRIBUTES_SIZE, "ERROR: GetCableNVP Unable to allocate buffer");
    if (!buffer)
        return PHY_NO_MEMORY;
    const uint32 status = fetch_attributes(&name, *buffer);
    if (status == PHY_OK)
        value = number_of(*buffer, AX_PA_CABLE_NVP, "CableNVP");
    return status;
}

uint32 VLNMPCA_TenGBaseT::GetPHYPortAttributeValues(const HBA_WWN* name, Phy* phy,
                                                    Phy_Settings* settings) {
    VLN_LOG(VLN_DBG, "VLNMPCA_TenGBaseT::GetPHYPortAttributeValues");
    if (!given(name, phy) || !given(name, settings))
        return PHY_INVALID_ARGUMENT;
    auto buffer = reply_buffer(AX_PORT_ATTRIBUTES_SIZE,
                               "ERROR: GetPHYPortAttributeValues:Unable to allocate buffer");
    if (!buffer)
        return PHY_NO_MEMORY;
    const uint32 status = fetch_attributes(name, *buffer);
    if (status == PHY_OK)
        read_attributes(*buffer, *phy, *settings);
    return status;
}

uint32 VLNMPCA_TenGBaseT::GetPHYPortStatistics(const HBA_WWN* name, Phy* phy) {
    VLN_LOG(VLN_DBG, "VLNMPCA_TenGBaseT::GetPHYPortStatistics");
    if (!given(name, phy))
        return PHY_INVALID_ARGUMENT;
    for (const Counter_Row& row : COUNTERS)
        (phy->*row.property).set(0);
    auto buffer = reply_buffer(AX_PORT_STATISTICS_SIZE,
                               "ERROR: GetPHYPortStatistics: Unable to allocate buffer");
    if (!buffer)
        return PHY_NO_MEMORY;
    const AX_STATUS status = AX_GetPortStatistics(wwnOf(name), buffer->data(), buffer->size());
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "AX_GetPortStatistics call failed, exited with error code : %d",
                static_cast<int>(status));
        return PHY_CALL_FAILED;
    }
    read_counters(*buffer, *phy);
    return PHY_OK;
}

} // namespace cimple
