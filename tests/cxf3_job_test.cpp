// Jobs of CxF3 documents: the job handle, the tolerance kept in each series'
// quality control set, and how jobs reach a file and come back from it.
#include "cxf3_test_support.h"

#include <tessarine/tessarine.h>

#include "dll/cxfwrapper/source/cxf3jobwrapper.h"
#include "dll/cxfwrapper/source/cxf3text.h"
#include "dll/cxfwrapper/source/cxf3wrapper.h"

#include <array>
#include <cstddef>
#include <sstream>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace {

typedef std::array<float, 6> Values;

// The values of a default tolerance.
const Values k_default_values = {3.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f};

CXFTolerance MakeTolerance(CXFToleranceModusType a_mode, const Values &ar_values) {
    CXFTolerance tolerance;
    tolerance.SetToleranceModus(a_mode);
    tolerance.SetV(ar_values[0], ar_values[1], ar_values[2], ar_values[3], ar_values[4], ar_values[5]);
    return tolerance;
}

void ExpectTolerance(const CXFTolerance &ar_tolerance, CXFToleranceModusType a_mode, const Values &ar_values) {
    EXPECT_EQ(a_mode, ar_tolerance.GetToleranceModus());
    for (unsigned short index = 0; index < 6; ++index)
        EXPECT_FLOAT_EQ(ar_values[index], ar_tolerance[index]) << "V" << index;
}

CxF3JobWrapper &BodyOf(const boost::shared_ptr<CxF3Job> &ar_job) {
    return *dynamic_cast<CxF3JobInterface &>(*ar_job).GetWrapper();
}

qc::c_QCSet &SetOf(const boost::shared_ptr<CxF3Job> &ar_job, std::size_t a_index) {
    return *BodyOf(ar_job).series.at(a_index)->set;
}

// Adds a series made by hand, as a loaded file can have it.
void AddRawSeries(const boost::shared_ptr<CxF3Job> &ar_job, const qc::c_QCSet &ar_set) {
    BodyOf(ar_job).series.push_back(boost::shared_ptr<CxF3QCSetWrapper>(new CxF3QCSetWrapper(ar_set)));
}

qc::c_RangeToleranceType Range(double a_max, double a_min) {
    qc::c_RangeToleranceType range;
    range.set_max(a_max);
    range.set_min(a_min);
    return range;
}

qc::c_SingleDEToleranceType Limit(double a_value) {
    qc::c_SingleDEToleranceType limit;
    limit.set_value(a_value);
    return limit;
}

// A set holding the one tolerance set given.
qc::c_QCSet SetWith(const qc::c_ToleranceSet &ar_tolerance_set) {
    qc::c_QCSet set;
    set.set_Name(L"S");
    set.set_StandardRef(L"O1");
    set.append_ToleranceSet(ar_tolerance_set);
    return set;
}

qc::c_ToleranceSet ToleranceSetNamed(const std::wstring &ar_name) {
    qc::c_ToleranceSet tolerance_set;
    tolerance_set.set_Name(ar_name);
    tolerance_set.set_ColorSpecification(L"CS1");
    return tolerance_set;
}

void ExpectRange(const qc::c_RangeToleranceType *ap_range, double a_max, double a_min) {
    ASSERT_NE(nullptr, ap_range);
    EXPECT_DOUBLE_EQ(a_max, ap_range->get_max());
    EXPECT_DOUBLE_EQ(a_min, ap_range->get_min());
}

void ExpectTol(const qc::c_CustomTolerances &ar_custom, std::size_t a_index, const std::wstring &ar_label, double a_max,
               double a_min) {
    ASSERT_LT(a_index, ar_custom.size_Tol());
    const qc::c_CustomRangeToleranceType &tol = ar_custom.get_Tol(a_index);
    EXPECT_EQ(ar_label, tol.get_Label());
    EXPECT_DOUBLE_EQ(a_max, tol.get_max());
    EXPECT_DOUBLE_EQ(a_min, tol.get_min());
}

template <typename T> std::string Marshalled(const T &ar_document) {
    std::string text;
    EXPECT_EQ(lmx::elmx_ok, ar_document.marshal(text));
    return text;
}

// The texts of the custom resource entries that hold a quality control document.
std::vector<std::string> QualityControlEntries(const cc::CustomResources &ar_resources) {
    std::vector<std::string> entries;
    for (std::size_t index = 0; index < ar_resources.size_inner_CustomResources(); ++index) {
        std::string text;
        ar_resources.get_inner_CustomResources(index).get_any(nullptr, nullptr, text);
        if (text.find("CxF3-qualitycontrol") != std::string::npos)
            entries.push_back(text);
    }
    return entries;
}

std::vector<std::string> JobNames(const std::vector<boost::shared_ptr<CxF3Job>> &ar_jobs) {
    std::vector<std::string> names;
    for (const boost::shared_ptr<CxF3Job> &job : ar_jobs)
        names.push_back(job->GetName());
    return names;
}

std::vector<std::string> ReferenceIds(const CxF3Job &ar_job) {
    std::vector<std::string> ids;
    for (unsigned index = 0; index < ar_job.GetSeriesCount(); ++index)
        ids.push_back(ar_job.GetReferenceId(index));
    return ids;
}

// A job of one name whose series have the given set names; the reference
// ids are "R" and the set name.
boost::shared_ptr<CxF3Job> JobWithSets(const std::string &ar_name, const std::vector<std::string> &ar_set_names) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->SetName(ar_name);
    for (const std::string &set_name : ar_set_names)
        job->AddSerie("R" + set_name, set_name, nullptr, "", {});
    return job;
}

boost::shared_ptr<CxF3Object> TaggedObject(const std::string &ar_name, CxF3ObjectType a_type,
                                           const std::string &ar_collection, const std::string &ar_job) {
    boost::shared_ptr<CxF3Object> object = CxF3Object::CreateCxFObject();
    object->SetName(ar_name);
    object->SetObjectType(a_type);
    object->AddTag(ar_collection, "Job", ar_job);
    return object;
}

std::string ObjectsXml() { return "<cc:ObjectCollection>" + ObjectXml("O1") + "</cc:ObjectCollection>"; }

} // namespace

// ---------------------------------------------------------------- the job handle

