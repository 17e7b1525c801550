// SPDX-License-Identifier: MIT
// A careless provider. An input is a sequence of its calls: the first byte chooses strict providers, then each call is
// a byte for the function and bytes for its arguments. Objects lie in a few places of each kind, so that later calls
// use those that earlier ones made; a place may be empty, and any argument may be null or an object without a handle.
// Objects that were released are not passed again, since no broker survives that.
//
// Every call answers: a function of the factories gives an object or an error. What is delivered can be written as
// CIM-XML and read again.
#include "pegasus/cmpi/broker/BrokerTables.h"
#include "pegasus/cmpi/objects/ArgsObject.h"
#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/ContextObject.h"
#include "pegasus/cmpi/objects/ObjectPathObject.h"
#include "pegasus/cmpi/objects/ResultObject.h"
#include "pegasus/cmpi/services/PropertyFilter.h"
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/ElementEncoder.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <list>
#include <string>
#include <vector>

using namespace Pegasus;
using namespace Pegasus::cmpi;

namespace {

constexpr std::size_t kMaxCalls = 400;
const char* const kNamespace = "root/fuzz";

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

void require(bool holds)
{
    if (!holds) {
        std::abort();
    }
}

// A server with these classes and one instance. Its log is read, so that a bad text in it is found.
class Services : public BrokerServices
{
  public:
    Services()
    {
        mof::CompileOptions options;
        options.nameSpace = CIMNamespaceName(kNamespace);
        mof::compileText(kMof, "fuzz.mof", options, fDefinitions);
    }

    CIMClass getClass(const CIMNamespaceName& nameSpace, const CIMName& className) override
    {
        CIMClass found;
        if (!nameSpace.equal(CIMNamespaceName(kNamespace)) || !fDefinitions.findClass(className, found)) {
            throw CIMException(CIM_ERR_NOT_FOUND, className.getString());
        }
        return found;
    }
    CIMInstance getInstance(const CIMNamespaceName&, const CIMObjectPath& path, const CIMPropertyList&) override
    {
        CIMInstance instance{path.getClassName()};
        instance.addProperty(CIMProperty(CIMName("Id"), CIMValue(String("1"))));
        instance.setPath(path);
        return instance;
    }
    Array<CIMInstance> enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                          const CIMPropertyList& properties) override
    {
        Array<CIMInstance> found;
        found.append(getInstance(nameSpace, CIMObjectPath(String::EMPTY, nameSpace, className), properties));
        return found;
    }
    Array<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className) override
    {
        Array<CIMObjectPath> found;
        found.append(CIMObjectPath(String::EMPTY, nameSpace, className));
        return found;
    }
    CIMValue invokeMethod(const CIMNamespaceName&, const CIMObjectPath&, const CIMName& method,
                          const Array<CIMParamValue>& in, Array<CIMParamValue>& out) override
    {
        out = in;
        return in.size() == 0 ? CIMValue(method.getString()) : in[0].getValue();
    }
    bool strictProviders() const override { return strict; }
    void log(Severity, const std::string& text) noexcept override { require(std::strlen(text.c_str()) == text.size()); }

    bool strict = false;

  private:
    mof::MemoryHandler fDefinitions;
};

// Every byte beyond the end is 0.
class Input
{
  public:
    Input(const std::uint8_t* data, std::size_t size) : fAt(data), fEnd(data + size) {}
    bool isAtEnd() const { return fAt == fEnd; }
    std::uint8_t byte() { return isAtEnd() ? std::uint8_t{0} : *fAt++; }

    // A name or text that means something, one of the input's own, or null.
    const char* text()
    {
        static const char* const kTexts[] = {
            "F",
            "G",
            "Link",
            "f",
            "Unknown",
            "no name",
            "",
            "Id",
            "Number",
            "Text",
            "B",
            "C",
            "N",
            "R",
            "L",
            "D",
            "SA",
            "UA",
            "DA",
            "CA",
            "E",
            "EA",
            "From",
            "To",
            "Small",
            "id",
            kNamespace,
            "root/nowhere",
            "20240229235959.123456+120",
            "00000001020304.000005:000",
            "20240229******.******+000",
            "99999999235959.999999:000",
            "$0 $1 $2 $9 $",
            "a\xFFz",
            "\xC3\xA9",
            "\x01",
            "CMPIInstance",
            "WQL",
            "select * from F",
            "CMPIInvocationFlags",
            "CMPIInitNameSpace",
        };
        constexpr std::uint8_t kOwn = 0xFE;
        const std::uint8_t choice = byte();
        if (choice < kOwn) {
            return kTexts[choice % std::size(kTexts)];
        }
        if (choice != kOwn) {
            return nullptr;
        }
        std::string own;
        for (std::size_t left = byte(); left > 0 && !isAtEnd(); --left) {
            own += static_cast<char>(byte());
        }
        return fOwn.emplace_back(std::move(own)).c_str();
    }

