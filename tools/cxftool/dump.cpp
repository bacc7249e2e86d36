// cxftool dump FILE [--format csv|json] [--palette NAME]: one row per object
// (of the file, or of one palette) with its Lab values and reflectance under
// each colour specification of the file.
#include "tools/cxftool/commands.h"
#include "tools/cxftool/document.h"
#include "tools/cxftool/output.h"

#include <stdexcept>

namespace cxftool {

namespace {

// The reflectance grid of the document classes: 36 points from 380 nm.
constexpr int k_reflectance_points = 36;
constexpr int k_first_wavelength = 380;
constexpr int k_wavelength_step = 10;

// What one object holds under one colour specification; empty where it
// holds nothing usable.
struct SpecificationValues {
    std::vector<double> lab;
    std::vector<double> reflectance;
};

struct ObjectRow {
    std::string id;
    std::string name;
    std::string type;
    // One entry per colour specification of the file, in the file's order.
    std::vector<SpecificationValues> values;
};

// A spectrum that does not reach across 400 .. 700 nm cannot be put on the
// grid; it counts as not usable.
std::vector<double> UsableReflectance(const CxF3Object &ar_object,
                                      const boost::shared_ptr<CxF3ColorSpecification> &ar_specification) {
    try {
        return ar_object.GetReflectance(ar_specification);
    } catch (const std::runtime_error &) {
        return {};
    }
}

ObjectRow RowOf(const CxF3Object &ar_object,
                const std::vector<boost::shared_ptr<CxF3ColorSpecification>> &ar_specifications) {
    ObjectRow row{ar_object.GetId(), ar_object.GetName(), ar_object.GetCxFObjectType(), {}};
    for (const boost::shared_ptr<CxF3ColorSpecification> &specification : ar_specifications) {
        const std::string id = specification->GetId();
        SpecificationValues values;
        if (ar_object.HasLab(id))
            values.lab = ar_object.GetLab(id);
        values.reflectance = UsableReflectance(ar_object, specification);
        row.values.push_back(values);
    }
    return row;
}

// The cells of a fixed number of values; cells past the values stay empty.
void WriteCsvValues(std::ostream &ar_out, const std::vector<double> &ar_values, std::size_t a_cells) {
    for (std::size_t index = 0; index < a_cells; ++index)
        ar_out << ',' << (index < ar_values.size() ? FormatNumber(ar_values[index]) : std::string());
}

void WriteCsv(std::ostream &ar_out, const std::vector<std::string> &ar_specification_ids,
              const std::vector<ObjectRow> &ar_rows) {
    ar_out << "id,name,type";
    for (const std::string &id : ar_specification_ids) {
        for (const char *p_coordinate : {"L", "a", "b"})
            ar_out << ',' << CsvField(id + ":" + p_coordinate);
        for (int point = 0; point < k_reflectance_points; ++point)
            ar_out << ',' << CsvField(id + ":" + std::to_string(k_first_wavelength + point * k_wavelength_step));
    }
    ar_out << "\n";
    for (const ObjectRow &row : ar_rows) {
        ar_out << CsvField(row.id) << ',' << CsvField(row.name) << ',' << CsvField(row.type);
        for (const SpecificationValues &values : row.values) {
            WriteCsvValues(ar_out, values.lab, 3);
            WriteCsvValues(ar_out, values.reflectance, k_reflectance_points);
        }
        ar_out << "\n";
    }
}

// A JSON array of the values; null when there are none.
std::string JsonValues(const std::vector<double> &ar_values) {
    if (ar_values.empty())
        return "null";
    std::string array = "[";
    for (std::size_t index = 0; index < ar_values.size(); ++index)
        array += (index == 0 ? "" : ", ") + JsonNumber(ar_values[index]);
    return array + "]";
}

void WriteJson(std::ostream &ar_out, const std::vector<std::string> &ar_specification_ids,
               const std::vector<ObjectRow> &ar_rows) {
    ar_out << "[";
    for (std::size_t index = 0; index < ar_rows.size(); ++index) {
        const ObjectRow &row = ar_rows[index];
        ar_out << (index == 0 ? "\n" : ",\n") << "  {\"id\": " << JsonString(row.id)
               << ", \"name\": " << JsonString(row.name) << ", \"type\": " << JsonString(row.type)
               << ", \"specifications\": {";
        for (std::size_t column = 0; column < row.values.size(); ++column)
            ar_out << (column == 0 ? "" : ", ") << JsonString(ar_specification_ids[column])
                   << ": {\"lab\": " << JsonValues(row.values[column].lab)
                   << ", \"reflectance\": " << JsonValues(row.values[column].reflectance) << "}";
        ar_out << "}}";
    }
    ar_out << (ar_rows.empty() ? "]\n" : "\n]\n");
}

// The names of the palettes as JSON strings, for a message: "A", "B".
std::string QuotedNames(const std::vector<Palette> &ar_palettes) {
    std::string names;
    for (const Palette &palette : ar_palettes)
        names += (names.empty() ? "" : ", ") + JsonString(palette.first);
    return names;
}

// The objects to dump: every object of the file, or with --palette those of
// the first palette of that name, in the palette's order. False, with the
// reason on ar_err, when the file has no palette of that name.
bool ObjectsToDump(const Arguments &ar_args, CxF3 &ar_document, CxF3::ObjectList &ar_objects,
                   std::ostream &ar_err) {
    if (!ar_args.HasOption("--palette")) {
        ar_objects = ar_document.GetObjects();
        return true;
    }
    const std::string name = ar_args.Option("--palette", "");
    const std::vector<Palette> palettes = PalettesOf(ar_document);
    for (const Palette &palette : palettes)
        if (palette.first == name) {
            ar_objects = palette.second;
            return true;
        }
    ar_err << "cxftool dump: no palette " << JsonString(name) << " in " << ar_args.file << "\n";
    if (palettes.empty())
        ar_err << "The file has no palettes.\n";
    else
        ar_err << "Its palettes: " << QuotedNames(palettes) << "\n";
    return false;
}

int RunDump(const Arguments &ar_args, std::ostream &ar_out, std::ostream &ar_err) {
    const std::string format = ar_args.Option("--format", "csv");
    if (format != "csv" && format != "json") {
        ar_err << "cxftool dump: unknown format '" << format << "' (csv or json)\n";
        return k_exit_usage;
    }
    LoadedFile file;
    if (!LoadFileOrComplain("dump", ar_args.file, file, ar_err))
        return k_exit_failure;
    const std::vector<boost::shared_ptr<CxF3ColorSpecification>> specifications =
        file.document->GetColorSpecifications();
    std::vector<std::string> specification_ids;
    for (const boost::shared_ptr<CxF3ColorSpecification> &specification : specifications)
        specification_ids.push_back(specification->GetId());
    CxF3::ObjectList objects;
    if (!ObjectsToDump(ar_args, *file.document, objects, ar_err))
        return k_exit_failure;
    std::vector<ObjectRow> rows;
    for (const boost::shared_ptr<CxF3Object> &object : objects)
        rows.push_back(RowOf(*object, specifications));

    if (format == "csv")
        WriteCsv(ar_out, specification_ids, rows);
    else
        WriteJson(ar_out, specification_ids, rows);
    return k_exit_ok;
}

} // namespace

const Command &DumpCommand() {
    static const Command command{
        "dump",
        "list the objects of FILE with Lab and reflectance, as CSV or JSON",
        "usage: cxftool dump FILE [--format csv|json] [--palette NAME]\n"
        "\n"
        "Writes one row per object: id, name, object type (as the file names it),\n"
        "then for each colour specification SPEC of the file, in the file's order:\n"
        "  - its Lab value (L, a, b);\n"
        "  - its reflectance on 36 points from 380 nm to 730 nm in steps of 10 nm.\n"
        "A value is empty (CSV) or null (JSON) when the object has none under that\n"
        "specification, or when its spectrum cannot be put on those 36 points (it\n"
        "must have steps of 10 nm and cover 400 nm to 700 nm). Values under an id\n"
        "that names no colour specification of the file are not listed.\n"
        "\n"
        "Options:\n"
        "  --format csv   (default) a header row, then one line per object; the\n"
        "                 columns after the type are SPEC:L, SPEC:a, SPEC:b,\n"
        "                 SPEC:380 ... SPEC:730. Fields holding a comma, quote,\n"
        "                 line break or edge space are quoted.\n"
        "  --format json  an array with one element per object:\n"
        "                 {\"id\", \"name\", \"type\", \"specifications\": {SPEC:\n"
        "                 {\"lab\": [L, a, b], \"reflectance\": [36 values]}}}.\n"
        "  --palette NAME only the objects of the palette NAME, in the palette's\n"
        "                 order; an object the palette lists twice is written\n"
        "                 twice. The name must match exactly; when palettes share\n"
        "                 the name, the first of them is taken. 'cxftool info'\n"
        "                 lists the palettes. A name that no palette has is an\n"
        "                 error (exit code 1). The columns stay those of the file.\n"
        "\n"
        "Numbers are written in the shortest form that reads back as the same\n"
        "double (e.g. 0.1, 42, 1e-07). Text is UTF-8.\n",
        {"--format", "--palette"},
        RunDump};
    return command;
}

} // namespace cxftool
