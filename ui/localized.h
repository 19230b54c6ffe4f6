// The window's lookups in the component's string table, as Qt strings.
#pragma once

#include <QString>

// The translation of key (UTF-8) in the table "Localizable"; the key itself when none.
QString Localized(const QString& key);
