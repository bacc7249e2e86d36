// cxftool: command lines, help, errors, and what info, validate and dump
// print for the example it writes, for the bundled example, for documents
// with palettes, jobs and a branded library, and for every file of the
// shared corpus.
#include "tools/cxftool/cxftool.h"
#include "tools/cxftool/output.h"

#include <tessarine/CxF3.h>

#include <gtest/gtest.h>

#include <boost/property_tree/json_parser.hpp>
#include <boost/property_tree/ptree.hpp>

#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <limits>
#include <regex>
#include <sstream>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;

struct Result {
    int code;
    std::string out;
    std::string err;
};

Result Cxftool(const std::vector<std::string> &ar_args) {
    std::ostringstream out;
    std::ostringstream err;
    const int code = cxftool::RunCxftool(ar_args, out, err);
    return {code, out.str(), err.str()};
}

std::vector<std::string> Lines(const std::string &ar_text) {
    std::vector<std::string> lines;
    std::istringstream stream(ar_text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

// The line with runs of spaces made one and the edges trimmed, so that the
// tests do not depend on column widths.
std::string Squeezed(const std::string &ar_line) {
    std::string squeezed;
    for (char character : ar_line)
        if (character != ' ' || (!squeezed.empty() && squeezed.back() != ' '))
            squeezed += character;
    if (!squeezed.empty() && squeezed.back() == ' ')
        squeezed.pop_back();
    return squeezed;
}

bool HasLine(const std::string &ar_text, const std::string &ar_squeezed_line) {
    const std::vector<std::string> lines = Lines(ar_text);
    return std::any_of(lines.begin(), lines.end(),
                       [&](const std::string &ar_line) { return Squeezed(ar_line) == ar_squeezed_line; });
}

// The squeezed lines of info's section that starts with the line
// ar_heading: that line and the indented lines after it; empty when there is
// no such line.
std::vector<std::string> Section(const std::string &ar_text, const std::string &ar_heading) {
    const std::vector<std::string> lines = Lines(ar_text);
    auto line = std::find_if(lines.begin(), lines.end(),
                             [&](const std::string &ar_line) { return Squeezed(ar_line) == ar_heading; });
    std::vector<std::string> section;
    if (line == lines.end())
        return section;
    section.push_back(Squeezed(*line));
    for (++line; line != lines.end() && line->rfind(' ', 0) == 0; ++line)
        section.push_back(Squeezed(*line));
    return section;
}

// The records of CSV text, each a list of fields with the quotes undone. A
// line break inside quotes belongs to the field.
std::vector<std::vector<std::string>> CsvRecords(const std::string &ar_text) {
    std::vector<std::vector<std::string>> records;
    std::vector<std::string> fields(1);
    bool quoted = false;
    for (std::size_t index = 0; index < ar_text.size(); ++index) {
        const char character = ar_text[index];
        if (quoted && character == '"' && index + 1 < ar_text.size() && ar_text[index + 1] == '"') {
            fields.back() += ar_text[++index];
        } else if (character == '"') {
            quoted = !quoted;
        } else if (character == ',' && !quoted) {
            fields.emplace_back();
        } else if (character == '\n' && !quoted) {
            records.push_back(fields);
            fields.assign(1, std::string());
        } else {
            fields.back() += character;
        }
    }
    return records;
}

// Parses JSON text; throws on text that is not well-formed.
boost::property_tree::ptree ParseJson(const std::string &ar_text) {
    std::istringstream stream(ar_text);
    boost::property_tree::ptree tree;
    boost::property_tree::read_json(stream, tree);
    return tree;
}

std::string WriteTextFile(const fs::path &ar_path, const std::string &ar_text) {
    std::ofstream(ar_path, std::ios::binary) << ar_text;
    return ar_path.string();
}

boost::shared_ptr<CxF3Job> NewJob(const std::string &ar_name) {
    const boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->SetName(ar_name);
    return job;
}

CXFTolerance NewTolerance(CXFToleranceModusType a_mode, float a_limit) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(a_mode);
    tolerance.SetV0(a_limit);
    return tolerance;
}

// Five objects, four palettes that the file keeps and one that it loses,
// and two jobs, written through the document classes:
//   O1 Sky (target), O2 Sky trial, O3 Moss (target), O4 Moss trial,
//   O5 Moss trial 2.
std::string WritePalettesAndJobs(const fs::path &ar_path) {
    const boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->SetFileInformationDescription("Sky and moss");
    CxF3::ObjectList objects;
    for (const auto &[name, type] : std::vector<std::pair<std::string, CxF3ObjectType>>{
             {"Sky", CxF3ObjectTarget},
             {"Sky trial", CxF3ObjectTrial},
             {"Moss", CxF3ObjectTarget},
             {"Moss trial", CxF3ObjectTrial},
             {"Moss trial 2", CxF3ObjectTrial}}) {
        objects.push_back(CxF3Object::CreateCxFObject());
        objects.back()->SetName(name);
        objects.back()->SetObjectType(type);
        EXPECT_TRUE(document->AddObject(objects.back())) << name;
    }
    const boost::shared_ptr<CxF3Object> unknown = CxF3Object::CreateCxFObject();
    unknown->SetId("X9");
    document->AddPalette("Greens and blues", {objects[2], objects[0]});
    document->AddPalette("Sky", {objects[0], objects[1]});
    document->AddPalette("Lost", {unknown});
    document->AddPalette("Sky", {objects[1]});
    document->AddPalette("Repeats", {objects[3], objects[3]});

    // The jobs are added out of the order of their names.
    const CXFTolerance de = NewTolerance(T_DE, 1.5f);
    const CXFTolerance fmc = NewTolerance(T_FMC, 2.0f);
    const boost::shared_ptr<CxF3Job> sky = NewJob("Sky approval");
    sky->AddSerie("O1", "Sky approval", &de, "M1", {"O2"});
    sky->AddSerie("O1", "Sky approval", nullptr, "", {});
    document->AddOstraJob(sky);
    const boost::shared_ptr<CxF3Job> moss = NewJob("Moss approval");
    moss->AddSerie("O3", "Moss approval", &fmc, "M1", {"O4", "O5"});
    document->AddOstraJob(moss);

    EXPECT_TRUE(document->SaveCxF(ar_path.string()));
    return ar_path.string();
}

const std::string k_branded_library = TESSARINE_SOURCE_DIR "/tests/data/lumivera_library.cxf";

// The ids of the objects dump writes, from its CSV or its JSON.
std::vector<std::string> CsvIds(const std::string &ar_csv) {
    const std::vector<std::vector<std::string>> records = CsvRecords(ar_csv);
    std::vector<std::string> ids;
    for (std::size_t index = 1; index < records.size(); ++index)
        ids.push_back(records[index].at(0));
    return ids;
}

std::vector<std::string> JsonIds(const std::string &ar_json) {
    std::vector<std::string> ids;
    for (const auto &row : ParseJson(ar_json))
        ids.push_back(row.second.get<std::string>("id"));
    return ids;
}

// ---------------------------------------------------------------- command line

TEST(Cxftool, HelpListsEveryCommand) {
    for (const char *p_flag : {"--help", "-h"}) {
        const Result result = Cxftool({p_flag});
        EXPECT_EQ(result.code, 0);
        EXPECT_EQ(result.err, "");
        for (const char *p_command : {"info", "validate", "dump", "example"})
            EXPECT_NE(result.out.find("\n  " + std::string(p_command) + " "), std::string::npos) << p_command;
    }
}

TEST(Cxftool, EachCommandHasItsOwnHelp) {
    for (const std::string command : {"info", "validate", "dump", "example"}) {
        const Result result = Cxftool({command, "--help"});
        EXPECT_EQ(result.code, 0) << command;
        EXPECT_EQ(result.err, "") << command;
        EXPECT_EQ(result.out.rfind("usage: cxftool " + command + " FILE", 0), 0u) << result.out;
    }
}

TEST(Cxftool, HelpOfACommandWinsOverAMissingFile) {
    EXPECT_EQ(Cxftool({"dump", "--format", "json", "-h"}).code, 0);
}

TEST(Cxftool, DumpHelpNamesTheFormatsAndTheNumberForm) {
    const std::string help = Cxftool({"dump", "--help"}).out;
    EXPECT_NE(help.find("--format csv"), std::string::npos);
    EXPECT_NE(help.find("--format json"), std::string::npos);
    EXPECT_NE(help.find("shortest form"), std::string::npos);
}

TEST(Cxftool, DumpHelpNamesThePaletteOptionAndWhichOfNamesakesItTakes) {
    const std::string help = Cxftool({"dump", "--help"}).out;
    EXPECT_EQ(help.rfind("usage: cxftool dump FILE [--format csv|json] [--palette NAME]\n", 0), 0u) << help;
    EXPECT_NE(help.find("\n  --palette NAME "), std::string::npos) << help;
    EXPECT_NE(help.find("the first of them is taken"), std::string::npos) << help;
}

TEST(Cxftool, InfoHelpNamesPalettesJobsAndTheColourLibrary) {
    const std::string help = Cxftool({"info", "--help"}).out;
    for (const char *p_words : {"its palettes", "its jobs", "branded colour library", "--palette NAME"})
        EXPECT_NE(help.find(p_words), std::string::npos) << p_words;
}

TEST(Cxftool, NoArgumentsPrintsTheUsageToStandardError) {
    const Result result = Cxftool({});
    EXPECT_EQ(result.code, 2);
    EXPECT_EQ(result.out, "");
    EXPECT_EQ(result.err.rfind("usage: cxftool", 0), 0u);
}

TEST(Cxftool, UnknownCommandIsRefused) {
    const Result result = Cxftool({"convert", "a.cxf"});
    EXPECT_EQ(result.code, 2);
    EXPECT_EQ(result.out, "");
    EXPECT_NE(result.err.find("unknown command 'convert'"), std::string::npos);
}

TEST(Cxftool, MissingFileIsRefused) {
    for (const std::string command : {"info", "validate", "dump", "example"}) {
        const Result result = Cxftool({command});
        EXPECT_EQ(result.code, 2) << command;
        EXPECT_EQ(result.out, "") << command;
        EXPECT_NE(result.err.find("missing FILE"), std::string::npos) << command;
    }
}

TEST(Cxftool, SecondFileIsRefused) {
    const Result result = Cxftool({"info", "a.cxf", "b.cxf"});
    EXPECT_EQ(result.code, 2);
    EXPECT_NE(result.err.find("unexpected argument 'b.cxf'"), std::string::npos);
}

TEST(Cxftool, OptionOfAnotherCommandIsRefused) {
    const Result result = Cxftool({"info", "a.cxf", "--format", "csv"});
    EXPECT_EQ(result.code, 2);
    EXPECT_NE(result.err.find("unknown option '--format'"), std::string::npos);
}

TEST(Cxftool, OptionWithoutValueIsRefused) {
    const Result result = Cxftool({"dump", "a.cxf", "--format"});
    EXPECT_EQ(result.code, 2);
    EXPECT_NE(result.err.find("option '--format' needs a value"), std::string::npos);
}

TEST(Cxftool, UnknownDumpFormatIsRefused) {
    for (const std::vector<std::string> &args :
         {std::vector<std::string>{"dump", "a.cxf", "--format", "xml"}, {"dump", "--format=xml", "a.cxf"}}) {
        const Result result = Cxftool(args);
        EXPECT_EQ(result.code, 2);
        EXPECT_EQ(result.out, "");
        EXPECT_NE(result.err.find("unknown format 'xml'"), std::string::npos);
    }
}

TEST(Cxftool, FileThatDoesNotExistFailsWithTheReason) {
    const std::string path = (fs::temp_directory_path() / "cxftool-test-no-such-file.cxf").string();
    for (const std::string command : {"info", "validate", "dump"}) {
        const Result result = Cxftool({command, path});
        EXPECT_EQ(result.code, 1) << command;
        EXPECT_EQ(result.out, "") << command;
        EXPECT_NE(result.err.find("Error code: 1\nError: Unable to open file"), std::string::npos) << result.err;
    }
}

// ---------------------------------------------------------------- output forms

TEST(CxftoolOutput, NumbersAreTheShortestThatReadBack) {
    EXPECT_EQ(cxftool::FormatNumber(0.1), "0.1");
    EXPECT_EQ(cxftool::FormatNumber(42.0), "42");
    EXPECT_EQ(cxftool::FormatNumber(-7.4), "-7.4");
    EXPECT_EQ(cxftool::FormatNumber(1e-7), "1e-07");
    EXPECT_EQ(cxftool::FormatNumber(0.1 + 0.2), "0.30000000000000004");
    EXPECT_EQ(cxftool::JsonNumber(1.5), "1.5");
    EXPECT_EQ(cxftool::JsonNumber(std::numeric_limits<double>::quiet_NaN()), "null");
    EXPECT_EQ(cxftool::JsonNumber(std::numeric_limits<double>::infinity()), "null");
}

TEST(CxftoolOutput, CsvFieldsAreQuotedOnlyWhenNeeded) {
    EXPECT_EQ(cxftool::CsvField("Brick Red"), "Brick Red");
    EXPECT_EQ(cxftool::CsvField(""), "");
    EXPECT_EQ(cxftool::CsvField("Red, batch 2"), "\"Red, batch 2\"");
    EXPECT_EQ(cxftool::CsvField("the \"red\""), "\"the \"\"red\"\"\"");
    EXPECT_EQ(cxftool::CsvField("two\nlines"), "\"two\nlines\"");
    EXPECT_EQ(cxftool::CsvField(" edge"), "\" edge\"");
    EXPECT_EQ(cxftool::CsvField("Ocre \xC3\xA9t\xC3\xA9"), "Ocre \xC3\xA9t\xC3\xA9");
}

TEST(CxftoolOutput, JsonStringsEscapeQuotesBackslashesAndControlCharacters) {
    EXPECT_EQ(cxftool::JsonString("plain"), "\"plain\"");
    EXPECT_EQ(cxftool::JsonString("a \"b\" \\ c"), "\"a \\\"b\\\" \\\\ c\"");
    EXPECT_EQ(cxftool::JsonString("tab\tnew\nret\r"), "\"tab\\tnew\\nret\\r\"");
    EXPECT_EQ(cxftool::JsonString(std::string("\x01\x1f\x7f", 3)), "\"\\u0001\\u001f\\u007f\"");
    // UTF-8 passes through: an accent, a CJK character, an emoji.
    const std::string utf8 = "\xC3\xA9 \xE8\x89\xB2 \xF0\x9F\x8E\xA8";
    EXPECT_EQ(cxftool::JsonString(utf8), "\"" + utf8 + "\"");
}

TEST(CxftoolOutput, TableTextIsQuotedWhenItsEdgesOrLineWouldBeLost) {
    EXPECT_EQ(cxftool::TableText("Autumn Range"), "Autumn Range");
    EXPECT_EQ(cxftool::TableText(""), "\"\"");
    EXPECT_EQ(cxftool::TableText(" padded"), "\" padded\"");
    EXPECT_EQ(cxftool::TableText("padded "), "\"padded \"");
    EXPECT_EQ(cxftool::TableText("two\nlines"), "\"two\\nlines\"");
    EXPECT_EQ(cxftool::TableText("say \"hi\""), "say \"hi\"");
}

TEST(CxftoolOutput, TableColumnsAlignOnCharactersNotBytes) {
    std::ostringstream out;
    cxftool::WriteTable(out, {{"Observer", "Id"}, {"2\xC2\xB0", "M1"}}, "  ");
    EXPECT_EQ(out.str(), "  Observer  Id\n  2\xC2\xB0        M1\n");
}

// ---------------------------------------------------------------- validate

class CxftoolFiles : public ::testing::Test {
protected:
    static void SetUpTestSuite() {
        s_folder = fs::temp_directory_path() / ("cxftool-test-" + std::to_string(::getpid()));
        fs::create_directories(s_folder);
        s_example = (s_folder / "swatches.cxf").string();
        const Result result = Cxftool({"example", s_example});
        ASSERT_EQ(result.code, 0) << result.err;
        ASSERT_EQ(result.out, "");
        s_palettes = WritePalettesAndJobs(s_folder / "palettes.cxf");
    }
    static void TearDownTestSuite() {
        std::error_code ignored;
        fs::remove_all(s_folder, ignored);
    }

    static fs::path s_folder;
    static std::string s_example;
    // See WritePalettesAndJobs.
    static std::string s_palettes;
};

fs::path CxftoolFiles::s_folder;
std::string CxftoolFiles::s_example;
std::string CxftoolFiles::s_palettes;

TEST_F(CxftoolFiles, ValidateAcceptsTheExample) {
    const Result result = Cxftool({"validate", s_example});
    EXPECT_EQ(result.code, 0);
    EXPECT_EQ(result.out, "valid\n");
    EXPECT_EQ(result.err, "");
}

TEST_F(CxftoolFiles, ValidateReportsCodeItemAndLineOfABrokenFile) {
    const std::string path = WriteTextFile(s_folder / "broken.cxf",
                                           "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                           "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\">\n"
                                           " <cc:Resources>\n"
                                           "  <cc:ObjectCollection>\n"
                                           "   <cc:Object ObjectType=\"Target\" Name=\"Broken\" Id=\"O1\">\n"
                                           "    <cc:CreationDate>2026-01-01T00:00:00Z</cc:CreationDate>\n"
                                           "    <cc:ColorValues>\n"
                                           "     <cc:ColorCIELab ColorSpecification=\"S\">\n"
                                           "      <cc:L>fifty</cc:L><cc:A>0</cc:A><cc:B>0</cc:B>\n"
                                           "     </cc:ColorCIELab>\n"
                                           "    </cc:ColorValues>\n"
                                           "   </cc:Object>\n"
                                           "  </cc:ObjectCollection>\n"
                                           " </cc:Resources>\n"
                                           "</cc:CxF>\n");
    const Result result = Cxftool({"validate", path});
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.out, "");
    EXPECT_EQ(result.err.rfind(path + ": invalid\n", 0), 0u) << result.err;
    EXPECT_NE(result.err.find("Error code: 35\nError: Invalid value format for this type\n"), std::string::npos)
        << result.err;
    EXPECT_NE(result.err.find("Item: cc:L\n"), std::string::npos) << result.err;
    EXPECT_NE(result.err.find("XML line: 9\n"), std::string::npos) << result.err;
}

