#pragma once

#include <array>
#include <chrono>
#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "lab/load/Checks.h"
#include "lab/load/Mix.h"

namespace cimhost::lab {

/** A wrong response. */
struct WrongResponse {
    std::optional<unsigned> client{};  ///< from 1; none for the checks at the end
    std::size_t number = 0;            ///< of the client's request, from 1
    std::string request{};             ///< operation and path
    Mismatch mismatch{};
};

/** Times and wrong responses of one client or of all. */
class Statistics {
public:
    using Time = std::chrono::nanoseconds;

    /** @param itsShown number of wrong responses to store */
    explicit Statistics(std::size_t itsShown) : shown(itsShown) {}

    void count(OperationKind kind, Time time, bool isWrong);
    void note(WrongResponse response);
    void add(const Statistics& other);

    const std::vector<Time>& times(OperationKind kind) const { return of(kind).times; }
    std::size_t wrongOf(OperationKind kind) const { return of(kind).wrong; }
    const std::map<std::string, std::size_t>& kinds() const { return wrongByKind; }
    std::size_t wrong() const;

    /** The first wrong responses, ordered by number, then by client. */
    std::vector<WrongResponse> first() const;

private:
    struct OfKind {
        std::vector<Time> times{};
        std::size_t wrong = 0;
    };

    const OfKind& of(OperationKind kind) const { return operations[static_cast<std::size_t>(kind)]; }

    std::size_t shown;
    std::array<OfKind, operationKindCount> operations{};
    std::map<std::string, std::size_t> wrongByKind{};
    std::vector<WrongResponse> responses{};
};

/** Figures of one kind of requests, or of all. */
struct Figures {
    std::string name{};
    std::size_t requests = 0;
    std::size_t wrong = 0;
    double perSecond = 0;
    double p50 = 0;  ///< microseconds, like the following
    double p95 = 0;
    double p99 = 0;
    double max = 0;
};

/** The result of a load. */
struct Report {
    std::string manager{};
    unsigned clients = 0;
    std::uint64_t seed = 0;
    double seconds = 0;
    Figures all{};
    std::vector<Figures> operations{};  ///< of the kinds that were sent
    std::size_t wrong = 0;              ///< including those of the checks at the end
    std::map<std::string, std::size_t> kinds{};
    std::vector<WrongResponse> first{};
};

/** Returns a percentile of the times; 0 if there are none. @param share from 0 to 1 */
double percentile(const std::vector<Statistics::Time>& sorted, double share);

/** Calculates the figures of a report. */
Report reportOf(const Statistics& statistics, double seconds);

}  // namespace cimhost::lab
