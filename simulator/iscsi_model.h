// What an iSCSI function sees and is told to log in to, and the network that it finds it in.
#ifndef VLNSIM_ISCSI_MODEL_H
#define VLNSIM_ISCSI_MODEL_H

#include "device/library/axapi.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace vlnsim {

struct Function;

// Statuses that the simulated library answers beside those of axapi.h.
enum : AX_STATUS {
    iscsi_login_refused = 109, // by the target or the portal
    iscsi_unknown = 110,       // no such target, portal, session or name server
    iscsi_exists = 111,
    iscsi_full = 112,
};

// Bytes of a record that the library leaves as they are are not zero.
struct iSCSI_Unit {
    AX_iSCSI_Lun entry{};
    AX_iSCSI_LunProperties properties{};
    bool silent = false; // its properties can't be had
};

struct iSCSI_Session {
    AX_iSCSI_Session entry{};
    AX_iSCSI_SessionInfo info{};
};

struct iSCSI_Target {
    AX_iSCSI_Target entry{};
    std::vector<iSCSI_Unit> units;
    std::vector<iSCSI_Session> sessions;
    AX_iSCSI_Authentication wanted{};            // of whoever logs in
    std::optional<AX_iSCSI_LoginOptions> limits; // what it agrees to; none: to what is offered
    std::string alias;

    // What callers set.
    AX_iSCSI_LoginProperties login{}; // what the function offers it
    AX_IPAddress portal{};   // where it was added or discovered; zeros: it answers anywhere
    bool discovered = false; // goes with its portal
    bool lists_units = true; // a target of the scenario does so also without a session
    std::uint32_t eto = 0;

    std::string name() const;
};

// A portal in the network.
struct iSCSI_Portal {
    AX_IPAddress address{};
    AX_iSCSI_Authentication wanted{}; // of whoever asks for its targets
    std::vector<iSCSI_Target> targets;
};

struct iSCSI_Network {
    std::vector<iSCSI_Portal> portals;                // all of which answer a ping
    std::vector<std::pair<AX_IPAddress, bool>> hosts; // others, and whether they answer one
};

// A portal that a function was told to ask for targets.
struct Send_Target_Portal {
    AX_IPAddress address{};
    AX_iSCSI_LoginProperties login{};
};

struct Name_Servers {
    std::uint32_t enabled = 0;
    std::vector<AX_IPAddress> list;
};

inline constexpr std::uint64_t isid_base =
    0x400002560000; // enterprise number form, RFC 7143, 11.12.5
inline constexpr std::uint16_t first_dynamic_port = 49152; // RFC 6335

bool same_address(const AX_IPAddress& one, const AX_IPAddress& other); // the port aside
bool same_portal(const AX_IPAddress& one, const AX_IPAddress& other);

iSCSI_Target* find_target(Function& function, std::string_view name);

// How the list shows a session: its record holds the same.
AX_iSCSI_Session session_entry(const AX_iSCSI_SessionInfo& info, std::uint32_t id);
// The flags of the list, after sessions came or went.
void update_flags(iSCSI_Target& target);

// A target of that name as the network has it, its units hidden until there is a session; one
// without units for a name that the network does not have.
iSCSI_Target new_target(const iSCSI_Network& network, const Function& function,
                        std::string_view name, const AX_IPAddress& portal);

// What a discovery session at the portal brings; a target that is known already stays as it is.
AX_STATUS discover(const iSCSI_Network& network, Function& function,
                   const Send_Target_Portal& portal);
// A session more, or the status of what is wrong. The counters of the function tell of both.
AX_STATUS log_in(const iSCSI_Network& network, Function& function, iSCSI_Target& target,
                 const AX_IPAddress& portal, const AX_iSCSI_LoginProperties& login);
// portal: null for any.
AX_STATUS log_out(Function& function, iSCSI_Target& target, const AX_IPAddress* portal,
                  std::uint32_t session_id);

} // namespace vlnsim

#endif // VLNSIM_ISCSI_MODEL_H
