// CxF3: a CxF version 3 document. Load it from a file or text, read and
// change its objects and colour specifications, and save it.
//
// GetObjects and GetColorSpecifications fill a list the first time they find
// it empty and give that same list afterwards: objects added or loaded later
// show only in a document whose list was still empty.
#ifndef TESSARINE_CXF3_H
#define TESSARINE_CXF3_H

#include <tessarine/CxF3ColorSpecification.h>
#include <tessarine/CxF3Job.h>
#include <tessarine/CxF3LumiveraLibrary.h>
#include <tessarine/CxF3Object.h>
#include <tessarine/ICxF3View.h>

#include <boost/shared_ptr.hpp>

#include <sstream>
#include <string>
#include <utility>
#include <vector>

class CxF3Wrapper;

class CxF3 {
public:
    class CxF3Implementation;

    // A new, empty document whose creator is the default creator.
    static boost::shared_ptr<CxF3> CreateCxF();
    // Whether the file's root element is cc:CxF; the rest is not looked at.
    static bool IsValidFile(const std::string &ar_path);
    // The creator of documents created afterwards.
    static void SetDefaultCreator(const std::string &ar_creator);

    ~CxF3();

    // Fills this document from a file; false when it cannot be read.
    bool LoadCxF(const std::string &ar_path);
    // Fills this document from XML text; throws std::runtime_error
    // "Error loading CxF (Error code: N)" when it cannot be read.
    void LoadFromStream(std::stringstream &ar_stream);
    // Stamps date and creator and writes the file; a path without an
    // extension gets ".cxf", and the extension is lower-cased. False when the
    // file cannot be written, in which case a previous file stays as it was.
    bool SaveCxF(const std::string &ar_path);
    // The whole file text, saved through a temporary file; "" on failure.
    std::string SaveToStream();

    // The creator written by every save; also set on the file information now.
    void SetCreator(const std::string &ar_creator);
    void SetFileInformationDescription(const std::string &ar_description);
    // The value of the first file tag of that name; "" when there is none.
    std::string GetFileInformationTag(const std::string &ar_name) const;
    bool AddFileInformationTag(const std::string &ar_name, const std::string &ar_value);

    // Gives the object the next id ("O" and the number of objects + 1) and
    // the current time as creation date, copies its values in and adds it.
    // False when the object lacks a required part.
    bool AddObject(const boost::shared_ptr<CxF3Object> &ar_object);
    const std::vector<boost::shared_ptr<CxF3Object>> &GetObjects();
    // A handle that refers to no object when the id is unknown.
    boost::shared_ptr<CxF3Object> GetObjectById(const std::string &ar_id) const;

    // Adds a copy of the specification unless one with its id is there, and
    // gives the id. With a_generate_id the id is built from device, serial
    // number, filter, calibration, illuminant and observer.
    std::string AddColorSpecification(const boost::shared_ptr<CxF3ColorSpecification> &ar_specification,
                                      bool a_generate_id);
    bool IsExistingColorSpecification(const std::string &ar_id) const;
    // A copy of the specification; a handle that refers to none when the id is unknown.
    boost::shared_ptr<CxF3ColorSpecification> GetColorSpecification(const std::string &ar_id) const;
    std::vector<boost::shared_ptr<CxF3ColorSpecification>> GetColorSpecifications();

    // ---- Palettes: named lists of objects, kept in a colour page.
    // Object types as files spell them, and the names of the group palettes.
    static const std::string &GetTargetTag();
    static const std::string &GetReferenceTag();
    static const std::string &GetTrialTag();
    static const std::string &GetSampleTag();
    static const std::string &GetTargetsGroupName();
    static const std::string &GetReferencesGroupName();
    static const std::string &GetTrialsGroupName();
    static const std::string &GetSamplesGroupName();

    typedef std::vector<boost::shared_ptr<CxF3Object>> ObjectList;
    // A new palette of the objects' ids as they are now; a palette of the
    // same name is a separate palette.
    void AddPalette(const std::string &ar_name, ObjectList a_objects);
    // Targets join the palette "Targets", standards "Standards"; other
    // objects are left out.
    void AddStandardPalette(ObjectList a_objects);
    // Trials join the palette "Trials", samples "Samples".
    void AddTrialPalette(ObjectList a_objects);
    // First the group of all objects (named by the file description, or
    // "Object Collection"), then each palette that has known objects.
    std::vector<std::pair<std::string, ObjectList>> GetPalettes() const;

    // ---- Jobs, kept as quality control sets.
    // The document shares the job: series added later are saved too.
    void AddOstraJob(const boost::shared_ptr<CxF3Job> &ar_job);
    std::vector<boost::shared_ptr<CxF3Job>> GetJobs() const;
    // The substrate object whose tag "Job" in the collection "Tags" is the
    // name; null when there is none.
    boost::shared_ptr<CxF3Object> GetJobSubstrate(const std::string &ar_name) const;

    // ---- Views: always empty; for arrangements an application adds.
    const std::vector<boost::shared_ptr<ICxF3View>> &GetViews() const;

    // ---- The branded colour library the file carried; null when none.
    boost::shared_ptr<CxF3LumiveraLibrary> GetLumiveraLibrary() const;

    CxF3Wrapper &GetWrapper() const;

private:
    explicit CxF3(const boost::shared_ptr<CxF3Implementation> &ar_implementation);

    boost::shared_ptr<CxF3Implementation> p_implementation;
    std::vector<boost::shared_ptr<CxF3Object>> p_objects;
    std::vector<boost::shared_ptr<CxF3ColorSpecification>> p_specifications;
};

#endif // TESSARINE_CXF3_H
