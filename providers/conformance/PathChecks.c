// SPDX-License-Identifier: MIT
/* Object paths. */
#include "Conformance.h"

#include <string.h>

static const char* pathsAreAlwaysMade(const Env* env)
{
    const struct
    {
        const char* nameSpace;
        const char* className;
        const char* expected;
    } rows[] = {{NS, "TST_Root", NS},
                {NULL, "TST_Root", NS},
                {"", "TST_Root", NS},
                {NS, "TST_Unknown", NS},
                {"root/nowhere", "TST_Root", "root/nowhere"}};
    for (size_t i = 0; i < sizeof rows / sizeof *rows; ++i) {
        CMPIStatus rc = kGarbage;
        const CMPIObjectPath* path = env->mb->eft->newObjectPath(env->mb, rows[i].nameSpace, rows[i].className, &rc);
        REQUIRE(path != NULL && rc.rc == CMPI_RC_OK && rc.msg == NULL);
        REQUIRE(strcmp(textOf(path->ft->getClassName(path, NULL)), rows[i].className) == 0);
        REQUIRE(strcmp(textOf(path->ft->getNameSpace(path, NULL)), rows[i].expected) == 0);
        REQUIRE(env->mb->eft->newInstance(env->mb, path, NULL) != NULL);
    }
    return NULL;
}

static const char* partsCanBeSet(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Root");
    REQUIRE(path->ft->setNameSpace(path, "root/other").rc == CMPI_RC_OK);
    REQUIRE(path->ft->setHostname(path, "box").rc == CMPI_RC_OK);
    REQUIRE(path->ft->setClassName(path, "TST_Other").rc == CMPI_RC_OK);
    REQUIRE(strcmp(textOf(path->ft->getHostname(path, NULL)), "box") == 0);
    REQUIRE(strcmp(textOf(path->ft->getClassName(path, NULL)), "TST_Other") == 0);
    const CMPIObjectPath* copy = newPath(env, "TST_Root");
    REQUIRE(copy->ft->setNameSpaceFromObjectPath(copy, path).rc == CMPI_RC_OK);
    REQUIRE(strcmp(textOf(copy->ft->getNameSpace(copy, NULL)), "root/other") == 0);
    REQUIRE(strcmp(textOf(copy->ft->getHostname(copy, NULL)), "") == 0);
    REQUIRE(copy->ft->setHostAndNameSpaceFromObjectPath(copy, path).rc == CMPI_RC_OK);
    REQUIRE(strcmp(textOf(copy->ft->getHostname(copy, NULL)), "box") == 0);
    return NULL;
}

static const char* badPartsAreRefused(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Root");
    REQUIRE(path->ft->setClassName(path, NULL).rc == CMPI_RC_ERR_INVALID_PARAMETER);
    REQUIRE(path->ft->setClassName(path, "no name").rc == CMPI_RC_ERR_INVALID_PARAMETER);
    return NULL;
}

