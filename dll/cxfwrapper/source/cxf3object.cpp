// CxF3Object: a handle over one cc::Object and the working copies of the
// value collections that CxF3::AddObject copies into it.
#include "cxf3objectwrapper.h"

#include "cxf3colorrecipewrapper.h"
#include "cxf3text.h"
#include "cxf3tolerancelabels.h"

#include <lmx/lmxtypes.h>

#include <cstddef>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

// ---------------------------------------------------------------- wrapper

namespace {

// A copy of an optional child of a loaded object; a new empty one when the
// object has none.
template <typename T> boost::shared_ptr<T> CopyOrNew(const T *ap_item) {
    return boost::shared_ptr<T>(ap_item ? new T(*ap_item) : new T());
}

bool HasAnyMember(const cc::PhysicalAttributes &ar_attributes) {
    return ar_attributes.isset_TargetType() || ar_attributes.isset_FinishType() ||
           ar_attributes.isset_SubstrateType() || ar_attributes.isset_Quantity() || ar_attributes.isset_Height() ||
           ar_attributes.isset_Width() || ar_attributes.isset_Length() || ar_attributes.isset_Thickness() ||
           ar_attributes.size_Gloss() > 0 || ar_attributes.size_Opacity() > 0 ||
           ar_attributes.size_CustomAttributeString() > 0 || ar_attributes.size_CustomAttributeValue() > 0 ||
           ar_attributes.size_Image() > 0;
}

} // namespace

CxF3ObjectWrapper::CxF3ObjectWrapper()
    : object(new cc::Object()), colorValues(new cc::ColorValues()),
      colorDifferenceValues(new cc::ColorDifferenceValues()), deviceColorValues(new cc::DeviceColorValues()),
      physicalAttributes(new cc::PhysicalAttributes()) {}

CxF3ObjectWrapper::CxF3ObjectWrapper(const cc::Object &ar_object)
    : object(new cc::Object(ar_object)), colorValues(CopyOrNew(ar_object.get_ColorValues())),
      colorDifferenceValues(CopyOrNew(ar_object.get_ColorDifferenceValues())),
      deviceColorValues(CopyOrNew(ar_object.get_DeviceColorValues())),
      physicalAttributes(CopyOrNew(ar_object.get_PhysicalAttributes())) {
    for (std::size_t index = 0; index < ar_object.size_TagCollection(); ++index)
        tagCollections.push_back(
            boost::shared_ptr<cc::TagCollection>(new cc::TagCollection(ar_object.get_TagCollection(index))));
}

void CxF3ObjectWrapper::CopyValuesIntoObject() {
    // A value collection without items is written as an empty element, which
    // no reader accepts; such collections stay out of the object.
    if (colorValues->size_inner_ColorValues() > 0)
        object->assign_ColorValues(*colorValues);
    if (deviceColorValues->size_inner_DeviceColorValues() > 0)
        object->assign_DeviceColorValues(*deviceColorValues);
    if (colorDifferenceValues->size_inner_ColorDifferenceValues() > 0)
        object->assign_ColorDifferenceValues(*colorDifferenceValues);
    if (HasAnyMember(*physicalAttributes))
        object->assign_PhysicalAttributes(*physicalAttributes);

    // Each collection that holds tags goes to its own index. The places before
    // it that the object lacks take the (empty) collections of those indexes,
    // so that they keep their required name.
    for (std::size_t index = 0; index < tagCollections.size(); ++index) {
        if (tagCollections[index]->size_Tag() == 0)
            continue;
        while (object->size_TagCollection() < index)
            object->append_TagCollection(*tagCollections[object->size_TagCollection()]);
        if (object->size_TagCollection() == index)
            object->append_TagCollection(*tagCollections[index]);
        else
            object->assign_TagCollection(index, *tagCollections[index]);
    }
}

// ---------------------------------------------------------------- handle

boost::shared_ptr<CxF3Object> CxF3Object::CreateCxFObject() {
    return CxF3ObjectInterface::Handle(boost::shared_ptr<CxF3ObjectWrapper>(new CxF3ObjectWrapper()));
}

const std::string &CxF3Object::GetSampleTypeTag() {
    static const std::string k_name("SampleType");
    return k_name;
}

