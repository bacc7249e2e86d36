// Palettes: adding, merging, listing, and their colour page in the file.
#include "cxf3_test_support.h"

#include <tessarine/tessarine.h>

#include <cxf/v3/cxf3.h>
#include <cxf/v3/cxf3_colorpage.h>

#include <sstream>

#include "dll/cxfwrapper/source/cxf3wrapper.h"

namespace {

boost::shared_ptr<CxF3Object> Added(CxF3 &ar_document, const std::string &ar_name, CxF3ObjectType a_type) {
    boost::shared_ptr<CxF3Object> object = CxF3Object::CreateCxFObject();
    object->SetName(ar_name);
    object->SetObjectType(a_type);
    EXPECT_TRUE(ar_document.AddObject(object));
    return object;
}

std::vector<std::string> NamesOf(const CxF3::ObjectList &ar_objects) {
    std::vector<std::string> names;
    for (const boost::shared_ptr<CxF3Object> &object : ar_objects)
        names.push_back(object->GetName());
    return names;
}

std::vector<std::string> GroupNames(const CxF3 &ar_document) {
    std::vector<std::string> names;
    for (const auto &group : ar_document.GetPalettes())
        names.push_back(group.first);
    return names;
}

const char *const k_one_page_of_two =
    "<cc:CustomResources><cp:ColorPage xmlns:cp=\"http://colorexchangeformat.com/CxF3-colorpage\" "
    "Name=\"Book\" NumPages=\"2\"><cp:Page Name=\"Reds\" NumRows=\"1\"><cp:Row Name=\"Row1\" NumColumns=\"2\">"
    "<cp:Obj Id=\"A\"/><cp:Obj Id=\"B\"/></cp:Row></cp:Page></cp:ColorPage></cc:CustomResources>";

} // namespace

TEST(CxF3Palette, FixedWords) {
    EXPECT_EQ(CxF3::GetTargetTag(), "Target");
    EXPECT_EQ(CxF3::GetReferenceTag(), "Standard");
    EXPECT_EQ(CxF3::GetTrialTag(), "Trial");
    EXPECT_EQ(CxF3::GetSampleTag(), "Sample");
    EXPECT_EQ(CxF3::GetTargetsGroupName(), "Targets");
    EXPECT_EQ(CxF3::GetReferencesGroupName(), "Standards");
    EXPECT_EQ(CxF3::GetTrialsGroupName(), "Trials");
    EXPECT_EQ(CxF3::GetSamplesGroupName(), "Samples");
}

TEST(CxF3Palette, StandardPaletteTwiceMergesIntoOneTargetsPalette) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddStandardPalette({Added(*document, "T1", CxF3ObjectTarget)});
    document->AddStandardPalette({Added(*document, "T2", CxF3ObjectTarget)});
    const std::vector<CxF3Palette> &palettes = document->GetWrapper().palettes;
    ASSERT_EQ(palettes.size(), 1u);
    EXPECT_EQ(palettes[0].name, "Targets");
    EXPECT_EQ(palettes[0].objectIds, (std::vector<std::string>{"O1", "O2"}));
}

TEST(CxF3Palette, StandardPaletteSplitsTargetsFromStandardsAndDropsOthers) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF(); // O1 Standard, O2 Target, O3 Trial
    std::stringstream stream(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("O1", "Standard") + ObjectXml("O2") +
                                      ObjectXml("O3", "Trial") + "</cc:ObjectCollection>"));
    document->LoadFromStream(stream);
    document->AddStandardPalette(document->GetObjects());
    EXPECT_EQ(GroupNames(*document), (std::vector<std::string>{"Object Collection", "Targets", "Standards"}));
    EXPECT_EQ(NamesOf(document->GetPalettes()[1].second), std::vector<std::string>{"NO2"});
    EXPECT_EQ(NamesOf(document->GetPalettes()[2].second), std::vector<std::string>{"NO1"});
}

TEST(CxF3Palette, TrialPaletteSplitsTrialsFromSamples) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("O1", "Sample") +
                                      ObjectXml("O2", "Trial") + ObjectXml("O3") + "</cc:ObjectCollection>"));
    document->LoadFromStream(stream);
    document->AddTrialPalette(document->GetObjects());
    EXPECT_EQ(GroupNames(*document), (std::vector<std::string>{"Object Collection", "Trials", "Samples"}));
}

