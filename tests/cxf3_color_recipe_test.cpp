// CxF3ColorRecipe: the handle over one cc::ColorRecipe, its
// attribute mapping, substrate texts, colorants with the growing indexed
// getters, tags, and handles that refer to nothing.
#include <gtest/gtest.h>

#include <tessarine/CxF3ColorRecipe.h>

#include <dll/cxfwrapper/source/cxf3colorrecipewrapper.h>

#include <cxf/v3/cxf3.h>

#include <ctime>
#include <stdexcept>
#include <string>

namespace {

std::wstring wide(const std::string &ar_utf8) {
    std::wstring out;
    lmx::convert(out, ar_utf8);
    return out;
}

// The recipe under a handle made by CreateCxFColorRecipe.
cc::ColorRecipe &bound(const boost::shared_ptr<CxF3ColorRecipe> &ar_handle) {
    const auto *p_interface = dynamic_cast<const CxF3ColorRecipeInterface *>(ar_handle.get());
    if (!p_interface || !p_interface->GetWrapper())
        throw std::logic_error("not a recipe handle with a wrapper");
    return *p_interface->GetWrapper()->recipe;
}

// ---------------------------------------------------------------- construction

TEST(CxF3ColorRecipe, FactoryGivesAHandleOverANewWrapper) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    ASSERT_TRUE(recipe);
    const auto *p_interface = dynamic_cast<const CxF3ColorRecipeInterface *>(recipe.get());
    ASSERT_NE(p_interface, nullptr);
    ASSERT_TRUE(p_interface->GetWrapper());
    ASSERT_TRUE(p_interface->GetWrapper()->recipe);
    // Two recipes are two wrappers.
    const boost::shared_ptr<CxF3ColorRecipe> other = CxF3ColorRecipe::CreateCxFColorRecipe();
    EXPECT_NE(&bound(recipe), &bound(other));
}

TEST(CxF3ColorRecipe, NewRecipeHasOnlyTheCreationDate) {
    const std::time_t before = std::time(nullptr);
    std::tm now{};
    gmtime_r(&before, &now);

    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    const cc::ColorRecipe &r_recipe = bound(recipe);
    const lmx::c_datetime &r_date = r_recipe.get_CreationDate();
    EXPECT_TRUE(r_date.is_utc());
    EXPECT_GE(r_date.get_year(), now.tm_year + 1900);
    EXPECT_LE(r_date.get_year(), now.tm_year + 1901);

    EXPECT_FALSE(r_recipe.isset_Comments());
    EXPECT_FALSE(r_recipe.isset_ColorSpecification());
    EXPECT_FALSE(r_recipe.isset_Substrate());
    EXPECT_FALSE(r_recipe.isset_Process());
    EXPECT_EQ(r_recipe.size_Tag(), 0u);
    EXPECT_EQ(r_recipe.size_Colorant(), 0u);
    // Name and Units are required and not yet set, and a colorant is missing.
    EXPECT_FALSE(r_recipe.is_occurs_ok());

    EXPECT_EQ(recipe->GetName(), "");
    EXPECT_EQ(recipe->GetInfo(), "");
    EXPECT_EQ(recipe->GetColorSpecification(), "");
    EXPECT_EQ(recipe->GetUnits(), "");
    EXPECT_EQ(recipe->GetProcess(), "");
    EXPECT_EQ(recipe->GetSubstrateType(), CxF3SubstrateNone);
    EXPECT_EQ(recipe->GetColorantCount(), 0u);
    EXPECT_EQ(recipe->GetTag("Assortment"), "");
}

TEST(CxF3ColorRecipe, WrapperFromARecipeTakesACopy) {
    cc::ColorRecipe source;
    source.set_Name(L"Loaded");
    source.set_Units(L"g");
    source.append_Colorant().set_Name(L"White");

    boost::shared_ptr<CxF3ColorRecipeWrapper> wrapper(new CxF3ColorRecipeWrapper(source));
    CxF3ColorRecipeInterface recipe(wrapper);
    EXPECT_EQ(recipe.GetName(), "Loaded");
    EXPECT_EQ(recipe.GetUnits(), "g");
    EXPECT_EQ(recipe.GetColorantCount(), 1u);
    EXPECT_EQ(recipe.GetColorantName(0), "White");
    // Not stamped: the loaded recipe keeps its (unset) date.
    EXPECT_EQ(wrapper->recipe->get_CreationDate().get_year(), source.get_CreationDate().get_year());

    recipe.SetName("Changed");
    EXPECT_TRUE(recipe.AddColorant("Black", false, 1, 1));
    EXPECT_EQ(source.get_Name(), L"Loaded");
    EXPECT_EQ(source.size_Colorant(), 1u);
}

