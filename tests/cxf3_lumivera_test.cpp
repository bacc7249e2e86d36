// The branded colour library a CxF3 file carries in its custom resources:
// finding it on load, its colours and their getters, the links to the
// document's objects, and who keeps the document alive.
#include "cxf3_test_support.h"

#include <tessarine/CxF3.h>

#include "dll/cxfwrapper/source/cxf3lumiverawrapper.h"
#include "dll/cxfwrapper/source/cxf3wrapper.h"

#include <boost/weak_ptr.hpp>

#include <stdexcept>
#include <string>
#include <vector>

namespace {

const char *const k_library_file = TESSARINE_SOURCE_DIR "/tests/data/lumivera_library.cxf";

typedef std::vector<boost::shared_ptr<CxF3LumiveraColor>> ColorList;

boost::shared_ptr<CxF3> LoadFile(const std::string &ar_path) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->LoadCxF(ar_path)) << ar_path;
    return document;
}

boost::shared_ptr<CxF3> LoadLibraryFile() { return LoadFile(k_library_file); }

// The colours of the test file. The document is gone when they are used:
// they carry all that their getters need.
ColorList LibraryFileColors() {
    const boost::shared_ptr<CxF3LumiveraLibrary> library = LoadLibraryFile()->GetLumiveraLibrary();
    EXPECT_TRUE(library);
    return library ? library->GetColors() : ColorList();
}

// <name attributes>text</name>
std::string Element(const std::string &ar_name, const std::string &ar_attributes, const std::string &ar_text) {
    return "<" + ar_name + " " + ar_attributes + ">" + ar_text + "</" + ar_name + ">";
}

// An LVColor with every child; the five GUID children all hold ar_guid.
std::string ColorXml(const std::string &ar_ref, const std::string &ar_guid) {
    return "<LVColor ref=\"" + ar_ref + "\" Tint=\"100\" Status=\"1\" Revision=\"2\" Code=\"C\">" +
           Element("MasterStandard", "name=\"Master\"", "m") + Element("DependentStandard", "name=\"Dependent\"", "d") +
           Element("Substrate", "name=\"s\"", ar_guid) +
           Element("PrintingCondition", "name=\"p\" type=\"t\"", ar_guid) +
           Element("WorkingStandard", "name=\"w\"", ar_guid) + Element("Finish", "name=\"f\"", ar_guid) +
           Element("WorkflowRestriction", "name=\"r\"", ar_guid) + "</LVColor>";
}

// A library document that lacks its required LVLibrary element.
const char *const k_incomplete_entry =
    "<Lumivera xmlns=\"http://colorexchangeformat.com/CxF3-Lumivera_V1\" version=\"1.0\"/>";

// A library document as a custom resource entry, with its namespace declared on it.
std::string LumiveraXml(const std::string &ar_colors) {
    return "<Lumivera xmlns=\"http://colorexchangeformat.com/CxF3-Lumivera_V1\" version=\"1.0\">"
           "<LVLibrary LVType=\"Library\" name=\"Inline\" Status=\"1\" Revision=\"1\" GUID=\"G\">" +
           ar_colors + "</LVLibrary></Lumivera>";
}

// A file with the objects "A" and "B" and the given custom resource entries.
std::string FileWithEntries(const std::string &ar_entries) {
    return Cxf3Text("<cc:ObjectCollection>" + ObjectXml("A") + ObjectXml("B") + "</cc:ObjectCollection>",
                    "<cc:CustomResources>" + ar_entries + "</cc:CustomResources>");
}

class CxF3LumiveraFile : public ScratchFolderTest {
protected:
    boost::shared_ptr<CxF3> LoadText(const std::string &ar_text) {
        const std::string path = PathOf("library.cxf");
        WriteFile(path, ar_text);
        return LoadFile(path);
    }
};

} // namespace

// ---------------------------------------------------------------- finding the library

TEST(CxF3LumiveraLibrary, TestFileLoadsAndItsEntryReadsAsALibraryDocument) {
    EXPECT_TRUE(CxF3::IsValidFile(k_library_file));
    const boost::shared_ptr<CxF3> document = LoadLibraryFile();
    const cc::CustomResources &entries = *document->GetWrapper().customResources;
    ASSERT_EQ(entries.size_inner_CustomResources(), 1u);
    std::string text;
    entries.get_inner_CustomResources(0).get_any(nullptr, nullptr, text);
    c_Lumivera branded;
    ASSERT_EQ(branded.unmarshal(text.data(), text.size()), 0);
    EXPECT_EQ(branded.get_LVLibrary().size_LVColor(), 3u);
    EXPECT_EQ(document->GetObjects().size(), 3u);
}

