#include "device/target.h"

#include "device/fcoe_adapter.h"
#include "device/library/hba_api.h"
#include "foundation/common.h"
#include "foundation/field_text.h"
#include "foundation/log.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

namespace cimple {

namespace {

constexpr int MOST_ATTEMPTS = 3;
constexpr uint32 RESPONSE_SIZE = 255;
constexpr uint32 SENSE_SIZE = 128;
constexpr uint32 SENSE_LOGGED = 24;

// Pages of vital product data, SPC-3, 7.6.
constexpr uint32 PAGE_SERIAL_NUMBER = 0x80;
constexpr uint32 PAGE_IDENTIFICATION = 0x83;

constexpr char UNKNOWN[] = "Unknown";

uint32 big_endian_32(const uint8* bytes) {
    return static_cast<uint32>(bytes[0]) << 24 | static_cast<uint32>(bytes[1]) << 16 |
           static_cast<uint32>(bytes[2]) << 8 | bytes[3];
}

void log_sense(const uint8 (&sense)[SENSE_SIZE]) {
    if (!log_wanted(VLN_DBG))
        return;
    std::string text = "Sense Data: ";
    char piece[4];
    for (uint32 i = 0; i < SENSE_LOGGED; ++i) {
        std::snprintf(piece, sizeof piece, "%02x ", sense[i]);
        text += piece;
    }
    VLN_LOG(VLN_DBG, "%s", text.c_str());
}

} // namespace

std::string descriptorText(const DeviceIdDescriptor& descriptor) {
    std::string text;
    VLN_Common::descriptorToString(&text, descriptor.identifier, descriptor.identifierLength);
    return text;
}

// The unit at the other end of the SCSI commands, and its last answer.
class Target::Unit {
public:
    Unit(HBA_HANDLE handle, const HBA_FCPSCSIENTRY& entry)
        : m_handle(handle), m_portWWN(entry.FcpId.PortWWN), m_fcpLun(entry.FcpId.FcpLun) {}

    // True when the unit answered. A check condition may be over with the next attempt.
    bool inquiry(uint8 evpd, uint32 page) {
        return send([&] {
            return HBA_SendScsiInquiry(m_handle, m_portWWN, m_fcpLun, evpd, page, response,
                                       sizeof response, sense, sizeof sense);
        });
    }
    bool readCapacity() {
        return send([&] {
            return HBA_SendReadCapacity(m_handle, m_portWWN, m_fcpLun, response, sizeof response,
                                        sense, sizeof sense);
        });
    }

    // The text in the field of the response, up to its end or a zero.
    std::string text(uint32 offset, uint32 size) const {
        const char* field = reinterpret_cast<const char*>(response) + offset;
        return fieldText(field, std::min(size, RESPONSE_SIZE - offset));
    }

    HBA_STATUS status = HBA_STATUS_OK; // of the last attempt
    uint8 response[RESPONSE_SIZE];
    uint8 sense[SENSE_SIZE];

private:
    template <class Command>
    bool send(Command command) {
        int attempts = 0;
        do {
            std::memset(response, 0, sizeof response);
            std::memset(sense, 0, sizeof sense);
            status = command();
            ++attempts;
        } while (status == HBA_STATUS_SCSI_CHECK_CONDITION && attempts < MOST_ATTEMPTS);
        if (status != HBA_STATUS_OK)
            VLN_LOG(VLN_DBG, "HBA_SendScsiInquiry_t(0x80) returns %d.", status);
        return status == HBA_STATUS_OK;
    }

    HBA_HANDLE m_handle;
    HBA_WWN m_portWWN;
    HBA_UINT64 m_fcpLun;
};

Target::Target(Adapter& adapter, const HBA_FCPSCSIENTRY& entry) {
    VLN_LOG(VLN_DBG, "Creating Target...");
    copyEntry(entry);
    {
        HBA_Adapter hba(dynamic_cast<FCoEAdapter&>(adapter).getHbaAdapterName());
        Unit unit(hba.handle(), entry);
        readStandardInquiry(unit);
        readSerialNumber(unit);
        readDescriptor(unit);
        readCapacity(unit);
    }
    VLN_LOG(VLN_DBG, "End Creating Target...");
}

void Target::copyEntry(const HBA_FCPSCSIENTRY& entry) {
    fcId = entry.FcpId.FcId;
    nodeWWN = VLN_Common::wwnText(entry.FcpId.NodeWWN.wwn);
    VLN_LOG(VLN_DBG, "%s", nodeWWN.c_str());
    portWWN = VLN_Common::wwnText(entry.FcpId.PortWWN.wwn);
    VLN_LOG(VLN_DBG, "%s", portWWN.c_str());
    fcpLun = static_cast<uint64>(entry.FcpId.FcpLun);
    osDeviceName = fieldText(entry.ScsiId.OSDeviceName);
    scsiBusNumber = entry.ScsiId.ScsiBusNumber;
    scsiTargetNumber = entry.ScsiId.ScsiTargetNumber;
    scsiOSLun = entry.ScsiId.ScsiOSLun;
}

void Target::readStandardInquiry(Unit& unit) {
    VLN_LOG(VLN_DBG, "SCSI Inquiry with 0, 0");
    if (!unit.inquiry(0, 0)) {
        vendor = product = revision = UNKNOWN;
        return;
    }
    deviceType = unit.response[0] & 0x1F;
    VLN_LOG(VLN_DBG, "DeviceType......%d", deviceType);
    vendor = unit.text(8, 8);
    product = unit.text(16, 16);
    revision = unit.text(32, 4);
}

void Target::readSerialNumber(Unit& unit) {
    VLN_LOG(VLN_DBG, "SCSI Inquiry with 1, 0x80");
    serialNumber = unit.inquiry(1, PAGE_SERIAL_NUMBER) ? unit.text(4, RESPONSE_SIZE) : UNKNOWN;
}

void Target::readDescriptor(Unit& unit) {
    VLN_LOG(VLN_DBG, "SCSI Inquiry with 1, 0x83");
    if (!unit.inquiry(1, PAGE_IDENTIFICATION)) {
        if (unit.status == HBA_STATUS_SCSI_CHECK_CONDITION)
            log_sense(unit.sense);
        return;
    }
    constexpr uint32 IDENTIFIER = 8; // offset in the response
    descriptor.deviceType = unit.response[0] & 0x1F;
    descriptor.pageCode = unit.response[1];
    descriptor.pageLength = unit.response[3];
    descriptor.identifierType = unit.response[5] & 0x0F;
    descriptor.identifierLength = unit.response[7];
    std::memcpy(descriptor.identifier, unit.response + IDENTIFIER,
                std::min(descriptor.identifierLength, RESPONSE_SIZE - IDENTIFIER));
    static_assert(RESPONSE_SIZE - IDENTIFIER <= sizeof descriptor.identifier);
}

void Target::readCapacity(Unit& unit) {
    VLN_LOG(VLN_DBG, "Send Read Capacity");
    if (!unit.readCapacity())
        return;
    lastLBA = big_endian_32(unit.response);
    blockLength = big_endian_32(unit.response + 4);
}

} // namespace cimple
