// SPDX-License-Identifier: MIT
#pragma once

namespace NKOLVRX20 {

// A filter for indications, the argument of ICIMNamespace::Subscribe.
// Here: indications are unsupported, so a filter needs only its destructor.
class ICIMIndicationFilter
{
  public:
    virtual ~ICIMIndicationFilter() = default;
};

} // namespace NKOLVRX20
