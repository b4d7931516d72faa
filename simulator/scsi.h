// How logical units answer SCSI commands, whichever call of the library brings these.
#ifndef VLNSIM_SCSI_H
#define VLNSIM_SCSI_H

#include "simulator/call.h"

namespace vlnsim {

enum class Scsi_Command : std::uint8_t { inquiry, serial_page, identity_page, read_capacity };

// The inquiry that is asked for; nothing for a page that no unit has.
std::optional<Scsi_Command> inquiry_command(std::uint32_t evpd, std::uint32_t page);

struct Scsi_Buffers {
    void* response;
    std::uint32_t response_size;
    void* sense;
    std::uint32_t sense_size;
};

// Answers an HBA_STATUS. What is not a command is refused by a check condition.
HBA_STATUS answer_scsi(Call& call, std::vector<Target>& targets, std::uint64_t port_wwn,
                       std::uint64_t fcp_lun, std::optional<Scsi_Command> command,
                       const Scsi_Buffers& buffers);
// REPORT LUNS: the units of a target that it tells of.
HBA_STATUS report_luns(Call& call, const std::vector<Target>& targets, std::uint64_t port_wwn,
                       const Scsi_Buffers& buffers);

} // namespace vlnsim

#endif // VLNSIM_SCSI_H
