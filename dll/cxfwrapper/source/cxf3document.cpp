#include <tessarine/CxF3.h>

#include "cxf3colorspecificationwrapper.h"
#include "cxf3text.h"
#include "cxf3wrapper.h"

#include <lmx/lmxparse.h>

#include <cctype>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace {

// The extension is lower-cased from the last dot of the whole path, so a dot
// in a folder name counts too; a path without a dot gets ".cxf".
std::string NormaliseSavePath(std::string a_path) {
    const std::size_t dot = a_path.rfind('.');
    if (a_path.empty() || dot == std::string::npos)
        return a_path + ".cxf";
    for (std::size_t index = dot; index < a_path.size(); ++index)
        a_path[index] = static_cast<char>(std::tolower(static_cast<unsigned char>(a_path[index])));
    return a_path;
}

// The observer text up to its last degree sign: "2°" gives "2".
std::string ObserverForId(const std::string &ar_observer) {
    const std::size_t degree = ar_observer.rfind("\xC2\xB0");
    return degree == std::string::npos ? ar_observer : ar_observer.substr(0, degree);
}

// The calibration standard as stored, up to its first comma.
std::string CalibrationForId(const CxF3ColorSpecificationWrapper &ar_wrapper) {
    const std::string stored = ToNarrow(ar_wrapper.measurementSpec->get_CalibrationStandard());
    return stored.substr(0, stored.find(','));
}

const char *VerimetraMarkForId(CxF3VerimetraStatus a_status) {
    switch (a_status) {
    case CxF3VerimetraDisabled:
        return "VT-";
    case CxF3VerimetraExpired:
        return "VTexp";
    case CxF3VerimetraActive:
        return "VT";
    }
    return "";
}

// "CS", device, serial number, filter, "-", calibration unless "KLMB",
// verification mark, illuminant, "-", observer: e.g. "CSdevice1234M1-VT-D50-2".
std::string GenerateSpecificationId(const CxF3ColorSpecificationInterface &ar_specification) {
    std::string calibration = CalibrationForId(*ar_specification.GetWrapper());
    if (calibration == "KLMB")
        calibration.clear();
    return "CS" + ar_specification.GetDeviceName() + ar_specification.GetDeviceSerialNumber() +
           ar_specification.GetFilter() + "-" + calibration + VerimetraMarkForId(ar_specification.GetVerimetraStatus()) +
           ar_specification.GetIlluminant() + "-" + ObserverForId(ar_specification.GetObserver());
}

const CxF3ColorSpecificationInterface &SpecificationBody(const boost::shared_ptr<CxF3ColorSpecification> &ar_handle) {
    const auto *body = dynamic_cast<const CxF3ColorSpecificationInterface *>(ar_handle.get());
    if (!body || !body->GetWrapper())
        throw std::logic_error("CxF3ColorSpecification: the handle refers to nothing (unknown id)");
    return *body;
}

} // namespace

CxF3::CxF3(const boost::shared_ptr<CxF3Implementation> &ar_implementation) : p_implementation(ar_implementation) {}

CxF3::~CxF3() = default;

boost::shared_ptr<CxF3> CxF3::CreateCxF() {
    return boost::shared_ptr<CxF3>(new CxF3(boost::shared_ptr<CxF3Implementation>(new CxF3Implementation())));
}

void CxF3::SetDefaultCreator(const std::string &ar_creator) { CxF3Wrapper::SetDefaultCreator(ar_creator); }

CxF3Wrapper &CxF3::GetWrapper() const { return *p_implementation->wrapper; }

// ---------------------------------------------------------------- file information

void CxF3::SetCreator(const std::string &ar_creator) {
    CxF3Wrapper &document = GetWrapper();
    document.creator = ar_creator;
    document.fileInformation->set_Creator(ToWide(ar_creator));
}

