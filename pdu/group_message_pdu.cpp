#include "pdu/group_message_pdu.h"

#include "pdu/pdu_text.h"

CGroupMessagePDU::CGroupMessagePDU() {
    SetMainType(XMLPDU_GROUP_MESSAGE);
}

int CGroupMessagePDU::GenerateXMLPDU() {
    TiXmlElement* root = StartDocument();
    AppendPlainElem(root, "sendid", m_strSendID);
    AppendPlainElem(root, "sendnodeid", m_strSendNodeId);
    AppendFilledElem(root, "SenderName",
                     [this](TiXmlElement*& e) { return GenerateSenderNameElem(e); });
    AppendPlainElem(root, "groupid", m_strGroupID);
    AppendFilledElem(root, "ReceiverName",
                     [this](TiXmlElement*& e) { return GenerateReceiverNameElem(e); });
    AppendPlainElem(root, "GroupCacheId", m_strGroupCacheId);
    AppendFilledElem(root, "message",
                     [this](TiXmlElement*& e) { return GenerateMessageContentElem(e); });
    return 1;
}

int CGroupMessagePDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_GROUP_MESSAGE);
    if (!root || !ParseRequiredElem(root, "sendid", m_strSendID)) return 0;
    ParseOptionalElem(root, "sendnodeid", m_strSendNodeId);
    TiXmlElement* sender = root->FirstChildElement("SenderName");
    if (sender) ParseSenderNameElem(sender);
    if (!ParseRequiredElem(root, "groupid", m_strGroupID)) return 0;
    TiXmlElement* receiver = root->FirstChildElement("ReceiverName");
    if (receiver) ParseReceiverNameElem(receiver);
    ParseOptionalElem(root, "GroupCacheId", m_strGroupCacheId);
    TiXmlElement* message = root->FirstChildElement("message");
    if (!message) return 0;
    ParseMessageContentElem(message);
    return 1;
}

void CGroupMessagePDU::SetSendNodeId(uint32_t dwID) {
    m_strSendNodeId = DwordText(dwID);
}

void CGroupMessagePDU::SetSendID(uint32_t dwID) {
    m_strSendID = DwordText(dwID);
}

void CGroupMessagePDU::SetGroupID(uint32_t dwID) {
    m_strGroupID = DwordText(dwID);
}

void CGroupMessagePDU::SetGroupCacheId(uint32_t dwID) {
    m_strGroupCacheId = DwordText(dwID);
    m_dwGroupCacheId = dwID;
}

uint32_t CGroupMessagePDU::GetSendID_DWORD() const {
    return DwordValue(m_strSendID);
}

uint32_t CGroupMessagePDU::GetSendNodeId_DWORD() const {
    return DwordValue(m_strSendNodeId);
}

uint32_t CGroupMessagePDU::GetGroupID_DWORD() const {
    return DwordValue(m_strGroupID);
}

uint32_t CGroupMessagePDU::GetGroupCacheId_DWORD() const {
    return DwordValue(m_strGroupCacheId);
}

int CGroupMessagePDU::GenerateSenderNameElem(TiXmlElement*& elem) {
    return GenerateTextElem(elem, m_strSenderName, 1);
}

int CGroupMessagePDU::GenerateReceiverNameElem(TiXmlElement*& elem) {
    return GenerateTextElem(elem, m_strReceiverName, 1);
}

int CGroupMessagePDU::GenerateMessageContentElem(TiXmlElement*& elem) {
    return GenerateTextElem(elem, m_strMessageContent, 1);
}

void CGroupMessagePDU::ParseSenderNameElem(TiXmlElement*& elem) {
    ParseTextElem(elem, m_strSenderName);
}

void CGroupMessagePDU::ParseReceiverNameElem(TiXmlElement*& elem) {
    ParseTextElem(elem, m_strReceiverName);
}

void CGroupMessagePDU::ParseMessageContentElem(TiXmlElement*& elem) {
    ParseTextElem(elem, m_strMessageContent);
}
