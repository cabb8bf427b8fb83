#include <cmpift.h>
#include <gmock/gmock.h>

#include <thread>

#include "agent/PlainValues.h"
#include "broker/RequestScope.h"

extern "C" CMPIInstanceMI* OstrelComputerSystemProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                                          CMPIStatus*);

using agent_test::text;
using agent_test::textIn;
using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::ObjectPath;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

using Properties = std::vector<std::pair<std::string, std::string>>;

Properties propertiesOf(const Instance& instance) {
    Properties properties;
    for (const NamedValue& property : instance.properties) {
        properties.emplace_back(property.name, textIn(property.value));
    }
    return properties;
}

std::string nameIn(const ObjectPath& path) {
    EXPECT_EQ(path.className, "VELKO_ComputerSystem");
    EXPECT_EQ(path.nameSpace, "root/other");
    EXPECT_EQ(path.keys.size(), 1U);
    EXPECT_EQ(path.keys.at(0).name, "Name");
    return textIn(path.keys.at(0).value);
}

/** Requests to the provider in the test's namespace. */
class OstrelComputerSystemProviderTest : public testing::Test {
protected:
    CMPIObjectPath* path(std::vector<NamedValue> keys = {}, const std::string& className = "VELKO_ComputerSystem") {
        return scope.objectPath({"", "root/other", className, std::move(keys)});
    }

    cimhost::Status enumerateNames(const CMPIObjectPath* ofPath) {
        return cimhost::statusFrom(mi->ft->enumerateInstanceNames(mi, context, result, ofPath));
    }

    cimhost::Status enumerate(const char** properties = nullptr) {
        return cimhost::statusFrom(mi->ft->enumerateInstances(mi, context, result, path(), properties));
    }

    cimhost::Status get(const CMPIObjectPath* ofPath, const char** properties = nullptr) {
        return cimhost::statusFrom(mi->ft->getInstance(mi, context, result, ofPath, properties));
    }

    std::vector<Instance> instances() const { return cimhost::eventsOf<Instance>(events); }

    cimhost::Broker host;
    cimhost::RequestScope scope{host};
    cimhost::ResultEvents events;
    CMPIResult* result = scope.result(events);
    CMPIContext* context = scope.context({});
    CMPIInstanceMI* mi = OstrelComputerSystemProvider_Create_InstanceMI(host.handle(), context, nullptr);
};

TEST_F(OstrelComputerSystemProviderTest, ReturnsItsInterface) {
    CMPIStatus status{CMPI_RC_ERR_FAILED, nullptr};
    const CMPIInstanceMI* interface = OstrelComputerSystemProvider_Create_InstanceMI(host.handle(), context, &status);
    ASSERT_NE(interface, nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(interface->ft->ftVersion, CMPIVersion200);
    EXPECT_STREQ(interface->ft->miName, "instanceOstrelComputerSystemProvider");
}

TEST_F(OstrelComputerSystemProviderTest, NamesEveryComputerThatHasAName) {
    EXPECT_TRUE(enumerateNames(path()).ok());
    std::vector<std::string> names;
    for (const ObjectPath& each : cimhost::eventsOf<ObjectPath>(events)) {
        names.push_back(nameIn(each));
    }
    EXPECT_THAT(names, ElementsAre("host1", "host2"));
    EXPECT_EQ(cimhost::doneCount(events), 1);
}

TEST_F(OstrelComputerSystemProviderTest, ReturnsEveryPropertyOfTheComputer) {
    EXPECT_TRUE(enumerate().ok());
    ASSERT_EQ(instances().size(), 2U);
    EXPECT_EQ(nameIn(instances()[0].path), "host1");
    EXPECT_THAT(propertiesOf(instances()[0]),
                ElementsAre(Pair("Name", "host1"), Pair("Caption", "Computer System"),
                            Pair("Description", "Computer system host1"), Pair("ElementName", "host1"),
                            Pair("Vendor", "Maker"), Pair("Model", "Model X"), Pair("ProductName", "Model X - Tower")));
    EXPECT_THAT(propertiesOf(instances()[1]), ElementsAre(Pair("Name", "host2"), Pair("Caption", "Computer System"),
                                                          Pair("Description", "Computer system host2"),
                                                          Pair("ElementName", "host2"), Pair("Vendor", "")));
    EXPECT_EQ(cimhost::doneCount(events), 1);
}

TEST_F(OstrelComputerSystemProviderTest, GetsOneComputerByItsName) {
    EXPECT_TRUE(get(path({{"name", text("host2")}}, "velko_computersystem")).ok());
    ASSERT_EQ(instances().size(), 1U);
    EXPECT_EQ(nameIn(instances()[0].path), "host2");
    EXPECT_EQ(cimhost::doneCount(events), 1);
}

TEST_F(OstrelComputerSystemProviderTest, FindsNoComputerOfAnotherName) {
    for (const char* name : {"host3", "HOST1", ""}) {
        const cimhost::Status status = get(path({{"Name", text(name)}}));
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND) << name;
        EXPECT_EQ(status.message, "There is no computer system named \"" + std::string(name) + "\"");
    }
    EXPECT_THAT(events, IsEmpty());
}

