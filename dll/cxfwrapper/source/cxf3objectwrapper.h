// The body of a CxF3Object handle: the cc::Object and the working copies of
// the value collections that CxF3::AddObject copies into it.
#ifndef TESSARINE_CXF3OBJECTWRAPPER_H
#define TESSARINE_CXF3OBJECTWRAPPER_H

#include <tessarine/CxF3Object.h>

#include <cxf/v3/cxf3.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

class CxF3ObjectWrapper {
public:
    // A new object with nothing set and empty collections.
    CxF3ObjectWrapper();
    // A copy of a loaded object, copies of its value collections (new empty
    // ones where it has none; ar_object is left as it is) and of each of its
    // tag collections.
    explicit CxF3ObjectWrapper(const cc::Object &ar_object);

    // Copies the value collections that hold something, the physical
    // attributes when one of them is set, and the tag collections that hold
    // tags into the cc::Object.
    void CopyValuesIntoObject();

    boost::shared_ptr<cc::Object> object;
    boost::shared_ptr<cc::ColorValues> colorValues;
    boost::shared_ptr<cc::ColorDifferenceValues> colorDifferenceValues;
    boost::shared_ptr<cc::DeviceColorValues> deviceColorValues;
    boost::shared_ptr<cc::PhysicalAttributes> physicalAttributes;
    std::vector<boost::shared_ptr<cc::TagCollection>> tagCollections;
    // The text of the last failed value check; empty while the object is valid.
    std::string errorInfo;
};

// What a CxF3Object handle holds: the wrapper, or nothing for a handle made
// for an unknown id.
class CxF3ObjectInterface {
public:
    explicit CxF3ObjectInterface(const boost::shared_ptr<CxF3ObjectWrapper> &ar_wrapper) : wrapper(ar_wrapper) {}

    // A new public handle on the wrapper (which may be null).
    static boost::shared_ptr<CxF3Object> Handle(const boost::shared_ptr<CxF3ObjectWrapper> &ar_wrapper) {
        return boost::shared_ptr<CxF3Object>(
            new CxF3Object(boost::shared_ptr<CxF3ObjectInterface>(new CxF3ObjectInterface(ar_wrapper))));
    }

    boost::shared_ptr<CxF3ObjectWrapper> wrapper;
};

#endif // TESSARINE_CXF3OBJECTWRAPPER_H
