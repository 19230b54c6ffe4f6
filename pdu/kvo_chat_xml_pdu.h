// CKvoChatXMLPDU: the common base of the chat PDUs. A PDU is itself the XML document it
// generates or parses: one "chat" root with ver="1.0", an "mtype" child naming the PDU kind,
// then the subclass's elements; free text travels in CDATA sections.
#pragma once

#include <tinyxml.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

// The main types the engine produces, carried as the text of "mtype".
enum XMLPDUType {
    XMLPDU_GROUP_INFO = 1,
    XMLPDU_PRIVATE_MESSAGE = 2,
    XMLPDU_GROUP_MESSAGE = 3,
    XMLPDU_USER_INFO = 4,
    XMLPDU_ROSTER_INFO = 5,
    XMLPDU_FAQ_MACRO = 8,
    XMLPDU_PRIM_CUST_NODE_ID = 10,
    XMLPDU_CUSTOMER_ID = 11,
};

class CKvoChatXMLPDU : public TiXmlDocument {
public:
    // Version 1 and no main type.
    CKvoChatXMLPDU();
    CKvoChatXMLPDU(int nMainType, uint32_t dwVersion);
    ~CKvoChatXMLPDU() override;
    CKvoChatXMLPDU(const CKvoChatXMLPDU&) = delete;
    CKvoChatXMLPDU& operator=(const CKvoChatXMLPDU&) = delete;

    // The version given at construction or read from "ver" by the last check.
    virtual uint32_t GetVersion() const;
    // Builds the document from the fields, replacing what it held; 1 when built. The base
    // builds nothing and returns 0.
    virtual int GenerateXMLPDU();
    // Reads the fields from text; 1 on success, 0 otherwise. The base reads nothing (0).
    // Subclasses parse through ParseDocument, so a text beyond the caps of xml_limits.h, or
    // anything after its first NUL, never reaches tinyxml.
    virtual int ParseXMLPDU(const std::string& text);
    // The main type of a received text (1 to 11), or 0 when the text is empty, does not parse,
    // has no "chat" root with an "mtype" child, or names a value outside 1 to 11. Keeps nothing.
    virtual int GetPDUType(const std::string& text) const;

    // Received bytes (not NUL-terminated): the same as the text overloads on a copy of them.
    int ParseXMLPDU(const char* data, size_t length);
    int GetPDUType(const char* data, size_t length) const;

    // The document's wire bytes: compact, no declaration, no whitespace, no terminating NUL.
    // (TiXmlNode::ToText is tinyxml's own cast to a text node.)
    std::string ToWireText() const;

    void SetMainType(int nMainType);
    void SetMainType(const std::string& strMainType);
    const std::string& GetMainType() const { return m_strMainType; }
    // The main type's value, 0 when it is empty.
    int GetMainType_Int() const;

    // Sets ver="1.0" on root and appends "mtype", with text only when the main type is set.
    // Returns 1.
    int GenerateVersionAndType(TiXmlElement* root);
    // True when root has ver="1.0" and an "mtype" child whose value is eType. Stores the
    // version and the main type text on the way; pFirstChild receives the "mtype" element.
    bool CheckVersionAndType(TiXmlElement*& pFirstChild, TiXmlElement* root, XMLPDUType eType);
    // Appends text to elem as one CDATA section, with every "]]>" widened to "]] >" when
    // nEscape is not 0. Returns 0 (appending nothing) for empty text, else 1.
    int GenerateTextElem(TiXmlElement*& elem, const std::string& text, int nEscape);
    // Copies elem's text into out; out stays as it was when elem has no text or empty text.
    // Only the first text or CDATA section of elem counts.
    void ParseTextElem(TiXmlElement*& elem, std::string& out) const;

protected:
    // Starts a fresh document: the "chat" root with version and main type. Returns the root.
    TiXmlElement* StartDocument();
    // Appends <name>value</name> to root as plain (entity-escaped) text, unless value is empty.
    static void AppendPlainElem(TiXmlElement* root, const char* name, const std::string& value);
    // Appends <name> with value as CDATA to root, unless value is empty.
    void AppendTextElem(TiXmlElement* root, const char* name, const std::string& value);
    // Makes a name element, lets fill (int fill(TiXmlElement*&)) give it content and appends
    // it to root when fill returned non-zero; drops it otherwise.
    template <typename Fill>
    static void AppendFilledElem(TiXmlElement* root, const char* name, Fill fill) {
        auto elem = std::make_unique<TiXmlElement>(name);
        TiXmlElement* raw = elem.get();
        if (fill(raw)) root->LinkEndChild(elem.release());
    }
    // Parses text and checks root, version and main type; the "chat" root, or null on failure.
    TiXmlElement* ParseDocument(const std::string& text, XMLPDUType eType);
    // True when root has a name child with text; copies that text into out.
    bool ParseRequiredElem(TiXmlElement* root, const char* name, std::string& out) const;
    // Copies the text of root's name child into out when there is one.
    void ParseOptionalElem(TiXmlElement* root, const char* name, std::string& out) const;

private:
    uint32_t m_dwVersion;
    std::string m_strMainType;
};
