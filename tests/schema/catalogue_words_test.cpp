// What the catalogue tells people of our classes: a sentence for each of their parts, and words for
// numbers.
#include "schema/mof_parser/word_map.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace {

class Catalogue_Words : public testing::Test {
protected:
    // What our classes declare themselves.
    template <class Visit>
    void for_own_features(Visit visit) const {
        for (const auto& each : _schema.classes())
            if (each->name().rfind("VLNMPCA_", 0) == 0)
                for (const mof::Feature& feature : each->declaration->features)
                    visit(each->name() + "." + feature.name, feature);
    }

    const mof::Schema _schema = mof::load_schema(MOF_FOLDER "/catalogue.mof");
};

bool is_sentence(const mof::Qualifiers& qualifiers) {
    const mof::Qualifier* description = mof::find(qualifiers, "Description");
    const std::string text = description ? description->value.text : "";
    return text.size() > 1 && text.back() == '.' && text.find("  ") == std::string::npos;
}

TEST_F(Catalogue_Words, EveryPartOfOursIsDescribed) {
    for (const auto& each : _schema.classes()) {
        const bool ours = each->name().rfind("VLNMPCA_", 0) == 0;
        EXPECT_TRUE(!ours || is_sentence(each->qualifiers())) << each->name();
    }
    for_own_features([](const std::string& name, const mof::Feature& feature) {
        EXPECT_TRUE(is_sentence(feature.qualifiers)) << name;
        for (const mof::Parameter& parameter : feature.parameters)
            EXPECT_TRUE(is_sentence(parameter.qualifiers)) << name << " " << parameter.name;
    });
}

// Numbers of the adapter or of its library whose meaning only they know, and a register.
constexpr const char* WITHOUT_WORDS[] = {
    ".AutoNegotiationStatus", ".LinkStatus",    ".MICallRMStatus", ".MaskingState", ".PCIType",
    "FIPFCFData.State",       ".FeatureEnable",
};
constexpr const char* ENDINGS_OF_WORDS[] = {
    "State", "Status", "Mode", "Type", "Types", "Enable", "Enabled", "Boot", "Rule",
};

template <std::size_t N>
bool ends_with_any(const std::string& name, const char* const (&endings)[N]) {
    return std::any_of(std::begin(endings), std::end(endings),
                       [&](const char* ending) { return name.ends_with(ending); });
}

void expect_words(const std::string& name, const mof::Declaration& declaration) {
    const auto length = [&](const char* qualifier) {
        const mof::Qualifier* list = mof::find(declaration.qualifiers, qualifier);
        return list ? list->value.elements.size() : 0;
    };
    EXPECT_EQ(length("BitMap"), length("BitValues")) << name;
    const bool stands_for_word =
        declaration.type >= mof::Type::uint8 && declaration.type <= mof::Type::sint64 &&
        ends_with_any(name, ENDINGS_OF_WORDS) && !ends_with_any(name, WITHOUT_WORDS);
    EXPECT_TRUE(!stands_for_word || mof::Word_Map::read(declaration) || length("BitMap")) << name;
}

TEST_F(Catalogue_Words, NumbersThatStandForWordsHaveThem) {
    for_own_features([](const std::string& name, const mof::Feature& feature) {
        for (const mof::Parameter& parameter : feature.parameters)
            expect_words(name + " " + parameter.name, parameter);
        if (feature.kind != mof::Feature_Kind::method)
            return expect_words(name, feature);
        if (feature.name == "RefreshTable") // is refused
            return;
        const auto words = mof::Word_Map::read(feature);
        ASSERT_TRUE(words) << name;
        for (const std::int64_t result : {0, 33068})
            EXPECT_TRUE(words->find(result)) << name << " answers " << result;
    });
}

} // namespace
