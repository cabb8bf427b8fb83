#pragma once

#include "CapturedResult.h"
#include "Gate.h"
#include "OwnObjects.h"
#include "Request.h"

#include <cmpift.h>

#include <string>
#include <vector>

namespace gate {

/**
 * The provider behind the gate, driven through its own factories and function tables. Who has this object has the
 * turn: nobody else is inside the provider, except while the provider waits for the object manager.
 *
 * Paths name the instance completely. The provider logs what goes wrong inside it and answers a success; where that
 * can be seen, because the answer was not ended, it is a failure here.
 */
class Provider {
public:
    using Paths = std::vector<const CMPIObjectPath*>;
    using Instances = std::vector<const CMPIInstance*>;

    /** Tells the provider of its broker; false when it does not give its interfaces. */
    static bool connect(const CMPIBroker* manager);

    /** Whether the provider has this broker, with the tables that it has now. Waits for no turn. */
    static bool isConnectedTo(const CMPIBroker* manager);

    /** The broker that the provider has; null when there is none. Waits for no turn. */
    static const CMPIBroker* manager();

    /** Ends both interfaces, as the object manager does that ends itself, and forgets its broker. The gate is shut. */
    static void end(const CMPIContext* context);

    explicit Provider(const Request& request);

    Paths names(const OwnPath& classPath) const;
    Instances instances(const OwnPath& classPath) const;

    /** Null when there is none. */
    const CMPIInstance* get(const OwnPath& path) const;

    void create(const OwnPath& path) const;
    void modify(const OwnPath& path, const OwnInstance& instance) const;
    void remove(const OwnPath& path) const;

    Paths associatorNames(const OwnPath& path, const char* associationClass) const;

    /** Does some work, of the object manager's, while others may have the turn. Ended when that ends meanwhile. */
    template <class Work>
    void letOthersIn(Work work) const {
        turn.interruptFor(work);
    }

    class Watch;

private:
    bool isListed(const OwnPath& path) const;

    mutable Turn turn;
    const CMPIContext* context;
};

/** Tells whether an instance has been removed since, by whomever: for who lets others in. Asked by who has the turn. */
class Provider::Watch {
public:
    explicit Watch(const OwnPath& path);
    ~Watch();
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;

    bool sawRemoval() const { return isRemoved; }

private:
    friend class Provider;
    static void tell(const OwnPath& removed);

    const OwnPath& watched;
    bool isRemoved = false;
    Watch* next = nullptr;
};

}  // namespace gate
