#pragma once

#include "GateFixture.h"
#include "lab/emulation/ManagerEmulation.h"
#include "operations/ObjectManager.h"

namespace gatetest {

/** Who serves the classes. */
enum class Served { byGate, byProvider };

/**
 * An object manager that emulates another one, with the gate (or the provider itself) and the provider of the computer
 * systems registered, over the classes of the schema. Its end closes the libraries.
 */
class ManagedGate {
public:
    explicit ManagedGate(cimhost::lab::Manager manager, Served served = Served::byGate);

    cimhost::ObjectManager& manager() { return *host; }

    /** @name Requests as a client makes them; a status other than OK is a failure of the test */
    ///@{
    std::vector<std::string> identifiers(const std::string& className);
    std::vector<ObjectPath> paths(const std::string& className);
    Instance got(const ObjectPath& path);
    ///@}

    /** @name Requests that may fail: the status that the client gets, with the message that the provider itself gave */
    ///@{
    cimhost::Status ask(const cimhost::Request& request);
    cimhost::Status create(const std::string& id, std::vector<NamedValue> properties, const std::string& of = lease);
    cimhost::Status modify(const ObjectPath& path, std::vector<NamedValue> properties);
    cimhost::Status remove(const std::string& id, const std::string& of = lease);
    ///@}

private:
    std::unique_ptr<cimhost::ObjectManager> host;
};

/** Keeps the agent's log silent while it lives: thousands of requests would fill the disk. */
class SilentLog {
public:
    SilentLog();
    ~SilentLog();
    SilentLog(const SilentLog&) = delete;
    SilentLog& operator=(const SilentLog&) = delete;

private:
    std::string before;
};

}  // namespace gatetest
