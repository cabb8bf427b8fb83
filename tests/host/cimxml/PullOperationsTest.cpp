#include "CimXmlFixture.h"

namespace cimhost::cimxml::test {
namespace {

class PullOperationsTest : public CimXmlTest {
protected:
    PullOperationsTest() {
        manager.answer = [](const Request& request) {
            Response response;
            for (int i = 0; i < 5; ++i) {
                const std::string name = request.path.className + std::to_string(i);
                response.instances.push_back(instanceOf("Other", name));
                response.paths.push_back(pathOf("Other", name));
            }
            (returnsPaths(request.operation) ? response.instances.clear() : response.paths.clear());
            return response;
        };
    }

    static std::string outputOf(const XmlElement& result, const std::string& name) {
        for (const XmlElement& each : result.children) {
            if (each.name == "PARAMVALUE" && *each.attribute("NAME") == name) {
                return each.child("VALUE")->characters;
            }
        }
        return "absent";
    }

    XmlElement open(const std::string& parameters, const std::string& operation = "OpenEnumerateInstances") {
        return response(operation, className("ClassName", "Other") + parameters);
    }

    XmlElement pull(const std::string& context, int count, const std::string& operation = "PullInstancesWithPath") {
        return response(operation,
                        value("EnumerationContext", context) + value("MaxObjectCount", std::to_string(count)));
    }
};

TEST_F(PullOperationsTest, AnEnumerationIsReadInParts) {
    const XmlElement opened = open(value("MaxObjectCount", "2"));
    EXPECT_EQ(returned(opened).size(), 2U);
    EXPECT_EQ(returned(opened)[0].name, "VALUE.INSTANCEWITHPATH");
    EXPECT_EQ(outputOf(opened, "EndOfSequence"), "FALSE");
    const std::string context = outputOf(opened, "EnumerationContext");
    const XmlElement second = pull(context, 2);
    EXPECT_EQ(returned(second).size(), 2U);
    EXPECT_EQ(outputOf(second, "EnumerationContext"), context);
    const XmlElement last = pull(context, 2);
    EXPECT_EQ(returned(last).size(), 1U);
    EXPECT_EQ(outputOf(last, "EndOfSequence"), "TRUE");
    EXPECT_EQ(statusOf(pull(context, 2)), 21);
}

TEST_F(PullOperationsTest, OpeningReturnsNoObjectsByDefault) {
    const XmlElement opened = open("", "OpenEnumerateInstancePaths");
    EXPECT_TRUE(returned(opened).empty());
    const XmlElement paths = pull(outputOf(opened, "EnumerationContext"), 100, "PullInstancePaths");
    EXPECT_EQ(returned(paths).size(), 5U);
    EXPECT_EQ(returned(paths)[0].name, "INSTANCEPATH");
    EXPECT_EQ(outputOf(paths, "EndOfSequence"), "TRUE");
}

TEST_F(PullOperationsTest, AssociationsCanBePulled) {
    for (const char* operation : {"OpenAssociatorInstances", "OpenReferenceInstances"}) {
        const XmlElement opened =
            response(operation, parameter("InstanceName", instanceName("Base", "a")) + value("MaxObjectCount", "9"));
        EXPECT_EQ(returned(opened).size(), 5U) << operation;
        const XmlElement paths =
            response(std::string(operation, std::string(operation).size() - 1) + "Paths",
                     parameter("InstanceName", instanceName("Base", "a")) + value("MaxObjectCount", "9"));
        EXPECT_EQ(returned(paths).size(), 5U) << operation;
    }
}

TEST_F(PullOperationsTest, AClosedEnumerationIsUnknown) {
    const std::string context = outputOf(open(""), "EnumerationContext");
    EXPECT_EQ(statusOf(response("CloseEnumeration", value("EnumerationContext", context))), 0);
    EXPECT_EQ(statusOf(pull(context, 1)), 21);
    EXPECT_EQ(statusOf(response("CloseEnumeration", value("EnumerationContext", context))), 21);
}

TEST_F(PullOperationsTest, AnEnumerationIsPulledOnlyByItsUserInItsNamespaceAndKind) {
    const std::string context = outputOf(open(""), "EnumerationContext");
    EXPECT_EQ(statusOf(pull(context, 1, "PullInstancePaths")), 21);
    const std::string parameters = value("EnumerationContext", context) + value("MaxObjectCount", "1");
    EXPECT_EQ(statusOf(response("PullInstancesWithPath", parameters, "interop")), 21);
    EXPECT_EQ(statusOf(respondedTo(request("PullInstancesWithPath", parameters), {"mallory", true})), 21);
    EXPECT_EQ(returned(pull(context, 1)).size(), 1U);
}

TEST_F(PullOperationsTest, LimitsAndUnsupportedOptionsHaveTheirStatus) {
    options.limits.open = 1;
    options.limits.longestTimeout = std::chrono::seconds(10);
    options.limits.mostObjects = 3;
    EXPECT_EQ(statusOf(open(value("OperationTimeout", "11"))), 22);
    EXPECT_EQ(statusOf(open(value("OperationTimeout", "0"))), 22);
    EXPECT_EQ(statusOf(open(value("FilterQueryLanguage", "DMTF:FQL"))), 25);
    EXPECT_EQ(statusOf(open(value("ContinueOnError", "true"))), 26);
    const std::string context = outputOf(open(value("OperationTimeout", "10")), "EnumerationContext");
    EXPECT_EQ(statusOf(open("")), 27);
    EXPECT_EQ(returned(pull(context, 100)).size(), 3U);
    EXPECT_EQ(statusOf(response("PullInstancesWithPath", value("EnumerationContext", context))),
              CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(PullOperationsTest, ResultsOfAllOpenEnumerationsAreLimited) {
    options.limits.results = 9;
    const std::string context = outputOf(open(value("MaxObjectCount", "1")), "EnumerationContext");  // 4 remain
    EXPECT_EQ(statusOf(open("")), 0);
    EXPECT_EQ(statusOf(open(value("MaxObjectCount", "4"))), 27);
    EXPECT_EQ(statusOf(open(value("MaxObjectCount", "5"))), 0);  // none remain
    EXPECT_EQ(returned(pull(context, 1)).size(), 1U);
    EXPECT_EQ(statusOf(open(value("MaxObjectCount", "4"))), 0);
    EXPECT_EQ(returned(pull(context, 1)).size(), 1U);  // also at the limit
}

TEST_F(PullOperationsTest, AUserOpensAtMostHalfOfTheEnumerations) {
    options.limits.open = 4;
    const auto openAs = [&](const std::string& user) {
        return statusOf(respondedTo(request("OpenEnumerateInstances", className("ClassName", "Other")), {user, true}));
    };
    EXPECT_EQ(openAs("alice"), 0);
    EXPECT_EQ(openAs("alice"), 0);
    EXPECT_EQ(openAs("alice"), 27);
    EXPECT_EQ(openAs("bob"), 0);
    EXPECT_EQ(openAs("bob"), 0);
    EXPECT_EQ(openAs("carol"), 27);
}

TEST(ResultCursorTest, AResultIsFreedWhenItIsWritten) {
    const ObjectWriter writer("host", "root/test");
    ResultCursor instances{Response::ofInstances({instanceOf("Other", "a"), instanceOf("Other", "b")})};
    std::string xml;
    instances.append(xml, writer);
    EXPECT_EQ(instances.results.instances[0].properties.capacity(), 0U);
    EXPECT_EQ(instances.results.instances[0].path.keys.capacity(), 0U);
    EXPECT_EQ(instances.results.instances[1].properties.size(), 1U);
    ResultCursor paths{Response::ofPaths({pathOf("Other", "a"), pathOf("Other", "b")}), ObjectForm::instanceName};
    paths.append(xml, writer);
    EXPECT_EQ(paths.results.paths[0].keys.capacity(), 0U);
    paths.append(xml, writer);
    EXPECT_EQ(paths.left(), 0U);
    EXPECT_THAT(xml, testing::HasSubstr(">b<"));
}

TEST_F(PullOperationsTest, TheTimeoutStartsWhenTheResponseHasBeenSent) {
    const Message message = readMessage(request("OpenEnumerateInstances", className("ClassName", "Other")));
    const auto longAfter = OpenEnumerations::Clock::now() + std::chrono::hours(1);
    options.limits.open = 1;
    {
        const ResponseText unsent(message, operations().perform(message, {}));
        operations().removeExpired(longAfter);
        EXPECT_EQ(statusOf(open("")), 27);
    }
    operations().removeExpired(longAfter);
    EXPECT_EQ(statusOf(open("")), 0);
}

TEST(OpenEnumerationsTest, EnumerationsExpireAfterTheirTimeout) {
    OpenEnumerations enumerations({});
    const auto start = OpenEnumerations::Clock::now();
    OpenEnumeration enumeration;
    enumeration.nameSpace = "root/test";
    enumeration.timeout = std::chrono::seconds(5);
    const auto open = [&] {
        const std::string identifier = enumerations.keep(enumeration, "", start).value();
        enumerations.startTimeout(identifier, start);
        return identifier;
    };
    const std::string identifier = open();
    EXPECT_FALSE(enumerations.take(identifier, "root/test", "", start + std::chrono::seconds(5)));
    EXPECT_EQ(enumerations.size(), 0U);
    open();
    enumerations.removeExpired(start + std::chrono::seconds(4));
    EXPECT_EQ(enumerations.size(), 1U);
    enumerations.removeExpired(start + std::chrono::seconds(5));
    EXPECT_EQ(enumerations.size(), 0U);
    const std::string another = open();
    EXPECT_TRUE(enumerations.take(another, "ROOT/test", "", start + std::chrono::seconds(4)));
    EXPECT_NE(identifier, another);
}

}  // namespace
}  // namespace cimhost::cimxml::test
