#include "platform/string_table.h"

#include <libintl.h>

#include <cstring>
#include <set>
#include <utility>

namespace {

// Translations come back in UTF-8 whatever the host's locale: the engine's strings are UTF-8.
// The host owns the locale and its own default domain, so neither is touched here.
void ReturnUtf8From(const char* domain) {
    static std::set<std::string> bound;
    if (bound.insert(domain).second) bind_textdomain_codeset(domain, "UTF-8");
}

// Appends what a "%" at format[at] stands for and returns the index after it. Only "%@"
// and "%N$@" with N naming a parameter are placeholders; anything else is the text "%".
std::size_t AppendPlaceholder(const std::string& format, std::size_t at,
                              const std::string* const params[], std::size_t count,
                              std::size_t& nextParam, std::string& out) {
    if (format.compare(at, 2, "%@") == 0) {
        if (nextParam >= count) {
            out += "%@";
        } else {
            out += *params[nextParam++];
        }
        return at + 2;
    }
    const char digit = at + 1 < format.size() ? format[at + 1] : '\0';
    if (digit >= '1' && static_cast<std::size_t>(digit - '0') <= count &&
        format.compare(at + 2, 2, "$@") == 0) {
        out += *params[digit - '1'];
        return at + 4;
    }
    out += '%';
    return at + 1;
}

void FormatWith(const std::string& format, const std::string* const params[], std::size_t count,
                std::string& out) {
    std::string result;  // out may be the format itself
    result.reserve(format.size());
    std::size_t nextParam = 0;
    std::size_t at = 0;
    while (at < format.size()) {
        const std::size_t percent = format.find('%', at);
        if (percent == std::string::npos) {
            result.append(format, at, std::string::npos);
            break;
        }
        result.append(format, at, percent - at);
        at = AppendPlaceholder(format, percent, params, count, nextParam, result);
    }
    out = std::move(result);
}

}  // namespace

void SetStringTableDirectory(const char* dir) {
    if (dir != nullptr) bindtextdomain(kChatBundleId, dir);
}

std::string GetLocalizedString(const std::string& key, const char* bundleId, const char* table) {
    // The empty key would fetch the catalogue's header, and a key with a NUL in it cannot be
    // in any table.
    if (key.empty() || key.find('\0') != std::string::npos) return key;
    if (table != nullptr && std::strcmp(table, kChatStringTable) != 0) return key;
    const char* domain = (bundleId != nullptr && *bundleId != '\0') ? bundleId : kChatBundleId;
    ReturnUtf8From(domain);
    const char* found = dgettext(domain, key.c_str());
    return found == key.c_str() ? key : std::string(found);
}

void FormatStringWithParameter(const std::string& format, const std::string& param,
                               std::string& out) {
    const std::string* const params[] = {&param};
    FormatWith(format, params, 1, out);
}

void FormatStringWith2Parameters(const std::string& format, const std::string& p1,
                                 const std::string& p2, std::string& out) {
    const std::string* const params[] = {&p1, &p2};
    FormatWith(format, params, 2, out);
}
