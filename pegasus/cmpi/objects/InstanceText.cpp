// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/services/DeclaredProperty.h"
#include "pegasus/cmpi/services/PropertyFilter.h"
#include "pegasus/common/NameAccess.h"
#include "pegasus/wire/ElementEncoder.h"

// An instance as the XML of an answer, written from its values and the texts of its class.
namespace Pegasus::cmpi {
namespace {

constexpr wire::Blanks kBlanks = wire::Blanks::kRaw; // how OpenPegasus passes a provider's texts on

// Appends the property of an instance that may or may not have set it.
void appendDeclared(std::string& out, const PropertySchema& declared, const ProviderValue& value)
{
    if (declared.start.empty()) {
        wire::appendProperty(out, propertyOf(declared, value.isSet() ? value.value() : declared.initial), kBlanks);
    } else if (!value.isSet()) {
        out += declared.unset;
    } else if (value.isPlain()) {
        out += declared.start;
        out += "<VALUE>";
        value.appendText(out);
        out += "</VALUE>\n</PROPERTY>\n";
    } else {
        out += declared.start;
        wire::appendValue(out, value.value(), kBlanks);
        out += "</PROPERTY>\n";
    }
}

} // namespace

// Appends the path as INSTANCENAME if it consists of the class's keys, all with plain values.
// Returns: false, with nothing appended, for any other.
bool InstanceObject::appendPlainName(std::string& out) const
{
    if (fPath.schema == nullptr || fPathKeys != 0) {
        return false;
    }
    const std::size_t size = out.size();
    out += fPath.schema->nameStart();
    std::size_t ofPath = 0;
    for (const std::size_t at : fPath.schema->keys()) {
        const PropertySchema& declared = fPath.schema->properties()[at];
        const PathKey* const key = fPath.findKey(declared.name);
        const ProviderValue& value = key != nullptr ? key->value : fValues[at];
        const bool isSpelled = key == nullptr || key->name.getString() == declared.name.getString();
        if (declared.keyStart.empty() || !value.isPlain() || value.type() != declared.type || !isSpelled) {
            out.resize(size);
            return false;
        }
        ofPath += key != nullptr ? 1 : 0;
        out += declared.keyStart;
        value.appendText(out);
        out += "</KEYVALUE>\n</KEYBINDING>\n";
    }
    out += "</INSTANCENAME>\n";
    if (ofPath != fPath.keys.size()) {
        out.resize(size);
    }
    return out.size() > size;
}

void InstanceObject::appendDelivered(std::string& out, const PropertyFilter& filter) const
{
    notNull(fPath.className); // as delivered() does
    out += "<VALUE.NAMEDINSTANCE>\n";
    if (!appendPlainName(out)) {
        wire::appendInstanceName(out, deliveredPath(), kBlanks);
    }
    if (fPath.schema == nullptr) {
        wire::appendInstanceStart(out, fPath.className);
    } else {
        out += fPath.schema->instanceStart();
        const auto& declared = fPath.schema->properties();
        for (const std::size_t i : filter.passing(*fPath.schema)) {
            appendDeclared(out, declared[i], fValues[i]);
        }
    }
    for (const NamedValue* extra : undeclared(filter)) {
        wire::appendProperty(out, CIMProperty(extra->name, extra->value), kBlanks);
    }
    out += "</INSTANCE>\n</VALUE.NAMEDINSTANCE>\n";
}

} // namespace Pegasus::cmpi