  private:
    const std::uint8_t* fAt;
    const std::uint8_t* fEnd;
    std::list<std::string> fOwn;
};

// The places for objects of one kind.
template <typename Face> class Places
{
  public:
    static constexpr std::size_t kCount = 4;

    void put(Input& in, Face* object) { fObjects[in.byte() % kCount] = object; }
    // Returns: an object, null, or one without a handle.
    Face* get(Input& in)
    {
        const std::uint8_t choice = in.byte();
        if (choice == 0xFF && fObjects[0] != nullptr) {
            fBroken = *fObjects[0];
            fBroken.hdl = nullptr;
            return &fBroken;
        }
        return fObjects[choice % (kCount + 1)];
    }
    void forget(const Face* object)
    {
        for (Face*& at : fObjects) {
            at = at == object ? nullptr : at;
        }
    }

  private:
    Face* fObjects[kCount + 1] = {}; // the last one stays null
    Face fBroken{};
};

// A value as a function takes it: the bytes of its type alone.
struct Passed
{
    const CMPIValue* value = nullptr;
    CMPIType type = CMPI_null;
    std::vector<char> bytes;
};

class Provider
{
  public:
    Provider(Input& in, Broker& owner, const CMPIContext* context, const CMPIObjectPath* path, const CMPIArgs* given,
             CMPIArgs* out, const CMPIResult* result)
        : fIn(in), fMb(&owner), fContext(context), fPath(path), fGiven(given), fOut(out), fResult(result)
    {
    }

    void run()
    {
        using Step = void (Provider::*)();
        static constexpr Step kSteps[] = {&Provider::makeSimple,  &Provider::makePath,     &Provider::makeInstance,
                                          &Provider::makeDate,    &Provider::makeArray,    &Provider::makeError,
                                          &Provider::usePath,     &Provider::setKey,       &Provider::readKey,
                                          &Provider::setInstance, &Provider::readInstance, &Provider::useArray,
                                          &Provider::setElement,  &Provider::useArgs,      &Provider::useDate,
                                          &Provider::useError,    &Provider::useContext,   &Provider::useEnumeration,
                                          &Provider::upcall,      &Provider::change,       &Provider::deliver,
                                          &Provider::ask,         &Provider::message,      &Provider::release,
                                          &Provider::clone,       &Provider::unsupported};
        for (std::size_t i = 0; i < kMaxCalls && !fIn.isAtEnd(); ++i) {
            (this->*kSteps[fIn.byte() % std::size(kSteps)])();
        }
        for (const auto& free : fClones) {
            free.second();
        }
    }

  private:
    // A status that the callee has to overwrite; or null.
    CMPIStatus* status()
    {
        fStatus = {static_cast<CMPIrc>(0x5A5A), reinterpret_cast<CMPIString*>(0x5A5A)};
        return fIn.byte() % 8 == 7 ? nullptr : &fStatus;
    }
    // Checks the status that a call left and keeps its message.
    void answered(const CMPIStatus* rc)
    {
        if (rc != nullptr) {
            require(rc->rc != static_cast<CMPIrc>(0x5A5A) && (rc->rc != CMPI_RC_OK || rc->msg == nullptr));
            fStrings.put(fIn, rc->msg);
        }
    }
    template <typename Object> Object* made(Object* object, const CMPIStatus* rc)
    {
        require(rc == nullptr || (object != nullptr) == (rc->rc == CMPI_RC_OK));
        answered(rc);
        return object;
    }
    // Reads data and keeps its object.
    void keep(const CMPIData& data)
    {
        if ((data.state & CMPI_nullValue) != 0) {
            return;
        }
        if ((data.type & CMPI_ARRAY) != 0) {
            fArrays.put(fIn, data.value.array);
        } else if (data.type == CMPI_string) {
            fStrings.put(fIn, data.value.string);
        } else if (data.type == CMPI_chars) {
            fLength += std::strlen(data.value.chars);
        } else if (data.type == CMPI_dateTime) {
            fDates.put(fIn, data.value.dateTime);
        } else if (data.type == CMPI_ref) {
            fPaths.put(fIn, data.value.ref);
        } else if (data.type == CMPI_instance) {
            fInstances.put(fIn, data.value.inst);
        }
    }
    void keep(CMPIString* string)
    {
        if (string != nullptr) {
            fLength += std::strlen(string->ft->getCharPtr(string, nullptr));
            fStrings.put(fIn, string);
        }
    }