void CxF3::SetFileInformationDescription(const std::string &ar_description) {
    GetWrapper().fileInformation->set_Description(ToWide(ar_description));
}

std::string CxF3::GetFileInformationTag(const std::string &ar_name) const {
    const cc::FileInformation &information = *GetWrapper().fileInformation;
    const std::wstring name = ToWide(ar_name);
    for (std::size_t index = 0; index < information.size_Tag(); ++index)
        if (information.get_Tag(index).get_Name() == name)
            return ToNarrow(information.get_Tag(index).get_Value());
    return "";
}

bool CxF3::AddFileInformationTag(const std::string &ar_name, const std::string &ar_value) {
    cc::Tag tag;
    tag.set_Name(ToWide(ar_name));
    tag.set_Value(ToWide(ar_value));
    if (!tag.is_occurs_ok())
        return false;
    GetWrapper().fileInformation->append_Tag(tag);
    return true;
}

// ---------------------------------------------------------------- objects

bool CxF3::AddObject(const boost::shared_ptr<CxF3Object> &ar_object) {
    CxF3Wrapper &document = GetWrapper();
    const boost::shared_ptr<CxF3ObjectWrapper> &wrapper =
        RequireTarget(ar_object, "CxF3Object").GetInterface()->wrapper;
    cc::Object &object = *RequireTarget(wrapper, "CxF3Object").object;

    // Ids are numbered from the list size, with no test for collisions.
    const std::string id = "O" + std::to_string(document.objects.size() + 1);
    object.set_Id(ToWide(id));
    object.set_CreationDate(CurrentUtcDateTime());
    wrapper->CopyValuesIntoObject();
    if (!object.is_occurs_ok())
        return false;
    document.objects.push_back(wrapper);
    document.objectsById[id] = wrapper;
    return true;
}

const std::vector<boost::shared_ptr<CxF3Object>> &CxF3::GetObjects() {
    if (p_objects.empty())
        for (const boost::shared_ptr<CxF3ObjectWrapper> &wrapper : GetWrapper().objects)
            p_objects.push_back(CxF3ObjectInterface::Handle(wrapper));
    return p_objects;
}

boost::shared_ptr<CxF3Object> CxF3::GetObjectById(const std::string &ar_id) const {
    const auto &by_id = GetWrapper().objectsById;
    const auto found = by_id.find(ar_id);
    return CxF3ObjectInterface::Handle(found == by_id.end() ? boost::shared_ptr<CxF3ObjectWrapper>() : found->second);
}

// ---------------------------------------------------------------- colour specifications

std::string CxF3::AddColorSpecification(const boost::shared_ptr<CxF3ColorSpecification> &ar_specification,
                                        bool a_generate_id) {
    const CxF3ColorSpecificationInterface &body = SpecificationBody(ar_specification);
    const std::string id = a_generate_id ? GenerateSpecificationId(body) : body.GetId();

    // The id is the sole identity: a specification with a known id is not added again.
    if (IsExistingColorSpecification(id))
        return id;
    CxF3ColorSpecificationWrapper &wrapper = *body.GetWrapper();
    cc::ColorSpecification &specification = *wrapper.specification;
    specification.set_Id(ToWide(id));
    specification.assign_MeasurementSpec(*wrapper.measurementSpec);
    if (wrapper.tristimulusSpec->is_occurs_ok())
        specification.assign_TristimulusSpec(*wrapper.tristimulusSpec);
    GetWrapper().colorSpecifications->append_ColorSpecification(specification);
    return id;
}

bool CxF3::IsExistingColorSpecification(const std::string &ar_id) const {
    const cc::ColorSpecificationCollection &collection = *GetWrapper().colorSpecifications;
    const std::wstring id = ToWide(ar_id);
    for (std::size_t index = 0; index < collection.size_ColorSpecification(); ++index)
        if (collection.get_ColorSpecification(index).get_Id() == id)
            return true;
    return false;
}

