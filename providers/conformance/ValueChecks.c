// SPDX-License-Identifier: MIT
/* Every type of value; the broker reads exactly its bytes. */
#include "Conformance.h"

#include <float.h>
#include <limits.h>
#include <string.h>
#include <sys/mman.h>
#include <unistd.h>

typedef struct ScalarRow
{
    const char* property;
    CMPIType type;
    size_t size;
    CMPIValue value;
} ScalarRow;

static const ScalarRow kScalars[] = {
    {"B", CMPI_boolean, 1, {.boolean = 1}},         {"B", CMPI_boolean, 1, {.boolean = 0}},
    {"C16", CMPI_char16, 2, {.char16 = 0xFFFD}},    {"U8", CMPI_uint8, 1, {.uint8 = UCHAR_MAX}},
    {"S8", CMPI_sint8, 1, {.sint8 = SCHAR_MIN}},    {"U16", CMPI_uint16, 2, {.uint16 = USHRT_MAX}},
    {"S16", CMPI_sint16, 2, {.sint16 = SHRT_MIN}},  {"U32", CMPI_uint32, 4, {.uint32 = UINT_MAX}},
    {"S32", CMPI_sint32, 4, {.sint32 = INT_MIN}},   {"U64", CMPI_uint64, 8, {.uint64 = ULLONG_MAX}},
    {"S64", CMPI_sint64, 8, {.sint64 = LLONG_MIN}}, {"S64", CMPI_sint64, 8, {.sint64 = LLONG_MAX}},
    {"R32", CMPI_real32, 4, {.real32 = -FLT_MAX}},  {"R64", CMPI_real64, 8, {.real64 = DBL_MIN}},
};
enum
{
    kScalarCount = sizeof kScalars / sizeof *kScalars
};

