// Records of the library, field by field: vital product data, PCI registers, initiator, network.
#include "simulator/scenario.h"

#include "simulator/call.h"

#include <algorithm>
#include <arpa/inet.h>
#include <cstring>

namespace vlnsim {
namespace {

// A numeric field of a record by its name; fields with an index are a list in a scenario.
struct Field {
    std::string_view name;
    std::size_t offset;
    std::size_t width;
    std::size_t count;
};

// By a pointer to the member: a field of a packed record may not be referred to.
template <class Record, class Element, std::size_t size>
constexpr std::size_t element_width(Element (Record::*)[size]) {
    return sizeof(Element);
}
template <class Record, class Element>
constexpr std::size_t element_width(Element Record::*) {
    return sizeof(Element);
}

#define FIELD(record, field)                                                                       \
    Field {                                                                                        \
#field, offsetof(record, field), element_width(&record::field),                            \
            sizeof(record::field) / element_width(&record::field)                                  \
    }

#define PCI(field) FIELD(AX_PCIRegisters, field)
const Field pci_fields[] = {
    PCI(busNumber),
    PCI(deviceNumber),
    PCI(functionNumber),
    PCI(pciType),
    PCI(vendorID),
    PCI(deviceID),
    PCI(command),
    PCI(status),
    PCI(revisionID),
    PCI(progIf),
    PCI(subClass),
    PCI(baseClass),
    PCI(cacheLineSize),
    PCI(latencyTimer),
    PCI(headerType),
    PCI(builtInSelfTest),
    PCI(baseAddresses),
    PCI(cis),
    PCI(subVendorID),
    PCI(subsystemID),
    PCI(expansionROMBaseAddress),
    PCI(capabilitiesPtr),
    PCI(interruptLine),
    PCI(interruptPin),
    PCI(minimumGrant),
    PCI(maximumLatency),
    PCI(featureEnable),
    PCI(pwrMgtCaps),
    PCI(pwrMgtCtrl),
    PCI(msiCtrl),
    PCI(msiLowAddr),
    PCI(msiHighAddr),
    PCI(msiData),
    PCI(msiMaskBits),
    PCI(msiPendingBits),
    PCI(msiXCtrl),
    PCI(msiXTableOffset),
    PCI(msiXPBAOffset),
    PCI(vpdAddr),
    PCI(vpdData),
    PCI(pcieCap),
    PCI(pcieDeviceCapReg),
    PCI(pcieDeviceStatusCtrl),
    PCI(pcieDeviceLinkCap),
    PCI(pcieDeviceLinkStatusCtrl),
    PCI(slotCap),
    PCI(slotStatusCtrlReg),
    PCI(rootCapCtrlReg),
    PCI(rootStatusReg),
    PCI(deviceCap2Reg),
    PCI(deviceStatusCtl2Reg),
    PCI(linkCap2Reg),
    PCI(linkStatus2Ctl2Reg),
    PCI(slotCap2Reg),
    PCI(slotStatusCtl2Reg),
    PCI(enhancedCapHdrAER),
    PCI(uncorrectableErrStat),
    PCI(uncorrectableErrMask),
    PCI(uncorrectableErrSeverity),
    PCI(correctableErrStat),
    PCI(correctableErrMask),
    PCI(advErrCapCtl),
    PCI(headerLog),
    PCI(enhancedCapHdrPBUDG),
    PCI(dataSelectReg),
    PCI(dataReg),
    PCI(powerBudget),
};
#undef PCI

#define LOGIN(field) FIELD(AX_iSCSI_LoginOptions, field)
const Field login_fields[] = {
    LOGIN(firstBurstLength),  LOGIN(maxBurstLength),      LOGIN(maxRecvDataSegmentLength),
    LOGIN(defaultTime2Wait),  LOGIN(defaultTime2Retain),  LOGIN(maxConnections),
    LOGIN(maxOutstandingR2T), LOGIN(initialR2T),          LOGIN(immediateData),
    LOGIN(headerDigest),      LOGIN(dataDigest),          LOGIN(errorRecoveryLevel),
    LOGIN(dataPDUInOrder),    LOGIN(dataSequenceInOrder),
};
#undef LOGIN

#define COUNTER(field) FIELD(AX_iSCSI_PortStatistics, field)
const Field statistics_fields[] = {
    COUNTER(bytesTransmitted),    COUNTER(bytesReceived),          COUNTER(pdusTransmitted),
    COUNTER(pdusReceived),        COUNTER(loginAccepts),           COUNTER(loginOtherFails),
    COUNTER(loginRedirects),      COUNTER(loginAuthenticateFails), COUNTER(loginAuthorizeFails),
    COUNTER(loginNegotiateFails), COUNTER(logoutNormals),          COUNTER(logoutOtherCodes),
    COUNTER(sessionDigestErrors), COUNTER(sessionTimeoutErrors),   COUNTER(sessionFormatErrors),
    COUNTER(sessionFailures),
};
#undef COUNTER

void store(const Node& node, const Field& field, std::size_t index, void* record) {
    const std::uint64_t maximum = ~std::uint64_t{} >> (64 - 8 * field.width);
    // The low bytes come first on every platform of this project.
    const std::uint64_t number = node.number(maximum);
    std::memcpy(static_cast<std::uint8_t*>(record) + field.offset + index * field.width, &number,
                field.width);
}

void read_fields(const Node& values, std::span<const Field> fields, void* record) {
    std::vector<std::string_view> known;
    for (const Field& field : fields)
        known.push_back(field.name);
    values.expect_object(known);
    for (const Field& field : fields) {
        const auto node = values.member(field.name);
        if (!node)
            continue;
        if (field.count == 1) {
            store(*node, field, 0, record);
            continue;
        }
        const std::vector<Node> items = node->items();
        if (items.size() > field.count)
            node->fail("more than " + std::to_string(field.count) + " entries");
        for (std::size_t i = 0; i < items.size(); ++i)
            store(items[i], field, i, record);
    }
}

template <std::size_t size>
void read_text(const Node& values, std::string_view key, char (&field)[size]) {
    const auto node = values.member(key);
    if (!node)
        return;
    if (node->text().size() >= size)
        node->fail("longer than " + std::to_string(size - 1) + " bytes");
    copy_text(node->text(), field, size);
}

// A page of a transceiver's memory: all its bytes, or pieces of it by their offset, bytes or text.
void read_page(const Node& values, std::uint8_t (&page)[256]) {
    const auto put = [&](const Node& value, std::size_t offset, const Bytes& bytes) {
        if (bytes.size() > sizeof page - offset)
            value.fail("reaches past the end of the page of 256 bytes");
        std::copy(bytes.begin(), bytes.end(), page + offset);
    };
    if (!values.is(Value::Kind::object)) {
        put(values, 0, values.bytes());
        return;
    }
    for (const auto& [key, source] : values.value().members) {
        const Node value(source, values.scope());
        const auto number = parse_number(key);
        if (!number || *number >= sizeof page)
            value.fail("\"" + key + "\" is no offset below 256");
        const auto offset = static_cast<std::size_t>(*number);
        if (value.is(Value::Kind::object)) {
            put(value, offset, read_attribute(value, nullptr).bytes);
        } else {
            const std::string text = value.text();
            put(value, offset, Bytes(text.begin(), text.end()));
        }
    }
}

} // namespace

void read_address(const Node& values, std::string_view key, AX_IPAddress& address) {
    const auto node = values.member(key);
    if (node && !parse_address(node->text(), address))
        node->fail("\"" + node->text() + "\" is not an IPv4 or IPv6 address");
}

bool parse_address(const std::string& text, AX_IPAddress& address) {
    if (inet_pton(AF_INET6, text.c_str(), address.address) == 1)
        address.flags = AX_IP_FLAG_V6;
    else if (inet_pton(AF_INET, text.c_str(), address.address) != 1)
        return false;
    return true;
}

std::uint32_t read_authentication(const Node& values) {
    constexpr std::string_view names[] = {"none", "oneWayCHAP", "mutualCHAP"};
    const auto node = values.member("authentication");
    if (!node)
        return AX_ISCSI_AUTH_NONE;
    const std::string name = node->text();
    const auto it = std::find(std::begin(names), std::end(names), name);
    if (it == std::end(names))
        node->fail("unknown method \"" + name + "\"; " + known_list(names));
    return static_cast<std::uint32_t>(it - std::begin(names));
}

AX_iSCSI_Authentication read_account(const Node& values) {
    AX_iSCSI_Authentication account{};
    account.method = read_authentication(values);
    read_text(values, "targetCHAPName", account.targetCHAPName);
    read_text(values, "targetSecret", account.targetSecret);
    read_text(values, "initiatorCHAPName", account.initiatorCHAPName);
    read_text(values, "initiatorSecret", account.initiatorSecret);
    return account;
}

void read_login_options(const Node& values, AX_iSCSI_LoginOptions& options) {
    read_fields(values, login_fields, &options);
}

Bytes read_vpd_value(const Node& value) {
    Bytes bytes;
    if (value.is(Value::Kind::object)) {
        bytes = read_attribute(value, nullptr).bytes;
    } else if (value.is(Value::Kind::number)) {
        bytes.push_back(static_cast<std::uint8_t>(value.number(0xFF)));
    } else {
        const std::string text = value.text();
        bytes.assign(text.begin(), text.end());
    }
    if (bytes.size() > 255)
        value.fail("longer than 255 bytes");
    return bytes;
}

std::vector<std::pair<std::string, Bytes>> read_vpd(const Node& values) {
    values.expect_any_object();
    std::vector<std::pair<std::string, Bytes>> entries;
    for (const auto& [tag, source] : values.value().members) {
        const Node value(source, values.scope());
        if (value.is(Value::Kind::null))
            continue;
        if (tag.size() != 2)
            value.fail("a tag of two characters is wanted");
        entries.emplace_back(tag, read_vpd_value(value));
    }
    return entries;
}

AX_PCIRegisters read_pci(const Node& values) {
    AX_PCIRegisters registers{};
    read_fields(values, pci_fields, &registers);
    return registers;
}

AX_iSCSI_InitiatorProperties read_initiator(const Node& values) {
    values.expect_object({"name", "alias", "authentication", "targetCHAPName", "targetSecret",
                          "initiatorCHAPName", "initiatorSecret", "loginOptions"});
    AX_iSCSI_InitiatorProperties initiator{};
    read_text(values, "name", initiator.name);
    read_text(values, "alias", initiator.alias);
    initiator.authentication = read_account(values);
    if (const auto options = values.member("loginOptions"))
        read_login_options(*options, initiator.loginOptions);
    return initiator;
}

AX_iSCSI_PortStatistics read_iscsi_statistics(const Node& values) {
    AX_iSCSI_PortStatistics statistics{};
    read_fields(values, statistics_fields, &statistics);
    return statistics;
}

AX_Ini_NetworkProperties read_network(const Node& values) {
    values.expect_object({"address", "subnetMask", "gateway", "dhcp", "linkUp", "vlanEnabled",
                          "vlanID", "priority"});
    AX_Ini_NetworkProperties network{};
    read_address(values, "address", network.address);
    read_address(values, "subnetMask", network.subnetMask);
    read_address(values, "gateway", network.gateway);
    network.addressOrigin =
        values.boolean("dhcp", false) ? AX_ADDRESS_ORIGIN_DHCP : AX_ADDRESS_ORIGIN_STATIC;
    network.linkUp = values.boolean("linkUp", true);
    network.vlanEnabled = values.boolean("vlanEnabled", false);
    network.vlanID = static_cast<std::uint16_t>(values.number("vlanID", 0, 4095));
    network.priority = static_cast<std::uint8_t>(values.number("priority", 0, 7));
    return network;
}

AX_SffData read_sff(const Node& values) {
    values.expect_object({"a0", "a2"});
    AX_SffData data{};
    if (const auto page = values.member("a0"))
        read_page(*page, data.pageA0);
    if (const auto page = values.member("a2"))
        read_page(*page, data.pageA2);
    return data;
}

} // namespace vlnsim
