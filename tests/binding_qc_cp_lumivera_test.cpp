// The bound classes of the three groups that travel inside cc:CustomResources:
// quality control (qc), colour pages (cp) and the branded colour library,
// whose elements live in the default namespace. Each is read, refused where
// a required member is missing or a member is out of place, and written back.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include <cxf/v3/cxf3-Lumivera_v1.h>
#include <cxf/v3/cxf3.h>
#include <cxf/v3/cxf3_colorpage.h>
#include <cxf/v3/cxf3_qualitycontrol.h>

#include "bound_reads.h"

namespace {

using lmx::elmx_error;
using tessarine_test::read;

const elmx_error k_ok = lmx::elmx_ok;
const elmx_error k_not_found = lmx::elmx_element_not_found;
const elmx_error k_bad_end = lmx::elmx_bad_end_of_element;
const elmx_error k_missing_element = lmx::elmx_mandatory_element_missing;
const elmx_error k_missing_attribute = lmx::elmx_required_attribute_missing;
const elmx_error k_occurs = lmx::elmx_marshal_occurs_error;

const std::string k_qc = std::string("xmlns:qc=\"") + qc::k_namespace_uri + "\"";
const std::string k_cp = std::string("xmlns:cp=\"") + cp::k_namespace_uri + "\"";
const std::string k_lv = std::string("xmlns=\"") + lumivera::k_namespace_uri + "\"";
const std::string k_prolog = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";

// The text with its one occurrence of ar_piece replaced.
std::string replaced(const std::string &ar_text, const std::string &ar_piece, const std::string &ar_replacement) {
    std::string::size_type at = ar_text.find(ar_piece);
    EXPECT_NE(at, std::string::npos) << ar_piece;
    EXPECT_EQ(ar_text.find(ar_piece, at + 1), std::string::npos) << ar_piece << " is not unique";
    if (at == std::string::npos)
        return ar_text;
    return ar_text.substr(0, at) + ar_replacement + ar_text.substr(at + ar_piece.size());
}

std::string without(const std::string &ar_text, const std::string &ar_piece) {
    return replaced(ar_text, ar_piece, "");
}

// Reads, writes, reads the writing and writes again, three times over: the
// writings must agree byte for byte.
template <typename T> void expect_stable_round_trip(const std::string &ar_document) {
    T first;
    ASSERT_EQ(read(first, ar_document), k_ok) << ar_document;
    std::string written_1;
    ASSERT_EQ(first.marshal(written_1), k_ok);
    T second;
    ASSERT_EQ(read(second, written_1), k_ok) << written_1;
    std::string written_2;
    ASSERT_EQ(second.marshal(written_2), k_ok);
    T third;
    ASSERT_EQ(read(third, written_2), k_ok) << written_2;
    std::string written_3;
    ASSERT_EQ(third.marshal(written_3), k_ok);
    EXPECT_EQ(written_2, written_1);
    EXPECT_EQ(written_3, written_2);
}

// ================================================================ quality control

std::string range(const std::string &ar_tag, const std::string &ar_body) {
    return "<qc:" + ar_tag + ">" + ar_body + "</qc:" + ar_tag + ">";
}
const std::string k_max_min = "<qc:max>1.5</qc:max><qc:min>-1.5</qc:min>";

std::string lab_tolerances(const std::string &ar_body) {
    return "<qc:CIELabTolerances " + k_qc + ">" + ar_body + "</qc:CIELabTolerances>";
}
std::string tolerance_set(const std::string &ar_attributes, const std::string &ar_body) {
    return "<qc:ToleranceSet" + ar_attributes + ">" + ar_body + "</qc:ToleranceSet>";
}
std::string qc_set(int a_tolerance_sets, const std::string &ar_after = "") {
    std::string body;
    for (int i = 0; i < a_tolerance_sets; ++i)
        body += "<qc:ToleranceSet ColorSpecification=\"cs" + std::to_string(i) + "\"/>";
    return "<qc:QCSet " + k_qc + " Name=\"set\" StandardRef=\"std-1\">" + body + ar_after + "</qc:QCSet>";
}

const std::string k_quality_control =
    "<qc:QualityControl " + k_qc +
    " Name=\"press check\">"
    "<qc:QCSet Name=\"set 1\" StandardRef=\"std-1\">"
    "<qc:ToleranceSet Name=\"tight\" ColorSpecification=\"cs-d50\">"
    "<qc:CIELabTolerances>" +
    range("dLTol", k_max_min) + range("dATol", k_max_min) + range("dBTol", k_max_min) + range("dCTol", k_max_min) +
    range("dHTol", k_max_min) +
    "<qc:dETol LRatio=\"1\">2</qc:dETol>"
    "<qc:dEcmcTol LRatio=\"2\">1.5</qc:dEcmcTol>"
    "<qc:dE94Tol>1</qc:dE94Tol>"
    "<qc:dE2000Tol LRatio=\"1\">2.5</qc:dE2000Tol>"
    "</qc:CIELabTolerances>"
    "<qc:CustomTolerances>"
    "<qc:Tol Label=\"gloss\"><qc:max>5</qc:max><qc:min>0</qc:min></qc:Tol>"
    "<qc:Tol Label=\"opacity\"><qc:max>99</qc:max><qc:min>90</qc:min></qc:Tol>"
    "</qc:CustomTolerances>"
    "</qc:ToleranceSet>"
    "<qc:ToleranceSet ColorSpecification=\"cs-d65\"/>"
    "<qc:SampleSet><qc:Obj Id=\"s1\"/><qc:Obj Id=\"s2\"/></qc:SampleSet>"
    "</qc:QCSet>"
    "<qc:QCSet Name=\"set 2\" StandardRef=\"std-2\"/>"
    "</qc:QualityControl>";

TEST(BindingQualityControl, ReadsAWholeDocument) {
    qc::c_QualityControl control;
    ASSERT_EQ(read(control, k_quality_control), k_ok);
    EXPECT_EQ(control.get_Name(), L"press check");
    ASSERT_EQ(control.size_QCSet(), 2u);
    const qc::c_QCSet &set = control.get_QCSet(0);
    EXPECT_EQ(set.get_StandardRef(), L"std-1");
    ASSERT_EQ(set.size_ToleranceSet(), 2u);
    const qc::c_ToleranceSet &tight = set.get_ToleranceSet(0);
    EXPECT_EQ(tight.get_Name(), L"tight");
    ASSERT_NE(tight.get_CIELabTolerances(), nullptr);
    const qc::c_CIELabTolerances &lab = *tight.get_CIELabTolerances();
    ASSERT_NE(lab.get_dLTol(), nullptr);
    EXPECT_EQ(lab.get_dLTol()->get_max(), 1.5);
    EXPECT_EQ(lab.get_dLTol()->get_min(), -1.5);
    ASSERT_NE(lab.get_dETol(), nullptr);
    EXPECT_EQ(lab.get_dETol()->get_value(), 2.0);
    EXPECT_EQ(lab.get_dETol()->get_LRatio(), 1.0);
    ASSERT_NE(lab.get_dE94Tol(), nullptr);
    EXPECT_FALSE(lab.get_dE94Tol()->isset_LRatio());
    ASSERT_NE(tight.get_CustomTolerances(), nullptr);
    ASSERT_EQ(tight.get_CustomTolerances()->size_Tol(), 2u);
    EXPECT_EQ(tight.get_CustomTolerances()->get_Tol(1).get_Label(), L"opacity");
    EXPECT_EQ(tight.get_CustomTolerances()->get_Tol(1).get_min(), 90.0);
    EXPECT_FALSE(set.get_ToleranceSet(1).isset_Name());
    ASSERT_NE(set.get_SampleSet(), nullptr);
    ASSERT_EQ(set.get_SampleSet()->size_Obj(), 2u);
    EXPECT_EQ(set.get_SampleSet()->get_Obj(1).get_Id(), L"s2");
    EXPECT_EQ(control.get_QCSet(1).size_ToleranceSet(), 0u);
    EXPECT_FALSE(control.get_QCSet(1).isset_SampleSet());
}

TEST(BindingQualityControl, EmptyQualityControlNeedsOnlyItsName) {
    qc::c_QualityControl control;
    EXPECT_EQ(read(control, "<qc:QualityControl " + k_qc + " Name=\"q\"/>"), k_ok);
    EXPECT_EQ(control.size_QCSet(), 0u);
    EXPECT_EQ(read(control, "<qc:QualityControl " + k_qc + " Name=\"q\"></qc:QualityControl>"), k_ok);
    EXPECT_EQ(read(control, "<qc:QualityControl " + k_qc + "/>"), k_missing_attribute);
    EXPECT_EQ(read(control, "<qc:QualityControl " + k_qc + "></qc:QualityControl>"), k_missing_attribute);
}

TEST(BindingQualityControl, RangeToleranceNeedsMaxThenMin) {
    const tessarine_test::s_read_row rows[] = {
        {"max and min", lab_tolerances(range("dLTol", "<qc:max>1</qc:max><qc:min>0</qc:min>")), k_ok, nullptr},
        {"max without min", lab_tolerances(range("dLTol", "<qc:max>1</qc:max>")), k_missing_element, nullptr},
        {"min without max", lab_tolerances(range("dATol", "<qc:min>0</qc:min>")), k_missing_element, nullptr},
        // max comes first: at min the reader is still waiting for max.
        {"min then max", lab_tolerances(range("dCTol", "<qc:min>0</qc:min><qc:max>1</qc:max>")), k_missing_element,
         nullptr},
        {"max twice", lab_tolerances(range("dHTol", "<qc:max>1</qc:max><qc:max>2</qc:max>")), k_missing_element,
         nullptr},
    };
    tessarine_test::expect_reads<qc::c_CIELabTolerances>(rows);

    const std::string open = "<qc:CustomTolerances " + k_qc + "><qc:Tol Label=\"l\">";
    const std::string close = "</qc:Tol></qc:CustomTolerances>";
    const tessarine_test::s_read_row custom_rows[] = {
        {"max and min", open + "<qc:max>1</qc:max><qc:min>0</qc:min>" + close, k_ok, nullptr},
        {"max without min", open + "<qc:max>1</qc:max>" + close, k_missing_element, nullptr},
        {"min without max", open + "<qc:min>0</qc:min>" + close, k_missing_element, nullptr},
        {"min then max", open + "<qc:min>0</qc:min><qc:max>1</qc:max>" + close, k_missing_element, nullptr},
    };
    tessarine_test::expect_reads<qc::c_CustomTolerances>(custom_rows);
}

TEST(BindingQualityControl, CIELabTolerancesKeepTheirOrder) {
    const tessarine_test::s_read_row rows[] = {
        {"empty", lab_tolerances(""), k_ok, nullptr},
        {"dETol alone", lab_tolerances("<qc:dETol>2</qc:dETol>"), k_ok, nullptr},
        {"dHTol after dETol", lab_tolerances("<qc:dETol>2</qc:dETol>" + range("dHTol", k_max_min)), k_bad_end,
         "qc:CIELabTolerances"},
        {"dLTol twice", lab_tolerances(range("dLTol", k_max_min) + range("dLTol", k_max_min)), k_bad_end,
         "qc:CIELabTolerances"},
    };
    tessarine_test::expect_reads<qc::c_CIELabTolerances>(rows);
}

TEST(BindingQualityControl, LRatioIsOptionalOnEveryDeltaE) {
    for (const char *tag : {"dETol", "dEcmcTol", "dE94Tol", "dE2000Tol"}) {
        SCOPED_TRACE(tag);
        const std::string name = std::string("qc:") + tag;
        qc::c_CIELabTolerances without_ratio;
        ASSERT_EQ(read(without_ratio, lab_tolerances("<" + name + ">2</" + name + ">")), k_ok);
        qc::c_CIELabTolerances with_ratio;
        ASSERT_EQ(read(with_ratio, lab_tolerances("<" + name + " LRatio=\"1.5\">2</" + name + ">")), k_ok);
    }
    qc::c_CIELabTolerances lab;
    ASSERT_EQ(read(lab, lab_tolerances("<qc:dETol>2</qc:dETol><qc:dE2000Tol LRatio=\"0.5\">1</qc:dE2000Tol>")),
              k_ok);
    const qc::c_CIELabTolerances &read_lab = lab;
    ASSERT_NE(read_lab.get_dETol(), nullptr);
    EXPECT_FALSE(read_lab.get_dETol()->isset_LRatio());
    EXPECT_EQ(read_lab.get_dETol()->get_value(), 2.0);
    ASSERT_NE(read_lab.get_dE2000Tol(), nullptr);
    EXPECT_TRUE(read_lab.get_dE2000Tol()->isset_LRatio());
    EXPECT_EQ(read_lab.get_dE2000Tol()->get_LRatio(), 0.5);
    EXPECT_FALSE(read_lab.isset_dEcmcTol());

    qc::c_SingleDEToleranceType tolerance;
    tolerance.set_value(3);
    EXPECT_TRUE(tolerance.is_occurs_ok());
    std::string out;
    ASSERT_EQ(tolerance.marshal(out), k_ok);
    EXPECT_EQ(out.find("LRatio"), std::string::npos) << out;
}

TEST(BindingQualityControl, AFourthToleranceSetIsReportedAtTheEndOfTheSet) {
    qc::c_QCSet set;
    EXPECT_EQ(read(set, qc_set(0)), k_ok);
    EXPECT_EQ(read(set, qc_set(3)), k_ok);
    EXPECT_EQ(set.size_ToleranceSet(), 3u);
    EXPECT_EQ(read(set, qc_set(3, "<qc:SampleSet/>")), k_ok);
    lmx::s_debug_error debug;
    EXPECT_EQ(read(set, qc_set(4), &debug), k_bad_end);
    EXPECT_EQ(debug.item_name, "qc:QCSet");
    EXPECT_EQ(read(set, qc_set(4, "<qc:SampleSet/>")), k_bad_end);
    // Out of order: the sample set comes last.
    EXPECT_EQ(read(set, "<qc:QCSet " + k_qc +
                            " Name=\"s\" StandardRef=\"r\"><qc:SampleSet/><qc:ToleranceSet ColorSpecification=\"c\"/>"
                            "</qc:QCSet>"),
              k_bad_end);
}

TEST(BindingQualityControl, AQCSetOfFourToleranceSetsIsNotWritten) {
    qc::c_QCSet set;
    set.set_Name(L"set");
    set.set_StandardRef(L"std-1");
    for (int i = 0; i < 3; ++i)
        set.append_ToleranceSet().set_ColorSpecification(L"cs" + std::to_wstring(i));
    EXPECT_TRUE(set.is_occurs_ok());
    std::string out;
    ASSERT_EQ(set.marshal(out), k_ok);
    qc::c_QCSet again;
    ASSERT_EQ(read(again, out), k_ok);
    EXPECT_EQ(again.size_ToleranceSet(), 3u);

    set.append_ToleranceSet().set_ColorSpecification(L"cs3");
    EXPECT_FALSE(set.is_occurs_ok());
    std::string refused = "untouched";
    EXPECT_EQ(set.marshal(refused), k_occurs);
    EXPECT_EQ(refused, "untouched");

    // Inside a quality control the whole write fails.
    qc::c_QualityControl control;
    control.set_Name(L"q");
    control.append_QCSet(set);
    EXPECT_EQ(control.marshal(refused), k_occurs);
}

TEST(BindingQualityControl, ToleranceSetNeedsOnlyItsColorSpecification) {
    const std::string cs = " " + k_qc + " ColorSpecification=\"cs\"";
    const std::string lab = "<qc:CIELabTolerances/>";
    const std::string custom = "<qc:CustomTolerances/>";
    const tessarine_test::s_read_row rows[] = {
        {"no children", tolerance_set(cs, ""), k_ok, nullptr},
        {"empty element", "<qc:ToleranceSet" + cs + "/>", k_ok, nullptr},
        {"CIELab tolerances alone", tolerance_set(cs, lab), k_ok, nullptr},
        {"custom tolerances alone", tolerance_set(cs, custom), k_ok, nullptr},
        {"both", tolerance_set(cs + " Name=\"n\"", lab + custom), k_ok, nullptr},
        {"both, out of order", tolerance_set(cs, custom + lab), k_bad_end, "qc:ToleranceSet"},
        {"no ColorSpecification", tolerance_set(" " + k_qc + " Name=\"n\"", lab), k_missing_attribute, nullptr},
    };
    tessarine_test::expect_reads<qc::c_ToleranceSet>(rows);
}

// Each row takes one required member out of the whole document.
TEST(BindingQualityControl, EveryRequiredMemberIsNeededOnReading) {
    struct s_row {
        const char *name;
        std::string taken;
        std::string replacement;
        elmx_error error;
    };
    const s_row rows[] = {
        {"Name of QualityControl", " Name=\"press check\"", "", k_missing_attribute},
        {"Name of QCSet", " Name=\"set 2\"", "", k_missing_attribute},
        {"StandardRef of QCSet", " StandardRef=\"std-1\"", "", k_missing_attribute},
        {"ColorSpecification of ToleranceSet", " ColorSpecification=\"cs-d65\"", "", k_missing_attribute},
        {"Id of Obj", " Id=\"s2\"", "", k_missing_attribute},
        {"Label of Tol", " Label=\"gloss\"", "", k_missing_attribute},
        {"max of dHTol", range("dHTol", k_max_min), range("dHTol", "<qc:min>-1.5</qc:min>"), k_missing_element},
        {"min of dHTol", range("dHTol", k_max_min), range("dHTol", "<qc:max>1.5</qc:max>"), k_missing_element},
        {"max of Tol", "<qc:max>5</qc:max>", "", k_missing_element},
        {"min of Tol", "<qc:min>90</qc:min>", "", k_missing_element},
    };
    for (const s_row &row : rows) {
        SCOPED_TRACE(row.name);
        const std::string document = replaced(k_quality_control, row.taken, row.replacement);
        qc::c_QualityControl control;
        EXPECT_EQ(read(control, document), row.error) << document;
    }
}

TEST(BindingQualityControl, EveryRequiredMemberIsNeededOnWriting) {
    std::string out;
    qc::c_QualityControl control;
    EXPECT_FALSE(control.is_occurs_ok());
    EXPECT_EQ(control.marshal(out), k_occurs);
    control.set_Name(L"q");
    EXPECT_EQ(control.marshal(out), k_ok);

    qc::c_QCSet name_only;
    name_only.set_Name(L"s");
    EXPECT_EQ(name_only.marshal(out), k_occurs);
    qc::c_QCSet reference_only;
    reference_only.set_StandardRef(L"r");
    EXPECT_EQ(reference_only.marshal(out), k_occurs);
    // Nested, the missing member fails the whole write.
    control.append_QCSet(reference_only);
    EXPECT_EQ(control.marshal(out), k_occurs);

    qc::c_Obj obj;
    EXPECT_EQ(obj.marshal(out), k_occurs);
    qc::c_SampleSet samples;
    samples.append_Obj(obj);
    EXPECT_EQ(samples.marshal(out), k_occurs);
    samples.get_Obj(0).set_Id(L"o");
    EXPECT_EQ(samples.marshal(out), k_ok);

    qc::c_ToleranceSet tolerance_set_object;
    tolerance_set_object.set_Name(L"n");
    EXPECT_EQ(tolerance_set_object.marshal(out), k_occurs);
    tolerance_set_object.set_ColorSpecification(L"cs");
    EXPECT_EQ(tolerance_set_object.marshal(out), k_ok);

    qc::c_RangeToleranceType max_only;
    max_only.set_max(1);
    EXPECT_EQ(max_only.marshal(out), k_occurs);
    qc::c_RangeToleranceType min_only;
    min_only.set_min(0);
    EXPECT_EQ(min_only.marshal(out), k_occurs);
    qc::c_CIELabTolerances lab;
    lab.assign_dLTol(max_only);
    EXPECT_EQ(lab.marshal(out), k_occurs);
    lab.get_dLTol().set_min(0);
    EXPECT_EQ(lab.marshal(out), k_ok);

    qc::c_CustomRangeToleranceType tol;
    tol.set_max(1);
    tol.set_min(0);
    EXPECT_EQ(tol.marshal(out), k_occurs); // no Label
    qc::c_CustomRangeToleranceType labelled;
    labelled.set_Label(L"l");
    labelled.set_max(1);
    EXPECT_EQ(labelled.marshal(out), k_occurs); // no min
    qc::c_CustomTolerances custom;
    custom.append_Tol(labelled);
    EXPECT_EQ(custom.marshal(out), k_occurs);
    custom.get_Tol(0).set_min(0);
    EXPECT_EQ(custom.marshal(out), k_ok);

    qc::c_SingleDEToleranceType delta_e;
    delta_e.set_LRatio(1);
    EXPECT_EQ(delta_e.marshal(out), k_occurs); // no value
}

struct s_global {
    const char *name;
    std::string document;
    qc::c_qc::elmx_chosen chosen;
    std::function<bool(const qc::c_qc &)> holds;
};

const std::vector<s_global> &globals() {
    static const std::vector<s_global> s_globals = {
        {"qc:QualityControl", k_quality_control, qc::c_qc::EQualityControl,
         [](const qc::c_qc &ar_qc) {
             return ar_qc.get_QualityControl() && ar_qc.get_QualityControl()->get_Name() == L"press check";
         }},
        {"qc:QCSet", qc_set(2, "<qc:SampleSet><qc:Obj Id=\"a\"/></qc:SampleSet>"), qc::c_qc::EQCSet,
         [](const qc::c_qc &ar_qc) { return ar_qc.get_QCSet() && ar_qc.get_QCSet()->size_ToleranceSet() == 2; }},
        {"qc:SampleSet", "<qc:SampleSet " + k_qc + "><qc:Obj Id=\"a\"/><qc:Obj Id=\"b\"/></qc:SampleSet>",
         qc::c_qc::ESampleSet,
         [](const qc::c_qc &ar_qc) { return ar_qc.get_SampleSet() && ar_qc.get_SampleSet()->size_Obj() == 2; }},
        {"qc:Obj", "<qc:Obj " + k_qc + " Id=\"sample-7\"/>", qc::c_qc::EObj,
         [](const qc::c_qc &ar_qc) { return ar_qc.get_Obj() && ar_qc.get_Obj()->get_Id() == L"sample-7"; }},
        {"qc:ToleranceSet", tolerance_set(" " + k_qc + " ColorSpecification=\"cs\"", "<qc:CustomTolerances/>"),
         qc::c_qc::EToleranceSet,
         [](const qc::c_qc &ar_qc) {
             return ar_qc.get_ToleranceSet() && ar_qc.get_ToleranceSet()->isset_CustomTolerances();
         }},
        {"qc:CustomTolerances",
         "<qc:CustomTolerances " + k_qc +
             "><qc:Tol Label=\"l\"><qc:max>1</qc:max><qc:min>0</qc:min></qc:Tol></qc:CustomTolerances>",
         qc::c_qc::ECustomTolerances,
         [](const qc::c_qc &ar_qc) {
             return ar_qc.get_CustomTolerances() && ar_qc.get_CustomTolerances()->size_Tol() == 1;
         }},
        {"qc:CIELabTolerances", lab_tolerances("<qc:dETol LRatio=\"2\">1.5</qc:dETol>"), qc::c_qc::ECIELabTolerances,
         [](const qc::c_qc &ar_qc) {
             return ar_qc.get_CIELabTolerances() && ar_qc.get_CIELabTolerances()->get_dETol() &&
                    ar_qc.get_CIELabTolerances()->get_dETol()->get_value() == 1.5;
         }},
    };
    return s_globals;
}

TEST(BindingQualityControl, EntryClassSelectsEachGlobalElement) {
    ASSERT_EQ(globals().size(), 7u);
    for (const s_global &global : globals()) {
        SCOPED_TRACE(global.name);
        qc::c_qc entry;
        EXPECT_EQ(entry.getchosen(), qc::c_qc::Echoice_not_set);
        ASSERT_EQ(read(entry, global.document), k_ok);
        EXPECT_EQ(entry.getchosen(), global.chosen);
        EXPECT_TRUE(entry.is_occurs_ok());
        EXPECT_TRUE(global.holds(entry));

        elmx_error error = lmx::elmx_undefined_error;
        qc::c_qc from_text(global.document, &error);
        EXPECT_EQ(error, k_ok);
        EXPECT_EQ(from_text.getchosen(), global.chosen);
    }
}

TEST(BindingQualityControl, EntryClassRefusesOtherRoots) {
    const tessarine_test::s_read_row rows[] = {
        {"unknown element", "<qc:Unknown " + k_qc + "/>", k_not_found, nullptr},
        {"local element dLTol", "<qc:dLTol " + k_qc + ">" + k_max_min + "</qc:dLTol>", k_not_found, nullptr},
        {"local element Tol",
         "<qc:Tol " + k_qc + " Label=\"l\"><qc:max>1</qc:max><qc:min>0</qc:min></qc:Tol>", k_not_found, nullptr},
        {"global name in the core namespace",
         std::string("<cc:QualityControl xmlns:cc=\"") + cc::k_namespace_uri + "\" Name=\"q\"/>", k_not_found,
         nullptr},
        {"global name in no namespace", "<QualityControl Name=\"q\"/>", k_not_found, nullptr},
        {"colour page object", "<cp:Obj " + k_cp + " Id=\"o\"/>", k_not_found, nullptr},
    };
    tessarine_test::expect_reads<qc::c_qc>(rows);
}

TEST(BindingQualityControl, EntryClassRoundTripIsStable) {
    for (const s_global &global : globals()) {
        SCOPED_TRACE(global.name);
        expect_stable_round_trip<qc::c_qc>(global.document);
        qc::c_qc entry;
        ASSERT_EQ(read(entry, global.document), k_ok);
        std::string out;
        ASSERT_EQ(entry.marshal(out), k_ok);
        // The writing opens with the chosen element.
        EXPECT_EQ(out.compare(0, k_prolog.size() + 1 + std::string(global.name).size(),
                              k_prolog + "<" + global.name),
                  0)
            << out;
    }
}

TEST(BindingQualityControl, QualityControlRoundTripIsStable) {
    expect_stable_round_trip<qc::c_QualityControl>(k_quality_control);
    qc::c_QualityControl control;
    ASSERT_EQ(read(control, k_quality_control), k_ok);
    std::string out;
    ASSERT_EQ(control.marshal(out), k_ok);
    // max is written before min, as it is read.
    EXPECT_LT(out.find("<qc:max>"), out.find("<qc:min>"));
    EXPECT_NE(out.find("LRatio=\"2\""), std::string::npos);
}

// ================================================================ colour pages

std::string color_page(const std::string &ar_attributes, const std::string &ar_body) {
    return "<cp:ColorPage " + k_cp + ar_attributes + ">" + ar_body + "</cp:ColorPage>";
}

const std::string k_color_page = color_page(" Name=\"fan\" NumPages=\"2\" MaxRows=\"3\" MaxColumns=\"4\"",
                                            "<cp:Page Name=\"p1\" NumRows=\"2\">"
                                            "<cp:Row Name=\"r1\" NumColumns=\"3\"><cp:Obj Id=\"o1\"/></cp:Row>"
                                            "<cp:Row Name=\"r2\" NumColumns=\"4\"/>"
                                            "</cp:Page>"
                                            "<cp:Page Name=\"p2\" NumRows=\"0\"/>");

TEST(BindingColorPage, ReadsPagesRowsAndObjects) {
    cp::ColorPage page;
    ASSERT_EQ(read(page, k_color_page), k_ok);
    EXPECT_EQ(page.get_Name(), L"fan");
    EXPECT_EQ(page.get_NumPages(), 2);
    EXPECT_EQ(page.get_MaxRows(), 3);
    EXPECT_EQ(page.get_MaxColumns(), 4);
    ASSERT_EQ(page.size_Page(), 2u);
    ASSERT_EQ(page.get_Page(0).size_Row(), 2u);
    const cp::Row &row = page.get_Page(0).get_Row(0);
    EXPECT_EQ(row.get_NumColumns(), 3);
    ASSERT_EQ(row.size_Obj(), 1u);
    EXPECT_EQ(row.get_Obj(0).get_Id(), L"o1");
    EXPECT_EQ(page.get_Page(1).size_Row(), 0u);
    expect_stable_round_trip<cp::ColorPage>(k_color_page);
}

TEST(BindingColorPage, ColorPageNeedsNameAndNumPages) {
    const tessarine_test::s_read_row rows[] = {
        {"name and number of pages", color_page(" Name=\"fan\" NumPages=\"1\"", ""), k_ok, nullptr},
        {"empty element", "<cp:ColorPage " + k_cp + " Name=\"fan\" NumPages=\"1\"/>", k_ok, nullptr},
        {"without NumPages", color_page(" Name=\"fan\" MaxRows=\"3\" MaxColumns=\"4\"", ""), k_missing_attribute,
         nullptr},
        {"without Name", color_page(" NumPages=\"1\"", ""), k_missing_attribute, nullptr},
        {"NumPages above a short", color_page(" Name=\"fan\" NumPages=\"32768\"", ""),
         lmx::elmx_value_above_maximum, nullptr},
    };
    tessarine_test::expect_reads<cp::ColorPage>(rows);

    cp::ColorPage page;
    ASSERT_EQ(read(page, color_page(" Name=\"fan\" NumPages=\"1\"", "")), k_ok);
    EXPECT_FALSE(page.isset_MaxRows());
    EXPECT_FALSE(page.isset_MaxColumns());
    std::string out;
    ASSERT_EQ(page.marshal(out), k_ok);
    EXPECT_EQ(out.find("MaxRows"), std::string::npos);
}

TEST(BindingColorPage, EveryLevelMayBeEmpty) {
    const tessarine_test::s_read_row rows[] = {
        {"empty colour page", color_page(" Name=\"c\" NumPages=\"0\"", ""), k_ok, nullptr},
        {"empty page", color_page(" Name=\"c\" NumPages=\"1\"", "<cp:Page Name=\"p\" NumRows=\"0\"/>"), k_ok,
         nullptr},
        {"empty row",
         color_page(" Name=\"c\" NumPages=\"1\"",
                    "<cp:Page Name=\"p\" NumRows=\"1\"><cp:Row Name=\"r\" NumColumns=\"0\"></cp:Row></cp:Page>"),
         k_ok, nullptr},
    };
    tessarine_test::expect_reads<cp::ColorPage>(rows);
}

TEST(BindingColorPage, RowOfThreeColumnsMayHoldOneObject) {
    const std::string document =
        color_page(" Name=\"c\" NumPages=\"1\"",
                   "<cp:Page Name=\"p\" NumRows=\"1\"><cp:Row Name=\"r\" NumColumns=\"3\"><cp:Obj Id=\"only\"/>"
                   "</cp:Row></cp:Page>");
    cp::ColorPage page;
    ASSERT_EQ(read(page, document), k_ok);
    EXPECT_EQ(page.get_Page(0).get_Row(0).get_NumColumns(), 3);
    EXPECT_EQ(page.get_Page(0).get_Row(0).size_Obj(), 1u);
}

TEST(BindingColorPage, PageAndRowNeedTheirAttributes) {
    const std::string attributes = " Name=\"c\" NumPages=\"1\"";
    const tessarine_test::s_read_row rows[] = {
        {"page without NumRows", color_page(attributes, "<cp:Page Name=\"p\"/>"), k_missing_attribute, nullptr},
        {"page without Name", color_page(attributes, "<cp:Page NumRows=\"1\"/>"), k_missing_attribute, nullptr},
        {"page of 40000 rows", color_page(attributes, "<cp:Page Name=\"p\" NumRows=\"40000\"/>"),
         lmx::elmx_value_above_maximum, nullptr},
        {"row without NumColumns",
         color_page(attributes, "<cp:Page Name=\"p\" NumRows=\"1\"><cp:Row Name=\"r\"/></cp:Page>"),
         k_missing_attribute, nullptr},
        {"row without Name",
         color_page(attributes, "<cp:Page Name=\"p\" NumRows=\"1\"><cp:Row NumColumns=\"1\"/></cp:Page>"),
         k_missing_attribute, nullptr},
    };
    tessarine_test::expect_reads<cp::ColorPage>(rows);
}

TEST(BindingColorPage, ObjectIsIdentifiedById) {
    const std::string head = "<cp:ColorPage " + k_cp +
                             " Name=\"c\" NumPages=\"1\"><cp:Page Name=\"p\" NumRows=\"1\">"
                             "<cp:Row Name=\"r\" NumColumns=\"1\">";
    const std::string close = "</cp:Row></cp:Page></cp:ColorPage>";
    const tessarine_test::s_read_row rows[] = {
        {"Id", head + "<cp:Obj Id=\"o1\"/>" + close, k_ok, nullptr},
        {"no attribute", head + "<cp:Obj/>" + close, k_missing_attribute, nullptr},
        {"ID in upper case", head + "<cp:Obj ID=\"o1\"/>" + close, lmx::elmx_unexpected_attribute, "@ID"},
        {"ObjectId", head + "<cp:Obj ObjectId=\"o1\"/>" + close, lmx::elmx_unexpected_attribute, "@ObjectId"},
    };
    tessarine_test::expect_reads<cp::ColorPage>(rows);

    cp::Obj obj;
    ASSERT_EQ(read(obj, "<cp:Obj " + k_cp + " Id=\"o9\"/>"), k_ok);
    EXPECT_EQ(obj.get_Id(), L"o9");
    EXPECT_EQ(read(obj, "<cp:Obj " + k_cp + "/>"), k_missing_attribute);
}

TEST(BindingColorPage, RequiredAttributesAreNeededOnWriting) {
    std::string out;
    cp::ColorPage page;
    page.set_Name(L"fan");
    EXPECT_EQ(page.marshal(out), k_occurs);
    page.set_NumPages(1);
    EXPECT_EQ(page.marshal(out), k_ok);
    cp::Page &first = page.append_Page();
    first.set_Name(L"p");
    EXPECT_EQ(page.marshal(out), k_occurs);
    first.set_NumRows(1);
    cp::Row &row = first.append_Row();
    row.set_Name(L"r");
    row.set_NumColumns(3);
    cp::Obj &obj = row.append_Obj();
    EXPECT_EQ(page.marshal(out), k_occurs);
    obj.set_Id(L"o1");
    ASSERT_EQ(page.marshal(out), k_ok);
    EXPECT_NE(out.find("<cp:Obj Id=\"o1\"/>"), std::string::npos) << out;
    expect_stable_round_trip<cp::ColorPage>(out);
}

// ================================================================ the branded colour library

// A whole library, each attribute value unique within the document.
const std::string k_standards = "<MasterStandard name=\"master\" publicname=\"Master\">ms</MasterStandard>"
                                "<DependentStandard name=\"dependent\" publicname=\"Dependent\">ds</DependentStandard>"
                                "<Substrate name=\"substrate\">paper</Substrate>"
                                "<PrintingCondition name=\"condition\" type=\"offset\">pc</PrintingCondition>"
                                "<WorkingStandard name=\"working\">ws</WorkingStandard>"
                                "<Finish name=\"finish\">matte</Finish>"
                                "<WorkflowRestriction name=\"restriction\">none</WorkflowRestriction>";
const std::string k_color = "<LVColor ref=\"r1\" Tint=\"100\" Status=\"21\" Revision=\"22\" Code=\"C-1\""
                            " stdref=\"std\" VTSignature=\"vt\" Comment=\"colour comment\" LibraryUpdateBatch=\"7\">" +
                            k_standards + "</LVColor>";
const std::string k_library = "<LVLibrary LVType=\"Library\" name=\"Fan\" Status=\"11\" Revision=\"12\" GUID=\"g-1\""
                              " PublicName=\"Fan deck\" Comment=\"library comment\">" +
                              k_color + "</LVLibrary>";
const std::string k_lumivera_body = " version=\"1.0\" Description=\"fan deck\">" + k_library + "</Lumivera>";
const std::string k_lumivera = "<Lumivera " + k_lv + k_lumivera_body;

// An element of the library as a document of its own: the namespace
// declared on it.
std::string alone(const std::string &ar_element) {
    std::string::size_type at = ar_element.find_first_of(" >");
    return ar_element.substr(0, at) + " " + k_lv + ar_element.substr(at);
}

// The same document with every element name under the prefix "lv".
std::string prefixed(const std::string &ar_document) {
    std::string out;
    for (std::string::size_type i = 0; i < ar_document.size(); ++i) {
        out += ar_document[i];
        if (ar_document[i] == '<') {
            if (ar_document[i + 1] == '/')
                out += ar_document[++i];
            out += "lv:";
        }
    }
    return replaced(out, "xmlns=", "xmlns:lv=");
}

// The names of the elements written, in order: none may carry a prefix.
std::vector<std::string> element_names(const std::string &ar_xml) {
    std::vector<std::string> names;
    for (std::string::size_type at = ar_xml.find('<'); at != std::string::npos; at = ar_xml.find('<', at + 1)) {
        std::string::size_type start = at + 1;
        if (start < ar_xml.size() && (ar_xml[start] == '?' || ar_xml[start] == '!'))
            continue;
        if (start < ar_xml.size() && ar_xml[start] == '/')
            ++start;
        std::string::size_type end = ar_xml.find_first_of(" \t\r\n/>", start);
        names.push_back(ar_xml.substr(start, end - start));
    }
    return names;
}

TEST(BindingLumivera, ReadsAWholeLibrary) {
    c_Lumivera lumivera_object;
    ASSERT_EQ(read(lumivera_object, k_lumivera), k_ok);
    EXPECT_EQ(lumivera_object.get_version(), L"1.0");
    EXPECT_EQ(lumivera_object.get_Description(), L"fan deck");
    ASSERT_NE(static_cast<const c_Lumivera &>(lumivera_object).get_LVLibrary(), nullptr);
    const c_LVLibrary &library = lumivera_object.get_LVLibrary();
    EXPECT_EQ(library.getenum_LVType(), Eenum_LVType_Library);
    EXPECT_EQ(library.get_name(), L"Fan");
    EXPECT_TRUE(library.get_Status() == "11");
    EXPECT_TRUE(library.get_Revision() == "12");
    EXPECT_EQ(library.get_GUID(), L"g-1");
    EXPECT_EQ(library.get_PublicName(), L"Fan deck");
    ASSERT_EQ(library.size_LVColor(), 1u);
    const c_LVColor &color = library.get_LVColor(0);
    EXPECT_EQ(color.get_ref(), L"r1");
    EXPECT_EQ(color.get_Tint(), 100.0);
    EXPECT_TRUE(color.get_Status() == "21");
    EXPECT_EQ(color.get_Code(), L"C-1");
    EXPECT_EQ(color.get_stdref(), L"std");
    EXPECT_TRUE(color.get_LibraryUpdateBatch() == "7");
}

TEST(BindingLumivera, SimpleClassesKeepTextAndAttributes) {
    c_LVColor color;
    ASSERT_EQ(read(color, alone(k_color)), k_ok) << alone(k_color);
    ASSERT_NE(static_cast<const c_LVColor &>(color).get_MasterStandard(), nullptr);
    EXPECT_EQ(color.get_MasterStandard().get_value(), L"ms");
    EXPECT_EQ(color.get_MasterStandard().get_name(), L"master");
    EXPECT_TRUE(color.get_MasterStandard().isset_publicname());
    EXPECT_EQ(color.get_MasterStandard().get_publicname(), L"Master");
    EXPECT_EQ(color.get_DependentStandard().get_value(), L"ds");
    EXPECT_EQ(color.get_DependentStandard().get_name(), L"dependent");
    EXPECT_EQ(color.get_DependentStandard().get_publicname(), L"Dependent");
    EXPECT_EQ(color.get_Substrate().get_value(), L"paper");
    EXPECT_EQ(color.get_Substrate().get_name(), L"substrate");
    EXPECT_EQ(color.get_PrintingCondition().get_value(), L"pc");
    EXPECT_EQ(color.get_PrintingCondition().get_name(), L"condition");
    EXPECT_EQ(color.get_PrintingCondition().get_type(), L"offset");
    EXPECT_EQ(color.get_WorkingStandard().get_value(), L"ws");
    EXPECT_EQ(color.get_WorkingStandard().get_name(), L"working");
    EXPECT_EQ(color.get_Finish().get_value(), L"matte");
    EXPECT_EQ(color.get_Finish().get_name(), L"finish");
    ASSERT_TRUE(color.isset_WorkflowRestriction());
    EXPECT_EQ(color.get_WorkflowRestriction().get_value(), L"none");
    EXPECT_EQ(color.get_WorkflowRestriction().get_name(), L"restriction");

    // Each simple class read as a document of its own.
    c_MasterStandard master;
    ASSERT_EQ(read(master, "<MasterStandard " + k_lv + " name=\"m\">  spaced  </MasterStandard>"), k_ok);
    EXPECT_EQ(master.get_value(), L"  spaced  ");
    EXPECT_FALSE(master.isset_publicname());
    c_PrintingCondition condition;
    ASSERT_EQ(read(condition, "<PrintingCondition " + k_lv + " name=\"n\" type=\"t\"/>"), k_ok);
    EXPECT_EQ(condition.get_value(), L"");
    EXPECT_EQ(condition.get_type(), L"t");
}

// The attribute names are the format's own, case and all.
TEST(BindingLumivera, AttributeNamesKeepTheirCase) {
    const tessarine_test::s_read_row rows[] = {
        {"publicname on a master standard",
         "<MasterStandard " + k_lv + " name=\"m\" publicname=\"p\">x</MasterStandard>", k_ok, nullptr},
        {"PublicName on a master standard",
         "<MasterStandard " + k_lv + " name=\"m\" PublicName=\"p\">x</MasterStandard>", lmx::elmx_unexpected_attribute,
         "@PublicName"},
        {"Name on a master standard", "<MasterStandard " + k_lv + " Name=\"m\">x</MasterStandard>",
         lmx::elmx_unexpected_attribute, "@Name"},
    };
    tessarine_test::expect_reads<c_MasterStandard>(rows);
    const tessarine_test::s_read_row dependent_rows[] = {
        {"publicname on a dependent standard",
         "<DependentStandard " + k_lv + " name=\"d\" publicname=\"p\">x</DependentStandard>", k_ok, nullptr},
        {"PublicName on a dependent standard",
         "<DependentStandard " + k_lv + " name=\"d\" PublicName=\"p\">x</DependentStandard>",
         lmx::elmx_unexpected_attribute, "@PublicName"},
    };
    tessarine_test::expect_reads<c_DependentStandard>(dependent_rows);

    const std::string library = alone(k_library);
    const tessarine_test::s_read_row library_rows[] = {
        {"PublicName on the library", library, k_ok, nullptr},
        {"publicname on the library", replaced(library, " PublicName=", " publicname="),
         lmx::elmx_unexpected_attribute, "@publicname"},
        {"Name on the library", replaced(library, " name=\"Fan\"", " Name=\"Fan\""), lmx::elmx_unexpected_attribute,
         "@Name"},
    };
    tessarine_test::expect_reads<c_LVLibrary>(library_rows);
}

TEST(BindingLumivera, RootMustBeLumiveraInItsNamespace) {
    const tessarine_test::s_read_row rows[] = {
        {"the library", k_lumivera, k_ok, nullptr},
        {"with a prefix", prefixed(k_lumivera), k_ok, nullptr},
        {"another root", alone(k_library), k_not_found, nullptr},
        {"another name", "<LumiveraLibrary " + k_lv + k_lumivera_body, k_not_found, nullptr},
        {"the name in lower case", "<lumivera " + k_lv + k_lumivera_body, k_not_found, nullptr},
        {"the name in another namespace",
         "<Lumivera xmlns=\"http://colorexchangeformat.com/CxF3-other\"" + k_lumivera_body, k_not_found, nullptr},
        {"the name in the core namespace", "<Lumivera xmlns=\"" + std::string(cc::k_namespace_uri) + "\"" +
                                               k_lumivera_body,
         k_not_found, nullptr},
        {"the name in no namespace", "<Lumivera" + k_lumivera_body, k_not_found, nullptr},
    };
    tessarine_test::expect_reads<c_Lumivera>(rows);
    EXPECT_NE(prefixed(k_lumivera).find("<lv:LVColor ref="), std::string::npos);
    EXPECT_NE(prefixed(k_lumivera).find("</lv:Lumivera>"), std::string::npos);
}

TEST(BindingLumivera, ColorNeedsTintAndFinishButNotAWorkflowRestriction) {
    const std::string library = alone(k_library);
    const tessarine_test::s_read_row rows[] = {
        {"complete", library, k_ok, nullptr},
        {"without Tint", without(library, " Tint=\"100\""), k_missing_attribute, nullptr},
        {"without Finish", without(library, "<Finish name=\"finish\">matte</Finish>"), k_missing_element, nullptr},
        {"without WorkflowRestriction",
         without(library, "<WorkflowRestriction name=\"restriction\">none</WorkflowRestriction>"), k_ok, nullptr},
        {"without MasterStandard", without(library, "<MasterStandard name=\"master\" publicname=\"Master\">ms</MasterStandard>"),
         k_missing_element, nullptr},
        {"Finish after WorkflowRestriction",
         without(library, "<Finish name=\"finish\">matte</Finish>")
             .insert(without(library, "<Finish name=\"finish\">matte</Finish>").find("</LVColor>"),
                     "<Finish name=\"finish\">matte</Finish>"),
         k_missing_element, nullptr},
    };
    tessarine_test::expect_reads<c_LVLibrary>(rows);

    c_LVLibrary read_back;
    ASSERT_EQ(read(read_back, without(library, "<WorkflowRestriction name=\"restriction\">none</WorkflowRestriction>")),
              k_ok);
    EXPECT_FALSE(read_back.get_LVColor(0).isset_WorkflowRestriction());
}

// A library holds at least one colour: without one the colour is reported
// missing, whether the library is closed at once or has an end tag.
// A library whose content holds no colour misses its mandatory LVColor; an
// element with no content at all is refused before that, as empty.
TEST(BindingLumivera, LibraryNeedsAColor) {
    const std::string head = "<LVLibrary " + k_lv + " LVType=\"Palette\" name=\"n\" Status=\"1\" Revision=\"1\" GUID=\"g\"";
    c_LVLibrary library;
    EXPECT_EQ(read(library, head + "><Finish name=\"f\">x</Finish></LVLibrary>"), k_missing_element);
    EXPECT_EQ(read(library, head + "></LVLibrary>"), lmx::elmx_unexpected_empty_element);
    EXPECT_EQ(read(library, head + "/>"), lmx::elmx_unexpected_empty_element);

    c_LVLibrary built;
    built.setenum_LVType(Eenum_LVType_Palette);
    built.set_name(L"n");
    built.set_Status(lmx::c_big_int(1));
    built.set_Revision(lmx::c_big_int("2"));
    built.set_GUID(L"g");
    EXPECT_FALSE(built.is_occurs_ok());
    std::string out = "untouched";
    EXPECT_EQ(built.marshal(out), k_occurs);
    EXPECT_EQ(out, "untouched");
}

// Each row leaves out one required attribute of the whole document.
TEST(BindingLumivera, EveryRequiredAttributeIsNeeded) {
    struct s_row {
        const char *name;
        const char *attribute;
    };
    const s_row rows[] = {
        {"version of Lumivera", " version=\"1.0\""},
        {"LVType of LVLibrary", " LVType=\"Library\""},
        {"name of LVLibrary", " name=\"Fan\""},
        {"Status of LVLibrary", " Status=\"11\""},
        {"Revision of LVLibrary", " Revision=\"12\""},
        {"GUID of LVLibrary", " GUID=\"g-1\""},
        {"ref of LVColor", " ref=\"r1\""},
        {"Tint of LVColor", " Tint=\"100\""},
        {"Status of LVColor", " Status=\"21\""},
        {"Revision of LVColor", " Revision=\"22\""},
        {"Code of LVColor", " Code=\"C-1\""},
        {"name of MasterStandard", " name=\"master\""},
        {"name of DependentStandard", " name=\"dependent\""},
        {"name of Substrate", " name=\"substrate\""},
        {"name of PrintingCondition", " name=\"condition\""},
        {"type of PrintingCondition", " type=\"offset\""},
        {"name of WorkingStandard", " name=\"working\""},
        {"name of Finish", " name=\"finish\""},
        {"name of WorkflowRestriction", " name=\"restriction\""},
    };
    for (const s_row &row : rows) {
        SCOPED_TRACE(row.name);
        c_Lumivera lumivera_object;
        EXPECT_EQ(read(lumivera_object, without(k_lumivera, row.attribute)), k_missing_attribute);
    }
    // The optional ones may go.
    const char *const optional[] = {" Description=\"fan deck\"", " PublicName=\"Fan deck\"",
                                    " Comment=\"library comment\"", " stdref=\"std\"", " VTSignature=\"vt\"",
                                    " Comment=\"colour comment\"", " LibraryUpdateBatch=\"7\"",
                                    " publicname=\"Master\"", " publicname=\"Dependent\""};
    for (const char *attribute : optional) {
        SCOPED_TRACE(attribute);
        c_Lumivera lumivera_object;
        EXPECT_EQ(read(lumivera_object, without(k_lumivera, attribute)), k_ok);
    }
}

// A colour built through the accessors, every required member set but the
// one left out.
c_LVColor built_color(const std::string &ar_left_out) {
    c_LVColor color;
    if (ar_left_out != "ref")
        color.set_ref(L"r");
    if (ar_left_out != "Tint")
        color.set_Tint(50);
    if (ar_left_out != "Status")
        color.set_Status(lmx::c_big_int(1));
    if (ar_left_out != "Revision")
        color.set_Revision(lmx::c_big_int(2));
    if (ar_left_out != "Code")
        color.set_Code(L"c");
    c_MasterStandard master;
    if (ar_left_out != "MasterStandard name")
        master.set_name(L"m");
    master.set_value(L"ms");
    color.assign_MasterStandard(master);
    c_DependentStandard dependent;
    if (ar_left_out != "DependentStandard name")
        dependent.set_name(L"d");
    dependent.set_value(L"ds");
    color.assign_DependentStandard(dependent);
    c_Substrate substrate;
    if (ar_left_out != "Substrate name")
        substrate.set_name(L"s");
    substrate.set_value(L"paper");
    color.assign_Substrate(substrate);
    c_PrintingCondition condition;
    if (ar_left_out != "PrintingCondition name")
        condition.set_name(L"p");
    if (ar_left_out != "PrintingCondition type")
        condition.set_type(L"t");
    condition.set_value(L"pc");
    color.assign_PrintingCondition(condition);
    c_WorkingStandard working;
    if (ar_left_out != "WorkingStandard name")
        working.set_name(L"w");
    working.set_value(L"ws");
    color.assign_WorkingStandard(working);
    if (ar_left_out != "Finish") {
        c_Finish finish;
        if (ar_left_out != "Finish name")
            finish.set_name(L"f");
        finish.set_value(L"matte");
        color.assign_Finish(finish);
    }
    if (ar_left_out == "WorkflowRestriction name") {
        c_WorkflowRestriction restriction;
        restriction.set_value(L"none");
        color.assign_WorkflowRestriction(restriction);
    }
    return color;
}

TEST(BindingLumivera, EveryRequiredMemberIsNeededOnWriting) {
    std::string out;
    ASSERT_EQ(built_color("").marshal(out), k_ok);
    c_LVColor again;
    ASSERT_EQ(read(again, out), k_ok) << out;

    const char *const members[] = {"ref",
                                 "Tint",
                                 "Status",
                                 "Revision",
                                 "Code",
                                 "MasterStandard name",
                                 "DependentStandard name",
                                 "Substrate name",
                                 "PrintingCondition name",
                                 "PrintingCondition type",
                                 "WorkingStandard name",
                                 "Finish",
                                 "Finish name",
                                 "WorkflowRestriction name"};
    for (const char *member : members) {
        SCOPED_TRACE(member);
        EXPECT_EQ(built_color(member).marshal(out), k_occurs);
    }

    c_Lumivera lumivera_object;
    ASSERT_EQ(read(lumivera_object, k_lumivera), k_ok);
    c_Lumivera without_version;
    without_version.assign_LVLibrary(lumivera_object.get_LVLibrary());
    EXPECT_EQ(without_version.marshal(out), k_occurs);
    c_Lumivera without_library;
    without_library.set_version(L"1");
    EXPECT_EQ(without_library.marshal(out), k_occurs);
}

TEST(BindingLumivera, WrittenAloneInTheDefaultNamespace) {
    c_Lumivera lumivera_object;
    ASSERT_EQ(read(lumivera_object, k_lumivera), k_ok);
    std::string out;
    ASSERT_EQ(lumivera_object.marshal(out), k_ok);
    const std::string opening =
        k_prolog + "<Lumivera xmlns=\"http://colorexchangeformat.com/CxF3-Lumivera_V1\"";
    EXPECT_EQ(out.compare(0, opening.size(), opening), 0) << out;
    EXPECT_EQ(out.find("xmlns:lumivera"), std::string::npos) << out;
    const std::vector<std::string> names = element_names(out);
    ASSERT_FALSE(names.empty());
    EXPECT_EQ(names.front(), "Lumivera");
    for (const std::string &name : names)
        EXPECT_EQ(name.find(':'), std::string::npos) << name;
    // One declaration of the namespace, on the outermost element.
    EXPECT_EQ(out.find("xmlns=\"", out.find("xmlns=\"") + 1), std::string::npos) << out;
    expect_stable_round_trip<c_Lumivera>(k_lumivera);
}

TEST(BindingLumivera, ColorWrittenAloneDeclaresTheDefaultNamespace) {
    std::string out;
    ASSERT_EQ(built_color("").marshal(out), k_ok);
    const std::string opening = k_prolog + "<LVColor xmlns=\"" + lumivera::k_namespace_uri + "\"";
    EXPECT_EQ(out.compare(0, opening.size(), opening), 0) << out;
    for (const std::string &name : element_names(out))
        EXPECT_EQ(name.find(':'), std::string::npos) << name;
}

TEST(BindingLumivera, LibraryTypeIsOneOfItsTexts) {
    const std::string head = "<LVLibrary " + k_lv + " LVType=\"";
    const std::string tail = "\" name=\"n\" Status=\"1\" Revision=\"1\" GUID=\"g\">" + k_color + "</LVLibrary>";
    const tessarine_test::s_read_row rows[] = {
        {"Library", head + "Library" + tail, k_ok, nullptr},
        {"Palette", head + "Palette" + tail, k_ok, nullptr},
        {"Other", head + "Other" + tail, k_ok, nullptr},
        {"library", head + "library" + tail, lmx::elmx_value_not_enumerated, nullptr},
        {"empty", head + tail, lmx::elmx_value_not_enumerated, nullptr},
    };
    tessarine_test::expect_reads<c_LVLibrary>(rows);
}

} // namespace
