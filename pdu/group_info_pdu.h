// CGroupInfoPDU: a send-to group's display name, appended to the group's chat cache next to
// the cache handle it belongs to (main type 1).
#pragma once

#include <cstdint>
#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CGroupInfoPDU : public CKvoChatXMLPDU {
public:
    CGroupInfoPDU();

    // Builds "grouphandle" and "groupname", each only when set. Returns 1.
    int GenerateXMLPDU() override;
    // 1 when text has "grouphandle" text and a "groupname" element.
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetGroupName(const std::string& strName) { m_strGroupName = strName; }
    void SetGroupHandle(uint32_t dwHandle);
    void SetGroupHandle(const std::string& strHandle) { m_strGroupHandle = strHandle; }

    const std::string& GetGroupName() const { return m_strGroupName; }
    const std::string& GetGroupHandle() const { return m_strGroupHandle; }
    // The handle's value: 0 for empty text, else the low 32 bits of the decimal.
    uint32_t GetGroupHandle_DWORD() const;

private:
    std::string m_strGroupName;
    std::string m_strGroupHandle;
};
