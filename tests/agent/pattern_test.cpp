#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_Product.h"
#include "classes/VLNMPCA_StorageVolume.h"
#include "derivedObjects/pattern.h"
#include "tests/agent/agent_fixture.h"

#include <atomic>
#include <stdexcept>
#include <thread>

namespace cimple {

namespace {

class Pattern_Test : public Agent_Test {
protected:
    // A settled agent: what a test puts into a store is not cleared by a refresh.
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
    VLNMPCA_Product* put_product(const char* name) {
        auto* product = create<VLNMPCA_Product>();
        product->Name.set(name);
        EXPECT_GE(agent->m_VLNMPCA_Product_map.insert(product), 0);
        return product;
    }

    ProviderAgent* agent = nullptr;
};

struct Taken {
    std::vector<std::string> names;
    std::vector<Ref<const VLNMPCA_Product>> instances;
    bool more = true;

    static bool take(const Instance* instance, sint32, void* self) {
        auto& taken = *static_cast<Taken*>(self);
        taken.instances.emplace_back(instance);
        taken.names.push_back(taken.instances.back()->Name.value.c_str());
        return taken.more;
    }
};

const Pattern_Row& product_row() {
    return pattern_table[pattern_id<VLNMPCA_Product>];
}

bool refuse(const Instance* instance, sint32, void*) {
    unref(instance);
    throw std::runtime_error("client gone");
}

} // namespace

TEST_F(Pattern_Test, SharesWhatItDelivers) {
    const VLNMPCA_Product* first = put_product("a");
    put_product("b");
    Taken taken;
    EXPECT_EQ(pattern_enum_instances(product_row(), {&Taken::take, &taken}), 0);
    EXPECT_EQ(taken.names, (std::vector<std::string>{"a", "b"}));
    EXPECT_EQ(taken.instances[0].get(), first);

    auto& store = agent->m_VLNMPCA_Product_map;
    const auto rename = [](VLNMPCA_Product& product) { product.ElementName.set("changed"); };
    const auto* changed = change(store, first, rename);
    EXPECT_NE(changed, first) << "somebody reads the former one";
    EXPECT_TRUE(first->ElementName.value.empty());
    EXPECT_EQ(change(store, changed, rename), changed) << "nobody else has this one";
    EXPECT_EQ(store.find(first), 0) << "the index knows it by its keys";

    taken = {};
    taken.more = false;
    EXPECT_EQ(pattern_enum_instances(product_row(), {&Taken::take, &taken}), 0);
    EXPECT_EQ(taken.names.size(), 1u) << "the handler has asked to stop";
}

// Two properties that are changed together are read together, however long a reader takes.
TEST_F(Pattern_Test, NoReaderSeesHalfAChange) {
    constexpr int CHANGES = 2000;
    put_product("0");
    auto& store = agent->m_VLNMPCA_Product_map;
    std::atomic<bool> done{false};
    const Instance_Proc compare = [](const Instance* instance, sint32, void*) {
        const Ref<const VLNMPCA_Product> product(instance);
        const std::string name = product->Caption.value.c_str();
        std::this_thread::yield();
        EXPECT_EQ(name, product->Description.value.c_str());
        return true;
    };
    std::vector<std::thread> readers;
    for (int i = 0; i < 3; ++i)
        readers.emplace_back([&] {
            while (!done)
                pattern_enum_instances(product_row(), {compare, nullptr});
        });
    for (int i = 1; i <= CHANGES; ++i) {
        Auto_Mutex lock(agent->m_DataMutex);
        change(store, 0u, [i](VLNMPCA_Product& product) {
            product.Caption.set(std::to_string(i).c_str());
            product.Description.set(std::to_string(i).c_str());
        });
    }
    done = true;
    for (std::thread& reader : readers)
        reader.join();
    EXPECT_STREQ(store[0]->Caption.value.c_str(), std::to_string(CHANGES).c_str());
}

TEST_F(Pattern_Test, ExceptionsEndInTheGuardOfTheShape) {
    put_product("a");
    agent->m_VLNMPCA_StorageVolume_map.insert(create<VLNMPCA_StorageVolume>());
    agent->m_VLNMPCA_Card_map.insert(create<VLNMPCA_Card>());
    const struct {
        Pattern_Id id;
        const char* line;
    } rows[] = {
        {pattern_id<VLNMPCA_Product>, "Exception in CIM Provider Enumeration - do nothing"},
        {pattern_id<VLNMPCA_StorageVolume>,
         "Exception in SAN CIM Provider Enumeration - do nothing"},
        {pattern_id<VLNMPCA_Card>, "Exception in Active CIM Provider Enumeration - do nothing"},
    };
    for (const auto& row : rows) {
        Agent_Log log;
        EXPECT_EQ(pattern_enum_instances(pattern_table[row.id], {&refuse, nullptr}), 0);
        EXPECT_EQ(log.count(VLN_CRIT, row.line), 1);
        EXPECT_EQ(count_instances(*pattern_table[row.id].meta_class), 1) << "a lock is still held";
    }
}

} // namespace cimple
