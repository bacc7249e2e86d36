// CxF3Job: the quality control record of a print job, a named list of
// series. Each series names a reference object, the tolerance to judge by,
// the specification to measure with and the ids of the samples taken.
//
// In a file a job exists only as quality control sets named by the series'
// set names: a reloaded document rebuilds one job per set name, sorted by
// name, and the job's own name and info are not kept.
#ifndef TESSARINE_CXF3JOB_H
#define TESSARINE_CXF3JOB_H

#include <tessarine/CXFTolerance.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

class CxF3Job {
public:
    static boost::shared_ptr<CxF3Job> CreateCxFJob();

    virtual ~CxF3Job() = default;

    virtual void SetName(const std::string &ar_name) = 0;
    virtual std::string GetName() const = 0;
    // Kept in memory only; never written to a file.
    virtual void SetInfo(const std::string &ar_info) = 0;
    virtual std::string GetInfo() const = 0;
    // Adds a series; ap_tolerance may be null.
    virtual void AddSerie(const std::string &ar_reference_id, const std::string &ar_set_name,
                          const CXFTolerance *ap_tolerance, const std::string &ar_specification_id,
                          std::vector<std::string> a_sample_ids) = 0;
    virtual unsigned GetSeriesCount() const = 0;
    // "" when the index is out of range.
    virtual std::string GetReferenceId(unsigned a_index) const = 0;
    // A default tolerance when the index is out of range.
    virtual CXFTolerance GetTolerance(unsigned a_index) const = 0;
    // "" when the index is out of range or the series has no tolerance.
    virtual std::string GetColorSpecification(unsigned a_index) const = 0;
    // Empty when the index is out of range.
    virtual std::vector<std::string> GetSampleIds(unsigned a_index) = 0;
};

#endif // TESSARINE_CXF3JOB_H
