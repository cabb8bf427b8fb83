#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "ProviderFixture.h"
#include "support/AgentConfiguration.h"

namespace contract {

/** Parameters of the tests of both associations. */
struct AssociationKind {
    const char* association;
    const char* element;
    const char* associationOfOthers;  ///< the other association and its element class
    const char* otherElement;
    const char* dataFile;
    const char* fields;  ///< a record of the data file without its identifier line
};

constexpr AssociationKind leases{
    "VELKO_LeaseSetting",
    "VELKO_Lease",
    "VELKO_WarrantySetting",
    "VELKO_Warranty",
    "Lease.dat",
    "ACME_Leasing\n20260101000000.000000+000\n36\n0\n1\n0\n1\n1250.00\n*\n*\n*\n7\n",
};
constexpr AssociationKind warranties{
    "VELKO_WarrantySetting", "VELKO_Warranty", "VELKO_LeaseSetting",
    "VELKO_Lease",           "Warranty.dat",   "Acme_Service\n20260202000000.000000+060\n24\n",
};

inline std::ostream& operator<<(std::ostream& stream, const AssociationKind& kind) {
    return stream << kind.element;
}

/** Returns the content of a data file with records that have these identifiers. */
std::string recordFile(const AssociationKind& kind, const std::vector<std::string>& identifiers);

/** Nodes of three computers, named "alpha", "beta" and "gamma". */
extern const char* const threeComputers;

/** @name Identifiers of the computers' records: string forms of the computers' node paths */
///@{
constexpr const char* ofAlpha = "/system/computer";
constexpr const char* ofBeta = "/system/second%5Fcomputer%202";  ///< of "/system/second_computer 2"
constexpr const char* ofGamma = "/system/third";
///@}

/** Returns a computer system of the object manager. */
Instance computerSystem(const std::string& name);

/** Return paths, or complete instances, as strings. */
std::vector<std::string> stringsOf(const std::vector<ObjectPath>& paths);
std::vector<std::string> stringsOf(const std::vector<Instance>& instances);

/** An agent with three computers, and an object manager with the computer systems that the test sets. */
class AssociationTest : public ProviderTest, public testing::WithParamInterface<AssociationKind> {
protected:
    AssociationTest() : nodes(threeComputers) {}

    static const AssociationKind& kind() { return GetParam(); }

    /** Writes records for the provider to load. */
    static void writeRecordFile(const std::vector<std::string>& identifiers);

    /** Sets the computer systems of the object manager, in order. */
    void setComputers(const std::vector<std::string>& names);

    /** @name Operations with the association class of the test */
    ///@{
    Outcome names() { return provider().enumerateInstanceNames(classPath(kind().association)); }
    Outcome instances() { return provider().enumerateInstances(classPath(kind().association)); }
    Outcome associatorNames(const ObjectPath& source) { return provider().associatorNames(source, through()); }
    Outcome associators(const ObjectPath& source, const cimhost::PropertyList& properties = {}) {
        return provider().associators(source, through(), properties);
    }
    ///@}

    static cimhost::AssociationFilter through() { return {kind().association, {}, {}, {}}; }

    /** @name Paths as strings */
    ///@{
    static std::string computer(const std::string& name);
    static std::string element(const std::string& identifier);
    static std::string keylessElement();
    static std::string pair(const std::string& computerName, const std::string& identifier);
    static std::string pairWithoutElement(const std::string& computerName);  ///< with an element path without keys
    ///@}

    /** Returns a path of the association with these ends. Omits an end without a class name. */
    static ObjectPath association(const ObjectPath& antecedent, const ObjectPath& dependent);

    int upCalls() const { return broker.count("CMPIBrokerFT.enumerateInstances"); }

private:
    agentEnvironment::AgentNodes nodes;
};

/** Returns the name of a parameterised test. */
inline std::string associationName(const testing::TestParamInfo<AssociationKind>& info) {
    return std::string(info.param.element).substr(6);
}

}  // namespace contract