const std::string &CxF3Object::GetPaperTypeTag() {
    static const std::string k_name("PaperType");
    return k_name;
}

CxF3Object::CxF3Object(const boost::shared_ptr<CxF3ObjectInterface> &ar_interface) : p_interface(ar_interface) {}

CxF3ObjectWrapper &CxF3Object::p_wrapper() const {
    return RequireTarget(RequireTarget(p_interface, "CxF3Object").wrapper, "CxF3Object");
}

// ---------------------------------------------------------------- names, ids, type

void CxF3Object::SetName(const std::string &ar_name) { p_wrapper().object->set_Name(ToWide(ar_name)); }

std::string CxF3Object::GetName() const { return ToNarrow(p_wrapper().object->get_Name()); }

void CxF3Object::SetInfo(const std::string &ar_info) { p_wrapper().object->set_Comment(ToWide(ar_info)); }

std::string CxF3Object::GetInfo() const { return ToNarrow(p_wrapper().object->get_Comment()); }

void CxF3Object::SetId(const std::string &ar_id) { p_wrapper().object->set_Id(ToWide(ar_id)); }

void CxF3Object::SetId(int a_id) { SetId(std::to_string(a_id)); }

std::string CxF3Object::GetId() const { return ToNarrow(p_wrapper().object->get_Id()); }

void CxF3Object::SetCreationDate(const std::string &ar_date) {
    p_wrapper().object->set_CreationDate(lmx::c_datetime(ar_date));
}

std::string CxF3Object::GetCreationDate() const { return p_wrapper().object->get_CreationDate().get_as_string(); }

void CxF3Object::SetGUID(const std::string &ar_guid) { p_wrapper().object->set_GUID(ToWide(ar_guid)); }

std::string CxF3Object::GetGUID() const { return ToNarrow(p_wrapper().object->get_GUID()); }

namespace {

const wchar_t *const k_lumivera_type = L"Lumivera";
const wchar_t *const k_unknown_type = L"Unknown";

// The words an object type is read from; a type is written as its first
// word. "Standard" and "Sample" come only from files of other applications.
struct ObjectTypeWord {
    const wchar_t *word;
    CxF3ObjectType type;
};

const ObjectTypeWord k_object_type_words[] = {
    {L"Target", CxF3ObjectTarget},       {L"Standard", CxF3ObjectTarget},
    {L"Trial", CxF3ObjectTrial},         {L"Sample", CxF3ObjectTrial},
    {L"Substrate", CxF3ObjectSubstrate}, {L"Colorant", CxF3ObjectColorant},
    {k_lumivera_type, CxF3ObjectLumivera},
};

} // namespace

void CxF3Object::SetObjectType(CxF3ObjectType a_type) {
    // A branded standard is made by AddLumiveraStandard alone; asked for
    // here, it is written as unknown like every value outside the table.
    const wchar_t *p_word = k_unknown_type;
    if (a_type != CxF3ObjectLumivera)
        for (const ObjectTypeWord &r_entry : k_object_type_words)
            if (r_entry.type == a_type) {
                p_word = r_entry.word;
                break;
            }
    p_wrapper().object->set_ObjectType(p_word);
}

CxF3ObjectType CxF3Object::GetObjectType() const {
    const std::wstring &r_stored = p_wrapper().object->get_ObjectType();
    for (const ObjectTypeWord &r_entry : k_object_type_words)
        if (r_stored == r_entry.word)
            return r_entry.type;
    return CxF3ObjectUnknown;
}

std::string CxF3Object::GetCxFObjectType() const { return ToNarrow(p_wrapper().object->get_ObjectType()); }

bool CxF3Object::AddLumiveraStandard(const std::string &ar_guid, unsigned long /*a_revision*/) {
    cc::Object &r_object = *p_wrapper().object;
    r_object.set_ObjectType(k_lumivera_type);
    r_object.set_GUID(ToWide(ar_guid));
    return true;
}

// ---------------------------------------------------------------- measured values

