// The branded colour library: read-only handles over the c_Lumivera document
// that a file carried in its custom resources.
#include <tessarine/CxF3.h>
#include <tessarine/CxF3LumiveraLibrary.h>

#include "cxf3lumiverawrapper.h"
#include "cxf3text.h"
#include "cxf3wrapper.h"

#include <locale>

namespace {

// The text content of an optional child element; "" when it is missing.
template <typename T> std::string TextOf(const T *ap_element) {
    return ap_element ? ToNarrow(ap_element->get_value()) : std::string();
}

// The name attribute of an optional child element; "" when it is missing.
template <typename T> std::string NameOf(const T *ap_element) {
    return ap_element ? ToNarrow(ap_element->get_name()) : std::string();
}

// Files spell GUIDs in either case; lowering each byte the way the C locale
// does (A-Z only) lets them compare alike and leaves UTF-8 bytes untouched.
template <typename T> std::string GuidOf(const T *ap_element) {
    std::string guid = TextOf(ap_element);
    std::use_facet<std::ctype<char>>(std::locale::classic()).tolower(guid.data(), guid.data() + guid.size());
    return guid;
}

// The colour seen as const, so that reading a missing child gives null
// instead of creating it.
const c_LVColor &ColorOf(const boost::shared_ptr<CxF3LumiveraColorImpl> &ar_impl) { return ar_impl->color; }

// The object of that id in the document; null when there is none. Ids
// compare by bytes, as in CxF3::GetObjectById.
boost::shared_ptr<CxF3ObjectWrapper> ObjectWithId(const CxF3Wrapper &ar_document, const std::string &ar_id) {
    const auto found = ar_document.objectsById.find(ar_id);
    return found == ar_document.objectsById.end() ? boost::shared_ptr<CxF3ObjectWrapper>() : found->second;
}

boost::shared_ptr<CxF3LumiveraColor> ColorHandle(const c_LVColor &ar_color, const CxF3Wrapper &ar_document) {
    const boost::shared_ptr<CxF3ObjectWrapper> object = ObjectWithId(ar_document, ToNarrow(ar_color.get_ref()));
    return boost::shared_ptr<CxF3LumiveraColor>(
        new CxF3LumiveraColor(boost::shared_ptr<CxF3LumiveraColorImpl>(new CxF3LumiveraColorImpl(ar_color, object))));
}

} // namespace

// ---------------------------------------------------------------- bodies

CxF3LumiveraLibraryImpl::CxF3LumiveraLibraryImpl(const boost::shared_ptr<c_Lumivera> &ar_document,
                                                 const boost::shared_ptr<CxF3Wrapper> &ar_owner)
    : document(ar_document), owner(ar_owner) {}

CxF3LumiveraColorImpl::CxF3LumiveraColorImpl(const c_LVColor &ar_color,
                                             const boost::shared_ptr<CxF3ObjectWrapper> &ar_object)
    : color(ar_color), object(ar_object) {}

// ---------------------------------------------------------------- library

// The handle holds the document strongly: the library body cannot (the
// document holds it), and a handle must stay usable after the CxF3 is gone.
CxF3LumiveraLibrary::CxF3LumiveraLibrary(const boost::shared_ptr<CxF3LumiveraLibraryImpl> &ar_impl)
    : p_impl(ar_impl), p_owner(ar_impl->owner.lock()) {}

// Each colour finds its object now, once: a colour is then of use without
// the document.
const std::vector<boost::shared_ptr<CxF3LumiveraColor>> &CxF3LumiveraLibrary::GetColors() const {
    std::vector<boost::shared_ptr<CxF3LumiveraColor>> &colors = p_impl->colors;
    if (!colors.empty())
        return colors;
    const CxF3Wrapper &document = RequireTarget(p_owner, "CxF3LumiveraLibrary");
    // The non-const accessor makes an empty library element when the tree has none.
    const c_LVLibrary &library = p_impl->document->get_LVLibrary();
    for (std::size_t index = 0; index < library.size_LVColor(); ++index)
        colors.push_back(ColorHandle(library.get_LVColor(index), document));
    return colors;
}

// ---------------------------------------------------------------- colours

CxF3LumiveraColor::CxF3LumiveraColor(const boost::shared_ptr<CxF3LumiveraColorImpl> &ar_impl) : p_impl(ar_impl) {}

// A new handle on the object each time; one that refers to nothing, like
// CxF3::GetObjectById gives, when the document had no object of the reference.
boost::shared_ptr<CxF3Object> CxF3LumiveraColor::GetObject() const {
    return boost::shared_ptr<CxF3Object>(
        new CxF3Object(boost::shared_ptr<CxF3ObjectInterface>(new CxF3ObjectInterface(p_impl->object))));
}

unsigned long CxF3LumiveraColor::GetRevision() const { return ColorOf(p_impl).get_Revision().get_unsigned(); }

std::string CxF3LumiveraColor::GetMasterStandardName() const { return NameOf(ColorOf(p_impl).get_MasterStandard()); }

std::string CxF3LumiveraColor::GetDependentStandardName() const {
    return NameOf(ColorOf(p_impl).get_DependentStandard());
}

std::string CxF3LumiveraColor::GetSubstrateGUID() const { return GuidOf(ColorOf(p_impl).get_Substrate()); }

std::string CxF3LumiveraColor::GetFinishGUID() const { return GuidOf(ColorOf(p_impl).get_Finish()); }

std::string CxF3LumiveraColor::GetPrintingConditionGUID() const {
    return GuidOf(ColorOf(p_impl).get_PrintingCondition());
}

std::string CxF3LumiveraColor::GetWorkflowGUID() const { return GuidOf(ColorOf(p_impl).get_WorkflowRestriction()); }

std::string CxF3LumiveraColor::GetWorkingStandardGUID() const { return GuidOf(ColorOf(p_impl).get_WorkingStandard()); }

// ---------------------------------------------------------------- document

boost::shared_ptr<CxF3LumiveraLibrary> CxF3::GetLumiveraLibrary() const {
    const boost::shared_ptr<CxF3LumiveraLibraryImpl> &library = GetWrapper().library;
    if (!library)
        return boost::shared_ptr<CxF3LumiveraLibrary>();
    return boost::shared_ptr<CxF3LumiveraLibrary>(new CxF3LumiveraLibrary(library));
}
