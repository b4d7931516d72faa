#include "tests/cimple/cmpi_fixture.h"

#include "schema/entry_points.h"

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
        script.instance.reset(self ? clone(self) : nullptr);
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
    script.model.reset(clone(method));
    return script.run(OP_INVOKE_METHOD);
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
    return instance_proc<Base_Provider, Test_Base>(registration, operation, a0, a1, a2, a3, a4, a5,
                                                   a6, a7);
}

} // namespace

Registration registrations[] = {
    {"module", "Test_Base_Provider", indication_proc, &Test_Base::static_meta_class, nullptr},
    {"module", "Test_Link_Provider", association_proc<Link_Provider, Test_Link>,
     &Test_Link::static_meta_class, nullptr},
    {"module", "Test_Service_Provider", method_proc<Service_Provider, Test_Service, invoke>,
     &Test_Service::static_meta_class, nullptr},
    {"module", "Test_Types_Provider", instance_proc<Scripted_Provider<Test_Types>, Test_Types>,
     &Test_Types::static_meta_class, nullptr},
    {"module", "Test_Arrays_Provider", instance_proc<Scripted_Provider<Test_Arrays>, Test_Arrays>,
     &Test_Arrays::static_meta_class, nullptr},
    {"module", "Test_Holder_Provider", instance_proc<Scripted_Provider<Test_Holder>, Test_Holder>,
     &Test_Holder::static_meta_class, nullptr},
};

// ---- The fixture ----

Cmpi_Test::Cmpi_Test()
    : core(std::make_shared<host::Core>([this] {
          host::Options options;
          options.mof_path = TEST_MOF;
          options.name_space = "root/test";
          options.class_defaults = false;
          options.trace = [this](const std::string& line) {
              if (line.starts_with("up-call"))
                  trace.push_back(line);
          };
          options.refuse = [this](bool, const char* function, CMPIrc& code) {
              const auto failure = failures.find(function);
              if (failure == failures.end() || (failure->second != 0 && --failure->second != 0))
                  return false;
              code = CMPI_RC_ERR_FAILED;
              return true;
          };
          return options;
      }())) {
    script = {};
    EXPECT_EQ(core->module.open("", core->classes), ""); // this program
}

Cmpi_Test::~Cmpi_Test() {
    script = {};
    failures.clear();
    core->module.cleanup(*core, true);
    core->report_leaks();
    for (const host::Fault& fault : core->faults.all())
        ADD_FAILURE() << host::to_string(fault);
}

CMPIInstanceMI* Cmpi_Test::instance_mi(const char* name) {
    host::Status status;
    return core->module.instance(*core, known(name), status);
}
CMPIMethodMI* Cmpi_Test::method_mi(const char* name) {
    host::Status status;
    return core->module.method(*core, known(name), status);
}
CMPIAssociationMI* Cmpi_Test::association_mi(const char* name) {
    host::Status status;
    return core->module.association(*core, known(name), status);
}

namespace {

host::Answer kind_of_answer(int operation) {
    switch (operation) {
    case OP_ENUM_INSTANCES:
    case OP_GET_INSTANCE:
    case OP_ENUM_ASSOCIATORS:
    case OP_ENUM_REFERENCES:
        return host::Answer::instances;
    case OP_INVOKE_METHOD:
        return host::Answer::data;
    default:
        return host::Answer::paths;
    }
}

} // namespace

Told Cmpi_Test::ask(const Question& q) {
    // Made before the call begins: a factory call is one of its own.
    CMPIInstanceMI* instances = instance_mi(q.class_name);
    CMPIMethodMI* methods = method_mi(q.class_name);
    CMPIAssociationMI* associations = association_mi(q.class_name);
    host::Request request(*core, known(q.class_name), "call", "root/test");
    const CMPIContext* context = request.context();
    const CMPIResult* result = request.result(kind_of_answer(q.operation), nullptr);
    const CMPIObjectPath* path = request.path(q.path);
    const CMPIInstance* instance = request.instance({q.path, q.properties});
    const char** list = request.property_list(q.list);
    const CMPIArgs* in = request.args(q.properties);
    const host::Method* called = q.method ? known(q.class_name).find_method(q.method) : nullptr;
    CMPIArgs* out = request.args({}, called ? called : &known("Test_Service").methods[0]);
    const auto answer = [&]() -> CMPIStatus {
        const char *result_class = q.result_class, *role = q.role, *result_role = q.result_role;
        switch (q.operation) {
        case ENUM_NAMES:
            return instances->ft->enumerateInstanceNames(instances, context, result, path);
        case OP_ENUM_INSTANCES:
            return instances->ft->enumerateInstances(instances, context, result, path, list);
        case OP_GET_INSTANCE:
            return instances->ft->getInstance(instances, context, result, path, list);
        case OP_CREATE_INSTANCE:
            return instances->ft->createInstance(instances, context, result, path, instance);
        case OP_MODIFY_INSTANCE:
            return instances->ft->modifyInstance(instances, context, result, path, instance, list);
        case OP_DELETE_INSTANCE:
            return instances->ft->deleteInstance(instances, context, result, path);
        case OP_INVOKE_METHOD:
            return methods->ft->invokeMethod(methods, context, result, path, q.method, in, out);
        case OP_ENUM_ASSOCIATOR_NAMES:
            return associations->ft->associatorNames(associations, context, result, path, "ignored",
                                                     result_class, role, result_role);
        case OP_ENUM_ASSOCIATORS:
            return associations->ft->associators(associations, context, result, path, "ignored",
                                                 result_class, role, result_role, list);
        case REFERENCE_NAMES:
            return associations->ft->referenceNames(associations, context, result, path, "ignored",
                                                    role);
        default:
            return associations->ft->references(associations, context, result, path, "ignored",
                                                role, list);
        }
    };
    const std::size_t before = host::Call::top()->arena.count;
    const CMPIStatus status = answer();
    const std::size_t message = status.msg != nullptr;
    if (failures.empty()) {
        EXPECT_EQ(host::Call::top()->arena.count - message, before)
            << "what is delivered is given back";
    }
    host::ResultBody& answered = request.answered();
    return {status.rc,     std::move(answered.instances), std::move(answered.paths),
            answered.data, request.outputs().values,      answered.done};
}

void Cmpi_Test::in_a_call(std::function<void()> body) {
    script.on = [&](int operation) {
        if (operation == OP_INVOKE_METHOD)
            body();
    };
    ask({.operation = OP_INVOKE_METHOD, .class_name = "Test_Service", .method = "Run"});
    script.on = nullptr;
}

} // namespace cimple

VLN_ASSOCIATION_FACTORIES(Test_Base, 0)
VLN_ASSOCIATION_FACTORIES(Test_Link, 1)
VLN_CLASS_FACTORIES(Test_Service, 2)
VLN_CLASS_FACTORIES(Test_Types, 3)
VLN_CLASS_FACTORIES(Test_Arrays, 4)
VLN_CLASS_FACTORIES(Test_Holder, 5)
