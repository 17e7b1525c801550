// SPDX-License-Identifier: MIT
// A careless provider. An input is a sequence of its calls: the first byte chooses strict providers and the form of
// delivered instances, objects or XML; then each call is a byte for the function and bytes for its arguments. Objects
// lie in a few places of each kind, so that later calls use those that earlier ones made; a place may be empty, and any
// argument may be null or an object without a handle. Objects that were released are not passed again, since no broker
// survives that.
//
// Every call answers: a function of the factories gives an object or an error. What is delivered can be written as
// CIM-XML and read again.
#include "fuzz/cmpi_broker/CallInput.h"
#include "fuzz/cmpi_broker/CarelessProvider.h"
#include "fuzz/cmpi_broker/FuzzServices.h"
#include "fuzz/cmpi_broker/Require.h"
#include "pegasus/cmpi/broker/BrokerTables.h"
#include "pegasus/cmpi/objects/ArgsObject.h"
#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/ContextObject.h"
#include "pegasus/cmpi/objects/ObjectPathObject.h"
#include "pegasus/cmpi/objects/ResultObject.h"
#include "pegasus/cmpi/services/PropertyFilter.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/ElementEncoder.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

using namespace Pegasus;
using namespace Pegasus::cmpi;

namespace {

void checkInstance(const CIMInstance& instance)
{
    std::string text;
    wire::appendInstance(text, instance);
    wire::XmlDocument document;
    wire::ElementDecoder decoder;
    const CIMInstance again = decoder.decodeInstance(document.parseFragment(text));
    fuzz::require(again.getPropertyCount() == instance.getPropertyCount());
}

void checkText(std::string_view element)
{
    wire::XmlDocument document;
    wire::ElementDecoder decoder;
    decoder.decodeNamedInstance(document.parseFragment(element));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static fuzz::FuzzServices fgServices;
    fuzz::CallInput in(data, size);
    const unsigned choice = in.byte();
    fgServices.strict = choice % 2 != 0;
    Broker broker(fgServices, brokerTables());
    ProviderRequest request;
    request.provider = "Fuzz";
    request.nameSpace = CIMNamespaceName(fuzz::kNamespace);
    Array<CIMParamValue> parameters;
    parameters.append(CIMParamValue(String("Text"), CIMValue(String("x"))));
    const PropertyFilter filter;
    ContextObject context(broker, request, 1);
    const Frame frame(context.origin);
    ObjectPathObject path(broker, CIMObjectPath(String("root/fuzz:F.Id=\"1\",Number=2")));
    ArgsObject given(broker, parameters, request.nameSpace);
    ArgsObject out(broker);
    ResultObject texts(filter, checkText);
    ResultObject objects(
        filter, checkInstance, [](const CIMObjectPath& delivered) { delivered.toString(); },
        [](const CIMValue& delivered) { delivered.toString(); });
    ResultObject& result = choice / 2 % 2 != 0 ? texts : objects;
    context.lifetime = path.lifetime = given.lifetime = out.lifetime = Lifetime::kArgument;
    broker.classes().beginRequest();
    fuzz::CarelessProvider(in, {&broker, &context, &path, &given, &out, &result}).run();
    out.parameters();
    result.rethrow();
    return 0;
}
