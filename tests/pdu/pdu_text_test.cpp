#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "pdu/pdu_text.h"

TEST(PduText, DecimalsKeepTheLow32BitsWhateverTheSign) {
    const std::tuple<const char*, uint32_t> cases[] = {
        {"", 0u},
        {"0", 0u},
        {"15", 15u},
        {"4097", 4097u},
        {"2147483648", 0x80000000u},
        {"4294967295", 0xFFFFFFFFu},
        {"-1", 0xFFFFFFFFu},
        {"-6", 0xFFFFFFFAu},
        {"+7", 7u},
        {"4294967296", 0u},
        {"4294967297", 1u},
        {"  42", 42u},
        {"12abc", 12u},
        {"abc", 0u},
        {"-", 0u},
        {"1.0", 1u},
    };
    for (const auto& [text, value] : cases)
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