    template <typename Face> void point(Passed& passed, Face* object)
    {
        passed.bytes.resize(sizeof object);
        std::memcpy(passed.bytes.data(), &object, sizeof object);
    }
    // Any type with a value of that type; or no value.
    Passed value()
    {
        static constexpr CMPIType kTypes[] = {
            CMPI_null,     CMPI_boolean, CMPI_char16, CMPI_real32,      CMPI_real64, CMPI_uint8,
            CMPI_uint16,   CMPI_uint32,  CMPI_uint64, CMPI_sint8,       CMPI_sint16, CMPI_sint32,
            CMPI_sint64,   CMPI_string,  CMPI_chars,  CMPI_dateTime,    CMPI_ref,    CMPI_instance,
            CMPI_charsptr, CMPI_args,    CMPI_filter, CMPI_enumeration, 0x0777,      0x00F4};
        static constexpr std::size_t kSizes[] = {0, 1, 2, 4, 8, 1, 2, 4, 8, 1, 2, 4, 8};
        const std::uint8_t choice = fIn.byte();
        const std::size_t index = choice % std::size(kTypes);
        Passed passed;
        passed.type = kTypes[index];
        if (choice >= 0xF0) {
            passed.type = static_cast<CMPIType>(passed.type | CMPI_ARRAY);
        }
        if (fIn.byte() % 16 == 15) {
            return passed;
        }
        if (choice >= 0xF0) {
            point(passed, fArrays.get(fIn));
        } else if (index < std::size(kSizes)) {
            for (std::size_t i = 0; i < kSizes[index]; ++i) {
                passed.bytes.push_back(static_cast<char>(fIn.byte()));
            }
        } else if (passed.type == CMPI_string) {
            point(passed, fStrings.get(fIn));
        } else if (passed.type == CMPI_dateTime) {
            point(passed, fDates.get(fIn));
        } else if (passed.type == CMPI_ref) {
            point(passed, fPaths.get(fIn));
        } else if (passed.type == CMPI_instance) {
            point(passed, fInstances.get(fIn));
        } else if (passed.type == CMPI_charsptr) {
            point(passed, fIn.text());
        } else if (passed.type == CMPI_chars) {
            passed.value = reinterpret_cast<const CMPIValue*>(fIn.text());
            return passed;
        } else {
            passed.bytes.resize(sizeof(CMPIValue));
        }
        passed.value = reinterpret_cast<const CMPIValue*>(passed.bytes.data());
        return passed;
    }

    const char** list()
    {
        fList = {fIn.text(), nullptr, nullptr};
        fList[1] = fList[0] == nullptr ? nullptr : fIn.text();
        return fIn.byte() % 2 == 0 ? nullptr : fList.data();
    }
    const CMPIObjectPath* path() { return fIn.byte() % 8 == 0 ? fPath : fPaths.get(fIn); }
    const CMPIArgs* args() { return fIn.byte() % 4 == 0 ? fGiven : fArgs.get(fIn); }

