// Software and record logs where they are not as on every host (shown/two-port-cna.md).
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

#include <fstream>

using road::expect_properties;
using road::Road;

namespace {

// The firmware's card tells its release date, if it has one of this form.
TEST(Software, AFirmwareOfAnotherForm) {
    Road road({.scenario = road::card(R"({"use": "nic"})", R"("vpd": {"FW": "D:031520145"},
        "adapterAttributes": {"OperationalFirmwareVersion": "4.01A5"}, )")});
    expect_properties(road.enumerate("VLNMPCA_SoftwareIdentity").at(2), {{"ReleaseDate", "-"},
                                                                         {"MajorVersion", "4"},
                                                                         {"RevisionNumber", "1"},
                                                                         {"BuildNumber", "5"},
                                                                         {"ReleaseType", "A"}});
}

TEST(Software, RecordLogsShowTheLogger) {
    const char* const rows[][4] = {// mode, level and whether it is enabled; how that is shown
                                   {"2,5,1\n", "5", "5", "3"},
                                   {"2,2,0\n", "2", "2", "2"}};
    for (const auto& [settings, level, requested, enabled] : rows) {
        Road road;
        std::ofstream(road.root() / "etc/vorlan_mpca_provider.dmp") << settings;
        const auto logs = road.enumerate("VLNMPCA_RecordLog");
        ASSERT_EQ(logs.size(), 5u) << "and three of drivers";
        expect_properties(logs[0], {{"ElementName", "Record logs for Vorlan CIM Provider"},
                                    {"LogLevel", level},
                                    {"RequestedState", requested},
                                    {"EnabledState", enabled}});
        expect_properties(logs[1], {{"RequestedState", "2"},
                                    {"LogLevel", "3"},
                                    {"TracePath", (road.root() / "tmp/nima2d.log").c_str()},
                                    {"MaxNumberOfRecords", "1024"}});
    }
}

} // namespace
