// Values between CMPI objects and instances, both ways.
#include "cimple/conversion.h"
#include "tests/cimple/fake_broker.h"
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>
#include <limits>

#pragma GCC diagnostic ignored "-Winvalid-offsetof"

namespace cimple {

namespace {

class Conversion_Test : public testing::Test {
protected:
    ~Conversion_Test() override { EXPECT_EQ(broker.released_parameters, 0); }

    template <class C>
    Ref<C> from_path(fake::Members keys, const char* name_space = "root/test") {
        return make_cimple_reference({&broker.broker, &test_repository, name_space},
                                     &C::static_meta_class,
                                     broker.path(name_space, C::static_meta_class.name, keys))
            .release();
    }
    template <class C>
    Ref<C> from_instance(fake::Members properties) {
        const auto path = fake::path_data("root/test", C::static_meta_class.name);
        return make_cimple_instance(converter, &C::static_meta_class,
                                    broker.instance(fake::instance_data(path, properties)))
            .release();
    }
    fake::Data_Ref to_instance(const Instance* instance, const char** properties = nullptr) {
        CMPIInstance* out = nullptr;
        const int rc =
            make_CMPI_instance(&broker.broker, instance, "root/test", nullptr, properties, out);
        if (rc != 0)
            return nullptr;
        auto data = std::make_shared<fake::Data>(fake::Broker::data(out));
        out->ft->release(out);
        EXPECT_EQ(broker.live(), 0) << "what was made on the way is given back";
        return data;
    }

