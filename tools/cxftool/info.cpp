// cxftool info FILE: what a CxF3 file holds, section by section.
#include "tools/cxftool/commands.h"
#include "tools/cxftool/document.h"
#include "tools/cxftool/output.h"

#include "dll/cxfwrapper/source/cxf3text.h"

#include <iterator>
#include <map>
#include <set>
#include <stdexcept>
#include <utility>

namespace cxftool {

namespace {

const char *const k_absent = "-";

// The element names of the kinds of values, one per alternative of the
// binding's choice, in its order.
const char *const k_color_value_kinds[] = {
    "ReflectanceSpectrum", "TransmittanceSpectrum", "EmissiveSpectrum", "CustomSpectrum",  "ColorSRGB",
    "ColorAdobeRGB",       "ColorCIELab",           "ColorCIELCh",      "ColorCIEXYZ",     "ColorEmissiveCIEXYZ",
    "ColorCIExyY",         "ColorEmissiveCIExyY",   "ColorCIELuv",      "ColorDensity",    "PrivateSpectrum",
    "PrivateColorValues",  "CustomColorSpace"};
static_assert(std::size(k_color_value_kinds) == cc::inner_ColorValues::Echoice_not_set);

const char *const k_difference_value_kinds[] = {"DeltaCIELab", "DeltaCustom"};
static_assert(std::size(k_difference_value_kinds) == cc::inner_ColorDifferenceValues::Echoice_not_set);

const char *const k_device_value_kinds[] = {"ColorHTML",   "ColorNotation",         "ColorRGB",
                                            "ColorHSL",    "ColorCMYK",             "ColorCMYKPlusN",
                                            "ColorCustom", "ColorPantoneHexachrome", "ColorRecipe",
                                            "PrivateColorValues"};
static_assert(std::size(k_device_value_kinds) == cc::inner_DeviceColorValues::Echoice_not_set);

// The three groups of values of an object, in the order of the file.
enum ValueGroup : int { k_color_values, k_difference_values, k_device_values };
const char *const k_group_names[] = {"ColorValues", "ColorDifferenceValues", "DeviceColorValues"};

// A kind of value: its group and the binding's choice within the group.
using ValueKind = std::pair<ValueGroup, std::size_t>;

template <std::size_t N> std::string KindName(const char *const (&ar_names)[N], std::size_t a_chosen) {
    return a_chosen < N ? ar_names[a_chosen] : "(none chosen)";
}

std::string KindName(const ValueKind &ar_kind) {
    switch (ar_kind.first) {
    case k_color_values:
        return KindName(k_color_value_kinds, ar_kind.second);
    case k_difference_values:
        return KindName(k_difference_value_kinds, ar_kind.second);
    case k_device_values:
        break;
    }
    return KindName(k_device_value_kinds, ar_kind.second);
}

// The kinds of the items of each value group of one object.
std::set<ValueKind> KindsOf(const cc::Object &ar_object) {
    std::set<ValueKind> kinds;
    if (const cc::ColorValues *p_values = ar_object.get_ColorValues())
        for (std::size_t index = 0; index < p_values->size_inner_ColorValues(); ++index)
            kinds.insert({k_color_values, p_values->get_inner_ColorValues(index).getchosen()});
    if (const cc::ColorDifferenceValues *p_values = ar_object.get_ColorDifferenceValues())
        for (std::size_t index = 0; index < p_values->size_inner_ColorDifferenceValues(); ++index)
            kinds.insert({k_difference_values, p_values->get_inner_ColorDifferenceValues(index).getchosen()});
    if (const cc::DeviceColorValues *p_values = ar_object.get_DeviceColorValues())
        for (std::size_t index = 0; index < p_values->size_inner_DeviceColorValues(); ++index)
            kinds.insert({k_device_values, p_values->get_inner_DeviceColorValues(index).getchosen()});
    return kinds;
}

// Counts one more of ar_key, keeping the keys in the order first met.
void CountInOrder(std::vector<std::pair<std::string, int>> &ar_counts, const std::string &ar_key) {
    for (auto &entry : ar_counts)
        if (entry.first == ar_key) {
            ++entry.second;
            return;
        }
    ar_counts.push_back({ar_key, 1});
}

// A value the file may leave out: "-" when it does.
std::string OrAbsent(const std::string &ar_text) { return ar_text.empty() ? k_absent : TableText(ar_text); }

void WriteFileInformation(std::ostream &ar_out, const LoadedFile &ar_file, const std::string &ar_path) {
    const cc::FileInformation *p_information = BoundTree(*ar_file.document).get_FileInformation();
    const cc::FileInformation empty;
    const cc::FileInformation &information = p_information ? *p_information : empty;
    const std::string created =
        information.isset_CreationDate() ? information.get_CreationDate().get_as_string() : std::string();
    WriteTable(ar_out,
               {{"File:", ar_path},
                {"Creator:", OrAbsent(ToNarrow(information.get_Creator()))},
                {"Created:", OrAbsent(created)},
                {"Description:", OrAbsent(ToNarrow(information.get_Description()))},
                {"Comment:", OrAbsent(ToNarrow(information.get_Comment()))}},
               "");
    ar_out << "File tags: " << information.size_Tag() << "\n";
    std::vector<TableRow> tags;
    for (std::size_t index = 0; index < information.size_Tag(); ++index)
        tags.push_back({TableText(ToNarrow(information.get_Tag(index).get_Name())),
                        TableText(ToNarrow(information.get_Tag(index).get_Value()))});
    WriteTable(ar_out, tags, "  ");
}

void WriteObjectTypes(std::ostream &ar_out, CxF3 &ar_document) {
    const std::vector<boost::shared_ptr<CxF3Object>> &objects = ar_document.GetObjects();
    std::vector<std::pair<std::string, int>> types;
    for (const boost::shared_ptr<CxF3Object> &object : objects)
        CountInOrder(types, TableText(object->GetCxFObjectType()));
    ar_out << "Objects: " << objects.size() << "\n";
    std::vector<TableRow> rows;
    for (const auto &entry : types)
        rows.push_back({entry.first, std::to_string(entry.second)});
    WriteTable(ar_out, rows, "  ");
}

std::string MeasurementWord(CxF3MeasurementType a_type) {
    switch (a_type) {
    case CxF3MeasurementSpectral:
        return "spectral";
    case CxF3MeasurementColorimetric:
        return "colorimetric";
    case CxF3MeasurementOther:
        break;
    }
    return "other";
}

// The condition word exists for reflectance and transmittance only.
std::string FilterWord(const CxF3ColorSpecification &ar_specification) {
    try {
        return ar_specification.GetFilter();
    } catch (const std::runtime_error &) {
        return k_absent;
    }
}

std::string WavelengthRange(const CxF3ColorSpecification &ar_specification) {
    const int start = ar_specification.GetStartWL();
    const int increment = ar_specification.GetWLIncrement();
    if (start == 0 && increment == 0)
        return k_absent;
    return "from " + std::to_string(start) + " nm, step " + std::to_string(increment) + " nm";
}

void WriteColorSpecifications(std::ostream &ar_out, CxF3 &ar_document) {
    const std::vector<boost::shared_ptr<CxF3ColorSpecification>> specifications = ar_document.GetColorSpecifications();
    ar_out << "Colour specifications: " << specifications.size() << "\n";
    if (specifications.empty())
        return;
    std::vector<TableRow> rows = {{"Id", "Measurement", "Filter", "Illuminant", "Observer", "Wavelengths"}};
    for (const boost::shared_ptr<CxF3ColorSpecification> &specification : specifications)
        rows.push_back({TableText(specification->GetId()), MeasurementWord(specification->GetMeasurementType()),
                        FilterWord(*specification), OrAbsent(specification->GetIlluminant()),
                        OrAbsent(specification->GetObserver()), WavelengthRange(*specification)});
    WriteTable(ar_out, rows, "  ");
}

// Each kind once per object that holds it, in the order of the groups and
// of the binding's choices.
void WriteValueKinds(std::ostream &ar_out, const cc::CxF &ar_tree) {
    std::map<ValueKind, int> objects_by_kind;
    const cc::Resources *p_resources = ar_tree.get_Resources();
    const cc::ObjectCollection *p_objects = p_resources ? p_resources->get_ObjectCollection() : nullptr;
    for (std::size_t index = 0; p_objects && index < p_objects->size_Object(); ++index)
        for (const ValueKind &kind : KindsOf(p_objects->get_Object(index)))
            ++objects_by_kind[kind];
    ar_out << "Kinds of values: " << objects_by_kind.size() << "\n";
    if (objects_by_kind.empty())
        return;
    std::vector<TableRow> rows = {{"Kind", "Group", "Objects"}};
    for (const auto &entry : objects_by_kind)
        rows.push_back({KindName(entry.first), k_group_names[entry.first.first], std::to_string(entry.second)});
    WriteTable(ar_out, rows, "  ");
}

void WritePalettes(std::ostream &ar_out, const CxF3 &ar_document) {
    const std::vector<Palette> palettes = PalettesOf(ar_document);
    ar_out << "Palettes: " << palettes.size() << "\n";
    if (palettes.empty())
        return;
    std::vector<TableRow> rows = {{"Name", "Objects"}};
    for (const Palette &palette : palettes)
        rows.push_back({TableText(palette.first), std::to_string(palette.second.size())});
    WriteTable(ar_out, rows, "  ");
}

// Ids joined by ", "; "-" when there are none.
std::string IdList(const std::vector<std::string> &ar_ids) {
    std::string list;
    for (const std::string &id : ar_ids)
        list += (list.empty() ? "" : ", ") + TableText(id);
    return list.empty() ? k_absent : list;
}

// One row per series. A series names a colour specification only through
// its tolerance, so a series without one shows "-" for both (the tolerance
// the classes give for it is a default, not the file's).
std::vector<TableRow> SeriesRows(CxF3Job &ar_job) {
    std::vector<TableRow> rows = {{"Reference", "Tolerance", "Specification", "Samples"}};
    for (unsigned index = 0; index < ar_job.GetSeriesCount(); ++index) {
        const std::string specification = ar_job.GetColorSpecification(index);
        const bool has_tolerance = !specification.empty();
        rows.push_back({OrAbsent(ar_job.GetReferenceId(index)),
                        has_tolerance ? TableText(ar_job.GetTolerance(index).GetString()) : k_absent,
                        has_tolerance ? TableText(specification) : k_absent, IdList(ar_job.GetSampleIds(index))});
    }
    return rows;
}

void WriteJobs(std::ostream &ar_out, const CxF3 &ar_document) {
    const std::vector<boost::shared_ptr<CxF3Job>> jobs = ar_document.GetJobs();
    ar_out << "Jobs: " << jobs.size() << "\n";
    for (const boost::shared_ptr<CxF3Job> &job : jobs) {
        ar_out << "  " << TableText(job->GetName()) << ": " << job->GetSeriesCount() << " series\n";
        if (job->GetSeriesCount() > 0)
            WriteTable(ar_out, SeriesRows(*job), "    ");
    }
}

// "-" when the file carries no library; a library without a name shows "".
void WriteBrandedLibrary(std::ostream &ar_out, const CxF3 &ar_document) {
    const boost::shared_ptr<CxF3LumiveraLibrary> library = ar_document.GetLumiveraLibrary();
    if (!library) {
        ar_out << "Colour library: " << k_absent << "\n";
        return;
    }
    ar_out << "Colour library: " << TableText(BrandedLibraryName(ar_document)) << "\n"
           << "  Colours: " << library->GetColors().size() << "\n";
}

int RunInfo(const Arguments &ar_args, std::ostream &ar_out, std::ostream &ar_err) {
    LoadedFile file;
    if (!LoadFileOrComplain("info", ar_args.file, file, ar_err))
        return k_exit_failure;
    WriteFileInformation(ar_out, file, ar_args.file);
    WriteObjectTypes(ar_out, *file.document);
    WriteColorSpecifications(ar_out, *file.document);
    WriteValueKinds(ar_out, BoundTree(*file.document));
    WritePalettes(ar_out, *file.document);
    WriteJobs(ar_out, *file.document);
    WriteBrandedLibrary(ar_out, *file.document);
    return k_exit_ok;
}

} // namespace

const Command &InfoCommand() {
    static const Command command{
        "info",
        "describe FILE: objects, specifications, palettes, jobs, library",
        "usage: cxftool info FILE\n"
        "\n"
        "Describes a CxF3 file:\n"
        "  - its creator, creation date, description, comment and file tags;\n"
        "  - the number of objects of each object type, as the file names it;\n"
        "  - its colour specifications: id, measurement type (spectral, colorimetric\n"
        "    or other), filter condition (M0..M3, D8i, D8e, D8t; \"-\" for a\n"
        "    measurement that has none, such as an emissive one), illuminant,\n"
        "    observer and wavelength range;\n"
        "  - each kind of value the objects hold (ReflectanceSpectrum, ColorCIELab,\n"
        "    DeltaCIELab, ColorRecipe, ...), with the number of objects holding it;\n"
        "  - its palettes, in the file's order: name and number of objects (a\n"
        "    palette none of whose objects is in the file is not listed); palettes\n"
        "    may share a name. 'cxftool dump FILE --palette NAME' lists the objects\n"
        "    of one;\n"
        "  - its jobs: for each, its series with the reference object's id, the\n"
        "    tolerance, the colour specification it is judged under and the ids of\n"
        "    the samples (\"-\" for a series without tolerance or samples). A file\n"
        "    keeps a job as quality control sets, one per series, named after the\n"
        "    job: jobs read back one per set name, sorted by name;\n"
        "  - the branded colour library it carries: its name and number of colours\n"
        "    (\"-\" when it carries none).\n"
        "\"-\" stands for a value the file does not give. Text that is empty, has a\n"
        "space at an edge or holds a control character is shown as a JSON string\n"
        "(\"\", \" padded\", \"two\\nlines\"), so that each entry keeps to its line.\n",
        {},
        RunInfo};
    return command;
}

} // namespace cxftool
