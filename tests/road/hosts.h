// Hosts that a test describes in a line, and what the platform has of its own.
#ifndef TESTS_ROAD_HOSTS_H
#define TESTS_ROAD_HOSTS_H

#include <string>

namespace road {

// A scenario of cards made from the templates of the simulator's own.
inline std::string cards(const std::string& list) {
    return R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [)" + list + "]}";
}

// Of one card with these functions on each of its ports, one if nothing more is told of it.
inline std::string card(const std::string& functions, const std::string& more = "") {
    return cards(R"({"use": "cna", )" + more + R"("functions": [)" + functions + "]}");
}

// Its computer systems, of which the first counts, its chassis, and two of its profiles.
inline constexpr const char* PLATFORM = R"({
  "classes": [{"name": "OMC_RegisteredBaseServerProfile", "superclass": "PG_RegisteredProfile"}],
  "instances": [
    {"namespace": "root/ibmse", "class": "IBMSD_ComputerSystem",
     "properties": {"CreationClassName": "IBMSD_ComputerSystem", "Name": "rack7-node3"}},
    {"namespace": "root/ibmse", "class": "IBMSD_ComputerSystem",
     "properties": {"CreationClassName": "IBMSD_ComputerSystem", "Name": "a second one"}},
    {"namespace": "root/ibmse", "class": "IBMSD_Chassis",
     "properties": {"CreationClassName": "IBMSD_Chassis", "Tag": "chassis 12"}},
    {"namespace": "root/pg_interop", "class": "OMC_RegisteredBaseServerProfile",
     "properties": {"InstanceID": "OMC:Fan", "RegisteredName": "Fan"}},
    {"namespace": "root/pg_interop", "class": "OMC_RegisteredBaseServerProfile",
     "properties": {"InstanceID": "OMC:Server", "RegisteredName": "Base Server"}}
  ]})";

} // namespace road

#endif // TESTS_ROAD_HOSTS_H
