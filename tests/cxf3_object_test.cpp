// CxF3Object: names and types, measured values and their resampling, recipes,
// tags, physical attributes, tolerances, and the wrapper that carries them
// into the cc::Object.
#include <tessarine/CxF3Object.h>

#include "dll/cxfwrapper/source/cxf3colorrecipewrapper.h"
#include "dll/cxfwrapper/source/cxf3colorspecificationwrapper.h"
#include "dll/cxfwrapper/source/cxf3objectwrapper.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

typedef boost::shared_ptr<CxF3Object> ObjectPtr;

ObjectPtr NewObject() { return CxF3Object::CreateCxFObject(); }

CxF3ObjectWrapper &WrapperOf(const ObjectPtr &ar_object) { return *ar_object->GetInterface()->wrapper; }

// A handle on a wrapper made from a loaded cc::Object.
ObjectPtr LoadedObject(const cc::Object &ar_object) {
    boost::shared_ptr<CxF3ObjectWrapper> wrapper(new CxF3ObjectWrapper(ar_object));
    return ObjectPtr(new CxF3Object(boost::shared_ptr<CxF3ObjectInterface>(new CxF3ObjectInterface(wrapper))));
}

boost::shared_ptr<CxF3ColorSpecification> Specification(const std::string &ar_id, int a_start, int a_increment) {
    boost::shared_ptr<CxF3ColorSpecification> specification = CxF3ColorSpecification::CreateCxFColorSpecification();
    specification->SetId(ar_id);
    specification->SetStartWL(a_start);
    specification->SetWLIncrement(a_increment);
    return specification;
}

// a_count values that tell their index: 0.1, 0.11, 0.12, ...
std::vector<double> Ramp(std::size_t a_count) {
    std::vector<double> values;
    for (std::size_t index = 0; index < a_count; ++index)
        values.push_back(0.1 + 0.01 * static_cast<double>(index));
    return values;
}

// The wavelength of a point of the 36-point result.
std::size_t GridIndex(int a_wavelength) { return static_cast<std::size_t>((a_wavelength - 380) / 10); }

// The text of the std::runtime_error that GetReflectance throws; "" when it
// throws none.
std::string ResamplingError(const ObjectPtr &ar_object,
                            const boost::shared_ptr<CxF3ColorSpecification> &ar_specification) {
    try {
        ar_object->GetReflectance(ar_specification);
    } catch (const std::runtime_error &r_error) {
        return r_error.what();
    }
    return "";
}

// A recipe complete enough to be added: units, name, date and one colorant.
boost::shared_ptr<CxF3ColorRecipe> Recipe(const std::string &ar_name, const std::string &ar_specification_id) {
    boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetName(ar_name);
    recipe->SetUnits("%");
    recipe->SetColorSpecification(ar_specification_id);
    recipe->AddColorant("Cyan", false, 12.5, 1.4);
    return recipe;
}

CXFTolerance Tolerance(CXFToleranceModusType a_mode, float a_v0, float a_v1, float a_v2, float a_v3, float a_v4,
                       float a_v5) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(a_mode);
    tolerance.SetV(a_v0, a_v1, a_v2, a_v3, a_v4, a_v5);
    return tolerance;
}

void ExpectValues(const CXFTolerance &ar_tolerance, CXFToleranceModusType a_mode, const std::vector<float> &ar_v) {
    EXPECT_EQ(a_mode, ar_tolerance.GetToleranceModus());
    for (unsigned short index = 0; index < 6; ++index)
        EXPECT_FLOAT_EQ(ar_v[index], ar_tolerance[index]) << "V" << index;
}

void ExpectDefaultTolerance(const CXFTolerance &ar_tolerance) {
    ExpectValues(ar_tolerance, T_DE, {3.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f});
}

// The colour difference an object holds at a_index.
const cc::inner_ColorDifferenceValues &Difference(const ObjectPtr &ar_object, std::size_t a_index) {
    const cc::ColorDifferenceValues &r_values = *WrapperOf(ar_object).colorDifferenceValues;
    return r_values.get_inner_ColorDifferenceValues(a_index);
}

// An object whose only colour difference is a_delta, as a file gives it.
ObjectPtr ObjectWithDelta(const cc::DeltaCIELab &ar_delta) {
    cc::Object object;
    object.get_ColorDifferenceValues().append_inner_ColorDifferenceValues().assign_DeltaCIELab(ar_delta);
    return LoadedObject(object);
}

ObjectPtr ObjectWithCustomDelta(const std::wstring &ar_name, std::size_t a_value_count) {
    cc::Object object;
    cc::DeltaCustom &r_delta =
        object.get_ColorDifferenceValues().append_inner_ColorDifferenceValues().get_DeltaCustom();
    r_delta.set_Name(ar_name);
    for (std::size_t index = 0; index < a_value_count; ++index) {
        cc::CustomDeltaType &r_value = r_delta.append_DeltaValue();
        r_value.set_Label(L"value");
        r_value.set_value(1.5 + static_cast<double>(index));
    }
    return LoadedObject(object);
}

} // namespace

// ---------------------------------------------------------------- handles

TEST(CxF3Object, NewObjectHasNothingSet) {
    const ObjectPtr object = NewObject();
    ASSERT_TRUE(object);
    EXPECT_EQ("", object->GetName());
    EXPECT_EQ("", object->GetInfo());
    EXPECT_EQ("", object->GetId());
    EXPECT_EQ("", object->GetGUID());
    EXPECT_EQ("", object->GetCxFObjectType());
    EXPECT_EQ(CxF3ObjectUnknown, object->GetObjectType());
    EXPECT_TRUE(object->IsValid());
    EXPECT_EQ("", object->GetErrorInfo());
    EXPECT_EQ(CxF3SubstrateNone, object->GetSubstrateType());
    EXPECT_TRUE(object->GetPhysicalProperties().empty());
    EXPECT_TRUE(object->GetReflectanceColorSpecificationIds().empty());
    EXPECT_EQ("", object->GetLabColorSpecificationId());
    EXPECT_EQ("", object->GetRecipeColorSpecificationId());
    EXPECT_EQ("", object->GetAssortmentName());
    EXPECT_EQ("", object->GetSubstrateName());
    ExpectDefaultTolerance(object->GetTolerance());
}

TEST(CxF3Object, NewWrapperHasEmptyCollections) {
    const CxF3ObjectWrapper wrapper;
    ASSERT_TRUE(wrapper.object && wrapper.colorValues && wrapper.colorDifferenceValues &&
                wrapper.deviceColorValues && wrapper.physicalAttributes);
    EXPECT_EQ(0u, wrapper.colorValues->size_inner_ColorValues());
    EXPECT_EQ(0u, wrapper.colorDifferenceValues->size_inner_ColorDifferenceValues());
    EXPECT_EQ(0u, wrapper.deviceColorValues->size_inner_DeviceColorValues());
    EXPECT_TRUE(wrapper.tagCollections.empty());
    EXPECT_EQ("", wrapper.errorInfo);
}

TEST(CxF3Object, TagNamesAreSampleTypeAndPaperType) {
    EXPECT_EQ("SampleType", CxF3Object::GetSampleTypeTag());
    EXPECT_EQ("PaperType", CxF3Object::GetPaperTypeTag());
    EXPECT_EQ(&CxF3Object::GetSampleTypeTag(), &CxF3Object::GetSampleTypeTag());
    EXPECT_EQ(&CxF3Object::GetPaperTypeTag(), &CxF3Object::GetPaperTypeTag());
}

TEST(CxF3Object, HandleWithoutWrapperThrowsLogicError) {
    const boost::shared_ptr<CxF3ObjectInterface> nothing(
        new CxF3ObjectInterface(boost::shared_ptr<CxF3ObjectWrapper>()));
    CxF3Object object(nothing);
    EXPECT_THROW(object.GetName(), std::logic_error);
    EXPECT_THROW(object.SetName("x"), std::logic_error);
    EXPECT_THROW(object.IsValid(), std::logic_error);
    EXPECT_THROW(object.GetErrorInfo(), std::logic_error);
    EXPECT_THROW(object.AddTag("c", "n", "v"), std::logic_error);
    EXPECT_THROW(object.GetTolerance(), std::logic_error);
    EXPECT_THROW(object.GetReflectance(Specification("S", 380, 10)), std::logic_error);
}

