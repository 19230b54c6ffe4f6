#include "netconf/conference_subjects.h"

#include <cstdlib>

namespace {

constexpr std::size_t kMaxUserLength = 32;

// Names may hold any byte; subjects take only tokens without dots, spaces or wildcards.
std::string Hex(const std::string& bytes) {
    static const char digits[] = "0123456789abcdef";
    std::string out;
    out.reserve(bytes.size() * 2);
    for (const unsigned char byte : bytes) {
        out += digits[byte >> 4];
        out += digits[byte & 0xf];
    }
    return out;
}

}  // namespace

bool IsValidConferenceUser(const std::string& user) {
    if (user.empty() || user.size() > kMaxUserLength) return false;
    for (const char c : user) {
        const bool ok = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') ||
                        (c >= '0' && c <= '9') || c == '-' || c == '_';
        if (!ok) return false;
    }
    return true;
}

std::uint32_t ConferenceUserId(const std::string& user) {
    // FNV-1a: stable across processes and machines.
    std::uint32_t hash = 2166136261u;
    for (const unsigned char c : user) {
        hash ^= c;
        hash *= 16777619u;
    }
    return 1 + hash % 0x7ffffffeu;
}

ConferenceSubjects::ConferenceSubjects(std::uint16_t conferenceId)
    : m_prefix("qc." + std::to_string(conferenceId)),
      m_stream("QC_" + std::to_string(conferenceId)) {}

std::string ConferenceSubjects::CacheStream() const {
    return m_stream;
}

std::string ConferenceSubjects::MailboxStream(const std::string& user) const {
    return m_stream + "_P_" + user;
}

std::string ConferenceSubjects::CacheAction(std::uint32_t handle, const std::string& writer) const {
    return m_prefix + ".c." + std::to_string(handle) + "." + writer;
}

std::string ConferenceSubjects::CacheFilter(std::uint32_t handle) const {
    return m_prefix + ".c." + std::to_string(handle) + ".*";
}

std::string ConferenceSubjects::AllCaches() const {
    return m_prefix + ".c.>";
}

std::string ConferenceSubjects::Private(const std::string& receiver,
                                        const std::string& sender) const {
    return m_prefix + ".p." + receiver + "." + sender;
}

std::string ConferenceSubjects::Mailbox(const std::string& receiver) const {
    return m_prefix + ".p." + receiver + ".*";
}

std::string ConferenceSubjects::Presence(const std::string& user) const {
    return m_prefix + ".presence." + user;
}

std::string ConferenceSubjects::AllPresence() const {
    return m_prefix + ".presence.*";
}

std::string ConferenceSubjects::NameNumber(const std::string& name) const {
    return m_prefix + ".id.n." + (name.empty() ? std::string("-") : Hex(name));
}

std::string ConferenceSubjects::SessionNumber(std::uint32_t sessionId) const {
    return m_prefix + ".id.s." + std::to_string(sessionId);
}

std::string ConferenceSubjects::UserIdClaim(std::uint32_t userId) const {
    return m_prefix + ".id.u." + std::to_string(userId);
}

std::string ConferenceSubjects::AllNumbers() const {
    return m_prefix + ".id.>";
}

std::string ConferenceSubjects::InboxPrefix(const std::string& user) {
    return "_INBOX_" + user;
}

std::string ConferenceSubjects::LastToken(const std::string& subject) {
    const std::size_t dot = subject.rfind('.');
    return dot == std::string::npos ? std::string() : subject.substr(dot + 1);
}

std::uint32_t ConferenceSubjects::HandleOf(const std::string& subject) const {
    const std::string head = m_prefix + ".c.";
    if (subject.compare(0, head.size(), head) != 0) return 0;
    const std::size_t end = subject.find('.', head.size());
    if (end == std::string::npos) return 0;
    const std::string digits = subject.substr(head.size(), end - head.size());
    if (digits.empty() || digits.size() > 10) return 0;
    char* stop = nullptr;
    const unsigned long long value = std::strtoull(digits.c_str(), &stop, 10);
    if (*stop != '\0' || value > 0xffffffffull) return 0;
    return static_cast<std::uint32_t>(value);
}