TEST(CxF3Job, NewJobIsEmpty) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    EXPECT_EQ("", job->GetName());
    EXPECT_EQ("", job->GetInfo());
    EXPECT_EQ(0u, job->GetSeriesCount());
}

TEST(CxF3Job, NameAndInfoAreKept) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->SetName("Print 42");
    job->SetInfo("night shift");
    EXPECT_EQ("Print 42", job->GetName());
    EXPECT_EQ("night shift", job->GetInfo());
}

TEST(CxF3Job, AddSerieStoresReferenceSetNameAndSamplesInTheSet) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    const CXFTolerance tolerance;
    job->AddSerie("O1", "Cyan", &tolerance, "CS1", {"O2", "O3", "O4"});

    ASSERT_EQ(1u, job->GetSeriesCount());
    const qc::c_QCSet &set = SetOf(job, 0);
    EXPECT_EQ(L"Cyan", set.get_Name());
    EXPECT_EQ(L"O1", set.get_StandardRef());
    EXPECT_EQ(1u, set.size_ToleranceSet());
    ASSERT_TRUE(set.isset_SampleSet());
    ASSERT_EQ(3u, set.get_SampleSet()->size_Obj());
    EXPECT_EQ(L"O3", set.get_SampleSet()->get_Obj(1).get_Id());

    EXPECT_EQ("O1", job->GetReferenceId(0));
    EXPECT_EQ("CS1", job->GetColorSpecification(0));
    EXPECT_EQ((std::vector<std::string>{"O2", "O3", "O4"}), job->GetSampleIds(0));
}

TEST(CxF3Job, SeriesKeepTheirOrder) {
    boost::shared_ptr<CxF3Job> job = JobWithSets("J", {"S1", "S2", "S3"});
    EXPECT_EQ(3u, job->GetSeriesCount());
    EXPECT_EQ((std::vector<std::string>{"RS1", "RS2", "RS3"}), ReferenceIds(*job));
}

TEST(CxF3Job, NullToleranceGivesDefaultToleranceAndNoColorSpecification) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->AddSerie("O1", "S", nullptr, "CS1", {"O2"});
    EXPECT_EQ(0u, SetOf(job, 0).size_ToleranceSet());
    ExpectTolerance(job->GetTolerance(0), T_DE, k_default_values);
    EXPECT_EQ("", job->GetColorSpecification(0));
}

TEST(CxF3Job, OutOfRangeIndexesGiveEmptyResults) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    const CXFTolerance tolerance = MakeTolerance(T_CMC, {1.0f, 2.0f, 1.0f, 0.0f, 0.0f, 0.0f});
    job->AddSerie("O1", "S", &tolerance, "CS1", {"O2"});

    EXPECT_EQ("", job->GetReferenceId(5));
    ExpectTolerance(job->GetTolerance(5), T_DE, k_default_values);
    EXPECT_EQ("", job->GetColorSpecification(5));
    EXPECT_TRUE(job->GetSampleIds(5).empty());
    EXPECT_EQ("", job->GetReferenceId(1));
    EXPECT_EQ(1u, job->GetSeriesCount());
}

TEST(CxF3Job, EmptySampleIdsMakeNoSampleSet) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->AddSerie("O1", "S", nullptr, "", {});
    EXPECT_FALSE(SetOf(job, 0).isset_SampleSet());
    EXPECT_EQ(std::string::npos, Marshalled(SetOf(job, 0)).find("SampleSet"));
}

TEST(CxF3Job, GetSampleIdsCreatesTheEmptySampleSet) {
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->AddSerie("O1", "S", nullptr, "", {});
    EXPECT_TRUE(job->GetSampleIds(0).empty());

    const qc::c_QCSet &set = SetOf(job, 0);
    ASSERT_TRUE(set.isset_SampleSet());
    EXPECT_EQ(0u, set.get_SampleSet()->size_Obj());
    EXPECT_NE(std::string::npos, Marshalled(set).find("<qc:SampleSet/>"));
}

TEST(CxF3Job, HandleWithoutWrapperThrowsLogicError) {
    CxF3JobInterface job((boost::shared_ptr<CxF3JobWrapper>()));
    const CXFTolerance tolerance;
    EXPECT_THROW(job.SetName("J"), std::logic_error);
    EXPECT_THROW(job.GetName(), std::logic_error);
    EXPECT_THROW(job.SetInfo("I"), std::logic_error);
    EXPECT_THROW(job.GetInfo(), std::logic_error);
    EXPECT_THROW(job.AddSerie("O1", "S", &tolerance, "CS1", {"O2"}), std::logic_error);
    EXPECT_THROW(job.GetSeriesCount(), std::logic_error);
    EXPECT_THROW(job.GetReferenceId(5), std::logic_error);
    EXPECT_THROW(job.GetTolerance(5), std::logic_error);
    EXPECT_THROW(job.GetColorSpecification(5), std::logic_error);
    EXPECT_THROW(job.GetSampleIds(5), std::logic_error);
}

TEST(CxF3Job, HandleWithoutWrapperNamesTheClass) {
    CxF3JobInterface job((boost::shared_ptr<CxF3JobWrapper>()));
    try {
        job.GetName();
        FAIL() << "no exception";
    } catch (const std::logic_error &error) {
        EXPECT_EQ(0u, std::string(error.what()).find("CxF3Job"));
    }
}

// ---------------------------------------------------------------- tolerance to set and back

class CxF3JobTolerance : public ::testing::Test {
protected:
    // Adds a series with the tolerance and gives the tolerance set it became.
    const qc::c_ToleranceSet &Written(CXFToleranceModusType a_mode, const Values &ar_values) {
        const CXFTolerance tolerance = MakeTolerance(a_mode, ar_values);
        p_job->AddSerie("O1", "S", &tolerance, "CS1", {});
        const qc::c_QCSet &set = SetOf(p_job, p_job->GetSeriesCount() - 1);
        EXPECT_EQ(1u, set.size_ToleranceSet());
        return set.get_ToleranceSet(0);
    }
    CXFTolerance ReadBack() const { return p_job->GetTolerance(p_job->GetSeriesCount() - 1); }

    boost::shared_ptr<CxF3Job> p_job = CxF3Job::CreateCxFJob();
};

