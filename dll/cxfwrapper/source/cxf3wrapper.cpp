#include "cxf3wrapper.h"

#include "cxf3lumiverawrapper.h"
#include "cxf3text.h"

#include <lmx/lmxparse.h>

namespace {

// The default creator of new documents; changed only by SetDefaultCreator.
std::string &DefaultCreator() {
    static std::string creator;
    return creator;
}

// The XML declaration that marshalling a document always puts first:
// `<?xml version="1.0" encoding="UTF-8"?>`. Custom resource entries are
// stored without it.
const std::size_t k_xml_declaration_length = 38;

} // namespace

CxF3Wrapper::CxF3Wrapper()
    : root(new cc::CxF()), fileInformation(new cc::FileInformation()), resources(new cc::Resources()),
      colorSpecifications(new cc::ColorSpecificationCollection()), customResources(new cc::CustomResources()),
      creator(DefaultCreator()) {}

void CxF3Wrapper::SetDefaultCreator(const std::string &ar_creator) {
    std::string &creator = DefaultCreator();
    if (&ar_creator != &creator)
        creator = ar_creator;
}

void CxF3Wrapper::SynchroniseAfterLoad() {
    fileInformation.reset(new cc::FileInformation(root->get_FileInformation()));

    // Ids of an earlier load stay in the map unless an object of this file
    // takes them over; the working resources are kept as they were.
    cc::ObjectCollection &loaded = root->get_Resources().get_ObjectCollection();
    objects.clear();
    for (std::size_t index = 0; index < loaded.size_Object(); ++index) {
        boost::shared_ptr<CxF3ObjectWrapper> wrapper(new CxF3ObjectWrapper(loaded.get_Object(index)));
        objects.push_back(wrapper);
        objectsById[ToNarrow(wrapper->object->get_Id())] = wrapper;
    }

    colorSpecifications.reset(
        new cc::ColorSpecificationCollection(root->get_Resources().get_ColorSpecificationCollection()));
    customResources.reset(new cc::CustomResources(root->get_CustomResources()));
    ReadExtensions();
}

void CxF3Wrapper::PrepareTreeForSave() {
    fileInformation->set_CreationDate(CurrentUtcDateTime());
    fileInformation->set_Creator(ToWide(creator));
    root->assign_FileInformation(*fileInformation);

    if (colorSpecifications->size_ColorSpecification() > 0)
        resources->assign_ColorSpecificationCollection(*colorSpecifications);

    // Each object keeps its own index, so an object that lacks a required
    // part leaves a default entry in its place.
    cc::ObjectCollection collection;
    for (std::size_t index = 0; index < objects.size(); ++index) {
        const cc::Object &object = *objects[index]->object;
        if (!object.is_occurs_ok())
            continue;
        while (collection.size_Object() < index)
            collection.append_Object();
        collection.append_Object(object);
    }
    if (collection.size_Object() > 0)
        resources->assign_ObjectCollection(collection);
    root->assign_Resources(*resources);

    const bool wrote_color_page = WriteColorPage();
    const bool wrote_quality_control = WriteQualityControl();
    if (wrote_color_page || wrote_quality_control)
        root->assign_CustomResources(*customResources);
}

bool CxF3Wrapper::StoreExtensionText(std::string a_text) {
    a_text.erase(0, k_xml_declaration_length);
    lmx::c_any_info xml;
    xml.set_value(a_text);
    cc::inner_CustomResources entry;
    entry.reset();
    entry.set_any(xml);
    if (!entry.is_occurs_ok())
        return false;
    customResources->append_inner_CustomResources(entry);
    return true;
}

void CxF3Wrapper::ReadExtensions() {
    palettes.clear();
    jobs.clear();
    for (std::size_t index = 0; index < customResources->size_inner_CustomResources(); ++index) {
        std::string text;
        customResources->get_inner_CustomResources(index).get_any(nullptr, nullptr, text);
        if (text.find("CxF3-colorpage") != std::string::npos) {
            colorPage.reset(new cp::ColorPage());
            if (colorPage->unmarshal(text.data(), text.size()) == lmx::elmx_ok)
                ReadPalettes();
        }
        // Fandecks need no reading of their own: one is read as the colour
        // page that it also is.
        if (text.find("CxF3-qualitycontrol") != std::string::npos) {
            qualityControl.reset(new qc::c_QualityControl());
            if (qualityControl->unmarshal(text.data(), text.size()) == lmx::elmx_ok)
                ReadJobs();
        }
        if (text.find("CxF3-Lumivera_V1") != std::string::npos) {
            boost::shared_ptr<c_Lumivera> branded(new c_Lumivera());
            if (branded->unmarshal(text.data(), text.size()) == lmx::elmx_ok)
                library.reset(new CxF3LumiveraLibraryImpl(branded, shared_from_this()));
        }
    }
}
