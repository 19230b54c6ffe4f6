// CPrivateMessagePDU: one chat line sent as private data from one participant to another
// (main type 2).
#pragma once

#include <cstdint>
#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CPrivateMessagePDU : public CKvoChatXMLPDU {
public:
    CPrivateMessagePDU();

    // Builds "sendid", "SenderName", "recid", "ReceiverName", "message", each only when set.
    // Returns 1.
    int GenerateXMLPDU() override;
    // 1 when text is a private message with "sendid" and "recid" text and a "message"
    // element; fields read before a failure keep their new values.
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetSenderName(const std::string& strName) { m_strSenderName = strName; }
    void SetReceiverName(const std::string& strName) { m_strReceiverName = strName; }
    void SetSendID(uint32_t dwID);
    void SetSendID(const std::string& strID) { m_strSendID = strID; }
    // A role id such as -1 (host) is passed as its 32-bit pattern and written as the unsigned
    // decimal "4294967295", the form builds with a 32-bit unsigned long have always sent;
    // readers keep the low 32 bits of what they read, so that text and "-1" mean the same.
    void SetReveID(uint32_t dwID);
    void SetReveID(const std::string& strID) { m_strReveID = strID; }
    // Stores the text with every "]]>" already widened to "]] >".
    void SetMessageContent(const std::string& strContent);

    const std::string& GetSenderName() const { return m_strSenderName; }
    const std::string& GetReceiverName() const { return m_strReceiverName; }
    const std::string& GetSendID() const { return m_strSendID; }
    const std::string& GetReveID() const { return m_strReveID; }
    const std::string& GetMessageContent() const { return m_strMessageContent; }
    // The ids' values: 0 for empty text, else the low 32 bits of the decimal.
    uint32_t GetSendID_DWORD() const;
    uint32_t GetReveID_DWORD() const;

    // Append the field to elem as CDATA; 0 (appending nothing) when the field is empty.
    int GenerateSenderNameElem(TiXmlElement*& elem);
    int GenerateReceiverNameElem(TiXmlElement*& elem);
    int GenerateMessageContentElem(TiXmlElement*& elem);
    // Take elem's text into the field when it has any.
    void ParseSenderNameElem(TiXmlElement*& elem);
    void ParseReceiverNameElem(TiXmlElement*& elem);
    void ParseMessageContentElem(TiXmlElement*& elem);

private:
    std::string m_strSenderName;
    std::string m_strReceiverName;
    std::string m_strSendID;
    std::string m_strReveID;
    std::string m_strMessageContent;
};