TEST_F(CxF3JobTolerance, DeltaEIsALimitNamedByItsDescription) {
    const qc::c_ToleranceSet &set = Written(T_DE, {2.5f, 7.0f, 0.0f, 0.0f, 0.0f, 0.0f});
    EXPECT_EQ(L"CIELAB", set.get_Name());
    EXPECT_EQ(L"CS1", set.get_ColorSpecification());
    EXPECT_FALSE(set.isset_CustomTolerances());
    const qc::c_CIELabTolerances *p_lab = set.get_CIELabTolerances();
    ASSERT_NE(nullptr, p_lab);
    ASSERT_NE(nullptr, p_lab->get_dETol());
    EXPECT_DOUBLE_EQ(2.5, p_lab->get_dETol()->get_value());
    EXPECT_FALSE(p_lab->get_dETol()->isset_LRatio());
    EXPECT_FALSE(p_lab->isset_dLTol());
    EXPECT_FALSE(p_lab->isset_dEcmcTol());

    ExpectTolerance(ReadBack(), T_DE, {2.5f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f});
}

TEST_F(CxF3JobTolerance, LabBoxWritesNegatedMinimaAndReadsBackAsDeltaEWithMinimaAsStored) {
    const qc::c_ToleranceSet &set = Written(T_LAB, {1.0f, 2.0f, 3.0f, 1.0f, 2.0f, 3.0f});
    EXPECT_EQ(L"CIELAB", set.get_Name());
    EXPECT_FALSE(set.isset_CustomTolerances());
    const qc::c_CIELabTolerances *p_lab = set.get_CIELabTolerances();
    ASSERT_NE(nullptr, p_lab);
    ExpectRange(p_lab->get_dLTol(), 1.0, -1.0);
    ExpectRange(p_lab->get_dATol(), 2.0, -2.0);
    ExpectRange(p_lab->get_dBTol(), 3.0, -3.0);
    EXPECT_FALSE(p_lab->isset_dCTol());
    EXPECT_FALSE(p_lab->isset_dHTol());
    EXPECT_FALSE(p_lab->isset_dETol());

    ExpectTolerance(ReadBack(), T_DE, {1.0f, 2.0f, 3.0f, -1.0f, -2.0f, -3.0f});
}

TEST_F(CxF3JobTolerance, FmcIsOneCustomLimitAndReadsBackWithDefaultValues) {
    const qc::c_ToleranceSet &set = Written(T_FMC, {1.5f, 9.0f, 9.0f, 9.0f, 9.0f, 9.0f});
    EXPECT_EQ(L"T_FMC", set.get_Name());
    EXPECT_FALSE(set.isset_CIELabTolerances());
    ASSERT_TRUE(set.isset_CustomTolerances());
    EXPECT_EQ(1u, set.get_CustomTolerances()->size_Tol());
    ExpectTol(*set.get_CustomTolerances(), 0, L"dE_FMC", 1.5, 0.0);

    ExpectTolerance(ReadBack(), T_FMC, k_default_values);
}

TEST_F(CxF3JobTolerance, CmcIsAWeightedLimitAndLosesItsChromaWeight) {
    const qc::c_ToleranceSet &set = Written(T_CMC, {1.25f, 2.0f, 1.0f, 0.0f, 0.0f, 0.0f});
    EXPECT_EQ(L"CMC 2 : 1", set.get_Name());
    const qc::c_CIELabTolerances *p_lab = set.get_CIELabTolerances();
    ASSERT_NE(nullptr, p_lab);
    ASSERT_NE(nullptr, p_lab->get_dEcmcTol());
    EXPECT_DOUBLE_EQ(1.25, p_lab->get_dEcmcTol()->get_value());
    EXPECT_DOUBLE_EQ(2.0, p_lab->get_dEcmcTol()->get_LRatio());
    EXPECT_FALSE(p_lab->isset_dETol());
    EXPECT_FALSE(set.isset_CustomTolerances());

    ExpectTolerance(ReadBack(), T_CMC, {1.25f, 2.0f, 0.0f, 0.0f, 0.0f, 0.0f});
}

TEST_F(CxF3JobTolerance, LabMgIsThreeCustomRangesAndReadsBackWithDefaultValues) {
    const qc::c_ToleranceSet &set = Written(T_LABMG, {1.0f, 2.0f, 3.0f, 0.5f, 1.0f, 1.5f});
    EXPECT_EQ(L"T_LABMG", set.get_Name());
    EXPECT_FALSE(set.isset_CIELabTolerances());
    ASSERT_TRUE(set.isset_CustomTolerances());
    const qc::c_CustomTolerances &custom = *set.get_CustomTolerances();
    EXPECT_EQ(3u, custom.size_Tol());
    ExpectTol(custom, 0, L"dLmg", 1.0, -0.5);
    ExpectTol(custom, 1, L"damg", 2.0, -1.0);
    ExpectTol(custom, 2, L"dbmg", 3.0, -1.5);

    ExpectTolerance(ReadBack(), T_LABMG, k_default_values);
}

TEST_F(CxF3JobTolerance, DeltaEMgIsOneCustomLimitAndReadsBackWithDefaultValues) {
    const qc::c_ToleranceSet &set = Written(T_DEMG, {2.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f});
    EXPECT_EQ(L"T_DEMG", set.get_Name());
    EXPECT_FALSE(set.isset_CIELabTolerances());
    ASSERT_TRUE(set.isset_CustomTolerances());
    EXPECT_EQ(1u, set.get_CustomTolerances()->size_Tol());
    ExpectTol(*set.get_CustomTolerances(), 0, L"dEmg", 2.0, 0.0);

    ExpectTolerance(ReadBack(), T_DEMG, k_default_values);
}

TEST_F(CxF3JobTolerance, DeltaE94IsAWeightedLimitNamedByItsDescription) {
    const qc::c_ToleranceSet &set = Written(T_DE94, {1.5f, 1.0f, 0.045f, 0.015f, 0.0f, 0.0f});
    EXPECT_EQ(L"dE* 94 (1 : 0.045 : 0.015)", set.get_Name());
    const qc::c_CIELabTolerances *p_lab = set.get_CIELabTolerances();
    ASSERT_NE(nullptr, p_lab);
    ASSERT_NE(nullptr, p_lab->get_dE94Tol());
    EXPECT_DOUBLE_EQ(1.5, p_lab->get_dE94Tol()->get_value());
    EXPECT_DOUBLE_EQ(1.0, p_lab->get_dE94Tol()->get_LRatio());
    EXPECT_FALSE(set.isset_CustomTolerances());

    ExpectTolerance(ReadBack(), T_DE94, {1.5f, 1.0f, 0.0f, 0.0f, 0.0f, 0.0f});
}

