#include "ui/localized.h"

#include "platform/string_table.h"

QString Localized(const QString& key) {
    return QString::fromStdString(GetLocalizedString(key.toStdString()));
}
