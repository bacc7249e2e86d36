// A document built through the public classes, saved, and loaded into a new
// document: every value comes back through the getters.
#include "cxf3_test_support.h"

#include <tessarine/tessarine.h>

#include <cxf/v3/cxf3.h>
#include <cxf/v3/cxf3_colorpage.h>
#include <cxf/v3/cxf3_qualitycontrol.h>

#include "dll/cxfwrapper/source/cxf3wrapper.h"

namespace {

std::vector<double> Spectrum(double a_offset) {
    std::vector<double> values;
    for (int index = 0; index < 36; ++index)
        values.push_back(a_offset + 0.02 * index);
    return values;
}

CXFTolerance ToleranceOfMode(int a_mode) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(static_cast<CXFToleranceModusType>(a_mode));
    tolerance.SetV(1.5f, 2.0f, 0.5f, 0.25f, 4.0f, 0.75f);
    return tolerance;
}

boost::shared_ptr<CxF3ColorRecipe> Recipe(const std::string &ar_specification_id) {
    boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetName("Formula 7");
    recipe->SetInfo("Mixed on line 2");
    recipe->SetColorSpecification(ar_specification_id);
    recipe->SetUnits("g");
    recipe->SetProcess("Offset");
    recipe->SetSubstrateType(CxF3SubstratePaper);
    EXPECT_TRUE(recipe->AddColorant("Cyan", false, 12.5, 1.4));
    EXPECT_TRUE(recipe->AddColorant("Varnish", true, 87.5, 0.05));
    EXPECT_TRUE(recipe->AddTag("Assortment", "Process inks"));
    EXPECT_TRUE(recipe->AddTag("Substrate", "Coated board"));
    return recipe;
}

struct Built {
    std::string spectral;
    std::string colorimetric;
};

// Two specifications; one object of each type, the first six, and five more
// targets, so that each of the eleven tolerance modes has an object.
Built Build(CxF3 &ar_document) {
    ar_document.SetCreator("End-to-end test");
    ar_document.SetFileInformationDescription("Every kind of value");
    EXPECT_TRUE(ar_document.AddFileInformationTag("Customer", "Acme Paints"));
    EXPECT_TRUE(ar_document.AddFileInformationTag("Order", "4711"));

    boost::shared_ptr<CxF3ColorSpecification> spectral = CxF3ColorSpecification::CreateCxFColorSpecification();
    spectral->SetDeviceName("Spectro");
    spectral->SetDeviceSerialNumber("SN-1");
    spectral->SetFilter("M1");
    spectral->SetIlluminant("D50");
    spectral->SetObserver("2");
    spectral->SetCalibrationStandard(CxF3CalibrationKLMA, CxF3VerimetraActive);
    boost::shared_ptr<CxF3ColorSpecification> colorimetric = CxF3ColorSpecification::CreateCxFColorSpecification();
    colorimetric->SetFilter("D8e");
    colorimetric->SetIlluminant("D65");
    colorimetric->SetObserver("10");
    colorimetric->SetId("lab-d65");
    Built built{ar_document.AddColorSpecification(spectral, true),
                ar_document.AddColorSpecification(colorimetric, false)};

    const CxF3ObjectType types[] = {CxF3ObjectTarget,   CxF3ObjectTrial,    CxF3ObjectSubstrate,
                                    CxF3ObjectColorant, CxF3ObjectLumivera, CxF3ObjectUnknown};
    for (int index = 0; index < 11; ++index) {
        boost::shared_ptr<CxF3Object> object = CxF3Object::CreateCxFObject();
        object->SetName("Colour " + std::to_string(index));
        object->SetInfo("Batch " + std::to_string(index));
        object->SetGUID("guid-" + std::to_string(index));
        if (index < 6 && types[index] == CxF3ObjectLumivera)
            EXPECT_TRUE(object->AddLumiveraStandard("LV-GUID-4", 3));
        else
            object->SetObjectType(index < 6 ? types[index] : CxF3ObjectTarget);
        EXPECT_TRUE(object->AddReflectanceSpectrum(Spectrum(0.1 + 0.01 * index), built.spectral, "M1 spectrum"));
        EXPECT_TRUE(object->AddColorCIELab({50.0 + index, -3.5, 12.25}, built.colorimetric, "Lab"));
        EXPECT_TRUE(object->AddColorRecipe(Recipe(built.spectral)));
        EXPECT_TRUE(object->AddTolerance(ToleranceOfMode(index), built.colorimetric));
        EXPECT_TRUE(object->AddTag("Tags", "Job", "J-" + std::to_string(index)));
        EXPECT_TRUE(object->AddTag("Tags", "Shift", "night"));
        EXPECT_TRUE(object->AddTag("Press", "Speed", "12000"));
        EXPECT_TRUE(object->AddThickness(0.125, "mm"));
        EXPECT_TRUE(object->AddSubstrateType(index % 2 == 0));
        EXPECT_TRUE(ar_document.AddObject(object));
    }
    return built;
}

