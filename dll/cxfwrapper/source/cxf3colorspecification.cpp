// CxF3ColorSpecification: a handle over one cc::ColorSpecification,
// its cc::MeasurementSpec and its cc::TristimulusSpec, spoken of in short
// condition, illuminant and observer words.
#include "cxf3colorspecificationwrapper.h"

#include "cxf3text.h"

#include <cstddef>
#include <map>
#include <stdexcept>

namespace {

// The degree sign of the narrow API. Narrow strings are UTF-8 here, so the
// single byte 0xB0 of the original code page becomes U+00B0 in UTF-8.
const char k_degree[] = "\xC2\xB0";

const char *const k_class_name = "CxF3ColorSpecification";

// Leading and trailing whitespace removed.
std::string trimmed(const std::string &ar_text) {
    const char *const p_space = " \t\n\r\f\v";
    const std::size_t first = ar_text.find_first_not_of(p_space);
    if (first == std::string::npos)
        return std::string();
    const std::size_t last = ar_text.find_last_not_of(p_space);
    return ar_text.substr(first, last - first + 1);
}

// The calibration element's text split at each "," with each part trimmed;
// empty for an absent or empty element.
std::vector<std::string> calibration_parts(const cc::MeasurementSpec &ar_spec) {
    std::vector<std::string> parts;
    if (!ar_spec.isset_CalibrationStandard())
        return parts;
    const std::string text = ToNarrow(ar_spec.get_CalibrationStandard());
    if (text.empty())
        return parts;
    std::size_t start = 0;
    for (;;) {
        const std::size_t comma = text.find(',', start);
        if (comma == std::string::npos) {
            parts.push_back(trimmed(text.substr(start)));
            break;
        }
        parts.push_back(trimmed(text.substr(start, comma - start)));
        start = comma + 1;
    }
    return parts;
}

// A single-angle geometry: annular, illumination 45, measurement 0.
cc::GeometryChoice single_angle_geometry() {
    cc::GeometryChoice geometry;
    cc::SingleAngleType &r_angle = geometry.get_SingleAngle();
    r_angle.setenum_SingleAngleConfiguration(cc::Eenum_SingleAngleConfiguration_Annular);
    r_angle.set_IlluminationAngle(45.0);
    r_angle.set_MeasurementAngle(0.0);
    return geometry;
}

cc::GeometryChoice sphere_geometry(cc::Eenum_SphereGeometry a_value) {
    cc::GeometryChoice geometry;
    geometry.setenum_SphereGeometry(a_value);
    return geometry;
}

} // namespace

// ---------------------------------------------------------------- wrapper

CxF3ColorSpecificationWrapper::CxF3ColorSpecificationWrapper()
    : specification(new cc::ColorSpecification()), measurementSpec(new cc::MeasurementSpec()),
      tristimulusSpec(new cc::TristimulusSpec()) {
    illuminants["A"] = cc::Eenum_Illuminant_A;
    illuminants["C"] = cc::Eenum_Illuminant_C;
    illuminants["D50"] = cc::Eenum_Illuminant_D50;
    illuminants["D55"] = cc::Eenum_Illuminant_D55;
    illuminants["D65"] = cc::Eenum_Illuminant_D65;
    illuminants["D75"] = cc::Eenum_Illuminant_D75;
    illuminants["F2"] = cc::Eenum_Illuminant_F2;
    illuminants["FL2"] = cc::Eenum_Illuminant_F2;
    illuminants["F3"] = cc::Eenum_Illuminant_F3;
    illuminants["FL3"] = cc::Eenum_Illuminant_F3;
    illuminants["F7"] = cc::Eenum_Illuminant_F7;
    illuminants["FL7"] = cc::Eenum_Illuminant_F7;
    illuminants["F9"] = cc::Eenum_Illuminant_F9;
    illuminants["FL9"] = cc::Eenum_Illuminant_F9;
    illuminants["F11"] = cc::Eenum_Illuminant_F11;
    illuminants["FL11"] = cc::Eenum_Illuminant_F11;
    illuminants["F12"] = cc::Eenum_Illuminant_F12;
    illuminants["FL12"] = cc::Eenum_Illuminant_F12;

    measurementSpec->setenum_MeasurementType(cc::Eenum_MeasurementType_Spectrum_Reflectance);
    cc::WavelengthRange &r_range = measurementSpec->get_WavelengthRange();
    r_range.set_StartWL(380);
    r_range.set_Increment(10);
    tristimulusSpec->setenum_Method(cc::Eenum_Method_E308_Table6);
}

