// Validation specs and the facet checks of their validators: codes, order,
// behaviour under a handler that swallows errors, and what reaches the
// reader's error record.
#include <cmath>
#include <limits>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>
#include <lmx/lmxtypes.h>

namespace {

using lmx::elmx_error;

struct owned_document {
    std::string m_document;
};

// A reader that records every error handed to it and, if asked, swallows them.
class recording_reader : private owned_document, public lmx::c_xml_reader_memory {
public:
    explicit recording_reader(const std::string &ar_document = std::string())
        : owned_document{ar_document}, lmx::c_xml_reader_memory(m_document) {}

    lmx::elmx_error user_handle_error(lmx::elmx_error a_error) override {
        seen.push_back(a_error);
        return is_swallowing ? lmx::elmx_ok : a_error;
    }
    using lmx::c_xml_reader_memory::user_handle_error;

    bool is_swallowing = false;
    std::vector<lmx::elmx_error> seen;
};

typedef std::vector<lmx::elmx_error> codes;

// ---------------------------------------------------------------------------
// Validators of the kind a binding generates, one per value shorthand
// ---------------------------------------------------------------------------

elmx_error lexical_not_empty(lmx::c_xml_reader &ar_reader, const std::string &ar_text) {
    return lmx::check_min_length(ar_reader, ar_text, 1);
}

elmx_error lexical_not_empty_max_1(lmx::c_xml_reader &ar_reader, const std::string &ar_text) {
    if (elmx_error error = lmx::check_min_length(ar_reader, ar_text, 1))
        return error;
    return lmx::check_max_length(ar_reader, ar_text, 1);
}

elmx_error lexical_360_to_400(lmx::c_xml_reader &ar_reader, const std::string &ar_text) {
    return lmx::check_integer(ar_reader, ar_text, "360", "400");
}

elmx_error value_not_negative(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    return lmx::check_min_inclusive(ar_reader, ar_value, 0.0);
}

elmx_error value_positive(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    return lmx::check_min_exclusive(ar_reader, ar_value, 0.0);
}

elmx_error value_0_to_1(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    if (elmx_error error = lmx::check_min_inclusive(ar_reader, ar_value, 0.0))
        return error;
    return lmx::check_max_inclusive(ar_reader, ar_value, 1.0);
}

elmx_error value_0_to_100(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    if (elmx_error error = lmx::check_min_inclusive(ar_reader, ar_value, 0.0))
        return error;
    return lmx::check_max_inclusive(ar_reader, ar_value, 100.0);
}

elmx_error value_0_to_360(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    if (elmx_error error = lmx::check_min_inclusive(ar_reader, ar_value, 0.0))
        return error;
    return lmx::check_max_inclusive(ar_reader, ar_value, 360.0);
}

// Enumeration texts are wide constants made once from UTF-8.
const std::wstring k_modes[] = {lmx::inittowstring("Reflectance"), lmx::inittowstring("Transmittance"),
                                lmx::inittowstring("Emissive")};

elmx_error value_mode(lmx::c_xml_reader &ar_reader, const std::wstring &ar_value) {
    return lmx::check_enumeration(ar_reader, ar_value, k_modes);
}

const lmx::ct_typed_validation_spec<short> k_short_spec(lmx::ws_collapse, "", lmx::lexical_validator_short,
                                                         lmx::value_validator_none<short>, lmx::v_to_o<short>,
                                                         lmx::o_to_v<short>);
const lmx::ct_typed_validation_spec<int> k_int_spec(lmx::ws_collapse, "", lmx::lexical_validator_int,
                                                     lmx::value_validator_none<int>, lmx::v_to_o<int>,
                                                     lmx::o_to_v<int>);
const lmx::ct_typed_validation_spec<int> k_int_preserve_spec(lmx::ws_preserve, "", lmx::lexical_validator_int,
                                                              lmx::value_validator_none<int>, lmx::v_to_o<int>,
                                                              lmx::o_to_v<int>);
const lmx::ct_typed_validation_spec<unsigned short> k_360_to_400_spec(lmx::ws_collapse, "", lexical_360_to_400,
                                                                       lmx::value_validator_none<unsigned short>,
                                                                       lmx::v_to_o<unsigned short>,
                                                                       lmx::o_to_v<unsigned short>);
const lmx::ct_typed_validation_spec<double> k_double_0_to_1_spec(lmx::ws_collapse, "", lmx::lexical_validator_float,
                                                                  value_0_to_1, lmx::v_to_o<double>,
                                                                  lmx::o_to_v<double>);
const lmx::ct_typed_validation_spec<std::wstring> k_mode_spec(lmx::ws_preserve, "", lmx::lexical_validator_none,
                                                               value_mode, lmx::v_to_o<std::wstring>,
                                                               lmx::o_to_v<std::wstring>);

// ---------------------------------------------------------------------------
// Validation specs
// ---------------------------------------------------------------------------

TEST(ValidationSpec, HoldsWhitespaceDefaultAndFunctions) {
    recording_reader reader;
    EXPECT_EQ(k_short_spec.get_whitespace_handling(), lmx::ws_collapse);
    EXPECT_EQ(k_int_preserve_spec.get_whitespace_handling(), lmx::ws_preserve);
    EXPECT_EQ(k_short_spec.get_default(), "");
    EXPECT_EQ(k_short_spec.is_lexical_valid(reader, "12"), lmx::elmx_ok);
    EXPECT_EQ(k_short_spec.is_lexical_valid(reader, "40000"), lmx::elmx_value_above_maximum);
    short value = 0;
    k_short_spec.v_to_o(value, "-12");
    EXPECT_EQ(value, -12);
    EXPECT_EQ(k_short_spec.is_value_valid(reader, value), lmx::elmx_ok);
    std::ostringstream os;
    k_short_spec.o_to_v(os, value);
    EXPECT_EQ(os.str(), "-12");
}

TEST(ValidationSpec, KeepsADefaultText) {
    lmx::ct_typed_validation_spec<int> with_default(lmx::ws_collapse, "7", lmx::lexical_validator_int,
                                                    lmx::value_validator_none<int>, lmx::v_to_o<int>,
                                                    lmx::o_to_v<int>);
    EXPECT_EQ(with_default.get_default(), "7");
    lmx::ct_typed_validation_spec<int> null_default(lmx::ws_collapse, nullptr, lmx::lexical_validator_int,
                                                    lmx::value_validator_none<int>, lmx::v_to_o<int>,
                                                    lmx::o_to_v<int>);
    EXPECT_EQ(null_default.get_default(), "");
    const lmx::c_untyped_validation_spec &untyped = with_default;
    recording_reader reader;
    EXPECT_EQ(untyped.is_lexical_valid(reader, "x"), lmx::elmx_invalid_value_format);
}

TEST(ValidationSpec, EnumerationValue) {
    recording_reader reader;
    std::wstring value;
    k_mode_spec.v_to_o(value, "Transmittance");
    EXPECT_EQ(k_mode_spec.is_value_valid(reader, value), lmx::elmx_ok);
    k_mode_spec.v_to_o(value, "transmittance");
    EXPECT_EQ(k_mode_spec.is_value_valid(reader, value), lmx::elmx_value_not_enumerated);
    EXPECT_EQ(k_mode_spec.is_value_valid(reader, L""), lmx::elmx_value_not_enumerated);
    EXPECT_EQ(reader.seen, (codes{lmx::elmx_value_not_enumerated, lmx::elmx_value_not_enumerated}));
}

// ---------------------------------------------------------------------------
// Integer bounds on the text
// ---------------------------------------------------------------------------

TEST(IntegerBounds, ShortOf40000IsAboveMaximumNotWrapped) {
    recording_reader reader;
    EXPECT_EQ(lmx::lexical_validator_short(reader, "40000"), lmx::elmx_value_above_maximum);
    EXPECT_EQ(reader.seen, codes{lmx::elmx_value_above_maximum});
}

TEST(IntegerBounds, NonNumberGivesFormatErrorAndNoRangeCheck) {
    recording_reader reader;
    EXPECT_EQ(lmx::lexical_validator_int(reader, "abc"), lmx::elmx_invalid_value_format);
    EXPECT_EQ(reader.seen, codes{lmx::elmx_invalid_value_format});
    // A number out of range after a bad form is not reached either.
    reader.seen.clear();
    EXPECT_EQ(lmx::lexical_validator_short(reader, "99999x"), lmx::elmx_invalid_value_format);
    EXPECT_EQ(reader.seen, codes{lmx::elmx_invalid_value_format});
}

TEST(IntegerBounds, RangeCheckStillRunsWhenTheFormatErrorIsSwallowed) {
    recording_reader reader;
    reader.is_swallowing = true;
    EXPECT_EQ(lmx::lexical_validator_short(reader, "99999x"), lmx::elmx_ok);
    EXPECT_EQ(reader.seen, (codes{lmx::elmx_invalid_value_format, lmx::elmx_value_above_maximum}));
    reader.seen.clear();
    EXPECT_EQ(lmx::lexical_validator_short(reader, "-99999x"), lmx::elmx_ok);
    EXPECT_EQ(reader.seen, (codes{lmx::elmx_invalid_value_format, lmx::elmx_value_below_minimum}));
    // No digits at all reads as zero, which is in range.
    reader.seen.clear();
    EXPECT_EQ(lmx::lexical_validator_short(reader, "abc"), lmx::elmx_ok);
    EXPECT_EQ(reader.seen, codes{lmx::elmx_invalid_value_format});
}

TEST(IntegerBounds, Table) {
    struct {
        lmx::t_lexical_validator validator;
        const char *text;
        elmx_error code;
    } const cases[] = {
        {lmx::lexical_validator_short, "32767", lmx::elmx_ok},
        {lmx::lexical_validator_short, "-32768", lmx::elmx_ok},
        {lmx::lexical_validator_short, "+00032767", lmx::elmx_ok},
        {lmx::lexical_validator_short, "-0", lmx::elmx_ok},
        {lmx::lexical_validator_short, "32768", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_short, "40000", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_short, "-32769", lmx::elmx_value_below_minimum},
        {lmx::lexical_validator_short, "12.0", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_short, "", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_int, "2147483647", lmx::elmx_ok},
        {lmx::lexical_validator_int, "-2147483648", lmx::elmx_ok},
        {lmx::lexical_validator_int, "2147483648", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_int, "-2147483649", lmx::elmx_value_below_minimum},
        {lmx::lexical_validator_int, "99999999999999999999999", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_int, "-99999999999999999999999", lmx::elmx_value_below_minimum},
        {lmx::lexical_validator_int, "4294967296", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_int, "1e3", lmx::elmx_invalid_value_format},
        {lexical_360_to_400, "360", lmx::elmx_ok},
        {lexical_360_to_400, "400", lmx::elmx_ok},
        {lexical_360_to_400, "0400", lmx::elmx_ok},
        {lexical_360_to_400, "380", lmx::elmx_ok},
        {lexical_360_to_400, "359", lmx::elmx_value_below_minimum},
        {lexical_360_to_400, "401", lmx::elmx_value_above_maximum},
        {lexical_360_to_400, "-400", lmx::elmx_value_below_minimum},
        {lexical_360_to_400, "0", lmx::elmx_value_below_minimum},
        {lmx::lexical_validator_unsigned_short, "65535", lmx::elmx_ok},
        {lmx::lexical_validator_unsigned_short, "65536", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_unsigned_short, "-1", lmx::elmx_value_below_minimum},
        {lmx::lexical_validator_unsigned_int, "4294967295", lmx::elmx_ok},
        {lmx::lexical_validator_unsigned_int, "4294967296", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_byte, "-128", lmx::elmx_ok},
        {lmx::lexical_validator_byte, "128", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_byte, "-129", lmx::elmx_value_below_minimum},
        {lmx::lexical_validator_unsigned_byte, "255", lmx::elmx_ok},
        {lmx::lexical_validator_unsigned_byte, "256", lmx::elmx_value_above_maximum},
        {lmx::lexical_validator_integer, "123456789012345678901234567890", lmx::elmx_ok},
        {lmx::lexical_validator_integer, "1.5", lmx::elmx_invalid_value_format},
    };
    for (const auto &c : cases) {
        recording_reader reader;
        EXPECT_EQ(c.validator(reader, c.text), c.code) << c.text;
    }
}

TEST(IntegerBounds, SingleBoundChecks) {
    recording_reader reader;
    EXPECT_EQ(lmx::check_integer_min_inclusive(reader, "10", "10"), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_integer_min_inclusive(reader, "9", "10"), lmx::elmx_value_below_minimum);
    EXPECT_EQ(lmx::check_integer_max_inclusive(reader, "10", "10"), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_integer_max_inclusive(reader, "11", "10"), lmx::elmx_value_above_maximum);
    EXPECT_EQ(lmx::check_integer(reader, "5", nullptr, "10"), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_integer(reader, "-5000000000", nullptr, "10"), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_integer(reader, "5000000000", "0", nullptr), lmx::elmx_ok);
}

// ---------------------------------------------------------------------------
// Whitespace is applied before the lexical check
// ---------------------------------------------------------------------------

// Reads the text of the root's first child in the whitespace mode of the
// validation spec and runs its lexical check on the text.
elmx_error check_child_text(const std::string &ar_document, const lmx::ct_typed_validation_spec<int> &ar_spec) {
    recording_reader reader(ar_document);
    elmx_error error = lmx::elmx_ok;
    std::string name;
    if (reader.get_element_event(&error, &name) != lmx::xe_name)
        return lmx::elmx_undefined_error;
    bool is_empty = false;
    if (!reader.skip_start_tag(&is_empty) || is_empty)
        return lmx::elmx_undefined_error;
    if (reader.get_element_event(&error, &name) != lmx::xe_name)
        return lmx::elmx_undefined_error;
    std::string value;
    if (!reader.get_simple_type_value(name, ar_spec.get_whitespace_handling(), &value, &error, &is_empty))
        return lmx::elmx_undefined_error;
    return ar_spec.is_lexical_valid(reader, value);
}

TEST(Whitespace, LeadingBlanksPassInACollapseTypeAndFailInAPreserveType) {
    const std::string document = "<r><a>  42 \n</a></r>";
    EXPECT_EQ(check_child_text(document, k_int_spec), lmx::elmx_ok);
    EXPECT_EQ(check_child_text(document, k_int_preserve_spec), lmx::elmx_invalid_value_format);
    EXPECT_EQ(check_child_text("<r><a>42</a></r>", k_int_preserve_spec), lmx::elmx_ok);
}

// ---------------------------------------------------------------------------
// Lengths
// ---------------------------------------------------------------------------

TEST(LengthFacets, NotEmptyString) {
    recording_reader reader;
    EXPECT_EQ(lexical_not_empty(reader, ""), lmx::elmx_length_too_short);
    EXPECT_EQ(lexical_not_empty(reader, "a"), lmx::elmx_ok);
    EXPECT_EQ(lexical_not_empty(reader, " "), lmx::elmx_ok);
}

TEST(LengthFacets, NotEmptyAndAtMostOneCharacter) {
    recording_reader reader;
    EXPECT_EQ(lexical_not_empty_max_1(reader, ""), lmx::elmx_length_too_short);
    EXPECT_EQ(lexical_not_empty_max_1(reader, "ab"), lmx::elmx_length_too_long);
    EXPECT_EQ(lexical_not_empty_max_1(reader, "a"), lmx::elmx_ok);
    EXPECT_EQ(lexical_not_empty_max_1(reader, "\xc3\xa9"), lmx::elmx_ok);
    EXPECT_EQ(lexical_not_empty_max_1(reader, "\xf0\x9f\x98\x80"), lmx::elmx_ok);
    EXPECT_EQ(lexical_not_empty_max_1(reader, "\xc3\xa9\xc3\xa9"), lmx::elmx_length_too_long);
}

TEST(LengthFacets, LongerMinimumCountsCharacters) {
    recording_reader reader;
    EXPECT_EQ(lmx::check_min_length(reader, "ab", 3), lmx::elmx_length_too_short);
    EXPECT_EQ(lmx::check_min_length(reader, "abc", 3), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_min_length(reader, "\xc3\xa9\xc3\xa9", 3), lmx::elmx_length_too_short);
    EXPECT_EQ(lmx::check_min_length(reader, "", 0), lmx::elmx_ok);
}

TEST(LengthFacets, SwallowedShortLengthGoesOnToTheMaximum) {
    recording_reader reader;
    reader.is_swallowing = true;
    EXPECT_EQ(lexical_not_empty_max_1(reader, ""), lmx::elmx_ok);
    EXPECT_EQ(reader.seen, codes{lmx::elmx_length_too_short});
}

TEST(DigitFacets, TotalAndFractionDigits) {
    recording_reader reader;
    EXPECT_EQ(lmx::check_total_digits(reader, "123.45", 5), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_total_digits(reader, "123.456", 5), lmx::elmx_total_digits_exceeded);
    EXPECT_EQ(lmx::check_fraction_digits(reader, "1.25", 2), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_fraction_digits(reader, "1.255", 2), lmx::elmx_fraction_digits_exceeded);
}

// ---------------------------------------------------------------------------
// Type forms
// ---------------------------------------------------------------------------

TEST(TypeForms, Table) {
    struct {
        lmx::t_lexical_validator validator;
        const char *text;
        elmx_error code;
    } const cases[] = {
        {lmx::lexical_validator_float, "1.5", lmx::elmx_ok},
        {lmx::lexical_validator_float, "-INF", lmx::elmx_ok},
        {lmx::lexical_validator_float, "-0.5", lmx::elmx_ok},
        {lmx::lexical_validator_float, "abc", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_float, "1,5", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_float, ".", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_float, "", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_bool, "true", lmx::elmx_ok},
        {lmx::lexical_validator_bool, "0", lmx::elmx_ok},
        {lmx::lexical_validator_bool, "yes", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_datetime, "2024-05-31T12:00:00Z", lmx::elmx_ok},
        {lmx::lexical_validator_datetime, "2024-05-31", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_base64, "QUJD", lmx::elmx_ok},
        {lmx::lexical_validator_base64, "", lmx::elmx_ok},
        {lmx::lexical_validator_base64, "QQ=", lmx::elmx_invalid_value_format},
        {lmx::lexical_validator_none, "anything at all", lmx::elmx_ok},
    };
    for (const auto &c : cases) {
        recording_reader reader;
        EXPECT_EQ(c.validator(reader, c.text), c.code) << c.text;
    }
    recording_reader reader;
    EXPECT_EQ(lmx::check_facet(reader, true, lmx::elmx_no_pattern_matched), lmx::elmx_ok);
    EXPECT_EQ(lmx::check_facet(reader, false, lmx::elmx_no_pattern_matched), lmx::elmx_no_pattern_matched);
    EXPECT_EQ(lmx::check_facet(reader, false, lmx::elmx_fixed_value_mismatch), lmx::elmx_fixed_value_mismatch);
}

// ---------------------------------------------------------------------------
// Bounds on double values
// ---------------------------------------------------------------------------

TEST(DoubleBounds, Table) {
    const double nan = std::numeric_limits<double>::quiet_NaN();
    const double inf = std::numeric_limits<double>::infinity();
    struct {
        elmx_error (*validator)(lmx::c_xml_reader &, const double &);
        double value;
        elmx_error code;
    } const cases[] = {
        {value_not_negative, 0.0, lmx::elmx_ok},
        {value_not_negative, -0.0, lmx::elmx_ok},
        {value_not_negative, 5.0, lmx::elmx_ok},
        {value_not_negative, -0.5, lmx::elmx_value_below_minimum},
        {value_not_negative, -inf, lmx::elmx_value_below_minimum},
        {value_not_negative, nan, lmx::elmx_value_below_minimum},
        {value_positive, 0.0, lmx::elmx_value_below_minimum},
        {value_positive, -1.0, lmx::elmx_value_below_minimum},
        {value_positive, 1e-300, lmx::elmx_ok},
        {value_0_to_1, 0.0, lmx::elmx_ok},
        {value_0_to_1, 1.0, lmx::elmx_ok},
        {value_0_to_1, 0.5, lmx::elmx_ok},
        {value_0_to_1, -1.0, lmx::elmx_value_below_minimum},
        {value_0_to_1, 1.0000001, lmx::elmx_value_above_maximum},
        {value_0_to_1, inf, lmx::elmx_value_above_maximum},
        {value_0_to_100, 100.0, lmx::elmx_ok},
        {value_0_to_100, 100.5, lmx::elmx_value_above_maximum},
        {value_0_to_100, -0.1, lmx::elmx_value_below_minimum},
        {value_0_to_360, 360.0, lmx::elmx_ok},
        {value_0_to_360, 361.0, lmx::elmx_value_above_maximum},
        {value_0_to_360, -360.0, lmx::elmx_value_below_minimum},
    };
    for (const auto &c : cases) {
        recording_reader reader;
        EXPECT_EQ(c.validator(reader, c.value), c.code) << c.value;
    }
    recording_reader reader;
    EXPECT_EQ(lmx::check_max_exclusive(reader, 1.0, 1.0), lmx::elmx_value_above_maximum);
    EXPECT_EQ(lmx::check_max_exclusive(reader, 0.999, 1.0), lmx::elmx_ok);
}

TEST(DoubleBounds, MinimumIsCheckedFirst) {
    recording_reader reader;
    reader.is_swallowing = true;
    EXPECT_EQ(value_0_to_1(reader, std::numeric_limits<double>::quiet_NaN()), lmx::elmx_ok);
    EXPECT_EQ(reader.seen, (codes{lmx::elmx_value_below_minimum, lmx::elmx_value_above_maximum}));
}

TEST(DoubleBounds, TextToValueThenCheck) {
    recording_reader reader;
    double value = 0.0;
    EXPECT_EQ(k_double_0_to_1_spec.is_lexical_valid(reader, "-0.5"), lmx::elmx_ok);
    k_double_0_to_1_spec.v_to_o(value, "-0.5");
    EXPECT_EQ(k_double_0_to_1_spec.is_value_valid(reader, value), lmx::elmx_value_below_minimum);
    EXPECT_EQ(k_double_0_to_1_spec.is_lexical_valid(reader, "abc"), lmx::elmx_invalid_value_format);
}

// ---------------------------------------------------------------------------
// Empty content
// ---------------------------------------------------------------------------

TEST(EmptyContent, TextMustBeEmpty) {
    recording_reader reader;
    EXPECT_EQ(lmx::lexical_validator_empty(reader, ""), lmx::elmx_ok);
    EXPECT_EQ(lmx::lexical_validator_empty(reader, "x"), lmx::elmx_invalid_value_format);
    EXPECT_EQ(lmx::lexical_validator_empty(reader, " "), lmx::elmx_invalid_value_format);
    EXPECT_EQ(lmx::value_validator_empty(reader, lmx::c_empty()), lmx::elmx_ok);

    lmx::ct_typed_validation_spec<lmx::c_empty> spec(lmx::ws_collapse, "", lmx::lexical_validator_empty,
                                                     lmx::value_validator_empty, lmx::v_to_o_not_used,
                                                     lmx::o_to_v_not_used);
    lmx::c_empty value;
    spec.v_to_o(value, "ignored");
    std::ostringstream os;
    spec.o_to_v(os, value);
    EXPECT_EQ(os.str(), "");
    EXPECT_EQ(spec.is_value_valid(reader, value), lmx::elmx_ok);
}

// ---------------------------------------------------------------------------
// What reaches the error record
// ---------------------------------------------------------------------------

TEST(ValidatorErrors, ValidatorFailureNamesTheCurrentElement) {
    recording_reader reader("<cc:L xmlns:cc=\"urn:c\">abc</cc:L>");
    elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.set_code_file("cxf3.cpp");
    reader.set_code_line(42);
    EXPECT_EQ(lmx::lexical_validator_float(reader, "abc"), lmx::elmx_invalid_value_format);
    const lmx::s_debug_error &debug = reader.get_debug_error();
    EXPECT_EQ(debug.error, lmx::elmx_invalid_value_format);
    EXPECT_EQ(debug.item_name, "cc:L");
    EXPECT_STREQ(debug.p_prog_file, "cxf3.cpp");
    EXPECT_EQ(debug.prog_line, 42);
    std::string message = reader.get_error_message();
    EXPECT_NE(message.find("Error: Invalid value format for this type\n"), std::string::npos) << message;
    EXPECT_NE(message.find("Item: cc:L\n"), std::string::npos) << message;
}

TEST(ValidatorErrors, ValidatorsUseTheShortFormWithoutAnAtSign) {
    recording_reader reader("<Mode>x</Mode>");
    elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    EXPECT_EQ(k_mode_spec.is_value_valid(reader, L"x"), lmx::elmx_value_not_enumerated);
    EXPECT_EQ(reader.get_debug_error().item_name, "Mode");
}

// ---------------------------------------------------------------------------
// Patterns
// ---------------------------------------------------------------------------

TEST(Patterns, HoldTheirTextOnly) {
    lmx::c_pattern pattern;
    EXPECT_TRUE(pattern.empty());
    pattern.add("[0-9]+");
    pattern.add("[a-z]+");
    EXPECT_EQ(pattern.size(), 2u);
    EXPECT_EQ(pattern[1].get_pattern(), "[a-z]+");
    lmx::c_pattern_null none;
    EXPECT_TRUE(none.empty());
    EXPECT_EQ(lmx::c_regex("x").get_pattern(), "x");
}

} // namespace
