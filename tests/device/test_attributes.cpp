#include "tests/device/model_fixture.h"

#include "device/fcoe_adapter.h"
#include "device/iscsi_adapter.h"
#include "device/library/attribute_buffer.h"
#include "device/nic_adapter.h"

#include <cstring>

namespace cimple {

class Attributes_Test : public Model_Test {
protected:
    // A port needs an adapter to belong to; its attributes take no notice of it.
    NICAdapter& owner() {
        if (!m_owner)
            m_owner = std::make_unique<NICAdapter>("Vorlan", 0, identifier, info());
        return *m_owner;
    }
    NICPortAttributes nicPort() { return {owner(), 0, identifier, info()}; }
    FCoEPortAttributes fcoePort() { return {owner(), 0, identifier, info()}; }
    iSCSIPortAttributes iscsiPort() { return {owner(), 0, identifier, info()}; }

private:
    std::unique_ptr<NICAdapter> m_owner;
};

TEST_F(Attributes_Test, DefaultsStandWhenNothingIsOffered) {
    fake_library.add(1, NIC);
    const NICPortAttributes n = nicPort();
    EXPECT_EQ(n.FunctionalPortState, 1U);
    EXPECT_EQ(n.PhysicalPortState, 1U);
    EXPECT_EQ(n.PortType, 1U);
    EXPECT_EQ(n.SRIOVState, 3U);
    EXPECT_EQ(n.VEPAState, 2U);
    EXPECT_EQ(n.PortSpeed, 0U);
    const FCoEPortAttributes o = fcoePort();
    EXPECT_EQ(o.PortType, 1U);
    EXPECT_EQ(o.PhysicalPortState, 1U);
    EXPECT_EQ(o.FunctionalPortState, 0U);
    const iSCSIPortAttributes i = iscsiPort();
    EXPECT_EQ(i.PhysicalPortState, 1U);
    EXPECT_EQ(i.PortType, 1U);
}

TEST_F(Attributes_Test, IscsiPort) {
    Fake_Instance& instance = fake_library.add(1, ISCSI);
    std::memset(instance.initiator.name, 'n', sizeof instance.initiator.name); // no terminator
    std::strcpy(instance.initiator.authentication.targetCHAPName, "target");
    std::strcpy(instance.initiator.authentication.initiatorCHAPName, "initiator");
    instance.initiator.loginOptions.maxBurstLength = 262144;
    instance.network.address = {{10, 0, 0, 200}, 0, 0};
    instance.network.addressOrigin = 4;
    const struct {
        uint32 method;
        const char *text, *target, *initiator;
    } cases[] = {{0, "None", "Not Available", "Not Available"},
                 {1, "One-Way CHAP", "target", "Not Available"},
                 {2, "Mutual CHAP", "target", "initiator"},
                 {99, "Mutual CHAP", "target", "initiator"}};
    for (const auto& c : cases) {
        instance.initiator.authentication.method = c.method;
        const iSCSIPortAttributes a = iscsiPort();
        EXPECT_EQ(a.AuthenticationMethod, c.text);
        EXPECT_EQ(a.TargetCHAPName, c.target);
        EXPECT_EQ(a.InitiatorCHAPName, c.initiator);
    }
    const iSCSIPortAttributes a = iscsiPort();
    EXPECT_EQ(a.InitiatorName, std::string(AX_ISCSI_NAME_SIZE, 'n'));
    EXPECT_EQ(a.LoginOptions.maxBurstLength, 262144U);
    EXPECT_EQ(a.IPAddress, "10.0.0.200");
    EXPECT_EQ(a.SubnetMask, "0.0.0.0");
    EXPECT_EQ(a.AddressOrigin, 4);
}

TEST_F(Attributes_Test, AddressTexts) {
    const std::pair<AX_IPAddress, const char*> cases[] = {
        {{{255, 255, 255, 0, 9, 9}, 0, 0xFFFE}, "255.255.255.0"},
        {{{}, 0, 1}, ":::"},
        {{{0xFE, 0x80, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1}, 0, 1}, "fe80::1:"},
        {{{0x20, 0x01, 0x0D, 0xB8, 0, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0x10, 0}, 0, 1}, "201:db8:1::10:"},
        {{{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16}, 0, 1},
         "12:34:56:78:9a:bc:de:f10:"}};
    for (const auto& [address, text] : cases)
        EXPECT_EQ(addressText(address), text);
}

// ---- Values that lie ----

TEST_F(Attributes_Test, ValuesBesideTheBufferAreRefused) {
    static char elsewhere[] = "secret of the process";
    fake_library.add(1, NIC).adapterValues = {{516, "model"}, {526, number(7)}};
    for (std::ptrdiff_t offset : {-1, int{AX_ADAPTER_ATTRIBUTES_SIZE}, 1 << 20}) {
        fake_library.onValue = [offset](void* buffer, uint16_t, void*, uint16_t* length) -> void* {
            *length = 0xFFFF;
            return reinterpret_cast<void*>(reinterpret_cast<std::uintptr_t>(buffer) +
                                           static_cast<std::uintptr_t>(offset));
        };
        const NICAdapterAttributes a(identifier, info());
        EXPECT_EQ(a.Model, "");
        EXPECT_EQ(a.DeviceID, 0U);
        EXPECT_EQ(logged("3:ERROR: AX_GetAttributeValue points outside of its buffer (516)"), 1);
    }
    fake_library.onValue = [](void*, uint16_t, void*, uint16_t*) -> void* { return elsewhere; };
    EXPECT_EQ(NICAdapterAttributes(identifier, info()).Model, "");
}

TEST_F(Attributes_Test, ValuesAtTheVeryEndAreCutThere) {
    fake_library.add(1, NIC).adapterValues = {{516, "model"}, {526, number(7)}};
    fake_library.onValue = [](void* buffer, uint16_t identifier, void*, uint16_t* length) -> void* {
        *length = 0xFFFF;
        char* end = static_cast<char*>(buffer) + AX_ADAPTER_ATTRIBUTES_SIZE;
        std::memcpy(end - 3, "end", 3);
        return identifier == 516 ? end - 3 : end - 2;
    };
    const NICAdapterAttributes a(identifier, info());
    EXPECT_EQ(a.Model, "end");
    EXPECT_EQ(a.DeviceID, 0U) << "a number that does not fit is none";
}

} // namespace cimple
