// Where instances live: the provider's own namespaces, and the platform's with its classes that the
// instances link to.
#ifndef VLN_AGENT_NAME_SPACES_H
#define VLN_AGENT_NAME_SPACES_H

namespace cimple {

inline constexpr char VORLAN_NAME_SPACE[] = "root/vorlan";
inline constexpr char INTEROP_NAME_SPACE[] = "root/pg_interop";
inline constexpr char PLATFORM_NAME_SPACE[] = "root/ibmse";
inline constexpr char PLATFORM_CLASSES[] =
    "IBMSD_ComputerSystem IBMSD_Chassis PG_RegisteredProfile";

} // namespace cimple

#endif // VLN_AGENT_NAME_SPACES_H