/* Copies `size` bytes of `source` to the end of a page; the page after it is inaccessible. */
static void* atPageEnd(void** page, const void* source, size_t size)
{
    const size_t bytes = (size_t)sysconf(_SC_PAGESIZE);
    *page = mmap(NULL, 2 * bytes, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    if (*page == MAP_FAILED || mprotect((char*)*page + bytes, bytes, PROT_NONE) != 0) {
        return NULL;
    }
    return memcpy((char*)*page + bytes - size, source, size);
}

static void freePages(void* page)
{
    munmap(page, 2 * (size_t)sysconf(_SC_PAGESIZE));
}

static const char* scalarsComeBack(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    for (int i = 0; i < kScalarCount; ++i) {
        const ScalarRow* row = &kScalars[i];
        void* page;
        const CMPIValue* value = atPageEnd(&page, &row->value, row->size);
        REQUIRE(value != NULL);
        REQUIRE(instance->ft->setProperty(instance, row->property, value, row->type).rc == CMPI_RC_OK);
        freePages(page);
        CMPIStatus rc = kGarbage;
        const CMPIData data = instance->ft->getProperty(instance, row->property, &rc);
        REQUIRE(rc.rc == CMPI_RC_OK && rc.msg == NULL);
        REQUIRE(data.type == row->type && data.state == CMPI_goodValue);
        REQUIRE(memcmp(&data.value, &row->value, row->size) == 0);
    }
    return NULL;
}

void setScalars(const CMPIBroker* broker, const CMPIInstance* instance)
{
    CMPIArray* numbers = broker->eft->newArray(broker, 2, CMPI_uint8, NULL);
    const CMPIDateTime* time = broker->eft->newDateTimeFromChars(broker, "20231114221320.123456+060", NULL);
    for (int i = 0; i < kScalarCount; ++i) {
        instance->ft->setProperty(instance, kScalars[i].property, &kScalars[i].value, kScalars[i].type);
    }
    instance->ft->setProperty(instance, "Number", &kScalars[5].value, CMPI_uint16);
    instance->ft->setProperty(instance, "S", (const CMPIValue*)"<\xc3\xa9 & a long text with \"quotes\" and\ttabs>",
                              CMPI_chars);
    instance->ft->setProperty(instance, "D", (const CMPIValue*)&time, CMPI_dateTime);
    instance->ft->setProperty(instance, "U8A", (const CMPIValue*)&numbers, CMPI_uint8A);
    instance->ft->setProperty(instance, "R32", NULL, CMPI_real32);
}

static const char* textIsThePointerItself(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    void* page;
    const CMPIValue* text = atPageEnd(&page, "edge", 5);
    REQUIRE(text != NULL);
    REQUIRE(instance->ft->setProperty(instance, "S", text, CMPI_chars).rc == CMPI_RC_OK);
    freePages(page);
    const CMPIData data = instance->ft->getProperty(instance, "s", NULL);
    REQUIRE(data.type == CMPI_string && data.state == CMPI_goodValue);
    REQUIRE(strcmp(textOf(data.value.string), "edge") == 0);
    return NULL;
}

static const char* otherFormsOfText(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    CMPIValue value = {.chars = (char*)"by pointer"};
    REQUIRE(instance->ft->setProperty(instance, "S", &value, CMPI_charsptr).rc == CMPI_RC_OK);
    REQUIRE(strcmp(textOf(instance->ft->getProperty(instance, "S", NULL).value.string), "by pointer") == 0);
    value.string = env->mb->eft->newString(env->mb, "object", NULL);
    REQUIRE(instance->ft->setProperty(instance, "S", &value, CMPI_string).rc == CMPI_RC_OK);
    value.string->ft->release(value.string);
    REQUIRE(strcmp(textOf(instance->ft->getProperty(instance, "S", NULL).value.string), "object") == 0);
    return NULL;
}

/* Invalid UTF-8 bytes are replaced; the rest of the text stays. */
static const char* textIsRepaired(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    REQUIRE(instance->ft->setProperty(instance, "S", (const CMPIValue*)"a\xFFz", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(strcmp(textOf(instance->ft->getProperty(instance, "S", NULL).value.string), "a\xEF\xBF\xBDz") == 0);
    return NULL;
}

static const char* nullsAreTyped(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    CMPIValue empty;
    memset(&empty, 0, sizeof empty);
    const struct
    {
        const char* property;
        const CMPIValue* value;
        CMPIType passed;
        CMPIType expected;
    } rows[] = {
        {"S", NULL, CMPI_chars, CMPI_string},         {"S", NULL, CMPI_string, CMPI_string},
        {"S", &empty, CMPI_string, CMPI_string},      {"S", &empty, CMPI_charsptr, CMPI_string},
        {"U32", NULL, CMPI_uint32, CMPI_uint32},      {"D", &empty, CMPI_dateTime, CMPI_dateTime},
        {"U16A", &empty, CMPI_uint16A, CMPI_uint16A}, {"SA", NULL, CMPI_stringA, CMPI_stringA},
    };
    for (size_t i = 0; i < sizeof rows / sizeof *rows; ++i) {
        REQUIRE(instance->ft->setProperty(instance, rows[i].property, rows[i].value, rows[i].passed).rc == CMPI_RC_OK);
        const CMPIData data = instance->ft->getProperty(instance, rows[i].property, NULL);
        REQUIRE(data.type == rows[i].expected && data.state == CMPI_nullValue && data.value.uint64 == 0);
    }
    return NULL;
}

static const char* untypedNullsAreTaken(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    REQUIRE(instance->ft->setProperty(instance, "S", (const CMPIValue*)"x", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(instance->ft->setProperty(instance, "S", NULL, CMPI_null).rc == CMPI_RC_OK);
    const CMPIData data = instance->ft->getProperty(instance, "S", NULL);
    REQUIRE(data.type == CMPI_string && data.state == CMPI_nullValue);
    return NULL;
}

static const char* objectsComeBack(const Env* env)
{
    const CMPIInstance* link = newInst(env, "TST_Link");
    CMPIValue value = {.ref = newPath(env, "TST_Root")};
    REQUIRE(value.ref->ft->addKey(value.ref, "Id", (const CMPIValue*)"a", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(link->ft->setProperty(link, "From", &value, CMPI_ref).rc == CMPI_RC_OK);
    value.ref->ft->release(value.ref);
    CMPIData data = link->ft->getProperty(link, "From", NULL);
    REQUIRE(data.type == CMPI_ref && (data.state & CMPI_nullValue) == 0);
    data = data.value.ref->ft->getKey(data.value.ref, "Id", NULL);
    REQUIRE(strcmp(textOf(data.value.string), "a") == 0);

    const CMPIInstance* instance = newInst(env, "TST_Everything");
    value.inst = newInst(env, "TST_Root");
    REQUIRE(value.inst->ft->setProperty(value.inst, "Text", (const CMPIValue*)"inner", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(instance->ft->setProperty(instance, "Embedded", &value, CMPI_instance).rc == CMPI_RC_OK);
    data = instance->ft->getProperty(instance, "Embedded", NULL);
    REQUIRE(data.type == CMPI_instance);
    data = data.value.inst->ft->getProperty(data.value.inst, "Text", NULL);
    REQUIRE(strcmp(textOf(data.value.string), "inner") == 0);
    REQUIRE(instance->ft->setProperty(instance, "S", &value, CMPI_instance).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    return NULL;
}

const CheckRow kValueChecks[] = {{"scalars come back", scalarsComeBack, kStandard},
                                 {"text is the pointer itself", textIsThePointerItself, kStandard},
                                 {"other forms of text", otherFormsOfText, kStandard},
                                 {"text is repaired", textIsRepaired, kOursOnly},
                                 {"nulls are typed", nullsAreTyped, kStandard},
                                 {"untyped nulls are taken", untypedNullsAreTaken, kOursOnly},
                                 {"objects come back", objectsComeBack, kStandard},
                                 {NULL, NULL, kOursOnly}};
