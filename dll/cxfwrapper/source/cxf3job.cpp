// CxF3Job: a print job's quality control record, and the document's jobs.
// A file has no element for a job: each series is a qc:QCSet, and on load the
// sets are grouped into jobs by their Name again.
#include "cxf3jobwrapper.h"

#include "cxf3text.h"
#include "cxf3tolerancelabels.h"
#include "cxf3wrapper.h"

#include <cstddef>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

// ---------------------------------------------------------------- tolerance to tolerance set

namespace {

// The modes whose description names their values ("CMC 2 : 1"); the others
// are named by their keyword, which reading back recognises.
bool IsNamedByDescription(CXFToleranceModusType a_mode) {
    return a_mode == T_DE || a_mode == T_CMC || a_mode == T_DE94 || a_mode == T_DE2000;
}

// One side of a box tolerance: the positive limit of the axis and the
// negated value of its negative limit, three places further on.
template <typename Range> void SetBoxSide(Range &ar_range, const CXFTolerance &ar_tolerance, unsigned short a_axis) {
    ar_range.set_max(ar_tolerance[a_axis]);
    ar_range.set_min(-ar_tolerance[static_cast<unsigned short>(a_axis + 3)]);
}

template <typename Range> Range BoxSide(const CXFTolerance &ar_tolerance, unsigned short a_axis) {
    Range range;
    SetBoxSide(range, ar_tolerance, a_axis);
    return range;
}

// A dE limit; the weighted ones (dEcmc, dE94, dE2000) carry the lightness
// weight V1 as well.
qc::c_SingleDEToleranceType Limit(const CXFTolerance &ar_tolerance, bool a_weighted) {
    qc::c_SingleDEToleranceType limit;
    limit.set_value(ar_tolerance[0]);
    if (a_weighted)
        limit.set_LRatio(ar_tolerance[1]);
    return limit;
}

void SetCIELabBox(qc::c_CIELabTolerances &ar_lab, const CXFTolerance &ar_tolerance, bool a_chroma_hue) {
    ar_lab.assign_dLTol(BoxSide<qc::c_RangeToleranceType>(ar_tolerance, 0));
    if (a_chroma_hue) {
        ar_lab.assign_dCTol(BoxSide<qc::c_RangeToleranceType>(ar_tolerance, 1));
        ar_lab.assign_dHTol(BoxSide<qc::c_RangeToleranceType>(ar_tolerance, 2));
    } else {
        ar_lab.assign_dATol(BoxSide<qc::c_RangeToleranceType>(ar_tolerance, 1));
        ar_lab.assign_dBTol(BoxSide<qc::c_RangeToleranceType>(ar_tolerance, 2));
    }
}

// A custom limit runs from 0 to the limit, which is V0 except for the
// density limit, kept in V4.
void SetCustomLimit(qc::c_CustomRangeToleranceType &ar_tol, const CXFTolerance &ar_tolerance) {
    ar_tol.set_max(ar_tolerance.GetToleranceModus() == T_D ? ar_tolerance[4] : ar_tolerance[0]);
    ar_tol.set_min(0.0);
}

void SetCustomTolerances(qc::c_CustomTolerances &ar_custom, const CXFTolerance &ar_tolerance) {
    const std::vector<const wchar_t *> labels = CustomToleranceLabels(ar_tolerance.GetToleranceModus());
    for (std::size_t index = 0; index < labels.size(); ++index) {
        qc::c_CustomRangeToleranceType &r_tol = ar_custom.append_Tol();
        r_tol.set_Label(labels[index]);
        if (labels.size() == 1)
            SetCustomLimit(r_tol, ar_tolerance);
        else
            SetBoxSide(r_tol, ar_tolerance, static_cast<unsigned short>(index));
    }
}

// The tolerance set of a series. A mode outside the eleven gets a set with
// its names only.
qc::c_ToleranceSet ToleranceSetOf(const CXFTolerance &ar_tolerance, const std::string &ar_specification_id) {
    const CXFToleranceModusType mode = ar_tolerance.GetToleranceModus();
    qc::c_ToleranceSet set;
    set.set_Name(
        ToWide(IsNamedByDescription(mode) ? ar_tolerance.GetString() : ar_tolerance.GetToleranceModusString()));
    set.set_ColorSpecification(ToWide(ar_specification_id));
    switch (mode) {
    case T_DE:
        set.get_CIELabTolerances().assign_dETol(Limit(ar_tolerance, false));
        break;
    case T_CMC:
        set.get_CIELabTolerances().assign_dEcmcTol(Limit(ar_tolerance, true));
        break;
    case T_DE94:
        set.get_CIELabTolerances().assign_dE94Tol(Limit(ar_tolerance, true));
        break;
    case T_DE2000:
        set.get_CIELabTolerances().assign_dE2000Tol(Limit(ar_tolerance, true));
        break;
    case T_LAB:
    case T_CIE_dLCH_Elliptical:
        SetCIELabBox(set.get_CIELabTolerances(), ar_tolerance, mode == T_CIE_dLCH_Elliptical);
        break;
    case T_FMC:
    case T_DEMG:
    case T_D:
    case T_LABMG:
    case T_LCHmg_Elliptical:
        SetCustomTolerances(set.get_CustomTolerances(), ar_tolerance);
        break;
    }
    return set;
}

// ---------------------------------------------------------------- tolerance set to tolerance

// A single dE limit, tested in a fixed order; false when there is none.
bool ReadLimit(const qc::c_CIELabTolerances &ar_lab, CXFTolerance &ar_tolerance) {
    if (const qc::c_SingleDEToleranceType *p_limit = ar_lab.get_dETol()) {
        ar_tolerance.SetToleranceModus(T_DE);
        ar_tolerance[0] = static_cast<float>(p_limit->get_value());
        return true;
    }
    const struct {
        const qc::c_SingleDEToleranceType *p_limit;
        CXFToleranceModusType mode;
    } weighted[] = {{ar_lab.get_dEcmcTol(), T_CMC}, {ar_lab.get_dE94Tol(), T_DE94}, {ar_lab.get_dE2000Tol(), T_DE2000}};
    for (const auto &candidate : weighted) {
        if (!candidate.p_limit)
            continue;
        ar_tolerance.SetToleranceModus(candidate.mode);
        ar_tolerance[0] = static_cast<float>(candidate.p_limit->get_value());
        ar_tolerance[1] = static_cast<float>(candidate.p_limit->get_LRatio());
        return true;
    }
    return false;
}

// The modes of the keywords that name a tolerance set; any other name,
// "CIELAB" of the box included, reads as T_DE.
CXFToleranceModusType ModeOfName(const std::string &ar_name) {
    static const std::map<std::string, CXFToleranceModusType> k_modes = {
        {"T_FMC", T_FMC},
        {"T_LABMG", T_LABMG},
        {"T_DEMG", T_DEMG},
        {"T_D", T_D},
        {"T_CIE_dLCH_Elliptical", T_CIE_dLCH_Elliptical},
        {"T_LCHmg_Elliptical", T_LCHmg_Elliptical}};
    const auto found = k_modes.find(ar_name);
    return found == k_modes.end() ? T_DE : found->second;
}

// One side of a box from the first of two ranges that is there. The minimum
// is taken as stored: writing negated it, reading does not, which files of
// earlier releases rely on.
void ReadBoxSide(const qc::c_RangeToleranceType *ap_first, const qc::c_RangeToleranceType *ap_second,
                 unsigned short a_axis, CXFTolerance &ar_tolerance) {
    const qc::c_RangeToleranceType *p_range = ap_first ? ap_first : ap_second;
    if (!p_range)
        return;
    ar_tolerance[a_axis] = static_cast<float>(p_range->get_max());
    ar_tolerance[static_cast<unsigned short>(a_axis + 3)] = static_cast<float>(p_range->get_min());
}

// Custom tolerances are not read: their modes come back with default values.
CXFTolerance ToleranceOf(const qc::c_ToleranceSet &ar_set) {
    CXFTolerance tolerance;
    const qc::c_CIELabTolerances *p_lab = ar_set.get_CIELabTolerances();
    if (p_lab && ReadLimit(*p_lab, tolerance))
        return tolerance;
    tolerance.SetToleranceModus(ModeOfName(ToNarrow(ar_set.get_Name())));
    if (p_lab) {
        ReadBoxSide(p_lab->get_dLTol(), nullptr, 0, tolerance);
        ReadBoxSide(p_lab->get_dATol(), p_lab->get_dCTol(), 1, tolerance);
        ReadBoxSide(p_lab->get_dBTol(), p_lab->get_dHTol(), 2, tolerance);
    }
    return tolerance;
}

boost::shared_ptr<CxF3Job> JobHandle(const boost::shared_ptr<CxF3JobWrapper> &ar_wrapper) {
    return boost::shared_ptr<CxF3Job>(new CxF3JobInterface(ar_wrapper));
}

// The set of a series; null when the index is out of range.
qc::c_QCSet *SeriesSet(const CxF3JobWrapper &ar_job, unsigned a_index) {
    return a_index < ar_job.series.size() ? ar_job.series[a_index]->set.get() : nullptr;
}

// The tolerance set that stands for a series' tolerance: its first one.
const qc::c_ToleranceSet *FirstToleranceSet(const CxF3JobWrapper &ar_job, unsigned a_index) {
    const qc::c_QCSet *p_set = SeriesSet(ar_job, a_index);
    return p_set && p_set->size_ToleranceSet() > 0 ? &p_set->get_ToleranceSet(0) : nullptr;
}

} // namespace

