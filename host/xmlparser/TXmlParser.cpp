#include <host/TXmlParser.h>

#include <expat.h>

#include <algorithm>
#include <exception>
#include <memory>
#include <new>

namespace NKOLVRX20 {
namespace {

constexpr std::size_t kMaxDocumentBytes = 16UL * 1024 * 1024;
constexpr unsigned int kMaxDepth = 64;

constexpr char kTooLarge[] = "the document is larger than 16 MiB";
constexpr char kTooDeep[] = "elements are nested deeper than 64 levels";
constexpr char kEntityDeclared[] = "entity declarations are not accepted";
constexpr char kEntityNotRead[] = "is not known: external DTDs and parameter entities are not read";

constexpr char kAttributeList[] = "<!ATTLIST";

struct TParserDeleter
{
    void operator()(XML_Parser parser) const { XML_ParserFree(parser); }
};
using TExpatParser = std::unique_ptr<XML_ParserStruct, TParserDeleter>;

bool IsPredefined(const std::string& entity)
{
    static constexpr const char* kPredefined[] = {"amp", "lt", "gt", "apos", "quot"};
    return entity[0] == '#' ||
           std::find(std::begin(kPredefined), std::end(kPredefined), entity) != std::end(kPredefined);
}

// Returns: the first entity in a well-formed piece of markup that XML itself does not define; empty if there is none.
std::string FindDeclaredEntity(const std::string& markup)
{
    for (std::size_t at = markup.find('&'); at != std::string::npos; at = markup.find('&', at + 1)) {
        const std::string entity = markup.substr(at + 1, markup.find(';', at) - at - 1);
        if (!IsPredefined(entity)) {
            return entity;
        }
    }
    return "";
}

} // namespace

// The state of one parse, and the bridge from expat's C callbacks. Exceptions must stay out of expat's C frames: one
// that a callback throws is kept, ends the parse, and is thrown again by Parse.
//
// After an unread DTD or parameter entity, expat assumes that unknown entities are declared there, and silently drops
// references to them in attribute values. So the raw text of tags and attribute declarations is searched for
// references.
struct TXmlParser::TState
{
    explicit TState(TXmlParser& owner) : fOwner(owner) {}

    TXmlParser& fOwner;
    TExpatParser fExpat;
    unsigned int fDepth = 0;
    std::string fRefusal; // why this class, rather than expat, ended the parse
    std::exception_ptr fCallbackException;
    bool fHasUnreadDeclarations = false;
    std::string fRawMarkup; // collected only after unread declarations

    void Install();
    void Stop() { XML_StopParser(fExpat.get(), XML_FALSE); }
    void Refuse(const std::string& reason)
    {
        fRefusal = reason;
        Stop();
    }
    void RefuseEntity(const std::string& entity) { Refuse("the entity &" + entity + "; " + kEntityNotRead); }
    void RefuseEntitiesOfTag();
    void RefuseEntitiesOfRawMarkup();

    // expat delivers what it has already tokenised even after it was stopped.
    template <typename Call> void Deliver(Call call)
    {
        if (!fRefusal.empty() || fCallbackException) {
            return;
        }
        try {
            call();
        } catch (...) {
            fCallbackException = std::current_exception();
            Stop();
        }
    }

    static TState& From(void* state) { return *static_cast<TState*>(state); }

