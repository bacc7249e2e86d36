// Loading and saving CxF3 documents, the custom resource extensions on the
// way, and telling a CxF3 file from anything else.
#include "cxf3_test_support.h"

#include <tessarine/tessarine.h>

#include "dll/cxfwrapper/source/cxf3wrapper.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <stdexcept>

namespace {

boost::shared_ptr<CxF3Object> NamedTarget(const std::string &ar_name) {
    boost::shared_ptr<CxF3Object> object = CxF3Object::CreateCxFObject();
    object->SetName(ar_name);
    object->SetObjectType(CxF3ObjectTarget);
    return object;
}

std::vector<std::string> CorpusFiles() {
    std::vector<std::string> files;
    for (const auto &entry : std::filesystem::recursive_directory_iterator(TESSARINE_CORPUS_DIR "/cxf3"))
        if (entry.path().extension() == ".cxf")
            files.push_back(entry.path().string());
    std::sort(files.begin(), files.end());
    return files;
}

// Sets an environment variable for the life of the object.
class EnvironmentOverride {
public:
    EnvironmentOverride(const char *ap_name, const std::string &ar_value) : p_name(ap_name) {
        if (const char *old = std::getenv(ap_name))
            p_old = old, p_had_value = true;
        setenv(ap_name, ar_value.c_str(), 1);
    }
    ~EnvironmentOverride() {
        if (p_had_value)
            setenv(p_name, p_old.c_str(), 1);
        else
            unsetenv(p_name);
    }

private:
    const char *p_name;
    std::string p_old;
    bool p_had_value = false;
};

} // namespace

class CxF3SaveTest : public ScratchFolderTest {};

// ---------------------------------------------------------------- paths

TEST_F(CxF3SaveTest, PathWithoutExtensionGetsCxf) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->SaveCxF(PathOf("swatch")));
    EXPECT_TRUE(std::filesystem::exists(PathOf("swatch.cxf")));
    EXPECT_FALSE(std::filesystem::exists(PathOf("swatch")));
}

TEST_F(CxF3SaveTest, ExtensionIsLowerCasedAndTheStemKeepsItsCase) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->SaveCxF(PathOf("SWATCH.CxF")));
    EXPECT_TRUE(std::filesystem::exists(PathOf("SWATCH.cxf")));
}

TEST_F(CxF3SaveTest, OtherExtensionsAreKept) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->SaveCxF(PathOf("swatch.xml")));
    EXPECT_TRUE(std::filesystem::exists(PathOf("swatch.xml")));
}

TEST_F(CxF3SaveTest, DotInAFolderNameCountsAsTheExtension) {
    std::filesystem::create_directories(p_folder / "a.b");
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->SaveCxF(PathOf("a.b/c")));
    EXPECT_TRUE(std::filesystem::is_regular_file(PathOf("a.b/c")));
    EXPECT_FALSE(std::filesystem::exists(PathOf("a.b/c.cxf")));
}

TEST_F(CxF3SaveTest, DotInAFolderNameLowerCasesTheRestOfThePath) {
    std::filesystem::create_directories(p_folder / "a.bin");
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->SaveCxF(PathOf("a.BIN/LOW")));
    EXPECT_TRUE(std::filesystem::is_regular_file(PathOf("a.bin/low")));
}

TEST_F(CxF3SaveTest, PathThatCannotBeWrittenGivesFalse) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_FALSE(document->SaveCxF(PathOf("missing/folder/swatch.cxf")));
}

TEST_F(CxF3SaveTest, FailedSaveLeavesThePreviousFileIntact) {
    const std::string path = PathOf("swatch.cxf");
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(NamedTarget("Red")));
    ASSERT_TRUE(document->SaveCxF(path));
    const std::string before = ReadFile(path);

    // A gap in the object collection cannot be written: the save fails.
    document->GetWrapper().objects.insert(document->GetWrapper().objects.begin(),
                                          boost::shared_ptr<CxF3ObjectWrapper>(new CxF3ObjectWrapper()));
    EXPECT_FALSE(document->SaveCxF(path));
    EXPECT_EQ(ReadFile(path), before);
    EXPECT_FALSE(std::filesystem::exists(path + ".tessarine-partial"));
}

// ---------------------------------------------------------------- what a save writes

