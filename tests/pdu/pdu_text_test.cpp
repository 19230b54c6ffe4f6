#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <vector>

#include "pdu/pdu_text.h"

TEST(PduText, DecimalsKeepTheLow32BitsWhateverTheSign) {
    // Each value and the texts that read as it.
    const std::tuple<uint32_t, std::vector<const char*>> cases[] = {
        {0u, {"", "0", "abc", "-", "4294967296"}},
        {1u, {"4294967297", "1.0"}},
        {7u, {"+7"}},
        {12u, {"12abc"}},
        {42u, {"  42"}},
        {4097u, {"4097"}},
        {0x80000000u, {"2147483648"}},
        {0xFFFFFFFFu, {"4294967295", "-1"}},
        {0xFFFFFFFAu, {"-6"}},
    };
    for (const auto& [value, texts] : cases)
        for (const char* text : texts)
            EXPECT_EQ(DwordValue(text), value) << '"' << text << '"';
}

TEST(PduText, EveryCdataEndMarkerGetsItsBlank) {
    const std::tuple<const char*, const char*> cases[] = {
        {"", ""},
        {"plain", "plain"},
        {"a]]>b", "a]] >b"},
        {"]]>", "]] >"},
        {"]]>]]>", "]] >]] >"},
        {"]]>x]]>", "]] >x]] >"},
        {"]]]>>", "]]] >>"},
        {"]] >", "]] >"},
        {"]]", "]]"},
    };
    for (const auto& [in, out] : cases)
        EXPECT_EQ(ReplaceCdataEndMarkers(in), out) << in;
}
