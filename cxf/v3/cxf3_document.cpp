// The hand-written members of cc::CxF: loading and saving a whole document,
// and the lookups across cc:Resources that the document layer uses instead
// of walking the tree itself. Their declarations are in
// cxf3_document.members, which the generator copies into the class.
#include <cxf/v3/cxf3.h>

#include <filesystem>
#include <fstream>
#include <limits>

namespace cc {

namespace {

// The index of a search that found nothing.
constexpr unsigned k_not_found = std::numeric_limits<unsigned>::max();

std::string narrow(const std::wstring &ar_text) {
    std::string out;
    lmx::convert(out, ar_text);
    return out;
}

const ObjectCollection &objects_of(const CxF &ar_document) {
    return *ar_document.get_Resources()->get_ObjectCollection();
}

const Object &object_at(const CxF &ar_document, unsigned a_object_index) {
    return objects_of(ar_document).get_Object(a_object_index);
}

// A linear scan from the start for the first a_get(i) whose Id is ar_id,
// compared case-sensitively.
template <typename Get>
unsigned index_by_id(std::size_t a_size, const std::wstring &ar_id, Get a_get) {
    for (std::size_t i = 0; i < a_size; ++i)
        if (a_get(i).get_Id().compare(ar_id) == 0)
            return static_cast<unsigned>(i);
    return k_not_found;
}

// The items, among a_size, whose chosen value a_chosen_of(i) is a_chosen.
template <typename Chosen, typename ChosenOf>
std::vector<unsigned> indices_of_kind(std::size_t a_size, Chosen a_chosen, ChosenOf a_chosen_of) {
    std::vector<unsigned> indices;
    for (std::size_t i = 0; i < a_size; ++i)
        if (a_chosen_of(i) == a_chosen)
            indices.push_back(static_cast<unsigned>(i));
    return indices;
}

} // namespace

// ---------------------------------------------------------------- loading and saving

lmx::elmx_error CxF::loadFile(const char *ap_path) {
    lmx::c_xml_reader_file reader(ap_path);
    if (!reader.is_open())
        return lmx::elmx_unable_to_open_file;
    return unmarshal(reader);
}

lmx::elmx_error CxF::loadString(const std::wstring &ar_text) {
    std::string text = narrow(ar_text);
    lmx::c_xml_reader_memory reader(text.data(), text.size());
    return unmarshal(reader);
}

lmx::elmx_error CxF::writeFile(const std::wstring &ar_path) const {
    const std::filesystem::path target = std::filesystem::u8path(narrow(ar_path));
    std::filesystem::path temporary = target;
    temporary += ".tessarine-partial";
    lmx::elmx_error error;
    {
        std::ofstream file(temporary, std::ios::out | std::ios::binary | std::ios::trunc);
        if (!file)
            return lmx::elmx_unable_to_open_file;
        error = lmx::marshal(*this, file);
        file.close();
        if (error == lmx::elmx_ok && !file)
            error = lmx::elmx_unable_to_open_file;
    }
    std::error_code ignored;
    if (error == lmx::elmx_ok) {
        std::error_code renamed;
        std::filesystem::rename(temporary, target, renamed);
        if (!renamed)
            return lmx::elmx_ok;
        error = lmx::elmx_unable_to_open_file;
    }
    std::filesystem::remove(temporary, ignored);
    return error;
}

std::wstring CxF::writeString() const {
    std::string text;
    if (lmx::marshal(*this, text) != lmx::elmx_ok)
        return std::wstring();
    std::wstring wide;
    lmx::convert(wide, text);
    return wide;
}

// ---------------------------------------------------------------- sizes

unsigned CxF::get_SizeOfObject() {
    return static_cast<unsigned>(get_Resources().get_ObjectCollection().size_Object());
}

unsigned CxF::get_SizeOfColorValues(unsigned a_object_index) {
    Object &object = get_Resources().get_ObjectCollection().get_Object(a_object_index);
    return static_cast<unsigned>(object.get_ColorValues().size_inner_ColorValues());
}

unsigned CxF::get_SizeOfColorSpecification() const {
    return static_cast<unsigned>(get_Resources()->get_ColorSpecificationCollection()->size_ColorSpecification());
}

unsigned CxF::get_SizeOfProfile() const {
    return static_cast<unsigned>(get_Resources()->get_ProfileCollection()->size_Profile());
}

// ---------------------------------------------------------------- colour values

std::string CxF::get_ColorSpaceName(inner_ColorValues::elmx_chosen a_chosen) const {
    // The spectra have no leading "E" and CustomColorSpace has no name of
    // its own; callers compare these texts.
    static const char *const k_names[] = {"ReflectanceSpectrum", "TransmittanceSpectrum", "EmissiveSpectrum",
                                          "CustomSpectrum", "EColorSRGB", "EColorAdobeRGB", "EColorCIELab",
                                          "EColorCIELCh", "EColorCIEXYZ", "EColorEmissiveCIEXYZ", "EColorCIExyY",
                                          "EColorEmissiveCIExyY", "EColorCIELuv", "EColorDensity",
                                          "EPrivateSpectrum", "EPrivateColorValues"};
    if (a_chosen == inner_ColorValues::Echoice_not_set)
        return "Echoice_not_set";
    const int index = static_cast<int>(a_chosen);
    if (index >= 0 && index < static_cast<int>(sizeof k_names / sizeof k_names[0]))
        return k_names[index];
    return "EIHaveNoIdea!!";
}

std::vector<double> CxF::colorValuesToVector(unsigned a_object_index, unsigned a_item_index,
                                             inner_ColorValues::elmx_chosen &ar_chosen) const {
    const inner_ColorValues item =
        object_at(*this, a_object_index).get_ColorValues()->get_inner_ColorValues(a_item_index);
    ar_chosen = item.getchosen();
    std::vector<double> values;
    auto spectrum = [&values](const auto *ap_spectrum) {
        for (std::size_t i = 0; i < ap_spectrum->size_value(); ++i)
            values.push_back(ap_spectrum->get_value(i));
    };
    switch (ar_chosen) {
    case inner_ColorValues::EReflectanceSpectrum:
        spectrum(item.get_ReflectanceSpectrum());
        break;
    case inner_ColorValues::ETransmittanceSpectrum:
        spectrum(item.get_TransmittanceSpectrum());
        break;
    case inner_ColorValues::EEmissiveSpectrum:
        spectrum(item.get_EmissiveSpectrum());
        break;
    case inner_ColorValues::ECustomSpectrum: {
        const CustomSpectrum &custom = *item.get_CustomSpectrum();
        for (std::size_t i = 0; i < custom.size_SpectralPoint(); ++i)
            values.push_back(custom.get_SpectralPoint(i).get_value());
        break;
    }
    case inner_ColorValues::EColorSRGB: {
        const ColorSRGB &rgb = *item.get_ColorSRGB();
        values = {double(rgb.get_R()), double(rgb.get_G()), double(rgb.get_B())};
        break;
    }
    case inner_ColorValues::EColorAdobeRGB: {
        const ColorAdobeRGB &rgb = *item.get_ColorAdobeRGB();
        values = {double(rgb.get_R()), double(rgb.get_G()), double(rgb.get_B()), rgb.get_Alpha()};
        break;
    }
    case inner_ColorValues::EColorCIELab: {
        const ColorCIELab &lab = *item.get_ColorCIELab();
        values = {lab.get_L(), lab.get_A(), lab.get_B()};
        break;
    }
    case inner_ColorValues::EColorCIELCh: {
        const ColorCIELCh &lch = *item.get_ColorCIELCh();
        values = {lch.get_L(), lch.get_C(), lch.get_H()};
        break;
    }
    case inner_ColorValues::EColorCIEXYZ: {
        const ColorCIEXYZ &xyz = *item.get_ColorCIEXYZ();
        values = {xyz.get_X(), xyz.get_Y(), xyz.get_Z()};
        break;
    }
    case inner_ColorValues::EColorEmissiveCIEXYZ: {
        const ColorEmissiveCIEXYZ &xyz = *item.get_ColorEmissiveCIEXYZ();
        values = {xyz.get_X(), xyz.get_Y(), xyz.get_Z()};
        break;
    }
    case inner_ColorValues::EColorCIExyY: {
        const ColorCIExyY &xyy = *item.get_ColorCIExyY();
        values = {xyy.get_x(), xyy.get_y(), xyy.get_Y()};
        break;
    }
    case inner_ColorValues::EColorEmissiveCIExyY: {
        const ColorEmissiveCIExyY &xyy = *item.get_ColorEmissiveCIExyY();
        values = {xyy.get_x(), xyy.get_y(), xyy.get_Y()};
        break;
    }
    case inner_ColorValues::EColorCIELuv: {
        const ColorCIELuv &luv = *item.get_ColorCIELuv();
        values = {luv.get_L(), luv.get_U(), luv.get_V()};
        break;
    }
    case inner_ColorValues::EColorDensity:
        values = {item.get_ColorDensity()->get_Density()};
        break;
    default:
        break;
    }
    return values;
}

std::vector<double> CxF::colorValuesToVector(unsigned a_object_index, unsigned a_item_index) const {
    inner_ColorValues::elmx_chosen chosen;
    return colorValuesToVector(a_object_index, a_item_index, chosen);
}

ColorValues CxF::get_ColorValues(unsigned a_object_index) const {
    return *object_at(*this, a_object_index).get_ColorValues();
}

DeviceColorValues CxF::get_DeviceColorValues(unsigned a_object_index) const {
    return *object_at(*this, a_object_index).get_DeviceColorValues();
}

std::vector<unsigned> CxF::indexsOfColorSpace(unsigned a_object_index, inner_ColorValues::elmx_chosen a_chosen) const {
    const ColorValues values = get_ColorValues(a_object_index);
    return indices_of_kind(values.size_inner_ColorValues(), a_chosen,
                           [&values](std::size_t i) { return values.get_inner_ColorValues(i).getchosen(); });
}

std::vector<unsigned> CxF::indexsOfColorSpace(unsigned a_object_index,
                                              inner_DeviceColorValues::elmx_chosen a_chosen) const {
    const DeviceColorValues values = get_DeviceColorValues(a_object_index);
    return indices_of_kind(values.size_inner_DeviceColorValues(), a_chosen,
                           [&values](std::size_t i) { return values.get_inner_DeviceColorValues(i).getchosen(); });
}

unsigned CxF::indexOfColorSpace(unsigned a_object_index, inner_ColorValues::elmx_chosen a_chosen) const {
    const std::vector<unsigned> indices = indexsOfColorSpace(a_object_index, a_chosen);
    return indices.empty() ? k_not_found : indices.front();
}

unsigned CxF::indexOfColorSpace(unsigned a_object_index, inner_DeviceColorValues::elmx_chosen a_chosen) const {
    const std::vector<unsigned> indices = indexsOfColorSpace(a_object_index, a_chosen);
    return indices.empty() ? k_not_found : indices.front();
}

// ---------------------------------------------------------------- lookups by Id

Object CxF::get_ObjectByID(const std::wstring &ar_id) const {
    const unsigned index = indexOfObject(ar_id);
    return index == k_not_found ? Object() : object_at(*this, index);
}

ColorSpecification CxF::get_ColorSpecificationByID(const std::wstring &ar_id) const {
    const ColorSpecificationCollection &specs = *get_Resources()->get_ColorSpecificationCollection();
    const unsigned index = index_by_id(specs.size_ColorSpecification(), ar_id,
                                       [&specs](std::size_t i) { return specs.get_ColorSpecification(i); });
    return index == k_not_found ? ColorSpecification() : specs.get_ColorSpecification(index);
}

ProfileType CxF::get_ProfileByID(const std::wstring &ar_id) const {
    const ProfileCollection &profiles = *get_Resources()->get_ProfileCollection();
    const unsigned index = index_by_id(profiles.size_Profile(), ar_id,
                                       [&profiles](std::size_t i) { return profiles.get_Profile(i); });
    return index == k_not_found ? ProfileType() : profiles.get_Profile(index);
}

unsigned CxF::indexOfObject(const std::wstring &ar_id) const {
    const ObjectCollection &objects = objects_of(*this);
    return index_by_id(objects.size_Object(), ar_id, [&objects](std::size_t i) { return objects.get_Object(i); });
}

std::wstring CxF::get_ColorSpaceSpecification(const std::wstring &ar_object_id, unsigned a_item_index) const {
    Object object = get_ObjectByID(ar_object_id);
    // A copy: selecting the reflectance replaces any other kind of value
    // by an empty spectrum, whose attribute is empty.
    inner_ColorValues &item = object.get_ColorValues().get_inner_ColorValues(a_item_index);
    item.select_ReflectanceSpectrum();
    return item.get_ReflectanceSpectrum().get_ColorSpecification();
}

std::string CxF::get_CustomResource(unsigned a_index, std::string a_ns, std::string a_name) {
    std::string value;
    get_CustomResources().get_inner_CustomResources(a_index).get_any(&a_ns, &a_name, value);
    return value;
}

std::vector<inner_DeviceColorValues>
CxF::get_DeviceColorValuesForType(unsigned a_object_index, inner_DeviceColorValues::elmx_chosen a_chosen) const {
    const DeviceColorValues &values = *object_at(*this, a_object_index).get_DeviceColorValues();
    std::vector<inner_DeviceColorValues> items;
    for (std::size_t i = 0; i < values.size_inner_DeviceColorValues(); ++i)
        if (values.get_inner_DeviceColorValues(i).getchosen() == a_chosen)
            items.push_back(values.get_inner_DeviceColorValues(i));
    return items;
}

// ---------------------------------------------------------------- colour getters

namespace {

// The first item of a_chosen in the object's colour values, copied; the
// all-ones index of a missing kind fails in the vector access.
inner_ColorValues first_item(const CxF &ar_document, unsigned a_object_index,
                             inner_ColorValues::elmx_chosen a_chosen) {
    const unsigned position = ar_document.indexOfColorSpace(a_object_index, a_chosen);
    return ar_document.get_ColorValues(a_object_index).get_inner_ColorValues(position);
}

} // namespace

// The spectra are taken by selecting them on the copy; the other kinds
// through the const accessor.
#define TESSARINE_SPECTRUM_GETTER(Kind)                                                                            \
    Kind CxF::get_##Kind(unsigned a_object_index) const {                                                          \
        return first_item(*this, a_object_index, inner_ColorValues::E##Kind).get_##Kind();                         \
    }
#define TESSARINE_VALUE_GETTER(Kind)                                                                               \
    Kind CxF::get_##Kind(unsigned a_object_index) const {                                                          \
        const inner_ColorValues item = first_item(*this, a_object_index, inner_ColorValues::E##Kind);              \
        return *item.get_##Kind();                                                                                 \
    }
#define TESSARINE_GETTER_BY_ID(Kind)                                                                               \
    Kind CxF::get_##Kind(const std::wstring &ar_id) const { return get_##Kind(indexOfObject(ar_id)); }

TESSARINE_SPECTRUM_GETTER(ReflectanceSpectrum)
TESSARINE_SPECTRUM_GETTER(TransmittanceSpectrum)
TESSARINE_SPECTRUM_GETTER(EmissiveSpectrum)
TESSARINE_SPECTRUM_GETTER(CustomSpectrum)
TESSARINE_VALUE_GETTER(ColorSRGB)
TESSARINE_VALUE_GETTER(ColorAdobeRGB)
TESSARINE_VALUE_GETTER(ColorCIELab)
TESSARINE_VALUE_GETTER(ColorCIELCh)
TESSARINE_VALUE_GETTER(ColorCIEXYZ)
TESSARINE_VALUE_GETTER(ColorEmissiveCIEXYZ)
TESSARINE_VALUE_GETTER(ColorCIExyY)
TESSARINE_VALUE_GETTER(ColorEmissiveCIExyY)
TESSARINE_VALUE_GETTER(ColorCIELuv)
TESSARINE_VALUE_GETTER(ColorDensity)
TESSARINE_GETTER_BY_ID(EmissiveSpectrum)
TESSARINE_GETTER_BY_ID(CustomSpectrum)
TESSARINE_GETTER_BY_ID(ColorSRGB)
TESSARINE_GETTER_BY_ID(ColorAdobeRGB)
TESSARINE_GETTER_BY_ID(ColorCIELab)
TESSARINE_GETTER_BY_ID(ColorCIELCh)
TESSARINE_GETTER_BY_ID(ColorCIEXYZ)
TESSARINE_GETTER_BY_ID(ColorEmissiveCIEXYZ)
TESSARINE_GETTER_BY_ID(ColorCIExyY)
TESSARINE_GETTER_BY_ID(ColorEmissiveCIExyY)
TESSARINE_GETTER_BY_ID(ColorCIELuv)
TESSARINE_GETTER_BY_ID(ColorDensity)

#undef TESSARINE_SPECTRUM_GETTER
#undef TESSARINE_VALUE_GETTER
#undef TESSARINE_GETTER_BY_ID

// ---------------------------------------------------------------- device colour getters

namespace {

// Every element of one kind across the device value items of that kind.
template <typename T, typename Count, typename Get>
std::vector<T> device_values(const CxF &ar_document, unsigned a_object_index,
                             inner_DeviceColorValues::elmx_chosen a_chosen, Count a_count, Get a_get) {
    std::vector<T> values;
    for (const inner_DeviceColorValues &item : ar_document.get_DeviceColorValuesForType(a_object_index, a_chosen))
        for (std::size_t i = 0; i < a_count(item); ++i)
            values.push_back(a_get(item, i));
    return values;
}

} // namespace

#define TESSARINE_DEVICE_GETTER(Getter, Kind)                                                                      \
    std::vector<Kind> CxF::Getter(unsigned a_object_index) const {                                                 \
        return device_values<Kind>(                                                                                \
            *this, a_object_index, inner_DeviceColorValues::E##Kind,                                               \
            [](const inner_DeviceColorValues &ar_item) { return ar_item.size_##Kind(); },                          \
            [](const inner_DeviceColorValues &ar_item, std::size_t i) { return ar_item.get_##Kind(i); });          \
    }

TESSARINE_DEVICE_GETTER(get_DeviceColorHTML, ColorHTML)
TESSARINE_DEVICE_GETTER(get_DeviceColorNotation, ColorNotation)
TESSARINE_DEVICE_GETTER(get_DeviceColorRgb, ColorRGB)
TESSARINE_DEVICE_GETTER(get_DeviceColorHSL, ColorHSL)
TESSARINE_DEVICE_GETTER(get_DeviceColorCMYK, ColorCMYK)
TESSARINE_DEVICE_GETTER(get_DeviceColorCMYKPlusN, ColorCMYKPlusN)
TESSARINE_DEVICE_GETTER(get_DeviceColorColorPantoneHexachrome, ColorPantoneHexachrome)
TESSARINE_DEVICE_GETTER(get_DeviceColorColorColorRecipe, ColorRecipe)

#undef TESSARINE_DEVICE_GETTER

std::vector<PrivateColorValues> CxF::get_DeviceColorPrivateColorValues(unsigned a_object_index) const {
    // Counted by size_ColorRecipe, which is 0 on an item of private values:
    // the result has always been empty and callers expect nothing else.
    return device_values<PrivateColorValues>(
        *this, a_object_index, inner_DeviceColorValues::EPrivateColorValues,
        [](const inner_DeviceColorValues &ar_item) { return ar_item.size_ColorRecipe(); },
        [](const inner_DeviceColorValues &ar_item, std::size_t i) { return ar_item.get_PrivateColorValues(i); });
}

} // namespace cc
