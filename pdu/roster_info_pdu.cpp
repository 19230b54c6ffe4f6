#include "pdu/roster_info_pdu.h"

#include "pdu/pdu_text.h"

CRosterInfoPDU::CRosterInfoPDU() {
    SetMainType(XMLPDU_ROSTER_INFO);
}

int CRosterInfoPDU::GenerateXMLPDU() {
    TiXmlElement* root = StartDocument();
    AppendPlainElem(root, "NodeID", m_strNodeID);
    AppendTextElem(root, "UserName", m_strUserName);
    AppendPlainElem(root, "RoleSet", m_strRoleSet);
    AppendPlainElem(root, "Visible", m_strVisible);
    AppendPlainElem(root, "UserType", m_strUserType);
    AppendTextElem(root, "FName", m_strFirstName);
    AppendTextElem(root, "LName", m_strLastName);
    AppendPlainElem(root, "Phone", m_strPhoneNumber);
    AppendTextElem(root, "Email", m_strEmailAddress);
    AppendPlainElem(root, "GuestID", m_strCustomerId);
    // A tag of 0 means none and is left out.
    if (m_strUserExternalTag != "0") AppendPlainElem(root, "UIT", m_strUserExternalTag);
    return 1;
}

int CRosterInfoPDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_ROSTER_INFO);
    if (!root) return 0;
    ParseOptionalElem(root, "NodeID", m_strNodeID);
    ParseOptionalElem(root, "UserName", m_strUserName);
    ParseOptionalElem(root, "RoleSet", m_strRoleSet);
    ParseOptionalElem(root, "Visible", m_strVisible);
    ParseOptionalElem(root, "UserType", m_strUserType);
    ParseOptionalElem(root, "FName", m_strFirstName);
    ParseOptionalElem(root, "LName", m_strLastName);
    ParseOptionalElem(root, "Phone", m_strPhoneNumber);
    ParseOptionalElem(root, "Email", m_strEmailAddress);
    ParseOptionalElem(root, "GuestID", m_strCustomerId);
    ParseOptionalElem(root, "UIT", m_strUserExternalTag);
    return 1;
}

void CRosterInfoPDU::SetNodeID(uint32_t dwID) {
    m_strNodeID = DwordText(dwID);
}

void CRosterInfoPDU::SetUserType(uint32_t dwType) {
    m_strUserType = DwordText(dwType);
}

void CRosterInfoPDU::SetRoleSet(uint32_t dwRoles) {
    m_strRoleSet = DwordText(dwRoles);
}

void CRosterInfoPDU::SetVisible(int nVisible) {
    m_strVisible = IntText(nVisible);
}

void CRosterInfoPDU::SetCustomerId(uint32_t dwID) {
    m_strCustomerId = DwordText(dwID);
}

void CRosterInfoPDU::SetUserExternalTag(uint32_t dwTag) {
    m_strUserExternalTag = DwordText(dwTag);
}

uint32_t CRosterInfoPDU::GetNodeID_DWORD() const {
    return DwordValue(m_strNodeID);
}

uint32_t CRosterInfoPDU::GetUserType_DWORD() const {
    return DwordValue(m_strUserType);
}

uint32_t CRosterInfoPDU::GetRoleSet_DWORD() const {
    return DwordValue(m_strRoleSet);
}

uint32_t CRosterInfoPDU::GetCustomerId_DWORD() const {
    return DwordValue(m_strCustomerId);
}

uint32_t CRosterInfoPDU::GetUserExternalTag_DWORD() const {
    return DwordValue(m_strUserExternalTag);
}

int CRosterInfoPDU::GetVisible_BOOL() const {
    return static_cast<int32_t>(DwordValue(m_strVisible));
}
