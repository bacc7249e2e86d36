// Reading bound objects from text in tests: one read into a fresh object, and
// tables of reads that fail, each row checked for its verdict and for the item
// the debug record names.
#ifndef TESSARINE_TESTS_BOUND_READS_H
#define TESSARINE_TESTS_BOUND_READS_H

#include <cstddef>
#include <string>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

namespace tessarine_test {

// Reads into a fresh object: a bound object remembers what it has read, and
// would refuse the same attribute a second time.
template <typename T>
lmx::elmx_error read(T &ar_object, const std::string &ar_xml, lmx::s_debug_error *ap_debug = nullptr) {
    ar_object.reset();
    return lmx::unmarshal(ar_object, ar_xml, ap_debug);
}

struct s_read_row {
    const char *name;
    std::string text;
    lmx::elmx_error error;
    const char *item; // null: no debug record asked for
};

// Reads each row's text into a fresh T.
template <typename T, std::size_t N> void expect_reads(const s_read_row (&ar_rows)[N]) {
    for (const s_read_row &row : ar_rows) {
        SCOPED_TRACE(row.name);
        T object;
        lmx::s_debug_error debug;
        EXPECT_EQ(read(object, row.text, row.item ? &debug : nullptr), row.error);
        if (row.item) {
            EXPECT_EQ(debug.item_name, row.item);
        }
    }
}

} // namespace tessarine_test

#endif
