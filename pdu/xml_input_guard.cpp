#include "pdu/xml_input_guard.h"

#include <tinyxml.h>

#include "pdu/tiny_lexer.h"
#include "pdu/xml_limits.h"
#include "pdu/xml_shape_check.h"

namespace {

constexpr char kByteOrderMark[] = "\xEF\xBB\xBF";

// True when the text opens with "<?xml ...>" naming UTF-8 or no encoding, the declaration that
// makes tinyxml read the rest as UTF-8.
bool DeclaresUtf8(const char* p) {
    p = TinyLexer::SkipWhiteSpace(p, TIXML_ENCODING_LEGACY);
    if (!p || !*p || !TinyLexer::StringEqual(p, "<?xml", true, TIXML_ENCODING_LEGACY)) {
        return false;
    }
    TiXmlDeclaration declaration;
    declaration.Parse(p, nullptr, TIXML_ENCODING_LEGACY);
    const char* name = declaration.Encoding();
    return !*name || TinyLexer::StringEqual(name, "UTF-8", true, TIXML_ENCODING_LEGACY) ||
           TinyLexer::StringEqual(name, "UTF8", true, TIXML_ENCODING_LEGACY);
}

// True when every byte that starts a multi-byte sequence in tinyxml's UTF-8 table is followed
// by its continuation bytes. Reading UTF-8, the parser steps over a whole sequence at once, so
// a cut sequence would carry it past a '<', a quote or the terminating NUL.
bool SequencesComplete(const char* text) {
    const auto* p = reinterpret_cast<const unsigned char*>(text);
    while (*p) {
        const int length = TiXmlBase::utf8ByteTable[*p++];
        for (int i = 1; i < length; ++i, ++p) {
            if ((*p & 0xC0) != 0x80) return false;
        }
    }
    return true;
}

}  // namespace

bool ParseWithinLimits(TiXmlDocument& doc, const std::string& text) {
    // Parse adds to what the document holds, so a reused PDU starts from nothing.
    doc.Clear();
    doc.ClearError();
    // Rows and columns of errors are never shown; counting them costs a pass over the text.
    doc.SetTabSize(0);
    if (text.empty() || text.size() > kMaxXmlBytes) return false;

    // The encoding is chosen here rather than by the parser on the way: UTF-8 when the text
    // says so with a byte-order mark or its declaration and its sequences are whole, byte by
    // byte otherwise. Fixed for the whole text, it lets the shape check read as the parser does.
    const char* p = text.c_str();
    const bool marked = text.compare(0, 3, kByteOrderMark) == 0;
    if (marked) p += 3;
    const bool utf8 = (marked || DeclaresUtf8(p)) && SequencesComplete(p);
    const TiXmlEncoding encoding = utf8 ? TIXML_ENCODING_UTF8 : TIXML_ENCODING_LEGACY;

    if (!FitsXmlLimits(p, encoding)) return false;
    doc.Parse(p, nullptr, encoding);
    return !doc.Error();
}