TEST(CxF3Object, HandleWithoutInterfaceThrowsLogicError) {
    CxF3Object object((boost::shared_ptr<CxF3ObjectInterface>()));
    EXPECT_THROW(object.GetId(), std::logic_error);
    EXPECT_THROW(object.SetId(3), std::logic_error);
    EXPECT_THROW(object.HasLab("S"), std::logic_error);
}

TEST(CxF3Object, TwoHandlesOnOneInterfaceShareTheObject) {
    const ObjectPtr first = NewObject();
    CxF3Object second(first->GetInterface());
    second.SetName("Shared");
    EXPECT_EQ("Shared", first->GetName());
}

TEST(CxF3Object, HandleKeepsItsWrapperAlive) {
    boost::shared_ptr<CxF3ObjectInterface> body;
    {
        const ObjectPtr object = NewObject();
        object->SetName("Kept");
        body = object->GetInterface();
    }
    EXPECT_EQ("Kept", CxF3Object(body).GetName());
}

// ---------------------------------------------------------------- names, ids, dates

TEST(CxF3Object, NameInfoAndGuidAreStoredInTheObject) {
    const ObjectPtr object = NewObject();
    object->SetName("Red 12");
    object->SetInfo("from the lab");
    object->SetGUID("8d2c7a1e-0000-4000-8000-1234567890ab");
    const cc::Object &r_stored = *WrapperOf(object).object;
    EXPECT_EQ(L"Red 12", r_stored.get_Name());
    EXPECT_EQ(L"from the lab", r_stored.get_Comment());
    EXPECT_EQ(L"8d2c7a1e-0000-4000-8000-1234567890ab", r_stored.get_GUID());
    EXPECT_EQ("Red 12", object->GetName());
    EXPECT_EQ("from the lab", object->GetInfo());
    EXPECT_EQ("8d2c7a1e-0000-4000-8000-1234567890ab", object->GetGUID());
}

TEST(CxF3Object, TextCrossesAsUtf8AndUtf16) {
    const ObjectPtr object = NewObject();
    object->SetName("Gr\xC3\xBCn 2\xC2\xB0");
    EXPECT_EQ(L"Gr\u00FCn 2\u00B0", WrapperOf(object).object->get_Name());
    EXPECT_EQ("Gr\xC3\xBCn 2\xC2\xB0", object->GetName());
}

TEST(CxF3Object, TextEndsAtItsFirstNul) {
    const ObjectPtr object = NewObject();
    object->SetName(std::string("ab\0cd", 5));
    EXPECT_EQ("ab", object->GetName());
}

TEST(CxF3Object, SetIdStoresTheText) {
    const ObjectPtr object = NewObject();
    object->SetId("X");
    EXPECT_EQ(L"X", WrapperOf(object).object->get_Id());
    EXPECT_EQ("X", object->GetId());
}

TEST(CxF3Object, SetIdWithNumberWritesItsDecimalText) {
    const ObjectPtr object = NewObject();
    object->SetId(42);
    EXPECT_EQ("42", object->GetId());
    object->SetId(-7);
    EXPECT_EQ("-7", object->GetId());
}

TEST(CxF3Object, CreationDateRoundTripsInDateTimeForm) {
    const ObjectPtr object = NewObject();
    object->SetCreationDate("2026-11-24T10:15:00Z");
    EXPECT_EQ("2026-11-24T10:15:00Z", object->GetCreationDate());
    EXPECT_EQ(2026, WrapperOf(object).object->get_CreationDate().get_year());
    object->SetCreationDate("2025-01-02T03:04:05.5+01:00");
    EXPECT_EQ("2025-01-02T03:04:05.5+01:00", object->GetCreationDate());
}

// ---------------------------------------------------------------- object type

TEST(CxF3Object, SetObjectTypeWritesItsWord) {
    const ObjectPtr object = NewObject();
    const std::map<int, std::string> words = {{0, "Target"}, {1, "Trial"}, {2, "Substrate"}, {3, "Colorant"},
                                              {4, "Unknown"}, {5, "Unknown"}, {17, "Unknown"}, {-1, "Unknown"}};
    for (const auto &r_entry : words) {
        object->SetObjectType(static_cast<CxF3ObjectType>(r_entry.first));
        EXPECT_EQ(r_entry.second, object->GetCxFObjectType()) << "type " << r_entry.first;
    }
}

TEST(CxF3Object, SetObjectTypeLumiveraWritesUnknown) {
    const ObjectPtr object = NewObject();
    object->SetObjectType(CxF3ObjectLumivera);
    EXPECT_EQ("Unknown", object->GetCxFObjectType());
    EXPECT_EQ(CxF3ObjectUnknown, object->GetObjectType());
}

TEST(CxF3Object, GetObjectTypeReadsEveryWord) {
    const ObjectPtr object = NewObject();
    const std::map<std::wstring, CxF3ObjectType> types = {
        {L"Target", CxF3ObjectTarget},       {L"Standard", CxF3ObjectTarget}, {L"Trial", CxF3ObjectTrial},
        {L"Sample", CxF3ObjectTrial},        {L"Substrate", CxF3ObjectSubstrate},
        {L"Colorant", CxF3ObjectColorant},   {L"Lumivera", CxF3ObjectLumivera},
        {L"Unknown", CxF3ObjectUnknown},     {L"target", CxF3ObjectUnknown},
        {L"Target ", CxF3ObjectUnknown},     {L"", CxF3ObjectUnknown}};
    for (const auto &r_entry : types) {
        WrapperOf(object).object->set_ObjectType(r_entry.first);
        EXPECT_EQ(r_entry.second, object->GetObjectType());
    }
}

TEST(CxF3Object, StandardReadsAsTargetAndKeepsItsText) {
    cc::Object loaded;
    loaded.set_ObjectType(L"Standard");
    const ObjectPtr object = LoadedObject(loaded);
    EXPECT_EQ(CxF3ObjectTarget, object->GetObjectType());
    EXPECT_EQ("Standard", object->GetCxFObjectType());
}

TEST(CxF3Object, SampleReadsAsTrialAndKeepsItsText) {
    cc::Object loaded;
    loaded.set_ObjectType(L"Sample");
    const ObjectPtr object = LoadedObject(loaded);
    EXPECT_EQ(CxF3ObjectTrial, object->GetObjectType());
    EXPECT_EQ("Sample", object->GetCxFObjectType());
}

TEST(CxF3Object, AddLumiveraStandardSetsTypeAndGuidOnly) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddLumiveraStandard("guid-1", 7));
    EXPECT_EQ(CxF3ObjectLumivera, object->GetObjectType());
    EXPECT_EQ("Lumivera", object->GetCxFObjectType());
    EXPECT_EQ("guid-1", object->GetGUID());
    EXPECT_EQ("", object->GetName());
    EXPECT_EQ("", object->GetInfo());
}

// ---------------------------------------------------------------- substrate and thickness

TEST(CxF3Object, AddSubstrateTypeFilmStoresFilm) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddSubstrateType(true));
    const cc::PhysicalAttributes &r_attributes = *WrapperOf(object).physicalAttributes;
    ASSERT_NE(nullptr, r_attributes.get_SubstrateType());
    EXPECT_EQ(L"Film", r_attributes.get_SubstrateType()->get_value());
    EXPECT_EQ(CxF3SubstrateFilm, object->GetSubstrateType());
}

TEST(CxF3Object, AddSubstrateTypePaperStoresPaper) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddSubstrateType(false));
    const cc::PhysicalAttributes &r_attributes = *WrapperOf(object).physicalAttributes;
    ASSERT_NE(nullptr, r_attributes.get_SubstrateType());
    EXPECT_EQ(L"Paper", r_attributes.get_SubstrateType()->get_value());
    EXPECT_EQ(CxF3SubstratePaper, object->GetSubstrateType());
}