CxF3ColorSpecificationWrapper::CxF3ColorSpecificationWrapper(const cc::ColorSpecification &ar_specification)
    : specification(new cc::ColorSpecification(ar_specification)) {
    // The copy's accessor makes a measurement spec where the source had none.
    measurementSpec.reset(new cc::MeasurementSpec(specification->get_MeasurementSpec()));
    const cc::ColorSpecification &r_source = *specification;
    if (const cc::TristimulusSpec *p_tristimulus = r_source.get_TristimulusSpec())
        tristimulusSpec.reset(new cc::TristimulusSpec(*p_tristimulus));
    else
        tristimulusSpec.reset(new cc::TristimulusSpec());
    // The illuminant table stays empty.
}

// ---------------------------------------------------------------- statics

boost::shared_ptr<CxF3ColorSpecification> CxF3ColorSpecification::CreateCxFColorSpecification() {
    boost::shared_ptr<CxF3ColorSpecificationWrapper> wrapper(new CxF3ColorSpecificationWrapper());
    return boost::shared_ptr<CxF3ColorSpecification>(new CxF3ColorSpecificationInterface(wrapper));
}

std::string CxF3ColorSpecification::GetCalibrationStandardString(CxF3CalibrationStandard a_standard) {
    switch (a_standard) {
    case CxF3CalibrationKLMB:
        return "KLMB";
    case CxF3CalibrationKLMA:
        return "KLMA";
    case CxF3CalibrationKLME:
        return "KLME";
    case CxF3CalibrationKLMD:
        return "KLMD";
    case CxF3CalibrationKLMC:
        return "KLMC";
    case CxF3CalibrationNIST:
        return "NIST";
    case CxF3CalibrationDCI:
        return "DCI";
    default:
        return std::string();
    }
}

std::string CxF3ColorSpecification::GetVerimetraStandardString(CxF3VerimetraStatus a_status) {
    switch (a_status) {
    case CxF3VerimetraExpired:
        return "Verimetra_Expired";
    case CxF3VerimetraActive:
        return "Verimetra";
    default:
        // Nothing is written for disabled, although the read side knows its word.
        return std::string();
    }
}

CxF3CalibrationStandard CxF3ColorSpecification::CalibrationStandardFromString(
    const std::vector<std::string> &ar_parts) {
    // Built once on first use; lives until the process ends.
    static const std::map<std::string, CxF3CalibrationStandard> s_table = {
        {"KLMB", CxF3CalibrationKLMB}, {"KLMA", CxF3CalibrationKLMA}, {"KLME", CxF3CalibrationKLME},
        {"KLMD", CxF3CalibrationKLMD}, {"KLMC", CxF3CalibrationKLMC}, {"NIST", CxF3CalibrationNIST},
        {"DCI", CxF3CalibrationDCI}};
    for (const std::string &r_part : ar_parts) {
        const auto found = s_table.find(r_part);
        if (found != s_table.end())
            return found->second;
    }
    return CxF3CalibrationUnknown;
}

