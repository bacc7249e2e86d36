// Byte sources and character decoding: memory and file sources, encoding
// detection and declared encodings, UTF-16 and UCS-2, single byte encodings,
// line end folding and line counting, the UTF-8 helpers, and the reader's
// robustness against truncated and malformed input.
#include <chrono>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <initializer_list>
#include <optional>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include "reader_walk.h"

namespace {

using tessarine_test::clean_walk_row;
using tessarine_test::document_walk;
using tessarine_test::expect_clean_walk;
using tessarine_test::expect_walk;
using tessarine_test::recording_error;
using tessarine_test::temp_file;
using tessarine_test::traced_walk;
using tessarine_test::walk_traced;

// ---------------------------------------------------------------------------
// Helpers
// ---------------------------------------------------------------------------

std::string bytes(std::initializer_list<int> a_values) {
    std::string out;
    for (int v : a_values)
        out.push_back(static_cast<char>(v));
    return out;
}

std::string utf16le(const std::u16string &ar_text) {
    std::string out;
    for (char16_t unit : ar_text) {
        out.push_back(static_cast<char>(unit & 0xFF));
        out.push_back(static_cast<char>(unit >> 8));
    }
    return out;
}

std::string utf16be(const std::u16string &ar_text) {
    std::string out;
    for (char16_t unit : ar_text) {
        out.push_back(static_cast<char>(unit >> 8));
        out.push_back(static_cast<char>(unit & 0xFF));
    }
    return out;
}

const std::string k_le_bom = "\xFF\xFE";
const std::string k_be_bom = "\xFE\xFF";

// A decoding stream over its own copy of the input, reporting to its own record.
class decoder : public tessarine_test::getter_over_text<lmx::c_get_as_utf8> {
public:
    using getter_over_text::getter_over_text;

