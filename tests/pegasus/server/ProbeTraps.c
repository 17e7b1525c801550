// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/ProbeTraps.h"

#include <float.h>
#include <math.h>
#include <string.h>

typedef struct Trap
{
    const CMPIBroker* mb;
    const CMPIContext* context;
    const CMPIObjectPath* path;
    CMPIObjectPath* own; /* of Probe_Trap, without keys */
    CMPIInstance* instance;
} Trap;

static CMPIStatus setText(const Trap* trap, const char* name, const char* text)
{
    return trap->instance->ft->setProperty(trap->instance, name, (const CMPIValue*)text, CMPI_chars);
}

static CMPIArray* newArray(const Trap* trap, CMPIType type)
{
    return trap->mb->eft->newArray(trap->mb, 1, type, NULL);
}

static CMPIStatus charsInStringArray(const Trap* trap)
{
    const CMPIArray* array = newArray(trap, CMPI_string);
    return array->ft->setElementAt(array, 0, (const CMPIValue*)"x", CMPI_chars);
}

static CMPIStatus elementReleasedEarly(const Trap* trap)
{
    const CMPIValue words = {.array = newArray(trap, CMPI_string)};
    const CMPIValue text = {.string = trap->mb->eft->newString(trap->mb, "x", NULL)};
    words.array->ft->setElementAt(words.array, 0, &text, CMPI_string);
    const CMPIStatus released = text.string->ft->release(text.string);
    return released.rc != CMPI_RC_OK ? released
                                     : trap->instance->ft->setProperty(trap->instance, "Words", &words, CMPI_stringA);
}

static CMPIStatus nullElement(const Trap* trap)
{
    const CMPIArray* array = newArray(trap, CMPI_uint8);
    return array->ft->setElementAt(array, 0, NULL, CMPI_uint8);
}

static CMPIStatus nullDateTimeElement(const Trap* trap)
{
    const CMPIValue when = {.array = newArray(trap, CMPI_dateTime)};
    return trap->instance->ft->setProperty(trap->instance, "When", &when, CMPI_dateTimeA);
}

static CMPIStatus untypedNull(const Trap* trap)
{
    return trap->instance->ft->setProperty(trap->instance, "T1", NULL, CMPI_null);
}

static CMPIStatus embeddedAsText(const Trap* trap)
{
    return setText(trap, "Inner", "instance of Probe_Stored { };");
}

static CMPIStatus embeddedArray(const Trap* trap)
{
    const CMPIValue inners = {.array = newArray(trap, CMPI_instance)};
    const CMPIValue inner = {.inst = trap->instance};
    inners.array->ft->setElementAt(inners.array, 0, &inner, CMPI_instance);
    return trap->instance->ft->setProperty(trap->instance, "Inners", &inners, CMPI_instanceA);
}

static CMPIStatus textNotUtf8(const Trap* trap)
{
    return setText(trap, "T1", "a\xFFz");
}

static CMPIStatus setReal(const Trap* trap, float real)
{
    const CMPIValue part = {.real32 = real};
    return trap->instance->ft->setProperty(trap->instance, "Part", &part, CMPI_real32);
}

static CMPIStatus infiniteReal(const Trap* trap)
{
    return setReal(trap, -INFINITY);
}

static CMPIStatus realNotANumber(const Trap* trap)
{
    return setReal(trap, NAN);
}

static CMPIStatus denormalReal(const Trap* trap)
{
    return setReal(trap, FLT_MIN / 2);
}

static CMPIStatus halfSurrogate(const Trap* trap)
{
    const CMPIValue unit = {.char16 = 0xD801};
    return trap->instance->ft->setProperty(trap->instance, "Unit", &unit, CMPI_char16);
}

/* The caller leaves returnDone out. */
static CMPIStatus noReturnDone(const Trap* trap)
{
    (void)trap;
    const CMPIStatus ok = {CMPI_RC_OK, NULL};
    return ok;
}

static CMPIThreadReturn visit(void* parameter)
{
    static CMPIStatus status;
    const Trap* trap = parameter;
    trap->mb->bft->enumerateInstanceNames(trap->mb, trap->context, trap->path, &status);
    status.msg = NULL; /* ends with the thread */
    return &status;
}

static CMPIStatus noAttach(const Trap* trap)
{
    CMPIThreadReturn returned = NULL;
    Trap copy = *trap;
    trap->mb->xft->joinThread(trap->mb->xft->newThread(visit, &copy, 0), &returned);
    return *(CMPIStatus*)returned;
}

/* Calls itself through the server as often as the digit says. */
static CMPIStatus nested(const Trap* trap, char digit)
{
    char kind[] = "nested 0";
    CMPIStatus status = {CMPI_RC_OK, NULL};
    if (digit == '0') {
        return status;
    }
    kind[sizeof kind - 2] = (char)(digit - 1);
    CMPIArgs* in = trap->mb->eft->newArgs(trap->mb, NULL);
    in->ft->addArg(in, "Kind", (const CMPIValue*)kind, CMPI_chars);
    trap->mb->bft->invokeMethod(trap->mb, trap->context, trap->path, "Trap", in, NULL, &status);
    return status;
}

static const struct
{
    const char* kind;
    CMPIStatus (*spring)(const Trap* trap);
} kTraps[] = {
    {"chars in string array", charsInStringArray},
    {"element released early", elementReleasedEarly},
    {"null element", nullElement},
    {"null datetime element", nullDateTimeElement},
    {"untyped null", untypedNull},
    {"embedded as text", embeddedAsText},
    {"embedded array", embeddedArray},
    {"text not UTF-8", textNotUtf8},
    {"infinite real", infiniteReal},
    {"real not a number", realNotANumber},
    {"denormal real", denormalReal},
    {"half surrogate", halfSurrogate},
    {"no returnDone", noReturnDone},
    {"no attach", noAttach},
};

CMPIStatus doTrap(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path, const char* kind)
{
    const char* nameSpace = (const char*)path->ft->getNameSpace(path, NULL)->hdl;
    Trap trap = {broker, context, path, broker->eft->newObjectPath(broker, nameSpace, "Probe_Trap", NULL), NULL};
    trap.instance = broker->eft->newInstance(broker, trap.own, NULL);
    if (strncmp(kind, "nested ", 7) == 0) {
        return nested(&trap, kind[7]);
    }
    for (size_t i = 0; i < sizeof kTraps / sizeof kTraps[0]; ++i) {
        if (strcmp(kTraps[i].kind, kind) == 0) {
            return kTraps[i].spring(&trap);
        }
    }
    const CMPIStatus unknown = {CMPI_RC_ERR_NOT_FOUND, NULL};
    return unknown;
}
