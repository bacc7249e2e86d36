// The document layer of cc::CxF: loading and saving whole documents, the
// lookups across cc:Resources, the colour value getters and their quirks
// (cxf/v3/cxf3_document.cpp).
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <limits>
#include <random>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include <cxf/v3/cxf3.h>

namespace {

namespace fs = std::filesystem;

using Chosen = cc::inner_ColorValues;
using DeviceChosen = cc::inner_DeviceColorValues;

// What the lookups give for a kind or an Id they do not find.
constexpr unsigned k_not_found = std::numeric_limits<unsigned>::max();

const char *const k_date = "2024-05-06T07:08:09Z";

std::wstring wide(const std::string &ar_utf8) {
    std::wstring out;
    lmx::convert(out, ar_utf8);
    return out;
}

std::string narrow(const std::wstring &ar_text) {
    std::string out;
    lmx::convert(out, ar_text);
    return out;
}

// An object with its required attributes and creation date, appended to the
// document's object collection.
cc::Object &add_object(cc::CxF &ar_document, const std::wstring &ar_id, const std::wstring &ar_name = L"name") {
    cc::Object &object = ar_document.get_Resources().get_ObjectCollection().append_Object();
    object.set_ObjectType(L"Standard");
    object.set_Name(ar_name);
    object.set_Id(ar_id);
    object.set_CreationDate(lmx::c_datetime(k_date));
    return object;
}

cc::inner_ColorValues &add_item(cc::Object &ar_object) {
    return ar_object.get_ColorValues().append_inner_ColorValues();
}

void add_lab(cc::Object &ar_object, double a_l, double a_a, double a_b,
             const std::wstring &ar_color_specification = L"cs1") {
    cc::inner_ColorValues &item = add_item(ar_object);
    item.select_ColorCIELab();
    cc::ColorCIELab &lab = item.get_ColorCIELab();
    lab.set_ColorSpecification(ar_color_specification);
    lab.set_L(a_l);
    lab.set_A(a_a);
    lab.set_B(a_b);
}

// A document of one object holding one colour value item of every kind, in
// the order of their chosen numbers, 0 to 16.
cc::CxF every_kind_document() {
    cc::CxF document;
    cc::Object &object = add_object(document, L"every");

    add_item(object).select_ReflectanceSpectrum();
    {
        cc::ReflectanceSpectrum &spectrum = object.get_ColorValues().get_inner_ColorValues(0).get_ReflectanceSpectrum();
        spectrum.set_ColorSpecification(L"cs1");
        spectrum.set_StartWL(400);
        for (double value : {0.1, 0.2, 0.3})
            spectrum.append_value(value);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_TransmittanceSpectrum();
        item.get_TransmittanceSpectrum().set_ColorSpecification(L"cs1");
        item.get_TransmittanceSpectrum().append_value(0.5);
        item.get_TransmittanceSpectrum().append_value(0.25);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_EmissiveSpectrum();
        item.get_EmissiveSpectrum().set_ColorSpecification(L"cs1");
        for (double value : {1.5, 2.5, 3.5, 4.5})
            item.get_EmissiveSpectrum().append_value(value);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_CustomSpectrum();
        cc::CustomSpectrum &custom = item.get_CustomSpectrum();
        custom.set_ColorSpecification(L"cs1");
        cc::SpectralPoint &first = custom.append_SpectralPoint();
        first.set_WL(405.5);
        first.set_value(0.7);
        cc::SpectralPoint &second = custom.append_SpectralPoint();
        second.set_WL(612.25);
        second.set_value(0.8);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorSRGB();
        cc::ColorSRGB &rgb = item.get_ColorSRGB();
        rgb.set_ColorSpecification(L"cs1");
        rgb.set_MaxRange(255);
        rgb.set_R(10);
        rgb.set_G(20);
        rgb.set_B(30);
    }
    {
        // No Alpha: the vector still has four numbers.
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorAdobeRGB();
        cc::ColorAdobeRGB &rgb = item.get_ColorAdobeRGB();
        rgb.set_ColorSpecification(L"cs1");
        rgb.set_R(1);
        rgb.set_G(2);
        rgb.set_B(3);
    }
    add_lab(object, 50, -10, 20);
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorCIELCh();
        cc::ColorCIELCh &lch = item.get_ColorCIELCh();
        lch.set_ColorSpecification(L"cs1");
        lch.set_L(60);
        lch.set_C(30);
        lch.set_H(270);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorCIEXYZ();
        cc::ColorCIEXYZ &xyz = item.get_ColorCIEXYZ();
        xyz.set_ColorSpecification(L"cs1");
        xyz.set_X(41.2);
        xyz.set_Y(21.3);
        xyz.set_Z(1.9);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorEmissiveCIEXYZ();
        cc::ColorEmissiveCIEXYZ &xyz = item.get_ColorEmissiveCIEXYZ();
        xyz.set_ColorSpecification(L"cs1");
        xyz.set_X(95.047);
        xyz.set_Y(100);
        xyz.set_Z(108.883);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorCIExyY();
        cc::ColorCIExyY &xyy = item.get_ColorCIExyY();
        xyy.set_ColorSpecification(L"cs1");
        xyy.set_x(0.3127);
        xyy.set_y(0.329);
        xyy.set_Y(18);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorEmissiveCIExyY();
        cc::ColorEmissiveCIExyY &xyy = item.get_ColorEmissiveCIExyY();
        xyy.set_ColorSpecification(L"cs1");
        xyy.set_x(0.64);
        xyy.set_y(0.33);
        xyy.set_Y(80);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorCIELuv();
        cc::ColorCIELuv &luv = item.get_ColorCIELuv();
        luv.set_ColorSpecification(L"cs1");
        luv.set_L(70);
        luv.set_U(-5.5);
        luv.set_V(12.5);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_ColorDensity();
        cc::ColorDensity &density = item.get_ColorDensity();
        density.set_ColorSpecification(L"cs1");
        density.set_Density(1.45);
        density.set_Status(L"T");
        density.set_Filter(L"Cyan");
        density.set_BaseOffset(0.05);
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_PrivateSpectrum();
        cc::PrivateSpectrum &spectrum = item.append_PrivateSpectrum();
        spectrum.set_KeyID(L"key");
        spectrum.set_ColorSpecification(L"cs1");
        const unsigned char bytes[] = {1, 2, 3};
        spectrum.set_value(lmx::c_binary(bytes, sizeof bytes));
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_PrivateColorValues();
        cc::PrivateColorValues &values = item.append_PrivateColorValues();
        values.set_KeyID(L"key");
        values.set_ColorSpecification(L"cs1");
        const unsigned char bytes[] = {4, 5};
        values.set_value(lmx::c_binary(bytes, sizeof bytes));
    }
    {
        cc::inner_ColorValues &item = add_item(object);
        item.select_CustomColorSpace();
        cc::CustomColorSpace &space = item.append_CustomColorSpace();
        space.set_Name(L"space");
        space.set_ColorSpecification(L"cs1");
        cc::CustomDataType &value = space.append_Value();
        value.set_Label(L"c1");
        value.set_value(0.5);
    }
    return document;
}

