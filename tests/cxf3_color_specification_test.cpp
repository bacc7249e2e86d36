// CxF3ColorSpecification: the handle over a cc::ColorSpecification
// with its measurement and tristimulus specs: condition words both ways,
// measurement types, calibration and status texts, device fields,
// illuminant and observer words, wavelength range, loaded specifications,
// and handles that refer to nothing.
#include <gtest/gtest.h>

#include <tessarine/CxF3.h>
#include <tessarine/CxF3ColorSpecification.h>

#include <dll/cxfwrapper/source/cxf3colorspecificationwrapper.h>

#include <cxf/v3/cxf3.h>

#include <stdexcept>
#include <string>
#include <vector>

namespace {

using Geometry = cc::GeometryChoiceType;

const std::string k_degree = "\xC2\xB0";

typedef boost::shared_ptr<CxF3ColorSpecification> SpecPtr;

CxF3ColorSpecificationWrapper &body(const SpecPtr &ar_handle) {
    const auto *p_interface = dynamic_cast<const CxF3ColorSpecificationInterface *>(ar_handle.get());
    if (!p_interface || !p_interface->GetWrapper())
        throw std::logic_error("not a specification handle with a wrapper");
    return *p_interface->GetWrapper();
}

const cc::MeasurementSpec &measurement(const SpecPtr &ar_handle) { return *body(ar_handle).measurementSpec; }
const cc::TristimulusSpec &tristimulus(const SpecPtr &ar_handle) { return *body(ar_handle).tristimulusSpec; }

SpecPtr fresh() { return CxF3ColorSpecification::CreateCxFColorSpecification(); }

// A handle over a wrapper made from a specification as a document holds it.
SpecPtr loaded(const cc::ColorSpecification &ar_source) {
    boost::shared_ptr<CxF3ColorSpecificationWrapper> wrapper(new CxF3ColorSpecificationWrapper(ar_source));
    return SpecPtr(new CxF3ColorSpecificationInterface(wrapper));
}

// A loaded specification of a measurement type with a single-angle geometry.
cc::ColorSpecification single_angle_source(const wchar_t *ap_type = L"Spectrum_Reflectance") {
    cc::ColorSpecification source;
    source.set_Id(L"loaded");
    cc::MeasurementSpec &r_spec = source.get_MeasurementSpec();
    r_spec.set_MeasurementType(ap_type);
    cc::SingleAngleType &r_angle = r_spec.get_GeometryChoice().get_SingleAngle();
    r_angle.set_SingleAngleConfiguration(L"Annular");
    r_angle.set_IlluminationAngle(45);
    r_angle.set_MeasurementAngle(0);
    return source;
}

// ---------------------------------------------------------------- a new specification

TEST(CxF3ColorSpecification, NewSpecificationDefaults) {
    const SpecPtr spec = fresh();
    EXPECT_EQ(spec->GetMeasurementType(), CxF3MeasurementSpectral);
    EXPECT_EQ(spec->GetStartWL(), 380);
    EXPECT_EQ(spec->GetWLIncrement(), 10);
    EXPECT_EQ(spec->GetFilter(), "M0");
    EXPECT_EQ(spec->GetCalibrationStandard(), CxF3CalibrationUnknown);
    EXPECT_EQ(spec->GetVerimetraStatus(), CxF3VerimetraDisabled);
    EXPECT_EQ(spec->GetId(), "");
    EXPECT_EQ(spec->GetDeviceName(), "");
    EXPECT_EQ(spec->GetDeviceSerialNumber(), "");
    EXPECT_EQ(spec->GetIlluminant(), "");
    EXPECT_EQ(spec->GetObserver(), "");
}

TEST(CxF3ColorSpecification, NewSpecificationSetsNothingElse) {
    const SpecPtr spec = fresh();
    const cc::MeasurementSpec &r_spec = measurement(spec);
    EXPECT_EQ(r_spec.get_MeasurementType(), L"Spectrum_Reflectance");
    ASSERT_NE(r_spec.get_WavelengthRange(), nullptr);
    EXPECT_EQ(r_spec.get_WavelengthRange()->get_StartWL(), 380);
    EXPECT_EQ(r_spec.get_WavelengthRange()->get_Increment(), 10);
    EXPECT_EQ(r_spec.get_GeometryChoice(), nullptr);
    EXPECT_FALSE(r_spec.isset_Device());
    EXPECT_FALSE(r_spec.isset_CalibrationStandard());
    EXPECT_FALSE(r_spec.isset_LuminanceUnitsType());
    EXPECT_FALSE(r_spec.isset_Aperture());
    EXPECT_FALSE(r_spec.isset_Backing());
    EXPECT_FALSE(r_spec.isset_BandpassCorrected());

    const cc::TristimulusSpec &r_tristimulus = tristimulus(spec);
    EXPECT_EQ(r_tristimulus.get_Method(), L"E308_Table6");
    EXPECT_EQ(r_tristimulus.get_anon_Illuminant(), nullptr);
    EXPECT_EQ(r_tristimulus.get_Observer(), nullptr);
    // Illuminant and observer are required, so the specification is not yet complete.
    EXPECT_FALSE(r_tristimulus.is_occurs_ok());

    const cc::ColorSpecification &r_specification = *body(spec).specification;
    EXPECT_FALSE(r_specification.isset_TristimulusSpec());
    EXPECT_EQ(r_specification.get_MeasurementSpec(), nullptr);
    EXPECT_FALSE(r_specification.isset_PhysicalAttributes());
}

TEST(CxF3ColorSpecification, NewSpecificationHasTheIlluminantTable) {
    const SpecPtr spec = fresh();
    EXPECT_EQ(body(spec).illuminants.size(), 18u);
}

TEST(CxF3ColorSpecification, IdSetAndGet) {
    const SpecPtr spec = fresh();
    spec->SetId("CS-1");
    EXPECT_EQ(spec->GetId(), "CS-1");
    EXPECT_EQ(body(spec).specification->get_Id(), L"CS-1");
}

TEST(CxF3ColorSpecification, HandlesOnOneWrapperShareIt) {
    boost::shared_ptr<CxF3ColorSpecificationWrapper> wrapper(new CxF3ColorSpecificationWrapper());
    CxF3ColorSpecificationInterface first(wrapper);
    CxF3ColorSpecificationInterface second(wrapper);
    first.SetDeviceName("Shared");
    EXPECT_EQ(second.GetDeviceName(), "Shared");
}

// ---------------------------------------------------------------- SetFilter

struct FilterRow {
    const char *word;
    Geometry::elmx_chosen geometry;
    const wchar_t *sphere;       // for a sphere geometry
    const wchar_t *illumination; // DeviceIllumination
    bool polarization;
    const wchar_t *filter;   // DeviceFilter
    const wchar_t *type;     // MeasurementType afterwards
    const char *read_back;   // GetFilter afterwards
};

class CxF3ColorSpecificationSetFilter : public ::testing::TestWithParam<FilterRow> {};

TEST_P(CxF3ColorSpecificationSetFilter, SetsGeometryIlluminationPolarizationAndFilter) {
    const FilterRow &row = GetParam();
    const SpecPtr spec = fresh();
    spec->SetFilter(row.word);

    const cc::MeasurementSpec &r_spec = measurement(spec);
    EXPECT_EQ(r_spec.get_MeasurementType(), row.type);
    const cc::GeometryChoice *p_geometry = r_spec.get_GeometryChoice();
    ASSERT_NE(p_geometry, nullptr);
    ASSERT_EQ(p_geometry->getchosen(), row.geometry);
    if (row.geometry == Geometry::ESingleAngle) {
        const cc::SingleAngleType *p_angle = p_geometry->get_SingleAngle();
        ASSERT_NE(p_angle, nullptr);
        EXPECT_EQ(p_angle->get_SingleAngleConfiguration(), L"Annular");
        EXPECT_EQ(p_angle->get_IlluminationAngle(), 45.0);
        EXPECT_EQ(p_angle->get_MeasurementAngle(), 0.0);
        EXPECT_TRUE(p_angle->is_occurs_ok());
    } else {
        EXPECT_EQ(p_geometry->get_SphereGeometry(), row.sphere);
    }

    const cc::Device *p_device = r_spec.get_Device();
    ASSERT_NE(p_device, nullptr);
    ASSERT_NE(p_device->get_DeviceIllumination(), nullptr);
    EXPECT_EQ(p_device->get_DeviceIllumination()->get_value(), row.illumination);
    ASSERT_TRUE(p_device->isset_DevicePolarization());
    EXPECT_EQ(p_device->get_DevicePolarization(), row.polarization);
    ASSERT_NE(p_device->get_DeviceFilter(), nullptr);
    EXPECT_EQ(p_device->get_DeviceFilter()->get_value(), row.filter);

    EXPECT_EQ(spec->GetFilter(), row.read_back);
    EXPECT_EQ(spec->GetMeasurementType(), CxF3MeasurementSpectral);
}

const wchar_t *const k_refl = L"Spectrum_Reflectance";
const wchar_t *const k_trans = L"Spectrum_Transmittance";

INSTANTIATE_TEST_SUITE_P(
    EveryWord, CxF3ColorSpecificationSetFilter,
    ::testing::Values(
        FilterRow{"No", Geometry::ESingleAngle, L"", L"M0_Incandescent", false, L"Filter_None", k_refl, "M0"},
        FilterRow{"M0", Geometry::ESingleAngle, L"", L"M0_Incandescent", false, L"Filter_None", k_refl, "M0"},
        FilterRow{"D65", Geometry::ESingleAngle, L"", L"M1_Daylight", false, L"Filter_UVD65", k_refl, "M1"},
        FilterRow{"M1", Geometry::ESingleAngle, L"", L"M1_Daylight", false, L"Filter_UVD65", k_refl, "M1"},
        FilterRow{"UVCut", Geometry::ESingleAngle, L"", L"M2_UVExcluded", false, L"Filter_UVExcluded", k_refl, "M2"},
        FilterRow{"M2", Geometry::ESingleAngle, L"", L"M2_UVExcluded", false, L"Filter_UVExcluded", k_refl, "M2"},
        FilterRow{"Pol", Geometry::ESingleAngle, L"", L"M3_Polarized", true, L"Filter_None", k_refl, "M3"},
        FilterRow{"M3", Geometry::ESingleAngle, L"", L"M3_Polarized", true, L"Filter_None", k_refl, "M3"},
        FilterRow{"D8i", Geometry::ESphereGeometry, L"Specular_Included", L"Flash", false, L"Filter_None", k_refl,
                  "D8i"},
        FilterRow{"D8e", Geometry::ESphereGeometry, L"Specular_Excluded", L"Flash", false, L"Filter_None", k_refl,
                  "D8e"},
        FilterRow{"D8t", Geometry::ESphereGeometry, L"Specular_Included", L"Flash", false, L"Filter_None", k_trans,
                  "D8t"}));

TEST(CxF3ColorSpecification, SetFilterD8tReadsBackAsD8tAndStaysSpectral) {
    const SpecPtr spec = fresh();
    spec->SetFilter("D8t");
    EXPECT_EQ(spec->GetFilter(), "D8t");
    EXPECT_EQ(spec->GetMeasurementType(), CxF3MeasurementSpectral);
    EXPECT_EQ(measurement(spec).get_MeasurementType(), L"Spectrum_Transmittance");
}

TEST(CxF3ColorSpecification, SetFilterOtherWordEmptiesTheGeometryAndKeepsTheIllumination) {
    const SpecPtr spec = fresh();
    spec->SetFilter("M3");
    spec->SetFilter("Unknown word");
    const cc::MeasurementSpec &r_spec = measurement(spec);
    ASSERT_NE(r_spec.get_GeometryChoice(), nullptr);
    EXPECT_EQ(r_spec.get_GeometryChoice()->getchosen(), Geometry::Echoice_not_set);
    ASSERT_NE(r_spec.get_Device(), nullptr);
    EXPECT_EQ(r_spec.get_Device()->get_DeviceIllumination()->get_value(), L"M3_Polarized");
    EXPECT_FALSE(r_spec.get_Device()->get_DevicePolarization());
    EXPECT_EQ(r_spec.get_Device()->get_DeviceFilter()->get_value(), L"Filter_None");
    EXPECT_EQ(r_spec.get_MeasurementType(), L"Spectrum_Reflectance");
    // No geometry falls through to the last step.
    EXPECT_EQ(spec->GetFilter(), "M0");
}

TEST(CxF3ColorSpecification, SetFilterOtherWordOnANewSpecCreatesTheDeviceWithoutIllumination) {
    const SpecPtr spec = fresh();
    spec->SetFilter("");
    const cc::Device *p_device = measurement(spec).get_Device();
    ASSERT_NE(p_device, nullptr);
    EXPECT_FALSE(p_device->isset_DeviceIllumination());
    EXPECT_TRUE(p_device->isset_DevicePolarization());
    EXPECT_FALSE(p_device->get_DevicePolarization());
    EXPECT_EQ(p_device->get_DeviceFilter()->get_value(), L"Filter_None");
    EXPECT_EQ(spec->GetFilter(), "M0");
}

TEST(CxF3ColorSpecification, SetFilterComparesExactly) {
    for (const char *p_word : {"m1", "M1 ", " M1", "d8i", "pol", "uvcut", "D8T", "M4", "D50"}) {
        const SpecPtr spec = fresh();
        spec->SetFilter("M2");
        spec->SetFilter(p_word);
        EXPECT_EQ(measurement(spec).get_GeometryChoice()->getchosen(), Geometry::Echoice_not_set) << p_word;
        EXPECT_EQ(spec->GetFilter(), "M0") << p_word;
    }
}

TEST(CxF3ColorSpecification, SetFilterKeepsOtherDeviceFields) {
    const SpecPtr spec = fresh();
    spec->SetDeviceName("Spectro");
    spec->SetDeviceSerialNumber("1234");
    spec->SetFilter("M1");
    EXPECT_EQ(spec->GetDeviceName(), "Spectro");
    EXPECT_EQ(spec->GetDeviceSerialNumber(), "1234");
}

TEST(CxF3ColorSpecification, TransmittanceStaysAfterAnotherFilter) {
    // Only "D8t" changes the measurement type, and nothing changes it back.
    const SpecPtr spec = fresh();
    spec->SetFilter("D8t");
    spec->SetFilter("M1");
    EXPECT_EQ(measurement(spec).get_MeasurementType(), L"Spectrum_Transmittance");
    EXPECT_EQ(spec->GetFilter(), "D8t");
}

TEST(CxF3ColorSpecification, LaterFilterReplacesTheGeometry) {
    const SpecPtr spec = fresh();
    spec->SetFilter("D8e");
    EXPECT_EQ(spec->GetFilter(), "D8e");
    spec->SetFilter("M2");
    EXPECT_EQ(measurement(spec).get_GeometryChoice()->getchosen(), Geometry::ESingleAngle);
    EXPECT_EQ(spec->GetFilter(), "M2");
    spec->SetFilter("D8i");
    EXPECT_EQ(spec->GetFilter(), "D8i");
    EXPECT_EQ(measurement(spec).get_Device()->get_DeviceFilter()->get_value(), L"Filter_None");
}

// ---------------------------------------------------------------- GetFilter

TEST(CxF3ColorSpecification, GetFilterTransmittanceTypesGiveD8t) {
    for (const wchar_t *p_type : {L"Spectrum_Transmittance", L"Spectrum_TotalTransmittance"}) {
        // Whatever the geometry: none, single angle, sphere.
        cc::ColorSpecification source = single_angle_source(p_type);
        EXPECT_EQ(loaded(source)->GetFilter(), "D8t");
        source.get_MeasurementSpec().get_GeometryChoice().set_SphereGeometry(L"Specular_Excluded");
        EXPECT_EQ(loaded(source)->GetFilter(), "D8t");
        source.get_MeasurementSpec().assign_GeometryChoice(cc::GeometryChoice());
        EXPECT_EQ(loaded(source)->GetFilter(), "D8t");
    }
}

class CxF3ColorSpecificationUnsupported : public ::testing::TestWithParam<const char *> {};

TEST_P(CxF3ColorSpecificationUnsupported, GetFilterThrowsWithTheTypeText) {
    const std::string type = GetParam();
    std::wstring wide_type;
    lmx::convert(wide_type, type);
    const SpecPtr spec = loaded(single_angle_source(wide_type.c_str()));
    try {
        spec->GetFilter();
        FAIL() << "no exception for " << type;
    } catch (const std::runtime_error &r_error) {
        EXPECT_EQ(std::string(r_error.what()), "Unsupported measurement specification: " + type);
    }
    EXPECT_THROW(spec->GetFilter(), std::runtime_error);
}

INSTANTIATE_TEST_SUITE_P(OtherTypes, CxF3ColorSpecificationUnsupported,
                         ::testing::Values("Spectrum_Emissive", "Colorimetric_Transmittance",
                                           "Colorimetric_Emissive", "Spectrum_Custom", "spectrum_reflectance",
                                           "Nonsense"));

TEST(CxF3ColorSpecification, GetFilterThrowsForAnUnsetType) {
    // A loaded specification without a measurement spec gets an empty one.
    cc::ColorSpecification source;
    source.set_Id(L"bare");
    const SpecPtr spec = loaded(source);
    try {
        spec->GetFilter();
        FAIL() << "no exception";
    } catch (const std::runtime_error &r_error) {
        EXPECT_EQ(std::string(r_error.what()), "Unsupported measurement specification: ");
    }
}

TEST(CxF3ColorSpecification, GetFilterColorimetricReflectanceIsRead) {
    cc::ColorSpecification source = single_angle_source(L"Colorimetric_Reflectance");
    source.get_MeasurementSpec().get_Device().get_DeviceIllumination().set_value(L"M1_Daylight");
    const SpecPtr spec = loaded(source);
    EXPECT_EQ(spec->GetFilter(), "M1");
    EXPECT_EQ(spec->GetMeasurementType(), CxF3MeasurementColorimetric);

    source.get_MeasurementSpec().get_GeometryChoice().set_SphereGeometry(L"Specular_Included");
    EXPECT_EQ(loaded(source)->GetFilter(), "D8i");
}

TEST(CxF3ColorSpecification, GetFilterSphereValues) {
    cc::ColorSpecification source = single_angle_source();
    cc::GeometryChoice &r_geometry = source.get_MeasurementSpec().get_GeometryChoice();
    r_geometry.set_SphereGeometry(L"Specular_Included");
    EXPECT_EQ(loaded(source)->GetFilter(), "D8i");
    r_geometry.set_SphereGeometry(L"Specular_Excluded");
    EXPECT_EQ(loaded(source)->GetFilter(), "D8e");
    // Any other sphere value falls to the last step, also with a polarised device.
    source.get_MeasurementSpec().get_Device().set_DevicePolarization(true);
    r_geometry.set_SphereGeometry(L"Diffuse");
    EXPECT_EQ(loaded(source)->GetFilter(), "M0");
    r_geometry.set_SphereGeometry(L"");
    EXPECT_EQ(loaded(source)->GetFilter(), "M0");
}

TEST(CxF3ColorSpecification, GetFilterSingleAngleWithoutDeviceIsM0) {
    EXPECT_EQ(loaded(single_angle_source())->GetFilter(), "M0");
}

struct IlluminationRow {
    const wchar_t *illumination;
    const char *word;
};

class CxF3ColorSpecificationIllumination : public ::testing::TestWithParam<IlluminationRow> {};

TEST_P(CxF3ColorSpecificationIllumination, IlluminationDecidesBeforePolarizationAndFilter) {
    const IlluminationRow &row = GetParam();
    cc::ColorSpecification source = single_angle_source();
    cc::Device &r_device = source.get_MeasurementSpec().get_Device();
    r_device.get_DeviceIllumination().set_value(row.illumination);
    // A conflicting filter and polarisation do not count.
    r_device.get_DeviceFilter().set_value(L"Filter_Partial");
    r_device.set_DevicePolarization(true);
    EXPECT_EQ(loaded(source)->GetFilter(), row.word);
}

INSTANTIATE_TEST_SUITE_P(FirstFourValues, CxF3ColorSpecificationIllumination,
                         ::testing::Values(IlluminationRow{L"M0_Incandescent", "M0"},
                                           IlluminationRow{L"M1_Daylight", "M1"},
                                           IlluminationRow{L"M2_UVExcluded", "M2"},
                                           IlluminationRow{L"M3_Polarized", "M3"}));

TEST(CxF3ColorSpecification, GetFilterPolarizationWhenIlluminationSaysNothing) {
    for (const wchar_t *p_illumination : {L"Flash", L"LED", L"Ambient", L"Custom", L""}) {
        cc::ColorSpecification source = single_angle_source();
        cc::Device &r_device = source.get_MeasurementSpec().get_Device();
        r_device.get_DeviceIllumination().set_value(p_illumination);
        r_device.set_DevicePolarization(true);
        r_device.get_DeviceFilter().set_value(L"Filter_UVD65");
        EXPECT_EQ(loaded(source)->GetFilter(), "M3");
    }
    // Without an illumination element too.
    cc::ColorSpecification source = single_angle_source();
    source.get_MeasurementSpec().get_Device().set_DevicePolarization(true);
    EXPECT_EQ(loaded(source)->GetFilter(), "M3");
}

struct DeviceFilterRow {
    const wchar_t *filter; // null: no filter element
    const char *word;
};

class CxF3ColorSpecificationDeviceFilter : public ::testing::TestWithParam<DeviceFilterRow> {};

TEST_P(CxF3ColorSpecificationDeviceFilter, FilterDecidesLast) {
    const DeviceFilterRow &row = GetParam();
    // Three device states that leave the decision to the filter: illumination
    // without a condition and no polarisation; polarisation false; neither element.
    for (int variant = 0; variant < 3; ++variant) {
        cc::ColorSpecification source = single_angle_source();
        cc::Device &r_device = source.get_MeasurementSpec().get_Device();
        if (variant == 0)
            r_device.get_DeviceIllumination().set_value(L"Flash");
        if (variant == 1)
            r_device.set_DevicePolarization(false);
        if (row.filter)
            r_device.get_DeviceFilter().set_value(row.filter);
        EXPECT_EQ(loaded(source)->GetFilter(), row.word) << variant;
    }
}

INSTANTIATE_TEST_SUITE_P(EveryFilter, CxF3ColorSpecificationDeviceFilter,
                         ::testing::Values(DeviceFilterRow{L"Filter_None", "M0"},
                                           DeviceFilterRow{L"Filter_UVExcluded", "M2"},
                                           DeviceFilterRow{L"Filter_Partial", "M2"},
                                           DeviceFilterRow{L"Filter_UVD65", "M1"},
                                           DeviceFilterRow{L"Filter_Custom", "M0"},
                                           DeviceFilterRow{L"filter_uvd65", "M0"},
                                           DeviceFilterRow{nullptr, "M0"}));

TEST(CxF3ColorSpecification, GetFilterOtherGeometriesGiveM0) {
    cc::ColorSpecification source = single_angle_source();
    cc::Device &r_device = source.get_MeasurementSpec().get_Device();
    r_device.get_DeviceIllumination().set_value(L"M1_Daylight");
    r_device.set_DevicePolarization(true);
    cc::GeometryChoice &r_geometry = source.get_MeasurementSpec().get_GeometryChoice();

    r_geometry.set_EmissiveMode(L"EmissiveMode_Diffuser");
    EXPECT_EQ(loaded(source)->GetFilter(), "M0");
    r_geometry.set_UnknownGeometry(L"45/0 roughly");
    EXPECT_EQ(loaded(source)->GetFilter(), "M0");
    r_geometry.get_MultiAngle();
    EXPECT_EQ(r_geometry.getchosen(), Geometry::EMultiAngle);
    EXPECT_EQ(loaded(source)->GetFilter(), "M0");
    source.get_MeasurementSpec().assign_GeometryChoice(cc::GeometryChoice());
    EXPECT_EQ(loaded(source)->GetFilter(), "M0");
}

TEST(CxF3ColorSpecification, GetFilterWithoutGeometryElementIsM0) {
    cc::ColorSpecification source;
    source.get_MeasurementSpec().set_MeasurementType(L"Spectrum_Reflectance");
    source.get_MeasurementSpec().get_Device().set_DevicePolarization(true);
    const SpecPtr spec = loaded(source);
    EXPECT_EQ(measurement(spec).get_GeometryChoice(), nullptr);
    EXPECT_EQ(spec->GetFilter(), "M0");
    // Reading did not create the element.
    EXPECT_EQ(measurement(spec).get_GeometryChoice(), nullptr);
}

// ---------------------------------------------------------------- measurement type

struct TypeRow {
    const wchar_t *type;
    CxF3MeasurementType kind;
};

class CxF3ColorSpecificationType : public ::testing::TestWithParam<TypeRow> {};

TEST_P(CxF3ColorSpecificationType, Classified) {
    const TypeRow &row = GetParam();
    EXPECT_EQ(loaded(single_angle_source(row.type))->GetMeasurementType(), row.kind);
}

INSTANTIATE_TEST_SUITE_P(EveryType, CxF3ColorSpecificationType,
                         ::testing::Values(TypeRow{L"Spectrum_Reflectance", CxF3MeasurementSpectral},
                                           TypeRow{L"Spectrum_Transmittance", CxF3MeasurementSpectral},
                                           TypeRow{L"Spectrum_TotalTransmittance", CxF3MeasurementOther},
                                           TypeRow{L"Spectrum_Emissive", CxF3MeasurementOther},
                                           TypeRow{L"Colorimetric_Reflectance", CxF3MeasurementColorimetric},
                                           TypeRow{L"Colorimetric_Transmittance", CxF3MeasurementOther},
                                           TypeRow{L"Colorimetric_Emissive", CxF3MeasurementOther},
                                           TypeRow{L"Spectrum_Custom", CxF3MeasurementOther},
                                           TypeRow{L"", CxF3MeasurementOther}));

// ---------------------------------------------------------------- calibration texts

TEST(CxF3ColorSpecification, CalibrationStandardStrings) {
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationKLMB), "KLMB");
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationKLMA), "KLMA");
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationKLME), "KLME");
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationKLMD), "KLMD");
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationKLMC), "KLMC");
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationNIST), "NIST");
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationDCI), "DCI");
    EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationUnknown), "");
    for (int value : {-1, 7, 8, 9, 11, 100})
        EXPECT_EQ(CxF3ColorSpecification::GetCalibrationStandardString(static_cast<CxF3CalibrationStandard>(value)),
                  "")
            << value;
}

