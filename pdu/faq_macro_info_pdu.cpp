#include "pdu/faq_macro_info_pdu.h"

CFAQMacroInfoPDU::CFAQMacroInfoPDU() {
    SetMainType(XMLPDU_FAQ_MACRO);
}

int CFAQMacroInfoPDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_FAQ_MACRO);
    if (!root) return 0;
    ParseOptionalElem(root, "fname", m_strFirstName);
    ParseOptionalElem(root, "lname", m_strLastName);
    ParseOptionalElem(root, "phone", m_strPhoneNumber);
    ParseOptionalElem(root, "email", m_strEmailAddress);
    return 1;
}
