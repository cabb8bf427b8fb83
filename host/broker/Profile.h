#pragma once

#include <cstddef>
#include <optional>
#include <string_view>

#include "broker/FunctionTables.h"

namespace cimhost {

/** Object managers that this host can play. */
enum class Manager {
    standard,             ///< the host itself: what the standard promises, and helpful where it leaves a choice
    sfcb,                 ///< as SFCB 1.3 was seen to behave
    openPegasus,          ///< as OpenPegasus was seen to behave
    openPegasusEmptyKey,  ///< the same, where a new instance's path has a key that is empty instead of unreadable
};

/** Functions that the broker lacks. */
enum class BrokerGaps { none, someFunctions, memoryTable };

/** The thread on which a request reaches its provider. */
enum class RequestThread {
    callers,          ///< that of who asks
    ownUnlessNested,  ///< one of its own; an up-call runs on the thread of the provider that asks
    own,              ///< one of its own, up-calls too
};

/** What becomes of an exception that leaves a provider. */
enum class Escape { failure, endOfProcess, unknownError };

/** What a provider finds in the path of a new instance. */
enum class CreationKey {
    asSent,
    unreadable,  ///< keys are counted, but have no value
    empty        ///< keys have a value, which is an empty text
};

/** What a provider must return from CreateInstance. */
enum class CreationResult {
    pathOrInstance,
    pathRead,  ///< whatever comes first is read as a path, nothing at all ends the process
    pathOnly   ///< instances are refused
};

/** Which factory is called, "Name_Create_..." or "_Generic_Create_...". */
enum class FactoryChoice {
    namedFirst,
    genericFirst,
    onlyOne  ///< a library that has both cannot be used
};

/** What becomes of a value whose type is not that of the property. */
enum class Typing {
    asSent,
    numbersPass,  ///< numbers reach the provider as they are; text for a number ends the process
    byClass       ///< numbers that fit are converted; all else, and datetimes that do not exist, are refused
};

/** What providers and clients meet under an object manager, where managers differ. */
struct Profile {
    Manager manager;
    const char* name;  ///< on command lines
    unsigned int brokerVersion;
    int encapsulationVersion;
    BrokerGaps gaps;
    RequestThread thread;
    Escape escape;
    CreationResult created;
    CreationKey creationKey;
    FactoryChoice factory;
    Typing typing;
    std::size_t answerLimit;      ///< of the bytes that an answer has in XML; 0: none
    bool loadsLazily;             ///< functions of a library are looked for when they are first called
    bool startsAllInterfaces;     ///< for a class, its instance and its association interface start together
    bool startsAtOnce;            ///< factories run on several threads at a time
    bool filterHidesKeys;         ///< a property filter shows what it lists, keys or not
    bool staysIfAllAsk;           ///< an idle library stays if all its interfaces ask for it, not if one does
    bool completesInstances;      ///< all properties of the class are there at creation and modification, unset: null
    bool marksElementsNull;       ///< CMPIEnumeration.getNext gives good elements the state CMPI_nullValue
    bool hollowTexts;             ///< unset texts, principal and role are string objects without characters
    bool namesAllProperties;      ///< the property list is never null, and that of a modification has the keys
    bool fillsAssociationClass;   ///< a provider is told the association class also when the client names none
    bool refusesEmptyGet;         ///< returnDone fails in GetInstance before an instance was returned
    bool keepsReturnedPath;       ///< a path returned from CreateInstance must not be released
    bool emptiesReferences;       ///< references that are not supported are answered as none
    bool trimsBlanks;             ///< at both ends of texts from clients
    bool trimsOutsideAscii;       ///< bytes outside ASCII go, too
    bool startsProviderPerClass;  ///< factories are called once for every class that is asked for
};

const Profile& profileOf(Manager manager);

/** The manager of that name, such as "sfcb"; none for another name. */
std::optional<Manager> managerNamed(std::string_view name);

/** Makes function tables look like the manager's: versions, and null pointers where it has no function. */
void applyGaps(const Profile& profile, FunctionTables& tables);

}  // namespace cimhost
