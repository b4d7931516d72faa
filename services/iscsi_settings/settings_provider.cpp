// How an iSCSI port names itself and proves it, and whether the host boots over it.
#include "agent/hardware/port_name.h"
#include "agent/text.h"
#include "foundation/common.h"
#include "services/iscsi_settings/instances.h"
#include "services/iscsi_settings/provider.h"
#include "services/iscsi_settings/rules.h"
#include "services/method_call.h"

namespace cimple {

namespace {

// What follows the last colon of a setting's name is the name of its port.
bool port_of_setting(const CIM_SettingData& setting, HBA_WWN& name) {
    const std::string id = setting.InstanceID.value.c_str();
    return VLN_MethodWrapper::string2HBAName(&name, id.substr(id.rfind(':') + 1).c_str()) != 0;
}

bool keeps_type(const CIM_SettingData& model, const CIM_SettingData& stored) {
    return model.ChangeableType.is_null() ||
           (!stored.ChangeableType.is_null() &&
            model.ChangeableType.value == stored.ChangeableType.value);
}

// ---- Initiator properties ----

using Initiator = VLNMPCA_ISCSIInitiatorPropertiesData;

constexpr char MISSING[] = "Err: Invalid input parameters for AuthMethod value %d ";

// Lengths are tested once all that the method needs is given.
bool check_account(const Initiator& model, uint32 method) {
    const bool mutual = method == AX_ISCSI_AUTH_MUTUAL_CHAP;
    if (method == AX_ISCSI_AUTH_NONE)
        return true;
    if (model.TargetCHAPName.is_null() || model.TargetSecret.is_null() ||
        (mutual && (model.InitCHAPName.is_null() || model.InitSecret.is_null()))) {
        VLN_LOG(VLN_ERR, MISSING, static_cast<int>(method));
        return false;
    }
    const CHAP_Texts texts{&model.TargetCHAPName, &model.TargetSecret, &model.InitCHAPName,
                           &model.InitSecret};
    if (is_authentication(method, texts))
        return true;
    const int name = MAX_CHAP_NAME, least = MIN_CHAP_SECRET, most = MAX_CHAP_SECRET;
    if (mutual)
        VLN_LOG(VLN_ERR,
                "Err: Init/Target ChapName lenght must not excced %d and Init/Target Secret lenght "
                "must be b/w %d and %d  characters",
                name, least, most);
    else
        VLN_LOG(VLN_ERR,
                "Err: TargetChapName lenght must not excced %d and TargetSecret lenght must be b/w "
                "%d and %d characters",
                name, least, most);
    return false;
}

bool take_name(const Property<String>& wanted, char (&field)[AX_ISCSI_NAME_SIZE],
               const char* line) {
    if (wanted.is_null())
        return true;
    if (wanted.value.size() > MAX_ISCSI_NAME) {
        VLN_LOG(VLN_ERR, "%s", line);
        return false;
    }
    put_text(wanted.value, field);
    return true;
}

bool take_account(const Initiator& model, AX_iSCSI_Authentication& account) {
    const char* word = model.AuthMethod.is_null() ? "" : model.AuthMethod.value.c_str();
    const auto method = authentication_number(word);
    if (!method) {
        VLN_LOG(VLN_ERR, "Invalid AuthMethod to process %s", word);
        return false;
    }
    if (!check_account(model, *method))
        return false;
    if (*method == AX_ISCSI_AUTH_NONE)
        account = {};
    put_account(
        *method,
        {&model.TargetCHAPName, &model.TargetSecret, &model.InitCHAPName, &model.InitSecret},
        account);
    return true;
}

bool set_initiator(const HBA_WWN& name, AX_iSCSI_InitiatorProperties& properties) {
    return VLN_MethodWrapper::SetInitiatorProperties(&name, properties) == AX_STATUS_OK &&
           VLN_MethodWrapper::GetIscsiInitiatorProps(&name, &properties) == AX_STATUS_OK;
}

sint32 modify_initiator(ProviderAgent& agent, const Initiator* model, const Initiator* instance) {
    if (!model || !instance)
        return refuse_modify(
            MODIFY_INSTANCE_FAILED,
            "VLNMPCA_ISCSIInitiatorPropertiesData_Provider::modify_instance invalid parameter");
    const Initiator* stored = agent.m_VLNMPCA_ISCSIInitiatorPropertiesData_map.lookup(instance);
    HBA_WWN name{};
    if (!stored || !port_of_setting(*stored, name))
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                             "Invalid instance of VLNMPCA_ISCSIInitiatorPropertiesData");
    AX_iSCSI_InitiatorProperties properties{};
    if (VLN_MethodWrapper::GetIscsiInitiatorProps(&name, &properties) != AX_STATUS_OK ||
        !take_name(model->InitiatorSCSIName, properties.name,
                   "Invalid InitiatorSCSIName to process") ||
        !take_name(model->InitiatorAlias, properties.alias, "Invalid InitiatorAlias to process") ||
        !take_account(*model, properties.authentication))
        return MODIFY_INSTANCE_FAILED;
    if (!keeps_type(*model, *stored))
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "Error:Invalid Input parameter, Changeable Type is not modifiable");
    if (!set_initiator(name, properties))
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "Unable to modify the VLNMPCA_ISCSIInitiatorPropertiesData element "
                             "setting data");
    change(agent.m_VLNMPCA_ISCSIInitiatorPropertiesData_map, stored,
           [&](Initiator& data) { fill_initiator_properties(data, properties); });
    VLN_LOG(VLN_DBG, "Successfully modified the ISCSI Initiator Properties data");
    return MODIFY_INSTANCE_OK;
}