    void makeSimple()
    {
        CMPIStatus* rc = status();
        if (fIn.byte() % 2 == 0) {
            fStrings.put(fIn, made(fMb->eft->newString(fMb, fIn.text(), rc), rc));
        } else {
            fArgs.put(fIn, made(fMb->eft->newArgs(fMb, rc), rc));
        }
    }
    void makePath()
    {
        CMPIStatus* rc = status();
        const char* nameSpace = fIn.byte() % 2 == 0 ? kNamespace : fIn.text();
        fPaths.put(fIn, made(fMb->eft->newObjectPath(fMb, nameSpace, fIn.text(), rc), rc));
    }
    void makeInstance()
    {
        CMPIStatus* rc = status();
        fInstances.put(fIn, made(fMb->eft->newInstance(fMb, path(), rc), rc));
    }
    void makeDate()
    {
        CMPIStatus* rc = status();
        switch (fIn.byte() % 3) {
        case 0:
            fDates.put(fIn, made(fMb->eft->newDateTime(fMb, rc), rc));
            break;
        case 1:
            fDates.put(fIn, made(fMb->eft->newDateTimeFromChars(fMb, fIn.text(), rc), rc));
            break;
        default: {
            CMPIUint64 time = 0;
            for (int i = 0; i < 8; ++i) {
                time = time << 8 | fIn.byte();
            }
            fDates.put(fIn, made(fMb->eft->newDateTimeFromBinary(fMb, time, fIn.byte() % 2, rc), rc));
        }
        }
    }
    void makeArray()
    {
        CMPIStatus* rc = status();
        const CMPIType type = value().type;
        const CMPICount size = fIn.byte() == 0xFF ? 0xFFFFFFFFU : fIn.byte() % 8;
        fArrays.put(fIn, made(fMb->eft->newArray(fMb, size, type, rc), rc));
    }
    void makeError()
    {
        CMPIStatus* rc = status();
        const char* owner = fIn.text();
        const char* id = fIn.text();
        const char* text = fIn.text();
        const auto code = static_cast<CMPIrc>(fIn.byte());
        fErrors.put(fIn,
                    made(fMb->eft->newCMPIError(fMb, owner, id, text, ErrorSevLow, ErrorProbCauseOther, code, rc), rc));
    }

