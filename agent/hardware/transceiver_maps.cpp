// The pluggable transceiver of a physical port, with its readings.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/hardware/port_name.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_Transceiver.h"
#include "device/library/bound_functions.h"
#include "device/sff8472.h"
#include "operations/operation_frame.h"

namespace cimple {

namespace {

using M = SFF_Transceiver;
using C = VLNMPCA_Transceiver;

struct Reading_Row {
    M::Quantity quantity;
    M::Level level;
    Property<real32> C::*property;
};

constexpr Reading_Row READINGS[] = {
    {M::TEMPERATURE, M::MEASURED, &C::Temperature},
    {M::VOLTAGE, M::MEASURED, &C::Vcc},
    {M::BIAS, M::MEASURED, &C::TxBiasCurrent},
    {M::TX_POWER, M::MEASURED, &C::TxPower},
    {M::RX_POWER, M::MEASURED, &C::RxPower},
    {M::RX_POWER, M::HIGH_ALARM, &C::RxPowerHighAlarm},
    {M::RX_POWER, M::LOW_ALARM, &C::RxPowerLowAlarm},
    {M::RX_POWER, M::HIGH_WARNING, &C::RxPowerHighWarning},
    {M::RX_POWER, M::LOW_WARNING, &C::RxPowerLowWarning},
    {M::TX_POWER, M::HIGH_ALARM, &C::TxPowerHighAlarm},
    {M::TX_POWER, M::LOW_ALARM, &C::TxPowerLowAlarm},
    {M::TX_POWER, M::HIGH_WARNING, &C::TxPowerHighWarning},
    {M::TX_POWER, M::LOW_WARNING, &C::TxPowerLowWarning},
    {M::TEMPERATURE, M::HIGH_ALARM, &C::TemperatureHighAlarm},
    {M::TEMPERATURE, M::LOW_ALARM, &C::TemperatureLowAlarm},
    {M::TEMPERATURE, M::HIGH_WARNING, &C::TemperatureHighWarning},
    {M::TEMPERATURE, M::LOW_WARNING, &C::TemperatureLowWarning},
    {M::VOLTAGE, M::HIGH_ALARM, &C::VoltageHighAlarm},
    {M::VOLTAGE, M::LOW_ALARM, &C::VoltageLowAlarm},
    {M::VOLTAGE, M::HIGH_WARNING, &C::VoltageHighWarning},
    {M::VOLTAGE, M::LOW_WARNING, &C::VoltageLowWarning},
    {M::BIAS, M::HIGH_ALARM, &C::CurrentHighAlarm},
    {M::BIAS, M::LOW_ALARM, &C::CurrentLowAlarm},
    {M::BIAS, M::HIGH_WARNING, &C::CurrentHighWarning},
    {M::BIAS, M::LOW_WARNING, &C::CurrentLowWarning},
};

bool read_module(const String& port_name, M& module) {
    HBA_WWN name{};
    AX_SffData data{};
    return port_name_to_wwn(port_name, name) &&
           AX_GetSffData(wwnOf(&name), &data) == AX_STATUS_OK && parse_sff8472(data, module);
}

void set_readings(C& transceiver, const M& module) {
    if (!module.hasDiagnostics)
        return;
    transceiver.SFPStatus.set(module.status);
    transceiver.TemperatureUnit.set("Celsius");
    for (const Reading_Row& row : READINGS)
        if (const auto& value = module.value[row.quantity][row.level])
            (transceiver.*row.property).set(*value);
}

Ref<C> transceiver_instance(const String& serial_and_number, const M& module) {
    auto transceiver = make_instance<C>();
    transceiver->CreationClassName.set("VLNMPCA_Transceiver");
    transceiver->Tag.set(serial_and_number);
    transceiver->Name.set(serial_and_number);
    transceiver->ElementName.set(format_text("VLN MPCA Transceiver:%s", serial_and_number.c_str()));
    transceiver->Manufacturer.set(text(module.vendor));
    transceiver->PartNumber.set(text(module.partNumber));
    transceiver->Version.set(text(module.revision));
    transceiver->SerialNumber.set(text(module.serialNumber));
    transceiver->OUI.set(text(module.oui));
    transceiver->Identifier.set(module.identifier);
    transceiver->ExtIdentifier.set(module.extIdentifier);
    transceiver->Connector.set(module.connector);
    if (module.waveLength)
        transceiver->WaveLength.set(*module.waveLength);
    // The year of the standard has two digits, and began with this century.
    Datetime date;
    if (module.dateCode.size() >= 6 &&
        date.set(("20" + module.dateCode.substr(0, 6) + "000000.000000+000").c_str()))
        transceiver->ManufactureDate.set(date);
    set_readings(*transceiver, module);
    return transceiver;
}

} // namespace

// Made with the first function of the port that tells of a transceiver.
void Adapter_Map_Builder::createTransceiver(const NIC_Port& port) {
    auto& transceivers = _agent.m_VLNMPCA_Transceiver_map;
    const auto known = find_by_key(transceivers, &C::Tag, port.serial_and_number);
    M module;
    if (known || !port.port_controller || !read_module(port.name, module))
        return;
    const auto* transceiver =
        insert_instance(transceivers, transceiver_instance(port.serial_and_number, module));
    VLN_LOG(VLN_DBG, "Created VLNMPCA_Transceiver");
    associate(_agent.m_VLNMPCA_TransceiverComponent_map, port.port_controller, transceiver);
}

} // namespace cimple
