// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/Capabilities.h"

#include <algorithm>
#include <iterator>
#include <string_view>

#include <linux/capability.h>
#include <sys/prctl.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace Pegasus::server {

namespace {

// In the order of their numbers.
constexpr std::string_view kNames[] = {"chown",
                                       "dac_override",
                                       "dac_read_search",
                                       "fowner",
                                       "fsetid",
                                       "kill",
                                       "setgid",
                                       "setuid",
                                       "setpcap",
                                       "linux_immutable",
                                       "net_bind_service",
                                       "net_broadcast",
                                       "net_admin",
                                       "net_raw",
                                       "ipc_lock",
                                       "ipc_owner",
                                       "sys_module",
                                       "sys_rawio",
                                       "sys_chroot",
                                       "sys_ptrace",
                                       "sys_pacct",
                                       "sys_admin",
                                       "sys_boot",
                                       "sys_nice",
                                       "sys_resource",
                                       "sys_time",
                                       "sys_tty_config",
                                       "mknod",
                                       "lease",
                                       "audit_write",
                                       "audit_control",
                                       "setfcap",
                                       "mac_override",
                                       "mac_admin",
                                       "syslog",
                                       "wake_alarm",
                                       "block_suspend",
                                       "audit_read",
                                       "perfmon",
                                       "bpf",
                                       "checkpoint_restore"};
static_assert(kNames[CAP_SYS_RAWIO] == "sys_rawio" && kNames[CAP_SYSLOG] == "syslog" &&
              kNames[CAP_CHECKPOINT_RESTORE] == "checkpoint_restore");

} // namespace

std::optional<CapabilitySet> parseCapabilities(const std::string& list)
{
    if (list == "all" || list == "none") {
        return list == "all" ? kAllCapabilities : 0;
    }
    CapabilitySet set = 0;
    for (std::size_t begin = 0; begin <= list.size();) {
        const std::size_t end = std::min(list.find(',', begin), list.size());
        const std::string_view name = std::string_view(list).substr(begin, end - begin);
        const auto* const found = std::find(std::begin(kNames), std::end(kNames), name);
        if (found == std::end(kNames)) {
            return std::nullopt;
        }
        set |= CapabilitySet{1} << (found - std::begin(kNames));
        begin = end + 1;
    }
    return set;
}

void keepCapabilities(CapabilitySet kept)
{
    for (int number = 0; ::prctl(PR_CAPBSET_READ, number) >= 0; ++number) {
        if ((kept >> number & 1) == 0) {
            ::prctl(PR_CAPBSET_DROP, number);
        }
    }
    __user_cap_header_struct header = {_LINUX_CAPABILITY_VERSION_3, 0};
    __user_cap_data_struct data[_LINUX_CAPABILITY_U32S_3] = {};
    ::syscall(SYS_capget, &header, data);
    for (__user_cap_data_struct& part : data) {
        const auto mask = static_cast<std::uint32_t>(kept);
        part.permitted &= mask;
        part.effective &= mask;
        part.inheritable &= mask;
        kept >>= 32;
    }
    ::syscall(SYS_capset, &header, data);
}

} // namespace Pegasus::server