    int get() { return getter().get(); }
    int line() { return getter().get_line_num(); }
    lmx::e_encoding_mode mode() { return getter().get_encoding_mode(); }
};

// Bytes whose values run through all 256 in an order that is not periodic
// at the block size.
std::string patterned_bytes(std::size_t a_size) {
    std::string out(a_size, '\0');
    for (std::size_t i = 0; i < a_size; ++i)
        out[i] = static_cast<char>((i * 31 + i / 256 + i / 65536) & 0xFF);
    return out;
}

// Everything a byte source delivers up to its end.
std::string read_source(lmx::c_read &ar_source) {
    std::string read;
    for (int c = ar_source.read(); c != -1; c = ar_source.read())
        read.push_back(static_cast<char>(c));
    return read;
}

// The decoder reads ar_input to its end as ar_output, settles on a_mode (when
// given) and, with a_no_report, reports nothing.
void expect_decoded(const std::string &ar_input, const std::string &ar_output,
                    std::optional<lmx::e_encoding_mode> a_mode, bool a_no_report) {
    decoder d(ar_input);
    EXPECT_EQ(d.read_to_end(), ar_output);
    if (a_mode) {
        EXPECT_EQ(d.mode(), *a_mode);
    }
    if (a_no_report) {
        EXPECT_TRUE(d.error().reports().empty()) << d.error().describe();
    }
}

constexpr bool k_no_report = true;
constexpr bool k_reports_unchecked = false;

// The decoder has given up on what it reads next: the stream is over for good
// and the record holds the fatal report of an unrecognised encoding.
void expect_unrecognised_encoding(decoder &ar_decoder) {
    EXPECT_EQ(ar_decoder.get(), -1);
    EXPECT_EQ(ar_decoder.get(), -1);
    EXPECT_TRUE(ar_decoder.error().is_fatal_errored());
    EXPECT_EQ(ar_decoder.error().get_last_error(), lmx::elmx_encoding_not_supported);
    EXPECT_TRUE(ar_decoder.error().reported(lmx::elmx_type_fatal, lmx::elmx_encoding_not_supported,
                                            "Unrecognised character encoding"))
        << ar_decoder.error().describe();
}

// The decoder's verdict on the first bytes of an input.
void expect_detection_failure(const std::string &ar_input) {
    decoder d(ar_input);
    expect_unrecognised_encoding(d);
}

// ---------------------------------------------------------------------------
// Memory and file sources
// ---------------------------------------------------------------------------

TEST(ByteSource, MemoryDeliversEveryByteValueThenEnd) {
    const std::string data = patterned_bytes(256 * 3);
    lmx::c_read_memory source(data.data(), data.size());
    EXPECT_TRUE(source.is_open());
    for (std::size_t i = 0; i < data.size(); ++i)
        ASSERT_EQ(source.read(), static_cast<unsigned char>(data[i])) << "at " << i;
    EXPECT_EQ(source.read(), -1);
    EXPECT_EQ(source.read(), -1);
}

TEST(ByteSource, MemoryRewindStartsOver) {
    const std::string data = "<abc/>";
    lmx::c_read_memory source(data.data(), data.size());
    EXPECT_EQ(source.read(), '<');
    EXPECT_EQ(source.read(), 'a');
    source.rewind();
    EXPECT_EQ(source.read(), '<');
    while (source.read() != -1) {
    }
    source.rewind();
    EXPECT_EQ(source.read(), '<');
}

TEST(ByteSource, MemorySourceIdIsEmpty) {
    const std::string data = "<a/>";
    lmx::c_read_memory source(data.data(), data.size());
    ASSERT_NE(source.get_source_id(), nullptr);
    EXPECT_STREQ(source.get_source_id(), "");
}

TEST(ByteSource, EmptyMemoryEndsAtOnce) {
    lmx::c_read_memory source("", 0);
    EXPECT_EQ(source.read(), -1);
    source.rewind();
    EXPECT_EQ(source.read(), -1);
}

TEST(ByteSource, MemoryDeliversNulAndHighBytesAsValues) {
    const std::string data = bytes({0x00, 0x80, 0xFF, 0x7F});
    lmx::c_read_memory source(data.data(), data.size());
    EXPECT_EQ(source.read(), 0);
    EXPECT_EQ(source.read(), 0x80);
    EXPECT_EQ(source.read(), 0xFF);
    EXPECT_EQ(source.read(), 0x7F);
    EXPECT_EQ(source.read(), -1);
}

TEST(ByteSource, StringSourceReadsTheString) {
    const std::string data = "<a>\xC3\xA9</a>";
    lmx::c_read_string source(data);
    EXPECT_EQ(read_source(source), data);
}

TEST(ByteSource, FileDeliversEveryByteAcrossBlockBoundaries) {
    for (std::size_t size : {std::size_t{0}, std::size_t{1}, std::size_t{65535}, std::size_t{65536},
                             std::size_t{65537}, std::size_t{3 * 65536 + 17}}) {
        SCOPED_TRACE(size);
        const std::string data = patterned_bytes(size);
        temp_file file(data);
        lmx::c_read_file source(file.path().c_str());
        ASSERT_TRUE(source.is_open());
        std::size_t i = 0;
        for (int c = source.read(); c != -1; c = source.read(), ++i) {
            ASSERT_LT(i, data.size());
            ASSERT_EQ(c, static_cast<unsigned char>(data[i])) << "at " << i;
        }
        EXPECT_EQ(i, data.size());
        EXPECT_EQ(source.read(), -1);
    }
}

TEST(ByteSource, FileRewindStartsOverFromAnyBlock) {
    const std::string data = patterned_bytes(150000);
    temp_file file(data);
    lmx::c_read_file source(file.path().c_str());
    ASSERT_TRUE(source.is_open());
    for (int i = 0; i < 70000; ++i)
        ASSERT_NE(source.read(), -1);
    source.rewind();
    for (std::size_t i = 0; i < data.size(); ++i)
        ASSERT_EQ(source.read(), static_cast<unsigned char>(data[i])) << "at " << i;
    EXPECT_EQ(source.read(), -1);
}

TEST(ByteSource, FileSourceIdIsThePath) {
    temp_file file("<a/>");
    lmx::c_read_file source(file.path().c_str());
    ASSERT_NE(source.get_source_id(), nullptr);
    EXPECT_EQ(std::string(source.get_source_id()), file.path());
}

TEST(ByteSource, WidePathWithNonAsciiNameOpensTheFile) {
    const std::string dir = std::filesystem::temp_directory_path().string();
    for (char c : dir)
        if (static_cast<unsigned char>(c) >= 0x80)
            GTEST_SKIP() << "temporary directory has a non-ASCII path";
    // "é" and "中" as UTF-8 for the file system, as UTF-16 units for the reader.
    const std::string stem = temp_file::unique_name("");
    const std::string utf8_name = stem + "_\xC3\xA9\xE4\xB8\xAD.xml";
    const std::string document = "<caf\xC3\xA9 v=\"1\"/>";
    temp_file file(document, utf8_name);

    std::wstring wide_path(dir.begin(), dir.end());
    wide_path += L'/';
    wide_path += std::wstring(stem.begin(), stem.end());
    wide_path += L"_\u00E9\u4E2D.xml";

    lmx::c_read_file source(wide_path.c_str());
    ASSERT_TRUE(source.is_open());
    ASSERT_NE(source.get_source_id(), nullptr);
    EXPECT_EQ(std::string(source.get_source_id()), dir + "/" + utf8_name);
    EXPECT_EQ(read_source(source), document);

    lmx::c_xml_reader_file reader(wide_path.c_str());
    ASSERT_TRUE(reader.is_open());
    expect_walk(walk_traced(reader), lmx::elmx_ok, "<caf\xC3\xA9>[v=1]</caf\xC3\xA9>");
}

TEST(ByteSource, FileThatCannotBeOpenedReadsAsEnd) {
    const std::filesystem::path missing =
        std::filesystem::temp_directory_path() / temp_file::unique_name("_no_such_dir") / "missing.xml";
    const std::string path = missing.string();

    lmx::c_read_file source(path.c_str());
    EXPECT_FALSE(source.is_open());
    EXPECT_EQ(source.read(), -1);
    EXPECT_EQ(source.read(), -1);
    source.rewind();
    EXPECT_EQ(source.read(), -1);

    recording_error error;
    lmx::c_get_as_utf8 getter(source, error);
    EXPECT_EQ(getter.get(), -1);
    EXPECT_TRUE(error.reports().empty()) << error.describe();

    lmx::c_xml_reader_file reader(path.c_str());
    EXPECT_FALSE(reader.is_open());
    lmx::elmx_error code = lmx::elmx_ok;
    EXPECT_EQ(reader.get_element_event(&code), lmx::xe_end_of_input);
    EXPECT_EQ(code, lmx::elmx_unexpected_end_of_message);

    EXPECT_EQ(tessarine_tools::walk_xml_file(path).error, lmx::elmx_unable_to_open_file);
}

TEST(ByteSource, WidePathThatCannotBeOpenedReadsAsEnd) {
    const std::wstring path = L"/tessarine-no-such-directory/\u00E9.xml";
    lmx::c_read_file source(path.c_str());
    EXPECT_FALSE(source.is_open());
    EXPECT_EQ(source.read(), -1);
    lmx::c_xml_reader_file reader(path.c_str());
    EXPECT_FALSE(reader.is_open());
}

// Walks the document from a file: its one text run must be ar_expected. The
// reader is then handed to a_more for what else the test checks.
template <typename F>
void expect_text_read_from_file(const std::string &ar_document, const std::string &ar_expected, F a_more) {
    temp_file file(ar_document);
    lmx::c_xml_reader_file reader(file.path().c_str());
    ASSERT_TRUE(reader.is_open());
    traced_walk walk = walk_traced(reader);
    ASSERT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    ASSERT_EQ(walk.seen.texts.size(), 1u);
    EXPECT_EQ(walk.seen.texts[0].size(), ar_expected.size());
    EXPECT_TRUE(walk.seen.texts[0] == ar_expected) << "text differs from the file's content";
    a_more(reader);
}

TEST(ByteSource, LargeUtf8FileWithCharactersAndLineEndAcrossBlocks) {
    std::string document = "<a>";
    std::string expected;
    auto fill_to = [&](std::size_t a_offset) {
        while (document.size() < a_offset) {
            char c = static_cast<char>('a' + document.size() % 26);
            document.push_back(c);
            expected.push_back(c);
        }
    };
    fill_to(65535); // 2 byte character split over the first boundary
    document += "\xC3\xA9";
    expected += "\xC3\xA9";
    fill_to(131071); // CR LF split over the second boundary
    document += "\r\n";
    expected += "\n";
    fill_to(196607); // 3 byte character, first byte before the third boundary
    document += "\xE2\x82\xAC";
    expected += "\xE2\x82\xAC";
    fill_to(262142); // 4 byte character, two bytes on each side of the fourth
    document += "\xF0\x9F\x98\x80";
    expected += "\xF0\x9F\x98\x80";
    fill_to(270000);
    document += "</a>";

    expect_text_read_from_file(document, expected,
                               [](lmx::c_xml_reader_file &ar_reader) { EXPECT_EQ(ar_reader.get_line_no(), 2); });
}

TEST(ByteSource, LargeUtf16FileWithSurrogatePairAcrossABlockBoundary) {
    std::u16string text;
    // BOM (2 bytes) and "<a>" (6 bytes) come first; the high surrogate then
    // ends the first block and the low surrogate starts the second.
    for (std::size_t offset = 8; offset < 65534; offset += 2)
        text.push_back(u'x');
    text += u"\xD83D\xDE00";
    for (int i = 0; i < 40000; ++i)
        text.push_back(static_cast<char16_t>(u'a' + i % 26));
    text += u"\x00E9";
    const std::string document = k_le_bom + utf16le(u"<a>" + text + u"</a>");

    std::string expected;
    for (char16_t unit : text) {
        if (unit < 0x80)
            expected.push_back(static_cast<char>(unit));
    }
    expected.insert((65534 - 8) / 2, "\xF0\x9F\x98\x80");
    expected += "\xC3\xA9";

    expect_text_read_from_file(document, expected, [](lmx::c_xml_reader_file &ar_reader) {
        EXPECT_EQ(ar_reader.get_encoding_mode(), lmx::mode_utf16_le);
    });
}

// ---------------------------------------------------------------------------
// Encoding detection
// ---------------------------------------------------------------------------

TEST(Decoding, Utf8ByteOrderMarkIsDroppedAndTheDocumentParses) {
    const std::string input = "\xEF\xBB\xBF<a/>";
    expect_decoded(input, "<a/>", lmx::mode_utf8, k_no_report);
    expect_walk(walk_traced(input), lmx::elmx_ok, "<a></a>");
}

TEST(Decoding, QuestionMarkAsFirstByteFailsDetection) {
    const std::string input = "?xml version=\"1.0\"?><a/>";
    expect_detection_failure(input);
    expect_walk(walk_traced(input), lmx::elmx_encoding_not_supported);
}

TEST(Decoding, Utf16WithoutBomIsToldByTheZeroBesideLessThan) {
    // Zero after "<": little endian; zero before it: big endian.
    expect_decoded(utf16le(u"<?xml version=\"1.0\"?>"), "<?xml version=\"1.0\"?>", lmx::mode_utf16_le,
                   k_reports_unchecked);
    expect_decoded(utf16be(u"<?xml version=\"1.0\"?>"), "<?xml version=\"1.0\"?>", lmx::mode_utf16_be,
                   k_reports_unchecked);
}

TEST(Decoding, TabAsFirstByteIsAccepted) {
    expect_decoded("\t<a/>", "\t<a/>", lmx::mode_utf8, k_reports_unchecked);
    expect_walk(walk_traced(std::string("\t<a/>")), lmx::elmx_ok);
}

TEST(Decoding, LetterAsFirstByteIsRejected) {
    const std::string input = "a<b/>";
    expect_detection_failure(input);
    expect_walk(walk_traced(input), lmx::elmx_encoding_not_supported);
}

struct detection_row {
    const char *name;
    std::string input;
    std::string expected;
    lmx::e_encoding_mode mode;
};

TEST(Decoding, FirstBytesSelectTheEncoding) {
    const detection_row rows[] = {
        {"utf-8 with byte order mark", "\xEF\xBB\xBF<a/>", "<a/>", lmx::mode_utf8},
        {"utf-8 starting with less-than", "<a/>", "<a/>", lmx::mode_utf8},
        {"utf-8 starting with a blank", " <a/>", " <a/>", lmx::mode_utf8},
        {"utf-8 starting with a tab", "\t<a/>", "\t<a/>", lmx::mode_utf8},
        {"utf-8 starting with a line feed", "\n<a/>", "\n<a/>", lmx::mode_utf8},
        {"utf-8 non-ASCII right after the first byte", "<\xC3\xA9/>", "<\xC3\xA9/>", lmx::mode_utf8},
        {"utf-8 of one byte", "<", "<", lmx::mode_utf8},
        // The byte order mark is dropped.
        {"utf-16le with byte order mark", k_le_bom + utf16le(u"<a/>"), "<a/>", lmx::mode_utf16_le},
        {"utf-16be with byte order mark", k_be_bom + utf16be(u"<a/>"), "<a/>", lmx::mode_utf16_be},
        {"utf-16le without byte order mark", utf16le(u"<a/>"), "<a/>", lmx::mode_utf16_le},
        {"utf-16be without byte order mark", utf16be(u"<a/>"), "<a/>", lmx::mode_utf16_be},
        {"utf-16le starting with a blank", utf16le(u" <a/>"), " <a/>", lmx::mode_utf16_le},
        {"utf-16be starting with a blank", utf16be(u" <a/>"), " <a/>", lmx::mode_utf16_be},
        {"utf-16le with mark starting with a blank", k_le_bom + utf16le(u" <a/>"), " <a/>", lmx::mode_utf16_le},
    };
    for (const detection_row &row : rows) {
        SCOPED_TRACE(row.name);
        expect_decoded(row.input, row.expected, row.mode, k_no_report);
    }
}

TEST(Decoding, FirstBytesThatFitNoRuleFail) {
    const std::pair<const char *, std::string> rows[] = {
        {"question mark", "?"},
        {"letter", "a"},
        {"digit", "1<a/>"},
        {"stray continuation byte", bytes({0x80, '<'})},
        {"non-ASCII character first", "\xC3\xA9<a/>"},
        {"FF alone", bytes({0xFF})},
        {"FF not followed by FE", bytes({0xFF, 0x41, '<', 0})},
        {"FF FE then end", bytes({0xFF, 0xFE})},
        {"FF FE then zero first", bytes({0xFF, 0xFE, 0x00, '<'})},
        {"FF FE then non-zero second", bytes({0xFF, 0xFE, '<', '<'})},
        {"FF FE then non-ASCII unit", bytes({0xFF, 0xFE, 0xE9, 0x00})},
        {"FF FE then half a unit", bytes({0xFF, 0xFE, '<'})},
        {"FE alone", bytes({0xFE})},
        {"FE not followed by FF", bytes({0xFE, 0x41})},
        {"FE FF then non-zero first", bytes({0xFE, 0xFF, '<', 0x00})},
        {"FE FF then zero second", bytes({0xFE, 0xFF, 0x00, 0x00})},
        {"FE FF then non-ASCII unit", bytes({0xFE, 0xFF, 0x00, 0xE9})},
        {"EF alone", bytes({0xEF})},
        {"EF not followed by BB", bytes({0xEF, 0x41, 0xBF, '<'})},
        {"EF BB not followed by BF", bytes({0xEF, 0xBB, 0x41, '<'})},
        {"EF BB then end", bytes({0xEF, 0xBB})},
        {"zero alone", bytes({0x00})},
        {"zero then letter", bytes({0x00, 'a'})},
        {"zero then zero", bytes({0x00, 0x00})},
    };
    for (const auto &row : rows) {
        SCOPED_TRACE(row.first);
        expect_detection_failure(row.second);
    }
}

TEST(Decoding, EmptyInputEndsWithoutErrorAndResolvesNothing) {
    decoder d("");
    EXPECT_EQ(d.get(), -1);
    EXPECT_EQ(d.get(), -1);
    EXPECT_TRUE(d.error().reports().empty());
    EXPECT_FALSE(d.error().is_fatal_errored());
    EXPECT_EQ(d.mode(), lmx::mode_unresolved);
}

// ---------------------------------------------------------------------------
// Documents in every encoding form
// ---------------------------------------------------------------------------

std::u16string declared(const std::u16string &ar_encoding) {
    return u"<?xml version=\"1.0\" encoding=\"" + ar_encoding + u"\"?>\n<doc lang=\"fr\"><name>x</name></doc>";
}

std::string declared8(const std::string &ar_encoding) {
    return "<?xml version=\"1.0\" encoding=\"" + ar_encoding + "\"?>\n<doc lang=\"fr\"><name>x</name></doc>";
}

// What the walk meets in the documents of declared() and declared8().
const char *const k_declared_trace = "<doc>[lang=fr]<name>x</name></doc>";

TEST(Decoding, DocumentsInEveryEncodingFormRead) {
    const clean_walk_row rows[] = {
        {"utf-8 without declaration", "<doc lang=\"fr\"><name>x</name></doc>", k_declared_trace, 0, lmx::mode_utf8},
        {"utf-8 declared", declared8("UTF-8"), k_declared_trace, 0, lmx::mode_utf8},
        {"utf-8 with byte order mark", "\xEF\xBB\xBF" + declared8("UTF-8"), k_declared_trace, 0, lmx::mode_utf8},
        {"utf-16le with byte order mark", k_le_bom + utf16le(declared(u"UTF-16")), k_declared_trace, 0,
         lmx::mode_utf16_le},
        {"utf-16le without byte order mark", utf16le(declared(u"UTF-16")), k_declared_trace, 0, lmx::mode_utf16_le},
        {"utf-16be with byte order mark", k_be_bom + utf16be(declared(u"UTF-16")), k_declared_trace, 0,
         lmx::mode_utf16_be},
        {"utf-16be without byte order mark", utf16be(declared(u"UTF-16")), k_declared_trace, 0, lmx::mode_utf16_be},
        {"utf-16 without declaration", k_le_bom + utf16le(u"<doc lang=\"fr\"><name>x</name></doc>"),
         k_declared_trace, 0, lmx::mode_utf16_le},
        {"ucs-2 little endian", k_le_bom + utf16le(declared(u"ISO-10646-UCS-2")), k_declared_trace, 0,
         lmx::mode_ucs2_le},
        {"ucs-2 big endian", utf16be(declared(u"ISO-10646-UCS-2")), k_declared_trace, 0, lmx::mode_ucs2_be},
        {"iso-8859-1", declared8("ISO-8859-1"), k_declared_trace, 0, lmx::mode_single_byte},
        {"us-ascii", declared8("US-ASCII"), k_declared_trace, 0, lmx::mode_single_byte},
    };
    for (const clean_walk_row &row : rows)
        expect_clean_walk(row);
}

TEST(Decoding, Utf16CharactersBecomeUtf8) {
    const std::u16string text = u"<doc v=\"\x00E9\">caf\x00E9 \x20AC \xD83D\xDE00</doc>";
    const std::string expected = "<doc>[v=\xC3\xA9]caf\xC3\xA9 \xE2\x82\xAC \xF0\x9F\x98\x80</doc>";
    for (const std::string &document : {k_le_bom + utf16le(text), utf16le(text), k_be_bom + utf16be(text),
                                        utf16be(text)})
        expect_walk(walk_traced(document), lmx::elmx_ok, expected);
}

TEST(Decoding, Utf16SurrogatePairBecomesFourByteUtf8) {
    expect_decoded(utf16le(u"<\xD83D\xDE00\xDBFF\xDFFF\xD800\xDC00"),
                   "<\xF0\x9F\x98\x80\xF4\x8F\xBF\xBF\xF0\x90\x80\x80", std::nullopt, k_no_report);
    expect_decoded(utf16be(u"<\xD83D\xDE00"), "<\xF0\x9F\x98\x80", std::nullopt, k_no_report);
}

TEST(Decoding, HighSurrogateWithoutLowSurrogateIsFatal) {
    for (const std::string &input : {utf16le(u"<\xD83D" u"A"), utf16be(u"<\xD83D" u"A"),
                                     utf16le(u"<\xD83D\xD83D\xDE00")}) {
        decoder d(input);
        EXPECT_EQ(d.get(), '<');
        expect_unrecognised_encoding(d);
    }
}

TEST(Decoding, HighSurrogateAtEndOfInputEndsSilently) {
    std::string with_half_low = utf16le(u"<\xD83D\xDE00");
    with_half_low.pop_back();
    for (const std::string &input : {utf16le(u"<\xD83D"), with_half_low}) {
        decoder d(input);
        EXPECT_EQ(d.get(), '<');
        EXPECT_EQ(d.get(), -1);
        EXPECT_TRUE(d.error().reports().empty()) << d.error().describe();
    }
}

TEST(Decoding, LoneLowSurrogateGoesStraightThroughTheMapping) {
    expect_decoded(utf16le(u"<\xDE00" u"a"), "<\xED\xB8\x80" "a", std::nullopt, k_no_report);
    expect_walk(walk_traced(k_le_bom + utf16le(u"<a>\xDE00</a>")), lmx::elmx_ok, "<a>\xED\xB8\x80</a>");
}

TEST(Decoding, Utf16InputEndingInsideAUnitEndsSilently) {
    expect_decoded(utf16le(u"<a") + "b", "<a", std::nullopt, k_no_report);
}

TEST(Decoding, Ucs2PassesSurrogatesThroughOneByOne) {
    const std::u16string text = u"<?xml version=\"1.0\" encoding=\"ISO-10646-UCS-2\"?><a>\xD83D\xDE00</a>";
    const std::string high_then_low = "\xED\xA0\xBD\xED\xB8\x80";
    for (const std::string &document : {k_le_bom + utf16le(text), utf16be(text)}) {
        document_walk w(document);
        expect_walk(w.walk, lmx::elmx_ok, "<a>" + high_then_low + "</a>");
        EXPECT_TRUE(w.reader.get_encoding_mode() == lmx::mode_ucs2_le ||
                    w.reader.get_encoding_mode() == lmx::mode_ucs2_be);
    }
}

TEST(Decoding, SetEncodingSwitchesUtf16ToUcs2) {
    decoder le(utf16le(u"<\xD83D\xDE00"));
    EXPECT_EQ(le.get(), '<');
    EXPECT_TRUE(le.getter().set_encoding("ISO-10646-UCS-2"));
    EXPECT_EQ(le.mode(), lmx::mode_ucs2_le);
    EXPECT_EQ(le.read_to_end(), "\xED\xA0\xBD\xED\xB8\x80");

    decoder be(utf16be(u"<a"));
    EXPECT_EQ(be.get(), '<');
    EXPECT_TRUE(be.getter().set_encoding("iso-10646-ucs-2"));
    EXPECT_EQ(be.mode(), lmx::mode_ucs2_be);
}

// ---------------------------------------------------------------------------
// Declared encodings
// ---------------------------------------------------------------------------

TEST(Decoding, DeclaredSingleByteEncodingsMapEveryByteToOneCharacter) {
    const clean_walk_row rows[] = {
        {"declared ISO-8859-1 turns later high bytes into two byte UTF-8",
         "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><doc title=\"caf\xE9\">na\xEFve \xA9\xFF\x7F</doc>",
         "<doc>[title=caf\xC3\xA9]na\xC3\xAFve \xC2\xA9\xC3\xBF\x7F</doc>", 0, lmx::mode_single_byte},
        {"declared ISO-8859-1 reads UTF-8 bytes as two characters",
         "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><a>\xC3\xA9</a>", "<a>\xC3\x83\xC2\xA9</a>"},
        {"declared US-ASCII reads like Latin-1", "<?xml version=\"1.0\" encoding=\"US-ASCII\"?><a>\xE9\x80</a>",
         "<a>\xC3\xA9\xC2\x80</a>"},
        {"single byte NEL becomes newline", "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><a>x\x85y</a>",
         "<a>x\ny</a>", 2},
    };
    for (const clean_walk_row &row : rows)
        expect_clean_walk(row);
}

TEST(Decoding, SingleByteEncodingTakesEffectFromTheNextByte) {
    // The byte after the first is read with it, to tell the encoding.
    decoder d("<x\xE9" "a");
    EXPECT_EQ(d.get(), '<');
    EXPECT_EQ(d.get(), 'x');
    EXPECT_TRUE(d.getter().set_encoding("ISO-8859-1"));
    EXPECT_EQ(d.mode(), lmx::mode_single_byte);
    EXPECT_EQ(d.read_to_end(), "\xC3\xA9" "a");
}

TEST(Decoding, DeclaredNameIsMatchedInAnyCase) {
    const clean_walk_row rows[] = {
        {"utf-8", declared8("utf-8"), k_declared_trace, 0, lmx::mode_utf8},
        {"Utf-8", declared8("Utf-8"), k_declared_trace, 0, lmx::mode_utf8},
        {"iso-8859-1", declared8("iso-8859-1"), k_declared_trace, 0, lmx::mode_single_byte},
        {"Iso-8859-1", declared8("Iso-8859-1"), k_declared_trace, 0, lmx::mode_single_byte},
        {"us-ascii", declared8("us-ascii"), k_declared_trace, 0, lmx::mode_single_byte},
        {"uS-AsCiI", declared8("uS-AsCiI"), k_declared_trace, 0, lmx::mode_single_byte},
        {"utf-16", k_le_bom + utf16le(declared(u"utf-16")), k_declared_trace, 0, lmx::mode_utf16_le},
        {"uTf-16", utf16be(declared(u"uTf-16")), k_declared_trace, 0, lmx::mode_utf16_be},
        {"iso-10646-ucs-2", k_le_bom + utf16le(declared(u"iso-10646-ucs-2")), k_declared_trace, 0,
         lmx::mode_ucs2_le},
        {"Iso-10646-Ucs-2", utf16be(declared(u"Iso-10646-Ucs-2")), k_declared_trace, 0, lmx::mode_ucs2_be},
    };
    for (const clean_walk_row &row : rows)
        expect_clean_walk(row);
}

struct declaration_failure_row {
    const char *name;
    std::string document;
    lmx::elmx_error code;
    const char *message;
};

const char *const k_mismatch_message = "Mis-match between specfied encoding and byte format";
const char *const k_unknown_message = "Unknown character encoding specified";

TEST(Decoding, DeclarationsThatContradictTheBytesOrAreUnknownAreFatal) {
    const declaration_failure_row rows[] = {
        {"utf-16le declaring utf-8", k_le_bom + utf16le(declared(u"UTF-8")), lmx::elmx_encoding_mismatch,
         k_mismatch_message},
        {"utf-16be declaring utf-8", utf16be(declared(u"utf-8")), lmx::elmx_encoding_mismatch, k_mismatch_message},
        {"utf-8 declaring utf-16", declared8("UTF-16"), lmx::elmx_encoding_mismatch, k_mismatch_message},
        {"utf-8 with mark declaring utf-16", "\xEF\xBB\xBF" + declared8("UTF-16"), lmx::elmx_encoding_mismatch,
         k_mismatch_message},
        {"utf-8 declaring ucs-2", declared8("ISO-10646-UCS-2"), lmx::elmx_encoding_mismatch, k_mismatch_message},
        {"utf-16le declaring iso-8859-1", utf16le(declared(u"ISO-8859-1")), lmx::elmx_encoding_mismatch,
         k_mismatch_message},
        {"utf-16be declaring us-ascii", utf16be(declared(u"US-ASCII")), lmx::elmx_encoding_mismatch,
         k_mismatch_message},
        {"utf-8 declaring an unknown name", declared8("EBCDIC-US"), lmx::elmx_encoding_not_supported,
         k_unknown_message},
        {"utf-8 declaring an empty name", declared8(""), lmx::elmx_encoding_not_supported, k_unknown_message},
        {"utf-16 declaring an unknown name", k_le_bom + utf16le(declared(u"KOI8-R")),
         lmx::elmx_encoding_not_supported, k_unknown_message},
        {"utf-8 declaring a near miss", declared8("UTF8"), lmx::elmx_encoding_not_supported, k_unknown_message},
    };
    for (const declaration_failure_row &row : rows) {
        SCOPED_TRACE(row.name);
        document_walk w(row.document);
        expect_walk(w.walk, row.code);
        EXPECT_EQ(w.reader.get_error(), row.code);
        EXPECT_TRUE(w.reader.get_error_record().is_fatal_errored());
        EXPECT_TRUE(w.walk.seen.elements.empty());
        tessarine_test::expect_scan_report(row.document, tessarine_test::scan_end::fails, lmx::elmx_type_fatal,
                                           row.code, row.message);
    }
}

TEST(Decoding, SetEncodingAcceptsOnlyNamesThatFitTheBytes) {
    {
        decoder d("<a");
        EXPECT_EQ(d.get(), '<');
        EXPECT_TRUE(d.getter().set_encoding("UTF-8"));
        EXPECT_EQ(d.mode(), lmx::mode_utf8);
        EXPECT_TRUE(d.error().reports().empty());
    }
    // Names the bytes cannot be (the name set, the input, the report): the
    // stream is over after the report.
    const declaration_failure_row refused[] = {
        {"UTF-16", "<a", lmx::elmx_encoding_mismatch, k_mismatch_message},
        {"Shift_JIS", "<a", lmx::elmx_encoding_not_supported, k_unknown_message},
    };
    for (const declaration_failure_row &row : refused) {
        SCOPED_TRACE(row.name);
        decoder d(row.document);
        EXPECT_EQ(d.get(), '<');
        EXPECT_FALSE(d.getter().set_encoding(row.name));
        EXPECT_TRUE(d.error().reported(lmx::elmx_type_fatal, row.code, row.message)) << d.error().describe();
        EXPECT_EQ(d.get(), -1);
    }
    {
        decoder d(utf16le(u"<a"));
        EXPECT_EQ(d.get(), '<');
        EXPECT_TRUE(d.getter().set_encoding("utf-16"));
        EXPECT_EQ(d.mode(), lmx::mode_utf16_le);
        EXPECT_FALSE(d.getter().set_encoding("UTF-8"));
        EXPECT_EQ(d.error().get_last_error(), lmx::elmx_encoding_mismatch);
    }
}

// ---------------------------------------------------------------------------
// Line ends and line numbers
// ---------------------------------------------------------------------------

struct value_and_line {
    int value;
    int line;
};

// Decodes ar_input value by value, each with the line number it leaves.
void expect_values_and_lines(const std::string &ar_input, std::initializer_list<value_and_line> a_expected) {
    SCOPED_TRACE(testing::PrintToString(ar_input));
    decoder d(ar_input);
    int index = 0;
    for (const value_and_line &e : a_expected) {
        SCOPED_TRACE(index++);
        EXPECT_EQ(d.get(), e.value);
        EXPECT_EQ(d.line(), e.line);
    }
}

TEST(Decoding, CrLfCrAndLfEachCountOneLine) {
    expect_values_and_lines("<\r\n1\r2\n3",
                            {{'<', 1}, {'\n', 2}, {'1', 2}, {'\n', 3}, {'2', 3}, {'\n', 4}, {'3', 4}, {-1, 4}});
}

TEST(Decoding, RunsOfLineEndsCountOneLineEach) {
    expect_values_and_lines("<\r\r", {{'<', 1}, {'\n', 2}, {'\n', 3}});
    expect_values_and_lines("<\n\r", {{'<', 1}, {'\n', 2}, {'\n', 3}});
    expect_values_and_lines("<\r\n\r\n", {{'<', 1}, {'\n', 2}, {'\n', 3}, {-1, 3}});
    expect_values_and_lines("<\n\n", {{'<', 1}, {'\n', 2}, {'\n', 3}, {-1, 3}});
}

TEST(Decoding, NelAndLineSeparatorFoldToNewline) {
    expect_values_and_lines("<\xC2\x85" "a\xE2\x80\xA8" "b",
                            {{'<', 1}, {'\n', 2}, {'a', 2}, {'\n', 3}, {'b', 3}, {-1, 3}});
}

TEST(Decoding, ParagraphSeparatorIsNotALineEnd) {
    decoder d("<\xE2\x80\xA9");
    EXPECT_EQ(d.read_to_end(), "<\xE2\x80\xA9");
    EXPECT_EQ(d.line(), 1);
}

TEST(Decoding, CarriageReturnBeforeNelCountsOneLine) {
    expect_values_and_lines("<\r\xC2\x85" "a", {{'<', 1}, {'\n', 2}, {'a', 2}});
}

TEST(Decoding, Utf16LineEndsFold) {
    decoder d(utf16le(u"<\r\n1\r2\x0085" u"3\x2028" u"4"));
    EXPECT_EQ(d.read_to_end(), "<\n1\n2\n3\n4");
    EXPECT_EQ(d.line(), 5);
}

TEST(Decoding, ReaderFoldsAndCountsLineEnds) {
    const clean_walk_row rows[] = {
        {"NEL and line separator fold in a version 1.0 document",
         "<?xml version=\"1.0\"?><a>x\xC2\x85y\xE2\x80\xA8z</a>", "<a>x\ny\nz</a>", 3},
        {"each kind of line end counts once", "<a>\r\n<b/>\r<c/>\n</a>", nullptr, 4},
        // The scanner reads the line end after "a", pushes it back and reads it
        // again: the line counter runs one ahead.
        {"newline right after a tag name is counted twice", "<a\n/>", nullptr, 3},
    };
    for (const clean_walk_row &row : rows)
        expect_clean_walk(row);
}

TEST(Decoding, NewlinePushedBackIsCountedAgain) {
    decoder d("<\nx");
    EXPECT_EQ(d.get(), '<');
    EXPECT_EQ(d.get(), '\n');
    EXPECT_EQ(d.line(), 2);
    d.getter().unget('\n');
    EXPECT_EQ(d.line(), 2);
    EXPECT_EQ(d.get(), '\n');
    EXPECT_EQ(d.line(), 3);
    EXPECT_EQ(d.get(), 'x');
    EXPECT_EQ(d.line(), 3);
}

TEST(Decoding, NewlinePushedBackRightAfterCarriageReturnIsDropped) {
    decoder d("<\rx");
    EXPECT_EQ(d.get(), '<');
    EXPECT_EQ(d.get(), '\n');
    EXPECT_EQ(d.line(), 2);
    d.getter().unget('\n');
    EXPECT_EQ(d.get(), 'x');
    EXPECT_EQ(d.line(), 2);
}

TEST(Decoding, PushedBackValuesComeBackLastInFirstOut) {
    decoder d("<ab");
    EXPECT_EQ(d.get(), '<');
    EXPECT_EQ(d.get(), 'a');
    EXPECT_EQ(d.get(), 'b');
    d.getter().unget('b');
    d.getter().unget('a');
    EXPECT_EQ(d.get(), 'a');
    EXPECT_EQ(d.get(), 'b');
    EXPECT_EQ(d.get(), -1);
    d.getter().unget(-1);
    EXPECT_EQ(d.get(), -1);
}

// ---------------------------------------------------------------------------
// Fatal errors and rewind
// ---------------------------------------------------------------------------

TEST(Decoding, AfterFatalErrorGetGivesEndEvenWithPushedBackValues) {
    decoder d("<abc");
    EXPECT_EQ(d.get(), '<');
    EXPECT_EQ(d.get(), 'a');
    d.getter().unget('a');
    d.getter().error(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "stop here");
    EXPECT_EQ(d.get(), -1);
    EXPECT_EQ(d.get(), -1);
}

TEST(Decoding, AfterFatalErrorUnreadBytesAreNotDelivered) {
    decoder d("<\xC3\xA9" "bc");
    EXPECT_EQ(d.get(), '<');
    EXPECT_EQ(d.get(), 0xC3); // the second byte of the character waits
    d.error().error(lmx::elmx_type_fatal, lmx::elmx_not_well_formed, nullptr, 1, "stop");
    EXPECT_EQ(d.get(), -1);
    EXPECT_EQ(d.get(), -1);
}

TEST(Decoding, NonFatalErrorLeavesTheStreamAlive) {
    decoder d("<ab");
    EXPECT_EQ(d.get(), '<');
    d.getter().error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "not fatal");
    d.getter().error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "not fatal either");
    EXPECT_EQ(d.get(), 'a');
    EXPECT_EQ(d.get(), 'b');
}

