// CXFTolerance: a tolerance value of six floats in one of eleven modes.
#include <tessarine/CXFTolerance.h>

#include <boost/lexical_cast/bad_lexical_cast.hpp>

#include <cmath>
#include <ios>
#include <sstream>
#include <typeinfo>

namespace {

// A float as boost::lexical_cast<std::string>(float) renders it at the legacy
// boundary: a string stream with skipws unset, precision 7, default notation.
std::string float_text(float a_value) {
    std::ostringstream stream;
    stream.unsetf(std::ios::skipws);
    stream.precision(7);
    if (!(stream << a_value))
        throw boost::bad_lexical_cast(typeid(float), typeid(std::string));
    return stream.str();
}

} // namespace

CXFTolerance::CXFTolerance() : p_values{3.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f}, p_mode(T_DE) {}

CXFTolerance::CXFTolerance(const CXFTolerance &ar_other) : p_values{}, p_mode(T_DE) {
    SetToleranceModus(ar_other.GetToleranceModus());
    const float *p_other = ar_other.GetV();
    SetV(p_other[0], p_other[1], p_other[2], p_other[3], p_other[4], p_other[5]);
}

CXFTolerance::~CXFTolerance() = default;

void CXFTolerance::SetV(float a_v0, float a_v1, float a_v2, float a_v3, float a_v4, float a_v5) {
    p_values[0] = a_v0;
    p_values[1] = a_v1;
    p_values[2] = a_v2;
    p_values[3] = a_v3;
    p_values[4] = a_v4;
    p_values[5] = a_v5;
}

float CXFTolerance::Length() const {
    // The sum of squares in single precision, in order from 0; the root in
    // double of that float, rounded back to float. V3 to V5 never count.
    float sum = 0.0f;
    for (int i = 0; i < 3; ++i) {
        const float square = p_values[i] * p_values[i];
        sum = sum + square;
    }
    return static_cast<float>(std::sqrt(static_cast<double>(sum)));
}

std::string CXFTolerance::GetString() const {
    switch (p_mode) {
    case T_FMC:
        return "FMCII";
    case T_CMC:
        return "CMC " + float_text(p_values[1]) + " : " + float_text(p_values[2]);
    case T_LABMG:
    case T_DEMG:
        return "LABmg";
    case T_DE94:
        return "dE* 94 (" + float_text(p_values[1]) + " : " + float_text(p_values[2]) + " : " +
               float_text(p_values[3]) + ")";
    case T_D:
        return "D";
    case T_CIE_dLCH_Elliptical:
        return "CIELAB LCH";
    case T_LCHmg_Elliptical:
        return "LCHmg";
    case T_DE2000:
        return "dE 2000 (" + float_text(p_values[1]) + " : " + float_text(p_values[2]) + " : " +
               float_text(p_values[3]) + ")";
    default:
        // T_DE, T_LAB and any value outside the enumeration.
        return "CIELAB";
    }
}

std::string CXFTolerance::GetToleranceModusString() const { return GetToleranceModeString(p_mode); }

std::string CXFTolerance::GetToleranceModeString(CXFToleranceModusType a_mode) {
    switch (a_mode) {
    case T_FMC:
        return "T_FMC";
    case T_CMC:
        return "T_CMC";
    case T_LABMG:
        return "T_LABMG";
    case T_DEMG:
        return "T_DEMG";
    case T_DE94:
        return "T_DE94";
    case T_D:
        return "T_D";
    case T_CIE_dLCH_Elliptical:
        return "T_CIE_dLCH_Elliptical";
    case T_LCHmg_Elliptical:
        return "T_LCHmg_Elliptical";
    case T_DE2000:
        return "T_DE2000";
    default:
        return "CIELAB";
    }
}
