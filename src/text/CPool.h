#pragma once

#include <cstddef>
#include <new>

/**
 * Process-wide free-list allocator for one object type T.
 *
 * Memory comes in blocks of 256 objects and is never given back to the system: the pool
 * stays at its high-water mark for the life of the process. A free slot holds the link to
 * the next free slot in its own first bytes, so a live object carries no pool overhead.
 * Not thread-safe; the text layer runs on the main thread only.
 */
template <class T>
class CPool {
public:
    static constexpr std::size_t block_count = 256;

    /** A slot for one T, or null when the system has no memory for a new block. */
    static void* allocate() noexcept {
        if (free_list == nullptr && !grow())
            return nullptr;
        FreeSlot* slot = free_list;
        free_list = slot->next;
        --free_slots;
        return slot;
    }

    /** Puts a slot obtained from allocate() back at the front of the free list. */
    static void release(void* p) noexcept {
        if (p == nullptr)
            return;
        free_list = ::new (p) FreeSlot{free_list};
        ++free_slots;
    }

    /** Blocks taken from the system so far. */
    static std::size_t blocks() noexcept { return block_total; }

    /** Slots waiting on the free list. */
    static std::size_t free_count() noexcept { return free_slots; }

private:
    struct FreeSlot {
        FreeSlot* next;
    };
    static_assert(sizeof(T) >= sizeof(FreeSlot), "a pooled object must hold a link word");

    // Slot 0 goes to the caller; slots 255 down to 1 are chained so that 255 is handed out
    // next and slot 1 ends the list.
    static bool grow() noexcept {
        auto* raw =
            static_cast<unsigned char*>(::operator new[](block_count * sizeof(T), std::nothrow));
        if (raw == nullptr)
            return false;
        ++block_total;
        FreeSlot* head = nullptr;
        for (std::size_t i = 1; i < block_count; ++i)
            head = ::new (raw + i * sizeof(T)) FreeSlot{head};
        free_list = ::new (raw) FreeSlot{head};
        free_slots += block_count;
        return true;
    }

    static inline FreeSlot* free_list = nullptr;
    static inline std::size_t free_slots = 0;
    static inline std::size_t block_total = 0;
};

/** Base that routes a node type's single-object new and delete through its own CPool. */
template <class Node>
struct CPooled {
    static void* operator new(std::size_t) noexcept { return CPool<Node>::allocate(); }
    static void operator delete(void* p, std::size_t) noexcept { CPool<Node>::release(p); }
};
