// How a class is bound to its provider: the registration record, the numbered provider procedure,
// the enumeration handler and the status numbers that providers answer.
#ifndef CIMPLE_REGISTRATION_H
#define CIMPLE_REGISTRATION_H

#include "cimple/instance.h"

namespace cimple {

struct Registration;

// An argument of a provider procedure: a pointer or a small number, 4 bytes on i386.
using Provider_Word = std::uintptr_t;

// The one entry of a class provider: a numbered operation and its words, unused ones 0. Answers the
// provider's status, -1 for an operation that the class does not have.
using Provider_Proc = sint32 (*)(const Registration* registration, int operation,
                                 Provider_Word arg0, Provider_Word arg1, Provider_Word arg2,
                                 Provider_Word arg3, Provider_Word arg4, Provider_Word arg5,
                                 Provider_Word arg6, Provider_Word arg7);

struct Registration {
    const char* module_name;
    const char* provider_name;
    Provider_Proc proc;
    const Meta_Class* meta_class;
    const Registration* next; // the previously built record
};

// Operation numbers with their arguments (arg0 is the provider object unless said otherwise).
enum Provider_Operation : int {
    OP_GET_META_CLASS = 0,       // arg0: const Meta_Class** out
    OP_CREATE_PROVIDER = 1,      // arg0: void** out
    OP_DESTROY_PROVIDER = 2,     //
    OP_LOAD = 3,                 //
    OP_UNLOAD = 4,               //
    OP_GET_INSTANCE = 5,         // keys Instance*, Instance** out (caller owns)
    OP_ENUM_INSTANCES = 6,       // model Instance*, Instance_Proc, client data, and, or 0,
                                 // const Enumeration_Focus*
    OP_CREATE_INSTANCE = 7,      // Instance*
    OP_DELETE_INSTANCE = 8,      // Instance*
    OP_MODIFY_INSTANCE = 9,      // model Instance*, Instance*
    OP_INVOKE_METHOD = 10,       // Instance*, method Instance*
    OP_ENABLE_INDICATIONS = 11,  // Indication_Proc, client data
    OP_DISABLE_INDICATIONS = 12, //
    OP_GET_REPOSITORY = 13,      // arg0: const Meta_Repository** out
    // Instance*, result class, role, result role (const char*), Instance_Proc, client data
    OP_ENUM_ASSOCIATOR_NAMES = 14,
    OP_ENUM_REFERENCES = 15,  // Instance*, model Instance*, role, Instance_Proc, client data
    OP_ENUM_ASSOCIATORS = 16, // as 14
};

// Receives one instance and owns a count of it, or null with the provider's status at the end of
// the stream. Others may share the instance. Answers whether more is wanted.
using Instance_Proc = bool (*)(const Instance* instance, sint32 status, void* client_data);
using Indication_Proc = bool (*)(Instance* indication, void* client_data);

// What the receiver of an enumeration is after: it ignores every other instance. A provider that
// can tell them at less cost may leave those out, and nothing else: what it delivers stays in its
// order. Most providers take no notice.
struct Enumeration_Focus {
    enum Kind : uint8 {
        KEYS,          // the first instance for which key_eq(this one, it) holds
        REFERENCES_TO, // associations for which is_reference_to(it, this one, "") holds
    };
    Kind kind;
    const Instance* instance;
};

// What a provider hands its instances to.
class Instance_Handler {
public:
    Instance_Handler(Instance_Proc proc, void* client_data,
                     const Enumeration_Focus* focus = nullptr) noexcept
        : _proc(proc), _client_data(client_data), _focus(focus) {}
    // Null: everything is wanted.
    const Enumeration_Focus* focus() const noexcept { return _focus; }
    // Takes over a count of the instance; false asks the provider to stop.
    bool handle(const Instance* instance) const { return _proc(instance, 0, _client_data); }

private:
    Instance_Proc _proc;
    void* _client_data;
    const Enumeration_Focus* _focus;
};
using Enum_Instances_Handler = Instance_Handler;
using Enum_Associator_Names_Handler = Instance_Handler;
using Enum_References_Handler = Instance_Handler;
using Enum_Associators_Handler = Instance_Handler;

// Status numbers of providers, one range per operation. Provider operations answer them as sint32:
// other numbers occur too, and the adapter has a rule for each.
enum Provider_Status : sint32 {
    PROVIDER_OK = 0,
    LOAD_FAILED = 30,

    GET_INSTANCE_OK = 0,
    GET_INSTANCE_NOT_FOUND = 60,
    GET_INSTANCE_UNSUPPORTED = 61,
    GET_INSTANCE_INVALID_PARAMETER = 62,
    GET_INSTANCE_ACCESS_DENIED = 63,
    GET_INSTANCE_FAILED = 64,

    ENUM_INSTANCES_OK = 0,
    ENUM_INSTANCES_FAILED = 70,
    ENUM_INSTANCES_ACCESS_DENIED = 71,

    CREATE_INSTANCE_OK = 0,
    CREATE_INSTANCE_DUPLICATE = 80,
    CREATE_INSTANCE_UNSUPPORTED = 81,
    CREATE_INSTANCE_INVALID_PARAMETER = 82,
    CREATE_INSTANCE_ACCESS_DENIED = 83,
    CREATE_INSTANCE_FAILED = 84,

    DELETE_INSTANCE_OK = 0,
    DELETE_INSTANCE_NOT_FOUND = 90,
    DELETE_INSTANCE_UNSUPPORTED = 91,
    DELETE_INSTANCE_ACCESS_DENIED = 92,
    DELETE_INSTANCE_FAILED = 93,

    MODIFY_INSTANCE_OK = 0,
    MODIFY_INSTANCE_NOT_FOUND = 100,
    MODIFY_INSTANCE_UNSUPPORTED = 101,
    MODIFY_INSTANCE_INVALID_PARAMETER = 102,
    MODIFY_INSTANCE_ACCESS_DENIED = 103,
    MODIFY_INSTANCE_FAILED = 104,

    ENUM_ASSOCIATOR_NAMES_OK = 0,
    ENUM_ASSOCIATOR_NAMES_FAILED = 110,
    ENUM_ASSOCIATOR_NAMES_UNSUPPORTED = 111,
    ENUM_ASSOCIATOR_NAMES_ACCESS_DENIED = 112,

    ENUM_REFERENCES_OK = 0,
    ENUM_REFERENCES_FAILED = 120,
    ENUM_REFERENCES_UNSUPPORTED = 121,
    ENUM_REFERENCES_ACCESS_DENIED = 122,

    INVOKE_METHOD_OK = 0,
    INVOKE_METHOD_FAILED = 130,
    INVOKE_METHOD_UNSUPPORTED = 131,
    INVOKE_METHOD_ACCESS_DENIED = 132,

    ENABLE_INDICATIONS_FAILED = 140,
    DISABLE_INDICATIONS_FAILED = 150,

    ENUM_ASSOCIATORS_OK = 0,
    ENUM_ASSOCIATORS_FAILED = 170,
    ENUM_ASSOCIATORS_UNSUPPORTED = 171,
    ENUM_ASSOCIATORS_ACCESS_DENIED = 172,
};

} // namespace cimple

// Head of the registration chain: the class of the catalogue built last.
extern "C" const cimple::Registration* cimple_module();

#endif // CIMPLE_REGISTRATION_H