// The file ends after its first object, as a copy broken off would.
TEST_F(CxftoolFiles, ValidateReportsAFileThatEndsTooEarly) {
    std::ifstream example(s_example, std::ios::binary);
    const std::string text((std::istreambuf_iterator<char>(example)), std::istreambuf_iterator<char>());
    const std::string end_of_object = "</cc:Object>\n";
    const std::string kept = text.substr(0, text.find(end_of_object) + end_of_object.size());
    const std::string path = WriteTextFile(s_folder / "truncated.cxf", kept);
    const Result result = Cxftool({"validate", path});
    EXPECT_EQ(result.code, 1);
    EXPECT_NE(result.err.find("Error code: 34\nError: Unexpected end of message\n"), std::string::npos) << result.err;
    const auto line_after_the_end = std::count(kept.begin(), kept.end(), '\n') + 1;
    EXPECT_NE(result.err.find("XML line: " + std::to_string(line_after_the_end) + "\n"), std::string::npos)
        << result.err;
}

TEST_F(CxftoolFiles, ValidateTellsAFileOfAnotherKind) {
    const std::string path = WriteTextFile(s_folder / "other.xml", "<?xml version=\"1.0\"?>\n<palette/>\n");
    const Result result = Cxftool({"validate", path});
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.out, "");
    EXPECT_NE(result.err.find("Not a CxF3 file"), std::string::npos) << result.err;
    EXPECT_NE(result.err.find("Item: palette\n"), std::string::npos) << result.err;
}

