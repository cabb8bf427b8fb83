#include "lab/program/LoadReport.h"

#include <cstdio>
#include <nlohmann/json.hpp>

namespace cimhost {
namespace {

std::string rounded(double number, int digits) {
    char formatted[64];
    std::snprintf(formatted, sizeof formatted, "%.*f", digits, number);
    return formatted;
}

text::Row rowOf(const lab::Figures& figures) {
    return {figures.name,
            std::to_string(figures.requests),
            std::to_string(figures.wrong),
            rounded(figures.perSecond, 0),
            rounded(figures.p50, 1),
            rounded(figures.p95, 1),
            rounded(figures.p99, 1),
            rounded(figures.max, 1)};
}

std::string positionOf(const lab::WrongResponse& response) {
    const std::string client = response.client ? "client " + std::to_string(*response.client) : "at the end";
    return client + ", request " + std::to_string(response.number);
}

std::string formatWrong(const lab::Report& report) {
    if (report.wrong == 0) {
        return "no answer was wrong\n";
    }
    std::string text = "wrong answers: " + std::to_string(report.wrong);
    for (const auto& [kind, count] : report.kinds) {
        text += ", " + kind + " " + std::to_string(count);
    }
    text += "\n";
    for (const lab::WrongResponse& each : report.first) {
        text += "  " + each.mismatch.kind + ": " + positionOf(each) + ": " + each.request +
                "\n    expected: " + each.mismatch.expected + "\n    got: " + each.mismatch.got + "\n";
    }
    return text;
}

using Json = nlohmann::ordered_json;

Json figuresJson(const lab::Figures& figures) {
    return {{"operation", figures.name},
            {"requests", figures.requests},
            {"wrong", figures.wrong},
            {"perSecond", figures.perSecond},
            {"microseconds", {{"p50", figures.p50}, {"p95", figures.p95}, {"p99", figures.p99}, {"max", figures.max}}}};
}

Json wrongJson(const lab::WrongResponse& response) {
    return {{"kind", response.mismatch.kind},
            {"client", response.client ? Json(*response.client) : Json(nullptr)},
            {"number", response.number},
            {"request", response.request},
            {"expected", response.mismatch.expected},
            {"got", response.mismatch.got}};
}

}  // namespace

std::string text::format(const lab::Report& report, const Style& style) {
    std::vector<Row> rows{{"", "requests", "wrong", "per second", "p50 us", "p95 us", "p99 us", "max us"}};
    for (const lab::Figures& each : report.operations) {
        rows.push_back(rowOf(each));
    }
    rows.push_back(rowOf(report.all));
    return std::to_string(report.clients) + " clients, " + std::to_string(report.all.requests) + " requests, manager " +
           report.manager + ", seed " + std::to_string(report.seed) + ": " + rounded(report.seconds, 3) + " s\n\n" +
           aligned(rows, "", style, {Role::name}) + "\n" + formatWrong(report);
}

std::string json::format(const lab::Report& report) {
    Json operations = Json::array();
    for (const lab::Figures& each : report.operations) {
        operations.push_back(figuresJson(each));
    }
    Json first = Json::array();
    for (const lab::WrongResponse& each : report.first) {
        first.push_back(wrongJson(each));
    }
    const Json document = {{"manager", report.manager},
                           {"clients", report.clients},
                           {"seed", report.seed},
                           {"seconds", report.seconds},
                           {"all", figuresJson(report.all)},
                           {"operations", operations},
                           {"wrongAnswers", {{"count", report.wrong}, {"kinds", report.kinds}, {"first", first}}}};
    return document.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace cimhost