TEST_F(CxF3JobTolerance, DensityWritesItsLimitFromV4AndReadsBackWithDefaultValues) {
    const qc::c_ToleranceSet &set = Written(T_D, {2.0f, 0.0f, 0.0f, 0.0f, 1.5f, 0.0f});
    EXPECT_EQ(L"T_D", set.get_Name());
    EXPECT_FALSE(set.isset_CIELabTolerances());
    ASSERT_TRUE(set.isset_CustomTolerances());
    EXPECT_EQ(1u, set.get_CustomTolerances()->size_Tol());
    ExpectTol(*set.get_CustomTolerances(), 0, L"dDensity", 1.5, 0.0);
    const std::string text = Marshalled(set);
    EXPECT_NE(std::string::npos, text.find("<qc:max>1.5</qc:max>"));
    EXPECT_NE(std::string::npos, text.find("<qc:min>0.0</qc:min>"));

    ExpectTolerance(ReadBack(), T_D, k_default_values);
}

TEST_F(CxF3JobTolerance, LchBoxUsesChromaAndHueRangesAndReadsBackWithMinimaAsStored) {
    const qc::c_ToleranceSet &set = Written(T_CIE_dLCH_Elliptical, {1.0f, 2.0f, 3.0f, 1.0f, 2.0f, 3.0f});
    EXPECT_EQ(L"T_CIE_dLCH_Elliptical", set.get_Name());
    EXPECT_FALSE(set.isset_CustomTolerances());
    const qc::c_CIELabTolerances *p_lab = set.get_CIELabTolerances();
    ASSERT_NE(nullptr, p_lab);
    ExpectRange(p_lab->get_dLTol(), 1.0, -1.0);
    ExpectRange(p_lab->get_dCTol(), 2.0, -2.0);
    ExpectRange(p_lab->get_dHTol(), 3.0, -3.0);
    EXPECT_FALSE(p_lab->isset_dATol());
    EXPECT_FALSE(p_lab->isset_dBTol());

    ExpectTolerance(ReadBack(), T_CIE_dLCH_Elliptical, {1.0f, 2.0f, 3.0f, -1.0f, -2.0f, -3.0f});
}

TEST_F(CxF3JobTolerance, LchMgIsThreeCustomRangesAndReadsBackWithDefaultValues) {
    const qc::c_ToleranceSet &set = Written(T_LCHmg_Elliptical, {1.0f, 2.0f, 3.0f, 0.5f, 1.0f, 1.5f});
    EXPECT_EQ(L"T_LCHmg_Elliptical", set.get_Name());
    EXPECT_FALSE(set.isset_CIELabTolerances());
    ASSERT_TRUE(set.isset_CustomTolerances());
    const qc::c_CustomTolerances &custom = *set.get_CustomTolerances();
    EXPECT_EQ(3u, custom.size_Tol());
    ExpectTol(custom, 0, L"dLmg", 1.0, -0.5);
    ExpectTol(custom, 1, L"dCmg", 2.0, -1.0);
    ExpectTol(custom, 2, L"dHmg", 3.0, -1.5);

    ExpectTolerance(ReadBack(), T_LCHmg_Elliptical, k_default_values);
}

TEST_F(CxF3JobTolerance, DeltaE2000IsAWeightedLimitNamedByItsDescription) {
    const qc::c_ToleranceSet &set = Written(T_DE2000, {0.75f, 1.0f, 1.0f, 1.0f, 0.0f, 0.0f});
    EXPECT_EQ(L"dE 2000 (1 : 1 : 1)", set.get_Name());
    const qc::c_CIELabTolerances *p_lab = set.get_CIELabTolerances();
    ASSERT_NE(nullptr, p_lab);
    ASSERT_NE(nullptr, p_lab->get_dE2000Tol());
    EXPECT_DOUBLE_EQ(0.75, p_lab->get_dE2000Tol()->get_value());
    EXPECT_DOUBLE_EQ(1.0, p_lab->get_dE2000Tol()->get_LRatio());
    EXPECT_FALSE(set.isset_CustomTolerances());

    ExpectTolerance(ReadBack(), T_DE2000, {0.75f, 1.0f, 0.0f, 0.0f, 0.0f, 0.0f});
}

TEST_F(CxF3JobTolerance, UnknownModeWritesOnlyTheNamesAndReadsBackAsDefault) {
    const qc::c_ToleranceSet &set = Written(static_cast<CXFToleranceModusType>(11), {4.0f, 1.0f, 1.0f, 0, 0, 0});
    EXPECT_EQ(L"CIELAB", set.get_Name());
    EXPECT_EQ(L"CS1", set.get_ColorSpecification());
    EXPECT_FALSE(set.isset_CIELabTolerances());
    EXPECT_FALSE(set.isset_CustomTolerances());

    ExpectTolerance(ReadBack(), T_DE, k_default_values);
}

TEST_F(CxF3JobTolerance, ToleranceGoesFirstInTheSetsTolerances) {
    Written(T_CMC, {1.0f, 2.0f, 1.0f, 0.0f, 0.0f, 0.0f});
    EXPECT_EQ(L"CMC 2 : 1", SetOf(p_job, 0).get_ToleranceSet(0).get_Name());
}

TEST_F(CxF3JobTolerance, SingleLimitsAreTriedInOrderDeltaECmc94And2000) {
    qc::c_ToleranceSet all = ToleranceSetNamed(L"T_LABMG");
    qc::c_CIELabTolerances &lab = all.get_CIELabTolerances();
    lab.assign_dE2000Tol(Limit(4.0));
    lab.assign_dE94Tol(Limit(3.0));
    lab.assign_dEcmcTol(Limit(2.0));
    lab.assign_dETol(Limit(1.0));
    lab.assign_dLTol(Range(9.0, -9.0));
    AddRawSeries(p_job, SetWith(all));
    ExpectTolerance(p_job->GetTolerance(0), T_DE, {1.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f});

    lab.unset_dETol();
    AddRawSeries(p_job, SetWith(all));
    ExpectTolerance(p_job->GetTolerance(1), T_CMC, {2.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f});

    lab.unset_dEcmcTol();
    AddRawSeries(p_job, SetWith(all));
    ExpectTolerance(p_job->GetTolerance(2), T_DE94, {3.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f});

    lab.unset_dE94Tol();
    AddRawSeries(p_job, SetWith(all));
    ExpectTolerance(p_job->GetTolerance(3), T_DE2000, {4.0f, 0.0f, 0.0f, 0.0f, 0.0f, 0.0f});
}