TEST(CxF3Palette, SamePaletteNameTwiceGivesTwoPalettes) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> red = Added(*document, "Red", CxF3ObjectTarget);
    document->AddPalette("A", {red});
    document->AddPalette("A", {red});
    EXPECT_EQ(GroupNames(*document), (std::vector<std::string>{"Object Collection", "A", "A"}));
}

TEST(CxF3Palette, PaletteOfUnknownIdsIsNotListed) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    Added(*document, "Red", CxF3ObjectTarget);
    boost::shared_ptr<CxF3Object> stranger = CxF3Object::CreateCxFObject();
    stranger->SetId("nowhere");
    document->AddPalette("Ghosts", {stranger});
    EXPECT_EQ(GroupNames(*document), std::vector<std::string>{"Object Collection"});
}

TEST(CxF3Palette, DocumentWithoutObjectsListsNoPalettes) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> loose = CxF3Object::CreateCxFObject();
    loose->SetId("O1");
    document->AddPalette("Loose", {loose});
    EXPECT_TRUE(document->GetPalettes().empty());
}

TEST(CxF3Palette, PaletteIdsAreTakenWhenThePaletteIsAdded) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> early = CxF3Object::CreateCxFObject();
    early->SetName("Early");
    early->SetObjectType(CxF3ObjectTarget);
    early->SetId("draft");
    document->AddPalette("Too early", {early});
    ASSERT_TRUE(document->AddObject(early));
    EXPECT_EQ(document->GetWrapper().palettes[0].objectIds, std::vector<std::string>{"draft"});
    EXPECT_EQ(GroupNames(*document), std::vector<std::string>{"Object Collection"});
}

TEST(CxF3Palette, RepeatedIdListsEveryObjectOfThatId) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("Twin") + ObjectXml("Twin") +
                                      "</cc:ObjectCollection>"));
    document->LoadFromStream(stream);
    document->AddPalette("Twins", {document->GetObjectById("Twin")});
    EXPECT_EQ(document->GetPalettes()[1].second.size(), 2u);
}

TEST(CxF3Palette, DescriptionNamesTheGroupOfAllObjects) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    Added(*document, "Red", CxF3ObjectTarget);
    document->SetFileInformationDescription("Fandeck 12");
    EXPECT_EQ(GroupNames(*document), std::vector<std::string>{"Fandeck 12"});
}

TEST(CxF3Palette, PaletteListsObjectsInTheOrderOfItsIds) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> red = Added(*document, "Red", CxF3ObjectTarget);
    boost::shared_ptr<CxF3Object> blue = Added(*document, "Blue", CxF3ObjectTarget);
    document->AddPalette("Cool first", {blue, red});
    EXPECT_EQ(NamesOf(document->GetPalettes()[1].second), (std::vector<std::string>{"Blue", "Red"}));
    // The handles share the document's objects.
    document->GetPalettes()[1].second[0]->SetName("Navy");
    EXPECT_EQ(blue->GetName(), "Navy");
}

TEST(CxF3Palette, PageCountComesFromNumPagesNotFromThePagesPresent) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream(Cxf3Text("", k_one_page_of_two));
    document->LoadFromStream(stream);
    const std::vector<CxF3Palette> &palettes = document->GetWrapper().palettes;
    ASSERT_EQ(palettes.size(), 2u);
    EXPECT_EQ(palettes[0].name, "Reds");
    EXPECT_EQ(palettes[0].objectIds, (std::vector<std::string>{"A", "B"}));
    EXPECT_EQ(palettes[1].name, "");
    EXPECT_TRUE(palettes[1].objectIds.empty());
}

TEST(CxF3Palette, ViewsAreEmptyAlsoForAFileWithAColorPage) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("A") + "</cc:ObjectCollection>",
                                      k_one_page_of_two));
    document->LoadFromStream(stream);
    EXPECT_TRUE(document->GetViews().empty());
    EXPECT_EQ(GroupNames(*document), (std::vector<std::string>{"Object Collection", "Reds"}));
}

class CxF3PaletteFileTest : public ScratchFolderTest {};

TEST_F(CxF3PaletteFileTest, PaletteWithoutIdsCountsInNumPagesButWritesNoPage) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> red = Added(*document, "Red", CxF3ObjectTarget);
    document->AddPalette("Empty", {});
    document->AddPalette("Reds", {red});
    ASSERT_TRUE(document->SaveCxF(PathOf("pages.cxf")));
    const cp::ColorPage &page = *document->GetWrapper().colorPage;
    EXPECT_EQ(page.get_Name(), L"Vantry Palettes");
    EXPECT_EQ(page.get_NumPages(), 2);
    ASSERT_EQ(page.size_Page(), 1u);
    EXPECT_EQ(page.get_Page(0).get_Name(), L"Reds");
    EXPECT_EQ(page.get_Page(0).get_NumRows(), 1);
}

