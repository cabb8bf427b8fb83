#include "server/Authentication.h"

#include <grp.h>
#include <pwd.h>
#include <security/pam_appl.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "cim/Names.h"
#include "server/UserDatabase.h"

namespace cimhost::server {
namespace {

/** Decodes Base64. Returns none for other strings. */
std::optional<std::string> base64Decoded(std::string_view encoded) {
    constexpr std::string_view digits = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
    if (encoded.size() % 4 != 0) {
        return std::nullopt;
    }
    const std::size_t end = encoded.find('=');
    const std::size_t padding = end == std::string_view::npos ? 0 : encoded.size() - end;
    if (padding > 2 || (padding == 2 && encoded.back() != '=')) {
        return std::nullopt;
    }
    encoded.remove_suffix(padding);
    std::string decoded;
    unsigned bits = 0;
    unsigned count = 0;
    for (const char each : encoded) {
        const std::size_t value = digits.find(each);
        if (value == std::string_view::npos) {
            return std::nullopt;
        }
        bits = (bits << 6U | static_cast<unsigned>(value)) & 0xFFFFU;
        count += 6;
        if (count >= 8) {
            count -= 8;
            decoded += static_cast<char>(bits >> count & 0xFFU);
        }
    }
    return decoded;
}

/** Answers PAM's prompts for hidden input with the password. */
int answerQuestions(int count, const pam_message** messages, pam_response** responses, void* password) {
    auto* answers = static_cast<pam_response*>(std::calloc(static_cast<std::size_t>(count), sizeof(pam_response)));
    if (answers == nullptr) {
        return PAM_BUF_ERR;
    }
    for (int i = 0; i < count; ++i) {
        if (messages[i]->msg_style == PAM_PROMPT_ECHO_OFF) {
            answers[i].resp = ::strdup(static_cast<const char*>(password));
        }
    }
    *responses = answers;
    return PAM_SUCCESS;
}

/** Replaces the delay of PAM modules, since the server delays all failures equally. */
void doNotDelay(int, unsigned, void*) {}

/** One transaction with PAM. */
class PamTransaction {
public:
    PamTransaction(const std::string& service, const std::filesystem::path& directory, const Credentials& credentials)
        : conversation{&answerQuestions, const_cast<char*>(credentials.password.c_str())} {
        status = directory.empty() ? ::pam_start(service.c_str(), credentials.user.c_str(), &conversation, &handle)
                                   : ::pam_start_confdir(service.c_str(), credentials.user.c_str(), &conversation,
                                                         directory.c_str(), &handle);
    }
    ~PamTransaction() {
        if (handle != nullptr) {
            ::pam_end(handle, status);
        }
    }
    PamTransaction(const PamTransaction&) = delete;
    PamTransaction& operator=(const PamTransaction&) = delete;

    bool accepts(const std::string& host) {
        if (status != PAM_SUCCESS) {
            return false;
        }
        using Delay = void (*)(int, unsigned, void*);
        Delay delay = &doNotDelay;
        ::pam_set_item(handle, PAM_FAIL_DELAY, reinterpret_cast<const void*>(delay));
        status = ::pam_set_item(handle, PAM_RHOST, host.c_str());
        if (status == PAM_SUCCESS) {
            status = ::pam_authenticate(handle, PAM_SILENT | PAM_DISALLOW_NULL_AUTHTOK);
        }
        if (status == PAM_SUCCESS) {
            status = ::pam_acct_mgmt(handle, PAM_SILENT);
        }
        return status == PAM_SUCCESS;
    }

private:
    pam_conv conversation;
    pam_handle_t* handle = nullptr;
    int status = PAM_SYSTEM_ERR;
};

/** Names of all groups of a user; empty for an unknown user. */
std::vector<std::string> groupsOf(const std::string& user) {
    std::vector<char> buffer;
    passwd entry{};
    passwd* found = nullptr;
    const auto readUser = [&](char* data, std::size_t size) {
        return ::getpwnam_r(user.c_str(), &entry, data, size, &found);
    };
    if (!readEntry(buffer, readUser) || found == nullptr) {
        return {};
    }
    int count = 1024;
    std::vector<gid_t> ids(static_cast<std::size_t>(count));
    count = std::max(::getgrouplist(user.c_str(), entry.pw_gid, ids.data(), &count), 0);
    std::vector<std::string> names;
    for (int i = 0; i < count; ++i) {
        group groupEntry{};
        group* foundGroup = nullptr;
        const auto readGroup = [&](char* data, std::size_t size) {
            return ::getgrgid_r(ids[static_cast<std::size_t>(i)], &groupEntry, data, size, &foundGroup);
        };
        if (readEntry(buffer, readGroup) && foundGroup != nullptr) {
            names.emplace_back(groupEntry.gr_name);
        }
    }
    return names;
}

bool names(const std::vector<std::string>& rule, const std::string& user) {
    if (std::find(rule.begin(), rule.end(), user) != rule.end()) {
        return true;
    }
    const auto isGroup = [](const std::string& each) { return !each.empty() && each.front() == '@'; };
    if (std::none_of(rule.begin(), rule.end(), isGroup)) {
        return false;
    }
    const std::vector<std::string> groups = groupsOf(user);
    return std::any_of(groups.begin(), groups.end(), [&](const std::string& each) {
        return std::find(rule.begin(), rule.end(), "@" + each) != rule.end();
    });
}

}  // namespace

std::optional<Credentials> credentialsFrom(const std::string& authorization) {
    constexpr std::string_view scheme = "Basic ";
    if (!cim::sameName(std::string_view(authorization).substr(0, scheme.size()), scheme)) {
        return std::nullopt;
    }
    const std::size_t first = authorization.find_first_not_of(' ', scheme.size());
    const auto decoded = base64Decoded(first == std::string::npos ? "" : std::string_view(authorization).substr(first));
    const std::size_t colon = decoded ? decoded->find(':') : std::string::npos;
    if (colon == std::string::npos || colon == 0 || decoded->find('\0') != std::string::npos) {
        return std::nullopt;
    }
    return Credentials{decoded->substr(0, colon), decoded->substr(colon + 1)};
}

bool PamAuthenticator::accepts(const Credentials& credentials, const std::string& host) {
    return PamTransaction(service, directory, credentials).accepts(host);
}

Right rightOf(const std::string& user, const AccessRules& rules) {
    return names(rules.writers, user) ? Right::write : names(rules.readers, user) ? Right::read : Right::none;
}

}  // namespace cimhost::server
