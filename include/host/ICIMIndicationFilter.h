#pragma once

namespace NKOLVRX20 {

// A filter for indications. No namespace provider in this project serves indications.
class ICIMIndicationFilter
{
  public:
    virtual ~ICIMIndicationFilter() = default;
};

} // namespace NKOLVRX20
