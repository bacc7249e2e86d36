// CXFTolerance: defaults, copies, the mode and description texts
// of all eleven modes, number formatting and the length.
#include <gtest/gtest.h>

#include <tessarine/CXFTolerance.h>

#include <limits>
#include <string>

namespace {

CXFTolerance make(int a_mode, float a_v0, float a_v1, float a_v2, float a_v3, float a_v4, float a_v5) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(static_cast<CXFToleranceModusType>(a_mode));
    tolerance.SetV(a_v0, a_v1, a_v2, a_v3, a_v4, a_v5);
    return tolerance;
}

// ---------------------------------------------------------------- construction and access

TEST(CXFTolerance, DefaultIsALimitOfThreeInModeZero) {
    const CXFTolerance tolerance;
    EXPECT_EQ(tolerance.GetToleranceModus(), T_DE);
    EXPECT_EQ(tolerance[0], 3.0f);
    for (unsigned short i = 1; i < 6; ++i)
        EXPECT_EQ(tolerance[i], 0.0f) << i;
    EXPECT_EQ(tolerance.Length(), 3.0f);
    EXPECT_EQ(tolerance.GetString(), "CIELAB");
    EXPECT_EQ(tolerance.GetToleranceModusString(), "CIELAB");
}

TEST(CXFTolerance, SettersAndAccessorsReachTheSameArray) {
    CXFTolerance tolerance;
    tolerance.SetV(1, 2, 3, 4, 5, 6);
    const float *p_values = tolerance.GetV();
    for (unsigned short i = 0; i < 6; ++i) {
        EXPECT_EQ(p_values[i], static_cast<float>(i + 1));
        EXPECT_EQ(tolerance[i], static_cast<float>(i + 1));
    }
    tolerance.SetV0(10);
    tolerance.SetV1(11);
    tolerance.SetV2(12);
    tolerance.SetV3(13);
    tolerance.SetV4(14);
    tolerance.SetV5(15);
    for (unsigned short i = 0; i < 6; ++i)
        EXPECT_EQ(tolerance.GetV()[i], static_cast<float>(10 + i));
    tolerance[3] = -1.5f;
    tolerance.GetV()[5] = 0.25f;
    EXPECT_EQ(tolerance[3], -1.5f);
    EXPECT_EQ(tolerance[5], 0.25f);
    const CXFTolerance &r_const = tolerance;
    EXPECT_EQ(r_const[3], -1.5f);
    EXPECT_EQ(r_const.GetV()[5], 0.25f);
}

TEST(CXFTolerance, CopyAndAssignmentTakeModeAndAllSixValues) {
    const CXFTolerance source = make(T_DE2000, 1, 2, 3, 4, 5, 6);
    const CXFTolerance copy(source);
    EXPECT_EQ(copy.GetToleranceModus(), T_DE2000);
    for (unsigned short i = 0; i < 6; ++i)
        EXPECT_EQ(copy[i], source[i]);

    CXFTolerance assigned;
    assigned = source;
    EXPECT_EQ(assigned.GetToleranceModus(), T_DE2000);
    for (unsigned short i = 0; i < 6; ++i)
        EXPECT_EQ(assigned[i], source[i]);

    // Copies are independent.
    assigned.SetV0(99);
    EXPECT_EQ(source[0], 1.0f);
}

// ---------------------------------------------------------------- texts of every mode

struct ModeRow {
    int mode;
    const char *mode_string;
    const char *description; // with V1 = 2, V2 = 1, V3 = 0.5
};

class CXFToleranceModes : public ::testing::TestWithParam<ModeRow> {};

TEST_P(CXFToleranceModes, ModeStringAndDescription) {
    const ModeRow &row = GetParam();
    const CXFTolerance tolerance = make(row.mode, 7, 2, 1, 0.5f, 9, 9);
    EXPECT_EQ(tolerance.GetToleranceModusString(), row.mode_string);
    EXPECT_EQ(CXFTolerance::GetToleranceModeString(static_cast<CXFToleranceModusType>(row.mode)), row.mode_string);
    EXPECT_EQ(tolerance.GetString(), row.description);
}

INSTANTIATE_TEST_SUITE_P(
    AllModes, CXFToleranceModes,
    ::testing::Values(ModeRow{T_DE, "CIELAB", "CIELAB"}, ModeRow{T_LAB, "CIELAB", "CIELAB"},
                      ModeRow{T_FMC, "T_FMC", "FMCII"}, ModeRow{T_CMC, "T_CMC", "CMC 2 : 1"},
                      ModeRow{T_LABMG, "T_LABMG", "LABmg"}, ModeRow{T_DEMG, "T_DEMG", "LABmg"},
                      ModeRow{T_DE94, "T_DE94", "dE* 94 (2 : 1 : 0.5)"}, ModeRow{T_D, "T_D", "D"},
                      ModeRow{T_CIE_dLCH_Elliptical, "T_CIE_dLCH_Elliptical", "CIELAB LCH"},
                      ModeRow{T_LCHmg_Elliptical, "T_LCHmg_Elliptical", "LCHmg"},
                      ModeRow{T_DE2000, "T_DE2000", "dE 2000 (2 : 1 : 0.5)"},
                      // Outside the enumeration: no error, "CIELAB" in both texts.
                      ModeRow{11, "CIELAB", "CIELAB"}, ModeRow{-1, "CIELAB", "CIELAB"},
                      ModeRow{1000, "CIELAB", "CIELAB"}));

