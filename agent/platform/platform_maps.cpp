// The computer system and the chassis that everything hangs on: the platform's own, found by an
// up-call to the object manager, else the provider's.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/platform/host_identity.h"
#include "agent/platform/platform_objects.h"
#include "agent/text.h"
#include "agent/version.h"
#include "cimple/cimom.h"

#include <cerrno>

namespace cimple {

namespace {

constexpr std::size_t HOST_NAME_SIZE = 512;
constexpr char UNKNOWN_HOST[] = "unknown";

struct Up_Call {
    const char* platform_class;
    const Meta_Class* wanted; // what an instance must be to be linked to
    const char* started;
    const char* calling;
    const char* found;
    const char* finished; // or null
};

const Up_Call COMPUTER_SYSTEM_CALL = {
    "IBMSD_ComputerSystem",
    &CIM_ComputerSystem::static_meta_class,
    "up-call to enumerate CIM_ComputerSystem started",
    "up-call to enumerate CIM_ComputerSystem created--calling now",
    "up-call - found the correct CIM_ComputerSystem to link",
    "up-call to enumerate CIM_ComputerSystem created",
};

const Up_Call CHASSIS_CALL = {
    "IBMSD_Chassis",
    &CIM_Chassis::static_meta_class,
    "up-call to enumerate CIM_Chassis started",
    "up-call to enumerate CIM_Chassis created--calling now",
    "up-call - found the correct CIM_Chassis to link",
    nullptr,
};

// The first instance of the wanted class in the enumeration, in a copy of the platform's namespace.
Ref<Instance> first_match(Instance_Enumerator& enumerator, const Up_Call& call) {
    for (; enumerator.more(); enumerator.next()) {
        const Ref<Instance> candidate = enumerator.get();
        // Without a key, which the object manager may fail to hand out, it names nothing.
        if (!candidate || !is_subclass(call.wanted, candidate->__meta_class) ||
            !keys_all_set(candidate.get()))
            continue;
        VLN_LOG(VLN_DBG, "%s", call.found);
        Ref<Instance> copy(clone(candidate.get()));
        copy->__name_space = PLATFORM_NAME_SPACE;
        return copy;
    }
    return {};
}

// The platform's instance, or null: the class is unknown, nobody serves it, or it has no instances.
Ref<Instance> platform_instance(const Up_Call& call) {
    VLN_LOG(VLN_DBG, "%s", call.started);
    const Meta_Class* platform_class =
        find_meta_class(call.wanted->meta_repository, call.platform_class);
    if (!platform_class)
        return {};
    const Ref<Instance> model(create(platform_class));
    VLN_LOG(VLN_DBG, "%s", call.calling);
    Instance_Enumerator enumerator;
    Ref<Instance> instance;
    if (cimom::enum_instances(PLATFORM_NAME_SPACE, model.get(), enumerator) == 0)
        instance = first_match(enumerator, call);
    if (call.finished)
        VLN_LOG(VLN_INFO, "%s", call.finished);
    return instance;
}

struct Host_Identity {
    std::string name = UNKNOWN_HOST;
    std::string address = UNKNOWN_HOST;
};

Host_Identity host_identity() {
    Host_Identity host;
    char name[HOST_NAME_SIZE] = "";
    if (host_queries().host_name(name, sizeof name) != 0) {
        VLN_LOG(
            VLN_ERR,
            "Error! gethostname() failed err : %d , using 'unknown' for hostname and IP address",
            errno);
        return host;
    }
    name[sizeof name - 1] = '\0';
    VLN_LOG(VLN_DBG, "Host Name : %s", name);
    host.name = name;
    if (host_queries().resolve(name, host.name, host.address))
        VLN_LOG(VLN_DBG, "Host ipAddress : %s", host.address.c_str());
    else
        VLN_LOG(VLN_ERR, "Error! gethostbyname() failed, using 'unknown' for IP address.");
    return host;
}

} // namespace

Platform_Objects find_platform_objects() {
    Platform_Objects found;
    found.system = Ref<CIM_ComputerSystem>(platform_instance(COMPUTER_SYSTEM_CALL).release());
    found.chassis = Ref<CIM_Chassis>(platform_instance(CHASSIS_CALL).release());
    return found;
}

uint32 Adapter_Map_Builder::createComputerSystem() {
    Ref<CIM_ComputerSystem> system = _platform.system;
    _agent.m_bOwnComputerSystem = !system;
    if (system) {
        VLN_LOG(VLN_DBG, "All clear -created vlnhba computer system instance");
    } else {
        VLN_LOG(VLN_DBG, "up-call method failed");
        system = ownComputerSystem();
    }
    _system = insert_instance(_agent.m_CIM_ComputerSystem_map, system,
                              "Insert Failed : m_VLNHBA_ComputerSystem_map");
    return _system ? MAP_OK : END_PASS;
}

Ref<CIM_ComputerSystem> Adapter_Map_Builder::ownComputerSystem() const {
    const Host_Identity host = host_identity();
    VLN_LOG(VLN_DBG, "Generating an vorlan specific m_CIM_ComputerSystem_map[0]");
    auto system = make_instance<CIM_ComputerSystem>();
    system->Description.set(format_text("%s with Vorlan CMPI HBA Provider v%d.%d.%d-%d",
                                        _agent.m_OSName.c_str(), VLN_PROVIDER_VERSION_NUMBERS));
    system->CreationClassName.set("CIM_ComputerSystem");
    system->Name.set(text(host.name));
    system->ElementName.set(text(host.name));
    system->RequestedState.set(12);
    system->EnabledDefault.set(2);
    system->OtherIdentifyingInfo.append(text(host.address));
    system->IdentifyingDescriptions.append(String("VORLAN:IP_ADDRESS"));
    system->OtherIdentifyingInfo.append(text(_agent.m_OSName));
    system->IdentifyingDescriptions.append(String("VORLAN:OS_NAME"));
    return system;
}

uint32 Adapter_Map_Builder::createChassis() {
    Ref<CIM_Chassis> chassis = _platform.chassis;
    if (!chassis) {
        VLN_LOG(VLN_DBG, "up-call method to get the chassis is failed");
        chassis = ownChassis();
        if (!chassis) {
            VLN_LOG(VLN_CRIT, "Could not create the Chassis Instance");
            return END_PASS;
        }
    }
    _chassis =
        insert_instance(_agent.m_CIM_Chassis_map, chassis, "Insert Failed : m_CIM_Chassis_map");
    return MAP_OK;
}

Ref<CIM_Chassis> Adapter_Map_Builder::ownChassis() const {
    auto chassis = make_instance<CIM_Chassis>();
    chassis->Tag.set("VLN MPCA:Chassis");
    chassis->ElementName.set("VLN MPCA:Chassis");
    chassis->CreationClassName.set("CIM_Chassis");
    chassis->PackageType.set(3);
    return chassis;
}

} // namespace cimple
