// The window's text-field formatters: MaxFilter limits the chat input's length, NumberFilter
// keeps a numeric field to digits up to a largest value. Both beep at an edit they dislike.
#pragma once

#include <QString>
#include <QVariant>
#include <functional>

// How a formatter beeps; the default is the desktop's beep.
using Beeper = std::function<void()>;

class MaxFilter {
public:
    // Sets the limit in characters (a surrogate pair counts as one).
    void setMax(int max) { mMax = max; }
    int max() const { return mMax; }

    // The object itself when it holds a string, else a null string.
    QString stringForObjectValue(const QVariant& object) const;
    // The text cut to its first mMax characters when it has mMax or more, else the text.
    QString getObjectValue(const QString& text) const;
    // Accepts every edit; beeps first when the edited text has mMax characters or more.
    bool isPartialStringValid(const QString& text) const;

    void setBeeper(Beeper beeper) { mBeeper = std::move(beeper); }

private:
    int mMax = 0;
    Beeper mBeeper;
};

class NumberFilter {
public:
    void setMaxnumber(int max) { mMax = max; }

    // A number printed as a decimal integer; a null string for anything else.
    QString stringForObjectValue(const QVariant& object) const;
    // The value of the text's leading digits (0 when there are none); values beyond the
    // range of int are held at its largest value instead of overflowing.
    int getObjectValue(const QString& text) const;
    // Rejects with a beep an edit holding anything but digits, starting with 0, or above
    // mMax; accepts everything else, the empty text included.
    bool isPartialStringValid(const QString& text) const;

    void setBeeper(Beeper beeper) { mBeeper = std::move(beeper); }

private:
    int mMax = 0;
    Beeper mBeeper;
};

// Characters (code points) in text; a surrogate pair counts once.
int CharacterCount(const QString& text);
// The first count characters of text, never splitting a surrogate pair.
QString FirstCharacters(const QString& text, int count);
