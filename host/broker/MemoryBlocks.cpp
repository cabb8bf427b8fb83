#include "broker/MemoryBlocks.h"

#include <utility>

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

}  // namespace cimhost
