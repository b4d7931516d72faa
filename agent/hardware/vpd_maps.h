// Writes the field-replaceable-unit data of the adapters into the agent's stores.
//
// Runs in the adapter pass, with the adapter maps' ready mutex and m_DataMutex held. A failure
// leaves the instances as they are and never ends the pass: the status is all that tells.
#ifndef VLN_AGENT_HARDWARE_VPD_MAPS_H
#define VLN_AGENT_HARDWARE_VPD_MAPS_H

#include "agent/provider_agent.h"
#include "device/vpd.h"

namespace cimple {

class VPD_Maps : public VLN_Vpd {
public:
    // The kind of address that GetLogicalPortAddress serves.
    static constexpr uint32 PORT_ADDRESS = 2;

    explicit VPD_Maps(ProviderAgent& agent) : _agent(agent) {}

    // Fills a card of the store and creates its FRU instance and the association between them. For
    // a card that has FRU data already, adds the ASIC's name to them. The UUID becomes the card's
    // tag, which is its key, so clones taken before do not refer to it any more; not if another
    // card has it already.
    //   asicName   of the function that leads to the card; may be empty
    //   deviceId   of a port of that function, 16 digits
    //   index      of the card among the cards, for a card without serial number
    // 0, a status of the library, 32768 for a card without its FRU instance, or 32769 when an
    // insertion failed.
    uint32 UpdateFRUToCard(VLNMPCA_Card& card, const String& asicName, const String& deviceId,
                           uint32 index);

    // The same for the identities of the firmware on the cards. 0; the status of the last identity
    // that failed; or 32768 when there is no software identity.
    uint32 UpdateFRUToSoftwareInstance();

    // The address (16 digits) of the first port of the card with that serial number; of the first
    // card that has a port if it is empty. 0 or 32768.
    uint32 GetLogicalPortAddress(const String& reference, uint32 type, String* address) const;

    // The instance name of the firmware of the card that the port belongs to. 0 or 32768.
    uint32 GetSoftwareInstanceName(const char* portAddress, String& name) const;

private:
    uint32 createFRUData(VLNMPCA_Card& card, const String& asicName, const FRUVPD& record);
    uint32 addASIC(const VLNMPCA_Card& card, const String& asicName, const String& deviceId);
    void setCardTag(VLNMPCA_Card& card, const String& tag);
    uint32 updateFirmware(VLNMPCA_SoftwareIdentity& firmware);

    ProviderAgent& _agent;
};

} // namespace cimple

#endif // VLN_AGENT_HARDWARE_VPD_MAPS_H
