// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMClass.h>
#include <host/IProvider.h>
#include <host/TVRXException.h>

#include <string>
#include <utility>
#include <vector>

namespace NKOLVRX20 {

// A provider in memory: three texts, and classes in the order in which they were added.
// Ownership: keeps its classes alive. Thread: one at a time.
class TInmemProvider : public IProvider
{
  public:
    TInmemProvider(std::string name, std::string module, std::string description)
        : fName(std::move(name)), fModule(std::move(module)), fDescription(std::move(description))
    {
    }
    void AddClass(const boost::shared_ptr<ICIMClass>& served) { fClasses.push_back(served); }

    std::string GetName(TCIMContext) const override { return fName; }
    std::string GetModuleName(TCIMContext) const override { return fModule; }
    std::string GetDescription(TCIMContext) const override { return fDescription; }
    boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext) const override
    {
        throw TVRXException(TVRXStatusCode::kNotSupported);
    }
    void EnumerateClassesProvided(TClassVisitor visitor, TCIMContext) override
    {
        for (const auto& served : fClasses) {
            if (!visitor(served)) {
                return;
            }
        }
    }
    // Here: leaves this provider as it is.
    IProvider& operator=(const IProvider&) override { return *this; }

  private:
    std::string fName;
    std::string fModule;
    std::string fDescription;
    std::vector<boost::shared_ptr<ICIMClass>> fClasses;
};

} // namespace NKOLVRX20
