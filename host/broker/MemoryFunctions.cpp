#include <cstring>
#include <utility>

#include "broker/Broker.h"
#include "broker/Encapsulation.h"
#include "broker/FunctionTables.h"

// CMPIBrokerMemFT: marks, memory blocks, and freeing objects before their request ends.

namespace cimhost {

void* MemoryBlocks::allocate(std::size_t count, std::size_t size) {
    const bool isEmpty = count == 0 || size == 0;
    std::unique_ptr<void, Free> block(std::calloc(isEmpty ? 1 : count, isEmpty ? 1 : size));
    void* address = block.get();
    if (address != nullptr) {
        const std::lock_guard<std::mutex> lock(mutex);
        blocks.emplace(address, std::move(block));
    }
    return address;
}

void* MemoryBlocks::resize(void* block, std::size_t size) {
    if (block == nullptr) {
        return allocate(1, size);
    }
    const std::lock_guard<std::mutex> lock(mutex);
    const auto found = blocks.find(block);
    if (found == blocks.end()) {
        return nullptr;
    }
    auto node = blocks.extract(found);
    void* moved = std::realloc(block, size == 0 ? 1 : size);
    if (moved != nullptr) {
        static_cast<void>(node.mapped().release());
        node.mapped().reset(moved);
        node.key() = moved;
    }
    blocks.insert(std::move(node));
    return moved;
}

void MemoryBlocks::free(void* block) {
    const std::lock_guard<std::mutex> lock(mutex);
    blocks.erase(block);
}

namespace {

CMPIGcStat* mark(const CMPIBroker* broker, CMPIStatus* rc) {
    // CMPI's marks are pointers to non-const, but providers only pass them to release().
    return guarded<CMPIGcStat*>(rc, nullptr,
                                [&] { return const_cast<CMPIGcStat*>(Broker::of(broker).arena().mark()); });
}

CMPIStatus release(const CMPIBroker* broker, const CMPIGcStat* marked) {
    return guarded([&] {
        if (!Broker::of(broker).arena().releaseMark(marked)) {
            throw Failure(CMPI_RC_ERR_FAILED, "This is not a mark of the current request.");
        }
    });
}

void* cmpiCalloc(const CMPIBroker* broker, size_t count, size_t size) {
    return guarded<void*>(nullptr, nullptr, [&] { return Broker::of(broker).memory().allocate(count, size); });
}

void* cmpiMalloc(const CMPIBroker* broker, size_t size) {
    return cmpiCalloc(broker, 1, size);
}

void* cmpiRealloc(const CMPIBroker* broker, void* block, size_t size) {
    return guarded<void*>(nullptr, nullptr, [&] { return Broker::of(broker).memory().resize(block, size); });
}

char* cmpiStrDup(const CMPIBroker* broker, const char* string) {
    if (string == nullptr) {
        return nullptr;
    }
    const size_t size = std::strlen(string) + 1;
    void* copy = cmpiMalloc(broker, size);
    return copy == nullptr ? nullptr : static_cast<char*>(std::memcpy(copy, string, size));
}

void cmpiFree(const CMPIBroker* broker, void* block) {
    guarded([&] { Broker::of(broker).memory().free(block); });
}

template <class Handle>
void freeObject(const CMPIBroker* broker, Handle* handle) {
    if (guarded([&] { Broker::of(broker); }).rc == CMPI_RC_OK) {
        releaseObject(handle);
    }
}

/** Queries are not supported, so there is never a CMPISelectExp. */
void freeSelectExp(const CMPIBroker*, CMPISelectExp*) {}

}  // namespace

const CMPIBrokerMemFT memoryTable{tableVersion,
                                  mark,
                                  release,
                                  cmpiMalloc,
                                  cmpiCalloc,
                                  cmpiRealloc,
                                  cmpiStrDup,
                                  cmpiFree,
                                  freeObject<CMPIInstance>,
                                  freeObject<CMPIObjectPath>,
                                  freeObject<CMPIArgs>,
                                  freeObject<CMPIString>,
                                  freeObject<CMPIArray>,
                                  freeObject<CMPIDateTime>,
                                  freeSelectExp};

}  // namespace cimhost
