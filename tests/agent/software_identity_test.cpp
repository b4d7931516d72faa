#include "agent/software/software_identity.h"

#include "agent/text.h"
#include "operations/curl_library.h"

#include <cstring>
#include <gtest/gtest.h>

namespace cimple {

// A word that is missing counts as not being the first one.
TEST(Target_System, CodesFollowTheWordsOfTheText) {
    const struct {
        const char* system;
        const char* codes;
    } rows[] = {
        {"Linux 2.6 x86_64 RH", "36 80 "},
        {"Linux", "36 80 "},
        {"x86_64 Linux", "36 79 "},
        {"RH Linux 6", "36 85 "},
        {"SL Linux", "36 80 "},
        {"VMware ESX", "104 "},
        {"Linux on VMware", "36 80 "},
        {"Windows 2008 x64 R2", "103 "},
        {"R2 Windows 2008", "77 "},
        {"2008 Windows R2", "1 2008 Windows R2"},
        {"Solaris", "1 Solaris"},
        {"", "1 "},
    };
    for (const auto& row : rows) {
        const Ref<CIM_SoftwareIdentity> software(create_null<CIM_SoftwareIdentity>());
        append_target_system(*software, row.system);
        std::string codes;
        for (uint16 code : software->TargetOSTypes.value)
            codes += std::to_string(code) + " ";
        for (const String& name : software->TargetOperatingSystems.value)
            codes += name.c_str();
        EXPECT_EQ(codes, row.codes) << row.system;
    }
}

TEST(Text, IsWholeAndPureHoweverLong) {
    for (const std::size_t length : {255u, 256u, 5000u})
        EXPECT_EQ(format_text("%s\xFF", std::string(length, 'x').c_str()),
                  String((std::string(length, 'x') + "\xEF\xBF\xBD").c_str()));
}

namespace {

bool curl_installed = false;
int curl_open = 0;

// A host with or without libcurl, under the one name that all distributions know.
constexpr Loader_Calls CURL_LOADER = {
    [](const char* file, int) -> void* {
        if (!curl_installed || std::strcmp(file, "libcurl.so") != 0)
            return nullptr;
        ++curl_open;
        return &curl_open;
    },
    [](void*, const char*) -> void* { return nullptr; },
    [](void*) { return --curl_open; },
    []() -> char* { return nullptr; },
};

} // namespace

TEST(Curl, IsLookedForAndLetGoAgain) {
    replace_curl_loader(&CURL_LOADER);
    for (const bool installed : {true, false}) {
        curl_installed = installed;
        EXPECT_EQ(curl_is_present(), installed);
        EXPECT_EQ(curl_open, 0);
    }
    replace_curl_loader(nullptr);
}

} // namespace cimple