TEST(CxF3Object, AddSubstrateTypeReplacesTheFormerOne) {
    const ObjectPtr object = NewObject();
    object->AddSubstrateType(true);
    object->AddSubstrateType(false);
    EXPECT_EQ(CxF3SubstratePaper, object->GetSubstrateType());
}

TEST(CxF3Object, EverySubstrateKindButFilmReadsAsPaper) {
    const ObjectPtr object = NewObject();
    for (const wchar_t *p_kind : {L"Leather", L"Metal", L"Textile", L"Other", L"Paper", L"film", L""}) {
        WrapperOf(object).physicalAttributes->get_SubstrateType().set_value(p_kind);
        EXPECT_EQ(CxF3SubstratePaper, object->GetSubstrateType());
    }
    WrapperOf(object).physicalAttributes->get_SubstrateType().set_value(L"Film");
    EXPECT_EQ(CxF3SubstrateFilm, object->GetSubstrateType());
}

TEST(CxF3Object, NoSubstrateTypeReadsNone) {
    const ObjectPtr object = NewObject();
    object->AddThickness(0.1, "mm");
    EXPECT_EQ(CxF3SubstrateNone, object->GetSubstrateType());
}

TEST(CxF3Object, AddThicknessReplacesTheFormerOne) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddThickness(0.1, "mm"));
    EXPECT_TRUE(object->AddThickness(120.0, "um"));
    const cc::PhysicalAttributes &r_attributes = *WrapperOf(object).physicalAttributes;
    ASSERT_NE(nullptr, r_attributes.get_Thickness());
    EXPECT_DOUBLE_EQ(120.0, r_attributes.get_Thickness()->get_value());
    EXPECT_EQ(L"um", r_attributes.get_Thickness()->get_Units());
}

// ---------------------------------------------------------------- physical properties

TEST(CxF3Object, GetPhysicalPropertiesGroupsCustomAttributesByName) {
    cc::Object loaded;
    cc::PhysicalAttributes &r_attributes = loaded.get_PhysicalAttributes();
    const std::pair<const wchar_t *, const wchar_t *> strings[] = {
        {L"Finish", L"high"}, {L"Batch", L"B7"}, {L"Finish", L"low"}};
    for (const auto &r_string : strings) {
        cc::CustomAttributeString &r_attribute = r_attributes.append_CustomAttributeString();
        r_attribute.set_Label(r_string.first);
        r_attribute.set_value(r_string.second);
    }
    cc::CustomAttributeValue &r_weight = r_attributes.append_CustomAttributeValue();
    r_weight.set_Label(L"Weight");
    r_weight.set_value(80.5);
    cc::CustomAttributeValue &r_batch = r_attributes.append_CustomAttributeValue();
    r_batch.set_Label(L"Batch");
    r_batch.set_value(2.0);

    const ObjectPtr object = LoadedObject(loaded);
    const std::map<std::string, std::vector<std::string>> expected = {
        {"Batch", {"B7", "2"}}, {"Finish", {"high", "low"}}, {"Weight", {"80.5"}}};
    EXPECT_EQ(expected, object->GetPhysicalProperties());
    EXPECT_EQ((std::vector<std::string>{"high", "low"}), object->GetPhysicalProperties("Finish"));
    EXPECT_EQ((std::vector<std::string>{"80.5"}), object->GetPhysicalProperties("Weight"));
}

TEST(CxF3Object, GetPhysicalPropertiesOfUnknownNameIsEmpty) {
    cc::Object loaded;
    cc::CustomAttributeString &r_attribute = loaded.get_PhysicalAttributes().append_CustomAttributeString();
    r_attribute.set_Label(L"Finish");
    r_attribute.set_value(L"high");
    const ObjectPtr object = LoadedObject(loaded);
    EXPECT_TRUE(object->GetPhysicalProperties("finish").empty());
    EXPECT_TRUE(NewObject()->GetPhysicalProperties("Finish").empty());
}

// ---------------------------------------------------------------- reflectance spectra

TEST(CxF3Object, AddReflectanceSpectrumStoresASpectrumFrom380) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddReflectanceSpectrum({0.1, 0.2, 0.3}, "S1", "measured"));
    const cc::ColorValues &r_values = *WrapperOf(object).colorValues;
    ASSERT_EQ(1u, r_values.size_inner_ColorValues());
    const cc::ReflectanceSpectrum *p_spectrum = r_values.get_inner_ColorValues(0).get_ReflectanceSpectrum();
    ASSERT_NE(nullptr, p_spectrum);
    EXPECT_EQ(L"S1", p_spectrum->get_ColorSpecification());
    EXPECT_EQ(L"measured", p_spectrum->get_Name());
    EXPECT_TRUE(p_spectrum->isset_StartWL());
    EXPECT_EQ(380, p_spectrum->get_StartWL());
    ASSERT_EQ(3u, p_spectrum->size_value());
    EXPECT_DOUBLE_EQ(0.1, p_spectrum->get_value(0));
    EXPECT_DOUBLE_EQ(0.3, p_spectrum->get_value(2));
    EXPECT_TRUE(object->IsValid());
}

TEST(CxF3Object, ReflectanceOutsideRangeIsKeptAndMarksTheObjectInvalid) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddReflectanceSpectrum({0.5, 2.5, -0.2, 0.4}, "S1", ""));
    EXPECT_FALSE(object->IsValid());
    EXPECT_EQ("Invalid reflectance value(s)", object->GetErrorInfo());
    const cc::ReflectanceSpectrum *p_spectrum =
        static_cast<const cc::ColorValues &>(*WrapperOf(object).colorValues)
            .get_inner_ColorValues(0)
            .get_ReflectanceSpectrum();
    ASSERT_NE(nullptr, p_spectrum);
    ASSERT_EQ(4u, p_spectrum->size_value());
    EXPECT_DOUBLE_EQ(2.5, p_spectrum->get_value(1));
    EXPECT_DOUBLE_EQ(-0.2, p_spectrum->get_value(2));
}

TEST(CxF3Object, ReflectanceRangeLimitsAreValid) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddReflectanceSpectrum({-0.1, 2.0}, "S1", ""));
    EXPECT_TRUE(object->IsValid());
}

TEST(CxF3Object, EmptySpectrumIsRefused) {
    const ObjectPtr object = NewObject();
    EXPECT_FALSE(object->AddReflectanceSpectrum({}, "S1", "none"));
    EXPECT_EQ(0u, WrapperOf(object).colorValues->size_inner_ColorValues());
}

TEST(CxF3Object, ReflectanceSpecificationIdsComeInOrder) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum({0.1}, "A", "");
    object->AddColorCIELab({50.0, 1.0, 2.0}, "L", "");
    object->AddReflectanceSpectrum({0.1}, "B", "");
    object->AddReflectanceSpectrum({0.1}, "A", "");
    EXPECT_EQ((std::vector<std::string>{"A", "B", "A"}), object->GetReflectanceColorSpecificationIds());
}

// ---------------------------------------------------------------- resampling

TEST(CxF3Object, SpectrumFrom400RepeatsEdgeValues) {
    const ObjectPtr object = NewObject();
    const std::vector<double> values = Ramp(31);
    object->AddReflectanceSpectrum(values, "S", "");
    // The spectrum's own start (380) is not read: the specification's is.
    const std::vector<double> grid = object->GetReflectance(Specification("S", 400, 10));
    ASSERT_EQ(36u, grid.size());
    EXPECT_DOUBLE_EQ(values.front(), grid[GridIndex(380)]);
    EXPECT_DOUBLE_EQ(values.front(), grid[GridIndex(390)]);
    for (std::size_t index = 0; index < values.size(); ++index)
        EXPECT_DOUBLE_EQ(values[index], grid[index + 2]) << "index " << index;
    EXPECT_DOUBLE_EQ(values.back(), grid[GridIndex(710)]);
    EXPECT_DOUBLE_EQ(values.back(), grid[GridIndex(720)]);
    EXPECT_DOUBLE_EQ(values.back(), grid[GridIndex(730)]);
}