namespace {

// Reflectance values outside this range are kept but make the object invalid.
constexpr double k_min_reflectance = -0.1;
constexpr double k_max_reflectance = 2.0;
// Likewise for L*.
constexpr double k_min_lightness = -0.1;
constexpr double k_max_lightness = 110.0;
// Spectra added through this class start here; the step is the specification's.
constexpr unsigned short k_added_spectrum_start = 380;

const char *const k_invalid_reflectance = "Invalid reflectance value(s)";
const char *const k_invalid_lab = "Invalid Lab value";

// The values of one kind in the colour values, in order, e.g. with
// &cc::inner_ColorValues::get_ColorCIELab.
template <typename T>
std::vector<const T *> ValuesOfKind(const cc::ColorValues &ar_values,
                                    const T *(cc::inner_ColorValues::*ap_get)() const) {
    std::vector<const T *> found;
    for (std::size_t index = 0; index < ar_values.size_inner_ColorValues(); ++index)
        if (const T *p_value = (ar_values.get_inner_ColorValues(index).*ap_get)())
            found.push_back(p_value);
    return found;
}

std::vector<const cc::ReflectanceSpectrum *> Reflectances(const cc::ColorValues &ar_values) {
    return ValuesOfKind(ar_values, &cc::inner_ColorValues::get_ReflectanceSpectrum);
}

std::vector<const cc::ColorCIELab *> LabValues(const cc::ColorValues &ar_values) {
    return ValuesOfKind(ar_values, &cc::inner_ColorValues::get_ColorCIELab);
}

} // namespace

bool CxF3Object::AddReflectanceSpectrum(const std::vector<double> &ar_values, const std::string &ar_specification_id,
                                        const std::string &ar_name) {
    CxF3ObjectWrapper &r_wrapper = p_wrapper();
    cc::ReflectanceSpectrum spectrum;
    spectrum.set_ColorSpecification(ToWide(ar_specification_id));
    spectrum.set_Name(ToWide(ar_name));
    spectrum.set_StartWL(k_added_spectrum_start);
    for (double value : ar_values) {
        if (value < k_min_reflectance || value > k_max_reflectance)
            r_wrapper.errorInfo = k_invalid_reflectance;
        spectrum.append_value(value);
    }
    if (!spectrum.is_occurs_ok())
        return false;
    r_wrapper.colorValues->append_inner_ColorValues().assign_ReflectanceSpectrum(spectrum);
    return true;
}

bool CxF3Object::AddColorCIELab(const std::vector<double> &ar_lab, const std::string &ar_specification_id,
                                const std::string &ar_name) {
    CxF3ObjectWrapper &r_wrapper = p_wrapper();
    if (ar_lab.size() < 3)
        return false;
    cc::ColorCIELab lab;
    lab.set_ColorSpecification(ToWide(ar_specification_id));
    lab.set_Name(ToWide(ar_name));
    lab.set_L(ar_lab[0]);
    lab.set_A(ar_lab[1]);
    lab.set_B(ar_lab[2]);
    if (ar_lab[0] < k_min_lightness || ar_lab[0] > k_max_lightness)
        r_wrapper.errorInfo = k_invalid_lab;
    if (!lab.is_occurs_ok())
        return false;
    r_wrapper.colorValues->append_inner_ColorValues().assign_ColorCIELab(lab);
    return true;
}

namespace {

// The public spectra lie on 36 points from 380 nm to 730 nm, 10 nm apart.
constexpr int k_grid_first = 380;
constexpr int k_grid_last = 730;
constexpr int k_grid_step = 10;
constexpr int k_grid_points = (k_grid_last - k_grid_first) / k_grid_step + 1;
// The part of the grid every spectrum must cover.
constexpr int k_covered_first = 400;
constexpr int k_covered_last = 700;

// Whether a spectrum can be put on the grid: more than 30 values, 10 nm
// apart, starting from 360 nm to 400 nm.
bool IsResamplable(std::size_t a_count, int a_start, int a_increment) {
    return a_count > 30 && a_increment == k_grid_step && a_start >= 360 && a_start <= 400;
}

// A spectrum of values 10 nm apart from a_start, put on the grid.
class SpectrumOnGrid {
public:
    SpectrumOnGrid(const cc::ReflectanceSpectrum &ar_spectrum, int a_start) : p_grid(k_grid_points, 0.0) {
        for (std::size_t index = 0; index < ar_spectrum.size_value(); ++index)
            p_by_wavelength[static_cast<unsigned short>(a_start + k_grid_step * static_cast<int>(index))] =
                ar_spectrum.get_value(index);
    }

