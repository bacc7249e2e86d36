// The CxF3 document: file information, creator, adding and finding objects
// and colour specifications, and the cached lists.
#include "cxf3_test_support.h"

#include <tessarine/tessarine.h>

#include "dll/cxfwrapper/source/cxf3wrapper.h"

#include <sstream>
#include <stdexcept>

namespace {

boost::shared_ptr<CxF3> LoadedFrom(const std::string &ar_text) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream stream(ar_text);
    document->LoadFromStream(stream);
    return document;
}

boost::shared_ptr<CxF3Object> NamedTarget(const std::string &ar_name) {
    boost::shared_ptr<CxF3Object> object = CxF3Object::CreateCxFObject();
    object->SetName(ar_name);
    object->SetObjectType(CxF3ObjectTarget);
    return object;
}

boost::shared_ptr<CxF3ColorSpecification> TypicalSpecification() {
    boost::shared_ptr<CxF3ColorSpecification> specification = CxF3ColorSpecification::CreateCxFColorSpecification();
    specification->SetDeviceName("device");
    specification->SetDeviceSerialNumber("1234");
    specification->SetFilter("M1");
    specification->SetIlluminant("D50");
    specification->SetObserver("2\xC2\xB0");
    return specification;
}

} // namespace

// ---------------------------------------------------------------- file information and creator

TEST(CxF3Document, FileInformationTagThatIsNotThereIsEmpty) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->AddFileInformationTag("Customer", "Acme"));
    EXPECT_EQ(document->GetFileInformationTag("Supplier"), "");
}

TEST(CxF3Document, FirstFileInformationTagOfANameIsFound) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->AddFileInformationTag("Customer", "first"));
    EXPECT_TRUE(document->AddFileInformationTag("Customer", "second"));
    EXPECT_EQ(document->GetFileInformationTag("Customer"), "first");
}

TEST(CxF3Document, FileInformationTagWithEmptyNameAndValueIsAccepted) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->AddFileInformationTag("", ""));
    EXPECT_EQ(document->GetWrapper().fileInformation->size_Tag(), 1u);
}

TEST(CxF3Document, FileInformationTagsKeepUnicode) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->AddFileInformationTag("Farbe \xE8\x89\xB2", "\xF0\x9F\x8E\xA8 rot"));
    EXPECT_EQ(document->GetFileInformationTag("Farbe \xE8\x89\xB2"), "\xF0\x9F\x8E\xA8 rot");
}

TEST(CxF3Document, EmptyCreatorMarksTheElementPresent) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->SetCreator("");
    const cc::FileInformation &information = *document->GetWrapper().fileInformation;
    EXPECT_TRUE(information.isset_Creator());
    EXPECT_EQ(information.get_Creator(), L"");
}

TEST(CxF3Document, SetCreatorTakesEffectAtOnce) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->SetCreator("Colour lab");
    EXPECT_EQ(document->GetWrapper().creator, "Colour lab");
    EXPECT_EQ(document->GetWrapper().fileInformation->get_Creator(), L"Colour lab");
}

TEST(CxF3Document, NewDocumentSetsNothingInItsTree) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    const CxF3Wrapper &wrapper = document->GetWrapper();
    EXPECT_FALSE(wrapper.fileInformation->isset_Creator());
    EXPECT_FALSE(wrapper.fileInformation->isset_CreationDate());
    EXPECT_FALSE(wrapper.root->isset_FileInformation());
    EXPECT_FALSE(wrapper.root->isset_Resources());
}

TEST(CxF3Document, DefaultCreatorReachesDocumentsCreatedAfterwards) {
    boost::shared_ptr<CxF3> before = CxF3::CreateCxF();
    CxF3::SetDefaultCreator("Spectro suite");
    boost::shared_ptr<CxF3> after = CxF3::CreateCxF();
    CxF3::SetDefaultCreator("");
    EXPECT_EQ(before->GetWrapper().creator, "");
    EXPECT_EQ(after->GetWrapper().creator, "Spectro suite");
}

TEST(CxF3Document, DescriptionGoesIntoTheFileInformation) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->SetFileInformationDescription("Spring palette");
    EXPECT_EQ(document->GetWrapper().fileInformation->get_Description(), L"Spring palette");
}

TEST(CxF3Document, HandleKeepsTheDocumentsObjectAliveAfterTheDocumentIsGone) {
    boost::shared_ptr<CxF3Object> handle;
    {
        boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
        ASSERT_TRUE(document->AddObject(NamedTarget("Red")));
        handle = document->GetObjectById("O1");
    }
    EXPECT_EQ(handle->GetName(), "Red");
    handle->SetName("Still here");
    EXPECT_EQ(handle->GetName(), "Still here");
}

// ---------------------------------------------------------------- objects