TEST(CxF3ColorRecipe, TwoHandlesOnOneWrapperShareTheRecipe) {
    boost::shared_ptr<CxF3ColorRecipeWrapper> wrapper(new CxF3ColorRecipeWrapper());
    CxF3ColorRecipeInterface first(wrapper);
    CxF3ColorRecipeInterface second(wrapper);
    first.SetName("Shared");
    EXPECT_EQ(second.GetName(), "Shared");
    ASSERT_TRUE(second.AddColorant("Cyan", false, 1, 1));
    EXPECT_EQ(first.GetColorantCount(), 1u);
}

TEST(CxF3ColorRecipe, HandleKeepsItsWrapperAlive) {
    boost::shared_ptr<CxF3ColorRecipe> handle;
    {
        boost::shared_ptr<CxF3ColorRecipeWrapper> wrapper(new CxF3ColorRecipeWrapper());
        handle.reset(new CxF3ColorRecipeInterface(wrapper));
        handle->SetName("Kept");
    }
    EXPECT_EQ(handle->GetName(), "Kept");
}

// ---------------------------------------------------------------- attributes and elements

TEST(CxF3ColorRecipe, TextsMapOntoTheirBoundParts) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetName("Red 032");
    recipe->SetInfo("Mixed on Monday");
    recipe->SetColorSpecification("CSdevice1234M1-VT-D50-2");
    recipe->SetUnits("g/kg");
    recipe->SetProcess("Offset");

    const cc::ColorRecipe &r_recipe = bound(recipe);
    EXPECT_EQ(r_recipe.get_Name(), L"Red 032");
    EXPECT_TRUE(r_recipe.isset_Comments());
    EXPECT_EQ(r_recipe.get_Comments(), L"Mixed on Monday");
    EXPECT_TRUE(r_recipe.isset_ColorSpecification());
    EXPECT_EQ(r_recipe.get_ColorSpecification(), L"CSdevice1234M1-VT-D50-2");
    EXPECT_EQ(r_recipe.get_Units(), L"g/kg");
    EXPECT_TRUE(r_recipe.isset_Process());
    EXPECT_EQ(r_recipe.get_Process(), L"Offset");

    EXPECT_EQ(recipe->GetName(), "Red 032");
    EXPECT_EQ(recipe->GetInfo(), "Mixed on Monday");
    EXPECT_EQ(recipe->GetColorSpecification(), "CSdevice1234M1-VT-D50-2");
    EXPECT_EQ(recipe->GetUnits(), "g/kg");
    EXPECT_EQ(recipe->GetProcess(), "Offset");
}

TEST(CxF3ColorRecipe, TextsCrossAsUtf8AndStopAtTheFirstNul) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    const std::string name = "Gr\xC3\xBCn \xE2\x82\xAC";
    recipe->SetName(name);
    EXPECT_EQ(bound(recipe).get_Name(), wide(name));
    EXPECT_EQ(recipe->GetName(), name);

    recipe->SetInfo(std::string("before\0after", 12));
    EXPECT_EQ(recipe->GetInfo(), "before");
}

TEST(CxF3ColorRecipe, EmptyTextsAreStoredAsPresent) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetInfo("");
    recipe->SetProcess("");
    EXPECT_TRUE(bound(recipe).isset_Comments());
    EXPECT_TRUE(bound(recipe).isset_Process());
    EXPECT_EQ(recipe->GetInfo(), "");
}

// ---------------------------------------------------------------- substrate type

struct SubstrateRow {
    int type;
    const wchar_t *stored;
    CxF3SubstrateType read;
};

class CxF3ColorRecipeSubstrate : public ::testing::TestWithParam<SubstrateRow> {};

