// SPDX-License-Identifier: MIT
#include "fuzz/cmpi_broker/FuzzServices.h"

#include "fuzz/cmpi_broker/CallInput.h"
#include "fuzz/cmpi_broker/Require.h"
#include "pegasus/mof/Compiler.h"

#include <cstring>

using namespace Pegasus;

namespace fuzz {

namespace {

constexpr char kMof[] = R"(
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);
Qualifier EmbeddedObject : boolean = false, Scope(property), Flavor(DisableOverride, ToSubclass);
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride, ToSubclass);
class F { [Key] string Id; [Key] uint16 Number; string Text = "given"; boolean B; char16 C; sint64 N; real32 R;
    real64 L; datetime D; string SA[]; uint16 UA[]; datetime DA[]; char16 CA[]; [EmbeddedObject] string E;
    [EmbeddedObject] string EA[]; };
class G : F { uint8 Small; };
[Association] class Link { [Key] F REF From; [Key] F REF To; };
)";

} // namespace

FuzzServices::FuzzServices()
{
    mof::CompileOptions options;
    options.nameSpace = CIMNamespaceName(kNamespace);
    mof::compileText(kMof, "fuzz.mof", options, fDefinitions);
}

CIMClass FuzzServices::getClass(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    CIMClass found;
    if (!nameSpace.equal(CIMNamespaceName(kNamespace)) || !fDefinitions.findClass(className, found)) {
        throw CIMException(CIM_ERR_NOT_FOUND, className.getString());
    }
    return found;
}

CIMInstance FuzzServices::getInstance(const CIMNamespaceName&, const CIMObjectPath& path, const CIMPropertyList&)
{
    CIMInstance instance{path.getClassName()};
    instance.addProperty(CIMProperty(CIMName("Id"), CIMValue(String("1"))));
    instance.setPath(path);
    return instance;
}

Array<CIMInstance> FuzzServices::enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                    const CIMPropertyList& properties)
{
    Array<CIMInstance> found;
    found.append(getInstance(nameSpace, CIMObjectPath(String::EMPTY, nameSpace, className), properties));
    return found;
}

Array<CIMObjectPath> FuzzServices::enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    Array<CIMObjectPath> found;
    found.append(CIMObjectPath(String::EMPTY, nameSpace, className));
    return found;
}

CIMValue FuzzServices::invokeMethod(const CIMNamespaceName&, const CIMObjectPath&, const CIMName& method,
                                    const Array<CIMParamValue>& in, Array<CIMParamValue>& out)
{
    out = in;
    return in.size() == 0 ? CIMValue(method.getString()) : in[0].getValue();
}

void FuzzServices::log(Severity, const std::string& text) noexcept
{
    require(std::strlen(text.c_str()) == text.size());
}

} // namespace fuzz
