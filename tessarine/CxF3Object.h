// CxF3Object: one colour object of a CxF3 document (a target, trial,
// substrate, colorant or branded standard) with its names, ids, measured
// values, recipes, tags and tolerance.
//
// Values added with the Add... members reach the file only when the object is
// added to a document afterwards (CxF3::AddObject copies them in); names, ids,
// dates and the object type reach it at any time.
#ifndef TESSARINE_CXF3OBJECT_H
#define TESSARINE_CXF3OBJECT_H

#include <tessarine/CXFTolerance.h>
#include <tessarine/CxF3ColorRecipe.h>
#include <tessarine/CxF3ColorSpecification.h>
#include <tessarine/CxF3Types.h>

#include <boost/shared_ptr.hpp>

#include <map>
#include <string>
#include <vector>

class CxF3ObjectInterface;
class CxF3ObjectWrapper;

class CxF3Object {
public:
    static boost::shared_ptr<CxF3Object> CreateCxFObject();
    // The tag names under which applications keep the sample and paper type.
    static const std::string &GetSampleTypeTag();
    static const std::string &GetPaperTypeTag();

    explicit CxF3Object(const boost::shared_ptr<CxF3ObjectInterface> &ar_interface);

    void SetName(const std::string &ar_name);
    std::string GetName() const;
    // The object's comment.
    void SetInfo(const std::string &ar_info);
    std::string GetInfo() const;
    // Overwritten by CxF3::AddObject, which numbers the objects "O1", "O2", ...
    void SetId(const std::string &ar_id);
    void SetId(int a_id);
    std::string GetId() const;
    // In the XML date-time form, e.g. "2026-11-24T10:15:00Z".
    void SetCreationDate(const std::string &ar_date);
    std::string GetCreationDate() const;
    void SetGUID(const std::string &ar_guid);
    std::string GetGUID() const;
    // Writes "Target", "Trial", "Substrate", "Colorant"; anything else "Unknown".
    void SetObjectType(CxF3ObjectType a_type);
    CxF3ObjectType GetObjectType() const;
    // The object type as stored, e.g. "Standard".
    std::string GetCxFObjectType() const;
    // Makes the object a standard of the branded library; the revision is not kept.
    bool AddLumiveraStandard(const std::string &ar_guid, unsigned long a_revision);

    // A spectrum from 380 nm. Values outside -0.1 .. 2.0 are kept and make the
    // object invalid (IsValid, GetErrorInfo).
    bool AddReflectanceSpectrum(const std::vector<double> &ar_values, const std::string &ar_specification_id,
                                const std::string &ar_name);
    // L, a, b from the first three values. L outside -0.1 .. 110 is kept and
    // makes the object invalid.
    bool AddColorCIELab(const std::vector<double> &ar_lab, const std::string &ar_specification_id,
                        const std::string &ar_name);
    bool AddColorRecipe(const boost::shared_ptr<CxF3ColorRecipe> &ar_recipe);
    bool AddSubstrateType(bool a_is_film);
    bool AddThickness(double a_thickness, const std::string &ar_units);
    // Adds a tag to the named tag collection, making the collection when needed.
    bool AddTag(const std::string &ar_collection, const std::string &ar_name, const std::string &ar_value);
    std::string GetTag(const std::string &ar_collection, const std::string &ar_name) const;
    bool AddTolerance(const CXFTolerance &ar_tolerance, const std::string &ar_specification_id);
    // From the first colour difference value; a default tolerance when there is none.
    CXFTolerance GetTolerance() const;

    // The spectrum measured under the specification, on 36 points from 380 nm
    // to 730 nm; empty when there is none with more than 30 values, steps of
    // 10 nm and a start from 360 to 400 nm. Throws std::runtime_error when the
    // spectrum does not cover 400 .. 700 nm.
    std::vector<double> GetReflectance(const boost::shared_ptr<CxF3ColorSpecification> &ar_specification) const;
    std::vector<std::string> GetReflectanceColorSpecificationIds() const;
    bool HasLab(const std::string &ar_specification_id) const;
    // The last Lab value of the specification; 0, 0, 0 when there is none.
    std::vector<double> GetLab(const std::string &ar_specification_id) const;
    std::string GetLabColorSpecificationId() const;
    // A copy of the first recipe made for the specification; a handle that
    // refers to no recipe when there is none.
    boost::shared_ptr<CxF3ColorRecipe> GetRecipe(const std::string &ar_specification_id) const;
    std::string GetRecipeColorSpecificationId() const;
    // The tags "Assortment" and "Substrate" of the first recipe.
    std::string GetAssortmentName() const;
    std::string GetSubstrateName() const;
    CxF3SubstrateType GetSubstrateType() const;
    // The custom attributes of the physical attributes, by name.
    std::map<std::string, std::vector<std::string>> GetPhysicalProperties() const;
    std::vector<std::string> GetPhysicalProperties(const std::string &ar_name) const;

    // False once a value check has failed; it never turns true again.
    bool IsValid() const;
    const std::string &GetErrorInfo() const;

    const boost::shared_ptr<CxF3ObjectInterface> &GetInterface() const { return p_interface; }

private:
    // The wrapper; throws std::logic_error on a handle that refers to no object.
    CxF3ObjectWrapper &p_wrapper() const;

    boost::shared_ptr<CxF3ObjectInterface> p_interface;
};

#endif // TESSARINE_CXF3OBJECT_H
