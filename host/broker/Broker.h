#pragma once

#include <cmpift.h>

#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>

#include "broker/Arena.h"
#include "broker/ClassInfo.h"
#include "broker/FunctionTables.h"
#include "broker/MemoryBlocks.h"
#include "model/Request.h"
#include "model/Response.h"

namespace cimhost {

/** A line that a provider logs or traces through the broker. */
struct LogRecord {
    bool isTrace = false;
    int level = 0;            ///< a CMPISeverity, or a CMPILevel of a trace
    std::string component{};  ///< id of the message or name of the component; may be empty
    std::string text{};
};

/** Receives the requests that providers send to the object manager. */
class UpCalls {
public:
    virtual ~UpCalls() = default;

    /**
     * Performs a request. Called on the thread of the provider that sends it, possibly concurrently and from inside
     * another request; an exception becomes the status CMPI_RC_ERR_FAILED with its message.
     */
    virtual Response perform(Request request) = 0;
};

/** The response to an operation that an object manager does not have. */
Response notSupported(Operation operation);

/** What a broker is made with. */
struct BrokerOptions {
    ClassInfoLookup classInfo{};  ///< none: no class is known
    UpCalls* upCalls = nullptr;   ///< not owned; null: no up-call is supported
    std::function<void(const LogRecord&)>
        log{};                               ///< none: log and trace records are dropped; may be called concurrently
    const FunctionTables* tables = nullptr;  ///< not owned; null: the standard tables
    bool hasMemoryTable = true;              ///< whether the handle has a CMPIBrokerMemFT
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

    /** The class of that name; null when it is not known. */
    std::shared_ptr<const ClassInfo> classInfo(const std::string& className) const;

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