TEST(CxF3Document, AddObjectNumbersObjectsOverwritingTheCallersId) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> object = NamedTarget("Red");
    object->SetId("X");
    ASSERT_TRUE(document->AddObject(object));
    EXPECT_EQ(object->GetId(), "O1");
    ASSERT_TRUE(document->AddObject(NamedTarget("Green")));
    EXPECT_EQ(document->GetObjectById("O2")->GetName(), "Green");
}

TEST(CxF3Document, AddObjectStampsTheCreationDate) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> object = NamedTarget("Red");
    ASSERT_TRUE(document->AddObject(object));
    const std::string date = object->GetCreationDate();
    ASSERT_EQ(date.size(), 20u) << date;
    EXPECT_EQ(date.back(), 'Z');
}

TEST(CxF3Document, AddObjectRefusesAnObjectWithoutName) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> object = CxF3Object::CreateCxFObject();
    object->SetObjectType(CxF3ObjectTarget);
    EXPECT_FALSE(document->AddObject(object));
    // Id and date were set before the check and stay.
    EXPECT_EQ(object->GetId(), "O1");
    EXPECT_FALSE(object->GetCreationDate().empty());
    EXPECT_TRUE(document->GetObjects().empty());
}

TEST(CxF3Document, NextIdCountsObjectsWithoutLookingForCollisions) {
    boost::shared_ptr<CxF3> document = LoadedFrom(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("O1") +
                                                           ObjectXml("O7") + "</cc:ObjectCollection>"));
    boost::shared_ptr<CxF3Object> object = NamedTarget("New");
    ASSERT_TRUE(document->AddObject(object));
    EXPECT_EQ(object->GetId(), "O3");
}

TEST(CxF3Document, NewObjectTakesOverTheMapEntryOfALoadedId) {
    boost::shared_ptr<CxF3> document = LoadedFrom(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("O3") +
                                                           ObjectXml("O9") + "</cc:ObjectCollection>"));
    ASSERT_TRUE(document->AddObject(NamedTarget("Newcomer")));
    EXPECT_EQ(document->GetObjectById("O3")->GetName(), "Newcomer");
    EXPECT_EQ(document->GetObjects().size(), 3u);
}

TEST(CxF3Document, UnknownObjectIdGivesAHandleThatRefusesUse) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> handle = document->GetObjectById("O42");
    ASSERT_TRUE(handle);
    EXPECT_THROW(handle->GetName(), std::logic_error);
}

TEST(CxF3Document, EmptyObjectListIsRebuiltWhileANonEmptyOneIsKept) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->GetObjects().empty());
    ASSERT_TRUE(document->AddObject(NamedTarget("Red")));
    EXPECT_EQ(document->GetObjects().size(), 1u);
    ASSERT_TRUE(document->AddObject(NamedTarget("Green")));
    EXPECT_EQ(document->GetObjects().size(), 1u);
    EXPECT_EQ(document->GetObjectById("O2")->GetName(), "Green");
}

TEST(CxF3Document, ObjectListIsNotRefreshedByALoad) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(NamedTarget("Red")));
    ASSERT_EQ(document->GetObjects().size(), 1u);
    std::stringstream stream(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("A") + ObjectXml("B") +
                                      "</cc:ObjectCollection>"));
    document->LoadFromStream(stream);
    EXPECT_EQ(document->GetObjects().size(), 1u);
    EXPECT_EQ(document->GetObjects()[0]->GetName(), "Red");
    // The map is not cleared either: the earlier object is still found.
    EXPECT_EQ(document->GetObjectById("O1")->GetName(), "Red");
    EXPECT_EQ(document->GetObjectById("B")->GetName(), "NB");
}

TEST(CxF3Document, RepeatedIdInAFileGivesTheMapToTheLaterObject) {
    std::string later = ObjectXml("Twin");
    later.replace(later.find("NTwin"), 5, "Later");
    boost::shared_ptr<CxF3> document =
        LoadedFrom(Cxf3Text("<cc:ObjectCollection>" + ObjectXml("Twin") + later + "</cc:ObjectCollection>"));
    EXPECT_EQ(document->GetObjects().size(), 2u);
    EXPECT_EQ(document->GetObjectById("Twin")->GetName(), "Later");
}

TEST(CxF3Document, HandlesFromTheDocumentShareTheWrapperWithTheCaller) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Object> mine = NamedTarget("Red");
    ASSERT_TRUE(document->AddObject(mine));
    document->GetObjects()[0]->SetName("Crimson");
    EXPECT_EQ(mine->GetName(), "Crimson");
    EXPECT_EQ(document->GetObjectById("O1")->GetName(), "Crimson");
}

// ---------------------------------------------------------------- colour specifications