TEST_P(CxF3ColorRecipeSubstrate, WritesTextAndReadsItBack) {
    const SubstrateRow &row = GetParam();
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetSubstrateType(static_cast<CxF3SubstrateType>(row.type));
    EXPECT_TRUE(bound(recipe).isset_Substrate());
    EXPECT_EQ(bound(recipe).get_Substrate(), row.stored);
    EXPECT_EQ(recipe->GetSubstrateType(), row.read);
}

INSTANTIATE_TEST_SUITE_P(AllValues, CxF3ColorRecipeSubstrate,
                         ::testing::Values(SubstrateRow{CxF3SubstrateFilm, L"Film", CxF3SubstrateFilm},
                                           SubstrateRow{CxF3SubstratePaper, L"Paper", CxF3SubstratePaper},
                                           // 2 writes "Unknown" and reads back as 2.
                                           SubstrateRow{CxF3SubstrateNone, L"Unknown", CxF3SubstrateNone},
                                           SubstrateRow{3, L"Unknown", CxF3SubstrateNone},
                                           SubstrateRow{-1, L"Unknown", CxF3SubstrateNone}));

TEST(CxF3ColorRecipe, SubstrateTextsOtherThanFilmAndPaperReadAsNone) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    for (const wchar_t *p_text : {L"Textile", L"film", L"Paper ", L"", L"Unknown"}) {
        bound(recipe).set_Substrate(p_text);
        EXPECT_EQ(recipe->GetSubstrateType(), CxF3SubstrateNone);
    }
    bound(recipe).set_Substrate(L"Paper");
    EXPECT_EQ(recipe->GetSubstrateType(), CxF3SubstratePaper);
    bound(recipe).set_Substrate(L"Film");
    EXPECT_EQ(recipe->GetSubstrateType(), CxF3SubstrateFilm);
}

// ---------------------------------------------------------------- colorants

TEST(CxF3ColorRecipe, AddColorantKeepsAllFour) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    EXPECT_TRUE(recipe->AddColorant("Cyan", false, 12.5, 1.4));
    EXPECT_EQ(recipe->GetColorantCount(), 1u);
    EXPECT_EQ(recipe->GetColorantName(0), "Cyan");
    EXPECT_EQ(recipe->GetColorantAmount(0), 12.5);
    EXPECT_EQ(recipe->GetColorantDensity(0), 1.4);
    EXPECT_FALSE(recipe->IsColorantBase(0));

    EXPECT_TRUE(recipe->AddColorant("Varnish", true, 80, 0));
    EXPECT_EQ(recipe->GetColorantCount(), 2u);
    EXPECT_EQ(recipe->GetColorantName(1), "Varnish");
    EXPECT_TRUE(recipe->IsColorantBase(1));
    EXPECT_EQ(recipe->GetColorantAmount(1), 80.0);
    EXPECT_EQ(recipe->GetColorantDensity(1), 0.0);
    // The first is untouched.
    EXPECT_EQ(recipe->GetColorantName(0), "Cyan");
    EXPECT_EQ(recipe->GetColorantCount(), 2u);
}

TEST(CxF3ColorRecipe, AddColorantFillsTheBoundColorant) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    ASSERT_TRUE(recipe->AddColorant("Magenta", true, 3.25, 0.9));
    const cc::ColorRecipe &r_recipe = bound(recipe);
    ASSERT_EQ(r_recipe.size_Colorant(), 1u);
    const cc::Colorant &r_colorant = r_recipe.get_Colorant(0);
    EXPECT_EQ(r_colorant.get_Name(), L"Magenta");
    EXPECT_TRUE(r_colorant.isset_isBase());
    EXPECT_TRUE(r_colorant.get_isBase());
    EXPECT_EQ(r_colorant.get_Value(), 3.25);
    ASSERT_TRUE(r_colorant.isset_Density());
    EXPECT_EQ(r_colorant.get_Density()->get_value(), 0.9);
    EXPECT_FALSE(r_colorant.isset_ID());
    EXPECT_FALSE(r_colorant.isset_PartNumber());
    EXPECT_TRUE(r_colorant.is_occurs_ok());
}

