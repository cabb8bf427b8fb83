#include "cimxml/OpenEnumerations.h"

#include <sys/random.h>

#include <array>
#include <cerrno>
#include <system_error>

#include "cim/Names.h"

namespace cimhost::cimxml {
namespace {

/** An identifier that other clients cannot guess. */
std::string randomIdentifier() {
    std::array<unsigned char, 16> bytes{};
    if (::getrandom(bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size())) {
        throw std::system_error(errno, std::generic_category(), "no random number is available");
    }
    constexpr auto digits = "0123456789abcdef";
    std::string identifier;
    for (const unsigned char byte : bytes) {
        identifier += digits[byte >> 4U];
        identifier += digits[byte & 0xFU];
    }
    return identifier;
}

}  // namespace

std::optional<std::string> OpenEnumerations::keep(OpenEnumeration enumeration, std::string identifier,
                                                  Clock::time_point now) {
    const std::lock_guard<std::mutex> lock(mutex);
    erase(now);
    if (identifier.empty()) {
        if (!hasRoomFor(enumeration)) {
            return std::nullopt;
        }
        identifier = randomIdentifier();
    }
    entries.insert_or_assign(identifier, Entry{std::move(enumeration)});
    return identifier;
}

void OpenEnumerations::startTimeout(const std::string& identifier, Clock::time_point now) {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto found = entries.find(identifier);
    if (found != entries.end()) {
        found->second.expires = now + found->second.enumeration.timeout;
    }
}

std::optional<OpenEnumeration> OpenEnumerations::take(const std::string& identifier, const std::string& nameSpace,
                                                      const std::string& principal, Clock::time_point now) {
    const std::lock_guard<std::mutex> lock(mutex);
    erase(now);
    const auto found = entries.find(identifier);
    if (found == entries.end() || !cim::sameName(found->second.enumeration.nameSpace, nameSpace) ||
        found->second.enumeration.principal != principal) {
        return std::nullopt;
    }
    OpenEnumeration enumeration = std::move(found->second.enumeration);
    entries.erase(found);
    return enumeration;
}

std::size_t OpenEnumerations::size() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return entries.size();
}

void OpenEnumerations::removeExpired(Clock::time_point now) {
    const std::lock_guard<std::mutex> lock(mutex);
    erase(now);
}

/** Erases expired enumerations. The caller holds the mutex. */
void OpenEnumerations::erase(Clock::time_point now) {
    for (auto each = entries.begin(); each != entries.end();) {
        each = each->second.expires <= now ? entries.erase(each) : std::next(each);
    }
}

/** Whether the limits permit a new enumeration. The caller holds the mutex. */
bool OpenEnumerations::hasRoomFor(const OpenEnumeration& added) const {
    std::size_t results = added.cursor.left();
    std::size_t ofSameUser = 0;
    for (const auto& [identifier, each] : entries) {
        results += each.enumeration.cursor.left();
        ofSameUser += each.enumeration.principal == added.principal ? 1 : 0;
    }
    const std::size_t mostOfOneUser = added.principal.empty() ? limits.open : (limits.open + 1) / 2;
    return entries.size() < limits.open && ofSameUser < mostOfOneUser && results <= limits.results;
}

}  // namespace cimhost::cimxml
