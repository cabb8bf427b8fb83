#include "schema/Registration.h"

#include <algorithm>
#include <sstream>
#include <string>
#include <vector>

#include "Target.h"
#include "cim/Names.h"
#include "schema/Errors.h"

// Registration files: an input is rejected with a LoadError, or its registrations are the same after they are written
// and read.

namespace {

using cimhost::ProviderRegistration;
using fuzz::require;
using fuzz::requireSame;
using Registrations = std::vector<ProviderRegistration>;

std::string lineIfAny(const char* keyword, const std::string& value) {
    return value.empty() ? std::string() : std::string("  ") + keyword + ": " + value + "\n";
}

std::string written(const ProviderRegistration& registration) {
    std::string types = registration.instance ? " instance" : "";
    types += registration.association ? " association" : "";
    std::string section = "[" + registration.className + "]\n";
    section += lineIfAny("provider", registration.provider) + lineIfAny("location", registration.location);
    section += lineIfAny("type", types);
    for (const std::string& nameSpace : registration.nameSpaces) {
        section += lineIfAny("namespace", nameSpace);
    }
    return section + lineIfAny("group", registration.group) + lineIfAny("unload", registration.unload);
}

std::string written(const Registrations& registrations) {
    std::string file;
    for (const ProviderRegistration& registration : registrations) {
        file += written(registration);
    }
    return file;
}

Registrations read(const std::string& file) {
    std::istringstream stream(file);
    return cimhost::readRegistrations(stream, "input");
}

void requireComplete(const ProviderRegistration& registration) {
    require(cim::isName(registration.className), "a class has a name");
    require(!registration.provider.empty() && !registration.location.empty(), "a class has a provider");
    require(!registration.nameSpaces.empty(), "a class has a namespace");
    require(registration.source.rfind("input:", 0) == 0, "a registration has its position");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string file(fuzz::inputOf(data, size));
    Registrations registrations;
    try {
        registrations = read(file);
    } catch (const cimhost::LoadError& error) {
        require(std::string(error.what()).rfind("input:", 0) == 0, "an error begins with its position");
        return 0;
    }
    std::for_each(registrations.begin(), registrations.end(), requireComplete);
    const auto brackets = static_cast<std::size_t>(std::count(file.begin(), file.end(), '['));
    require(registrations.size() <= brackets, "each registration has a section head");
    const std::string first = written(registrations);
    requireSame(written(read(first)), first, "registrations that were written and read");
    return 0;
}
