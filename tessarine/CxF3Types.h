// Enumerations shared by the CxF3 document classes. Their numeric values are
// part of the interface.
#ifndef TESSARINE_CXF3TYPES_H
#define TESSARINE_CXF3TYPES_H

// What an object is. A file's "Standard" reads as a target and "Sample" as a trial.
enum CxF3ObjectType : int {
    CxF3ObjectTarget = 0,
    CxF3ObjectTrial = 1,
    CxF3ObjectSubstrate = 2,
    CxF3ObjectColorant = 3,
    CxF3ObjectLumivera = 4, // a standard of the branded colour library
    CxF3ObjectUnknown = 5
};

enum CxF3SubstrateType : int {
    CxF3SubstrateFilm = 0,
    CxF3SubstratePaper = 1,
    CxF3SubstrateNone = 2 // no substrate type stored
};

enum CxF3MeasurementType : int {
    CxF3MeasurementOther = 0,
    CxF3MeasurementSpectral = 1,     // spectral reflectance or transmittance
    CxF3MeasurementColorimetric = 2  // colorimetric reflectance
};

// The calibration standard of an instrument, stored as its text ("KLMB", ...).
enum CxF3CalibrationStandard : int {
    CxF3CalibrationKLMB = 0,
    CxF3CalibrationKLMA = 1,
    CxF3CalibrationKLME = 2,
    CxF3CalibrationKLMD = 3,
    CxF3CalibrationKLMC = 4,
    CxF3CalibrationNIST = 5,
    CxF3CalibrationDCI = 6,
    CxF3CalibrationUnknown = 10
};

// Verification state of an instrument's calibration.
enum CxF3VerimetraStatus : int {
    CxF3VerimetraDisabled = 0,
    CxF3VerimetraExpired = 1,
    CxF3VerimetraActive = 2
};

#endif // TESSARINE_CXF3TYPES_H
