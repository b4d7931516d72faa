// An enumeration whose receiver tells what it looks at, against one that delivers everything.
#include "agent/associations.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_Container.h"
#include "classes/VLNMPCA_PhysicalConnector.h"
#include "classes/VLNMPCA_RecordLog.h"
#include "classes/VLNMPCA_StorageVolume.h"
#include "derivedObjects/pattern.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

namespace {

// Takes what arrives, and keeps what a receiver with the focus would.
struct Receiver {
    Enumeration_Focus focus;
    std::vector<std::string> kept = {};
    int delivered = 0;

    static bool take(const Instance* instance, sint32, void* self) {
        auto& receiver = *static_cast<Receiver*>(self);
        const Ref<const Instance> owner(instance);
        ++receiver.delivered;
        const Instance* wanted = receiver.focus.instance;
        const bool by_keys = receiver.focus.kind == Enumeration_Focus::KEYS;
        if (by_keys ? !key_eq(wanted, instance) : !is_reference_to(instance, wanted, ""))
            return true;
        String path;
        EXPECT_EQ(instance_to_model_path(instance, path), 0);
        receiver.kept.push_back(path.c_str());
        return !by_keys;
    }
};

class Narrowing_Test : public Agent_Test {
protected:
    void SetUp() override {
        Agent_Test::SetUp();
        ASSERT_EQ(pattern_load(pattern_table[0]), 0);
        agent = ProviderAgent::current();
        ASSERT_EQ(refreshes_started(*agent), 1);
    }
    void TearDown() override {
        pattern_unload(pattern_table[0]);
        Agent_Test::TearDown();
    }

    // Both enumerations; what they keep must agree. Answers the number that the narrowed one
    // delivered.
    int compare(Pattern_Id id, Enumeration_Focus::Kind kind, const Instance* source) {
        Receiver whole = {{kind, source}};
        Receiver narrowed = {{kind, source}};
        const Pattern_Row& row = pattern_table[id];
        pattern_enum_instances(row, {&Receiver::take, &whole});
        pattern_enum_instances(row, {&Receiver::take, &narrowed, &narrowed.focus});
        EXPECT_EQ(narrowed.kept, whole.kept);
        return narrowed.delivered;
    }

    ProviderAgent* agent = nullptr;
};

template <class T>
Ref<T> physical(const std::string& tag) {
    Ref<T> made(create_null<T>());
    made->CreationClassName.set(made->__meta_class->name);
    made->Tag.set(tag.c_str());
    return made;
}

} // namespace

TEST_F(Narrowing_Test, WhatNobodyLooksAtIsNotDelivered) {
    auto& store = agent->m_VLNMPCA_Container_map;
    for (int i = 0; i < 100; ++i) {
        const auto whole = physical<VLNMPCA_Card>(std::to_string(i / 10));
        const auto part = physical<VLNMPCA_PhysicalConnector>(std::to_string(i));
        ASSERT_NE(associate(store, whole.get(), part.get()), nullptr);
    }
    const auto delivered = [&](Enumeration_Focus::Kind kind, const Instance* source) {
        return compare(PATTERN_VLNMPCA_Container, kind, source);
    };
    EXPECT_EQ(delivered(Enumeration_Focus::REFERENCES_TO, physical<VLNMPCA_Card>("3").get()), 10);
    EXPECT_EQ(delivered(Enumeration_Focus::REFERENCES_TO, physical<VLNMPCA_Card>("x").get()), 0);
    EXPECT_EQ(delivered(Enumeration_Focus::KEYS, store[40]), 1);
}

// Gates, requests and log lines are those of any enumeration.
TEST_F(Narrowing_Test, EverythingButTheCopyIsAsBefore) {
    const Ref<Instance> volume(create<VLNMPCA_StorageVolume>());
    const Enumeration_Focus focus = {Enumeration_Focus::KEYS, volume.get()};
    Receiver receiver = {focus};
    agent->m_bIsSANMapsReady = true; // a gate that is down would wait for a refresh
    Agent_Log log;
    pattern_enum_instances(pattern_table[PATTERN_VLNMPCA_StorageVolume],
                           {&Receiver::take, &receiver, &focus});
    EXPECT_EQ(log.count(VLN_DBG, "VLNMPCA_StorageVolume_Provider::enum_instances()"), 1);
    EXPECT_EQ(receiver.delivered, 0);
}

// Keys that became equal by a fault empty every answer, the narrow ones too.
TEST_F(Narrowing_Test, EqualKeysEmptyNarrowAnswersToo) {
    auto& store = agent->m_VLNMPCA_Card_map;
    for (const char* tag : {"a", "b", "c"})
        store.insert(physical<VLNMPCA_Card>(tag).release());
    change(store, 1, [](VLNMPCA_Card& card) { card.Tag.set("a"); });
    const auto wanted = physical<VLNMPCA_Card>("c");
    Agent_Log log;
    EXPECT_EQ(compare(PATTERN_VLNMPCA_Card, Enumeration_Focus::KEYS, wanted.get()), 0);
    EXPECT_EQ(log.count(VLN_CRIT, "Insert failed for 1"), 2) << "once for each enumeration";
}

// Nothing keeps keys distinct across the stores of one class, so those are taken whole.
TEST_F(Narrowing_Test, ClassesOfSeveralStoresAreTakenWhole) {
    const auto log_of = [](const char* id) {
        auto* log = create_null<VLNMPCA_RecordLog>();
        log->InstanceID.set(id);
        return log;
    };
    agent->m_VLNMPCA_RecordLog_map.clear();
    agent->m_VLNMPCA_RecordLog_map.insert(log_of("one"));
    agent->m_VLNMPCA_DriverRecordLog_map.insert(log_of("two"));
    const Ref<Instance> two(log_of("two"));
    EXPECT_EQ(compare(PATTERN_VLNMPCA_RecordLog, Enumeration_Focus::KEYS, two.get()), 2);
    agent->m_VLNMPCA_ISCSIRecordLog_map.insert(log_of("one"));
    EXPECT_EQ(compare(PATTERN_VLNMPCA_RecordLog, Enumeration_Focus::KEYS, two.get()), 0);
}

} // namespace cimple