TEST(CxF3ColorSpecification, VerimetraStandardStringsWriteSide) {
    EXPECT_EQ(CxF3ColorSpecification::GetVerimetraStandardString(CxF3VerimetraExpired), "Verimetra_Expired");
    EXPECT_EQ(CxF3ColorSpecification::GetVerimetraStandardString(CxF3VerimetraActive), "Verimetra");
    // Nothing for disabled, although the read side knows "Verimetra_Disabled".
    EXPECT_EQ(CxF3ColorSpecification::GetVerimetraStandardString(CxF3VerimetraDisabled), "");
    for (int value : {-1, 3, 10})
        EXPECT_EQ(CxF3ColorSpecification::GetVerimetraStandardString(static_cast<CxF3VerimetraStatus>(value)), "")
            << value;
}

TEST(CxF3ColorSpecification, CalibrationStandardFromEveryText) {
    typedef std::vector<std::string> Parts;
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"KLMB"}), CxF3CalibrationKLMB);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"KLMA"}), CxF3CalibrationKLMA);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"KLME"}), CxF3CalibrationKLME);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"KLMD"}), CxF3CalibrationKLMD);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"KLMC"}), CxF3CalibrationKLMC);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"NIST"}), CxF3CalibrationNIST);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"DCI"}), CxF3CalibrationDCI);
}

