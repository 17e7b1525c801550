// SPDX-License-Identifier: MIT
/* Instances: their properties, and how path and properties meet. */
#include "Conformance.h"

#include <string.h>

static const char* pathsAreCopied(const Env* env)
{
    CMPIObjectPath* path = newPath(env, "TST_Root");
    path->ft->addKey(path, "Id", (const CMPIValue*)"before", CMPI_chars);
    const CMPIInstance* instance = env->mb->eft->newInstance(env->mb, path, NULL);
    path->ft->addKey(path, "Id", (const CMPIValue*)"after", CMPI_chars);
    REQUIRE(path->ft->release(path).rc == CMPI_RC_OK);
    const CMPIObjectPath* own = instance->ft->getObjectPath(instance, NULL);
    REQUIRE(strcmp(textOf(own->ft->getKey(own, "Id", NULL).value.string), "before") == 0);
    return NULL;
}

static const char* keysFillProperties(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Root");
    path->ft->addKey(path, "Id", (const CMPIValue*)"k", CMPI_chars);
    const CMPIInstance* instance = env->mb->eft->newInstance(env->mb, path, NULL);
    REQUIRE(strcmp(textOf(instance->ft->getProperty(instance, "Id", NULL).value.string), "k") == 0);
    return NULL;
}

static const char* nullPathIsRefused(const Env* env)
{
    CMPIStatus rc = kGarbage;
    REQUIRE(env->mb->eft->newInstance(env->mb, NULL, &rc) == NULL && rc.rc == CMPI_RC_ERR_INVALID_PARAMETER);
    return NULL;
}

static const char* pathsAreCompleted(const Env* env)
{
    CMPIValue three = {.uint16 = 3};
    CMPIInstance* instance = newInst(env, "TST_Everything");
    instance->ft->setProperty(instance, "Id", (const CMPIValue*)"p", CMPI_chars);
    instance->ft->setProperty(instance, "Number", &three, CMPI_uint16);
    const CMPIObjectPath* path = instance->ft->getObjectPath(instance, NULL);
    REQUIRE(strcmp(textOf(path->ft->toString(path, NULL)), NS ":TST_Everything.Id=\"p\",Number=3") == 0);

    CMPIObjectPath* half = newPath(env, "TST_Everything");
    half->ft->addKey(half, "Id", (const CMPIValue*)"explicit", CMPI_chars);
    instance = env->mb->eft->newInstance(env->mb, half, NULL);
    instance->ft->setProperty(instance, "Id", (const CMPIValue*)"other", CMPI_chars);
    instance->ft->setProperty(instance, "Number", &three, CMPI_uint16);
    path = instance->ft->getObjectPath(instance, NULL);
    REQUIRE(strcmp(textOf(path->ft->toString(path, NULL)), NS ":TST_Everything.Id=\"explicit\",Number=3") == 0);
    return NULL;
}

