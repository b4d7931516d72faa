// The virtual ports of an FC port, what they see, and the virtual machines that use them.
#include "foundation/field_text.h"
#include "operations/operation_frame.h"

namespace cimple {

namespace {

constexpr uint32 FIRST_PORTS = 64;
constexpr uint32 FIRST_UNITS = 64;
constexpr uint32 FIRST_LUNS = 64;

constexpr int MOST_ATTEMPTS = 3;
constexpr uint32 RESPONSE_SIZE = 255;
constexpr uint32 SENSE_SIZE = 128;

uint32 bigEndian32(const uint8* bytes) {
    return static_cast<uint32>(bytes[0]) << 24 | static_cast<uint32>(bytes[1]) << 16 |
           static_cast<uint32>(bytes[2]) << 8 | bytes[3];
}

// The number in the first level of a LUN; peripheral and flat space addressing of SAM.
uint32 lunNumber(const uint8* lun) {
    return static_cast<uint32>(lun[0] & 0x3F) << 8 | lun[1];
}

AX_STATUS tell(AX_STATUS status, const char* operation) {
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "%s exited with the error code %d", operation, status);
    return status;
}

// Where a unit's answer goes.
struct Scsi_Answer {
    uint8 response[RESPONSE_SIZE];
    uint8 sense[SENSE_SIZE];
};

template <class Command>
AX_STATUS send(const char* function, Command command) {
    AX_STATUS status = AX_STATUS_OK;
    int attempts = 0;
    do
        status = command();
    while (status == AX_STATUS_CHECK_CONDITION && ++attempts < MOST_ATTEMPTS);
    VLN_LOG(VLN_DBG, "AX_%s: status=%d", function, static_cast<int>(status));
    if (status != AX_STATUS_OK)
        VLN_MethodWrapper::logStatus(status);
    return status;
}

std::string textAt(const Scsi_Answer& answer, uint32 offset, uint32 size) {
    return fieldText(reinterpret_cast<const char*>(answer.response) + offset, size);
}

} // namespace

AX_STATUS VLN_MethodWrapper::ListVPorts(const HBA_WWN* name, std::vector<AX_VPort>* ports) {
    Operation_Frame frame("VLN_MethodWrapper::ListVPorts");
    if (!frame.given(ports))
        return frame.status();
    return tell(
        fetch_list<AX_VPortList>(ports, FIRST_PORTS,
                                 {"Unable to allocate the memory for the list of virtual ports"},
                                 [&](AX_VPortList* list) { return AX_VPList(wwnOf(name), list); }),
        "ListVPorts");
}

AX_STATUS VLN_MethodWrapper::ListVPortAttributes(const HBA_WWN* name, const HBA_WWN* vport,
                                                 AX_VPortAttributes* attributes) {
    Operation_Frame frame("VLN_MethodWrapper::ListVPortAttributes");
    if (!frame.given(attributes))
        return frame.status();
    *attributes = {};
    return tell(AX_VPGetAttributes(wwnOf(name), wwnOf(vport), attributes), "ListVPortAttributes");
}

AX_STATUS VLN_MethodWrapper::ListVPortTargets(const HBA_WWN* name, const HBA_WWN* vport,
                                              std::vector<AX_VPortTarget>* units) {
    Operation_Frame frame("VLN_MethodWrapper::ListVPortTargets");
    if (!frame.given(units))
        return frame.status();
    return tell(fetch_list<AX_VPortTargetList>(
                    units, FIRST_UNITS,
                    {"Unable to allocate the memory for the targets of a virtual port"},
                    [&](AX_VPortTargetList* list) {
                        return AX_VPListTargets(wwnOf(name), wwnOf(vport), list);
                    }),
                "ListVPortTargets");
}