// ---- Boot ----

using Boot = VLNMPCA_ISCSIBootData;

sint32 modify_boot(ProviderAgent& agent, const Boot* model, const Boot* instance) {
    const Boot* stored =
        model && instance ? agent.m_VLNMPCA_ISCSIBootData_map.lookup(instance) : nullptr;
    HBA_WWN name{};
    if (!stored || !port_of_setting(*stored, name))
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                             "Invalid instance of VLNMPCA_ISCSIBootData ");
    if (model->Value.is_null() || model->Value.value > 1)
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Error: No parameter specified");
    const uint32 value = model->Value.value;
    if (VLN_MethodWrapper::SetiSCSIBoot(&name, value) != AX_STATUS_OK)
        return MODIFY_INSTANCE_NOT_FOUND;
    change(agent.m_VLNMPCA_ISCSIBootData_map, stored,
           [value](Boot& data) { data.Value.set(value); });
    VLN_LOG(VLN_DBG, "Successfully modified the iSCSI Boot Status");
    return MODIFY_INSTANCE_OK;
}

// ---- Name servers ----

using State = VLNMPCA_ISCSIiSNSData;
using Server = VLNMPCA_ISCSIISNSServerData;

constexpr uint32 MAX_TCP_PORT = 65535;

// What is given goes over what there is.
template <class T>
const Property<T>& given_or(const Property<T>& given, const Property<T>& otherwise) {
    return given.is_null() ? otherwise : given;
}

AX_STATUS update_servers(const HBA_WWN& name, const Property<String>& address,
                         const Property<uint32>& port, uint32 enable) {
    if (address.is_null() || port.is_null() || port.value == 0 || port.value > MAX_TCP_PORT) {
        VLN_LOG(VLN_ERR, "UpdateiSNSServer: Invalid IP address or port passed.");
        return AX_STATUS_ERROR;
    }
    return VLN_MethodWrapper::UpdateiSNSServer(&name, address.value.c_str(),
                                               static_cast<uint16>(port.value), enable);
}

sint32 modify_state(ProviderAgent& agent, const State* model, const State* instance) {
    if (!model || !instance)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLNMPCA_ISCSIiSNSData_Provider::modify_instance invalid parameter");
    const State* stored = agent.m_VLNMPCA_ISCSIiSNSData_map.lookup(instance);
    HBA_WWN name{};
    if (!stored || !port_of_setting(*stored, name))
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                             "Invalid instance of VLNMPCA_ISCSIiSNSData");
    if (model->IPAddress.is_null() && model->TCPPort.is_null() && model->Enable.is_null())
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Error: No parameter specified");
    if (!keeps_type(*model, *stored))
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Error:Invalid Input parameter, Modifiable "
                                                     "parameters are IPAddress and TCPPort");
    const uint32 enable = given_or(model->Enable, stored->Enable).value;
    if (update_servers(name, given_or(model->IPAddress, stored->IPAddress),
                       given_or(model->TCPPort, stored->TCPPort), enable) != AX_STATUS_OK)
        return MODIFY_INSTANCE_FAILED;
    rebuild_name_servers(agent);
    return MODIFY_INSTANCE_OK;
}