TEST(CxF3Object, SpectrumFrom380ComesBackValueForValue) {
    const ObjectPtr object = NewObject();
    const std::vector<double> values = Ramp(36);
    object->AddReflectanceSpectrum(values, "S", "");
    EXPECT_EQ(values, object->GetReflectance(Specification("S", 380, 10)));
}

TEST(CxF3Object, ThirtyValuesAreNotUsable) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(30), "S", "");
    EXPECT_TRUE(object->GetReflectance(Specification("S", 400, 10)).empty());
}

TEST(CxF3Object, SpectrumFrom360EndingAt660Throws) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(31), "S", ""); // 360 .. 660
    EXPECT_EQ("Unsupported spectrum size (wavelength 670nm not found)",
              ResamplingError(object, Specification("S", 360, 10)));
}

TEST(CxF3Object, SpectrumWithIncrement20IsPassedOver) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(36), "S", "");
    EXPECT_TRUE(object->GetReflectance(Specification("S", 380, 20)).empty());
    EXPECT_TRUE(object->GetReflectance(Specification("S", 380, 5)).empty());
}

TEST(CxF3Object, SpectrumStartingOutside360To400IsPassedOver) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(40), "S", "");
    EXPECT_TRUE(object->GetReflectance(Specification("S", 350, 10)).empty());
    EXPECT_TRUE(object->GetReflectance(Specification("S", 410, 10)).empty());
}

TEST(CxF3Object, SpecificationWithoutRangeFindsNoSpectrum) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(36), "S", "");
    cc::ColorSpecification bare;
    bare.set_Id(L"S");
    const boost::shared_ptr<CxF3ColorSpecification> specification(
        new CxF3ColorSpecificationInterface(boost::shared_ptr<CxF3ColorSpecificationWrapper>(
            new CxF3ColorSpecificationWrapper(bare))));
    EXPECT_TRUE(object->GetReflectance(specification).empty());
}

TEST(CxF3Object, SpectrumFrom390RepeatsItsFirstValueAt380) {
    const ObjectPtr object = NewObject();
    const std::vector<double> values = Ramp(35); // 390 .. 730
    object->AddReflectanceSpectrum(values, "S", "");
    const std::vector<double> grid = object->GetReflectance(Specification("S", 390, 10));
    ASSERT_EQ(36u, grid.size());
    EXPECT_DOUBLE_EQ(values[0], grid[GridIndex(380)]);
    for (std::size_t index = 0; index < values.size(); ++index)
        EXPECT_DOUBLE_EQ(values[index], grid[index + 1]) << "index " << index;
}

TEST(CxF3Object, SpectrumFrom360LeavesOutWavelengthsBelow380AndAbove730) {
    const ObjectPtr object = NewObject();
    const std::vector<double> values = Ramp(41); // 360 .. 760
    object->AddReflectanceSpectrum(values, "S", "");
    const std::vector<double> grid = object->GetReflectance(Specification("S", 360, 10));
    ASSERT_EQ(36u, grid.size());
    for (std::size_t index = 0; index < grid.size(); ++index)
        EXPECT_DOUBLE_EQ(values[index + 2], grid[index]) << "index " << index;
}

TEST(CxF3Object, SpectrumEndingAt710RepeatsItsLastValue) {
    const ObjectPtr object = NewObject();
    const std::vector<double> values = Ramp(34); // 380 .. 710
    object->AddReflectanceSpectrum(values, "S", "");
    const std::vector<double> grid = object->GetReflectance(Specification("S", 380, 10));
    ASSERT_EQ(36u, grid.size());
    EXPECT_DOUBLE_EQ(values[33], grid[GridIndex(710)]);
    EXPECT_DOUBLE_EQ(values[33], grid[GridIndex(720)]);
    EXPECT_DOUBLE_EQ(values[33], grid[GridIndex(730)]);
}

TEST(CxF3Object, SpectrumFrom370EndingAt690Throws) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(33), "S", ""); // 370 .. 690
    EXPECT_EQ("Unsupported spectrum size (wavelength 700nm not found)",
              ResamplingError(object, Specification("S", 370, 10)));
}

TEST(CxF3Object, UnusableSpectrumIsSkippedForTheNextOne) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(36), "Other", "");
    object->AddReflectanceSpectrum(Ramp(30), "S", "");
    std::vector<double> usable(36, 0.5);
    object->AddReflectanceSpectrum(usable, "S", "");
    EXPECT_EQ(usable, object->GetReflectance(Specification("S", 380, 10)));
}

TEST(CxF3Object, FirstUsableSpectrumOfTheSpecificationWins) {
    const ObjectPtr object = NewObject();
    const std::vector<double> first(36, 0.25);
    object->AddReflectanceSpectrum(first, "S", "");
    object->AddReflectanceSpectrum(std::vector<double>(36, 0.75), "S", "");
    EXPECT_EQ(first, object->GetReflectance(Specification("S", 380, 10)));
}

TEST(CxF3Object, SpectrumOfAnotherSpecificationIsNotFound) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum(Ramp(36), "B", "");
    object->AddColorCIELab({50.0, 0.0, 0.0}, "A", "");
    EXPECT_TRUE(object->GetReflectance(Specification("A", 380, 10)).empty());
    EXPECT_TRUE(NewObject()->GetReflectance(Specification("A", 380, 10)).empty());
}

TEST(CxF3Object, GetReflectanceWithoutSpecificationThrowsLogicError) {
    EXPECT_THROW(NewObject()->GetReflectance(boost::shared_ptr<CxF3ColorSpecification>()), std::logic_error);
}

// ---------------------------------------------------------------- Lab values

TEST(CxF3Object, AddColorCIELabStoresTheFirstThreeValues) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddColorCIELab({52.5, -3.25, 17.0, 99.0}, "D50", "mean"));
    const cc::ColorCIELab *p_lab =
        static_cast<const cc::ColorValues &>(*WrapperOf(object).colorValues).get_inner_ColorValues(0).get_ColorCIELab();
    ASSERT_NE(nullptr, p_lab);
    EXPECT_EQ(L"D50", p_lab->get_ColorSpecification());
    EXPECT_EQ(L"mean", p_lab->get_Name());
    EXPECT_DOUBLE_EQ(52.5, p_lab->get_L());
    EXPECT_DOUBLE_EQ(-3.25, p_lab->get_A());
    EXPECT_DOUBLE_EQ(17.0, p_lab->get_B());
    EXPECT_TRUE(object->IsValid());
}

TEST(CxF3Object, LabWithLightness111IsKeptAndMarksTheObjectInvalid) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddColorCIELab({111.0, 0.0, 0.0}, "S", ""));
    EXPECT_FALSE(object->IsValid());
    EXPECT_EQ("Invalid Lab value", object->GetErrorInfo());
    EXPECT_EQ((std::vector<double>{111.0, 0.0, 0.0}), object->GetLab("S"));
}

TEST(CxF3Object, LightnessLimitsAreValidAndAAndBAreNotChecked) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddColorCIELab({-0.1, 500.0, -500.0}, "S", ""));
    EXPECT_TRUE(object->AddColorCIELab({110.0, 0.0, 0.0}, "S", ""));
    EXPECT_TRUE(object->IsValid());
    EXPECT_TRUE(object->AddColorCIELab({-0.2, 0.0, 0.0}, "S", ""));
    EXPECT_FALSE(object->IsValid());
}

TEST(CxF3Object, LabOfFewerThanThreeValuesIsRefused) {
    const ObjectPtr object = NewObject();
    EXPECT_FALSE(object->AddColorCIELab({50.0, 1.0}, "S", ""));
    EXPECT_EQ(0u, WrapperOf(object).colorValues->size_inner_ColorValues());
    EXPECT_TRUE(object->IsValid());
}

TEST(CxF3Object, ErrorInfoIsNeverCleared) {
    const ObjectPtr object = NewObject();
    object->AddColorCIELab({120.0, 0.0, 0.0}, "S", "");
    object->AddColorCIELab({50.0, 0.0, 0.0}, "S", "");
    object->AddReflectanceSpectrum({0.5}, "S", "");
    EXPECT_FALSE(object->IsValid());
    EXPECT_EQ("Invalid Lab value", object->GetErrorInfo());
    // The text is that of the last check that failed.
    object->AddReflectanceSpectrum({3.0}, "S", "");
    EXPECT_EQ("Invalid reflectance value(s)", object->GetErrorInfo());
    object->AddColorCIELab({50.0, 0.0, 0.0}, "S", "");
    EXPECT_EQ("Invalid reflectance value(s)", object->GetErrorInfo());
}

