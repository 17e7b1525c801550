#pragma once

namespace NKOLVRX20 {

// The root of everything that a namespace holds.
class ICIMElement
{
  public:
    virtual ~ICIMElement() = default;
};

} // namespace NKOLVRX20