TEST_F(CxftoolFiles, ExampleRefusesAFolderThatDoesNotExist) {
    const Result result = Cxftool({"example", (s_folder / "no-such-folder" / "x.cxf").string()});
    EXPECT_EQ(result.code, 1);
    EXPECT_NE(result.err.find("cannot write"), std::string::npos) << result.err;
}

// ---------------------------------------------------------------- info

TEST_F(CxftoolFiles, InfoOfTheExampleShowsItsFileInformation) {
    const Result result = Cxftool({"info", s_example});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(result.err, "");
    EXPECT_TRUE(HasLine(result.out, "Creator: Tessarine cxftool")) << result.out;
    EXPECT_TRUE(HasLine(result.out, "Description: Four paint swatches of an autumn range, measured under M1 and M2"));
    EXPECT_TRUE(HasLine(result.out, "Comment: -"));
    EXPECT_TRUE(HasLine(result.out, "File tags: 2"));
    EXPECT_TRUE(HasLine(result.out, "Project Autumn Range"));
    EXPECT_TRUE(HasLine(result.out, "Customer Hollin & Daughters"));
    // The date of writing, in the XML form.
    const std::regex created("Created: +[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9]{2}:[0-9]{2}:[0-9]{2}Z");
    const std::vector<std::string> lines = Lines(result.out);
    EXPECT_TRUE(std::any_of(lines.begin(), lines.end(),
                            [&](const std::string &ar_line) { return std::regex_match(ar_line, created); }))
        << result.out;
}