TEST(CxF3ColorSpecification, CalibrationStandardFromPartsFirstFoundWins) {
    typedef std::vector<std::string> Parts;
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{}), CxF3CalibrationUnknown);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"Verimetra", "NIST", "KLMA"}),
              CxF3CalibrationNIST);
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"", "DCI"}), CxF3CalibrationDCI);
    // Exact, untrimmed comparison of each part.
    EXPECT_EQ(CxF3ColorSpecification::CalibrationStandardFromString(Parts{"klmb", " KLMA", "NIST ", "KLM"}),
              CxF3CalibrationUnknown);
}

TEST(CxF3ColorSpecification, VerimetraStatusFromEveryWord) {
    typedef std::vector<std::string> Parts;
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"Verimetra"}), CxF3VerimetraActive);
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"Verimetrated"}), CxF3VerimetraActive);
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"Verimetra_Expired"}), CxF3VerimetraExpired);
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"Verimetra_Disabled"}),
              CxF3VerimetraDisabled);
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{}), CxF3VerimetraDisabled);
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"KLMB", "verimetra", "Verimetra "}),
              CxF3VerimetraDisabled);
}

TEST(CxF3ColorSpecification, VerimetraStatusFromPartsFirstFoundWins) {
    typedef std::vector<std::string> Parts;
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"KLMA", "Verimetra_Expired", "Verimetra"}),
              CxF3VerimetraExpired);
    // The disabled word is found, and stops the search.
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"Verimetra_Disabled", "Verimetra"}),
              CxF3VerimetraDisabled);
    EXPECT_EQ(CxF3ColorSpecification::VerimetraStatusFromString(Parts{"x", "Verimetrated", "Verimetra_Expired"}),
              CxF3VerimetraActive);
}

