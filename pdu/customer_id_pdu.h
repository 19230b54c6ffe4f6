// CCustomerIdPDU: the customer id the host hands over as configuration (main type 11).
// Only parsed.
#pragma once

#include <cstdint>
#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CCustomerIdPDU : public CKvoChatXMLPDU {
public:
    CCustomerIdPDU();

    // 1 when text has "customerid" text; otherwise 0 and the customer id stays as it was.
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetCustomerId(const std::string& strID) { m_strCustomerId = strID; }
    const std::string& GetCustomerId() const { return m_strCustomerId; }
    // The id's value: 0 for empty text, else the low 32 bits of the decimal.
    uint32_t GetCustomerId_DWORD() const;

private:
    std::string m_strCustomerId;
};