TEST_F(CxF3SaveTest, EmptyDocumentSavesCreatorDateAndEmptyResources) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->SaveCxF(PathOf("empty.cxf")));
    const std::string text = ReadFile(PathOf("empty.cxf"));
    EXPECT_NE(text.find("<cc:Creator></cc:Creator>"), std::string::npos) << text;
    EXPECT_NE(text.find("<cc:CreationDate>"), std::string::npos) << text;
    EXPECT_NE(text.find("<cc:Resources/>"), std::string::npos) << text;
    EXPECT_EQ(text.find("CustomResources"), std::string::npos) << text;

    boost::shared_ptr<CxF3> reloaded = CxF3::CreateCxF();
    EXPECT_TRUE(reloaded->LoadCxF(PathOf("empty.cxf")));
}

TEST_F(CxF3SaveTest, SaveStampsTheTimeOfSavingOverALoadedDate) {
    WriteFile(PathOf("dated.cxf"),
              "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"><cc:FileInformation>"
              "<cc:Creator>Old</cc:Creator><cc:CreationDate>1999-01-01T00:00:00Z</cc:CreationDate>"
              "</cc:FileInformation></cc:CxF>");
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->LoadCxF(PathOf("dated.cxf")));
    ASSERT_TRUE(document->SaveCxF(PathOf("dated.cxf")));
    const std::string text = ReadFile(PathOf("dated.cxf"));
    EXPECT_EQ(text.find("1999-01-01"), std::string::npos) << text;
    // The creator of the document (empty here) replaces the loaded one.
    EXPECT_NE(text.find("<cc:Creator></cc:Creator>"), std::string::npos) << text;
}

TEST_F(CxF3SaveTest, ObjectWithoutValuesSavesAReadableFile) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(NamedTarget("Plain")));
    ASSERT_TRUE(document->SaveCxF(PathOf("plain.cxf")));
    const std::string text = ReadFile(PathOf("plain.cxf"));
    EXPECT_EQ(text.find("ColorValues"), std::string::npos) << text;
    EXPECT_EQ(text.find("PhysicalAttributes"), std::string::npos) << text;

    boost::shared_ptr<CxF3> reloaded = CxF3::CreateCxF();
    ASSERT_TRUE(reloaded->LoadCxF(PathOf("plain.cxf")));
    EXPECT_EQ(reloaded->GetObjectById("O1")->GetName(), "Plain");
}

TEST_F(CxF3SaveTest, ValuesAddedAfterAddObjectAreNotSaved) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> object = NamedTarget("Late");
    ASSERT_TRUE(document->AddObject(object));
    ASSERT_TRUE(object->AddColorCIELab({50.0, 10.0, -10.0}, "cs", "lab"));
    object->SetInfo("comments reach the file at any time");
    EXPECT_TRUE(object->HasLab("cs"));

    ASSERT_TRUE(document->SaveCxF(PathOf("late.cxf")));
    boost::shared_ptr<CxF3> reloaded = CxF3::CreateCxF();
    ASSERT_TRUE(reloaded->LoadCxF(PathOf("late.cxf")));
    EXPECT_FALSE(reloaded->GetObjectById("O1")->HasLab("cs"));
    EXPECT_EQ(reloaded->GetObjectById("O1")->GetInfo(), "comments reach the file at any time");
}

TEST_F(CxF3SaveTest, ObjectThatLostARequiredPartIsLeftOutWhenLast) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(NamedTarget("Kept")));
    ASSERT_TRUE(document->AddObject(NamedTarget("Dropped")));
    *document->GetWrapper().objects[1]->object = cc::Object();
    ASSERT_TRUE(document->SaveCxF(PathOf("dropped.cxf")));
    const std::string text = ReadFile(PathOf("dropped.cxf"));
    EXPECT_EQ(CountOf(text, "<cc:Object "), 1u) << text;
}