// ---------------------------------------------------------------- colour value kinds

TEST(CxfDocumentColourSpaces, IndexOfAKindTheObjectLacksIsAllOnes) {
    cc::CxF document;
    cc::Object &object = add_object(document, L"o1");
    add_lab(object, 50, 1, 2);
    add_item(object).select_ColorSRGB();
    add_lab(object, 60, 3, 4);
    cc::inner_DeviceColorValues &device = object.get_DeviceColorValues().append_inner_DeviceColorValues();
    device.select_ColorHTML();
    device.append_ColorHTML().set_HTML(L"#102030");

    EXPECT_EQ(document.indexOfColorSpace(0, Chosen::EColorCIELab), 0u);
    EXPECT_EQ(document.indexOfColorSpace(0, Chosen::EColorSRGB), 1u);
    EXPECT_EQ(document.indexsOfColorSpace(0, Chosen::EColorCIELab), (std::vector<unsigned>{0, 2}));

    EXPECT_EQ(document.indexOfColorSpace(0, Chosen::EColorCIEXYZ), k_not_found);
    EXPECT_EQ(document.indexOfColorSpace(0, Chosen::EReflectanceSpectrum), k_not_found);
    EXPECT_TRUE(document.indexsOfColorSpace(0, Chosen::EColorCIEXYZ).empty());

    EXPECT_EQ(document.indexOfColorSpace(0, DeviceChosen::EColorHTML), 0u);
    EXPECT_EQ(document.indexOfColorSpace(0, DeviceChosen::EColorCMYK), k_not_found);
    EXPECT_TRUE(document.indexsOfColorSpace(0, DeviceChosen::EColorCMYK).empty());
}