// What GetTolerance gives back for a tolerance written in each mode: the
// modes whose elements cannot tell them apart come back as the default.
CXFTolerance ExpectedTolerance(int a_mode) {
    CXFTolerance expected;
    switch (a_mode) {
    case 0:
    case 2:
    case 5:
        expected.SetToleranceModus(static_cast<CXFToleranceModusType>(a_mode));
        expected.SetV0(1.5f);
        break;
    case 3:
        expected.SetToleranceModus(T_CMC);
        expected.SetV(1.5f, 2.0f, 1.0f, 0.0f, 0.0f, 0.0f);
        break;
    case 6:
    case 10:
        expected.SetToleranceModus(static_cast<CXFToleranceModusType>(a_mode));
        expected.SetV(1.5f, 2.0f, 1.0f, 1.0f, 0.0f, 0.0f);
        break;
    case 7:
        expected.SetToleranceModus(T_D);
        expected.SetV(4.0f, 4.0f, 4.0f, 4.0f, 4.0f, 0.0f);
        break;
    default:
        break;
    }
    return expected;
}

void ExpectSameTolerance(const CXFTolerance &ar_actual, const CXFTolerance &ar_expected, int a_mode) {
    EXPECT_EQ(ar_actual.GetToleranceModus(), ar_expected.GetToleranceModus()) << "mode " << a_mode;
    for (unsigned short index = 0; index < 6; ++index)
        EXPECT_FLOAT_EQ(ar_actual[index], ar_expected[index]) << "mode " << a_mode << " V" << index;
}

} // namespace

class CxF3EndToEndTest : public ScratchFolderTest {};