// ---------------------------------------------------------------- job

boost::shared_ptr<CxF3Job> CxF3Job::CreateCxFJob() {
    return JobHandle(boost::shared_ptr<CxF3JobWrapper>(new CxF3JobWrapper()));
}

CxF3JobInterface::CxF3JobInterface(const boost::shared_ptr<CxF3JobWrapper> &ar_wrapper) : p_wrapper(ar_wrapper) {}

CxF3JobWrapper &CxF3JobInterface::p_job() const { return RequireTarget(p_wrapper, "CxF3Job"); }

void CxF3JobInterface::SetName(const std::string &ar_name) { p_job().name = ar_name; }

std::string CxF3JobInterface::GetName() const { return p_job().name; }

void CxF3JobInterface::SetInfo(const std::string &ar_info) { p_job().info = ar_info; }

std::string CxF3JobInterface::GetInfo() const { return p_job().info; }

void CxF3JobInterface::AddSerie(const std::string &ar_reference_id, const std::string &ar_set_name,
                                const CXFTolerance *ap_tolerance, const std::string &ar_specification_id,
                                std::vector<std::string> a_sample_ids) {
    CxF3JobWrapper &job = p_job();
    boost::shared_ptr<CxF3QCSetWrapper> series(new CxF3QCSetWrapper());
    qc::c_QCSet &set = *series->set;
    set.set_StandardRef(ToWide(ar_reference_id));
    set.set_Name(ToWide(ar_set_name));
    if (ap_tolerance)
        set.insert_ToleranceSet(0, ToleranceSetOf(*ap_tolerance, ar_specification_id));
    // Without samples the series has no sample set at all.
    if (!a_sample_ids.empty()) {
        qc::c_SampleSet samples;
        for (const std::string &id : a_sample_ids)
            samples.append_Obj().set_Id(ToWide(id));
        set.assign_SampleSet(samples);
    }
    job.series.push_back(series);
}

