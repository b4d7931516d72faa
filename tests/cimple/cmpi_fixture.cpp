#include "tests/cimple/cmpi_fixture.h"

#include <algorithm>

namespace cimple {

Script script;

sint32 Script::run(int operation) {
    operations.push_back(operation);
    if (on)
        on(operation);
    return status[operation];
}

sint32 Script::deliver(int operation, const Instance_Handler& handler) {
    const sint32 answer = run(operation);
    for (const Ref<Instance>& instance : instances)
        if (!handler.handle(clone(instance.get())))
            break;
    return answer;
}

long Script::count(int operation) const {
    return std::count(operations.begin(), operations.end(), operation);
}

namespace {

template <class C>
struct Scripted_Provider {
    sint32 load() { return script.run(OP_LOAD); }
    sint32 unload() { return script.run(OP_UNLOAD); }
    sint32 get_instance(const C* keys, C*& out) {
        script.model.reset(clone(keys));
        const sint32 status = script.run(OP_GET_INSTANCE);
        if (status == 0 && !script.instances.empty())
            out = static_cast<C*>(clone(script.instances[0].get()));
        return status;
    }
    sint32 enum_instances(const C* model, const Enum_Instances_Handler& handler) {
        script.model.reset(clone(model));
        return script.deliver(OP_ENUM_INSTANCES, handler);
    }
    sint32 create_instance(C* instance) {
        script.instance.reset(clone(instance));
        return script.run(OP_CREATE_INSTANCE);
    }
    sint32 delete_instance(const C* keys) {
        script.model.reset(clone(keys));
        return script.run(OP_DELETE_INSTANCE);
    }
    sint32 modify_instance(const C* model, const C* instance) {
        script.model.reset(clone(model));
        script.instance.reset(clone(instance));
        return script.run(OP_MODIFY_INSTANCE);
    }
    sint32 enum_associator_names(const Instance* source, const char* result_class, const char* role,
                                 const char* result_role,
                                 const Enum_Associator_Names_Handler& handler) {
        script.instance.reset(clone(source));
        script.role = std::string(result_class) + "/" + role + "/" + result_role;
        const sint32 status = script.status[OP_ENUM_ASSOCIATOR_NAMES];
        return status == ENUM_ASSOCIATOR_NAMES_UNSUPPORTED
                   ? script.run(OP_ENUM_ASSOCIATOR_NAMES)
                   : script.deliver(OP_ENUM_ASSOCIATOR_NAMES, handler);
    }
    sint32 enum_references(const Instance* source, const C*, const char* role,
                           const Enum_References_Handler& handler) {
        script.instance.reset(clone(source));
        script.role = role;
        return script.status[OP_ENUM_REFERENCES] == ENUM_REFERENCES_UNSUPPORTED
                   ? script.run(OP_ENUM_REFERENCES)
                   : script.deliver(OP_ENUM_REFERENCES, handler);
    }
    sint32 enum_associators(const Instance*, const char*, const char*, const char*,
                            const Enum_Associators_Handler& handler) {
        return script.status[OP_ENUM_ASSOCIATORS] == 0
                   ? script.deliver(OP_ENUM_ASSOCIATORS, handler)
                   : script.run(OP_ENUM_ASSOCIATORS);
    }
};

struct Base_Provider : Scripted_Provider<Test_Base> {};
struct Link_Provider : Scripted_Provider<Test_Link> {};
struct Service_Provider : Scripted_Provider<Test_Service> {
    sint32 Run(const Test_Service* self, const Property<uint32>* level, Test_Base** target,
               Property<String>* answer, Property<uint32>* return_value) {
        script.instance.reset(clone(self));
        script.model.reset(*target ? clone(*target) : nullptr);
        const sint32 status = script.run(OP_INVOKE_METHOD);
        if (level->is_null())
            return status;
        answer->set("level");
        return_value->set(level->value + 1);
        return status;
    }
};

sint32 invoke(Service_Provider* provider, const Test_Service* self, Instance* method) {
    if (auto* m = method_cast<Test_Service_Run_method>(method))
        return provider->Run(self, &m->Level, &m->Target, &m->Answer, &m->return_value);
    return -1;
}

sint32 indication_proc(const Registration* registration, int operation, Provider_Word a0,
                       Provider_Word a1, Provider_Word a2, Provider_Word a3, Provider_Word a4,
                       Provider_Word a5, Provider_Word a6, Provider_Word a7) {
    if (operation == OP_ENABLE_INDICATIONS) {
        script.indication_proc = reinterpret_cast<Indication_Proc>(a1);
        script.indication_data = reinterpret_cast<void*>(a2);
    }
    if (operation == OP_ENABLE_INDICATIONS || operation == OP_DISABLE_INDICATIONS)
        return script.run(operation);
    return base_registration.proc(registration, operation, a0, a1, a2, a3, a4, a5, a6, a7);
}

} // namespace

const Registration base_registration = {"module", "Base_Provider",
                                        instance_proc<Base_Provider, Test_Base>,
                                        &Test_Base::static_meta_class, nullptr};
const Registration link_registration = {"module", "Link_Provider",
                                        association_proc<Link_Provider, Test_Link>,
                                        &Test_Link::static_meta_class, nullptr};
const Registration service_registration = {"module", "Service_Provider",
                                           method_proc<Service_Provider, Test_Service, invoke>,
                                           &Test_Service::static_meta_class, nullptr};
const Registration indication_registration = {"module", "Indication_Provider", indication_proc,
                                              &Test_Base::static_meta_class, nullptr};

Cmpi_Test::~Cmpi_Test() {
    script = {};
    for (auto& [registration, block] : blocks) {
        CMPIInstanceMI mi = {&block, &block.instance_ft};
        while (block.adapter)
            mi.ft->cleanup(&mi, context, true);
    }
    broker.end_call();
    EXPECT_EQ(broker.released_parameters, 0);
}

void* Cmpi_Test::interface_any(const Registration& registration, char letter, const char* name) {
    Provider_Static_Data& block = blocks[&registration];
    void* interface = nullptr;
    EXPECT_EQ(cimple_cmpi_adapter(&block, &registration, &broker.broker, context, name, letter,
                                  &interface),
              0);
    return interface;
}

fake::Data_Ref Cmpi_Test::base_data(const char* id, unsigned slot) {
    return fake::path_data("root/test", "Test_Base",
                           {{"Id", fake::text(id)}, {"Slot", fake::number(CMPI_uint64, slot)}});
}

CMPIObjectPath* Cmpi_Test::base_path(const char* id, unsigned slot) {
    return id ? broker.path(base_data(id, slot)) : broker.path("root/test", "Test_Base");
}

} // namespace cimple