    void usePath()
    {
        CMPIObjectPath* p = fPaths.get(fIn);
        if (p == nullptr) {
            return;
        }
        CMPIStatus* rc = status();
        switch (fIn.byte() % 9) {
        case 0:
            p->ft->setNameSpace(p, fIn.text());
            break;
        case 1:
            p->ft->setHostname(p, fIn.text());
            break;
        case 2:
            p->ft->setClassName(p, fIn.text());
            break;
        case 3:
            keep(p->ft->getNameSpace(p, rc));
            break;
        case 4:
            keep(p->ft->getHostname(p, rc));
            break;
        case 5:
            keep(p->ft->getClassName(p, rc));
            break;
        case 6:
            keep(p->ft->toString(p, rc));
            break;
        case 7:
            p->ft->setNameSpaceFromObjectPath(p, path());
            break;
        default:
            p->ft->setHostAndNameSpaceFromObjectPath(p, path());
            break;
        }
    }
    void setKey()
    {
        const Passed passed = value();
        if (CMPIObjectPath* p = fPaths.get(fIn)) {
            p->ft->addKey(p, fIn.text(), passed.value, passed.type);
        }
    }
    void readKey()
    {
        const CMPIObjectPath* p = path();
        if (p == nullptr) {
            return;
        }
        CMPIStatus* rc = status();
        CMPIString* name = nullptr;
        if (fIn.byte() % 2 == 0) {
            keep(p->ft->getKey(p, fIn.text(), rc));
        } else {
            keep(p->ft->getKeyAt(p, fIn.byte() % 8, fIn.byte() % 2 == 0 ? nullptr : &name, rc));
        }
        keep(name);
        fLength += p->ft->getKeyCount(p, rc);
        answered(rc);
    }
    void setInstance()
    {
        const Passed passed = value();
        const CMPIInstance* i = fInstances.get(fIn);
        if (i == nullptr) {
            return;
        }
        switch (fIn.byte() % 8) {
        case 0:
            i->ft->setPropertyWithOrigin(i, fIn.text(), passed.value, passed.type, fIn.text());
            break;
        case 1:
            i->ft->setObjectPath(i, path());
            break;
        case 2:
            i->ft->setPropertyFilter(i, list(), nullptr);
            break;
        default:
            i->ft->setProperty(i, fIn.text(), passed.value, passed.type);
            break;
        }
    }
    void readInstance()
    {
        const CMPIInstance* i = fInstances.get(fIn);
        if (i == nullptr) {
            return;
        }
        CMPIStatus* rc = status();
        CMPIString* name = nullptr;
        switch (fIn.byte() % 3) {
        case 0:
            keep(i->ft->getProperty(i, fIn.text(), rc));
            break;
        case 1:
            keep(i->ft->getPropertyAt(i, fIn.byte() % 20, fIn.byte() % 2 == 0 ? nullptr : &name, rc));
            break;
        default:
            fPaths.put(fIn, i->ft->getObjectPath(i, rc));
            break;
        }
        keep(name);
        fLength += i->ft->getPropertyCount(i, rc);
        answered(rc);
    }
    void useArray()
    {
        if (const CMPIArray* a = fArrays.get(fIn)) {
            CMPIStatus* rc = status();
            fLength += a->ft->getSize(a, rc) + a->ft->getSimpleType(a, rc);
            keep(a->ft->getElementAt(a, fIn.byte() % 9, rc));
            answered(rc);
        }
    }
    void setElement()
    {
        const Passed passed = value();
        if (const CMPIArray* a = fArrays.get(fIn)) {
            a->ft->setElementAt(a, fIn.byte() % 9, passed.value, passed.type);
        }
    }
    void useArgs()
    {
        const CMPIArgs* a = args();
        if (a == nullptr) {
            return;
        }
        CMPIStatus* rc = status();
        CMPIString* name = nullptr;
        const Passed passed = value();
        switch (fIn.byte() % 4) {
        case 0:
            keep(a->ft->getArg(a, fIn.text(), rc));
            break;
        case 1:
            keep(a->ft->getArgAt(a, fIn.byte() % 8, &name, rc));
            break;
        case 2:
            fOut->ft->addArg(fOut, fIn.text(), passed.value, passed.type);
            break;
        default:
            a->ft->addArg(a, fIn.text(), passed.value, passed.type);
            break;
        }
        keep(name);
        fLength += a->ft->getArgCount(a, rc);
        answered(rc);
    }
    void useDate()
    {
        if (const CMPIDateTime* d = fDates.get(fIn)) {
            CMPIStatus* rc = status();
            fLength += d->ft->getBinaryFormat(d, rc) + d->ft->isInterval(d, rc);
            keep(d->ft->getStringFormat(d, rc));
            answered(rc);
        }
    }
    void useError()
    {
        const CMPIError* e = fErrors.get(fIn);
        if (e == nullptr) {
            return;
        }
        CMPIStatus* rc = status();
        switch (fIn.byte() % 10) {
        case 0:
            keep(e->ft->getOtherErrorType(e, rc));
            break;
        case 1:
            keep(e->ft->getMessage(e, rc));
            break;
        case 2:
            keep(e->ft->getCIMStatusCodeDescription(e, rc));
            break;
        case 3:
            fArrays.put(fIn, e->ft->getRecommendedActions(e, rc));
            break;
        case 4:
            fArrays.put(fIn, e->ft->getMessageArguments(e, rc));
            break;
        case 5:
            e->ft->setRecommendedActions(e, fArrays.get(fIn));
            break;
        case 6:
            e->ft->setMessageArguments(e, fArrays.get(fIn));
            break;
        case 7:
            e->ft->setOtherErrorType(e, fIn.text());
            break;
        case 8:
            e->ft->setErrorSource(e, fIn.text());
            break;
        default:
            fResult->ft->returnError(fResult, e);
            break;
        }
    }
    void useContext()
    {
        CMPIStatus* rc = status();
        CMPIString* name = nullptr;
        const Passed passed = value();
        switch (fIn.byte() % 3) {
        case 0:
            keep(fContext->ft->getEntry(fContext, fIn.text(), rc));
            break;
        case 1:
            keep(fContext->ft->getEntryAt(fContext, fIn.byte() % 8, &name, rc));
            break;
        default:
            fContext->ft->addEntry(fContext, fIn.text(), passed.value, passed.type);
            break;
        }
        keep(name);
        fLength += fContext->ft->getEntryCount(fContext, rc);
        answered(rc);
    }
    void useEnumeration()
    {
        if (const CMPIEnumeration* e = fEnumerations.get(fIn)) {
            CMPIStatus* rc = status();
            switch (fIn.byte() % 3) {
            case 0:
                fLength += e->ft->hasNext(e, rc);
                break;
            case 1:
                keep(e->ft->getNext(e, rc));
                break;
            default:
                fArrays.put(fIn, e->ft->toArray(e, rc));
                break;
            }
        }
    }

