// What a client sees of the two-port card, class by class and property by property.
#include "tests/road/road.h"

using road::Road;
using road::text_of;

namespace {

struct Expected {
    const char* property;
    const char* first;  // of the first port
    const char* second; // of the second
};

// "-" stands for a property that has no value.
constexpr Expected ETHERNET_PORT[] = {
    {"PortNumber", "0", "1"},
    {"InstanceID", "VMC-2210:100002564C000000", "VMC-2210:100002564C000101"},
    {"Description", "Vorlan VMC-2210 10Gb 2-port PCIe Converged Network Adapter",
     "Vorlan VMC-2210 10Gb 2-port PCIe Converged Network Adapter"},
    {"SystemCreationClassName", "CIM_ComputerSystem", "CIM_ComputerSystem"},
    {"ElementName", "vln0p0", "vln0p1"},
    {"Name", "vln0p0", "vln0p1"},
    {"CreationClassName", "VLNMPCA_EthernetPort", "VLNMPCA_EthernetPort"},
    {"DeviceID", "100002564C000000", "100002564C000101"},
    {"OperationalStatus", "{2}", "{2}"},
    {"StatusDescriptions", "{OK}", "{OK}"},
    {"PermanentAddress", "02564c000000", "02564c000101"},
    {"NetworkAddresses", "{02564c000000}", "{02564c000101}"},
    {"LinkTechnology", "2", "2"},
    {"Capabilities", "{2, 3, 4}", "{2, 3, 4}"},
    {"EnabledCapabilities", "{3, 4}", "{3, 4}"},
    {"RequestedState", "12", "12"},
    {"EnabledState", "2", "2"},
    {"Speed", "10000000000", "10000000000"},
    {"MaxSpeed", "10000000000", "10000000000"},
    {"FunctionalPortSpeed", "10 Gbps", "10 Gbps"},
    {"PortType", "0", "0"},
    {"SupportedMaximumTransmissionUnit", "9000", "9000"},
    {"ActiveMaximumTransmissionUnit", "1500", "1500"},
    {"Generation", "0", "1"},
    {"OtherIdentifyingInfo", "{VR10420117:00, VR10420117:0, VR10420117}",
     "{VR10420117:00, VR10420117:1, VR10420117}"},
    {"IdentifyingDescriptions",
     "{SerialNumber + Sub-AdapterID, SerialNumber:PhysicalPortNumber, "
     "SerialNumber}",
     "{SerialNumber + Sub-AdapterID, SerialNumber:PhysicalPortNumber, SerialNumber}"},
    {"FunctionalQosBandwidth", "10 Gbps", "10 Gbps"},
    {"FunctionalQosMinBandwidth", "1 Gbps", "1 Gbps"},
    {"PCIBusNumber", "16", "16"},
    {"OtherEnabledState", "-", "-"},
    {"FullDuplex", "-", "-"},
};

TEST(Enumeration, EthernetPortShowsEveryPropertyOfItsPort) {
    Road road;
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    ASSERT_EQ(ports.size(), 2u);
    for (const Expected& row : ETHERNET_PORT) {
        EXPECT_EQ(text_of(ports[0], row.property), row.first) << row.property;
        EXPECT_EQ(text_of(ports[1], row.property), row.second) << row.property;
    }
}

// Class and number of instances: one card with two physical ports, a NIC function on each. What is
// not listed has none.
const std::map<std::string, std::size_t> TWO_PORT_CENSUS = {
    {"VLNMPCA_BindsToLANEndpoint", 2},
    {"VLNMPCA_Card", 1},
    {"VLNMPCA_CardConformsToProfile", 3},
    {"VLNMPCA_CardContainsChip", 1},
    {"VLNMPCA_CardRealizesPortController", 2},
    {"VLNMPCA_ChassisContainsCard", 1},
    {"VLNMPCA_Chip", 1},
    {"VLNMPCA_ComputerSystemConformsToProfile", 13}, // every profile but IP Interface
    {"VLNMPCA_ConcreteIdentity", 2},
    {"VLNMPCA_ConnectorDependsOnChip", 2},
    {"VLNMPCA_Container", 2},
    {"VLNMPCA_ControlledBy", 2},
    {"VLNMPCA_ElementCapabilities", 1},
    {"VLNMPCA_ElementSoftwareIdentity", 2},
    {"VLNMPCA_ElementVPD", 2},
    {"VLNMPCA_EnabledLogicalElementCapabilities", 2},
    {"VLNMPCA_EnabledLogicalIPProtocolEndpointCapabilities", 2},
    {"VLNMPCA_EnabledRecordLogCapabilities", 1},
    {"VLNMPCA_EndpointCapabilities", 2},
    {"VLNMPCA_EthernetPort", 2},
    {"VLNMPCA_EthernetPortSoftwareIdentity", 2},
    {"VLNMPCA_EthernetPortSystemDevice", 2},
    {"VLNMPCA_FRUElementVPD", 1},
    {"VLNMPCA_FRUVitalProductData", 1},
    {"VLNMPCA_FirmwareElementSoftwareIdentity", 1},
    {"VLNMPCA_FlashImageSoftwareIdentity", 1},
    {"VLNMPCA_HostedIPConfigurationService", 1},
    {"VLNMPCA_HostedIPProtocolEndpoint", 2},
    {"VLNMPCA_HostedInstallationService", 1},
    {"VLNMPCA_HostedLANEndpoint", 2},
    {"VLNMPCA_IPAssignmentSettingData", 2},
    {"VLNMPCA_IPConfigurationService", 1},
    {"VLNMPCA_IPConfigurationServiceAffectsElement", 2},
    {"VLNMPCA_IPProtocolEndpoint", 2},
    {"VLNMPCA_IPProtocolEndpointCapabilities", 2},
    {"VLNMPCA_IPProtocolEndpointConformsToProfile", 2},
    {"VLNMPCA_IPProtocolEndpointIPAssignmentSettingData", 2},
    {"VLNMPCA_InstallServiceAffectsChip", 1},
    {"VLNMPCA_InstallServiceAffectsFirmwareIdentity", 1},
    {"VLNMPCA_InstallServiceAffectsSystem", 1},
    {"VLNMPCA_InstallServiceConformsToProfile", 1},
    {"VLNMPCA_InstalledSoftwareIdentity", 2}, // provider, firmware
    {"VLNMPCA_LANEndpoint", 2},
    {"VLNMPCA_MPCAPortFlashImageSoftwareIdentity", 2},
    {"VLNMPCA_NICCapabilities", 2},
    {"VLNMPCA_NICPortConformsToProfile", 4}, // two profiles
    {"VLNMPCA_NICSAPImplementation", 2},
    {"VLNMPCA_OrderedIPAssignmentSettingData", 2},
    {"VLNMPCA_PCIDevice", 2},
    {"VLNMPCA_PCIElementConformsToProfile", 2},
    {"VLNMPCA_PhysicalConnector", 2},
    {"VLNMPCA_PortController", 2},
    {"VLNMPCA_PortControllerConformsToProfile", 2},
    {"VLNMPCA_PortControllerRealizes", 2},
    {"VLNMPCA_PortControllerSystemDevice", 2},
    {"VLNMPCA_Product", 1},
    {"VLNMPCA_ProductPhysicalComponent", 1},
    {"VLNMPCA_ProductPhysicalConnector", 2},
    {"VLNMPCA_ProductPortControllerComponent", 2},
    {"VLNMPCA_ProviderConfigSetting", 3},
    {"VLNMPCA_ProviderElementSoftwareIdentity", 1},
    {"VLNMPCA_ProviderUseOfLog", 2},
    {"VLNMPCA_Realizes", 2},
    {"VLNMPCA_RecordLog", 2}, // the provider's and the library's
    {"VLNMPCA_RecordLogCapabilities", 1},
    {"VLNMPCA_RecordLogConformsToProfile", 2},
    {"VLNMPCA_ReferencedProfile", 12},
    {"VLNMPCA_RegisteredProfile", 14},
    {"VLNMPCA_RemoteAccessAvailableToElement", 2},
    {"VLNMPCA_RemoteHostedAccessPoint", 1},
    {"VLNMPCA_RemoteServiceAccessPoint", 1}, // the gateway of both ports
    {"VLNMPCA_SoftwareConformsToProfile", 3},
    {"VLNMPCA_SoftwareIdentity", 3}, // provider, driver, firmware
    {"VLNMPCA_SoftwareInstallationService", 1},
    {"VLNMPCA_SoftwareInstallationServiceCapabilities", 1},
    {"VLNMPCA_StaticIPAssignmentSettingData", 2},
    {"VLNMPCA_StaticIPProtocolEndpointIPAssignmentSettingData", 2},
    {"VLNMPCA_SystemDevice", 2},
    {"VLNMPCA_Transceiver", 2},
    {"VLNMPCA_TransceiverComponent", 2},
    {"VLNMPCA_VitalProductData", 2},
};

TEST(Enumeration, CensusOfTheTwoPortCard) {
    Road road;
    EXPECT_EQ(road.manager().provider_classes().size(), 299u);
    EXPECT_EQ(road.census(), TWO_PORT_CENSUS);
}

TEST(Enumeration, TheOldRecordCallShowsTheSameHost) {
    Road road({.scenario = "old-records.json"});
    EXPECT_EQ(road.census(), TWO_PORT_CENSUS);
}

// Both ends of each association name instances that a get finds.
TEST(Enumeration, AssociationsJoinWhatExists) {
    Road road;
    std::size_t ends = 0;
    for (const host::Class* known : road.manager().provider_classes()) {
        if (!known->is_association)
            continue;
        for (const host::Instance& association : road.enumerate(known->name))
            for (const host::Named_Value& property : association.properties) {
                const host::ObjectPath* end = property.value.as_reference();
                if (!end || !end->class_name.starts_with("VLNMPCA_"))
                    continue;
                const auto found = road.manager().get(*end);
                EXPECT_TRUE(found.ok()) << known->name << "." << property.name;
                ++ends;
            }
    }
    EXPECT_EQ(ends, 210u); // the census, without the ends that are the system or the chassis
}

TEST(Enumeration, NamesAndGetAgreeWithInstances) {
    Road road;
    const auto names = road.manager().enumerate_names("VLNMPCA_PortController");
    ASSERT_TRUE(names.ok());
    const auto instances = road.enumerate("VLNMPCA_PortController");
    ASSERT_EQ(names.value.size(), instances.size());
    for (std::size_t i = 0; i < instances.size(); ++i) {
        EXPECT_EQ(names.value[i], instances[i].path);
        const auto got = road.manager().get(names.value[i]);
        ASSERT_TRUE(got.ok());
        EXPECT_EQ(got.value, instances[i]);
    }
    host::ObjectPath nobody = names.value[0];
    host::set(nobody.keys, "DeviceID", host::Value::text("no such device"));
    EXPECT_EQ(road.manager().get(nobody).status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST(Enumeration, APropertyListNarrowsWhatIsSet) {
    Road road;
    const auto reply = road.manager().enumerate("VLNMPCA_Card", {{"Model", "NoSuchProperty"}});
    ASSERT_TRUE(reply.ok());
    ASSERT_EQ(reply.value.size(), 1u);
    EXPECT_EQ(text_of(reply.value[0], "Model"), "VMC-2210");
    EXPECT_EQ(text_of(reply.value[0], "Tag"),
              "0f4a2c117d3e4b529a0102564c000001"); // keys come along
    EXPECT_EQ(text_of(reply.value[0], "Manufacturer"), "-");
}

TEST(Enumeration, PatternClassesRefuseChanges) {
    Road road;
    const auto cards = road.enumerate("VLNMPCA_Card");
    ASSERT_EQ(cards.size(), 1u);
    EXPECT_EQ(road.manager().create(cards[0]).status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(road.manager().modify(cards[0]).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(road.manager().remove(cards[0].path).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(road.manager().enumerate("VLNMPCA_Crad").status.rc, CMPI_RC_ERR_INVALID_CLASS);
}

TEST(Enumeration, MethodsNobodyWroteAreNotSupported) {
    Road road;
    const auto cards = road.enumerate("VLNMPCA_Card");
    ASSERT_EQ(cards.size(), 1u);
    const auto known = road.manager().invoke(cards[0].path, "ConnectorPower",
                                             {{"PoweredOn", host::Value::boolean(true)}});
    EXPECT_EQ(known.status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(road.manager().invoke(cards[0].path, "Explode", {}).status.rc,
              CMPI_RC_ERR_METHOD_NOT_FOUND);
}

} // namespace