    // 400 .. 700 nm from the spectrum; the edges from the spectrum where it
    // reaches them, else repeating the nearest value inside.
    std::vector<double> Resample() {
        for (int wavelength = k_covered_first; wavelength <= k_covered_last; wavelength += k_grid_step)
            p_at(wavelength) = p_required(wavelength);
        for (int wavelength = k_covered_first - k_grid_step; wavelength >= k_grid_first; wavelength -= k_grid_step)
            p_at(wavelength) = p_value_or(wavelength, p_at(wavelength + k_grid_step));
        for (int wavelength = k_covered_last + k_grid_step; wavelength <= k_grid_last; wavelength += k_grid_step)
            p_at(wavelength) = p_value_or(wavelength, p_at(wavelength - k_grid_step));
        return p_grid;
    }

private:
    double &p_at(int a_wavelength) {
        return p_grid[static_cast<std::size_t>((a_wavelength - k_grid_first) / k_grid_step)];
    }

    double p_required(int a_wavelength) const {
        const auto found = p_by_wavelength.find(static_cast<unsigned short>(a_wavelength));
        if (found == p_by_wavelength.end())
            throw std::runtime_error("Unsupported spectrum size (wavelength " + std::to_string(a_wavelength) +
                                     "nm not found)");
        return found->second;
    }

    double p_value_or(int a_wavelength, double a_fallback) const {
        const auto found = p_by_wavelength.find(static_cast<unsigned short>(a_wavelength));
        return found == p_by_wavelength.end() ? a_fallback : found->second;
    }

    // Keyed by wavelength as a 16-bit number, the type of a spectrum's start.
    std::map<unsigned short, double> p_by_wavelength;
    std::vector<double> p_grid;
};

} // namespace

std::vector<double>
CxF3Object::GetReflectance(const boost::shared_ptr<CxF3ColorSpecification> &ar_specification) const {
    const CxF3ObjectWrapper &r_wrapper = p_wrapper();
    const CxF3ColorSpecification &r_specification = RequireTarget(ar_specification, "CxF3ColorSpecification");
    const std::wstring id = ToWide(r_specification.GetId());
    // The range is the specification's; the spectrum's own start is not read.
    const int start = r_specification.GetStartWL();
    const int increment = r_specification.GetWLIncrement();
    for (const cc::ReflectanceSpectrum *p_spectrum : Reflectances(*r_wrapper.colorValues))
        if (p_spectrum->get_ColorSpecification() == id && IsResamplable(p_spectrum->size_value(), start, increment))
            return SpectrumOnGrid(*p_spectrum, start).Resample();
    return std::vector<double>();
}

std::vector<std::string> CxF3Object::GetReflectanceColorSpecificationIds() const {
    std::vector<std::string> ids;
    for (const cc::ReflectanceSpectrum *p_spectrum : Reflectances(*p_wrapper().colorValues))
        ids.push_back(ToNarrow(p_spectrum->get_ColorSpecification()));
    return ids;
}

bool CxF3Object::HasLab(const std::string &ar_specification_id) const {
    const std::wstring id = ToWide(ar_specification_id);
    for (const cc::ColorCIELab *p_lab : LabValues(*p_wrapper().colorValues))
        if (p_lab->get_ColorSpecification() == id)
            return true;
    return false;
}

std::vector<double> CxF3Object::GetLab(const std::string &ar_specification_id) const {
    const std::wstring id = ToWide(ar_specification_id);
    std::vector<double> lab(3, 0.0);
    // Every match overwrites the one before: the last one counts.
    for (const cc::ColorCIELab *p_lab : LabValues(*p_wrapper().colorValues))
        if (p_lab->get_ColorSpecification() == id)
            lab = {p_lab->get_L(), p_lab->get_A(), p_lab->get_B()};
    return lab;
}

std::string CxF3Object::GetLabColorSpecificationId() const {
    const std::vector<const cc::ColorCIELab *> labs = LabValues(*p_wrapper().colorValues);
    return labs.empty() ? std::string() : ToNarrow(labs.front()->get_ColorSpecification());
}

// ---------------------------------------------------------------- recipes

