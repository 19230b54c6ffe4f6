// Fuzz target for the chat PDUs: any bytes a peer or the host may send. Besides not crashing,
// the tree the parser builds stays within the caps, the type check agrees with the parsers,
// and whatever parsed generates a document that reads back to the same fields.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <utility>
#include <vector>

#include "pdu/chat_user_info_pdu.h"
#include "pdu/customer_id_pdu.h"
#include "pdu/faq_macro_info_pdu.h"
#include "pdu/group_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/pdu_text.h"
#include "pdu/prim_cust_node_id_pdu.h"
#include "pdu/private_message_pdu.h"
#include "pdu/roster_info_pdu.h"
#include "pdu/xml_input_guard.h"
#include "pdu/xml_limits.h"

namespace {

void Check(bool condition) {
    if (!condition) std::abort();
}

// Walks the tree without recursion: depth, attributes per element and node count.
bool TreeWithinLimits(const TiXmlDocument& doc) {
    std::vector<std::pair<const TiXmlNode*, size_t>> pending;
    for (const TiXmlNode* node = doc.FirstChild(); node; node = node->NextSibling()) {
        pending.emplace_back(node, 1);
    }
    size_t nodes = 0;
    while (!pending.empty()) {
        const auto [node, depth] = pending.back();
        pending.pop_back();
        ++nodes;
        if (const TiXmlElement* element = node->ToElement()) {
            if (depth > kMaxXmlDepth) return false;
            size_t attributes = 0;
            for (const TiXmlAttribute* a = element->FirstAttribute(); a; a = a->Next()) {
                ++attributes;
            }
            if (attributes > kMaxXmlAttributes) return false;
            nodes += attributes;
        }
        for (const TiXmlNode* child = node->FirstChild(); child; child = child->NextSibling()) {
            pending.emplace_back(child, depth + 1);
        }
    }
    return nodes <= kMaxXmlNodes;
}

// Text travelling as CDATA comes back with its end markers widened.
bool SameText(const std::string& sent, const std::string& read) {
    return read == ReplaceCdataEndMarkers(sent);
}

// Plain text comes back as sent with runs of blanks condensed to one and none at either end
// (other white space is printed as character references), except that tinyxml's printer
// passes "&#x" through unescaped, so such text is read back as the character it names.
bool SamePlain(const std::string& sent, const std::string& read) {
    if (sent.find("&#x") != std::string::npos) return true;
    std::string condensed;
    bool blank = false;
    for (const char c : sent) {
        if (c == ' ') {
            blank = !condensed.empty();
            continue;
        }
        if (blank) condensed += ' ';
        blank = false;
        condensed += c;
    }
    return read == condensed;
}

// Parses bytes with a fresh PDU; when that works, generates it, reads the printed text with
// another fresh PDU and lets same() compare the two. required() says whether the generated
// text still carries every element the parser insists on.
template <typename Pdu, typename Required, typename Same>
void RoundTrip(const char* data, size_t size, int type, int pduType, Required required, Same same) {
    Pdu parsed;
    const int result = parsed.ParseXMLPDU(data, size);
    Check(result == 0 || result == 1);
    if (!result) return;
    Check(pduType == type);
    Check(parsed.GenerateXMLPDU() == 1);
    const std::string text = parsed.ToWireText();
    if (text.size() > kMaxXmlBytes) return;
    Pdu again;
    const int back = again.ParseXMLPDU(text);
    Check(back == (required(parsed) ? 1 : 0));
    if (back) Check(same(parsed, again));
}

template <typename Pdu>
void ParseOnly(const char* data, size_t size, int type, int pduType) {
    Pdu parsed;
    const int result = parsed.ParseXMLPDU(data, size);
    Check(result == 0 || result == 1);
    if (result) Check(pduType == type);
    Check(parsed.GenerateXMLPDU() == 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
    const char* data = reinterpret_cast<const char*>(bytes);

    TiXmlDocument doc;
    ParseWithinLimits(doc, std::string(data, size));
    Check(TreeWithinLimits(doc));

    const int pduType = CKvoChatXMLPDU().GetPDUType(data, size);
    Check(pduType >= 0 && pduType <= 11);

    RoundTrip<CGroupInfoPDU>(
        data, size, XMLPDU_GROUP_INFO, pduType,
        [](const CGroupInfoPDU& p) {
            return !p.GetGroupHandle().empty() && !p.GetGroupName().empty();
        },
        [](const CGroupInfoPDU& a, const CGroupInfoPDU& b) {
            return SamePlain(a.GetGroupHandle(), b.GetGroupHandle()) &&
                   SameText(a.GetGroupName(), b.GetGroupName());
        });
    RoundTrip<CPrivateMessagePDU>(
        data, size, XMLPDU_PRIVATE_MESSAGE, pduType,
        [](const CPrivateMessagePDU& p) {
            return !p.GetSendID().empty() && !p.GetReveID().empty() &&
                   !p.GetMessageContent().empty();
        },
        [](const CPrivateMessagePDU& a, const CPrivateMessagePDU& b) {
            return SamePlain(a.GetSendID(), b.GetSendID()) &&
                   SamePlain(a.GetReveID(), b.GetReveID()) &&
                   SameText(a.GetSenderName(), b.GetSenderName()) &&
                   SameText(a.GetReceiverName(), b.GetReceiverName()) &&
                   a.GetMessageContent() == b.GetMessageContent();
        });
    RoundTrip<CGroupMessagePDU>(
        data, size, XMLPDU_GROUP_MESSAGE, pduType,
        [](const CGroupMessagePDU& p) {
            return !p.GetSendID().empty() && !p.GetGroupID().empty() &&
                   !p.GetMessageContent().empty();
        },
        [](const CGroupMessagePDU& a, const CGroupMessagePDU& b) {
            return SamePlain(a.GetSendID(), b.GetSendID()) &&
                   SamePlain(a.GetSendNodeId(), b.GetSendNodeId()) &&
                   SamePlain(a.GetGroupID(), b.GetGroupID()) &&
                   SamePlain(a.GetGroupCacheId(), b.GetGroupCacheId()) &&
                   SameText(a.GetSenderName(), b.GetSenderName()) &&
                   SameText(a.GetReceiverName(), b.GetReceiverName()) &&
                   SameText(a.GetMessageContent(), b.GetMessageContent());
        });
    RoundTrip<CChatUserInfoPDU>(
        data, size, XMLPDU_USER_INFO, pduType,
        [](const CChatUserInfoPDU& p) {
            return !p.GetUserID().empty() && !p.GetUserName().empty();
        },
        [](const CChatUserInfoPDU& a, const CChatUserInfoPDU& b) {
            return SamePlain(a.GetUserID(), b.GetUserID()) &&
                   SameText(a.GetUserName(), b.GetUserName()) &&
                   (a.GetUserExternalTag() == "0" ||
                    SamePlain(a.GetUserExternalTag(), b.GetUserExternalTag()));
        });
    RoundTrip<CRosterInfoPDU>(
        data, size, XMLPDU_ROSTER_INFO, pduType, [](const CRosterInfoPDU&) { return true; },
        [](const CRosterInfoPDU& a, const CRosterInfoPDU& b) {
            return SamePlain(a.GetNodeID(), b.GetNodeID()) &&
                   SamePlain(a.GetRoleSet(), b.GetRoleSet()) &&
                   SamePlain(a.GetVisible(), b.GetVisible()) &&
                   SamePlain(a.GetUserType(), b.GetUserType()) &&
                   SamePlain(a.GetPhoneNumber(), b.GetPhoneNumber()) &&
                   SamePlain(a.GetCustomerId(), b.GetCustomerId()) &&
                   SameText(a.GetUserNameW(), b.GetUserNameW()) &&
                   SameText(a.GetFirstName(), b.GetFirstName()) &&
                   SameText(a.GetLastName(), b.GetLastName()) &&
                   SameText(a.GetEmailAddress(), b.GetEmailAddress()) &&
                   (a.GetUserExternalTag() == "0" ||
                    SamePlain(a.GetUserExternalTag(), b.GetUserExternalTag()));
        });
    ParseOnly<CFAQMacroInfoPDU>(data, size, XMLPDU_FAQ_MACRO, pduType);
    ParseOnly<CPrimCustNodeIdPDU>(data, size, XMLPDU_PRIM_CUST_NODE_ID, pduType);
    ParseOnly<CCustomerIdPDU>(data, size, XMLPDU_CUSTOMER_ID, pduType);
    return 0;
}