CxF3VerimetraStatus CxF3ColorSpecification::VerimetraStatusFromString(const std::vector<std::string> &ar_parts) {
    static const std::map<std::string, CxF3VerimetraStatus> s_table = {
        {"Verimetra", CxF3VerimetraActive},
        {"Verimetrated", CxF3VerimetraActive},
        {"Verimetra_Expired", CxF3VerimetraExpired},
        {"Verimetra_Disabled", CxF3VerimetraDisabled}};
    for (const std::string &r_part : ar_parts) {
        const auto found = s_table.find(r_part);
        if (found != s_table.end())
            return found->second;
    }
    return CxF3VerimetraDisabled;
}

// ---------------------------------------------------------------- interface

CxF3ColorSpecificationInterface::CxF3ColorSpecificationInterface(
    const boost::shared_ptr<CxF3ColorSpecificationWrapper> &ar_wrapper)
    : p_wrapper(ar_wrapper) {}

CxF3ColorSpecificationWrapper &CxF3ColorSpecificationInterface::p_body() const {
    return RequireTarget(p_wrapper, k_class_name);
}

void CxF3ColorSpecificationInterface::SetId(const std::string &ar_id) {
    RequireTarget(p_body().specification, k_class_name).set_Id(ToWide(ar_id));
}

std::string CxF3ColorSpecificationInterface::GetId() const {
    const cc::ColorSpecification &r_spec = RequireTarget(p_body().specification, k_class_name);
    return ToNarrow(r_spec.get_Id());
}

CxF3MeasurementType CxF3ColorSpecificationInterface::GetMeasurementType() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    const std::wstring &r_type = r_spec.get_MeasurementType();
    if (r_type == L"Spectrum_Reflectance" || r_type == L"Spectrum_Transmittance")
        return CxF3MeasurementSpectral;
    if (r_type == L"Colorimetric_Reflectance")
        return CxF3MeasurementColorimetric;
    return CxF3MeasurementOther;
}

void CxF3ColorSpecificationInterface::SetFilter(const std::string &ar_word) {
    cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);

    cc::GeometryChoice geometry;
    const wchar_t *p_illumination = nullptr; // null: left as it is
    bool polarization = false;
    const wchar_t *p_filter = L"Filter_None";

    if (ar_word == "No" || ar_word == "M0") {
        geometry = single_angle_geometry();
        p_illumination = L"M0_Incandescent";
    } else if (ar_word == "D65" || ar_word == "M1") {
        geometry = single_angle_geometry();
        p_illumination = L"M1_Daylight";
        p_filter = L"Filter_UVD65";
    } else if (ar_word == "UVCut" || ar_word == "M2") {
        geometry = single_angle_geometry();
        p_illumination = L"M2_UVExcluded";
        p_filter = L"Filter_UVExcluded";
    } else if (ar_word == "Pol" || ar_word == "M3") {
        geometry = single_angle_geometry();
        p_illumination = L"M3_Polarized";
        polarization = true;
    } else if (ar_word == "D8i") {
        geometry = sphere_geometry(cc::Eenum_SphereGeometry_Specular_Included);
        p_illumination = L"Flash";
    } else if (ar_word == "D8e") {
        geometry = sphere_geometry(cc::Eenum_SphereGeometry_Specular_Excluded);
        p_illumination = L"Flash";
    } else if (ar_word == "D8t") {
        geometry = sphere_geometry(cc::Eenum_SphereGeometry_Specular_Included);
        p_illumination = L"Flash";
        r_spec.setenum_MeasurementType(cc::Eenum_MeasurementType_Spectrum_Transmittance);
    }
    // Any other word: an empty geometry, the illumination unchanged.

    r_spec.assign_GeometryChoice(geometry);
    cc::Device &r_device = r_spec.get_Device();
    if (p_illumination)
        r_device.get_DeviceIllumination().set_value(p_illumination);
    r_device.set_DevicePolarization(polarization);
    r_device.get_DeviceFilter().set_value(p_filter);
}

