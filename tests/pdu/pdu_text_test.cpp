#include <gtest/gtest.h>

#include <string>

#include "pdu/pdu_text.h"

TEST(PduText, DecimalsKeepTheLow32BitsWhateverTheSign) {
    const struct {
        const char* text;
        uint32_t value;
    } cases[] = {
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
    for (const auto& c : cases)
        EXPECT_EQ(DwordValue(c.text), c.value) << '"' << c.text << '"';
}

TEST(PduText, EveryCdataEndMarkerGetsItsBlank) {
    const struct {
        const char* in;
        const char* out;
    } cases[] = {
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
    for (const auto& c : cases)
        EXPECT_EQ(ReplaceCdataEndMarkers(c.in), c.out) << c.in;
}
