#include <sstream>
#include <thread>
#include <utility>

#include "cim/Names.h"
#include "host/operations/OperationsFixture.h"
#include "lab/emulation/ManagerEmulation.h"

// Differences between the standard behaviour, SFCB and OpenPegasus, one test each.

namespace {

using cimhost::Instance;
using cimhost::ObjectPath;
using cimhost::PropertyList;
using cimhost::Request;
using cimhost::lab::Manager;
using testing::HasSubstr;
using testing::StartsWith;
using testsupport::stringOf;
using testsupport::text;

class EmulationTest : public OperationsTest {
protected:
    EmulationTest() {
        registry = {};
        add("Unloadable", "Absent", "DoesNotExist", true, false);
        for (const char* className :
             {"Echo_Seen", "Echo_Thing", "Echo_Broker", "Echo_Thread", "Echo_Calls", "Echo_Throwing",
              "Echo_ReturnsInstance", "Echo_ReturnsBoth", "Echo_ReturnsNothing", "Echo_ReleasesPath"}) {
            add(className, "Echo", "EchoProvider", true, false);
        }
        add("Echo_Link", "Echo", "EchoProvider", false, true);
        add("Echo_OtherLink", "Echo", "EchoProvider", false, true);
        add("Curious_Thing", "Curious", "EchoProvider", true, false);
        options.classInfo = [](const std::string& name) { return infoOf(name); };
    }

    /** Starts an object manager that emulates another one. */
    cimhost::ObjectManager& as(Manager which) {
        started.reset();
        log.clear();
        options.behaviour = cimhost::lab::emulationOf(which);
        return manager();
    }

    static std::shared_ptr<const cimhost::ClassInfo> infoOf(const std::string& name) {
        auto info = std::make_shared<cimhost::ClassInfo>();
        if (cim::foldedName(name) == "echo_thing") {
            info->name = "Echo_Thing";
            info->properties = {{"Name", CMPI_string, false, true, {}},
                                {"Text", CMPI_string, false, false, {}},
                                {"Size", CMPI_uint32, false, false, {}}};
            return info;
        }
        if (name == "Echo_Link") {
            info->name = name;
            info->properties = {{"End", CMPI_ref, false, true, "Echo_Thing"}};
            return info;
        }
        return nullptr;
    }

    static ObjectPath path(const char* className, const char* name) { return OperationsTest::named(className, name); }

    static cimhost::NamedValue with(const char* name, cimhost::Value value) {
        return testsupport::named(name, std::move(value));
    }

    /** The provider's description when this class is enumerated. */
    std::string reported(const char* className) {
        const auto found = manager().perform(Request::enumerateInstances(classPath(className)));
        EXPECT_TRUE(found.ok()) << found.status.message;
        return found.instances.empty() ? "" : stringOf(found.instance().properties, "Text").value_or("");
    }

    std::string seen() { return reported("Echo_Seen"); }

    cimhost::Response create(const char* className) {
        return manager().perform(Request::createInstance(path(className, "a"), {}));
    }

    /** The provider's description of a creation of Echo_Thing.Name="a" with these properties. */
    std::string seenOfCreation(std::vector<cimhost::NamedValue> properties = {}) {
        EXPECT_TRUE(
            manager().perform(Request::createInstance(path("Echo_Thing", "a"), {{}, std::move(properties)})).ok());
        return seen();
    }

    std::string seenOfModification(std::vector<cimhost::NamedValue> properties, const PropertyList& list) {
        EXPECT_TRUE(manager()
                        .perform(Request::modifyInstance(path("Echo_Thing", "a"), {{}, std::move(properties)}, list))
                        .ok());
        return seen();
    }

