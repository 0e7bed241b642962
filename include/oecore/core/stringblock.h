// The heap block shared by OmbString values and filled by OmbStringBuilder:
// a 32-bit length, a 32-bit atomic count, the bytes and a zero byte. Public
// only so that copying a string and asking its size stay inline.
#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <new>

namespace oecore::detail {

struct StringBlock {
    static constexpr std::size_t headerSize = 8;
    static constexpr std::size_t maxLength = 0xFFFFFFF0u;

    std::uint32_t length;
    std::atomic<std::uint32_t> count;

    char* bytes() noexcept { return reinterpret_cast<char*>(this) + headerSize; }

    // A new block for length bytes of text plus the terminating zero.
    static StringBlock* allocate(std::size_t length) {
        void* memory = std::malloc(headerSize + length + 1);
        if (!memory) throw std::bad_alloc();
        return adopt(memory, length);
    }

    // Turns malloc'ed memory that already holds the text (at headerSize)
    // into a block with count 1.
    static StringBlock* adopt(void* memory, std::size_t length) noexcept {
        auto* block = new (memory) StringBlock;
        block->length = static_cast<std::uint32_t>(length);
        block->count.store(1, std::memory_order_relaxed);
        return block;
    }

    void ref() noexcept { count.fetch_add(1, std::memory_order_relaxed); }

    void unref() noexcept {
        if (count.fetch_sub(1, std::memory_order_acq_rel) == 1) {
            this->~StringBlock();
            std::free(this);
        }
    }
};

static_assert(sizeof(StringBlock) == StringBlock::headerSize, "block header is two 32-bit words");

}  // namespace oecore::detail