std::string CxF3ColorSpecificationInterface::GetFilter() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);

    const std::wstring &r_type = r_spec.get_MeasurementType();
    if (r_type == L"Spectrum_Transmittance" || r_type == L"Spectrum_TotalTransmittance")
        return "D8t";
    if (r_type != L"Spectrum_Reflectance" && r_type != L"Colorimetric_Reflectance")
        throw std::runtime_error("Unsupported measurement specification: " + ToNarrow(r_type));

    const cc::GeometryChoice *p_geometry = r_spec.get_GeometryChoice();
    if (!p_geometry)
        return "M0";

    if (p_geometry->getchosen() == cc::GeometryChoiceType::ESphereGeometry) {
        const std::wstring sphere = p_geometry->get_SphereGeometry();
        if (sphere == L"Specular_Included")
            return "D8i";
        if (sphere == L"Specular_Excluded")
            return "D8e";
        return "M0";
    }

    if (p_geometry->getchosen() == cc::GeometryChoiceType::ESingleAngle) {
        const cc::Device *p_device = r_spec.get_Device();
        if (!p_device)
            return "M0";
        if (const cc::DeviceIllumination *p_illumination = p_device->get_DeviceIllumination()) {
            const std::wstring &r_value = p_illumination->get_value();
            if (r_value == L"M0_Incandescent")
                return "M0";
            if (r_value == L"M1_Daylight")
                return "M1";
            if (r_value == L"M2_UVExcluded")
                return "M2";
            if (r_value == L"M3_Polarized")
                return "M3";
        }
        if (p_device->isset_DevicePolarization() && p_device->get_DevicePolarization())
            return "M3";
        if (const cc::DeviceFilterType *p_filter = p_device->get_DeviceFilter()) {
            const std::wstring &r_value = p_filter->get_value();
            if (r_value == L"Filter_None")
                return "M0";
            if (r_value == L"Filter_UVExcluded" || r_value == L"Filter_Partial")
                return "M2";
            if (r_value == L"Filter_UVD65")
                return "M1";
        }
        return "M0";
    }

    return "M0";
}

void CxF3ColorSpecificationInterface::SetCalibrationStandard(CxF3CalibrationStandard a_standard,
                                                             CxF3VerimetraStatus a_status) {
    cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    const std::string standard = GetCalibrationStandardString(a_standard);
    const std::string status = GetVerimetraStandardString(a_status);
    std::string text;
    if (!standard.empty() && !status.empty())
        text = standard + "," + status;
    else if (!standard.empty())
        text = standard;
    else
        text = status;
    if (text.empty())
        return; // the old value stays
    r_spec.set_CalibrationStandard(ToWide(text));
}

CxF3CalibrationStandard CxF3ColorSpecificationInterface::GetCalibrationStandard() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    return CalibrationStandardFromString(calibration_parts(r_spec));
}

CxF3VerimetraStatus CxF3ColorSpecificationInterface::GetVerimetraStatus() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    return VerimetraStatusFromString(calibration_parts(r_spec));
}

void CxF3ColorSpecificationInterface::SetDeviceSerialNumber(const std::string &ar_serial) {
    cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    if (ar_serial.empty())
        return;
    r_spec.get_Device().set_SerialNumber(ToWide(ar_serial));
}

std::string CxF3ColorSpecificationInterface::GetDeviceSerialNumber() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    const cc::Device *p_device = r_spec.get_Device();
    if (!p_device || !p_device->isset_SerialNumber())
        return std::string();
    return ToNarrow(p_device->get_SerialNumber());
}

void CxF3ColorSpecificationInterface::SetDeviceName(const std::string &ar_name) {
    cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    if (ar_name.empty())
        return;
    // The device's name is its model.
    r_spec.get_Device().set_Model(ToWide(ar_name));
}

std::string CxF3ColorSpecificationInterface::GetDeviceName() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    const cc::Device *p_device = r_spec.get_Device();
    if (!p_device || !p_device->isset_Model())
        return std::string();
    return ToNarrow(p_device->get_Model());
}

