// SPDX-License-Identifier: MIT
#pragma once

#include "src/instance/ConvertedValue.h"
#include "src/schema/TPEGASUSClass.h"

#include <Pegasus/Client/CIMClient.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

namespace NKOLVRX20 {

class TPEGASUSInstance;

// Makes the host's instances of a class from the server's, in one retrieval. A property that fails to convert is left
// out and logged under the name of the operation that asked.
//
// Instances of a class have the same properties, mostly at the same places, and many properties have one value in all
// of them. What follows from a property's name is therefore kept for the next instance, and so is its first value:
// instances with the same value share the converted one. Ownership: the class outlives the builder.
class TInstanceBuilder
{
  public:
    TInstanceBuilder(TPEGASUSClass& instanceClass, std::string operation);

    // Throws: boost::bad_weak_ptr when the namespace is gone; Pegasus::Exception for an unreadable instance.
    // Blocks: for each reference property to a class that is new to the namespace, as long as its GetClass.
    boost::shared_ptr<TPEGASUSInstance> Build(const Pegasus::CIMInstance& source);

  private:
    // A property by its place: its name, what follows from it, and its first value.
    struct TMember
    {
        Pegasus::String fServed;    // as it came
        std::string fServerName;    // the same text
        std::string fKey;           // normalised
        bool fIsInstanceId = false; // its value is never null
        bool fIsSlotNumber = false; // its value is 16 bits wide
        TConvertedValue fFirst;     // its first value
    };

    TMember& MemberAt(Pegasus::Uint32 place, const Pegasus::String& served);
    void Transfer(const Pegasus::CIMInstance& source, Pegasus::Uint32 place, const Pegasus::CIMConstProperty& property,
                  TPEGASUSInstance& target);
    TCIMValue Value(const Pegasus::CIMInstance& source, TMember& member,
                    const Pegasus::CIMConstProperty& property) const;
    TCIMValue Converted(const Pegasus::CIMValue& served, Pegasus::CIMType type, bool isArray, TMember& member) const;
    boost::shared_ptr<ICIMClass> ReferencedClass(const Pegasus::CIMInstance& source, const std::string& property) const;

    TPEGASUSClass& fClass;
    const std::string fOperation;  // the function's name, as the log has it
    std::vector<TMember> fMembers; // by place in the instance
    // The last one: the host lets the instances of a class that live at one time share what they have in common.
    boost::shared_ptr<TPEGASUSInstance> fBuilt;
};

} // namespace NKOLVRX20
