#include "ui/chat_unit.h"

#include <cctype>
#include <cstring>
#include <string>

namespace {

struct UrlPattern {
    const char* text;
    bool atStart;  // must occur at position 0; otherwise anywhere
};

// Tried against the lower-cased text. There are no CR LF or TAB forms of "https://", and the
// telnet forms after CR LF and TAB carry "//" while the others do not.
constexpr UrlPattern kPatterns[] = {
    {" https://", false},     {"https://", true},     {" http://", false}, {"http://", true},
    {"\r\nhttp://", false},   {"\thttp://", false},   {" ftp://", false},  {"ftp://", true},
    {"\r\nftp://", false},    {"\tftp://", false},    {" telnet:", false}, {"telnet:", true},
    {"\r\ntelnet://", false}, {"\ttelnet://", false}, {" www.", false},    {"www.", true},
    {"\r\nwww.", false},      {"\twww.", false},      {" file://", false}, {"file://", true},
    {"\r\nfile://", false},   {"\tfile://", false},   {" mailto:", false}, {"mailto:", true},
    {"\r\nmailto:", false},   {"\tmailto:", false},
};

std::string LowerCopy(const char* text) {
    std::string copy(text);
    for (char& c : copy)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return copy;
}

bool MatchesAnyPattern(const std::string& lower) {
    for (const UrlPattern& pattern : kPatterns) {
        const std::size_t at = lower.find(pattern.text);
        if (at == std::string::npos) continue;
        if (!pattern.atStart || at == 0) return true;
    }
    return false;
}

bool IsBlank(char c) {
    return c == ' ' || c == '\t' || c == '\n' || c == '\r';
}

CChatUnit MakeUnit(const std::string& text, bool maybeUrl) {
    CChatUnit unit;
    unit.SetContent(text.c_str());
    unit.SetIsText(maybeUrl && CChatUnit::IsUrl(text.c_str()) ? 0 : 1);
    return unit;
}

}  // namespace

CChatUnit::CChatUnit(const CChatUnit& other) : m_nIsText(other.m_nIsText) {
    SetContent(other.GetContent());
}

CChatUnit& CChatUnit::operator=(const CChatUnit& other) {
    if (this == &other) return *this;
    m_pContent.reset();
    SetContent(other.GetContent());
    m_nIsText = other.m_nIsText;
    return *this;
}

void CChatUnit::SetContent(const char* text) {
    if (!text) return;
    const std::size_t length = std::strlen(text);
    m_pContent = std::make_unique<char[]>(length + 1);
    std::memcpy(m_pContent.get(), text, length + 1);
}

bool CChatUnit::IsHaveUrlContent(const char* text) {
    if (!text) return false;
    const std::string lower = LowerCopy(text);
    if (lower.find('.') == std::string::npos) return false;
    return MatchesAnyPattern(lower);
}

bool CChatUnit::IsUrl(const char* text) {
    if (!text) return false;
    const std::string lower = LowerCopy(text);
    if (lower.find('.') == std::string::npos) return false;
    if (lower.front() == '.' || lower.back() == '.') return false;
    if (lower.size() >= 2 && lower.compare(lower.size() - 2, 2, ".\r") == 0) return false;
    return MatchesAnyPattern(lower);
}

std::vector<CChatUnit> CChatUnit::GetChatUnitListFromString(const char* text) {
    std::vector<CChatUnit> units;
    if (!text) return units;
    if (!IsHaveUrlContent(text)) {
        units.push_back(MakeUnit(text, false));
        return units;
    }
    std::string word;
    std::string blanks;
    for (const char* p = text; *p; ++p) {
        if (IsBlank(*p)) {
            if (!word.empty()) units.push_back(MakeUnit(word, true));
            word.clear();
            blanks += *p;
        } else {
            if (!blanks.empty()) units.push_back(MakeUnit(blanks, false));
            blanks.clear();
            word += *p;
        }
    }
    if (!word.empty()) units.push_back(MakeUnit(word, true));
    if (!blanks.empty()) units.push_back(MakeUnit(blanks, false));
    return units;
}
