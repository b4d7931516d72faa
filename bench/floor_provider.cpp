// The floor that the library's enumeration is measured against: a provider written straight to
// CMPI.
//
// It answers VLNMPCA_EthernetPort from constant data, as a careful programmer would by hand: one
// object path and one instance per port, a broker call per property, nothing else. It has the shape
// of the instances that the library makes of the simulated two-port card; only DeviceID differs
// from one instance to the next. VLN_FLOOR_INSTANCES says how many there are.
#include "cmpi/cmpi.h"

#include <cstdio>
#include <cstdlib>

namespace {

constexpr const char* CLASS_NAME = "VLNMPCA_EthernetPort";

struct Property_Row {
    const char* name;
    CMPIType type;    // CMPI_uint64 stands for all unsigned numbers of `number`
    const char* text; // strings: the value; arrays of strings: up to three, separated by '|'
    CMPIUint64 number;
};

constexpr Property_Row PROPERTIES[] = {
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
    {"SystemName", CMPI_string, "server.example", 0},
    {"CreationClassName", CMPI_string, CLASS_NAME, 0},
    {"OtherIdentifyingInfo", CMPI_stringA, "VR10420117:00|VR10420117:0|VR10420117", 0},
    {"IdentifyingDescriptions", CMPI_stringA,
     "SerialNumber + Sub-AdapterID|SerialNumber:PhysicalPortNumber|SerialNumber", 0},
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
};

const CMPIBroker* broker;

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

unsigned instance_count() {
    const char* text = std::getenv("VLN_FLOOR_INSTANCES");
    return text ? static_cast<unsigned>(std::strtoul(text, nullptr, 10)) : 2;
}

CMPIValue string_value(const char* text) {
    CMPIValue value;
    value.string = broker->eft->newString(broker, text, nullptr);
    return value;
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
            element = string_value(piece);
        else
            element.uint64 = std::strtoul(piece, nullptr, 10);
        array.array->ft->setElementAt(array.array, i, &element, type);
    }
    return array;
}

CMPIValue value_of(const Property_Row& row) {
    CMPIValue value;
    if (row.type == CMPI_string)
        return string_value(row.text);
    if (row.type & CMPI_ARRAY)
        return array_value(row.text, static_cast<CMPIType>(row.type & ~CMPI_ARRAY));
    value.uint64 = row.number; // little-endian: the narrower members read its low bytes
    return value;
}

CMPIObjectPath* new_path(const char* name_space, const char* device_id) {
    CMPIObjectPath* path = broker->eft->newObjectPath(broker, name_space, CLASS_NAME, nullptr);
    const char* keys[][2] = {{"SystemCreationClassName", "CIM_ComputerSystem"},
                             {"SystemName", "server.example"},
                             {"CreationClassName", CLASS_NAME},
                             {"DeviceID", device_id}};
    for (const auto& key : keys) {
        CMPIValue value = string_value(key[1]);
        path->ft->addKey(path, key[0], &value, CMPI_string);
    }
    return path;
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return ok();
}

CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath* model, const char** properties) {
    const char* name_space = model->ft->getNameSpace(model, nullptr)
                                 ->ft->getCharPtr(model->ft->getNameSpace(model, nullptr), nullptr);
    const unsigned count = instance_count();
    for (unsigned i = 0; i < count; ++i) {
        char device_id[32];
        std::snprintf(device_id, sizeof device_id, "10000090FA%06X", i);
        CMPIObjectPath* path = new_path(name_space, device_id);
        CMPIInstance* instance = broker->eft->newInstance(broker, path, nullptr);
        if (properties)
            instance->ft->setPropertyFilter(instance, properties, nullptr);
        for (const Property_Row& row : PROPERTIES) {
            CMPIValue value = value_of(row);
            instance->ft->setProperty(instance, row.name, &value, row.type);
        }
        CMPIValue device = string_value(device_id);
        instance->ft->setProperty(instance, "DeviceID", &device, CMPI_string);
        result->ft->returnInstance(result, instance);
        instance->ft->release(instance);
        path->ft->release(path);
    }
    result->ft->returnDone(result);
    return ok();
}

CMPIStatus unsupported() {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}
CMPIStatus names(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*) {
    return unsupported();
}
CMPIStatus get(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
               const char**) {
    return unsupported();
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

} // namespace

extern "C" __attribute__((visibility("default"))) CMPIInstanceMI*
VLNMPCA_EthernetPort_Provider_Create_InstanceMI(const CMPIBroker* b, const CMPIContext*,
                                                CMPIStatus*) {
    static CMPIInstanceMIFT table = {100, 100,    "floor", cleanup, names, enumerate,
                                     get, create, modify,  remove,  query};
    static CMPIInstanceMI mi = {nullptr, &table};
    broker = b;
    return &mi;
}
