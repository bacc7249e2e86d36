// Palettes: named lists of object ids, kept in a file as a colour page with
// one page per palette and one row per object. Also the document's views.
#include <tessarine/CxF3.h>

#include "cxf3text.h"
#include "cxf3wrapper.h"

const std::string &CxF3::GetTargetTag() { static const std::string word("Target"); return word; }
const std::string &CxF3::GetReferenceTag() { static const std::string word("Standard"); return word; }
const std::string &CxF3::GetTrialTag() { static const std::string word("Trial"); return word; }
const std::string &CxF3::GetSampleTag() { static const std::string word("Sample"); return word; }
const std::string &CxF3::GetTargetsGroupName() { static const std::string word("Targets"); return word; }
const std::string &CxF3::GetReferencesGroupName() { static const std::string word("Standards"); return word; }
const std::string &CxF3::GetTrialsGroupName() { static const std::string word("Trials"); return word; }
const std::string &CxF3::GetSamplesGroupName() { static const std::string word("Samples"); return word; }

namespace {

std::vector<std::string> IdsOf(const CxF3::ObjectList &ar_objects) {
    std::vector<std::string> ids;
    for (const boost::shared_ptr<CxF3Object> &object : ar_objects)
        ids.push_back(object->GetId());
    return ids;
}

// Adds the objects' ids to the first palette of that name, or to a new one.
void MergeUnderName(std::vector<CxF3Palette> &ar_palettes, const std::string &ar_name,
                    const CxF3::ObjectList &ar_objects) {
    const std::vector<std::string> ids = IdsOf(ar_objects);
    for (CxF3Palette &palette : ar_palettes)
        if (palette.name == ar_name) {
            palette.objectIds.insert(palette.objectIds.end(), ids.begin(), ids.end());
            return;
        }
    ar_palettes.push_back(CxF3Palette{ar_name, ids});
}

// Splits the objects by their type as stored into two group palettes; other
// types are left out.
void AddGroupPalettes(std::vector<CxF3Palette> &ar_palettes, const CxF3::ObjectList &ar_objects,
                      const std::string &ar_first_type, const std::string &ar_first_group,
                      const std::string &ar_second_type, const std::string &ar_second_group) {
    CxF3::ObjectList first, second;
    for (const boost::shared_ptr<CxF3Object> &object : ar_objects) {
        const std::string type = object->GetCxFObjectType();
        if (type == ar_first_type)
            first.push_back(object);
        else if (type == ar_second_type)
            second.push_back(object);
    }
    if (!first.empty())
        MergeUnderName(ar_palettes, ar_first_group, first);
    if (!second.empty())
        MergeUnderName(ar_palettes, ar_second_group, second);
}

} // namespace

void CxF3::AddPalette(const std::string &ar_name, ObjectList a_objects) {
    GetWrapper().palettes.push_back(CxF3Palette{ar_name, IdsOf(a_objects)});
}

void CxF3::AddStandardPalette(ObjectList a_objects) {
    AddGroupPalettes(GetWrapper().palettes, a_objects, GetTargetTag(), GetTargetsGroupName(), GetReferenceTag(),
                     GetReferencesGroupName());
}

void CxF3::AddTrialPalette(ObjectList a_objects) {
    AddGroupPalettes(GetWrapper().palettes, a_objects, GetTrialTag(), GetTrialsGroupName(), GetSampleTag(),
                     GetSamplesGroupName());
}

std::vector<std::pair<std::string, CxF3::ObjectList>> CxF3::GetPalettes() const {
    const CxF3Wrapper &document = GetWrapper();
    std::vector<std::pair<std::string, ObjectList>> groups;
    ObjectList all;
    for (const boost::shared_ptr<CxF3ObjectWrapper> &wrapper : document.objects)
        all.push_back(CxF3ObjectInterface::Handle(wrapper));
    if (all.empty())
        return groups;

    const std::string description = ToNarrow(document.fileInformation->get_Description());
    groups.emplace_back(description.empty() ? "Object Collection" : description, all);
    // Every object of each id, so repeated ids give several objects; a
    // palette of unknown ids vanishes.
    for (const CxF3Palette &palette : document.palettes) {
        ObjectList members;
        for (const std::string &id : palette.objectIds)
            for (const boost::shared_ptr<CxF3Object> &object : all)
                if (object->GetId() == id)
                    members.push_back(object);
        if (!members.empty())
            groups.emplace_back(palette.name, members);
    }
    return groups;
}

const std::vector<boost::shared_ptr<ICxF3View>> &CxF3::GetViews() const { return p_implementation->views; }

// ---------------------------------------------------------------- the colour page in the file

void CxF3Wrapper::ReadPalettes() {
    // The page count comes from NumPages, not from the pages present:
    // missing pages read as empty ones.
    const short page_count = colorPage->get_NumPages();
    for (short number = 0; number < page_count; ++number) {
        while (colorPage->size_Page() <= static_cast<std::size_t>(number))
            colorPage->append_Page();
        const cp::Page &page = colorPage->get_Page(static_cast<std::size_t>(number));
        CxF3Palette palette;
        palette.name = ToNarrow(page.get_Name());
        for (std::size_t row = 0; row < page.size_Row(); ++row)
            for (std::size_t obj = 0; obj < page.get_Row(row).size_Obj(); ++obj)
                palette.objectIds.push_back(ToNarrow(page.get_Row(row).get_Obj(obj).get_Id()));
        palettes.push_back(palette);
    }
}

bool CxF3Wrapper::WriteColorPage() {
    if (palettes.empty())
        return false;
    colorPage.reset(new cp::ColorPage());
    colorPage->set_Name(L"Vantry Palettes");
    colorPage->set_NumPages(static_cast<short>(palettes.size()));
    for (const CxF3Palette &palette : palettes) {
        if (palette.objectIds.empty())
            continue;
        cp::Page &page = colorPage->append_Page();
        page.set_Name(ToWide(palette.name));
        page.set_NumRows(static_cast<short>(palette.objectIds.size()));
        for (std::size_t position = 0; position < palette.objectIds.size(); ++position) {
            cp::Row &row = page.append_Row();
            row.set_Name(ToWide("Row" + std::to_string(position + 1)));
            row.set_NumColumns(1);
            row.append_Obj().set_Id(ToWide(palette.objectIds[position]));
        }
    }
    return colorPage->size_Page() > 0 && colorPage->is_occurs_ok() && StoreExtension(*colorPage);
}