TEST(CXFTolerance, ModesZeroAndOneCannotBeToldApartByText) {
    EXPECT_EQ(make(T_DE, 1, 0, 0, 0, 0, 0).GetString(), make(T_LAB, 1, 2, 3, 4, 5, 6).GetString());
    EXPECT_EQ(CXFTolerance::GetToleranceModeString(T_DE), CXFTolerance::GetToleranceModeString(T_LAB));
    // T_DEMG and T_LABMG share their description but not their mode string.
    EXPECT_EQ(make(T_DEMG, 1, 0, 0, 0, 0, 0).GetString(), make(T_LABMG, 1, 0, 0, 0, 0, 0).GetString());
    EXPECT_NE(CXFTolerance::GetToleranceModeString(T_DEMG), CXFTolerance::GetToleranceModeString(T_LABMG));
}

TEST(CXFTolerance, ModeElevenIsNotRefused) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(static_cast<CXFToleranceModusType>(11));
    EXPECT_EQ(static_cast<int>(tolerance.GetToleranceModus()), 11);
    EXPECT_EQ(tolerance.GetString(), "CIELAB");
    EXPECT_EQ(tolerance.GetToleranceModusString(), "CIELAB");
    EXPECT_EQ(CXFTolerance::GetToleranceModeString(static_cast<CXFToleranceModusType>(11)), "CIELAB");
}

TEST(CXFTolerance, CmcTwoToOne) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(T_CMC);
    tolerance.SetV1(2);
    tolerance.SetV2(1);
    EXPECT_EQ(tolerance.GetString(), "CMC 2 : 1");
}

TEST(CXFTolerance, De94WithGraphicArtsWeights) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(T_DE94);
    tolerance.SetV1(1);
    tolerance.SetV2(0.045f);
    tolerance.SetV3(0.015f);
    EXPECT_EQ(tolerance.GetString(), "dE* 94 (1 : 0.045 : 0.015)");
}

TEST(CXFTolerance, De2000Separators) {
    EXPECT_EQ(make(T_DE2000, 5, 1, 1, 1, 0, 0).GetString(), "dE 2000 (1 : 1 : 1)");
    EXPECT_EQ(make(T_DE2000, 5, 2, 1.5f, 0.75f, 0, 0).GetString(), "dE 2000 (2 : 1.5 : 0.75)");
}

TEST(CXFTolerance, NoDescriptionShowsV0) {
    for (int mode = 0; mode <= 11; ++mode) {
        const std::string text = make(mode, 123.25f, 1, 1, 1, 1, 1).GetString();
        EXPECT_EQ(text.find("123"), std::string::npos) << mode << ": " << text;
    }
}

// ---------------------------------------------------------------- number formatting

struct NumberRow {
    float value;
    const char *text;
};

class CXFToleranceNumbers : public ::testing::TestWithParam<NumberRow> {};

// Each value shows as lexical_cast<std::string>(float) at precision 7 renders it.
TEST_P(CXFToleranceNumbers, AsCmcWeight) {
    const NumberRow &row = GetParam();
    EXPECT_EQ(make(T_CMC, 0, row.value, 1, 0, 0, 0).GetString(), std::string("CMC ") + row.text + " : 1");
    EXPECT_EQ(make(T_DE94, 0, 1, 1, row.value, 0, 0).GetString(),
              std::string("dE* 94 (1 : 1 : ") + row.text + ")");
}

INSTANTIATE_TEST_SUITE_P(
    Precision7, CXFToleranceNumbers,
    ::testing::Values(NumberRow{1.5f, "1.5"}, NumberRow{2.0f, "2"}, NumberRow{0.0f, "0"}, NumberRow{-1.5f, "-1.5"},
                      NumberRow{1234567.0f, "1234567"}, NumberRow{12345678.0f, "1.234568e+07"},
                      NumberRow{0.1f, "0.1"}, NumberRow{1.0f / 3.0f, "0.3333333"},
                      NumberRow{0.0001f, "0.0001"}, NumberRow{0.00001f, "1e-05"},
                      NumberRow{std::numeric_limits<float>::infinity(), "inf"}));

// ---------------------------------------------------------------- length

TEST(CXFTolerance, LengthIgnoresV3ToV5) {
    EXPECT_EQ(make(T_DE, 3, 4, 0, 9, 9, 9).Length(), 5.0f);
    EXPECT_EQ(make(T_LAB, 3, 4, 0, 9, 9, 9).Length(), 5.0f);
    EXPECT_EQ(make(T_DE, 0, 0, 0, 100, 100, 100).Length(), 0.0f);
}

TEST(CXFTolerance, LengthIsTheSameInEveryMode) {
    for (int mode = 0; mode <= 11; ++mode)
        EXPECT_EQ(make(mode, 2, 3, 6, 1, 1, 1).Length(), 7.0f) << mode;
}

TEST(CXFTolerance, LengthCountsNegativeValuesBySquare) {
    EXPECT_EQ(make(T_DE, -3, 0, -4, 0, 0, 0).Length(), 5.0f);
}

TEST(CXFTolerance, LengthSumsInSinglePrecision) {
    // The float sum of squares loses bits that a double sum keeps: summed in
    // double the length would be 629.882568.
    EXPECT_EQ(make(T_DE, 492.0f, 370.625f, 131.625f, 0, 0, 0).Length(), 629.882507f);
    EXPECT_EQ(make(T_DE, 4750.0f, 434.0f, 154.0625f, 0, 0, 0).Length(), 4772.27344f);
}

} // namespace
