// The body of a CxF3ColorSpecification handle.
#ifndef TESSARINE_CXF3COLORSPECIFICATIONWRAPPER_H
#define TESSARINE_CXF3COLORSPECIFICATIONWRAPPER_H

#include <tessarine/CxF3ColorSpecification.h>

#include <cxf/v3/cxf3.h>

#include <boost/shared_ptr.hpp>

#include <map>
#include <string>

class CxF3ColorSpecificationWrapper {
public:
    // A new specification: spectral reflectance, 380 nm in steps of 10 nm,
    // method "E308_Table6", and the illuminant table filled.
    CxF3ColorSpecificationWrapper();
    // A copy of a specification of a document. Its illuminant table stays
    // empty, so SetIlluminant on it always writes "Custom".
    explicit CxF3ColorSpecificationWrapper(const cc::ColorSpecification &ar_specification);

    // Illuminant word ("D50", "FL2", ...) to the schema's illuminant.
    std::map<std::string, cc::Eenum_Illuminant> illuminants;
    boost::shared_ptr<cc::ColorSpecification> specification;
    boost::shared_ptr<cc::MeasurementSpec> measurementSpec;
    boost::shared_ptr<cc::TristimulusSpec> tristimulusSpec;
};

// The one implementation of CxF3ColorSpecification.
class CxF3ColorSpecificationInterface : public CxF3ColorSpecification {
public:
    explicit CxF3ColorSpecificationInterface(const boost::shared_ptr<CxF3ColorSpecificationWrapper> &ar_wrapper);

    void SetId(const std::string &ar_id) override;
    std::string GetId() const override;
    CxF3MeasurementType GetMeasurementType() const override;
    void SetFilter(const std::string &ar_word) override;
    std::string GetFilter() const override;
    void SetCalibrationStandard(CxF3CalibrationStandard a_standard, CxF3VerimetraStatus a_status) override;
    CxF3CalibrationStandard GetCalibrationStandard() const override;
    CxF3VerimetraStatus GetVerimetraStatus() const override;
    void SetDeviceSerialNumber(const std::string &ar_serial) override;
    std::string GetDeviceSerialNumber() const override;
    void SetDeviceName(const std::string &ar_name) override;
    std::string GetDeviceName() const override;
    void SetIlluminant(const std::string &ar_word) override;
    std::string GetIlluminant() const override;
    void SetObserver(const std::string &ar_word) override;
    std::string GetObserver() const override;
    void SetStartWL(int a_nm) override;
    int GetStartWL() const override;
    void SetWLIncrement(int a_nm) override;
    int GetWLIncrement() const override;

    // The wrapper; null for a handle made for an unknown id.
    const boost::shared_ptr<CxF3ColorSpecificationWrapper> &GetWrapper() const { return p_wrapper; }

private:
    // The wrapper; throws std::logic_error when the handle refers to none.
    CxF3ColorSpecificationWrapper &p_body() const;

    boost::shared_ptr<CxF3ColorSpecificationWrapper> p_wrapper;
};

#endif // TESSARINE_CXF3COLORSPECIFICATIONWRAPPER_H
