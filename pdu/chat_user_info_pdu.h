// CChatUserInfoPDU: a participant's user id and name, appended to the user-info cache so that
// late joiners can name the senders of chat history (main type 4).
#pragma once

#include <cstdint>
#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CChatUserInfoPDU : public CKvoChatXMLPDU {
public:
    CChatUserInfoPDU();

    // Builds "uid", "un", "UIT", each only when set ("UIT" also not when "0"). Returns 1.
    int GenerateXMLPDU() override;
    // 1 when text has "uid" text and a "un" element (its text may be empty).
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetUserName(const std::string& strName) { m_strUserName = strName; }
    void SetUserID(uint32_t dwID);
    void SetUserID(const std::string& strID) { m_strUserID = strID; }
    void SetUserExternalTag(uint32_t dwTag);
    void SetUserExternalTag(const std::string& strTag) { m_strUserExternalTag = strTag; }

    const std::string& GetUserName() const { return m_strUserName; }
    const std::string& GetUserID() const { return m_strUserID; }
    const std::string& GetUserExternalTag() const { return m_strUserExternalTag; }
    // The texts' values: 0 for empty text, else the low 32 bits of the decimal.
    uint32_t GetUserID_DWORD() const;
    uint32_t GetUserExternalTag_DWORD() const;

private:
    std::string m_strUserName;
    std::string m_strUserID;
    std::string m_strUserExternalTag;
};
