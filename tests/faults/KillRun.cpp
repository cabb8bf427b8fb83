// Kills processes that create, modify and delete, and tells what is left of their files.
//
// Usage: kill_run [--counted] KILLS [SEED]
//   --counted  not at random moments, but after so many operations on files as the seed says: repeats exactly
//
// Ends with status 1 when a promise was broken: asset data are always whole, and those of the last modification that
// was answered or of the one under way; and the next process serves.

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
constexpr int longestLife = 20000;    ///< microseconds after the first answer
constexpr int mostOperations = 4000;  ///< on files, of a process whose operations are counted

/** The text that a step writes into two properties at once. */
std::string textOf(int step) {
    return "written by step " + std::to_string(step);
}

/** A step of the load: asset data, a lease, a new warranty or its deletion, in turn. */
Request stepOf(int step) {
    const auto with = [](const char* request, const std::string& identifier, std::vector<cimhost::NamedValue> values) {
        Request made = requestNamed(request);
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
                        {named("AssetNumber", text(textOf(step))), named("SystemLocation", text(textOf(step)))});
        case 1:
            return with("ModifyLease", "lease number " + number, {named("Lessor", text(textOf(step)))});
        case 2:
            return with("CreateWarranty", "warranty of step " + std::to_string(step), {});
        default:
            return with("DeleteWarranty", "warranty of step " + std::to_string(step - 1), {});
    }
}

/** What has been seen of a kind of files of records. */
struct Seen {
    int whole = 0;
    int empty = 0;
    int cutOff = 0;
    int recordsLost = 0;  ///< of all the files that are not whole, against those that had to be there

    void add(const std::string& content, int linesOfRecord) {
        const FileState state = stateOf(content, linesOfRecord);
        ++(state == FileState::whole ? whole : state == FileState::empty ? empty : cutOff);
        if (state != FileState::whole) {
            recordsLost += records - std::min(records, wholeRecordsIn(content, linesOfRecord));
        }
    }
};

class KillRun {
public:
    KillRun(bool countsOperations, unsigned int seed) : isCounted(countsOperations), random(seed) {}

    void killOnce() {
        FileContents files = scene.filesAtFirst();
        files[leaseFile] = leaseRecords(records);
        files[warrantyFile] = warrantyRecords(records);
        scene.restart(files);
        const int answered = answeredUntilKilled();
        const FileContents left = scene.files();
        leases.add(left.at(leaseFile), linesOfLease);
        warranties.add(left.at(warrantyFile), linesOfWarranty);
        temporaries += static_cast<int>(left.size()) - 3;
        lookAtAsset(left.at(assetFile), answered);
        for (const char* file : {leaseFile, warrantyFile, assetFile}) {
            require(scene.ask(repairOf(file)).outcome.rc == CMPI_RC_OK, "the next process does not serve");
        }
        ++kills;
    }

    bool report() const {
        std::cout << "kills                        " << kills << "\nsteps answered before them   " << steps
                  << "\nasset.dat whole              " << assetsWhole << "\ntemporary files left         "
                  << temporaries << '\n';
        tell("Lease.dat", leases);
        tell("Warranty.dat", warranties);
        std::cout << "promises broken              " << broken << '\n';
        return broken == 0;
    }

private:
    int upTo(int most) { return std::uniform_int_distribution<int>(0, most)(random); }

    /** The load, which tells each step that was answered. Kills itself after some operations, if there are any. */
    void work(int told, int operations) {
        for (int step = 0;; ++step) {
            const Fault killed{anyOnFiles, operations, false, 0, [] { std::raise(SIGKILL); }};
            const Done done = scene.ask(stepOf(step), operations > 0 ? &killed : nullptr);
            for (const auto& each : onFiles(done.counts)) {
                operations -= each.second;
            }
            if (write(told, &step, sizeof step) != sizeof step) {
                throw std::runtime_error("nobody listens");
            }
        }
    }

    /** Runs the load in a process of its own until it is killed; the last step that was answered, -1 without one. */
    int answeredUntilKilled() {
        int pipe[2];
        if (::pipe(pipe) != 0) {
            throw std::runtime_error("no pipe");
        }
        const int operations = isCounted ? 1 + upTo(mostOperations) : 0;
        const pid_t child = startProcess([&] { work(pipe[1], operations); });
        close(pipe[1]);
        int last = -1;
        int step = 0;
        if (!isCounted && read(pipe[0], &step, sizeof step) == sizeof step) {
            last = step;
            std::this_thread::sleep_for(std::chrono::microseconds(upTo(longestLife)));
            kill(child, SIGKILL);
        }
        require(waitForEnd(child), "the load came to an end");
        while (read(pipe[0], &step, sizeof step) == sizeof step) {
            last = step;
        }
        close(pipe[0]);
        steps += last + 1;
        return last;
    }

    /** The modifications whose content asset.dat may have: the last one answered, and the step under way, if it is one.
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

    void lookAtAsset(const std::string& content, int answered) {
        bool found = answered < 0 && content == scene.filesAtFirst().at(assetFile);
        for (const int step : possibleModifications(answered)) {
            const std::string value = textOf(step) + "\n";
            found = found || (content.find("USER.AssetNumber=" + value) != std::string::npos &&
                              content.find("USER.Location=" + value) != std::string::npos);
        }
        require(found && std::count(content.begin(), content.end(), '\n') == 21,
                "asset.dat is none that it may be after step " + std::to_string(answered));
        assetsWhole += found ? 1 : 0;
    }

    void require(bool kept, const std::string& what) {
        if (!kept) {
            ++broken;
            std::cout << "kill " << kills + 1 << ": " << what << '\n';
        }
    }

    static void tell(const char* file, const Seen& seen) {
        std::cout << file << ": whole " << seen.whole << ", empty " << seen.empty << ", cut off " << seen.cutOff
                  << "; records lost in these " << seen.recordsLost << " of " << (seen.empty + seen.cutOff) * records
                  << '\n';
    }

    Scene scene;
    bool isCounted;
    std::mt19937 random;
    Seen leases;
    Seen warranties;
    int kills = 0;
    int steps = 0;
    int assetsWhole = 0;
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
