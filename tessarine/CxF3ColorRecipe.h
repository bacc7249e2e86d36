// CxF3ColorRecipe: the formula of a colour (named colorants with amounts and
// densities, the process and the substrate), as one cc:ColorRecipe.
#ifndef TESSARINE_CXF3COLORRECIPE_H
#define TESSARINE_CXF3COLORRECIPE_H

#include <tessarine/CxF3Types.h>

#include <boost/shared_ptr.hpp>

#include <string>

class CxF3ColorRecipe {
public:
    // A new recipe, stamped with the current UTC time as its creation date.
    static boost::shared_ptr<CxF3ColorRecipe> CreateCxFColorRecipe();

    virtual ~CxF3ColorRecipe() = default;

    virtual void SetName(const std::string &ar_name) = 0;
    virtual std::string GetName() const = 0;
    // The recipe's comments.
    virtual void SetInfo(const std::string &ar_info) = 0;
    virtual std::string GetInfo() const = 0;
    // The id of the colour specification the recipe was made for.
    virtual void SetColorSpecification(const std::string &ar_id) = 0;
    virtual std::string GetColorSpecification() const = 0;
    virtual void SetUnits(const std::string &ar_units) = 0;
    virtual std::string GetUnits() const = 0;
    virtual void SetProcess(const std::string &ar_process) = 0;
    virtual std::string GetProcess() const = 0;
    // Stored as the text "Film", "Paper" or "Unknown".
    virtual void SetSubstrateType(CxF3SubstrateType a_type) = 0;
    virtual CxF3SubstrateType GetSubstrateType() const = 0;

    virtual unsigned GetColorantCount() const = 0;
    // False when the colorant lacks a required part (the name).
    virtual bool AddColorant(const std::string &ar_name, bool a_is_base, double a_amount, double a_density) = 0;
    // The indexed getters are not checked: an index at or past the end grows
    // the colorant list with empty colorants up to it and reads an empty one.
    virtual std::string GetColorantName(unsigned a_index) = 0;
    virtual double GetColorantAmount(unsigned a_index) = 0;
    virtual bool IsColorantBase(unsigned a_index) = 0;

    virtual bool AddTag(const std::string &ar_name, const std::string &ar_value) = 0;
    // The first tag of that name; "" when there is none.
    virtual std::string GetTag(const std::string &ar_name) const = 0;
    virtual double GetColorantDensity(unsigned a_index) = 0;
};

#endif // TESSARINE_CXF3COLORRECIPE_H
