// Kills processes that create, modify and delete records, and reports the state of their files.
//
// Usage: kill_run [--counted] KILLS [SEED]
//   --counted  kills after a number of file operations that depends on the seed instead of at a random time, so that
//              the run is reproducible
//
// Exits with status 1 if asset.dat is incomplete, if it is neither that of the last successful modification nor of the
// current one, or if the next process fails.

#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <iostream>
#include <random>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "Killing.h"
#include "support/Values.h"

namespace faults {
namespace {

using testsupport::named;
using testsupport::text;
using testsupport::uint32;

constexpr int records = 10;
constexpr int maximumDelay = 20000;          ///< microseconds after the first response
constexpr int maximumOperationCount = 4000;  ///< file operations of a process whose operations are counted

/** Returns the value that a step writes to two properties. */
std::string valueOf(int step) {
    return "written by step " + std::to_string(step);
}

/** Returns a step of the load. In turn, the steps modify asset data or a lease, create a warranty, and delete it. */
RequestCase stepOf(int step) {
    const auto with = [](const char* request, const std::string& identifier, std::vector<cimhost::NamedValue> values) {
        RequestCase made = requestNamed(request);
        if (!identifier.empty()) {
            made.path =
                testsupport::objectPath("root/cimv2", made.path.className, {named("InstanceID", text(identifier))});
        }
        made.instance = testsupport::instance(made.path, std::move(values));
        return made;
    };
    const std::string number = std::to_string(3 + step / 4 % (records - 2));
    switch (step % 4) {
        case 0:
            return with("ModifyAsset", "",
                        {named("AssetNumber", text(valueOf(step))), named("SystemLocation", text(valueOf(step)))});
        case 1:
            return with("ModifyLease", "lease number " + number, {named("Lessor", text(valueOf(step)))});
        case 2:
            return with("CreateWarranty", "warranty of step " + std::to_string(step), {});
        default:
            return with("DeleteWarranty", "warranty of step " + std::to_string(step - 1), {});
    }
}

/** States of the record files of a class after kills. */
struct FileStatistics {
    int complete = 0;
    int empty = 0;
    int truncated = 0;
    int recordsLost = 0;  ///< in incomplete files

    void add(const std::string& content, int linesOfRecord) {
        const FileState state = stateOf(content, linesOfRecord);
        ++(state == FileState::complete ? complete : state == FileState::empty ? empty : truncated);
        if (state != FileState::complete) {
            recordsLost += records - std::min(records, completeRecordsIn(content, linesOfRecord));
        }
    }
};

class KillRun {
public:
    KillRun(bool countsOperations, unsigned int seed) : isCounted(countsOperations), random(seed) {}

    void killOnce() {
        FileContents files = environment.filesAtFirst();
        files[leaseFile] = leaseRecords(records);
        files[warrantyFile] = warrantyRecords(records);
        environment.restart(files);
        const int answered = answeredUntilKilled();
        const FileContents left = environment.files();
        leases.add(left.at(leaseFile), linesOfLease);
        warranties.add(left.at(warrantyFile), linesOfWarranty);
        temporaries += static_cast<int>(left.size()) - 3;
        checkAsset(left.at(assetFile), answered);
        for (const char* file : {leaseFile, warrantyFile, assetFile}) {
            require(environment.ask(repairOf(file)).outcome.rc == CMPI_RC_OK, "the next process fails");
        }
        ++kills;
    }

    bool report() const {
        std::cout << "kills                        " << kills << "\nsteps completed before them  " << steps
                  << "\nasset.dat complete           " << assetsComplete << "\ntemporary files left         "
                  << temporaries << '\n';
        print("Lease.dat", leases);
        print("Warranty.dat", warranties);
        std::cout << "errors                       " << broken << '\n';
        return broken == 0;
    }

private:
    int upTo(int most) { return std::uniform_int_distribution<int>(0, most)(random); }

