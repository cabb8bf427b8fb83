#include <functional>

#include "GateFixture.h"

// Checks which requests the gate sends to the provider for a client's request, and in which order.

namespace gatetest {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::uint16;
using Names = std::vector<std::string>;

/**
 * The leases of both computers, another lease, and the warranty of the first computer. The gate has already compared
 * the records of both classes with their files, which takes further requests.
 */
class ProviderRequestsTest : public GateTest {
protected:
    ProviderRequestsTest() {
        create(firstNode, {named("Lessor", text("ACME"))});
        create(secondNode);
        create("L1");
        create(firstNode, {}, warranty);
    }

    /** Returns the provider's entry points that the gate calls for a successful request. */
    static Names behind(const std::function<Outcome()>& request) {
        const Names names = behindAny(request);
        EXPECT_EQ(status, CMPI_RC_OK);
        return names;
    }

    /** Returns the entry points that the gate calls for a request that fails with this status. */
    static Names behindFailure(int rc, const std::function<Outcome()>& request) {
        const Names names = behindAny(request);
        EXPECT_EQ(status, rc);
        return names;
    }

    static ObjectPath settingPath(const std::string& computer, const std::string& element) {
        return testsupport::objectPath(nameSpace, leaseSetting,
                                       {named("Antecedent", testsupport::reference(computerPath(computer))),
                                        named("Dependent", testsupport::reference(keyedPath(lease, element)))});
    }

    static inline const cimhost::AssociationFilter leases{leaseSetting, {}, {}, {}};

private:
    static Names behindAny(const std::function<Outcome()>& request) {
        agentEnvironment::forgetLog();
        status = request().rc;
        Names names;
        for (const agentEnvironment::LogRecord& record : agentEnvironment::log()) {
            const std::string prefix = "ENTERING: LeaseAndWarranty_";
            if (record.channel == "log" && record.function == "markProviderEntry" && record.text.find(prefix) == 0) {
                names.push_back(record.text.substr(prefix.size(), record.text.find('(') - prefix.size()));
            }
        }
        return names;
    }