TEST_F(CxF3LumiveraFile, FileWithoutTheExtensionHasNoLibrary) {
    EXPECT_FALSE(LoadText(FileWithEntries(""))->GetLumiveraLibrary());
}

TEST(CxF3LumiveraLibrary, NewDocumentHasNoLibrary) { EXPECT_FALSE(CxF3::CreateCxF()->GetLumiveraLibrary()); }

TEST(CxF3LumiveraLibrary, ColorsComeInFileOrder) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[0]->GetMasterStandardName(), "Harbour Blue Master");
    EXPECT_EQ(colors[1]->GetMasterStandardName(), "Ember Red MASTER");
    EXPECT_EQ(colors[2]->GetMasterStandardName(), "Lost Green Master");
}

TEST(CxF3LumiveraLibrary, ColorListIsMadeOnceAndSharedByEveryHandle) {
    const boost::shared_ptr<CxF3> document = LoadLibraryFile();
    const ColorList &first = document->GetLumiveraLibrary()->GetColors();
    const boost::shared_ptr<CxF3LumiveraLibrary> other = document->GetLumiveraLibrary();
    const ColorList &second = other->GetColors();
    EXPECT_EQ(&second, &first);
    EXPECT_EQ(&other->GetColors(), &second);
    ASSERT_EQ(first.size(), 3u);
    EXPECT_EQ(second[0], first[0]);
}

TEST(CxF3LumiveraLibrary, LibraryElementMissingFromTheTreeGivesNoColorsAndIsCreated) {
    const boost::shared_ptr<CxF3Wrapper> owner(new CxF3Wrapper());
    const boost::shared_ptr<c_Lumivera> tree(new c_Lumivera());
    const CxF3LumiveraLibrary library(
        boost::shared_ptr<CxF3LumiveraLibraryImpl>(new CxF3LumiveraLibraryImpl(tree, owner)));
    EXPECT_TRUE(library.GetColors().empty());
    const c_Lumivera &read_only = *tree;
    ASSERT_NE(read_only.get_LVLibrary(), nullptr);
    EXPECT_EQ(read_only.get_LVLibrary()->size_LVColor(), 0u);
}

TEST_F(CxF3LumiveraFile, LastLibraryEntryWins) {
    const boost::shared_ptr<CxF3> document =
        LoadText(FileWithEntries(LumiveraXml(ColorXml("A", "FIRST")) + LumiveraXml(ColorXml("B", "SECOND"))));
    const ColorList &colors = document->GetLumiveraLibrary()->GetColors();
    ASSERT_EQ(colors.size(), 1u);
    EXPECT_EQ(colors[0]->GetSubstrateGUID(), "second");
    EXPECT_EQ(colors[0]->GetObject()->GetId(), "B");
}

TEST_F(CxF3LumiveraFile, EntryWithTheMarkerThatDoesNotParseIsSkipped) {
    const boost::shared_ptr<CxF3> document = LoadText(FileWithEntries(k_incomplete_entry));
    EXPECT_FALSE(document->GetLumiveraLibrary());
    EXPECT_EQ(document->GetObjects().size(), 2u);
    EXPECT_EQ(document->GetWrapper().customResources->size_inner_CustomResources(), 1u);
}

TEST_F(CxF3LumiveraFile, EntriesThatDoNotParseLeaveAnEarlierLibraryInPlace) {
    const std::string mention = "<x:Note xmlns:x=\"urn:example:notes\">see CxF3-Lumivera_V1</x:Note>";
    const boost::shared_ptr<CxF3> document =
        LoadText(FileWithEntries(LumiveraXml(ColorXml("A", "KEPT")) + k_incomplete_entry + mention));
    ASSERT_TRUE(document->GetLumiveraLibrary());
    const ColorList &colors = document->GetLumiveraLibrary()->GetColors();
    ASSERT_EQ(colors.size(), 1u);
    EXPECT_EQ(colors[0]->GetFinishGUID(), "kept");
}

// ---------------------------------------------------------------- colour getters