TEST(CxF3Document, GeneratedSpecificationIdNamesDeviceConditionIlluminantAndObserver) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_EQ(document->AddColorSpecification(TypicalSpecification(), true), "CSdevice1234M1-VT-D50-2");
}

TEST(CxF3Document, GeneratedIdCarriesCalibrationOtherThanKLMBAndTheStatusMark) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3ColorSpecification> specification = TypicalSpecification();
    specification->SetCalibrationStandard(CxF3CalibrationKLMA, CxF3VerimetraExpired);
    EXPECT_EQ(document->AddColorSpecification(specification, true), "CSdevice1234M1-KLMAVTexpD50-2");

    boost::shared_ptr<CxF3ColorSpecification> active = TypicalSpecification();
    active->SetCalibrationStandard(CxF3CalibrationKLMB, CxF3VerimetraActive);
    active->SetObserver("10");
    EXPECT_EQ(document->AddColorSpecification(active, true), "CSdevice1234M1-VTD50-10");
}

TEST(CxF3Document, SameSpecificationAddedTwiceGivesOneEntryAndOneId) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    const std::string first = document->AddColorSpecification(TypicalSpecification(), true);
    const std::string second = document->AddColorSpecification(TypicalSpecification(), true);
    EXPECT_EQ(first, second);
    EXPECT_EQ(document->GetWrapper().colorSpecifications->size_ColorSpecification(), 1u);
}

TEST(CxF3Document, SpecificationsThatDifferOutsideTheIdCollapseIntoTheFirst) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3ColorSpecification> other = TypicalSpecification();
    other->SetStartWL(400);
    document->AddColorSpecification(TypicalSpecification(), true);
    const std::string id = document->AddColorSpecification(other, true);
    EXPECT_EQ(document->GetColorSpecification(id)->GetStartWL(), 380);
}

TEST(CxF3Document, AddColorSpecificationWithoutGeneratingKeepsTheSpecificationsId) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3ColorSpecification> specification = TypicalSpecification();
    specification->SetId("cs-own");
    EXPECT_EQ(document->AddColorSpecification(specification, false), "cs-own");
    EXPECT_TRUE(document->IsExistingColorSpecification("cs-own"));
    EXPECT_FALSE(document->IsExistingColorSpecification("CS-OWN"));
}

TEST(CxF3Document, GeneratedIdIsWrittenIntoTheCallersSpecification) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3ColorSpecification> specification = TypicalSpecification();
    const std::string id = document->AddColorSpecification(specification, true);
    EXPECT_EQ(specification->GetId(), id);
}

TEST(CxF3Document, GeneratingAnIdThrowsForAnUnsupportedMeasurementType) {
    boost::shared_ptr<CxF3> document = LoadedFrom(Cxf3Text(
        "<cc:ColorSpecificationCollection><cc:ColorSpecification Id=\"em\"><cc:MeasurementSpec>"
        "<cc:MeasurementType>Spectrum_Emissive</cc:MeasurementType><cc:GeometryChoice>"
        "<cc:UnknownGeometry>lamp</cc:UnknownGeometry></cc:GeometryChoice></cc:MeasurementSpec>"
        "</cc:ColorSpecification></cc:ColorSpecificationCollection>"));
    boost::shared_ptr<CxF3ColorSpecification> emissive = document->GetColorSpecification("em");
    EXPECT_THROW(document->AddColorSpecification(emissive, true), std::runtime_error);
    EXPECT_EQ(document->AddColorSpecification(emissive, false), "em");
}

TEST(CxF3Document, ChangesToAFoundSpecificationDoNotReachTheDocument) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    const std::string id = document->AddColorSpecification(TypicalSpecification(), true);
    document->GetColorSpecification(id)->SetStartWL(400);
    EXPECT_EQ(document->GetColorSpecification(id)->GetStartWL(), 380);
}

TEST(CxF3Document, UnknownSpecificationIdGivesAHandleThatRefusesUse) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3ColorSpecification> handle = document->GetColorSpecification("nothing");
    ASSERT_TRUE(handle);
    EXPECT_THROW(handle->GetId(), std::logic_error);
    EXPECT_THROW(document->AddColorSpecification(handle, false), std::logic_error);
}

TEST(CxF3Document, SpecificationListIsFilledOnceAndNotRefreshed) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->GetColorSpecifications().empty());
    document->AddColorSpecification(TypicalSpecification(), true);
    ASSERT_EQ(document->GetColorSpecifications().size(), 1u);
    boost::shared_ptr<CxF3ColorSpecification> second = TypicalSpecification();
    second->SetIlluminant("D65");
    document->AddColorSpecification(second, true);
    EXPECT_EQ(document->GetColorSpecifications().size(), 1u);
    EXPECT_EQ(document->GetWrapper().colorSpecifications->size_ColorSpecification(), 2u);
}
