#include "lmxpool.h"

#include <sys/mman.h>

#include <atomic>
#include <cstdint>
#include <cstdlib>

#if defined(__SANITIZE_ADDRESS__)
#define LMX_POOL_ASAN 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define LMX_POOL_ASAN 1
#endif
#endif
#ifdef LMX_POOL_ASAN
#include <sanitizer/asan_interface.h>
#define LMX_POOL_POISON(p, n) ASAN_POISON_MEMORY_REGION((p), (n))
#define LMX_POOL_UNPOISON(p, n) ASAN_UNPOISON_MEMORY_REGION((p), (n))
#else
#define LMX_POOL_POISON(p, n) ((void)(p), (void)(n))
#define LMX_POOL_UNPOISON(p, n) ((void)(p), (void)(n))
#endif

namespace lmx {

namespace {

constexpr std::size_t k_granule = 8; // block sizes are multiples of it
constexpr std::size_t k_classes = k_pool_max_block / k_granule;
constexpr std::size_t k_slab_size = 32 * 1024; // also the slab's alignment
// Slabs are cut from runs mapped from the system, a run at a time, so that
// aligning them costs address space and not memory.
constexpr std::size_t k_slabs_per_run = 32;
constexpr std::size_t k_run_size = k_slab_size * k_slabs_per_run;
// Added to a slab's count while it is a thread's current slab, so that frees
// on other threads cannot bring it to zero then.
constexpr std::int64_t k_current_bias = std::int64_t(1) << 40;

struct s_free_block {
    s_free_block *p_next;
};

// The head of a slab; its blocks follow it.
struct alignas(16) s_slab {
    // The first slab of the run this slab was cut from, whose m_run_slabs
    // counts the run's slabs not yet released, including those not yet cut.
    s_slab *p_run;
    std::atomic<std::int64_t> m_run_slabs;
    // Blocks handed out and not yet freed, plus the bias while current.
    std::atomic<std::int64_t> m_outstanding;
    // The rest belongs to the thread whose current slab this is.
    char *p_next;             // the first block never handed out
    char *p_end;              // no block starts at or after it
    s_free_block *p_free;     // blocks freed by that thread, to hand out again
    std::int64_t m_handed;    // blocks handed out less those on p_free
};

constexpr std::size_t k_first_block = (sizeof(s_slab) + k_granule - 1) / k_granule * k_granule;

s_slab *slab_of(void *ap_block) {
    return reinterpret_cast<s_slab *>(reinterpret_cast<std::uintptr_t>(ap_block) & ~(std::uintptr_t(k_slab_size) - 1));
}

// The heads stay in place until the run is unmapped: the first slab's head
// holds the run's count.
void release_slabs(s_slab *ap_run, std::int64_t a_count) {
    if (ap_run->m_run_slabs.fetch_sub(a_count, std::memory_order_acq_rel) == a_count) {
        LMX_POOL_UNPOISON(ap_run, k_run_size);
        munmap(ap_run, k_run_size);
    }
}

void release_slab(s_slab *ap_slab) { release_slabs(ap_slab->p_run, 1); }

// One more block back; the slab goes when it was the last.
void count_free(s_slab *ap_slab) {
    if (ap_slab->m_outstanding.fetch_sub(1, std::memory_order_acq_rel) == 1)
        release_slab(ap_slab);
}

// Stops cutting blocks from a slab: its count becomes what it has out.
void retire(s_slab *ap_slab) {
    if (ap_slab->m_outstanding.fetch_sub(k_current_bias - ap_slab->m_handed, std::memory_order_acq_rel) ==
        k_current_bias - ap_slab->m_handed)
        release_slab(ap_slab);
}

// Maps a run aligned to the slab size: a little more is mapped, and the
// ends beyond the aligned run are given back.
s_slab *map_run() {
    const std::size_t mapped = k_run_size + k_slab_size;
    void *p_mapped = mmap(nullptr, mapped, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    if (p_mapped == MAP_FAILED)
        throw std::bad_alloc();
    const std::uintptr_t start = reinterpret_cast<std::uintptr_t>(p_mapped);
    const std::uintptr_t aligned = (start + k_slab_size - 1) & ~(std::uintptr_t(k_slab_size) - 1);
    if (aligned != start)
        munmap(p_mapped, aligned - start);
    if (std::size_t tail = (start + mapped) - (aligned + k_run_size))
        munmap(reinterpret_cast<void *>(aligned + k_run_size), tail);
    s_slab *p_run = new (reinterpret_cast<void *>(aligned)) s_slab;
    p_run->m_run_slabs.store(k_slabs_per_run, std::memory_order_relaxed);
    return p_run;
}

s_slab *cut_slab(std::size_t a_block_size);

// The current slab of each size of this thread. Plain data, so that it is
// there from the thread's start to its very end without a constructor or a
// destructor of its own.
struct s_thread_slabs {
    s_slab *p_current[k_classes];
    s_slab *p_run;        // the run slabs are cut from
    std::size_t m_cut;    // slabs cut from it
    bool m_is_ending;     // the thread's storage is being torn down
};

thread_local s_thread_slabs t_slabs = {};

// Retires the thread's current slabs when the thread ends.
struct c_thread_end {
    bool m_is_armed = false;
    void arm() { m_is_armed = true; }
    ~c_thread_end() {
        t_slabs.m_is_ending = true;
        for (s_slab *&p_slab : t_slabs.p_current)
            if (p_slab) {
                retire(p_slab);
                p_slab = nullptr;
            }
        if (t_slabs.p_run) {
            release_slabs(t_slabs.p_run, static_cast<std::int64_t>(k_slabs_per_run - t_slabs.m_cut));
            t_slabs.p_run = nullptr;
        }
    }
};

thread_local c_thread_end t_thread_end;

// The next slab of the thread's run, for blocks of a_block_size.
s_slab *cut_slab(std::size_t a_block_size) {
    if (!t_slabs.p_run) {
        t_slabs.p_run = map_run();
        t_slabs.m_cut = 0;
        if (!t_slabs.m_is_ending)
            t_thread_end.arm();
    }
    char *p_base = reinterpret_cast<char *>(t_slabs.p_run) + t_slabs.m_cut * k_slab_size;
    ++t_slabs.m_cut;
    s_slab *p_slab = t_slabs.m_cut == 1 ? t_slabs.p_run : new (p_base) s_slab;
    p_slab->p_run = t_slabs.p_run;
    p_slab->m_outstanding.store(k_current_bias, std::memory_order_relaxed);
    p_slab->p_next = p_base + k_first_block;
    p_slab->p_end = p_base + k_slab_size - a_block_size + 1;
    p_slab->p_free = nullptr;
    p_slab->m_handed = 0;
    LMX_POOL_POISON(p_slab->p_next, k_slab_size - k_first_block);
    // The thread lets go of a run once it has cut its last slab, which may
    // be released, and the run with it, before the thread needs another; after
    // the thread's end it keeps no run for later slabs.
    if (t_slabs.m_cut == k_slabs_per_run) {
        t_slabs.p_run = nullptr;
    } else if (t_slabs.m_is_ending) {
        release_slabs(t_slabs.p_run, static_cast<std::int64_t>(k_slabs_per_run - t_slabs.m_cut));
        t_slabs.p_run = nullptr;
    }
    return p_slab;
}

} // namespace

void *pool_allocate_small(std::size_t a_size) {
    const std::size_t index = (a_size - 1) / k_granule;
    const std::size_t block_size = (index + 1) * k_granule;
    s_slab *p_slab = t_slabs.p_current[index];
    if (p_slab) {
        if (s_free_block *p_block = p_slab->p_free) {
            LMX_POOL_UNPOISON(p_block, block_size);
            p_slab->p_free = p_block->p_next;
            ++p_slab->m_handed;
            return p_block;
        }
        if (p_slab->p_next < p_slab->p_end) {
            char *p_block = p_slab->p_next;
            p_slab->p_next += block_size;
            ++p_slab->m_handed;
            LMX_POOL_UNPOISON(p_block, block_size);
            return p_block;
        }
    }
    s_slab *p_new = cut_slab(block_size);
    char *p_block = p_new->p_next;
    p_new->p_next += block_size;
    p_new->m_handed = 1;
    LMX_POOL_UNPOISON(p_block, block_size);
    if (t_slabs.m_is_ending) {
        // After the thread's end has retired its slabs: a slab for this
        // block alone.
        retire(p_new);
        return p_block;
    }
    if (p_slab)
        retire(p_slab);
    t_slabs.p_current[index] = p_new;
    return p_block;
}

void pool_free_small(void *ap_block, std::size_t a_size) noexcept {
    const std::size_t index = (a_size - 1) / k_granule;
    s_slab *p_slab = slab_of(ap_block);
    if (p_slab == t_slabs.p_current[index]) {
        s_free_block *p_block = static_cast<s_free_block *>(ap_block);
        p_block->p_next = p_slab->p_free;
        p_slab->p_free = p_block;
        --p_slab->m_handed;
        LMX_POOL_POISON(p_block, (index + 1) * k_granule);
        return;
    }
    LMX_POOL_POISON(ap_block, (index + 1) * k_granule);
    count_free(p_slab);
}

} // namespace lmx
