#include "netconf/server_config.h"

#include "netconf/conference_subjects.h"

namespace {

// A quoted string for the configuration file.
std::string Quoted(const std::string& text) {
    std::string out = "\"";
    for (const char c : text) {
        if (c == '"' || c == '\\') out += '\\';
        out += c;
    }
    return out + "\"";
}

std::string List(const std::vector<std::string>& items, const std::string& indent) {
    std::string out = "[\n";
    for (const std::string& item : items)
        out += indent + "  " + Quoted(item) + "\n";
    return out + indent + "]";
}

// Everything a participant's connection publishes to: its own subjects, claims on named
// handles and session values, the claim on its own user id (nobody else's), and the stream
// requests its caches and mailbox need.
std::vector<std::string> PublishAllowed(const ConferenceSubjects& subjects, const std::string& user,
                                        std::uint16_t conferenceId) {
    const std::string prefix = "qc." + std::to_string(conferenceId);
    std::vector<std::string> allowed = {
        prefix + ".c.*." + user, prefix + ".p.*." + user,
        subjects.Presence(user), prefix + ".id.n.*",
        prefix + ".id.s.*",      subjects.UserIdClaim(ConferenceUserId(user)),
        "$JS.API.INFO",
    };
    for (const std::string& stream : {subjects.CacheStream(), subjects.MailboxStream(user)}) {
        allowed.push_back("$JS.API.STREAM.INFO." + stream);
        allowed.push_back("$JS.API.STREAM.CREATE." + stream);
        allowed.push_back("$JS.API.CONSUMER.CREATE." + stream);
        allowed.push_back("$JS.API.CONSUMER.CREATE." + stream + ".>");
        allowed.push_back("$JS.API.CONSUMER.INFO." + stream + ".*");
        allowed.push_back("$JS.API.CONSUMER.DELETE." + stream + ".*");
        allowed.push_back("$JS.FC." + stream + ".>");
    }
    return allowed;
}

}  // namespace

std::string ConferenceServerConfig(const ConferenceServerOptions& options) {
    const ConferenceSubjects subjects(options.conferenceId);
    std::string text = "# Conference " + std::to_string(options.conferenceId) + "\n";
    if (!options.serverName.empty()) text += "server_name: " + Quoted(options.serverName) + "\n";
    text += "host: " + Quoted(options.host) + "\n";
    text += "port: " + std::to_string(options.port) + "\n";
    text += "jetstream {\n  store_dir: " + Quoted(options.storeDir) + "\n}\n";
    if (!options.clusterName.empty()) {
        text += "cluster {\n  name: " + Quoted(options.clusterName) + "\n";
        text += "  host: " + Quoted(options.host) + "\n";
        text += "  port: " + std::to_string(options.clusterPort) + "\n";
        text += "  routes: " + List(options.routes, "  ") + "\n}\n";
    }
    text += "authorization {\n  users: [\n";
    for (const ConferenceCredential& participant : options.participants) {
        if (!IsValidConferenceUser(participant.user)) return std::string();
        const std::string& user = participant.user;
        text += "    {\n      user: " + Quoted(user) + "\n";
        text += "      password: " + Quoted(participant.password) + "\n";
        text += "      permissions: {\n";
        text += "        publish: { allow: " +
                List(PublishAllowed(subjects, user, options.conferenceId), "        ") + " }\n";
        text += "        subscribe: { allow: " +
                List({ConferenceSubjects::InboxPrefix(user) + ".>", subjects.AllPresence()},
                     "        ") +
                " }\n";
        text += "      }\n    }\n";
    }
    text += "  ]\n}\n";
    return text;
}
