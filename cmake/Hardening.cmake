# SPDX-License-Identifier: MIT
# Flags that make a fault of the programs hard to exploit, for the targets of the current folder and of those that are
# added after this. tools/check hardening looks for them in the compile commands and in the files of a staged tree.
# The release preset switches them on. The builds with sanitizers keep to the sanitizers' own checks.
option(VRX_HARDENING "Stack protector, FORTIFY, BIND_NOW and the like in the product" OFF)
if(NOT VRX_HARDENING OR CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  return()
endif()
include(CheckCXXSourceCompiles)
include(CheckPIESupported)

check_pie_supported()
add_compile_options(-fstack-protector-strong -fstack-clash-protection -fcf-protection=full)
add_compile_definitions($<$<COMPILE_LANGUAGE:CXX>:_GLIBCXX_ASSERTIONS>)
# GCC 12 takes the checked assignment of a text for an overlapping copy (its bug 105651).
add_compile_options($<$<AND:$<CXX_COMPILER_ID:GNU>,$<COMPILE_LANGUAGE:CXX>>:-Wno-restrict>)
add_link_options(-Wl,-z,relro -Wl,-z,now -Wl,-z,noexecstack)

# Level 3 needs GCC 12 or clang, and glibc 2.34; an older glibc warns. Without optimisation the checks are not made.
set(CMAKE_REQUIRED_FLAGS "-O2 -Werror -U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=3")
check_cxx_source_compiles(
  "#include <cstring>
   int main(int argc, char** argv) { return static_cast<int>(__builtin_dynamic_object_size(argv[argc - 1], 0)); }"
  VRX_HAS_FORTIFY_3)
unset(CMAKE_REQUIRED_FLAGS)
set(VRX_FORTIFY_LEVEL 2)
if(VRX_HAS_FORTIFY_3)
  set(VRX_FORTIFY_LEVEL 3)
endif()
add_compile_options("$<$<NOT:$<CONFIG:Debug>>:-U_FORTIFY_SOURCE;-D_FORTIFY_SOURCE=${VRX_FORTIFY_LEVEL}>")
