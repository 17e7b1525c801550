#ifndef HOST_ICIMINDICATIONFILTER_H
#define HOST_ICIMINDICATIONFILTER_H

namespace NKOLVRX20 {

// A filter for indications. No namespace provider in this project serves indications.
class ICIMIndicationFilter
{
  public:
    virtual ~ICIMIndicationFilter() = default;
};

} // namespace NKOLVRX20

#endif
