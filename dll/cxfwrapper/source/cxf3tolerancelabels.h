// The labels under which the tolerance modes without an element of their own
// are stored (as custom deltas on objects, custom tolerances in jobs).
#ifndef TESSARINE_CXF3TOLERANCELABELS_H
#define TESSARINE_CXF3TOLERANCELABELS_H

#include <tessarine/CXFTolerance.h>

#include <vector>

// One label for a limit, three for a box; none for the modes that have an
// element of their own.
inline std::vector<const wchar_t *> CustomToleranceLabels(CXFToleranceModusType a_mode) {
    switch (a_mode) {
    case T_FMC:
        return {L"dE_FMC"};
    case T_DEMG:
        return {L"dEmg"};
    case T_D:
        return {L"dDensity"};
    case T_LABMG:
        return {L"dLmg", L"damg", L"dbmg"};
    case T_LCHmg_Elliptical:
        return {L"dLmg", L"dCmg", L"dHmg"};
    default:
        return {};
    }
}

#endif // TESSARINE_CXF3TOLERANCELABELS_H