// ---------------------------------------------------------------- calibration storage

struct CalibrationRow {
    int standard;
    int status;
    const wchar_t *text; // null: nothing written
    CxF3CalibrationStandard read_standard;
    CxF3VerimetraStatus read_status;
};

class CxF3ColorSpecificationCalibration : public ::testing::TestWithParam<CalibrationRow> {};

TEST_P(CxF3ColorSpecificationCalibration, WritesOneTextAndReadsBoth) {
    const CalibrationRow &row = GetParam();
    const SpecPtr spec = fresh();
    spec->SetCalibrationStandard(static_cast<CxF3CalibrationStandard>(row.standard),
                                 static_cast<CxF3VerimetraStatus>(row.status));
    const cc::MeasurementSpec &r_spec = measurement(spec);
    if (row.text) {
        ASSERT_TRUE(r_spec.isset_CalibrationStandard());
        EXPECT_EQ(r_spec.get_CalibrationStandard(), row.text);
    } else {
        EXPECT_FALSE(r_spec.isset_CalibrationStandard());
    }
    EXPECT_EQ(spec->GetCalibrationStandard(), row.read_standard);
    EXPECT_EQ(spec->GetVerimetraStatus(), row.read_status);
}

INSTANTIATE_TEST_SUITE_P(
    Combinations, CxF3ColorSpecificationCalibration,
    ::testing::Values(
        CalibrationRow{0, 2, L"KLMB,Verimetra", CxF3CalibrationKLMB, CxF3VerimetraActive},
        CalibrationRow{0, 1, L"KLMB,Verimetra_Expired", CxF3CalibrationKLMB, CxF3VerimetraExpired},
        CalibrationRow{0, 0, L"KLMB", CxF3CalibrationKLMB, CxF3VerimetraDisabled},
        CalibrationRow{1, 2, L"KLMA,Verimetra", CxF3CalibrationKLMA, CxF3VerimetraActive},
        CalibrationRow{2, 1, L"KLME,Verimetra_Expired", CxF3CalibrationKLME, CxF3VerimetraExpired},
        CalibrationRow{3, 0, L"KLMD", CxF3CalibrationKLMD, CxF3VerimetraDisabled},
        CalibrationRow{4, 2, L"KLMC,Verimetra", CxF3CalibrationKLMC, CxF3VerimetraActive},
        CalibrationRow{5, 0, L"NIST", CxF3CalibrationNIST, CxF3VerimetraDisabled},
        CalibrationRow{6, 1, L"DCI,Verimetra_Expired", CxF3CalibrationDCI, CxF3VerimetraExpired},
        CalibrationRow{10, 2, L"Verimetra", CxF3CalibrationUnknown, CxF3VerimetraActive},
        CalibrationRow{10, 1, L"Verimetra_Expired", CxF3CalibrationUnknown, CxF3VerimetraExpired},
        CalibrationRow{10, 0, nullptr, CxF3CalibrationUnknown, CxF3VerimetraDisabled},
        CalibrationRow{7, 3, nullptr, CxF3CalibrationUnknown, CxF3VerimetraDisabled}));

