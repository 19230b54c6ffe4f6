// The transcript: a read-only rich-text view whose links open on a click. Peer text is never
// read as markup: it goes in through a text cursor with character formats, links as anchors.
#pragma once

#include <QTextEdit>
#include <functional>

class NSTextViewWithLinks final : public QTextEdit {
    Q_OBJECT

public:
    explicit NSTextViewWithLinks(QWidget* parent = nullptr);

    // Opens a clicked link: "www." links as "http://" plus the lower-cased text; http, https,
    // ftp and mailto directly; any other scheme (file:, telnet:) only after the user agrees.
    // A link that is not a URL beeps.
    void clickedOnLink(const QString& link);

    // Sets or clears the underline of a range of the document.
    void setUnderLine(bool underline, int start, int length);
    // Gives a range the view's font with the given weight and style added.
    void changeFontStyle(bool bold, bool italic, int start, int length);
    // Context-menu actions by tag: 0 copies the selection, 2 selects all, others do nothing.
    void selectMenu(int tag);

    // Where a confirmed link goes; tests replace it (the default opens it on the desktop).
    void setLinkOpener(std::function<void(const QUrl&)> opener) { m_opener = std::move(opener); }

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;

private:
    void Open(const QUrl& url);

    std::function<void(const QUrl&)> m_opener;
    QString m_pressedAnchor;  // the link under the last press, if any
};
