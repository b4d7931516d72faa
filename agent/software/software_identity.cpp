#include "agent/software/software_identity.h"

#include "agent/associations.h"
#include "agent/text.h"
#include "classes/CIM_ElementSoftwareIdentity.h"
#include "foundation/log.h"
#include "operations/method_wrapper.h"

#include <algorithm>
#include <cstdlib>

namespace cimple {

namespace {

constexpr uint16 TARGET_OTHER = 1; // CIM_SoftwareIdentity.TargetOSTypes, as all numbers below
constexpr uint16 TARGET_LINUX = 36;
constexpr uint16 TARGET_VMWARE = 104;

// A condition on the place of a word. A word that is missing is not first, and so fits NOT_FIRST:
// that is meant, since consoles know the codes that come of it.
enum Place_In_Text : bool { NOT_FIRST = false, FIRST = true };

struct Word_Rule {
    const char* word; // null: no further condition
    Place_In_Text place;
};

struct Flavour {
    Word_Rule words[3]; // all must hold
    uint16 code;
};

constexpr Flavour LINUX_FLAVOURS[] = {
    {{{"RH", NOT_FIRST}, {"x86_64", NOT_FIRST}}, 80},
    {{{"RH", NOT_FIRST}}, 79},
    {{{"SL", NOT_FIRST}, {"x86_64", NOT_FIRST}}, 85},
    {{{"SL", NOT_FIRST}}, 84},
};

constexpr Flavour WINDOWS_FLAVOURS[] = {
    {{{"2008", NOT_FIRST}, {"x64", NOT_FIRST}, {"R2", FIRST}}, 77},
    {{{"2008", NOT_FIRST}, {"x64", FIRST}, {"R2", FIRST}}, 76},
    {{{"2008", NOT_FIRST}, {"R2", NOT_FIRST}}, 103},
};

bool holds(const Word_Rule& rule, const String& system) {
    return !rule.word || (system.find(rule.word) == 0) == (rule.place == FIRST);
}

bool fits(const Flavour& flavour, const String& system) {
    return std::all_of(std::begin(flavour.words), std::end(flavour.words),
                       [&](const Word_Rule& rule) { return holds(rule, system); });
}

bool contains(const String& system, const char* word) {
    return system.find(word) != -1;
}

void append_unknown(CIM_SoftwareIdentity& software, const String& system, const char* line) {
    VLN_LOG(VLN_DBG, "%s", line);
    software.TargetOSTypes.append(TARGET_OTHER);
    software.TargetOperatingSystems.append(system);
}

// The code of the first flavour that fits.
template <std::size_t N>
void append_flavour(CIM_SoftwareIdentity& software, const String& system,
                    const Flavour (&flavours)[N], const char* unknown) {
    const auto* flavour = std::find_if(std::begin(flavours), std::end(flavours),
                                       [&](const Flavour& each) { return fits(each, system); });
    if (flavour != std::end(flavours))
        software.TargetOSTypes.append(flavour->code);
    else
        append_unknown(software, system, unknown);
}

} // namespace

void append_identity(CIM_SoftwareIdentity& software, const char* type, const String& value) {
    software.IdentityInfoType.append(String(type));
    software.IdentityInfoValue.append(value);
}

Ref<VLNMPCA_SoftwareIdentity> driver_identity_instance(const Driver_Texts& texts,
                                                       const CNAAdapterAttributes& adapter) {
    auto identity = make_instance<VLNMPCA_SoftwareIdentity>();
    const String name =
        format_text("%s v%s", adapter.DriverName.c_str(), adapter.DriverVersion.c_str());
    identity->Description.set(texts.description);
    identity->ElementName.set(name);
    identity->Name.set(name);
    identity->InstanceID.set(format_text("%s: Driver %s", texts.id_head, name.c_str()));
    identity->VersionString.set(text(adapter.DriverVersion));
    identity->Manufacturer.set(text(adapter.Manufacturer));
    identity->Classifications.append(SOFTWARE_DRIVER);
    identity->ClassificationDescriptions.append(String(texts.kind));
    identity->IsEntity.set(true);
    append_identity(*identity, "VORLAN:DRIVER_NAME", text(adapter.DriverName));
    append_identity(*identity, "VORLAN:DRIVER_VERSION", text(adapter.DriverVersion));
    return identity;
}

Association_Details software_status(std::initializer_list<uint16> statuses) {
    return [statuses](Instance& association) {
        if (auto* identity = cast<CIM_ElementSoftwareIdentity>(&association))
            for (uint16 status : statuses)
                identity->ElementSoftwareStatus.append(status);
    };
}

void setTargetOSTypes(CIM_SoftwareIdentity& software) {
    VLN_LOG(VLN_DBG, "Entering setTargetOSTypes()");
    char system[VLN_MethodWrapper::TARGET_OS_SIZE] = "";
    if (const AX_STATUS status = VLN_MethodWrapper::getTargetOS_info(system))
        VLN_LOG(VLN_ERR, "getTargetOS_info failed with %d", status);
    else
        append_target_system(software, text(system));
}

void append_target_system(CIM_SoftwareIdentity& software, const String& system) {
    if (contains(system, "Linux")) {
        VLN_LOG(VLN_DBG, "Entering Linux Section");
        software.TargetOSTypes.append(TARGET_LINUX);
        append_flavour(software, system, LINUX_FLAVOURS, "Unknown flavour of Linux");
    } else if (contains(system, "VMware")) {
        software.TargetOSTypes.append(TARGET_VMWARE);
    } else if (contains(system, "Windows")) {
        append_flavour(software, system, WINDOWS_FLAVOURS, "Unknown flavour of Windows");
    } else {
        append_unknown(software, system, "Unsupported platforms");
    }
}

std::array<uint16, 4> dotted_version(const std::string& version) {
    std::array<uint16, 4> numbers{};
    std::size_t at = 0;
    for (uint16& number : numbers) {
        const std::size_t end = std::min(version.find('.', at), version.size());
        number =
            static_cast<uint16>(std::strtol(version.substr(at, end - at).c_str(), nullptr, 10));
        at = end + 1; // behind the text if there was no dot
    }
    return numbers;
}

} // namespace cimple
