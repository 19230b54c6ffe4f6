// CRosterInfoPDU: a participant's enrolment record (main type 5). Its text is the enroll
// payload and comes back to every participant inside the application roster.
#pragma once

#include <cstdint>
#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CRosterInfoPDU : public CKvoChatXMLPDU {
public:
    CRosterInfoPDU();

    // Builds "NodeID", "UserName", "RoleSet", "Visible", "UserType", "FName", "LName",
    // "Phone", "Email", "GuestID", "UIT", each only when set ("UIT" also not when "0").
    // Returns 1.
    int GenerateXMLPDU() override;
    // 1 for any roster record; every element is optional and fills its field when it has text.
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetNodeID(uint32_t dwID);
    void SetNodeID(const std::string& strID) { m_strNodeID = strID; }
    void SetUserType(uint32_t dwType);
    void SetUserType(const std::string& strType) { m_strUserType = strType; }
    void SetUserName(const std::string& strName) { m_strUserName = strName; }
    void SetRoleSet(uint32_t dwRoles);
    void SetRoleSet(const std::string& strRoles) { m_strRoleSet = strRoles; }
    void SetVisible(int nVisible);
    void SetVisible(const std::string& strVisible) { m_strVisible = strVisible; }
    void SetFirstName(const std::string& strName) { m_strFirstName = strName; }
    void SetLastName(const std::string& strName) { m_strLastName = strName; }
    // Sent as plain text, not CDATA.
    void SetPhoneNumber(const std::string& strPhone) { m_strPhoneNumber = strPhone; }
    void SetEmailAddress(const std::string& strEmail) { m_strEmailAddress = strEmail; }
    void SetCustomerId(uint32_t dwID);
    void SetCustomerId(const std::string& strID) { m_strCustomerId = strID; }
    void SetUserExternalTag(uint32_t dwTag);
    void SetUserExternalTag(const std::string& strTag) { m_strUserExternalTag = strTag; }

    const std::string& GetNodeID() const { return m_strNodeID; }
    const std::string& GetUserType() const { return m_strUserType; }
    const std::string& GetUserNameW() const { return m_strUserName; }
    const std::string& GetRoleSet() const { return m_strRoleSet; }
    const std::string& GetVisible() const { return m_strVisible; }
    const std::string& GetFirstName() const { return m_strFirstName; }
    const std::string& GetLastName() const { return m_strLastName; }
    const std::string& GetPhoneNumber() const { return m_strPhoneNumber; }
    const std::string& GetEmailAddress() const { return m_strEmailAddress; }
    const std::string& GetCustomerId() const { return m_strCustomerId; }
    const std::string& GetUserExternalTag() const { return m_strUserExternalTag; }
    // The texts' values: 0 for empty text, else the low 32 bits of the decimal.
    uint32_t GetNodeID_DWORD() const;
    uint32_t GetUserType_DWORD() const;
    uint32_t GetRoleSet_DWORD() const;
    uint32_t GetCustomerId_DWORD() const;
    uint32_t GetUserExternalTag_DWORD() const;
    // The visible flag's value, 0 when empty.
    int GetVisible_BOOL() const;

private:
    std::string m_strNodeID;
    std::string m_strUserType;
    std::string m_strUserName;
    std::string m_strRoleSet;
    std::string m_strVisible;
    std::string m_strFirstName;
    std::string m_strLastName;
    std::string m_strPhoneNumber;
    std::string m_strEmailAddress;
    std::string m_strCustomerId;
    std::string m_strUserExternalTag;
};