TEST_F(CxftoolFiles, InfoOfTheExampleCountsObjectsByType) {
    const std::string out = Cxftool({"info", s_example}).out;
    EXPECT_TRUE(HasLine(out, "Objects: 4")) << out;
    for (const char *p_type : {"Target 1", "Trial 1", "Substrate 1", "Colorant 1"})
        EXPECT_TRUE(HasLine(out, p_type)) << p_type;
}

TEST_F(CxftoolFiles, InfoOfTheExampleListsItsColourSpecifications) {
    const std::string out = Cxftool({"info", s_example}).out;
    EXPECT_TRUE(HasLine(out, "Colour specifications: 2")) << out;
    EXPECT_TRUE(HasLine(out, "Id Measurement Filter Illuminant Observer Wavelengths"));
    EXPECT_TRUE(HasLine(out, "M1_D50_2 spectral M1 D50 2\xC2\xB0 from 380 nm, step 10 nm"));
    EXPECT_TRUE(HasLine(out, "M2_D65_10 spectral M2 D65 10\xC2\xB0 from 380 nm, step 10 nm"));
}

TEST_F(CxftoolFiles, InfoOfTheExampleCountsTheObjectsHoldingEachKindOfValue) {
    const std::string out = Cxftool({"info", s_example}).out;
    EXPECT_TRUE(HasLine(out, "Kinds of values: 4")) << out;
    EXPECT_TRUE(HasLine(out, "ReflectanceSpectrum ColorValues 4"));
    EXPECT_TRUE(HasLine(out, "ColorCIELab ColorValues 3"));
    EXPECT_TRUE(HasLine(out, "DeltaCIELab ColorDifferenceValues 1"));
    EXPECT_TRUE(HasLine(out, "ColorRecipe DeviceColorValues 1"));
}

