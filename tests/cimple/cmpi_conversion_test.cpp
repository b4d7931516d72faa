// Values between CMPI objects and instances, both ways: into a provider that keeps what it is
// given, and out of it again.
#include "cimple/conversion.h"
#include "host/scalar_text.h"
#include "tests/cimple/cmpi_fixture.h"

namespace cimple {

namespace {

using Array = Value::Array;

class Conversion_Test : public Cmpi_Test {
protected:
    // What the provider of the class gets as an instance with these properties.
    template <class C>
    C* given(host::Named_Values properties) {
        const char* name = C::static_meta_class.name;
        script.status[OP_CREATE_INSTANCE] = 99; // nothing to answer, whatever it is
        EXPECT_EQ(
            ask({OP_CREATE_INSTANCE, name, {"root/test", name, {}}, std::move(properties)}).rc, 0);
        return cast<C>(script.instance.get());
    }
    // What a client gets of the instance that the provider has got last.
    host::Instance returned(const host::Property_List& list = std::nullopt) {
        script.instances = {clone(script.instance.get())};
        const char* name = script.instance->__meta_class->name;
        const Told told = ask({OP_ENUM_INSTANCES, name, {"root/test", name, {}}, {}, list});
        EXPECT_EQ(told.results(), 1);
        return told.instances.empty() ? host::Instance{} : told.instances[0];
    }
    static host::Instance base_instance(const char* id, unsigned slot, const char* caption = "") {
        host::Instance made{base(id, slot), base(id, slot).keys};
        made.properties.push_back({"Caption", Value::text(caption)});
        return made;
    }
};

TEST_F(Conversion_Test, EveryTypeGoesThereAndBackAloneAndInAnArray) {
    const std::pair<std::string, std::vector<const char*>> samples[] = {
        {"B", {"TRUE", "FALSE"}},
        {"U8", {"0", "255"}},
        {"S8", {"-128", "127"}},
        {"U16", {"0", "65535"}},
        {"S16", {"-32768", "32767"}},
        {"U32", {"0", "4294967295"}},
        {"S32", {"-2147483648", "2147483647"}},
        {"U64", {"0", "18446744073709551615"}},
        {"S64", {"-9223372036854775808", "9223372036854775807"}},
        {"R32", {"-3.4028235e38", "0.1"}},
        {"R64", {"-1.7976931348623157e308", "0.1"}},
        {"C16", {"0", "65535"}},
        {"Str", {"", "grün", "a longer text than fits the smallest block"}},
        {"Date", {"00000001020304.000005:000", "20261121042952.000007+060"}},
    };
    for (std::size_t i = 0; i < 2; i++) {
        host::Named_Values properties = {{"Name", Value::text("n")}};
        for (const auto& [name, texts] : samples) {
            const CMPIType type = known("Test_Arrays").find_property(name)->type;
            Array all;
            std::string error;
            for (const char* text : texts)
                all.push_back(host::scalar_from_text(type, text, error));
            ASSERT_EQ(error, "") << name;
            properties.push_back({name, all[i]});
            properties.push_back({name + "s", Value::array(type, all)});
        }
        given<Test_Arrays>(properties);
        const host::Instance back = returned();
        for (const auto& [name, value] : properties) {
            ASSERT_TRUE(back.property(name)) << name;
            EXPECT_EQ(*back.property(name), value) << name;
        }
    }
}

TEST_F(Conversion_Test, ReferencesGoAsPathsInTheirOwnNamespace) {
    host::ObjectPath left = leaf("l");
    left.name_space = "root/other";
    const auto* link = given<Test_Link>(
        {{"Left", Value::reference(left)}, {"Right", Value::reference(base("r", 7, ""))}});
    EXPECT_EQ(link->Left->__name_space, "root/other");
    EXPECT_EQ(link->Right->__name_space, "root/test");
    EXPECT_EQ(link->Right->Slot.value, 7u);
    const host::Instance back = returned();
    EXPECT_EQ(*back.property("Left")->as_reference(), left);
    EXPECT_EQ(*back.property("Right")->as_reference(), base("r", 7));
    EXPECT_EQ(*back.path.key("Left"), *back.property("Left")) << "key references are keys";
}

TEST_F(Conversion_Test, EmbeddedObjectsGoWhole) {
    const host::Named_Values properties = {
        {"Id", Value::text("h")},
        {"Object", Value::instance(base_instance("o", 1, "not a key"))},
        {"Objects", Value::array(CMPI_instance, {Value::instance(base_instance("a", 2)),
                                                 Value::instance(base_instance("b", 3))})}};
    given<Test_Holder>(properties);
    const host::Instance back = returned();
    for (const auto& [name, value] : properties)
        EXPECT_EQ(*back.property(name), value) << name;

    // A list saves the conversion of what it does not name: the instance alone is made.
    failures = {{"newInstance", 9}};
    returned({{"Count"}});
    EXPECT_EQ(failures["newInstance"], 7) << "once of the broker, once of its path";
    failures.clear();

    const auto* holder = given<Test_Holder>(
        {{"Objects", Value::array(CMPI_instance, {Value::instance(base_instance("a", 2)),
                                                  Value::null(CMPI_instance)})}});
    ASSERT_EQ(holder->Objects.value.size(), 2u);
    EXPECT_EQ(holder->Objects.value[1], nullptr) << "a null element is kept as a null pointer";
}

// A platform's subclass of the class that is expected is known by its keys; with fewer or others it
// is nothing, and so is a class that is expected elsewhere.
TEST_F(Conversion_Test, ReferencesToOtherClasses) {
    const host::Named_Value slot{"Slot", number(CMPI_uint64, 7)}, id{"Id", Value::text("f")},
        other{"Other", Value::text("f")};
    const auto read = [&](const char* class_name, const host::Named_Values& keys) {
        return given<Test_Link>({{"Right", Value::reference({"root/far", class_name, keys})},
                                 {"Left", Value::reference(base("f", 7))},
                                 {"Weight", number(CMPI_uint32, 3)}});
    };
    const auto* link = read("Foreign", {slot, id});
    ASSERT_NE(link->Right, nullptr);
    EXPECT_STREQ(link->Right->__meta_class->name, "Foreign");
    EXPECT_STREQ(link->Right->__name_space.c_str(), "root/far");
    EXPECT_TRUE(key_eq(link->Right, Ref<Instance>(make_base("f", 7)).get()));
    EXPECT_EQ(link->Left, nullptr);
    EXPECT_EQ(link->Weight.value, 3u);
    for (const auto& keys : {host::Named_Values{slot}, {slot, other}, {}})
        EXPECT_EQ(read("Foreign", keys)->Right, nullptr);
}

// ---- Into the provider ----

TEST_F(Conversion_Test, KeysAreNarrowedByTruncation) {
    const auto wide = [](std::uint64_t value) { return number(CMPI_uint64, value); };
    const host::Named_Values keys = {
        {"U8", wide(5)},
        {"S8", wide(300)},
        {"U16", wide(0x12345)},
        {"S32", wide(0xFFFFFFFF)},
        {"S64", wide(~0ull)},
        {"U32", Value::signed_number(CMPI_sint64, 0x100000002)},
        {"S16", Value::signed_number(CMPI_sint64, 4)},
    };
    ask({OP_DELETE_INSTANCE, "Test_Types", {"root/test", "Test_Types", keys}});
    const auto* types = cast<Test_Types>(script.model.get());
    EXPECT_EQ(types->U8.value, 5);
    EXPECT_EQ(types->S8.value, 44);
    EXPECT_EQ(types->U16.value, 0x2345);
    EXPECT_EQ(types->S32.value, -1);
    EXPECT_EQ(types->S64.value, -1);
    EXPECT_EQ(types->U32.value, 2u);
    EXPECT_TRUE(types->S16.is_null()) << "signed keys are narrowed to uint32 only";
    EXPECT_TRUE(given<Test_Base>({{"Slot", wide(5)}})->Slot.is_null())
        << "properties are not narrowed";
}

TEST_F(Conversion_Test, ABadMemberFailsAlone) {
    const Value one = number(CMPI_uint32, 1);
    const auto* types = given<Test_Types>({
        {"U8", Value::text("not a number")},
        {"U16", one},
        {"Date", Value::datetime("20261121")},
        {"Numbers", Value::array(CMPI_uint32, {one, Value::null(CMPI_uint32)})},
        {"Names", Value::array(CMPI_string, {one})},
        {"Dates", Value::array(CMPI_uint32, {one})},
        {"Installed", Value::datetime("00000001020304.000005:000")},
    });
    EXPECT_FALSE(types->Installed.is_null()) << "the last one, behind all the bad ones";
    EXPECT_TRUE(types->U8.is_null() && types->U16.is_null() && types->Date.is_null());
    EXPECT_TRUE(types->Numbers.is_null() && types->Names.is_null() && types->Dates.is_null());
}

// What other object managers hand out, and this one never would.
TEST_F(Conversion_Test, OddDataIsTakenForWhatItCanBe) {
    const CMPIBroker* cmpi_broker = block(instance_mi()).adapter->broker;
    host::Request request(*core, known("Test_Types"), "call", "root/test");
    CMPIInstance* real = request.instance({{"root/test", "Test_Types", {}},
                                           {{"B", Value::boolean(true)},
                                            {"S8", Value::signed_number(CMPI_sint8, 1)},
                                            {"Str", Value::text("text")},
                                            {"Date", Value::datetime("")},
                                            {"Dates", Value::array(CMPI_dateTime, {})}}});
    CMPIInstanceFT table = *real->ft;
    table.getPropertyAt = [](const CMPIInstance* odd, CMPICount index, CMPIString** name,
                             CMPIStatus* status) {
        const auto* real = static_cast<const CMPIInstance*>(odd->hdl);
        CMPIData data = real->ft->getPropertyAt(real, index, name, status);
        if (data.type == CMPI_boolean)
            data.value.boolean = 2;
        else if (data.type == CMPI_sint8)
            data.state = CMPI_badValue;
        else
            data.value.string = nullptr;
        return data;
    };
    table.getPropertyCount = [](const CMPIInstance* odd, CMPIStatus* status) {
        const auto* real = static_cast<const CMPIInstance*>(odd->hdl);
        return real->ft->getPropertyCount(real, status);
    };
    const CMPIInstance odd = {real, &table};
    const Ref<Test_Types> types = make_cimple_instance({cmpi_broker, &meta_repository, "root/test"},
                                                       &Test_Types::static_meta_class, &odd)
                                      .release();
    EXPECT_TRUE(types->B.value && !types->B.is_null()) << "any byte but zero is true";
    EXPECT_TRUE(types->Str.value.empty() && !types->Str.is_null()) << "no string is an empty one";
    EXPECT_TRUE(types->S8.is_null() && types->Date.is_null() && types->Dates.is_null());
}

TEST_F(Conversion_Test, StringArgumentsAreCastToSmallScalars) {
    const auto cast_all = [this](std::initializer_list<std::pair<const char*, const char*>> texts) {
        host::Named_Values in;
        for (const auto& [name, text] : texts)
            in.push_back({name, Value::text(text)});
        ask({.operation = OP_INVOKE_METHOD,
             .class_name = "Test_Service",
             .properties = in,
             .method = "Cast"});
        return static_cast<const Test_Service_Cast_method*>(script.model.get());
    };
    const auto* cast = cast_all({{"U16", "12"},
                                 {"U8", "300"},
                                 {"S8", "-1"},
                                 {"U32", "4294967295"},
                                 {"S32", "-5x"},
                                 {"B", "TRUE"},
                                 {"Str", "12"},
                                 {"U64", "12"},
                                 {"R64", "1.5"},
                                 {"C16", "c"},
                                 {"Date", "00000001020304.000005:000"}});
    EXPECT_EQ(cast->U16.value, 12);
    EXPECT_EQ(cast->U8.value, 44);
    EXPECT_EQ(cast->S8.value, -1);
    EXPECT_EQ(cast->U32.value, 4294967295u);
    EXPECT_EQ(cast->S32.value, -5);
    EXPECT_TRUE(cast->B.value && !cast->B.is_null());
    EXPECT_STREQ(cast->Str.value.c_str(), "12");
    EXPECT_TRUE(cast->U64.is_null() && cast->R64.is_null() && cast->C16.is_null() &&
                cast->Date.is_null());
    cast = cast_all({{"U16", "abc"}, {"B", "falsehood"}});
    EXPECT_FALSE(cast->U16.is_null() || cast->U16.value || cast->B.is_null() || cast->B.value);
    EXPECT_TRUE(cast_all({{"B", "yes"}})->B.is_null());
}

} // namespace

} // namespace cimple