TEST_F(OstrelComputerSystemProviderTest, RequiresTheKeyToGetAComputer) {
    const cimhost::Status status = get(path({{"InstanceID", text("host1")}}));
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(status.message, "The key Name is missing or is not a string");
    EXPECT_EQ(get(path({{"Name", agent_test::nullOf(CMPI_string)}})).rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(OstrelComputerSystemProviderTest, ReturnsThePropertiesOfTheListAndTheKey) {
    const char* list[] = {"vendor", "NoSuchProperty", "MODEL", nullptr};
    EXPECT_TRUE(get(path({{"Name", text("host1")}}), list).ok());
    EXPECT_TRUE(enumerate(list).ok());
    ASSERT_EQ(instances().size(), 3U);
    for (const std::size_t index : {0U, 1U}) {
        EXPECT_THAT(propertiesOf(instances()[index]),
                    ElementsAre(Pair("Name", "host1"), Pair("Vendor", "Maker"), Pair("Model", "Model X")));
    }
    const char* nothing[] = {nullptr};
    EXPECT_TRUE(get(path({{"Name", text("host1")}}), nothing).ok());
    EXPECT_THAT(propertiesOf(instances().back()), ElementsAre(Pair("Name", "host1")));
}

TEST_F(OstrelComputerSystemProviderTest, RejectsOtherClasses) {
    const cimhost::Status status = enumerateNames(path({}, "VELKO_Lease"));
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(status.message, "This provider serves VELKO_ComputerSystem only");
    EXPECT_EQ(enumerateNames(nullptr).rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(get(path({{"Name", text("host1")}}, "VELKO_Lease")).rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_THAT(events, IsEmpty());
}

TEST_F(OstrelComputerSystemProviderTest, IsReadOnlyAndDoesNotSupportQueries) {
    const CMPIInstanceMIFT& functions = *mi->ft;
    CMPIObjectPath* object = path({{"Name", text("host1")}});
    CMPIInstance* instance = scope.instance({});
    EXPECT_EQ(functions.createInstance(mi, context, result, object, instance).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(functions.modifyInstance(mi, context, result, object, instance, nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(functions.deleteInstance(mi, context, result, object).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(functions.execQuery(mi, context, result, object, "WQL", "select *").rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(events, IsEmpty());
}

TEST_F(OstrelComputerSystemProviderTest, WorksAfterCleanup) {
    EXPECT_EQ(mi->ft->cleanup(mi, context, 1).rc, CMPI_RC_OK);
    EXPECT_EQ(mi->ft->cleanup(mi, context, 0).rc, CMPI_RC_OK);
    EXPECT_TRUE(enumerate().ok());
    EXPECT_EQ(instances().size(), 2U);
}

TEST_F(OstrelComputerSystemProviderTest, ReportsThatTheBrokerCannotCreateAnObject) {
    cimhost::FunctionTables tables = cimhost::standardTables();
    tables.encapsulation.newInstance = [](const CMPIBroker*, const CMPIObjectPath*,
                                          CMPIStatus* status) -> CMPIInstance* {
        status->rc = CMPI_RC_ERR_FAILED;
        return nullptr;
    };
    cimhost::BrokerOptions options;
    options.tables = &tables;
    const cimhost::Broker failing(options);
    mi = OstrelComputerSystemProvider_Create_InstanceMI(failing.handle(), context, nullptr);
    EXPECT_EQ(enumerate().rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(get(path({{"Name", text("host1")}})).rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(events, IsEmpty());
}

TEST_F(OstrelComputerSystemProviderTest, ServesConcurrentRequests) {
    std::vector<std::thread> threads;
    std::vector<std::size_t> counts(4);
    for (std::size_t& count : counts) {
        threads.emplace_back([this, &count] {
            for (int round = 0; round < 50; ++round) {
                cimhost::RequestScope request(host);
                cimhost::ResultEvents answers;
                const CMPIObjectPath* all = request.objectPath({"", "root/other", "VELKO_ComputerSystem", {}});
                mi->ft->enumerateInstances(mi, request.context({}), request.result(answers), all, nullptr);
                count += cimhost::eventsOf<Instance>(answers).size();
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_THAT(counts, ElementsAre(100U, 100U, 100U, 100U));
}

}  // namespace
