// SPDX-License-Identifier: MIT
/* Arrays and arguments. */
#include "Conformance.h"

#include <string.h>

static const char* arraysStartNull(const Env* env)
{
    const CMPIType forms[] = {CMPI_uint16, CMPI_uint16A};
    for (size_t i = 0; i < 2; ++i) {
        CMPIStatus rc = kGarbage;
        const CMPIArray* array = env->mb->eft->newArray(env->mb, 3, forms[i], &rc);
        REQUIRE(array != NULL && rc.rc == CMPI_RC_OK && rc.msg == NULL);
        REQUIRE(array->ft->getSize(array, NULL) == 3);
        const CMPIData data = array->ft->getElementAt(array, 2, NULL);
        REQUIRE(data.type == CMPI_uint16 && data.state == CMPI_nullValue);
    }
    const CMPIArray* empty = env->mb->eft->newArray(env->mb, 0, CMPI_string, NULL);
    REQUIRE(empty != NULL && empty->ft->getSize(empty, NULL) == 0);
    return NULL;
}

static const char* typesAreAsNamed(const Env* env)
{
    const CMPIType types[] = {CMPI_uint16, CMPI_uint16A};
    for (size_t i = 0; i < sizeof types / sizeof *types; ++i) {
        const CMPIArray* array = env->mb->eft->newArray(env->mb, 1, types[i], NULL);
        REQUIRE(array->ft->getSimpleType(array, NULL) == types[i]);
    }
    return NULL;
}

static const char* oddArraysAreMade(const Env* env)
{
    CMPIStatus rc = kGarbage;
    const CMPIArray* array = env->mb->eft->newArray(env->mb, 1, 0x0777, &rc);
    REQUIRE(array != NULL && rc.rc == CMPI_RC_OK);
    return NULL;
}