    /**
     * Runs the load and writes the number of each completed step to the pipe. Kills itself after `operations` file
     * operations, unless 0.
     */
    void work(int output, int operations) {
        for (int step = 0;; ++step) {
            const Fault killed{anyOnFiles, operations, false, 0, [] { std::raise(SIGKILL); }};
            const ObservedResponse response = environment.ask(stepOf(step), operations > 0 ? &killed : nullptr);
            for (const auto& each : onFiles(response.counts)) {
                operations -= each.second;
            }
            if (write(output, &step, sizeof step) != sizeof step) {
                throw std::runtime_error("the pipe has no reader");
            }
        }
    }

    /** Runs the load in a child process until it is killed. Returns the last completed step, or -1. */
    int answeredUntilKilled() {
        int pipe[2];
        if (::pipe(pipe) != 0) {
            throw std::runtime_error("no pipe");
        }
        const int operations = isCounted ? 1 + upTo(maximumOperationCount) : 0;
        const pid_t child = startProcess([&] { work(pipe[1], operations); });
        close(pipe[1]);
        int last = -1;
        int step = 0;
        if (!isCounted && read(pipe[0], &step, sizeof step) == sizeof step) {
            last = step;
            std::this_thread::sleep_for(std::chrono::microseconds(upTo(maximumDelay)));
            kill(child, SIGKILL);
        }
        require(waitForEnd(child), "the load was not killed");
        while (read(pipe[0], &step, sizeof step) == sizeof step) {
            last = step;
        }
        close(pipe[0]);
        steps += last + 1;
        return last;
    }

    /**
     * Returns the modifications that asset.dat may contain: the last completed one and the current step, if it modifies
     * asset data.
     */
    static std::vector<int> possibleModifications(int answered) {
        std::vector<int> steps;
        for (const int step : {answered < 0 ? answered : answered - answered % 4, answered + 1}) {
            if (step >= 0 && step % 4 == 0) {
                steps.push_back(step);
            }
        }
        return steps;
    }

    void checkAsset(const std::string& content, int answered) {
        bool found = answered < 0 && content == environment.filesAtFirst().at(assetFile);
        for (const int step : possibleModifications(answered)) {
            const std::string value = valueOf(step) + "\n";
            found = found || (content.find("USER.AssetNumber=" + value) != std::string::npos &&
                              content.find("USER.Location=" + value) != std::string::npos);
        }
        require(found && std::count(content.begin(), content.end(), '\n') == 21,
                "unexpected content of asset.dat after step " + std::to_string(answered));
        assetsComplete += found ? 1 : 0;
    }

    void require(bool kept, const std::string& what) {
        if (!kept) {
            ++broken;
            std::cout << "kill " << kills + 1 << ": " << what << '\n';
        }
    }

    static void print(const char* file, const FileStatistics& files) {
        std::cout << file << ": complete " << files.complete << ", empty " << files.empty << ", truncated "
                  << files.truncated << "; records lost in these " << files.recordsLost << " of "
                  << (files.empty + files.truncated) * records << '\n';
    }

    TestEnvironment environment;
    bool isCounted;
    std::mt19937 random;
    FileStatistics leases;
    FileStatistics warranties;
    int kills = 0;
    int steps = 0;
    int assetsComplete = 0;
    int temporaries = 0;
    int broken = 0;
};

}  // namespace
}  // namespace faults

int main(int count, char** arguments) {
    std::vector<std::string> words(arguments + 1, arguments + count);
    const bool isCounted = !words.empty() && words.front() == "--counted";
    words.erase(words.begin(), words.begin() + (isCounted ? 1 : 0));
    const int kills = words.empty() ? 0 : std::atoi(words[0].c_str());
    if (kills < 1 || words.size() > 2) {
        std::cerr << "Usage: kill_run [--counted] KILLS [SEED]\n";
        return 2;
    }
    faults::KillRun run(isCounted, words.size() > 1 ? static_cast<unsigned int>(std::atoi(words[1].c_str())) : 1);
    for (int kill = 0; kill < kills; ++kill) {
        run.killOnce();
    }
    return run.report() ? 0 : 1;
}
