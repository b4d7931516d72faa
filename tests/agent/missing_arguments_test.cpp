// What a caller of this library's own code leaves out, no client can: the object manager's side
// gives every argument. So each operation and each change is asked here without them.
#include "agent/associations.h"
#include "operations/method_wrapper.h"
#include "services/bridging/provider.h"
#include "services/channels/provider.h"
#include "services/configuration/provider.h"
#include "services/diagnostics/settings_provider.h"
#include "services/driver_parameters/provider.h"
#include "services/dump/settings_provider.h"
#include "services/fip/provider.h"
#include "services/ip_tables/provider.h"
#include "services/iscsi_settings/provider.h"
#include "services/nic_settings/provider.h"
#include "services/phy/provider.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

namespace {

using Missing_Arguments = Agent_Test;
using W = VLN_MethodWrapper;

const HBA_WWN NAME{{0x10, 0, 0, 0x90, 0xFA, 0, 0, 1}};

// The adapter's name, nothing else that can be left out, and zeros.
template <class T>
struct Least {
    using Value = std::decay_t<T>;
    static Value& value() {
        static Value least{};
        return least;
    }
};
template <>
struct Least<const HBA_WWN*> {
    static const HBA_WWN* value() { return &NAME; }
};

template <class... Arguments>
AX_STATUS ask(AX_STATUS (*operation)(Arguments...)) {
    return operation(Least<Arguments>::value()...);
}

#define EXPECT_REFUSED(operation) EXPECT_EQ(ask(&W::operation), AX_STATUS_INVALID_ARGUMENT)

TEST_F(Missing_Arguments, AnOperationThatHasNowhereToAnswerToAsksNobody) {
    EXPECT_REFUSED(GetLibraryVersion);
    EXPECT_REFUSED(GetNIMALibVersion);
    EXPECT_REFUSED(GetHBAFeatureList);
    EXPECT_REFUSED(ListiSCSITargets);
    EXPECT_REFUSED(ListiSCSISessions);
    EXPECT_REFUSED(GetiSCSILuns);
    EXPECT_REFUSED(GetIscsiInitiatorProps);
    EXPECT_REFUSED(GetIscsiPortStatistics);
    EXPECT_EQ(ask(&W::Ping), AX_STATUS_ERROR);
    EXPECT_REFUSED(GetiSNSServer);
    EXPECT_REFUSED(AddTargetPortal);
    EXPECT_REFUSED(GetTargetPortalProperties);
    EXPECT_REFUSED(GetTargetLoginAuthProperties);
    EXPECT_REFUSED(discoverARPTable);
    EXPECT_REFUSED(discoverRoute);
    EXPECT_REFUSED(GetPhyPortSpeedAttributesValues);
    EXPECT_REFUSED(SetPhyPortSpeed);
    EXPECT_REFUSED(GetFirmwareOnFlash);
    EXPECT_REFUSED(SetPortEnabled);
    EXPECT_REFUSED(GetSRIOVState);
    EXPECT_REFUSED(GetNICNetworkBootParams);
    EXPECT_REFUSED(SetNICNetworkBootParams);
    EXPECT_REFUSED(GetQosInfo);
    EXPECT_REFUSED(GetVirtualFuncList);
    EXPECT_REFUSED(GetVirtualFuncPropertyList);
    EXPECT_REFUSED(ListVPorts);
    EXPECT_REFUSED(ListVPortAttributes);
    EXPECT_REFUSED(ListVPortTargets);
    EXPECT_REFUSED(ListVPortLuns);
    EXPECT_REFUSED(VPortLunAttr);
    EXPECT_REFUSED(ListVMfromVPort);
    EXPECT_REFUSED(FCoEGetDriverParam);
    EXPECT_REFUSED(GetOASLunList);
    EXPECT_REFUSED(vlncimGetCoreDump);
    EXPECT_REFUSED(GetDumpFileNames);
    EXPECT_REFUSED(vlncimGetDumpDirectory);
    EXPECT_REFUSED(vlncimSetDumpDirectory);
    EXPECT_REFUSED(vlncimGetRetentionCount);
    EXPECT_REFUSED(GetDeadNICPorts);
    EXPECT_REFUSED(GetExtFATAdvancedData);
    EXPECT_REFUSED(StartLoopBackTest);
    EXPECT_REFUSED(StartEchoTest);
    EXPECT_REFUSED(StartCableTest);
    EXPECT_REFUSED(vlncimGetCEEParams);
    EXPECT_REFUSED(vlnGetFIPParams);
    EXPECT_REFUSED(GetFcfList);
    EXPECT_REFUSED(GetWWNCapability);
    EXPECT_REFUSED(ReadWWN);
    EXPECT_REFUSED(ChangeWWN);
    EXPECT_REFUSED(RestoreWWN);
    EXPECT_REFUSED(GetChannelMgmtCNAInfo);
    EXPECT_REFUSED(GetChannelMgmtPortInfo);
    EXPECT_REFUSED(HasFeature);
    EXPECT_REFUSED(GetAdpaterPortConfig);
    EXPECT_REFUSED(SetAdpaterPortConfig);
    EXPECT_REFUSED(ListProfiles);
    EXPECT_REFUSED(GetAdapterPersonalities);
}

#undef EXPECT_REFUSED

// Without what is to be changed, and without what it is to become.
template <class C>
void expect_unchangeable(sint32 status) {
    typename Provider_For<C>::type provider;
    const auto one = make_instance<C>();
    EXPECT_EQ(provider.modify_instance(nullptr, one.get()), status) << C::static_meta_class.name;
    EXPECT_EQ(provider.modify_instance(one.get(), nullptr), status) << C::static_meta_class.name;
}

TEST_F(Missing_Arguments, AChangeNeedsWhatItChangesAndWhatItBecomes) {
    const Loaded_Agent agent;
    expect_unchangeable<VLNMPCA_PGData>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_DcbxLldpData>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_PFCThrottle>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_PortConfigData>(MODIFY_INSTANCE_FAILED);
    expect_unchangeable<VLNMPCA_ProviderConfigSetting>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_DiagnosticSettingData>(MODIFY_INSTANCE_FAILED);
    expect_unchangeable<VLNMPCA_DriverParameterSettingData>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_ExtFATDumpData>(MODIFY_INSTANCE_FAILED);
    expect_unchangeable<VLNMPCA_FIPData>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_ISCSIInitiatorPropertiesData>(MODIFY_INSTANCE_FAILED);
    expect_unchangeable<VLNMPCA_ISCSIQOSData>(MODIFY_INSTANCE_FAILED);
    expect_unchangeable<VLNMPCA_ISCSIiSNSData>(MODIFY_INSTANCE_FAILED);
    expect_unchangeable<VLNMPCA_NICNetworkBootData>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_NICQOSData>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_PHYPhysicalComponentData>(MODIFY_INSTANCE_INVALID_PARAMETER);
    expect_unchangeable<VLNMPCA_PortController>(MODIFY_INSTANCE_INVALID_PARAMETER);
    EXPECT_EQ(Provider_For<VLNMPCA_ExtFATDumpAdvancedData>::type().modify_instance(nullptr, nullptr),
              MODIFY_INSTANCE_FAILED);
    Driver_Parameter_Provider parameters;
    EXPECT_EQ(parameters.create_instance(nullptr), CREATE_INSTANCE_FAILED);
    EXPECT_EQ(parameters.delete_instance(nullptr), DELETE_INSTANCE_FAILED);
}

} // namespace

} // namespace cimple
