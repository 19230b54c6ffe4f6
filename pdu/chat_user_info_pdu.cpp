#include "pdu/chat_user_info_pdu.h"

#include "pdu/pdu_text.h"

CChatUserInfoPDU::CChatUserInfoPDU() {
    SetMainType(XMLPDU_USER_INFO);
}

int CChatUserInfoPDU::GenerateXMLPDU() {
    TiXmlElement* root = StartDocument();
    AppendPlainElem(root, "uid", m_strUserID);
    AppendTextElem(root, "un", m_strUserName);
    // A tag of 0 means none and is left out.
    if (m_strUserExternalTag != "0") AppendPlainElem(root, "UIT", m_strUserExternalTag);
    return 1;
}

int CChatUserInfoPDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_USER_INFO);
    if (!root || !ParseRequiredElem(root, "uid", m_strUserID)) return 0;
    TiXmlElement* name = root->FirstChildElement("un");
    if (!name) return 0;
    ParseTextElem(name, m_strUserName);
    ParseOptionalElem(root, "UIT", m_strUserExternalTag);
    return 1;
}

void CChatUserInfoPDU::SetUserID(uint32_t dwID) {
    m_strUserID = DwordText(dwID);
}

void CChatUserInfoPDU::SetUserExternalTag(uint32_t dwTag) {
    m_strUserExternalTag = DwordText(dwTag);
}

uint32_t CChatUserInfoPDU::GetUserID_DWORD() const {
    return DwordValue(m_strUserID);
}

uint32_t CChatUserInfoPDU::GetUserExternalTag_DWORD() const {
    return DwordValue(m_strUserExternalTag);
}
