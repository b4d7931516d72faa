#include "tests/cimple/test_schema.h"

#include <iterator>

#pragma GCC diagnostic ignored "-Winvalid-offsetof"

namespace cimple {

namespace {

constexpr uint32 KEY = FLAG_KEY;

// ---- Values ----

constexpr const char* ABSTRACT_TEXT = "for tests";
constexpr Meta_Value FIVE{.uint16_value = 5};
constexpr Meta_Value VERSION{.string_value = "1.0"};
constexpr Meta_Value INTERVAL{.string_value = "00000001020304.000005:000"};
constexpr uint32 NUMBERS[] = {1, 2};
constexpr const char* NAMES[] = {"a", "b"};
constexpr Meta_Value NUMBERS_VALUE{.array_value = {NUMBERS, 2}};
constexpr Meta_Value NAMES_VALUE{.array_value = {NAMES, 2}};
constexpr Meta_Value TEXT_VALUE{.string_value = ABSTRACT_TEXT};

const Meta_Qualifier version{{0}, "Version", TYPE_STRING, 0, &VERSION};
const Meta_Qualifier abstract{{0}, "Abstract", TYPE_BOOLEAN, 0, nullptr};
const Meta_Qualifier description{{0}, "Description", TYPE_STRING, 0, &TEXT_VALUE};
const Meta_Qualifier values{{0}, "Values", TYPE_STRING, 1, &NAMES_VALUE};
const Meta_Qualifier* const root_qualifiers[] = {&abstract, &version};
const Meta_Qualifier* const state_qualifiers[] = {&values};
const Meta_Qualifier* const level_qualifiers[] = {&description};

// Inside a class's rows, T is the structure.
#define PROPERTY(member, type, flags)                                                              \
    {                                                                                              \
        {{0}, FLAG_PROPERTY | FLAG_READ | (flags), #member, nullptr, 0}, type, 0,                  \
            offsetof(T, member), nullptr                                                           \
    }
#define PROPERTY_WITH(member, type, subscript, value)                                              \
    {                                                                                              \
        {{0}, FLAG_PROPERTY | FLAG_READ, #member, nullptr, 0}, type, subscript,                    \
            offsetof(T, member), value                                                             \
    }
#define REFERENCE(member, subscript, target, flags)                                                \
    {                                                                                              \
        {{0}, FLAG_REFERENCE | (flags), #member, nullptr, 0}, subscript,                           \
            &target::static_meta_class, offsetof(T, member)                                        \
    }

#define CLASS(name, flags, qualifiers, num_qualifiers, features, locals, super, keys)              \
    constinit const Meta_Class name::static_meta_class{                                            \
        {{{0}, flags, #name, qualifiers, num_qualifiers},                                          \
         features,                                                                                 \
         std::size(features),                                                                      \
         sizeof(name)},                                                                            \
        locals,                                                                                    \
        super,                                                                                     \
        keys,                                                                                      \
        &test_repository};

namespace base {
using T = Test_Base;
const Meta_Property id PROPERTY(Id, TYPE_STRING, KEY);
const Meta_Property slot PROPERTY(Slot, TYPE_UINT32, KEY);
const Meta_Property caption PROPERTY(Caption, TYPE_STRING, 0);
const Meta_Feature* const features[] = {&id, &slot, &caption};
constexpr uint8 locals[] = {1, 1, 1};
} // namespace base

namespace sub {
using T = Test_Sub;
const Meta_Property state{
    {{0}, FLAG_PROPERTY, "State", state_qualifiers, 1}, TYPE_UINT16, 0, offsetof(T, State), &FIVE};
const Meta_Feature* const features[] = {&base::id, &base::slot, &base::caption, &state};
constexpr uint8 locals[] = {0, 0, 0, 1};
} // namespace sub

namespace stranger {
using T = Test_Stranger;
const Meta_Property slot PROPERTY(SLOT, TYPE_UINT32, KEY);
const Meta_Property id PROPERTY(ID, TYPE_STRING, KEY);
const Meta_Feature* const features[] = {&slot, &id};
constexpr uint8 locals[] = {1, 1};
} // namespace stranger

namespace root {
using T = Test_Root;
const Meta_Property caption PROPERTY(Caption, TYPE_STRING, 0);
const Meta_Feature* const features[] = {&caption};
constexpr uint8 locals[] = {1};
} // namespace root

namespace leaf {
using T = Test_Leaf;
const Meta_Property name PROPERTY(Name, TYPE_STRING, KEY);
const Meta_Feature* const features[] = {&root::caption, &name};
constexpr uint8 locals[] = {0, 1};
} // namespace leaf

namespace types {
using T = Test_Types;
const Meta_Property scalars[] = {
    PROPERTY(B, TYPE_BOOLEAN, KEY),  PROPERTY(U8, TYPE_UINT8, KEY),
    PROPERTY(S8, TYPE_SINT8, KEY),   PROPERTY(U16, TYPE_UINT16, KEY),
    PROPERTY(S16, TYPE_SINT16, KEY), PROPERTY(U32, TYPE_UINT32, KEY),
    PROPERTY(S32, TYPE_SINT32, KEY), PROPERTY(U64, TYPE_UINT64, KEY),
    PROPERTY(S64, TYPE_SINT64, KEY), PROPERTY(R32, TYPE_REAL32, KEY),
    PROPERTY(R64, TYPE_REAL64, KEY), PROPERTY(C16, TYPE_CHAR16, KEY),
    PROPERTY(Str, TYPE_STRING, KEY), PROPERTY(Date, TYPE_DATETIME, KEY),
};
const Meta_Property numbers PROPERTY_WITH(Numbers, TYPE_UINT32, -1, &NUMBERS_VALUE);
const Meta_Property names PROPERTY_WITH(Names, TYPE_STRING, 2, &NAMES_VALUE);
const Meta_Property dates PROPERTY_WITH(Dates, TYPE_DATETIME, -1, nullptr);
const Meta_Property installed PROPERTY_WITH(Installed, TYPE_DATETIME, 0, &INTERVAL);
const Meta_Feature* const features[] = {
    &scalars[0],  &scalars[1],  &scalars[2], &scalars[3], &scalars[4],  &scalars[5],
    &scalars[6],  &scalars[7],  &scalars[8], &scalars[9], &scalars[10], &scalars[11],
    &scalars[12], &scalars[13], &numbers,    &names,      &dates,       &installed};
constexpr uint8 locals[] = {1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1};
} // namespace types

namespace link {
using T = Test_Link;
const Meta_Reference left REFERENCE(Left, 0, Test_Root, KEY);
const Meta_Reference right REFERENCE(Right, 0, Test_Base, KEY);
const Meta_Property weight PROPERTY(Weight, TYPE_UINT32, 0);
const Meta_Feature* const features[] = {&left, &right, &weight};
constexpr uint8 locals[] = {1, 1, 1};
} // namespace link

namespace chain {
using T = Test_Chain;
const Meta_Reference link_ref REFERENCE(Link, 0, Test_Link, KEY);
const Meta_Feature* const features[] = {&link_ref};
constexpr uint8 locals[] = {1};
} // namespace chain

namespace holder {
using T = Test_Holder;
const Meta_Property id PROPERTY(Id, TYPE_STRING, KEY);
const Meta_Reference object REFERENCE(Object, 0, Test_Base, FLAG_EMBEDDED_OBJECT);
const Meta_Reference objects REFERENCE(Objects, -1, Test_Base, FLAG_EMBEDDED_INSTANCE);
const Meta_Property count PROPERTY(Count, TYPE_UINT32, 0);
const Meta_Feature* const features[] = {&id, &object, &objects, &count};
constexpr uint8 locals[] = {1, 1, 1, 1};
} // namespace holder

namespace crowd {
using T = Test_Crowd;
const Meta_Reference head REFERENCE(Head, 0, Test_Base, KEY);
const Meta_Reference tail REFERENCE(Tail, 0, Test_Base, KEY);
const Meta_Reference others REFERENCE(Others, -1, Test_Base, 0);
const Meta_Feature* const features[] = {&head, &tail, &others};
constexpr uint8 locals[] = {1, 1, 1};
} // namespace crowd

namespace run_method {
using T = Test_Service_Run_method;
const Meta_Property level{{{0}, FLAG_PROPERTY | FLAG_IN, "Level", level_qualifiers, 1},
                          TYPE_UINT32,
                          0,
                          offsetof(T, Level),
                          nullptr};
const Meta_Reference target REFERENCE(Target, 0, Test_Base, FLAG_IN);
const Meta_Property answer{{{0}, FLAG_PROPERTY | FLAG_OUT, "Answer", nullptr, 0},
                           TYPE_STRING,
                           0,
                           offsetof(T, Answer),
                           nullptr};
const Meta_Property return_value{{{0}, FLAG_PROPERTY | FLAG_OUT, "return_value", nullptr, 0},
                                 TYPE_UINT32,
                                 0,
                                 offsetof(T, return_value),
                                 nullptr};
const Meta_Feature* const features[] = {&level, &target, &answer, &return_value};
} // namespace run_method

namespace service {
using T = Test_Service;
const Meta_Property name PROPERTY(Name, TYPE_STRING, KEY);
const Meta_Feature* const features[] = {&name, &Test_Service_Run_method::static_meta_class};
constexpr uint8 locals[] = {1, 1};
} // namespace service

const Meta_Class* const classes[] = {
    &Test_Base::static_meta_class,     &Test_Sub::static_meta_class,
    &Test_Stranger::static_meta_class, &Test_Root::static_meta_class,
    &Test_Leaf::static_meta_class,     &Test_Types::static_meta_class,
    &Test_Link::static_meta_class,     &Test_Chain::static_meta_class,
    &Test_Holder::static_meta_class,   &Test_Service::static_meta_class,
    &Test_Crowd::static_meta_class,
};

} // namespace

const Meta_Repository test_repository{classes, std::size(classes)};

CLASS(Test_Base, FLAG_CLASS, nullptr, 0, base::features, base::locals, nullptr, 2)
CLASS(Test_Sub, FLAG_CLASS, nullptr, 0, sub::features, sub::locals, &Test_Base::static_meta_class,
      2)
CLASS(Test_Stranger, FLAG_CLASS, nullptr, 0, stranger::features, stranger::locals, nullptr, 2)
CLASS(Test_Root, FLAG_CLASS | FLAG_ABSTRACT, root_qualifiers, 2, root::features, root::locals,
      nullptr, 0)
CLASS(Test_Leaf, FLAG_CLASS, nullptr, 0, leaf::features, leaf::locals,
      &Test_Root::static_meta_class, 1)
CLASS(Test_Types, FLAG_CLASS, nullptr, 0, types::features, types::locals, nullptr, 14)
CLASS(Test_Link, FLAG_ASSOCIATION, nullptr, 0, link::features, link::locals, nullptr, 2)
CLASS(Test_Chain, FLAG_ASSOCIATION, nullptr, 0, chain::features, chain::locals, nullptr, 1)
CLASS(Test_Holder, FLAG_CLASS, nullptr, 0, holder::features, holder::locals, nullptr, 1)
CLASS(Test_Crowd, FLAG_ASSOCIATION, nullptr, 0, crowd::features, crowd::locals, nullptr, 2)
CLASS(Test_Service, FLAG_CLASS, nullptr, 0, service::features, service::locals, nullptr, 1)

constinit const Meta_Method Test_Service_Run_method::static_meta_class{
    {{{0}, FLAG_METHOD, "Run", nullptr, 0},
     run_method::features,
     std::size(run_method::features),
     sizeof(Test_Service_Run_method)},
    TYPE_UINT32};

Test_Base* make_base(const char* id, uint32 slot) {
    Ref<Test_Base> base(create_null<Test_Base>());
    base->Id.set(id);
    base->Slot.set(slot);
    return base.release();
}

} // namespace cimple
