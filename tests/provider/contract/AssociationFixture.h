#pragma once

#include "AgentNodes.h"
#include "ProviderFixture.h"

#include <ostream>
#include <string>
#include <vector>

namespace contract {

/** One of the two associations: what tests of both need to know of it. */
struct Side {
    const char* association;
    const char* element;
    const char* associationOfOthers;  ///< the other association and its element class
    const char* otherElement;
    const char* dataFile;
    const char* fields;  ///< a record of the data file without its first line, the identifier
};

constexpr Side leases{
    "VELKO_LeaseSetting",
    "VELKO_Lease",
    "VELKO_WarrantySetting",
    "VELKO_Warranty",
    "Lease.dat",
    "ACME_Leasing\n20260101000000.000000+000\n36\n0\n1\n0\n1\n1250.00\n*\n*\n*\n7\n",
};
constexpr Side warranties{
    "VELKO_WarrantySetting", "VELKO_Warranty", "VELKO_LeaseSetting",
    "VELKO_Lease",           "Warranty.dat",   "Acme_Service\n20260202000000.000000+060\n24\n",
};

inline std::ostream& operator<<(std::ostream& stream, const Side& side) {
    return stream << side.element;
}

/** The data file of records with these identifiers. */
std::string recordFile(const Side& side, const std::vector<std::string>& identifiers);

/** Three computers, "alpha", "beta" and "gamma", each of which has a name. */
extern const char* const threeComputers;

/** @name Identifiers of the records that belong to them: the texts of their places in the tree */
///@{
constexpr const char* ofAlpha = "/system/computer";
constexpr const char* ofBeta = "/system/second%5Fcomputer%202";  ///< of "/system/second_computer 2"
constexpr const char* ofGamma = "/system/third";
///@}

/** A computer system as the object manager knows it. */
Instance computerSystem(const std::string& name);

/** Text of paths, and of whole instances, for comparison. */
std::vector<std::string> textsOf(const std::vector<ObjectPath>& paths);
std::vector<std::string> textsOf(const std::vector<Instance>& instances);

/** An agent with three computers, and an object manager that knows the computer systems that a test says. */
class AssociationTest : public ProviderTest, public testing::WithParamInterface<Side> {
protected:
    AssociationTest() : nodes(threeComputers) {}

    static const Side& side() { return GetParam(); }

    /** Records for the provider to load. */
    static void haveRecords(const std::vector<std::string>& identifiers);

    /** The computer systems that the object manager knows, in order. */
    void knowComputers(const std::vector<std::string>& names);

    /** @name Operations, narrowed by the side's association class */
    ///@{
    Outcome names() { return provider().enumerateInstanceNames(classPath(side().association)); }
    Outcome instances() { return provider().enumerateInstances(classPath(side().association)); }
    Outcome associatorNames(const ObjectPath& source) { return provider().associatorNames(source, through()); }
    Outcome associators(const ObjectPath& source, const cimhost::PropertyList& properties = {}) {
        return provider().associators(source, through(), properties);
    }
    ///@}

    static cimhost::AssociationFilter through() { return {side().association, {}, {}, {}}; }

    /** @name Paths as text */
    ///@{
    static std::string computer(const std::string& name);
    static std::string element(const std::string& identifier);
    static std::string keylessElement();
    static std::string pair(const std::string& computerName, const std::string& identifier);
    static std::string pairWithoutElement(const std::string& computerName);  ///< with the keyless element path
    ///@}

    /** A path of the association with these ends; an end without class name is left out. */
    static ObjectPath association(const ObjectPath& antecedent, const ObjectPath& dependent);

    int upCalls() const { return broker.count("CMPIBrokerFT.enumerateInstances"); }

private:
    AgentNodes nodes;
};

/** Names of parameterised tests. */
inline std::string sideName(const testing::TestParamInfo<Side>& info) {
    return std::string(info.param.element).substr(6);
}

}  // namespace contract
