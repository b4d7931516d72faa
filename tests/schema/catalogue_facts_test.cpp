// The catalogue against what is known of it from elsewhere: the published classes feature by
// feature, the dispatch order of the methods, the defaults.
#include "schema/generator/generator.h"

#include <gtest/gtest.h>

#include <fstream>
#include <map>
#include <set>
#include <sstream>

namespace {

const mof::Schema& schema() {
    static const generator::Catalogue loaded =
        generator::load_catalogue(MOF_FOLDER "/catalogue.mof");
    return loaded.schema;
}

// The row of the facts file that the class would have.
std::string row(const mof::Schema_Class& schema_class) {
    std::string keys, locals, names;
    int counts[3] = {};
    for (const mof::Schema_Feature& feature : schema_class.features) {
        names += (names.empty() ? "" : ",") + feature.name();
        if (feature.key)
            keys += (keys.empty() ? "" : ",") + feature.name();
        locals += feature.local ? '1' : '0';
        counts[static_cast<int>(feature.kind())]++;
    }
    std::ostringstream out;
    out << schema_class.name() << '\t' << (keys.empty() ? "-" : keys) << '\t'
        << (locals.empty() ? "-" : locals) << '\t' << counts[0] << '/' << counts[1] << '/'
        << counts[2] << '\t' << (names.empty() ? "-" : names);
    return out.str();
}

TEST(CatalogueFacts, PublishedClassesFeatureByFeature) {
    std::ifstream in(FACTS_FILE);
    std::size_t number = 0;
    for (std::string line; std::getline(in, line);) {
        if (line.empty() || line[0] == '#')
            continue;
        ASSERT_LT(number, schema().classes().size());
        EXPECT_EQ(row(*schema().classes()[number++]), line);
    }
    EXPECT_EQ(number, 142u);
}

// ---- Methods ----

const std::string SERVICE =
    "RequestStateChange StartService StopService ChangeAffectedElementsAssignedSequence";
const std::string DEVICE = "RequestStateChange SetPowerState Reset EnableDevice OnlineDevice "
                           "QuiesceDevice SaveProperties RestoreProperties";
const std::string ENDPOINT = "RequestStateChange BroadcastReset";

const std::map<std::string, std::string> DISPATCH = {
    {"CEEService", SERVICE},
    {"FIPService", SERVICE},
    {"NICSettingService", SERVICE},
    {"SoftwareInstallationService",
     SERVICE + " CheckSoftwareIdentity InstallFromSoftwareIdentity InstallFromByteStream "
               "InstallFromURI Reset SetPortEnabled SetSRIOVState GetHBAFeatures"},
    {"IPConfigurationService", SERVICE + " AddStaticIPv4Interface ApplySettingToLANEndpoint "
                                         "ApplySettingToIPProtocolEndpoint"},
    {"DumpService",
     SERVICE + " GenerateExtFATDump GetDumpFileNames DeleteDumpFiles SetAdvancedFATDumpTraceLevel "
               "RestoreAdvancedFATDumpSetting GenerateCoreDump RetrieveFATDump"},
    {"ChannelMgmtService",
     SERVICE + " SetCMMode SetCMChannelType SetCMBandwidths SetCMLPVIDs SetVEPAState"},
    {"DiagnosticTest", SERVICE + " RunDiagnostic RunDiagnosticService RunTest ClearResults "
                                 "DiscontinueTest"},
    {"HelpService", SERVICE + " GetHelp"},
    {"DriverParameterService", SERVICE + " DisableAllPrioViaLuns"},
    {"FCWWNService", SERVICE + " ChangeWWN RestoreWWN ReadWWN GetWWNCapability"},
    {"iSCSISettingService",
     SERVICE + " Ping AddTargetPortal RemoveTargetPortal AddTarget RemoveTarget TargetLogin "
               "TargetLogout setBootTargetSession setTargetLoginProperties setTargetProperties "
               "setTPLoginProperties"},
    {"PortController", DEVICE},
    {"EthernetPort", DEVICE},
    {"VirtualFCPort", DEVICE},
    {"NICLogicalDevice", DEVICE},
    {"DownEthernetPort", DEVICE},
    {"FCPort", DEVICE},
    {"StorageExtent", DEVICE},
    {"SCSIArbitraryLogicalUnit", DEVICE},
    {"LogicalDisk", DEVICE},
    {"StorageVolume", DEVICE},
    {"VirtualStorageVolume", DEVICE},
    {"SCSIProtocolController", DEVICE},
    {"PCIDevice", DEVICE + " BISTExecution"},
    {"TapeDrive", DEVICE + " LockMedia"},
    {"LANEndpoint", ENDPOINT},
    {"VLANEndpoint", ENDPOINT},
    {"IPProtocolEndpoint", ENDPOINT},
    {"SCSIProtocolInitiatorEndpoint", ENDPOINT},
    {"SCSIProtocolEndpoint", ENDPOINT},
    {"VirtualSCSIProtocolTargetEndpoint", ENDPOINT},
    {"iSCSIProtocolEndpoint", ENDPOINT},
    {"TCPProtocolEndpoint", ENDPOINT},
    {"iSCSITargetProtocolEndpoint", ENDPOINT},
    {"RemoteServiceAccessPoint", "RequestStateChange"},
    {"iSCSIConnection", "RequestStateChange"},
    {"iSCSISession", "RequestStateChange"},
    {"SoftwareInstallationServiceCapabilities", "CreateGoalSettings"},
    {"EnabledRecordLogCapabilities", "CreateGoalSettings"},
    {"EnabledLogicalElementCapabilities", "CreateGoalSettings"},
    {"EnabledLogicalIPProtocolEndpointCapabilities", "CreateGoalSettings"},
    {"DiagnosticServiceCapabilities", "CreateGoalSettings"},
    {"RecordLog", "RequestStateChange ClearLog SetLogParams"},
    {"DiagnosticsLog", "RequestStateChange ClearLog"},
    {"RegisteredProfile",
     "CloseConformantInstances OpenConformantInstances PullConformantInstances"},
    {"Card", "IsCompatible ConnectorPower"},
    {"ConcreteJob", "KillJob RequestStateChange GetError GetErrors"},
    {"FCPortStatistics", "ResetSelectedStats"},
    {"ISCSILoginStatistics", "ResetSelectedStats"},
    {"ISCSISessionFailures", "ResetSelectedStats"},
    {"ISCSISessionStatistics", "ResetSelectedStats"},
    {"RouteTable", "RefreshTable"},
    {"ARPTable", "RefreshTable"},
};

TEST(CatalogueFacts, MethodsInDispatchOrder) {
    std::size_t with_methods = 0;
    for (const auto& each : schema().classes()) {
        if (each->name().rfind("VLNMPCA_", 0) != 0)
            continue;
        std::string methods;
        for (const mof::Schema_Feature& feature : each->features)
            if (feature.kind() == mof::Feature_Kind::method)
                methods += (methods.empty() ? "" : " ") + feature.name();
        auto expected = DISPATCH.find(each->name().substr(8));
        EXPECT_EQ(methods, expected == DISPATCH.end() ? "" : expected->second) << each->name();
        with_methods += !methods.empty();
    }
    EXPECT_EQ(with_methods, DISPATCH.size());
}

// "In name type" of each parameter, "Out" and "InOut" likewise, return type last.
std::string signature(const char* class_name, const char* method) {
    const mof::Feature& feature = *schema().find(class_name)->find(method)->feature;
    std::string text;
    for (const mof::Parameter& parameter : feature.parameters)
        text += std::string(parameter.is_in() ? "In" : "") + (parameter.is_out() ? "Out" : "") +
                " " + parameter.name + " " +
                (parameter.target.empty() ? mof::type_name(parameter.type) : parameter.target) +
                (parameter.array ? "[]" : "") + ", ";
    return text + mof::type_name(feature.type);
}

TEST(CatalogueFacts, Signatures) {
    EXPECT_EQ(
        signature("VLNMPCA_SoftwareInstallationService", "SetPortEnabled"),
        "In Target CIM_LogicalPort, In PortEnabled boolean, InOut ConfigStatus uint8, uint32");
    EXPECT_EQ(signature("VLNMPCA_DumpService", "GetDumpFileNames"),
              "In Target CIM_LogicalPort, InOut DumpFiles string[], uint32");
    EXPECT_EQ(signature("VLNMPCA_FCWWNService", "ReadWWN"),
              "In Target VLNMPCA_FCPort, In Type uint16, InOut WWPN string, InOut WWNN string, "
              "InOut WWNOperationStatus uint16, uint32");
    EXPECT_EQ(signature("VLNMPCA_ARPTable", "RefreshTable"), "uint32");
    EXPECT_EQ(signature("VLNMPCA_ConcreteJob", "GetErrors"), "InOut Errors CIM_Error[], uint32");
    EXPECT_EQ(
        signature("VLNMPCA_EthernetPort", "RequestStateChange"),
        "In RequestedState uint16, Out Job CIM_ConcreteJob, In TimeoutPeriod datetime, uint32");
}

// ---- Defaults ----

std::string text_of(const mof::Value& value) {
    switch (value.kind) {
    case mof::Value::Kind::boolean:
        return value.boolean ? "true" : "false";
    case mof::Value::Kind::integer:
        return std::to_string(value.magnitude);
    default:
        return value.text;
    }
}

const std::map<std::string, std::set<std::string>> DEFAULTS = {
    {"EnabledState", {"5"}},
    {"EnabledDefault", {"2"}},
    {"RequestedState", {"12", "5"}},
    {"TransitioningToState", {"12"}},
    {"LogState", {"4"}},
    {"OverwritePolicy", {"0"}},
    {"IsMaximum", {"0"}},
    {"IsMinimum", {"0"}},
    {"IsPending", {"0"}},
    {"AccessContext", {"0"}},
    {"OrderOfAccess", {"0"}},
    {"ErrorSourceFormat", {"0"}},
    {"QueryTimeout", {"0"}},
    {"AddressOrigin", {"0", "3"}},
    {"IsComposite", {"true"}},
    {"IsEntity", {"false"}},
    {"IsLargeBuildNumber", {"false"}},
    {"NonDestructive", {"false"}},
    {"Primordial", {"false"}},
    {"Directionality", {"2"}},
    {"PortAvailability", {"2"}},
    {"RemovalConditions", {"2"}},
    {"JobRunTimes", {"1"}},
    {"NameFormat", {"12"}},
    {"NameNamespace", {"8"}},
    {"ProtocolIFType", {"4096", "4111"}},
    {"SupportedTestWarnings", {"3"}},
    {"TypeOfRoute", {"3"}},
    {"ConsumedResourceUnits", {"count"}},
    {"VirtualQuantityUnits", {"count"}},
    {"SampleInterval", {"00000000000000.000000:000"}},
    {"TimeBeforeRemoval", {"00000000000500.000000:000"}},
};

TEST(CatalogueFacts, DefaultsAreTheseAndNoOthers) {
    std::map<std::string, std::set<std::string>> found;
    for (const auto& each : schema().classes())
        for (const mof::Schema_Feature& feature : each->features)
            if (feature.default_value)
                found[feature.name()].insert(text_of(*feature.default_value));
    EXPECT_EQ(found, DEFAULTS);
}

std::string default_of(const char* class_name, const char* property) {
    const mof::Schema_Feature* feature = schema().find(class_name)->find(property);
    return feature->default_value ? text_of(*feature->default_value) : "none";
}

TEST(CatalogueFacts, DefaultsThatDifferByClass) {
    const struct {
        const char* class_name;
        const char* property;
        const char* value;
    } cases[] = {
        {"VLNMPCA_EthernetPort", "RequestedState", "12"},
        {"VLNMPCA_iSCSIConnection", "RequestedState", "5"},
        {"VLNMPCA_iSCSISession", "RequestedState", "5"},
        {"VLNMPCA_iSCSISession", "EnabledState", "5"}, // overridden without a default of its own
        {"VLNMPCA_LANEndpoint", "EnabledState", "5"},
        {"VLNMPCA_IPProtocolEndpoint", "AddressOrigin", "0"},
        {"VLNMPCA_StaticIPAssignmentSettingData", "AddressOrigin", "3"},
        {"VLNMPCA_IPProtocolEndpoint", "ProtocolIFType", "4096"},
        {"VLNMPCA_TCPProtocolEndpoint", "ProtocolIFType", "4111"},
        {"VLNMPCA_LANEndpoint", "ProtocolIFType", "none"},
        {"VLNMPCA_LogicalDisk", "NameFormat", "12"},
        {"VLNMPCA_StorageVolume", "NameFormat", "none"},
    };
    for (const auto& each : cases)
        EXPECT_EQ(default_of(each.class_name, each.property), each.value)
            << each.class_name << "." << each.property;
}

} // namespace