TEST(CxF3ColorSpecification, CalibrationWithNothingToWriteKeepsTheFormerText) {
    const SpecPtr spec = fresh();
    spec->SetCalibrationStandard(CxF3CalibrationNIST, CxF3VerimetraActive);
    spec->SetCalibrationStandard(CxF3CalibrationUnknown, CxF3VerimetraDisabled);
    EXPECT_EQ(measurement(spec).get_CalibrationStandard(), L"NIST,Verimetra");
    EXPECT_EQ(spec->GetCalibrationStandard(), CxF3CalibrationNIST);
    EXPECT_EQ(spec->GetVerimetraStatus(), CxF3VerimetraActive);
    // A later text replaces it whole.
    spec->SetCalibrationStandard(CxF3CalibrationKLMA, CxF3VerimetraDisabled);
    EXPECT_EQ(measurement(spec).get_CalibrationStandard(), L"KLMA");
    EXPECT_EQ(spec->GetVerimetraStatus(), CxF3VerimetraDisabled);
}

struct ElementTextRow {
    const wchar_t *text;
    CxF3CalibrationStandard standard;
    CxF3VerimetraStatus status;
};

class CxF3ColorSpecificationCalibrationText : public ::testing::TestWithParam<ElementTextRow> {};

TEST_P(CxF3ColorSpecificationCalibrationText, SplitAtCommasAndTrimmed) {
    const ElementTextRow &row = GetParam();
    cc::ColorSpecification source = single_angle_source();
    source.get_MeasurementSpec().set_CalibrationStandard(row.text);
    const SpecPtr spec = loaded(source);
    EXPECT_EQ(spec->GetCalibrationStandard(), row.standard);
    EXPECT_EQ(spec->GetVerimetraStatus(), row.status);
}

INSTANTIATE_TEST_SUITE_P(
    ElementTexts, CxF3ColorSpecificationCalibrationText,
    ::testing::Values(ElementTextRow{L"KLMA , Verimetra_Expired", CxF3CalibrationKLMA, CxF3VerimetraExpired},
                      ElementTextRow{L"KLMB,Verimetra", CxF3CalibrationKLMB, CxF3VerimetraActive},
                      ElementTextRow{L" NIST ", CxF3CalibrationNIST, CxF3VerimetraDisabled},
                      ElementTextRow{L"\tDCI\n,\r Verimetrated ", CxF3CalibrationDCI, CxF3VerimetraActive},
                      ElementTextRow{L"Verimetra", CxF3CalibrationUnknown, CxF3VerimetraActive},
                      ElementTextRow{L"Verimetra_Disabled,KLMC", CxF3CalibrationKLMC, CxF3VerimetraDisabled},
                      ElementTextRow{L"Verimetra_Expired,KLMD,KLMA,Verimetra", CxF3CalibrationKLMD,
                                     CxF3VerimetraExpired},
                      ElementTextRow{L",,KLME,", CxF3CalibrationKLME, CxF3VerimetraDisabled},
                      ElementTextRow{L"KLMA Verimetra", CxF3CalibrationUnknown, CxF3VerimetraDisabled},
                      ElementTextRow{L"klma,verimetra", CxF3CalibrationUnknown, CxF3VerimetraDisabled},
                      ElementTextRow{L"", CxF3CalibrationUnknown, CxF3VerimetraDisabled},
                      ElementTextRow{L"   ", CxF3CalibrationUnknown, CxF3VerimetraDisabled}));

TEST(CxF3ColorSpecification, CalibrationAbsentElementReadsAsNothing) {
    const SpecPtr spec = loaded(single_angle_source());
    EXPECT_EQ(spec->GetCalibrationStandard(), CxF3CalibrationUnknown);
    EXPECT_EQ(spec->GetVerimetraStatus(), CxF3VerimetraDisabled);
}

// ---------------------------------------------------------------- device fields

TEST(CxF3ColorSpecification, DeviceNameIsTheModelAndCannotBeCleared) {
    const SpecPtr spec = fresh();
    spec->SetDeviceName("");
    EXPECT_FALSE(measurement(spec).isset_Device()); // nothing done, nothing created
    EXPECT_EQ(spec->GetDeviceName(), "");

    spec->SetDeviceName("Spectro 2");
    ASSERT_TRUE(measurement(spec).isset_Device());
    EXPECT_TRUE(measurement(spec).get_Device()->isset_Model());
    EXPECT_EQ(measurement(spec).get_Device()->get_Model(), L"Spectro 2");
    EXPECT_FALSE(measurement(spec).get_Device()->isset_Manufacturer());
    EXPECT_EQ(spec->GetDeviceName(), "Spectro 2");

    spec->SetDeviceName("");
    EXPECT_EQ(spec->GetDeviceName(), "Spectro 2");
    spec->SetDeviceName("Other");
    EXPECT_EQ(spec->GetDeviceName(), "Other");
}