TEST_F(CxF3SaveTest, SpecificationsAndObjectsRoundTrip) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->SetCreator("Lab bench");
    boost::shared_ptr<CxF3ColorSpecification> specification = CxF3ColorSpecification::CreateCxFColorSpecification();
    specification->SetFilter("D8i");
    specification->SetIlluminant("D65");
    specification->SetObserver("10");
    const std::string id = document->AddColorSpecification(specification, true);
    boost::shared_ptr<CxF3Object> object = NamedTarget("Sky");
    ASSERT_TRUE(object->AddColorCIELab({70.0, -5.0, -30.0}, id, "lab"));
    ASSERT_TRUE(document->AddObject(object));
    ASSERT_TRUE(document->SaveCxF(PathOf("sky.cxf")));

    boost::shared_ptr<CxF3> reloaded = CxF3::CreateCxF();
    ASSERT_TRUE(reloaded->LoadCxF(PathOf("sky.cxf")));
    EXPECT_EQ(reloaded->GetWrapper().fileInformation->get_Creator(), L"Lab bench");
    ASSERT_TRUE(reloaded->IsExistingColorSpecification(id));
    EXPECT_EQ(reloaded->GetColorSpecification(id)->GetIlluminant(), "D65");
    EXPECT_EQ(reloaded->GetObjectById("O1")->GetLab(id), (std::vector<double>{70.0, -5.0, -30.0}));
}

// ---------------------------------------------------------------- to and from text

TEST_F(CxF3SaveTest, SaveToStreamGivesTheFileTextAndRemovesTheFile) {
    EnvironmentOverride temporary("TMPDIR", p_folder.string());
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(NamedTarget("Red")));
    const std::string text = document->SaveToStream();
    EXPECT_EQ(text.rfind("<?xml version=\"1.0\" encoding=\"UTF-8\"?>", 0), 0u) << text;
    EXPECT_NE(text.find("Name=\"Red\""), std::string::npos);
    EXPECT_FALSE(std::filesystem::exists(PathOf("cxf3.cxf")));

    boost::shared_ptr<CxF3> reloaded = CxF3::CreateCxF();
    std::stringstream stream(text);
    reloaded->LoadFromStream(stream);
    EXPECT_EQ(reloaded->GetObjectById("O1")->GetName(), "Red");
}

TEST_F(CxF3SaveTest, SaveToStreamWithoutATemporaryFolderThrows) {
    EnvironmentOverride temporary("TMPDIR", PathOf("no-such-folder"));
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    try {
        document->SaveToStream();
        FAIL() << "expected an exception";
    } catch (const std::runtime_error &error) {
        EXPECT_STREQ(error.what(), "Error getting temporary path");
    }
}

TEST_F(CxF3SaveTest, SaveToStreamThatCannotWriteGivesEmptyText) {
    EnvironmentOverride temporary("TMPDIR", p_folder.string());
    // A folder in the way of the file being written.
    std::filesystem::create_directories(p_folder / "cxf3.cxf.tessarine-partial");
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_EQ(document->SaveToStream(), "");
}

TEST(CxF3Load, LoadFromStreamOfAVersion2FileThrowsWithTheErrorCode) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream("<?xml version=\"1.0\"?>\n<CXF xmlns=\"http://colorexchangeformat.com/CxF2\">"
                             "<FileInformation/></CXF>");
    try {
        document->LoadFromStream(stream);
        FAIL() << "expected an exception";
    } catch (const std::runtime_error &error) {
        EXPECT_STREQ(error.what(), "Error loading CxF (Error code: 16)");
    }
}

TEST(CxF3Load, LoadFromStreamOfMalformedTextThrows) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream("<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"><cc:Resources>");
    EXPECT_THROW(document->LoadFromStream(stream), std::runtime_error);
}

TEST_F(CxF3SaveTest, LoadOfAMissingFileGivesFalse) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_FALSE(document->LoadCxF(PathOf("missing.cxf")));
}

TEST_F(CxF3SaveTest, LoadOfAMalformedFileGivesFalseAndKeepsTheWorkingCopies) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(NamedTarget("Red")));
    WriteFile(PathOf("broken.cxf"), "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"><cc:Res");
    EXPECT_FALSE(document->LoadCxF(PathOf("broken.cxf")));
    EXPECT_EQ(document->GetWrapper().objects.size(), 1u);
}

// ---------------------------------------------------------------- extensions in the custom resources

TEST_F(CxF3SaveTest, LoadKeepsEveryCustomResourceEntryAndSaveWritesThemBack) {
    const std::string foreign =
        "<cc:CustomResources><x:Note xmlns:x=\"urn:example:notes\" kind=\"a\">keep me</x:Note>"
        "<y:Other xmlns:y=\"urn:example:other\"/></cc:CustomResources>";
    WriteFile(PathOf("custom.cxf"), Cxf3Text("<cc:ObjectCollection>" + ObjectXml("A") + "</cc:ObjectCollection>",
                                             foreign));
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->LoadCxF(PathOf("custom.cxf")));
    EXPECT_EQ(document->GetWrapper().customResources->size_inner_CustomResources(), 2u);
    ASSERT_TRUE(document->SaveCxF(PathOf("custom.cxf")));
    const std::string text = ReadFile(PathOf("custom.cxf"));
    EXPECT_NE(text.find("keep me</x:Note>"), std::string::npos) << text;
    EXPECT_NE(text.find("<y:Other"), std::string::npos) << text;
}

