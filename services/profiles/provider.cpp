#include "services/profiles/provider.h"

#include "agent/associations.h"
#include "agent/gates.h"
#include "cimple/cimom.h"
#include "cimple/guard.h"
#include "classes/PG_RegisteredProfile.h"
#include "classes/VLNMPCA_RegisteredProfile.h"

#include <vector>

namespace cimple {

namespace {

constexpr char PLATFORM_CLASS[] = "OMC_RegisteredBaseServerProfile";

using Profiles = std::vector<Ref<const VLNMPCA_RegisteredProfile>>;

// Counted, so that no lock of the agent is held during the up-call.
Profiles registered_profiles(ProviderAgent& agent) {
    return behind(agent, adapter_maps_gate, [&agent] {
        const auto& store = agent.m_VLNMPCA_RegisteredProfile_map;
        Profiles profiles;
        for (uint32 i = 0; i < store.size(); ++i)
            profiles.push_back(Ref<const VLNMPCA_RegisteredProfile>::share(store[i]));
        return profiles;
    });
}

bool is_base_server(const PG_RegisteredProfile* profile) {
    return profile && profile->RegisteredName.value == "Base Server";
}

// The class is the platform's and no part of the schema; its instances look like those of the class
// that it is derived from. They count the class that is made here, and so outlive this call.
Ref<PG_RegisteredProfile> base_server_profile() {
    const Class_Handle platform_class(
        create_meta_class(PLATFORM_CLASS, &PG_RegisteredProfile::static_meta_class, FLAG_CLASS));
    const Ref<Instance> model(create(platform_class.get()));
    VLN_LOG(VLN_DBG,
            "up-call to enumerate OMC_RegisteredBaseServerProfile/OMC_RegisteredBaseServerProfile/"
            "PG_RegisteredProfile created--calling now");
    Instance_Enumerator enumerator;
    if (cimom::enum_instances(INTEROP_NAME_SPACE, model.get(), enumerator) != 0)
        return {};
    for (; enumerator.more(); enumerator.next()) {
        Ref<PG_RegisteredProfile> profile(enumerator.get().release());
        if (!is_base_server(profile.get()) || !keys_all_set(profile.get()))
            continue;
        profile->__name_space = INTEROP_NAME_SPACE;
        return profile;
    }
    return {};
}

Ref<VLNMPCA_BaseServerReferencedProfile>
reference_to(const Ref<PG_RegisteredProfile>& base_server,
             const Ref<const VLNMPCA_RegisteredProfile>& profile) {
    auto association = association_of(&VLNMPCA_BaseServerReferencedProfile::static_meta_class,
                                      {base_server.get(), profile.get()});
    return Ref<VLNMPCA_BaseServerReferencedProfile>(association.release());
}

void enumerate(ProviderAgent& agent, const Enum_Instances_Handler& handler) {
    const Profiles profiles = registered_profiles(agent);
    const auto base_server = base_server_profile();
    if (!base_server)
        return;
    for (const auto& profile : profiles)
        if (!handler.handle(reference_to(base_server, profile).release()))
            return;
}

Ref<VLNMPCA_BaseServerReferencedProfile> find(ProviderAgent& agent,
                                              const VLNMPCA_BaseServerReferencedProfile& model) {
    if (!model.Antecedent || !model.Dependent)
        return {};
    for (const auto& profile : registered_profiles(agent)) {
        if (!key_eq(profile.get(), model.Dependent))
            continue;
        const auto base_server = base_server_profile();
        if (base_server && key_eq(base_server.get(), model.Antecedent))
            return reference_to(base_server, profile);
    }
    return {};
}

} // namespace

sint32 Base_Server_Profile_Provider::get_instance(const VLNMPCA_BaseServerReferencedProfile* model,
                                                  VLNMPCA_BaseServerReferencedProfile*& instance) {
    ProviderAgent* agent = ProviderAgent::current();
    const bool complete = run_guarded([&] {
        if (agent)
            instance = find(*agent, *model).release();
    });
    if (!complete)
        VLN_LOG(VLN_CRIT, "Exception in CIM Provider Enumeration - do nothing");
    return instance ? GET_INSTANCE_OK : GET_INSTANCE_NOT_FOUND;
}

sint32 Base_Server_Profile_Provider::enum_instances(const VLNMPCA_BaseServerReferencedProfile*,
                                                    const Enum_Instances_Handler& handler) {
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return ENUM_INSTANCES_OK;
    if (!run_guarded([&] { enumerate(*agent, handler); }))
        VLN_LOG(VLN_CRIT, "Exception in CIM Provider Enumeration - do nothing");
    return ENUM_INSTANCES_OK;
}

} // namespace cimple
