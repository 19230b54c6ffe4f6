#include "pdu/xml_shape_check.h"

#include <array>
#include <cstring>
#include <string>
#include <string_view>

#include "pdu/tiny_lexer.h"
#include "pdu/xml_limits.h"

namespace {

// Follows tinyxml's parser over a text with a list of open elements in place of its recursion.
// Each step returns where the parser goes on, or null where it fails or a cap is passed.
class ShapeWalk {
public:
    explicit ShapeWalk(TiXmlEncoding encoding) : m_encoding(encoding) {}
    ShapeWalk(const ShapeWalk&) = delete;
    ShapeWalk& operator=(const ShapeWalk&) = delete;

    bool Fits(const char* text);

private:
    // SkipWhiteSpace, without the call where there is nothing to skip (in UTF-8 it also
    // steps over byte-order marks, which start with 0xEF).
    const char* Skip(const char* p) const {
        if (!p || !*p) return nullptr;
        if (!TinyLexer::IsWhiteSpace(*p) && static_cast<unsigned char>(*p) != 0xEF) return p;
        return TinyLexer::SkipWhiteSpace(p, m_encoding);
    }
    // Identify's test for an element after the '<' at p; ASCII letters pass in any locale.
    bool StartsElement(const char* p) const {
        const char c = p[1];
        return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_' ||
               TinyLexer::IsAlpha(static_cast<unsigned char>(c), m_encoding);
    }
    const char* Over() {
        m_over = true;
        return nullptr;
    }
    bool AddNode() { return ++m_nodes <= kMaxXmlNodes; }

    const char* ReadUntil(const char* from, char end, bool trim);
    const char* NameEnd(const char* p);
    const char* Node(const char* p);
    const char* Text(const char* withBlanks, const char* p);
    const char* EndTag(const char* p);
    const char* Element(const char* p);
    const char* Attribute(const char* p);
    const char* Declaration(const char* p);
    bool RestFits(const char* from) const;

    const TiXmlEncoding m_encoding;
    // Names of the elements whose content is being read, outermost first.
    std::array<std::string_view, kMaxXmlDepth> m_open;
    size_t m_depth = 0;
    size_t m_nodes = 0;
    bool m_over = false;
    // Receives names and values the lexing functions read; only their end positions count.
    std::string m_scratch;
};

bool ShapeWalk::Fits(const char* p) {
    const char* withBlanks = p;
    p = Skip(p);
    while (p && *p) {
        const char* start = p;
        if (m_depth == 0) {
            // At document level anything but markup ends the document, without an error.
            if (*p != '<') return true;
            p = Node(p);
        } else if (*p != '<') {
            p = Text(withBlanks, p);
        } else if (p[1] == '/') {
            p = EndTag(p);
        } else {
            p = Node(p);
        }
        if (m_over) return false;
        if (!p) return RestFits(start);
        withBlanks = p;
        p = Skip(p);
    }
    return true;
}

// What the parser makes of markup at p: declaration, comment, CDATA, element or something else.
const char* ShapeWalk::Node(const char* p) {
    if (!AddNode()) return Over();
    // Every special form starts with "<?" or "<!", so other markup skips their comparisons.
    if (p[1] == '?' && TinyLexer::StringEqual(p, "<?xml", true, m_encoding)) {
        return Declaration(p + 5);
    }
    if (p[1] == '!' && TinyLexer::StringEqual(p, "<!--", false, m_encoding)) {
        // An unclosed comment runs to the end of the text.
        const char* end = std::strstr(p + 4, "-->");
        return end ? end + 3 : p + std::strlen(p);
    }
    if (p[1] == '!' && TinyLexer::StringEqual(p, "<![CDATA[", false, m_encoding)) {
        const char* end = std::strstr(p + 9, "]]>");
        return end && end[3] ? end + 3 : nullptr;
    }
    if (StartsElement(p)) return Element(p + 1);
    // Anything else ("<!DOCTYPE", "<?other", "< ", ...) is an unknown node up to the next '>'.
    const char* end = std::strchr(p + 1, '>');
    return end ? end + 1 : p + std::strlen(p);
}

// Character data inside an element; entities may carry the reading past a '<'.
const char* ShapeWalk::Text(const char* withBlanks, const char* p) {
    if (!AddNode()) return Over();
    const char* from = TiXmlBase::IsWhiteSpaceCondensed() ? p : withBlanks;
    p = ReadUntil(from, '<', true);
    return p && *p ? p - 1 : nullptr;
}

// ReadText up to the end character: where it returns after the end character, or null. Text
// without '&' (and in UTF-8 without multi-byte sequences) simply ends at the first end
// character, so that case needs no call.
const char* ShapeWalk::ReadUntil(const char* from, char end, bool trim) {
    const char* p = from;
    for (; *p && *p != end; ++p) {
        if (*p == '&' || (m_encoding == TIXML_ENCODING_UTF8 && (*p & 0x80))) {
            const char terminator[] = {end, '\0'};
            return TinyLexer::ReadText(from, &m_scratch, trim, terminator, false, m_encoding);
        }
    }
    return *p && p[1] ? p + 1 : nullptr;
}

// "</" closing the innermost open element: its exact name, blanks, then '>'.
const char* ShapeWalk::EndTag(const char* p) {
    const std::string_view name = m_open[m_depth - 1];
    if (std::strncmp(p + 2, name.data(), name.size()) != 0) return nullptr;
    p = Skip(p + 2 + name.size());
    if (!p || *p != '>') return nullptr;
    --m_depth;
    return p + 1;
}

// ReadName: just past the name at p, or null when p holds none. A name of ASCII letters,
// digits and "_-.:" that ends in a blank, '>', '/', '=' or the end of the text ends there
// whatever the locale, so that case needs no call.
const char* ShapeWalk::NameEnd(const char* p) {
    const auto letter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); };
    const auto inName = [&](char c) {
        return letter(c) || (c >= '0' && c <= '9') || c == '_' || c == '-' || c == '.' || c == ':';
    };
    if (letter(*p) || *p == '_') {
        const char* q = p + 1;
        while (inName(*q))
            ++q;
        if (!*q || *q == ' ' || *q == '>' || *q == '/' || *q == '=') return q;
    }
    return TinyLexer::ReadName(p, &m_scratch, m_encoding);
}