    static void OnStart(void* state, const XML_Char* name, const XML_Char** attributes);
    static void OnEnd(void* state, const XML_Char* name);
    static void OnInstruction(void* state, const XML_Char* target, const XML_Char* data);
    static void OnText(void* state, const XML_Char* text, int length);
    static void OnNotation(void* state, const XML_Char* name, const XML_Char* base, const XML_Char* systemId,
                           const XML_Char* publicId);
    static void OnEntityDeclaration(void* state, const XML_Char*, int, const XML_Char*, int, const XML_Char*,
                                    const XML_Char*, const XML_Char*, const XML_Char*);
    static int OnUnreadDeclarations(void* state);
    static void OnSkippedEntity(void* state, const XML_Char* name, int isParameterEntity);
    static void OnRawMarkup(void* state, const XML_Char* text, int length);
};

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
    TState& self = From(state);
    if (++self.fDepth > kMaxDepth) {
        return self.Refuse(kTooDeep);
    }
    self.RefuseEntitiesOfTag();
    self.Deliver([&] {
        std::map<std::string, std::string> byName;
        for (; *attributes; attributes += 2) {
            byName[attributes[0]] = attributes[1];
        }
        self.fOwner.StartElement(name, byName);
    });
}

void TXmlParser::TState::OnEnd(void* state, const XML_Char* name)
{
    TState& self = From(state);
    --self.fDepth;
    self.Deliver([&] { self.fOwner.EndElement(name); });
}

void TXmlParser::TState::OnInstruction(void* state, const XML_Char* target, const XML_Char* data)
{
    TState& self = From(state);
    self.Deliver([&] { self.fOwner.processingInstruction(target, data); });
}

void TXmlParser::TState::OnText(void* state, const XML_Char* text, int length)
{
    TState& self = From(state);
    self.Deliver([&] { self.fOwner.characters(text, static_cast<unsigned int>(length)); });
}

void TXmlParser::TState::OnNotation(void* state, const XML_Char* name, const XML_Char*, const XML_Char* systemId,
                                    const XML_Char* publicId)
{
    TState& self = From(state);
    self.Deliver([&] { self.fOwner.notationDecl(name, publicId ? publicId : "", systemId ? systemId : ""); });
}

void TXmlParser::TState::OnEntityDeclaration(void* state, const XML_Char*, int, const XML_Char*, int, const XML_Char*,
                                             const XML_Char*, const XML_Char*, const XML_Char*)
{
    From(state).Refuse(kEntityDeclared);
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
        From(state).RefuseEntity(name);
    }
}

// Called for a tag when RefuseEntitiesOfTag asks, and for all markup that has no callback of its own. A declaration of
// attributes arrives token by token.
void TXmlParser::TState::OnRawMarkup(void* state, const XML_Char* text, int length)
{
    TState& self = From(state);
    const std::string piece(text, static_cast<std::size_t>(length));
    if (piece == kAttributeList) {
        self.fRawMarkup.clear();
    }
    self.fRawMarkup += piece;
    if (piece == ">" && self.fRawMarkup.compare(0, sizeof kAttributeList - 1, kAttributeList) == 0) {
        self.RefuseEntitiesOfRawMarkup();
    }
}

TXmlParser::TXmlParser() : fState(new TState(*this)) {}

TXmlParser::~TXmlParser()
{
    delete fState;
}

bool TXmlParser::Parse(const char* buffer, std::size_t length)
{
    if (length > kMaxDocumentBytes) {
        FatalError(kTooLarge);
        return false;
    }
    fState->Install();
    const XML_Status status = XML_Parse(fState->fExpat.get(), buffer, static_cast<int>(length), XML_TRUE);
    if (fState->fCallbackException) {
        std::rethrow_exception(fState->fCallbackException);
    }
    if (status == XML_STATUS_OK) {
        return true;
    }
    const std::string& refusal = fState->fRefusal;
    FatalError(refusal.empty() ? XML_ErrorString(XML_GetErrorCode(fState->fExpat.get())) : refusal.c_str());
    return false;
}

unsigned int TXmlParser::GetCurLine() const
{
    if (!fState->fExpat) {
        return 1;
    }
    return static_cast<unsigned int>(XML_GetCurrentLineNumber(fState->fExpat.get()));
}

// expat does these steps itself; the slots stay for the host's order.
void TXmlParser::ParseJSSP() {}
void TXmlParser::ParseCharData() {}
void TXmlParser::GetAttributeNValue() {}

} // namespace NKOLVRX20