TEST_F(CxF3JobTolerance, RangesAreReadUnderTheModeOfTheSetName) {
    qc::c_ToleranceSet tolerance_set = ToleranceSetNamed(L"T_LABMG");
    tolerance_set.get_CIELabTolerances().assign_dLTol(Range(1.0, -0.5));
    AddRawSeries(p_job, SetWith(tolerance_set));
    ExpectTolerance(p_job->GetTolerance(0), T_LABMG, {1.0f, 0.0f, 0.0f, -0.5f, 0.0f, 0.0f});
}

TEST_F(CxF3JobTolerance, EveryKnownSetNameGivesItsMode) {
    const std::vector<std::pair<std::wstring, CXFToleranceModusType>> names = {
        {L"T_FMC", T_FMC},
        {L"T_LABMG", T_LABMG},
        {L"T_DEMG", T_DEMG},
        {L"T_D", T_D},
        {L"T_CIE_dLCH_Elliptical", T_CIE_dLCH_Elliptical},
        {L"T_LCHmg_Elliptical", T_LCHmg_Elliptical},
        {L"T_CMC", T_DE},
        {L"T_DE2000", T_DE},
        {L"", T_DE}};
    for (const auto &name : names)
        AddRawSeries(p_job, SetWith(ToleranceSetNamed(name.first)));
    for (unsigned index = 0; index < names.size(); ++index)
        EXPECT_EQ(names[index].second, p_job->GetTolerance(index).GetToleranceModus()) << index;
}

TEST_F(CxF3JobTolerance, AxisRangesComeBeforeChromaAndHueRanges) {
    qc::c_ToleranceSet tolerance_set = ToleranceSetNamed(L"CIELAB");
    qc::c_CIELabTolerances &lab = tolerance_set.get_CIELabTolerances();
    lab.assign_dATol(Range(2.0, -2.0));
    lab.assign_dCTol(Range(5.0, -5.0));
    lab.assign_dHTol(Range(6.0, -6.0));
    AddRawSeries(p_job, SetWith(tolerance_set));
    ExpectTolerance(p_job->GetTolerance(0), T_DE, {3.0f, 2.0f, 6.0f, 0.0f, -2.0f, -6.0f});
}

TEST_F(CxF3JobTolerance, OnlyTheFirstToleranceSetIsRead) {
    qc::c_ToleranceSet first = ToleranceSetNamed(L"T_D");
    first.set_ColorSpecification(L"CS-first");
    qc::c_ToleranceSet second = ToleranceSetNamed(L"T_FMC");
    second.get_CIELabTolerances().assign_dETol(Limit(1.0));
    qc::c_QCSet set = SetWith(first);
    set.append_ToleranceSet(second);
    AddRawSeries(p_job, set);
    ExpectTolerance(p_job->GetTolerance(0), T_D, k_default_values);
    EXPECT_EQ("CS-first", p_job->GetColorSpecification(0));
}

// ---------------------------------------------------------------- jobs of a document

TEST(CxF3Jobs, NewDocumentHasNoJobs) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_TRUE(document->GetJobs().empty());
}

TEST(CxF3Jobs, AddedJobIsSharedWithTheDocument) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = JobWithSets("J", {"S1"});
    document->AddOstraJob(job);
    job->AddSerie("O9", "S2", nullptr, "", {});

    ASSERT_EQ(1u, document->GetWrapper().jobs.size());
    EXPECT_EQ(BodyOf(job).series.size(), document->GetWrapper().jobs[0]->series.size());
    const std::vector<boost::shared_ptr<CxF3Job>> jobs = document->GetJobs();
    ASSERT_EQ(1u, jobs.size());
    EXPECT_EQ(2u, jobs[0]->GetSeriesCount());
    EXPECT_EQ("O9", jobs[0]->GetReferenceId(1));
}

TEST(CxF3Jobs, SameJobCanBeAddedTwice) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = JobWithSets("J", {"S1"});
    document->AddOstraJob(job);
    document->AddOstraJob(job);

    const std::vector<boost::shared_ptr<CxF3Job>> jobs = document->GetJobs();
    ASSERT_EQ(2u, jobs.size());
    EXPECT_EQ(&BodyOf(jobs[0]), &BodyOf(jobs[1]));

    ASSERT_TRUE(document->GetWrapper().WriteQualityControl());
    EXPECT_EQ(2u, document->GetWrapper().qualityControl->size_QCSet());
}

TEST(CxF3Jobs, JobsAreKeptInTheOrderAdded) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("B", {}));
    document->AddOstraJob(JobWithSets("A", {}));
    EXPECT_EQ((std::vector<std::string>{"B", "A"}), JobNames(document->GetJobs()));
}

TEST(CxF3Jobs, GetJobsMakesFreshHandlesOnTheSameJobs) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("J", {"S1"}));
    const std::vector<boost::shared_ptr<CxF3Job>> first = document->GetJobs();
    const std::vector<boost::shared_ptr<CxF3Job>> second = document->GetJobs();
    ASSERT_EQ(1u, first.size());
    ASSERT_EQ(1u, second.size());
    EXPECT_NE(first[0].get(), second[0].get());
    EXPECT_EQ(&BodyOf(first[0]), &BodyOf(second[0]));

    first[0]->SetName("renamed");
    EXPECT_EQ("renamed", second[0]->GetName());
}

TEST(CxF3Jobs, AddingAHandleWithoutWrapperThrowsLogicError) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_THROW(document->AddOstraJob(boost::shared_ptr<CxF3Job>()), std::logic_error);
    EXPECT_THROW(
        document->AddOstraJob(boost::shared_ptr<CxF3Job>(new CxF3JobInterface(boost::shared_ptr<CxF3JobWrapper>()))),
        std::logic_error);
    EXPECT_TRUE(document->GetJobs().empty());
}

// ---------------------------------------------------------------- writing the quality control document

