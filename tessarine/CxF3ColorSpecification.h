// CxF3ColorSpecification: how a set of values was measured (device, filter
// condition, illuminant, observer, wavelength range, calibration), as one
// cc:ColorSpecification. Measurement conditions are spoken of in short words:
// "M0" to "M3" for single-angle filters, "D8i", "D8e", "D8t" for spheres.
#ifndef TESSARINE_CXF3COLORSPECIFICATION_H
#define TESSARINE_CXF3COLORSPECIFICATION_H

#include <tessarine/CxF3Types.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

class CxF3ColorSpecification {
public:
    // Spectral reflectance from 380 nm in steps of 10 nm, method "E308_Table6".
    static boost::shared_ptr<CxF3ColorSpecification> CreateCxFColorSpecification();

    // "KLMB", ... "DCI"; "" for an unknown value.
    static std::string GetCalibrationStandardString(CxF3CalibrationStandard a_standard);
    // "Verimetra_Expired", "Verimetra"; "" for disabled and anything else.
    static std::string GetVerimetraStandardString(CxF3VerimetraStatus a_status);
    // The first part that names a standard; CxF3CalibrationUnknown when none does.
    static CxF3CalibrationStandard CalibrationStandardFromString(const std::vector<std::string> &ar_parts);
    // The first part that names a status; CxF3VerimetraDisabled when none does.
    static CxF3VerimetraStatus VerimetraStatusFromString(const std::vector<std::string> &ar_parts);

    virtual ~CxF3ColorSpecification() = default;

    virtual void SetId(const std::string &ar_id) = 0;
    virtual std::string GetId() const = 0;
    virtual CxF3MeasurementType GetMeasurementType() const = 0;
    // Sets geometry, illumination, polarisation and filter from a condition word.
    virtual void SetFilter(const std::string &ar_word) = 0;
    // The condition word; throws std::runtime_error for a measurement type
    // other than reflectance and transmittance.
    virtual std::string GetFilter() const = 0;
    // Writes "standard,status"; nothing when both texts are empty.
    virtual void SetCalibrationStandard(CxF3CalibrationStandard a_standard, CxF3VerimetraStatus a_status) = 0;
    virtual CxF3CalibrationStandard GetCalibrationStandard() const = 0;
    virtual CxF3VerimetraStatus GetVerimetraStatus() const = 0;
    // An empty text leaves the stored value.
    virtual void SetDeviceSerialNumber(const std::string &ar_serial) = 0;
    virtual std::string GetDeviceSerialNumber() const = 0;
    // An empty text leaves the stored value.
    virtual void SetDeviceName(const std::string &ar_name) = 0;
    virtual std::string GetDeviceName() const = 0;
    // "A", "C", "D50" .. "D75", "F2"/"FL2" .. "F12"/"FL12"; anything else is "Custom".
    virtual void SetIlluminant(const std::string &ar_word) = 0;
    virtual std::string GetIlluminant() const = 0;
    // "2", "2°", "10", "10°"; anything else is a custom observer.
    virtual void SetObserver(const std::string &ar_word) = 0;
    virtual std::string GetObserver() const = 0;
    virtual void SetStartWL(int a_nm) = 0;
    virtual int GetStartWL() const = 0;
    virtual void SetWLIncrement(int a_nm) = 0;
    virtual int GetWLIncrement() const = 0;
};

#endif // TESSARINE_CXF3COLORSPECIFICATION_H
