#pragma once

#include "pegasus/cmpi/include/cmpi/cmpi.h"

#include <string>

namespace Pegasus::cmpi {

// A loaded vendor library and its entry points.
class ProviderLibrary
{
  public:
    // Throws: CIM_ERR_FAILED with the loader's words.
    // Blocks: as long as the library's own initialisers do.
    explicit ProviderLibrary(const std::string& path);
    ~ProviderLibrary();
    ProviderLibrary(const ProviderLibrary&) = delete;
    ProviderLibrary& operator=(const ProviderLibrary&) = delete;

    const std::string& path() const { return fPath; }

    // Requires that the provider has entry points of one style, specific (<provider>_Create_...) or generic, and only
    // one. Throws: CIM_ERR_FAILED "ProviderLoadFailure: ...".
    void requireProvider(const std::string& provider) const;

    // Makes the provider's interface of one kind ("Instance", "Method") by its factory.
    // Returns: null when the library has no factory of that kind for the provider.
    // Throws: CIM_ERR_FAILED "ProviderInitFailure: ..." when the factory fails.
    template <class Interface>
    Interface* create(const std::string& kind, const std::string& provider, const CMPIBroker& broker,
                      const CMPIContext& context) const
    {
        return static_cast<Interface*>(createAny(kind, provider, broker, context));
    }

  private:
    void* symbol(const std::string& name) const;
    void* createAny(const std::string& kind, const std::string& provider, const CMPIBroker& broker,
                    const CMPIContext& context) const;

    std::string fPath;
    void* fHandle;
};

} // namespace Pegasus::cmpi