TEST(CxF3JobsWriting, NoJobsWriteNothing) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    CxF3Wrapper &wrapper = document->GetWrapper();
    EXPECT_FALSE(wrapper.WriteQualityControl());
    EXPECT_FALSE(wrapper.qualityControl);
    EXPECT_EQ(0u, wrapper.customResources->size_inner_CustomResources());
}

TEST(CxF3JobsWriting, DocumentIsNamedAfterTheLastJob) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("First", {"S1"}));
    document->AddOstraJob(JobWithSets("Second", {"S2"}));
    CxF3Wrapper &wrapper = document->GetWrapper();
    ASSERT_TRUE(wrapper.WriteQualityControl());
    EXPECT_EQ(L"Second", wrapper.qualityControl->get_Name());
    EXPECT_EQ(2u, wrapper.qualityControl->size_QCSet());
    EXPECT_EQ(L"S1", wrapper.qualityControl->get_QCSet(0).get_Name());
    EXPECT_EQ(L"S2", wrapper.qualityControl->get_QCSet(1).get_Name());
}

TEST(CxF3JobsWriting, JobWithoutSeriesStillRenamesTheDocument) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("WithSeries", {"S1"}));
    document->AddOstraJob(JobWithSets("Empty", {}));
    CxF3Wrapper &wrapper = document->GetWrapper();
    ASSERT_TRUE(wrapper.WriteQualityControl());
    EXPECT_EQ(L"Empty", wrapper.qualityControl->get_Name());
    const std::vector<std::string> entries = QualityControlEntries(*wrapper.customResources);
    ASSERT_EQ(1u, entries.size());
    EXPECT_NE(std::string::npos, entries[0].find("Name=\"Empty\""));
}

TEST(CxF3JobsWriting, JobsWithoutSeriesStoreNoEntry) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("Empty", {}));
    CxF3Wrapper &wrapper = document->GetWrapper();
    EXPECT_FALSE(wrapper.WriteQualityControl());
    ASSERT_TRUE(wrapper.qualityControl);
    EXPECT_EQ(L"Empty", wrapper.qualityControl->get_Name());
    EXPECT_EQ(0u, wrapper.qualityControl->size_QCSet());
    EXPECT_EQ(0u, wrapper.customResources->size_inner_CustomResources());
}

TEST(CxF3JobsWriting, EntryIsTheMarshalledDocumentWithoutItsDeclaration) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("J", {"S1"}));
    CxF3Wrapper &wrapper = document->GetWrapper();
    ASSERT_TRUE(wrapper.WriteQualityControl());
    const std::vector<std::string> entries = QualityControlEntries(*wrapper.customResources);
    ASSERT_EQ(1u, entries.size());
    // The cut is by count: the line end after the declaration stays.
    EXPECT_EQ(0u, entries[0].find("\n<qc:QualityControl"));
    EXPECT_EQ(Marshalled(*wrapper.qualityControl).substr(38), entries[0]);
}

TEST(CxF3JobsWriting, SetWithoutReferenceIsLeftOut) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = JobWithSets("J", {"S1"});
    qc::c_QCSet without_reference;
    without_reference.set_Name(L"S2");
    AddRawSeries(job, without_reference);
    job->AddSerie("O3", "S3", nullptr, "", {});
    document->AddOstraJob(job);

    CxF3Wrapper &wrapper = document->GetWrapper();
    ASSERT_TRUE(wrapper.WriteQualityControl());
    ASSERT_EQ(2u, wrapper.qualityControl->size_QCSet());
    EXPECT_EQ(L"S1", wrapper.qualityControl->get_QCSet(0).get_Name());
    EXPECT_EQ(L"S3", wrapper.qualityControl->get_QCSet(1).get_Name());
    EXPECT_EQ(3u, job->GetSeriesCount());
}

TEST(CxF3JobsWriting, SetWithFourToleranceSetsIsLeftOut) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    const CXFTolerance tolerance;
    job->AddSerie("O1", "S1", &tolerance, "CS1", {});
    for (int extra = 0; extra < 3; ++extra)
        SetOf(job, 0).append_ToleranceSet(ToleranceSetNamed(L"extra"));
    document->AddOstraJob(job);

    CxF3Wrapper &wrapper = document->GetWrapper();
    EXPECT_FALSE(wrapper.WriteQualityControl());
    EXPECT_EQ(0u, wrapper.qualityControl->size_QCSet());
    EXPECT_EQ(0u, wrapper.customResources->size_inner_CustomResources());
}

TEST(CxF3JobsWriting, SetWithoutNameIsWrittenWithAnEmptyName) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    qc::c_QCSet without_name;
    without_name.set_StandardRef(L"O1");
    AddRawSeries(job, without_name);
    document->AddOstraJob(job);

    CxF3Wrapper &wrapper = document->GetWrapper();
    ASSERT_TRUE(wrapper.WriteQualityControl());
    ASSERT_EQ(1u, wrapper.qualityControl->size_QCSet());
    EXPECT_TRUE(wrapper.qualityControl->get_QCSet(0).is_occurs_ok());
    EXPECT_EQ(L"", wrapper.qualityControl->get_QCSet(0).get_Name());
}

TEST(CxF3JobsWriting, InfoIsNotWritten) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = JobWithSets("J", {"S1"});
    job->SetInfo("kept in memory only");
    document->AddOstraJob(job);
    ASSERT_TRUE(document->GetWrapper().WriteQualityControl());
    const std::vector<std::string> entries = QualityControlEntries(*document->GetWrapper().customResources);
    ASSERT_EQ(1u, entries.size());
    EXPECT_EQ(std::string::npos, entries[0].find("kept in memory only"));
}

// ---------------------------------------------------------------- job substrates

TEST(CxF3JobSubstrate, SubstrateTaggedWithTheJobIsFound) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(TaggedObject("Other paper", CxF3ObjectSubstrate, "Tags", "J2")));
    ASSERT_TRUE(document->AddObject(TaggedObject("Paper", CxF3ObjectSubstrate, "Tags", "J1")));
    ASSERT_TRUE(document->AddObject(TaggedObject("Second paper", CxF3ObjectSubstrate, "Tags", "J1")));

    boost::shared_ptr<CxF3Object> substrate = document->GetJobSubstrate("J1");
    ASSERT_TRUE(substrate);
    EXPECT_EQ("Paper", substrate->GetName());
    EXPECT_EQ("O2", substrate->GetId());
}

