#include "agent/san/logical_unit_maps.h"

#include "agent/associations.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/CIM_SCSIInitiatorTargetLogicalUnitPath.h"
#include "classes/VLNMPCA_LogicalDisk.h"
#include "classes/VLNMPCA_SCSIArbitraryLogicalUnit.h"
#include "classes/VLNMPCA_StorageExtent.h"
#include "classes/VLNMPCA_StorageVolume.h"
#include "classes/VLNMPCA_TapeDrive.h"

#include <limits>

namespace cimple {

namespace {

constexpr uint16 DATA_ORGANIZATION_OTHER = 1; // CIM_StorageExtent.DataOrganization
constexpr uint16 DEVICE_TYPE_OTHER = 1;       // CIM_SCSIArbitraryLogicalUnit.DeviceType

// ---- Names of a volume ----

// How the identification page names a unit; the index is the type of its descriptor.
struct Name_Format {
    uint16 name_format;    // CIM_StorageExtent.NameFormat
    uint16 name_namespace; // CIM_StorageExtent.NameNamespace
    const char* other_name_format;
    const char* other_name_namespace;
};

// A misspelt text, a pair that differs and a type's name that is no prose: management software has
// seen them so, and matches them.
constexpr Name_Format NAME_FORMATS[] = {
    {6, 1, nullptr, "Vendor specific"},
    {5, 4, nullptr, nullptr},
    {10, 3, nullptr, nullptr},
    {9, 2, nullptr, nullptr},
    {1, 1, "Relative target port identifier", "Relative target port idientifier"},
    {1, 1, "Target port group", "Target port group"},
    {1, 1, "Logical port group", "Logical unit group"},
    {1, 1, "MD5 logical unit identifier", "MD5 logical unit identifier"},
    {1, 1, "SCSI name std::string", "SCSI name std::string"},
};

void name_volume(VLNMPCA_StorageVolume& volume, const Logical_Unit& unit) {
    if (!unit.identifier_type || *unit.identifier_type >= std::size(NAME_FORMATS))
        return;
    const Name_Format& row = NAME_FORMATS[*unit.identifier_type];
    volume.NameFormat.set(row.name_format);
    volume.NameNamespace.set(row.name_namespace);
    if (row.other_name_format)
        volume.OtherNameFormat.set(row.other_name_format);
    if (row.other_name_namespace)
        volume.OtherNameNamespace.set(row.other_name_namespace);
}

// ---- What one class has and another has not ----

template <class T>
constexpr const char* INQUIRY_LABEL = "Standard SCSI inquiry data";
template <>
constexpr const char* INQUIRY_LABEL<VLNMPCA_TapeDrive> = "standard SCSI Inquery data";

// What thousands of units say alike, in one piece of memory.
template <class T>
struct Shared_Texts {
    const String class_name{T::static_meta_class.name};
    const String capacity_unit{"Byte"};
    const String device_name_label{"OS Device Name"};
    const String inquiry_label{INQUIRY_LABEL<T>};
    const String no_text{NO_TEXT};

