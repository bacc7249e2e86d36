// c_binary: hex and base64 checks, decoding, encoding and the byte container.
#include <algorithm>
#include <random>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxtypes.h>

namespace {

typedef std::vector<unsigned char> bytes;

bytes to_bytes(const std::string &ar_text) { return bytes(ar_text.begin(), ar_text.end()); }

bytes random_bytes(std::size_t a_size, unsigned a_seed) {
    std::mt19937 random(a_seed);
    bytes data(a_size);
    for (unsigned char &b : data)
        b = static_cast<unsigned char>(random());
    return data;
}

// A plain bit-by-bit encoder to check the table-driven one against.
std::string reference_base64(const bytes &ar_data) {
    const char *alphabet = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
    std::string text;
    unsigned bits = 0;
    int bit_count = 0;
    for (unsigned char b : ar_data) {
        bits = (bits << 8) | b;
        bit_count += 8;
        while (bit_count >= 6) {
            bit_count -= 6;
            text += alphabet[(bits >> bit_count) & 0x3f];
        }
    }
    if (bit_count > 0)
        text += alphabet[(bits << (6 - bit_count)) & 0x3f];
    while (text.size() % 4 != 0)
        text += '=';
    return text;
}

std::string base64_of(const lmx::c_binary &ar_value) {
    std::ostringstream os;
    ar_value.out_base64(os);
    return os.str();
}

std::string hex_of(const lmx::c_binary &ar_value) {
    std::ostringstream os;
    ar_value.out_hex(os);
    return os.str();
}

lmx::c_binary decoded(const std::string &ar_text) {
    lmx::c_binary value;
    value.from_base64(ar_text);
    return value;
}

struct s_check_case {
    const char *text;
    bool is_valid;
};

// ---------------------------------------------------------------------------
// Hex
// ---------------------------------------------------------------------------

TEST(BinaryHex, Form) {
    const s_check_case cases[] = {
        {"", true},     {"00", true},  {"0aFf", true}, {"0123456789abcdefABCDEF", true},
        {"0", false},   {"abc", false}, {"0g", false},  {" ab", false}, {"ab ", false}, {"0x00", false},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::c_binary::is_valid_hex(c.text), c.is_valid) << c.text;
}

TEST(BinaryHex, ReadsEitherCaseAndWritesUpperCase) {
    lmx::c_binary value;
    value.from_hex("00abFF10");
    EXPECT_EQ(value.get(), (bytes{0x00, 0xab, 0xff, 0x10}));
    EXPECT_EQ(hex_of(value), "00ABFF10");
    std::ostringstream os;
    lmx::output_convert_to_hex(os, value);
    lmx::o_to_v_hex(os, value);
    EXPECT_EQ(os.str(), "00ABFF1000ABFF10");
    lmx::c_binary via;
    lmx::v_to_o_hex(via, "7f80");
    EXPECT_EQ(via.get(), (bytes{0x7f, 0x80}));
}

TEST(BinaryHex, LeavesTheStreamFlagsAsTheyWere) {
    lmx::c_binary value(bytes{0x01, 0xfe});
    std::ostringstream os;
    os << std::hex << std::nouppercase;
    os.fill('*');
    std::ios::fmtflags flags = os.flags();
    value.out_hex(os);
    EXPECT_EQ(os.flags(), flags);
    EXPECT_EQ(os.fill(), '*');
    os << ' ' << 255;
    EXPECT_EQ(os.str(), "01FE ff");
}

TEST(BinaryHex, LongValuesRoundTrip) {
    bytes data = random_bytes(5000, 3);
    lmx::c_binary value(data);
    std::string text = hex_of(value);
    ASSERT_EQ(text.size(), 10000u);
    EXPECT_TRUE(lmx::c_binary::is_valid_hex(text));
    lmx::c_binary back;
    back.from_hex(text);
    EXPECT_EQ(back.get(), data);
}

// ---------------------------------------------------------------------------
// Base64: form
// ---------------------------------------------------------------------------

TEST(Base64Form, Table) {
    const s_check_case cases[] = {
        {"", true},
        {"QQ==", true},
        {"QUI=", true},
        {"QUJD", true},
        {"QUJDRA==", true},
        {"QUJDRQ==", true},
        {"QUJD\nRA==", true},
        {"QU JD", true},
        {" QUJD ", true},
        {"\tQ U J D\r\n", true},
        {"////++++", true},
        {"QQ=\n", true},
        {"Q", false},
        {"QQ", false},
        {"QUI", false},
        {"QQ=", false},
        {"Q===", false},
        {"QQ=A", false},
        {"QQ== ", false},
        {"QUI= ", false},
        {"QU!D", false},
        {"QUJD*", false},
        {"QUJDR===", false},
        {"====", false},
        {"=", false},
        {"AB=C", false},
        {"QUJD-_", false},
        {"QQ==QQ==", false},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::c_binary::is_valid_base64(c.text), c.is_valid) << c.text;
}

TEST(Base64Form, EveryEncodingIsValid) {
    for (std::size_t size = 0; size < 200; ++size) {
        std::string text = reference_base64(random_bytes(size, static_cast<unsigned>(size)));
        EXPECT_TRUE(lmx::c_binary::is_valid_base64(text)) << text;
    }
}

// ---------------------------------------------------------------------------
// Base64: decoding
// ---------------------------------------------------------------------------

TEST(Base64Decode, Table) {
    struct {
        const char *text;
        const char *value;
    } const cases[] = {
        {"", ""},
        {"QQ==", "A"},
        {"QUI=", "AB"},
        {"QUJD", "ABC"},
        {"QUJDRA==", "ABCD"},
        {"QU\nJD", "ABC"},
        {"QUJD RA==", "ABCD"},
        {"QQ", "A"},
        {"QUI", "AB"},
        {"Q", ""},
        {"QUJDR", "ABC"},
        {"Q!U@J#D", "ABC"},
        {"aGVsbG8gd29ybGQ=", "hello world"},
        {"TWFu", "Man"},
    };
    for (const auto &c : cases)
        EXPECT_EQ(decoded(c.text).get(), to_bytes(c.value)) << c.text;
}

TEST(Base64Decode, AllByteValues) {
    bytes data(256);
    for (int i = 0; i < 256; ++i)
        data[static_cast<std::size_t>(i)] = static_cast<unsigned char>(i);
    EXPECT_EQ(decoded(reference_base64(data)).get(), data);
    EXPECT_EQ(decoded("/+/+").get(), (bytes{0xff, 0xef, 0xfe}));
}

TEST(Base64Decode, ReplacesTheOldBytes) {
    lmx::c_binary value(bytes{1, 2, 3});
    value.from_base64("QQ==");
    EXPECT_EQ(value.get(), to_bytes("A"));
    lmx::v_to_o(value, std::string("QUI="));
    EXPECT_EQ(value.get(), to_bytes("AB"));
    lmx::v_to_o_base64(value, "QUJD");
    EXPECT_EQ(value.get(), to_bytes("ABC"));
}

// ---------------------------------------------------------------------------
// Base64: encoding
// ---------------------------------------------------------------------------

TEST(Base64Encode, Table) {
    struct {
        const char *value;
        const char *text;
    } const cases[] = {
        {"", ""},         {"A", "QQ=="},       {"AB", "QUI="},     {"ABC", "QUJD"},
        {"ABCD", "QUJDRA=="}, {"Man", "TWFu"}, {"hello world", "aGVsbG8gd29ybGQ="},
    };
    for (const auto &c : cases) {
        lmx::c_binary value(to_bytes(c.value));
        EXPECT_EQ(base64_of(value), c.text) << c.value;
        EXPECT_EQ(value.get_as_string(), c.text) << c.value;
    }
}

TEST(Base64Encode, MatchesAPlainEncoderForEveryLengthUpTo3000) {
    for (std::size_t size = 0; size <= 3000; ++size) {
        bytes data = random_bytes(size, static_cast<unsigned>(size) + 17);
        lmx::c_binary value(data);
        std::string text = base64_of(value);
        ASSERT_EQ(text, reference_base64(data)) << size;
        ASSERT_EQ(decoded(text).get(), data) << size;
    }
}

TEST(Base64Encode, HundredKilobytesHaveNoNewline) {
    bytes data = random_bytes(100 * 1024, 100);
    lmx::c_binary value(data);
    std::string text = base64_of(value);
    EXPECT_EQ(text.size(), (data.size() + 2) / 3 * 4);
    EXPECT_EQ(text.find('\n'), std::string::npos);
    EXPECT_EQ(text.find('\r'), std::string::npos);
    EXPECT_EQ(text, reference_base64(data));
    EXPECT_TRUE(lmx::c_binary::is_valid_base64(text));
    EXPECT_EQ(decoded(text).get(), data);
}

TEST(Base64Encode, EveryWayOfWritingGivesTheSameText) {
    lmx::c_binary value(random_bytes(2000, 9));
    std::string expected = reference_base64(value.get());
    std::ostringstream a, b, c, d;
    lmx::o_to_v(a, value);
    lmx::o_to_v_base64(b, value);
    c << lmx::c_as_base64(value);
    d << lmx::as_xml(value);
    EXPECT_EQ(a.str(), expected);
    EXPECT_EQ(b.str(), expected);
    EXPECT_EQ(c.str(), expected);
    EXPECT_EQ(d.str(), expected);
    std::string as_text;
    lmx::as_string(as_text, value);
    EXPECT_EQ(as_text, expected);
    std::ostringstream hex;
    hex << lmx::c_as_hex(lmx::c_binary(bytes{0xca, 0xfe}));
    EXPECT_EQ(hex.str(), "CAFE");
}

// ---------------------------------------------------------------------------
// The byte container
// ---------------------------------------------------------------------------

TEST(BinaryBytes, ContainerOperations) {
    lmx::c_binary value;
    EXPECT_TRUE(value.empty());
    EXPECT_EQ(value.size(), 0u);
    value.append(0x01);
    value += 0x02;
    const unsigned char more[] = {0x03, 0x04};
    value.append(more, 2);
    EXPECT_EQ(value.size(), 4u);
    EXPECT_FALSE(value.empty());
    EXPECT_EQ(value[0], 0x01);
    EXPECT_EQ(value.at(3), 0x04);
    value[0] = 0x10;
    EXPECT_EQ(value.at(0), 0x10);
    EXPECT_THROW(value.at(4), std::out_of_range);
    const lmx::c_binary &constant = value;
    EXPECT_EQ(constant[1], 0x02);
    EXPECT_THROW(constant.at(9), std::out_of_range);

    lmx::c_binary other(more, 2);
    value += other;
    EXPECT_EQ(value.get(), (bytes{0x10, 0x02, 0x03, 0x04, 0x03, 0x04}));
    value.append(other);
    EXPECT_EQ(value.size(), 8u);

    lmx::c_binary a(bytes{1, 2}), b(bytes{1, 2}), c(bytes{1, 3});
    EXPECT_TRUE(a.equal(b));
    EXPECT_TRUE(a == b);
    EXPECT_FALSE(a.equal(c));
    EXPECT_TRUE(a != c);

    a.set(more, 2);
    EXPECT_EQ(a.get(), (bytes{3, 4}));
    a.set(bytes{9});
    EXPECT_EQ(a.get(), (bytes{9}));
    a.get().push_back(8);
    EXPECT_EQ(a.size(), 2u);
}

} // namespace
