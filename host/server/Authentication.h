#pragma once

#include <filesystem>
#include <mutex>
#include <optional>
#include <string>

#include "server/Settings.h"

namespace cimhost::server {

/** A user name and a password, as a client sends them. */
struct Credentials {
    std::string user{};
    std::string password{};
};

/** The credentials in the value of a header Authorization with the scheme Basic; none for any other value. */
std::optional<Credentials> credentialsFrom(const std::string& authorization);

/** Decides whether a password is that of a user. Called concurrently. */
class Authenticator {
public:
    virtual ~Authenticator() = default;
    virtual bool accepts(const Credentials& credentials) = 0;
};

/** Authenticates users of the operating system through a PAM service. Attempts are serialised. */
class PamAuthenticator : public Authenticator {
public:
    /** @param itsDirectory with the file of the service; empty: the system's directory */
    explicit PamAuthenticator(std::string itsService, std::filesystem::path itsDirectory = {})
        : service(std::move(itsService)), directory(std::move(itsDirectory)) {}

    bool accepts(const Credentials& credentials) override;

private:
    std::string service;
    std::filesystem::path directory;
    std::mutex mutex;  ///< some PAM modules are not safe to use from several threads
};

/** The right of an authenticated user. */
enum class Right { none, read, write };

Right rightOf(const std::string& user, const AccessRules& rules);

}  // namespace cimhost::server
