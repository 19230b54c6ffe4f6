// One run of a chat message: plain text or a URL. A message is split into runs so the window
// can show URL runs as links; detection is a fixed list of scheme prefixes, no URL grammar.
#pragma once

#include <memory>
#include <vector>

class CChatUnit {
public:
    CChatUnit() = default;
    CChatUnit(const CChatUnit& other);
    CChatUnit& operator=(const CChatUnit& other);
    CChatUnit(CChatUnit&&) = default;
    CChatUnit& operator=(CChatUnit&&) = default;
    virtual ~CChatUnit() = default;

    // Stores a private copy of text; null changes nothing.
    void SetContent(const char* text);
    // The run's text, or null when none was set.
    const char* GetContent() const { return m_pContent.get(); }

    // 1: plain text; 0: the run is a URL.
    int IsText() const { return m_nIsText; }
    void SetIsText(int isText) { m_nIsText = isText; }

    // Whether one word (no blanks) is a URL: it begins with a known scheme prefix, holds a
    // dot and neither begins nor ends with one. Null is not.
    static bool IsUrl(const char* text);
    // Whether a message holds anything URL-like. Null does not.
    static bool IsHaveUrlContent(const char* text);
    // The runs of a message in text order: words and blank runs alternate when the message
    // is URL-like, else one plain run. They concatenate back to text. Null gives none.
    static std::vector<CChatUnit> GetChatUnitListFromString(const char* text);

private:
    std::unique_ptr<char[]> m_pContent;
    int m_nIsText = 1;
};
