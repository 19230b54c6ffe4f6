// The component's string table: every user-visible text is an English key looked up in the
// bundle's table "Localizable", and titles are built from formats whose "%@" take names.
#pragma once

#include <string>

// The component's bundle; its "Localizable" table is the gettext domain of the same name.
inline constexpr char kChatBundleId[] = "com.korvo.quintarachat";
inline constexpr char kChatStringTable[] = "Localizable";

// Makes the component's table come from dir/<language>/LC_MESSAGES/com.korvo.quintarachat.mo.
// Until then the system's locale directory is searched. Null changes nothing.
void SetStringTableDirectory(const char* dir);

// The UTF-8 translation of key for the host's current language. The key itself when there
// is none, when the key is empty, or when table names another table than "Localizable". A
// null bundleId means the component's own bundle.
std::string GetLocalizedString(const std::string& key, const char* bundleId = nullptr,
                               const char* table = nullptr);

// Sets out to format with "%@" replaced by param (see FormatStringWith2Parameters).
void FormatStringWithParameter(const std::string& format, const std::string& param,
                               std::string& out);

// Sets out to format with each "%@" replaced by the next parameter in order; "%1$@" and
// "%2$@" name one, so a translation may reorder them. A "%@" with no parameter left stays as
// it is; every other character, "%s" and "%d" included, is text, and the parameters are
// inserted as they are, never read as formats.
void FormatStringWith2Parameters(const std::string& format, const std::string& p1,
                                 const std::string& p2, std::string& out);
