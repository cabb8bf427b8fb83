#pragma once

#include <filesystem>
#include <optional>
#include <string>

#include "server/Settings.h"

namespace cimhost::server {

/** A user name and a password, as a client sends them. */
struct Credentials {
    std::string user{};
    std::string password{};
};

/** The credentials in the value of a header Authorization. None unless the scheme is Basic and the value is valid. */
std::optional<Credentials> credentialsFrom(const std::string& authorization);

/** Checks the passwords of users. Never called concurrently, since some PAM modules are not thread-safe. */
class Authenticator {
public:
    virtual ~Authenticator() = default;

    /** @param host address of the client */
    virtual bool accepts(const Credentials& credentials, const std::string& host) = 0;
};

/** Authenticates users of the operating system through a PAM service. */
class PamAuthenticator : public Authenticator {
public:
    /** @param itsDirectory directory of the PAM service file; empty: the system's directory */
    explicit PamAuthenticator(std::string itsService, std::filesystem::path itsDirectory = {})
        : service(std::move(itsService)), directory(std::move(itsDirectory)) {}

    bool accepts(const Credentials& credentials, const std::string& host) override;

private:
    std::string service;
    std::filesystem::path directory;
};

/** The right of an authenticated user. */
enum class Right { none, read, write };

Right rightOf(const std::string& user, const AccessRules& rules);

}  // namespace cimhost::server
