#pragma once

#include <cmpift.h>

#include <memory>
#include <string>
#include <vector>

#include "broker/Broker.h"
#include "lab/emulation/ManagerEmulation.h"
#include "model/Value.h"

namespace testsupport {

/** A call that a provider made through one of the broker's function tables. */
struct RecordedCall {
    std::string function;                ///< table and function, "CMPIResultFT.returnInstance"
    std::vector<std::string> arguments;  ///< descriptions; see RecordingBroker
};

using cimhost::lab::Manager;

/**
 * A cimhost::Broker that records the calls of a provider, and makes selected calls fail. Thread-safe. It must outlive
 * the provider.
 *
 * Functions are named by table and function, as in the CMPI standard: "CMPIBrokerEncFT.newInstance",
 * "CMPIObjectPathFT.getKey", "CMPIStringFT.getCharPtr". Throws std::invalid_argument for other names.
 *
 * Calls of the test and the host are not recorded. Arguments are described in order: character pointers by their
 * characters ("null" for a null pointer), object paths as "root/cimv2:Class.Key="x"", instances by their path, strings
 * by their characters, property lists as "{A,B}", values in MOF ("\"x\"", "12", "NULL"), types and counts as numbers.
 * The broker, contexts, results, the object of the call, and pointers for output are omitted.
 *
 * Several brokers can exist: each has separate tables, and objects belong to the broker that created them. Calls on
 * null objects and of CMPIBrokerExtFT, which have no broker, belong to the newest.
 */
class RecordingBroker {
public:
    RecordingBroker();
    ~RecordingBroker();
    RecordingBroker(const RecordingBroker&) = delete;
    RecordingBroker& operator=(const RecordingBroker&) = delete;

    /** The handle for a provider's factory. Call emulate() first, which changes it. */
    const CMPIBroker* handle() const;

    /** The host's broker, for RequestScope and runCall(). */
    cimhost::Broker& broker();

    /** @name Recorded calls */
    ///@{
    std::vector<RecordedCall> calls() const;

    /** The calls of one function. */
    std::vector<RecordedCall> calls(const std::string& function) const;

    /** Names of the called functions, in order. */
    std::vector<std::string> functions() const;
    int count(const std::string& function) const;

    /** Removes the recorded calls. Failures remain. */
    void forget();
    ///@}

    /** @name Failures
     * A failing function only sets its status and returns null, 0, or data with the state CMPI_badValue. Its call is
     * recorded. If several failures apply to a call, the latest one does.
     */
    ///@{

    /** Fails one call of a function. @param number 1 for the next call, 2 for the one after it... */
    void failCall(const std::string& function, int number, CMPIrc rc);

    /** Fails all following calls of a function. */
    void failEvery(const std::string& function, CMPIrc rc);

    /**
     * Makes one call, or all following ones, return null, 0 or null data with the status CMPI_RC_OK: null characters
     * (CMPIStringFT.getCharPtr), a null namespace (CMPIObjectPathFT.getNameSpace), no new object and so on.
     */
    void answerNothing(const std::string& function, int number);
    void answerNothingEver(const std::string& function);

    /**
     * Makes a function that returns CMPIData by name (CMPIObjectPathFT.getKey, CMPIInstanceFT.getProperty,
     * CMPIContextFT.getEntry, CMPIArgsFT.getArg) return this for a case-insensitive name. Objects in the data must
     * outlive the calls: create them with the functions below.
     */
    void answerData(const std::string& function, const std::string& name, const CMPIData& data, CMPIrc rc = CMPI_RC_OK);

    /**
     * Sets the state of all data that a function returns (CMPIObjectPathFT.getKey, getKeyAt,
     * CMPIInstanceFT.getProperty, getPropertyAt, CMPIEnumerationFT.getNext, CMPIArrayFT.getElementAt,
     * CMPIContextFT.getEntry...). Status, type and value remain those of the broker.
     */
    void answerState(const std::string& function, CMPIValueState valueState);

    /** Removes all failures. The emulation remains. */
    void cancelFailures();
    ///@}

    /** @name Objects for failures
     * Owned by the broker. Their creation is not recorded.
     */
    ///@{
    CMPIString* string(const std::string& text);

    /** A string whose characters are null although the status is OK. */
    CMPIString* stringWithoutCharacters();
    CMPIObjectPath* objectPath(const cimhost::ObjectPath& path);
    CMPIInstance* instance(const cimhost::Instance& instance);
    ///@}

    /** @name Object managers
     * Call both before the provider receives the handle.
     */
    ///@{

    /** Uses the function tables of an object manager: versions, functions that are null. */
    void emulate(Manager manager);

    /** Sets the known classes. A new instance of a known class has the keys of its path as properties. */
    void know(cimhost::ClassInfoLookup classes);
    ///@}

    /** @name Up-calls
     * Set the responses to enumerateInstances and enumerateInstanceNames of a class, in all namespaces. For other
     * classes, the response is CMPI_RC_ERR_INVALID_CLASS; other up-calls are not supported. For failures while the
     * provider iterates over the instances, fail "CMPIEnumerationFT.hasNext", "CMPIEnumerationFT.getNext" or
     * "CMPIInstanceFT.getObjectPath".
     */
    ///@{
    void serve(const std::string& className, std::vector<cimhost::Instance> instances);
    void failEnumeration(const std::string& className, CMPIrc rc);
    ///@}

    struct State;

private:
    std::unique_ptr<State> state;
};

}  // namespace testsupport
