// The body of a CxF3 document: the bound tree that reaches the file and the
// working copies of its parts that the public classes change.
#ifndef TESSARINE_CXF3WRAPPER_H
#define TESSARINE_CXF3WRAPPER_H

#include <tessarine/CxF3.h>

#include "cxf3objectwrapper.h"

#include <cxf/v3/cxf3.h>
#include <cxf/v3/cxf3_colorpage.h>
#include <cxf/v3/cxf3_qualitycontrol.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>

#include <map>
#include <string>
#include <vector>

class CxF3JobWrapper;
class CxF3LumiveraLibraryImpl;
class ICxF3View;

// A named list of object ids, as a colour page keeps it.
struct CxF3Palette {
    std::string name;
    std::vector<std::string> objectIds;
};

class CxF3Wrapper : public boost::enable_shared_from_this<CxF3Wrapper> {
public:
    // An empty document whose creator is the default creator.
    CxF3Wrapper();

    // The creator of documents created from now on.
    static void SetDefaultCreator(const std::string &ar_creator);

    // Rebuilds the working copies and the object list from the tree after a load.
    void SynchroniseAfterLoad();
    // Stamps date and creator and copies the working copies into the tree.
    void PrepareTreeForSave();

    // The extensions in the custom resources: palettes and jobs are read
    // from and written to them; the branded library is only read. An entry
    // is known by the namespace markers in its text, never by its name.
    void ReadExtensions();
    // Each gives true when it added an entry to the custom resources.
    bool WriteColorPage();
    bool WriteQualityControl(); // with the jobs, in cxf3job.cpp
    // Appends a marshalled extension document as a new custom resource
    // entry, without its XML declaration; entries already there stay.
    template <typename T> bool StoreExtension(const T &ar_document) {
        std::string text;
        return ar_document.marshal(text) == lmx::elmx_ok && StoreExtensionText(text);
    }

private:
    bool StoreExtensionText(std::string a_text);
    void ReadPalettes();
    // Rebuilds the jobs from the sets of qualityControl (in cxf3job.cpp).
    void ReadJobs();

public:
    boost::shared_ptr<cc::CxF> root;
    boost::shared_ptr<cc::FileInformation> fileInformation;
    boost::shared_ptr<cc::Resources> resources;
    boost::shared_ptr<cc::ColorSpecificationCollection> colorSpecifications;
    std::vector<boost::shared_ptr<CxF3ObjectWrapper>> objects;
    boost::shared_ptr<cc::CustomResources> customResources;
    boost::shared_ptr<cp::ColorPage> colorPage;
    std::vector<CxF3Palette> palettes;
    boost::shared_ptr<qc::c_QualityControl> qualityControl;
    std::vector<boost::shared_ptr<CxF3JobWrapper>> jobs;
    // Compared by bytes.
    std::map<std::string, boost::shared_ptr<CxF3ObjectWrapper>> objectsById;
    boost::shared_ptr<CxF3LumiveraLibraryImpl> library;
    std::string creator;
};

class CxF3::CxF3Implementation {
public:
    CxF3Implementation() : wrapper(new CxF3Wrapper()) {}

    boost::shared_ptr<CxF3Wrapper> wrapper;
    std::vector<boost::shared_ptr<ICxF3View>> views;
};

#endif // TESSARINE_CXF3WRAPPER_H