void CxF3ColorSpecificationInterface::SetIlluminant(const std::string &ar_word) {
    CxF3ColorSpecificationWrapper &r_body = p_body();
    cc::TristimulusSpec &r_spec = RequireTarget(r_body.tristimulusSpec, k_class_name);
    cc::Eenum_Illuminant value = cc::Eenum_Illuminant_Custom;
    const auto found = r_body.illuminants.find(ar_word);
    if (found != r_body.illuminants.end())
        value = found->second;
    cc::Illuminant illuminant;
    illuminant.setenum_value(value);
    r_spec.get_anon_Illuminant().assign_Illuminant(illuminant);
}

std::string CxF3ColorSpecificationInterface::GetIlluminant() const {
    const cc::TristimulusSpec &r_spec = RequireTarget(p_body().tristimulusSpec, k_class_name);
    const cc::anon_Illuminant *p_group = r_spec.get_anon_Illuminant();
    if (!p_group)
        return std::string();
    const cc::Illuminant *p_illuminant = p_group->get_Illuminant();
    if (!p_illuminant)
        return std::string(); // none, or a custom illuminant element
    static const wchar_t *const s_own[] = {L"A",  L"C",  L"D50", L"D55", L"D65", L"D75",
                                           L"F2", L"F3", L"F7",  L"F9",  L"F11", L"F12"};
    static const wchar_t *const s_custom[] = {L"B", L"E", L"9300", L"Custom"};
    const std::wstring &r_value = p_illuminant->get_value();
    for (const wchar_t *p_word : s_own)
        if (r_value == p_word)
            return ToNarrow(r_value);
    for (const wchar_t *p_word : s_custom)
        if (r_value == p_word)
            return "Custom";
    return std::string();
}

void CxF3ColorSpecificationInterface::SetObserver(const std::string &ar_word) {
    cc::TristimulusSpec &r_spec = RequireTarget(p_body().tristimulusSpec, k_class_name);
    cc::Eenum_Observer value = cc::Eenum_Observer_Custom_CMF;
    if (ar_word == std::string("2") + k_degree || ar_word == "2")
        value = cc::Eenum_Observer_2_Degree;
    else if (ar_word == std::string("10") + k_degree || ar_word == "10")
        value = cc::Eenum_Observer_10_Degree;
    r_spec.get_Observer().setenum_value(value);
}

std::string CxF3ColorSpecificationInterface::GetObserver() const {
    const cc::TristimulusSpec &r_spec = RequireTarget(p_body().tristimulusSpec, k_class_name);
    const cc::Observer *p_observer = r_spec.get_Observer();
    if (!p_observer)
        return std::string();
    const std::wstring &r_value = p_observer->get_value();
    if (r_value == L"2_Degree")
        return std::string("2") + k_degree;
    if (r_value == L"10_Degree")
        return std::string("10") + k_degree;
    return std::string();
}

void CxF3ColorSpecificationInterface::SetStartWL(int a_nm) {
    cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    r_spec.get_WavelengthRange().set_StartWL(static_cast<unsigned short>(a_nm));
}

int CxF3ColorSpecificationInterface::GetStartWL() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    const cc::WavelengthRange *p_range = r_spec.get_WavelengthRange();
    return p_range ? static_cast<int>(p_range->get_StartWL()) : 0;
}

void CxF3ColorSpecificationInterface::SetWLIncrement(int a_nm) {
    cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    r_spec.get_WavelengthRange().set_Increment(static_cast<short>(a_nm));
}

int CxF3ColorSpecificationInterface::GetWLIncrement() const {
    const cc::MeasurementSpec &r_spec = RequireTarget(p_body().measurementSpec, k_class_name);
    const cc::WavelengthRange *p_range = r_spec.get_WavelengthRange();
    return p_range ? static_cast<int>(p_range->get_Increment()) : 0;
}