TEST(CxF3Object, HasLabFindsALabOfTheSpecification) {
    const ObjectPtr object = NewObject();
    EXPECT_FALSE(object->HasLab("S"));
    object->AddReflectanceSpectrum({0.5}, "S", "");
    EXPECT_FALSE(object->HasLab("S"));
    object->AddColorCIELab({50.0, 0.0, 0.0}, "A", "");
    object->AddColorCIELab({60.0, 0.0, 0.0}, "S", "");
    object->AddColorCIELab({70.0, 0.0, 0.0}, "S", "");
    EXPECT_TRUE(object->HasLab("S"));
    EXPECT_TRUE(object->HasLab("A"));
    EXPECT_FALSE(object->HasLab("s"));
}

TEST(CxF3Object, GetLabGivesTheLastLabOfTheSpecification) {
    const ObjectPtr object = NewObject();
    object->AddColorCIELab({60.0, 1.0, 2.0}, "S", "");
    object->AddColorCIELab({10.0, 0.0, 0.0}, "A", "");
    object->AddColorCIELab({70.0, 3.0, 4.0}, "S", "");
    object->AddColorCIELab({20.0, 0.0, 0.0}, "A", "");
    EXPECT_EQ((std::vector<double>{70.0, 3.0, 4.0}), object->GetLab("S"));
}

TEST(CxF3Object, GetLabWithoutMatchGivesZeros) {
    const ObjectPtr object = NewObject();
    EXPECT_EQ((std::vector<double>{0.0, 0.0, 0.0}), object->GetLab("S"));
    object->AddColorCIELab({60.0, 1.0, 2.0}, "A", "");
    EXPECT_EQ((std::vector<double>{0.0, 0.0, 0.0}), object->GetLab("S"));
}

TEST(CxF3Object, LabSpecificationIdIsThatOfTheFirstLab) {
    const ObjectPtr object = NewObject();
    object->AddReflectanceSpectrum({0.5}, "R", "");
    object->AddColorCIELab({60.0, 1.0, 2.0}, "L1", "");
    object->AddColorCIELab({60.0, 1.0, 2.0}, "L2", "");
    EXPECT_EQ("L1", object->GetLabColorSpecificationId());
}

// ---------------------------------------------------------------- recipes

TEST(CxF3Object, AddColorRecipeStoresEachRecipeInAnItemOfItsOwn) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddColorRecipe(Recipe("first", "A")));
    EXPECT_TRUE(object->AddColorRecipe(Recipe("second", "B")));
    const cc::DeviceColorValues &r_values = *WrapperOf(object).deviceColorValues;
    ASSERT_EQ(2u, r_values.size_inner_DeviceColorValues());
    for (std::size_t index = 0; index < 2; ++index)
        EXPECT_EQ(1u, r_values.get_inner_DeviceColorValues(index).size_ColorRecipe());
    EXPECT_EQ(L"second", r_values.get_inner_DeviceColorValues(1).get_ColorRecipe(0).get_Name());
}

TEST(CxF3Object, AddColorRecipeStoresACopy) {
    const ObjectPtr object = NewObject();
    const boost::shared_ptr<CxF3ColorRecipe> recipe = Recipe("first", "A");
    object->AddColorRecipe(recipe);
    recipe->SetName("changed");
    EXPECT_EQ("first", object->GetRecipe("A")->GetName());
}

TEST(CxF3Object, IncompleteRecipeIsRefused) {
    const ObjectPtr object = NewObject();
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetName("no colorant");
    recipe->SetUnits("%");
    EXPECT_FALSE(object->AddColorRecipe(recipe));
    EXPECT_FALSE(object->AddColorRecipe(boost::shared_ptr<CxF3ColorRecipe>()));
    EXPECT_EQ(0u, WrapperOf(object).deviceColorValues->size_inner_DeviceColorValues());
}

TEST(CxF3Object, GetRecipeGivesACopyOfTheMatchingRecipe) {
    const ObjectPtr object = NewObject();
    object->AddColorRecipe(Recipe("first", "A"));
    object->AddColorRecipe(Recipe("second", "B"));
    const boost::shared_ptr<CxF3ColorRecipe> found = object->GetRecipe("B");
    ASSERT_TRUE(found);
    EXPECT_EQ("second", found->GetName());
    EXPECT_EQ("Cyan", found->GetColorantName(0));
    EXPECT_DOUBLE_EQ(12.5, found->GetColorantAmount(0));
    found->SetName("changed");
    EXPECT_EQ("second", object->GetRecipe("B")->GetName());
}

TEST(CxF3Object, GetRecipeOfUnknownSpecificationRefersToNoRecipe) {
    const ObjectPtr object = NewObject();
    object->AddColorRecipe(Recipe("first", "A"));
    const boost::shared_ptr<CxF3ColorRecipe> found = object->GetRecipe("Z");
    ASSERT_TRUE(found);
    EXPECT_THROW(found->GetName(), std::logic_error);
    EXPECT_THROW(object->AddColorRecipe(found), std::logic_error);
}

TEST(CxF3Object, GetRecipeLooksAtTheFirstRecipeOfEachItemOnly) {
    cc::Object loaded;
    cc::inner_DeviceColorValues &r_item = loaded.get_DeviceColorValues().append_inner_DeviceColorValues();
    for (const wchar_t *p_specification : {L"A", L"B"}) {
        cc::ColorRecipe &r_recipe = r_item.append_ColorRecipe();
        r_recipe.set_Name(p_specification);
        r_recipe.set_ColorSpecification(p_specification);
    }
    const ObjectPtr object = LoadedObject(loaded);
    EXPECT_EQ("A", object->GetRecipe("A")->GetName());
    EXPECT_THROW(object->GetRecipe("B")->GetName(), std::logic_error);
}

TEST(CxF3Object, RecipeSpecificationIdIsThatOfTheFirstRecipe) {
    cc::Object loaded;
    loaded.get_DeviceColorValues().append_inner_DeviceColorValues().append_ColorCMYK();
    const ObjectPtr object = LoadedObject(loaded);
    EXPECT_EQ("", object->GetRecipeColorSpecificationId());
    object->AddColorRecipe(Recipe("first", "A"));
    object->AddColorRecipe(Recipe("second", "B"));
    EXPECT_EQ("A", object->GetRecipeColorSpecificationId());
}

TEST(CxF3Object, AssortmentAndSubstrateNamesAreTagsOfTheFirstRecipe) {
    const ObjectPtr object = NewObject();
    const boost::shared_ptr<CxF3ColorRecipe> first = Recipe("first", "A");
    first->AddTag("Assortment", "Fan deck 3");
    first->AddTag("Substrate", "Gloss paper");
    first->AddTag("Assortment", "Fan deck 4");
    const boost::shared_ptr<CxF3ColorRecipe> second = Recipe("second", "B");
    second->AddTag("Assortment", "Other deck");
    object->AddColorRecipe(first);
    object->AddColorRecipe(second);
    EXPECT_EQ("Fan deck 3", object->GetAssortmentName());
    EXPECT_EQ("Gloss paper", object->GetSubstrateName());
}

TEST(CxF3Object, AssortmentAndSubstrateNamesAreEmptyWithoutTags) {
    const ObjectPtr object = NewObject();
    object->AddColorRecipe(Recipe("first", ""));
    EXPECT_EQ("", object->GetAssortmentName());
    EXPECT_EQ("", object->GetSubstrateName());
}

// ---------------------------------------------------------------- tags

TEST(CxF3Object, GetTagWithoutTagsIsEmpty) {
    const ObjectPtr object = NewObject();
    EXPECT_EQ("", object->GetTag("Info", "Batch"));
}

