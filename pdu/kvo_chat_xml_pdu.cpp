#include "pdu/kvo_chat_xml_pdu.h"

#include <memory>

#include "pdu/pdu_text.h"
#include "pdu/xml_input_guard.h"
#include "pdu/xml_limits.h"

namespace {

constexpr char kRootName[] = "chat";
constexpr char kVersionName[] = "ver";
constexpr char kVersionText[] = "1.0";
constexpr char kMainTypeName[] = "mtype";

// GetText gives the first child's text only when that child is text or CDATA, so a second
// CDATA section of the same element is never read.
bool HasText(const TiXmlElement* elem) {
    return elem && elem->GetText() && *elem->GetText();
}

}  // namespace

CKvoChatXMLPDU::CKvoChatXMLPDU() : m_dwVersion(1) {}

CKvoChatXMLPDU::CKvoChatXMLPDU(int nMainType, uint32_t dwVersion) : m_dwVersion(dwVersion) {
    SetMainType(nMainType);
}

CKvoChatXMLPDU::~CKvoChatXMLPDU() = default;

uint32_t CKvoChatXMLPDU::GetVersion() const {
    return m_dwVersion;
}

int CKvoChatXMLPDU::GenerateXMLPDU() {
    return 0;
}

int CKvoChatXMLPDU::ParseXMLPDU(const std::string& /*text*/) {
    return 0;
}

int CKvoChatXMLPDU::GetPDUType(const std::string& text) const {
    TiXmlDocument doc;
    if (!ParseWithinLimits(doc, text)) return 0;
    const TiXmlElement* root = doc.FirstChildElement(kRootName);
    const TiXmlElement* type = root ? root->FirstChildElement(kMainTypeName) : nullptr;
    if (!type) return 0;
    const int value = type->GetText() ? static_cast<int32_t>(DwordValue(type->GetText())) : 0;
    return value >= 1 && value <= 11 ? value : 0;
}

int CKvoChatXMLPDU::ParseXMLPDU(const char* data, size_t length) {
    // Too long to ever pass the parser's checks: not worth copying.
    if (!data || length > kMaxXmlBytes) return 0;
    return ParseXMLPDU(std::string(data, length));
}

int CKvoChatXMLPDU::GetPDUType(const char* data, size_t length) const {
    if (!data || length > kMaxXmlBytes) return 0;
    return GetPDUType(std::string(data, length));
}

std::string CKvoChatXMLPDU::ToWireText() const {
    TiXmlPrinter printer;
    printer.SetStreamPrinting();
    Accept(&printer);
    return printer.Str();
}

void CKvoChatXMLPDU::SetMainType(int nMainType) {
    m_strMainType = IntText(nMainType);
}

void CKvoChatXMLPDU::SetMainType(const std::string& strMainType) {
    m_strMainType = strMainType;
}

int CKvoChatXMLPDU::GetMainType_Int() const {
    return static_cast<int32_t>(DwordValue(m_strMainType));
}

int CKvoChatXMLPDU::GenerateVersionAndType(TiXmlElement* root) {
    root->SetAttribute(kVersionName, kVersionText);
    auto type = std::make_unique<TiXmlElement>(kMainTypeName);
    if (!m_strMainType.empty()) type->LinkEndChild(new TiXmlText(m_strMainType));
    root->LinkEndChild(type.release());
    return 1;
}

bool CKvoChatXMLPDU::CheckVersionAndType(TiXmlElement*& pFirstChild, TiXmlElement* root,
                                         XMLPDUType eType) {
    const char* version = root->Attribute(kVersionName);
    if (!version) return false;
    m_dwVersion = DwordValue(version);
    if (std::string(version) != kVersionText) return false;
    pFirstChild = root->FirstChildElement(kMainTypeName);
    if (!pFirstChild) return false;
    const char* type = pFirstChild->GetText();
    m_strMainType = type ? type : "";
    return GetMainType_Int() == eType;
}

int CKvoChatXMLPDU::GenerateTextElem(TiXmlElement*& elem, const std::string& text, int nEscape) {
    if (text.empty()) return 0;
    auto node = std::make_unique<TiXmlText>(nEscape ? ReplaceCdataEndMarkers(text) : text);
    node->SetCDATA(true);
    elem->LinkEndChild(node.release());
    return 1;
}

void CKvoChatXMLPDU::ParseTextElem(TiXmlElement*& elem, std::string& out) const {
    if (HasText(elem)) out = elem->GetText();
}

TiXmlElement* CKvoChatXMLPDU::StartDocument() {
    Clear();
    TiXmlElement* root = new TiXmlElement(kRootName);
    LinkEndChild(root);
    GenerateVersionAndType(root);
    return root;
}

void CKvoChatXMLPDU::AppendPlainElem(TiXmlElement* root, const char* name,
                                     const std::string& value) {
    if (value.empty()) return;
    auto elem = std::make_unique<TiXmlElement>(name);
    elem->LinkEndChild(new TiXmlText(value));
    root->LinkEndChild(elem.release());
}

void CKvoChatXMLPDU::AppendTextElem(TiXmlElement* root, const char* name,
                                    const std::string& value) {
    AppendFilledElem(root, name,
                     [&](TiXmlElement*& elem) { return GenerateTextElem(elem, value, 1); });
}

TiXmlElement* CKvoChatXMLPDU::ParseDocument(const std::string& text, XMLPDUType eType) {
    if (text.empty() || !ParseWithinLimits(*this, text)) return nullptr;
    TiXmlElement* root = FirstChildElement(kRootName);
    TiXmlElement* type = nullptr;
    if (!root || !CheckVersionAndType(type, root, eType)) return nullptr;
    return root;
}

bool CKvoChatXMLPDU::ParseRequiredElem(TiXmlElement* root, const char* name,
                                       std::string& out) const {
    TiXmlElement* elem = root->FirstChildElement(name);
    if (!HasText(elem)) return false;
    ParseTextElem(elem, out);
    return true;
}

void CKvoChatXMLPDU::ParseOptionalElem(TiXmlElement* root, const char* name,
                                       std::string& out) const {
    TiXmlElement* elem = root->FirstChildElement(name);
    if (elem) ParseTextElem(elem, out);
}