TEST(CxF3ColorSpecification, SerialNumberCannotBeCleared) {
    const SpecPtr spec = fresh();
    spec->SetDeviceSerialNumber("");
    EXPECT_FALSE(measurement(spec).isset_Device());
    EXPECT_EQ(spec->GetDeviceSerialNumber(), "");

    spec->SetDeviceSerialNumber("SN-0042");
    ASSERT_TRUE(measurement(spec).isset_Device());
    EXPECT_EQ(measurement(spec).get_Device()->get_SerialNumber(), L"SN-0042");
    EXPECT_EQ(spec->GetDeviceSerialNumber(), "SN-0042");
    spec->SetDeviceSerialNumber("");
    EXPECT_EQ(spec->GetDeviceSerialNumber(), "SN-0042");
}

TEST(CxF3ColorSpecification, DeviceWithoutTheValueGivesEmpty) {
    const SpecPtr spec = fresh();
    spec->SetDeviceSerialNumber("1");
    EXPECT_EQ(spec->GetDeviceName(), "");
    const SpecPtr other = fresh();
    other->SetDeviceName("Name");
    EXPECT_EQ(other->GetDeviceSerialNumber(), "");
    // A device made by SetFilter holds neither.
    const SpecPtr filtered = fresh();
    filtered->SetFilter("M1");
    EXPECT_EQ(filtered->GetDeviceName(), "");
    EXPECT_EQ(filtered->GetDeviceSerialNumber(), "");
}

TEST(CxF3ColorSpecification, DeviceFieldsOfALoadedSpecification) {
    cc::ColorSpecification source = single_angle_source();
    source.get_MeasurementSpec().get_Device().set_Model(L"i1");
    source.get_MeasurementSpec().get_Device().set_SerialNumber(L"778");
    source.get_MeasurementSpec().get_Device().set_Manufacturer(L"Maker");
    const SpecPtr spec = loaded(source);
    EXPECT_EQ(spec->GetDeviceName(), "i1");
    EXPECT_EQ(spec->GetDeviceSerialNumber(), "778");
}

TEST(CxF3ColorSpecification, DeviceGettersDoNotCreateTheDevice) {
    const SpecPtr spec = fresh();
    spec->GetDeviceName();
    spec->GetDeviceSerialNumber();
    EXPECT_FALSE(measurement(spec).isset_Device());
}

// ---------------------------------------------------------------- illuminant

struct IlluminantRow {
    const char *word;
    const wchar_t *stored;
    const char *read_back;
};

class CxF3ColorSpecificationSetIlluminant : public ::testing::TestWithParam<IlluminantRow> {};

TEST_P(CxF3ColorSpecificationSetIlluminant, WritesTheSchemaIlluminant) {
    const IlluminantRow &row = GetParam();
    const SpecPtr spec = fresh();
    spec->SetIlluminant(row.word);
    const cc::anon_Illuminant *p_group = tristimulus(spec).get_anon_Illuminant();
    ASSERT_NE(p_group, nullptr);
    ASSERT_EQ(p_group->getchosen(), cc::anon_Illuminant::EIlluminant);
    EXPECT_EQ(p_group->get_Illuminant()->get_value(), row.stored);
    EXPECT_EQ(spec->GetIlluminant(), row.read_back);
}

INSTANTIATE_TEST_SUITE_P(
    EveryWord, CxF3ColorSpecificationSetIlluminant,
    ::testing::Values(IlluminantRow{"A", L"A", "A"}, IlluminantRow{"C", L"C", "C"},
                      IlluminantRow{"D50", L"D50", "D50"}, IlluminantRow{"D55", L"D55", "D55"},
                      IlluminantRow{"D65", L"D65", "D65"}, IlluminantRow{"D75", L"D75", "D75"},
                      IlluminantRow{"F2", L"F2", "F2"}, IlluminantRow{"FL2", L"F2", "F2"},
                      IlluminantRow{"F3", L"F3", "F3"}, IlluminantRow{"FL3", L"F3", "F3"},
                      IlluminantRow{"F7", L"F7", "F7"}, IlluminantRow{"FL7", L"F7", "F7"},
                      IlluminantRow{"F9", L"F9", "F9"}, IlluminantRow{"FL9", L"F9", "F9"},
                      IlluminantRow{"F11", L"F11", "F11"}, IlluminantRow{"FL11", L"F11", "F11"},
                      IlluminantRow{"F12", L"F12", "F12"}, IlluminantRow{"FL12", L"F12", "F12"},
                      // Anything else is "Custom", also schema values outside the table.
                      IlluminantRow{"B", L"Custom", "Custom"}, IlluminantRow{"E", L"Custom", "Custom"},
                      IlluminantRow{"D60", L"Custom", "Custom"}, IlluminantRow{"F10", L"Custom", "Custom"},
                      IlluminantRow{"TL84", L"Custom", "Custom"}, IlluminantRow{"9300", L"Custom", "Custom"},
                      IlluminantRow{"FL10", L"Custom", "Custom"}, IlluminantRow{"d50", L"Custom", "Custom"},
                      IlluminantRow{"D50 ", L"Custom", "Custom"}, IlluminantRow{"", L"Custom", "Custom"},
                      IlluminantRow{"Custom", L"Custom", "Custom"}));

TEST(CxF3ColorSpecification, SetIlluminantReplacesACustomIlluminant) {
    cc::ColorSpecification source = single_angle_source();
    source.get_TristimulusSpec().get_anon_Illuminant().get_CustomIlluminant().set_Name(L"Lamp");
    const SpecPtr spec = loaded(source);
    EXPECT_EQ(spec->GetIlluminant(), "");
    spec->SetIlluminant("D50");
    EXPECT_EQ(tristimulus(spec).get_anon_Illuminant()->getchosen(), cc::anon_Illuminant::EIlluminant);
}

TEST(CxF3ColorSpecification, LoadedSpecificationAlwaysWritesCustom) {
    // The illuminant table is filled only by the default construction.
    const SpecPtr spec = loaded(single_angle_source());
    EXPECT_TRUE(body(spec).illuminants.empty());
    for (const char *p_word : {"D50", "D65", "A", "FL2", "F12"}) {
        spec->SetIlluminant(p_word);
        EXPECT_EQ(tristimulus(spec).get_anon_Illuminant()->get_Illuminant()->get_value(), L"Custom") << p_word;
        EXPECT_EQ(spec->GetIlluminant(), "Custom") << p_word;
    }
}

struct StoredIlluminantRow {
    const wchar_t *stored;
    const char *word;
};

class CxF3ColorSpecificationGetIlluminant : public ::testing::TestWithParam<StoredIlluminantRow> {};

TEST_P(CxF3ColorSpecificationGetIlluminant, ReversesTheSchemaValue) {
    const StoredIlluminantRow &row = GetParam();
    cc::ColorSpecification source = single_angle_source();
    source.get_TristimulusSpec().get_anon_Illuminant().get_Illuminant().set_value(row.stored);
    EXPECT_EQ(loaded(source)->GetIlluminant(), row.word);
}