TEST(CxF3Object, AddTagMakesTheCollectionAndFindsTheTag) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddTag("Info", "Batch", "B7"));
    EXPECT_EQ("B7", object->GetTag("Info", "Batch"));
    const CxF3ObjectWrapper &r_wrapper = WrapperOf(object);
    ASSERT_EQ(1u, r_wrapper.tagCollections.size());
    EXPECT_EQ(L"Info", r_wrapper.tagCollections[0]->get_Name());
    ASSERT_EQ(1u, r_wrapper.tagCollections[0]->size_Tag());
    EXPECT_EQ(L"Batch", r_wrapper.tagCollections[0]->get_Tag(0).get_Name());
    EXPECT_EQ(L"B7", r_wrapper.tagCollections[0]->get_Tag(0).get_Value());
}

TEST(CxF3Object, AddTagReusesACollectionOfThatName) {
    const ObjectPtr object = NewObject();
    object->AddTag("Info", "Batch", "B7");
    object->AddTag("Print", CxF3Object::GetPaperTypeTag(), "coated");
    object->AddTag("Info", "Line", "3");
    const CxF3ObjectWrapper &r_wrapper = WrapperOf(object);
    ASSERT_EQ(2u, r_wrapper.tagCollections.size());
    EXPECT_EQ(2u, r_wrapper.tagCollections[0]->size_Tag());
    EXPECT_EQ(1u, r_wrapper.tagCollections[1]->size_Tag());
    EXPECT_EQ("3", object->GetTag("Info", "Line"));
    EXPECT_EQ("coated", object->GetTag("Print", "PaperType"));
}

TEST(CxF3Object, GetTagGivesTheFirstTagOfThatName) {
    const ObjectPtr object = NewObject();
    object->AddTag("Info", "Batch", "B7");
    object->AddTag("Info", "Batch", "B8");
    EXPECT_EQ("B7", object->GetTag("Info", "Batch"));
}

TEST(CxF3Object, GetTagOfUnknownCollectionOrNameIsEmpty) {
    const ObjectPtr object = NewObject();
    object->AddTag("Info", "Batch", "B7");
    EXPECT_EQ("", object->GetTag("Other", "Batch"));
    EXPECT_EQ("", object->GetTag("Info", "batch"));
}

TEST(CxF3Object, EmptyTagTextsAreAccepted) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddTag("", "", ""));
    EXPECT_EQ(1u, WrapperOf(object).tagCollections.size());
    EXPECT_EQ("", object->GetTag("", ""));
}

// ---------------------------------------------------------------- tolerances written

TEST(CxF3Object, ToleranceDeltaEIsWrittenAsDE) {
    const ObjectPtr object = NewObject();
    object->SetId("O5");
    EXPECT_TRUE(object->AddTolerance(Tolerance(T_DE, 2.5f, 0, 0, 0, 0, 0), "D50"));
    const cc::DeltaCIELab *p_delta = Difference(object, 0).get_DeltaCIELab();
    ASSERT_NE(nullptr, p_delta);
    EXPECT_EQ(L"CIELAB", p_delta->get_Name());
    EXPECT_EQ(L"D50", p_delta->get_ColorSpecification());
    EXPECT_EQ(L"O5", p_delta->get_StandardRef());
    ASSERT_TRUE(p_delta->isset_dE());
    EXPECT_DOUBLE_EQ(2.5, p_delta->get_dE());
    EXPECT_FALSE(p_delta->isset_dL());
    ExpectValues(object->GetTolerance(), T_DE, {2.5f, 0, 0, 0, 0, 0});
}

TEST(CxF3Object, ToleranceBoxesWriteDLOnlyAndDoNotComeBack) {
    for (CXFToleranceModusType mode : {T_LAB, T_CIE_dLCH_Elliptical}) {
        const ObjectPtr object = NewObject();
        EXPECT_TRUE(object->AddTolerance(Tolerance(mode, 1.0f, 2.0f, 3.0f, 4.0f, 5.0f, 6.0f), "S"));
        const cc::DeltaCIELab *p_delta = Difference(object, 0).get_DeltaCIELab();
        ASSERT_NE(nullptr, p_delta) << "mode " << mode;
        ASSERT_TRUE(p_delta->isset_dL());
        EXPECT_DOUBLE_EQ(1.0, p_delta->get_dL());
        EXPECT_FALSE(p_delta->isset_dA() || p_delta->isset_dB() || p_delta->isset_dC() || p_delta->isset_dH() ||
                     p_delta->isset_dE());
        ExpectDefaultTolerance(object->GetTolerance());
    }
    const ObjectPtr object = NewObject();
    object->AddTolerance(Tolerance(T_CIE_dLCH_Elliptical, 1.0f, 2.0f, 3.0f, 0, 0, 0), "S");
    EXPECT_EQ(L"CIELAB LCH", Difference(object, 0).get_DeltaCIELab()->get_Name());
}

TEST(CxF3Object, ToleranceCMCIsWrittenAsDEcmcAndReadBack) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddTolerance(Tolerance(T_CMC, 1.2f, 2.0f, 1.0f, 0, 0, 0), "S"));
    const cc::DeltaCIELab *p_delta = Difference(object, 0).get_DeltaCIELab();
    ASSERT_NE(nullptr, p_delta);
    EXPECT_EQ(L"CMC 2 : 1", p_delta->get_Name());
    ASSERT_NE(nullptr, p_delta->get_dEcmc());
    EXPECT_DOUBLE_EQ(static_cast<double>(1.2f), p_delta->get_dEcmc()->get_value());
    EXPECT_DOUBLE_EQ(2.0, p_delta->get_dEcmc()->get_LRatio());
    ExpectValues(object->GetTolerance(), T_CMC, {1.2f, 2.0f, 1.0f, 0, 0, 0});
}

TEST(CxF3Object, ToleranceDE94IsWrittenAsDE94AndReadBackWithUnitWeights) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddTolerance(Tolerance(T_DE94, 1.5f, 1.0f, 0.045f, 0.015f, 0, 0), "S"));
    const cc::DeltaCIELab *p_delta = Difference(object, 0).get_DeltaCIELab();
    ASSERT_NE(nullptr, p_delta);
    EXPECT_EQ(L"dE* 94 (1 : 0.045 : 0.015)", p_delta->get_Name());
    ASSERT_NE(nullptr, p_delta->get_dE94());
    EXPECT_DOUBLE_EQ(1.5, p_delta->get_dE94()->get_value());
    EXPECT_DOUBLE_EQ(1.0, p_delta->get_dE94()->get_LRatio());
    ExpectValues(object->GetTolerance(), T_DE94, {1.5f, 1.0f, 1.0f, 1.0f, 0, 0});
}

TEST(CxF3Object, ToleranceDE2000IsWrittenAsDE2000AndReadBackWithUnitWeights) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddTolerance(Tolerance(T_DE2000, 0.8f, 2.0f, 0.5f, 0.25f, 0, 0), "S"));
    const cc::DeltaCIELab *p_delta = Difference(object, 0).get_DeltaCIELab();
    ASSERT_NE(nullptr, p_delta);
    EXPECT_EQ(L"dE 2000 (2 : 0.5 : 0.25)", p_delta->get_Name());
    ASSERT_NE(nullptr, p_delta->get_dE2000());
    EXPECT_DOUBLE_EQ(static_cast<double>(0.8f), p_delta->get_dE2000()->get_value());
    EXPECT_DOUBLE_EQ(2.0, p_delta->get_dE2000()->get_LRatio());
    ExpectValues(object->GetTolerance(), T_DE2000, {0.8f, 2.0f, 1.0f, 1.0f, 0, 0});
}

