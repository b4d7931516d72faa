// A small schema for the engine's tests, in the form of the generated tables: a keyed base class
// with a subclass, all types and arrays, an association, embedded objects, and a class with a
// method.
#ifndef TESTS_CIMPLE_TEST_SCHEMA_H
#define TESTS_CIMPLE_TEST_SCHEMA_H

#include "cimple/instance.h"

namespace cimple {

struct Test_Base : Instance {
    Property<String> Id;   // key
    Property<uint32> Slot; // key
    Property<String> Caption;
    static const Meta_Class static_meta_class;
};

struct Test_Sub : Test_Base {
    Property<uint16> State; // default 5
    static const Meta_Class static_meta_class;
};

// Other names' case and another order of the same keys, and no relation to Test_Base.
struct Test_Stranger : Instance {
    Property<uint32> SLOT; // key
    Property<String> ID;   // key
    static const Meta_Class static_meta_class;
};

// Abstract, without keys.
struct Test_Root : Instance {
    Property<String> Caption;
    static const Meta_Class static_meta_class;
};

struct Test_Leaf : Test_Root {
    Property<String> Name; // key
    static const Meta_Class static_meta_class;
};

// Every scalar but the last is a key.
struct Test_Types : Instance {
    Property<boolean> B;
    Property<uint8> U8;
    Property<sint8> S8;
    Property<uint16> U16;
    Property<sint16> S16;
    Property<uint32> U32;
    Property<sint32> S32;
    Property<uint64> U64;
    Property<sint64> S64;
    Property<real32> R32;
    Property<real64> R64;
    Property<char16> C16;
    Property<String> Str;
    Property<Datetime> Date;
    Property<Array<uint32>> Numbers; // default {1, 2}
    Property<Array<String>> Names;   // default {"a", "b"}
    Property<Array<Datetime>> Dates;
    Property<Datetime> Installed; // default an interval
    static const Meta_Class static_meta_class;
};

// Left and Right are keys.
struct Test_Link : Instance {
    Instance* Left; // Test_Root or below
    Test_Base* Right;
    Property<uint32> Weight;
    static const Meta_Class static_meta_class;
};

// A link to links: its path quotes paths within paths.
struct Test_Chain : Instance {
    Test_Link* Link; // key
    static const Meta_Class static_meta_class;
};

struct Test_Holder : Instance {
    Property<String> Id; // key
    Test_Base* Object;   // embedded
    Property<Array<Test_Base*>> Objects;
    Property<uint32> Count;
    static const Meta_Class static_meta_class;
};

// A link with references besides its ends: many in an array.
struct Test_Crowd : Instance {
    Test_Base* Head; // key
    Test_Base* Tail; // key
    Property<Array<Test_Base*>> Others;
    static const Meta_Class static_meta_class;
};

struct Test_Service_Run_method : Instance {
    Property<uint32> Level;
    Test_Base* Target;
    Property<String> Answer;
    Property<uint32> return_value;
    static const Meta_Method static_meta_class;
};

struct Test_Service : Instance {
    Property<String> Name; // key
    static const Meta_Class static_meta_class;
};

extern const Meta_Repository test_repository;

// A Test_Base with its keys set and the rest null.
Test_Base* make_base(const char* id, uint32 slot);

} // namespace cimple

#endif // TESTS_CIMPLE_TEST_SCHEMA_H
