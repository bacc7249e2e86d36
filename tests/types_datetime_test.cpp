// Durations, dates and times: lexical checks, reading, writing, comparison.
#include <sstream>
#include <string>

#include <gtest/gtest.h>

#include <lmx/lmxtypes.h>

namespace {

template <typename T> std::string to_xml(const T &ar_value) {
    std::ostringstream os;
    lmx::o_to_v<T>(os, ar_value);
    return os.str();
}

struct s_check_case {
    const char *text;
    bool is_valid;
};

// ---------------------------------------------------------------------------
// c_duration
// ---------------------------------------------------------------------------

TEST(Duration, LexicalForm) {
    const s_check_case cases[] = {
        {"P", true},
        {"-P", true},
        {"+P1Y", true},
        {"P1Y", true},
        {"P1M", true},
        {"P1D", true},
        {"P1Y2M3D", true},
        {"P1Y3D", true},
        {"PT1H", true},
        {"PT1M", true},
        {"PT1S", true},
        {"PT1.5S", true},
        {"PT.5S", true},
        {"PT1.S", true},
        {"P1Y2M3DT4H5M6.7S", true},
        {"-P1DT1S", true},
        {"PT", true},
        {"P1YT", true},
        {"P0Y", true},
        {"PT0S", true},
        {"P0012D", true},
        {"", false},
        {"1Y", false},
        {"P1", false},
        {"P1X", false},
        {"PY", false},
        {"P1D1Y", false},
        {"P1Y1Y", false},
        {"P1M1Y", false},
        {"PT1D", false},
        {"P1H", false},
        {"P1S", false},
        {"P1.5Y", false},
        {"PT1.5M", false},
        {"PT1.5H", false},
        {"P-1Y", false},
        {"P1Y ", false},
        {" P1Y", false},
        {"PT1H1H", false},
        {"PT1S1M", false},
        {"PT.S", false},
        {"p1Y", false},
        {"P1y", false},
        {"--P1Y", false},
        {"PTT1H", false},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::c_duration::is_valid(c.text), c.is_valid) << c.text;
}

TEST(Duration, ReadsEveryField) {
    lmx::c_duration d("-P1Y2M3DT4H5M6.5S");
    EXPECT_TRUE(d.is_negative());
    EXPECT_EQ(d.get_years(), 1u);
    EXPECT_EQ(d.get_months(), 2u);
    EXPECT_EQ(d.get_days(), 3u);
    EXPECT_EQ(d.get_hours(), 4u);
    EXPECT_EQ(d.get_minutes(), 5u);
    EXPECT_EQ(d.get_seconds(), 6.5f);
}

TEST(Duration, MinutesAndMonthsAreToldApartByTheT) {
    lmx::c_duration months("P5M");
    EXPECT_EQ(months.get_months(), 5u);
    EXPECT_EQ(months.get_minutes(), 0u);
    lmx::c_duration minutes("PT5M");
    EXPECT_EQ(minutes.get_months(), 0u);
    EXPECT_EQ(minutes.get_minutes(), 5u);
}

TEST(Duration, TextForm) {
    struct {
        const char *text;
        const char *written;
    } const cases[] = {
        {"P1Y2M3DT4H5M6.5S", "P1Y2M3DT4H5M6.5S"},
        {"P", "P"},
        {"-P", "-P"},
        {"-P1D", "-P1D"},
        {"+P1D", "P1D"},
        {"P0Y", "P"},
        {"PT0S", "P"},
        {"P0Y0M0DT0H0M0S", "P"},
        {"P1Y0M", "P1Y"},
        {"PT36H", "PT36H"},
        {"P40D", "P40D"},
        {"P13M", "P13M"},
        {"PT1.25S", "PT1.25S"},
        {"PT.5S", "PT0.5S"},
        {"PT30S", "PT30S"},
        {"PT0.0005S", "PT0.000500S"},
        {"PT0.001S", "PT0.001S"},
        {"PT12.345678S", "PT12.3457S"},
        {"P0012D", "P12D"},
        {"P1DT1M", "P1DT1M"},
        {"PT1H0M0S", "PT1H"},
    };
    for (const auto &c : cases) {
        lmx::c_duration d(c.text);
        EXPECT_EQ(d.get_as_string(), c.written) << c.text;
        EXPECT_EQ(to_xml(d), c.written) << c.text;
    }
}

TEST(Duration, ZeroPrintsP) {
    EXPECT_EQ(lmx::c_duration().get_as_string(), "P");
}

TEST(Duration, AssignmentStopsAtTheFirstMismatchKeepingWhatItRead) {
    lmx::c_duration d("P9Y9M9D");
    d = "P1Y2X3D";
    EXPECT_EQ(d.get_years(), 1u);
    EXPECT_EQ(d.get_months(), 0u);
    EXPECT_EQ(d.get_days(), 0u);

    d = "P1Y2M3DT4H5X";
    EXPECT_EQ(d.get_as_string(), "P1Y2M3DT4H");

    d = "garbage";
    EXPECT_EQ(d.get_as_string(), "P");

    d = std::string("-P5D");
    EXPECT_EQ(d.get_as_string(), "-P5D");
    d = "P1Y";
    EXPECT_EQ(d.get_as_string(), "P1Y");
}

TEST(Duration, ReadsAndWritesThroughTheConversions) {
    lmx::c_duration d;
    lmx::v_to_o(d, std::string("PT90M"));
    EXPECT_EQ(d.get_minutes(), 90u);
    EXPECT_EQ(to_xml(d), "PT90M");
}

TEST(Duration, NormalizeCarriesUpToDaysAndMonthsIntoYears) {
    struct {
        const char *text;
        const char *normal;
    } const cases[] = {
        {"PT90S", "PT1M30S"},      {"PT61M", "PT1H1M"},     {"PT25H", "P1DT1H"},   {"P13M", "P1Y1M"},
        {"P40D", "P40D"},          {"PT86400S", "P1D"},     {"P24M", "P2Y"},       {"PT59.5S", "PT59.5S"},
        {"P1Y13M45DT47H119M150.5S", "P2Y1M47DT1H1M30.5S"},
    };
    for (const auto &c : cases) {
        lmx::c_duration d(c.text);
        d.normalize();
        EXPECT_EQ(d.get_as_string(), lmx::c_duration(c.normal).get_as_string()) << c.text;
    }
}

enum e_order { lt, eq, gt, ind };

const char *order_name(e_order a_order) {
    switch (a_order) {
    case lt:
        return "<";
    case eq:
        return "==";
    case gt:
        return ">";
    case ind:
        return "indeterminate";
    }
    return "?";
}

e_order reverse(e_order a_order) { return a_order == lt ? gt : (a_order == gt ? lt : a_order); }

void expect_order(const lmx::c_duration &ar_a, const lmx::c_duration &ar_b, e_order a_order,
                  const std::string &ar_label) {
    SCOPED_TRACE(ar_label + " expected " + order_name(a_order));
    EXPECT_EQ(ar_a.is_indeterminate(ar_b), a_order == ind);
    EXPECT_EQ(ar_a == ar_b, a_order == eq);
    EXPECT_EQ(ar_a != ar_b, a_order != eq);
    EXPECT_EQ(ar_a < ar_b, a_order == lt);
    EXPECT_EQ(ar_a <= ar_b, a_order == lt || a_order == eq);
    EXPECT_EQ(ar_a > ar_b, a_order == gt);
    // Not less: also true when the order cannot be told.
    EXPECT_EQ(ar_a >= ar_b, a_order != lt);
}

TEST(Duration, MonthAgainstThirtyDaysIsIndeterminate) {
    lmx::c_duration month("P1M"), days("P30D");
    EXPECT_TRUE(month.is_indeterminate(days));
    EXPECT_FALSE(month == days);
    EXPECT_FALSE(month < days);
    EXPECT_FALSE(month <= days);
    EXPECT_FALSE(month > days);
    EXPECT_TRUE(month != days);
}

TEST(Duration, ComparisonTable) {
    struct {
        const char *a;
        const char *b;
        e_order order;
    } const cases[] = {
        // A month is 28 to 31 days.
        {"P1M", "P30D", ind},
        {"P1M", "P29D", ind},
        {"P1M", "P28D", gt},
        {"P1M", "P27D", gt},
        {"P1M", "P31D", lt},
        {"P1M", "P32D", lt},
        {"P2M", "P60D", ind},
        {"P2M", "P59D", gt},
        {"P2M", "P62D", lt},
        {"P3M", "P90D", ind},
        {"P5M", "P150D", gt},
        {"P5M", "P151D", ind},
        {"P11M", "P334D", gt},
        {"P11M", "P335D", ind},
        {"P11M", "P337D", lt},
        {"P1M", "P1M1D", lt},
        {"P1M1D", "P1M", gt},
        {"P1M", "PT720H", ind},
        {"P1M", "PT672H", gt},
        // Months modulo twelve: years take the rest.
        {"P1Y", "P12M", eq},
        {"P1Y1M", "P13M", eq},
        {"P1Y", "P11M", gt},
        {"P1Y", "P13M", lt},
        {"P1Y1M", "P1Y30D", ind},
        {"P2Y1M", "P1Y395D", ind},
        {"P2Y1M", "P1Y392D", gt},
        {"P2Y1M", "P1Y398D", lt},
        // Equal months: years, then days, then time.
        {"P1Y", "P364D", gt},
        {"P1Y", "P365D", gt},
        {"P1Y", "P366D", lt},
        {"P1Y", "P367D", lt},
        {"P2Y", "P1Y400D", lt},
        {"P1Y", "P1Y", eq},
        {"P1D", "P2D", lt},
        {"P1DT1H", "P1D", gt},
        {"P1MT1H", "P1M", gt},
        {"P1D", "PT23H", gt},
        {"P1D", "PT25H", lt},
        {"PT1H", "PT59M", gt},
        {"PT1S", "PT1.5S", lt},
        // Carries.
        {"PT24H", "P1D", eq},
        {"PT60M", "PT1H", eq},
        {"PT3600S", "PT1H", eq},
        {"PT90S", "PT1M30S", eq},
        // Zero and signs.
        {"P", "P", eq},
        {"P", "-P", eq},
        {"P", "PT0S", eq},
        {"P", "P1D", lt},
        {"-P1D", "P", lt},
        {"-P1D", "P1D", lt},
        {"P1D", "-P1D", gt},
        {"-P2D", "-P1D", lt},
        {"-P1D", "-P2D", gt},
        {"-P1M", "-P30D", ind},
        {"-P1M", "-P27D", lt},
        {"-P1M", "P30D", lt},
        {"P1M", "-P30D", gt},
        {"-P1Y", "-P12M", eq},
        {"-PT1H", "-PT59M", lt},
    };
    for (const auto &c : cases) {
        lmx::c_duration a(c.a), b(c.b);
        expect_order(a, b, c.order, std::string(c.a) + " vs " + c.b);
        expect_order(b, a, reverse(c.order), std::string(c.b) + " vs " + c.a);
    }
}

TEST(Duration, ComparisonDoesNotChangeTheOperands) {
    lmx::c_duration a("PT90S"), b("PT1M30S");
    EXPECT_TRUE(a == b);
    EXPECT_EQ(a.get_as_string(), "PT90S");
}

// ---------------------------------------------------------------------------
// Dates and times: forms
// ---------------------------------------------------------------------------

TEST(DateTimeForm, DateTime) {
    const s_check_case cases[] = {
        {"2024-05-31T12:34:56", true},
        {"2024-05-31T12:34:56Z", true},
        {"2024-05-31T12:34:56.789", true},
        {"2024-05-31T12:34:56.789+02:00", true},
        {"2024-05-31T12:34:56-05:30", true},
        {"-0044-03-15T12:00:00", true},
        {"+2024-01-01T00:00:00", true},
        {"12024-01-01T00:00:00", true},
        {"2024-13-45T25:61:61", true},
        {"0000-00-00T00:00:00", true},
        {"", false},
        {"2024-05-31", false},
        {"24-05-31T12:34:56", false},
        {"2024-5-31T12:34:56", false},
        {"2024-005-31T12:34:56", false},
        {"2024-05-31 12:34:56", false},
        {"2024-05-31t12:34:56", false},
        {"2024-05-31T12:34", false},
        {"2024-05-31T1:34:56", false},
        {"2024-05-31T12:34:567", false},
        {"2024-05-31T12:34:56.", false},
        {"2024-05-31T12:34:56Z ", false},
        {" 2024-05-31T12:34:56", false},
        {"2024-05-31T12:34:56+0200", false},
        {"2024-05-31T12:34:56+02", false},
        {"2024-05-31T12:34:56+2:00", false},
        {"2024-05-31T12:34:56z", false},
        {"2024-05-31T12:34:56ZZ", false},
        {"2024-05-31T12:34:56+02:00Z", false},
        {"2024-05-31T12:34:5", false},
    };
    for (const s_check_case &c : cases)
        EXPECT_EQ(lmx::c_datetime::is_valid(c.text), c.is_valid) << c.text;
}

TEST(DateTimeForm, OtherClasses) {
    struct {
        bool (*is_valid)(const std::string &);
        const char *text;
        bool valid;
    } const cases[] = {
        {lmx::c_date::is_valid, "2024-05-31", true},
        {lmx::c_date::is_valid, "2024-05-31Z", true},
        {lmx::c_date::is_valid, "2024-05-31+01:00", true},
        {lmx::c_date::is_valid, "2024-05-31-01:00", true},
        {lmx::c_date::is_valid, "-2024-05-31", true},
        {lmx::c_date::is_valid, "2024-05", false},
        {lmx::c_date::is_valid, "2024-05-31T00:00:00", false},
        {lmx::c_date::is_valid, "2024/05/31", false},
        {lmx::c_time::is_valid, "12:34:56", true},
        {lmx::c_time::is_valid, "12:34:56.5Z", true},
        {lmx::c_time::is_valid, "12:34:56-08:00", true},
        {lmx::c_time::is_valid, "-12:34:56", true},
        {lmx::c_time::is_valid, "+12:34:56", true},
        {lmx::c_time::is_valid, "12:34", false},
        {lmx::c_time::is_valid, "1:34:56", false},
        {lmx::c_time::is_valid, "12:34:56.", false},
        {lmx::c_time::is_valid, "--12:34:56", false},
        {lmx::c_gyearmonth::is_valid, "2024-05", true},
        {lmx::c_gyearmonth::is_valid, "2024-05Z", true},
        {lmx::c_gyearmonth::is_valid, "2024-05-03:00", true},
        {lmx::c_gyearmonth::is_valid, "2024", false},
        {lmx::c_gyearmonth::is_valid, "2024-5", false},
        {lmx::c_gyearmonth::is_valid, "2024-05-31", false},
        {lmx::c_gyear::is_valid, "2024", true},
        {lmx::c_gyear::is_valid, "-2024", true},
        {lmx::c_gyear::is_valid, "2024Z", true},
        {lmx::c_gyear::is_valid, "2024+05:00", true},
        {lmx::c_gyear::is_valid, "12345", true},
        {lmx::c_gyear::is_valid, "202", false},
        {lmx::c_gyear::is_valid, "2024-05", false},
        {lmx::c_gyear::is_valid, "", false},
        {lmx::c_gmonthday::is_valid, "--05-31", true},
        {lmx::c_gmonthday::is_valid, "--05-31Z", true},
        {lmx::c_gmonthday::is_valid, "--13-45", true},
        {lmx::c_gmonthday::is_valid, "-05-31", false},
        {lmx::c_gmonthday::is_valid, "--5-31", false},
        {lmx::c_gmonthday::is_valid, "--05", false},
        {lmx::c_gday::is_valid, "---31", true},
        {lmx::c_gday::is_valid, "---31+01:00", true},
        {lmx::c_gday::is_valid, "--31", false},
        {lmx::c_gday::is_valid, "---1", false},
        {lmx::c_gday::is_valid, "---311", false},
        {lmx::c_gmonth::is_valid, "--05--", true},
        {lmx::c_gmonth::is_valid, "--05--Z", true},
        {lmx::c_gmonth::is_valid, "--05", false},
        {lmx::c_gmonth::is_valid, "--5--", false},
        {lmx::c_gmonth::is_valid, "--05-", false},
    };
    for (const auto &c : cases)
        EXPECT_EQ(c.is_valid(c.text), c.valid) << c.text;
}

// ---------------------------------------------------------------------------
// Dates and times: reading and writing
// ---------------------------------------------------------------------------

template <typename T> std::string round_trip(const char *ap_text) {
    T value(ap_text);
    std::string written = value.get_as_string();
    EXPECT_EQ(to_xml(value), written) << ap_text;
    T from_conversion;
    lmx::v_to_o(from_conversion, std::string(ap_text));
    EXPECT_EQ(from_conversion.get_as_string(), written) << ap_text;
    return written;
}

TEST(DateTimeText, DateTimeTable) {
    struct {
        const char *text;
        const char *written;
    } const cases[] = {
        {"2024-05-31T12:34:56Z", "2024-05-31T12:34:56Z"},
        {"2024-05-31T12:34:05.5", "2024-05-31T12:34:05.5"},
        {"2024-05-31T12:34:00", "2024-05-31T12:34:00"},
        {"2024-05-31T12:34:56.000", "2024-05-31T12:34:56"},
        {"2024-05-31T12:34:56.25-05:30", "2024-05-31T12:34:56.25-05:30"},
        {"2024-05-31T12:34:56+00:00", "2024-05-31T12:34:56"},
        {"2024-05-31T12:34:56+14:00", "2024-05-31T12:34:56+14:00"},
        {"0001-01-01T00:00:00", "0001-01-01T00:00:00"},
        {"0044-03-15T12:00:00", "0044-03-15T12:00:00"},
        {"-0044-03-15T12:00:00", "-0044-03-15T12:00:00"},
        {"+2024-01-01T00:00:00", "2024-01-01T00:00:00"},
        {"12024-01-01T00:00:00", "12024-01-01T00:00:00"},
        {"002024-01-01T00:00:00", "2024-01-01T00:00:00"},
        {"2024-13-45T25:61:61", "2024-13-45T25:61:61"},
        {"2024-05-31T12:34:09.999", "2024-05-31T12:34:09.999"},
        {"2024-05-31T12:34:00.0001", "2024-05-31T12:34:00.000100"},
    };
    for (const auto &c : cases)
        EXPECT_EQ(round_trip<lmx::c_datetime>(c.text), c.written) << c.text;
}

TEST(DateTimeText, OtherClassesTable) {
    EXPECT_EQ(round_trip<lmx::c_date>("2024-05-31"), "2024-05-31");
    EXPECT_EQ(round_trip<lmx::c_date>("2024-05-31Z"), "2024-05-31Z");
    EXPECT_EQ(round_trip<lmx::c_date>("0900-01-02-10:00"), "0900-01-02-10:00");
    EXPECT_EQ(round_trip<lmx::c_time>("12:34:56"), "12:34:56");
    EXPECT_EQ(round_trip<lmx::c_time>("00:00:01.5Z"), "00:00:01.5Z");
    EXPECT_EQ(round_trip<lmx::c_time>("23:59:59+01:00"), "23:59:59+01:00");
    EXPECT_EQ(round_trip<lmx::c_gyearmonth>("2024-05"), "2024-05");
    EXPECT_EQ(round_trip<lmx::c_gyearmonth>("0099-12Z"), "0099-12Z");
    EXPECT_EQ(round_trip<lmx::c_gyear>("2024"), "2024");
    EXPECT_EQ(round_trip<lmx::c_gyear>("-0001"), "-0001");
    EXPECT_EQ(round_trip<lmx::c_gyear>("2024+05:00"), "2024+05:00");
    EXPECT_EQ(round_trip<lmx::c_gmonthday>("--05-31"), "--05-31");
    EXPECT_EQ(round_trip<lmx::c_gmonthday>("--12-25Z"), "--12-25Z");
    EXPECT_EQ(round_trip<lmx::c_gday>("---31"), "---31");
    EXPECT_EQ(round_trip<lmx::c_gday>("---01-01:30"), "---01-01:30");
    EXPECT_EQ(round_trip<lmx::c_gmonth>("--05--"), "--05--");
    EXPECT_EQ(round_trip<lmx::c_gmonth>("--11--Z"), "--11--Z");
}

TEST(DateTimeText, ReadsEachField) {
    lmx::c_datetime d("2024-05-31T12:34:56.5-05:30");
    EXPECT_EQ(d.get_year(), 2024);
    EXPECT_EQ(d.get_month(), 5u);
    EXPECT_EQ(d.get_day(), 31u);
    EXPECT_EQ(d.get_hours(), 12u);
    EXPECT_EQ(d.get_minutes(), 34u);
    EXPECT_EQ(d.get_seconds(), 56.5f);
    EXPECT_EQ(d.get_tz_offset(), -330);
    EXPECT_FALSE(d.is_utc());
    lmx::c_datetime utc("2024-05-31T12:34:56Z");
    EXPECT_TRUE(utc.is_utc());
    EXPECT_EQ(utc.get_tz_offset(), 0);
    EXPECT_EQ(lmx::c_datetime("-0044-03-15T12:00:00").get_year(), -44);
}

TEST(DateTimeText, DefaultValue) {
    lmx::c_datetime d;
    EXPECT_EQ(d.get_year(), 1);
    EXPECT_EQ(d.get_month(), 0u);
    EXPECT_EQ(d.get_as_string(), "0001-00-00T00:00:00");
}

TEST(DateTimeText, BuiltFromFieldsAsASaveStampsIt) {
    lmx::c_datetime d;
    d.set_year(2024);
    d.set_month(5);
    d.set_day(31);
    d.set_hours(8);
    d.set_minutes(9);
    d.set_seconds(10);
    d.set_utc(true);
    EXPECT_EQ(d.get_as_string(), "2024-05-31T08:09:10Z");
    d.set_utc(false);
    d.set_tz_offset(90);
    EXPECT_EQ(d.get_as_string(), "2024-05-31T08:09:10+01:30");
    d.set_tz_offset(-45);
    EXPECT_EQ(d.get_as_string(), "2024-05-31T08:09:10-00:45");
}

TEST(DateTimeText, PaddingOfYearsAndSeconds) {
    lmx::c_datetime d("2024-01-01T00:00:00");
    d.set_year(5);
    d.set_seconds(0.0f);
    EXPECT_EQ(d.get_as_string(), "0005-01-01T00:00:00");
    d.set_year(-5);
    EXPECT_EQ(d.get_as_string(), "-0005-01-01T00:00:00");
    d.set_year(2024);
    d.set_seconds(5.5f);
    EXPECT_EQ(d.get_as_string(), "2024-01-01T00:00:05.5");
    d.set_seconds(0.0005f);
    EXPECT_EQ(d.get_as_string(), "2024-01-01T00:00:00.000500");
    d.set_seconds(10.0f);
    EXPECT_EQ(d.get_as_string(), "2024-01-01T00:00:10");
    d.set_seconds(59.25f);
    EXPECT_EQ(d.get_as_string(), "2024-01-01T00:00:59.25");
}

TEST(DateTimeText, AssignmentStopsAtTheFirstMismatchLeavingTheRest) {
    lmx::c_datetime d("2024-05-31T12:34:56Z");
    d = "2025-06-xx";
    EXPECT_EQ(d.get_year(), 2025);
    EXPECT_EQ(d.get_month(), 6u);
    EXPECT_EQ(d.get_day(), 31u);
    EXPECT_EQ(d.get_hours(), 12u);
    EXPECT_TRUE(d.is_utc());
    EXPECT_EQ(d.get_as_string(), "2025-06-31T12:34:56Z");

    d = std::string("garbage");
    EXPECT_EQ(d.get_as_string(), "2025-06-31T12:34:56Z");

    d = "2026-07-01T01:02:03";
    EXPECT_EQ(d.get_as_string(), "2026-07-01T01:02:03");
}

TEST(DateTimeText, TimeCheckAcceptsASignThatAssignmentDoesNotRead) {
    EXPECT_TRUE(lmx::c_time::is_valid("-12:00:00"));
    lmx::c_time t("01:02:03");
    t = "-12:00:00";
    EXPECT_EQ(t.get_hours(), 1u);
    EXPECT_EQ(t.get_as_string(), "01:02:03");
}

TEST(DateTimeText, MonthThirteenPasses) {
    EXPECT_TRUE(lmx::c_date::is_valid("2024-13-01"));
    EXPECT_EQ(lmx::c_date("2024-13-01").get_month(), 13u);
}

// ---------------------------------------------------------------------------
// Dates and times: comparison
// ---------------------------------------------------------------------------

TEST(DateTimeCompare, FieldByFieldIgnoringTheZone) {
    struct {
        const char *a;
        const char *b;
        int order;
    } const cases[] = {
        {"2024-05-31T12:00:00Z", "2024-05-31T12:00:00+05:00", 0},
        {"2024-05-31T12:00:00", "2024-05-31T12:00:00Z", 0},
        {"2024-05-31T12:00:00", "2024-05-31T12:00:00", 0},
        {"2024-05-31T12:00:00", "2025-01-01T00:00:00", -1},
        {"2024-06-01T00:00:00", "2024-05-31T23:59:59", 1},
        {"2024-05-31T12:00:00", "2024-05-31T12:00:01", -1},
        {"2024-05-31T12:00:00.5", "2024-05-31T12:00:00.25", 1},
        {"2024-05-31T11:59:59", "2024-05-31T12:00:00", -1},
        {"-0001-01-01T00:00:00", "0001-01-01T00:00:00", -1},
        // The zone is not applied: 12:00-05:00 is later in UTC, but compares earlier.
        {"2024-05-31T12:00:00-05:00", "2024-05-31T13:00:00Z", -1},
    };
    for (const auto &c : cases) {
        lmx::c_datetime a(c.a), b(c.b);
        std::string label = std::string(c.a) + " vs " + c.b;
        EXPECT_EQ(a == b, c.order == 0) << label;
        EXPECT_EQ(a != b, c.order != 0) << label;
        EXPECT_EQ(a < b, c.order < 0) << label;
        EXPECT_EQ(a <= b, c.order <= 0) << label;
        EXPECT_EQ(a > b, c.order > 0) << label;
        EXPECT_EQ(a >= b, c.order >= 0) << label;
    }
}

TEST(DateTimeCompare, OtherFormsCompareTheirFields) {
    EXPECT_TRUE(lmx::c_date("2024-05-31") < lmx::c_date("2024-06-01"));
    EXPECT_TRUE(lmx::c_time("10:00:00") > lmx::c_time("09:59:59"));
    EXPECT_TRUE(lmx::c_gyear("2024") == lmx::c_gyear("2024Z"));
    EXPECT_TRUE(lmx::c_gmonth("--05--") < lmx::c_gmonth("--06--"));
}

} // namespace
