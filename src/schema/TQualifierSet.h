#pragma once

#include <host/HostFwd.h>

#include <boost/shared_ptr.hpp>

#include <map>
#include <string>

namespace NKOLVRX20 {

class TPEGASUSQualifier;

// The qualifiers of one element, by normalised name.
class TQualifierSet
{
  public:
    // Takes the place of a qualifier of the same name.
    // Throws: TVRXException 14 for null or a qualifier that another plug-in made, 25 for a bad name.
    void Add(const boost::shared_ptr<ICIMQualifier>& qualifier);
    // Returns: null when there is none of that name. Throws: TVRXException 25.
    boost::shared_ptr<ICIMQualifier> Find(const std::string& name) const;
    // In byte order of the normalised names, until the visitor returns false.
    void Enumerate(const TQualifierVisitor& visitor) const;

  private:
    std::map<std::string, boost::shared_ptr<TPEGASUSQualifier>> fQualifiers;
};

} // namespace NKOLVRX20