TEST_F(CxF3PaletteFileTest, EachObjectGetsARowOfItsOwn) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> red = Added(*document, "Red", CxF3ObjectTarget);
    boost::shared_ptr<CxF3Object> blue = Added(*document, "Blue", CxF3ObjectTarget);
    document->AddPalette("Both", {red, blue});
    ASSERT_TRUE(document->SaveCxF(PathOf("rows.cxf")));
    const cp::Page &page = document->GetWrapper().colorPage->get_Page(0);
    ASSERT_EQ(page.size_Row(), 2u);
    EXPECT_EQ(page.get_Row(1).get_Name(), L"Row2");
    EXPECT_EQ(page.get_Row(1).get_NumColumns(), 1);
    ASSERT_EQ(page.get_Row(1).size_Obj(), 1u);
    EXPECT_EQ(page.get_Row(1).get_Obj(0).get_Id(), L"O2");
}

TEST_F(CxF3PaletteFileTest, DocumentWithoutPalettesWritesNoColorPage) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    Added(*document, "Red", CxF3ObjectTarget);
    ASSERT_TRUE(document->SaveCxF(PathOf("none.cxf")));
    EXPECT_EQ(ReadFile(PathOf("none.cxf")).find("ColorPage"), std::string::npos);
}

TEST_F(CxF3PaletteFileTest, SavingTwiceLeavesTwoColorPageEntries) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddPalette("Reds", {Added(*document, "Red", CxF3ObjectTarget)});
    ASSERT_TRUE(document->SaveCxF(PathOf("twice.cxf")));
    ASSERT_TRUE(document->SaveCxF(PathOf("twice.cxf")));
    const std::string text = ReadFile(PathOf("twice.cxf"));
    EXPECT_EQ(CountOf(text, "<cp:ColorPage "), 2u);
    // The XML declaration of each entry is cut away.
    EXPECT_EQ(CountOf(text, "<?xml"), 1u);
}

TEST_F(CxF3PaletteFileTest, LoadThenSaveListsEveryPaletteTwiceOnTheNextLoad) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddPalette("Reds", {Added(*document, "Red", CxF3ObjectTarget)});
    ASSERT_TRUE(document->SaveCxF(PathOf("first.cxf")));

    boost::shared_ptr<CxF3> second = CxF3::CreateCxF();
    ASSERT_TRUE(second->LoadCxF(PathOf("first.cxf")));
    EXPECT_EQ(GroupNames(*second), (std::vector<std::string>{"Object Collection", "Reds"}));
    ASSERT_TRUE(second->SaveCxF(PathOf("second.cxf")));

    boost::shared_ptr<CxF3> third = CxF3::CreateCxF();
    ASSERT_TRUE(third->LoadCxF(PathOf("second.cxf")));
    EXPECT_EQ(GroupNames(*third), (std::vector<std::string>{"Object Collection", "Reds", "Reds"}));
}

TEST_F(CxF3PaletteFileTest, WrittenColorPageReadsBackThroughTheBindingAndCompares) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> red = Added(*document, "Red", CxF3ObjectTarget);
    document->AddPalette("Reds", {red});
    document->AddStandardPalette({red});
    ASSERT_TRUE(document->SaveCxF(PathOf("binding.cxf")));

    cc::CxF tree;
    ASSERT_EQ(tree.loadFile(PathOf("binding.cxf").c_str()), lmx::elmx_ok);
    ASSERT_EQ(tree.get_CustomResources().size_inner_CustomResources(), 1u);
    std::string text;
    tree.get_CustomResources().get_inner_CustomResources(0).get_any(nullptr, nullptr, text);
    cp::ColorPage read;
    ASSERT_EQ(read.unmarshal(text.data(), text.size()), lmx::elmx_ok);
    std::string written, reread;
    ASSERT_EQ(document->GetWrapper().colorPage->marshal(written), lmx::elmx_ok);
    ASSERT_EQ(read.marshal(reread), lmx::elmx_ok);
    EXPECT_EQ(reread, written);
}
