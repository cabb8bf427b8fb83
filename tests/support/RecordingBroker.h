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
    std::vector<std::string> arguments;  ///< those that say something: see RecordingBroker
};

using cimhost::lab::Manager;

/**
 * A CMPI broker for contract tests of a provider: a real one (cimhost::Broker) that writes down every call and can
 * be told to fail.
 *
 * Functions are named by table and function as the standard spells them: "CMPIBrokerEncFT.newInstance",
 * "CMPIObjectPathFT.getKey", "CMPIStringFT.getCharPtr". std::invalid_argument for a name that is none, so that a
 * test cannot wait for what never comes.
 *
 * Recorded are the calls of the provider only: what the test or the host does with plain values is not a call.
 * Arguments are written as text, in order: names and other texts as they are ("null" for a null pointer), object
 * paths as "root/cimv2:Class.Key="x"", instances as the path of theirs, strings as their characters, property lists
 * as "{A,B}", values as MOF ("\"text\"", "12", "NULL"), types and counts as numbers. Left out are the broker,
 * contexts, results, the object itself that the function is called on, and pointers for output.
 *
 * Several may be alive at a time: each has its own tables, and objects stay with the broker that made them.
 * Calls on a null object, and those of CMPIBrokerExtFT, which name no broker, go to the youngest.
 * Safe to use from several threads. It must outlive the provider that has its handle.
 */
class RecordingBroker {
public:
    RecordingBroker();
    ~RecordingBroker();
    RecordingBroker(const RecordingBroker&) = delete;
    RecordingBroker& operator=(const RecordingBroker&) = delete;

    /** The broker to hand to a provider's factory. emulate() changes it, so call that first. */
    const CMPIBroker* handle() const;

    /** The host's broker underneath, for RequestScope and runCall(). */
    cimhost::Broker& broker();

    /** @name What the provider called */
    ///@{
    std::vector<RecordedCall> calls() const;

    /** The calls of one function. */
    std::vector<RecordedCall> calls(const std::string& function) const;

    /** Names of the called functions, in order. */
    std::vector<std::string> functions() const;
    int count(const std::string& function) const;

    /** Forgets the calls; orders to fail stay. */
    void forget();
    ///@}

    /** @name Orders to fail
     * A failing function does nothing but set its status and answer null, 0, or data with the state CMPI_badValue.
     * Its call is recorded. Orders for one function add up; the latest wins for a call that several apply to.
     */
    ///@{

    /** Fails one call of a function. @param number 1 for the next call, 2 for the one after it... */
    void failCall(const std::string& function, int number, CMPIrc rc);

    /** Fails every call of a function from now on. */
    void failEvery(const std::string& function, CMPIrc rc);

    /**
     * Lets one call, or every one from now on, answer null, 0 or null data with the status CMPI_RC_OK: a string whose
     * characters are null (CMPIStringFT.getCharPtr), a path whose namespace is a null string
     * (CMPIObjectPathFT.getNameSpace), no object from a maker...
     */
    void answerNothing(const std::string& function, int number);
    void answerNothingEver(const std::string& function);

    /**
     * Lets a function that answers CMPIData by name (CMPIObjectPathFT.getKey, CMPIInstanceFT.getProperty,
     * CMPIContextFT.getEntry, CMPIArgsFT.getArg) answer this for a name, in any letter case. Objects in the data
     * must live as long as the provider may look at them: make them with the functions below.
     */
    void answerData(const std::string& function, const std::string& name, const CMPIData& data, CMPIrc rc = CMPI_RC_OK);

    /**
     * Sets the state of all data that a function returns (CMPIObjectPathFT.getKey, getKeyAt,
     * CMPIInstanceFT.getProperty, getPropertyAt, CMPIEnumerationFT.getNext, CMPIArrayFT.getElementAt,
     * CMPIContextFT.getEntry...). Status, type and value remain those of the broker.
     */
    void answerState(const std::string& function, CMPIValueState valueState);

    /** Takes all orders back; poses stay. */
    void obey();
    ///@}

    /** @name Objects for orders
     * They live as long as the broker; making them is not recorded.
     */
    ///@{
    CMPIString* string(const std::string& text);

    /** A string whose characters are null although the status is OK. */
    CMPIString* stringWithoutCharacters();
    CMPIObjectPath* objectPath(const cimhost::ObjectPath& path);
    CMPIInstance* instance(const cimhost::Instance& instance);
    ///@}

    /** @name Object managers
     * Both before the provider has the handle.
     */
    ///@{

    /** Has the function tables of that object manager from now on: versions, functions that are null. */
    void emulate(Manager manager);

    /** Knows classes from now on: their instances begin with their keys. */
    void know(cimhost::ClassInfoLookup classes);
    ///@}

    /** @name Up-calls
     * What the broker's enumerateInstances and enumerateInstanceNames answer for a class, in any namespace: the
     * instances as given, in order; CMPI_RC_ERR_INVALID_CLASS for a class that is not served. All other up-calls are
     * not supported. For failures while the provider walks through them fail "CMPIEnumerationFT.hasNext",
     * "CMPIEnumerationFT.getNext" or "CMPIInstanceFT.getObjectPath" at the call wanted.
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