TEST(CxfDocumentColourValues, VectorOfEachKind) {
    const cc::CxF document = every_kind_document();
    struct s_row {
        Chosen::elmx_chosen chosen;
        std::vector<double> values;
    };
    const s_row rows[] = {
        {Chosen::EReflectanceSpectrum, {0.1, 0.2, 0.3}},
        {Chosen::ETransmittanceSpectrum, {0.5, 0.25}},
        {Chosen::EEmissiveSpectrum, {1.5, 2.5, 3.5, 4.5}},
        // The point values, without their wavelengths.
        {Chosen::ECustomSpectrum, {0.7, 0.8}},
        {Chosen::EColorSRGB, {10, 20, 30}},
        // Alpha 0 when the item has none.
        {Chosen::EColorAdobeRGB, {1, 2, 3, 0}},
        {Chosen::EColorCIELab, {50, -10, 20}},
        {Chosen::EColorCIELCh, {60, 30, 270}},
        {Chosen::EColorCIEXYZ, {41.2, 21.3, 1.9}},
        {Chosen::EColorEmissiveCIEXYZ, {95.047, 100, 108.883}},
        {Chosen::EColorCIExyY, {0.3127, 0.329, 18}},
        {Chosen::EColorEmissiveCIExyY, {0.64, 0.33, 80}},
        {Chosen::EColorCIELuv, {70, -5.5, 12.5}},
        // The density alone: status, filter and base offset are no numbers of it.
        {Chosen::EColorDensity, {1.45}},
        // Private values and custom colour spaces have no numbers to give.
        {Chosen::EPrivateSpectrum, {}},
        {Chosen::EPrivateColorValues, {}},
        {Chosen::ECustomColorSpace, {}},
    };
    ASSERT_EQ(document.get_ColorValues(0).size_inner_ColorValues(), std::size(rows));
    for (unsigned i = 0; i < std::size(rows); ++i) {
        SCOPED_TRACE(document.get_ColorSpaceName(rows[i].chosen));
        Chosen::elmx_chosen chosen = Chosen::Echoice_not_set;
        EXPECT_EQ(document.colorValuesToVector(0, i, chosen), rows[i].values);
        EXPECT_EQ(chosen, rows[i].chosen);
        EXPECT_EQ(document.colorValuesToVector(0, i), rows[i].values);
    }
}

TEST(CxfDocumentColourValues, AdobeRgbWithAlphaGivesItsAlpha) {
    cc::CxF document;
    cc::inner_ColorValues &item = add_item(add_object(document, L"o"));
    item.select_ColorAdobeRGB();
    cc::ColorAdobeRGB &rgb = item.get_ColorAdobeRGB();
    rgb.set_ColorSpecification(L"cs1");
    rgb.set_MaxRange(255);
    rgb.set_R(200);
    rgb.set_G(100);
    rgb.set_B(0);
    rgb.set_Alpha(0.5);
    EXPECT_EQ(document.colorValuesToVector(0, 0), (std::vector<double>{200, 100, 0, 0.5}));
}

TEST(CxfDocumentColourValues, VectorsOfItemsReadFromText) {
    const std::wstring text = L"<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"><cc:Resources>"
                              L"<cc:ObjectCollection><cc:Object ObjectType=\"Standard\" Name=\"n\" Id=\"o\">"
                              L"<cc:CreationDate>2024-05-06T07:08:09Z</cc:CreationDate><cc:ColorValues>"
                              L"<cc:ColorDensity ColorSpecification=\"s\"><cc:Density>0.95</cc:Density>"
                              L"<cc:Status>T</cc:Status><cc:Filter>Black</cc:Filter></cc:ColorDensity>"
                              L"<cc:ColorAdobeRGB ColorSpecification=\"s\"><cc:R>1</cc:R><cc:G>2</cc:G>"
                              L"<cc:B>3</cc:B></cc:ColorAdobeRGB>"
                              L"<cc:ColorSRGB ColorSpecification=\"s\"><cc:MaxRange>255</cc:MaxRange><cc:R>4</cc:R>"
                              L"<cc:G>5</cc:G><cc:B>6</cc:B></cc:ColorSRGB>"
                              L"<cc:ReflectanceSpectrum ColorSpecification=\"s\" StartWL=\"380\">0.1 0.2 0.4"
                              L"</cc:ReflectanceSpectrum>"
                              L"<cc:CustomSpectrum ColorSpecification=\"s\"><cc:SpectralPoint WL=\"401\">0.5"
                              L"</cc:SpectralPoint><cc:SpectralPoint WL=\"433.5\">0.25</cc:SpectralPoint>"
                              L"</cc:CustomSpectrum>"
                              L"</cc:ColorValues></cc:Object></cc:ObjectCollection></cc:Resources></cc:CxF>";
    cc::CxF document;
    ASSERT_EQ(document.loadString(text), lmx::elmx_ok);
    Chosen::elmx_chosen chosen = Chosen::Echoice_not_set;
    EXPECT_EQ(document.colorValuesToVector(0, 0, chosen), std::vector<double>{0.95});
    EXPECT_EQ(chosen, Chosen::EColorDensity);
    EXPECT_EQ(document.colorValuesToVector(0, 1, chosen), (std::vector<double>{1, 2, 3, 0}));
    EXPECT_EQ(chosen, Chosen::EColorAdobeRGB);
    EXPECT_EQ(document.colorValuesToVector(0, 2, chosen), (std::vector<double>{4, 5, 6}));
    EXPECT_EQ(chosen, Chosen::EColorSRGB);
    EXPECT_EQ(document.colorValuesToVector(0, 3, chosen), (std::vector<double>{0.1, 0.2, 0.4}));
    EXPECT_EQ(chosen, Chosen::EReflectanceSpectrum);
    EXPECT_EQ(document.colorValuesToVector(0, 4, chosen), (std::vector<double>{0.5, 0.25}));
    EXPECT_EQ(chosen, Chosen::ECustomSpectrum);
}

