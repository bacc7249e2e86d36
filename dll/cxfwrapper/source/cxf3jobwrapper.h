// The bodies of CxF3Job handles: a job is a name, an info text and its
// series, each series one quality control set.
#ifndef TESSARINE_CXF3JOBWRAPPER_H
#define TESSARINE_CXF3JOBWRAPPER_H

#include <tessarine/CxF3Job.h>

#include <cxf/v3/cxf3_qualitycontrol.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

// One series: the set's Name links it to its job, StandardRef names the
// reference object, its tolerance sets hold the tolerance and its sample set
// the sample ids.
class CxF3QCSetWrapper {
public:
    CxF3QCSetWrapper() : set(new qc::c_QCSet()) {}
    explicit CxF3QCSetWrapper(const qc::c_QCSet &ar_set) : set(new qc::c_QCSet(ar_set)) {}

    boost::shared_ptr<qc::c_QCSet> set;
};

class CxF3JobWrapper {
public:
    std::string name;
    std::string info;
    std::vector<boost::shared_ptr<CxF3QCSetWrapper>> series;
};

// The one implementation of CxF3Job.
class CxF3JobInterface : public CxF3Job {
public:
    explicit CxF3JobInterface(const boost::shared_ptr<CxF3JobWrapper> &ar_wrapper);

    void SetName(const std::string &ar_name) override;
    std::string GetName() const override;
    void SetInfo(const std::string &ar_info) override;
    std::string GetInfo() const override;
    void AddSerie(const std::string &ar_reference_id, const std::string &ar_set_name, const CXFTolerance *ap_tolerance,
                  const std::string &ar_specification_id, std::vector<std::string> a_sample_ids) override;
    unsigned GetSeriesCount() const override;
    std::string GetReferenceId(unsigned a_index) const override;
    CXFTolerance GetTolerance(unsigned a_index) const override;
    std::string GetColorSpecification(unsigned a_index) const override;
    std::vector<std::string> GetSampleIds(unsigned a_index) override;

    const boost::shared_ptr<CxF3JobWrapper> &GetWrapper() const { return p_wrapper; }

private:
    // The wrapper; throws std::logic_error when the handle refers to none.
    CxF3JobWrapper &p_job() const;

    boost::shared_ptr<CxF3JobWrapper> p_wrapper;
};

#endif // TESSARINE_CXF3JOBWRAPPER_H
