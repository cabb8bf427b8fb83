#pragma once

#include <functional>
#include <ostream>
#include <string>
#include <vector>

#include "AssociationFixture.h"
#include "ProviderFixture.h"

namespace contract {

class TranscriptTest;

/** Actions whose log records are compared with a golden file. */
struct Scenario {
    std::string name;  ///< also the name of its golden file
    std::function<void(TranscriptTest&)> run;
    bool isRequest = true;  ///< whether all records belong to requests that are dispatched by class
};

inline std::ostream& operator<<(std::ostream& stream, const Scenario& scenario) {
    return stream << scenario.name;
}

/** Returns all scenarios: every operation of every class, including failures, and logging outside of requests. */
const std::vector<Scenario>& scenarios();

/** A provider whose log is recorded. */
class TranscriptTest : public ProviderTest {
public:
    /** Runs a scenario. Returns its log records of both channels, in order. */
    std::vector<LogRecord> transcriptOf(const Scenario& scenario);

    /** @name Functions of scenarios */
    ///@{
    using ProviderTest::blockData;
    using ProviderTest::provider;
    using ProviderTest::unload;
    using ProviderTest::writeData;

    /** Loads the provider after a scenario's preparations. Discards the records logged so far. */
    testsupport::ProviderLibrary& begin();

    /** Sets the computer systems of the object manager. */
    void setComputers(const std::vector<std::string>& names);
    ///@}
};

}  // namespace contract
