// SPDX-License-Identifier: MIT
#pragma once

#include <cmpi/cmpi.h>

#include <string>
#include <vector>

namespace Pegasus::cmpi {

// A loaded vendor library and its entry points.
class ProviderLibrary
{
  public:
    // Throws: CIM_ERR_FAILED with the loader's message.
    // Blocks: as long as the library's own initialisers.
    explicit ProviderLibrary(const std::string& path);
    ~ProviderLibrary();
    ProviderLibrary(const ProviderLibrary&) = delete;
    ProviderLibrary& operator=(const ProviderLibrary&) = delete;

    // Checks that the provider has entry points of exactly one style, specific (<provider>_Create_...) or generic.
    // Throws: CIM_ERR_FAILED "ProviderLoadFailure: ...".
    void requireProvider(const std::string& provider) const;

    // Returns: a sentence that names the library and the functions that would make a provider's interface of this kind.
    std::string missingFactories(const std::string& kind, const std::string& provider) const;

    // Makes the provider's interface of one kind ("Instance", "Method") by its factory.
    // Returns: null when the library lacks a factory of that kind for the provider.
    // Throws: CIM_ERR_FAILED "ProviderInitFailure: ..." when the factory fails, or its interface lacks a function
    // table.
    template <typename Interface>
    Interface* create(const std::string& kind, const std::string& provider, const CMPIBroker& broker,
                      const CMPIContext& context) const
    {
        auto* const made = static_cast<Interface*>(createAny(kind, provider, broker, context));
        if (made != nullptr && made->ft == nullptr) {
            failWithoutTable(kind, provider);
        }
        return made;
    }

  private:
    void* symbol(const std::string& name) const;
    void* createAny(const std::string& kind, const std::string& provider, const CMPIBroker& broker,
                    const CMPIContext& context) const;

    [[noreturn]] void failWithoutTable(const std::string& kind, const std::string& provider) const;

    std::string fPath;
    void* fHandle;
};

// Finds the file that a PG_ProviderModule's Location names: lib<location>.so in the first directory that has it.
// Throws: CIM_ERR_FAILED `File "lib<location>.so" was not found for provider module "<module>".`
std::string findProviderLibrary(const std::vector<std::string>& directories, const std::string& location,
                                const std::string& moduleName);

} // namespace Pegasus::cmpi
