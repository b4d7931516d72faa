// What an adapter takes of names and secrets. Values alone: no library, no log, no lock.
#ifndef VLN_SERVICES_ISCSI_SETTINGS_RULES_H
#define VLN_SERVICES_ISCSI_SETTINGS_RULES_H

#include "cimple/instance.h"
#include "device/library/axapi.h"

#include <cstring>
#include <optional>

namespace cimple {

inline constexpr uint32 MAX_CHAP_NAME = 255;
inline constexpr uint32 MIN_CHAP_SECRET = 12;
inline constexpr uint32 MAX_CHAP_SECRET = 16;
inline constexpr uint32 MAX_ISCSI_NAME = 255;

// The four texts of CHAP as a client gives them.
struct CHAP_Texts {
    const Property<String>* target_name;
    const Property<String>* target_secret;
    const Property<String>* initiator_name;
    const Property<String>* initiator_secret;
};

// 11 to 223 bytes.
bool is_target_name(const Property<String>& name);

// AX_ISCSI_AUTH_ by its text in any case, and back; none for another.
std::optional<uint32> authentication_number(const char* text);
const char* authentication_text(uint32 method);

// Whether a text is given, and 1 to 255 bytes; 12 to 16.
bool is_chap_name(const Property<String>& name);
bool is_chap_secret(const Property<String>& secret);
// Whether the method has the texts that it needs; false for a number that is no method.
bool is_authentication(uint32 method, const CHAP_Texts& texts);

// Cut to the field, with zeros behind.
template <std::size_t size>
void put_text(const String& text, char (&field)[size]) {
    std::memset(field, 0, size);
    std::memcpy(field, text.c_str(), text.size() < size ? text.size() : size - 1);
}

// Writes the method into the account, and the texts that it needs. All else stays.
void put_account(uint32 method, const CHAP_Texts& texts, AX_iSCSI_Authentication& account);

} // namespace cimple

#endif // VLN_SERVICES_ISCSI_SETTINGS_RULES_H
