#include "server/Certificates.h"

#include <array>
#include <fstream>
#include <iterator>
#include <string>

#include "server/Settings.h"

namespace cimhost::server {
namespace {

std::string contentOf(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    std::string content{std::istreambuf_iterator<char>(stream), {}};
    if (!stream || content.empty()) {
        throw SettingsError(file.string() + ": this file cannot be read");
    }
    return content;
}

void check(int result, const std::filesystem::path& file) {
    if (result < 0) {
        throw SettingsError(file.string() + ": " + gnutls_strerror(result));
    }
}

gnutls_datum_t datum(std::string& content) {
    return {reinterpret_cast<unsigned char*>(content.data()), static_cast<unsigned>(content.size())};
}

/** Whether the key belongs to the certificate. */
bool fit(gnutls_pcert_st& certificate, gnutls_privkey_t key) {
    gnutls_pubkey_t ofKey = nullptr;
    gnutls_pubkey_init(&ofKey);
    std::array<unsigned char, 64> left{};
    std::array<unsigned char, 64> right{};
    std::size_t leftSize = left.size();
    std::size_t rightSize = right.size();
    const bool same = gnutls_pubkey_import_privkey(ofKey, key, 0, 0) == 0 &&
                      gnutls_pubkey_get_key_id(ofKey, 0, left.data(), &leftSize) == 0 &&
                      gnutls_pubkey_get_key_id(certificate.pubkey, 0, right.data(), &rightSize) == 0 &&
                      leftSize == rightSize && left == right;
    gnutls_pubkey_deinit(ofKey);
    return same;
}

std::unique_ptr<Certificates::Chain> load(const std::filesystem::path& certificate, const std::filesystem::path& key) {
    constexpr unsigned longest = 16;
    auto chain = std::make_unique<Certificates::Chain>();
    std::string pem = contentOf(certificate);
    gnutls_datum_t data = datum(pem);
    unsigned count = longest;
    chain->certificates.resize(longest);
    const int imported =
        gnutls_pcert_list_import_x509_raw(chain->certificates.data(), &count, &data, GNUTLS_X509_FMT_PEM, 0);
    chain->certificates.resize(imported < 0 ? 0 : count);
    check(imported, certificate);
    std::string keyPem = contentOf(key);
    data = datum(keyPem);
    check(gnutls_privkey_init(&chain->key), key);
    check(gnutls_privkey_import_x509_raw(chain->key, &data, GNUTLS_X509_FMT_PEM, nullptr, 0), key);
    if (!fit(chain->certificates.front(), chain->key)) {
        throw SettingsError(key.string() + ": this is not the key of " + certificate.string());
    }
    return chain;
}

}  // namespace

Certificates::Chain::~Chain() {
    for (gnutls_pcert_st& each : certificates) {
        gnutls_pcert_deinit(&each);
    }
    if (key != nullptr) {
        gnutls_privkey_deinit(key);
    }
}

Certificates::Certificates(const std::filesystem::path& itsCertificate, const std::filesystem::path& itsKey)
    : certificate(itsCertificate), key(itsKey) {
    reload();
}

Certificates::~Certificates() = default;

void Certificates::reload() {
    chains.push_back(load(certificate, key));
    active = chains.back().get();
}

}  // namespace cimhost::server