    void upcall()
    {
        CMPIStatus* rc = status();
        const CMPIBrokerFT* bft = fMb->bft;
        switch (fIn.byte() % 5) {
        case 0:
            fEnumerations.put(fIn, made(bft->enumerateInstances(fMb, fContext, path(), list(), rc), rc));
            break;
        case 1:
            fEnumerations.put(fIn, made(bft->enumerateInstanceNames(fMb, fContext, path(), rc), rc));
            break;
        case 2:
            fInstances.put(fIn, made(bft->getInstance(fMb, fContext, path(), list(), rc), rc));
            break;
        case 3:
            keep(bft->getProperty(fMb, fContext, path(), fIn.text(), rc));
            break;
        default:
            keep(bft->invokeMethod(fMb, fContext, path(), fIn.text(), args(), fArgs.get(fIn), rc));
            break;
        }
    }
    void change()
    {
        CMPIStatus* rc = status();
        const CMPIBrokerFT* bft = fMb->bft;
        const Passed passed = value();
        const CMPIInstance* instance = fInstances.get(fIn);
        switch (fIn.byte() % 5) {
        case 0:
            fPaths.put(fIn, bft->createInstance(fMb, fContext, path(), instance, rc));
            break;
        case 1:
            bft->modifyInstance(fMb, fContext, path(), instance, list());
            break;
        case 2:
            bft->deleteInstance(fMb, fContext, path());
            break;
        case 3:
            bft->setProperty(fMb, fContext, path(), fIn.text(), passed.value, passed.type);
            break;
        default:
            bft->deliverIndication(fMb, fContext, fIn.text(), instance);
            break;
        }
    }
    void deliver()
    {
        const Passed passed = value();
        switch (fIn.byte() % 4) {
        case 0:
            fResult->ft->returnObjectPath(fResult, path());
            break;
        case 1:
            fResult->ft->returnData(fResult, passed.value, passed.type);
            break;
        default:
            fResult->ft->returnInstance(fResult, fInstances.get(fIn));
            break;
        }
    }

    const void* anyObject()
    {
        switch (fIn.byte() % 7) {
        case 0:
            return fStrings.get(fIn);
        case 1:
            return fPaths.get(fIn);
        case 2:
            return fInstances.get(fIn);
        case 3:
            return fArrays.get(fIn);
        case 4:
            return fDates.get(fIn);
        case 5:
            return fErrors.get(fIn);
        default:
            return fContext;
        }
    }
    void ask()
    {
        CMPIStatus* rc = status();
        switch (fIn.byte() % 4) {
        case 0:
            fLength += fMb->eft->classPathIsA(fMb, path(), fIn.text(), rc);
            break;
        case 1:
            keep(fMb->eft->toString(fMb, anyObject(), rc));
            break;
        case 2:
            keep(fMb->eft->getType(fMb, anyObject(), rc));
            break;
        default:
            fLength += fMb->eft->isOfType(fMb, anyObject(), fIn.text(), rc);
            break;
        }
        answered(rc);
    }
    void message()
    {
        CMPIStatus* rc = status();
        const char* id = fIn.text();
        const char* text = fIn.text();
        const CMPIString* string = fStrings.get(fIn);
        switch (fIn.byte() % 4) {
        case 0:
            fMb->eft->logMessage(fMb, static_cast<CMPISeverity>(fIn.byte()), id, text, string);
            break;
        case 1:
            fMb->eft->trace(fMb, CMPI_LEV_INFO, id, text, string);
            break;
        case 2:
            keep(fMb->eft->getMessage(fMb, id, text, rc, 0));
            break;
        default:
            keep(fMb->eft->getMessage(fMb, id, text, rc, 3, CMPI_sint16, fIn.byte(), CMPI_chars, fIn.text(),
                                      CMPI_string, string));
            break;
        }
    }
    void unsupported()
    {
        CMPIStatus* rc = status();
        CMPIArray* projection = nullptr;
        const char* query = fIn.text();
        const char* language = fIn.text();
        require(fMb->eft->newSelectExp(fMb, query, language, &projection, rc) == nullptr);
        require(fMb->bft->execQuery(fMb, fContext, path(), query, language, rc) == nullptr);
        require(fMb->bft->associators(fMb, fContext, path(), query, language, nullptr, nullptr, list(), rc) == nullptr);
        answered(rc);
    }

