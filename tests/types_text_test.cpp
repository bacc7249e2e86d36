// Text: UTF-8 and UTF-16 conversions, escaping for XML output, the length and
// digit facets, list items, qualified names, string values and manipulators.
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxtypes.h>

namespace {

std::string escaped(const std::string &ar_text) {
    std::ostringstream os;
    lmx::output_convert_to_xml(os, ar_text);
    return os.str();
}

std::string escaped(const std::wstring &ar_text) {
    std::ostringstream os;
    lmx::output_convert_to_xml(os, ar_text);
    return os.str();
}

std::wstring wide(const std::string &ar_text) {
    std::wstring out = L"old";
    lmx::vtostring(out, ar_text);
    return out;
}

std::string narrow(const std::wstring &ar_text) {
    std::string out = "old";
    lmx::convert(out, ar_text);
    return out;
}

// UTF-16 units as a wide string.
std::wstring units(std::initializer_list<unsigned> a_units) {
    std::wstring out;
    for (unsigned u : a_units)
        out += static_cast<wchar_t>(u);
    return out;
}

std::string utf8(unsigned long a_code_point) {
    std::string out;
    lmx::unicode_char_to_utf8(out, a_code_point);
    return out;
}

// ---------------------------------------------------------------------------
// Escaping
// ---------------------------------------------------------------------------

TEST(Escaping, DoubleBracketBeforeGreaterThanIsEscaped) {
    EXPECT_EQ(escaped(std::string("]]>")), "]]&gt;");
}

TEST(Escaping, BracketGreaterThanAtTheStartIsNotEscaped) {
    EXPECT_EQ(escaped(std::string("]>")), "]>");
}

TEST(Escaping, NarrowTable) {
    struct {
        const char *text;
        const char *written;
    } const cases[] = {
        {"", ""},
        {"plain", "plain"},
        {"\"", "&quot;"},
        {"'", "&apos;"},
        {"&", "&amp;"},
        {"<", "&lt;"},
        {">", ">"},
        {"a>b", "a>b"},
        {"]>", "]>"},
        {"]]>", "]]&gt;"},
        {"a]>", "a]&gt;"},
        {"x]]>y", "x]]&gt;y"},
        {"]]>]]>", "]]&gt;]]&gt;"},
        {"]] >", "]] >"},
        {"<a & 'b' \"c\">", "&lt;a &amp; &apos;b&apos; &quot;c&quot;>"},
        {"&amp;", "&amp;amp;"},
        {"\x01\t\n\r\x7f", "\x01\t\n\r\x7f"},
        {"caf\xc3\xa9 \xe2\x82\xac", "caf\xc3\xa9 \xe2\x82\xac"},
    };
    for (const auto &c : cases) {
        EXPECT_EQ(escaped(std::string(c.text)), c.written) << c.text;
        std::ostringstream os;
        lmx::output_convert_to_xml(os, c.text);
        EXPECT_EQ(os.str(), c.written) << c.text;
        std::string appended = "<";
        lmx::append_escaped(appended, c.text, std::string(c.text).size());
        EXPECT_EQ(appended, std::string("<") + c.written) << c.text;
    }
}

TEST(Escaping, NulBytesPass) {
    EXPECT_EQ(escaped(std::string("a\0<", 3)), std::string("a\0&lt;", 6));
}

TEST(Escaping, WideTable) {
    struct {
        std::wstring text;
        std::string written;
    } const cases[] = {
        {L"", ""},
        {L"]]>", "]]&gt;"},
        {L"]>", "]>"},
        {L"<&'\">", "&lt;&amp;&apos;&quot;>"},
        {units({0xE9}), "\xc3\xa9"},
        {units({0x20AC}), "\xe2\x82\xac"},
        {units({0xD83D, 0xDE00}), "\xf0\x9f\x98\x80"},
        {units({'a', 0xD83D, 0xDE00, '<'}), "a\xf0\x9f\x98\x80&lt;"},
        // A broken pair ends the string.
        {units({'a', 0xD83D}), "a"},
        {units({'a', 0xD83D, 'b', 'c'}), "a"},
        {units({'a', 0xD83D, 0xD83D, 0xDE00}), "a"},
        // A lone low surrogate passes as a code point.
        {units({'a', 0xDE00, 'b'}), "a\xed\xb8\x80" "b"},
        {units({0x01, 0x7F}), "\x01\x7f"},
    };
    for (const auto &c : cases)
        EXPECT_EQ(escaped(c.text), c.written);
}

TEST(Escaping, ObeysTheRuleInLongText) {
    std::string text;
    std::string expected;
    for (int i = 0; i < 5000; ++i) {
        text += "ab]]>c<d&e\"f'g]>";
        expected += "ab]]&gt;c&lt;d&amp;e&quot;f&apos;g]&gt;";
    }
    EXPECT_EQ(escaped(text), expected);
    std::wstring wide_text(text.begin(), text.end());
    EXPECT_EQ(escaped(wide_text), expected);
}

TEST(Escaping, StringValuesAreWrittenEscaped) {
    std::ostringstream os;
    lmx::o_to_v(os, std::string("a<b"));
    lmx::o_to_v(os, std::wstring(L"&]]>"));
    EXPECT_EQ(os.str(), "a&lt;b&amp;]]&gt;");
}

TEST(Escaping, AsciiOutputReplacesWhatIsAbove127) {
    std::ostringstream os;
    lmx::output_convert_to_ascii(os, units({'a', 0x7F, 0x80, 0xE9, 0xD83D, 0xDE00, '<'}));
    EXPECT_EQ(os.str(), "a\x7f....<");
}

// ---------------------------------------------------------------------------
// UTF-8 to UTF-16
// ---------------------------------------------------------------------------

TEST(NarrowToWide, Table) {
    struct {
        std::string text;
        std::wstring value;
    } const cases[] = {
        {"", L""},
        {"abc", L"abc"},
        {"\xc3\xa9", units({0xE9})},
        {"\xe2\x82\xac", units({0x20AC})},
        {"\xf0\x9f\x98\x80", units({0xD83D, 0xDE00})},
        {"\xf4\x8f\xbf\xbf", units({0xDBFF, 0xDFFF})},
        {"\xef\xbf\xbf", units({0xFFFF})},
        // An encoded surrogate pair passes as the two units.
        {"\xed\xa0\xbd\xed\xb8\x80", units({0xD83D, 0xDE00})},
        // Stops, keeping what was done, at ...
        {"ab\x80" "cd", L"ab"},                  // a continuation byte as lead
        {"ab\xf8\x80\x80\x80\x80", L"ab"},         // a five-byte lead
        {"ab\xff", L"ab"},                       // an impossible byte
        {"ab\xc3", L"ab"},                       // a truncated sequence
        {"ab\xe2\x82", L"ab"},                   // a truncated sequence
        {"ab\xc3(", L"ab"},                      // a bad continuation byte
        {"ab\xe2\x28\xac" "cd", L"ab"},          // a bad continuation byte
        {"ab\xed\xa0\xbd" "cd", L"ab"},          // a high surrogate without its low one
        {"ab\xed\xa0\xbd", L"ab"},               // a high surrogate at the end
        {"ab\xf4\x90\x80\x80", L"ab"},           // above U+10FFFF
    };
    for (const auto &c : cases)
        EXPECT_EQ(wide(c.text), c.value) << c.text;
}

TEST(NarrowToWide, EveryConversionFormAgrees) {
    std::string text = "x\xc3\xa9\xf0\x9f\x98\x80";
    std::wstring expected = units({'x', 0xE9, 0xD83D, 0xDE00});
    std::wstring a, b, c;
    lmx::convert(a, text);
    lmx::inittowstring(b, text.c_str());
    lmx::v_to_o(c, text);
    EXPECT_EQ(a, expected);
    EXPECT_EQ(b, expected);
    EXPECT_EQ(c, expected);
    EXPECT_EQ(lmx::inittowstring(text.c_str()), expected);
    EXPECT_EQ(lmx::inittowstring(nullptr), L"");
    std::string copy;
    lmx::vtostring(copy, text);
    EXPECT_EQ(copy, text);
    lmx::convert(copy, std::string("n"));
    EXPECT_EQ(copy, "n");
    std::wstring wide_copy;
    lmx::convert(wide_copy, expected);
    EXPECT_EQ(wide_copy, expected);
}

// ---------------------------------------------------------------------------
// UTF-16 to UTF-8
// ---------------------------------------------------------------------------

TEST(WideToNarrow, Table) {
    struct {
        std::wstring value;
        std::string text;
    } const cases[] = {
        {L"", ""},
        {L"abc", "abc"},
        {units({0xE9}), "\xc3\xa9"},
        {units({0x7FF}), "\xdf\xbf"},
        {units({0x800}), "\xe0\xa0\x80"},
        {units({0xFFFF}), "\xef\xbf\xbf"},
        {units({0xD83D, 0xDE00}), "\xf0\x9f\x98\x80"},
        {units({0xDBFF, 0xDFFF}), "\xf4\x8f\xbf\xbf"},
        // A lone surrogate passes as a code point of its own.
        {units({0xD83D}), "\xed\xa0\xbd"},
        {units({0xD83D, 'a'}), "\xed\xa0\xbd" "a"},
        {units({0xDE00}), "\xed\xb8\x80"},
        {units({0xDE00, 0xD83D}), "\xed\xb8\x80\xed\xa0\xbd"},
        // A wchar_t wide enough for a whole code point.
        {units({0x1F600}), "\xf0\x9f\x98\x80"},
        {units({0x110000}), "\xef\xbf\xbd"},
    };
    for (const auto &c : cases)
        EXPECT_EQ(narrow(c.value), c.text);
}

TEST(WideToNarrow, EncodesByCodePointSize) {
    EXPECT_EQ(utf8(0x41), "A");
    EXPECT_EQ(utf8(0x80), "\xc2\x80");
    EXPECT_EQ(utf8(0xFFFD), "\xef\xbf\xbd");
    EXPECT_EQ(utf8(0x10000), "\xf0\x90\x80\x80");
    EXPECT_EQ(utf8(0x10FFFF), "\xf4\x8f\xbf\xbf");
}

TEST(WideAndNarrow, EveryCodePointRoundTrips) {
    std::string all;
    std::wstring all_wide;
    for (unsigned long cp = 1; cp <= 0x10FFFF; ++cp) {
        if (cp >= 0xD800 && cp <= 0xDFFF)
            continue;
        std::string one = utf8(cp);
        std::wstring one_wide = wide(one);
        ASSERT_EQ(one_wide.size(), cp > 0xFFFF ? 2u : 1u) << std::hex << cp;
        ASSERT_EQ(narrow(one_wide), one) << std::hex << cp;
        all += one;
        all_wide += one_wide;
    }
    EXPECT_EQ(wide(all), all_wide);
    EXPECT_EQ(narrow(all_wide), all);
    EXPECT_EQ(lmx::length(all), 0x10FFFFu - 0x800u);
}

TEST(WideAndNarrow, EveryUnitPairRoundTripsFromWide) {
    // All well-formed UTF-16: each unit alone, and every surrogate pair.
    for (unsigned u = 1; u < 0x10000; ++u) {
        if (u >= 0xD800 && u <= 0xDFFF)
            continue;
        std::wstring w = units({u});
        ASSERT_EQ(wide(narrow(w)), w) << u;
    }
    for (unsigned high = 0xD800; high <= 0xDBFF; high += 7)
        for (unsigned low = 0xDC00; low <= 0xDFFF; ++low) {
            std::wstring w = units({high, low});
            ASSERT_EQ(wide(narrow(w)), w) << high << ' ' << low;
        }
}

// ---------------------------------------------------------------------------
// Length and digit facets
// ---------------------------------------------------------------------------

TEST(Length, CountsUtf8Characters) {
    struct {
        std::string text;
        std::size_t length;
    } const cases[] = {
        {"", 0},
        {"abc", 3},
        {"\xc3\xa9", 1},
        {"caf\xc3\xa9", 4},
        {"\xe2\x82\xac", 1},
        {"\xf0\x9f\x98\x80", 1},
        {"a\xf0\x9f\x98\x80" "b", 3},
        {"\xed\xa0\xbd\xed\xb8\x80", 1},       // an encoded surrogate pair counts once
        {"a\xed\xa0\xbd\xed\xb8\x80" "b", 3},
        {"\xed\x9f\xbf", 1},                    // U+D7FF is an ordinary three-byte character
        {"ab\x80" "cd", 2},                     // a bad lead ends the count
        {"ab\xf8" "cd", 2},
        {"ab\xff", 2},
    };
    for (const auto &c : cases)
        EXPECT_EQ(lmx::length(c.text), c.length) << c.text;
}

TEST(Length, MaxLength) {
    struct {
        std::string text;
        std::size_t max;
        bool is_ok;
    } const cases[] = {
        {"", 0, true},
        {"a", 0, false},
        {"a", 1, true},
        {"ab", 1, false},
        {"\xc3\xa9", 1, true},
        {"\xf0\x9f\x98\x80", 1, true},
        {"\xf0\x9f\x98\x80" "a", 1, false},
        {"\xc3\xa9\xc3\xa9", 1, false},
        {"\xc3\xa9\xc3\xa9", 2, true},
        {"abcde", 5, true},
        {"abcdef", 5, false},
        {"\xed\xa0\xbd\xed\xb8\x80", 2, true},
        // More than four bytes a character is refused without counting.
        {"\xed\xa0\xbd\xed\xb8\x80", 1, false},
    };
    for (const auto &c : cases)
        EXPECT_EQ(lmx::is_max_length_ok(c.text, c.max), c.is_ok) << c.text << " max " << c.max;
}

TEST(Length, MinLength) {
    struct {
        std::string text;
        std::size_t min;
        bool is_ok;
    } const cases[] = {
        {"", 0, true},
        {"", 1, false},
        {"a", 1, true},
        {"ab", 3, false},
        {"abc", 3, true},
        {"\xc3\xa9\xc3\xa9", 2, true},
        {"\xc3\xa9\xc3\xa9", 3, false},
        {"\xf0\x9f\x98\x80\xf0\x9f\x98\x80", 2, true},
        {"\xf0\x9f\x98\x80", 2, false},
        // Four bytes a character is enough without counting.
        {"\xed\xa0\xbd\xed\xb8\x80\xed\xa0\xbd\xed\xb8\x80", 3, true},
    };
    for (const auto &c : cases)
        EXPECT_EQ(lmx::is_min_length_ok(c.text, c.min), c.is_ok) << c.text << " min " << c.min;
}

TEST(Digits, TotalAndFraction) {
    struct {
        const char *text;
        std::size_t total;
        std::size_t fraction;
    } const cases[] = {
        {"", 0, 0},          {"123", 3, 0},      {"-12.345", 5, 3}, {".5", 1, 1},    {"5.", 1, 0},
        {"1.2.3", 3, 2},     {"+0.00", 3, 2},    {"1e10", 3, 0},    {"abc", 0, 0},
    };
    for (const auto &c : cases) {
        EXPECT_EQ(lmx::total_digits(c.text), c.total) << c.text;
        EXPECT_EQ(lmx::fraction_digits(c.text), c.fraction) << c.text;
    }
}

// ---------------------------------------------------------------------------
// List items
// ---------------------------------------------------------------------------

std::vector<std::string> tokens(lmx::c_xml_list_tokeniser &ar_tokeniser) {
    std::vector<std::string> out;
    std::string token;
    while (ar_tokeniser.get(&token))
        out.push_back(token);
    return out;
}

TEST(ListTokeniser, SplitsAtWhiteSpace) {
    lmx::c_xml_list_tokeniser tokeniser("  1.5 2\t3\n\r\n-4  ");
    EXPECT_EQ(tokens(tokeniser), (std::vector<std::string>{"1.5", "2", "3", "-4"}));
    std::string token = "kept";
    EXPECT_FALSE(tokeniser.get(token));
}

TEST(ListTokeniser, EmptyAndBlankTextHaveNoItems) {
    lmx::c_xml_list_tokeniser empty("");
    EXPECT_TRUE(tokens(empty).empty());
    lmx::c_xml_list_tokeniser blank(" \t\n ");
    EXPECT_TRUE(tokens(blank).empty());
    lmx::c_xml_list_tokeniser none;
    EXPECT_TRUE(tokens(none).empty());
}

TEST(ListTokeniser, SetRestarts) {
    lmx::c_xml_list_tokeniser tokeniser("a b");
    std::string token;
    ASSERT_TRUE(tokeniser.get(token));
    EXPECT_EQ(token, "a");
    tokeniser.set("x");
    EXPECT_EQ(tokens(tokeniser), (std::vector<std::string>{"x"}));
    tokeniser.set("c d");
    EXPECT_EQ(tokens(tokeniser), (std::vector<std::string>{"c", "d"}));
}

// ---------------------------------------------------------------------------
// Qualified names and empty values
// ---------------------------------------------------------------------------

TEST(QualifiedName, MakeQnameStoresNamespaceAndName) {
    lmx::ct_qname<std::string> narrow_name;
    lmx::make_qname(narrow_name, "urn:a", "local");
    EXPECT_EQ(narrow_name.get_namespace(), "urn:a");
    EXPECT_EQ(narrow_name.get_name(), "local");

    lmx::ct_qname<std::wstring> wide_name;
    lmx::make_qname(wide_name, "urn:b", "caf\xc3\xa9");
    EXPECT_EQ(wide_name.get_namespace(), "urn:b");
    EXPECT_EQ(wide_name.get_name(), units({'c', 'a', 'f', 0xE9}));

    std::string plain;
    lmx::make_qname(plain, "urn:c", "only");
    EXPECT_EQ(plain, "only");
    std::wstring plain_wide;
    lmx::make_qname(plain_wide, "urn:c", "only");
    EXPECT_EQ(plain_wide, L"only");

    EXPECT_TRUE(narrow_name == lmx::ct_qname<std::string>("urn:a", "local"));
    EXPECT_TRUE(narrow_name != lmx::ct_qname<std::string>("urn:x", "local"));
}

TEST(EmptyValue, AllEmptyValuesAreEqual) {
    EXPECT_TRUE(lmx::c_empty() == lmx::c_empty());
    EXPECT_FALSE(lmx::c_empty() != lmx::c_empty());
}

// ---------------------------------------------------------------------------
// Strings as values, text forms and manipulators
// ---------------------------------------------------------------------------

TEST(StringValue, ReadsAsIs) {
    std::string value;
    lmx::v_to_o(value, std::string(" a<b "));
    EXPECT_EQ(value, " a<b ");
}

TEST(AsString, GivesUnescapedText) {
    std::string out;
    lmx::as_string(out, std::string("a<b"));
    EXPECT_EQ(out, "a<b");
    lmx::as_string(out, units({'<', 0xE9}));
    EXPECT_EQ(out, "<\xc3\xa9");
    lmx::as_string(out, 0.1);
    EXPECT_EQ(out, "0.1");
    lmx::as_string(out, 0.1f);
    EXPECT_EQ(out, "0.1");
    lmx::as_string(out, true);
    EXPECT_EQ(out, "true");
    lmx::as_string(out, -12);
    EXPECT_EQ(out, "-12");
    lmx::as_string(out, 12u);
    EXPECT_EQ(out, "12");
    lmx::as_string(out, static_cast<short>(-7));
    EXPECT_EQ(out, "-7");
    lmx::as_string(out, static_cast<unsigned char>(200));
    EXPECT_EQ(out, "200");
    lmx::as_string(out, lmx::c_big_int("-007"));
    EXPECT_EQ(out, "-7");
    lmx::as_string(out, lmx::c_duration("P1D"));
    EXPECT_EQ(out, "P1D");
    lmx::as_string(out, lmx::c_datetime("2024-01-02T03:04:05Z"));
    EXPECT_EQ(out, "2024-01-02T03:04:05Z");
}

TEST(Manipulators, WriteTheirValueWhenInserted) {
    std::ostringstream os;
    std::string text = "a<b";
    std::wstring wide_text = units({'&', 0xE9});
    os << lmx::as_xml(text) << '|' << lmx::as_xml(wide_text) << '|' << lmx::as_xml(1.5) << '|'
       << lmx::as_xml(lmx::c_big_int("42")) << '|' << lmx::as_xml(true) << '|'
       << lmx::c_as_escaped<std::string>(text) << '|' << lmx::c_as_escaped<std::wstring>(wide_text) << '|'
       << lmx::c_as_bool_digit(true) << lmx::c_as_bool_digit(false) << '|' << lmx::c_as_ascii(wide_text) << '|'
       << lmx::c_as_xml_string<std::string>(text) << '|' << lmx::c_as_xml_string<std::wstring>(wide_text);
    EXPECT_EQ(os.str(), "a&lt;b|&amp;\xc3\xa9|1.5|42|true|a&lt;b|&amp;\xc3\xa9|10|&.|a<b|&\xc3\xa9");
}

TEST(Manipulators, ValueTypesHaveTheirTextForms) {
    std::ostringstream os;
    os << lmx::as_xml(lmx::c_decimal("-0.5")) << ' ' << lmx::as_xml(lmx::c_duration("PT1M")) << ' '
       << lmx::as_xml(lmx::c_date("2024-05-31")) << ' ' << lmx::as_xml(lmx::c_gday("---07"));
    EXPECT_EQ(os.str(), "-.5 PT1M 2024-05-31 ---07");
}

TEST(Output, AFailedStreamIsMarkedBad) {
    std::ostream os(nullptr);
    lmx::o_to_v(os, 1.5);
    EXPECT_TRUE(os.bad());
}

} // namespace
