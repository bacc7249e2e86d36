// Small-block storage for the objects a loaded document is made of.
//
// A document is mostly small objects of a few sizes: one per element, and
// the short vectors of pointers that hold repeated children. Through the
// general heap each of them costs a block header and the rounding of its size
// to the heap's granule, a third of a two-pointer vector's room and 8 to 16
// bytes of every bound object. Here blocks of one size are cut from slabs of
// 32 KiB with nothing between them, and a block finds its slab by its address.
//
// Threads. Each thread cuts blocks from slabs of its own, one current slab
// per size, with no synchronisation; a block may be freed on any thread. A
// slab counts the blocks it has handed out and not yet got back in one
// atomic counter, which holds a large bias while the slab is some thread's
// current slab. A thread that frees a block of its own current slab puts it
// on that slab's free list, to be handed out again; any other free lowers the
// counter. When a thread moves on to a new slab, or ends, it takes the bias
// off its old one; whoever brings the counter to zero releases the slab. So
// there is no lock and no shared list: all a thread shares with others is the
// counter of a slab whose blocks it holds.
//
// What a slab holds is released only when every block cut from it has been
// freed: the space of a block freed while its slab is not current waits for
// the rest of the slab.
#ifndef LMX_LMXPOOL_H
#define LMX_LMXPOOL_H

#include <cstddef>
#include <new>

namespace lmx {

// Blocks up to this size come from the slabs; larger ones from operator new.
constexpr std::size_t k_pool_max_block = 512;

void *pool_allocate_small(std::size_t a_size);
void pool_free_small(void *ap_block, std::size_t a_size) noexcept;

inline void *pool_allocate(std::size_t a_size) {
    if (a_size - 1 < k_pool_max_block)
        return pool_allocate_small(a_size);
    return ::operator new(a_size);
}

// a_size must be the size the block was allocated with.
inline void pool_free(void *ap_block, std::size_t a_size) noexcept {
    if (!ap_block)
        return;
    if (a_size - 1 < k_pool_max_block)
        pool_free_small(ap_block, a_size);
    else
        ::operator delete(ap_block);
}

// The allocator of the vectors inside the containers of repeated children.
template <typename T> class ct_pool_allocator {
public:
    typedef T value_type;

    ct_pool_allocator() noexcept = default;
    template <typename U> ct_pool_allocator(const ct_pool_allocator<U> &) noexcept {}

    T *allocate(std::size_t a_count) {
        if (a_count > static_cast<std::size_t>(-1) / sizeof(T))
            throw std::bad_array_new_length();
        return static_cast<T *>(pool_allocate(a_count * sizeof(T)));
    }
    void deallocate(T *ap_items, std::size_t a_count) noexcept { pool_free(ap_items, a_count * sizeof(T)); }

    template <typename U> bool operator==(const ct_pool_allocator<U> &) const noexcept { return true; }
    template <typename U> bool operator!=(const ct_pool_allocator<U> &) const noexcept { return false; }
};

} // namespace lmx

// Class-level allocation from the pool, for a class whose objects are made
// one at a time with new. Derived classes inherit it; a deleting destructor
// passes the size of the object's own class.
#define LMX_POOLED_OBJECT                                                                                           \
    static void *operator new(std::size_t a_size) { return ::lmx::pool_allocate(a_size); }                          \
    static void operator delete(void *ap_object, std::size_t a_size) noexcept { ::lmx::pool_free(ap_object, a_size); }

#endif
