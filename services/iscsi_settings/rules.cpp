#include "services/iscsi_settings/rules.h"

#include "cimple/meta.h"

#include <iterator>

namespace cimple {

namespace {

constexpr uint32 MIN_TARGET_NAME = 11;
constexpr uint32 MAX_TARGET_NAME = 223; // RFC 7143

constexpr const char* AUTHENTICATION_TEXTS[] = {"None", "One-Way CHAP", "Mutual CHAP"};

bool has_length(const Property<String>& text, uint32 least, uint32 most) {
    return !text.is_null() && text.value.size() >= least && text.value.size() <= most;
}

} // namespace

bool is_target_name(const Property<String>& name) {
    return has_length(name, MIN_TARGET_NAME, MAX_TARGET_NAME);
}

std::optional<uint32> authentication_number(const char* text) {
    for (uint32 i = 0; i < std::size(AUTHENTICATION_TEXTS); ++i)
        if (name_equal(text, AUTHENTICATION_TEXTS[i]))
            return i;
    return {};
}

const char* authentication_text(uint32 method) {
    return method < std::size(AUTHENTICATION_TEXTS) ? AUTHENTICATION_TEXTS[method] : "Unknown";
}

bool is_chap_name(const Property<String>& name) {
    return has_length(name, 1, MAX_CHAP_NAME);
}

bool is_chap_secret(const Property<String>& secret) {
    return has_length(secret, MIN_CHAP_SECRET, MAX_CHAP_SECRET);
}

bool is_authentication(uint32 method, const CHAP_Texts& texts) {
    if (method == AX_ISCSI_AUTH_NONE)
        return true;
    const bool one_way = is_chap_name(*texts.target_name) && is_chap_secret(*texts.target_secret);
    if (method == AX_ISCSI_AUTH_ONE_WAY_CHAP)
        return one_way;
    return method == AX_ISCSI_AUTH_MUTUAL_CHAP && one_way && is_chap_name(*texts.initiator_name) &&
           is_chap_secret(*texts.initiator_secret);
}

void put_account(uint32 method, const CHAP_Texts& texts, AX_iSCSI_Authentication& account) {
    account.method = method;
    if (method == AX_ISCSI_AUTH_NONE)
        return;
    put_text(texts.target_name->value, account.targetCHAPName);
    put_text(texts.target_secret->value, account.targetSecret);
    if (method != AX_ISCSI_AUTH_MUTUAL_CHAP)
        return;
    put_text(texts.initiator_name->value, account.initiatorCHAPName);
    put_text(texts.initiator_secret->value, account.initiatorSecret);
}

} // namespace cimple