TEST(Decoding, RewindResetsModeLinePushBackAndPendingBytes) {
    decoder d(k_le_bom + utf16le(u"<a>\n\xE9</a>"));
    EXPECT_EQ(d.read_to_end(), "<a>\n\xC3\xA9</a>");
    EXPECT_EQ(d.line(), 2);
    EXPECT_EQ(d.mode(), lmx::mode_utf16_le);
    d.getter().unget('z');
    d.getter().rewind();
    EXPECT_EQ(d.mode(), lmx::mode_unresolved);
    EXPECT_EQ(d.line(), 1);
    EXPECT_EQ(d.read_to_end(), "<a>\n\xC3\xA9</a>");
    EXPECT_EQ(d.line(), 2);

    decoder pending("<\xC3\xA9");
    EXPECT_EQ(pending.get(), '<');
    EXPECT_EQ(pending.get(), 0xC3);
    pending.getter().rewind();
    EXPECT_EQ(pending.get(), '<');
}

TEST(Decoding, RewindForgetsThePreviousCarriageReturn) {
    decoder d("\n\r");
    EXPECT_EQ(d.get(), '\n');
    EXPECT_EQ(d.get(), '\n'); // the CR
    EXPECT_EQ(d.line(), 3);
    d.getter().rewind();
    EXPECT_EQ(d.get(), '\n'); // not taken for the LF of a CR LF pair
    EXPECT_EQ(d.line(), 2);
}

