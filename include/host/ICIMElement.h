// SPDX-License-Identifier: MIT
#pragma once

namespace NKOLVRX20 {

// The common base of classes and instances: everything that a namespace holds. Its only operation is the destructor; a
// host uses it for lists of both, and dynamic_cast to find out which one it has.
class ICIMElement
{
  public:
    virtual ~ICIMElement() = default;
};

} // namespace NKOLVRX20
