// The pool of small blocks behind bound objects and the vectors of repeated
// children: blocks are reused on the thread that frees them, may be freed on
// any thread, and a document outlives the thread that read it.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <set>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include <cxf/v3/cxf3.h>
#include <lmx/lmxpool.h>

namespace {

const char *const k_document = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                               "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\">"
                               "<cc:Resources><cc:ObjectCollection>"
                               "<cc:Object ObjectType=\"Target\" Name=\"one\" Id=\"o1\">"
                               "<cc:CreationDate>2024-01-02T03:04:05Z</cc:CreationDate>"
                               "<cc:TagCollection Name=\"t\"><cc:Tag Name=\"a\" Value=\"b\"/><cc:Tag Name=\"c\" Value=\"d\"/>"
                               "</cc:TagCollection></cc:Object>"
                               "</cc:ObjectCollection></cc:Resources></cc:CxF>";

TEST(Pool, BlocksAreDistinctAlignedAndWritable) {
    std::vector<std::pair<void *, std::size_t>> blocks;
    std::set<void *> seen;
    for (int round = 0; round < 3; ++round)
        for (std::size_t size = 1; size <= lmx::k_pool_max_block + 8; size += 7) {
            void *p = lmx::pool_allocate(size);
            ASSERT_NE(p, nullptr);
            EXPECT_EQ(reinterpret_cast<std::uintptr_t>(p) % alignof(void *), 0u);
            EXPECT_TRUE(seen.insert(p).second);
            std::memset(p, 0xA5, size);
            blocks.emplace_back(p, size);
        }
    for (auto &block : blocks)
        lmx::pool_free(block.first, block.second);
    lmx::pool_free(nullptr, 8);
}

TEST(Pool, FreedBlockIsHandedOutAgainOnTheSameThread) {
    void *p = lmx::pool_allocate(40);
    lmx::pool_free(p, 40);
    void *q = lmx::pool_allocate(40);
    EXPECT_EQ(p, q);
    lmx::pool_free(q, 40);
}

TEST(Pool, ManySlabsOfBlocksComeAndGo) {
    std::vector<void *> blocks;
    for (int i = 0; i < 200000; ++i)
        blocks.push_back(lmx::pool_allocate(88));
    for (std::size_t i = 0; i < blocks.size(); i += 2)
        lmx::pool_free(blocks[i], 88);
    for (std::size_t i = 1; i < blocks.size(); i += 2)
        lmx::pool_free(blocks[i], 88);
}

TEST(Pool, BlocksFreedOnAnotherThread) {
    std::vector<void *> blocks;
    std::thread maker([&] {
        for (int i = 0; i < 50000; ++i)
            blocks.push_back(lmx::pool_allocate(24 + (i % 5) * 8));
    });
    maker.join(); // the thread has ended: its slabs are no longer current
    std::thread freer([&] {
        for (std::size_t i = 0; i < blocks.size(); ++i)
            lmx::pool_free(blocks[i], 24 + (i % 5) * 8);
    });
    freer.join();
}

TEST(Pool, ThreadsAllocatingAndFreeingEachOthersBlocks) {
    constexpr int k_count = 20000;
    std::vector<void *> first(k_count), second(k_count);
    std::thread a([&] {
        for (int i = 0; i < k_count; ++i)
            first[i] = lmx::pool_allocate(136);
    });
    std::thread b([&] {
        for (int i = 0; i < k_count; ++i)
            second[i] = lmx::pool_allocate(136);
    });
    a.join();
    b.join();
    // Each frees the other's blocks while allocating new ones of the same size.
    std::vector<void *> kept_a, kept_b;
    std::thread c([&] {
        for (int i = 0; i < k_count; ++i) {
            lmx::pool_free(second[i], 136);
            kept_a.push_back(lmx::pool_allocate(136));
        }
    });
    std::thread d([&] {
        for (int i = 0; i < k_count; ++i) {
            lmx::pool_free(first[i], 136);
            kept_b.push_back(lmx::pool_allocate(136));
        }
    });
    c.join();
    d.join();
    for (void *p : kept_a)
        lmx::pool_free(p, 136);
    for (void *p : kept_b)
        lmx::pool_free(p, 136);
}

TEST(Pool, DocumentReadOnOneThreadIsCopiedAndDestroyedOnOthers) {
    cc::CxF *p_document = nullptr;
    lmx::elmx_error error = lmx::elmx_ok;
    std::thread reader([&] {
        p_document = new cc::CxF;
        error = p_document->unmarshal(k_document, std::strlen(k_document));
    });
    reader.join();
    ASSERT_EQ(error, lmx::elmx_ok);
    cc::CxF copy;
    std::thread copier([&] { copy = *p_document; });
    copier.join();
    std::thread destroyer([&] { delete p_document; });
    destroyer.join();
    const cc::Object &object = copy.get_Resources().get_ObjectCollection().get_Object(0);
    EXPECT_EQ(object.get_Name(), L"one");
    ASSERT_EQ(object.size_TagCollection(), 1u);
    EXPECT_EQ(object.get_TagCollection(0).get_Tag(1).get_Value(), L"d");
}

TEST(Pool, RepeatedChildrenGrowAndShrink) {
    cc::TagCollection tags;
    for (int i = 0; i < 1000; ++i)
        tags.append_Tag().set_Name(std::to_wstring(i));
    for (int i = 0; i < 990; ++i)
        tags.delete_Tag(0);
    ASSERT_EQ(tags.size_Tag(), 10u);
    EXPECT_EQ(tags.get_Tag(0).get_Name(), L"990");
    cc::TagCollection copy(tags);
    EXPECT_EQ(copy.get_Tag(9).get_Name(), L"999");
}

} // namespace