TEST(Decoding, RewindAfterFatalErrorStillGivesEnd) {
    decoder d("?bad");
    EXPECT_EQ(d.get(), -1);
    ASSERT_TRUE(d.error().is_fatal_errored());
    d.getter().rewind();
    EXPECT_EQ(d.get(), -1);
    EXPECT_EQ(d.error().get_last_error(), lmx::elmx_encoding_not_supported);
}

TEST(Decoding, SourceIdComesFromTheByteSource) {
    decoder d("<a/>");
    ASSERT_NE(d.getter().get_source_id(), nullptr);
    EXPECT_STREQ(d.getter().get_source_id(), "");

    temp_file file("<a/>");
    lmx::c_read_file source(file.path().c_str());
    recording_error error;
    lmx::c_get_as_utf8 getter(source, error);
    EXPECT_EQ(std::string(getter.get_source_id()), file.path());
    getter.get();
    getter.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "with the path");
    ASSERT_EQ(error.reports().size(), 1u);
    EXPECT_EQ(error.reports()[0].file, file.path());
    EXPECT_EQ(error.reports()[0].line, 1);
}

// ---------------------------------------------------------------------------
// UTF-8 helpers
// ---------------------------------------------------------------------------

struct encoding_row {
    std::uint32_t code_point;
    const char *utf8;
};

