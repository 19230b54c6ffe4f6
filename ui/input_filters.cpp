#include "ui/input_filters.h"

#include <QApplication>
#include <climits>

namespace {

void Beep(const Beeper& beeper) {
    if (beeper) {
        beeper();
    } else {
        QApplication::beep();
    }
}

// The value of a run of decimal digits, held at INT_MAX when it would exceed it.
long long SaturatedValue(const QString& digits, int from, int to) {
    long long value = 0;
    for (int i = from; i < to; ++i) {
        value = value * 10 + (digits[i].unicode() - '0');
        if (value > INT_MAX) return INT_MAX + 1LL;  // one past, so a limit of INT_MAX rejects
    }
    return value;
}

}  // namespace

int CharacterCount(const QString& text) {
    int count = 0;
    for (int i = 0; i < text.size(); ++i) {
        if (text[i].isHighSurrogate() && i + 1 < text.size() && text[i + 1].isLowSurrogate()) ++i;
        ++count;
    }
    return count;
}

QString FirstCharacters(const QString& text, int count) {
    int end = 0;
    for (int taken = 0; taken < count && end < text.size(); ++taken) {
        const bool pair =
            text[end].isHighSurrogate() && end + 1 < text.size() && text[end + 1].isLowSurrogate();
        end += pair ? 2 : 1;
    }
    return text.left(end);
}

QString MaxFilter::stringForObjectValue(const QVariant& object) const {
    return object.typeId() == QMetaType::QString ? object.toString() : QString();
}

QString MaxFilter::getObjectValue(const QString& text) const {
    return CharacterCount(text) >= mMax ? FirstCharacters(text, mMax) : text;
}

bool MaxFilter::isPartialStringValid(const QString& text) const {
    if (CharacterCount(text) >= mMax) Beep(mBeeper);
    return true;
}

QString NumberFilter::stringForObjectValue(const QVariant& object) const {
    bool isNumber = false;
    const int value = object.toInt(&isNumber);
    const bool numeric = object.typeId() == QMetaType::Int || object.typeId() == QMetaType::UInt ||
                         object.typeId() == QMetaType::LongLong ||
                         object.typeId() == QMetaType::Double;
    return numeric && isNumber ? QString::number(value) : QString();
}

int NumberFilter::getObjectValue(const QString& text) const {
    int i = 0;
    while (i < text.size() && text[i].isSpace())
        ++i;
    bool negative = false;
    if (i < text.size() && (text[i] == u'-' || text[i] == u'+')) negative = text[i++] == u'-';
    int end = i;
    while (end < text.size() && text[end] >= u'0' && text[end] <= u'9')
        ++end;
    const long long value = std::min<long long>(SaturatedValue(text, i, end), INT_MAX);
    return static_cast<int>(negative ? -value : value);
}

bool NumberFilter::isPartialStringValid(const QString& text) const {
    if (text.isEmpty()) return true;
    bool valid = text[0] != u'0';
    for (const QChar c : text)
        valid = valid && c >= u'0' && c <= u'9';
    if (valid) valid = SaturatedValue(text, 0, text.size()) <= mMax;
    if (!valid) Beep(mBeeper);
    return valid;
}
