// Association queries and gets over a provider that delivers no more than the engine looks at,
// against the same provider delivering everything: every answer must be the same.
#include "tests/cimple/cmpi_fixture.h"
#include "tests/cimple/random_links.h"

namespace cimple {

namespace {

std::string describe(const fake::Value& value);

std::string describe(const fake::Data& data) {
    std::string text = data.name_space + ":" + data.text;
    if (data.path)
        text += "@" + describe(*data.path);
    for (const auto& [name, value] : data.members)
        text += "," + name + "=" + describe(value);
    for (const auto& element : data.elements)
        text += ";" + describe(element);
    return text;
}

std::string describe(const fake::Value& value) {
    if (value.state & CMPI_nullValue)
        return "null";
    return value.object ? describe(*value.object) : std::to_string(value.scalar.uint32);
}

class Narrowed_Test : public Cmpi_Test {
protected:
    // Everything that a call lets the object manager see.
    std::string seen(CMPIrc rc) {
        std::string text = std::to_string(rc) + "/" + std::to_string(broker.done);
        for (const auto* list : {&broker.returned_paths, &broker.returned_instances})
            for (const auto& data : *list)
                text += "\n" + describe(*data);
        for (const std::string& call : broker.upcalls)
            text += "\n" + call;
        broker.clear_results();
        broker.upcalls.clear();
        broker.end_call();
        return text;
    }

    // All answers about one source, with roles, result classes and result roles.
    std::string ask(const fake::Data_Ref& source) {
        static const char* const roles[] = {nullptr, "left", "Right", "None"};
        static const char* const classes[] = {nullptr, "Test_Sub", "Test_Root", "Test_Base"};
        std::string all;
        for (const char* role : roles) {
            CMPIObjectPath* path = broker.path(source);
            all += seen(mi->ft->references(mi, context, result, path, 0, role, nullptr).rc);
            all += seen(mi->ft->referenceNames(mi, context, result, path, 0, role).rc);
            for (const char* wanted : classes) {
                all += seen(
                    mi->ft->associatorNames(mi, context, result, path, 0, wanted, role, nullptr)
                        .rc);
                all += seen(
                    mi->ft->associators(mi, context, result, path, 0, wanted, role, "RIGHT", 0).rc);
            }
        }
        return all;
    }

    void fill(Instance_Map_Base& store, Instance* member) {
        Ref<Instance> owner(member);
        if (store.insert(member) < 0)
            return;
        script.instances.emplace_back(clone(member));
        owner.release();
    }

    CMPIAssociationMI* mi = association_mi();
};

fake::Data_Ref source_data(Random_Links& random) {
    static const char* const names[] = {"a", "b", "c", "none"};
    static const char* const classes[] = {"Test_Base", "Test_Sub", "Test_Leaf", "Test_Stranger"};
    const char* class_name = classes[random.below(4)];
    const fake::Value name = fake::text(names[random.below(4)]);
    const fake::Value slot = fake::number(CMPI_uint32, random.below(3));
    if (random.below(10) == 0)
        return fake::path_data("root/test", class_name); // all keys are missing
    if (std::string(class_name) == "Test_Leaf")
        return fake::path_data("root/test", class_name, {{"Name", name}});
    return fake::path_data("root/other", class_name, {{"Id", name}, {"Slot", slot}});
}

} // namespace

TEST_F(Narrowed_Test, AssociationAnswersAreThoseOfTheWholeEnumeration) {
    script.status = {{OP_ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_UNSUPPORTED},
                     {OP_ENUM_REFERENCES, ENUM_REFERENCES_UNSUPPORTED},
                     {OP_ENUM_ASSOCIATORS, ENUM_ASSOCIATORS_UNSUPPORTED}};
    std::size_t whole = 0;
    std::size_t narrowed = 0;
    for (uint32 seed = 1; seed <= 15; ++seed) {
        Random_Links random(seed);
        Instance_Map<Test_Link> store;
        script.instances.clear();
        for (uint32 i = 0; i < 40; ++i)
            fill(store, random.link());
        for (int i = 0; i < 6; ++i) {
            const fake::Data_Ref source = source_data(random);
            script.store = nullptr;
            script.delivered = 0;
            const std::string expected = ask(source);
            whole += script.delivered;
            script.store = &store;
            script.delivered = 0;
            ASSERT_EQ(ask(source), expected) << describe(*source);
            narrowed += script.delivered;
        }
    }
    EXPECT_LT(narrowed * 4, whole);
    EXPECT_GT(narrowed, 0u);
}

TEST_F(Narrowed_Test, AGetFindsTheSameInstance) {
    script.status = {{OP_GET_INSTANCE, GET_INSTANCE_UNSUPPORTED}};
    CMPIInstanceMI* instances = instance_mi();
    Random_Links random(7);
    Instance_Map<Test_Base> store;
    for (uint32 i = 0; i < 60; ++i)
        fill(store, random.base(false));
    for (int i = 0; i < 100; ++i) {
        const fake::Data_Ref source = source_data(random);
        std::string answers[2];
        for (int narrowed = 0; narrowed < 2; ++narrowed) {
            script.store = narrowed ? &store : nullptr;
            script.delivered = 0;
            answers[narrowed] = seen(
                instances->ft->getInstance(instances, context, result, broker.path(source), 0).rc);
            if (narrowed) {
                EXPECT_LE(script.delivered, 1u);
            }
        }
        EXPECT_EQ(answers[0], answers[1]) << describe(*source);
    }
}

} // namespace cimple