const encoding_row k_encodings[] = {
    {0x41, "A"},
    {0x7F, "\x7F"},
    {0x80, "\xC2\x80"},
    {0xE9, "\xC3\xA9"},
    {0x7FF, "\xDF\xBF"},
    {0x800, "\xE0\xA0\x80"},
    {0x20AC, "\xE2\x82\xAC"},
    {0xD7FF, "\xED\x9F\xBF"},
    {0xE000, "\xEE\x80\x80"},
    {0xFFFF, "\xEF\xBF\xBF"},
    {0x10000, "\xF0\x90\x80\x80"},
    {0x1F600, "\xF0\x9F\x98\x80"},
    {0x10FFFF, "\xF4\x8F\xBF\xBF"},
    {0x110000, "\xF4\x90\x80\x80"},
    {0x1FFFFF, "\xF7\xBF\xBF\xBF"},
};

TEST(Utf8, UnicodeCharToUtf8EncodesByRange) {
    for (const encoding_row &row : k_encodings) {
        SCOPED_TRACE(row.code_point);
        char buffer[8];
        std::memset(buffer, 'x', sizeof buffer);
        char *result = lmx::unicode_char_to_utf8(row.code_point, buffer);
        EXPECT_EQ(result, buffer);
        const std::size_t length = std::strlen(row.utf8);
        EXPECT_EQ(std::string(buffer, length), std::string(row.utf8));
        EXPECT_EQ(buffer[length], '\0');
    }
}