TEST(CxfDocumentColourSpaces, NameOfEveryChosenValue) {
    const cc::CxF document;
    // The four spectra have no leading "E"; CustomColorSpace (16) has no name
    // of its own. Callers compare these texts, so they stay as they are.
    const char *const names[] = {"ReflectanceSpectrum", "TransmittanceSpectrum", "EmissiveSpectrum",
                                 "CustomSpectrum",      "EColorSRGB",            "EColorAdobeRGB",
                                 "EColorCIELab",        "EColorCIELCh",          "EColorCIEXYZ",
                                 "EColorEmissiveCIEXYZ", "EColorCIExyY",         "EColorEmissiveCIExyY",
                                 "EColorCIELuv",        "EColorDensity",         "EPrivateSpectrum",
                                 "EPrivateColorValues", "EIHaveNoIdea!!",        "Echoice_not_set"};
    static_assert(std::size(names) == Chosen::Echoice_not_set + 1, "one name for each chosen value");
    for (int i = 0; i <= Chosen::Echoice_not_set; ++i) {
        SCOPED_TRACE(i);
        EXPECT_EQ(document.get_ColorSpaceName(static_cast<Chosen::elmx_chosen>(i)), names[i]);
    }
    EXPECT_EQ(document.get_ColorSpaceName(Chosen::ECustomColorSpace), "EIHaveNoIdea!!");
    EXPECT_EQ(document.get_ColorSpaceName(Chosen::Echoice_not_set), "Echoice_not_set");
    // Values past the table.
    EXPECT_EQ(document.get_ColorSpaceName(static_cast<Chosen::elmx_chosen>(18)), "EIHaveNoIdea!!");
    EXPECT_EQ(document.get_ColorSpaceName(static_cast<Chosen::elmx_chosen>(31)), "EIHaveNoIdea!!");
}

// ---------------------------------------------------------------- colour getters

TEST(CxfDocumentColourGetters, FirstValueOfAKindByIndexAndById) {
    cc::CxF document;
    add_object(document, L"first");
    cc::Object &object = add_object(document, L"second");
    add_item(object).select_ColorSRGB();
    add_lab(object, 40, 5, 6, L"cs-a");
    add_lab(object, 41, 7, 8, L"cs-b");

    const cc::ColorCIELab by_index = document.get_ColorCIELab(1);
    EXPECT_EQ(by_index.get_L(), 40);
    EXPECT_EQ(by_index.get_ColorSpecification(), L"cs-a");
    const cc::ColorCIELab by_id = document.get_ColorCIELab(L"second");
    EXPECT_EQ(by_id.get_B(), 6);
}

TEST(CxfDocumentColourGetters, KindTheObjectLacksThrowsOutOfRange) {
    cc::CxF document;
    add_lab(add_object(document, L"lab-only"), 50, 0, 0);
    EXPECT_THROW(document.get_ColorCIEXYZ(0), std::out_of_range);
    EXPECT_THROW(document.get_ReflectanceSpectrum(0), std::out_of_range);
    EXPECT_THROW(document.get_ColorDensity(L"lab-only"), std::out_of_range);
    EXPECT_NO_THROW(document.get_ColorCIELab(0));
}

// ---------------------------------------------------------------- device colour values