TEST(CxF3Object, SingleValueCustomTolerancesAreNamedByTheirKeyword) {
    const struct {
        CXFToleranceModusType mode;
        const wchar_t *name;
        const wchar_t *label;
    } cases[] = {{T_FMC, L"T_FMC", L"dE_FMC"}, {T_DEMG, L"T_DEMG", L"dEmg"}};
    for (const auto &r_case : cases) {
        const ObjectPtr object = NewObject();
        object->SetId("O2");
        EXPECT_TRUE(object->AddTolerance(Tolerance(r_case.mode, 2.5f, 7.0f, 8.0f, 9.0f, 10.0f, 11.0f), "S"));
        const cc::DeltaCustom *p_delta = Difference(object, 0).get_DeltaCustom();
        ASSERT_NE(nullptr, p_delta) << "mode " << r_case.mode;
        EXPECT_EQ(r_case.name, p_delta->get_Name());
        EXPECT_EQ(L"S", p_delta->get_ColorSpecification());
        EXPECT_EQ(L"O2", p_delta->get_StandardRef());
        ASSERT_EQ(1u, p_delta->size_DeltaValue());
        EXPECT_EQ(r_case.label, p_delta->get_DeltaValue(0).get_Label());
        EXPECT_DOUBLE_EQ(2.5, p_delta->get_DeltaValue(0).get_value());
        ExpectValues(object->GetTolerance(), r_case.mode, {2.5f, 0, 0, 0, 0, 0});
    }
}

TEST(CxF3Object, DensityToleranceWritesV4AndReadsItIntoV0ToV4) {
    const ObjectPtr object = NewObject();
    EXPECT_TRUE(object->AddTolerance(Tolerance(T_D, 1.0f, 2.0f, 3.0f, 4.0f, 0.15f, 6.0f), "S"));
    const cc::DeltaCustom *p_delta = Difference(object, 0).get_DeltaCustom();
    ASSERT_NE(nullptr, p_delta);
    EXPECT_EQ(L"T_D", p_delta->get_Name());
    ASSERT_EQ(1u, p_delta->size_DeltaValue());
    EXPECT_EQ(L"dDensity", p_delta->get_DeltaValue(0).get_Label());
    EXPECT_DOUBLE_EQ(static_cast<double>(0.15f), p_delta->get_DeltaValue(0).get_value());
    ExpectValues(object->GetTolerance(), T_D, {0.15f, 0.15f, 0.15f, 0.15f, 0.15f, 0.0f});
}

TEST(CxF3Object, MgBoxTolerancesAreWrittenAsThreeDeltasAndDoNotComeBack) {
    const struct {
        CXFToleranceModusType mode;
        const wchar_t *name;
        std::vector<const wchar_t *> labels;
    } cases[] = {{T_LABMG, L"T_LABMG", {L"dLmg", L"damg", L"dbmg"}},
                 {T_LCHmg_Elliptical, L"T_LCHmg_Elliptical", {L"dLmg", L"dCmg", L"dHmg"}}};
    for (const auto &r_case : cases) {
        const ObjectPtr object = NewObject();
        EXPECT_TRUE(object->AddTolerance(Tolerance(r_case.mode, 1.0f, 2.0f, 3.0f, 4.0f, 5.0f, 6.0f), "S"));
        const cc::DeltaCustom *p_delta = Difference(object, 0).get_DeltaCustom();
        ASSERT_NE(nullptr, p_delta) << "mode " << r_case.mode;
        EXPECT_EQ(r_case.name, p_delta->get_Name());
        ASSERT_EQ(3u, p_delta->size_DeltaValue());
        for (std::size_t index = 0; index < 3; ++index) {
            EXPECT_EQ(r_case.labels[index], p_delta->get_DeltaValue(index).get_Label());
            EXPECT_DOUBLE_EQ(static_cast<double>(index + 1), p_delta->get_DeltaValue(index).get_value());
        }
        ExpectDefaultTolerance(object->GetTolerance());
    }
}

TEST(CxF3Object, ToleranceOfUnknownModeIsRefused) {
    const ObjectPtr object = NewObject();
    EXPECT_FALSE(object->AddTolerance(Tolerance(static_cast<CXFToleranceModusType>(11), 1, 0, 0, 0, 0, 0), "S"));
    EXPECT_EQ(0u, WrapperOf(object).colorDifferenceValues->size_inner_ColorDifferenceValues());
}

TEST(CxF3Object, GetToleranceReadsTheFirstDifferenceOnly) {
    const ObjectPtr object = NewObject();
    object->AddTolerance(Tolerance(T_DE, 1.0f, 0, 0, 0, 0, 0), "S");
    object->AddTolerance(Tolerance(T_CMC, 2.0f, 2.0f, 1.0f, 0, 0, 0), "S");
    EXPECT_EQ(2u, WrapperOf(object).colorDifferenceValues->size_inner_ColorDifferenceValues());
    ExpectValues(object->GetTolerance(), T_DE, {1.0f, 0, 0, 0, 0, 0});
}

// ---------------------------------------------------------------- tolerances read from files

TEST(CxF3Object, FileDeltaLabBoxReadsAsLabMode) {
    cc::DeltaCIELab delta;
    delta.set_dL(1.0);
    delta.set_dA(2.0);
    delta.set_dB(3.0);
    ExpectValues(ObjectWithDelta(delta)->GetTolerance(), T_LAB, {1.0f, 2.0f, 3.0f, 1.0f, 2.0f, 3.0f});
}

TEST(CxF3Object, FileDeltaLChBoxReadsAsLChMode) {
    cc::DeltaCIELab delta;
    delta.set_dL(1.0);
    delta.set_dC(2.0);
    delta.set_dH(3.0);
    ExpectValues(ObjectWithDelta(delta)->GetTolerance(), T_CIE_dLCH_Elliptical,
                 {1.0f, 2.0f, 3.0f, 1.0f, 2.0f, 3.0f});
}

TEST(CxF3Object, FileDeltaLabTestsDEFirstThenTheWeightedLimits) {
    cc::DeltaCIELab delta;
    delta.set_dL(1.0);
    delta.set_dA(2.0);
    delta.set_dB(3.0);
    delta.get_dE2000().set_value(0.7);
    delta.get_dE2000().set_LRatio(1.0);
    ExpectValues(ObjectWithDelta(delta)->GetTolerance(), T_DE2000, {0.7f, 1.0f, 1.0f, 1.0f, 0, 0});
    delta.get_dE94().set_value(0.9);
    delta.get_dE94().set_LRatio(2.0);
    ExpectValues(ObjectWithDelta(delta)->GetTolerance(), T_DE94, {0.9f, 2.0f, 1.0f, 1.0f, 0, 0});
    delta.get_dEcmc().set_value(1.1);
    delta.get_dEcmc().set_LRatio(2.0);
    ExpectValues(ObjectWithDelta(delta)->GetTolerance(), T_CMC, {1.1f, 2.0f, 1.0f, 0, 0, 0});
    delta.set_dE(4.0);
    ExpectValues(ObjectWithDelta(delta)->GetTolerance(), T_DE, {4.0f, 0, 0, 0, 0, 0});
}

TEST(CxF3Object, FileDeltaLabWithoutACompleteSetReadsAsDefault) {
    cc::DeltaCIELab delta;
    delta.set_dL(1.0);
    delta.set_dA(2.0);
    delta.set_dH(3.0);
    ExpectDefaultTolerance(ObjectWithDelta(delta)->GetTolerance());
}

TEST(CxF3Object, FileCustomDeltaReadsByItsKeyword) {
    ExpectValues(ObjectWithCustomDelta(L"T_D", 2)->GetTolerance(), T_D, {1.5f, 1.5f, 1.5f, 1.5f, 1.5f, 0.0f});
    ExpectValues(ObjectWithCustomDelta(L"T_DEMG", 1)->GetTolerance(), T_DEMG, {1.5f, 0, 0, 0, 0, 0});
    ExpectValues(ObjectWithCustomDelta(L"T_FMC", 1)->GetTolerance(), T_FMC, {1.5f, 0, 0, 0, 0, 0});
}

TEST(CxF3Object, FileCustomDeltaOfOtherNameReadsAsDefault) {
    ExpectDefaultTolerance(ObjectWithCustomDelta(L"T_LABMG", 3)->GetTolerance());
    ExpectDefaultTolerance(ObjectWithCustomDelta(L"FMC", 1)->GetTolerance());
    ExpectDefaultTolerance(ObjectWithCustomDelta(L"CIELAB", 1)->GetTolerance());
}

TEST(CxF3Object, FileCustomDeltaWithoutValueReadsAsDefault) {
    ExpectDefaultTolerance(ObjectWithCustomDelta(L"T_D", 0)->GetTolerance());
}