// An element's start tag, from just after its '<'.
const char* ShapeWalk::Element(const char* p) {
    if (m_depth == kMaxXmlDepth) return Over();
    p = Skip(p);
    const char* name = p;
    p = NameEnd(p);
    if (!p || !*p) return nullptr;
    const std::string_view elementName(name, static_cast<size_t>(p - name));
    size_t attributes = 0;
    for (;;) {
        p = Skip(p);
        if (!p || !*p) return nullptr;
        if (*p == '/') return p[1] == '>' ? p + 2 : nullptr;
        if (*p == '>') {
            m_open[m_depth++] = elementName;
            return p + 1;
        }
        if (++attributes > kMaxXmlAttributes || !AddNode()) return Over();
        p = Attribute(p);
        if (!p || !*p) return nullptr;
    }
}

// name = value, the value quoted or (leniently) bare.
const char* ShapeWalk::Attribute(const char* p) {
    p = Skip(p);
    if (!p || !*p) return nullptr;
    p = NameEnd(p);
    if (!p || !*p) return nullptr;
    p = Skip(p);
    if (!p || *p != '=') return nullptr;
    p = Skip(p + 1);
    if (!p || !*p) return nullptr;
    if (*p == '\'' || *p == '"') return ReadUntil(p + 1, *p, false);
    for (; *p && !TinyLexer::IsWhiteSpace(*p) && *p != '/' && *p != '>'; ++p) {
        if (*p == '\'' || *p == '"') return nullptr;
    }
    return p;
}

// The rest of "<?xml ...>": only its version, encoding and standalone values are read as
// attributes (so a quoted '>' there does not end it); other words are stepped over.
const char* ShapeWalk::Declaration(const char* p) {
    while (*p) {
        if (*p == '>') return p + 1;
        p = Skip(p);
        if (!p || !*p) return nullptr;
        if (TinyLexer::StringEqual(p, "version", true, m_encoding) ||
            TinyLexer::StringEqual(p, "encoding", true, m_encoding) ||
            TinyLexer::StringEqual(p, "standalone", true, m_encoding)) {
            p = Attribute(p);
            if (!p) return nullptr;
        } else {
            while (*p && *p != '>' && !TinyLexer::IsWhiteSpace(*p))
                ++p;
        }
    }
    return nullptr;
}

// The parser fails at or after from. Should it read on after all, each further level needs an
// element start, each further attribute an '=' and each further node a '<' (text nodes lie
// between them), so the caps hold if they hold for all of those still ahead.
bool ShapeWalk::RestFits(const char* from) const {
    size_t starts = 0;
    size_t markups = 0;
    size_t signs = 0;
    for (const char* p = from; *p; ++p) {
        if (*p == '=') {
            ++signs;
        } else if (*p == '<') {
            ++markups;
            if (StartsElement(p)) ++starts;
        }
    }
    return m_depth + starts <= kMaxXmlDepth && signs <= kMaxXmlAttributes &&
           m_nodes + 2 * markups + 1 + signs <= kMaxXmlNodes;
}

}  // namespace

bool FitsXmlLimits(const char* text, TiXmlEncoding encoding) {
    ShapeWalk walk(encoding);
    return walk.Fits(text);
}