TEST_F(CxF3SaveTest, ExtensionThatDoesNotParseIsSkipped) {
    const std::string broken =
        "<cc:CustomResources><cp:ColorPage xmlns:cp=\"http://colorexchangeformat.com/CxF3-colorpage\"/>"
        "</cc:CustomResources>";
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("A") + "</cc:ObjectCollection>", broken));
    document->LoadFromStream(stream);
    EXPECT_TRUE(document->GetWrapper().palettes.empty());
    EXPECT_EQ(document->GetObjectById("A")->GetName(), "NA");
}

// ---------------------------------------------------------------- file recognition

class CxF3RecognitionTest : public ScratchFolderTest {};

TEST_F(CxF3RecognitionTest, CxF3FileIsRecognised) {
    WriteFile(PathOf("good.cxf"), Cxf3Text(""));
    EXPECT_TRUE(CxF3::IsValidFile(PathOf("good.cxf")));
}

TEST_F(CxF3RecognitionTest, RootCxFInAnotherNamespaceIsRefused) {
    WriteFile(PathOf("other.cxf"), "<cc:CxF xmlns:cc=\"http://example.com/not-cxf3\"/>");
    EXPECT_FALSE(CxF3::IsValidFile(PathOf("other.cxf")));
}

TEST_F(CxF3RecognitionTest, OtherRootInTheCoreNamespaceIsRefused) {
    WriteFile(PathOf("other.cxf"), "<cc:Resources xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"/>");
    EXPECT_FALSE(CxF3::IsValidFile(PathOf("other.cxf")));
}

TEST_F(CxF3RecognitionTest, MissingFileIsRefused) { EXPECT_FALSE(CxF3::IsValidFile(PathOf("missing.cxf"))); }

TEST_F(CxF3RecognitionTest, FileCutAfterTheRootStartTagIsRecognised) {
    WriteFile(PathOf("cut.cxf"), "<?xml version=\"1.0\"?>\n<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\">"
                                 "<cc:FileInfor");
    EXPECT_TRUE(CxF3::IsValidFile(PathOf("cut.cxf")));
}

TEST_F(CxF3RecognitionTest, Version2FileIsRefused) {
    WriteFile(PathOf("v2.cxf"), "<?xml version=\"1.0\"?>\n<CXF xmlns=\"http://colorexchangeformat.com/CxF2\"/>");
    EXPECT_FALSE(CxF3::IsValidFile(PathOf("v2.cxf")));
}

TEST_F(CxF3RecognitionTest, FileThatIsNotXmlIsRefused) {
    WriteFile(PathOf("binary.cxf"), std::string("\x00\x01\x02garbage", 10));
    EXPECT_FALSE(CxF3::IsValidFile(PathOf("binary.cxf")));
}

// ---------------------------------------------------------------- files written by others

TEST(CxF3Corpus, EveryFileLoadsAndIsRecognised) {
    const std::vector<std::string> files = CorpusFiles();
    ASSERT_EQ(files.size(), 15u);
    for (const std::string &path : files) {
        EXPECT_TRUE(CxF3::IsValidFile(path)) << path;
        boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
        EXPECT_TRUE(document->LoadCxF(path)) << path;
    }
}

class CxF3CorpusTest : public ScratchFolderTest {};

TEST_F(CxF3CorpusTest, EveryFileSavesAndLoadsAgainWithItsObjects) {
    EnvironmentOverride temporary("TMPDIR", p_folder.string());
    for (const std::string &path : CorpusFiles()) {
        boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
        ASSERT_TRUE(document->LoadCxF(path)) << path;
        const std::string text = document->SaveToStream();
        ASSERT_FALSE(text.empty()) << path;
        boost::shared_ptr<CxF3> reloaded = CxF3::CreateCxF();
        std::stringstream stream(text);
        ASSERT_NO_THROW(reloaded->LoadFromStream(stream)) << path;
        EXPECT_EQ(reloaded->GetObjects().size(), document->GetObjects().size()) << path;
    }
}
