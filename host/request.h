// One call into a provider, with the CMPI objects that it is made with.
//
// The objects belong to the call: they end with the request, and a provider must not release them.
#ifndef HOST_REQUEST_H
#define HOST_REQUEST_H

#include "host/core.h"

namespace host {

class Request {
public:
    Request(Core& core, const Class& known, const char* operation, const std::string& name_space);

    CMPIContext* context() const { return _context; }
    CMPIObjectPath* path(ObjectPath path);
    CMPIInstance* instance(const Instance& instance);
    CMPIArgs* args(Named_Values values, const Method* outputs_of = nullptr);
    CMPIResult* result(Answer answer, const Class* of_class, const Slot_Type* data_type = nullptr);
    // A null-terminated list for the provider, null for no restriction; lives as long as the
    // request.
    const char** property_list(const Property_List& properties);

    // The provider's status with its text.
    Status finish(CMPIStatus status);
    // What it answered.
    ResultBody& answered() { return *_result; }
    const ArgsBody& outputs() const { return *_outputs; }

private:
    Call _call;
    std::string _name_space;
    CMPIContext* _context = nullptr;
    ResultBody* _result = nullptr;
    const ArgsBody* _outputs = nullptr;
    std::vector<const char*> _names;
};

} // namespace host

#endif // HOST_REQUEST_H