INSTANTIATE_TEST_SUITE_P(
    EverySchemaValue, CxF3ColorSpecificationGetIlluminant,
    ::testing::Values(StoredIlluminantRow{L"A", "A"}, StoredIlluminantRow{L"B", "Custom"},
                      StoredIlluminantRow{L"C", "C"}, StoredIlluminantRow{L"D50", "D50"},
                      StoredIlluminantRow{L"D55", "D55"}, StoredIlluminantRow{L"D60", ""},
                      StoredIlluminantRow{L"D65", "D65"}, StoredIlluminantRow{L"D75", "D75"},
                      StoredIlluminantRow{L"E", "Custom"}, StoredIlluminantRow{L"F2", "F2"},
                      StoredIlluminantRow{L"F3", "F3"}, StoredIlluminantRow{L"F7", "F7"},
                      StoredIlluminantRow{L"F9", "F9"}, StoredIlluminantRow{L"F10", ""},
                      StoredIlluminantRow{L"F11", "F11"}, StoredIlluminantRow{L"F12", "F12"},
                      StoredIlluminantRow{L"9300", "Custom"}, StoredIlluminantRow{L"TL84", ""},
                      StoredIlluminantRow{L"TL83", ""}, StoredIlluminantRow{L"UL30", ""},
                      StoredIlluminantRow{L"UL35", ""}, StoredIlluminantRow{L"UL50", ""},
                      StoredIlluminantRow{L"Custom", "Custom"}, StoredIlluminantRow{L"FL2", ""},
                      StoredIlluminantRow{L"", ""}));

TEST(CxF3ColorSpecification, GetIlluminantOfACustomIlluminantElementIsEmpty) {
    cc::ColorSpecification source = single_angle_source();
    source.get_TristimulusSpec().get_anon_Illuminant().get_CustomIlluminant().set_Name(L"Custom");
    EXPECT_EQ(loaded(source)->GetIlluminant(), "");
}

TEST(CxF3ColorSpecification, GetIlluminantWithoutTristimulusIsEmpty) {
    cc::ColorSpecification source = single_angle_source();
    EXPECT_FALSE(source.isset_TristimulusSpec());
    const SpecPtr spec = loaded(source);
    EXPECT_EQ(spec->GetIlluminant(), "");
    EXPECT_EQ(tristimulus(spec).get_anon_Illuminant(), nullptr);
    // An empty group (nothing chosen).
    source.get_TristimulusSpec().get_anon_Illuminant();
    EXPECT_EQ(loaded(source)->GetIlluminant(), "");
}

// ---------------------------------------------------------------- observer

struct ObserverRow {
    std::string word;
    const wchar_t *stored;
    std::string read_back;
};

class CxF3ColorSpecificationObserver : public ::testing::TestWithParam<ObserverRow> {};

TEST_P(CxF3ColorSpecificationObserver, WritesTheSchemaObserver) {
    const ObserverRow &row = GetParam();
    const SpecPtr spec = fresh();
    spec->SetObserver(row.word);
    ASSERT_NE(tristimulus(spec).get_Observer(), nullptr);
    EXPECT_EQ(tristimulus(spec).get_Observer()->get_value(), row.stored);
    EXPECT_EQ(spec->GetObserver(), row.read_back);
}

INSTANTIATE_TEST_SUITE_P(Words, CxF3ColorSpecificationObserver,
                         ::testing::Values(ObserverRow{"2", L"2_Degree", "2" + k_degree},
                                           ObserverRow{"2" + k_degree, L"2_Degree", "2" + k_degree},
                                           ObserverRow{"10", L"10_Degree", "10" + k_degree},
                                           ObserverRow{"10" + k_degree, L"10_Degree", "10" + k_degree},
                                           ObserverRow{"", L"Custom_CMF", ""},
                                           ObserverRow{"15", L"Custom_CMF", ""},
                                           ObserverRow{"2 ", L"Custom_CMF", ""},
                                           ObserverRow{"2_Degree", L"Custom_CMF", ""},
                                           ObserverRow{k_degree, L"Custom_CMF", ""},
                                           // The lone single-byte sign is not the degree sign here.
                                           ObserverRow{"2\xB0", L"Custom_CMF", ""}));

TEST(CxF3ColorSpecification, SetObserverTwoGivesTheDegreeForm) {
    const SpecPtr spec = fresh();
    spec->SetObserver("2");
    EXPECT_EQ(spec->GetObserver(), "2\xC2\xB0");
}

TEST(CxF3ColorSpecification, ObserverRoundTripKeepsTheValue) {
    for (const char *p_word : {"2", "10"}) {
        const SpecPtr spec = fresh();
        spec->SetObserver(p_word);
        const std::wstring before = tristimulus(spec).get_Observer()->get_value();
        spec->SetObserver(spec->GetObserver());
        EXPECT_EQ(tristimulus(spec).get_Observer()->get_value(), before);
    }
}

TEST(CxF3ColorSpecification, GetObserverOfStoredValues) {
    for (const auto &row : std::vector<std::pair<std::wstring, std::string>>{
             {L"2_Degree", "2" + k_degree}, {L"10_Degree", "10" + k_degree}, {L"Custom_CMF", ""}, {L"", ""}}) {
        cc::ColorSpecification source = single_angle_source();
        source.get_TristimulusSpec().get_Observer().set_value(row.first);
        EXPECT_EQ(loaded(source)->GetObserver(), row.second);
    }
    EXPECT_EQ(loaded(single_angle_source())->GetObserver(), "");
}

TEST(CxF3ColorSpecification, IlluminantObserverAndMethodMakeTheTristimulusComplete) {
    const SpecPtr spec = fresh();
    spec->SetIlluminant("D50");
    EXPECT_FALSE(tristimulus(spec).is_occurs_ok());
    spec->SetObserver("2");
    EXPECT_TRUE(tristimulus(spec).is_occurs_ok());
}

// ---------------------------------------------------------------- wavelength range

TEST(CxF3ColorSpecification, WavelengthRangeSetAndGet) {
    const SpecPtr spec = fresh();
    spec->SetStartWL(400);
    spec->SetWLIncrement(20);
    EXPECT_EQ(spec->GetStartWL(), 400);
    EXPECT_EQ(spec->GetWLIncrement(), 20);
    EXPECT_EQ(measurement(spec).get_WavelengthRange()->get_StartWL(), 400);
    EXPECT_EQ(measurement(spec).get_WavelengthRange()->get_Increment(), 20);
}

TEST(CxF3ColorSpecification, WavelengthRangeAbsentReadsZeroAndIsCreatedBySetting) {
    const SpecPtr spec = loaded(single_angle_source());
    EXPECT_EQ(spec->GetStartWL(), 0);
    EXPECT_EQ(spec->GetWLIncrement(), 0);
    EXPECT_FALSE(measurement(spec).isset_WavelengthRange());

    spec->SetWLIncrement(5);
    EXPECT_TRUE(measurement(spec).isset_WavelengthRange());
    EXPECT_EQ(spec->GetWLIncrement(), 5);
    EXPECT_EQ(spec->GetStartWL(), 0);
    spec->SetStartWL(360);
    EXPECT_EQ(spec->GetStartWL(), 360);

    const SpecPtr other = loaded(single_angle_source());
    other->SetStartWL(390);
    EXPECT_EQ(other->GetStartWL(), 390);
    EXPECT_EQ(other->GetWLIncrement(), 0);
}

// ---------------------------------------------------------------- loaded specifications

TEST(CxF3ColorSpecification, LoadedSpecificationIsACopy) {
    cc::ColorSpecification source = single_angle_source();
    source.get_MeasurementSpec().get_Device().set_Model(L"Before");
    source.get_TristimulusSpec().get_Observer().set_value(L"10_Degree");
    source.get_TristimulusSpec().set_Method(L"E308_Table5");
    const SpecPtr spec = loaded(source);
    EXPECT_EQ(spec->GetId(), "loaded");
    EXPECT_EQ(spec->GetObserver(), "10" + k_degree);
    EXPECT_EQ(tristimulus(spec).get_Method(), L"E308_Table5");

    spec->SetDeviceName("After");
    spec->SetId("changed");
    spec->SetObserver("2");
    spec->SetFilter("D8i");
    EXPECT_EQ(source.get_MeasurementSpec().get_Device().get_Model(), L"Before");
    EXPECT_EQ(source.get_Id(), L"loaded");
    EXPECT_EQ(source.get_TristimulusSpec().get_Observer().get_value(), L"10_Degree");
    EXPECT_EQ(source.get_MeasurementSpec().get_GeometryChoice().getchosen(), Geometry::ESingleAngle);
}

