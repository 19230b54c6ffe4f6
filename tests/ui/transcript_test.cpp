// Chat lines in the transcript: paragraphs, styles, link runs, clicks and following the end.
#include <QScrollBar>
#include <QTest>
#include <QTextBlock>
#include <QTextDocument>
#include <QTextFragment>
#include <tuple>

#include "tests/ui/window_fixture.h"
#include "ui/chat_panels.h"
#include "ui/chat_text_view.h"

namespace {

// The document's text runs with whether each is a link.
std::vector<std::pair<std::string, bool>> Fragments(const QTextDocument* document) {
    std::vector<std::pair<std::string, bool>> runs;
    for (QTextBlock block = document->begin(); block.isValid(); block = block.next())
        for (auto it = block.begin(); !it.atEnd(); ++it)
            runs.emplace_back(it.fragment().text().toStdString(),
                              it.fragment().charFormat().isAnchor());
    return runs;
}

// Answers the link prompt from a script and records what would have opened.
class ScriptedPanels final : public ChatPanelProvider {
public:
    bool RunSavePanel(QWidget*, const QString&, const QString&, const QString&, QString*) override {
        return false;
    }
    bool RunOpenPanel(QWidget*, const QString&, const QStringList&, QString*) override {
        return false;
    }
    void AbortPanels() override {}
    bool ConfirmOpenLink(QWidget*, const QUrl& url) override {
        asked.push_back(url.toString().toStdString());
        return allow;
    }
    void OpenLink(const QUrl& url) override { opened.push_back(url.toString().toStdString()); }

    bool allow = false;
    std::vector<std::string> asked;
    std::vector<std::string> opened;
};

class TranscriptTest : public WindowTest {
protected:
    void Show(const char* text, bool title = false) {
        Command(title ? msg_ShowTitle : msg_ShowText, const_cast<char*>(text));
    }
    QTextDocument* Document() const { return window->textView()->document(); }
};

// Each shown line ends one paragraph, with or without its own line end.
TEST_F(TranscriptTest, LineEndsConvertedTwiceMakeNoBlankParagraph) {
    // Each line and the transcript's text after it alone.
    const std::tuple<const char*, const char*> cases[] = {
        {"abc", "abc\n"},
        {"def\n", "def\n"},
        {"two\r\nlines\r\n", "two\nlines\n"},
        {"", ""},
        {"x\r\r\n", "x\n"},
        {"x\r\r\r\ny", "x\ny\n"},
        {"see www.a.com\r\r\n", "see www.a.com\n"},
        // Line ends of their own still make blank lines.
        {"x\r\ry", "x\n\ny\n"},
        {"x\n\ny\r\n\r\n", "x\n\ny\n\n"},
    };
    for (const auto& [text, shown] : cases) {
        Command(msg_ClearChat);
        Show(text);
        EXPECT_EQ(Document()->toPlainText().toStdString(), shown) << text;
    }
}

TEST_F(TranscriptTest, TitlesAndBodiesHaveTheirStylesAndPeerMarkupIsText) {
    Show("from Ann to Everyone", true);
    Show("<b>bold?</b> &amp;");
    const QTextBlock title = Document()->begin();
    const QTextBlock body = title.next();
    EXPECT_EQ(title.begin().fragment().charFormat().foreground().color(), QColor(0x99, 0x99, 0x99));
    EXPECT_EQ(title.begin().fragment().charFormat().font().pointSize(), 12);
    EXPECT_EQ(title.blockFormat().bottomMargin(), 6);
    const QTextCharFormat text = body.begin().fragment().charFormat();
    EXPECT_EQ(text.foreground().color(), QColor(0x33, 0x33, 0x33));
    EXPECT_EQ(text.font().pointSize(), 14);
    EXPECT_EQ(body.blockFormat().bottomMargin(), 12);
    // A title is never split into links.
    Show("www.example.com", true);
    EXPECT_EQ(Fragments(Document()),
              (std::vector<std::pair<std::string, bool>>{{"from Ann to Everyone", false},
                                                         {"<b>bold?</b> &amp;", false},
                                                         {"www.example.com", false}}));
}

TEST_F(TranscriptTest, LinksShowAsLinksAndOpenByScheme) {
    auto panels = std::make_shared<ScriptedPanels>();
    SetChatPanelProvider(panels);
    NSTextViewWithLinks* view = window->textView();
    view->clickedOnLink("WWW.Example.COM/Mixed");
    view->clickedOnLink("https://a.example/x");
    view->clickedOnLink("mailto:ann@example.org");
    view->clickedOnLink("file:///etc/passwd");
    panels->allow = true;
    view->clickedOnLink("telnet:host.example");
    EXPECT_EQ(panels->opened,
              (std::vector<std::string>{"http://www.example.com/mixed", "https://a.example/x",
                                        "mailto:ann@example.org", "telnet:host.example"}));
    EXPECT_EQ(panels->asked,
              (std::vector<std::string>{"file:///etc/passwd", "telnet:host.example"}));

    // URL words become link runs without underline; a real click on one goes the same way.
    panels->opened.clear();
    Show("go www.A.com or ftp://nodot");
    EXPECT_EQ(Fragments(Document()),
              (std::vector<std::pair<std::string, bool>>{
                  {"go ", false}, {"www.A.com", true}, {" or ftp://nodot", false}}));
    QTextCursor cursor(view->document());
    cursor.setPosition(4);
    EXPECT_EQ(cursor.charFormat().anchorHref(), "www.A.com");
    EXPECT_FALSE(cursor.charFormat().fontUnderline());
    EXPECT_EQ(cursor.charFormat().foreground().color(), QColor(Qt::blue));
    const QRect at = view->cursorRect(cursor);
    QTest::mouseClick(view->viewport(), Qt::LeftButton, {}, at.center() + QPoint(4, 0));
    EXPECT_EQ(panels->opened, (std::vector<std::string>{"http://www.a.com"}));
    SetChatPanelProvider(nullptr);
}

TEST_F(TranscriptTest, FollowsNewLinesOnlyWhileAtTheEnd) {
    for (int i = 0; i < 60; ++i)
        Show("line");
    QApplication::processEvents();
    QScrollBar* bar = window->textView()->verticalScrollBar();
    ASSERT_GT(bar->maximum(), 0);
    EXPECT_TRUE(window->isScrollAtBottom());
    Show("more");
    EXPECT_EQ(bar->value(), bar->maximum());
    window->scrollToTop();
    Show("later");
    EXPECT_EQ(bar->value(), 0);
}

}  // namespace
