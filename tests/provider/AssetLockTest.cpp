// The asset element waits for the file lock.

#include <atomic>
#include <thread>

#include "AssetSupport.h"
#include "KO/Mutex.h"

namespace {

using namespace providerTest;

/** Waits until a function of the asset element has logged its entry. */
void awaitEntry(const std::string& function) {
    while (logMessagesOf("AssetIDDetails.cpp", function).empty()) {
        std::this_thread::yield();
    }
}

using AssetLock = AssetFile;

TEST_F(AssetLock, PreventsConcurrentCreationOfTheFile) {
    KO::_fileMutex.lock(withoutLimit);
    std::atomic<bool> isConstructed{false};
    std::thread other([&] {
        const AssetIDDetails element;
        isConstructed = true;
    });
    awaitEntry("getFileName");
    EXPECT_FALSE(isConstructed);
    EXPECT_FALSE(std::filesystem::exists(path()));
    KO::_fileMutex.unlock();
    other.join();
    EXPECT_TRUE(isConstructed);
    EXPECT_TRUE(std::filesystem::exists(path()));
}

TEST_F(AssetLock, PreventsConcurrentWritingOfTheFile) {
    AssetIDDetails element;
    element.setOwnerName("Anna");
    agentEnvironment::forgetLog();
    KO::_fileMutex.lock(withoutLimit);
    std::atomic<bool> written{false};
    std::thread other([&] {
        element.flushAssetData();
        written = true;
    });
    awaitEntry("flushAssetData");
    EXPECT_FALSE(written);
    EXPECT_EQ(file(), "");
    KO::_fileMutex.unlock();
    other.join();
    EXPECT_TRUE(written);
    EXPECT_EQ(valueOf(AssetIDDetails(), stringGetters[2]), "Anna");
}

}  // namespace