TEST(Utf8, UnicodeCharToUtf8OfZeroIsEmpty) {
    char buffer[8];
    std::memset(buffer, 'x', sizeof buffer);
    lmx::unicode_char_to_utf8(0, buffer);
    EXPECT_EQ(buffer[0], '\0');
}

TEST(Utf8, Utf8ToUnicodeCharDecodesOneToFourBytes) {
    for (const encoding_row &row : k_encodings) {
        SCOPED_TRACE(row.code_point);
        std::int32_t value = -7;
        EXPECT_TRUE(lmx::utf8_to_unicode_char(row.utf8, &value));
        EXPECT_EQ(value, static_cast<std::int32_t>(row.code_point));
    }
}

TEST(Utf8, Utf8ToUnicodeCharRejectsABadContinuationByte) {
    for (const char *sequence : {"\xC3\x41", "\xE2\x82\x41", "\xE2\x41\xAC", "\xF0\x9F\x98\x41", "\xF0\x41\x98\x80",
                                 "\xC3\xC3"}) {
        SCOPED_TRACE(sequence);
        std::int32_t value = 0;
        EXPECT_FALSE(lmx::utf8_to_unicode_char(sequence, &value));
    }
}

TEST(Utf8, Utf8ToUnicodeCharRejectsAnInvalidLeadWithMinusOne) {
    for (const char *sequence : {"\x80", "\xBF\x80", "\xF8\x88\x80\x80\x80", "\xFC\x84\x80\x80\x80\x80", "\xFE",
                                 "\xFF"}) {
        SCOPED_TRACE(sequence);
        std::int32_t value = 0;
        EXPECT_FALSE(lmx::utf8_to_unicode_char(sequence, &value));
        EXPECT_EQ(value, -1);
    }
}

