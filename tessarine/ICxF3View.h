// ICxF3View: the place for arrangements of a document's objects. A document
// keeps a list of views (CxF3::GetViews); nothing in the library fills it.
#ifndef TESSARINE_ICXF3VIEW_H
#define TESSARINE_ICXF3VIEW_H

class ICxF3View {
public:
    virtual ~ICxF3View() = default;
};

#endif // TESSARINE_ICXF3VIEW_H
