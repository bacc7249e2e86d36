// The bodies of the branded library handles, built on load from the custom
// resource entry that holds the library document.
#ifndef TESSARINE_CXF3LUMIVERAWRAPPER_H
#define TESSARINE_CXF3LUMIVERAWRAPPER_H

#include <tessarine/CxF3LumiveraLibrary.h>

#include <cxf/v3/cxf3-Lumivera_v1.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <vector>

class CxF3ObjectWrapper;
class CxF3Wrapper;

class CxF3LumiveraLibraryImpl {
public:
    // ar_owner is the document that holds the library. The library refers
    // to it weakly (the document holds the library); CxF3LumiveraLibrary
    // handles hold it strongly.
    CxF3LumiveraLibraryImpl(const boost::shared_ptr<c_Lumivera> &ar_document,
                            const boost::shared_ptr<CxF3Wrapper> &ar_owner);

    boost::shared_ptr<c_Lumivera> document;
    boost::weak_ptr<CxF3Wrapper> owner;
    // Made on the first GetColors.
    std::vector<boost::shared_ptr<CxF3LumiveraColor>> colors;
};

class CxF3LumiveraColorImpl {
public:
    // ar_object is the document's object that the colour refers to, null
    // when the document has none of that id.
    CxF3LumiveraColorImpl(const c_LVColor &ar_color, const boost::shared_ptr<CxF3ObjectWrapper> &ar_object);

    c_LVColor color;
    // The colour keeps its object rather than the document: the document
    // holds the library, whose list holds the colours, so a reference to the
    // document would be a cycle.
    boost::shared_ptr<CxF3ObjectWrapper> object;
};

#endif // TESSARINE_CXF3LUMIVERAWRAPPER_H