namespace {

const wchar_t *const k_assortment_tag = L"Assortment";
const wchar_t *const k_substrate_tag = L"Substrate";

// The first recipe of each recipe item of the device values, in order. A
// file's consecutive recipes share one item, and only the first of them is
// found by specification.
std::vector<const cc::ColorRecipe *> LeadingRecipes(const cc::DeviceColorValues &ar_values) {
    std::vector<const cc::ColorRecipe *> recipes;
    for (std::size_t index = 0; index < ar_values.size_inner_DeviceColorValues(); ++index) {
        const cc::inner_DeviceColorValues &r_item = ar_values.get_inner_DeviceColorValues(index);
        if (r_item.size_ColorRecipe() > 0)
            recipes.push_back(&r_item.get_ColorRecipe(0));
    }
    return recipes;
}

// The value of the first tag of that name in a tag list; "" when there is none.
template <typename Holder> std::string FirstTagValue(const Holder &ar_holder, const std::wstring &ar_name) {
    for (std::size_t index = 0; index < ar_holder.size_Tag(); ++index)
        if (ar_holder.get_Tag(index).get_Name() == ar_name)
            return ToNarrow(ar_holder.get_Tag(index).get_Value());
    return std::string();
}

// A tag of the first recipe. Looking the recipe up again by that recipe's own
// specification would find the same one.
std::string FirstRecipeTag(const cc::DeviceColorValues &ar_values, const wchar_t *ap_tag) {
    const std::vector<const cc::ColorRecipe *> recipes = LeadingRecipes(ar_values);
    return recipes.empty() ? std::string() : FirstTagValue(*recipes.front(), ap_tag);
}

} // namespace

bool CxF3Object::AddColorRecipe(const boost::shared_ptr<CxF3ColorRecipe> &ar_recipe) {
    CxF3ObjectWrapper &r_wrapper = p_wrapper();
    const auto *p_handle = dynamic_cast<const CxF3ColorRecipeInterface *>(ar_recipe.get());
    if (!p_handle)
        return false;
    const cc::ColorRecipe &r_recipe =
        RequireTarget(RequireTarget(p_handle->GetWrapper(), "CxF3ColorRecipe").recipe, "CxF3ColorRecipe");
    if (!r_recipe.is_occurs_ok())
        return false;
    // An item of its own, so that the lookup by specification can find it.
    r_wrapper.deviceColorValues->append_inner_DeviceColorValues().append_ColorRecipe(r_recipe);
    return true;
}

boost::shared_ptr<CxF3ColorRecipe> CxF3Object::GetRecipe(const std::string &ar_specification_id) const {
    const std::wstring id = ToWide(ar_specification_id);
    boost::shared_ptr<CxF3ColorRecipeWrapper> wrapper;
    for (const cc::ColorRecipe *p_recipe : LeadingRecipes(*p_wrapper().deviceColorValues))
        if (p_recipe->get_ColorSpecification() == id) {
            wrapper.reset(new CxF3ColorRecipeWrapper(*p_recipe));
            break;
        }
    return boost::shared_ptr<CxF3ColorRecipe>(new CxF3ColorRecipeInterface(wrapper));
}

std::string CxF3Object::GetRecipeColorSpecificationId() const {
    const std::vector<const cc::ColorRecipe *> recipes = LeadingRecipes(*p_wrapper().deviceColorValues);
    return recipes.empty() ? std::string() : ToNarrow(recipes.front()->get_ColorSpecification());
}

std::string CxF3Object::GetAssortmentName() const {
    return FirstRecipeTag(*p_wrapper().deviceColorValues, k_assortment_tag);
}

std::string CxF3Object::GetSubstrateName() const {
    return FirstRecipeTag(*p_wrapper().deviceColorValues, k_substrate_tag);
}

// ---------------------------------------------------------------- physical attributes

bool CxF3Object::AddSubstrateType(bool a_is_film) {
    CxF3ObjectWrapper &r_wrapper = p_wrapper();
    cc::SubstrateType substrate;
    substrate.setenum_value(a_is_film ? cc::Eenum_SubstrateType_Film : cc::Eenum_SubstrateType_Paper);
    if (!substrate.is_occurs_ok())
        return false;
    r_wrapper.physicalAttributes->assign_SubstrateType(substrate);
    return true;
}