unsigned CxF3JobInterface::GetSeriesCount() const { return static_cast<unsigned>(p_job().series.size()); }

std::string CxF3JobInterface::GetReferenceId(unsigned a_index) const {
    const qc::c_QCSet *p_set = SeriesSet(p_job(), a_index);
    return p_set ? ToNarrow(p_set->get_StandardRef()) : std::string();
}

CXFTolerance CxF3JobInterface::GetTolerance(unsigned a_index) const {
    const qc::c_ToleranceSet *p_tolerance_set = FirstToleranceSet(p_job(), a_index);
    return p_tolerance_set ? ToleranceOf(*p_tolerance_set) : CXFTolerance();
}

std::string CxF3JobInterface::GetColorSpecification(unsigned a_index) const {
    const qc::c_ToleranceSet *p_tolerance_set = FirstToleranceSet(p_job(), a_index);
    return p_tolerance_set ? ToNarrow(p_tolerance_set->get_ColorSpecification()) : std::string();
}

std::vector<std::string> CxF3JobInterface::GetSampleIds(unsigned a_index) {
    std::vector<std::string> ids;
    qc::c_QCSet *p_set = SeriesSet(p_job(), a_index);
    if (!p_set)
        return ids;
    // Asking makes the sample set, empty, where the series had none.
    const qc::c_SampleSet &samples = p_set->get_SampleSet();
    for (std::size_t index = 0; index < samples.size_Obj(); ++index)
        ids.push_back(ToNarrow(samples.get_Obj(index).get_Id()));
    return ids;
}

