// lease-warranty-data: checks, restores, exports and imports the record files.

#include <CLI/CLI.hpp>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <iostream>
#include <stdexcept>
#include <string>
#include <vector>

#include "KO/PlatformUtilities.h"
#include "RecordDocument.h"
#include "durable/DirectoryLock.h"
#include "durable/Files.h"
#include "durable/RecordFile.h"

namespace data {

namespace {

enum ExitStatus {
    exitSuccess = 0,
    exitFailure = 1,  ///< a file is damaged, or cannot be read or written, or the document is refused
    exitUsage = 2,    ///< the command line is wrong
    exitInUse = 3     ///< another process uses the data directory, or it cannot be locked
};

/** Reports that the data directory cannot be locked. */
class InUse : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** The agent's data directory, locked during the lifetime of this object. */
class LockedDirectory {
public:
    LockedDirectory() {
        const durable::DirectoryLock::Result result = lock.acquire(path);
        if (result.state == durable::DirectoryLock::State::heldByOther) {
            throw InUse("The data directory " + path + " is in use by " + result.reason + ". End that process first.");
        }
        if (result.state != durable::DirectoryLock::State::acquired) {
            throw InUse("The data directory cannot be locked. " + result.reason);
        }
    }

    durable::RecordFile fileOf(const RecordClass& owner) const { return durable::recordFileIn(path, owner.fileName); }

private:
    const std::string path = KO::PlatformUtilities::getKelsaDataDir();
    durable::DirectoryLock lock;
};

/** Whether there is neither a file nor a saved copy: the class has no records. */
bool isUnused(const durable::RecordFile& file) {
    return !file.content() && !file.needsRecovery();
}

/** The content of a complete record file. */
std::string completeContentOf(const durable::RecordFile& file) {
    const std::string defect = file.defect();
    if (defect.empty()) {
        return *file.content();
    }
    throw std::runtime_error(defect + (file.needsRecovery() ? " The gate or the command restore will restore it."
                                                            : " There is no saved copy. Repair it."));
}

/** Prints the state of a record file. */
void checkFile(const RecordClass& owner, const durable::RecordFile& file) {
    if (isUnused(file)) {
        std::cout << owner.fileName << " does not exist, so there are no records.\n";
        return;
    }
    const Document document = documentOf(owner, completeContentOf(file));
    requireUnique(document);
    std::cout << owner.fileName << " is complete (records: " << document.at("records").size() << ").\n";
}

int check() {
    const LockedDirectory directory;
    int status = exitSuccess;
    for (const RecordClass& owner : recordClasses) {
        try {
            checkFile(owner, directory.fileOf(owner));
        } catch (const std::exception& error) {
            std::cout << error.what() << "\n";
            status = exitFailure;
        }
    }
    return status;
}

int restore(const RecordClass& owner) {
    const LockedDirectory directory;
    const durable::RecordFile file = directory.fileOf(owner);
    const bool hasFormer = !file.content().value_or(std::string()).empty();
    const std::string restored = file.restoreSaved();
    if (restored.empty()) {
        throw std::runtime_error(std::string(owner.fileName) + " has no complete saved copy. Nothing is changed.");
    }
    std::cout << owner.fileName << ": " << restored;
    if (hasFormer) {
        std::cout << " The former file is now " << owner.fileName << ".damaged.";
    }
    std::cout << "\n";
    return exitSuccess;
}

int exportRecords(const RecordClass& owner) {
    const LockedDirectory directory;
    const durable::RecordFile file = directory.fileOf(owner);
    const std::string content = isUnused(file) ? "0\n" : completeContentOf(file);
    std::cout << documentOf(owner, content).dump(2) << "\n";
    return exitSuccess;
}

Document parse(const std::string& path) {
    const auto text = durable::readFile(path);
    if (!text) {
        throw std::runtime_error(path + ": " + std::strerror(ENOENT));
    }
    try {
        return Document::parse(*text);
    } catch (const Document::parse_error& error) {
        const std::string reason = error.what();
        throw std::runtime_error(path + " is not JSON: " + reason.substr(reason.find("] ") + 2));
    }
}

int importRecords(const std::string& path) {
    const Document document = parse(path);
    const bool hasClass = document.contains("class") && document.at("class").is_string();
    const RecordClass& owner = recordClassOf(hasClass ? document.at("class").get<std::string>() : "");
    const std::string content = contentOf(owner, document);
    const LockedDirectory directory;
    const durable::RecordFile file = directory.fileOf(owner);
    if (!file.isComplete(content)) {
        throw ConversionError("A value contains a null character, which cannot be stored.");
    }
    const std::string recovered = file.recover();
    std::cout << recovered << (recovered.empty() ? "" : "\n");
    file.replace(content);
    std::cout << owner.fileName << " was replaced (records: " << document.at("records").size() << ").\n";
    return exitSuccess;
}

/** Runs a command, and reports its failure. */
template <class Command>
int run(Command command) {
    int status = exitFailure;
    std::string reason;
    try {
        status = command();
        std::cout.flush();
        if (std::cout) {
            return status;
        }
        reason = std::string("The output cannot be written: ") + std::strerror(errno) + ".";
    } catch (const InUse& error) {
        status = exitInUse;
        reason = error.what();
    } catch (const std::exception& error) {
        reason = error.what();
    }
    std::cerr << "lease-warranty-data: " << reason << "\n";
    return status == exitSuccess ? exitFailure : status;
}

/** Adds a command with a class as its argument, and returns the command. */
CLI::App* addClassCommand(CLI::App& app, const char* name, const char* description, std::string& className) {
    CLI::App* command = app.add_subcommand(name, description);
    std::vector<std::string> names;
    names.reserve(recordClasses.size());
    for (const RecordClass& each : recordClasses) {
        names.emplace_back(each.name);
    }
    command->add_option("CLASS", className, "VELKO_Lease or VELKO_Warranty")
        ->required()
        ->check(CLI::IsMember(names).description(""));
    return command;
}

int main(int count, const char* const* values) {
    CLI::App app("Checks, restores, exports and imports the files of leases and warranties.", "lease-warranty-data");
    app.footer("Exit status: 0 success, 1 failure or damage, 2 wrong command line, 3 the data directory is in use.");
    app.set_version_flag("--version", "lease-warranty-data " LAW_VERSION);
    app.require_subcommand(1);
    std::string argument;
    const CLI::App* checking = app.add_subcommand("check", "Report whether the files are complete and what they lose");
    const CLI::App* restoring = addClassCommand(app, "restore", "Replace a file by its saved copy", argument);
    const CLI::App* exporting = addClassCommand(app, "export", "Write the records of a class as JSON", argument);
    CLI::App* importing = app.add_subcommand("import", "Replace the records of a class by those of a JSON document");
    importing->add_option("FILE", argument, "The document that export wrote")->required();
    try {
        app.parse(count, values);
    } catch (const CLI::ParseError& error) {
        return app.exit(error) == 0 ? exitSuccess : exitUsage;
    }
    return run([&] {
        return checking->parsed()    ? check()
               : restoring->parsed() ? restore(recordClassOf(argument))
               : exporting->parsed() ? exportRecords(recordClassOf(argument))
                                     : importRecords(argument);
    });
}

}  // namespace

}  // namespace data

int main(int count, char** values) {
    return data::main(count, values);
}
