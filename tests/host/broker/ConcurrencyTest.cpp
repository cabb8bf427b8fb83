#include <thread>

#include "BrokerFixture.h"

// Concurrent requests: each thread has separate objects, and shared objects support all threads.

namespace {

using cimhost::RequestScope;

constexpr int threadCount = 8;
constexpr int rounds = 200;

class BrokerConcurrencyTest : public BrokerTest {
protected:
    /** Runs the body many times in many threads, each time in a separate request. */
    template <class Body>
    void inManyRequests(Body body) {
        std::vector<std::thread> threads;
        for (int i = 0; i < threadCount; ++i) {
            threads.emplace_back([&, i] {
                for (int round = 0; round < rounds; ++round) {
                    RequestScope request(broker);
                    body(request, std::to_string(i) + "/" + std::to_string(round));
                }
            });
        }
        for (std::thread& each : threads) {
            each.join();
        }
    }
};

TEST_F(BrokerConcurrencyTest, ObjectsBelongToTheRequestOfTheirThread) {
    const std::size_t before = scope->arena().size();
    inManyRequests([&](RequestScope& request, const std::string& name) {
        CMPIStatus rc{};
        CMPIObjectPath* path = make().newObjectPath(handle(), "root/cimv2", "X", &rc);
        path->ft->addKey(path, "Name", charsValue(name.c_str()), CMPI_chars);
        CMPIInstance* instance = make().newInstance(handle(), path, &rc);
        instance->ft->setProperty(instance, "Text", charsValue(name.c_str()), CMPI_chars);
        EXPECT_EQ(characters(instance->ft->getProperty(instance, "Text", &rc).value.string), name);
        EXPECT_GE(request.arena().size(), 3U);
    });
    EXPECT_EQ(scope->arena().size(), before);
}

TEST_F(BrokerConcurrencyTest, ClonesExistUntilTheyAreReleased) {
    const std::size_t before = broker.lasting().size();
    inManyRequests([&](RequestScope&, const std::string& name) {
        CMPIString* copy = nullptr;
        {
            const RequestScope inner(broker);
            const CMPIString* original = make().newString(handle(), name.c_str(), nullptr);
            copy = original->ft->clone(original, nullptr);
        }
        EXPECT_EQ(characters(copy), name);
        EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
    });
    EXPECT_EQ(broker.lasting().size(), before);
}

TEST_F(BrokerConcurrencyTest, MarksBelongToTheirRequest) {
    inManyRequests([&](RequestScope& request, const std::string& name) {
        CMPIStatus rc{};
        const CMPIGcStat* mark = handle()->mft->mark(handle(), &rc);
        const std::size_t before = request.arena().size();
        make().newString(handle(), name.c_str(), &rc);
        EXPECT_EQ(handle()->mft->release(handle(), mark).rc, CMPI_RC_OK);
        EXPECT_EQ(request.arena().size(), before);
    });
}

TEST_F(BrokerConcurrencyTest, MemoryIsAllocatedAndFreed) {
    inManyRequests([&](RequestScope&, const std::string& name) {
        char* text = handle()->mft->cmpiStrDup(handle(), name.c_str());
        ASSERT_STREQ(text, name.c_str());
        text = static_cast<char*>(handle()->mft->cmpiRealloc(handle(), text, 1000));
        EXPECT_STREQ(text, name.c_str());
        handle()->mft->cmpiFree(handle(), text);
    });
}

TEST_F(BrokerConcurrencyTest, ThreadsAreAttachedAndDetached) {
    inManyRequests([&](RequestScope& request, const std::string& name) {
        CMPIContext* prepared = handle()->bft->prepareAttachThread(
            handle(), request.context({testsupport::named("Name", testsupport::text(name))}));
        ASSERT_NE(prepared, nullptr);
        EXPECT_EQ(handle()->bft->attachThread(handle(), prepared).rc, CMPI_RC_OK);
        EXPECT_EQ(characters(prepared->ft->getEntry(prepared, "Name", nullptr).value.string), name);
        EXPECT_EQ(handle()->bft->detachThread(handle(), prepared).rc, CMPI_RC_OK);
    });
}

}  // namespace
