#include <gtest/gtest.h>

#include <string>

#include "pdu/customer_id_pdu.h"
#include "pdu/faq_macro_info_pdu.h"
#include "pdu/prim_cust_node_id_pdu.h"

TEST(FAQMacroInfo, EachConfigurationReplacesOnlyTheDetailsItCarries) {
    CFAQMacroInfoPDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>8</mtype><fname>Ann</fname>"
                              "<lname>Lee</lname><phone>+1 &amp; 2</phone>"
                              "<email>a@example.org</email></chat>"),
              1);
    EXPECT_EQ(pdu.GetFirstName(), "Ann");
    EXPECT_EQ(pdu.GetLastName(), "Lee");
    EXPECT_EQ(pdu.GetPhoneNumber(), "+1 & 2");
    EXPECT_EQ(pdu.GetEmailAddress(), "a@example.org");

    // The same object takes every later configuration; the newest one wins.
    ASSERT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>8</mtype><fname></fname>"
                              "<email>b@example.org</email></chat>"),
              1);
    EXPECT_EQ(pdu.GetFirstName(), "Ann");
    EXPECT_EQ(pdu.GetLastName(), "Lee");
    EXPECT_EQ(pdu.GetPhoneNumber(), "+1 & 2");
    EXPECT_EQ(pdu.GetEmailAddress(), "b@example.org");

    EXPECT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>11</mtype><fname>Bo</fname></chat>"), 0);
    EXPECT_EQ(pdu.GetFirstName(), "Ann");
}

TEST(FAQMacroInfo, IsNeverGenerated) {
    CFAQMacroInfoPDU pdu;
    pdu.SetFirstName("Ann");
    EXPECT_EQ(pdu.GenerateXMLPDU(), 0);
    EXPECT_EQ(pdu.ToWireText(), "");
}

TEST(CustomerId, IsTakenOnlyFromACustomerIdText) {
    CCustomerIdPDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>11</mtype><customerid>77</customerid>"
                              "</chat>"),
              1);
    EXPECT_EQ(pdu.GetCustomerId_DWORD(), 77u);
    const char* refused[] = {
        "<chat ver=\"1.0\"><mtype>11</mtype><customerid></customerid></chat>",
        "<chat ver=\"1.0\"><mtype>11</mtype></chat>",
        "<chat ver=\"1.0\"><mtype>10</mtype><customerid>5</customerid></chat>",
    };
    for (const char* text : refused) {
        EXPECT_EQ(pdu.ParseXMLPDU(text), 0) << text;
        EXPECT_EQ(pdu.GetCustomerId(), "77") << text;
    }
    // 0 is a value like any other: it means there is no customer cache.
    ASSERT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>11</mtype><customerid>0</customerid>"
                              "</chat>"),
              1);
    EXPECT_EQ(pdu.GetCustomerId(), "0");
    EXPECT_EQ(pdu.GetCustomerId_DWORD(), 0u);
}

TEST(PrimCustNodeId, IsTakenOnlyFromAPrimcustText) {
    CPrimCustNodeIdPDU pdu;
    ASSERT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>10</mtype><primcust>4294967295</primcust>"
                              "</chat>"),
              1);
    EXPECT_EQ(pdu.GetPrimCustNodeId_DWORD(), 0xFFFFFFFFu);
    EXPECT_EQ(pdu.ParseXMLPDU("<chat ver=\"1.0\"><mtype>10</mtype></chat>"), 0);
    EXPECT_EQ(pdu.GetPrimCustNodeId(), "4294967295");
}