boost::shared_ptr<CxF3ColorSpecification> CxF3::GetColorSpecification(const std::string &ar_id) const {
    const cc::ColorSpecificationCollection &collection = *GetWrapper().colorSpecifications;
    const std::wstring id = ToWide(ar_id);
    boost::shared_ptr<CxF3ColorSpecificationWrapper> wrapper;
    for (std::size_t index = 0; index < collection.size_ColorSpecification() && !wrapper; ++index)
        if (collection.get_ColorSpecification(index).get_Id() == id)
            wrapper.reset(new CxF3ColorSpecificationWrapper(collection.get_ColorSpecification(index)));
    return boost::shared_ptr<CxF3ColorSpecification>(new CxF3ColorSpecificationInterface(wrapper));
}

std::vector<boost::shared_ptr<CxF3ColorSpecification>> CxF3::GetColorSpecifications() {
    if (p_specifications.empty()) {
        const cc::ColorSpecificationCollection &collection = *GetWrapper().colorSpecifications;
        for (std::size_t index = 0; index < collection.size_ColorSpecification(); ++index)
            p_specifications.push_back(
                GetColorSpecification(ToNarrow(collection.get_ColorSpecification(index).get_Id())));
    }
    return p_specifications;
}

// ---------------------------------------------------------------- load and save

bool CxF3::LoadCxF(const std::string &ar_path) {
    try {
        CxF3Wrapper &document = GetWrapper();
        if (document.root->loadFile(ar_path.c_str()) != lmx::elmx_ok)
            return false;
        document.SynchroniseAfterLoad();
        return true;
    } catch (const std::exception &) {
        return false;
    }
}

void CxF3::LoadFromStream(std::stringstream &ar_stream) {
    CxF3Wrapper &document = GetWrapper();
    const std::string text = ar_stream.str();
    const lmx::elmx_error error = document.root->unmarshal(text.data(), text.size());
    if (error != lmx::elmx_ok)
        throw std::runtime_error("Error loading CxF (Error code: " + std::to_string(error) + ")");
    document.SynchroniseAfterLoad();
}

bool CxF3::SaveCxF(const std::string &ar_path) {
    CxF3Wrapper &document = GetWrapper();
    document.PrepareTreeForSave();
    return document.root->writeFile(ToWide(NormaliseSavePath(ar_path))) == lmx::elmx_ok;
}

std::string CxF3::SaveToStream() {
    std::string folder;
    try {
        folder = std::filesystem::temp_directory_path().u8string();
    } catch (const std::filesystem::filesystem_error &) {
    }
    if (folder.empty() || folder.size() >= 1024)
        throw std::runtime_error("Error getting temporary path");
    const std::filesystem::path path = std::filesystem::u8path(folder) / "cxf3.cxf";
    if (!SaveCxF(path.u8string()))
        return "";
    std::string text;
    {
        std::ifstream file(path, std::ios::in | std::ios::binary);
        if (file)
            text.assign(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
    }
    std::error_code ignored;
    std::filesystem::remove(path, ignored);
    return text;
}

// ---------------------------------------------------------------- file recognition

bool CxF3::IsValidFile(const std::string &ar_path) {
    lmx::c_xml_reader_file reader(ar_path.c_str());
    if (!reader.is_open())
        return false;
    reader.set_ns_map(cc::ns_map_reader());
    std::string name;
    lmx::elmx_error error = lmx::elmx_ok;
    reader.get_element_event(&error, &name);
    if (error != lmx::elmx_ok) {
        reader.capture_error(error, name, __FILE__, __LINE__);
        return false;
    }
    // The core namespace is the first user namespace the reader numbers.
    if (reader.get_current_event() != lmx::xe_name || reader.get_element_ns_id() != 1000 ||
        reader.get_local_name() != "CxF") {
        reader.capture_error(lmx::elmx_element_not_found, name, __FILE__, __LINE__);
        return false;
    }
    return true;
}
