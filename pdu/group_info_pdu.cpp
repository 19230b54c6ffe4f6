#include "pdu/group_info_pdu.h"

#include "pdu/pdu_text.h"

CGroupInfoPDU::CGroupInfoPDU() {
    SetMainType(XMLPDU_GROUP_INFO);
}

int CGroupInfoPDU::GenerateXMLPDU() {
    TiXmlElement* root = StartDocument();
    AppendPlainElem(root, "grouphandle", m_strGroupHandle);
    AppendTextElem(root, "groupname", m_strGroupName);
    return 1;
}

int CGroupInfoPDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_GROUP_INFO);
    if (!root || !ParseRequiredElem(root, "grouphandle", m_strGroupHandle)) return 0;
    TiXmlElement* name = root->FirstChildElement("groupname");
    if (!name) return 0;
    ParseTextElem(name, m_strGroupName);
    return 1;
}

void CGroupInfoPDU::SetGroupHandle(uint32_t dwHandle) {
    m_strGroupHandle = DwordText(dwHandle);
}

uint32_t CGroupInfoPDU::GetGroupHandle_DWORD() const {
    return DwordValue(m_strGroupHandle);
}
