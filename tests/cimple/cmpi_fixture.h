// Scripted providers over the test schema, and a fixture that asks them as a hasty object manager
// would: unchecked on the way in, checked on the way out.
#ifndef TESTS_CIMPLE_CMPI_FIXTURE_H
#define TESTS_CIMPLE_CMPI_FIXTURE_H

#include "cimple/cmpi_adapter.h"
#include "cimple/provider_proc.h"
#include "host/request.h"
#include "tests/cimple/test_schema.h"

#include <functional>
#include <gtest/gtest.h>
#include <map>
#include <string>
#include <vector>

namespace cimple {

using host::Value;

// What the scripted providers do, by operation number.
struct Script {
    std::map<int, sint32> status;          // answers; 0 unless given
    std::vector<Ref<Instance>> instances;  // what enumerations deliver, as clones
    std::function<void(int operation)> on; // runs inside the operation; may throw
    std::vector<int> operations;           // what was called

    Ref<Instance> model; // clones of what an operation was given
    Ref<Instance> instance;
    std::string role; // and the texts of an association operation
    Indication_Proc indication_proc = nullptr;
    void* indication_data = nullptr;

    sint32 run(int operation);
    sint32 deliver(int operation, const Instance_Handler& handler);
    long count(int operation) const;
};
extern Script script;

// Test_Base, which indicates too; Test_Link, an association; and Test_Service, which has methods.
extern Registration registrations[6];

// Functions of the interfaces that ask for names, beside the numbers of the provider's operations.
enum { ENUM_NAMES = 100, REFERENCE_NAMES };

// A call; what its function does not take is not looked at.
struct Question {
    int operation = 0;
    const char* class_name = "Test_Base"; // whose provider is asked
    host::ObjectPath path = {"root/test", class_name, {}};
    host::Named_Values properties = {}; // of an instance, or the arguments
    host::Property_List list = std::nullopt;
    const char* result_class = nullptr;
    const char* role = nullptr;
    const char* result_role = nullptr;
    const char* method = nullptr;
};

// What came of it.
struct Told {
    int rc = 0;
    std::vector<host::Instance> instances;
    std::vector<host::ObjectPath> paths;
    std::optional<Value> data;
    host::Named_Values outputs;
    int done = 0; // whether returnDone was called
    int results() const { return static_cast<int>(instances.size() + paths.size()); }
};

class Cmpi_Test : public testing::Test {
protected:
    Cmpi_Test();
    // Unloads everything; nothing may be left behind, and nothing was done that may not be.
    ~Cmpi_Test() override;

    // Each object of the broker that the provider's side makes, it gives back.
    Told ask(const Question& question);
    // Runs this inside an operation of Test_Service, on the calling thread.
    void in_a_call(std::function<void()> body);
    const host::Class& known(const char* name) { return *core->classes.find(name); }

    CMPIInstanceMI* instance_mi(const char* name = "Test_Base");
    CMPIMethodMI* method_mi(const char* name = "Test_Service");
    CMPIAssociationMI* association_mi(const char* name = "Test_Link");
    template <class MI>
    static Provider_Static_Data& block(const MI* mi) {
        return *static_cast<Provider_Static_Data*>(mi->hdl);
    }

    static Value number(CMPIType type, std::uint64_t value) {
        return Value::unsigned_number(type, value);
    }
    static host::ObjectPath base(const char* id, unsigned slot,
                                 const char* name_space = "root/test") {
        return {name_space,
                "Test_Base",
                {{"Id", Value::text(id)}, {"Slot", number(CMPI_uint32, slot)}}};
    }
    static host::ObjectPath leaf(const char* name) {
        return {"root/test", "Test_Leaf", {{"Name", Value::text(name)}}};
    }

    std::map<std::string, int> failures; // functions of the broker by name; countdown, 0: each call
    std::vector<std::string> trace;      // "up-call enumerateInstances root/x:Test_Base"
    const std::shared_ptr<host::Core> core;
};

} // namespace cimple

#endif // TESTS_CIMPLE_CMPI_FIXTURE_H