TEST(CxfDocumentDeviceColours, RgbRunsSeparatedByAnotherKindComeBackInOneVector) {
    cc::CxF document;
    cc::Object &object = add_object(document, L"device");
    cc::DeviceColorValues &values = object.get_DeviceColorValues();
    auto add_rgb = [](cc::inner_DeviceColorValues &ar_item, short a_red) {
        cc::ColorRGB &rgb = ar_item.append_ColorRGB();
        rgb.set_ColorSpecification(L"cs1");
        rgb.set_R(a_red);
        rgb.set_G(0);
        rgb.set_B(0);
    };
    cc::inner_DeviceColorValues &first_run = values.append_inner_DeviceColorValues();
    first_run.select_ColorRGB();
    add_rgb(first_run, 1);
    add_rgb(first_run, 2);
    cc::inner_DeviceColorValues &between = values.append_inner_DeviceColorValues();
    between.select_ColorCMYK();
    cc::ColorCMYK &cmyk = between.append_ColorCMYK();
    cmyk.set_ColorSpecification(L"cs1");
    cmyk.set_Cyan(10);
    cmyk.set_Magenta(20);
    cmyk.set_Yellow(30);
    cmyk.set_Black(40);
    cc::inner_DeviceColorValues &second_run = values.append_inner_DeviceColorValues();
    second_run.select_ColorRGB();
    add_rgb(second_run, 3);

    auto check = [](const cc::CxF &ar_document) {
        const std::vector<cc::ColorRGB> rgb = ar_document.get_DeviceColorRgb(0);
        ASSERT_EQ(rgb.size(), 3u);
        EXPECT_EQ(rgb[0].get_R(), 1);
        EXPECT_EQ(rgb[1].get_R(), 2);
        EXPECT_EQ(rgb[2].get_R(), 3);
        EXPECT_EQ(ar_document.indexsOfColorSpace(0, DeviceChosen::EColorRGB), (std::vector<unsigned>{0, 2}));
        EXPECT_EQ(ar_document.get_DeviceColorValuesForType(0, DeviceChosen::EColorRGB).size(), 2u);
        ASSERT_EQ(ar_document.get_DeviceColorCMYK(0).size(), 1u);
        EXPECT_EQ(ar_document.get_DeviceColorCMYK(0)[0].get_Black(), 40);
        EXPECT_TRUE(ar_document.get_DeviceColorHTML(0).empty());
    };
    check(document);

    // The same three items when read back: the runs stay apart.
    cc::CxF reread;
    ASSERT_EQ(reread.loadString(document.writeString()), lmx::elmx_ok);
    ASSERT_EQ(reread.get_DeviceColorValues(0).size_inner_DeviceColorValues(), 3u);
    check(reread);
}

TEST(CxfDocumentDeviceColours, PrivateValuesAreNeverReturned) {
    cc::CxF document;
    cc::Object &object = add_object(document, L"private");
    cc::inner_DeviceColorValues &item = object.get_DeviceColorValues().append_inner_DeviceColorValues();
    item.select_PrivateColorValues();
    for (const wchar_t *key : {L"k1", L"k2"}) {
        cc::PrivateColorValues &values = item.append_PrivateColorValues();
        values.set_KeyID(key);
        values.set_ColorSpecification(L"cs1");
        const unsigned char bytes[] = {0xDE, 0xAD};
        values.set_value(lmx::c_binary(bytes, sizeof bytes));
    }

    // The object has two private values, in one item of that kind ...
    EXPECT_EQ(document.indexOfColorSpace(0, DeviceChosen::EPrivateColorValues), 0u);
    const std::vector<cc::inner_DeviceColorValues> items =
        document.get_DeviceColorValuesForType(0, DeviceChosen::EPrivateColorValues);
    ASSERT_EQ(items.size(), 1u);
    EXPECT_EQ(items[0].size_PrivateColorValues(), 2u);
    // ... and the getter still gives none: it counts them by their recipes.
    EXPECT_TRUE(document.get_DeviceColorPrivateColorValues(0).empty());

    cc::CxF reread;
    ASSERT_EQ(reread.loadString(document.writeString()), lmx::elmx_ok);
    EXPECT_TRUE(reread.get_DeviceColorPrivateColorValues(0).empty());
}

// ---------------------------------------------------------------- lookups by Id

TEST(CxfDocumentLookups, UnknownObjectIdGivesAnObjectWithNothingSet) {
    cc::CxF document;
    cc::Object &known = add_object(document, L"known", L"Known");
    known.set_GUID(L"guid");
    known.set_Comment(L"comment");
    add_lab(known, 1, 2, 3);

    const cc::Object object = document.get_ObjectByID(L"unknown");
    EXPECT_EQ(object.get_Id(), L"");
    EXPECT_EQ(object.get_Name(), L"");
    EXPECT_EQ(object.get_ObjectType(), L"");
    EXPECT_FALSE(object.isset_GUID());
    EXPECT_FALSE(object.isset_Comment());
    EXPECT_FALSE(object.isset_ColorValues());
    EXPECT_FALSE(object.isset_ColorDifferenceValues());
    EXPECT_FALSE(object.isset_DeviceColorValues());
    EXPECT_EQ(object.size_TagCollection(), 0u);
    EXPECT_FALSE(object.isset_PhysicalAttributes());
    // Its required parts are missing too: it could not be written.
    EXPECT_FALSE(object.is_occurs_ok());
    EXPECT_EQ(document.indexOfObject(L"unknown"), k_not_found);
}

