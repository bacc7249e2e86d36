// The branded colour library a CxF3 file can carry in its custom resources,
// read on load: CxF3LumiveraLibrary with its CxF3LumiveraColor list. Each
// colour links to an object of the document. The library is read-only.
#ifndef TESSARINE_CXF3LUMIVERALIBRARY_H
#define TESSARINE_CXF3LUMIVERALIBRARY_H

#include <tessarine/CxF3Object.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

class CxF3LumiveraLibraryImpl;
class CxF3LumiveraColorImpl;
class CxF3Wrapper;

class CxF3LumiveraColor {
public:
    explicit CxF3LumiveraColor(const boost::shared_ptr<CxF3LumiveraColorImpl> &ar_impl);

    // The object the colour refers to, found when GetColors made the colour;
    // a handle that refers to nothing when the document had no object of
    // that id. The colour keeps its object, not the whole document.
    boost::shared_ptr<CxF3Object> GetObject() const;
    unsigned long GetRevision() const;
    std::string GetMasterStandardName() const;
    std::string GetDependentStandardName() const;
    // GUIDs in lower case, whatever the file's spelling.
    std::string GetSubstrateGUID() const;
    std::string GetFinishGUID() const;
    std::string GetPrintingConditionGUID() const;
    std::string GetWorkflowGUID() const;
    std::string GetWorkingStandardGUID() const;

private:
    boost::shared_ptr<CxF3LumiveraColorImpl> p_impl;
};

class CxF3LumiveraLibrary {
public:
    explicit CxF3LumiveraLibrary(const boost::shared_ptr<CxF3LumiveraLibraryImpl> &ar_impl);

    // The colours in file order; made on the first call.
    const std::vector<boost::shared_ptr<CxF3LumiveraColor>> &GetColors() const;

private:
    boost::shared_ptr<CxF3LumiveraLibraryImpl> p_impl;
    // Keeps the document alive while the handle lives: the colours find
    // their objects in it.
    boost::shared_ptr<CxF3Wrapper> p_owner;
};

#endif // TESSARINE_CXF3LUMIVERALIBRARY_H