static const char* unknownAndMistyped(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    CMPIValue value = {.uint32 = 1};
    REQUIRE(instance->ft->setProperty(instance, "Nope", &value, CMPI_uint32).rc == CMPI_RC_OK);
    CMPIStatus rc = kGarbage;
    REQUIRE(instance->ft->getProperty(instance, "Nope", &rc).state == (CMPI_nullValue | CMPI_notFound));
    REQUIRE(rc.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY);
    REQUIRE(instance->ft->setProperty(instance, "U16", &value, CMPI_uint32).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(instance->ft->setProperty(instance, "U32", (const CMPIValue*)"1", CMPI_chars).rc ==
            CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(instance->ft->setProperty(instance, "U32A", &value, CMPI_uint32).rc == CMPI_RC_ERR_INVALID_DATA_TYPE);
    REQUIRE(instance->ft->getProperty(instance, "U16", NULL).state == CMPI_nullValue);
    return NULL;
}

static const char* propertiesHaveNamesAndOrigins(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    const CMPIValue value = {.uint32 = 1};
    REQUIRE(instance->ft->setProperty(instance, NULL, &value, CMPI_uint32).rc == CMPI_RC_ERR_INVALID_PARAMETER);
    REQUIRE(instance->ft->setPropertyWithOrigin(instance, "u32", &value, CMPI_uint32, "TST_Root").rc == CMPI_RC_OK);
    REQUIRE(instance->ft->getProperty(instance, "U32", NULL).value.uint32 == 1);
    return NULL;
}

static const char* declaredPropertiesAreThere(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Root");
    REQUIRE(instance->ft->getPropertyCount(instance, NULL) == 3);
    const char* names[] = {"Id", "Text", "WithDefault"};
    for (CMPICount i = 0; i < 3; ++i) {
        CMPIString* name = NULL;
        const CMPIData data = instance->ft->getPropertyAt(instance, i, &name, NULL);
        REQUIRE(strcmp(textOf(name), names[i]) == 0);
        REQUIRE(data.type == CMPI_string);
        REQUIRE((data.state & CMPI_keyValue) == 0);
    }
    REQUIRE(strcmp(textOf(instance->ft->getProperty(instance, "WithDefault", NULL).value.string), "given") == 0);
    CMPIStatus rc = kGarbage;
    instance->ft->getPropertyAt(instance, 3, NULL, &rc);
    REQUIRE(rc.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return NULL;
}

static const char* unknownClassesTakeEverything(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Unknown");
    REQUIRE(instance->ft->setProperty(instance, "Any", (const CMPIValue*)"x", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(instance->ft->getPropertyCount(instance, NULL) == 1);
    REQUIRE(strcmp(textOf(instance->ft->getProperty(instance, "ANY", NULL).value.string), "x") == 0);
    return NULL;
}

static const char* pathsCanBeReplaced(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Root");
    const CMPIObjectPath* other = newPath(env, "tst_root");
    other->ft->addKey(other, "Id", (const CMPIValue*)"new", CMPI_chars);
    REQUIRE(instance->ft->setObjectPath(instance, other).rc == CMPI_RC_OK);
    const CMPIObjectPath* path = instance->ft->getObjectPath(instance, NULL);
    REQUIRE(strcmp(textOf(path->ft->getKey(path, "Id", NULL).value.string), "new") == 0);
    const CMPIStatus refused = instance->ft->setObjectPath(instance, newPath(env, "TST_Leaf"));
    REQUIRE(refused.rc == CMPI_RC_ERR_FAILED && strcmp(textOf(refused.msg), "Incompatible ObjectPath") == 0);
    path = instance->ft->getObjectPath(instance, NULL);
    REQUIRE(strcmp(textOf(path->ft->getClassName(path, NULL)), "TST_Root") == 0);
    return NULL;
}

static const char* filtersAreAccepted(const Env* env)
{
    const CMPIInstance* instance = newInst(env, "TST_Root");
    const char* none[] = {NULL};
    const char* some[] = {"Text", NULL};
    const char* keys[] = {"Id", NULL};
    REQUIRE(instance->ft->setPropertyFilter(instance, NULL, NULL).rc == CMPI_RC_OK);
    REQUIRE(instance->ft->setPropertyFilter(instance, none, keys).rc == CMPI_RC_OK);
    REQUIRE(instance->ft->setPropertyFilter(instance, some, keys).rc == CMPI_RC_OK);
    instance->ft->setProperty(instance, "Id", (const CMPIValue*)"k", CMPI_chars);
    const CMPIObjectPath* path = instance->ft->getObjectPath(instance, NULL);
    REQUIRE(path->ft->getKeyCount(path, NULL) == 1);
    return NULL;
}

const CheckRow kInstanceChecks[] = {{"paths are copied into instances", pathsAreCopied, kStandard},
                                    {"keys fill properties", keysFillProperties, kOursOnly},
                                    {"a null path is refused", nullPathIsRefused, kOursOnly},
                                    {"paths are completed from properties", pathsAreCompleted, kStandard},
                                    {"unknown and mistyped properties", unknownAndMistyped, kStandard},
                                    {"properties have names and origins", propertiesHaveNamesAndOrigins, kOursOnly},
                                    {"declared properties are there", declaredPropertiesAreThere, kStandard},
                                    {"unknown classes take everything", unknownClassesTakeEverything, kStandard},
                                    {"paths can be replaced", pathsCanBeReplaced, kStandard},
                                    {"filters are accepted", filtersAreAccepted, kStandard},
                                    {NULL, NULL, kOursOnly}};