TEST(CxfDocumentLookups, IdsAreCaseSensitiveAndTheFirstMatchWins) {
    cc::CxF document;
    add_object(document, L"A1", L"first");
    add_object(document, L"a1", L"lower");
    add_object(document, L"A1", L"second");
    cc::ColorSpecificationCollection &collection = document.get_Resources().get_ColorSpecificationCollection();
    collection.append_ColorSpecification().set_Id(L"D50");
    collection.get_ColorSpecification(0).get_MeasurementSpec().set_Aperture(L"first");
    collection.append_ColorSpecification().set_Id(L"d50");
    collection.get_ColorSpecification(1).get_MeasurementSpec().set_Aperture(L"lower");
    collection.append_ColorSpecification().set_Id(L"D50");
    collection.get_ColorSpecification(2).get_MeasurementSpec().set_Aperture(L"second");
    cc::ProfileCollection &profiles = document.get_Resources().get_ProfileCollection();
    profiles.append_Profile().set_Id(L"P");
    profiles.get_Profile(0).set_Direction(L"Profile_Input");
    profiles.append_Profile().set_Id(L"p");
    profiles.get_Profile(1).set_Direction(L"Profile_Output");
    profiles.append_Profile().set_Id(L"P");
    profiles.get_Profile(2).set_Direction(L"Profile_Both");

    EXPECT_EQ(document.indexOfObject(L"A1"), 0u);
    EXPECT_EQ(document.indexOfObject(L"a1"), 1u);
    EXPECT_EQ(document.indexOfObject(L"A"), k_not_found);
    EXPECT_EQ(document.indexOfObject(L"A1 "), k_not_found);
    EXPECT_EQ(document.get_ObjectByID(L"A1").get_Name(), L"first");
    EXPECT_EQ(document.get_ObjectByID(L"a1").get_Name(), L"lower");

    EXPECT_EQ(document.get_ColorSpecificationByID(L"D50").get_MeasurementSpec().get_Aperture(), L"first");
    EXPECT_EQ(document.get_ColorSpecificationByID(L"d50").get_MeasurementSpec().get_Aperture(), L"lower");
    EXPECT_EQ(document.get_ColorSpecificationByID(L"D5").get_Id(), L"");

    EXPECT_EQ(document.get_ProfileByID(L"P").get_Direction(), L"Profile_Input");
    EXPECT_EQ(document.get_ProfileByID(L"p").get_Direction(), L"Profile_Output");
    EXPECT_EQ(document.get_ProfileByID(L"q").get_Id(), L"");
}

TEST(CxfDocumentLookups, ColorSpecificationOfAReflectanceItemAndNoneOfALabItem) {
    cc::CxF document;
    cc::Object &object = add_object(document, L"obj");
    cc::inner_ColorValues &reflectance = add_item(object);
    reflectance.select_ReflectanceSpectrum();
    reflectance.get_ReflectanceSpectrum().set_ColorSpecification(L"cs-reflectance");
    reflectance.get_ReflectanceSpectrum().append_value(0.5);
    add_lab(object, 50, 0, 0, L"cs-lab");

    EXPECT_EQ(document.get_ColorSpaceSpecification(L"obj", 0), L"cs-reflectance");
    // Not a reflectance: empty, although the item names its ColorSpecification.
    EXPECT_EQ(document.get_ColorSpaceSpecification(L"obj", 1), L"");
    // The lookup works on a copy: the Lab item is still one.
    EXPECT_EQ(document.get_ColorValues(0).get_inner_ColorValues(1).getchosen(), Chosen::EColorCIELab);
    EXPECT_EQ(document.get_ColorCIELab(0).get_ColorSpecification(), L"cs-lab");
}

// ---------------------------------------------------------------- sizes

TEST(CxfDocumentSizes, SizeOfObjectOnAnEmptyDocumentIsZeroAndMakesResources) {
    cc::CxF document;
    EXPECT_FALSE(document.isset_Resources());
    EXPECT_EQ(document.get_SizeOfObject(), 0u);
    ASSERT_TRUE(document.isset_Resources());
    EXPECT_TRUE(std::as_const(document).get_Resources()->isset_ObjectCollection());
}

TEST(CxfDocumentSizes, SizeOfColorValuesMakesTheObjectsColorValues) {
    cc::CxF document;
    add_object(document, L"bare");
    EXPECT_FALSE(std::as_const(document).get_Resources()->get_ObjectCollection()->get_Object(0).isset_ColorValues());
    EXPECT_EQ(document.get_SizeOfColorValues(0), 0u);
    EXPECT_TRUE(std::as_const(document).get_Resources()->get_ObjectCollection()->get_Object(0).isset_ColorValues());
    add_lab(document.get_Resources().get_ObjectCollection().get_Object(0), 1, 2, 3);
    EXPECT_EQ(document.get_SizeOfColorValues(0), 1u);
    EXPECT_EQ(document.get_SizeOfObject(), 1u);
}

