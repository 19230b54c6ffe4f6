#include "pdu/customer_id_pdu.h"

#include "pdu/pdu_text.h"

CCustomerIdPDU::CCustomerIdPDU() {
    SetMainType(XMLPDU_CUSTOMER_ID);
}

int CCustomerIdPDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_CUSTOMER_ID);
    return root && ParseRequiredElem(root, "customerid", m_strCustomerId) ? 1 : 0;
}

uint32_t CCustomerIdPDU::GetCustomerId_DWORD() const {
    return DwordValue(m_strCustomerId);
}