static const char* oddArraysTakeNothing(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    const CMPIValue odd = {.array = env->mb->eft->newArray(env->mb, 1, 0x0777, NULL)};
    const CMPIValue number = {.uint32 = 1};
    REQUIRE(odd.array->ft->setElementAt(odd.array, 0, &number, CMPI_uint32).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(odd.array->ft->getElementAt(odd.array, 0, NULL).state == CMPI_nullValue);
    REQUIRE(instance->ft->setProperty(instance, "U32A", &odd, CMPI_uint32A).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    return NULL;
}

static const char* hugeArraysAreRefused(const Env* env)
{
    CMPIStatus rc = kGarbage;
    REQUIRE(env->mb->eft->newArray(env->mb, 0xFFFFFFFFU, CMPI_uint8, &rc) == NULL && rc.rc != CMPI_RC_OK);
    return NULL;
}

static const char* elementsAreChecked(const Env* env)
{
    const CMPIArray* array = env->mb->eft->newArray(env->mb, 3, CMPI_uint32A, NULL);
    CMPIValue value = {.uint32 = 7};
    REQUIRE(array->ft->setElementAt(array, 1, &value, CMPI_uint32).rc == CMPI_RC_OK);
    REQUIRE(array->ft->getElementAt(array, 1, NULL).value.uint32 == 7);
    REQUIRE(array->ft->setElementAt(array, 3, &value, CMPI_uint32).rc == CMPI_RC_ERR_NO_SUCH_PROPERTY);
    REQUIRE(array->ft->setElementAt(array, 1, &value, CMPI_uint16).rc == CMPI_RC_ERR_TYPE_MISMATCH);
    REQUIRE(array->ft->setElementAt(array, 1, &value, CMPI_null).rc == CMPI_RC_OK);
    REQUIRE(array->ft->getElementAt(array, 1, NULL).state == CMPI_nullValue);
    CMPIStatus rc = kGarbage;
    const CMPIData data = array->ft->getElementAt(array, 3, &rc);
    REQUIRE(rc.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY && (data.state & CMPI_nullValue) != 0);
    return NULL;
}

static const char* elementsWithoutValueAreNull(const Env* env)
{
    const CMPIArray* array = env->mb->eft->newArray(env->mb, 1, CMPI_uint32, NULL);
    const CMPIValue value = {.uint32 = 7};
    REQUIRE(array->ft->setElementAt(array, 0, &value, CMPI_uint32).rc == CMPI_RC_OK);
    REQUIRE(array->ft->setElementAt(array, 0, NULL, CMPI_null).rc == CMPI_RC_OK);
    REQUIRE(array->ft->getElementAt(array, 0, NULL).state == CMPI_nullValue);
    return NULL;
}

static const char* arraysOfText(const Env* env)
{
    const CMPIArray* chars = env->mb->eft->newArray(env->mb, 1, CMPI_chars, NULL);
    REQUIRE(chars->ft->setElementAt(chars, 0, (const CMPIValue*)"x", CMPI_chars).rc == CMPI_RC_OK);
    CMPIData data = chars->ft->getElementAt(chars, 0, NULL);
    REQUIRE(data.type == CMPI_chars && strcmp(data.value.chars, "x") == 0);

    const CMPIValue string = {.string = env->mb->eft->newString(env->mb, "y", NULL)};
    REQUIRE(chars->ft->setElementAt(chars, 0, &string, CMPI_string).rc == CMPI_RC_ERR_TYPE_MISMATCH);

    const CMPIArray* strings = env->mb->eft->newArray(env->mb, 1, CMPI_string, NULL);
    const CMPIValue text = {.string = env->mb->eft->newString(env->mb, "y", NULL)};
    REQUIRE(strings->ft->setElementAt(strings, 0, &text, CMPI_string).rc == CMPI_RC_OK);
    data = strings->ft->getElementAt(strings, 0, NULL);
    REQUIRE(data.type == CMPI_string && strcmp(textOf(data.value.string), "y") == 0);
    return NULL;
}

static const char* stringsTakeChars(const Env* env)
{
    const CMPIArray* strings = env->mb->eft->newArray(env->mb, 1, CMPI_string, NULL);
    REQUIRE(strings->ft->setElementAt(strings, 0, (const CMPIValue*)"y", CMPI_chars).rc == CMPI_RC_OK);
    const CMPIData data = strings->ft->getElementAt(strings, 0, NULL);
    REQUIRE(data.type == CMPI_string && strcmp(textOf(data.value.string), "y") == 0);
    return NULL;
}

static const char* storedArraysAreCopies(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    CMPIValue array = {.array = env->mb->eft->newArray(env->mb, 2, CMPI_uint16, NULL)};
    CMPIValue value = {.uint16 = 5};
    array.array->ft->setElementAt(array.array, 0, &value, CMPI_uint16);
    REQUIRE(instance->ft->setProperty(instance, "U16A", &array, CMPI_uint16A).rc == CMPI_RC_OK);
    value.uint16 = 6;
    array.array->ft->setElementAt(array.array, 0, &value, CMPI_uint16);
    REQUIRE(array.array->ft->release(array.array).rc == CMPI_RC_OK);
    const CMPIData data = instance->ft->getProperty(instance, "U16A", NULL);
    REQUIRE(data.type == CMPI_uint16A && data.state == CMPI_goodValue);
    REQUIRE(data.value.array->ft->getSize(data.value.array, NULL) == 2);
    REQUIRE(data.value.array->ft->getElementAt(data.value.array, 0, NULL).value.uint16 == 5);

    return NULL;
}

/* An array of another integer type is taken where its values fit. */
static const char* arraysAreConverted(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    CMPIValue array = {.array = env->mb->eft->newArray(env->mb, 2, CMPI_uint8, NULL)};
    const CMPIValue small = {.uint8 = 200};
    array.array->ft->setElementAt(array.array, 1, &small, CMPI_uint8);
    REQUIRE(instance->ft->setProperty(instance, "U16A", &array, CMPI_uint16A).rc == CMPI_RC_OK);
    const CMPIArray* stored = instance->ft->getProperty(instance, "U16A", NULL).value.array;
    REQUIRE(stored->ft->getSize(stored, NULL) == 2 && stored->ft->getElementAt(stored, 0, NULL).value.uint16 == 0);
    const CMPIData element = stored->ft->getElementAt(stored, 1, NULL);
    REQUIRE(element.type == CMPI_uint16 && element.value.uint16 == 200);
    return NULL;
}

static const char* convertedValuesFit(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    CMPIValue array = {.array = env->mb->eft->newArray(env->mb, 1, CMPI_uint16, NULL)};
    const CMPIValue large = {.uint16 = 300};
    array.array->ft->setElementAt(array.array, 0, &large, CMPI_uint16);
    REQUIRE(instance->ft->setProperty(instance, "U8A", &array, CMPI_uint8A).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(instance->ft->getProperty(instance, "U8A", NULL).state == CMPI_nullValue);
    REQUIRE(instance->ft->setProperty(instance, "SA", &array, CMPI_stringA).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    return NULL;
}

static const char* arraysAreNoScalars(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    const CMPIValue wrong = {.array = env->mb->eft->newArray(env->mb, 1, CMPI_uint8, NULL)};
    REQUIRE(instance->ft->setProperty(instance, "U16", &wrong, CMPI_uint8A).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    return NULL;
}

static const char* everyArrayType(const Env* env)
{
    const struct
    {
        const char* property;
        CMPIType type;
        size_t size;
    } rows[] = {{"BA", CMPI_boolean, 1},  {"C16A", CMPI_char16, 2}, {"U8A", CMPI_uint8, 1},   {"S8A", CMPI_sint8, 1},
                {"U16A", CMPI_uint16, 2}, {"S16A", CMPI_sint16, 2}, {"U32A", CMPI_uint32, 4}, {"S32A", CMPI_sint32, 4},
                {"U64A", CMPI_uint64, 8}, {"S64A", CMPI_sint64, 8}, {"R32A", CMPI_real32, 4}, {"R64A", CMPI_real64, 8}};
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    for (size_t i = 0; i < sizeof rows / sizeof *rows; ++i) {
        CMPIValue array = {.array = env->mb->eft->newArray(env->mb, 1, rows[i].type, NULL)};
        CMPIValue value = {.uint64 = 1};
        if (rows[i].type == CMPI_real32) {
            value.real32 = 1;
        } else if (rows[i].type == CMPI_real64) {
            value.real64 = 1;
        }
        REQUIRE(array.array->ft->setElementAt(array.array, 0, &value, rows[i].type).rc == CMPI_RC_OK);
        const CMPIType type = (CMPIType)(rows[i].type | CMPI_ARRAY);
        REQUIRE(instance->ft->setProperty(instance, rows[i].property, &array, type).rc == CMPI_RC_OK);
        const CMPIData data = instance->ft->getProperty(instance, rows[i].property, NULL);
        REQUIRE(data.type == type);
        const CMPIData element = data.value.array->ft->getElementAt(data.value.array, 0, NULL);
        REQUIRE(element.type == rows[i].type && memcmp(&element.value, &value, rows[i].size) == 0);
    }
    return NULL;
}

static const char* argumentsAreNamed(const Env* env)
{
    const CMPIArgs* args = env->mb->eft->newArgs(env->mb, NULL);
    CMPIValue value = {.uint32 = 1};
    REQUIRE(args->ft->addArg(args, "First", &value, CMPI_uint32).rc == CMPI_RC_OK);
    REQUIRE(args->ft->addArg(args, "Second", (const CMPIValue*)"x", CMPI_chars).rc == CMPI_RC_OK);
    value.uint32 = 2;
    REQUIRE(args->ft->addArg(args, "FIRST", &value, CMPI_uint32).rc == CMPI_RC_OK);
    REQUIRE(args->ft->getArgCount(args, NULL) == 2);
    REQUIRE(args->ft->getArg(args, "first", NULL).value.uint32 == 2);
    CMPIString* name = NULL;
    REQUIRE(args->ft->getArgAt(args, 0, &name, NULL).type == CMPI_string && strcmp(textOf(name), "Second") == 0);
    REQUIRE(args->ft->getArgAt(args, 1, NULL, NULL).value.uint32 == 2);
    CMPIStatus rc = kGarbage;
    REQUIRE(args->ft->getArg(args, "Third", &rc).state == (CMPI_nullValue | CMPI_notFound));
    REQUIRE(rc.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return NULL;
}

static const char* argumentsEnd(const Env* env)
{
    const CMPIArgs* args = env->mb->eft->newArgs(env->mb, NULL);
    CMPIString* name = NULL;
    CMPIStatus rc = kGarbage;
    args->ft->getArgAt(args, 0, &name, &rc);
    REQUIRE(rc.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return NULL;
}

const CheckRow kArrayChecks[] = {{"arrays start null", arraysStartNull, kStandard},
                                 {"array types are as named", typesAreAsNamed, kStandard},
                                 {"arrays of odd types are made", oddArraysAreMade, kStandard},
                                 {"arrays of odd types take nothing", oddArraysTakeNothing, kOursOnly},
                                 {"huge arrays are refused", hugeArraysAreRefused, kOursOnly},
                                 {"elements are checked", elementsAreChecked, kStandard},
                                 {"elements without value are null", elementsWithoutValueAreNull, kOursOnly},
                                 {"arrays of text", arraysOfText, kStandard},
                                 {"arrays of strings take chars", stringsTakeChars, kOursOnly},
                                 {"stored arrays are copies", storedArraysAreCopies, kStandard},
                                 {"arrays of other integers are converted", arraysAreConverted, kStandard},
                                 {"converted values fit", convertedValuesFit, kOursOnly},
                                 {"arrays for scalars are refused", arraysAreNoScalars, kOursOnly},
                                 {"every array type", everyArrayType, kStandard},
                                 {"arguments are named", argumentsAreNamed, kStandard},
                                 {"arguments have an end", argumentsEnd, kOursOnly},
                                 {NULL, NULL, kOursOnly}};
