#include "pdu/private_message_pdu.h"

#include "pdu/pdu_text.h"

CPrivateMessagePDU::CPrivateMessagePDU() {
    SetMainType(XMLPDU_PRIVATE_MESSAGE);
}

int CPrivateMessagePDU::GenerateXMLPDU() {
    TiXmlElement* root = StartDocument();
    AppendPlainElem(root, "sendid", m_strSendID);
    AppendFilledElem(root, "SenderName",
                     [this](TiXmlElement*& e) { return GenerateSenderNameElem(e); });
    AppendPlainElem(root, "recid", m_strReveID);
    AppendFilledElem(root, "ReceiverName",
                     [this](TiXmlElement*& e) { return GenerateReceiverNameElem(e); });
    AppendFilledElem(root, "message",
                     [this](TiXmlElement*& e) { return GenerateMessageContentElem(e); });
    return 1;
}

int CPrivateMessagePDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_PRIVATE_MESSAGE);
    if (!root || !ParseRequiredElem(root, "sendid", m_strSendID)) return 0;
    TiXmlElement* sender = root->FirstChildElement("SenderName");
    if (sender) ParseSenderNameElem(sender);
    if (!ParseRequiredElem(root, "recid", m_strReveID)) return 0;
    TiXmlElement* receiver = root->FirstChildElement("ReceiverName");
    if (receiver) ParseReceiverNameElem(receiver);
    TiXmlElement* message = root->FirstChildElement("message");
    if (!message) return 0;
    ParseMessageContentElem(message);
    return 1;
}

void CPrivateMessagePDU::SetSendID(uint32_t dwID) {
    m_strSendID = DwordText(dwID);
}

void CPrivateMessagePDU::SetReveID(uint32_t dwID) {
    m_strReveID = DwordText(dwID);
}

void CPrivateMessagePDU::SetMessageContent(const std::string& strContent) {
    m_strMessageContent = ReplaceCdataEndMarkers(strContent);
}

uint32_t CPrivateMessagePDU::GetSendID_DWORD() const {
    return DwordValue(m_strSendID);
}

uint32_t CPrivateMessagePDU::GetReveID_DWORD() const {
    return DwordValue(m_strReveID);
}

int CPrivateMessagePDU::GenerateSenderNameElem(TiXmlElement*& elem) {
    return GenerateTextElem(elem, m_strSenderName, 1);
}

int CPrivateMessagePDU::GenerateReceiverNameElem(TiXmlElement*& elem) {
    return GenerateTextElem(elem, m_strReceiverName, 1);
}

int CPrivateMessagePDU::GenerateMessageContentElem(TiXmlElement*& elem) {
    return GenerateTextElem(elem, m_strMessageContent, 1);
}

void CPrivateMessagePDU::ParseSenderNameElem(TiXmlElement*& elem) {
    ParseTextElem(elem, m_strSenderName);
}

void CPrivateMessagePDU::ParseReceiverNameElem(TiXmlElement*& elem) {
    ParseTextElem(elem, m_strReceiverName);
}

void CPrivateMessagePDU::ParseMessageContentElem(TiXmlElement*& elem) {
    std::string content;
    ParseTextElem(elem, content);
    if (!content.empty()) SetMessageContent(content);
}