    fake::Broker broker;
    const Converter converter = {&broker.broker, &test_repository, "root/test"};
};

// ---- Every type, alone and as an array, there and back ----

template <class T>
struct One : Instance {
    Property<T> Value;
    Property<Array<T>> Values;
};

template <class T>
struct One_Class {
    const Meta_Property value{{{0}, FLAG_PROPERTY, "Value", nullptr, 0},
                              Type_Of<T>::code,
                              0,
                              offsetof(One<T>, Value),
                              nullptr};
    const Meta_Property values{{{0}, FLAG_PROPERTY, "Values", nullptr, 0},
                               Type_Of<T>::code,
                               -1,
                               offsetof(One<T>, Values),
                               nullptr};
    const Meta_Feature* const features[2] = {&value, &values};
    const uint8 locals[2] = {1, 1};
    const Meta_Class meta_class{{{{0}, FLAG_CLASS, "One", nullptr, 0}, features, 2, sizeof(One<T>)},
                                locals,
                                nullptr,
                                0,
                                &test_repository};
};

template <class T>
std::vector<T> samples() {
    return {std::numeric_limits<T>::lowest(), T(), std::numeric_limits<T>::max()};
}
template <>
std::vector<String> samples() {
    return {"", "grün", "a longer text than fits the smallest block"};
}
template <>
std::vector<Datetime> samples() {
    Datetime interval, timestamp;
    interval.set("00000001020304.000005:000");
    timestamp.set("20261121042952.000007+060");
    return {Datetime(), interval, timestamp};
}

template <class T>
class Every_Type : public Conversion_Test {};

using All_Types = testing::Types<boolean, uint8, sint8, uint16, sint16, uint32, sint32, uint64,
                                 sint64, real32, real64, char16, String, Datetime>;
TYPED_TEST_SUITE(Every_Type, All_Types);

constexpr CMPIType CMPI_TYPES[] = {
    CMPI_boolean, CMPI_uint8,  CMPI_sint8,  CMPI_uint16, CMPI_sint16, CMPI_uint32, CMPI_sint32,
    CMPI_uint64,  CMPI_sint64, CMPI_real32, CMPI_real64, CMPI_char16, CMPI_string, CMPI_dateTime};

TYPED_TEST(Every_Type, GoesThereAndBack) {
    const One_Class<TypeParam> meta;
    const CMPIType expected = CMPI_TYPES[Type_Of<TypeParam>::code];
    for (const TypeParam& sample : samples<TypeParam>()) {
        const Ref<Instance> first(create(&meta.meta_class));
        auto* one = static_cast<One<TypeParam>*>(first.get());
        one->Value.set(sample);
        for (const TypeParam& item : samples<TypeParam>())
            one->Values.append(item);

        const fake::Data_Ref sent = this->to_instance(one);
        EXPECT_EQ(sent->find("Value")->type, expected);
        EXPECT_EQ(sent->find("Values")->type, expected | CMPI_ARRAY);

        const Ref<Instance> second =
            make_cimple_instance(this->converter, &meta.meta_class, this->broker.instance(sent));
        first->__name_space = "root/test";
        EXPECT_TRUE(identical(first.get(), second.get()));
    }
}

// ---- References and embedded objects ----

TEST_F(Conversion_Test, ReferencesGoAsPathsInTheirOwnNamespace) {
    const Ref<Test_Link> link(create_null<Test_Link>());
    auto* leaf = create_null<Test_Leaf>();
    leaf->Name.set("l");
    leaf->__name_space = "root/other";
    link->Left = leaf;
    link->Right = make_base("r", 7);

    const fake::Data_Ref sent = to_instance(link.get());
    ASSERT_EQ(sent->find("Left")->type, CMPI_ref);
    EXPECT_EQ(sent->find("Left")->object->name_space, "root/other");
    EXPECT_EQ(sent->find("Left")->object->text, "Test_Leaf");
    EXPECT_EQ(sent->find("Right")->object->name_space, "root/test");
    EXPECT_EQ(sent->find("Right")->object->find("Slot")->scalar.uint32, 7u);
    EXPECT_EQ(sent->path->find("Left")->type, CMPI_ref) << "key references are keys of the path";

    const auto back = from_instance<Test_Link>(sent->members);
    EXPECT_TRUE(key_eq(back.get(), link.get()));
    EXPECT_EQ(back->Left->__name_space, "root/other");
    EXPECT_EQ(back->Right->__name_space, "root/test");
}

TEST_F(Conversion_Test, EmbeddedObjectsGoWhole) {
    const Ref<Test_Holder> holder(create_null<Test_Holder>());
    holder->Object = make_base("o", 1);
    holder->Object->Caption.set("not a key");
    holder->Objects.append(make_base("a", 2));
    holder->Objects.append(make_base("b", 3));

    const fake::Data_Ref sent = to_instance(holder.get());
    EXPECT_EQ(sent->find("Object")->type, CMPI_instance);
    EXPECT_EQ(sent->find("Object")->object->string("Caption"), "not a key");
    EXPECT_EQ(sent->find("Objects")->type, CMPI_instanceA);

    // A list saves the conversion of what it does not name.
    const char* names[] = {"Count", nullptr};
    broker.failures = {{"newInstance", 9}};
    EXPECT_TRUE(to_instance(holder.get(), names));
    EXPECT_EQ(broker.failures["newInstance"], 8) << "asked for the instance alone";
    broker.failures.clear();

    fake::Members members = sent->members;
    for (auto& [name, value] : members)
        if (name == "Objects")
            value.object->elements.push_back(fake::null(CMPI_instance));
    const auto back = from_instance<Test_Holder>(members);
    EXPECT_STREQ(back->Object->Caption.value.c_str(), "not a key");
    ASSERT_EQ(back->Objects.value.size(), 3u);
    EXPECT_EQ(back->Objects.value[1]->Slot.value, 3u);
    EXPECT_EQ(back->Objects.value[2], nullptr) << "a null element is kept as a null pointer";
}

TEST_F(Conversion_Test, ReferenceToAnotherClassIsRefused) {
    const auto link = from_instance<Test_Link>(
        {{"Left", fake::object(CMPI_ref, fake::path_data("", "Test_Base"))},
         {"Right", fake::object(CMPI_ref, fake::path_data("", "Unknown_Class"))},
         {"Weight", fake::number(CMPI_uint32, 3)}});
    EXPECT_EQ(link->Left, nullptr);
    EXPECT_EQ(link->Right, nullptr);
    EXPECT_EQ(link->Weight.value, 3u);
}

// A platform's subclass of the class that is expected, by its keys; with fewer it is nothing.
TEST_F(Conversion_Test, ReferenceToAnUnknownClassIsKnownByItsKeys) {
    fake::Data_Ref foreign = fake::path_data(
        "root/far", "Foreign", {{"Slot", fake::number(CMPI_uint64, 7)}, {"Id", fake::text("f")}});
    const auto read = [&] {
        return from_instance<Test_Link>({{"Right", fake::object(CMPI_ref, foreign)}});
    };
    const auto link = read();
    ASSERT_NE(link->Right, nullptr);
    EXPECT_STREQ(link->Right->__meta_class->name, "Foreign");
    EXPECT_STREQ(link->Right->__name_space.c_str(), "root/far");
    const Ref<Instance> same(make_base("f", 7));
    EXPECT_TRUE(key_eq(link->Right, same.get()));
    foreign->members.pop_back();
    EXPECT_EQ(read()->Right, nullptr);
    foreign->members.emplace_back("Other", fake::text("f"));
    EXPECT_EQ(read()->Right, nullptr);
}

// ---- From CMPI ----

TEST_F(Conversion_Test, KeysAreNarrowedByTruncation) {
    const auto types = from_path<Test_Types>({
        {"U8", fake::number(CMPI_uint64, 5)},
        {"S8", fake::number(CMPI_uint64, 300)},
        {"U16", fake::number(CMPI_uint64, 0x12345)},
        {"S32", fake::number(CMPI_uint64, 0xFFFFFFFF)},
        {"S64", fake::number(CMPI_uint64, ~0ull)},
        {"U32", fake::number(CMPI_sint64, 0x100000002)},
        {"S16", fake::number(CMPI_sint64, 4)},
    });
    EXPECT_EQ(types->U8.value, 5);
    EXPECT_EQ(types->S8.value, 44);
    EXPECT_EQ(types->U16.value, 0x2345);
    EXPECT_EQ(types->S32.value, -1);
    EXPECT_EQ(types->S64.value, -1);
    EXPECT_EQ(types->U32.value, 2u);
    EXPECT_TRUE(types->S16.is_null()) << "signed keys are narrowed to uint32 only";

    const auto base = from_instance<Test_Base>({{"Slot", fake::number(CMPI_uint64, 5)}});
    EXPECT_TRUE(base->Slot.is_null()) << "properties are not narrowed";
}

TEST_F(Conversion_Test, ABadMemberFailsAlone) {
    const auto null_string = fake::object(CMPI_string, nullptr);
    const auto types = from_instance<Test_Types>({
        {"Unknown", fake::number(CMPI_uint8, 1)},
        {"U8", fake::text("not a number")},
        {"U16", fake::number(CMPI_uint32, 1)},
        {"B", fake::number(CMPI_boolean, 2)},
        {"Str", null_string},
        {"Date", fake::object(CMPI_dateTime, fake::path_data("", "20261121"))},
        {"Installed", fake::object(CMPI_dateTime, nullptr)},
        {"Numbers",
         fake::array(CMPI_uint32, {fake::number(CMPI_uint32, 1), fake::null(CMPI_uint32)})},
        {"Names", fake::array(CMPI_string, {fake::number(CMPI_uint32, 1)})},
        {"Dates", fake::object(CMPI_dateTimeA, nullptr)},
        {"S8", {CMPI_sint8, CMPI_badValue, {}, nullptr}},
        {"U64", fake::number(CMPI_uint64, 9)},
    });
    EXPECT_EQ(types->U64.value, 9u) << "the last one, behind all the bad ones";
    EXPECT_FALSE(types->Str.is_null()) << "a null string handle is an empty text";
    EXPECT_TRUE(types->Str.value.empty());
    EXPECT_TRUE(types->B.value) << "any non-zero byte is true";
    EXPECT_TRUE(types->U8.is_null() && types->U16.is_null() && types->S8.is_null());
    EXPECT_TRUE(types->Date.is_null() && types->Installed.is_null());
    EXPECT_TRUE(types->Numbers.is_null() && types->Names.is_null() && types->Dates.is_null());
}

// ---- Arguments ----

// The In parameter of type T that a text argument arrives as.
template <class T>
Property<T> parse_argument(fake::Broker& broker, const char* text) {
    const Meta_Property value{{{0}, FLAG_PROPERTY | FLAG_IN, "Value", nullptr, 0},
                              Type_Of<T>::code,
                              0,
                              offsetof(One<T>, Value),
                              nullptr};
    const Meta_Feature* const features[] = {&value};
    const Meta_Method method{{{{0}, FLAG_METHOD, "Do", nullptr, 0}, features, 1, sizeof(One<T>)},
                             TYPE_UINT32};
    const Ref<Instance> made = make_method_instance({&broker.broker, &test_repository, ""}, &method,
                                                    broker.args({{"Value", fake::text(text)}}));
    return static_cast<One<T>*>(made.get())->Value;
}

template <class T>
void expect_cast(fake::Broker& broker, const char* text, T expected) {
    const Property<T> parsed = parse_argument<T>(broker, text);
    EXPECT_FALSE(parsed.is_null()) << text;
    EXPECT_EQ(parsed.value, expected) << text;
}

template <class T>
void expect_refused(fake::Broker& broker, const char* text) {
    EXPECT_TRUE(parse_argument<T>(broker, text).is_null()) << text;
}

TEST_F(Conversion_Test, StringArgumentsAreCastToSmallScalars) {
    expect_cast<uint16>(broker, "12", 12);
    expect_cast<uint16>(broker, "abc", 0);
    expect_cast<uint8>(broker, "300", 44);
    expect_cast<sint8>(broker, "-1", -1);
    expect_cast<uint32>(broker, "4294967295", 4294967295u);
    expect_cast<sint32>(broker, "-5x", -5);
    expect_cast<boolean>(broker, "TRUE", true);
    expect_cast<boolean>(broker, "falsehood", false);
    expect_refused<boolean>(broker, "yes");
    expect_refused<uint64>(broker, "12");
    expect_refused<real64>(broker, "1.5");
    expect_refused<char16>(broker, "c");
    expect_refused<Datetime>(broker, "00000001020304.000005:000");
    EXPECT_STREQ(parse_argument<String>(broker, "12").value.c_str(), "12");
}

// ---- To CMPI ----

// Each function of the broker fails, always and at each of its calls: nothing is lost but what
// could not be converted, and nothing crashes.
TEST_F(Conversion_Test, FailuresOfTheBroker) {
    const Ref<Test_Holder> holder(create_null<Test_Holder>());
    holder->Id.set("h");
    holder->Object = make_base("o", 1);
    holder->Objects.append(make_base("a", 2));
    holder->Count.set(3);
    const fake::Data_Ref good = to_instance(holder.get());
    ASSERT_EQ(good->members.size(), 4u);

    for (const char* function : {"newInstance", "newObjectPath", "newString", "newArray",
                                 "setElementAt", "setProperty", "addKey"}) {
        for (int n = 0; n < 6; n++) {
            broker.failures = {{function, n}};
            const fake::Data_Ref sent = to_instance(holder.get());
            if (sent && std::string(function) != "setProperty") {
                EXPECT_EQ(sent->find("Count")->scalar.uint32, 3u) << function << n;
            }
        }
    }
    broker.failures.clear();
    const auto path = fake::path_data("", "Test_Holder");
    for (const char* function :
         {"getPropertyAt", "getPropertyCount", "getKey", "getKeyAt", "getKeyCount", "getCharPtr",
          "getClassName", "getNameSpace", "getObjectPath", "getSize", "getElementAt"}) {
        for (int n = 0; n < 12; n++) {
            broker.failures = {{function, n}};
            EXPECT_TRUE(
                make_cimple_instance(converter, &Test_Holder::static_meta_class,
                                     broker.instance(fake::instance_data(path, good->members))));
            EXPECT_EQ(broker.live(), 0) << function << n;
        }
    }
}

} // namespace

} // namespace cimple
