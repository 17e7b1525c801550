// SPDX-License-Identifier: MIT
#include "host/xmlparser/TXmlParserState.h"

#include <algorithm>
#include <new>

namespace NKOLVRX20 {
namespace {

constexpr unsigned int kMaxDepth = 64;

constexpr char kTooDeep[] = "elements are nested deeper than 64 levels";
constexpr char kEntityDeclared[] = "entity declarations are not accepted";
constexpr char kAttributeList[] = "<!ATTLIST";

bool IsPredefined(const std::string& entity)
{
    static constexpr const char* kPredefined[] = {"amp", "lt", "gt", "apos", "quot"};
    return entity[0] == '#' ||
           std::find(std::begin(kPredefined), std::end(kPredefined), entity) != std::end(kPredefined);
}

// Returns: the first entity of a well-formed piece of markup that a DTD must declare; empty if absent.
std::string FindDeclaredEntity(const std::string& markup)
{
    for (std::size_t at = markup.find('&'); at != std::string::npos; at = markup.find('&', at + 1)) {
        std::string entity = markup.substr(at + 1, markup.find(';', at) - at - 1);
        if (!IsPredefined(entity)) {
            return entity;
        }
    }
    return "";
}

} // namespace

void TXmlParser::TState::Install()
{
    fExpat.reset(XML_ParserCreate(nullptr));
    if (!fExpat) {
        throw std::bad_alloc();
    }
    XML_SetUserData(fExpat.get(), this);
    XML_SetElementHandler(fExpat.get(), OnStart, OnEnd);
    XML_SetProcessingInstructionHandler(fExpat.get(), OnInstruction);
    XML_SetCharacterDataHandler(fExpat.get(), OnText);
    XML_SetNotationDeclHandler(fExpat.get(), OnNotation);
    XML_SetEntityDeclHandler(fExpat.get(), OnEntityDeclaration);
    XML_SetNotStandaloneHandler(fExpat.get(), OnUnreadDeclarations);
    XML_SetSkippedEntityHandler(fExpat.get(), OnSkippedEntity);
}

void TXmlParser::TState::RefuseEntity(const std::string& entity)
{
    Refuse("the entity &" + entity + "; is not known: external DTDs and parameter entities are not read");
}

void TXmlParser::TState::RefuseEntitiesOfTag()
{
    if (fHasUnreadDeclarations) {
        fRawMarkup.clear();
        XML_DefaultCurrent(fExpat.get()); // calls OnRawMarkup
        RefuseEntitiesOfRawMarkup();
    }
}

void TXmlParser::TState::RefuseEntitiesOfRawMarkup()
{
    const std::string entity = FindDeclaredEntity(fRawMarkup);
    fRawMarkup.clear();
    if (!entity.empty()) {
        RefuseEntity(entity);
    }
}

void TXmlParser::TState::OnStart(void* state, const XML_Char* name, const XML_Char** attributes)
{
    Deliver(state, [&](TState& self) {
        if (++self.fDepth > kMaxDepth) {
            return self.Refuse(kTooDeep);
        }
        self.RefuseEntitiesOfTag();
        if (self.HasEnded()) {
            return;
        }
        std::map<std::string, std::string> byName;
        for (; *attributes; attributes += 2) {
            byName[attributes[0]] = attributes[1];
        }
        self.fOwner.StartElement(name, byName);
    });
}

void TXmlParser::TState::OnEnd(void* state, const XML_Char* name)
{
    Deliver(state, [&](TState& self) {
        --self.fDepth;
        self.fOwner.EndElement(name);
    });
}

void TXmlParser::TState::OnInstruction(void* state, const XML_Char* target, const XML_Char* data)
{
    Deliver(state, [&](TState& self) { self.fOwner.processingInstruction(target, data); });
}

void TXmlParser::TState::OnText(void* state, const XML_Char* text, int length)
{
    Deliver(state, [&](TState& self) { self.fOwner.characters(text, static_cast<unsigned int>(length)); });
}

void TXmlParser::TState::OnNotation(void* state, const XML_Char* name, const XML_Char*, const XML_Char* systemId,
                                    const XML_Char* publicId)
{
    Deliver(state,
            [&](TState& self) { self.fOwner.notationDecl(name, publicId ? publicId : "", systemId ? systemId : ""); });
}

void TXmlParser::TState::OnEntityDeclaration(void* state, const XML_Char*, int, const XML_Char*, int, const XML_Char*,
                                             const XML_Char*, const XML_Char*, const XML_Char*)
{
    Deliver(state, [&](TState& self) { self.Refuse(kEntityDeclared); });
}

int TXmlParser::TState::OnUnreadDeclarations(void* state)
{
    TState& self = From(state);
    self.fHasUnreadDeclarations = true;
    XML_SetDefaultHandlerExpand(self.fExpat.get(), OnRawMarkup);
    return XML_STATUS_OK;
}

void TXmlParser::TState::OnSkippedEntity(void* state, const XML_Char* name, int isParameterEntity)
{
    if (!isParameterEntity) {
        Deliver(state, [&](TState& self) { self.RefuseEntity(name); });
    }
}

// Called for a tag when RefuseEntitiesOfTag asks, and for markup that the other callbacks leave. A declaration of
// attributes arrives token by token.
void TXmlParser::TState::OnRawMarkup(void* state, const XML_Char* text, int length)
{
    Deliver(state, [&](TState& self) {
        const std::string piece(text, static_cast<std::size_t>(length));
        if (piece == kAttributeList) {
            self.fRawMarkup.clear();
        }
        self.fRawMarkup += piece;
        if (piece == ">" && self.fRawMarkup.compare(0, sizeof kAttributeList - 1, kAttributeList) == 0) {
            self.RefuseEntitiesOfRawMarkup();
        }
    });
}

} // namespace NKOLVRX20