TEST_F(CxF3EndToEndTest, EveryValueComesBackAfterSaveAndLoad) {
    boost::shared_ptr<CxF3> original = CxF3::CreateCxF();
    const Built built = Build(*original);
    ASSERT_TRUE(original->SaveCxF(PathOf("everything.cxf")));

    ASSERT_TRUE(CxF3::IsValidFile(PathOf("everything.cxf")));
    boost::shared_ptr<CxF3> loaded = CxF3::CreateCxF();
    ASSERT_TRUE(loaded->LoadCxF(PathOf("everything.cxf")));

    EXPECT_EQ(loaded->GetFileInformationTag("Customer"), "Acme Paints");
    EXPECT_EQ(loaded->GetFileInformationTag("Order"), "4711");
    EXPECT_EQ(built.spectral, "CSSpectroSN-1M1-KLMAVTD50-2");

    const std::vector<boost::shared_ptr<CxF3ColorSpecification>> specifications = loaded->GetColorSpecifications();
    ASSERT_EQ(specifications.size(), 2u);
    boost::shared_ptr<CxF3ColorSpecification> spectral = loaded->GetColorSpecification(built.spectral);
    EXPECT_EQ(spectral->GetDeviceName(), "Spectro");
    EXPECT_EQ(spectral->GetDeviceSerialNumber(), "SN-1");
    EXPECT_EQ(spectral->GetFilter(), "M1");
    EXPECT_EQ(spectral->GetIlluminant(), "D50");
    EXPECT_EQ(spectral->GetObserver(), "2\xC2\xB0");
    EXPECT_EQ(spectral->GetCalibrationStandard(), CxF3CalibrationKLMA);
    EXPECT_EQ(spectral->GetVerimetraStatus(), CxF3VerimetraActive);
    EXPECT_EQ(spectral->GetMeasurementType(), CxF3MeasurementSpectral);
    EXPECT_EQ(spectral->GetStartWL(), 380);
    EXPECT_EQ(spectral->GetWLIncrement(), 10);
    boost::shared_ptr<CxF3ColorSpecification> colorimetric = loaded->GetColorSpecification("lab-d65");
    EXPECT_EQ(colorimetric->GetFilter(), "D8e");
    EXPECT_EQ(colorimetric->GetIlluminant(), "D65");
    EXPECT_EQ(colorimetric->GetObserver(), "10\xC2\xB0");

    const std::vector<boost::shared_ptr<CxF3Object>> &objects = loaded->GetObjects();
    ASSERT_EQ(objects.size(), 11u);
    const CxF3ObjectType types[] = {CxF3ObjectTarget,   CxF3ObjectTrial,    CxF3ObjectSubstrate,
                                    CxF3ObjectColorant, CxF3ObjectLumivera, CxF3ObjectUnknown};
    for (int index = 0; index < 11; ++index) {
        SCOPED_TRACE("object " + std::to_string(index));
        const CxF3Object &object = *objects[static_cast<std::size_t>(index)];
        EXPECT_EQ(object.GetId(), "O" + std::to_string(index + 1));
        EXPECT_EQ(object.GetName(), "Colour " + std::to_string(index));
        EXPECT_EQ(object.GetInfo(), "Batch " + std::to_string(index));
        EXPECT_EQ(object.GetObjectType(), index < 6 ? types[index] : CxF3ObjectTarget);
        EXPECT_EQ(object.GetGUID(), index == 4 ? "LV-GUID-4" : "guid-" + std::to_string(index));
        EXPECT_EQ(object.GetCreationDate().size(), 20u);

        EXPECT_EQ(object.GetReflectanceColorSpecificationIds(), std::vector<std::string>{built.spectral});
        const std::vector<double> reflectance = object.GetReflectance(spectral);
        const std::vector<double> expected = Spectrum(0.1 + 0.01 * index);
        ASSERT_EQ(reflectance.size(), 36u);
        for (std::size_t point = 0; point < 36; ++point)
            EXPECT_NEAR(reflectance[point], expected[point], 1e-12);

        EXPECT_TRUE(object.HasLab("lab-d65"));
        EXPECT_EQ(object.GetLab("lab-d65"), (std::vector<double>{50.0 + index, -3.5, 12.25}));
        EXPECT_EQ(object.GetLabColorSpecificationId(), "lab-d65");

        EXPECT_EQ(object.GetRecipeColorSpecificationId(), built.spectral);
        boost::shared_ptr<CxF3ColorRecipe> recipe = object.GetRecipe(built.spectral);
        EXPECT_EQ(recipe->GetName(), "Formula 7");
        EXPECT_EQ(recipe->GetInfo(), "Mixed on line 2");
        EXPECT_EQ(recipe->GetUnits(), "g");
        EXPECT_EQ(recipe->GetProcess(), "Offset");
        EXPECT_EQ(recipe->GetSubstrateType(), CxF3SubstratePaper);
        ASSERT_EQ(recipe->GetColorantCount(), 2u);
        EXPECT_EQ(recipe->GetColorantName(0), "Cyan");
        EXPECT_FALSE(recipe->IsColorantBase(0));
        EXPECT_DOUBLE_EQ(recipe->GetColorantAmount(0), 12.5);
        EXPECT_DOUBLE_EQ(recipe->GetColorantDensity(0), 1.4);
        EXPECT_EQ(recipe->GetColorantName(1), "Varnish");
        EXPECT_TRUE(recipe->IsColorantBase(1));
        EXPECT_EQ(object.GetAssortmentName(), "Process inks");
        EXPECT_EQ(object.GetSubstrateName(), "Coated board");

        ExpectSameTolerance(object.GetTolerance(), ExpectedTolerance(index), index);

        EXPECT_EQ(object.GetTag("Tags", "Job"), "J-" + std::to_string(index));
        EXPECT_EQ(object.GetTag("Tags", "Shift"), "night");
        EXPECT_EQ(object.GetTag("Press", "Speed"), "12000");
        EXPECT_EQ(object.GetSubstrateType(), index % 2 == 0 ? CxF3SubstrateFilm : CxF3SubstratePaper);
        EXPECT_TRUE(object.IsValid());
    }
}

