// Tessarine: reads and writes CxF colour exchange files.
//
// Umbrella header. For now it exposes the XML runtime (reader, writer, value
// types); the CxF3 document classes will be added here as they land.
#ifndef TESSARINE_TESSARINE_H
#define TESSARINE_TESSARINE_H

#include <lmx/lmxparse.h>
#include <lmx/lmxtypes.h>

#endif // TESSARINE_TESSARINE_H