TEST(CxF3ColorRecipe, AnEmptyColorantNameIsStillAName) {
    // The name is set, if empty, so the colorant's required parts are there.
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    EXPECT_TRUE(recipe->AddColorant("", false, 1, 1));
    EXPECT_EQ(recipe->GetColorantCount(), 1u);
    EXPECT_EQ(recipe->GetColorantName(0), "");
}

TEST(CxF3ColorRecipe, RecipeWithNameUnitsAndAColorantIsComplete) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    recipe->SetName("R");
    recipe->SetUnits("%");
    EXPECT_FALSE(bound(recipe).is_occurs_ok());
    ASSERT_TRUE(recipe->AddColorant("Yellow", false, 100, 1));
    EXPECT_TRUE(bound(recipe).is_occurs_ok());
    std::string xml;
    EXPECT_EQ(bound(recipe).marshal(xml), lmx::elmx_ok);
    EXPECT_NE(xml.find("Yellow"), std::string::npos);
}

TEST(CxF3ColorRecipe, ColorantNamePastTheEndGrowsTheList) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    EXPECT_EQ(recipe->GetColorantName(2), "");
    EXPECT_EQ(recipe->GetColorantCount(), 3u);
    // The colorants that appeared are empty ones.
    const cc::ColorRecipe &r_recipe = bound(recipe);
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_FALSE(r_recipe.get_Colorant(i).isset_Density());
        EXPECT_FALSE(r_recipe.get_Colorant(i).is_occurs_ok());
    }
    // An index inside the list does not grow it.
    EXPECT_EQ(recipe->GetColorantName(1), "");
    EXPECT_EQ(recipe->GetColorantCount(), 3u);
}

TEST(CxF3ColorRecipe, EveryIndexedGetterGrowsTheList) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    ASSERT_TRUE(recipe->AddColorant("Cyan", false, 12.5, 1.4));

    EXPECT_EQ(recipe->GetColorantAmount(1), 0.0);
    EXPECT_EQ(recipe->GetColorantCount(), 2u);

    EXPECT_FALSE(recipe->IsColorantBase(3));
    EXPECT_EQ(recipe->GetColorantCount(), 4u);

    EXPECT_FALSE(bound(recipe).get_Colorant(3).isset_Density());
    EXPECT_EQ(recipe->GetColorantDensity(3), 0.0);
    EXPECT_EQ(recipe->GetColorantCount(), 4u);
    // Reading the density made an empty one.
    EXPECT_TRUE(bound(recipe).get_Colorant(3).isset_Density());

    EXPECT_EQ(recipe->GetColorantDensity(5), 0.0);
    EXPECT_EQ(recipe->GetColorantCount(), 6u);
    EXPECT_TRUE(bound(recipe).get_Colorant(5).isset_Density());

    // The first colorant is unchanged.
    EXPECT_EQ(recipe->GetColorantName(0), "Cyan");
    EXPECT_EQ(recipe->GetColorantDensity(0), 1.4);
}

TEST(CxF3ColorRecipe, DensityOfALoadedColorantWithoutOneIsZero) {
    cc::ColorRecipe source;
    cc::Colorant &r_colorant = source.append_Colorant();
    r_colorant.set_Name(L"NoDensity");
    r_colorant.set_Value(5);
    boost::shared_ptr<CxF3ColorRecipeWrapper> wrapper(new CxF3ColorRecipeWrapper(source));
    CxF3ColorRecipeInterface recipe(wrapper);
    EXPECT_EQ(recipe.GetColorantAmount(0), 5.0);
    EXPECT_FALSE(recipe.IsColorantBase(0)); // isBase absent
    EXPECT_EQ(recipe.GetColorantDensity(0), 0.0);
    EXPECT_TRUE(wrapper->recipe->get_Colorant(0).isset_Density());
    EXPECT_EQ(recipe.GetColorantCount(), 1u);
}

// ---------------------------------------------------------------- tags

