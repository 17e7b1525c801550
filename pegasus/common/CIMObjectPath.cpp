// SPDX-License-Identifier: MIT
#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMObjectPathRep.h"
#include "pegasus/common/ObjectPathParser.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>
#include <vector>

namespace Pegasus {

template class RepPointer<CIMObjectPathRep>;

namespace {

using Rep = CIMObjectPathRep;

const Rep& repOf(const RepPointer<Rep>& pointer)
{
    static const Rep kEmpty;
    return pointer ? *pointer : kEmpty;
}

[[noreturn]] void throwMalformed(const String& text, const std::string& reason)
{
    throw MalformedObjectNameException(text + String((", reason:\"" + reason + "\"").c_str()));
}

String checkedHost(const String& host)
{
    if (host.size() > 0 && !path::isHost(base::utf8(host))) {
        throwMalformed(host, "invalid hostname");
    }
    return host;
}

bool isBefore(const CIMKeyBinding& x, const CIMKeyBinding& y)
{
    return String::compareNoCase(x.getName().getString(), y.getName().getString()) < 0;
}

// In the order of the names; equal names stay in the order given.
Array<CIMKeyBinding> sorted(const Array<CIMKeyBinding>& keys)
{
    const CIMKeyBinding* data = keys.getData();
    if (std::is_sorted(data, data + keys.size(), isBefore)) {
        return keys;
    }
    std::vector<CIMKeyBinding> copy(data, data + keys.size());
    std::stable_sort(copy.begin(), copy.end(), isBefore);
    return Array<CIMKeyBinding>(copy.data(), keys.size());
}

CIMKeyBinding::Type typeOf(path::KeyKind kind)
{
    switch (kind) {
    case path::KeyKind::kBoolean:
        return CIMKeyBinding::BOOLEAN;
    case path::KeyKind::kNumeric:
        return CIMKeyBinding::NUMERIC;
    case path::KeyKind::kReference:
        return CIMKeyBinding::REFERENCE;
    default:
        return CIMKeyBinding::STRING;
    }
}

RepPointer<Rep> parse(const String& text)
{
    path::Parts parts;
    const std::string reason = path::parse(base::utf8(text), parts);
    if (!reason.empty()) {
        throwMalformed(text, reason);
    }
    RepPointer<Rep> rep(new Rep());
    rep->fHost = base::fromUtf8(parts.host);
    if (!parts.nameSpace.empty()) {
        rep->fNameSpace = base::fromUtf8(parts.nameSpace);
    }
    rep->fClassName = base::fromUtf8(parts.className);
    Array<CIMKeyBinding> keys;
    for (const path::Key& key : parts.keys) {
        keys.append(CIMKeyBinding(base::fromUtf8(key.name), base::fromUtf8(key.value), typeOf(key.kind)));
    }
    rep->fKeys = sorted(keys);
    return rep;
}

void appendQuoted(std::string& out, const String& value)
{
    out += '"';
    for (const char c : base::utf8(value)) {
        if (c == '"' || c == '\\') {
            out += '\\';
        }
        out += c;
    }
    out += '"';
}

void appendKey(std::string& out, const CIMKeyBinding& key)
{
    base::appendUtf8(out, key.getName().getString());
    out += '=';
    if (key.getType() == CIMKeyBinding::STRING || key.getType() == CIMKeyBinding::REFERENCE) {
        appendQuoted(out, key.getValue());
    } else {
        base::appendUtf8(out, key.getValue());
    }
}

std::string format(const Rep& rep)
{
    std::string out;
    if (rep.fHost.size() > 0) {
        out = "//" + base::utf8(rep.fHost) + "/";
    }
    if (rep.fHost.size() > 0 || !rep.fNameSpace.isNull()) {
        out += base::utf8(rep.fNameSpace.getString()) + ":";
    }
    base::appendUtf8(out, rep.fClassName.getString());
    char separator = '.';
    for (Uint32 i = 0; i < rep.fKeys.size(); ++i, separator = ',') {
        out += separator;
        appendKey(out, rep.fKeys[i]);
    }
    return out;
}

bool sameKeys(const Array<CIMKeyBinding>& x, const Array<CIMKeyBinding>& y)
{
    return x.size() == y.size() && std::equal(x.getData(), x.getData() + x.size(), y.getData());
}

// FNV-1a that ignores ASCII case.
class Hash
{
  public:
    void add(const String& text)
    {
        for (Uint32 i = 0; i < text.size(); ++i) {
            add(base::lowerAscii(text.getChar16Data()[i]));
        }
        add(Uint16(0));
    }
    void add(Uint16 unit) { fValue = (fValue ^ unit) * 16777619u; }
    Uint32 value() const { return fValue; }

