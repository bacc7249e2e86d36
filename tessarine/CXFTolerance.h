// CXFTolerance: one tolerance of a colour standard, in one of eleven modes,
// with up to six values whose sense depends on the mode.
#ifndef TESSARINE_CXFTOLERANCE_H
#define TESSARINE_CXFTOLERANCE_H

#include <string>

// The tolerance modes. The values are stored in files and must not change.
enum CXFToleranceModusType : int {
    T_DE = 0,                  // CIELAB dE limit (V0)
    T_LAB = 1,                 // CIELAB box: dL, da, db, -dL, -da, -db
    T_FMC = 2,                 // FMC II limit (V0)
    T_CMC = 3,                 // CMC limit V0 with l = V1, c = V2
    T_LABMG = 4,               // LABmg box: dL, da, db, -dL, -da, -db
    T_DEMG = 5,                // LABmg limit (V0)
    T_DE94 = 6,                // dE*94 limit V0 with l, c, h = V1, V2, V3
    T_D = 7,                   // density limit (V0)
    T_CIE_dLCH_Elliptical = 8, // LCh box: dL, dC, dH, -dL, -dC, -dH
    T_LCHmg_Elliptical = 9,    // LChmg box: dL, dC, dH, -dL, -dC, -dH
    T_DE2000 = 10              // dE 2000 limit V0 with l, c, h = V1, V2, V3
};

class CXFTolerance {
public:
    // A limit of 3.0 in mode T_DE.
    CXFTolerance();
    CXFTolerance(const CXFTolerance &ar_other);
    CXFTolerance &operator=(const CXFTolerance &ar_other) = default;
    virtual ~CXFTolerance();

    // Unchecked access to V0 .. V5.
    float operator[](unsigned short a_index) const { return p_values[a_index]; }
    float &operator[](unsigned short a_index) { return p_values[a_index]; }
    const float *GetV() const { return p_values; }
    float *GetV() { return p_values; }

    void SetV(float a_v0, float a_v1, float a_v2, float a_v3, float a_v4, float a_v5);
    void SetV0(float a_value) { p_values[0] = a_value; }
    void SetV1(float a_value) { p_values[1] = a_value; }
    void SetV2(float a_value) { p_values[2] = a_value; }
    void SetV3(float a_value) { p_values[3] = a_value; }
    void SetV4(float a_value) { p_values[4] = a_value; }
    void SetV5(float a_value) { p_values[5] = a_value; }

    void SetToleranceModus(CXFToleranceModusType a_mode) { p_mode = a_mode; }
    CXFToleranceModusType GetToleranceModus() const { return p_mode; }

    // The length of (V0, V1, V2), whatever the mode.
    float Length() const;
    // The human-readable description, e.g. "CMC 2 : 1".
    std::string GetString() const;
    // The keyword of this tolerance's mode, e.g. "T_CMC".
    std::string GetToleranceModusString() const;
    // The keyword of a mode; "CIELAB" for modes 0, 1 and any value outside 2..10.
    static std::string GetToleranceModeString(CXFToleranceModusType a_mode);

private:
    float p_values[6];
    CXFToleranceModusType p_mode;
};

#endif // TESSARINE_CXFTOLERANCE_H
