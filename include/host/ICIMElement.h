#ifndef HOST_ICIMELEMENT_H
#define HOST_ICIMELEMENT_H

namespace NKOLVRX20 {

// The root of everything that a namespace holds.
class ICIMElement
{
  public:
    virtual ~ICIMElement() = default;
};

} // namespace NKOLVRX20

#endif