static const char* keysAreWide(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Everything");
    CMPIValue value = {.uint16 = 65535};
    REQUIRE(path->ft->addKey(path, "Number", &value, CMPI_uint16).rc == CMPI_RC_OK);
    REQUIRE(path->ft->addKey(path, "ID", (const CMPIValue*)"x \"y\"", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKeyCount(path, NULL) == 2);
    CMPIData data = path->ft->getKey(path, "NUMBER", NULL);
    REQUIRE(data.type == CMPI_keyInteger && data.state == CMPI_keyValue);
    REQUIRE(data.value.uint64 == 65535 && data.value.uint16 == 65535);
    data = path->ft->getKey(path, "id", NULL);
    REQUIRE(data.type == CMPI_string && data.state == CMPI_keyValue &&
            strcmp(textOf(data.value.string), "x \"y\"") == 0);
    value.uint16 = 3;
    REQUIRE(path->ft->addKey(path, "number", &value, CMPI_uint16).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKeyCount(path, NULL) == 2 && path->ft->getKey(path, "Number", NULL).value.uint64 == 3);
    REQUIRE(strcmp(textOf(path->ft->toString(path, NULL)), NS ":TST_Everything.Id=\"x \\\"y\\\"\",Number=3") == 0);
    return NULL;
}

static const char* keyTypes(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Unknown");
    CMPIValue value = {.sint8 = -1};
    REQUIRE(path->ft->addKey(path, "Small", &value, CMPI_sint8).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKey(path, "Small", NULL).value.sint64 == -1);
    value.boolean = 1;
    REQUIRE(path->ft->addKey(path, "Flag", &value, CMPI_boolean).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKey(path, "Flag", NULL).type == CMPI_boolean);
    value.char16 = 65;
    REQUIRE(path->ft->addKey(path, "Letter", &value, CMPI_char16).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKey(path, "Letter", NULL).value.uint64 == 65);
    value.ref = newPath(env, "TST_Root");
    REQUIRE(path->ft->addKey(path, "Ref", &value, CMPI_ref).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKey(path, "Ref", NULL).type == CMPI_ref);
    value.dateTime = env->mb->eft->newDateTime(env->mb, NULL);
    REQUIRE(path->ft->addKey(path, "When", &value, CMPI_dateTime).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKey(path, "When", NULL).type == CMPI_dateTime);
    value.array = env->mb->eft->newArray(env->mb, 1, CMPI_uint8, NULL);
    REQUIRE(path->ft->addKey(path, "List", &value, CMPI_uint8A).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    value.inst = newInst(env, "TST_Root");
    REQUIRE(path->ft->addKey(path, "Whole", &value, CMPI_instance).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(path->ft->addKey(path, "Null", NULL, CMPI_null).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(path->ft->getKeyCount(path, NULL) == 5);
    return NULL;
}

static const char* missingKeys(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Root");
    CMPIStatus rc = kGarbage;
    REQUIRE((path->ft->getKey(path, "Id", &rc).state & CMPI_nullValue) != 0 && rc.rc == CMPI_RC_ERR_NOT_FOUND);
    rc = kGarbage;
    path->ft->getKeyAt(path, 0, NULL, &rc);
    REQUIRE(rc.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY);
    REQUIRE(path->ft->addKey(path, "Text", (const CMPIValue*)"x", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(path->ft->addKey(path, "Nope", (const CMPIValue*)"x", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(path->ft->getKeyCount(path, NULL) == 2);
    return NULL;
}

static const char* keysHaveTypesAndValues(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Everything");
    const CMPIValue wide = {.uint64 = 7};
    const CMPIValue other = {.sint32 = -9};
    REQUIRE(path->ft->addKey(path, "Number", &wide, CMPI_uint64).rc == CMPI_RC_OK);
    REQUIRE(path->ft->addKey(path, "Number", &other, CMPI_sint32).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(path->ft->addKey(path, "Number", (const CMPIValue*)"8", CMPI_chars).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(path->ft->addKey(path, "Id", &other, CMPI_sint32).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(path->ft->addKey(path, "Id", NULL, CMPI_string).rc == CMPI_RC_ERR_FAILED);
    REQUIRE(path->ft->getKeyCount(path, NULL) == 1 && path->ft->getKey(path, "Number", NULL).value.uint64 == 7);
    return NULL;
}

static const char* keysHaveNames(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Root");
    REQUIRE(path->ft->addKey(path, NULL, (const CMPIValue*)"x", CMPI_chars).rc == CMPI_RC_ERR_INVALID_PARAMETER);
    return NULL;
}

static const char* classesAreRelated(const Env* env)
{
    const CMPIBrokerEncFT* eft = env->mb->eft;
    const struct
    {
        const char* path;
        const char* className;
        CMPIBoolean expected;
    } rows[] = {
        {"TST_Leaf", "tst_leaf", 1},       {"TST_Leaf", "TST_Middle", 1}, {"TST_Leaf", "TST_ROOT", 1},
        {"TST_Leaf", "TST_Everything", 0}, {"TST_Root", "TST_Leaf", 0},   {"TST_Unknown", "TST_Root", 0},
    };
    for (size_t i = 0; i < sizeof rows / sizeof *rows; ++i) {
        CMPIStatus rc = kGarbage;
        REQUIRE(eft->classPathIsA(env->mb, newPath(env, rows[i].path), rows[i].className, &rc) == rows[i].expected);
        REQUIRE(rc.rc == CMPI_RC_OK);
    }
    return NULL;
}

static const char* classesHaveNames(const Env* env)
{
    const CMPIBrokerEncFT* eft = env->mb->eft;
    CMPIStatus rc = kGarbage;
    REQUIRE(!eft->classPathIsA(env->mb, newPath(env, "TST_Root"), "no name", &rc));
    REQUIRE(rc.rc == CMPI_RC_ERR_INVALID_CLASS);
    REQUIRE(!eft->classPathIsA(env->mb, newPath(env, "TST_Root"), NULL, &rc));
    REQUIRE(rc.rc == CMPI_RC_ERR_INVALID_PARAMETER);
    return NULL;
}

const CheckRow kPathChecks[] = {{"paths are always made", pathsAreAlwaysMade, kStandard},
                                {"parts of paths can be set", partsCanBeSet, kStandard},
                                {"bad parts of paths are refused", badPartsAreRefused, kOursOnly},
                                {"keys are wide", keysAreWide, kStandard},
                                {"types of keys", keyTypes, kStandard},
                                {"missing keys", missingKeys, kStandard},
                                {"keys have types and values", keysHaveTypesAndValues, kStandard},
                                {"keys have names", keysHaveNames, kOursOnly},
                                {"classes are related", classesAreRelated, kStandard},
                                {"classes have names", classesHaveNames, kOursOnly},
                                {NULL, NULL, kOursOnly}};