TEST(Utf8, EncodeThenDecodeGivesTheCodePointBack) {
    std::vector<std::uint32_t> code_points;
    for (std::uint32_t c = 1; c < 0x1000; ++c)
        code_points.push_back(c);
    for (std::uint32_t c = 0x1000; c <= 0x10FFFF; c += 0x3F1)
        code_points.push_back(c);
    for (std::uint32_t c : code_points) {
        if (c >= 0xD800 && c <= 0xDFFF)
            continue;
        char buffer[8];
        lmx::unicode_char_to_utf8(c, buffer);
        std::int32_t value = -7;
        ASSERT_TRUE(lmx::utf8_to_unicode_char(buffer, &value)) << c;
        ASSERT_EQ(value, static_cast<std::int32_t>(c));
        ASSERT_TRUE(lmx::is_valid_utf8_char_sequence(buffer)) << c;
    }
}

struct validity_row {
    const char *sequence;
    bool valid;
};

TEST(Utf8, IsValidUtf8CharSequenceChecksLeadAndSecondByte) {
    const validity_row rows[] = {
        {"A", true},
        {"\x7F", true},
        {"\x80\x80", false},
        {"\xBF\x80", false},
        {"\xC0\x80", false},
        {"\xC1\xBF", false},
        {"\xC2\x80", true},
        {"\xDF\xBF", true},
        {"\xE0\x9F\x80", false},
        {"\xE0\xA0\x80", true},
        {"\xE0\xBF\xBF", true},
        {"\xE0\xC0\x80", false},
        {"\xE1\x80\x80", true},
        {"\xEC\xBF\xBF", true},
        {"\xED\x80\x80", true},
        {"\xED\x9F\xBF", true},
        {"\xED\xA0\x80", false},
        {"\xED\xBF\xBF", false},
        {"\xEE\x80\x80", true},
        {"\xEF\xBF\xBF", true},
        {"\xF0\x8F\xBF\xBF", false},
        {"\xF0\x90\x80\x80", true},
        {"\xF0\xBF\xBF\xBF", true},
        {"\xF1\x80\x80\x80", true},
        {"\xF3\xBF\xBF\xBF", true},
        {"\xF4\x80\x80\x80", true},
        {"\xF4\x8F\xBF\xBF", true},
        {"\xF4\x90\x80\x80", false},
        {"\xF5\x80\x80\x80", false},
        {"\xF8\x88\x80\x80\x80", false},
        {"\xFC\x84\x80\x80\x80\x80", false},
        {"\xFE", false},
        {"\xFF", false},
        // Third and fourth bytes are not examined.
        {"\xE2\x82\x41", true},
        {"\xF0\x9F\x41\x41", true},
    };
    for (const validity_row &row : rows) {
        SCOPED_TRACE(testing::PrintToString(std::string(row.sequence)));
        EXPECT_EQ(lmx::is_valid_utf8_char_sequence(row.sequence), row.valid);
    }
}

// ---------------------------------------------------------------------------
// Invalid UTF-8 in the stream
// ---------------------------------------------------------------------------

struct invalid_row {
    const char *name;
    std::string sequence;
    bool consumed_whole; // the bytes after the sequence are read next
};

TEST(Decoding, InvalidUtf8SequencesReadAsEndWithoutError) {
    const invalid_row rows[] = {
        {"stray continuation byte", "\x80", true},
        {"stray last continuation byte", "\xBF", true},
        {"overlong C0", "\xC0\x80", true},
        {"overlong C1", "\xC1\xBF", true},
        {"overlong three byte form", "\xE0\x80\x80", true},
        {"overlong four byte form", "\xF0\x80\x80\x80", true},
        {"above the last code point", "\xF4\x90\x80\x80", true},
        {"lead F5", "\xF5\x80\x80\x80", true},
        {"five byte form", "\xF8\x88\x80\x80\x80", true},
        {"six byte form", "\xFC\x84\x80\x80\x80\x80", true},
        {"high surrogate in three byte form", "\xED\xA0\x80", true},
        {"low surrogate in three byte form", "\xED\xBF\xBF", true},
        {"lead byte followed by ASCII", "\xC3\x41", false},
        {"lead byte FF", "\xFF", false},
    };
    for (const invalid_row &row : rows) {
        SCOPED_TRACE(row.name);
        decoder d("<" + row.sequence + "z");
        EXPECT_EQ(d.get(), '<');
        EXPECT_EQ(d.get(), -1);
        if (row.consumed_whole) {
            EXPECT_EQ(d.get(), 'z');
        }
        EXPECT_TRUE(d.error().reports().empty()) << d.error().describe();
        EXPECT_FALSE(d.error().is_fatal_errored());
        EXPECT_EQ(d.error().get_last_error(), lmx::elmx_ok);
    }
}

TEST(Decoding, InputEndingInsideASequenceEndsWithoutError) {
    for (const std::string &input : {std::string("<a\xC3"), std::string("<a\xE2\x82"), std::string("<a\xF0\x9F\x98"),
                                     std::string("<a\xF8\x88\x80")}) {
        SCOPED_TRACE(testing::PrintToString(input));
        decoder d(input);
        EXPECT_EQ(d.get(), '<');
        EXPECT_EQ(d.get(), 'a');
        EXPECT_EQ(d.get(), -1);
        EXPECT_EQ(d.get(), -1);
        EXPECT_TRUE(d.error().reports().empty()) << d.error().describe();
    }
}

TEST(Decoding, NulByteReadsAsEndWithoutError) {
    decoder d(std::string("<a\0b", 4));
    EXPECT_EQ(d.get(), '<');
    EXPECT_EQ(d.get(), 'a');
    EXPECT_EQ(d.get(), -1);
    EXPECT_TRUE(d.error().reports().empty()) << d.error().describe();
}

TEST(Decoding, ValidMultiByteCharactersComeThroughUnchanged) {
    const std::string input = "<\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80\xEF\xBF\xBD\xF4\x8F\xBF\xBF";
    expect_decoded(input, input, std::nullopt, k_no_report);
}

// ---------------------------------------------------------------------------
// Robustness of the reader against malformed input
// ---------------------------------------------------------------------------

// Every proper prefix of these documents cuts the root element.
void expect_every_truncation_fails(const std::string &ar_document) {
    traced_walk whole = walk_traced(ar_document);
    ASSERT_EQ(whole.error(), lmx::elmx_ok) << whole.result.message;
    for (std::size_t length = 0; length < ar_document.size(); ++length) {
        const std::string prefix = ar_document.substr(0, length);
        traced_walk walk = walk_traced(prefix);
        EXPECT_NE(walk.error(), lmx::elmx_ok) << "prefix of " << length << " bytes: " << walk.trace();
    }
}

