#include "OperationsFixture.h"

namespace {

using cimhost::Instance;
using cimhost::ObjectPath;
using cimhost::Request;
using testsupport::stringOf;
using testsupport::text;

class ObjectManagerTest : public OperationsTest {
protected:
    cimhost::Response create(const char* className, const char* name) {
        return manager().perform(Request::createInstance(named(className, name), {}));
    }
};

TEST_F(ObjectManagerTest, CreatesFindsAndDeletes) {
    const auto created = create("Sample_Thing", "a");
    ASSERT_TRUE(created.ok()) << created.status.message;
    EXPECT_EQ(testsupport::toText(created.path()), "root/cimv2:Sample_Thing.Name=\"a\"");
    const auto names = manager().perform(Request::enumerateInstanceNames(classPath("Sample_Thing")));
    ASSERT_EQ(names.paths.size(), 1U);
    EXPECT_EQ(stringOf(names.path().keys, "Name"), "a");
    const auto found = manager().perform(Request::getInstance(created.path()));
    EXPECT_EQ(stringOf(found.instance().properties, "Name"), "a");
    EXPECT_TRUE(manager().perform(Request::deleteInstance(created.path())).ok());
    EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Sample_Thing"))).instances.empty());
}

TEST_F(ObjectManagerTest, GetInstanceWithoutAnInstanceIsNotFound) {
    const auto found = manager().perform(Request::getInstance(named("Sample_Thing", "missing")));
    EXPECT_EQ(found.status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_THAT(found.status.message, testing::HasSubstr("Sample_Thing.Name=\"missing\""));
}

TEST_F(ObjectManagerTest, CreateInstanceMayReturnAnInstance) {
    const auto created = create("Sample_ReturnsInstance", "b");
    ASSERT_TRUE(created.ok());
    EXPECT_EQ(testsupport::toText(created.path()), "root/cimv2:Sample_Thing.Name=\"b\"");
}

TEST_F(ObjectManagerTest, CreateInstanceMustReturnAResult) {
    const auto created = create("Sample_Silent", "c");
    EXPECT_EQ(created.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(created.status.message, testing::HasSubstr("returned neither a path nor an instance"));
}

TEST_F(ObjectManagerTest, CreatePassesKeysThenProperties) {
    Instance given;
    given.properties = {testsupport::named("Colour", text("red"))};
    ASSERT_TRUE(manager().perform(Request::createInstance(named("Sample_Thing", "d"), given)).ok());
    const auto found = manager().perform(Request::getInstance(named("Sample_Thing", "d")));
    EXPECT_EQ(stringOf(found.instance().properties, "Text"), "Name=d;Colour=red;");
}

TEST_F(ObjectManagerTest, CreatePassesNoKeyTwice) {
    Instance given;
    given.properties = {testsupport::named("Colour", text("red")), testsupport::named("NAME", text("e"))};
    ASSERT_TRUE(manager().perform(Request::createInstance(named("Sample_Thing", "e"), given)).ok());
    const auto found = manager().perform(Request::getInstance(named("Sample_Thing", "e")));
    EXPECT_EQ(stringOf(found.instance().properties, "Text"), "Colour=red;NAME=e;");
}

TEST_F(ObjectManagerTest, ModifyPassesExactlyTheProperties) {
    create("Sample_Thing", "f");
    Instance given;
    given.properties = {testsupport::named("Colour", text("blue"))};
    ASSERT_TRUE(manager().perform(Request::modifyInstance(named("Sample_Thing", "f"), given)).ok());
    const auto found = manager().perform(Request::getInstance(named("Sample_Thing", "f")));
    EXPECT_EQ(stringOf(found.instance().properties, "Text"), "Colour=blue;");
}

TEST_F(ObjectManagerTest, AFailureWithoutAMessageReceivesADefaultMessage) {
    const auto status = manager().perform(Request::deleteInstance(named("Sample_Thing", "missing"))).status;
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_FALSE(status.message.empty());
}

TEST_F(ObjectManagerTest, AFailureHasItsMessageAndNoResults) {
    const auto found = manager().perform(Request::enumerateInstances(classPath("Sample_Failing")));
    EXPECT_EQ(found.status.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(found.status.message, "not for you");
    EXPECT_TRUE(found.instances.empty());
}

TEST_F(ObjectManagerTest, AnUnknownClassIsInvalid) {
    const auto found = manager().perform(Request::enumerateInstances(classPath("Missing")));
    EXPECT_EQ(found.status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_THAT(found.status.message, testing::AllOf(testing::HasSubstr("Missing"), testing::HasSubstr("root/cimv2")));
    EXPECT_EQ(manager().perform(Request::enumerateInstances(classPath("Sample_OtherLink"))).status.rc,
              CMPI_RC_ERR_INVALID_CLASS)
        << "registered as an association only";
}

TEST_F(ObjectManagerTest, AnUnknownNameSpaceIsInvalid) {
    const auto found =
        manager().perform(Request::enumerateInstances(testsupport::objectPath("root/nowhere", "Sample_Thing")));
    EXPECT_EQ(found.status.rc, CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_THAT(found.status.message, testing::HasSubstr("root/nowhere"));
}

TEST_F(ObjectManagerTest, NamesIgnoreLetterCase) {
    EXPECT_TRUE(
        manager().perform(Request::enumerateInstances(testsupport::objectPath("ROOT/cimV2", "sample_THING"))).ok());
}

TEST_F(ObjectManagerTest, ResultsOfTheWrongKindAreAFailure) {
    const auto names = manager().perform(Request::enumerateInstanceNames(classPath("Sample_WrongKind")));
    EXPECT_EQ(names.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(names.status.message, testing::HasSubstr("EnumerateInstanceNames"));
}

TEST_F(ObjectManagerTest, APropertyListReachesTheProvider) {
    create("Sample_Thing", "g");
    const auto found = manager().perform(
        Request::enumerateInstances(classPath("Sample_Thing"), std::vector<std::string>{"Wanted", "Also"}));
    ASSERT_EQ(found.instances.size(), 1U);
    EXPECT_EQ(stringOf(found.instance().properties, "Text"), "Wanted");
}

TEST_F(ObjectManagerTest, CompletesTheContext) {
    const auto plain = manager().perform(Request::enumerateInstances(classPath("Sample_Context")));
    EXPECT_EQ(stringOf(plain.instance().properties, "Name"), "root/cimv2;;0");
    const cimhost::ContextEntries given{testsupport::named("cmpiPrincipal", text("anna")),
                                        testsupport::named(CMPIInvocationFlags, testsupport::uint32(4))};
    const auto own = manager().perform(Request::enumerateInstances(classPath("Sample_Context")).with(given));
    EXPECT_EQ(stringOf(own.instance().properties, "Name"), "root/cimv2;anna;4");
}

TEST_F(ObjectManagerTest, OptionsAddContextEntriesToEachRequest) {
    options.context = {testsupport::named(CMPIPrincipal, text("daemon"))};
    const auto found = manager().perform(Request::enumerateInstances(classPath("Sample_Context")));
    EXPECT_EQ(stringOf(found.instance().properties, "Name"), "root/cimv2;daemon;0");
}

TEST_F(ObjectManagerTest, AnExceptionOfAProviderIsAFailure) {
    const auto thrown = manager().perform(Request::enumerateInstances(classPath("Sample_Throwing")));
    EXPECT_EQ(thrown.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(thrown.status.message, testing::HasSubstr("out of paper"));
    EXPECT_EQ(manager().perform(Request::enumerateInstances(classPath("Sample_ThrowingOdd"))).status.rc,
              CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Sample_Thing"))).ok()) << "after failures";
}

TEST_F(ObjectManagerTest, TheResponseContainsThatOfTheProvider) {
    cimhost::Request request;
    request.path = classPath("Sample_Failing");
    auto failing = manager().perform(request);
    ASSERT_FALSE(failing.ok());
    ASSERT_EQ(failing.providers.size(), 1U);
    EXPECT_EQ(failing.providers.front().status.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_TRUE(failing.providers.front().hasMessage);
    EXPECT_FALSE(failing.providers.front().threw);
    EXPECT_EQ(cimhost::eventsOf<Instance>(failing.providers.front().events).size(), 1U);
    EXPECT_EQ(failing.providers.front().doneCount(), 0);

    request.path = classPath("Sample_Throwing");
    EXPECT_TRUE(manager().perform(request).providers.front().threw);
    request.path = classPath("Sample_Thing");
    EXPECT_EQ(manager().perform(request).providers.front().doneCount(), 1);
}

// Up-calls.

TEST_F(ObjectManagerTest, AnUpCallReachesTheSameLibrary) {
    create("Sample_Thing", "h");
    const auto found = manager().perform(Request::enumerateInstances(classPath("Sample_CallsSample_Thing")));
    ASSERT_EQ(found.instances.size(), 1U) << found.status.message;
    EXPECT_EQ(stringOf(found.instance().properties, "Name"), "h");
}

TEST_F(ObjectManagerTest, AnUpCallReachesAnotherLibrary) {
    const auto found = manager().perform(Request::enumerateInstances(classPath("Sample_CallsOther_Thing")));
    ASSERT_EQ(found.instances.size(), 1U) << found.status.message;
    EXPECT_EQ(found.instance().path.className, "Other_Thing");
}

TEST_F(ObjectManagerTest, UpCallsNest) {
    const auto found = manager().perform(Request::getInstance(named("Sample_Recursive", "3")));
    ASSERT_TRUE(found.ok()) << found.status.message;
    EXPECT_EQ(stringOf(found.instance().properties, "Below"), "3>Below=2>Below=1>Below=0>bottom;;;");
}

TEST_F(ObjectManagerTest, AFailingUpCallReturnsItsStatus) {
    const auto missing = manager().perform(Request::enumerateInstances(classPath("Sample_CallsMissing")));
    EXPECT_EQ(missing.status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_THAT(missing.status.message, testing::HasSubstr("Missing"));
    const auto throwing = manager().perform(Request::enumerateInstances(classPath("Sample_CallsSample_Throwing")));
    EXPECT_EQ(throwing.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(throwing.status.message, testing::HasSubstr("out of paper"));
    const auto unloadable = manager().perform(Request::enumerateInstances(classPath("Sample_CallsUnloadable")));
    EXPECT_EQ(unloadable.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(unloadable.status.message, testing::HasSubstr("libDoesNotExist.so"));
}

// Associations.

TEST_F(ObjectManagerTest, AnAssociationClassSelectsItsProvider) {
    const cimhost::AssociationFilter filter{"sample_link", "Far", "Here", std::nullopt};
    const auto found = manager().perform(Request::associators(named("Sample_Thing", "x"), filter));
    ASSERT_EQ(found.instances.size(), 1U) << found.status.message;
    EXPECT_EQ(stringOf(found.instance().properties, "Asked"), "sample_link,Far,Here,none");
}

TEST_F(ObjectManagerTest, WithoutAClassAllAssociationProvidersAreCalled) {
    const auto found = manager().perform(Request::associatorNames(named("Sample_Thing", "x"), {}));
    ASSERT_EQ(found.paths.size(), 2U);
    EXPECT_EQ(stringOf(found.paths[0].keys, "Asked"), "Sample_Link");
    EXPECT_EQ(stringOf(found.paths[1].keys, "Asked"), "Sample_OtherLink");
}

TEST_F(ObjectManagerTest, ASuperclassSelectsAllItsAssociations) {
    auto shape = std::make_shared<cimhost::ClassInfo>();
    shape->name = "Sample_OtherLink";
    shape->superclasses = {"Sample_AnyLink"};
    options.classInfo = [shape](const std::string& name) {
        return name == shape->name ? shape : std::shared_ptr<const cimhost::ClassInfo>();
    };
    const auto found =
        manager().perform(Request::associatorNames(named("Sample_Thing", "x"), {"Sample_AnyLink", {}, {}, {}}));
    ASSERT_EQ(found.paths.size(), 1U);
    EXPECT_EQ(stringOf(found.paths[0].keys, "Asked"), "Sample_OtherLink");
}

TEST_F(ObjectManagerTest, AnUnknownAssociationIsInvalid) {
    const auto found =
        manager().perform(Request::associators(named("Sample_Thing", "x"), {"Sample_Thing", {}, {}, {}}));
    EXPECT_EQ(found.status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_THAT(found.status.message, testing::HasSubstr("No association provider"));
}

TEST_F(ObjectManagerTest, AProviderThatDoesNotSupportAnAssociationOperationIsSkipped) {
    const auto found = manager().perform(Request::references(named("Sample_Thing", "x"), {}));
    ASSERT_TRUE(found.ok()) << found.status.message;
    EXPECT_EQ(found.instances.size(), 1U);
    EXPECT_EQ(
        manager().perform(Request::references(named("Sample_Thing", "x"), {{}, "Sample_OtherLink", {}, {}})).status.rc,
        CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(manager().perform(Request::referenceNames(named("Sample_Thing", "x"), {})).status.rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
}

}  // namespace
