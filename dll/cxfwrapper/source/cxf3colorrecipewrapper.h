// The body of a CxF3ColorRecipe handle: one cc::ColorRecipe.
#ifndef TESSARINE_CXF3COLORRECIPEWRAPPER_H
#define TESSARINE_CXF3COLORRECIPEWRAPPER_H

#include <tessarine/CxF3ColorRecipe.h>

#include <cxf/v3/cxf3.h>

#include <boost/shared_ptr.hpp>

class CxF3ColorRecipeWrapper {
public:
    // A new recipe stamped with the current UTC time.
    CxF3ColorRecipeWrapper();
    // A copy of a recipe of an object.
    explicit CxF3ColorRecipeWrapper(const cc::ColorRecipe &ar_recipe);

    boost::shared_ptr<cc::ColorRecipe> recipe;
};

// The one implementation of CxF3ColorRecipe; every operation works on the
// wrapper's recipe.
class CxF3ColorRecipeInterface : public CxF3ColorRecipe {
public:
    explicit CxF3ColorRecipeInterface(const boost::shared_ptr<CxF3ColorRecipeWrapper> &ar_wrapper);

    void SetName(const std::string &ar_name) override;
    std::string GetName() const override;
    void SetInfo(const std::string &ar_info) override;
    std::string GetInfo() const override;
    void SetColorSpecification(const std::string &ar_id) override;
    std::string GetColorSpecification() const override;
    void SetUnits(const std::string &ar_units) override;
    std::string GetUnits() const override;
    void SetProcess(const std::string &ar_process) override;
    std::string GetProcess() const override;
    void SetSubstrateType(CxF3SubstrateType a_type) override;
    CxF3SubstrateType GetSubstrateType() const override;
    unsigned GetColorantCount() const override;
    bool AddColorant(const std::string &ar_name, bool a_is_base, double a_amount, double a_density) override;
    std::string GetColorantName(unsigned a_index) override;
    double GetColorantAmount(unsigned a_index) override;
    bool IsColorantBase(unsigned a_index) override;
    bool AddTag(const std::string &ar_name, const std::string &ar_value) override;
    std::string GetTag(const std::string &ar_name) const override;
    double GetColorantDensity(unsigned a_index) override;

    // The wrapper; null for a handle made for an unknown specification id.
    const boost::shared_ptr<CxF3ColorRecipeWrapper> &GetWrapper() const { return p_wrapper; }

private:
    // The recipe; throws std::logic_error when the handle refers to none.
    cc::ColorRecipe &p_recipe() const;

    boost::shared_ptr<CxF3ColorRecipeWrapper> p_wrapper;
};

#endif // TESSARINE_CXF3COLORRECIPEWRAPPER_H