TEST_F(CxftoolFiles, InfoOfTheExampleListsItsPalettesAndItsJob) {
    const std::string out = Cxftool({"info", s_example}).out;
    EXPECT_EQ(Section(out, "Palettes: 3"),
              (std::vector<std::string>{"Palettes: 3", "Name Objects", "Targets 1", "Trials 1",
                                        "Brick Red materials 2"}))
        << out;
    EXPECT_EQ(Section(out, "Jobs: 1"),
              (std::vector<std::string>{"Jobs: 1", "Brick Red approval: 1 series",
                                        "Reference Tolerance Specification Samples", "O1 CIELAB M1_D50_2 O2"}))
        << out;
    EXPECT_TRUE(HasLine(out, "Colour library: -")) << out;
}

// Palettes that share a name are listed apart; a palette none of whose
// objects is in the file is not listed, nor is the group of all objects.
TEST_F(CxftoolFiles, InfoListsPalettesInTheFileOrderWithTheirObjectCounts) {
    const Result result = Cxftool({"info", s_palettes});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(Section(result.out, "Palettes: 4"),
              (std::vector<std::string>{"Palettes: 4", "Name Objects", "Greens and blues 2", "Sky 2", "Sky 1",
                                        "Repeats 2"}))
        << result.out;
}

// The file keeps a job as sets named after it, so the jobs come back by
// name; a series without tolerance or samples shows dashes.
TEST_F(CxftoolFiles, InfoListsJobsByNameWithTheirSeries) {
    const Result result = Cxftool({"info", s_palettes});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(Section(result.out, "Jobs: 2"),
              (std::vector<std::string>{"Jobs: 2", "Moss approval: 1 series",
                                        "Reference Tolerance Specification Samples", "O3 FMCII M1 O4, O5",
                                        "Sky approval: 2 series", "Reference Tolerance Specification Samples",
                                        "O1 CIELAB M1 O2", "O1 - - -"}))
        << result.out;
}

