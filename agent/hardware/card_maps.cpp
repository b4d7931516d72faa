// The hardware one can hold: product, card and connector.
//
// A converged card shows up as several adapters of the device model. They share one product and one
// card, found again by the serial number, and one connector for each physical port.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/hardware/physical_port.h"
#include "agent/hardware/port_name.h"
#include "agent/hardware/vpd_maps.h"
#include "agent/profiles/profile_maps.h"
#include "agent/software/software_identity.h"
#include "agent/status/dynamic_status.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_Chip.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"

namespace cimple {

namespace {

constexpr uint16 PACKAGE_TYPE_MODULE_CARD = 9; // CIM_PhysicalPackage.PackageType
constexpr uint16 CONNECTOR_LAYOUT = 12;        // CIM_PhysicalConnector.ConnectorLayout

Ref<VLNMPCA_Product> product_instance(const NICAdapterAttributes& adapter) {
    auto product = make_instance<VLNMPCA_Product>();
    product->Name.set(text(adapter.Model));
    product->Description.set(text(adapter.ModelDescription));
    product->IdentifyingNumber.set(text(adapter.SerialNumber));
    product->Vendor.set(text(adapter.Manufacturer));
    product->Version.set(text(adapter.HWVersion));
    return product;
}

Ref<VLNMPCA_Card> card_instance(const NICAdapterAttributes& adapter) {
    auto card = make_instance<VLNMPCA_Card>();
    card->CreationClassName.set("VLNMPCA_Card");
    card->Tag.set(text(adapter.SerialNumber));
    card->SerialNumber.set(text(adapter.SerialNumber));
    card->VLNSerialNumber.set(text(adapter.SerialNumber));
    card->Name.set(text(adapter.Model));
    card->Model.set(text(adapter.Model));
    card->PartNumber.set(text(adapter.Model));
    card->Manufacturer.set(text(adapter.Manufacturer));
    card->Description.set(text(adapter.ModelDescription));
    card->Version.set(text(adapter.HWVersion));
    card->VendorSpecID.set(adapter.VendorSpecificID);
    card->DeviceID.set(adapter.DeviceID);
    card->ModelID.set(adapter.ModelID);
    card->PackageType.set(PACKAGE_TYPE_MODULE_CARD);
    card->HostingBoard.set(false);
    card->ElementName.set(
        format_text("VLN MPCA:%s:%s", adapter.Model.c_str(), adapter.SerialNumber.c_str()));
    return card;
}

// What the connector takes, by the adapter's connection type.
String connector_identity(const NICAdapterAttributes& adapter) {
    constexpr uint32 SFP = 1;
    constexpr uint32 BASE_T = 2;
    switch (adapter.PortConnectionType) {
    case SFP:
        return format_text("LocalPhysicalPort:%d,Transceiver:SFP",
                           static_cast<int>(adapter.PortNumber));
    case BASE_T:
        return format_text("LocalPhysicalPort:%d,Transceiver:10GBaseT",
                           static_cast<int>(adapter.PortNumber));
    default:
        return format_text("LocalPhysicalPort:%d", static_cast<int>(adapter.PortNumber));
    }
}

Ref<VLNMPCA_PhysicalConnector> connector_instance(const NICAdapterAttributes& adapter,
                                                  const String& port_name,
                                                  const String& serial_and_number) {
    auto connector = make_instance<VLNMPCA_PhysicalConnector>();
    connector->InstanceID.set(serial_and_number);
    connector->CreationClassName.set("VLNMPCA_PhysicalConnector");
    connector->Tag.set(port_name);
    connector->Name.set(port_name);
    connector->OtherIdentifyingInfo.set(connector_identity(adapter));
    connector->Manufacturer.set(text(adapter.Manufacturer));
    connector->Model.set(text(adapter.Model));
    connector->Description.set(text(adapter.ModelDescription));
    connector->ElementName.set(format_text("VLN MPCA Port:%s:Network Connector:%d",
                                           adapter.SerialNumber.c_str(),
                                           static_cast<int>(adapter.PortNumber)));
    connector->SerialNumber.set(text(adapter.SerialNumber));
    connector->ConnectorLayout.set(CONNECTOR_LAYOUT);
    return connector;
}

} // namespace

uint32 Adapter_Map_Builder::createNICCards() {
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_NIC) {
            VLN_LOG(VLN_DBG, "Skippping Adapter [%s] since it is not a NIC Adapter",
                    adapter->getAdapterName().c_str());
            continue;
        }
        if (const uint32 status = createNICCard(static_cast<NICAdapter&>(*adapter)))
            return status;
    }
    return MAP_OK;
}

