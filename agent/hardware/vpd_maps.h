// Writes the field-replaceable-unit data of the adapters into the agent's stores.
//
// Runs in the adapter pass, with the adapter maps' ready mutex and m_DataMutex held. A failure
// leaves the instances as they are and never ends the pass: the status is all that tells.
#ifndef VLN_AGENT_HARDWARE_VPD_MAPS_H
#define VLN_AGENT_HARDWARE_VPD_MAPS_H

#include "agent/provider_agent.h"
#include "device/vpd.h"

#include <span>

namespace cimple {

// A function of a card, which leads to the card's data.
struct FRU_Source {
    String asicName; // may be empty
    String deviceId; // of a port of the function, 16 digits
};

class VPD_Maps : public VLN_Vpd {
public:
    // The kind of address that GetLogicalPortAddress serves.
    static constexpr uint32 PORT_ADDRESS = 2;

    explicit VPD_Maps(ProviderAgent& agent) : _agent(agent) {}

    // Fills a card that is being changed from the first of its functions that tells of it, and
    // creates its FRU instance with the ASICs of all that do. The UUID becomes the card's tag,
    // which is its key: nothing refers to the card yet. Not if another card has it already. For a
    // card that has FRU data already, adds ASICs only.
    //   index   of the card among the cards, for a card without serial number
    // 0; the status of the last function that failed; 32768 for a card without its FRU instance;
    // 32769 when an insertion failed.
    uint32 UpdateFRUToCard(VLNMPCA_Card& card, std::span<const FRU_Source> functions, uint32 index);

    // Ties the card to its FRU instance, if it has one.
    void joinFRUData(const VLNMPCA_Card& card);

    // The same for the identities of the firmware on the cards. 0; the status of the last identity
    // that failed; or 32768 when there is no software identity.
    uint32 UpdateFRUToSoftwareInstance();

    // The address (16 digits) of the first port of the card with that serial number; of the first
    // card that has a port if it is empty. 0 or 32768.
    uint32 GetLogicalPortAddress(const String& reference, uint32 type, String* address) const;

private:
    const VLNMPCA_FRUVitalProductData* findFRUData(const VLNMPCA_Card& card) const;
    uint32 takeFRUData(VLNMPCA_Card& card, const FRU_Source& function, uint32 index);
    uint32 addASIC(const VLNMPCA_Card& card, const FRU_Source& function);
    void addASICName(const VLNMPCA_FRUVitalProductData& fru, const String& name);
    void setCardTag(VLNMPCA_Card& card, const String& tag) const;
    uint32 updateFirmware(uint32 index);
    void describeFirmware(VLNMPCA_SoftwareIdentity& firmware, const String& reference,
                          const FRUVPD& record) const;

    ProviderAgent& _agent;
};

} // namespace cimple

#endif // VLN_AGENT_HARDWARE_VPD_MAPS_H
