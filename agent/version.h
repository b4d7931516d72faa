// The provider's version, as it stands in log lines, descriptions and software identities.
#ifndef VLN_AGENT_VERSION_H
#define VLN_AGENT_VERSION_H

namespace cimple {

inline constexpr int PROVIDER_MAJOR = 10;
inline constexpr int PROVIDER_MINOR = 2;
inline constexpr int PROVIDER_REVISION = 261;
inline constexpr int PROVIDER_BUILD = 13;

} // namespace cimple

// The four numbers in the order of a "%d.%d.%d-%d" format.
#define VLN_PROVIDER_VERSION_NUMBERS                                                               \
    ::cimple::PROVIDER_MAJOR, ::cimple::PROVIDER_MINOR, ::cimple::PROVIDER_REVISION,               \
        ::cimple::PROVIDER_BUILD

#endif // VLN_AGENT_VERSION_H
