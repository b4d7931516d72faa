// What the two test providers share: shorthands over the CMPI tables, and their broker.
#ifndef TESTS_HOST_PROVIDER_KIT_H
#define TESTS_HOST_PROVIDER_KIT_H

#include "cmpi/cmpi.h"

#include <string>

namespace kit {

inline constexpr CMPIStatus OK = {CMPI_RC_OK, nullptr};

inline std::string text(const CMPIString* string) {
    const char* chars = string ? string->ft->getCharPtr(string, nullptr) : nullptr;
    return chars ? chars : "";
}

inline CMPIObjectPath* new_path(const CMPIBroker* broker, const std::string& name_space,
                                const char* class_name) {
    return broker->eft->newObjectPath(broker, name_space.c_str(), class_name, nullptr);
}

inline CMPIObjectPath* new_path(const CMPIBroker* broker, const std::string& name_space,
                                const char* class_name, const std::string& name) {
    CMPIObjectPath* path = new_path(broker, name_space, class_name);
    path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>(name.c_str()), CMPI_chars);
    return path;
}

inline std::string name_space_of(const CMPIObjectPath* path) {
    return text(path->ft->getNameSpace(path, nullptr));
}

inline std::string argument(const CMPIArgs* in, const char* name) {
    const CMPIData data = in->ft->getArg(in, name, nullptr);
    return data.type == CMPI_string && data.state == CMPI_goodValue ? text(data.value.string) : "";
}

inline CMPIStatus answer_number(const CMPIResult* result, CMPIUint32 number) {
    CMPIValue value;
    value.uint32 = number;
    result->ft->returnData(result, &value, CMPI_uint32);
    return result->ft->returnDone(result);
}

} // namespace kit

#define KIT_EXPORT extern "C" __attribute__((visibility("default")))

#endif // TESTS_HOST_PROVIDER_KIT_H
