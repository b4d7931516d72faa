// What has changed of the targets, portals and name servers of iSCSI functions: tables of a state.
#ifndef VLNSIM_STATE_ISCSI_H
#define VLNSIM_STATE_ISCSI_H

#include "simulator/host_model.h"
#include "simulator/source_reader.h"

#include <nlohmann/json.hpp>

namespace vlnsim {

// By the target's name: what callers set of it, and its sessions.
nlohmann::ordered_json list_iscsi_targets(const Function& function);
void set_iscsi_target(Function& function, const std::string& name, const Node& value);

// By address and port: the login properties.
nlohmann::ordered_json list_send_target_portals(const Function& function);
void set_send_target_portal(Function& function, const std::string& portal, const Node& value);

// By address and port: true; and "enabled".
nlohmann::ordered_json list_name_servers(const Function& function);
void set_name_server(Function& function, const std::string& server, const Node& value);

} // namespace vlnsim

#endif // VLNSIM_STATE_ISCSI_H
