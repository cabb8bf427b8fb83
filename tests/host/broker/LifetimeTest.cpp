#include <thread>

#include "BrokerFixture.h"

// The address sanitizer also finds uses after release and leaks in these tests.

namespace {

class LifetimeTest : public BrokerTest {};

TEST_F(LifetimeTest, ARequestOwnsTheObjectsCreatedInIt) {
    newString("a");
    newInstance();
    EXPECT_EQ(scope->arena().size(), 3U) << "a string, a path and an instance";
    {
        const cimhost::RequestScope inner(broker);
        newString("b");
        EXPECT_EQ(scope->arena().size(), 3U);
    }
    newString("c");
    EXPECT_EQ(scope->arena().size(), 4U);
}

TEST_F(LifetimeTest, AnObjectReadFromAnotherBelongsToTheCurrentRequest) {
    const CMPIObjectPath* path = newPath();
    cimhost::RequestScope inner(broker);
    path->ft->getNameSpace(path, nullptr);
    EXPECT_EQ(inner.arena().size(), 1U);
}

TEST_F(LifetimeTest, OutsideOfRequestsObjectsLiveAsLongAsTheBroker) {
    scope.reset();
    const CMPIString* string = newString("lasting");
    { const cimhost::RequestScope request(broker); }
    EXPECT_EQ(characters(string), "lasting");
}

TEST_F(LifetimeTest, UseAfterReleaseIsReported) {
    CMPIString* string = newString("gone");
    EXPECT_EQ(string->ft->release(string).rc, CMPI_RC_OK);
    EXPECT_EQ(string->ft->getCharPtr(string, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(string->ft->release(string).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(LifetimeTest, AReleasedObjectIsAnInvalidArgument) {
    CMPIObjectPath* path = newPath();
    path->ft->release(path);
    EXPECT_EQ(make().newInstance(handle(), path, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(LifetimeTest, ACloneIsIndependent) {
    CMPIObjectPath* path = newPath("A");
    CMPIObjectPath* copy = path->ft->clone(path, &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    path->ft->setClassName(path, "B");
    path->ft->release(path);
    EXPECT_EQ(characters(copy->ft->getClassName(copy, nullptr)), "A");
}

TEST_F(LifetimeTest, ACloneOutlivesItsRequestUntilItIsReleased) {
    CMPIInstance* copy = newInstance("A")->ft->clone(newInstance("A"), nullptr);
    scope.reset();
    EXPECT_EQ(broker.lasting().size(), 1U);
    {
        const cimhost::RequestScope later(broker);
        const CMPIObjectPath* path = copy->ft->getObjectPath(copy, &status);
        EXPECT_EQ(characters(path->ft->getClassName(path, nullptr)), "A");
        EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
        EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_ERR_INVALID_HANDLE) << "detected until the request ends";
    }
    EXPECT_EQ(broker.lasting().size(), 0U);
}

TEST_F(LifetimeTest, EveryTypeCanBeClonedAndReleased) {
    const auto check = [&](auto* object) {
        auto* copy = object->ft->clone(object, &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        EXPECT_NE(copy, object);
        EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
        EXPECT_EQ(object->ft->release(object).rc, CMPI_RC_OK);
    };
    check(newString("s"));
    check(newPath());
    check(newInstance());
    check(make().newArgs(handle(), nullptr));
    check(make().newArray(handle(), 1, CMPI_uint8, nullptr));
    check(make().newDateTime(handle(), nullptr));
    check(scope->context({}));
    check(make().newCMPIError(handle(), "o", "i", "m", ErrorSevLow, ErrorProbCauseUnknown, CMPI_RC_OK, nullptr));
    check(scope->arena().make<CMPIEnumeration>({{CMPI_uint8, {std::uint8_t{1}}}, 0}));
}

TEST_F(LifetimeTest, ReleasingAMarkFreesLaterObjects) {
    const CMPIBrokerMemFT& memory = *handle()->mft;
    CMPIString* before = newString("before");
    CMPIGcStat* mark = memory.mark(handle(), &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    newString("after");
    CMPIGcStat* inner = memory.mark(handle(), nullptr);
    const CMPIString* clone = before->ft->clone(before, nullptr);
    EXPECT_EQ(memory.release(handle(), mark).rc, CMPI_RC_OK);
    EXPECT_EQ(scope->arena().size(), 1U);
    EXPECT_EQ(characters(before), "before");
    EXPECT_EQ(characters(clone), "before");
    EXPECT_EQ(memory.release(handle(), inner).rc, CMPI_RC_ERR_FAILED) << "went with the outer mark";
    EXPECT_EQ(memory.release(handle(), nullptr).rc, CMPI_RC_ERR_FAILED);
}

TEST_F(LifetimeTest, FreeingFunctionsRelease) {
    const CMPIBrokerMemFT& memory = *handle()->mft;
    CMPIString* string = newString("s");
    CMPIInstance* instance = newInstance();
    memory.freeString(handle(), string);
    memory.freeInstance(handle(), instance);
    memory.freeInstance(handle(), instance);
    string->ft->getCharPtr(string, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    instance->ft->getObjectPath(instance, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(LifetimeTest, MemoryIsFreedAtTheLatestWithTheBroker) {
    const CMPIBrokerMemFT& memory = *handle()->mft;
    auto* block = static_cast<char*>(memory.cmpiCalloc(handle(), 4, 2));
    EXPECT_EQ(std::string(block, 8), std::string(8, '\0'));
    block[7] = 'x';
    block = static_cast<char*>(memory.cmpiRealloc(handle(), block, 4096));
    EXPECT_EQ(block[7], 'x');
    EXPECT_STREQ(memory.cmpiStrDup(handle(), "text"), "text");
    EXPECT_NE(memory.cmpiMalloc(handle(), 0), nullptr);
    memory.cmpiFree(handle(), block);
    memory.cmpiFree(handle(), block);
    int foreign = 0;
    memory.cmpiFree(handle(), &foreign);
    EXPECT_EQ(memory.cmpiRealloc(handle(), &foreign, 8), nullptr);
}

TEST_F(LifetimeTest, AnAttachedThreadHasSeparateObjects) {
    const CMPIContext* context = scope->context({testsupport::named(CMPIPrincipal, testsupport::text("me"))});
    CMPIContext* prepared = handle()->bft->prepareAttachThread(handle(), context);
    ASSERT_NE(prepared, nullptr);
    const std::size_t before = scope->arena().size();
    std::thread([&] {
        EXPECT_EQ(handle()->bft->attachThread(handle(), prepared).rc, CMPI_RC_OK);
        EXPECT_EQ(characters(prepared->ft->getEntry(prepared, CMPIPrincipal, nullptr).value.string), "me");
        EXPECT_EQ(characters(make().newString(handle(), "t", nullptr)), "t");
        EXPECT_EQ(handle()->bft->detachThread(handle(), prepared).rc, CMPI_RC_OK);
        EXPECT_EQ(cimhost::Broker::arenaOfThread(), nullptr);
    }).join();
    EXPECT_EQ(scope->arena().size(), before);
    EXPECT_EQ(broker.lasting().size(), 0U);
    EXPECT_EQ(handle()->bft->detachThread(handle(), prepared).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(handle()->bft->attachThread(handle(), context).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(LifetimeTest, APreparedThreadThatIsNeverAttachedIsFreed) {
    EXPECT_NE(handle()->bft->prepareAttachThread(handle(), scope->context({})), nullptr);
}

TEST_F(LifetimeTest, RequestsOfSeveralThreadsOwnSeparateObjects) {
    const auto work = [this](const char* text) {
        for (int i = 0; i < 200; ++i) {
            cimhost::RequestScope request(broker);
            const CMPIString* string = make().newString(handle(), text, nullptr);
            EXPECT_EQ(characters(string), text);
            EXPECT_EQ(request.arena().size(), 1U);
        }
    };
    std::thread first(work, "first");
    std::thread second(work, "second");
    first.join();
    second.join();
}

}  // namespace
