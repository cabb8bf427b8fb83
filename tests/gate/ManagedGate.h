#pragma once

#include "GateFixture.h"
#include "lab/emulation/ManagerEmulation.h"
#include "operations/ObjectManager.h"

namespace gatetest {

/** The registered provider of the classes. */
enum class Served { byGate, byProvider };

/**
 * An emulated object manager with the gate (or with the provider alone) and the provider of computer systems. The
 * destructor closes the libraries.
 */
class ManagedGate {
public:
    explicit ManagedGate(cimhost::lab::Manager manager, Served served = Served::byGate);

    cimhost::ObjectManager& manager() { return *host; }

    /** @name Requests of a client; fail the test on a status other than OK */
    ///@{
    std::vector<std::string> identifiers(const std::string& className);
    std::vector<ObjectPath> paths(const std::string& className);
    Instance instanceOf(const ObjectPath& path);
    ///@}

    /** @name Requests that can fail: return the client's status with the provider's message */
    ///@{
    cimhost::Status ask(const cimhost::Request& request);
    cimhost::Status create(const std::string& id, std::vector<NamedValue> properties, const std::string& of = lease);
    cimhost::Status modify(const ObjectPath& path, std::vector<NamedValue> properties);
    cimhost::Status remove(const std::string& id, const std::string& of = lease);
    ///@}

private:
    std::unique_ptr<cimhost::ObjectManager> host;
};

/**
 * Disables the agent's log during the lifetime of this object, since the logs of thousands of requests would fill the
 * disk.
 */
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
