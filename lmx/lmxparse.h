// Public entry point of the lmx XML runtime: error model, byte sources and
// decoding, entities and the internal DTD, the scanner and the pull reader,
// the member containers and unmarshal driver of bound classes, and the
// writer. Value types and validation have their own entry, lmxtypes.h.
#ifndef LMX_LMXPARSE_H
#define LMX_LMXPARSE_H

#include "lmxerror.h"
#include "lmxrepository.h"
#include "lmxsource.h"
#include "lmxentities.h"
#include "lmxxmlinput.h"
#include "lmxdtd.h"
#include "lmxnamespaces.h"
#include "lmxscanner.h"
#include "lmxreader.h"
#include "lmxcontainers.h"
#include "lmxunmarshal.h"
#include "lmxwriter.h"

#endif
