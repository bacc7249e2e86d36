// Tessarine: reads and writes CxF colour exchange files.
//
// Umbrella header: the CxF3 document classes (objects, colour specifications,
// recipes, palettes, jobs, the branded library) and the tolerance value. The
// XML runtime is reached through <lmx/lmxparse.h> and <lmx/lmxtypes.h>, the
// bound classes of the CxF3 schemas through <cxf/v3/cxf3.h> and its siblings.
#ifndef TESSARINE_TESSARINE_H
#define TESSARINE_TESSARINE_H

#include <tessarine/CXFTolerance.h>
#include <tessarine/CxF3.h>
#include <tessarine/CxF3ColorRecipe.h>
#include <tessarine/CxF3ColorSpecification.h>
#include <tessarine/CxF3Job.h>
#include <tessarine/CxF3LumiveraLibrary.h>
#include <tessarine/CxF3Object.h>
#include <tessarine/CxF3Types.h>
#include <tessarine/ICxF3View.h>

#endif // TESSARINE_TESSARINE_H