TEST(CxF3LumiveraColor, FullyPopulatedColorGivesEveryValue) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    const CxF3LumiveraColor &color = *colors[0];
    EXPECT_EQ(color.GetRevision(), 3ul);
    EXPECT_EQ(color.GetMasterStandardName(), "Harbour Blue Master");
    EXPECT_EQ(color.GetDependentStandardName(), "Harbour Blue on Board");
    EXPECT_EQ(color.GetSubstrateGUID(), "5f0e1d2c-3b4a-4968-8776-a5b4c3d2e1f0");
    EXPECT_EQ(color.GetFinishGUID(), "fedcba98-7654-4321-8fed-cba987654321");
    EXPECT_EQ(color.GetPrintingConditionGUID(), "9c8b7a6d-5e4f-4321-abcd-ef0123456789");
    EXPECT_EQ(color.GetWorkflowGUID(), "1a2b3c4d-5e6f-4a7b-8c9d-0e1f2a3b4c5d");
    EXPECT_EQ(color.GetWorkingStandardGUID(), "abcdef01-2345-4678-9abc-def012345678");
}

TEST(CxF3LumiveraColor, UpperCaseGuidsComeBackLowerCase) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[2]->GetSubstrateGUID(), "abababab-cdcd-4efe-8faf-010101010101");
    EXPECT_EQ(colors[2]->GetPrintingConditionGUID(), "c0c0c0c0-d1d1-4e2e-8f3f-a4a4a4a4a4a4");
    EXPECT_EQ(colors[2]->GetWorkingStandardGUID(), "f9f9f9f9-e8e8-4d7d-8c6c-b5b5b5b5b5b5");
    EXPECT_EQ(colors[2]->GetFinishGUID(), "deadbeef-0000-4000-8000-000000000000");
    EXPECT_EQ(colors[2]->GetWorkflowGUID(), "badc0ffe-1111-4222-8333-444444444444");
}

TEST(CxF3LumiveraColor, MixedCaseGuidComesBackLowerCase) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[1]->GetSubstrateGUID(), "0123abcd-ef45-4a67-89ab-cdef01234567");
}

TEST_F(CxF3LumiveraFile, GuidLowerCasingTouchesOnlyAsciiLetters) {
    const boost::shared_ptr<CxF3> document =
        LoadText(FileWithEntries(LumiveraXml(ColorXml("A", u8"\u00C4BC-\u00DC-9_Z"))));
    EXPECT_EQ(document->GetLumiveraLibrary()->GetColors()[0]->GetSubstrateGUID(), u8"\u00C4bc-\u00DC-9_z");
}

TEST(CxF3LumiveraColor, StandardNamesComeBackAsTheyStand) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[1]->GetMasterStandardName(), "Ember Red MASTER");
    EXPECT_EQ(colors[1]->GetDependentStandardName(), "Ember Red (dependent)");
}

TEST(CxF3LumiveraColor, RevisionIsReadAsAnUnsignedNumber) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[1]->GetRevision(), 4000000000ul);
    EXPECT_EQ(colors[2]->GetRevision(), 1ul);
}

TEST(CxF3LumiveraColor, MissingWorkflowRestrictionGivesAnEmptyGuid) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[1]->GetWorkflowGUID(), "");
    EXPECT_EQ(colors[1]->GetFinishGUID(), "00000000-0000-4000-8000-0000000000ff");
}

// ---------------------------------------------------------------- linked objects

TEST(CxF3LumiveraColor, ObjectIsTheOneItsReferenceNames) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    const boost::shared_ptr<CxF3Object> first = colors[0]->GetObject();
    ASSERT_TRUE(first);
    EXPECT_EQ(first->GetId(), "LV-001");
    EXPECT_EQ(first->GetName(), "Harbour Blue");
    EXPECT_EQ(first->GetGUID(), "0F1E2D3C-4B5A-4978-8695-A4B3C2D1E0F9");
    EXPECT_EQ(colors[1]->GetObject()->GetName(), "Ember Red");
    EXPECT_EQ(colors[1]->GetObject()->GetInfo(), "second standard");
}

TEST(CxF3LumiveraColor, ObjectSharesTheDocumentsObject) {
    const boost::shared_ptr<CxF3> document = LoadLibraryFile();
    const boost::shared_ptr<CxF3Object> linked = document->GetLumiveraLibrary()->GetColors()[0]->GetObject();
    EXPECT_EQ(linked->GetInterface()->wrapper, document->GetObjectById("LV-001")->GetInterface()->wrapper);
}

TEST(CxF3LumiveraColor, ReferenceWithoutAnObjectGivesAHandleThatThrowsOnUse) {
    const ColorList colors = LibraryFileColors();
    ASSERT_EQ(colors.size(), 3u);
    const boost::shared_ptr<CxF3Object> missing = colors[2]->GetObject();
    ASSERT_TRUE(missing);
    EXPECT_FALSE(missing->GetInterface()->wrapper);
    EXPECT_THROW(missing->GetName(), std::logic_error);
    EXPECT_THROW(missing->GetId(), std::logic_error);
}

