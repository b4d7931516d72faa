// Which type serves a class: the pattern, unless a hand-written provider is named here for it.
//
// A class with a provider of its own in services/ specialises Provider_For in that provider's
// header, which services/providers.h names.
#ifndef VLN_DERIVED_OBJECTS_PROVIDER_FOR_H
#define VLN_DERIVED_OBJECTS_PROVIDER_FOR_H

#include "derivedObjects/pattern_provider.h"

namespace cimple {

template <class C>
struct Provider_For {
    using type = Pattern_Provider<C>;
};

} // namespace cimple

#endif // VLN_DERIVED_OBJECTS_PROVIDER_FOR_H
