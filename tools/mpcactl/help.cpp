#include "tools/mpcactl/help.h"

namespace mpcactl {

namespace {

struct Examples {
    const char* command;
    const char* lines;
};

constexpr Examples EXAMPLES[] = {
    {"", R"(  mpcactl --simulate two-port-cna census
  mpcactl --simulate two-port-cna class VLNMPCA_EthernetPort
  mpcactl --simulate two-port-cna enum VLNMPCA_EthernetPort -p DeviceID,Speed
  mpcactl --simulate two-port-cna names CIM_NetworkPort
  mpcactl --simulate two-port-cna get 'VLNMPCA_FRUVitalProductData.InstanceID="VR10420117"' --format json

Without a command, on a terminal, it asks for commands. docs/mpcactl.md is the guide.

Exit status: 0 done; 1 a CIM error (its CMPI word stands on standard error) or faults of the
provider; 2 wrong usage.)"},
    {"classes", R"(  mpcactl classes --all --format json)"},
    {"class", R"(  mpcactl class VLNMPCA_EthernetPort)"},
    {"enum", R"(  mpcactl --simulate two-port-cna enum VLNMPCA_EthernetPort -p DeviceID,Speed
  mpcactl --simulate two-port-cna enum VLNMPCA_EthernetPort --words --format mof)"},
    {"names", R"(  mpcactl --simulate two-port-cna names CIM_NetworkPort)"},
    {"census", R"(  mpcactl --simulate two-port-cna census)"},
    {"get",
     R"(  mpcactl --simulate two-port-cna get 'VLNMPCA_FRUVitalProductData.InstanceID="VR10420117"')"},
    {"create",
     R"(  mpcactl --simulate two-port-cna create VLNMPCA_ARPEntry MACAddress=02564C000002 DesMACAddress=02564C0000FF DesIPAddress=198.51.100.7)"},
    {"modify",
     R"(  mpcactl --simulate two-port-cna modify 'VLNMPCA_ProviderConfigSetting.InstanceID="Vorlan MPCA Provider:cachetimeout"' current=20)"},
    {"delete",
     R"(  mpcactl --simulate two-port-cna delete 'VLNMPCA_ARPEntry.MACAddress="02564c000002",DesMACAddress="02564cfe0001",DesIPAddress="198.51.100.1"')"},
    {"assoc",
     R"(  mpcactl --simulate two-port-cna assoc 'VLNMPCA_FRUVitalProductData.InstanceID="VR10420117"' -p Tag,Model)"},
    {"assoc-names",
     R"(  mpcactl --simulate two-port-cna assoc-names 'VLNMPCA_Card.Tag="0f4a2c117d3e4b529a0102564c000001",CreationClassName="VLNMPCA_Card"' --result-class VLNMPCA_PhysicalConnector)"},
    {"refs",
     R"(  mpcactl --simulate two-port-cna refs 'VLNMPCA_FRUVitalProductData.InstanceID="VR10420117"')"},
    {"ref-names",
     R"(  mpcactl --simulate two-port-cna ref-names 'VLNMPCA_FRUVitalProductData.InstanceID="VR10420117"')"},
    {"invoke",
     R"(  mpcactl --simulate two-port-cna invoke 'VLNMPCA_SoftwareInstallationService.Name="Vorlan MPCA Software Installation Service",SystemCreationClassName="CIM_ComputerSystem",SystemName="simulated-host",CreationClassName="VLNMPCA_SoftwareInstallationService"' StartService --check)"},
    {"hardware",
     R"(  mpcactl --simulate two-port-cna --keep host hardware 100002564C000000 portAttributes FunctionalPortState 3)"},
    {"reboot", R"(  mpcactl --simulate two-port-cna --keep host reboot)"},
    {"reset", R"(  mpcactl --simulate two-port-cna --keep host reset 100002564C000000)"},
    {"pull", R"(  mpcactl --simulate two-port-cna --keep host pull 100002564C000000)"},
    {"plug", R"(  mpcactl --simulate two-port-cna --keep host plug 100002564C000000)"},
    {"system-log",
     R"(  mpcactl --simulate two-port-cna --keep host system-log 'simulated-host kernel: vnicd: vln0: link is down')"},
    {"simulate-firmware",
     R"(  mpcactl --simulate two-port-cna simulate-firmware new.img VMC-2210 10.4.255.3 --size 8388608)"},
    {"run", R"(  echo 'names VLNMPCA_Card' | mpcactl --simulate two-port-cna run -)"},
};

} // namespace

std::string examples_of(const std::string& command) {
    for (const Examples& each : EXAMPLES)
        if (command == each.command)
            return std::string("Examples:\n") + each.lines;
    return "";
}

} // namespace mpcactl
