// The parser over damaged text: whatever the bytes, it answers with a document or an Error.
#include "schema/mof_parser/mof.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>

namespace {

// True if the text was accepted; an Error must name a place inside the text.
bool reads(const std::string& text) {
    try {
        mof::Schema schema(mof::parse_text(text, "t.mof"));
        return true;
    } catch (const mof::Error& error) {
        EXPECT_GE(error.where().line, 1u);
        EXPECT_GE(error.where().column, 1u);
        EXPECT_LE(error.where().line, 1 + std::count(text.begin(), text.end(), '\n'));
        return false;
    }
}

std::string sample() {
    std::string text = *mof::read_file(MOF_FOLDER "/qualifiers.mof");
    return text + *mof::read_file(MOF_FOLDER "/10_core.mof");
}

TEST(MofHostile, EveryPrefixOfACatalogueFile) {
    const std::string text = sample();
    ASSERT_TRUE(reads(text));
    for (std::size_t size = 0; size < text.size(); size += 7)
        reads(text.substr(0, size));
}

TEST(MofHostile, DamagedBytes) {
    const std::string text = sample();
    std::mt19937 random(2026);
    const std::string splices[] = {"\"",
                                   "/*",
                                   "{",
                                   "}",
                                   "[",
                                   "]",
                                   "(",
                                   ";",
                                   "\\",
                                   "'",
                                   "-",
                                   "0x",
                                   std::string(1, '\0'),
                                   "\xFF",
                                   "#pragma",
                                   "class",
                                   "ref",
                                   "9e9"};
    int refused = 0;
    for (int round = 0; round < 1500; round++) {
        std::string damaged = text;
        const auto faults = 1 + random() % 3;
        for (std::size_t i = 0; i < faults; i++) {
            std::size_t at = random() % damaged.size();
            if (random() % 2)
                damaged[at] = static_cast<char>(random());
            else
                damaged.replace(at, random() % 4, splices[random() % std::size(splices)]);
        }
        refused += !reads(damaged);
    }
    EXPECT_GT(refused, 500);
}

TEST(MofHostile, NoDepthOfNestingExhaustsTheStack) {
    const std::size_t many = 200000;
    for (const char* opening : {"{", "[", "(", "[a(", "class A {", "/*", "#pragma include (\""}) {
        std::string text;
        for (std::size_t i = 0; i < many; i++)
            text += opening;
        EXPECT_FALSE(reads(text)) << opening;
        EXPECT_FALSE(reads("class A { uint8 a[] = " + text)) << opening;
    }
    std::string chain = "class C0 {};";
    for (std::size_t i = 1; i < 20000; i++)
        chain += "class C" + std::to_string(i) + " : C" + std::to_string(i - 1) + " {};";
    EXPECT_TRUE(reads(chain));
}

} // namespace