    static inline int status = CMPI_RC_OK;
};

TEST_F(ProviderRequestsTest, AnEnumerationSendsOneRequest) {
    for (const char* name : {lease, warranty, asset, agent}) {
        const ObjectPath path = classPath(name);
        EXPECT_THAT(behind([&] { return gate().enumerateInstances(path); }), ElementsAre("EnumInstances"));
        EXPECT_THAT(behind([&] { return gate().enumerateInstanceNames(path); }), ElementsAre("EnumInstanceNames"));
    }
}

TEST_F(ProviderRequestsTest, AGetSendsOneRequestWhetherOrNotTheInstanceExists) {
    for (const char* id : {firstNode, "L1"}) {
        EXPECT_THAT(behind([&] { return gate().getInstance(keyedPath(lease, id)); }), ElementsAre("GetInstance"));
    }
    const auto isMissing = [&](const ObjectPath& path) {
        return behindFailure(CMPI_RC_ERR_NOT_FOUND, [&] { return gate().getInstance(path); });
    };
    EXPECT_THAT(isMissing(keyedPath(lease, "none")), ElementsAre("GetInstance"));
    EXPECT_THAT(isMissing(keyedPath(warranty, "L1")), ElementsAre("GetInstance"));
    for (const char* name : {asset, agent}) {
        ObjectPath path = gate().enumerateInstanceNames(classPath(name)).paths().front();
        const std::string request = name == agent ? "EnumInstances" : "GetInstance";
        EXPECT_THAT(behind([&] { return gate().getInstance(path); }), ElementsAre(request));
        path.keys.front() = named(path.keys.front().name, text("other"));
        EXPECT_THAT(isMissing(path), ElementsAre(request));
    }
}

TEST_F(ProviderRequestsTest, ACreationSendsOneRequestAndTwoMoreToSetValues) {
    EXPECT_THAT(behind([&] { return create("L2"); }), ElementsAre("CreateInstance"));
    EXPECT_THAT(behind([&] { return create("L3", {named("LeaseTerm", uint32(0))}); }), ElementsAre("CreateInstance"))
        << "a new lease already has this value";
    EXPECT_THAT(behind([&] {
                    return create("L4", {named("Lessor", text("ACME")), named("LeaseTerm", uint32(36))});
                }),
                ElementsAre("CreateInstance", "ModifyInstance", "GetInstance"));
}

TEST_F(ProviderRequestsTest, ACreationGetsTheRecordThatItIsComparedWith) {
    EXPECT_THAT(behindFailure(CMPI_RC_ERR_ALREADY_EXISTS, [&] { return create("L1"); }), ElementsAre("GetInstance"));
    EXPECT_THAT(behind([&] { return create("ACME"); }), ElementsAre("GetInstance", "CreateInstance"))
        << "the file contains an equal value of another property";
    EXPECT_THAT(behind([&] { return create("L2", {named("ElementName", text("Lease Information"))}); }),
                ElementsAre("EnumInstanceNames", "GetInstance", "CreateInstance"));
    remove(firstNode, warranty);
    EXPECT_THAT(behind([&] { return create("W2", {named("ElementName", text("Warranty Information"))}, warranty); }),
                ElementsAre("EnumInstanceNames", "CreateInstance"))
        << "no other record exists";
    const NamedValue readOnly = named("ChangeableType", uint16(1));
    EXPECT_THAT(behindFailure(CMPI_RC_ERR_INVALID_PARAMETER, [&] { return create("L3", {readOnly}); }),
                ElementsAre("EnumInstanceNames", "GetInstance"));
    EXPECT_THAT(behindFailure(CMPI_RC_ERR_INVALID_PARAMETER, [&] { return create("L_3"); }), IsEmpty());
}

TEST_F(ProviderRequestsTest, ACreationComparesReadOnlyValuesAlsoIfTheFileAltersTheFirstIdentifier) {
    remove(firstNode, warranty);
    unload();
    const RefusalOff off;
    create("W_1", {}, warranty);
    const NamedValue readOnly = named("ElementName", text("mine"));
    EXPECT_THAT(behindFailure(CMPI_RC_ERR_INVALID_PARAMETER, [&] { return create("W2", {readOnly}, warranty); }),
                ElementsAre("EnumInstanceNames", "GetInstance"));
    EXPECT_THAT(identifiers(warranty), ElementsAre("W_1")) << "the provider was not loaded again";
    unload();  // before the configuration is restored
}

TEST_F(ProviderRequestsTest, AModificationGetsTheInstanceBeforeAndAfterTheChange) {
    const NamedValue other = named("Lessor", text("Other"));
    EXPECT_THAT(behind([&] { return modify("L1", {other}); }),
                ElementsAre("GetInstance", "ModifyInstance", "GetInstance"));
    EXPECT_THAT(behind([&] { return modify("L1", {other}); }), ElementsAre("GetInstance")) << "no change";
    EXPECT_THAT(behindFailure(CMPI_RC_ERR_NOT_FOUND, [&] { return modify("none", {other}); }),
                ElementsAre("GetInstance"));
    const ObjectPath path = gate().enumerateInstanceNames(classPath(asset)).paths().front();
    const Instance number = testsupport::instance(path, {named("AssetNumber", text("A1"))});
    EXPECT_THAT(behind([&] { return gate().modifyInstance(path, number); }),
                ElementsAre("GetInstance", "ModifyInstance", "GetInstance"));
}

TEST_F(ProviderRequestsTest, ADeletionGetsTheRecordFirst) {
    EXPECT_THAT(behind([&] { return remove("L1"); }), ElementsAre("GetInstance", "DeleteInstance"));
    EXPECT_THAT(behindFailure(CMPI_RC_ERR_NOT_FOUND, [&] { return remove("L1"); }), ElementsAre("GetInstance"));
}

TEST_F(ProviderRequestsTest, TheFirstRequestForAClassEnumeratesItsNames) {
    unload();
    EXPECT_THAT(behind([&] { return gate().getInstance(keyedPath(lease, "L1")); }),
                ElementsAre("EnumInstanceNames", "GetInstance"));
    EXPECT_THAT(behind([&] { return gate().enumerateInstances(classPath(lease)); }), ElementsAre("EnumInstances"));
    EXPECT_THAT(behind([&] { return gate().enumerateInstanceNames(classPath(warranty)); }),
                ElementsAre("EnumInstanceNames"));
    EXPECT_THAT(behind([&] { return gate().enumerateInstances(classPath(warranty)); }), ElementsAre("EnumInstances"));
}

TEST_F(ProviderRequestsTest, TheFirstChangeInAClassEnumeratesItsNames) {
    unload();
    EXPECT_THAT(behind([&] { return create("L2"); }), ElementsAre("EnumInstanceNames", "CreateInstance"));
    EXPECT_THAT(behind([&] { return create("L3"); }), ElementsAre("CreateInstance"));
    EXPECT_THAT(behind([&] { return remove(firstNode, warranty); }),
                ElementsAre("EnumInstanceNames", "GetInstance", "EnumInstanceNames", "DeleteInstance"));
}

TEST_F(ProviderRequestsTest, ATraversalFromAComputerSendsOneRequestPerAssociationClass) {
    const ObjectPath source = computerPath("beta");
    EXPECT_THAT(behind([&] { return gate().associators(source, leases); }), ElementsAre("Associators"));
    EXPECT_THAT(behind([&] { return gate().associatorNames(source, leases); }), ElementsAre("AssociatorNames"));
    EXPECT_THAT(behind([&] {
                    return gate().references(source, {{}, leaseSetting, {}, {}});
                }),
                ElementsAre("AssociatorNames"));
    EXPECT_THAT(behind([&] { return gate().associatorNames(source, {}); }),
                ElementsAre("AssociatorNames", "AssociatorNames"));
}

TEST_F(ProviderRequestsTest, OtherTraversalsAndEnumerationsSendOneRequestPerComputer) {
    const auto eachComputer = ElementsAre("AssociatorNames", "AssociatorNames");
    const ObjectPath source = keyedPath(lease, secondNode);
    EXPECT_THAT(behind([&] { return gate().associators(source, {}); }), eachComputer);
    EXPECT_THAT(behind([&] { return gate().referenceNames(source, {}); }), eachComputer);
    EXPECT_THAT(behind([&] { return gate().enumerateInstances(classPath(leaseSetting)); }), eachComputer);
}

TEST_F(ProviderRequestsTest, AGetOfAnAssociationSendsAtMostOneRequest) {
    EXPECT_THAT(behind([&] { return gate().getInstance(settingPath("beta", secondNode)); }),
                ElementsAre("AssociatorNames"));
    const auto isMissing = [&](const ObjectPath& path) {
        return behindFailure(CMPI_RC_ERR_NOT_FOUND, [&] { return gate().getInstance(path); });
    };
    EXPECT_THAT(isMissing(settingPath("beta", firstNode)), ElementsAre("AssociatorNames"));
    EXPECT_THAT(isMissing(settingPath("gamma", firstNode)), IsEmpty());
}

}  // namespace
}  // namespace gatetest