CxF3SubstrateType CxF3Object::GetSubstrateType() const {
    const cc::PhysicalAttributes &r_attributes = *p_wrapper().physicalAttributes;
    const cc::SubstrateType *p_substrate = r_attributes.get_SubstrateType();
    if (!p_substrate)
        return CxF3SubstrateNone;
    // Leather, metal and the other kinds of the format count as paper.
    return p_substrate->getenum_value() == cc::Eenum_SubstrateType_Film ? CxF3SubstrateFilm : CxF3SubstratePaper;
}

bool CxF3Object::AddThickness(double a_thickness, const std::string &ar_units) {
    CxF3ObjectWrapper &r_wrapper = p_wrapper();
    cc::Thickness thickness;
    thickness.set_value(a_thickness);
    thickness.set_Units(ToWide(ar_units));
    if (!thickness.is_occurs_ok())
        return false;
    r_wrapper.physicalAttributes->assign_Thickness(thickness);
    return true;
}

std::map<std::string, std::vector<std::string>> CxF3Object::GetPhysicalProperties() const {
    const cc::PhysicalAttributes &r_attributes = *p_wrapper().physicalAttributes;
    std::map<std::string, std::vector<std::string>> properties;
    for (std::size_t index = 0; index < r_attributes.size_CustomAttributeString(); ++index) {
        const cc::CustomAttributeString &r_attribute = r_attributes.get_CustomAttributeString(index);
        properties[ToNarrow(r_attribute.get_Label())].push_back(ToNarrow(r_attribute.get_value()));
    }
    // Numbers in the text they have in a file.
    for (std::size_t index = 0; index < r_attributes.size_CustomAttributeValue(); ++index) {
        const cc::CustomAttributeValue &r_attribute = r_attributes.get_CustomAttributeValue(index);
        std::string text;
        lmx::as_string(text, r_attribute.get_value());
        properties[ToNarrow(r_attribute.get_Label())].push_back(text);
    }
    return properties;
}

std::vector<std::string> CxF3Object::GetPhysicalProperties(const std::string &ar_name) const {
    const std::map<std::string, std::vector<std::string>> properties = GetPhysicalProperties();
    const auto found = properties.find(ar_name);
    return found == properties.end() ? std::vector<std::string>() : found->second;
}

// ---------------------------------------------------------------- tags

namespace {

// The tag collection of that name; null when there is none.
cc::TagCollection *FindTagCollection(const std::vector<boost::shared_ptr<cc::TagCollection>> &ar_collections,
                                     const std::string &ar_name) {
    for (const boost::shared_ptr<cc::TagCollection> &r_collection : ar_collections)
        if (ToNarrow(r_collection->get_Name()) == ar_name)
            return r_collection.get();
    return nullptr;
}

} // namespace

bool CxF3Object::AddTag(const std::string &ar_collection, const std::string &ar_name, const std::string &ar_value) {
    CxF3ObjectWrapper &r_wrapper = p_wrapper();
    cc::TagCollection *p_collection = FindTagCollection(r_wrapper.tagCollections, ar_collection);
    if (!p_collection) {
        // Made before the tag is checked, and kept when the tag is refused.
        r_wrapper.tagCollections.push_back(boost::shared_ptr<cc::TagCollection>(new cc::TagCollection()));
        p_collection = r_wrapper.tagCollections.back().get();
        p_collection->set_Name(ToWide(ar_collection));
    }
    cc::Tag tag;
    tag.set_Name(ToWide(ar_name));
    tag.set_Value(ToWide(ar_value));
    if (!tag.is_occurs_ok())
        return false;
    p_collection->append_Tag(tag);
    return true;
}

std::string CxF3Object::GetTag(const std::string &ar_collection, const std::string &ar_name) const {
    const cc::TagCollection *p_collection = FindTagCollection(p_wrapper().tagCollections, ar_collection);
    return p_collection ? FirstTagValue(*p_collection, ToWide(ar_name)) : std::string();
}

// ---------------------------------------------------------------- tolerance

