// Numbers as XML text: the lexical checks of booleans, integers and floats,
// conversions both ways, float and double output against a stream, c_big_int
// and c_decimal.
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <locale>
#include <random>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxtypes.h>

namespace {

template <typename T> std::string to_xml(const T &ar_value) {
    std::ostringstream os;
    lmx::o_to_v<T>(os, ar_value);
    return os.str();
}

template <typename T> T from_text(const std::string &ar_text) {
    T value{};
    lmx::v_to_o<T>(value, ar_text);
    return value;
}

// What a stream in its default notation writes at a precision, in the
// classic locale. One stream for all values.
class stream_reference {
public:
    stream_reference() { m_os.imbue(std::locale::classic()); }
    template <typename T> std::string text(T a_value, int a_precision) {
        m_os.str(std::string());
        m_os.precision(a_precision);
        m_os << a_value;
        return m_os.str();
    }

private:
    std::ostringstream m_os;
};

std::string chars(float a_value) {
    char buffer[lmx::k_float_text_size];
    return std::string(buffer, lmx::to_xml_chars(buffer, a_value));
}

std::string chars(double a_value) {
    char buffer[lmx::k_float_text_size];
    return std::string(buffer, lmx::to_xml_chars(buffer, a_value));
}

double double_from_bits(std::uint64_t a_bits) {
    double value;
    std::memcpy(&value, &a_bits, sizeof value);
    return value;
}

float float_from_bits(std::uint32_t a_bits) {
    float value;
    std::memcpy(&value, &a_bits, sizeof value);
    return value;
}

int sign_of(int a_value) { return a_value < 0 ? -1 : (a_value > 0 ? 1 : 0); }

// ---------------------------------------------------------------------------
// Lexical checks
// ---------------------------------------------------------------------------

struct s_check_case {
    const char *text;
    bool is_valid;
};

TEST(IntegerForm, AcceptsSignsAndDigitsOnly) {
    const s_check_case cases[] = {
        {"+5", true},  {"-5", true},   {"5", true},     {"0", true},     {"007", true},
        {"-0", true},  {"123456789012345678901234567890", true},         {"", false},
        {"+", false},  {"-", false},   {"5 ", false},   {" 5", false},   {"5.0", false},
        {"5.", false}, {"abc", false}, {"1e3", false},  {"+-5", false},  {"--5", false},
        {"5a", false}, {"0x10", false}, {"\xd9\xa3", false},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::is_valid_integer(c.text), c.is_valid) << c.text;
}

TEST(IntegerForm, EmbeddedNulIsNotTheEnd) {
    EXPECT_FALSE(lmx::is_valid_integer(std::string("5\0", 2)));
}

TEST(FloatForm, AcceptsTheSchemaForms) {
    const s_check_case cases[] = {
        {"5.", true},      {".", false},      {".5e3", true},   {"INF", true},     {"-INF", true},
        {"NaN", true},     {"+INF", false},   {"inf", false},   {"nan", false},    {"Infinity", false},
        {"-NaN", false},   {"1", true},       {"-1", true},     {"+1.5", true},    {"1.5e10", true},
        {"1.5E-10", true}, {"1e+5", true},    {"1e", false},    {"1e+", false},    {"e5", false},
        {".e5", false},    {"1.2.3", false},  {"1 ", false},    {" 1", false},     {"", false},
        {"+", false},      {"-.5", true},     {"0.0", true},    {"00.00", true},   {"1e5.5", false},
        {"1ee5", false},   {"1,5", false},    {"0x1p3", false}, {"--1", false},    {"5.e-3", true},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::is_valid_float(c.text), c.is_valid) << c.text;
}

TEST(BoolForm, AcceptsTrueFalseOneZero) {
    const s_check_case cases[] = {
        {"true", true},   {"1", true},       {"false", true}, {"0", true},  {"TRUE", false},
        {"True", false},  {"yes", false},    {"", false},     {"01", false}, {" true", false},
        {"true ", false}, {"2", false},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::is_valid_bool(c.text), c.is_valid) << c.text;
}

// ---------------------------------------------------------------------------
// Booleans and integers both ways
// ---------------------------------------------------------------------------

TEST(BoolValue, TrueAndOneAreTrueAnythingElseFalse) {
    EXPECT_TRUE(from_text<bool>("true"));
    EXPECT_TRUE(from_text<bool>("1"));
    EXPECT_FALSE(from_text<bool>("false"));
    EXPECT_FALSE(from_text<bool>("0"));
    EXPECT_FALSE(from_text<bool>("yes"));
    EXPECT_FALSE(from_text<bool>("TRUE"));
    EXPECT_FALSE(from_text<bool>(""));
}

TEST(BoolValue, WritesWordsOrDigits) {
    EXPECT_EQ(to_xml(true), "true");
    EXPECT_EQ(to_xml(false), "false");
    std::ostringstream os;
    lmx::output_convert_to_bool_digit(os, true);
    lmx::output_convert_to_bool_digit(os, false);
    EXPECT_EQ(os.str(), "10");
}

TEST(IntegerValue, ReadsWithSignAndLeadingZeros) {
    EXPECT_EQ(from_text<int>("+5"), 5);
    EXPECT_EQ(from_text<int>("-5"), -5);
    EXPECT_EQ(from_text<int>("007"), 7);
    EXPECT_EQ(from_text<int>("2147483647"), 2147483647);
    EXPECT_EQ(from_text<int>("-2147483648"), -2147483647 - 1);
    EXPECT_EQ(from_text<short>("-32768"), -32768);
    EXPECT_EQ(from_text<unsigned short>("65535"), 65535);
    EXPECT_EQ(from_text<signed char>("-128"), -128);
    EXPECT_EQ(from_text<unsigned char>("255"), 255);
    EXPECT_EQ(from_text<unsigned int>("4000000000"), 4000000000u);
}

TEST(IntegerValue, OutOfRangeWrapsToTheType) {
    EXPECT_EQ(from_text<short>("40000"), static_cast<short>(40000 - 65536));
    EXPECT_EQ(from_text<unsigned char>("300"), 44);
    EXPECT_EQ(from_text<signed char>("200"), -56);
    EXPECT_EQ(from_text<int>("4294967297"), 1);
    EXPECT_EQ(from_text<unsigned short>("-1"), 65535);
}

TEST(IntegerValue, WritesDecimal) {
    EXPECT_EQ(to_xml(0), "0");
    EXPECT_EQ(to_xml(-2147483647 - 1), "-2147483648");
    EXPECT_EQ(to_xml(4294967295u), "4294967295");
    EXPECT_EQ(to_xml(static_cast<short>(-32768)), "-32768");
    EXPECT_EQ(to_xml(static_cast<unsigned short>(65535)), "65535");
    EXPECT_EQ(to_xml(static_cast<signed char>(-5)), "-5");
    EXPECT_EQ(to_xml(static_cast<unsigned char>(65)), "65");
}

TEST(IntegerValue, RoundTripsEveryShort) {
    for (int i = -32768; i <= 32767; ++i) {
        short value = static_cast<short>(i);
        ASSERT_EQ(from_text<short>(to_xml(value)), value);
    }
}

// ---------------------------------------------------------------------------
// Floats as text
// ---------------------------------------------------------------------------

TEST(Atofloat, SpecialValues) {
    EXPECT_TRUE(std::isnan(lmx::atofloat("NaN")));
    EXPECT_EQ(lmx::atofloat("INF"), std::numeric_limits<double>::infinity());
    EXPECT_EQ(lmx::atofloat("-INF"), -std::numeric_limits<double>::infinity());
}

TEST(Atofloat, ReadsTheSchemaForms) {
    struct {
        const char *text;
        double value;
    } const cases[] = {
        {"1.5", 1.5},       {"+1.5", 1.5},   {"-1.5", -1.5},     {"5.", 5.0},      {".5", 0.5},
        {".5e3", 500.0},    {"1e-3", 1e-3},  {"1E+3", 1000.0},   {"0", 0.0},       {"007.5", 7.5},
        {"0.1", 0.1},       {"-0", -0.0},    {"1e400", HUGE_VAL}, {"-1e400", -HUGE_VAL},
        {"4.9406564584124654e-324", 4.9406564584124654e-324},
        {"1.7976931348623157e308", 1.7976931348623157e308},
    };
    for (const auto &c : cases)
        EXPECT_EQ(lmx::atofloat(c.text), c.value) << c.text;
    EXPECT_TRUE(std::signbit(lmx::atofloat("-0")));
    EXPECT_EQ(lmx::atofloat(std::string("2.25")), 2.25);
}

TEST(Atofloat, UnderflowGivesZero) {
    EXPECT_EQ(lmx::atofloat("1e-400"), 0.0);
}

TEST(FloatValue, ReadsThroughDouble) {
    EXPECT_EQ(from_text<float>("0.1"), static_cast<float>(0.1));
    EXPECT_EQ(from_text<double>("0.1"), 0.1);
    EXPECT_TRUE(std::isnan(from_text<float>("NaN")));
    EXPECT_EQ(from_text<float>("-INF"), -std::numeric_limits<float>::infinity());
}

TEST(FloatOutput, SpecialValuesHaveTheirSchemaNames) {
    EXPECT_EQ(to_xml(std::numeric_limits<double>::quiet_NaN()), "NaN");
    EXPECT_EQ(to_xml(-std::numeric_limits<double>::quiet_NaN()), "NaN");
    EXPECT_EQ(to_xml(std::numeric_limits<double>::infinity()), "INF");
    EXPECT_EQ(to_xml(-std::numeric_limits<double>::infinity()), "-INF");
    EXPECT_EQ(to_xml(-0.0), "-0.0");
    EXPECT_EQ(to_xml(0.0), "0.0");
    EXPECT_EQ(to_xml(std::numeric_limits<float>::quiet_NaN()), "NaN");
    EXPECT_EQ(to_xml(std::numeric_limits<float>::infinity()), "INF");
    EXPECT_EQ(to_xml(-std::numeric_limits<float>::infinity()), "-INF");
    EXPECT_EQ(to_xml(-0.0f), "-0.0");
    EXPECT_EQ(to_xml(0.0f), "0.0");
    EXPECT_EQ(to_xml(lmx::atofloat("NaN")), "NaN");
}

TEST(FloatOutput, DoubleHasFourteenSignificantDigitsFloatSeven) {
    EXPECT_EQ(to_xml(0.1), "0.1");
    EXPECT_EQ(to_xml(0.1f), "0.1");
    EXPECT_EQ(to_xml(1.0 / 3.0), "0.33333333333333");
    EXPECT_EQ(to_xml(1.0f / 3.0f), "0.3333333");
    EXPECT_EQ(to_xml(2.0 / 3.0), "0.66666666666667");
    EXPECT_EQ(to_xml(2.0f / 3.0f), "0.6666667");
    EXPECT_EQ(to_xml(123456789.0), "123456789");
    EXPECT_EQ(to_xml(12345678901234.0), "12345678901234");
    EXPECT_EQ(to_xml(123456789012345.0), "1.2345678901234e+14");
    EXPECT_EQ(to_xml(1234567.0f), "1234567");
    EXPECT_EQ(to_xml(12345678.0f), "1.234568e+07");
    EXPECT_EQ(to_xml(1e20), "1e+20");
    EXPECT_EQ(to_xml(1e-5), "1e-05");
    EXPECT_EQ(to_xml(0.0001), "0.0001");
    EXPECT_EQ(to_xml(-2.5), "-2.5");
    EXPECT_EQ(to_xml(100.0), "100");
    EXPECT_EQ(to_xml(95.0f), "95");
}

TEST(FloatOutput, LeavesTheStreamAsItWas) {
    std::ostringstream os;
    os.precision(3);
    os.setf(std::ios::fixed, std::ios::floatfield);
    lmx::o_to_v(os, 1.0 / 3.0);
    lmx::output_convert_to_xml(os, 0.25f);
    EXPECT_EQ(os.str(), "0.333333333333330.25");
    EXPECT_EQ(os.precision(), 3);
    EXPECT_EQ(os.flags() & std::ios::floatfield, std::ios::fixed);
}

TEST(FloatOutput, IgnoresTheStreamLocale) {
    struct comma : std::numpunct<char> {
        char do_decimal_point() const override { return ','; }
    };
    std::ostringstream os;
    os.imbue(std::locale(std::locale::classic(), new comma));
    lmx::o_to_v(os, 1.5);
    EXPECT_EQ(os.str(), "1.5");
}

TEST(FloatOutput, AsXmlManipulatorWritesTheSameText) {
    std::ostringstream os;
    os << lmx::as_xml(0.1) << ' ' << lmx::as_xml(0.1f) << ' ' << lmx::as_xml(-0.0);
    EXPECT_EQ(os.str(), "0.1 0.1 -0.0");
}

// The text of every finite non-zero value is what a stream writes in its
// default notation at precision 14 (double) or 7 (float).
class FloatOutputMatchesStream : public ::testing::Test {
protected:
    void expect_double(double a_value) {
        if (!std::isfinite(a_value) || a_value == 0.0)
            return;
        ++m_count;
        ASSERT_EQ(chars(a_value), m_reference.text(a_value, 14)) << std::hexfloat << a_value;
    }
    void expect_float(float a_value) {
        if (!std::isfinite(a_value) || a_value == 0.0f)
            return;
        ++m_count;
        ASSERT_EQ(chars(a_value), m_reference.text(a_value, 7)) << std::hexfloat << a_value;
    }
    stream_reference m_reference;
    std::size_t m_count = 0;
};

TEST_F(FloatOutputMatchesStream, RandomDoubleBitPatterns) {
    std::mt19937_64 random(20240531);
    for (int i = 0; i < 200000; ++i)
        expect_double(double_from_bits(random()));
    EXPECT_GT(m_count, 199000u);
}

TEST_F(FloatOutputMatchesStream, RandomDoublesOfOrdinarySize) {
    std::mt19937_64 random(7);
    std::uniform_real_distribution<double> unit(-1.0, 1.0);
    std::uniform_int_distribution<int> exponent(-30, 30);
    for (int i = 0; i < 100000; ++i)
        expect_double(unit(random) * std::pow(10.0, exponent(random)));
    // Colour data: spectra and Lab values with few decimals.
    for (int i = -200000; i <= 200000; i += 7)
        expect_double(i / 1000.0);
}

TEST_F(FloatOutputMatchesStream, DecimalsOfOneToSeventeenDigitsAtEveryExponent) {
    // Values read from text with few digits, as measurement data mostly are,
    // and the lengths around fourteen digits where the rounding starts.
    std::mt19937_64 random(1234);
    for (int digits = 1; digits <= 17; ++digits) {
        for (int exponent = -310; exponent <= 308; ++exponent) {
            for (int i = 0; i < 6; ++i) {
                std::string text = std::to_string(1 + random() % 9);
                for (int d = 1; d < digits; ++d)
                    text += static_cast<char>('0' + random() % 10);
                text += "e" + std::to_string(exponent - digits + 1);
                double value = std::strtod(text.c_str(), nullptr);
                expect_double(value);
                expect_double(-value);
                expect_float(static_cast<float>(value));
            }
        }
    }
    EXPECT_GT(m_count, 100000u);
}

TEST_F(FloatOutputMatchesStream, RandomFloatBitPatterns) {
    std::mt19937 random(314159);
    for (int i = 0; i < 200000; ++i)
        expect_float(float_from_bits(random()));
    EXPECT_GT(m_count, 199000u);
}

TEST_F(FloatOutputMatchesStream, FloatsAcrossTheWholeRange) {
    for (std::uint64_t bits = 0; bits <= 0xFFFFFFFFu; bits += 65521)
        expect_float(float_from_bits(static_cast<std::uint32_t>(bits)));
}

TEST_F(FloatOutputMatchesStream, PowersOfTenAndTheirNeighbours) {
    for (int e = -323; e <= 308; ++e) {
        double value = std::strtod(("1e" + std::to_string(e)).c_str(), nullptr);
        for (double v : {value, std::nextafter(value, 0.0), std::nextafter(value, HUGE_VAL)}) {
            expect_double(v);
            expect_double(-v);
        }
    }
    for (int e = -45; e <= 38; ++e) {
        float value = std::strtof(("1e" + std::to_string(e)).c_str(), nullptr);
        for (float v : {value, std::nextafter(value, 0.0f), std::nextafter(value, HUGE_VALF)}) {
            expect_float(v);
            expect_float(-v);
        }
    }
}

TEST_F(FloatOutputMatchesStream, ExponentsNearTheSwitchToScientific) {
    // The general format switches at an exponent of -5 and at the precision;
    // rounding can carry a value over either edge.
    const char *const doubles[] = {
        "0.0001",          "0.00009999999999999",  "0.000099999999999995", "0.000099999999999994",
        "0.00010000000000001", "99999999999999",   "99999999999999.4",     "99999999999999.5",
        "99999999999999.6", "100000000000000",     "1e14",                 "9.99999999999995e13",
        "9.99999999999994e13", "12345678901234.5", "0.000123456789012345", "0.0000123456789012345",
    };
    for (const char *text : doubles) {
        expect_double(std::stod(text));
        expect_double(-std::stod(text));
    }
    const char *const floats[] = {
        "0.0001", "0.00009999999", "0.000099999995", "0.000099999994", "9999999", "9999999.4",
        "9999999.5", "9999999.6", "10000000", "1e7", "9.9999995e6", "1234567.5", "0.00001234567",
    };
    for (const char *text : floats) {
        expect_float(std::stof(text));
        expect_float(-std::stof(text));
    }
    std::mt19937_64 random(99);
    for (int e = -8; e <= 18; ++e) {
        double scale = std::pow(10.0, e);
        for (int i = 0; i < 2000; ++i) {
            double mantissa = 9.0 + std::generate_canonical<double, 64>(random);
            expect_double(mantissa * scale);
            expect_float(static_cast<float>(mantissa * scale));
        }
    }
}

TEST_F(FloatOutputMatchesStream, SubnormalsAndLimits) {
    expect_double(std::numeric_limits<double>::denorm_min());
    expect_double(std::numeric_limits<double>::min());
    expect_double(std::nextafter(std::numeric_limits<double>::min(), 0.0));
    expect_double(std::numeric_limits<double>::max());
    expect_double(std::numeric_limits<double>::lowest());
    expect_double(std::numeric_limits<double>::epsilon());
    expect_float(std::numeric_limits<float>::denorm_min());
    expect_float(std::numeric_limits<float>::min());
    expect_float(std::nextafter(std::numeric_limits<float>::min(), 0.0f));
    expect_float(std::numeric_limits<float>::max());
    expect_float(std::numeric_limits<float>::lowest());
    expect_float(std::numeric_limits<float>::epsilon());
    std::mt19937_64 random(2718);
    for (int i = 0; i < 20000; ++i) {
        expect_double(double_from_bits(random() & 0x800FFFFFFFFFFFFFull)); // exponent field zero
        expect_float(float_from_bits(static_cast<std::uint32_t>(random()) & 0x807FFFFFu));
    }
    EXPECT_EQ(chars(std::numeric_limits<double>::denorm_min()), "4.9406564584125e-324");
    EXPECT_EQ(chars(std::numeric_limits<float>::denorm_min()), "1.401298e-45");
    EXPECT_EQ(chars(std::numeric_limits<double>::max()), "1.7976931348623e+308");
    EXPECT_EQ(chars(std::numeric_limits<float>::max()), "3.402823e+38");
}

TEST(FloatOutput, ZeroIsSpecialEvenWhereAStreamDiffers) {
    stream_reference reference;
    EXPECT_EQ(reference.text(-0.0, 14), "-0");
    EXPECT_EQ(chars(-0.0), "-0.0");
    EXPECT_EQ(reference.text(0.0f, 7), "0");
    EXPECT_EQ(chars(0.0f), "0.0");
}

TEST(FloatOutput, RoundTripsThroughTextToTheWrittenPrecision) {
    std::mt19937_64 random(5);
    std::uniform_real_distribution<double> any(-1e6, 1e6);
    for (int i = 0; i < 10000; ++i) {
        double value = any(random);
        double back = from_text<double>(to_xml(value));
        ASSERT_NEAR(back, value, std::fabs(value) * 1e-13) << value;
        float f = static_cast<float>(value);
        ASSERT_NEAR(from_text<float>(to_xml(f)), f, std::fabs(f) * 1e-6f) << f;
    }
}

// ---------------------------------------------------------------------------
// Scanning helpers
// ---------------------------------------------------------------------------

TEST(ScanningHelpers, MoveTheCursorPastWhatTheyAccept) {
    const char *p = "123x";
    EXPECT_EQ(lmx::skip_digits(p), 3u);
    EXPECT_EQ(*p, 'x');

    p = "0042-";
    unsigned long value = 0;
    EXPECT_EQ(lmx::get_digits(p, &value), 4u);
    EXPECT_EQ(value, 42u);
    EXPECT_EQ(*p, '-');

    p = "12.345e";
    EXPECT_EQ(lmx::skip_decimal(p), 5u);
    EXPECT_EQ(*p, 'e');
    p = ".";
    EXPECT_EQ(lmx::skip_decimal(p), 0u);

    p = "2.5S";
    double decimal = 0.0;
    EXPECT_EQ(lmx::get_decimal(p, &decimal), 2u);
    EXPECT_EQ(decimal, 2.5);
    EXPECT_EQ(*p, 'S');

    p = "--05";
    EXPECT_TRUE(lmx::skip_const(p, "--"));
    EXPECT_FALSE(lmx::skip_const(p, "--"));
    EXPECT_STREQ(p, "05");

    p = "-1";
    bool is_negative = false;
    EXPECT_TRUE(lmx::get_sign(p, &is_negative));
    EXPECT_TRUE(is_negative);
    EXPECT_FALSE(lmx::get_sign(p, &is_negative));
    EXPECT_STREQ(p, "1");

    p = "+1";
    EXPECT_TRUE(lmx::skip_sign(p));
    EXPECT_FALSE(lmx::skip_sign(p));
    p = "-1";
    EXPECT_TRUE(lmx::skip_opt_sign(p));
    EXPECT_FALSE(lmx::skip_opt_sign(p));
    EXPECT_STREQ(p, "1");
}

// ---------------------------------------------------------------------------
// c_big_int
// ---------------------------------------------------------------------------

TEST(BigInt, NormalForm) {
    struct {
        const char *text;
        const char *normal;
    } const cases[] = {
        {"0", "0"},         {"-0", "0"},       {"+0", "0"},         {"000", "0"},      {"-000", "0"},
        {"007", "7"},       {"+12", "12"},     {"-00012", "-12"},   {"", "0"},         {"-", "0"},
        {"12abc", "12"},    {"abc", "0"},      {"-12.5", "-12"},    {"1 2", "1"},
        {"123456789012345678901234567890", "123456789012345678901234567890"},
        {"-000123456789012345678901234567890", "-123456789012345678901234567890"},
    };
    for (const auto &c : cases)
        EXPECT_EQ(lmx::c_big_int(c.text).get_as_string(), c.normal) << c.text;
    EXPECT_EQ(lmx::c_big_int().get_as_string(), "0");
    EXPECT_EQ(lmx::c_big_int(static_cast<const char *>(nullptr)).get_as_string(), "0");
    EXPECT_EQ(lmx::c_big_int(std::string("-42")).get_as_string(), "-42");
    EXPECT_EQ(lmx::c_big_int(-2147483647 - 1).get_as_string(), "-2147483648");
    EXPECT_EQ(lmx::c_big_int(0).get_as_string(), "0");
    lmx::c_big_int assigned;
    assigned = "-9";
    EXPECT_EQ(assigned.get_as_string(), "-9");
    assigned = std::string("10");
    EXPECT_EQ(assigned.get_as_string(), "10");
    assigned = 77;
    EXPECT_EQ(assigned.get_as_string(), "77");
}

TEST(BigInt, MinusZeroEqualsZero) {
    EXPECT_TRUE(lmx::c_big_int("-0") == "0");
    EXPECT_TRUE(lmx::c_big_int("0") == "-0");
    EXPECT_TRUE(lmx::c_big_int("0") == "-000");
}

struct s_compare_case {
    const char *lhs;
    const char *rhs;
    int order;
};

TEST(BigInt, ComparesWithText) {
    const s_compare_case cases[] = {
        {"0", "0", 0},
        {"0", "-0", 0},
        {"0", "+0", 0},
        {"0", "0000", 0},
        {"5", "005", 0},
        {"5", "+5", 0},
        {"-5", "-005", 0},
        {"1", "2", -1},
        {"2", "1", 1},
        {"9", "10", -1},
        {"10", "9", 1},
        {"99", "100", -1},
        {"-1", "1", -1},
        {"1", "-1", 1},
        {"-1", "-2", 1},
        {"-2", "-1", -1},
        {"-10", "-9", -1},
        {"-9", "-10", 1},
        {"0", "1", -1},
        {"0", "-1", 1},
        {"-1", "0", -1},
        {"32767", "32767", 0},
        {"32768", "32767", 1},
        {"40000", "32767", 1},
        {"-32768", "-32768", 0},
        {"-32769", "-32768", -1},
        {"2147483647", "2147483647", 0},
        {"2147483648", "2147483647", 1},
        {"-2147483648", "-2147483648", 0},
        {"-2147483649", "-2147483648", -1},
        {"99999999999999999999", "2147483647", 1},
        {"-99999999999999999999", "-2147483648", -1},
        {"359", "360", -1},
        {"360", "360", 0},
        {"400", "400", 0},
        {"401", "400", 1},
        {"123456789012345678901234567890", "123456789012345678901234567891", -1},
        {"123456789012345678901234567891", "123456789012345678901234567890", 1},
        {"-123456789012345678901234567890", "-123456789012345678901234567891", 1},
        {"1000", "0999", 1},
        {"12", "12abc", 0},
        {"0", "abc", 0},
    };
    for (const s_compare_case &c : cases) {
        lmx::c_big_int lhs(c.lhs);
        EXPECT_EQ(sign_of(lhs.compare(c.rhs)), c.order) << c.lhs << " vs " << c.rhs;
        EXPECT_EQ(lhs == c.rhs, c.order == 0) << c.lhs << " == " << c.rhs;
        EXPECT_EQ(lhs != c.rhs, c.order != 0) << c.lhs << " != " << c.rhs;
        EXPECT_EQ(lhs < c.rhs, c.order < 0) << c.lhs << " < " << c.rhs;
        EXPECT_EQ(lhs <= c.rhs, c.order <= 0) << c.lhs << " <= " << c.rhs;
        EXPECT_EQ(lhs > c.rhs, c.order > 0) << c.lhs << " > " << c.rhs;
        EXPECT_EQ(lhs >= c.rhs, c.order >= 0) << c.lhs << " >= " << c.rhs;
        std::string rhs_string(c.rhs);
        EXPECT_EQ(lhs < rhs_string, c.order < 0) << c.lhs << " < string " << c.rhs;
        EXPECT_EQ(lhs >= rhs_string, c.order >= 0) << c.lhs << " >= string " << c.rhs;
        lmx::c_big_int rhs_big(c.rhs);
        EXPECT_EQ(lhs == rhs_big, c.order == 0) << c.lhs << " == big " << c.rhs;
        EXPECT_EQ(lhs < rhs_big, c.order < 0) << c.lhs << " < big " << c.rhs;
        EXPECT_EQ(lhs > rhs_big, c.order > 0) << c.lhs << " > big " << c.rhs;
    }
}

TEST(BigInt, OrderOfManyRandomNumbersMatchesIntegerOrder) {
    std::mt19937_64 random(11);
    std::uniform_int_distribution<long long> any(-5000000000000LL, 5000000000000LL);
    for (int i = 0; i < 20000; ++i) {
        long long a = any(random) >> (random() % 40);
        long long b = any(random) >> (random() % 40);
        int expected = a < b ? -1 : (a > b ? 1 : 0);
        lmx::c_big_int big(std::to_string(a));
        ASSERT_EQ(sign_of(big.compare(std::to_string(b))), expected) << a << " vs " << b;
        ASSERT_EQ(sign_of(big.compare(lmx::c_big_int(std::to_string(b)))), expected) << a << " vs " << b;
    }
}

TEST(BigInt, NullTextCountsAsZero) {
    const char *null_text = nullptr;
    EXPECT_TRUE(lmx::c_big_int("0") == null_text);
    EXPECT_TRUE(lmx::c_big_int("-0") == null_text);
    EXPECT_TRUE(lmx::c_big_int("1") > null_text);
    EXPECT_TRUE(lmx::c_big_int("-1") < null_text);
}

TEST(BigInt, EmptyTextIsUnequalAndNeverGreater) {
    for (const char *value : {"0", "-5", "5"}) {
        lmx::c_big_int big(value);
        EXPECT_FALSE(big == "") << value;
        EXPECT_TRUE(big != "") << value;
        EXPECT_FALSE(big < "") << value;
        EXPECT_FALSE(big <= "") << value;
        EXPECT_TRUE(big > "") << value;
        EXPECT_TRUE(big >= "") << value;
    }
}

TEST(BigInt, GetFoldsToThirtyTwoBitsAndReportsOverflow) {
    struct {
        const char *text;
        long value;
        bool is_overflow;
    } const cases[] = {
        {"0", 0, false},
        {"2147483647", 2147483647L, false},
        {"-2147483647", -2147483647L, false},
        {"214748364", 214748364L, false},
        {"2147483648", -2147483647L - 1, true},
        {"-2147483648", -2147483647L - 1, true},
        {"2147483650", -2147483646L, true},
        {"4294967296", 0, true},
        {"4294967297", 1, true},
        {"21474836470", -10, true},
        {"99999999999", 1215752191L, true},
    };
    for (const auto &c : cases) {
        bool is_overflow = !c.is_overflow;
        EXPECT_EQ(lmx::c_big_int(c.text).get(&is_overflow), c.value) << c.text;
        EXPECT_EQ(is_overflow, c.is_overflow) << c.text;
    }
    EXPECT_EQ(lmx::c_big_int("12").get(), 12);
}

TEST(BigInt, GetUnsignedFoldsToThirtyTwoBits) {
    bool is_overflow = true;
    EXPECT_EQ(lmx::c_big_int("4294967295").get_unsigned(&is_overflow), 4294967295UL);
    EXPECT_FALSE(is_overflow);
    EXPECT_EQ(lmx::c_big_int("3000000000").get_unsigned(&is_overflow), 3000000000UL);
    EXPECT_FALSE(is_overflow);
    EXPECT_EQ(lmx::c_big_int("4294967296").get_unsigned(&is_overflow), 0UL);
    EXPECT_TRUE(is_overflow);
    EXPECT_EQ(lmx::c_big_int("42949672950").get_unsigned(&is_overflow), 4294967286UL);
    EXPECT_TRUE(is_overflow);
}

TEST(BigInt, GetAsFloatSumsTheDigits) {
    EXPECT_EQ(lmx::c_big_int("12345").get_as_float(), 12345.0);
    EXPECT_EQ(lmx::c_big_int("-12345").get_as_float(), -12345.0);
    EXPECT_DOUBLE_EQ(lmx::c_big_int("123456789012345678901234567890").get_as_float(), 1.2345678901234568e29);
}

TEST(BigInt, WritesItsDigits) {
    EXPECT_EQ(to_xml(lmx::c_big_int("-0042")), "-42");
    EXPECT_EQ(from_text<lmx::c_big_int>("+0099").get_as_string(), "99");
}

// ---------------------------------------------------------------------------
// c_decimal
// ---------------------------------------------------------------------------

TEST(Decimal, ValidForms) {
    const s_check_case cases[] = {
        {"1", true},   {"1.5", true}, {"-1.5", true}, {"+1.5", true}, {".5", true},  {"5.", true},
        {".", false},  {"", false},   {"1e3", false}, {"INF", false}, {"1.2.3", false}, {"-", false},
        {" 1", false}, {"1 ", false},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::c_decimal::is_valid(c.text), c.is_valid) << c.text;
}

TEST(Decimal, TextFormLeavesOutAZeroIntegralBeforeAFraction) {
    struct {
        const char *text;
        const char *written;
    } const cases[] = {
        {"0.5", ".5"},    {"-0.5", "-.5"},   {"12", "12"},    {"12.50", "12.50"}, {"+3.0", "3.0"},
        {"0", "0"},       {"007.25", "7.25"}, {".5", ".5"},   {"5.", "5"},        {"-12", "-12"},
        {"0.0", ".0"},    {"-0", "-0"},
        {"123456789012345678901234567890.000000000000000000001",
         "123456789012345678901234567890.000000000000000000001"},
    };
    for (const auto &c : cases) {
        EXPECT_EQ(lmx::c_decimal(c.text).get_as_string(), c.written) << c.text;
        EXPECT_EQ(to_xml(lmx::c_decimal(c.text)), c.written) << c.text;
    }
}

TEST(Decimal, FromDoubleClampsThePrecisionToFifteen) {
    EXPECT_EQ(lmx::c_decimal(2.5, 2).get_as_string(), "2.50");
    EXPECT_EQ(lmx::c_decimal(-2.5, 0).get_as_string(), "-2");
    EXPECT_EQ(lmx::c_decimal(1.0 / 3.0, 20).get_as_string(), ".333333333333333");
    EXPECT_EQ(lmx::c_decimal(0.125, 3).get_as_string(), ".125");
}

TEST(Decimal, FromTwoIntegers) {
    EXPECT_EQ(lmx::c_decimal(3, 14).get_as_string(), "3.14");
    EXPECT_EQ(lmx::c_decimal(-2, 5).get_as_string(), "-2.5");
    EXPECT_EQ(lmx::c_decimal(7, 0).get_as_string(), "7");
}

TEST(Decimal, ComparesAsNumbers) {
    const s_compare_case cases[] = {
        {"1.5", "1.50", 0},  {"1.5", "1.5000", 0}, {"1", "1.0", 0},    {"-1.5", "-1.4", -1},
        {"-1.4", "-1.5", 1}, {"-1", "1", -1},      {"2.05", "2.005", 1}, {"2.005", "2.05", -1},
        {"10", "9.99", 1},   {"0.1", ".1", 0},     {"007", "7", 0},    {"-10", "-9.99", -1},
        {"1.25", "1.3", -1}, {"0", "0.0", 0},
    };
    for (const s_compare_case &c : cases) {
        lmx::c_decimal lhs(c.lhs), rhs(c.rhs);
        EXPECT_EQ(lhs == rhs, c.order == 0) << c.lhs << " == " << c.rhs;
        EXPECT_EQ(lhs != rhs, c.order != 0) << c.lhs << " != " << c.rhs;
        EXPECT_EQ(lhs < rhs, c.order < 0) << c.lhs << " < " << c.rhs;
        EXPECT_EQ(lhs <= rhs, c.order <= 0) << c.lhs << " <= " << c.rhs;
        EXPECT_EQ(lhs > rhs, c.order > 0) << c.lhs << " > " << c.rhs;
        EXPECT_EQ(lhs >= rhs, c.order >= 0) << c.lhs << " >= " << c.rhs;
    }
}

TEST(Decimal, ScaledAndFractionalParts) {
    lmx::c_decimal value("1.05");
    EXPECT_EQ(value.get_integral(), 1);
    EXPECT_EQ(value.get_fractional(2), 5);
    EXPECT_EQ(value.get_fractional(3), 50);
    EXPECT_EQ(value.get_fractional(1), 0);
    EXPECT_EQ(value.get_scaled(2), 105);
    EXPECT_EQ(value.get_scaled(0), 1);
    EXPECT_EQ(lmx::c_decimal("-2.5").get_scaled(3), -2500);
    EXPECT_EQ(lmx::c_decimal("-2.5").get_integral(), -2);

    lmx::c_decimal scaled;
    scaled.set_scaled(-205, 2);
    EXPECT_EQ(scaled.get_as_string(), "-2.05");
    scaled.set_scaled(5, 3);
    EXPECT_EQ(scaled.get_as_string(), ".005");

    lmx::c_decimal parts;
    parts.set_integral(-7L);
    parts.set_fractional(5, 2);
    EXPECT_EQ(parts.get_as_string(), "-7.05");
    parts.set_integral(lmx::c_big_int("12"));
    EXPECT_EQ(parts.get_as_string(), "12.05");

    bool is_overflow = false;
    lmx::c_decimal("99999999999.5").get_scaled(1, &is_overflow);
    EXPECT_TRUE(is_overflow);
}

TEST(Decimal, AsFloat) {
    EXPECT_EQ(lmx::c_decimal("-.5").get_as_float(), -0.5);
    EXPECT_EQ(lmx::c_decimal("12.25").get_as_float(), 12.25);
}

TEST(Decimal, SetAndAssign) {
    lmx::c_decimal value;
    EXPECT_EQ(value.get_as_string(), "0");
    value.set("-1.25");
    EXPECT_EQ(value.get_as_string(), "-1.25");
    value = std::string("3");
    EXPECT_EQ(value.get_as_string(), "3");
    lmx::v_to_o(value, std::string("0.75"));
    EXPECT_EQ(value.get_as_string(), ".75");
}

// ---------------------------------------------------------------------------
// Every conversion takes any text
// ---------------------------------------------------------------------------

template <typename T> void convert_all(const std::vector<std::string> &ar_texts) {
    for (const std::string &text : ar_texts) {
        T value{};
        lmx::v_to_o<T>(value, text);
        std::ostringstream os;
        lmx::o_to_v<T>(os, value);
        EXPECT_FALSE(os.fail()) << text;
    }
}

TEST(TextToValue, NeverFailsOnTextThatIsNotValid) {
    const std::vector<std::string> texts = {
        "", " ", "-", "+", ".", "e", "abc", "P", "T", "--", "---", "Z", "\xff\xfe", std::string(1, '\0'),
        "99999999999999999999999999", "-99999999999999999999999999", "1e99999", "2024-", "2024-05-31T",
        "PT1.5", "QQ=", "0x", std::string(100, '9'), std::string(40, '.'), "\xed\xa0\xbd",
    };
    convert_all<bool>(texts);
    convert_all<int>(texts);
    convert_all<unsigned int>(texts);
    convert_all<short>(texts);
    convert_all<unsigned short>(texts);
    convert_all<signed char>(texts);
    convert_all<unsigned char>(texts);
    convert_all<float>(texts);
    convert_all<double>(texts);
    convert_all<std::string>(texts);
    convert_all<std::wstring>(texts);
    convert_all<lmx::c_big_int>(texts);
    convert_all<lmx::c_decimal>(texts);
    convert_all<lmx::c_duration>(texts);
    convert_all<lmx::c_datetime>(texts);
    convert_all<lmx::c_date>(texts);
    convert_all<lmx::c_time>(texts);
    convert_all<lmx::c_gyearmonth>(texts);
    convert_all<lmx::c_gyear>(texts);
    convert_all<lmx::c_gmonthday>(texts);
    convert_all<lmx::c_gday>(texts);
    convert_all<lmx::c_gmonth>(texts);
    convert_all<lmx::c_binary>(texts);
}

} // namespace