uint32 Adapter_Map_Builder::createNICCard(NICAdapter& adapter) {
    const auto& attributes =
        static_cast<const NICAdapterAttributes&>(*adapter.getAdapterAttributes());
    NIC_Function function{&adapter, &attributes, findOrMakeProduct(attributes), nullptr, false};

    const auto& cards = _agent.m_VLNMPCA_Card_map;
    VLN_LOG(VLN_DBG, "inside icard %zu", static_cast<std::size_t>(cards.size()));
    const String serial = text(attributes.SerialNumber);
    function.card = find_last(
        cards, [&](const VLNMPCA_Card& card) { return card.VLNSerialNumber.value == serial; });
    if (!function.card) {
        VLN_LOG(VLN_DBG, "create icard instance %zu", static_cast<std::size_t>(cards.size()));
        function.card = CreateMPCACardInstance(attributes);
        function.new_card = function.card != nullptr;
        if (function.card)
            function.card = readCard(*function.card);
        else
            VLN_LOG(VLN_CRIT, "CreateMPCACardInstance failed");
        associate(_agent.m_VLNMPCA_ProductPhysicalComponent_map, function.product, function.card,
                  "Insert Failed (CNA): VLNMPCA_ProductPhysicalComponent");
    } else {
        function.new_card = std::erase(_untied_cards, function.card) != 0;
    }
    for (const auto& port : adapter.getPorts())
        if (const uint32 status = createNICPort(function, *port))
            return status;
    // None of the function's ports could be read: the next function of the card ties it.
    if (function.new_card)
        _untied_cards.push_back(function.card);
    return MAP_OK;
}

const VLNMPCA_Product*
Adapter_Map_Builder::findOrMakeProduct(const NICAdapterAttributes& attributes) {
    auto& products = _agent.m_VLNMPCA_Product_map;
    const String serial = text(attributes.SerialNumber);
    auto* product = find_first(products, [&](const VLNMPCA_Product& candidate) {
        return candidate.IdentifyingNumber.value == serial;
    });
    return product ? product : insert_instance(products, product_instance(attributes));
}

const VLNMPCA_Card*
Adapter_Map_Builder::CreateMPCACardInstance(const NICAdapterAttributes& attributes) {
    return insert_instance(_agent.m_VLNMPCA_Card_map, card_instance(attributes));
}

// Comes before anything refers to the card, since it may give the card another key: so all of the
// card's functions are asked here.
const VLNMPCA_Card* Adapter_Map_Builder::readCard(const VLNMPCA_Card& new_card) {
    std::vector<FRU_Source> functions;
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_NIC || adapter->getPorts().empty())
            continue;
        const AdapterAttributes& attributes = *adapter->getAdapterAttributes();
        if (text(attributes.SerialNumber) == new_card.VLNSerialNumber.value)
            functions.push_back(
                {asic_name(attributes), text(adapter->getPorts().front()->getPortName())});
    }
    VPD_Maps vpd(_agent);
    const uint32 index = _agent.m_VLNMPCA_Card_map.size() - 1;
    const auto* read = change(_agent.m_VLNMPCA_Card_map, index, [&](VLNMPCA_Card& card) {
        vpd.UpdateFRUToCard(card, functions, index);
        // A client that gets the card by its name, or that comes just after a refresh, sees it too.
        if (!functions.empty())
            readBoardTemperature(functions.front().deviceId.c_str(), card);
    });
    vpd.joinFRUData(*read);
    return read;
}

// What hangs on the card itself is made once, with the card's first port.
void Adapter_Map_Builder::tieNewCard(NIC_Function& function) {
    if (!function.new_card)
        return;
    function.new_card = false;
    conformCard(*function.card);
    associate(_agent.m_VLNMPCA_ProviderElementSoftwareIdentity_map,
              find_provider_identity(_agent.m_VLNMPCA_SoftwareIdentity_map), function.card, {},
              software_status({STATUS_CURRENT, STATUS_NEXT}));
    if (_chassis)
        associate(_agent.m_VLNMPCA_ChassisContainsCard_map, _chassis, function.card,
                  "Insert Failed:VLNMPCA_ChassisContainsCard");
}

void Adapter_Map_Builder::conformCard(const VLNMPCA_Card& card) {
    constexpr struct {
        const char* text;
        Profile profile;
    } ROWS[] = {
        {"Access Points", PROFILE_ACCESS_POINTS},
        {"Host Discovered Resource", PROFILE_HOST_DISCOVERED_RESOURCES},
        {"Physical Asset", PROFILE_PHYSICAL_ASSET},
    };
    Profile_Maps profiles(_agent);
    for (const auto& row : ROWS)
        profiles.createCardConforms(
            format_text("MPCA Card %s, %s", card.VLNSerialNumber.value.c_str(), row.text),
            row.profile, &card);
}

void Adapter_Map_Builder::findOrMakeConnector(NIC_Port& port) {
    auto& connectors = _agent.m_VLNMPCA_PhysicalConnector_map;
    VLN_LOG(VLN_DBG, "inside Product %zu",
            static_cast<std::size_t>(_agent.m_VLNMPCA_Product_map.size()));
    port.connector = find_connector(_agent, port.serial_and_number);
    if (!port.connector)
        port.connector =
            insert_instance(connectors, connector_instance(*port.function.attributes, port.name,
                                                           port.serial_and_number));
}

// A connector that another function brought along is joined already, but maybe not with this chip.
void Adapter_Map_Builder::joinConnector(const NIC_Port& port) {
    associate_once(_agent.m_VLNMPCA_ProductPhysicalConnector_map, port.function.product,
                   port.connector, "Insert Failed (CNA): VLNMPCA_ProductPhysicalConnector");
    associate_once(_agent.m_VLNMPCA_Container_map, port.function.card, port.connector,
                   "Insert Failed (CNA): VLNMPCA_Container");
    if (port.function.chip)
        associate_once(_agent.m_VLNMPCA_ConnectorDependsOnChip_map, port.connector,
                       port.function.chip, "Insert Failed (CNA): VLNMPCA_ConnectorDependsOnChip");
}

} // namespace cimple