TEST_F(CxF3EndToEndTest, SavedFileSurvivesASecondRoundUnchanged) {
    boost::shared_ptr<CxF3> original = CxF3::CreateCxF();
    Build(*original);
    ASSERT_TRUE(original->SaveCxF(PathOf("first.cxf")));
    boost::shared_ptr<CxF3> loaded = CxF3::CreateCxF();
    ASSERT_TRUE(loaded->LoadCxF(PathOf("first.cxf")));
    // The creator is the saving document's own, not the loaded one.
    loaded->SetCreator("End-to-end test");
    ASSERT_TRUE(loaded->SaveCxF(PathOf("second.cxf")));

    // Only the time stamp of the file differs, and a loaded document always
    // has a custom resources element, empty here.
    std::string first = ReadFile(PathOf("first.cxf"));
    std::string second = ReadFile(PathOf("second.cxf"));
    const std::string date_tag = "<cc:CreationDate>";
    const std::size_t at = first.find(date_tag);
    ASSERT_NE(at, std::string::npos);
    first.replace(at + date_tag.size(), 20, 20, '#');
    second.replace(second.find(date_tag) + date_tag.size(), 20, 20, '#');
    const std::string empty_custom_resources = "\t<cc:CustomResources/>\n";
    const std::size_t custom = second.find(empty_custom_resources);
    ASSERT_NE(custom, std::string::npos);
    second.erase(custom, empty_custom_resources.size());
    EXPECT_TRUE(first == second);
}

namespace {

template <typename T> std::string Marshalled(const T &ar_document) {
    std::string text;
    EXPECT_EQ(ar_document.marshal(text), lmx::elmx_ok);
    return text;
}

// The captured text of each custom resource entry of a file read through the binding.
std::vector<std::string> CustomResourceTexts(const std::string &ar_path) {
    cc::CxF tree;
    EXPECT_EQ(tree.loadFile(ar_path.c_str()), lmx::elmx_ok);
    std::vector<std::string> texts;
    const cc::CustomResources &resources = tree.get_CustomResources();
    for (std::size_t index = 0; index < resources.size_inner_CustomResources(); ++index) {
        std::string text;
        resources.get_inner_CustomResources(index).get_any(nullptr, nullptr, text);
        texts.push_back(text);
    }
    return texts;
}

} // namespace

TEST_F(CxF3EndToEndTest, PalettesAndJobsReadBackThroughTheBindingAndCompare) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    Build(*document);
    document->AddStandardPalette(document->GetObjects());
    document->AddTrialPalette(document->GetObjects());
    document->AddPalette("Firsts", {document->GetObjectById("O3"), document->GetObjectById("O1")});
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->SetName("Approval");
    const CXFTolerance tolerance = ToleranceOfMode(T_DE2000);
    job->AddSerie("O1", "Approval", &tolerance, "lab-d65", {"O2"});
    document->AddOstraJob(job);
    ASSERT_TRUE(document->SaveCxF(PathOf("extensions.cxf")));

    const std::vector<std::string> texts = CustomResourceTexts(PathOf("extensions.cxf"));
    ASSERT_EQ(texts.size(), 2u);
    cp::ColorPage page;
    ASSERT_EQ(page.unmarshal(texts[0].data(), texts[0].size()), lmx::elmx_ok);
    EXPECT_EQ(Marshalled(page), Marshalled(*document->GetWrapper().colorPage));
    qc::c_QualityControl quality;
    ASSERT_EQ(quality.unmarshal(texts[1].data(), texts[1].size()), lmx::elmx_ok);
    EXPECT_EQ(Marshalled(quality), Marshalled(*document->GetWrapper().qualityControl));

    boost::shared_ptr<CxF3> loaded = CxF3::CreateCxF();
    ASSERT_TRUE(loaded->LoadCxF(PathOf("extensions.cxf")));
    std::vector<std::string> names;
    for (const auto &group : loaded->GetPalettes())
        names.push_back(group.first + ":" + std::to_string(group.second.size()));
    EXPECT_EQ(names, (std::vector<std::string>{"Every kind of value:11", "Targets:6", "Trials:1", "Firsts:2"}));
    ASSERT_EQ(loaded->GetJobs().size(), 1u);
    EXPECT_EQ(loaded->GetJobs()[0]->GetName(), "Approval");
    EXPECT_EQ(loaded->GetJobs()[0]->GetSampleIds(0), std::vector<std::string>{"O2"});
    EXPECT_EQ(loaded->GetJobs()[0]->GetTolerance(0).GetToleranceModus(), T_DE2000);
}
