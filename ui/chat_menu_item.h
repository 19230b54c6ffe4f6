// One send-to item of the popup: keeps the engine's full title and shows it shortened with
// an ellipsis to fit the popup, its parenthesised suffix localised and kept visible.
#pragma once

#include <QStandardItem>
#include <QString>

// What choosing an item does.
enum class ChatItemAction { None, Select, OpenAttendeeDialog };

// Model roles the popup's items carry beside their text.
enum ChatItemRole {
    kActionRole = Qt::UserRole + 1,  // ChatItemAction
    kChatMenuItemRole,               // true on ChatMenuItem objects
};

class ChatMenuItem final : public QStandardItem {
public:
    // An item titled title with action; fullTitle is title when it is non-empty.
    ChatMenuItem(const QString& title, ChatItemAction action);

    // Whether item is a ChatMenuItem (separators and others are not).
    static ChatMenuItem* From(QStandardItem* item);
    // A separator item; never selectable.
    static QStandardItem* NewSeparator();
    static bool IsSeparator(const QStandardItem* item);

    const QString& fullTitle() const { return m_fullTitle; }
    const QString& localizedFullTitle() const { return m_localizedFullTitle; }
    bool hasFullTitle() const { return !m_fullTitle.isNull(); }
    bool isGroup() const { return m_isGroup; }
    void setIsGroup(bool group) { m_isGroup = group; }
    bool hasExternalTag() const { return m_hasExternalTag != 0; }
    void setHasExternalTag(int tag) { m_hasExternalTag = tag; }
    bool isCompressed() const { return m_isCompressed; }
    // Stores the flag; the item's tooltip becomes its localised full title when set.
    void setIsCompressed(bool compressed);

    ChatItemAction action() const { return data(kActionRole).value<ChatItemAction>(); }
    void setAction(ChatItemAction action);

    // Stores title as the full title and derives the localised one (suffix translated for
    // groups and tagged items). A null title changes nothing.
    void setFullTitle(const QString& title);
    // Shows the full title shortened to fit width points, in black or grey by the enabled
    // state and bold for groups. Without a full title nothing changes.
    void compressTitlewithWidth(float width);

    // The translation of key in the component's string table, the key itself when none.
    static QString GetLocalizedString(const QString& key);

private:
    QString m_fullTitle;
    QString m_localizedFullTitle;
    bool m_isGroup = false;
    int m_hasExternalTag = 0;
    bool m_isCompressed = false;
};

Q_DECLARE_METATYPE(ChatItemAction)

// Splits title at its last " (": base and suffix key (" (" + the last piece). False when the
// title has no " (" at all.
bool SplitTitleSuffix(const QString& title, QString* base, QString* suffixKey);
