// Interface queries over a kernel that the test plays.

#include "device/ip_interface.h"
#include "tests/device/log_capture.h"

#include <gtest/gtest.h>

#include <arpa/inet.h>
#include <cstring>
#include <net/if.h>
#include <sys/socket.h>

namespace cimple {

namespace {

struct Fake_Kernel {
    int result = 0;
    ifreq answer{};
    std::vector<unsigned long> requests;
    ifreq asked{};
    int opened = 0, closed = 0;
} kernel;

constexpr int DESCRIPTOR = 77;

constexpr IP_Calls CALLS = {
    [](int domain, int type, int) {
        ++kernel.opened;
        return domain == AF_INET && (type & ~SOCK_CLOEXEC) == SOCK_DGRAM ? DESCRIPTOR : -1;
    },
    [](int descriptor, unsigned long request, void* argument) {
        kernel.requests.push_back(request);
        std::memcpy(&kernel.asked, argument, sizeof kernel.asked);
        if (descriptor != DESCRIPTOR || kernel.result < 0)
            return -1;
        std::memcpy(argument, &kernel.answer, sizeof kernel.answer);
        return 0;
    },
    [](int descriptor) {
        kernel.closed += descriptor == DESCRIPTOR;
        return 0;
    },
};

void set_address(sa_family_t family, const char* text) {
    sockaddr_in address{};
    address.sin_family = family;
    inet_pton(AF_INET, text, &address.sin_addr);
    std::memcpy(&kernel.answer.ifr_addr, &address, sizeof address);
}

class IP_Interface_Test : public testing::Test {
protected:
    void SetUp() override {
        kernel = Fake_Kernel{};
        VLN_IPInterfaceConfig::setCalls(&CALLS);
        log_capture::take();
    }
    void TearDown() override { VLN_IPInterfaceConfig::setCalls(nullptr); }
    static int logged(const char* line) { return log_capture::count(log_capture::take(), line); }
};

} // namespace

TEST_F(IP_Interface_Test, AnswersAreTheKernels) {
    {
        VLN_IPInterfaceConfig interface;
        kernel.answer.ifr_flags = IFF_UP | IFF_BROADCAST;
        EXPECT_TRUE(interface.GetInterfaceState("eth0"));
        EXPECT_STREQ(kernel.asked.ifr_name, "eth0");
        EXPECT_EQ(logged("5:GetInterfaceState -- Interface: [eth0] is UP"), 1);
        kernel.answer.ifr_flags = IFF_BROADCAST;
        EXPECT_FALSE(interface.GetInterfaceState("eth0"));
        EXPECT_EQ(logged("5:GetInterfaceState -- Interface: [eth0] is Down"), 1);

        set_address(AF_INET, "192.0.2.17");
        EXPECT_EQ(interface.GetIPAddressType("eth0"), 2);
        EXPECT_EQ(logged("5:GetIPAddressType -- INET FAMILY for strInterface [eth0]: [2]"), 1);
        EXPECT_EQ(interface.GetIPv4Address("eth0"), "192.0.2.17");
        EXPECT_EQ(logged("3:GetIPv4Address --- IPv4 Address for strInterface [eth0]: [192.0.2.17]"),
                  1);
        set_address(AF_INET, "255.255.254.0");
        EXPECT_EQ(interface.GetIPv4SubnetMask("eth0"), "255.255.254.0");
        EXPECT_EQ(kernel.requests, (std::vector<unsigned long>{35091, 35091, 35093, 35093, 35099}));

        set_address(AF_INET6, "192.0.2.17");
        EXPECT_EQ(interface.GetIPAddressType("eth0"), 10);
        EXPECT_EQ(interface.GetIPv4Address("eth0"), "");
        EXPECT_EQ(interface.GetIPv4SubnetMask("eth0"), "");
        EXPECT_EQ(kernel.closed, 0);
    }
    EXPECT_EQ(kernel.opened, 1);
    EXPECT_EQ(kernel.closed, 1);
    EXPECT_EQ(logged("5:VLN_IPInterfaceConfig -- Destructor of IPInterface"), 1);
}

TEST_F(IP_Interface_Test, FailuresAreLoggedAndEmpty) {
    VLN_IPInterfaceConfig interface;
    interface.GetInterfaceState("interface-of-a-long-name"); // is cut to the kernel's record
    EXPECT_EQ(std::string(kernel.asked.ifr_name, sizeof kernel.asked.ifr_name), "interface-of-a-l");
    EXPECT_EQ(kernel.asked.ifr_flags, 0);
    kernel.result = -1;
    set_address(AF_INET, "192.0.2.17");
    EXPECT_FALSE(interface.GetInterfaceState("x"));
    EXPECT_EQ(interface.GetIPAddressType("x"), -1);
    EXPECT_EQ(interface.GetIPv4SubnetMask("x"), "");
    EXPECT_EQ(interface.GetIPv4Address("x"), "");
    const auto lines = log_capture::take();
    for (const char* line :
         {"5:GetInterfaceState -- Failed to obtain the the Interface State for strInterface: [x]",
          "5:GetIPAddressType -- Failed to obtain the IP Address type for strInterface: [x]",
          "5:GetIPv4SubnetMask - Failed to obtain the IPv4 Subnet Mask for strInterface: [x]",
          "5:GetIPv4Address --- Failed to obtain the IP Address for strInterface: [x]"})
        EXPECT_EQ(log_capture::count(lines, line), 1) << line;
}

} // namespace cimple
