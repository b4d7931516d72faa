// Texts that name things: WWNs, MAC addresses, device identifiers, versions.
#include "foundation/address_text.h"
#include "foundation/common.h"
#include "fuzz/fuzz.h"
#include "operations/method_wrapper.h"

#include <arpa/inet.h>
#include <vector>

using namespace cimple;

namespace {

std::string upper(std::string text) {
    for (char& c : text)
        if (c >= 'a' && c <= 'z')
            c = static_cast<char>(c - 'a' + 'A');
    return text;
}

void wwn_texts(const char* text) {
    uint8 bytes[8];
    if (VLN_Common::stringToWwn(bytes, text) == 0)
        FUZZ_CHECK(VLN_Common::wwnText(bytes) == upper(text));
    uint8 word[8] = {1, 2, 3, 4, 5, 6, 7, 8};
    if (!VLN_Common::stringToWwnWord(word, text))
        FUZZ_CHECK(word[0] == 1 && word[7] == 8);

    char colon_form[VLN_MethodWrapper::HBA_NAME_SIZE];
    HBA_WWN name{};
    if (VLN_MethodWrapper::string2HBAName(&name, text) == 1) {
        // What is a plain name is a device identifier as well, and means the same.
        HBA_WWN other{};
        FUZZ_CHECK(VLN_MethodWrapper::Id2HBAName(colon_form, text) == 0);
        FUZZ_CHECK(VLN_MethodWrapper::str2HBAName(&other, colon_form) == 0);
        FUZZ_CHECK(std::memcmp(&name, &other, sizeof name) == 0);
    }
    if (VLN_MethodWrapper::Id2HBAName(colon_form, text) == 0)
        FUZZ_CHECK(std::strlen(colon_form) < sizeof colon_form);
    if (VLN_MethodWrapper::str2HBAName(&name, text) == 0) {
        HBA_WWN again{};
        VLN_MethodWrapper::HBAName2Str(colon_form, &name);
        FUZZ_CHECK(VLN_MethodWrapper::str2HBAName(&again, colon_form) == 0);
        FUZZ_CHECK(std::memcmp(&name, &again, sizeof name) == 0);
    }
}

void mac_texts(const char* text) {
    std::string naa;
    if (VLN_Common::macToNaa(&naa, text) == 0)
        FUZZ_CHECK(naa.size() == 23);
    else
        FUZZ_CHECK(naa.empty());
}

void version_texts(const char* text) {
    VLN_FirmwareVersion version;
    if (VLN_Common::parseVersion(text, version) == 0)
        FUZZ_CHECK(version.major < 10 && version.minor < 10 && version.revision < 10 &&
                   version.build < 10 && version.releaseType.size() == 1);
    uint16 numbers[4];
    VLN_Common::versionFourNumbers(text, numbers);
}

void tokens(const std::string& text) {
    std::vector<char> copy(text.c_str(), text.c_str() + text.size() + 1);
    std::size_t length = 0;
    char* place = nullptr;
    for (char* token = VLN_Common::nextToken(copy.data(), ",=", &place); token;
         token = VLN_Common::nextToken(nullptr, ",=", &place)) {
        FUZZ_CHECK(*token != '\0' && std::strpbrk(token, ",=") == nullptr);
        length += std::strlen(token) + 1;
    }
    FUZZ_CHECK(length <= copy.size());
}

void bytes_to_text(const std::string& bytes) {
    char text[33];
    const auto count = static_cast<uint32>(bytes.size());
    VLN_Common::bytesToSeparatedText(reinterpret_cast<const sint8*>(bytes.data()), text, ".", count,
                                     sizeof text - 1);
    FUZZ_CHECK(std::memchr(text, 0, sizeof text) != nullptr);
}

// What is an IPv4 address to the C library is one to us; what is shown is taken.
void written_addresses(const std::string& text) {
    uint8 expected[4] = {};
    const auto address = parse_ipv4(text);
    if (std::strlen(text.c_str()) == text.size() && inet_pton(AF_INET, text.c_str(), expected) == 1)
        FUZZ_CHECK(address && std::memcmp(address->data(), expected, sizeof expected) == 0);
    if (address)
        FUZZ_CHECK(parse_ipv4(ipv4_text(*address)) == address);
    if (const auto mac = parse_mac(text))
        FUZZ_CHECK(parse_mac(mac_digits(*mac)) == mac);
}

// Only what is an address: anything else is a name, and would go out to the network's resolver.
void addresses(const char* text) {
    uint8 expected[16] = {};
    if (inet_pton(AF_INET, text, expected) != 1 && inet_pton(AF_INET6, text, expected) != 1)
        return;
    VLN_IpInfo address;
    FUZZ_CHECK(VLN_MethodWrapper::ipAddr2IpInfo(text, &address) == 0);
    FUZZ_CHECK(std::memcmp(address.address, expected, sizeof expected) == 0);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::listen_to_log();
    const std::string text = fuzz::Input(data, size).rest();
    wwn_texts(text.c_str());
    mac_texts(text.c_str());
    version_texts(text.c_str());
    tokens(text.c_str());
    bytes_to_text(text);
    written_addresses(text);
    addresses(text.c_str());
    return 0;
}
