// How often the object manager is asked back. Each up-call goes through its whole machinery, to
// another process as a rule: 20 to 40 ms in a real one, and so more than all else that a request
// costs.
#include "tests/road/hosts.h"
#include "tests/road/road.h"

#include <algorithm>
#include <mutex>
#include <utility>

using road::PLATFORM;
using road::Road;

namespace {

// By operation and class. Traces come from the threads of clients and of refreshes.
struct Up_Calls {
    std::mutex mutex;
    std::map<std::string, std::size_t> counts;

    void trace(const std::string& line) {
        if (!line.starts_with("up-call "))
            return;
        const std::size_t name = line.find(' ', 8), space = line.find(':', name);
        const std::string key =
            line.substr(8, name - 8) + line.substr(space, line.find('.', space) - space);
        const std::lock_guard lock(mutex);
        ++counts[key];
    }
    std::map<std::string, std::size_t> take() {
        const std::lock_guard lock(mutex);
        return std::exchange(counts, {});
    }
};

using Counts = std::map<std::string, std::size_t>;

const Counts REFRESH = {{"enumerateInstances:IBMSD_ComputerSystem", 1},
                        {"enumerateInstances:IBMSD_Chassis", 1}};
const std::string BASE_SERVER = "enumerateInstances:OMC_RegisteredBaseServerProfile";

class Up_Call : public testing::TestWithParam<const char*> {
protected:
    Up_Calls up_calls;
    Road road{{.scenario = "blade-16-functions.json",
               .platform = GetParam(),
               .log = true,
               .trace = [this](const std::string& line) { up_calls.trace(line); }}};
    host::Manager& manager = road.manager();
};

// Whether the platform answers or not, and however many refreshes there are.
TEST_P(Up_Call, ARefreshAsksForTheSystemAndTheChassisOnceEach) {
    std::size_t refreshes = 0;
    for (const char* name : {"VLNMPCA_EthernetPort", "VLNMPCA_StorageVolume", "VLNMPCA_Card"}) {
        manager.enumerate(name);
        road.wait_for_refreshes(++refreshes);
        EXPECT_EQ(up_calls.take(), REFRESH) << name;
        vlnsim_advance(11 * 60 * 1'000'000ull);
    }
}

// Of all that a client may ask, two things lead to up-calls: the platform's own base server profile
// is asked for whenever what refers to it is, and the ends of associations are fetched, each by its
// own provider, for the one operation that delivers them whole.
TEST_P(Up_Call, ARequestMakesNoneButThoseThatItIsTold) {
    manager.enumerate("VLNMPCA_StorageVolume");
    up_calls.take();
    for (const host::Class* known : manager.provider_classes()) {
        const bool asks = known->name == "VLNMPCA_BaseServerReferencedProfile";
        const auto expect = [&](std::size_t requests, const char* what) {
            const Counts expected = asks && requests ? Counts{{BASE_SERVER, requests}} : Counts{};
            EXPECT_EQ(up_calls.take(), expected) << known->name << " " << what;
        };
        auto paths = manager.enumerate_names(known->name).value;
        paths.resize(std::min<std::size_t>(paths.size(), 2)); // what goes for two goes for all
        expect(1, "names");
        manager.enumerate(known->name);
        expect(1, "instances");
        for (const host::ObjectPath& path : paths)
            manager.get(path);
        expect(paths.size(), "get");
        if (!known->is_association)
            continue;
        for (const host::ObjectPath& path : paths) {
            for (const host::Named_Value& end : path.keys) {
                host::ObjectPath source = *end.value.as_reference();
                source.name_space = "root/vorlan";
                const host::Association_Filter via{known->name, "", "", ""};
                const std::size_t results = manager.associator_names(source, via).value.size();
                expect(1, "associatorNames");
                manager.references(source, via);
                manager.reference_names(source, via);
                expect(2, "references and referenceNames");
                manager.associators(source, via);
                std::size_t fetched = 0;
                for (const auto& [what, count] : up_calls.take())
                    if (what.starts_with("getInstance:"))
                        fetched += count;
                    else
                        EXPECT_TRUE(asks && what == BASE_SERVER && count == 1) << what;
                EXPECT_EQ(fetched, results) << known->name << " associators";
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Platforms, Up_Call, testing::Values("", PLATFORM),
                         [](const auto& info) { return *info.param ? "Answering" : "Missing"; });

} // namespace
