// The send-to popup: a combo box over a standard item model whose rows mirror the engine's
// menu model one for one (separators included), and the cell that draws its closed title.
#pragma once

#include <QComboBox>
#include <QStandardItemModel>

class ChatMenuItem;

// Draws the popup's selected title the way the closed popup shows it.
class ChatPopUpButtonCell {
public:
    // Draws title in frame: grey 0x666666, the title-bar font at 14, inset 10 on the left.
    static void drawTitleWithFrame(QPainter& painter, const QRect& frame, const QString& title);
};

class ChatPopUpButton final : public QComboBox {
    Q_OBJECT

public:
    explicit ChatPopUpButton(QWidget* parent = nullptr);

    QStandardItemModel* menu() const { return m_model; }
    int numberOfItems() const { return m_model->rowCount(); }
    QStandardItem* itemAtIndex(int index) const;
    // Index of the first item titled title (its full title for chat items), or -1.
    int indexOfItemWithTitle(const QString& title) const;
    ChatMenuItem* selectedChatItem() const;

    // Recompresses every chat item to the popup's width less 40 and sets the tooltip to the
    // selected item's full title when it is shortened. While the placeholder item is in the
    // popup nothing is recompressed and the tooltip is empty.
    void viewDidEndLiveResize2();

    bool isMenuOpen() const { return m_menuOpen; }
    void showPopup() override;
    void hidePopup() override;

signals:
    // The list is about to open.
    void menuWillPopUp();
    // The list closed, by a choice or without one.
    void menuDidEndTracking();

protected:
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private:
    QStandardItemModel* m_model;
    bool m_menuOpen = false;
};
