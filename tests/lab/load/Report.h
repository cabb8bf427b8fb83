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

/** An answer that was wrong. */
struct WrongAnswer {
    std::optional<unsigned> client{};  ///< from 1; none for what was asked at the end
    std::size_t number = 0;            ///< of the client's request, from 1
    std::string request{};             ///< operation and path
    Mismatch wrong{};
};

/** What was done and found, by one client or by all. */
class Statistics {
public:
    using Time = std::chrono::nanoseconds;

    /** @param itsShown how many wrong answers are kept in words */
    explicit Statistics(std::size_t itsShown) : shown(itsShown) {}

    void count(OperationKind kind, Time time, bool isWrong);
    void note(WrongAnswer answer);
    void add(const Statistics& other);

    const std::vector<Time>& times(OperationKind kind) const { return of(kind).times; }
    std::size_t wrongOf(OperationKind kind) const { return of(kind).wrong; }
    const std::map<std::string, std::size_t>& kinds() const { return wrongByKind; }
    std::size_t wrong() const;

    /** The first wrong answers, by number, then by client. */
    std::vector<WrongAnswer> first() const;

private:
    struct OfKind {
        std::vector<Time> times{};
        std::size_t wrong = 0;
    };

    const OfKind& of(OperationKind kind) const { return operations[static_cast<std::size_t>(kind)]; }

    std::size_t shown;
    std::array<OfKind, operationKindCount> operations{};
    std::map<std::string, std::size_t> wrongByKind{};
    std::vector<WrongAnswer> answers{};
};

/** Figures of one kind of request, or of all. */
struct Figures {
    std::string name{};
    std::size_t requests = 0;
    std::size_t wrong = 0;
    double perSecond = 0;
    double p50 = 0;  ///< microseconds, as those below
    double p95 = 0;
    double p99 = 0;
    double max = 0;
};

/** What a load has to tell. */
struct Report {
    std::string manager{};
    unsigned clients = 0;
    std::uint64_t seed = 0;
    double seconds = 0;
    Figures all{};
    std::vector<Figures> operations{};  ///< those that were done
    std::size_t wrong = 0;              ///< also those found at the end, which are no requests of a client
    std::map<std::string, std::size_t> kinds{};
    std::vector<WrongAnswer> first{};
};

/** The value below which that share of the times lies, 0 to 1; 0 without any. */
double percentile(const std::vector<Statistics::Time>& sorted, double share);

/** The report's figures out of the statistics. */
Report reportOf(const Statistics& statistics, double seconds);

}  // namespace cimhost::lab