    std::string seenOfEnumeration(const PropertyList& list = {}) {
        manager().perform(Request::enumerateInstances(classPath("Echo_Thing"), list));
        return seen();
    }
};

TEST_F(EmulationTest, ManagersHaveNames) {
    EXPECT_EQ(cimhost::lab::managerNamed("standard"), Manager::standard);
    EXPECT_EQ(cimhost::lab::managerNamed("sfcb"), Manager::sfcb);
    EXPECT_EQ(cimhost::lab::managerNamed("pegasus"), Manager::openPegasus);
    EXPECT_EQ(cimhost::lab::managerNamed("pegasus-empty-key"), Manager::openPegasusEmptyKey);
    EXPECT_EQ(cimhost::lab::managerNamed("SFCB"), std::nullopt);
    for (const Manager manager : cimhost::lab::everyManager) {
        EXPECT_EQ(cimhost::lab::managerNamed(cimhost::lab::nameOf(manager)), manager);
    }
}

TEST_F(EmulationTest, TheBrokerHasTheVersionsAndMissingFunctionsOfTheManager) {
    as(Manager::standard);
    EXPECT_EQ(reported("Echo_Broker"), "version 200/200");
    as(Manager::sfcb);
    EXPECT_EQ(reported("Echo_Broker"), "version 0/1, no errors and messages, no joining, only marks");
    as(Manager::openPegasus);
    EXPECT_EQ(reported("Echo_Broker"), "version 200/200, no memory table");
}

TEST_F(EmulationTest, ThePrincipalIsEmptyOrLacksCharacters) {
    as(Manager::standard);
    EXPECT_THAT(seenOfEnumeration(), HasSubstr("CMPIPrincipal=;CMPIRole=(error 12)"));
    as(Manager::sfcb);
    EXPECT_THAT(seenOfEnumeration(), HasSubstr("CMPIPrincipal=(without characters);CMPIRole=(without characters);"));
    as(Manager::openPegasus);
    EXPECT_THAT(seenOfEnumeration(), HasSubstr("CMPIPrincipal=;CMPIRole=(error 12)"));
}

TEST_F(EmulationTest, AConfiguredPrincipalIsUnchanged) {
    as(Manager::sfcb);
    manager().perform(Request::enumerateInstances(classPath("Echo_Thing")).with({with(CMPIPrincipal, text("anna"))}));
    EXPECT_THAT(seen(), HasSubstr("CMPIPrincipal=anna;"));
}

// Creation.

TEST_F(EmulationTest, ACreationHasTheSentOrAllProperties) {
    as(Manager::standard);
    EXPECT_EQ(seenOfCreation(), "Echo_Thing.Name=a; Name=a;");
    as(Manager::sfcb);
    EXPECT_EQ(seenOfCreation(), "Echo_Thing.Name=a; Name=a;Text=(null without characters);Size=(null);");
    EXPECT_EQ(seenOfCreation({with("SIZE", testsupport::uint32(5))}),
              "Echo_Thing.Name=a; Name=a;Text=(null without characters);SIZE=5;");
}

TEST_F(EmulationTest, ACreationMayHaveAKeyThatIsCountedButCannotBeRead) {
    as(Manager::openPegasus);
    EXPECT_EQ(seenOfCreation({with("Text", text("t"))}), "Echo_Thing.Name=(error 6, null); Name=a;Text=t;Size=(null);");
    manager().perform(Request::getInstance(path("Echo_Thing", "there")));
    EXPECT_THAT(seen(), StartsWith("Echo_Thing.Name=there;")) << "other operations have their keys";
}

TEST_F(EmulationTest, ACreationMayHaveAnEmptyKey) {
    as(Manager::openPegasusEmptyKey);
    EXPECT_EQ(seenOfCreation({with("Text", text("t"))}), "Echo_Thing.Name=; Name=a;Text=t;Size=(null);");
}

TEST_F(EmulationTest, APathWithoutKeysMayReceiveThoseOfTheInstance) {
    as(Manager::sfcb);
    ASSERT_TRUE(
        manager().perform(Request::createInstance(classPath("Echo_Thing"), {{}, {with("Name", text("b"))}})).ok());
    EXPECT_THAT(seen(), StartsWith("Echo_Thing.Name=b; Name=b;"));
    as(Manager::openPegasus);
    ASSERT_TRUE(
        manager().perform(Request::createInstance(classPath("Echo_Thing"), {{}, {with("Name", text("b"))}})).ok());
    EXPECT_THAT(seen(), StartsWith("Echo_Thing.Name=(error 6, null); Name=b;"));
}

TEST_F(EmulationTest, ACreationReturnsThePathOfTheProvider) {
    for (const Manager each : cimhost::lab::everyManager) {
        as(each);
        EXPECT_EQ(testsupport::toText(create("Echo_Thing").path()), "root/cimv2:Echo_Thing.Name=\"made\"");
    }
}

TEST_F(EmulationTest, AnInstanceFromACreationIsAcceptedMisreadOrRejected) {
    as(Manager::standard);
    EXPECT_EQ(testsupport::toText(create("Echo_ReturnsInstance").path()),
              "root/cimv2:Echo_ReturnsInstance.Text=\"an instance\"");
    EXPECT_EQ(seen(), "instance 0");
    as(Manager::sfcb);
    const auto misread = create("Echo_ReturnsInstance");
    EXPECT_TRUE(misread.ok()) << "the client receives a success";
    EXPECT_EQ(misread.path().className, "root/cimv2");
    EXPECT_TRUE(misread.path().keys.empty());
    EXPECT_EQ(seen(), "instance 0");
    as(Manager::openPegasus);
    const auto broken = create("Echo_ReturnsInstance");
    EXPECT_EQ(broken.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(broken.status.message, HasSubstr("broken response"));
    EXPECT_EQ(seen(), "instance 7");
}

TEST_F(EmulationTest, APathReplacesARejectedInstance) {
    as(Manager::openPegasus);
    EXPECT_EQ(testsupport::toText(create("Echo_ReturnsBoth").path()), "root/cimv2:Echo_ReturnsBoth.Name=\"made\"");
    as(Manager::sfcb);
    EXPECT_EQ(create("Echo_ReturnsBoth").path().className, "root/cimv2") << "the first result counts";
}

TEST_F(EmulationTest, ACreationWithoutResultCrashesOrBreaksTheResponse) {
    as(Manager::standard);
    EXPECT_THAT(create("Echo_ReturnsNothing").status.message, HasSubstr("neither a path nor an instance"));
    as(Manager::sfcb);
    const auto fatal = create("Echo_ReturnsNothing");
    EXPECT_EQ(fatal.status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(fatal.status.message, StartsWith("The manager's provider process would have died: "));
    as(Manager::openPegasus);
    EXPECT_THAT(create("Echo_ReturnsNothing").status.message, HasSubstr("broken response"));
}

TEST_F(EmulationTest, APathThatIsReleasedAfterItWasReturnedMayEndTheProcess) {
    as(Manager::standard);
    EXPECT_TRUE(create("Echo_ReleasesPath").ok());
    as(Manager::openPegasus);
    EXPECT_TRUE(create("Echo_ReleasesPath").ok());
    as(Manager::sfcb);
    EXPECT_THAT(create("Echo_ReleasesPath").status.message,
                "The manager's provider process would have died: The provider released the path that it had returned.");
}

// Modification, get, property lists.

TEST_F(EmulationTest, AModificationHasTheSentOrAllProperties) {
    const std::vector<cimhost::NamedValue> changes{with("Size", testsupport::uint32(5))};
    as(Manager::standard);
    EXPECT_EQ(seenOfModification(changes, {}), "Echo_Thing.Name=a; Size=5; null");
    as(Manager::sfcb);
    EXPECT_EQ(seenOfModification(changes, {}),
              "Echo_Thing.Name=a; Name=(null without characters);Text=(null without characters);Size=5; null");
    as(Manager::openPegasus);
    EXPECT_EQ(seenOfModification(changes, {}), "Echo_Thing.Name=a; Name=(null);Text=(null);Size=5; Name;Text;Size;");
}

TEST_F(EmulationTest, ModificationWithAListHasItAsSentOrWithTheKeys) {
    const std::vector<cimhost::NamedValue> changes{with("Text", text("t")), with("Size", testsupport::uint32(5))};
    const PropertyList list{{"Size"}};
    as(Manager::sfcb);
    EXPECT_EQ(seenOfModification(changes, list),
              "Echo_Thing.Name=a; Name=(null without characters);Text=t;Size=5; Size;");
    as(Manager::openPegasus);
    EXPECT_EQ(seenOfModification(changes, list), "Echo_Thing.Name=a; Name=(null);Text=t;Size=5; Size;Name;");
}

TEST_F(EmulationTest, APropertyListIsNullAsSentOrNamesAllProperties) {
    for (const Manager each : {Manager::standard, Manager::sfcb}) {
        as(each);
        EXPECT_THAT(seenOfEnumeration(), testing::EndsWith(",null"));
    }
    as(Manager::openPegasus);
    EXPECT_THAT(seenOfEnumeration(), testing::EndsWith(",Name;Text;Size;"));
    EXPECT_THAT(seenOfEnumeration({{"Size"}}), testing::EndsWith(",Size;"));
}

TEST_F(EmulationTest, GetWithoutAnInstanceIsNotFoundAndMayFailInReturnDone) {
    for (const auto& [each, done] : {std::pair(Manager::standard, "done 0 "), std::pair(Manager::sfcb, "done 0 "),
                                     std::pair(Manager::openPegasus, "done 1 Too few objects delivered.")}) {
        as(each);
        EXPECT_EQ(manager().perform(Request::getInstance(path("Echo_Thing", "missing"))).status.rc,
                  CMPI_RC_ERR_NOT_FOUND);
        EXPECT_THAT(seen(), HasSubstr(done));
        EXPECT_TRUE(manager().perform(Request::getInstance(path("Echo_Thing", "there"))).ok());
        EXPECT_THAT(seen(), HasSubstr("done 0"));
    }
}

TEST_F(EmulationTest, StringsLoseBlanksAndNonAsciiBytesAtTheirEnds) {
    const std::vector<cimhost::NamedValue> given{with("Text", text(" \xC3\xA9 a b\xC3\xA9 "))};
    as(Manager::standard);
    EXPECT_THAT(seenOfCreation(given), HasSubstr("Text= \xC3\xA9 a b\xC3\xA9 ;"));
    as(Manager::sfcb);
    EXPECT_THAT(seenOfCreation(given), HasSubstr("Text=a b;"));
    as(Manager::openPegasus);
    EXPECT_THAT(seenOfCreation(given), HasSubstr("Text=\xC3\xA9 a b\xC3\xA9;"));
}

TEST_F(EmulationTest, NamesKeepTheClientsLetterCase) {
    for (const Manager each : cimhost::lab::everyManager) {
        as(each);
        manager().perform(
            Request::getInstance(testsupport::objectPath("root/cimv2", "ECHO_thing", {with("nAmE", text("there"))})));
        EXPECT_THAT(seen(), StartsWith("ECHO_thing.nAmE=there;"));
    }
}

// Associations.

TEST_F(EmulationTest, AProviderReceivesItsAssociationClassOrThatOfTheClient) {
    const auto found = [this] { return manager().perform(Request::associators(path("Echo_Thing", "a"), {})); };
    as(Manager::standard);
    ASSERT_EQ(found().instances.size(), 2U);
    EXPECT_EQ(stringOf(found().instance().properties, "Text"), "Echo_Link,null");
    as(Manager::sfcb);
    ASSERT_EQ(found().instances.size(), 1U) << "the one provider is asked once";
    EXPECT_EQ(stringOf(found().instance().properties, "Text"), "none,null");
    as(Manager::openPegasus);
    ASSERT_EQ(found().instances.size(), 2U);
    EXPECT_EQ(stringOf(found().instance().properties, "Text"), "Echo_Link,Name;Text;Size;");
}

TEST_F(EmulationTest, AnAssociationClassThatTheClientSentReachesTheProviderAsSent) {
    for (const Manager each : cimhost::lab::everyManager) {
        as(each);
        const auto found = manager().perform(Request::associators(path("Echo_Thing", "a"), {"ECHO_Link", {}, {}, {}}));
        ASSERT_EQ(found.instances.size(), 1U);
        EXPECT_THAT(stringOf(found.instance().properties, "Text").value_or(""), StartsWith("ECHO_Link,"));
    }
}

TEST_F(EmulationTest, UnsupportedReferencesMayBeAnEmptyResult) {
    for (const Manager each : {Manager::standard, Manager::sfcb}) {
        as(each);
        EXPECT_EQ(manager().perform(Request::references(path("Echo_Thing", "a"), {})).status.rc,
                  CMPI_RC_ERR_NOT_SUPPORTED);
    }
    as(Manager::openPegasus);
    const auto found = manager().perform(Request::references(path("Echo_Thing", "a"), {}));
    EXPECT_TRUE(found.ok());
    EXPECT_TRUE(found.instances.empty());
    EXPECT_EQ(manager().perform(Request::associatorNames(path("Echo_Thing", "a"), {})).status.rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
}

// Threads, exceptions, factories.

TEST_F(EmulationTest, ARequestRunsOnTheCallersThreadOrASeparateOne) {
    std::ostringstream mine;
    mine << std::this_thread::get_id();
    as(Manager::standard);
    EXPECT_EQ(reported("Echo_Thread"), mine.str());
    for (const Manager each : {Manager::sfcb, Manager::openPegasus}) {
        as(each);
        EXPECT_NE(reported("Echo_Thread"), mine.str());
    }
}

TEST_F(EmulationTest, AnUpCallRunsOnTheProvidersThreadOrOnAnother) {
    for (const Manager each : {Manager::standard, Manager::sfcb}) {
        as(each);
        EXPECT_EQ(reported("Echo_Calls"), "same thread");
    }
    as(Manager::openPegasus);
    EXPECT_EQ(reported("Echo_Calls"), "another thread");
}

TEST_F(EmulationTest, AFactoryMayMakeUpCallsThatStartProviders) {
    for (const Manager each : cimhost::lab::everyManager) {
        as(each);
        EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Curious_Thing"))).ok());
        EXPECT_THAT(log, testing::Contains("echo factory"));
    }
}

TEST_F(EmulationTest, AnExceptionIsAFailureOrACrashOrUnknown) {
    const auto thrown = [this] {
        return manager().perform(Request::enumerateInstances(classPath("Echo_Throwing"))).status;
    };
    as(Manager::standard);
    EXPECT_EQ(thrown().message, "The provider threw an exception: out of ink");
    as(Manager::sfcb);
    EXPECT_EQ(thrown().rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(thrown().message,
              "The manager's provider process would have died: The provider threw an exception: out of ink");
    as(Manager::openPegasus);
    EXPECT_EQ(thrown().rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(thrown().message, "Unknown error.");
}

TEST_F(EmulationTest, FactoriesAreCalledOncePerProviderOrOncePerClass) {
    for (const auto& [each, calls] :
         {std::pair(Manager::standard, 1U), std::pair(Manager::sfcb, 2U), std::pair(Manager::openPegasus, 1U)}) {
        as(each);
        reported("Echo_Broker");
        reported("ECHO_broker");
        reported("Echo_Seen");
        EXPECT_EQ(log.size(), calls);
    }
}

TEST_F(EmulationTest, ALibraryThatCannotBeLoadedIsAnErrorOrNotFound) {
    const auto unloadable = Request::enumerateInstances(classPath("Unloadable"));
    for (const Manager each : {Manager::standard, Manager::openPegasus}) {
        as(each);
        EXPECT_THROW(manager().perform(unloadable), cimhost::LibraryError);
    }
    as(Manager::sfcb);
    const auto status = manager().perform(unloadable).status;
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(status.message, "Provider not found or not loadable");
}

}  // namespace