// ---------------------------------------------------------------- wrapper of a loaded object

TEST(CxF3Object, LoadedObjectIsCopiedWithItsCollections) {
    cc::Object loaded;
    loaded.set_Name(L"Loaded");
    loaded.get_ColorValues().append_inner_ColorValues().get_ColorCIELab().set_L(42.0);
    for (const wchar_t *p_name : {L"First", L"Second"}) {
        cc::TagCollection &r_collection = loaded.append_TagCollection();
        r_collection.set_Name(p_name);
        cc::Tag &r_tag = r_collection.append_Tag();
        r_tag.set_Name(L"Key");
        r_tag.set_Value(p_name);
    }
    const ObjectPtr object = LoadedObject(loaded);
    EXPECT_EQ("Loaded", object->GetName());
    EXPECT_EQ(42.0, object->GetLab("")[0]);
    EXPECT_EQ("Second", object->GetTag("Second", "Key"));
    ASSERT_EQ(2u, WrapperOf(object).tagCollections.size());

    // Copies: the loaded object does not see changes made through the handle.
    object->SetName("Changed");
    object->AddTag("First", "More", "1");
    object->AddColorCIELab({10.0, 0.0, 0.0}, "S", "");
    EXPECT_EQ(L"Loaded", loaded.get_Name());
    EXPECT_EQ(1u, loaded.get_TagCollection(0).size_Tag());
    EXPECT_EQ(1u, loaded.get_ColorValues().size_inner_ColorValues());
}

TEST(CxF3Object, LoadedObjectWithoutCollectionsGetsEmptyOnesAndStaysAsItIs) {
    const cc::Object loaded;
    const ObjectPtr object = LoadedObject(loaded);
    const CxF3ObjectWrapper &r_wrapper = WrapperOf(object);
    ASSERT_TRUE(r_wrapper.colorValues && r_wrapper.colorDifferenceValues && r_wrapper.deviceColorValues &&
                r_wrapper.physicalAttributes);
    EXPECT_EQ(0u, r_wrapper.colorValues->size_inner_ColorValues());
    EXPECT_TRUE(r_wrapper.tagCollections.empty());
    EXPECT_FALSE(loaded.isset_ColorValues() || loaded.isset_ColorDifferenceValues() ||
                 loaded.isset_DeviceColorValues() || loaded.isset_PhysicalAttributes());
    EXPECT_TRUE(object->IsValid());
}

// ---------------------------------------------------------------- values copied into the object

TEST(CxF3Object, CopyValuesLeavesEmptyCollectionsOut) {
    CxF3ObjectWrapper wrapper;
    wrapper.tagCollections.push_back(boost::shared_ptr<cc::TagCollection>(new cc::TagCollection()));
    wrapper.tagCollections.back()->set_Name(L"Empty");
    wrapper.CopyValuesIntoObject();
    const cc::Object &r_object = *wrapper.object;
    EXPECT_FALSE(r_object.isset_ColorValues());
    EXPECT_FALSE(r_object.isset_ColorDifferenceValues());
    EXPECT_FALSE(r_object.isset_DeviceColorValues());
    EXPECT_FALSE(r_object.isset_PhysicalAttributes());
    EXPECT_EQ(0u, r_object.size_TagCollection());
}

TEST(CxF3Object, CopyValuesCopiesTheCollectionsThatHoldSomething) {
    const ObjectPtr object = NewObject();
    object->AddColorCIELab({50.0, 1.0, 2.0}, "S", "");
    object->AddTolerance(CXFTolerance(), "S");
    object->AddColorRecipe(Recipe("first", "S"));
    object->AddThickness(0.1, "mm");
    CxF3ObjectWrapper &r_wrapper = WrapperOf(object);
    r_wrapper.CopyValuesIntoObject();
    const cc::Object &r_object = *r_wrapper.object;
    ASSERT_TRUE(r_object.isset_ColorValues());
    EXPECT_EQ(1u, r_object.get_ColorValues()->size_inner_ColorValues());
    ASSERT_TRUE(r_object.isset_ColorDifferenceValues());
    EXPECT_EQ(1u, r_object.get_ColorDifferenceValues()->size_inner_ColorDifferenceValues());
    ASSERT_TRUE(r_object.isset_DeviceColorValues());
    EXPECT_EQ(1u, r_object.get_DeviceColorValues()->size_inner_DeviceColorValues());
    ASSERT_TRUE(r_object.isset_PhysicalAttributes());
    ASSERT_NE(nullptr, r_object.get_PhysicalAttributes()->get_Thickness());
    EXPECT_DOUBLE_EQ(0.1, r_object.get_PhysicalAttributes()->get_Thickness()->get_value());
}

TEST(CxF3Object, CopyValuesTakesPhysicalAttributesWithAnyMemberSet) {
    CxF3ObjectWrapper wrapper;
    cc::Gloss &r_gloss = wrapper.physicalAttributes->append_Gloss();
    r_gloss.set_value(60.0);
    wrapper.CopyValuesIntoObject();
    ASSERT_TRUE(wrapper.object->isset_PhysicalAttributes());
    EXPECT_EQ(1u, static_cast<const cc::Object &>(*wrapper.object).get_PhysicalAttributes()->size_Gloss());
}

TEST(CxF3Object, CopyValuesReplacesWhatTheObjectHeld) {
    cc::Object loaded;
    loaded.get_ColorValues().append_inner_ColorValues().get_ColorCIELab().set_L(42.0);
    CxF3ObjectWrapper wrapper(loaded);
    wrapper.colorValues->append_inner_ColorValues().get_ColorCIELab().set_L(43.0);
    wrapper.CopyValuesIntoObject();
    EXPECT_EQ(2u, static_cast<const cc::Object &>(*wrapper.object).get_ColorValues()->size_inner_ColorValues());
}

TEST(CxF3Object, CopyValuesPutsEachTagCollectionAtItsOwnIndex) {
    const ObjectPtr object = NewObject();
    CxF3ObjectWrapper &r_wrapper = WrapperOf(object);
    for (const wchar_t *p_name : {L"Empty", L"Filled", L"Trailing"}) {
        r_wrapper.tagCollections.push_back(boost::shared_ptr<cc::TagCollection>(new cc::TagCollection()));
        r_wrapper.tagCollections.back()->set_Name(p_name);
    }
    object->AddTag("Filled", "Key", "Value");
    r_wrapper.CopyValuesIntoObject();
    const cc::Object &r_object = *r_wrapper.object;
    // The empty collection before keeps its place; the one after is left out.
    ASSERT_EQ(2u, r_object.size_TagCollection());
    EXPECT_EQ(L"Empty", r_object.get_TagCollection(0).get_Name());
    EXPECT_EQ(0u, r_object.get_TagCollection(0).size_Tag());
    EXPECT_EQ(L"Filled", r_object.get_TagCollection(1).get_Name());
    ASSERT_EQ(1u, r_object.get_TagCollection(1).size_Tag());
    EXPECT_EQ(L"Value", r_object.get_TagCollection(1).get_Tag(0).get_Value());
}

TEST(CxF3Object, CopyValuesOverwritesTheLoadedTagCollectionOfTheSameIndex) {
    cc::Object loaded;
    cc::TagCollection &r_collection = loaded.append_TagCollection();
    r_collection.set_Name(L"Info");
    cc::Tag &r_tag = r_collection.append_Tag();
    r_tag.set_Name(L"Batch");
    r_tag.set_Value(L"B7");
    const ObjectPtr object = LoadedObject(loaded);
    object->AddTag("Info", "Line", "3");
    object->AddTag("New", "Key", "Value");
    CxF3ObjectWrapper &r_wrapper = WrapperOf(object);
    r_wrapper.CopyValuesIntoObject();
    const cc::Object &r_object = *r_wrapper.object;
    ASSERT_EQ(2u, r_object.size_TagCollection());
    EXPECT_EQ(2u, r_object.get_TagCollection(0).size_Tag());
    EXPECT_EQ(L"New", r_object.get_TagCollection(1).get_Name());
}
