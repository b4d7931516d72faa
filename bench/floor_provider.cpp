// The floor that the library is measured against: providers written straight to CMPI.
//
// They answer VLNMPCA_EthernetPort and VLNMPCA_StorageVolume from constant data, as a careful
// programmer would by hand: one object path and one instance each, a broker call per property,
// texts as plain characters, an instance found by its key at once, nothing else. They have the
// shape of the first instance that the library makes of the simulated hosts, which a test compares;
// only DeviceID differs from one instance to the next. VLN_FLOOR_INSTANCES says how many there are.
// And an association class that has nothing to say.
#include "cmpi/cmpi.h"

#include <strings.h>

#include <cstdio>
#include <cstdlib>
#include <span>
#include <string>
#include <unordered_map>

namespace {

struct Property_Row {
    const char* name;
    CMPIType type;    // CMPI_uint64 stands for all unsigned numbers of `number`
    const char* text; // strings: the value; arrays of strings: the elements, separated by '|'
    CMPIUint64 number;
};

constexpr Property_Row PORT[] = {
    {"InstanceID", CMPI_string, "VMC-2210:100002564C000000", 0},
    {"Description", CMPI_string, "Vorlan VMC-2210 10Gb 2-port PCIe Converged Network Adapter", 0},
    {"ElementName", CMPI_string, "vln0p0", 0},
    {"Generation", CMPI_uint64, nullptr, 0},
    {"Name", CMPI_string, "vln0p0", 0},
    {"OperationalStatus", CMPI_uint16A, "2", 0},
    {"StatusDescriptions", CMPI_stringA, "OK", 0},
    {"EnabledState", CMPI_uint16, nullptr, 2},
    {"RequestedState", CMPI_uint16, nullptr, 12},
    {"SystemCreationClassName", CMPI_string, "CIM_ComputerSystem", 0},
    {"SystemName", CMPI_string, "simulated-host", 0},
    {"CreationClassName", CMPI_string, "VLNMPCA_EthernetPort", 0},
    {"OtherIdentifyingInfo", CMPI_stringA, "VR10420117:00|VR10420117:0|VR10420117|0|NotSupported",
     0},
    {"IdentifyingDescriptions", CMPI_stringA,
     "SerialNumber + Sub-AdapterID|SerialNumber:PhysicalPortNumber|SerialNumber|"
     "PhysicalPortNumber|VirtualPortNumber",
     0},
    {"LocationIndicator", CMPI_uint16, nullptr, 3},
    {"Speed", CMPI_uint64, nullptr, 10000000000ull},
    {"MaxSpeed", CMPI_uint64, nullptr, 10000000000ull},
    {"PortType", CMPI_uint16, nullptr, 0},
    {"PortNumber", CMPI_uint16, nullptr, 0},
    {"LinkTechnology", CMPI_uint16, nullptr, 2},
    {"PermanentAddress", CMPI_string, "02564c000000", 0},
    {"NetworkAddresses", CMPI_stringA, "02564c000000", 0},
    {"SupportedMaximumTransmissionUnit", CMPI_uint64, nullptr, 9000},
    {"ActiveMaximumTransmissionUnit", CMPI_uint64, nullptr, 1500},
    {"Capabilities", CMPI_uint16A, "2|3|4", 0},
    {"EnabledCapabilities", CMPI_uint16A, "3|4", 0},
    {"FunctionalQosBandwidth", CMPI_string, "10 Gbps", 0},
    {"FunctionalQosMinBandwidth", CMPI_string, "1 Gbps", 0},
    {"PCIBusNumber", CMPI_uint32, nullptr, 16},
    {"FunctionalPortSpeed", CMPI_string, "10 Gbps", 0},
    {"SRIOVState", CMPI_uint16, nullptr, 2},
};

constexpr Property_Row VOLUME[] = {
    {"Description", CMPI_string, "VORLAN   SIMULATED UNIT   Revision 1.00", 0},
    {"ElementName", CMPI_string, "Storage Volume: 0", 0},
    {"Name", CMPI_string, "Storage Volume: 0", 0},
    {"SystemCreationClassName", CMPI_string, "CIM_ComputerSystem", 0},
    {"SystemName", CMPI_string, "simulated-host", 0},
    {"CreationClassName", CMPI_string, "VLNMPCA_StorageVolume", 0},
    {"OtherIdentifyingInfo", CMPI_stringA,
     "n/a|VORLAN   SIMULATED UNIT   Revision 1.00 Serial Number T0L0", 0},
    {"IdentifyingDescriptions", CMPI_stringA, "OS Device Name|Standard SCSI inquiry data", 0},
    {"BlockSize", CMPI_uint64, nullptr, 512},
    {"NumberOfBlocks", CMPI_uint64, nullptr, 2097152},
    {"NameFormat", CMPI_uint16, nullptr, 9},
    {"NameNamespace", CMPI_uint16, nullptr, 2},
    {"Capacity", CMPI_uint64, nullptr, 1073741824},
    {"CapacityUnit", CMPI_string, "Byte", 0},
    {"DeviceType", CMPI_uint16, nullptr, 0},
};

// A class, with what makes its keys.
struct Floor_Class {
    const char* name;
    const char* system;
    void (*device_id)(char (&text)[128], unsigned number);
    std::span<const Property_Row> properties;
    std::unordered_map<std::string, unsigned> numbers = {}; // by DeviceID
};

Floor_Class ports = {"VLNMPCA_EthernetPort", "simulated-host",
                     [](char (&text)[128], unsigned number) {
                         std::snprintf(text, sizeof text, "100002564C%06X", number);
                     },
                     PORT};
// The simulator's names of the units of one target.
Floor_Class volumes = {"VLNMPCA_StorageVolume", "simulated-host",
                       [](char (&text)[128], unsigned number) {
                           std::snprintf(text, sizeof text,
                                         "100002564C000001_502564C000000001_%u_"
                                         "602564C00000000000000000%08X",
                                         number, number);
                       },
                       VOLUME};

const CMPIBroker* broker;

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus unsupported() {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

unsigned instance_count() {
    const char* text = std::getenv("VLN_FLOOR_INSTANCES");
    return text ? static_cast<unsigned>(std::strtoul(text, nullptr, 10)) : 2;
}

struct Device_Id {
    char text[128];
    Device_Id(const Floor_Class& floor, unsigned number) { floor.device_id(text, number); }
};

const CMPIValue* chars(const char* text) { // for CMPI_chars
    return reinterpret_cast<const CMPIValue*>(text);
}

// An array of the pieces of a '|' separated list.
CMPIValue array_value(const char* list, CMPIType type) {
    unsigned count = 1;
    for (const char* p = list; *p; ++p)
        count += *p == '|';
    CMPIValue array;
    array.array = broker->eft->newArray(broker, count, type, nullptr);
    for (unsigned i = 0; i < count; ++i) {
        char piece[128];
        unsigned n = 0;
        while (*list && *list != '|' && n < sizeof piece - 1)
            piece[n++] = *list++;
        piece[n] = 0;
        list += *list == '|';
        CMPIValue element;
        if (type == CMPI_string)
            element.string = broker->eft->newString(broker, piece, nullptr);
        else
            element.uint64 = std::strtoul(piece, nullptr, 10);
        array.array->ft->setElementAt(array.array, i, &element, type);
    }
    return array;
}

void set_property(CMPIInstance* instance, const Property_Row& row) {
    if (row.type == CMPI_string) {
        instance->ft->setProperty(instance, row.name, chars(row.text), CMPI_chars);
        return;
    }
    CMPIValue value;
    if (row.type & CMPI_ARRAY)
        value = array_value(row.text, static_cast<CMPIType>(row.type & ~CMPI_ARRAY));
    else
        value.uint64 = row.number; // little-endian: the narrower members read its low bytes
    instance->ft->setProperty(instance, row.name, &value, row.type);
    if (row.type & CMPI_ARRAY)
        value.array->ft->release(value.array); // the elements go with it
}

CMPIObjectPath* new_path(const Floor_Class& floor, const char* name_space, const char* device_id) {
    CMPIObjectPath* path = broker->eft->newObjectPath(broker, name_space, floor.name, nullptr);
    const char* keys[][2] = {{"SystemCreationClassName", "CIM_ComputerSystem"},
                             {"SystemName", floor.system},
                             {"CreationClassName", floor.name},
                             {"DeviceID", device_id}};
    for (const auto& key : keys)
        path->ft->addKey(path, key[0], chars(key[1]), CMPI_chars);
    return path;
}

void return_instance(const Floor_Class& floor, const CMPIResult* result, const char* name_space,
                     const char* device_id, const char** properties) {
    CMPIObjectPath* path = new_path(floor, name_space, device_id);
    CMPIInstance* instance = broker->eft->newInstance(broker, path, nullptr);
    if (properties)
        instance->ft->setPropertyFilter(instance, properties, nullptr);
    for (const Property_Row& row : floor.properties)
        set_property(instance, row);
    instance->ft->setProperty(instance, "DeviceID", chars(device_id), CMPI_chars);
    result->ft->returnInstance(result, instance);
    instance->ft->release(instance);
    path->ft->release(path);
}

const char* name_space_of(const CMPIObjectPath* path) {
    CMPIString* text = path->ft->getNameSpace(path, nullptr);
    return text->ft->getCharPtr(text, nullptr);
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return ok();
}

template <Floor_Class& Floor>
CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath* model, const char** properties) {
    const char* name_space = name_space_of(model);
    const unsigned count = instance_count();
    for (unsigned i = 0; i < count; ++i)
        return_instance(Floor, result, name_space, Device_Id(Floor, i).text, properties);
    result->ft->returnDone(result);
    return ok();
}

template <Floor_Class& Floor>
CMPIStatus names(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                 const CMPIObjectPath* model) {
    const char* name_space = name_space_of(model);
    const unsigned count = instance_count();
    for (unsigned i = 0; i < count; ++i) {
        CMPIObjectPath* path = new_path(Floor, name_space, Device_Id(Floor, i).text);
        result->ft->returnObjectPath(result, path);
        path->ft->release(path);
    }
    result->ft->returnDone(result);
    return ok();
}

template <Floor_Class& Floor>
CMPIStatus get(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
               const CMPIObjectPath* path, const char** properties) {
    const CMPIData key = path->ft->getKey(path, "DeviceID", nullptr);
    const char* device_id = key.value.string->ft->getCharPtr(key.value.string, nullptr);
    if (Floor.numbers.find(device_id) == Floor.numbers.end())
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    return_instance(Floor, result, name_space_of(path), device_id, properties);
    result->ft->returnDone(result);
    return ok();
}

CMPIStatus create(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                  const CMPIInstance*) {
    return unsupported();
}
CMPIStatus modify(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                  const CMPIInstance*, const char**) {
    return unsupported();
}
CMPIStatus remove(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*) {
    return unsupported();
}
CMPIStatus query(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                 const char*, const char*) {
    return unsupported();
}

template <Floor_Class& Floor>
CMPIInstanceMI* instance_mi(const CMPIBroker* b) {
    static CMPIInstanceMIFT table = {
        100,        100,    "floor", cleanup, names<Floor>, enumerate<Floor>,
        get<Floor>, create, modify,  remove,  query};
    static CMPIInstanceMI mi = {nullptr, &table};
    broker = b;
    const unsigned count = instance_count();
    for (unsigned i = 0; i < count; ++i)
        Floor.numbers.emplace(Device_Id(Floor, i).text, i);
    return &mi;
}

// ---- An association with nothing to say: it looks at the source's class, and that is all ----

const char* const END_CLASSES[] = {"VLNMPCA_PhysicalConnector", "VLNMPCA_EthernetPort"};

CMPIStatus refuse(const CMPIObjectPath* source) {
    CMPIString* name = source->ft->getClassName(source, nullptr);
    bool known = false;
    for (const char* end : END_CLASSES)
        known = known || strcasecmp(name->ft->getCharPtr(name, nullptr), end) == 0;
    name->ft->release(name);
    return known ? unsupported() : ok();
}

CMPIStatus cleanup_association(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
    return ok();
}
CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                       const CMPIObjectPath* source, const char*, const char*, const char*,
                       const char*, const char**) {
    return refuse(source);
}
CMPIStatus associator_names(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                            const CMPIObjectPath* source, const char*, const char*, const char*,
                            const char*) {
    return refuse(source);
}
CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                      const CMPIObjectPath* source, const char*, const char*, const char**) {
    return refuse(source);
}
CMPIStatus reference_names(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                           const CMPIObjectPath* source, const char*, const char*) {
    return refuse(source);
}

} // namespace

#define FLOOR_ENTRY extern "C" __attribute__((visibility("default")))

FLOOR_ENTRY CMPIInstanceMI* VLNMPCA_EthernetPort_Provider_Create_InstanceMI(const CMPIBroker* b,
                                                                            const CMPIContext*,
                                                                            CMPIStatus*) {
    return instance_mi<ports>(b);
}

FLOOR_ENTRY CMPIInstanceMI* VLNMPCA_StorageVolume_Provider_Create_InstanceMI(const CMPIBroker* b,
                                                                             const CMPIContext*,
                                                                             CMPIStatus*) {
    return instance_mi<volumes>(b);
}

FLOOR_ENTRY CMPIAssociationMI*
VLNMPCA_Realizes_Provider_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
    static CMPIAssociationMIFT table = {100,         100,
                                        "floor",     cleanup_association,
                                        associators, associator_names,
                                        references,  reference_names};
    static CMPIAssociationMI mi = {nullptr, &table};
    return &mi;
}