TEST_F(CxF3LumiveraFile, ReferenceMatchesObjectIdsByExactBytes) {
    const boost::shared_ptr<CxF3> document = LoadText(FileWithEntries(LumiveraXml(ColorXml("a", "G"))));
    EXPECT_FALSE(document->GetLumiveraLibrary()->GetColors()[0]->GetObject()->GetInterface()->wrapper);
}

TEST_F(CxF3LumiveraFile, ColorsFindTheirObjectsWhenTheListIsMade) {
    const boost::shared_ptr<CxF3> document = LoadText(FileWithEntries(LumiveraXml(ColorXml("O3", "G"))));
    const boost::shared_ptr<CxF3LumiveraColor> color = document->GetLumiveraLibrary()->GetColors()[0];
    boost::shared_ptr<CxF3Object> added = CxF3Object::CreateCxFObject();
    added->SetName("Added");
    added->SetObjectType(CxF3ObjectTarget);
    ASSERT_TRUE(document->AddObject(added));
    ASSERT_EQ(document->GetObjectById("O3")->GetName(), "Added");
    EXPECT_FALSE(color->GetObject()->GetInterface()->wrapper);
}

// ---------------------------------------------------------------- lifetime

TEST(CxF3LumiveraColor, ColorKeepsItsObjectButNotTheDocument) {
    boost::weak_ptr<CxF3Wrapper> watched;
    boost::shared_ptr<CxF3LumiveraColor> color;
    {
        const boost::shared_ptr<CxF3> document = LoadLibraryFile();
        watched = document->GetWrapper().shared_from_this();
        color = document->GetLumiveraLibrary()->GetColors()[1];
    }
    EXPECT_TRUE(watched.expired());
    EXPECT_EQ(color->GetObject()->GetName(), "Ember Red");
    EXPECT_EQ(color->GetSubstrateGUID(), "0123abcd-ef45-4a67-89ab-cdef01234567");
}

TEST(CxF3LumiveraLibrary, LibraryHandleKeepsTheDocumentAliveUntilItIsGone) {
    boost::weak_ptr<CxF3Wrapper> watched;
    boost::shared_ptr<CxF3LumiveraLibrary> library;
    {
        const boost::shared_ptr<CxF3> document = LoadLibraryFile();
        watched = document->GetWrapper().shared_from_this();
        library = document->GetLumiveraLibrary();
    }
    ASSERT_FALSE(watched.expired());
    const ColorList &colors = library->GetColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[0]->GetObject()->GetName(), "Harbour Blue");
    library.reset();
    EXPECT_TRUE(watched.expired());
}

TEST(CxF3LumiveraLibrary, DocumentIsFreedWhenItsLastHandleIsGone) {
    boost::weak_ptr<CxF3Wrapper> watched;
    {
        const boost::shared_ptr<CxF3> document = LoadLibraryFile();
        watched = document->GetWrapper().shared_from_this();
        const boost::shared_ptr<CxF3LumiveraLibrary> library = document->GetLumiveraLibrary();
        const boost::shared_ptr<CxF3LumiveraColor> color = library->GetColors()[0];
        EXPECT_EQ(color->GetObject()->GetId(), "LV-001");
        EXPECT_FALSE(watched.expired());
    }
    EXPECT_TRUE(watched.expired());
}

// ---------------------------------------------------------------- save and reload

TEST_F(CxF3LumiveraFile, SavedAndReloadedDocumentKeepsTheEntryAndTheLibrary) {
    const std::string path = PathOf("saved.cxf");
    ASSERT_TRUE(LoadLibraryFile()->SaveCxF(path));
    EXPECT_EQ(CountOf(ReadFile(path), "CxF3-Lumivera_V1"), 1u);

    const boost::shared_ptr<CxF3> reloaded = LoadFile(path);
    ASSERT_TRUE(reloaded->GetLumiveraLibrary());
    const ColorList &colors = reloaded->GetLumiveraLibrary()->GetColors();
    ASSERT_EQ(colors.size(), 3u);
    EXPECT_EQ(colors[0]->GetSubstrateGUID(), "5f0e1d2c-3b4a-4968-8776-a5b4c3d2e1f0");
    EXPECT_EQ(colors[1]->GetRevision(), 4000000000ul);
    EXPECT_EQ(colors[0]->GetObject()->GetName(), "Harbour Blue");
    EXPECT_FALSE(colors[2]->GetObject()->GetInterface()->wrapper);
}
