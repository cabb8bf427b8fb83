#pragma once

#include <cmpift.h>

#include <cstddef>
#include <cstdlib>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_map>

#include "broker/Arena.h"
#include "broker/ClassInfo.h"
#include "broker/FunctionTables.h"
#include "model/Request.h"
#include "model/Response.h"

namespace cimhost {

/** A message that a provider logs or traces through the broker. */
struct LogRecord {
    bool isTrace = false;
    int level = 0;            ///< a CMPISeverity, or a CMPILevel of a trace
    std::string component{};  ///< identifier of the message or name of the component; may be empty
    std::string message{};
};

/** Receives the requests that providers send to the object manager. */
class UpCalls {
public:
    virtual ~UpCalls() = default;

    /**
     * Performs a request. Called on the thread of the provider that sends the request, possibly concurrently and during
     * another request. An exception becomes the status CMPI_RC_ERR_FAILED with the exception's message.
     */
    virtual Response perform(Request request) = 0;
};

/** The response to an operation that an object manager does not support. */
Response notSupported(Operation operation);

/** The parameters of a broker. */
struct BrokerOptions {
    ClassInfoLookup classInfo{};                  ///< none: all classes are unknown
    UpCalls* upCalls = nullptr;                   ///< not owned; null: up-calls are not supported
    std::function<void(const LogRecord&)> log{};  ///< none: records are discarded; may be called concurrently
    const FunctionTables* tables = nullptr;       ///< not owned; null: the standard tables
    bool hasMemoryTable = true;                   ///< whether the handle has a CMPIBrokerMemFT
};

/** Memory that providers allocate through the broker. The destructor frees the remaining blocks. Thread-safe. */
class MemoryBlocks {
public:
    /** Allocates zeroed memory, at least one byte; null if out of memory. */
    void* allocate(std::size_t count, std::size_t size);

    /** Like realloc. Returns null and changes nothing if the pointer is unknown, or if out of memory. */
    void* resize(void* block, std::size_t size);

    /** Frees a block; ignores other pointers. */
    void free(void* block);

private:
    struct Free {
        void operator()(void* block) const { std::free(block); }
    };

    std::mutex mutex;
    std::unordered_map<void*, std::unique_ptr<void, Free>> blocks;
};

/**
 * A CMPI broker, through which providers use the object manager. Thread-safe.
 *
 * An object that a provider creates belongs to the innermost request of this broker on the calling thread
 * (RequestScope), or to the attached thread. Other objects and unreleased clones are freed with the broker. The broker
 * must outlive all requests and the providers that have its handle.
 */
class Broker {
public:
    explicit Broker(BrokerOptions itsOptions = {});
    ~Broker() = default;
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    /** The CMPI handle; owned by this object. */
    const CMPIBroker* handle() const { return &brokerHandle; }

    /** The broker of a handle. @throws Failure with CMPI_RC_ERR_INVALID_HANDLE if there is none */
    static Broker& of(const CMPIBroker* handle);

    const FunctionTables& tables() const { return *options.tables; }
    UpCalls& upCalls() const { return *options.upCalls; }

    /** The class of this name; null if it is unknown. */
    std::shared_ptr<const ClassInfo> classInfo(const std::string& className) const;

    /** Whether a class is the ancestor or is known to be derived from it. */
    bool isA(const std::string& className, const std::string& ancestor) const;

    void log(const LogRecord& record) const;

    /** The arena for objects that this thread creates now. */
    Arena& arena();

    /** The arena of clones and of objects that are created outside of requests. */
    Arena& lasting() { return outside; }

    /** The arena that this thread entered last, of any broker; null if it has entered none. */
    static Arena* arenaOfThread();

    /** The memory that providers allocate. */
    MemoryBlocks& memory() { return blocks; }

    /** @name Arenas of this thread
     * After enter(), the arena receives the objects that this thread creates, until leave().
     */
    ///@{
    void enter(Arena& arena);
    void leave(const Arena& arena);
    ///@}

    /** @name Threads of a provider
     * prepareThread() copies a context for a new thread and creates an arena for it. attachThread() enters this arena;
     * detachThread() leaves and frees it. These two return false for a context that prepareThread() did not return.
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
    std::map<const CMPIContext*, std::unique_ptr<Arena>> threads;  ///< arenas of prepared contexts
};

}  // namespace cimhost
