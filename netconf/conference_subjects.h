// Where one conference lives on the server: its subjects, streams and the participants' user
// ids, all derived from the conference id and the participants' credential names. The server's
// permissions (server_config.h) are written against the same names.
#pragma once

#include <cstdint>
#include <string>

// A credential name usable in subjects and stream names: 1 to 32 letters, digits, '-' or '_'.
bool IsValidConferenceUser(const std::string& user);

// The user id a credential name stands for: the same in every process, never 0 and below
// 0x80000000 (the component reads larger values as group addresses).
std::uint32_t ConferenceUserId(const std::string& user);

class ConferenceSubjects {
public:
    explicit ConferenceSubjects(std::uint16_t conferenceId);

    // The stream of the caches and conference-wide numbers, and a participant's mailbox
    // stream holding the private data sent to it.
    std::string CacheStream() const;
    std::string MailboxStream(const std::string& user) const;

    // A cache action by writer on the cache with handle; every action on one cache.
    std::string CacheAction(std::uint32_t handle, const std::string& writer) const;
    std::string CacheFilter(std::uint32_t handle) const;
    std::string AllCaches() const;
    // Private data from sender to receiver; everything sent to receiver.
    std::string Private(const std::string& receiver, const std::string& sender) const;
    std::string Mailbox(const std::string& receiver) const;
    // A participant's presence announcements; everybody's.
    std::string Presence(const std::string& user) const;
    std::string AllPresence() const;
    // Numbers granted once per conference: a named handle, a session value, a user id claim.
    std::string NameNumber(const std::string& name) const;
    std::string SessionNumber(std::uint32_t sessionId) const;
    std::string UserIdClaim(std::uint32_t userId) const;
    std::string AllNumbers() const;
    // The inbox prefix of a participant's replies (no other participant may listen there).
    static std::string InboxPrefix(const std::string& user);

    // The last token of subject (the writer or sender), or "" when it has none.
    static std::string LastToken(const std::string& subject);
    // The cache handle of a CacheAction subject, 0 when it is not one.
    std::uint32_t HandleOf(const std::string& subject) const;

private:
    std::string m_prefix;  // "qc.<conference id>"
    std::string m_stream;  // "QC_<conference id>"
};
