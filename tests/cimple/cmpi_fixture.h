// Three scripted providers over the test schema, and a fixture that drives their interfaces as an
// object manager would.
#ifndef TESTS_CIMPLE_CMPI_FIXTURE_H
#define TESTS_CIMPLE_CMPI_FIXTURE_H

#include "cimple/cmpi_adapter.h"
#include "cimple/provider_proc.h"
#include "tests/cimple/fake_broker.h"
#include "tests/cimple/test_schema.h"

#include <functional>
#include <gtest/gtest.h>
#include <map>
#include <string>
#include <vector>

namespace cimple {

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

extern const Registration base_registration;       // Test_Base, instance_proc
extern const Registration link_registration;       // Test_Link, association_proc
extern const Registration service_registration;    // Test_Service, method_proc
extern const Registration indication_registration; // Test_Base with operations 11 and 12

class Cmpi_Test : public testing::Test {
protected:
    Cmpi_Test() { script = {}; }
    // Unloads everything; nothing may be left behind and no parameter given back.
    ~Cmpi_Test() override;

    template <class Interface>
    Interface* interface(const Registration& registration, char letter, const char* name = "Test") {
        return static_cast<Interface*>(interface_any(registration, letter, name));
    }
    CMPIInstanceMI* instance_mi() { return interface<CMPIInstanceMI>(base_registration, 'I'); }
    CMPIAssociationMI* association_mi(const Registration& registration = link_registration) {
        return interface<CMPIAssociationMI>(registration, 'A');
    }
    CMPIMethodMI* method_mi() { return interface<CMPIMethodMI>(service_registration, 'M'); }

    CMPIObjectPath* base_path(const char* id = nullptr, unsigned slot = 0);
    fake::Data_Ref base_data(const char* id, unsigned slot);

    fake::Broker broker;
    CMPIContext* context = broker.context();
    CMPIResult* result = broker.result();
    std::map<const Registration*, Provider_Static_Data> blocks;

private:
    void* interface_any(const Registration& registration, char letter, const char* name);
};

} // namespace cimple

#endif // TESTS_CIMPLE_CMPI_FIXTURE_H
