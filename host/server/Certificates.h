#pragma once

#include <gnutls/abstract.h>
#include <gnutls/gnutls.h>

#include <atomic>
#include <filesystem>
#include <memory>
#include <mutex>
#include <vector>

namespace cimhost::server {

/** The server's certificate chain and key, which can be replaced while connections use them. */
class Certificates {
public:
    /** @throws SettingsError if the files cannot be read, or the key does not belong to the certificate */
    Certificates(const std::filesystem::path& itsCertificate, const std::filesystem::path& itsKey);
    ~Certificates();

    /** Reads the files again, for new connections. @throws SettingsError; the old certificate then remains in use */
    void reload();

    struct Chain;

    /** The current chain, which remains valid as long as this object exists. */
    const Chain& current() const { return *active.load(); }

private:
    std::filesystem::path certificate;
    std::filesystem::path key;
    std::atomic<const Chain*> active{nullptr};
    std::vector<std::unique_ptr<Chain>> chains;  ///< all loaded chains, since handshakes can still use old ones
};

struct Certificates::Chain {
    Chain() = default;
    ~Chain();
    Chain(const Chain&) = delete;
    Chain& operator=(const Chain&) = delete;

    std::vector<gnutls_pcert_st> certificates{};
    gnutls_privkey_t key = nullptr;
};

}  // namespace cimhost::server
