#include <stdexcept>

#include "BrokerFixture.h"

namespace {

using cimhost::Operation;
using cimhost::Request;
using cimhost::Response;

/** Responds to some operations with their arguments. */
class Echo : public cimhost::UpCalls {
public:
    Response perform(Request request) override {
        last = request;
        if (request.path.className == "Throwing") {
            throw std::runtime_error("broken");
        }
        if (request.path.className == "Failing") {
            return Response::failed({CMPI_RC_ERR_ACCESS_DENIED, "not you"});
        }
        switch (request.operation) {
            case Operation::enumerateInstances:
                return Response::ofInstances({{request.path, {}}, {{{}, request.path.nameSpace, "Second", {}}, {}}});
            case Operation::associatorNames:
                return Response::ofPaths({request.path});
            case Operation::getInstance:
                return Response::ofInstances({{request.path, {testsupport::named("P", testsupport::uint32(1))}}});
            case Operation::createInstance:
                return Response::ofPaths({request.instance.path});
            case Operation::deleteInstance:
                return {};
            case Operation::invokeMethod:
                return Response::ofValue(testsupport::text(request.member), request.input);
            default:
                return cimhost::notSupported(request.operation);
        }
    }

    Request last;
};

class UpCallTest : public BrokerTest {
protected:
    static cimhost::BrokerOptions options(Echo& echo) {
        cimhost::BrokerOptions made;
        made.upCalls = &echo;
        return made;
    }

    UpCallTest() : calling(options(echo)), request(calling) {}

    const CMPIBroker* caller() const { return calling.handle(); }
    const CMPIBrokerFT& up() const { return *caller()->bft; }

    Echo echo;
    cimhost::Broker calling;
    cimhost::RequestScope request;
    const CMPIContext* context = request.context({testsupport::named("Mine", testsupport::text("kept"))});
};

TEST_F(UpCallTest, AnEnumerationCanBeIteratedOnce) {
    const CMPIEnumeration* found = up().enumerateInstances(caller(), context, newPath("First"), nullptr, &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(found->ft->hasNext(found, &status), 1);
    const CMPIData first = found->ft->getNext(found, &status);
    ASSERT_EQ(first.type, CMPI_instance);
    const CMPIObjectPath* path = first.value.inst->ft->getObjectPath(first.value.inst, nullptr);
    EXPECT_EQ(characters(path->ft->getClassName(path, nullptr)), "First");
    found->ft->getNext(found, &status);
    EXPECT_EQ(found->ft->hasNext(found, &status), 0);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(found->ft->getNext(found, &status).state, CMPI_badValue);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    const CMPIArray* all = found->ft->toArray(found, nullptr);
    EXPECT_EQ(all->ft->getSize(all, nullptr), 2U);
}

TEST_F(UpCallTest, ContextAndPropertyListArePassed) {
    const char* list[] = {"A", "B", nullptr};
    up().enumerateInstances(caller(), context, newPath(), list, &status);
    EXPECT_EQ(testsupport::stringOf(echo.last.context, "Mine"), "kept");
    EXPECT_EQ(echo.last.properties, (std::vector<std::string>{"A", "B"}));
    up().enumerateInstances(caller(), nullptr, newPath(), nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(echo.last.properties, std::nullopt);
}

TEST_F(UpCallTest, AFilterDistinguishesNullAndEmpty) {
    up().associatorNames(caller(), context, newPath(), "Assoc", "", nullptr, "Role", &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(echo.last.filter.associationClass, "Assoc");
    EXPECT_EQ(echo.last.filter.resultClass, "");
    EXPECT_EQ(echo.last.filter.role, std::nullopt);
    EXPECT_EQ(echo.last.filter.resultRole, "Role");
}

TEST_F(UpCallTest, OperationsForOneObjectReturnIt) {
    const CMPIInstance* instance = up().getInstance(caller(), context, newPath(), nullptr, &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(instance->ft->getProperty(instance, "P", nullptr).value.uint32, 1U);
    const CMPIObjectPath* path = up().createInstance(caller(), context, newPath(), newInstance("New"), &status);
    EXPECT_EQ(characters(path->ft->getClassName(path, nullptr)), "New");
    EXPECT_EQ(up().deleteInstance(caller(), context, path).rc, CMPI_RC_OK);
}

TEST_F(UpCallTest, MethodsHaveOutput) {
    CMPIArgs* input = make().newArgs(handle(), nullptr);
    input->ft->addArg(input, "A", charsValue("x"), CMPI_chars);
    CMPIArgs* output = make().newArgs(handle(), nullptr);
    const CMPIData answer = up().invokeMethod(caller(), context, newPath(), "M", input, output, &status);
    EXPECT_EQ(characters(answer.value.string), "M");
    EXPECT_EQ(output->ft->getArgCount(output, nullptr), 1U);
}

TEST_F(UpCallTest, FailuresHaveTheirMessages) {
    EXPECT_EQ(up().enumerateInstances(caller(), context, newPath("Failing"), nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(characters(status.msg), "not you");
    EXPECT_EQ(up().enumerateInstances(caller(), context, newPath("Throwing"), nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(characters(status.msg), "broken");
}

TEST_F(UpCallTest, UnimplementedOperationsAreNotSupported) {
    EXPECT_EQ(up().modifyInstance(caller(), context, newPath(), newInstance(), nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(up().execQuery(caller(), context, newPath(), "q", "WQL", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(up().deliverIndication(caller(), context, "root", newInstance()).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(handle()->bft->enumerateInstanceNames(handle(), context, newPath(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(up().setProperty(caller(), context, newPath(), "P", charsValue("x"), CMPI_chars).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    up().getProperty(caller(), context, newPath(), "P", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

}  // namespace
