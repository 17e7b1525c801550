// SPDX-License-Identifier: MIT
#include "pegasus/repository/QualifierStore.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"

namespace Pegasus::repository {

namespace {

// A schema has about a hundred declarations. Beyond this number the memory starts over: choosing which to drop would
// cost more than decoding them again.
constexpr std::size_t kMaxKnown = 4096;

} // namespace

// FNV-1a over the name in lower case. A new class looks up dozens of declarations: the name itself is the key, since
// making a text of it would take longer than all the rest.
std::size_t QualifierStore::Hash::operator()(const Key& key) const noexcept
{
    auto hash = static_cast<std::uint64_t>(key.nameSpace) ^ 0xcbf29ce484222325u;
    const String& name = key.name.getString();
    const Char16* const units = name.getChar16Data();
    for (Uint32 i = 0; i < name.size(); ++i) {
        hash = (hash ^ base::lowerAscii(Uint16(units[i]))) * 0x100000001b3u;
    }
    return static_cast<std::size_t>(hash);
}

CIMQualifierDecl QualifierStore::find(NamespaceId nameSpace, const CIMName& name)
{
    const Key key{nameSpace, name};
    std::optional<std::string> text;
    std::uint64_t setCount = 0;
    {
        const Lock lock(fMutex);
        const auto known = fKnown.find(key);
        if (known != fKnown.end()) {
            return known->second;
        }
        text = fStorage.findQualifier(nameSpace, base::utf8(name));
        setCount = fSetCount;
    }
    if (!text) {
        return CIMQualifierDecl();
    }
    CIMQualifierDecl found = ObjectDecoder(fEncoder).decodeQualifier(std::move(*text));
    const Lock lock(fMutex);
    if (fKnown.size() >= kMaxKnown) {
        fKnown.clear();
    }
    if (setCount == fSetCount) {
        fKnown[key] = found;
    }
    return found;
}

std::vector<CIMQualifierDecl> QualifierStore::list(NamespaceId nameSpace)
{
    std::vector<std::string> texts;
    {
        const Lock lock(fMutex);
        texts = fStorage.listQualifiers(nameSpace);
    }
    ObjectDecoder decoder(fEncoder);
    std::vector<CIMQualifierDecl> all;
    for (std::string& text : texts) {
        all.push_back(decoder.decodeQualifier(std::move(text)));
    }
    return all;
}

void QualifierStore::set(NamespaceId nameSpace, const CIMConstQualifierDecl& declaration)
{
    const std::lock_guard<std::mutex> alone(fSetting);
    const CIMName& name = declaration.getName();
    const CIMQualifierDecl existing = find(nameSpace, name);
    if (!existing.isUninitialized() &&
        (existing.getType() != declaration.getType() || existing.isArray() != declaration.isArray()))
    {
        return;
    }
    const std::string text = fEncoder.encodeQualifier(declaration);
    const Lock lock(fMutex);
    fStorage.putQualifier(nameSpace, base::utf8(name), text);
    fKnown.erase(Key{nameSpace, name});
    ++fSetCount;
}

} // namespace Pegasus::repository
