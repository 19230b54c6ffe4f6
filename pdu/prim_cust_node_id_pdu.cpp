#include "pdu/prim_cust_node_id_pdu.h"

#include "pdu/pdu_text.h"

CPrimCustNodeIdPDU::CPrimCustNodeIdPDU() {
    SetMainType(XMLPDU_PRIM_CUST_NODE_ID);
}

int CPrimCustNodeIdPDU::ParseXMLPDU(const std::string& text) {
    TiXmlElement* root = ParseDocument(text, XMLPDU_PRIM_CUST_NODE_ID);
    return root && ParseRequiredElem(root, "primcust", m_strPrimCustNodeId) ? 1 : 0;
}

uint32_t CPrimCustNodeIdPDU::GetPrimCustNodeId_DWORD() const {
    return DwordValue(m_strPrimCustNodeId);
}
