#pragma once

#include "AssociationFixture.h"
#include "ProviderFixture.h"

#include <functional>
#include <ostream>
#include <string>
#include <vector>

namespace contract {

class TranscriptTest;

/** One thing that clients do, of which the log is looked at. */
struct Scenario {
    std::string name;  ///< also of its golden file
    std::function<void(TranscriptTest&)> run;
    bool isRequest = true;  ///< whether everything logged belongs to requests that are dispatched by class
};

inline std::ostream& operator<<(std::ostream& stream, const Scenario& scenario) {
    return stream << scenario.name;
}

/** All of them: every operation of every class, failing ones too, and what is logged outside of requests. */
const std::vector<Scenario>& scenarios();

/** A provider whose log is looked at. */
class TranscriptTest : public ProviderTest {
public:
    /** Starts a scenario anew and gives what it logged, both channels, in order. */
    std::vector<LogRecord> transcriptOf(const Scenario& scenario);

    /** @name For scenarios */
    ///@{
    using ProviderTest::blockData;
    using ProviderTest::provider;
    using ProviderTest::unload;
    using ProviderTest::writeData;

    /** The scenario's preparations are over: loads the provider; what has been logged so far does not count. */
    testsupport::ProviderLibrary& begin();

    /** The computer systems that the object manager knows. */
    void knowComputers(const std::vector<std::string>& names);
    ///@}
};

}  // namespace contract