    static const Shared_Texts& get() {
        static const Shared_Texts texts;
        return texts;
    }
};

template <class T>
void describe_type(T& device, const Logical_Unit& unit) {
    device.DeviceType.set(static_cast<uint16>(unit.peripheral_type));
    if constexpr (std::is_base_of_v<CIM_StorageExtent, T>) {
        if (unit.block_size != 0) {
            device.BlockSize.set(unit.block_size);
            device.NumberOfBlocks.set(unit.number_of_blocks);
        }
    }
}

void describe(VLNMPCA_StorageVolume& volume, const Logical_Unit& unit) {
    describe_type(volume, unit);
    name_volume(volume, unit);
    VLN_LOG(VLN_DBG, "StorageVolumeInstance->DeviceID = %s", volume.DeviceID.value.c_str());
}

void describe(VLNMPCA_LogicalDisk& disk, const Logical_Unit& unit) {
    describe_type(disk, unit);
    disk.DataOrganization.set(DATA_ORGANIZATION_OTHER);
}

void describe(VLNMPCA_SCSIArbitraryLogicalUnit& device, const Logical_Unit& unit) {
    device.DeviceType.set(DEVICE_TYPE_OTHER);
    device.OtherDeviceType.set(
        format_text("Peripheral devices type is 0x%02X", unit.peripheral_type));
}

void describe(VLNMPCA_StorageExtent& extent, const Logical_Unit& unit) {
    describe_type(extent, unit);
}

void describe(VLNMPCA_TapeDrive& drive, const Logical_Unit& unit) {
    describe_type(drive, unit);
}

// The device's name comes first, always: readers go by the position.
template <class T>
void append_identities(T& device, const Logical_Unit& unit) {
    device.OtherIdentifyingInfo.append(unit.os_device_name.empty() ? Shared_Texts<T>::get().no_text
                                                                   : unit.os_device_name);
    device.IdentifyingDescriptions.append(Shared_Texts<T>::get().device_name_label);
    device.OtherIdentifyingInfo.append(unit.inquiry);
    device.IdentifyingDescriptions.append(Shared_Texts<T>::get().inquiry_label);
}

template <class T>
Ref<Instance> device_instance(const Logical_Unit& unit, const CIM_ComputerSystem& system) {
    auto device = make_instance<T>();
    device->SystemCreationClassName.set(system.CreationClassName.value);
    device->SystemName.set(system.Name.value);
    device->CreationClassName.set(Shared_Texts<T>::get().class_name);
    device->DeviceID.set(unit.device_id);
    device->Name.set(unit.name);
    device->ElementName.set(unit.name);
    device->Description.set(unit.description);
    if (unit.block_size != 0)
        device->Capacity.set(unit.capacity);
    device->CapacityUnit.set(Shared_Texts<T>::get().capacity_unit);
    append_identities(*device, unit);
    describe(*device, unit);
    return device.release();
}

// ---- Classes and types ----

struct Unit_Class {
    Ref<Instance> (*make)(const Logical_Unit& unit, const CIM_ComputerSystem& system);
    Store_Id store;
    Store_Id system_device;
    Store_Id fc_path;
    Store_Id iscsi_path;
    const char* text; // of the association with the system
};

constexpr Unit_Class STORAGE_VOLUME = {device_instance<VLNMPCA_StorageVolume>,
                                       STORE_VLNMPCA_StorageVolume,
                                       STORE_VLNMPCA_StorageVolumeSystemDevice,
                                       STORE_VLNMPCA_SCSIInitiatorTargetStorageVolumePath,
                                       STORE_VLNMPCA_iSCSIInitiatorTargetStorageVolumePath,
                                       "Storage Volume"};
constexpr Unit_Class TAPE_DRIVE = {device_instance<VLNMPCA_TapeDrive>,
                                   STORE_VLNMPCA_TapeDrive,
                                   STORE_VLNMPCA_TapeDriveSystemDevice,
                                   STORE_VLNMPCA_SCSIInitiatorTargetTapeDrivePath,
                                   STORE_VLNMPCA_iSCSIInitiatorTargetTapeDrivePath,
                                   "Tape Drive"};
constexpr Unit_Class ARBITRARY_UNIT = {device_instance<VLNMPCA_SCSIArbitraryLogicalUnit>,
                                       STORE_VLNMPCA_SCSIArbitraryLogicalUnit,
                                       STORE_VLNMPCA_SCSIArbitraryLogicalUnitSystemDevice,
                                       STORE_VLNMPCA_SCSIInitiatorTargetArbitraryLogicalUnitPath,
                                       STORE_VLNMPCA_iSCSIInitiatorTargetArbitraryLogicalUnitPath,
                                       "SCSI Arbitrary Logical Unit"};
constexpr Unit_Class LOGICAL_DISK = {device_instance<VLNMPCA_LogicalDisk>,
                                     STORE_VLNMPCA_LogicalDisk,
                                     STORE_VLNMPCA_LogicalDiskSystemDevice,
                                     STORE_VLNMPCA_SCSIInitiatorTargetLogicalDiskPath,
                                     STORE_VLNMPCA_iSCSIInitiatorTargetLogicalDiskPath,
                                     "Logical Disk"};
constexpr Unit_Class STORAGE_EXTENT = {device_instance<VLNMPCA_StorageExtent>,
                                       STORE_VLNMPCA_StorageExtent,
                                       STORE_VLNMPCA_StorageExtentSystemDevice,
                                       STORE_VLNMPCA_SCSIInitiatorTargetStorageExtentPath,
                                       STORE_VLNMPCA_iSCSIInitiatorTargetStorageExtentPath,
                                       "Storage Extent"};

struct Peripheral_Type {
    uint32 type; // SPC-3, 6.4.2
    const Unit_Class& unit_class;
    const char* name; // before the unit's number
};

constexpr Peripheral_Type PERIPHERAL_TYPES[] = {
    {0, STORAGE_VOLUME, "Storage Volume: "},
    {14, STORAGE_VOLUME, "Storage Volume: "},
    {1, TAPE_DRIVE, "Tape Drive "},
    {12, ARBITRARY_UNIT, "Storage array controller "},
    {13, ARBITRARY_UNIT, "Enclosure services "},
    {16, ARBITRARY_UNIT, "Bridge controller "},
    {17, LOGICAL_DISK, "Object-based storage device: "},
    {2, STORAGE_EXTENT, "Printer "},
    {3, STORAGE_EXTENT, "Processor "},
    {4, STORAGE_EXTENT, "Write-once device "},
    {5, STORAGE_EXTENT, "CD/DVD "},
    {6, STORAGE_EXTENT, "Scanner "},
    {7, STORAGE_EXTENT, "Optical memory device "},
    {8, STORAGE_EXTENT, "Jukebox "},
    {9, STORAGE_EXTENT, "Communications device "},
    {15, STORAGE_EXTENT, "Optical card reader/writer "},
};
constexpr Peripheral_Type UNKNOWN_TYPE = {0, STORAGE_EXTENT, "Unknown device "};

constexpr const Peripheral_Type& find_peripheral_type(uint32 type) {
    for (const Peripheral_Type& row : PERIPHERAL_TYPES)
        if (row.type == type)
            return row;
    return UNKNOWN_TYPE;
}

void describe_path(CIM_SCSIInitiatorTargetLogicalUnitPath& path, const Logical_Unit& unit) {
    if (!unit.os_device_name.empty())
        path.OSDeviceName.set(unit.os_device_name);
    if (unit.number <= std::numeric_limits<uint16>::max())
        path.LogicalUnitNumber.set(static_cast<uint16>(unit.number));
}

} // namespace

String logical_unit_name(uint32 peripheral_type, uint64 number) {
    return format_text("%s%llu", find_peripheral_type(peripheral_type).name,
                       static_cast<unsigned long long>(number));
}

Logical_Unit_Maps::Logical_Unit_Maps(ProviderAgent& agent, const CIM_ComputerSystem* system)
    : _agent(agent), _system(system) {}

const Instance* Logical_Unit_Maps::findOrMake(const Logical_Unit& unit) {
    const Unit_Class& unit_class = find_peripheral_type(unit.peripheral_type).unit_class;
    Instance_Map_Base& store = _agent.store(unit_class.store);
    const Ref<Instance> device = unit_class.make(unit, *_system);
    if (const Instance* known = store.lookup(device.get()))
        return known;
    if (!insert_instance(store, device))
        return nullptr;
    Instance_Map_Base& system_devices = _agent.store(unit_class.system_device);
    VLN_LOG(VLN_DBG, "Generating %s (%s: %s)", system_devices.meta_class()->name, unit_class.text,
            unit.device_id.c_str());
    associate(system_devices, _system, device.get());
    return device.get(); // which the store keeps alive
}

bool Logical_Unit_Maps::joinPath(const Unit_Path& path, const Logical_Unit& unit,
                                 const Instance* device) {
    if (!path.initiator) {
        VLN_LOG(VLN_ERR, "Could not find VLNMPCA_SCSIProtocolEndpoint Initiator instance.");
        return false;
    }
    const Unit_Class& unit_class = find_peripheral_type(unit.peripheral_type).unit_class;
    Instance_Map_Base& store = _agent.store(
        path.transport == Unit_Transport::FC ? unit_class.fc_path : unit_class.iscsi_path);
    VLN_LOG(VLN_DBG, "creating %s - %s:%d", store.meta_class()->name, path.ends.c_str(),
            static_cast<int>(unit.number));
    return associate(store, {path.initiator, path.target, device}, {}, [&](Instance& joined) {
        describe_path(*cast<CIM_SCSIInitiatorTargetLogicalUnitPath>(&joined), unit);
    });
}

} // namespace cimple
