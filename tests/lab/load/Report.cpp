#include "lab/load/Report.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <tuple>

namespace cimhost::lab {
namespace {

Figures figuresOf(std::string name, std::vector<Statistics::Time> times, std::size_t wrong, double seconds) {
    std::sort(times.begin(), times.end());
    return {std::move(name),
            times.size(),
            wrong,
            seconds > 0 ? static_cast<double>(times.size()) / seconds : 0,
            percentile(times, 0.5),
            percentile(times, 0.95),
            percentile(times, 0.99),
            percentile(times, 1)};
}

}  // namespace

void Statistics::count(OperationKind kind, Time time, bool isWrong) {
    OfKind& target = operations[static_cast<std::size_t>(kind)];
    target.times.push_back(time);
    target.wrong += isWrong ? 1 : 0;
}

void Statistics::note(WrongResponse response) {
    ++wrongByKind[response.mismatch.kind];
    if (responses.size() < shown) {
        responses.push_back(std::move(response));
    }
}

void Statistics::add(const Statistics& other) {
    for (std::size_t i = 0; i < operationKindCount; ++i) {
        operations[i].times.insert(operations[i].times.end(), other.operations[i].times.begin(),
                                   other.operations[i].times.end());
        operations[i].wrong += other.operations[i].wrong;
    }
    for (const auto& [kind, count] : other.wrongByKind) {
        wrongByKind[kind] += count;
    }
    responses.insert(responses.end(), other.responses.begin(), other.responses.end());
}

std::size_t Statistics::wrong() const {
    return std::accumulate(wrongByKind.begin(), wrongByKind.end(), std::size_t{0},
                           [](std::size_t sum, const auto& each) { return sum + each.second; });
}

std::vector<WrongResponse> Statistics::first() const {
    std::vector<WrongResponse> sorted = responses;
    std::stable_sort(sorted.begin(), sorted.end(), [](const WrongResponse& left, const WrongResponse& right) {
        return std::tuple(!left.client, left.number, left.client) <
               std::tuple(!right.client, right.number, right.client);
    });
    sorted.resize(std::min(sorted.size(), shown));
    return sorted;
}

double percentile(const std::vector<Statistics::Time>& sorted, double share) {
    if (sorted.empty()) {
        return 0;
    }
    const double rank = std::ceil(share * static_cast<double>(sorted.size()));
    const auto index = static_cast<std::size_t>(std::max(rank, 1.0)) - 1;
    return std::chrono::duration<double, std::micro>(sorted[std::min(index, sorted.size() - 1)]).count();
}

Report reportOf(const Statistics& statistics, double seconds) {
    Report report;
    report.seconds = seconds;
    std::vector<Statistics::Time> all;
    std::size_t wrong = 0;
    for (std::size_t i = 0; i < operationKindCount; ++i) {
        const auto kind = static_cast<OperationKind>(i);
        const std::vector<Statistics::Time>& times = statistics.times(kind);
        if (!times.empty()) {
            report.operations.push_back(figuresOf(nameOf(kind), times, statistics.wrongOf(kind), seconds));
        }
        all.insert(all.end(), times.begin(), times.end());
        wrong += statistics.wrongOf(kind);
    }
    report.all = figuresOf("all", std::move(all), wrong, seconds);
    report.wrong = statistics.wrong();
    report.kinds = statistics.kinds();
    report.first = statistics.first();
    return report;
}

}  // namespace cimhost::lab
