// SPDX-License-Identifier: MIT
#pragma once

#include "src/instance/ConvertedValue.h"

#include <string>
#include <unordered_map>
#include <vector>

namespace NKOLVRX20 {

// The values of qualifiers on the elements of classes, as they were converted last. A class comes with all that it
// inherits, and an inherited element most often has the values that the superclass's has: the classes of a namespace
// share these.
// Thread: one at a time.
class TQualifierValues
{
  public:
    // What the element of a name had in the last class that had one.
    class TElement
    {
      public:
        // Returns: the qualifier's converted value; valid until the next call.
        TConvertedValue& Of(const Pegasus::CIMName& qualifier)
        {
            for (TQualifier& known : fQualifiers) {
                if (known.fName.getString().getChar16Data() == qualifier.getString().getChar16Data() ||
                    known.fName == qualifier)
                {
                    return known.fValue;
                }
            }
            fQualifiers.push_back({qualifier, {}});
            return fQualifiers.back().fValue;
        }

      private:
        struct TQualifier
        {
            Pegasus::CIMName fName;
            TConvertedValue fValue;
        };
        std::vector<TQualifier> fQualifiers;
    };

    // The name is the server's; the class's own qualifiers are those of the empty name, a parameter's name is
    // "method.parameter".
    TElement& On(const std::string& element) { return fElements[element]; }

  private:
    std::unordered_map<std::string, TElement> fElements;
};

} // namespace NKOLVRX20