TEST_F(CxftoolFiles, InfoNamesTheBrandedLibraryAndCountsItsColours) {
    const Result result = Cxftool({"info", k_branded_library});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(result.err, "");
    EXPECT_EQ(Section(result.out, "Colour library: Coastal Inks"),
              (std::vector<std::string>{"Colour library: Coastal Inks", "Colours: 3"}))
        << result.out;
    EXPECT_TRUE(HasLine(result.out, "Palettes: 0"));
    EXPECT_TRUE(HasLine(result.out, "Jobs: 0"));
}

TEST_F(CxftoolFiles, InfoOfAnEmptyDocumentSaysNone) {
    const std::string path = WriteTextFile(
        s_folder / "empty.cxf", "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"/>\n");
    const Result result = Cxftool({"info", path});
    EXPECT_EQ(result.code, 0) << result.err;
    for (const char *p_line :
         {"Creator: -", "Created: -", "File tags: 0", "Objects: 0", "Colour specifications: 0", "Kinds of values: 0",
          "Palettes: 0", "Jobs: 0", "Colour library: -"})
        EXPECT_TRUE(HasLine(result.out, p_line)) << p_line << "\n" << result.out;
}

TEST_F(CxftoolFiles, InfoQuotesTextThatWouldBreakItsLine) {
    const std::string path =
        WriteTextFile(s_folder / "tags.cxf",
                      "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\">\n"
                      " <cc:FileInformation>\n"
                      "  <cc:Creator>Tag Tester</cc:Creator>\n"
                      "  <cc:Tag Name=\"Two&#10;lines\" Value=\"  padded  \"/>\n"
                      "  <cc:Tag Name=\"\" Value=\"Tab&#9;Char\"/>\n"
                      " </cc:FileInformation>\n"
                      "</cc:CxF>\n");
    const Result result = Cxftool({"info", path});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_NE(result.out.find("\n  \"Two\\nlines\"  \"  padded  \"\n"), std::string::npos) << result.out;
    // Padded to the 12 characters of the first name, and two more.
    EXPECT_NE(result.out.find("\n  \"\"" + std::string(12, ' ') + "\"Tab\\tChar\"\n"), std::string::npos) << result.out;
}

// What the example command writes now and the bundled file differ only in
// the dates of writing.
TEST_F(CxftoolFiles, BundledExampleIsWhatTheExampleCommandWrites) {
    const std::string bundled = std::string(TESSARINE_SOURCE_DIR) + "/examples/swatches.cxf";
    EXPECT_EQ(Cxftool({"validate", bundled}).out, "valid\n");
    std::vector<std::string> expected = Lines(Cxftool({"info", s_example}).out);
    std::vector<std::string> actual = Lines(Cxftool({"info", bundled}).out);
    ASSERT_EQ(actual.size(), expected.size());
    // Lines 0 and 2 are the path and the creation date.
    for (std::size_t index = 0; index < actual.size(); ++index) {
        if (index == 0 || index == 2)
            continue;
        EXPECT_EQ(actual[index], expected[index]);
    }
    EXPECT_EQ(Cxftool({"dump", bundled}).out, Cxftool({"dump", s_example}).out);
}

// ---------------------------------------------------------------- dump

// 3 columns of the object, then L, a, b and 36 reflectance values under each
// of the two specifications.
constexpr std::size_t k_example_columns = 3 + 2 * (3 + 36);

TEST_F(CxftoolFiles, DumpCsvHasOneRowPerObject) {
    const Result result = Cxftool({"dump", s_example});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(result.err, "");
    EXPECT_EQ(Lines(result.out).size(), 5u);
    const std::vector<std::vector<std::string>> records = CsvRecords(result.out);
    ASSERT_EQ(records.size(), 5u);
    for (const std::vector<std::string> &record : records)
        EXPECT_EQ(record.size(), k_example_columns);
    std::vector<std::string> ids;
    for (std::size_t index = 1; index < records.size(); ++index)
        ids.push_back(records[index][0]);
    EXPECT_EQ(ids, (std::vector<std::string>{"O1", "O2", "O3", "O4"}));
}

TEST_F(CxftoolFiles, DumpCsvHeaderNamesEachValueBySpecification) {
    const std::vector<std::string> header = CsvRecords(Cxftool({"dump", s_example}).out).at(0);
    ASSERT_EQ(header.size(), k_example_columns);
    EXPECT_EQ(std::vector<std::string>(header.begin(), header.begin() + 7),
              (std::vector<std::string>{"id", "name", "type", "M1_D50_2:L", "M1_D50_2:a", "M1_D50_2:b",
                                        "M1_D50_2:380"}));
    EXPECT_EQ(header[41], "M1_D50_2:730");
    EXPECT_EQ(header[42], "M2_D65_10:L");
    EXPECT_EQ(header.back(), "M2_D65_10:730");
}

TEST_F(CxftoolFiles, DumpCsvGivesTheValuesOfEachObject) {
    const std::string out = Cxftool({"dump", s_example}).out;
    const std::vector<std::vector<std::string>> records = CsvRecords(out);
    ASSERT_EQ(records.size(), 5u);
    const std::vector<std::string> &target = records[1];
    EXPECT_EQ(std::vector<std::string>(target.begin(), target.begin() + 7),
              (std::vector<std::string>{"O1", "Brick Red", "Target", "44.8", "44.6", "30.2", "0.055"}));
    EXPECT_EQ(target[41], "0.6198"); // 730 nm under M1
    EXPECT_EQ(std::vector<std::string>(target.begin() + 42, target.begin() + 46),
              (std::vector<std::string>{"44.5", "42.9", "28.8", "0.052"}));

    // A comma in a name is quoted; the trial is measured under M1 only.
    EXPECT_NE(out.find("\nO2,\"Brick Red, batch 2\",Trial,45.6,43.1,29.5,0.058,"), std::string::npos) << out;
    const std::vector<std::string> &trial = records[2];
    EXPECT_TRUE(
        std::all_of(trial.begin() + 42, trial.end(), [](const std::string &ar_cell) { return ar_cell.empty(); }));

    // The brightener glows under M1 only.
    const std::vector<std::string> &card = records[3];
    EXPECT_EQ(card[3 + 3 + 6], "0.9782"); // 440 nm under M1
    EXPECT_EQ(card[42 + 3 + 6], "0.8782"); // 440 nm under M2

    // The colorant has a spectrum and no Lab value.
    const std::vector<std::string> &colorant = records[4];
    EXPECT_EQ(std::vector<std::string>(colorant.begin(), colorant.begin() + 7),
              (std::vector<std::string>{"O4", "Iron Oxide Red", "Colorant", "", "", "", "0.05"}));
}

TEST_F(CxftoolFiles, DumpJsonHasOneElementPerObject) {
    const Result result = Cxftool({"dump", s_example, "--format", "json"});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(result.err, "");
    const boost::property_tree::ptree rows = ParseJson(result.out);
    ASSERT_EQ(rows.size(), 4u);
    std::vector<std::string> names;
    for (const auto &row : rows)
        names.push_back(row.second.get<std::string>("name"));
    EXPECT_EQ(names, (std::vector<std::string>{"Brick Red", "Brick Red, batch 2", "White Card", "Iron Oxide Red"}));
    // One line per object between the brackets.
    EXPECT_EQ(Lines(result.out).size(), 6u);
}

TEST_F(CxftoolFiles, DumpJsonGivesLabAndReflectanceBySpecification) {
    const std::string out = Cxftool({"dump", "--format=json", s_example}).out;
    const std::vector<std::string> lines = Lines(out);
    ASSERT_EQ(lines.size(), 6u);
    EXPECT_EQ(lines[1].rfind("  {\"id\": \"O1\", \"name\": \"Brick Red\", \"type\": \"Target\", \"specifications\": "
                             "{\"M1_D50_2\": {\"lab\": [44.8, 44.6, 30.2], \"reflectance\": [0.055, ",
                             0),
              0u)
        << lines[1];
    EXPECT_NE(lines[2].find("\"M2_D65_10\": {\"lab\": null, \"reflectance\": null}"), std::string::npos) << lines[2];
    EXPECT_NE(lines[4].find("\"M1_D50_2\": {\"lab\": null, \"reflectance\": [0.05, 0.05, 0.0501,"), std::string::npos)
        << lines[4];

    const boost::property_tree::ptree rows = ParseJson(out);
    const boost::property_tree::ptree &target = rows.begin()->second;
    EXPECT_EQ(target.get_child("specifications.M1_D50_2.reflectance").size(), 36u);
    EXPECT_EQ(target.get_child("specifications.M2_D65_10.lab").size(), 3u);
}

TEST_F(CxftoolFiles, DumpJsonOfAnEmptyDocumentIsAnEmptyArray) {
    const std::string path = WriteTextFile(
        s_folder / "empty.cxf", "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"/>\n");
    EXPECT_EQ(Cxftool({"dump", path, "--format", "json"}).out, "[]\n");
    EXPECT_EQ(Cxftool({"dump", path}).out, "id,name,type\n");
}

// ---------------------------------------------------------------- dump --palette

TEST_F(CxftoolFiles, DumpPaletteCsvListsItsObjectsInPaletteOrder) {
    const Result result = Cxftool({"dump", s_example, "--palette", "Brick Red materials"});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(result.err, "");
    EXPECT_EQ(CsvIds(result.out), (std::vector<std::string>{"O4", "O3"}));
    // The columns are those of the whole file, and so are the values.
    const std::vector<std::vector<std::string>> records = CsvRecords(result.out);
    const std::vector<std::vector<std::string>> all = CsvRecords(Cxftool({"dump", s_example}).out);
    ASSERT_EQ(records.size(), 3u);
    ASSERT_EQ(all.size(), 5u);
    EXPECT_EQ(records[0], all[0]);
    EXPECT_EQ(records[1], all[4]);
    EXPECT_EQ(records[2], all[3]);

    EXPECT_EQ(CsvIds(Cxftool({"dump", s_palettes, "--palette=Greens and blues"}).out),
              (std::vector<std::string>{"O3", "O1"}));
}

TEST_F(CxftoolFiles, DumpPaletteJsonListsItsObjectsInPaletteOrder) {
    const Result result = Cxftool({"dump", s_example, "--palette", "Brick Red materials", "--format", "json"});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(JsonIds(result.out), (std::vector<std::string>{"O4", "O3"}));
    EXPECT_EQ(JsonIds(Cxftool({"dump", "--format=json", "--palette=Greens and blues", s_palettes}).out),
              (std::vector<std::string>{"O3", "O1"}));
}

TEST_F(CxftoolFiles, DumpPaletteWritesAnObjectAsOftenAsThePaletteListsIt) {
    EXPECT_EQ(CsvIds(Cxftool({"dump", s_palettes, "--palette", "Repeats"}).out),
              (std::vector<std::string>{"O4", "O4"}));
}

TEST_F(CxftoolFiles, DumpPaletteTakesTheFirstOfPalettesThatShareAName) {
    EXPECT_EQ(CsvIds(Cxftool({"dump", s_palettes, "--palette", "Sky"}).out), (std::vector<std::string>{"O1", "O2"}));
    EXPECT_EQ(JsonIds(Cxftool({"dump", s_palettes, "--palette", "Sky", "--format", "json"}).out),
              (std::vector<std::string>{"O1", "O2"}));
}

TEST_F(CxftoolFiles, DumpUnknownPaletteFailsAndNamesThePalettesThereAre) {
    for (const std::string format : {"csv", "json"}) {
        const Result result = Cxftool({"dump", s_palettes, "--palette", "Sk", "--format", format});
        EXPECT_EQ(result.code, 1) << format;
        EXPECT_EQ(result.out, "") << format;
        EXPECT_EQ(result.err, "cxftool dump: no palette \"Sk\" in " + s_palettes +
                                  "\nIts palettes: \"Greens and blues\", \"Sky\", \"Sky\", \"Repeats\"\n");
    }
}

// The palette that is lost (its object is not in the file) and the group of
// all objects, named by the file description, are not palettes.
TEST_F(CxftoolFiles, DumpPaletteFindsNoPaletteInTheGroupOfAllObjectsOrALostPalette) {
    for (const char *p_name : {"Sky and moss", "Lost"}) {
        const Result result = Cxftool({"dump", s_palettes, "--palette", p_name});
        EXPECT_EQ(result.code, 1) << p_name;
        EXPECT_EQ(result.out, "") << p_name;
        EXPECT_NE(result.err.find("no palette"), std::string::npos) << result.err;
    }
}

TEST_F(CxftoolFiles, DumpPaletteOfAFileWithoutPalettesFails) {
    const Result result = Cxftool({"dump", k_branded_library, "--palette", "Coastal Inks"});
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.out, "");
    EXPECT_EQ(result.err,
              "cxftool dump: no palette \"Coastal Inks\" in " + k_branded_library + "\nThe file has no palettes.\n");
}

// ---------------------------------------------------------------- corpus

std::vector<std::string> CorpusFiles() {
    std::vector<std::string> files;
    const fs::path folder = fs::path(TESSARINE_CORPUS_DIR) / "cxf3";
    if (!fs::is_directory(folder))
        return files;
    for (const fs::directory_entry &entry : fs::recursive_directory_iterator(folder))
        if (entry.is_regular_file() && entry.path().extension() == ".cxf")
            files.push_back(entry.path().string());
    std::sort(files.begin(), files.end());
    return files;
}

TEST(Cxftool, EveryCorpusFilePassesInfoValidateAndDump) {
    const std::vector<std::string> files = CorpusFiles();
    if (files.empty())
        GTEST_SKIP() << "no corpus at " << TESSARINE_CORPUS_DIR;
    for (const std::string &file : files) {
        for (const std::vector<std::string> &args :
             {std::vector<std::string>{"info", file}, {"validate", file}, {"dump", file}}) {
            const Result result = Cxftool(args);
            EXPECT_EQ(result.code, 0) << args[0] << " " << file << "\n" << result.err;
            EXPECT_EQ(result.err, "") << args[0] << " " << file;
        }
        const Result json = Cxftool({"dump", file, "--format", "json"});
        EXPECT_EQ(json.code, 0) << file << "\n" << json.err;
        EXPECT_NO_THROW(ParseJson(json.out)) << file << "\n" << json.out;
    }
}

// The names of the corpus hold quotes, ampersands, commas and Unicode of
// every kind: every CSV record still has as many fields as the header.
TEST(Cxftool, CorpusDumpsKeepOneCsvFieldPerColumn) {
    const std::vector<std::string> files = CorpusFiles();
    if (files.empty())
        GTEST_SKIP() << "no corpus at " << TESSARINE_CORPUS_DIR;
    for (const std::string &file : files) {
        const std::vector<std::vector<std::string>> records = CsvRecords(Cxftool({"dump", file}).out);
        ASSERT_FALSE(records.empty()) << file;
        for (const std::vector<std::string> &record : records)
            EXPECT_EQ(record.size(), records.front().size()) << file << " " << record.front();
    }
}

} // namespace