TEST(CxF3JobSubstrate, NoMatchGivesNullUnlikeAnUnknownId) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(TaggedObject("Paper", CxF3ObjectSubstrate, "Tags", "J1")));
    EXPECT_FALSE(document->GetJobSubstrate("J2"));
    EXPECT_FALSE(document->GetJobSubstrate(""));
    EXPECT_TRUE(document->GetObjectById("unknown"));
}

TEST(CxF3JobSubstrate, OnlySubstratesWithTheTagInTagsCount) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(TaggedObject("Target", CxF3ObjectTarget, "Tags", "J1")));
    ASSERT_TRUE(document->AddObject(TaggedObject("Elsewhere", CxF3ObjectSubstrate, "Other", "J1")));
    EXPECT_FALSE(document->GetJobSubstrate("J1"));
}

TEST(CxF3JobSubstrate, NewDocumentHasNone) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    EXPECT_FALSE(document->GetJobSubstrate(""));
}

// ---------------------------------------------------------------- files

class CxF3JobFile : public ScratchFolderTest {
protected:
    // Saves the document and loads the file into a new one.
    boost::shared_ptr<CxF3> Reloaded(CxF3 &ar_document) {
        EXPECT_TRUE(ar_document.SaveCxF(PathOf("jobs.cxf")));
        boost::shared_ptr<CxF3> reloaded = CxF3::CreateCxF();
        EXPECT_TRUE(reloaded->LoadCxF(PathOf("jobs.cxf")));
        return reloaded;
    }
};

TEST_F(CxF3JobFile, SeriesWithDifferentSetNamesReloadAsSeparateJobs) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("J", {"S1", "S2"}));
    const std::vector<boost::shared_ptr<CxF3Job>> jobs = Reloaded(*document)->GetJobs();
    ASSERT_EQ((std::vector<std::string>{"S1", "S2"}), JobNames(jobs));
    EXPECT_EQ((std::vector<std::string>{"RS1"}), ReferenceIds(*jobs[0]));
    EXPECT_EQ((std::vector<std::string>{"RS2"}), ReferenceIds(*jobs[1]));
}

TEST_F(CxF3JobFile, SeriesWithOneSetNameReloadAsOneJob) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->SetName("J");
    job->AddSerie("O1", "S", nullptr, "", {});
    job->AddSerie("O2", "S", nullptr, "", {});
    document->AddOstraJob(job);
    const std::vector<boost::shared_ptr<CxF3Job>> jobs = Reloaded(*document)->GetJobs();
    ASSERT_EQ((std::vector<std::string>{"S"}), JobNames(jobs));
    EXPECT_EQ((std::vector<std::string>{"O1", "O2"}), ReferenceIds(*jobs[0]));
}

TEST_F(CxF3JobFile, ReloadedJobsAreGroupedBySetNameAndSorted) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("Z", {"b", "B", "A"}));
    boost::shared_ptr<CxF3Job> second = JobWithSets("Y", {"B"});
    second->SetInfo("info");
    document->AddOstraJob(second);

    const std::vector<boost::shared_ptr<CxF3Job>> jobs = Reloaded(*document)->GetJobs();
    ASSERT_EQ((std::vector<std::string>{"A", "B", "b"}), JobNames(jobs));
    EXPECT_EQ(1u, jobs[0]->GetSeriesCount());
    EXPECT_EQ((std::vector<std::string>{"RB", "RB"}), ReferenceIds(*jobs[1]));
    EXPECT_EQ(1u, jobs[2]->GetSeriesCount());
    for (const boost::shared_ptr<CxF3Job> &job : jobs)
        EXPECT_EQ("", job->GetInfo());
}

TEST_F(CxF3JobFile, SeriesComeBackWithReferenceToleranceSpecificationAndSamples) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    const CXFTolerance tolerance = MakeTolerance(T_DE2000, {1.5f, 2.0f, 1.0f, 1.0f, 0.0f, 0.0f});
    job->AddSerie("O1", "S", &tolerance, "CS1", {"O2", "O3"});
    job->AddSerie("O4", "S", nullptr, "CS2", {});
    document->AddOstraJob(job);

    const std::vector<boost::shared_ptr<CxF3Job>> jobs = Reloaded(*document)->GetJobs();
    ASSERT_EQ(1u, jobs.size());
    const boost::shared_ptr<CxF3Job> &reloaded = jobs[0];
    ASSERT_EQ(2u, reloaded->GetSeriesCount());
    EXPECT_EQ("O1", reloaded->GetReferenceId(0));
    ExpectTolerance(reloaded->GetTolerance(0), T_DE2000, {1.5f, 2.0f, 0.0f, 0.0f, 0.0f, 0.0f});
    EXPECT_EQ("CS1", reloaded->GetColorSpecification(0));
    EXPECT_EQ((std::vector<std::string>{"O2", "O3"}), reloaded->GetSampleIds(0));
    EXPECT_EQ("O4", reloaded->GetReferenceId(1));
    ExpectTolerance(reloaded->GetTolerance(1), T_DE, k_default_values);
    EXPECT_EQ("", reloaded->GetColorSpecification(1));
    EXPECT_TRUE(reloaded->GetSampleIds(1).empty());
}

TEST_F(CxF3JobFile, EveryModeReadsBackFromTheFileAsFromMemory) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    for (int mode = T_DE; mode <= T_DE2000; ++mode) {
        const CXFTolerance tolerance =
            MakeTolerance(static_cast<CXFToleranceModusType>(mode), {1.5f, 2.0f, 0.5f, 1.0f, 0.25f, 0.75f});
        job->AddSerie("O1", "M" + std::to_string(100 + mode), &tolerance, "CS1", {});
    }
    document->AddOstraJob(job);

    const std::vector<boost::shared_ptr<CxF3Job>> jobs = Reloaded(*document)->GetJobs();
    ASSERT_EQ(11u, jobs.size());
    for (unsigned mode = 0; mode < jobs.size(); ++mode) {
        SCOPED_TRACE(mode);
        EXPECT_EQ("M" + std::to_string(100 + mode), jobs[mode]->GetName());
        const CXFTolerance in_memory = job->GetTolerance(mode);
        const CXFTolerance from_file = jobs[mode]->GetTolerance(0);
        ExpectTolerance(from_file, in_memory.GetToleranceModus(),
                        {in_memory[0], in_memory[1], in_memory[2], in_memory[3], in_memory[4], in_memory[5]});
    }
}

