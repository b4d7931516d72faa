// A host without the service that a client asks: the rest is in tables/ip_tables.txt.
#include "tests/road/road.h"

namespace {

TEST(IP_Configuration, NeedsExactlyOneService) {
    road::Road road({.scenario = "no-adapters.json"});
    EXPECT_TRUE(road.enumerate("VLNMPCA_IPConfigurationService").empty());
    host::ObjectPath path;
    path.class_name = "VLNMPCA_IPConfigurationService";
    for (const char* key : {"Name", "SystemName", "SystemCreationClassName", "CreationClassName"})
        path.keys.push_back({key, host::Value::text("none")});
    EXPECT_EQ(road.manager().invoke(path, "ApplySettingToIPProtocolEndpoint", {}).status.rc,
              CMPI_RC_ERR_FAILED);
}

} // namespace