TEST(CxF3ColorRecipe, TagsFirstMatchWins) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    EXPECT_TRUE(recipe->AddTag("Assortment", "first"));
    EXPECT_TRUE(recipe->AddTag("Substrate", "Board"));
    EXPECT_TRUE(recipe->AddTag("Assortment", "second"));
    EXPECT_EQ(recipe->GetTag("Assortment"), "first");
    EXPECT_EQ(recipe->GetTag("Substrate"), "Board");
    EXPECT_EQ(recipe->GetTag("Missing"), "");
    // Exact comparison.
    EXPECT_EQ(recipe->GetTag("assortment"), "");
    EXPECT_EQ(recipe->GetTag("Assortment "), "");

    const cc::ColorRecipe &r_recipe = bound(recipe);
    ASSERT_EQ(r_recipe.size_Tag(), 3u);
    EXPECT_EQ(r_recipe.get_Tag(0).get_Name(), L"Assortment");
    EXPECT_EQ(r_recipe.get_Tag(0).get_Value(), L"first");
    EXPECT_EQ(r_recipe.get_Tag(1).get_Name(), L"Substrate");
    EXPECT_EQ(r_recipe.get_Tag(2).get_Value(), L"second");
}

TEST(CxF3ColorRecipe, EmptyTagNameAndValueAreNotRefused) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    EXPECT_TRUE(recipe->AddTag("", ""));
    EXPECT_TRUE(recipe->AddTag("Empty", ""));
    EXPECT_EQ(bound(recipe).size_Tag(), 2u);
    EXPECT_EQ(recipe->GetTag(""), "");
    EXPECT_EQ(recipe->GetTag("Empty"), "");
}

TEST(CxF3ColorRecipe, TagValuesCrossAsUtf8) {
    const boost::shared_ptr<CxF3ColorRecipe> recipe = CxF3ColorRecipe::CreateCxFColorRecipe();
    const std::string value = "\xE8\x89\xB2";
    ASSERT_TRUE(recipe->AddTag("Name", value));
    EXPECT_EQ(recipe->GetTag("Name"), value);
}

// ---------------------------------------------------------------- handles that refer to nothing

TEST(CxF3ColorRecipe, EmptyWrapperThrowsLogicErrorOnEveryMember) {
    CxF3ColorRecipeInterface recipe((boost::shared_ptr<CxF3ColorRecipeWrapper>()));
    EXPECT_FALSE(recipe.GetWrapper());
    EXPECT_THROW(recipe.SetName("x"), std::logic_error);
    EXPECT_THROW(recipe.GetName(), std::logic_error);
    EXPECT_THROW(recipe.SetInfo("x"), std::logic_error);
    EXPECT_THROW(recipe.GetInfo(), std::logic_error);
    EXPECT_THROW(recipe.SetColorSpecification("x"), std::logic_error);
    EXPECT_THROW(recipe.GetColorSpecification(), std::logic_error);
    EXPECT_THROW(recipe.SetUnits("x"), std::logic_error);
    EXPECT_THROW(recipe.GetUnits(), std::logic_error);
    EXPECT_THROW(recipe.SetProcess("x"), std::logic_error);
    EXPECT_THROW(recipe.GetProcess(), std::logic_error);
    EXPECT_THROW(recipe.SetSubstrateType(CxF3SubstrateFilm), std::logic_error);
    EXPECT_THROW(recipe.GetSubstrateType(), std::logic_error);
    EXPECT_THROW(recipe.GetColorantCount(), std::logic_error);
    EXPECT_THROW(recipe.AddColorant("x", false, 1, 1), std::logic_error);
    EXPECT_THROW(recipe.GetColorantName(0), std::logic_error);
    EXPECT_THROW(recipe.GetColorantAmount(0), std::logic_error);
    EXPECT_THROW(recipe.IsColorantBase(0), std::logic_error);
    EXPECT_THROW(recipe.AddTag("a", "b"), std::logic_error);
    EXPECT_THROW(recipe.GetTag("a"), std::logic_error);
    EXPECT_THROW(recipe.GetColorantDensity(0), std::logic_error);
}

TEST(CxF3ColorRecipe, EmptyWrapperErrorNamesTheClass) {
    CxF3ColorRecipeInterface recipe((boost::shared_ptr<CxF3ColorRecipeWrapper>()));
    try {
        recipe.GetName();
        FAIL() << "no exception";
    } catch (const std::logic_error &r_error) {
        EXPECT_NE(std::string(r_error.what()).find("CxF3ColorRecipe"), std::string::npos) << r_error.what();
    }
}

} // namespace