TEST_F(CxF3JobFile, NonAsciiSetNameSurvivesTheFile) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    const std::string name = "Gr\u00fcn 5 \u20ac";
    document->AddOstraJob(JobWithSets("J", {name}));
    EXPECT_EQ((std::vector<std::string>{name}), JobNames(Reloaded(*document)->GetJobs()));
}

TEST_F(CxF3JobFile, SavingTwiceLeavesTwoQualityControlEntries) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("J", {"S1"}));
    ASSERT_TRUE(document->SaveCxF(PathOf("first.cxf")));
    ASSERT_TRUE(document->SaveCxF(PathOf("twice.cxf")));

    EXPECT_EQ(2u, QualityControlEntries(*document->GetWrapper().customResources).size());
    EXPECT_EQ(1u, CountOf(ReadFile(PathOf("first.cxf")), "<qc:QualityControl"));
    EXPECT_EQ(2u, CountOf(ReadFile(PathOf("twice.cxf")), "<qc:QualityControl"));
}

TEST_F(CxF3JobFile, LastQualityControlEntryGivesTheJobs) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = JobWithSets("J", {"A"});
    document->AddOstraJob(job);
    ASSERT_TRUE(document->SaveCxF(PathOf("jobs.cxf")));
    job->AddSerie("RB", "B", nullptr, "", {});

    const std::vector<boost::shared_ptr<CxF3Job>> jobs = Reloaded(*document)->GetJobs();
    ASSERT_EQ((std::vector<std::string>{"A", "B"}), JobNames(jobs));
    EXPECT_EQ(1u, jobs[0]->GetSeriesCount());
    EXPECT_EQ(1u, jobs[1]->GetSeriesCount());
}

TEST_F(CxF3JobFile, WrittenQualityControlReadsBackThroughTheBinding) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    boost::shared_ptr<CxF3Job> job = CxF3Job::CreateCxFJob();
    job->SetName("Print");
    const CXFTolerance box = MakeTolerance(T_LAB, {1.0f, 2.0f, 3.0f, 1.0f, 2.0f, 3.0f});
    const CXFTolerance density = MakeTolerance(T_D, {2.0f, 0.0f, 0.0f, 0.0f, 1.5f, 0.0f});
    job->AddSerie("O1", "S1", &box, "CS1", {"O2", "O3"});
    job->AddSerie("O4", "S2", &density, "CS2", {});
    document->AddOstraJob(job);
    ASSERT_TRUE(document->SaveCxF(PathOf("jobs.cxf")));

    cc::CxF root;
    ASSERT_EQ(lmx::elmx_ok, root.loadFile(PathOf("jobs.cxf").c_str()));
    const cc::CustomResources *p_resources = static_cast<const cc::CxF &>(root).get_CustomResources();
    ASSERT_NE(nullptr, p_resources);
    const std::vector<std::string> entries = QualityControlEntries(*p_resources);
    ASSERT_EQ(1u, entries.size());
    qc::c_QualityControl read;
    ASSERT_EQ(lmx::elmx_ok, read.unmarshal(entries[0].data(), entries[0].size()));
    EXPECT_EQ(L"Print", read.get_Name());
    EXPECT_EQ(2u, read.size_QCSet());
    EXPECT_EQ(Marshalled(*document->GetWrapper().qualityControl), Marshalled(read));
}

TEST_F(CxF3JobFile, ReloadedDocumentSavesItsJobsAgain) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    document->AddOstraJob(JobWithSets("J", {"S1"}));
    boost::shared_ptr<CxF3> reloaded = Reloaded(*document);
    ASSERT_TRUE(reloaded->SaveCxF(PathOf("again.cxf")));
    // The loaded entry stays and the reloaded jobs add a second one.
    EXPECT_EQ(2u, CountOf(ReadFile(PathOf("again.cxf")), "<qc:QualityControl"));
    EXPECT_EQ(L"S1", reloaded->GetWrapper().qualityControl->get_Name());
}

TEST_F(CxF3JobFile, SubstrateOfAJobIsFoundAfterLoading) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    ASSERT_TRUE(document->AddObject(TaggedObject("Paper", CxF3ObjectSubstrate, "Tags", "J1")));
    boost::shared_ptr<CxF3Object> substrate = Reloaded(*document)->GetJobSubstrate("J1");
    ASSERT_TRUE(substrate);
    EXPECT_EQ("Paper", substrate->GetName());
}

TEST(CxF3JobLoad, MalformedQualityControlEntryGivesNoJobs) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream text(
        Cxf3Text(ObjectsXml(), "<cc:CustomResources><qc:QualityControl "
                               "xmlns:qc=\"http://colorexchangeformat.com/CxF3-qualitycontrol\"><qc:QCSet Name=\"S\" "
                               "StandardRef=\"O1\"/></qc:QualityControl></cc:CustomResources>"));
    document->LoadFromStream(text);
    EXPECT_TRUE(document->GetJobs().empty());
}

TEST(CxF3JobLoad, SetsOfALoadedEntryBecomeJobs) {
    boost::shared_ptr<CxF3> document = CxF3::CreateCxF();
    std::stringstream text(Cxf3Text(ObjectsXml(),
                                    "<cc:CustomResources><qc:QualityControl Name=\"Doc\" "
                                    "xmlns:qc=\"http://colorexchangeformat.com/CxF3-qualitycontrol\">"
                                    "<qc:QCSet Name=\"T\" StandardRef=\"O1\"/><qc:QCSet Name=\"S\" StandardRef=\"O2\">"
                                    "<qc:SampleSet><qc:Obj Id=\"O3\"/></qc:SampleSet></qc:QCSet>"
                                    "</qc:QualityControl></cc:CustomResources>"));
    document->LoadFromStream(text);
    const std::vector<boost::shared_ptr<CxF3Job>> jobs = document->GetJobs();
    ASSERT_EQ((std::vector<std::string>{"S", "T"}), JobNames(jobs));
    EXPECT_EQ("O2", jobs[0]->GetReferenceId(0));
    EXPECT_EQ((std::vector<std::string>{"O3"}), jobs[0]->GetSampleIds(0));
    EXPECT_EQ("O1", jobs[1]->GetReferenceId(0));
}
