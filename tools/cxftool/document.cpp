#include "tools/cxftool/document.h"

// The body of the document, for its bound tree and for the branded
// library's name, which the public classes do not give.
#include "dll/cxfwrapper/source/cxf3lumiverawrapper.h"
#include "dll/cxfwrapper/source/cxf3text.h"
#include "dll/cxfwrapper/source/cxf3wrapper.h"

#include <lmx/lmxerror.h>

namespace cxftool {

namespace {

std::string ErrorReport(lmx::elmx_error a_code, const lmx::s_debug_error &ar_debug) {
    const std::string code_line = "Error code: " + std::to_string(static_cast<int>(a_code)) + "\n";
    // A file that cannot be opened leaves the reader's report empty.
    if (ar_debug.error == lmx::elmx_ok)
        return code_line + "Error: " + lmx::get_error_description(a_code) + "\n";
    return code_line + ar_debug.to_string();
}

} // namespace

bool LoadFile(const std::string &ar_path, LoadedFile &ar_file, std::string &ar_error) {
    ar_file.document = CxF3::CreateCxF();
    if (ar_file.document->LoadCxF(ar_path))
        return true;
    // The document says only that it failed; the binding says where.
    cc::CxF tree;
    lmx::s_debug_error debug;
    const lmx::elmx_error code = tree.unmarshal(ar_path.c_str(), &debug);
    ar_error = code != lmx::elmx_ok ? ErrorReport(code, debug) : "The document classes could not read the file.\n";
    return false;
}

bool LoadFileOrComplain(const std::string &ar_command, const std::string &ar_path, LoadedFile &ar_file,
                        std::ostream &ar_err) {
    std::string error;
    if (LoadFile(ar_path, ar_file, error))
        return true;
    ar_err << "cxftool " << ar_command << ": cannot read " << ar_path << "\n" << error;
    return false;
}

std::vector<Palette> PalettesOf(const CxF3 &ar_document) {
    std::vector<Palette> palettes = ar_document.GetPalettes();
    // A document without objects gives no groups at all.
    if (!palettes.empty())
        palettes.erase(palettes.begin());
    return palettes;
}

std::string BrandedLibraryName(const CxF3 &ar_document) {
    const boost::shared_ptr<CxF3LumiveraLibraryImpl> &library = ar_document.GetWrapper().library;
    if (!library)
        return std::string();
    // The const accessor gives null for a missing element instead of making one.
    const c_Lumivera &branded = *library->document;
    const c_LVLibrary *p_library = branded.get_LVLibrary();
    return p_library ? ToNarrow(p_library->get_name()) : std::string();
}

const cc::CxF &BoundTree(const CxF3 &ar_document) { return *ar_document.GetWrapper().root; }

} // namespace cxftool
