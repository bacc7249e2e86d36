// Reading a file for the commands.
//
// The document classes (CxF3 and its parts) answer for the objects, the
// colour specifications, the palettes, the jobs and the branded colour
// library. The file information (creator, date, description, tags) and the
// kinds of values an object holds are not shown by those classes, so the
// commands also look into the bound tree of <cxf/v3/cxf3.h> that the
// document holds (BoundTree). The name of the branded library is read from
// the document's body too (BrandedLibraryName).
#ifndef TESSARINE_TOOLS_CXFTOOL_DOCUMENT_H
#define TESSARINE_TOOLS_CXFTOOL_DOCUMENT_H

#include <tessarine/CxF3.h>

#include <cxf/v3/cxf3.h>

#include <boost/shared_ptr.hpp>

#include <ostream>
#include <string>
#include <utility>
#include <vector>

namespace cxftool {

struct LoadedFile {
    boost::shared_ptr<CxF3> document;
};

// Reads the file into a document. False when it cannot, with the reason in
// ar_error: the runtime's report (code, item, XML line), for which the file
// is read once more, through the binding alone.
bool LoadFile(const std::string &ar_path, LoadedFile &ar_file, std::string &ar_error);
// LoadFile for a command that needs the file: when it cannot be read, says
// so on ar_err ("cxftool COMMAND: cannot read FILE" and the reason).
bool LoadFileOrComplain(const std::string &ar_command, const std::string &ar_path, LoadedFile &ar_file,
                        std::ostream &ar_err);

// A palette: its name and its objects, in its order.
using Palette = std::pair<std::string, CxF3::ObjectList>;

// The palettes of the document, in its order. CxF3::GetPalettes gives the
// group of all objects first; that group is not a palette and is left out.
// Palettes may share a name.
std::vector<Palette> PalettesOf(const CxF3 &ar_document);

// The name of the branded colour library the file carries; "" when it has
// none, or when its library element or name is missing.
std::string BrandedLibraryName(const CxF3 &ar_document);

// The bound tree the document was read into.
const cc::CxF &BoundTree(const CxF3 &ar_document);

} // namespace cxftool

#endif // TESSARINE_TOOLS_CXFTOOL_DOCUMENT_H