AX_STATUS VLN_MethodWrapper::ListVPortLuns(const HBA_WWN* name, const HBA_WWN* vport,
                                           const AX_NAME& target, std::vector<uint32>* luns) {
    constexpr uint32 LUN_SIZE = 8;
    constexpr uint32 HEAD_SIZE = 8; // of which four are the length of the LUNs in bytes
    constexpr char NO_MEMORY[] = "Unable to allocate the memory for the units of a target";
    Operation_Frame frame("VLN_MethodWrapper::ListVPortLuns");
    if (!frame.given(luns))
        return frame.status();
    luns->clear();
    // A response that is cut tells its whole length all the same.
    Reply reply;
    const auto call = [&](void* buffer, uint32& count) -> AX_STATUS {
        uint8 sense[SENSE_SIZE] = {};
        const uint32 room = count;
        const AX_STATUS status = send("VpScsiReportLUNs", [&] {
            return AX_VpScsiReportLUNs(wwnOf(name), wwnOf(vport), wwnOf(target), buffer,
                                       HEAD_SIZE + room * LUN_SIZE, sense, sizeof sense);
        });
        count = bigEndian32(static_cast<const uint8*>(buffer)) / LUN_SIZE;
        return status == AX_STATUS_OK && count > room ? AX_STATUS_MORE_DATA : status;
    };
    const AX_STATUS status = reply.fetch({HEAD_SIZE, LUN_SIZE, FIRST_LUNS}, {NO_MEMORY}, call);
    if (status != AX_STATUS_OK)
        return tell(status, "ListVPortLuns");
    try {
        luns->reserve(reply.count());
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "%s", NO_MEMORY);
        return AX_STATUS_ERROR;
    }
    const auto* lun = static_cast<const uint8*>(reply.data()) + HEAD_SIZE;
    for (uint32 i = 0; i < reply.count(); ++i, lun += LUN_SIZE)
        luns->push_back(lunNumber(lun));
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::VPortLunAttr(const HBA_WWN* name, const HBA_WWN* vport,
                                          const AX_VPortTarget& unit, VLN_VPortUnit* answer) {
    Operation_Frame frame("VLN_MethodWrapper::VPortLunAttr");
    if (!frame.given(answer))
        return frame.status();
    Scsi_Answer inquiry;
    AX_STATUS status = send("VpScsiInquiry", [&] {
        inquiry = {};
        return AX_VpScsiInquiry(wwnOf(name), wwnOf(vport), wwnOf(unit.wwpn), unit.fcpLun, 0, 0,
                                inquiry.response, sizeof inquiry.response, inquiry.sense,
                                sizeof inquiry.sense);
    });
    if (status != AX_STATUS_OK)
        return status;
    Scsi_Answer capacity;
    status = send("VpScsiReadCapacity", [&] {
        capacity = {};
        return AX_VpScsiReadCapacity(wwnOf(name), wwnOf(vport), wwnOf(unit.wwpn), unit.fcpLun,
                                     capacity.response, sizeof capacity.response, capacity.sense,
                                     sizeof capacity.sense);
    });
    if (status != AX_STATUS_OK)
        return status;
    try {
        answer->vendor = textAt(inquiry, 8, 8);
        answer->product = textAt(inquiry, 16, 16);
        answer->revision = textAt(inquiry, 32, 4);
    } catch (const std::bad_alloc&) {
        return AX_STATUS_NO_MEMORY;
    }
    answer->deviceType = inquiry.response[0] & 0x1F;
    answer->lastLBA = bigEndian32(capacity.response);
    answer->blockLength = bigEndian32(capacity.response + 4);
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::ListVMfromVPort(const HBA_WWN* name, const HBA_WWN* vport,
                                             std::string* machine) {
    Operation_Frame frame("VLN_MethodWrapper::ListVMfromVPort");
    if (!frame.given(machine))
        return frame.status();
    AX_VM vm{};
    AX_STATUS status = AX_GetVMFromVPort(wwnOf(name), wwnOf(vport), &vm);
    if (status == AX_STATUS_NOT_SUPPORTED) {
        VLN_LOG(VLN_DBG, "No virtual machine uses the virtual port");
        return status;
    }
    AX_VMInfo info{};
    if (status == AX_STATUS_OK)
        status = AX_GetVMInfo(&vm, &info);
    if (status != AX_STATUS_OK)
        return tell(status, "ListVMfromVPort");
    try {
        *machine = fieldText(info.name);
    } catch (const std::bad_alloc&) {
        return AX_STATUS_NO_MEMORY;
    }
    return AX_STATUS_OK;
}

} // namespace cimple
