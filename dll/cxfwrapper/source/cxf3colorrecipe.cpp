// CxF3ColorRecipe: a handle over one cc::ColorRecipe.
#include "cxf3colorrecipewrapper.h"

#include "cxf3text.h"

#include <cstddef>

// ---------------------------------------------------------------- wrapper

CxF3ColorRecipeWrapper::CxF3ColorRecipeWrapper() : recipe(new cc::ColorRecipe()) {
    // Stamped at construction, not when the recipe is added to an object.
    recipe->set_CreationDate(CurrentUtcDateTime());
}

CxF3ColorRecipeWrapper::CxF3ColorRecipeWrapper(const cc::ColorRecipe &ar_recipe)
    : recipe(new cc::ColorRecipe(ar_recipe)) {}

// ---------------------------------------------------------------- factory

boost::shared_ptr<CxF3ColorRecipe> CxF3ColorRecipe::CreateCxFColorRecipe() {
    boost::shared_ptr<CxF3ColorRecipeWrapper> wrapper(new CxF3ColorRecipeWrapper());
    return boost::shared_ptr<CxF3ColorRecipe>(new CxF3ColorRecipeInterface(wrapper));
}

// ---------------------------------------------------------------- interface

CxF3ColorRecipeInterface::CxF3ColorRecipeInterface(const boost::shared_ptr<CxF3ColorRecipeWrapper> &ar_wrapper)
    : p_wrapper(ar_wrapper) {}

cc::ColorRecipe &CxF3ColorRecipeInterface::p_recipe() const {
    CxF3ColorRecipeWrapper &r_wrapper = RequireTarget(p_wrapper, "CxF3ColorRecipe");
    return RequireTarget(r_wrapper.recipe, "CxF3ColorRecipe");
}

namespace {

// The colorant at a_index, growing the list with empty colorants up to it.
// The unchecked index of the indexed getters is part of the contract.
cc::Colorant &colorant_at(cc::ColorRecipe &ar_recipe, unsigned a_index) {
    while (ar_recipe.size_Colorant() <= static_cast<std::size_t>(a_index))
        ar_recipe.append_Colorant();
    return ar_recipe.get_Colorant(a_index);
}

} // namespace

void CxF3ColorRecipeInterface::SetName(const std::string &ar_name) { p_recipe().set_Name(ToWide(ar_name)); }

std::string CxF3ColorRecipeInterface::GetName() const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    return ToNarrow(r_recipe.get_Name());
}

void CxF3ColorRecipeInterface::SetInfo(const std::string &ar_info) { p_recipe().set_Comments(ToWide(ar_info)); }

std::string CxF3ColorRecipeInterface::GetInfo() const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    return ToNarrow(r_recipe.get_Comments());
}

void CxF3ColorRecipeInterface::SetColorSpecification(const std::string &ar_id) {
    p_recipe().set_ColorSpecification(ToWide(ar_id));
}

std::string CxF3ColorRecipeInterface::GetColorSpecification() const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    return ToNarrow(r_recipe.get_ColorSpecification());
}

void CxF3ColorRecipeInterface::SetUnits(const std::string &ar_units) { p_recipe().set_Units(ToWide(ar_units)); }

std::string CxF3ColorRecipeInterface::GetUnits() const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    return ToNarrow(r_recipe.get_Units());
}

void CxF3ColorRecipeInterface::SetProcess(const std::string &ar_process) {
    p_recipe().set_Process(ToWide(ar_process));
}

std::string CxF3ColorRecipeInterface::GetProcess() const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    return ToNarrow(r_recipe.get_Process());
}

void CxF3ColorRecipeInterface::SetSubstrateType(CxF3SubstrateType a_type) {
    const wchar_t *p_text = L"Unknown";
    if (a_type == CxF3SubstrateFilm)
        p_text = L"Film";
    else if (a_type == CxF3SubstratePaper)
        p_text = L"Paper";
    p_recipe().set_Substrate(p_text);
}

CxF3SubstrateType CxF3ColorRecipeInterface::GetSubstrateType() const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    const std::wstring &r_text = r_recipe.get_Substrate();
    if (r_text == L"Film")
        return CxF3SubstrateFilm;
    if (r_text == L"Paper")
        return CxF3SubstratePaper;
    return CxF3SubstrateNone;
}

unsigned CxF3ColorRecipeInterface::GetColorantCount() const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    return static_cast<unsigned>(r_recipe.size_Colorant());
}

bool CxF3ColorRecipeInterface::AddColorant(const std::string &ar_name, bool a_is_base, double a_amount,
                                           double a_density) {
    cc::ColorRecipe &r_recipe = p_recipe();
    cc::Colorant colorant;
    colorant.set_Name(ToWide(ar_name));
    colorant.set_isBase(a_is_base);
    colorant.set_Value(a_amount);
    cc::Density density;
    density.set_value(a_density);
    colorant.assign_Density(density);
    if (!colorant.is_occurs_ok())
        return false;
    r_recipe.append_Colorant(colorant);
    return true;
}

std::string CxF3ColorRecipeInterface::GetColorantName(unsigned a_index) {
    const cc::Colorant &r_colorant = colorant_at(p_recipe(), a_index);
    return ToNarrow(r_colorant.get_Name());
}

double CxF3ColorRecipeInterface::GetColorantAmount(unsigned a_index) {
    return colorant_at(p_recipe(), a_index).get_Value();
}

bool CxF3ColorRecipeInterface::IsColorantBase(unsigned a_index) {
    return colorant_at(p_recipe(), a_index).get_isBase();
}

double CxF3ColorRecipeInterface::GetColorantDensity(unsigned a_index) {
    // The density's own accessor makes an empty one when there is none.
    return colorant_at(p_recipe(), a_index).get_Density().get_value();
}

bool CxF3ColorRecipeInterface::AddTag(const std::string &ar_name, const std::string &ar_value) {
    cc::ColorRecipe &r_recipe = p_recipe();
    cc::Tag tag;
    tag.set_Name(ToWide(ar_name));
    tag.set_Value(ToWide(ar_value));
    if (!tag.is_occurs_ok())
        return false;
    // As the document's file information tags: an empty tag at index size,
    // and the new one assigned onto it.
    const std::size_t index = r_recipe.size_Tag();
    r_recipe.append_Tag();
    r_recipe.assign_Tag(index, tag);
    return true;
}

std::string CxF3ColorRecipeInterface::GetTag(const std::string &ar_name) const {
    const cc::ColorRecipe &r_recipe = p_recipe();
    const std::wstring name = ToWide(ar_name);
    for (std::size_t i = 0; i < r_recipe.size_Tag(); ++i) {
        const cc::Tag &r_tag = r_recipe.get_Tag(i);
        if (r_tag.get_Name() == name)
            return ToNarrow(r_tag.get_Value());
    }
    return std::string();
}
