// SPDX-License-Identifier: MIT
// The repository's round trip. An input is an element of any name whose children are QUALIFIER.DECLARATION, CLASS and
// INSTANCE elements; each is stored if the repository takes it. What is read at once, from memory, equals what is read
// after the repository was closed and opened, from the file; an instance has the values that it was given.
#include "pegasus/repository/Repository.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/ElementEncoder.h"
#include "tests/support/FuzzFolder.h"

#include <Pegasus/Common/Exception.h>

#include <cstdint>
#include <cstdlib>
#include <string>

using namespace Pegasus;
using repository::Repository;

namespace {

const char* const kNamespace = "root/fuzz";

void fill(const std::string& folder)
{
    Repository repository(folder);
    repository.createNamespace(CIMNamespaceName(kNamespace));
    repository.setQualifier(CIMNamespaceName(kNamespace),
                            CIMQualifierDecl(CIMName("Key"), CIMValue(Boolean(false)), CIMScope(CIMScope::PROPERTY)));
}

void require(bool holds)
{
    if (!holds) {
        std::abort();
    }
}

// Everything that the repository has, as text.
std::string contentOf(const Repository& repository)
{
    const CIMNamespaceName nameSpace(kNamespace);
    std::string text;
    for (const CIMQualifierDecl& declaration : repository.enumerateQualifiers(nameSpace)) {
        wire::appendQualifierDeclaration(text, declaration);
    }
    for (const CIMName& name : repository.enumerateClassNames(nameSpace, CIMName(), true)) {
        for (const bool localOnly : {false, true}) {
            const repository::ClassOptions options{localOnly, true, true, {}};
            std::string element;
            wire::appendClass(element, repository.getClass(nameSpace, name, options));
            require(*repository.getClassText(nameSpace, name, options) == element);
            text += element;
        }
    }
    for (const CIMName& name : repository.enumerateClassNames(nameSpace, CIMName(), false)) {
        repository::InstanceOptions options;
        options.includeClassOrigin = true;
        repository.enumerateInstances(nameSpace, name, options, [&](const CIMInstance& instance) {
            std::string element;
            wire::appendNamedInstance(element, instance);
            std::string again;
            wire::appendNamedInstance(again, repository.getInstance(nameSpace, instance.getPath(), options));
            require(again == element);
            text += element;
            return true;
        });
    }
    return text;
}

std::string textOf(const CIMValue& value)
{
    std::string text;
    wire::appendValue(text, value);
    return text;
}

void checkValues(const CIMInstance& given, const CIMInstance& stored)
{
    for (Uint32 i = 0; i < given.getPropertyCount(); ++i) {
        const CIMConstProperty property = given.getProperty(i);
        const Uint32 found = stored.findProperty(property.getName());
        require(found != PEG_NOT_FOUND);
        require(textOf(stored.getProperty(found).getValue()) == textOf(property.getValue()));
    }
}

void store(Repository& repository, const wire::XmlElement& element, wire::ElementDecoder& decoder)
{
    const CIMNamespaceName nameSpace(kNamespace);
    if (element.is("QUALIFIER.DECLARATION")) {
        repository.setQualifier(nameSpace, decoder.decodeQualifierDeclaration(element));
    } else if (element.is("CLASS")) {
        repository.createClass(nameSpace, decoder.decodeClass(element));
    } else if (element.is("INSTANCE")) {
        const CIMInstance given = decoder.decodeInstance(element);
        const CIMObjectPath path = repository.createInstance(nameSpace, given);
        checkValues(given, repository.getInstance(nameSpace, path, {}));
        CIMInstance again = given.clone();
        again.setPath(path);
        repository.modifyInstance(nameSpace, again, CIMPropertyList());
        checkValues(given, repository.getInstance(nameSpace, path, {}));
    }
}

// Stores what can be stored. An element that is refused leaves the others.
void storeAll(Repository& repository, std::string& text)
{
    wire::XmlDocument document;
    wire::ElementDecoder decoder;
    try {
        const wire::XmlElement root = document.parseFragment(text);
        for (wire::XmlElement child = root.firstChild(); child; child = child.nextSibling()) {
            try {
                store(repository, child, decoder);
            } catch (const Exception&) { // not stored
            }
        }
    } catch (const wire::XmlError&) { // the rest is not XML
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static const test::FuzzFolder fgTemplate("repository", fill);
    const test::FuzzFolder home = fgTemplate.copy();
    const std::string folder = home.path() + "/repository";
    std::string text(reinterpret_cast<const char*>(data), size);
    std::string before;
    {
        Repository repository(folder);
        storeAll(repository, text);
        before = contentOf(repository);
    }
    require(contentOf(Repository(folder)) == before);
    return 0;
}
