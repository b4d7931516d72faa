// Firmware that is fetched from an address: what else its service does is in tables/firmware.txt.
#include "tests/operations/http_server.h"
#include "tests/road/properties.h"

#include <filesystem>

using host::Value;
using road::Road;
using road::text_of;

namespace {

class Installation : public testing::Test {
protected:
    void write(const std::string& name) {
        char error[256] = "";
        ASSERT_EQ(vlnsim_write_firmware((road.root() / name).c_str(), "VMC-2210", "10.4.255.3",
                                        1000, error, sizeof error),
                  0)
            << error;
    }
    void expect(std::uint64_t value, const std::string& uri, const std::string& line) {
        const std::size_t before = road.log_text().size();
        const auto service = road.enumerate("VLNMPCA_SoftwareInstallationService").at(0).path;
        const auto port = road.enumerate("VLNMPCA_EthernetPort").at(0).path;
        const auto reply =
            road.manager().invoke(service, "InstallFromURI",
                                  {{"Target", Value::reference(port)}, {"URI", Value::text(uri)}});
        EXPECT_EQ(reply.value.value.as_unsigned(), value) << uri;
        const std::string log = road.log_text().substr(before);
        EXPECT_NE(log.find(line), std::string::npos) << uri << ": " << line << "\n" << log;
    }
    // As the service tells it to consoles.
    bool is_curl_there() {
        return text_of(road.enumerate("VLNMPCA_SoftwareInstallationServiceCapabilities").at(0),
                       "SupportedURISchemes") == "{3, 4, 5, 6, 8}";
    }
    bool is_there(const char* name) const { return std::filesystem::exists(road.root() / name); }

    Road road{{.log = true}};
};

TEST_F(Installation, AnImageIsFetchedFromAnAddressAndRemovedWhenItIsInstalled) {
    if (sizeof(void*) == 4 && !is_curl_there())
        GTEST_SKIP() << "the machine has no libcurl of 32 bits (Debian: libcurl4:i386)";
    std::filesystem::create_directory(road.root() / "served");
    write("served/web.img");
    const Http_Server server(road.root() / "served");
    const std::string& plain = server.plain();
    expect(0, plain + "/web.img", "web.img removed successfully");
    expect(0, server.secure() + "/web.img", "web.img removed successfully");
    expect(40141, plain + "/none.img", "Status: <141>:The file is no firmware image");
    expect(4107, plain + "/cut.vfw", "ERROR: CURL returned with Error :18");
    expect(4107, "http://127.0.0.1:1/no.img", "ERROR: CURL returned with Error :7");
    expect(4107, "http://[/bad.img", "ERROR: CURL returned with Error :3");
    expect(4107, "bare.img", "ERROR: vlncimDownloadFW: FW file not found");
    for (const char* left : {"none.img", "cut.vfw", "no.img", "bad.img"})
        EXPECT_TRUE(is_there(left)) << left;
    EXPECT_FALSE(is_there("web.img"));
    EXPECT_EQ(vlnsim_calls("AX_DownloadFirmware"), 2u);
}

TEST_F(Installation, WithoutLibcurlAnAddressCannotBeReached) {
    if (is_curl_there())
        GTEST_SKIP() << "there is a libcurl; the test services_without_libcurl hides it";
    EXPECT_EQ(
        road.count_in_log("libcurl is not present. only file type URIScheme will be supported"),
        1u);
    const std::string address = "http://127.0.0.1:1/new.img";
    expect(4107, address, "ERROR: Could not load the curl library to download from internet");
    expect(4107, address, "ERROR: vlncimDownloadFW: FW file not found");
    write("new.img");
    expect(5, (road.root() / "new.img/of/no/folder").string(),
           "ERROR: vlncimDownloadFW: Can't stat FW file ");
}

} // namespace
