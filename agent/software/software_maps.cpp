// The software identities of the provider itself and of the NIC driver.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/profiles/profile_maps.h"
#include "agent/software/software_identity.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "agent/version.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"

namespace cimple {

namespace {

constexpr char PROVIDER_NAME[] = "Vorlan CMPI MPCA Provider";

String provider_version() {
    return format_text("%d.%d.%d-%d", VLN_PROVIDER_VERSION_NUMBERS);
}

String provider_element_name() {
    return format_text("%s v%s", PROVIDER_NAME, provider_version().c_str());
}

AX_STATUS nima_version(std::string* version) {
    return VLN_MethodWrapper::GetNIMALibVersion(version);
}
AX_STATUS qdc_version(std::string* version) {
    return VLN_MethodWrapper::GetLibraryVersion("QDC", version);
}
AX_STATUS axapi_version(std::string* version) {
    return VLN_MethodWrapper::GetLibraryVersion("AXAPI", version);
}

struct Library_Version {
    Property<String> VLNMPCA_SoftwareIdentity::*property;
    AX_STATUS (*query)(std::string* version);
    const char* failed;
};

constexpr Library_Version LIBRARY_VERSIONS[] = {
    {&VLNMPCA_SoftwareIdentity::LibNIMAVersion, nima_version, "GetNIMALibVersion"},
    {&VLNMPCA_SoftwareIdentity::LibQDCVersion, qdc_version, "LibQDCVersion"},
    {&VLNMPCA_SoftwareIdentity::LibAXAPIVersion, axapi_version, "LibAXAPIVersion"},
};

void set_library_versions(VLNMPCA_SoftwareIdentity& identity) {
    for (const Library_Version& row : LIBRARY_VERSIONS) {
        std::string version;
        if (const AX_STATUS status = row.query(&version))
            VLN_LOG(VLN_DBG, "Failed to get %s: returned with error - %d", row.failed, status);
        else
            (identity.*row.property).set(text(version));
    }
}

Ref<VLNMPCA_SoftwareIdentity> provider_identity_instance() {
    auto identity = make_instance<VLNMPCA_SoftwareIdentity>();
    identity->Description.set(PROVIDER_NAME);
    identity->Name.set(PROVIDER_NAME);
    identity->ElementName.set(provider_element_name());
    identity->InstanceID.set(provider_element_name());
    identity->VersionString.set(provider_version());
    identity->Manufacturer.set("Vorlan Corporation");
    identity->Classifications.append(SOFTWARE_OTHER);
    identity->ClassificationDescriptions.append(String("CMPI MPCA CIM Provider"));
    identity->IsEntity.set(true);
    identity->MajorVersion.set(PROVIDER_MAJOR);
    identity->MinorVersion.set(PROVIDER_MINOR);
    identity->RevisionNumber.set(PROVIDER_REVISION);
    identity->BuildNumber.set(PROVIDER_BUILD);
    identity->ReleaseDate.set(Datetime::now());
    append_identity(*identity, "SoftwareID", provider_version());
    append_identity(*identity, "SoftwareStatus", "2");
    setTargetOSTypes(*identity);
    set_library_versions(*identity);
    return identity;
}

} // namespace

void Adapter_Map_Builder::createProviderIdentity() {
    const auto* identity =
        insert_instance(_agent.m_VLNMPCA_SoftwareIdentity_map, provider_identity_instance());
    if (!identity)
        return;
    Profile_Maps profiles(_agent);
    profiles.createInstalledSoftware(
        format_text("Software Identity (CMPI MPCA Provider v%s)", provider_version().c_str()),
        identity, _system);
    profiles.createSoftwareConforms("CMPI MPCA Provider, Software", PROFILE_SOFTWARE, identity);
}

const VLNMPCA_SoftwareIdentity*
find_provider_identity(const Instance_Map<VLNMPCA_SoftwareIdentity>& store) {
    return find_by_key(store, &VLNMPCA_SoftwareIdentity::InstanceID, provider_element_name());
}

// All NIC functions run under one driver: the first one's.
uint32 Adapter_Map_Builder::createDriverIdentity() {
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (adapter->getAdapterType() == ADAPTER_NIC)
            return CreateDriverIdentity(static_cast<NICAdapter&>(*adapter));
        VLN_LOG(VLN_DBG, "Skippping Non NIC Adapter: [%s]", adapter->getAdapterName().c_str());
    }
    return MAP_OK;
}

uint32 Adapter_Map_Builder::CreateDriverIdentity(NICAdapter& adapter) {
    const auto& attributes =
        static_cast<const NICAdapterAttributes&>(*adapter.getAdapterAttributes());
    auto driver =
        driver_identity_instance({"CNA Driver", "Vorlan CNA Driver", "VLN CNA"}, attributes);
    append_identity(*driver, "VORLAN:VNICD_DRIVER_TYPE",
                    format_text("%d", static_cast<int>(adapter.getDriverType())));
    const auto* identity = insert_instance(_agent.m_VLNMPCA_SoftwareIdentity_map, driver);
    if (!identity)
        return END_PASS;
    Profile_Maps(_agent).createSoftwareConforms("Driver, Software Inventory",
                                                PROFILE_SOFTWARE_INVENTORY, identity);
    return MAP_OK;
}

} // namespace cimple