// ---------------------------------------------------------------- quality control document

namespace {

// The document's name while it is built; the jobs rename it.
const char *const k_quality_control_name = "Ostra Jobs";

// A copy of a series' set as the file gets it. Its name goes to narrow text
// and back, as every public text does, which also marks it present.
qc::c_QCSet SetForFile(const qc::c_QCSet &ar_set) {
    qc::c_QCSet copy(ar_set);
    copy.set_Name(ToWide(ToNarrow(ar_set.get_Name())));
    return copy;
}

} // namespace

bool CxF3Wrapper::WriteQualityControl() {
    if (jobs.empty())
        return false;
    qualityControl.reset(new qc::c_QualityControl());
    qualityControl->set_Name(ToWide(k_quality_control_name));
    for (const boost::shared_ptr<CxF3JobWrapper> &job : jobs) {
        // The file has one name for all jobs: the last job's, even when that
        // job has no series.
        qualityControl->set_Name(ToWide(job->name));
        for (const boost::shared_ptr<CxF3QCSetWrapper> &series : job->series) {
            const qc::c_QCSet set = SetForFile(*series->set);
            if (set.is_occurs_ok())
                qualityControl->append_QCSet(set);
        }
    }
    return qualityControl->size_QCSet() > 0 && qualityControl->is_occurs_ok() && StoreExtension(*qualityControl);
}

void CxF3Wrapper::ReadJobs() {
    jobs.clear();
    // Jobs are known by their sets' names only, so the jobs come back in the
    // byte order of those names.
    std::map<std::string, boost::shared_ptr<CxF3JobWrapper>> jobs_by_set_name;
    for (std::size_t index = 0; index < qualityControl->size_QCSet(); ++index) {
        const qc::c_QCSet &set = qualityControl->get_QCSet(index);
        const std::string name = ToNarrow(set.get_Name());
        boost::shared_ptr<CxF3JobWrapper> &job = jobs_by_set_name[name];
        if (!job) {
            job.reset(new CxF3JobWrapper());
            job->name = name;
        }
        job->series.push_back(boost::shared_ptr<CxF3QCSetWrapper>(new CxF3QCSetWrapper(set)));
    }
    for (const auto &entry : jobs_by_set_name)
        jobs.push_back(entry.second);
}

// ---------------------------------------------------------------- CxF3 members

void CxF3::AddOstraJob(const boost::shared_ptr<CxF3Job> &ar_job) {
    // Only jobs made by this library have a body the document can share.
    const boost::shared_ptr<CxF3JobInterface> body = boost::dynamic_pointer_cast<CxF3JobInterface>(ar_job);
    const boost::shared_ptr<CxF3JobWrapper> &wrapper = RequireTarget(body, "CxF3Job").GetWrapper();
    RequireTarget(wrapper, "CxF3Job");
    GetWrapper().jobs.push_back(wrapper);
}

std::vector<boost::shared_ptr<CxF3Job>> CxF3::GetJobs() const {
    std::vector<boost::shared_ptr<CxF3Job>> handles;
    for (const boost::shared_ptr<CxF3JobWrapper> &wrapper : GetWrapper().jobs)
        handles.push_back(JobHandle(wrapper));
    return handles;
}

boost::shared_ptr<CxF3Object> CxF3::GetJobSubstrate(const std::string &ar_name) const {
    for (const boost::shared_ptr<CxF3ObjectWrapper> &wrapper : GetWrapper().objects) {
        boost::shared_ptr<CxF3Object> object = CxF3ObjectInterface::Handle(wrapper);
        if (object->GetCxFObjectType() == "Substrate" && object->GetTag("Tags", "Job") == ar_name)
            return object;
    }
    return boost::shared_ptr<CxF3Object>();
}
