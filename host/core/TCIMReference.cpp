// SPDX-License-Identifier: MIT
#include <host/ICIMInstance.h>
#include <host/ICIMNamespace.h>
#include <host/TCIMReference.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {
namespace {

// Returns: where the class name begins in "//host[:port]/ns:Class.k=v", "ns:Class.k=v" or "Class.k=v". The search ends
// where the keys begin, because their values may hold colons.
std::size_t ClassNameAt(const std::string& path, std::size_t from)
{
    const std::size_t colon = path.find(':', from);
    const std::size_t keys = path.find_first_of(".=\"", from);
    return colon != std::string::npos && (keys == std::string::npos || colon < keys) ? colon + 1 : from;
}

// A host name has dots and colons of its own; it ends at the next slash.
std::size_t AfterHost(const std::string& path)
{
    if (path.compare(0, 2, "//") != 0) {
        return 0;
    }
    const std::size_t slash = path.find('/', 2);
    return slash == std::string::npos ? path.size() : slash + 1;
}

} // namespace

TCIMReference::TCIMReference() = default;

TCIMReference::TCIMReference(const boost::shared_ptr<ICIMNamespace>& ns, const TCIMContext& keys)
    : fNamespace(ns), fKeys(keys.empty() ? nullptr : new TCIMContext(keys))
{
}

TCIMReference::TCIMReference(const TCIMReference&) = default;
TCIMReference& TCIMReference::operator=(const TCIMReference&) = default;
TCIMReference::~TCIMReference() = default;

void TCIMReference::SetNamespace(const boost::shared_ptr<ICIMNamespace>& ns)
{
    fNamespace = ns;
}

boost::shared_ptr<ICIMNamespace> TCIMReference::GetNamespace() const
{
    return fNamespace.lock();
}

void TCIMReference::SetPath(const std::string& path)
{
    fPath = path;
}

const std::string& TCIMReference::GetPath() const
{
    return fPath;
}

std::string TCIMReference::GetClassName() const
{
    const std::size_t begin = ClassNameAt(fPath, AfterHost(fPath));
    const std::size_t end = fPath.find('.', begin);
    return fPath.substr(begin, end == std::string::npos ? end : end - begin);
}

const TCIMContext& TCIMReference::GetKeys() const
{
    static const TCIMContext fgNone;
    return fKeys ? *fKeys : fgNone;
}

bool TCIMReference::operator==(const TCIMReference& other) const
{
    return fPath == other.fPath;
}

bool TCIMReference::operator<(const TCIMReference& other) const
{
    return fPath < other.fPath;
}

// The only body of the interface; it also anchors the type information of ICIMInstance in this library.
TCIMReference ICIMInstance::BuildPath(TCIMContext context) const
{
    return GetReference(context);
}

} // namespace NKOLVRX20
