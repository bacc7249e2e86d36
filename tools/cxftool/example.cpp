// cxftool example FILE: writes a small CxF3 file built through the document
// classes: four paint swatches measured under two conditions, three palettes
// of them and the job that approves the trial. It is the bundled
// examples/swatches.cxf, and a short tour of the writing side of the classes.
//
// The swatches are made up: the spectra are smooth curves of the right
// shape, and the Lab values are typical of such colours rather than
// computed from the spectra.
#include "tools/cxftool/commands.h"

#include <tessarine/CxF3.h>

#include <cmath>

namespace cxftool {

namespace {

using Handle = boost::shared_ptr<CxF3Object>;

// 36 points from 380 nm in steps of 10 nm, as AddReflectanceSpectrum takes them.
constexpr int k_points = 36;
constexpr double k_first_nm = 380.0;
constexpr double k_step_nm = 10.0;

// An S-shaped reflectance rising from a_low to a_high around a_edge_nm, the
// shape of a red or yellow paint, plus an optional bump (the blue glow of an
// optical brightener, seen only when the light holds UV). Rounded to four
// decimals, as an instrument would report it.
std::vector<double> Spectrum(double a_low, double a_high, double a_edge_nm, double a_edge_width_nm,
                             double a_bump = 0.0) {
    std::vector<double> values;
    for (int point = 0; point < k_points; ++point) {
        const double nm = k_first_nm + point * k_step_nm;
        const double rise = 1.0 / (1.0 + std::exp(-(nm - a_edge_nm) / a_edge_width_nm));
        const double bump = a_bump * std::exp(-std::pow((nm - 440.0) / 20.0, 2.0));
        values.push_back(std::round((a_low + (a_high - a_low) * rise + bump) * 1e4) / 1e4);
    }
    return values;
}

std::string AddSpecification(CxF3 &ar_document, const std::string &ar_id, const std::string &ar_filter,
                             const std::string &ar_illuminant, const std::string &ar_observer) {
    const boost::shared_ptr<CxF3ColorSpecification> specification =
        CxF3ColorSpecification::CreateCxFColorSpecification();
    specification->SetId(ar_id);
    specification->SetFilter(ar_filter);
    specification->SetIlluminant(ar_illuminant);
    specification->SetObserver(ar_observer);
    specification->SetDeviceName("Spectro 45");
    specification->SetDeviceSerialNumber("SN-20417");
    specification->SetCalibrationStandard(CxF3CalibrationKLMB, CxF3VerimetraActive);
    return ar_document.AddColorSpecification(specification, false);
}

Handle NewObject(CxF3ObjectType a_type, const std::string &ar_name, const std::string &ar_info) {
    Handle object = CxF3Object::CreateCxFObject();
    object->SetObjectType(a_type);
    object->SetName(ar_name);
    object->SetInfo(ar_info);
    return object;
}

boost::shared_ptr<CxF3ColorRecipe> BrickRedRecipe(const std::string &ar_specification) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetName("Brick Red, 1 kg");
    recipe->SetColorSpecification(ar_specification);
    recipe->SetUnits("g");
    recipe->SetProcess("Brush");
    recipe->SetSubstrateType(CxF3SubstratePaper);
    recipe->AddColorant("Satin base", true, 850.0, 1.30);
    recipe->AddColorant("Iron Oxide Red", false, 135.0, 5.10);
    recipe->AddColorant("Carbon Black", false, 15.0, 1.80);
    recipe->AddTag("Assortment", "Autumn Range");
    recipe->AddTag("Substrate", "White Card");
    return recipe;
}

// AddObject numbers the objects in the order they are added: the target
// is O1, the trial O2, the card O3 and the colorant O4.
const char *const k_target_id = "O1";
const char *const k_trial_id = "O2";
const char *const k_card_id = "O3";
const char *const k_colorant_id = "O4";

// Each Add... below adds one swatch with the values it is measured with;
// false when the classes refuse one of them.

bool AddTarget(CxF3 &ar_document, const std::string &ar_m1, const std::string &ar_m2) {
    Handle target = NewObject(CxF3ObjectTarget, "Brick Red", "The colour the customer approved");
    // The tolerance names its standard by the object's id, which AddObject
    // gives only later.
    target->SetId(k_target_id);
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(T_CMC);
    tolerance.SetV(1.0f, 2.0f, 1.0f, 0.0f, 0.0f, 0.0f);
    return target->AddReflectanceSpectrum(Spectrum(0.055, 0.62, 600.0, 16.0), ar_m1, "Brick Red M1") &&
           target->AddReflectanceSpectrum(Spectrum(0.052, 0.61, 601.0, 16.0), ar_m2, "Brick Red M2") &&
           target->AddColorCIELab({44.8, 44.6, 30.2}, ar_m1, "Brick Red M1") &&
           target->AddColorCIELab({44.5, 42.9, 28.8}, ar_m2, "Brick Red M2") &&
           target->AddColorRecipe(BrickRedRecipe(ar_m1)) && target->AddTag("Paint", "Finish", "Satin") &&
           target->AddTag("Paint", "Gloss units", "35") && target->AddTolerance(tolerance, ar_m1) &&
           ar_document.AddObject(target);
}

bool AddTrial(CxF3 &ar_document, const std::string &ar_m1) {
    Handle trial = NewObject(CxF3ObjectTrial, "Brick Red, batch 2", "Second batch, slightly lighter");
    return trial->AddReflectanceSpectrum(Spectrum(0.058, 0.63, 602.0, 16.0), ar_m1, "Batch 2 M1") &&
           trial->AddColorCIELab({45.6, 43.1, 29.5}, ar_m1, "Batch 2 M1") && trial->AddTag("Paint", "Batch", "2") &&
           ar_document.AddObject(trial);
}

// M1 holds UV, which makes the brightener glow; M2 cuts it out.
bool AddCard(CxF3 &ar_document, const std::string &ar_m1, const std::string &ar_m2) {
    Handle card = NewObject(CxF3ObjectSubstrate, "White Card", "Brightened drawdown card");
    return card->AddReflectanceSpectrum(Spectrum(0.80, 0.88, 410.0, 8.0, 0.10), ar_m1, "White Card M1") &&
           card->AddReflectanceSpectrum(Spectrum(0.80, 0.88, 410.0, 8.0), ar_m2, "White Card M2") &&
           card->AddColorCIELab({94.6, 1.9, -7.4}, ar_m1, "White Card M1") &&
           card->AddColorCIELab({94.2, 0.4, -1.1}, ar_m2, "White Card M2") && card->AddSubstrateType(false) &&
           card->AddThickness(0.35, "mm") && ar_document.AddObject(card);
}

// A colorant is known by its spectrum alone.
bool AddColorant(CxF3 &ar_document, const std::string &ar_m1) {
    Handle colorant = NewObject(CxF3ObjectColorant, "Iron Oxide Red", "Masstone");
    return colorant->AddReflectanceSpectrum(Spectrum(0.05, 0.48, 592.0, 22.0), ar_m1, "Iron Oxide Red M1") &&
           ar_document.AddObject(colorant);
}

// "Targets" and "Trials" sort the swatches by type; "Brick Red materials"
// lists the colorant before the card, against the order of the file.
void AddPalettes(CxF3 &ar_document) {
    const CxF3::ObjectList &objects = ar_document.GetObjects();
    ar_document.AddStandardPalette(objects);
    ar_document.AddTrialPalette(objects);
    ar_document.AddPalette("Brick Red materials",
                           {ar_document.GetObjectById(k_colorant_id), ar_document.GetObjectById(k_card_id)});
}

// The trial judged against the target under M1, within a CIELAB dE of 2. A
// file keeps no name of a job apart from its series' set name, so both are
// the same. (A CMC limit would read back without its chroma weight.)
void AddApprovalJob(CxF3 &ar_document, const std::string &ar_m1) {
    const std::string name = "Brick Red approval";
    const boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->SetName(name);
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(T_DE);
    tolerance.SetV0(2.0f);
    job->AddSerie(k_target_id, name, &tolerance, ar_m1, {k_trial_id});
    ar_document.AddOstraJob(job);
}

int RunExample(const Arguments &ar_args, std::ostream & /*ar_out*/, std::ostream &ar_err) {
    const boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->SetCreator("Tessarine cxftool");
    document->SetFileInformationDescription("Four paint swatches of an autumn range, measured under M1 and M2");
    document->AddFileInformationTag("Project", "Autumn Range");
    document->AddFileInformationTag("Customer", "Hollin & Daughters");

    const std::string m1 = AddSpecification(*document, "M1_D50_2", "M1", "D50", "2");
    const std::string m2 = AddSpecification(*document, "M2_D65_10", "M2", "D65", "10");
    if (!(AddTarget(*document, m1, m2) && AddTrial(*document, m1) && AddCard(*document, m1, m2) &&
          AddColorant(*document, m1))) {
        ar_err << "cxftool example: the document classes refused a swatch\n";
        return k_exit_failure;
    }
    AddPalettes(*document);
    AddApprovalJob(*document, m1);
    if (!document->SaveCxF(ar_args.file)) {
        ar_err << "cxftool example: cannot write " << ar_args.file << "\n";
        return k_exit_failure;
    }
    return k_exit_ok;
}

} // namespace

const Command &ExampleCommand() {
    static const Command command{
        "example",
        "write a small example CxF3 file to FILE",
        "usage: cxftool example FILE\n"
        "\n"
        "Writes a CxF3 file of four made-up paint swatches: a target with its recipe\n"
        "and a CMC 2:1 tolerance, a trial, a brightened white card (substrate) and a\n"
        "colorant. They carry 36-point reflectance spectra from 380 nm and Lab values\n"
        "under two colour specifications, M1_D50_2 and M2_D65_10, with tags and\n"
        "file tags. The objects are numbered O1 to O4. Three palettes group them:\n"
        "\"Targets\" (O1), \"Trials\" (O2) and \"Brick Red materials\" (O4, O3); a job,\n"
        "\"Brick Red approval\", judges the trial against the target under M1_D50_2\n"
        "within a CIELAB dE of 2. The file gets the time of writing as its creation\n"
        "date. A FILE without an extension gets \".cxf\".\n"
        "Prints nothing on success.\n",
        {},
        RunExample};
    return command;
}

} // namespace cxftool
