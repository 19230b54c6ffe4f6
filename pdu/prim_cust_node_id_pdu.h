// CPrimCustNodeIdPDU: the primary customer's node id, in the configuration envelope
// (main type 10). Only parsed.
#pragma once

#include <cstdint>
#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CPrimCustNodeIdPDU : public CKvoChatXMLPDU {
public:
    CPrimCustNodeIdPDU();

    // 1 when text has "primcust" text; otherwise 0 and the node id stays as it was.
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetPrimCustNodeId(const std::string& strID) { m_strPrimCustNodeId = strID; }
    const std::string& GetPrimCustNodeId() const { return m_strPrimCustNodeId; }
    // The id's value: 0 for empty text, else the low 32 bits of the decimal.
    uint32_t GetPrimCustNodeId_DWORD() const;

private:
    std::string m_strPrimCustNodeId;
};
