// CGroupMessagePDU: one chat line appended to a send-to group's shared cache, and what
// recovery reads back (main type 3).
#pragma once

#include <cstdint>
#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CGroupMessagePDU : public CKvoChatXMLPDU {
public:
    CGroupMessagePDU();

    // Builds "sendid", "sendnodeid", "SenderName", "groupid", "ReceiverName", "GroupCacheId",
    // "message", each only when set. Returns 1.
    int GenerateXMLPDU() override;
    // 1 when text is a group message with "sendid" and "groupid" text and a "message"
    // element; fields read before a failure keep their new values.
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetSenderName(const std::string& strName) { m_strSenderName = strName; }
    void SetSendNodeId(uint32_t dwID);
    void SetSendNodeId(const std::string& strID) { m_strSendNodeId = strID; }
    void SetReceiverName(const std::string& strName) { m_strReceiverName = strName; }
    void SetSendID(uint32_t dwID);
    void SetSendID(const std::string& strID) { m_strSendID = strID; }
    void SetGroupID(uint32_t dwID);
    void SetGroupID(const std::string& strID) { m_strGroupID = strID; }
    // Stored unchanged; "]]>" is widened only in the generated document.
    void SetMessageContent(const std::string& strContent) { m_strMessageContent = strContent; }
    // Sets both the text and the numeric value of the cache handle.
    void SetGroupCacheId(uint32_t dwID);
    // Sets the text only; the numeric value stays as it was.
    void SetGroupCacheId(const std::string& strID) { m_strGroupCacheId = strID; }

    const std::string& GetSenderName() const { return m_strSenderName; }
    const std::string& GetSendNodeId() const { return m_strSendNodeId; }
    const std::string& GetReceiverName() const { return m_strReceiverName; }
    const std::string& GetSendID() const { return m_strSendID; }
    const std::string& GetGroupID() const { return m_strGroupID; }
    const std::string& GetMessageContent() const { return m_strMessageContent; }
    const std::string& GetGroupCacheId() const { return m_strGroupCacheId; }
    // The numeric cache handle given to SetGroupCacheId(uint32_t); 0 until then.
    uint32_t GetGroupCacheIdValue() const { return m_dwGroupCacheId; }
    // The texts' values: 0 for empty text, else the low 32 bits of the decimal.
    uint32_t GetSendID_DWORD() const;
    uint32_t GetSendNodeId_DWORD() const;
    uint32_t GetGroupID_DWORD() const;
    uint32_t GetGroupCacheId_DWORD() const;

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
    std::string m_strSendNodeId;
    std::string m_strReceiverName;
    std::string m_strSendID;
    std::string m_strGroupID;
    std::string m_strMessageContent;
    std::string m_strGroupCacheId;
    uint32_t m_dwGroupCacheId = 0;
};