  private:
    Uint32 fValue = 2166136261u;
};

} // namespace

CIMObjectPath::CIMObjectPath(const String& objectName) : fRep(parse(objectName)) {}

CIMObjectPath::CIMObjectPath(const String& host, const CIMNamespaceName& nameSpace, const CIMName& className,
                             const Array<CIMKeyBinding>& keyBindings)
{
    set(host, nameSpace, className, keyBindings);
}

CIMObjectPath& CIMObjectPath::operator=(const String& objectName)
{
    fRep = parse(objectName);
    return *this;
}

void CIMObjectPath::clear()
{
    fRep = RepPointer<CIMObjectPathRep>();
}

void CIMObjectPath::set(const String& host, const CIMNamespaceName& nameSpace, const CIMName& className,
                        const Array<CIMKeyBinding>& keyBindings)
{
    RepPointer<CIMObjectPathRep> rep(new CIMObjectPathRep());
    rep->fHost = checkedHost(host);
    rep->fNameSpace = nameSpace;
    rep->fClassName = className;
    rep->fKeys = sorted(keyBindings);
    fRep = rep;
}

void CIMObjectPath::set(const String& objectName)
{
    fRep = parse(objectName);
}

const String& CIMObjectPath::getHost() const
{
    return repOf(fRep).fHost;
}

void CIMObjectPath::setHost(const String& host)
{
    writable(fRep).fHost = checkedHost(host);
}

const CIMNamespaceName& CIMObjectPath::getNameSpace() const
{
    return repOf(fRep).fNameSpace;
}

void CIMObjectPath::setNameSpace(const CIMNamespaceName& nameSpace)
{
    writable(fRep).fNameSpace = nameSpace;
}

const CIMName& CIMObjectPath::getClassName() const
{
    return repOf(fRep).fClassName;
}

void CIMObjectPath::setClassName(const CIMName& className)
{
    writable(fRep).fClassName = className;
}

const Array<CIMKeyBinding>& CIMObjectPath::getKeyBindings() const
{
    return repOf(fRep).fKeys;
}

void CIMObjectPath::setKeyBindings(const Array<CIMKeyBinding>& keyBindings)
{
    writable(fRep).fKeys = sorted(keyBindings);
}

String CIMObjectPath::toString() const
{
    return base::fromUtf8(format(repOf(fRep)));
}

Boolean CIMObjectPath::identical(const CIMObjectPath& path) const
{
    if (fRep.get() == path.fRep.get()) {
        return true;
    }
    const Rep& x = repOf(fRep);
    const Rep& y = repOf(path.fRep);
    return x.fClassName.equal(y.fClassName) && x.fNameSpace.equal(y.fNameSpace) &&
           String::equalNoCase(x.fHost, y.fHost) && sameKeys(x.fKeys, y.fKeys);
}

Uint32 CIMObjectPath::makeHashCode() const
{
    // Values of numbers and references can be equal and written differently: only the names of keys count.
    const Rep& rep = repOf(fRep);
    Hash hash;
    hash.add(rep.fHost);
    hash.add(rep.fNameSpace.getString());
    hash.add(rep.fClassName.getString());
    for (Uint32 i = 0; i < rep.fKeys.size(); ++i) {
        hash.add(rep.fKeys[i].getName().getString());
        if (rep.fKeys[i].getType() == CIMKeyBinding::STRING) {
            hash.add(rep.fKeys[i].getValue());
        }
    }
    return hash.value();
}

Boolean operator==(const CIMObjectPath& x, const CIMObjectPath& y)
{
    return x.identical(y);
}

Boolean operator!=(const CIMObjectPath& x, const CIMObjectPath& y)
{
    return !x.identical(y);
}

} // namespace Pegasus
