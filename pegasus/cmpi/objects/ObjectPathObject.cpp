// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ObjectPathObject.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/KeyCodec.h"
#include "pegasus/cmpi/objects/NamedValues.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <Pegasus/Common/Exception.h>

#include <utility>

namespace Pegasus::cmpi {
namespace {

PathState& stateOf(const CMPIObjectPath* self)
{
    return objectOf<ObjectPathObject>(self).state;
}

CMPIString* textOf(const CMPIObjectPath* self, CMPIStatus* rc, String (*part)(const PathState&))
{
    return answer(rc, static_cast<CMPIString*>(nullptr), [&]() -> CMPIString* {
        return Frame::current().make<StringObject>(base::utf8(part(stateOf(self))));
    });
}

CMPIStatus setNameSpace(const CMPIObjectPath* self, const char* text)
{
    return perform([&] {
        ObjectPathObject& path = objectOf<ObjectPathObject>(self);
        path.state.nameSpace = PathState(path.broker, text, nullptr).nameSpace;
        path.state.lookUp(path.broker);
    });
}

CMPIString* getNameSpace(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return textOf(self, rc, [](const PathState& path) { return path.nameSpace.getString(); });
}

CMPIStatus setHostname(const CMPIObjectPath* self, const char* text)
{
    return perform([&] {
        const String host = base::fromUtf8Repaired(requireText(text));
        const CIMObjectPath path(host, CIMNamespaceName(), CIMName("Any")); // throws for a text that is not a host
        stateOf(self).host = host;
    });
}

CMPIString* getHostname(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return textOf(self, rc, [](const PathState& path) { return path.host; });
}

CMPIStatus setClassName(const CMPIObjectPath* self, const char* text)
{
    return perform([&] {
        ObjectPathObject& path = objectOf<ObjectPathObject>(self);
        path.state.className = requireName(text);
        path.state.lookUp(path.broker);
    });
}

CMPIString* getClassName(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return textOf(self, rc, [](const PathState& path) { return path.className.getString(); });
}

CMPIStatus addKey(const CMPIObjectPath* self, const char* name, const CMPIValue* value, CMPIType type)
{
    return perform([&] { stateOf(self).addKey(name, value, type); });
}

CMPIData getKey(const CMPIObjectPath* self, const char* name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] {
        const ObjectPathObject& path = objectOf<ObjectPathObject>(self);
        const PathKey* key = path.state.findKey(std::string_view(requireText(name)));
        if (key == nullptr) {
            throw CmpiError{CMPI_RC_ERR_NOT_FOUND, {}};
        }
        return encodeKey(path.broker, key->value.value());
    });
}

CMPIData getKeyAt(const CMPIObjectPath* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    return answer(rc, kNothing, [&] {
        const ObjectPathObject& path = objectOf<ObjectPathObject>(self);
        if (index >= path.state.keys.size()) {
            throw CmpiError{CMPI_RC_ERR_NO_SUCH_PROPERTY, {}};
        }
        if (name != nullptr) {
            *name = makeName(path.state.keys[index].name);
        }
        return encodeKey(path.broker, path.state.keys[index].value.value());
    });
}

CMPICount getKeyCount(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return answer(rc, CMPICount{0}, [&] { return static_cast<CMPICount>(stateOf(self).keys.size()); });
}

CMPIStatus setNameSpaceFromObjectPath(const CMPIObjectPath* self, const CMPIObjectPath* source)
{
    return perform([&] {
        ObjectPathObject& path = objectOf<ObjectPathObject>(self);
        path.state.nameSpace = stateOf(source).nameSpace;
        path.state.lookUp(path.broker);
    });
}

CMPIStatus setHostAndNameSpaceFromObjectPath(const CMPIObjectPath* self, const CMPIObjectPath* source)
{
    return perform([&] {
        ObjectPathObject& path = objectOf<ObjectPathObject>(self);
        path.state.host = stateOf(source).host;
        path.state.nameSpace = stateOf(source).nameSpace;
        path.state.lookUp(path.broker);
    });
}

// Not supported: the broker's schema keeps no qualifiers.
CMPIData noQualifier(CMPIStatus* rc)
{
    return answer(rc, kNothing, []() -> CMPIData { throw CmpiError{CMPI_RC_ERR_NOT_SUPPORTED, {}}; });
}

CMPIData getClassQualifier(const CMPIObjectPath*, const char*, CMPIStatus* rc)
{
    return noQualifier(rc);
}

CMPIData getElementQualifier(const CMPIObjectPath*, const char*, const char*, CMPIStatus* rc)
{
    return noQualifier(rc);
}

CMPIData getParameterQualifier(const CMPIObjectPath*, const char*, const char*, const char*, CMPIStatus* rc)
{
    return noQualifier(rc);
}

CMPIString* toString(const CMPIObjectPath* self, CMPIStatus* rc)
{
    return textOf(self, rc, [](const PathState& path) { return path.withNameSpace().toString(); });
}

} // namespace

const CMPIObjectPathFT kObjectPathTable{kTableVersion,
                                        releaseObject<ObjectPathObject, CMPIObjectPath>,
                                        cloneObject<ObjectPathObject, CMPIObjectPath>,
                                        setNameSpace,
                                        getNameSpace,
                                        setHostname,
                                        getHostname,
                                        setClassName,
                                        getClassName,
                                        addKey,
                                        getKey,
                                        getKeyAt,
                                        getKeyCount,
                                        setNameSpaceFromObjectPath,
                                        setHostAndNameSpaceFromObjectPath,
                                        getClassQualifier,
                                        getElementQualifier,
                                        getElementQualifier,
                                        getParameterQualifier,
                                        toString};

ObjectPathObject::ObjectPathObject(Broker& owner, PathState path)
    : CMPIObjectPath{nullptr, &kObjectPathTable}, broker(owner), state(std::move(path))
{
    hdl = this;
}

} // namespace Pegasus::cmpi