namespace {

// The value of the a_index-th custom delta. The density limit is kept in V4.
double CustomDeltaValue(const CXFTolerance &ar_tolerance, std::size_t a_index) {
    return ar_tolerance.GetToleranceModus() == T_D ? ar_tolerance[4]
                                                   : ar_tolerance[static_cast<unsigned short>(a_index)];
}

// A weighted limit (dEcmc, dE94, dE2000): the limit V0 with the lightness weight V1.
template <typename Limit> void SetWeightedLimit(Limit &ar_limit, const CXFTolerance &ar_tolerance) {
    ar_limit.set_value(ar_tolerance[0]);
    ar_limit.set_LRatio(ar_tolerance[1]);
}

// The values of a mode stored as a cc:DeltaCIELab; false for a mode that
// is none of the eleven.
bool SetDeltaCIELabValues(cc::DeltaCIELab &ar_delta, const CXFTolerance &ar_tolerance) {
    switch (ar_tolerance.GetToleranceModus()) {
    case T_DE:
        ar_delta.set_dE(ar_tolerance[0]);
        return true;
    case T_LAB:
    case T_CIE_dLCH_Elliptical:
        // Only dL is written for the two boxes, as files of earlier releases
        // have it; their other values do not reach the file.
        ar_delta.set_dL(ar_tolerance[0]);
        return true;
    case T_CMC:
        SetWeightedLimit(ar_delta.get_dEcmc(), ar_tolerance);
        return true;
    case T_DE94:
        SetWeightedLimit(ar_delta.get_dE94(), ar_tolerance);
        return true;
    case T_DE2000:
        SetWeightedLimit(ar_delta.get_dE2000(), ar_tolerance);
        return true;
    default:
        return false;
    }
}

// Name, specification and standard of either kind of colour difference.
template <typename Delta>
void SetDeltaReferences(Delta &ar_delta, const std::string &ar_name, const std::wstring &ar_specification_id,
                        const std::wstring &ar_standard_id) {
    ar_delta.set_Name(ToWide(ar_name));
    ar_delta.set_ColorSpecification(ar_specification_id);
    ar_delta.set_StandardRef(ar_standard_id);
}

// The colour difference that stores a tolerance; false when the mode is
// unknown or the element lacks a required part.
bool ToleranceAsDifference(const CXFTolerance &ar_tolerance, const std::wstring &ar_specification_id,
                           const std::wstring &ar_standard_id, cc::inner_ColorDifferenceValues &ar_item) {
    const std::vector<const wchar_t *> labels = CustomToleranceLabels(ar_tolerance.GetToleranceModus());
    if (!labels.empty()) {
        cc::DeltaCustom &r_delta = ar_item.get_DeltaCustom();
        // Custom deltas are named by the mode's keyword, which is what reading
        // them back recognises.
        SetDeltaReferences(r_delta, ar_tolerance.GetToleranceModusString(), ar_specification_id, ar_standard_id);
        for (std::size_t index = 0; index < labels.size(); ++index) {
            cc::CustomDeltaType &r_value = r_delta.append_DeltaValue();
            r_value.set_Label(labels[index]);
            r_value.set_value(CustomDeltaValue(ar_tolerance, index));
        }
        return r_delta.is_occurs_ok();
    }
    cc::DeltaCIELab &r_delta = ar_item.get_DeltaCIELab();
    if (!SetDeltaCIELabValues(r_delta, ar_tolerance))
        return false;
    SetDeltaReferences(r_delta, ar_tolerance.GetString(), ar_specification_id, ar_standard_id);
    return r_delta.is_occurs_ok();
}

// A weighted limit read back: the weights of chroma (and hue) are not in the
// file and read as 1.
template <typename Limit>
void ReadWeightedLimit(const Limit &ar_limit, CXFToleranceModusType a_mode, unsigned short a_unit_weights,
                       CXFTolerance &ar_tolerance) {
    ar_tolerance.SetToleranceModus(a_mode);
    ar_tolerance[0] = static_cast<float>(ar_limit.get_value());
    ar_tolerance[1] = static_cast<float>(ar_limit.get_LRatio());
    for (unsigned short weight = 0; weight < a_unit_weights; ++weight)
        ar_tolerance[static_cast<unsigned short>(2 + weight)] = 1.0f;
}

// A box read back: the same three values on the positive and negative side.
void ReadBox(CXFToleranceModusType a_mode, double a_first, double a_second, double a_third,
             CXFTolerance &ar_tolerance) {
    const float first = static_cast<float>(a_first);
    const float second = static_cast<float>(a_second);
    const float third = static_cast<float>(a_third);
    ar_tolerance.SetToleranceModus(a_mode);
    ar_tolerance.SetV(first, second, third, first, second, third);
}

void ReadDeltaCIELab(const cc::DeltaCIELab &ar_delta, CXFTolerance &ar_tolerance) {
    if (ar_delta.isset_dE()) {
        ar_tolerance.SetToleranceModus(T_DE);
        ar_tolerance[0] = static_cast<float>(ar_delta.get_dE());
    } else if (const cc::DEcmcType *p_cmc = ar_delta.get_dEcmc()) {
        ReadWeightedLimit(*p_cmc, T_CMC, 1, ar_tolerance);
    } else if (const cc::DE94Type *p_94 = ar_delta.get_dE94()) {
        ReadWeightedLimit(*p_94, T_DE94, 2, ar_tolerance);
    } else if (const cc::DE2000Type *p_2000 = ar_delta.get_dE2000()) {
        ReadWeightedLimit(*p_2000, T_DE2000, 2, ar_tolerance);
    } else if (ar_delta.isset_dL() && ar_delta.isset_dA() && ar_delta.isset_dB()) {
        ReadBox(T_LAB, ar_delta.get_dL(), ar_delta.get_dA(), ar_delta.get_dB(), ar_tolerance);
    } else if (ar_delta.isset_dL() && ar_delta.isset_dC() && ar_delta.isset_dH()) {
        ReadBox(T_CIE_dLCH_Elliptical, ar_delta.get_dL(), ar_delta.get_dC(), ar_delta.get_dH(), ar_tolerance);
    }
}

// Only the single-value modes are recognised by name: the LABmg and LChmg
// boxes read as the default tolerance.
void ReadDeltaCustom(const cc::DeltaCustom &ar_delta, CXFTolerance &ar_tolerance) {
    if (ar_delta.size_DeltaValue() == 0)
        return;
    const std::string name = ToNarrow(ar_delta.get_Name());
    const float value = static_cast<float>(ar_delta.get_DeltaValue(0).get_value());
    if (name == CXFTolerance::GetToleranceModeString(T_D)) {
        ar_tolerance.SetToleranceModus(T_D);
        ar_tolerance.SetV(value, value, value, value, value, ar_tolerance[5]);
    } else if (name == CXFTolerance::GetToleranceModeString(T_DEMG)) {
        ar_tolerance.SetToleranceModus(T_DEMG);
        ar_tolerance[0] = value;
    } else if (name == CXFTolerance::GetToleranceModeString(T_FMC)) {
        ar_tolerance.SetToleranceModus(T_FMC);
        ar_tolerance[0] = value;
    }
}

} // namespace

