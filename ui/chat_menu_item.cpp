#include "ui/chat_menu_item.h"

#include <QApplication>
#include <QFontMetricsF>

#include "platform/func_trace.h"
#include "ui/input_filters.h"
#include "ui/localized.h"

namespace {

const char kSeparatorMark[] = "separator";  // how Qt's combo box knows a separator item

QFont TitleFont(bool group) {
    const qreal size = QApplication::font().pointSizeF();
    QFont font = group ? QApplication::font() : QApplication::font("QMenu");
    font.setPointSizeF(size);
    font.setBold(group);
    return font;
}

}  // namespace

bool SplitTitleSuffix(const QString& title, QString* base, QString* suffixKey) {
    const QStringList pieces = title.split(" (");
    if (pieces.size() < 2) return false;
    *base = pieces.mid(0, pieces.size() - 1).join(" (");
    *suffixKey = " (" + pieces.last();
    return true;
}

ChatMenuItem::ChatMenuItem(const QString& title, ChatItemAction action) : QStandardItem(title) {
    if (!title.isEmpty()) m_fullTitle = title;
    setData(true, kChatMenuItemRole);
    setAction(action);
    setEditable(false);
}

ChatMenuItem* ChatMenuItem::From(QStandardItem* item) {
    return item && item->data(kChatMenuItemRole).toBool() ? static_cast<ChatMenuItem*>(item)
                                                          : nullptr;
}

QStandardItem* ChatMenuItem::NewSeparator() {
    auto* item = new QStandardItem;
    item->setData(QString(kSeparatorMark), Qt::AccessibleDescriptionRole);
    item->setFlags(Qt::NoItemFlags);
    return item;
}

bool ChatMenuItem::IsSeparator(const QStandardItem* item) {
    return item && item->data(Qt::AccessibleDescriptionRole).toString() == kSeparatorMark;
}

void ChatMenuItem::setAction(ChatItemAction action) {
    setData(QVariant::fromValue(action), kActionRole);
}

void ChatMenuItem::setIsCompressed(bool compressed) {
    m_isCompressed = compressed;
    setToolTip(compressed && !m_localizedFullTitle.isNull() ? m_localizedFullTitle : QString());
}

QString ChatMenuItem::GetLocalizedString(const QString& key) {
    return Localized(key);
}

void ChatMenuItem::setFullTitle(const QString& title) {
    if (title.isNull()) return;
    m_fullTitle = title;
    QString base;
    QString suffixKey;
    if ((m_isGroup || hasExternalTag()) && SplitTitleSuffix(title, &base, &suffixKey)) {
        m_localizedFullTitle = base + GetLocalizedString(suffixKey);
    } else {
        m_localizedFullTitle = title;
    }
    setIsCompressed(m_isCompressed);
}

void ChatMenuItem::compressTitlewithWidth(float width) {
    setIsCompressed(false);
    if (m_fullTitle.isNull()) return;
    const QFont font = TitleFont(m_isGroup);
    const QFontMetricsF metrics(font);
    const auto measure = [&metrics](const QString& text) {
        return static_cast<float>(metrics.horizontalAdvance(text));
    };
    bool compressed = false;

    QString text = m_fullTitle;
    QString suffix;
    float available = width;
    QString base;
    QString suffixKey;
    if ((m_isGroup || hasExternalTag()) && SplitTitleSuffix(m_fullTitle, &base, &suffixKey)) {
        suffix = GetLocalizedString(suffixKey);
        text = base;
        if (measure(base + suffix) > width) {
            const QStringList pieces = suffixKey.split(',');
            if (pieces.size() >= 2) {
                suffix = GetLocalizedString(pieces.first() + "...)");
                compressed = true;
            }
        }
        available = width - measure(suffix);
    }

    const float textWidth = measure(text);
    const int length = CharacterCount(text);
    if (textWidth > available && available > 0) {
        const QString ellipsis = GetLocalizedString("...");
        const auto candidate = [&](int n) { return FirstCharacters(text, n) + ellipsis; };
        int n = static_cast<int>(static_cast<float>(length) * available / textWidth - 1.0f);
        n = std::clamp(n, 0, length);
        QString shown = candidate(n);
        if (measure(shown) >= available) {
            for (int i = n - 1;; --i) {
                if (i < 0) {
                    MacWarnTrace2(kChatTag, "chat::compressTitlewithWidth remainLen = 0");
                    break;
                }
                shown = candidate(i);
                compressed = true;
                if (measure(shown) < available) break;
            }
        } else {
            while (measure(candidate(n)) < available) {
                if (n >= length) {
                    MacWarnTrace2(kChatTag, "chat::compressTitlewithWidth remainLen = strlen");
                    n = length;
                    break;
                }
                ++n;
            }
            shown = candidate(n > 0 ? n - 1 : 0);
            compressed = true;
        }
        text = shown;
    } else if (available <= 0) {
        compressed = true;
    }
    text += suffix;

    MacInfoTrace2(kChatTag, "compressTitlewithWidth %f, %f", measure(text), width);
    setText(text);
    setFont(font);
    setForeground(isEnabled() ? QColor(Qt::black) : QColor(Qt::gray));
    setIsCompressed(compressed);
}
