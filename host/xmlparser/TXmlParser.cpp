#include <host/TXmlParser.h>

#include <expat.h>

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

struct TParserDeleter
{
    void operator()(XML_Parser parser) const { XML_ParserFree(parser); }
};
typedef std::unique_ptr<XML_ParserStruct, TParserDeleter> TExpatParser;

} // namespace

// What one parse needs; and the bridge from expat's C callbacks. No exception may cross expat's C frames: one thrown
// by a callback is kept, ends the parse, and leaves Parse.
struct TXmlParser::TState
{
    explicit TState(TXmlParser& owner) : fOwner(owner) {}

    TXmlParser& fOwner;
    TExpatParser fExpat;
    unsigned int fDepth = 0;
    const char* fRefusal = nullptr; // a limit of our own was hit
    std::exception_ptr fCallbackException;

    void Install();
    void Stop() { XML_StopParser(fExpat.get(), XML_FALSE); }
    void Refuse(const char* reason)
    {
        fRefusal = reason;
        Stop();
    }

    // expat delivers what it has already tokenised even after it was stopped.
    template <typename Call> void Deliver(Call call)
    {
        if (fRefusal || fCallbackException) {
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
}

void TXmlParser::TState::OnStart(void* state, const XML_Char* name, const XML_Char** attributes)
{
    TState& self = From(state);
    if (++self.fDepth > kMaxDepth) {
        return self.Refuse(kTooDeep);
    }
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
    FatalError(fState->fRefusal ? fState->fRefusal : XML_ErrorString(XML_GetErrorCode(fState->fExpat.get())));
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
