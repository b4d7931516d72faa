// Conversion between CMPI data and instances, both ways, driven by the meta classes.
//
// Members are written straight from the instance to the broker and back: there is no value in
// between. A member that cannot be converted is left out with a warning in the engine's log; it
// never fails the rest. Functions that answer an int answer CMPI_RC_OK or CMPI_RC_ERR_FAILED.
// Nothing here locks; all may throw std::bad_alloc.
#ifndef CIMPLE_CONVERSION_H
#define CIMPLE_CONVERSION_H

#include "cimple/instance.h"
#include "cmpi/cmpi.h"

namespace cimple {

// What every conversion needs to know.
struct Converter {
    const CMPIBroker* broker;
    const Meta_Repository* repository; // where classes of references are looked up
    String name_space;                 // of what is converted; "" for none
};

// ---- Types: one table, conversion_to_cmpi.cpp ----

// CMPI's code of a scalar type; 0 for one that has none.
CMPIType to_cmpi_type(uint32 type);
// The engine's code of a CMPI type, arrays included; TYPE_NONE for one it does not know.
sint32 from_cmpi_type(CMPIType type);
// "UINT8", "STRING_ARRAY", "NONE".
const char* type_word(sint32 type);

// ---- From CMPI. What the carrier does not give is null, and so is all of a null carrier. ----

// An instance of the class with the keys of the path.
Ref<Instance> make_cimple_reference(const Converter& converter, const Meta_Class* meta_class,
                                    const CMPIObjectPath* path);
// The same for a path of a class that the repository does not have, which is some platform's. Its
// instances are known by their keys: it is taken as derived from the base, in a class made at run
// time. Null unless the path has the keys of the base.
Ref<Instance> make_foreign_reference(const Converter& converter, const Meta_Class* base,
                                     const CMPIObjectPath* path);
Ref<Instance> make_cimple_instance(const Converter& converter, const Meta_Class* meta_class,
                                   const CMPIInstance* instance);
// A method instance with its In parameters.
Ref<Instance> make_method_instance(const Converter& converter, const Meta_Method* method,
                                   const CMPIArgs* args);
// Reads the Out parameters of a method that was called, and its return value, into the instance.
int read_method_out(const Converter& converter, const CMPIArgs* args, const CMPIData& return_value,
                    Instance* method);

// Instances that were passed on keep their own namespace.
inline const char* own_name_space(const Instance* instance, const char* otherwise) {
    return instance->__name_space.empty() ? otherwise : instance->__name_space.c_str();
}

// ---- To CMPI; the objects are the broker's, out is null on failure ----

// The object paths of what a call's associations refer to, each made once for all that share the
// end: the last few are kept, and given back at the end of the scope. Of one call and one
// namespace.
class End_Paths {
public:
    End_Paths() = default;
    ~End_Paths();
    End_Paths(const End_Paths&) = delete;
    End_Paths& operator=(const End_Paths&) = delete;

    CMPIObjectPath* find(const Instance* end) const noexcept;      // null: to be made
    void keep(const Instance* end, CMPIObjectPath* path) noexcept; // takes over the path

private:
    // A result has two or three ends; one of them is often that of the results before.
    static constexpr std::size_t KEPT = 4;
    struct Entry {
        Ref<const Instance> end; // held, so that no other instance gets its address
        CMPIObjectPath* path = nullptr;
    };
    Entry _entries[KEPT];
    std::size_t _oldest = 0;
};

int make_cmpi_object_path(const CMPIBroker* broker, const Instance* instance,
                          const char* name_space, CMPIObjectPath*& out, End_Paths* ends = nullptr);
// With a list only the properties it names, and the keys, are converted.
int make_CMPI_instance(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                       CMPIObjectPath* path, const char** properties, CMPIInstance*& out,
                       End_Paths* ends = nullptr);
// Fills args with the parameters of a method instance that have the flag (In or Out).
int make_method_args(const CMPIBroker* broker, const char* name_space, const Instance* method,
                     uint32 flag, CMPIArgs* args);
// Out parameters go to args; the return value to out_value. out_type 0: the method returned null.
int make_method_out(const CMPIBroker* broker, const char* name_space, const Instance* method,
                    CMPIArgs* args, CMPIValue& out_value, CMPIType& out_type);

} // namespace cimple

#endif // CIMPLE_CONVERSION_H
