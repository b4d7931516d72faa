// A small object manager for the tests of the binding: objects in memory that are counted, calls
// that are recorded, and functions that fail on demand. It checks nothing about classes.
#ifndef TESTS_CIMPLE_FAKE_BROKER_H
#define TESTS_CIMPLE_FAKE_BROKER_H

#include "cmpi/cmpi.h"

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace fake {

struct Data;
using Data_Ref = std::shared_ptr<Data>;

// A value as it lies in a container: an object is shared, not copied.
struct Value {
    CMPIType type = CMPI_null;
    CMPIValueState state = CMPI_goodValue;
    CMPIValue scalar{};
    Data_Ref object;
};

// What an object of any kind holds.
struct Data {
    std::string text;       // of a string or datetime; class name of a path
    std::string name_space; // of a path
    std::vector<std::pair<std::string, Value>> members; // properties, keys or arguments
    std::vector<Value> elements;                        // of an array or enumeration
    Data_Ref path;                                      // of an instance
    std::optional<std::vector<std::string>> filter;     // of an instance: property list and keys

    const Value* find(const std::string& name) const;
    std::string string(const std::string& name) const; // text of a string member
};

// Text, number and object values for the containers.
Value text(const char* chars);
Value number(CMPIType type, unsigned long long value);
Value object(CMPIType type, Data_Ref data);
Value null(CMPIType type);
Value array(CMPIType element_type, std::vector<Value> elements);

using Members = std::vector<std::pair<std::string, Value>>;
Data_Ref path_data(const char* name_space, const char* class_name, Members keys = {});
Data_Ref instance_data(Data_Ref path, Members properties);

class Broker {
public:
    Broker();
    ~Broker();
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    CMPIBroker broker; // what the engine is given

    // Handles on data for calls; they are parameters, which the engine must not release.
    CMPIObjectPath* path(const Data_Ref& data);
    CMPIObjectPath* path(const char* name_space, const char* class_name, Members keys = {});
    CMPIInstance* instance(const Data_Ref& data);
    CMPIArgs* args(Members members = {});
    CMPIContext* context();
    CMPIResult* result();

    static const Data& data(const void* handle);

    // Objects that the engine caused and has not released, and the end of a call, which frees them.
    int live() const { return _live; }
    int released_parameters = 0; // faults of the engine
    void end_call();

    // Script: the named table functions fail; all calls, or the n-th from now.
    std::map<std::string, int> failures; // name to countdown, 0: every call
    std::vector<Data_Ref> upcall_instances;
    std::vector<std::string> upcalls; // "getInstance ns:Class"
    CMPIrc upcall_status = CMPI_RC_OK;
    Members method_outputs;
    Value method_result;

    // What came back.
    std::vector<Data_Ref> returned_paths;
    std::vector<Data_Ref> returned_instances;
    std::vector<Value> returned_data;
    std::vector<std::pair<std::string, Data_Ref>> indications; // namespace, instance
    int done = 0;
    void clear_results();

    // For the table functions.
    bool fails(const char* function);
    struct Handle;
    Handle* make(const void* table, Data_Ref data, bool parameter = false);
    void free(Handle* handle);
    void keep(Handle* handle); // an array takes its element over

private:
    int _live = 0;
    std::vector<std::unique_ptr<Handle>> _handles;
};

} // namespace fake

#endif // TESTS_CIMPLE_FAKE_BROKER_H