TEST(CxF3ColorSpecification, LoadedSpecificationWithoutTristimulusGetsAnEmptyOne) {
    const cc::ColorSpecification source = single_angle_source();
    const SpecPtr spec = loaded(source);
    ASSERT_TRUE(body(spec).tristimulusSpec);
    EXPECT_EQ(tristimulus(spec).get_Method(), L"");
    EXPECT_EQ(tristimulus(spec).get_Observer(), nullptr);
    // No defaults of a new specification either.
    EXPECT_FALSE(measurement(spec).isset_WavelengthRange());
}

TEST(CxF3ColorSpecification, LoadedSpecificationWithoutMeasurementSpecGetsOne) {
    cc::ColorSpecification source;
    source.set_Id(L"bare");
    const SpecPtr spec = loaded(source);
    ASSERT_TRUE(body(spec).measurementSpec);
    EXPECT_EQ(measurement(spec).get_MeasurementType(), L"");
    EXPECT_EQ(spec->GetMeasurementType(), CxF3MeasurementOther);
    const cc::ColorSpecification &r_specification = *body(spec).specification;
    EXPECT_NE(r_specification.get_MeasurementSpec(), nullptr);
}

// ---------------------------------------------------------------- handles that refer to nothing

TEST(CxF3ColorSpecification, EmptyWrapperThrowsLogicErrorOnEveryMember) {
    CxF3ColorSpecificationInterface spec((boost::shared_ptr<CxF3ColorSpecificationWrapper>()));
    EXPECT_FALSE(spec.GetWrapper());
    EXPECT_THROW(spec.SetId("x"), std::logic_error);
    EXPECT_THROW(spec.GetId(), std::logic_error);
    EXPECT_THROW(spec.GetMeasurementType(), std::logic_error);
    EXPECT_THROW(spec.SetFilter("M1"), std::logic_error);
    EXPECT_THROW(spec.GetFilter(), std::logic_error);
    EXPECT_THROW(spec.SetCalibrationStandard(CxF3CalibrationKLMB, CxF3VerimetraActive), std::logic_error);
    EXPECT_THROW(spec.GetCalibrationStandard(), std::logic_error);
    EXPECT_THROW(spec.GetVerimetraStatus(), std::logic_error);
    EXPECT_THROW(spec.SetDeviceSerialNumber("1"), std::logic_error);
    EXPECT_THROW(spec.GetDeviceSerialNumber(), std::logic_error);
    EXPECT_THROW(spec.SetDeviceName("n"), std::logic_error);
    EXPECT_THROW(spec.GetDeviceName(), std::logic_error);
    EXPECT_THROW(spec.SetIlluminant("D50"), std::logic_error);
    EXPECT_THROW(spec.GetIlluminant(), std::logic_error);
    EXPECT_THROW(spec.SetObserver("2"), std::logic_error);
    EXPECT_THROW(spec.GetObserver(), std::logic_error);
    EXPECT_THROW(spec.SetStartWL(380), std::logic_error);
    EXPECT_THROW(spec.GetStartWL(), std::logic_error);
    EXPECT_THROW(spec.SetWLIncrement(10), std::logic_error);
    EXPECT_THROW(spec.GetWLIncrement(), std::logic_error);
    // Empty texts too: the handle is checked before the text.
    EXPECT_THROW(spec.SetDeviceName(""), std::logic_error);
    EXPECT_THROW(spec.SetDeviceSerialNumber(""), std::logic_error);
    EXPECT_THROW(spec.SetCalibrationStandard(CxF3CalibrationUnknown, CxF3VerimetraDisabled), std::logic_error);
}

TEST(CxF3ColorSpecification, EmptyWrapperErrorIsNotTheRuntimeErrorOfGetFilter) {
    CxF3ColorSpecificationInterface spec((boost::shared_ptr<CxF3ColorSpecificationWrapper>()));
    try {
        spec.GetFilter();
        FAIL() << "no exception";
    } catch (const std::runtime_error &) {
        FAIL() << "runtime_error instead of logic_error";
    } catch (const std::logic_error &r_error) {
        EXPECT_NE(std::string(r_error.what()).find("CxF3ColorSpecification"), std::string::npos);
    }
}

// ---------------------------------------------------------------- in a document

TEST(CxF3ColorSpecification, TypicalGeneratedId) {
    const boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    const SpecPtr spec = fresh();
    spec->SetDeviceName("device");
    spec->SetDeviceSerialNumber("1234");
    spec->SetFilter("M1");
    spec->SetCalibrationStandard(CxF3CalibrationKLMB, CxF3VerimetraDisabled);
    spec->SetIlluminant("D50");
    spec->SetObserver("2");
    EXPECT_EQ(document->AddColorSpecification(spec, true), "CSdevice1234M1-VT-D50-2");
}

TEST(CxF3ColorSpecification, AddingTheSameSpecificationTwiceKeepsOneEntry) {
    const boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    const SpecPtr spec = fresh();
    spec->SetDeviceName("device");
    spec->SetFilter("D8i");
    spec->SetCalibrationStandard(CxF3CalibrationNIST, CxF3VerimetraActive);
    spec->SetIlluminant("D65");
    spec->SetObserver("10");
    const std::string first = document->AddColorSpecification(spec, true);
    const std::string second = document->AddColorSpecification(spec, true);
    EXPECT_EQ(first, second);
    EXPECT_EQ(first, "CSdeviceD8i-NISTVTD65-10");
    EXPECT_TRUE(document->IsExistingColorSpecification(first));
    EXPECT_EQ(document->GetColorSpecifications().size(), 1u);

    const SpecPtr copy = document->GetColorSpecification(first);
    EXPECT_EQ(copy->GetId(), first);
    EXPECT_EQ(copy->GetFilter(), "D8i");
    EXPECT_EQ(copy->GetObserver(), "10" + k_degree);
    EXPECT_EQ(copy->GetCalibrationStandard(), CxF3CalibrationNIST);
    EXPECT_EQ(copy->GetVerimetraStatus(), CxF3VerimetraActive);
    EXPECT_EQ(copy->GetDeviceName(), "device");
    // A copy from the document has no illuminant table.
    copy->SetIlluminant("D65");
    EXPECT_EQ(copy->GetIlluminant(), "Custom");
}

TEST(CxF3ColorSpecification, UnsupportedTypeThrowsOnlyWhenTheIdIsGenerated) {
    const boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    cc::ColorSpecification source = single_angle_source(L"Spectrum_Emissive");
    const SpecPtr spec = loaded(source);
    EXPECT_THROW(document->AddColorSpecification(spec, true), std::runtime_error);
    EXPECT_EQ(document->AddColorSpecification(spec, false), "loaded");
}

TEST(CxF3ColorSpecification, UnknownIdGivesAHandleOverNothing) {
    const boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    const SpecPtr spec = document->GetColorSpecification("missing");
    ASSERT_TRUE(spec);
    EXPECT_THROW(spec->GetId(), std::logic_error);
    EXPECT_THROW(spec->GetFilter(), std::logic_error);
}

} // namespace
