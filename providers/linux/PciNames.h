// SPDX-License-Identifier: MIT
#pragma once

#include "providers/linux/SystemTree.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace lnx {

// The names of PCI vendors and devices, from the file pci.ids of the package with that name. It is optional: without
// it, or for a number that it lacks, a name is absent. A name of more than kMaxNameBytes counts as absent. Throws:
// std::bad_alloc. Thread: const members.
class PciNames
{
  public:
    static constexpr std::size_t kMaxNameBytes = 256;

    explicit PciNames(const SystemTree& tree);
    explicit PciNames(std::string text);
    PciNames(const PciNames&) = delete;
    PciNames& operator=(const PciNames&) = delete;

    std::optional<std::string> vendor(std::optional<std::uint16_t> vendorId) const;
    std::optional<std::string> device(std::optional<std::uint16_t> vendorId,
                                      std::optional<std::uint16_t> deviceId) const;

  private:
    std::size_t findVendor(std::uint16_t id) const;

    std::string fText;
    std::vector<std::string_view> fLines; // of fText
};

} // namespace lnx