    template <typename Face> void releaseIn(Places<Face>& places)
    {
        Face* object = places.get(fIn);
        if (object == nullptr) {
            return;
        }
        const bool hasHandle = object->hdl != nullptr;
        const CMPIrc code = object->ft->release(object).rc;
        require(hasHandle || code == CMPI_RC_ERR_INVALID_HANDLE);
        if (code == CMPI_RC_OK) { // strict providers may be refused: the object stays
            places.forget(object);
            fClones.erase(
                std::remove_if(fClones.begin(), fClones.end(), [&](const auto& each) { return each.first == object; }),
                fClones.end());
        }
    }
    void release()
    {
        switch (fIn.byte() % 9) {
        case 0:
            releaseIn(fStrings);
            break;
        case 1:
            releaseIn(fPaths);
            break;
        case 2:
            releaseIn(fInstances);
            break;
        case 3:
            releaseIn(fArrays);
            break;
        case 4:
            releaseIn(fDates);
            break;
        case 5:
            releaseIn(fArgs);
            break;
        case 6:
            releaseIn(fErrors);
            break;
        case 7:
            releaseIn(fEnumerations);
            break;
        default: // arguments of the call: nothing happens
            fPath->ft->release(const_cast<CMPIObjectPath*>(fPath));
            fOut->ft->release(fOut);
            break;
        }
    }
    template <typename Face> void cloneIn(Places<Face>& places)
    {
        const Face* object = places.get(fIn);
        if (object == nullptr) {
            return;
        }
        CMPIStatus* rc = status();
        if (Face* copy = object->ft->clone(object, rc)) {
            fClones.emplace_back(copy, [copy] { copy->ft->release(copy); });
            places.put(fIn, copy);
        }
    }
    void clone()
    {
        switch (fIn.byte() % 7) {
        case 0:
            cloneIn(fStrings);
            break;
        case 1:
            cloneIn(fPaths);
            break;
        case 2:
            cloneIn(fInstances);
            break;
        case 3:
            cloneIn(fArrays);
            break;
        case 4:
            cloneIn(fDates);
            break;
        case 5:
            cloneIn(fArgs);
            break;
        default:
            cloneIn(fErrors);
            break;
        }
    }

    Input& fIn;
    const CMPIBroker* fMb;
    const CMPIContext* fContext;
    const CMPIObjectPath* fPath;
    const CMPIArgs* fGiven;
    CMPIArgs* fOut;
    const CMPIResult* fResult;
    Places<CMPIString> fStrings;
    Places<CMPIObjectPath> fPaths;
    Places<CMPIInstance> fInstances;
    Places<CMPIArray> fArrays;
    Places<CMPIDateTime> fDates;
    Places<CMPIArgs> fArgs;
    Places<CMPIError> fErrors;
    Places<CMPIEnumeration> fEnumerations;
    std::vector<std::pair<const void*, std::function<void()>>> fClones;
    std::vector<const char*> fList;
    CMPIStatus fStatus{};
    std::size_t fLength = 0; // of what was read
};

void checkInstance(const CIMInstance& instance)
{
    std::string text;
    wire::appendInstance(text, instance);
    wire::XmlDocument document;
    wire::ElementDecoder decoder;
    const CIMInstance again = decoder.decodeInstance(document.parseFragment(text.data(), text.size()));
    require(again.getPropertyCount() == instance.getPropertyCount());
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static Services fgServices;
    Input in(data, size);
    fgServices.strict = in.byte() % 2 != 0;
    Broker broker(fgServices, brokerTables());
    ProviderRequest request;
    request.provider = "Fuzz";
    request.nameSpace = CIMNamespaceName(kNamespace);
    Array<CIMParamValue> parameters;
    parameters.append(CIMParamValue(String("Text"), CIMValue(String("x"))));
    const PropertyFilter filter;
    ContextObject context(broker, request);
    const Frame frame(context.origin);
    ObjectPathObject path(broker, CIMObjectPath(String("root/fuzz:F.Id=\"1\",Number=2")));
    ArgsObject given(broker, parameters, request.nameSpace);
    ArgsObject out(broker);
    ResultObject result(
        filter, checkInstance, [](const CIMObjectPath& delivered) { delivered.toString(); },
        [](const CIMValue& delivered) { delivered.toString(); });
    context.lifetime = path.lifetime = given.lifetime = out.lifetime = Lifetime::kArgument;
    broker.classes().beginRequest();
    Provider(in, broker, &context, &path, &given, &out, &result).run();
    out.parameters();
    result.rethrow();
    return 0;
}