// ---------------------------------------------------------------- loading and saving

TEST(CxfDocumentLoad, MissingFileIsUnableToOpen) {
    const fs::path missing = fs::temp_directory_path() / "tessarine_cxf_document_no_such_file.cxf";
    ASSERT_FALSE(fs::exists(missing));
    cc::CxF document;
    EXPECT_EQ(document.loadFile(missing.string().c_str()), lmx::elmx_unable_to_open_file);
}

// A folder of its own under the temporary directory for each test, removed
// at the end.
class CxfDocumentWriteFile : public ::testing::Test {
protected:
    void SetUp() override {
        const unsigned salt = std::random_device{}();
        m_folder = fs::temp_directory_path() /
                   ("tessarine_cxf_document_" + std::to_string(salt) + "_" +
                    ::testing::UnitTest::GetInstance()->current_test_info()->name());
        fs::create_directories(m_folder);
    }
    void TearDown() override {
        std::error_code ignored;
        fs::remove_all(m_folder, ignored);
    }

    static std::wstring wide_path(const fs::path &ar_path) { return wide(ar_path.u8string()); }

    static std::string read_bytes(const fs::path &ar_path) {
        std::ifstream in(ar_path, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
    }

    static void write_bytes(const fs::path &ar_path, const std::string &ar_bytes) {
        std::ofstream out(ar_path, std::ios::binary | std::ios::trunc);
        out.write(ar_bytes.data(), static_cast<std::streamsize>(ar_bytes.size()));
    }

    // The names of the folder's entries.
    std::vector<std::string> entries() const {
        std::vector<std::string> names;
        for (const fs::directory_entry &entry : fs::directory_iterator(m_folder))
            names.push_back(entry.path().filename().u8string());
        return names;
    }

    static cc::CxF small_document(const std::wstring &ar_creator) {
        cc::CxF document;
        document.get_FileInformation().set_Creator(ar_creator);
        add_lab(add_object(document, L"o1"), 50, 1, 2);
        return document;
    }

    fs::path m_folder;
};

TEST_F(CxfDocumentWriteFile, PathInAMissingFolderIsRefusedAndWritesNothing) {
    const fs::path missing_folder = m_folder / "missing";
    const fs::path target = missing_folder / "out.cxf";
    const cc::CxF document = small_document(L"me");
    EXPECT_EQ(document.writeFile(wide_path(target)), lmx::elmx_unable_to_open_file);
    EXPECT_FALSE(fs::exists(missing_folder));
    EXPECT_TRUE(entries().empty());
}

TEST_F(CxfDocumentWriteFile, WritesTheDocumentAsWriteStringDoes) {
    const fs::path target = m_folder / "new.cxf";
    const cc::CxF document = small_document(L"Grün");
    ASSERT_EQ(document.writeFile(wide_path(target)), lmx::elmx_ok);
    EXPECT_EQ(read_bytes(target), narrow(document.writeString()));
    EXPECT_EQ(entries(), std::vector<std::string>{"new.cxf"});

    cc::CxF reread;
    ASSERT_EQ(reread.loadFile(target.string().c_str()), lmx::elmx_ok);
    EXPECT_EQ(reread.get_FileInformation().get_Creator(), L"Grün");
}

TEST_F(CxfDocumentWriteFile, ReplacesAnExistingFile) {
    const fs::path target = m_folder / "existing.cxf";
    write_bytes(target, std::string(10000, 'x') + "old contents");
    const cc::CxF document = small_document(L"new");
    ASSERT_EQ(document.writeFile(wide_path(target)), lmx::elmx_ok);
    EXPECT_EQ(read_bytes(target), narrow(document.writeString()));
    EXPECT_EQ(entries(), std::vector<std::string>{"existing.cxf"});
}

TEST_F(CxfDocumentWriteFile, FailedWriteLeavesThePreviousFileAndNoTemporary) {
    const fs::path target = m_folder / "kept.cxf";
    ASSERT_EQ(small_document(L"previous").writeFile(wide_path(target)), lmx::elmx_ok);
    const std::string previous = read_bytes(target);
    ASSERT_FALSE(previous.empty());

    // An object without its creation date cannot be written.
    cc::CxF broken = small_document(L"broken");
    cc::Object &object = broken.get_Resources().get_ObjectCollection().append_Object();
    object.set_ObjectType(L"Standard");
    object.set_Name(L"no date");
    object.set_Id(L"o2");
    EXPECT_EQ(broken.writeFile(wide_path(target)), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(read_bytes(target), previous);
    EXPECT_EQ(entries(), std::vector<std::string>{"kept.cxf"});
    EXPECT_EQ(broken.writeString(), L"");

    // Nor does a failure leave anything where no file was before.
    const fs::path fresh = m_folder / "fresh.cxf";
    EXPECT_EQ(broken.writeFile(wide_path(fresh)), lmx::elmx_marshal_occurs_error);
    EXPECT_FALSE(fs::exists(fresh));
    EXPECT_EQ(entries(), std::vector<std::string>{"kept.cxf"});
}

// ---------------------------------------------------------------- text

TEST(CxfDocumentText, NonAsciiTextRoundTripsThroughStrings) {
    // Wide strings hold UTF-16 code units: U+1F600 is a surrogate pair.
    std::wstring grinning;
    grinning += static_cast<wchar_t>(0xD83D);
    grinning += static_cast<wchar_t>(0xDE00);
    const std::wstring creator = L"Gr\u00FCn \u20AC " + grinning;

    cc::CxF document;
    document.get_FileInformation().set_Creator(creator);
    add_lab(add_object(document, L"id-\u00E9", L"Name \u65E5\u672C " + grinning), 50, 0, 0);

    const std::wstring written = document.writeString();
    ASSERT_FALSE(written.empty());
    EXPECT_NE(written.find(creator), std::wstring::npos);
    // As UTF-8 the pair is one four-byte character.
    const std::string utf8 = narrow(written);
    EXPECT_NE(utf8.find("Gr\xC3\xBCn \xE2\x82\xAC \xF0\x9F\x98\x80"), std::string::npos);
    EXPECT_EQ(utf8.find("\xED\xA0\xBD"), std::string::npos) << "a surrogate written as a character of its own";

    cc::CxF reread;
    ASSERT_EQ(reread.loadString(written), lmx::elmx_ok);
    EXPECT_EQ(reread.get_FileInformation().get_Creator(), creator);
    EXPECT_EQ(reread.get_ObjectByID(L"id-\u00E9").get_Name(), L"Name \u65E5\u672C " + grinning);
    EXPECT_EQ(reread.writeString(), written);
}

TEST(CxfDocumentText, LoadStringReadsNonAsciiMarkup) {
    std::wstring grinning;
    grinning += static_cast<wchar_t>(0xD83D);
    grinning += static_cast<wchar_t>(0xDE00);
    const std::wstring text = L"<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                              L"<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\">"
                              L"<cc:FileInformation><cc:Creator>Gr\u00FCn \u20AC</cc:Creator>"
                              L"<cc:Comment>" +
                              grinning + L" &#x1F600;</cc:Comment></cc:FileInformation></cc:CxF>";
    cc::CxF document;
    ASSERT_EQ(document.loadString(text), lmx::elmx_ok);
    EXPECT_EQ(document.get_FileInformation().get_Creator(), L"Gr\u00FCn \u20AC");
    EXPECT_EQ(document.get_FileInformation().get_Comment(), grinning + L" " + grinning);
}

// ---------------------------------------------------------------- custom resources

TEST(CxfDocumentCustomResources, CapturedXmlIsReturned) {
    const std::string first = "<v:Thing xmlns:v=\"urn:vendor\" a=\"1\"><v:Sub>x &amp; y</v:Sub></v:Thing>";
    const std::string second = "<Other xmlns=\"urn:other\"><Deep b=\"2\"/></Other>";
    const std::wstring text = L"<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\"><cc:CustomResources>" +
                              wide(first) + wide(second) + L"</cc:CustomResources></cc:CxF>";
    cc::CxF document;
    ASSERT_EQ(document.loadString(text), lmx::elmx_ok);
    ASSERT_EQ(document.get_CustomResources().size_inner_CustomResources(), 2u);
    EXPECT_EQ(document.get_CustomResource(0, "", ""), first);
    EXPECT_EQ(document.get_CustomResource(1, "ignored", "ignored"), second);

    std::string ns;
    std::string name;
    std::string value;
    document.get_CustomResources().get_inner_CustomResources(0).get_any(&ns, &name, value);
    EXPECT_EQ(ns, "urn:vendor");
    EXPECT_EQ(name, "v:Thing");
    EXPECT_EQ(value, first);
}

TEST(CxfDocumentCustomResources, StoredXmlIsReturned) {
    const std::string xml = "<p:Note xmlns:p=\"urn:p\">text</p:Note>";
    cc::CxF document;
    document.get_CustomResources().append_inner_CustomResources().set_any(lmx::c_any_info("urn:p", "p:Note", xml));
    EXPECT_EQ(document.get_CustomResource(0, "", ""), xml);
}

} // namespace
