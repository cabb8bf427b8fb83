#pragma once

#include <cmpift.h>

#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>

#include "broker/Arena.h"
#include "broker/ClassShape.h"
#include "broker/FunctionTables.h"
#include "broker/MemoryBlocks.h"
#include "broker/Profile.h"
#include "broker/UpCalls.h"

namespace cimhost {

/** A line that a provider gives the broker to log or to trace. */
struct LogRecord {
    bool isTrace = false;
    int level = 0;            ///< a CMPISeverity, or a CMPILevel of a trace
    std::string component{};  ///< id of the message or name of the component; may be empty
    std::string text{};
};

/** What a broker works with. */
struct BrokerOptions {
    ClassShapeLookup classShape{};                ///< none: no class is known
    UpCalls* upCalls = nullptr;                   ///< not owned; null: no up-call is supported
    std::function<void(const LogRecord&)> log{};  ///< none: log and trace records are dropped; may be called on
                                                  ///< several threads at a time
    const FunctionTables* tables = nullptr;       ///< not owned, gaps and all; null: those of the manager
    Manager manager = Manager::standard;          ///< the object manager that it is the broker of
};

/**
 * A CMPI broker: what providers see of the object manager.
 *
 * Objects that a provider makes belong to the innermost request of this broker on the provider's thread
 * (RequestScope), or to the attached thread; clones, and objects made outside of both, live as long as the broker. It
 * must outlive every provider that has its handle and every request. Safe to use from several threads.
 */
class Broker {
public:
    explicit Broker(BrokerOptions itsOptions = {});
    ~Broker();
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    /** The broker as providers see it; belongs to this object. */
    const CMPIBroker* handle() const { return &brokerHandle; }

    /** The broker behind a handle. Failure with CMPI_RC_ERR_INVALID_HANDLE if it is none. */
    static Broker& of(const CMPIBroker* handle);

    const FunctionTables& tables() const { return *options.tables; }
    UpCalls& upCalls() const { return *options.upCalls; }

    /** How its object manager treats providers. */
    const Profile& profile() const { return profileOf(options.manager); }

    /** Is the broker of that manager from now on, its tables apart. Not while requests run. */
    void play(Manager manager) { options.manager = manager; }

    /** Shape of a class, or null when it is not known. */
    std::shared_ptr<const ClassShape> classShape(const std::string& className) const;

    /** Whether the class is the other one or is known to descend from it. */
    bool isA(const std::string& className, const std::string& ancestor) const;

    void log(const LogRecord& record) const;

    /** Where objects made now on this thread go. */
    Arena& arena();

    /** What is not any request's: clones, and objects made outside of requests. */
    Arena& lasting() { return outside; }

    /** The innermost arena of this thread, of whatever broker; null outside of requests. */
    static Arena* arenaOfThread();

    /** Memory for providers. */
    MemoryBlocks& memory() { return blocks; }

    /** @name Arenas of this thread
     * An arena that is entered receives the objects that are made on this thread until it is left.
     */
    ///@{
    void enter(Arena& arena);
    void leave(const Arena& arena);
    ///@}

    /** @name Threads of a provider
     * prepareThread() copies the context for a thread to come, with an arena of its own. attachThread() makes that
     * the arena of the calling thread, detachThread() ends it. The last two answer false for a context that was not
     * prepared.
     */
    ///@{
    CMPIContext* prepareThread(const ContextEntries& entries);
    bool attachThread(const CMPIContext* context);
    bool detachThread(const CMPIContext* context);
    ///@}

private:
    BrokerOptions options;
    CMPIBroker brokerHandle;
    Arena outside;
    MemoryBlocks blocks;
    std::mutex mutex;
    std::map<const CMPIContext*, std::unique_ptr<Arena>> threads;  ///< by prepared context
};

}  // namespace cimhost