bool CxF3Object::AddTolerance(const CXFTolerance &ar_tolerance, const std::string &ar_specification_id) {
    CxF3ObjectWrapper &r_wrapper = p_wrapper();
    cc::inner_ColorDifferenceValues item;
    if (!ToleranceAsDifference(ar_tolerance, ToWide(ar_specification_id), r_wrapper.object->get_Id(), item))
        return false;
    r_wrapper.colorDifferenceValues->append_inner_ColorDifferenceValues(item);
    return true;
}

CXFTolerance CxF3Object::GetTolerance() const {
    const cc::ColorDifferenceValues &r_values = *p_wrapper().colorDifferenceValues;
    CXFTolerance tolerance;
    if (r_values.size_inner_ColorDifferenceValues() == 0)
        return tolerance;
    // Only the first colour difference counts.
    const cc::inner_ColorDifferenceValues &r_first = r_values.get_inner_ColorDifferenceValues(0);
    if (const cc::DeltaCIELab *p_lab = r_first.get_DeltaCIELab())
        ReadDeltaCIELab(*p_lab, tolerance);
    else if (const cc::DeltaCustom *p_custom = r_first.get_DeltaCustom())
        ReadDeltaCustom(*p_custom, tolerance);
    return tolerance;
}

// ---------------------------------------------------------------- validity

bool CxF3Object::IsValid() const { return p_wrapper().errorInfo.empty(); }

const std::string &CxF3Object::GetErrorInfo() const { return p_wrapper().errorInfo; }