sint32 refuse_create(const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return CREATE_INSTANCE_FAILED;
}

// The key is made here, whatever the client gave: it is what the client is told.
sint32 create_server(ProviderAgent& agent, Server& wanted) {
    if (wanted.IPAddress.is_null() || wanted.TCPPort.is_null() ||
        wanted.InitPortMACAddress.is_null())
        return refuse_create("Err:Input parameters missing");
    HBA_WWN name{};
    if (!wanted.ChangeableType.is_null() ||
        !find_iscsi_port(agent, wanted.InitPortMACAddress.value, name))
        return refuse_create("Err:Invalid Input parameter, The valid parameters are IPAddress and "
                             "TCPPort");
    if (update_servers(name, wanted.IPAddress, wanted.TCPPort, 1) != AX_STATUS_OK)
        return CREATE_INSTANCE_FAILED;
    AX_IPAddress server{};
    VLN_MethodWrapper::addressOf(wanted.IPAddress.value.c_str(),
                                 static_cast<uint16>(wanted.TCPPort.value), server);
    wanted.InstanceID.set(name_server_id(text(VLN_Common::wwnText(name.wwn)), server));
    rebuild_name_servers(agent);
    return CREATE_INSTANCE_OK;
}

sint32 delete_server(ProviderAgent& agent, const Server* keys) {
    const Server* stored = keys ? agent.m_VLNMPCA_ISCSIISNSServerData_map.lookup(keys) : nullptr;
    HBA_WWN name{};
    AX_IPAddress server{};
    if (!stored ||
        !VLN_MethodWrapper::string2HBAName(&name, stored->InitPortMACAddress.value.c_str()) ||
        !VLN_MethodWrapper::addressOf(stored->IPAddress.value.c_str(),
                                      static_cast<uint16>(stored->TCPPort.value), server)) {
        VLN_LOG(VLN_ERR, "Invalid instance of VLNMPCA_ISCSIISNSServerData");
        return DELETE_INSTANCE_NOT_FOUND;
    }
    if (VLN_MethodWrapper::DeleteiSNSServer(&name, server) != AX_STATUS_OK)
        return DELETE_INSTANCE_FAILED;
    rebuild_name_servers(agent);
    return DELETE_INSTANCE_OK;
}

// As answer_modify, for the other two.
template <class Operation>
sint32 answer_operation(sint32 failed, Operation operation) {
    ProviderAgent* agent = ProviderAgent::current();
    sint32 status = failed;
    const bool complete = agent && run_guarded([&] {
                              const Operation_Prologue prologue(*agent);
                              status = operation(*agent);
                          });
    return complete ? status : failed;
}

} // namespace

sint32 Initiator_Properties_Provider::modify_instance(const Initiator* model,
                                                      const Initiator* instance) {
    return answer_modify(
        [&](ProviderAgent& agent) { return modify_initiator(agent, model, instance); });
}

sint32 ISCSI_Boot_Provider::modify_instance(const Boot* model, const Boot* instance) {
    return answer_modify([&](ProviderAgent& agent) { return modify_boot(agent, model, instance); });
}

sint32 Name_Server_State_Provider::modify_instance(const State* model, const State* instance) {
    return answer_modify(
        [&](ProviderAgent& agent) { return modify_state(agent, model, instance); });
}

sint32 Name_Server_Provider::create_instance(Server* instance) {
    return answer_operation(CREATE_INSTANCE_FAILED,
                            [&](ProviderAgent& agent) { return create_server(agent, *instance); });
}

sint32 Name_Server_Provider::delete_instance(const Server* keys) {
    return answer_operation(DELETE_INSTANCE_FAILED,
                            [&](ProviderAgent& agent) { return delete_server(agent, keys); });
}

} // namespace cimple