TEST(DecodingRobustness, EveryTruncationOfAUtf8DocumentFails) {
    expect_every_truncation_fails("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                  "<!DOCTYPE r [<!ENTITY e \"v\">]>\n"
                                  "<r a=\"1\" b='2'><!--c--><x>t&amp;&e;&#65;</x><![CDATA[z]]><y/><?pi d?>"
                                  "<w>caf\xC3\xA9 \xE2\x82\xAC \xF0\x9F\x98\x80</w></r>");
}

TEST(DecodingRobustness, EveryTruncationOfAUtf16DocumentFails) {
    const std::u16string text =
        u"<?xml version=\"1.0\" encoding=\"UTF-16\"?><r a=\"\x00E9\"><x>t\xD83D\xDE00</x></r>";
    expect_every_truncation_fails(k_le_bom + utf16le(text));
    expect_every_truncation_fails(utf16be(text));
}

TEST(DecodingRobustness, EveryTruncationOfALatin1DocumentFails) {
    expect_every_truncation_fails("<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><r a=\"\xE9\">\xE9\x85</r>");
}

// The walk of the document ends with a_code, which the reader's error record
// holds too.
void expect_walk_ends_with(const std::string &ar_document, lmx::elmx_error a_code) {
    document_walk w(ar_document);
    expect_walk(w.walk, a_code);
    EXPECT_EQ(w.reader.get_debug_error().error, a_code);
}

struct cut_row {
    std::string document;
    lmx::elmx_error code;
};

TEST(DecodingRobustness, TruncationEndsWithTheErrorOfTheConstructCut) {
    const std::string decl = "<?xml version=\"1.0\"?>";
    const cut_row rows[] = {
        {"", lmx::elmx_unexpected_end_of_message},
        {"<?xml vers", lmx::elmx_bad_xml_decl},
        {"<?xml version=\"1.0\"", lmx::elmx_xml_badly_formed}, // the scan fails without a cause
        {decl + "<r", lmx::elmx_not_well_formed},
        {decl + "<r a", lmx::elmx_unexpected_end_of_message},
        {decl + "<r a=", lmx::elmx_not_well_formed},
        {decl + "<r a=\"1", lmx::elmx_not_well_formed},
        {decl + "<r a=\"1\"", lmx::elmx_xml_badly_formed}, // the scan fails without a cause
        {decl + "<r a=\"1\">", lmx::elmx_unexpected_end_of_message},
        {decl + "<r a=\"1\"><x>t", lmx::elmx_unexpected_end_of_message},
        {decl + "<r a=\"1\"><x>t<", lmx::elmx_not_well_formed},
        {decl + "<r a=\"1\"><x>t</x></", lmx::elmx_xml_badly_formed}, // the scan fails without a cause
        {decl + "<r a=\"1\"><x>t</x></r", lmx::elmx_not_well_formed},
        {"\xEF\xBB", lmx::elmx_encoding_not_supported},
        {"\xFF\xFE<", lmx::elmx_encoding_not_supported},
    };
    for (const cut_row &row : rows) {
        SCOPED_TRACE(testing::PrintToString(row.document));
        expect_walk_ends_with(row.document, row.code);
    }
}

struct malformed_row {
    const char *name;
    std::string document;
    lmx::elmx_error code;
};

TEST(DecodingRobustness, MalformedBytesEndWithAnErrorCode) {
    const malformed_row rows[] = {
        {"invalid UTF-8 in text", "<a>x\x80y</a>", lmx::elmx_unexpected_end_of_message},
        {"invalid UTF-8 in an attribute value", "<a b=\"x\x80y\"/>", lmx::elmx_not_well_formed},
        {"invalid UTF-8 in a tag name", "<a\x80/>", lmx::elmx_not_well_formed},
        {"overlong form in text", "<a>\xC0\xAF</a>", lmx::elmx_unexpected_end_of_message},
        {"five byte form in text", "<a>\xF8\x88\x80\x80\x80</a>", lmx::elmx_unexpected_end_of_message},
        {"surrogate in three byte form in text", "<a>\xED\xA0\x80</a>", lmx::elmx_unexpected_end_of_message},
        {"lead byte followed by ASCII in text", "<a>\xC3(</a>", lmx::elmx_unexpected_end_of_message},
        {"input ending inside a character", "<a>x\xE2\x82", lmx::elmx_unexpected_end_of_message},
        {"NUL in text", std::string("<a>x\0y</a>", 10), lmx::elmx_unexpected_end_of_message},
        {"NUL in an attribute value", std::string("<a b=\"x\0y\"/>", 12), lmx::elmx_not_well_formed},
        {"NUL in a tag name", std::string("<a\0/>", 5), lmx::elmx_not_well_formed},
        {"UTF-16 high surrogate without low surrogate", k_le_bom + utf16le(u"<a>x\xD83D" u"A</a>"),
         lmx::elmx_encoding_not_supported},
        {"UTF-16 high surrogate at the end", k_le_bom + utf16le(u"<a>x\xD83D"),
         lmx::elmx_unexpected_end_of_message},
        {"UTF-16 input ending inside a unit", k_le_bom + utf16le(u"<a>x") + "<",
         lmx::elmx_unexpected_end_of_message},
        {"UTF-16 NUL unit in text", k_le_bom + utf16le(std::u16string(u"<a>x\0y</a>", 10)),
         lmx::elmx_unexpected_end_of_message},
        {"UTF-16 big endian high surrogate without low surrogate", utf16be(u"<a>\xDBFF\xDBFF</a>"),
         lmx::elmx_encoding_not_supported},
    };
    for (const malformed_row &row : rows) {
        SCOPED_TRACE(row.name);
        expect_walk_ends_with(row.document, row.code);
    }
}

TEST(DecodingRobustness, RandomBytesNeverCrashOrHang) {
    const char *const tokens[] = {"<",     ">",   "/",    "a",  "b:c", "=",  "\"", "'",    "&",        ";",
                                  "amp",   "#",   "x41",  "!",  "--",  "[",  "]",  "CDATA", "?",       "xml",
                                  " ",     "\n",  "\r",   "\xC3", "\xA9", "\xFF", "\xFE", "%",      "DOCTYPE",
                                  "ENTITY", "e",  "&e;",  "xmlns", "\xED\xA0\x80", "\xEF\xBB\xBF", "version"};
    std::mt19937 random(20240611u);
    std::uniform_int_distribution<std::size_t> pick(0, sizeof tokens / sizeof tokens[0] - 1);
    std::uniform_int_distribution<int> length(0, 60);
    std::size_t ended = 0;
    for (int round = 0; round < 3000; ++round) {
        std::string document;
        for (int n = length(random); n > 0; --n)
            document += tokens[pick(random)];
        if (round % 7 == 0)
            document.push_back('\0');
        walk_traced(document);
        ++ended;
    }
    EXPECT_EQ(ended, 3000u);
}

TEST(DecodingRobustness, MutatedDocumentsNeverCrashOrHang) {
    const std::string original = "<?xml version=\"1.0\"?><!DOCTYPE r [<!ENTITY e \"<b a='1'>&#65;</b>\">]>"
                                 "<r xmlns=\"u\" p:a=\"&e;\"><x>t&amp;&e;</x><![CDATA[z]]><!--c--><y/></r>";
    std::mt19937 random(77u);
    std::uniform_int_distribution<int> byte(0, 255);
    for (int round = 0; round < 3000; ++round) {
        std::string document = original;
        std::uniform_int_distribution<std::size_t> where(0, document.size() - 1);
        const std::size_t at = where(random);
        switch (round % 3) {
        case 0:
            document[at] = static_cast<char>(byte(random));
            break;
        case 1:
            document.erase(at, 1 + round % 5);
            break;
        default:
            document.insert(at, 1, static_cast<char>(byte(random)));
            break;
        }
        walk_traced(document);
    }
    SUCCEED();
}

// Keeps only the sizes of what the walk meets.
class size_visitor : public tessarine_tools::xml_walk_visitor {
public:
    void on_attribute(lmx::c_xml_reader &, const std::string &ar_name, const std::string &ar_value) override {
        name = ar_name;
        value_size = ar_value.size();
        value_all_x = ar_value.find_first_not_of('x') == std::string::npos;
    }
    std::string name;
    std::size_t value_size = 0;
    bool value_all_x = false;
};

const std::size_t k_fifty_megabytes = 50u * 1024u * 1024u;

// An element whose attribute value runs on for fifty megabytes, not yet closed.
std::string fifty_megabyte_value() { return "<a v=\"" + std::string(k_fifty_megabytes, 'x'); }

TEST(DecodingRobustness, FiftyMegabyteAttributeValueIsReadInFull) {
    const std::string document = fifty_megabyte_value() + "\"/>";
    lmx::c_xml_reader_memory reader(document);
    size_visitor seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml(reader, &seen);
    EXPECT_EQ(result.error, lmx::elmx_ok) << result.message;
    EXPECT_EQ(seen.name, "v");
    EXPECT_EQ(seen.value_size, k_fifty_megabytes);
    EXPECT_TRUE(seen.value_all_x);
}

TEST(DecodingRobustness, UnterminatedFiftyMegabyteAttributeValueIsNotWellFormed) {
    document_walk w(fifty_megabyte_value());
    expect_walk(w.walk, lmx::elmx_not_well_formed);
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_not_well_formed);
}

} // namespace
