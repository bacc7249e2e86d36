// CxF3 files written by other projects (the shared corpus, ../shared/corpus)
// read into cc::CxF, written, and read and written again. Each file is a test
// of its own. The corpus is read where it lies; without it the tests skip.
#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <cstddef>
#include <filesystem>
#include <string>
#include <vector>

#include <cxf/v3/cxf3.h>

#ifndef TESSARINE_CORPUS_DIR
#define TESSARINE_CORPUS_DIR "../shared/corpus"
#endif

namespace {

namespace fs = std::filesystem;

fs::path corpus_cxf3() { return fs::path(TESSARINE_CORPUS_DIR) / "cxf3"; }

// Every *.cxf one folder below cxf3/, in name order. Kept as text: a test
// parameter is printed in failure reports.
std::vector<std::string> corpus_files() {
    std::vector<std::string> files;
    std::error_code error;
    if (!fs::is_directory(corpus_cxf3(), error))
        return files;
    for (const fs::directory_entry &folder : fs::directory_iterator(corpus_cxf3(), error)) {
        if (!folder.is_directory())
            continue;
        for (const fs::directory_entry &file : fs::directory_iterator(folder.path(), error))
            if (file.is_regular_file() && file.path().extension() == ".cxf")
                files.push_back(file.path().string());
    }
    std::sort(files.begin(), files.end());
    return files;
}

std::string narrow(const std::wstring &ar_text) {
    std::string out;
    lmx::convert(out, ar_text);
    return out;
}

// The counts compared between a document and its copy read back; none of
// them makes a missing part.
std::size_t objects_of(const cc::CxF &ar_document) {
    const cc::Resources *p_resources = ar_document.get_Resources();
    if (!p_resources || !p_resources->get_ObjectCollection())
        return 0;
    return p_resources->get_ObjectCollection()->size_Object();
}

std::size_t color_specifications_of(const cc::CxF &ar_document) {
    const cc::Resources *p_resources = ar_document.get_Resources();
    if (!p_resources || !p_resources->get_ColorSpecificationCollection())
        return 0;
    return p_resources->get_ColorSpecificationCollection()->size_ColorSpecification();
}

std::size_t custom_resources_of(const cc::CxF &ar_document) {
    const cc::CustomResources *p_custom = ar_document.get_CustomResources();
    return p_custom ? p_custom->size_inner_CustomResources() : 0;
}

// Where two texts first differ; their common length if one is the start of
// the other.
std::size_t first_difference(const std::wstring &ar_a, const std::wstring &ar_b) {
    const auto mismatch = std::mismatch(ar_a.begin(), ar_a.end(), ar_b.begin(), ar_b.end());
    return static_cast<std::size_t>(mismatch.first - ar_a.begin());
}

// Text around a position, for failure messages.
std::string around(const std::wstring &ar_text, std::size_t a_position) {
    const std::size_t start = a_position > 60 ? a_position - 60 : 0;
    return narrow(ar_text.substr(start, 120));
}

// Three generations of one file: read from the file, then each written and
// read back.
struct s_generations {
    cc::CxF original;
    cc::CxF second;
    cc::CxF third;
    std::wstring first_write;
    std::wstring second_write;
    std::wstring third_write;
};

void read_generations(const fs::path &ar_file, s_generations &ar_out) {
    ASSERT_EQ(ar_out.original.loadFile(ar_file.string().c_str()), lmx::elmx_ok);
    ar_out.first_write = ar_out.original.writeString();
    ASSERT_FALSE(ar_out.first_write.empty()) << "the file read, but could not be written";
    ASSERT_EQ(ar_out.second.loadString(ar_out.first_write), lmx::elmx_ok) << narrow(ar_out.first_write);
    ar_out.second_write = ar_out.second.writeString();
    ASSERT_FALSE(ar_out.second_write.empty());
    ASSERT_EQ(ar_out.third.loadString(ar_out.second_write), lmx::elmx_ok);
    ar_out.third_write = ar_out.third.writeString();
}

TEST(CorpusBinding, CorpusHasFiles) {
    if (!fs::is_directory(corpus_cxf3()))
        GTEST_SKIP() << "no corpus at " << corpus_cxf3();
    EXPECT_FALSE(corpus_files().empty()) << "no .cxf file under " << corpus_cxf3();
}

class CorpusFile : public ::testing::TestWithParam<std::string> {};

TEST_P(CorpusFile, LoadsWritesAndReadsBackTheSameTree) {
    const fs::path file = GetParam();
    SCOPED_TRACE(GetParam());
    s_generations generations;
    ASSERT_NO_FATAL_FAILURE(read_generations(file, generations));

    // The first write may differ from the second (see the test of the
    // control characters below); from then on the text is stable.
    const std::size_t difference = first_difference(generations.second_write, generations.third_write);
    EXPECT_TRUE(generations.second_write == generations.third_write)
        << "second and third writes differ at " << difference << ":\n"
        << around(generations.second_write, difference) << "\n---\n"
        << around(generations.third_write, difference);

    for (const cc::CxF *p_copy : {&generations.second, &generations.third}) {
        EXPECT_EQ(objects_of(*p_copy), objects_of(generations.original));
        EXPECT_EQ(color_specifications_of(*p_copy), color_specifications_of(generations.original));
        EXPECT_EQ(custom_resources_of(*p_copy), custom_resources_of(generations.original));
    }
}

// A test name from a file name: letters and digits only.
std::string test_name(const ::testing::TestParamInfo<std::string> &ar_info) {
    std::string name;
    for (char c : fs::path(ar_info.param).stem().string())
        name += std::isalnum(static_cast<unsigned char>(c)) ? c : '_';
    return name;
}

INSTANTIATE_TEST_SUITE_P(Cxf3, CorpusFile, ::testing::ValuesIn(corpus_files()), test_name);
// Without the corpus there is nothing to instantiate.
GTEST_ALLOW_UNINSTANTIATED_PARAMETERIZED_TEST(CorpusFile);

// A carriage return in an attribute value (here given as the character
// reference &#xD;) is written as the character itself; reading folds it into
// a line feed like any other line end. So the first write of such a file
// differs from the second by exactly that character, and from then on the
// text is stable.
TEST(CorpusBinding, CarriageReturnInAnAttributeBecomesALineFeedAfterOneRoundTrip) {
    const fs::path file =
        corpus_cxf3() / "colour-science__colour-cxf" / "colour_cxf__tests__resources__unicode_special_characters.cxf";
    if (!fs::exists(file))
        GTEST_SKIP() << "no " << file;
    s_generations generations;
    ASSERT_NO_FATAL_FAILURE(read_generations(file, generations));

    const std::wstring control_name = L"Control: Tab\tNewLine\nCarriageReturn";
    EXPECT_EQ(generations.original.get_ObjectByID(L"control1").get_Name(), control_name + L"\r");
    EXPECT_EQ(generations.second.get_ObjectByID(L"control1").get_Name(), control_name + L"\n");
    EXPECT_EQ(generations.third.get_ObjectByID(L"control1").get_Name(), control_name + L"\n");

    const std::wstring &first = generations.first_write;
    const std::wstring &second = generations.second_write;
    ASSERT_EQ(first.size(), second.size());
    const std::size_t difference = first_difference(first, second);
    ASSERT_LT(difference, first.size()) << "the first two writes are the same";
    EXPECT_EQ(first[difference], L'\r');
    EXPECT_EQ(second[difference], L'\n');
    // The character closes the Name attribute of object control1 ...
    const std::wstring before = L"Name=\"" + control_name;
    ASSERT_GE(difference, before.size());
    EXPECT_EQ(first.compare(difference - before.size(), before.size(), before), 0) << around(first, difference);
    EXPECT_EQ(first.compare(difference + 1, 1, L"\""), 0) << around(first, difference);
    EXPECT_NE(first.find(L"Id=\"control1\"", difference), std::wstring::npos);
    // ... and is the only difference.
    EXPECT_EQ(first.compare(difference + 1, std::wstring::npos, second, difference + 1, std::wstring::npos), 0);
    EXPECT_TRUE(second == generations.third_write);
}

} // namespace
