// Kills processes that create, modify and delete, at random moments, and tells what is left of their files.
//
// Usage: kill_run KILLS [SEED]
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
#include <thread>

#include "Killing.h"
#include "support/Values.h"

namespace faults {
namespace {

using testsupport::named;
using testsupport::text;
using testsupport::uint32;

constexpr int records = 10;
constexpr int longestLife = 20000;  ///< microseconds after the first answer

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
    const std::string number = std::to_string(2 + step / 4 % (records - 1));
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
    explicit KillRun(unsigned int seed) : random(seed) {}

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
    /** Runs the load in a process of its own until it is killed; the last step that was answered, -1 without one. */
    int answeredUntilKilled() {
        int pipe[2];
        if (::pipe(pipe) != 0) {
            throw std::runtime_error("no pipe");
        }
        const int life = std::uniform_int_distribution<int>(0, longestLife)(random);
        const pid_t child = fork();
        if (child == 0) {
            for (int step = 0;; ++step) {
                scene.ask(stepOf(step));
                if (write(pipe[1], &step, sizeof step) != sizeof step) {
                    _exit(1);
                }
            }
        }
        close(pipe[1]);
        int last = -1;
        int step = 0;
        if (read(pipe[0], &step, sizeof step) == sizeof step) {
            last = step;
            std::this_thread::sleep_for(std::chrono::microseconds(life));
        }
        kill(child, SIGKILL);
        waitForEnd(child);
        while (read(pipe[0], &step, sizeof step) == sizeof step) {
            last = step;
        }
        close(pipe[0]);
        steps += last + 1;
        return last;
    }

    void lookAtAsset(const std::string& content, int answered) {
        const int latest = answered - answered % 4;
        bool found = false;
        for (const int step : {latest, latest + 4}) {
            const std::string value = textOf(step) + "\n";
            found = found || (content.find("USER.AssetNumber=" + value) != std::string::npos &&
                              content.find("USER.Location=" + value) != std::string::npos);
        }
        require(found && std::count(content.begin(), content.end(), '\n') == 21,
                "asset.dat is neither that of step " + std::to_string(latest) + " nor that of the next");
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
    const int kills = count > 1 ? std::atoi(arguments[1]) : 0;
    if (kills < 1 || count > 3) {
        std::cerr << "Usage: kill_run KILLS [SEED]\n";
        return 2;
    }
    faults::KillRun run(count > 2 ? static_cast<unsigned int>(std::atoi(arguments[2])) : 1);
    for (int kill = 0; kill < kills; ++kill) {
        run.killOnce();
    }
    return run.report() ? 0 : 1;
}
