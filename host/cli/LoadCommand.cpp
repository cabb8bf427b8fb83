#include "cli/LoadCommand.h"

#include <limits>

#include "cli/ExitStatus.h"
#include "cli/LoadOutput.h"
#include "load/Load.h"
#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

constexpr auto usualMixWithAssociations = "create=20,modify=25,delete=15,enumerate=5,get=35,associate=5";

load::Mix mixOf(const LoadArguments& arguments) {
    if (!arguments.mix.empty()) {
        return load::Mix(arguments.mix);
    }
    return arguments.source.empty() ? load::Mix() : load::Mix(usualMixWithAssociations);
}

std::size_t shownOf(const Arguments& arguments) {
    const std::string& given = arguments.load.shown;
    const bool isAll = given == "all" || (given.empty() && arguments.format == Format::json);
    return isAll ? std::numeric_limits<std::size_t>::max() : std::stoul(given.empty() ? "10" : given);
}

load::Plan planOf(const Arguments& arguments, const Schema& schema) {
    const LoadArguments& given = arguments.load;
    load::Plan plan;
    for (const std::string& text : given.classes) {
        const ObjectPath path = parseObjectPath(text, schema, arguments.nameSpace);
        if (!path.keys.empty()) {
            throw UsageError(text + " names an instance; name a class");
        }
        plan.classes.push_back(load::loadClass(schema, path));
    }
    if (!given.source.empty()) {
        plan.source = parseObjectPath(given.source, schema, arguments.nameSpace);
    }
    plan.associationClass = given.associationClass;
    plan.clients = given.clients;
    plan.requests = given.requests;
    plan.seed = given.seed;
    plan.mix = mixOf(given);
    plan.fills = given.fills;
    plan.keeps = given.keeps;
    plan.listsChanges = arguments.manager != Manager::sfcb;
    plan.probes = !given.isTrusting;
    plan.shown = shownOf(arguments);
    return plan;
}

std::string complaintOf(const load::Report& report) {
    return report.wrong == 0
               ? ""
               : std::to_string(report.wrong) + (report.wrong == 1 ? " answer was wrong" : " answers were wrong");
}

}  // namespace

Outcome runLoadCommand(ObjectManager& manager, const Arguments& arguments, const Schema& schema) {
    try {
        const Answer<load::Report> report = runLoad(manager, planOf(arguments, schema));
        if (!report.ok()) {
            return {"", report.status, ""};
        }
        return {
            arguments.format == Format::json ? json::format(report.value) : text::format(report.value, arguments.style),
            {},
            complaintOf(report.value)};
    } catch (const load::PlanError& error) {
        throw UsageError(error.what());
    }
}

}  // namespace cimhost
