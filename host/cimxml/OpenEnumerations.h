#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <utility>

#include "cimxml/ObjectWriter.h"
#include "model/Response.h"

namespace cimhost::cimxml {

/** Results of an operation, with the position up to which the client has read them. */
struct ResultCursor {
    Response results{};
    ObjectForm form = ObjectForm::instance;
    InstanceParts parts{};
    std::size_t next = 0;

    bool holdsPaths() const { return form >= ObjectForm::instanceName; }
    std::size_t size() const { return holdsPaths() ? results.paths.size() : results.instances.size(); }
    std::size_t left() const { return size() - next; }

    /** Appends the next result and frees it, so that results that the client has read use no memory. */
    void append(std::string& xml, const ObjectWriter& writer) {
        if (holdsPaths()) {
            const ObjectPath path = std::move(results.paths[next]);
            writer.append(xml, path, form);
        } else {
            const Instance instance = std::move(results.instances[next]);
            writer.append(xml, instance, form, parts);
        }
        ++next;
    }
};

/** An enumeration that a client has opened and can continue to pull. */
struct OpenEnumeration {
    ResultCursor cursor{};
    std::string nameSpace{};
    std::string principal{};  ///< only this user may continue
    std::chrono::seconds timeout{};
};

struct EnumerationLimits {
    std::size_t open = 100;            ///< largest number of open enumerations; each user can have half of them
    std::size_t results = 200'000;     ///< largest number of unread results of all open enumerations
    std::chrono::seconds timeout{60};  ///< if the client requests none
    std::chrono::seconds longestTimeout{600};
    std::uint32_t mostObjects = 10'000;  ///< per open or pull operation
};

/** The open enumerations of all clients. Safe to use from several threads. */
class OpenEnumerations {
public:
    using Clock = std::chrono::steady_clock;

    explicit OpenEnumerations(const EnumerationLimits& itsLimits) : limits(itsLimits) {}

    /**
     * Keeps an enumeration until it is taken, or until the timeout that startTimeout() starts has passed.
     * @param identifier the previous identifier of the enumeration; empty for a new one
     * @return its identifier; none if too many enumerations are open, or they have too many results
     */
    std::optional<std::string> keep(OpenEnumeration enumeration, std::string identifier, Clock::time_point now);

    /** Starts the timeout of an enumeration. Call when a response with a part of its results was sent or has failed. */
    void startTimeout(const std::string& identifier, Clock::time_point now);

    /** Removes and returns an enumeration; none if the client has no open enumeration with that identifier. */
    std::optional<OpenEnumeration> take(const std::string& identifier, const std::string& nameSpace,
                                        const std::string& principal, Clock::time_point now);

    /** Frees the results of enumerations whose timeout has passed. */
    void removeExpired(Clock::time_point now);

    std::size_t size() const;

private:
    struct Entry {
        OpenEnumeration enumeration;
        Clock::time_point expires = Clock::time_point::max();
    };

    void erase(Clock::time_point now);
    bool hasRoomFor(const OpenEnumeration& added) const;

    EnumerationLimits limits;
    mutable std::mutex mutex;
    std::map<std::string, Entry> entries;
};

}  // namespace cimhost::cimxml
