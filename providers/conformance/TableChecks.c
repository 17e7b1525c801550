// SPDX-License-Identifier: MIT
/* The tables themselves: versions; every slot has a function. */
#include "Conformance.h"

#include <stddef.h>
#include <string.h>

static int hasNoHole(const void* table, size_t from, size_t size)
{
    for (size_t at = from; at < size; at += sizeof(void*)) {
        const void* slot;
        memcpy(&slot, (const char*)table + at, sizeof slot);
        if (slot == NULL) {
            return 0;
        }
    }
    return 1;
}

static const char* brokerTables(const Env* env)
{
    const CMPIBroker* mb = env->mb;
    REQUIRE(mb->hdl != NULL);
    REQUIRE(mb->bft->brokerVersion >= CMPIVersion200);
    REQUIRE(mb->bft->brokerName != NULL && mb->bft->brokerName[0] != '\0');
    REQUIRE(mb->eft->ftVersion >= mb->bft->brokerVersion);
    REQUIRE(mb->xft->ftVersion >= mb->bft->brokerVersion);
    REQUIRE(hasNoHole(mb->bft, 8, offsetof(CMPIBrokerFT, enumerateInstancesFiltered)));
    REQUIRE(hasNoHole(mb->eft, 8, offsetof(CMPIBrokerEncFT, newPropertyList)));
    REQUIRE(hasNoHole(mb->xft, 8, offsetof(CMPIBrokerExtFT, destroyMutex2)));
    return NULL;
}

/* Those of CMPI 2.1 too, and the table for memory. */
static const char* laterSlotsAreFilled(const Env* env)
{
    const CMPIBroker* mb = env->mb;
    REQUIRE(hasNoHole(mb->bft, 8, sizeof *mb->bft));
    REQUIRE(hasNoHole(mb->eft, 8, sizeof *mb->eft));
    REQUIRE(hasNoHole(mb->xft, 8, sizeof *mb->xft));
    REQUIRE(mb->mft != NULL && hasNoHole(mb->mft, 8, sizeof *mb->mft));
    return NULL;
}

#define REQUIRE_OBJECT(object)                                                                                         \
    do {                                                                                                               \
        REQUIRE((object) != NULL && (object)->hdl != NULL);                                                            \
        REQUIRE((object)->ft->ftVersion >= env->mb->bft->brokerVersion);                                               \
        REQUIRE(hasNoHole((object)->ft, 8, sizeof *(object)->ft));                                                     \
    } while (0)

/* The functions that providers of CMPI 2.0 call. */
static const char* objectTablesOfEveryServer(const Env* env)
{
    const CMPIBrokerEncFT* eft = env->mb->eft;
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    const CMPIString* string = eft->newString(env->mb, "x", NULL);
    const CMPIArray* array = eft->newArray(env->mb, 1, CMPI_uint8, NULL);
    const CMPIDateTime* when = eft->newDateTime(env->mb, NULL);
    REQUIRE(instance->hdl != NULL && hasNoHole(instance->ft, 8, sizeof *instance->ft));
    REQUIRE(string->hdl != NULL && hasNoHole(string->ft, 8, offsetof(CMPIStringFT, newCharsCP)));
    REQUIRE(array->hdl != NULL && hasNoHole(array->ft, 8, sizeof *array->ft));
    REQUIRE(when->hdl != NULL && hasNoHole(when->ft, 8, sizeof *when->ft));
    REQUIRE(env->in->hdl != NULL && hasNoHole(env->in->ft, 8, sizeof *env->in->ft));
    REQUIRE(env->ctx->hdl != NULL && hasNoHole(env->ctx->ft, offsetof(CMPIContextFT, getEntry), sizeof *env->ctx->ft));
    REQUIRE(env->op->hdl != NULL && hasNoHole(env->op->ft, 8, offsetof(CMPIObjectPathFT, getClassQualifier)));
    REQUIRE(env->op->ft->toString != NULL);
    REQUIRE(hasNoHole(env->result->ft, offsetof(CMPIResultFT, returnData), sizeof *env->result->ft));
    return NULL;
}

static const char* objectTables(const Env* env)
{
    const CMPIBrokerEncFT* eft = env->mb->eft;
    REQUIRE_OBJECT(env->ctx);
    REQUIRE_OBJECT(env->op);
    REQUIRE_OBJECT(env->in);
    REQUIRE_OBJECT(env->out);
    REQUIRE_OBJECT(env->result);
    REQUIRE_OBJECT(newInst(env, "TST_Everything"));
    REQUIRE_OBJECT(newPath(env, "TST_Everything"));
    REQUIRE_OBJECT(eft->newString(env->mb, "x", NULL));
    REQUIRE_OBJECT(eft->newArray(env->mb, 1, CMPI_uint8, NULL));
    REQUIRE_OBJECT(eft->newDateTime(env->mb, NULL));
    REQUIRE_OBJECT(
        eft->newCMPIError(env->mb, "o", "i", "m", ErrorSevLow, ErrorProbCauseOther, CMPI_RC_ERR_FAILED, NULL));
    REQUIRE_OBJECT(env->mb->bft->enumerateInstanceNames(env->mb, env->ctx, newPath(env, "TST_Item"), NULL));
    return NULL;
}

static const char* kindsAreNamed(const Env* env)
{
    const CMPIBrokerEncFT* eft = env->mb->eft;
    const struct
    {
        const void* object;
        const char* name;
    } rows[] = {
        {env->ctx, "CMPIContext"},
        {env->op, "CMPIObjectPath"},
        {env->in, "CMPIArgs"},
        {env->result, "CMPIResult"},
        {newInst(env, "TST_Everything"), "CMPIInstance"},
        {eft->newString(env->mb, "x", NULL), "CMPIString"},
        {eft->newArray(env->mb, 1, CMPI_uint8, NULL), "CMPIArray"},
        {eft->newDateTime(env->mb, NULL), "CMPIDateTime"},
    };
    for (size_t i = 0; i < sizeof rows / sizeof *rows; ++i) {
        REQUIRE(strcmp(textOf(eft->getType(env->mb, rows[i].object, NULL)), rows[i].name) == 0);
        REQUIRE(eft->isOfType(env->mb, rows[i].object, rows[i].name, NULL));
        REQUIRE(!eft->isOfType(env->mb, rows[i].object, "CMPIBroker", NULL));
        REQUIRE(eft->toString(env->mb, rows[i].object, NULL) != NULL);
    }
    return NULL;
}

static const char* nullHasNoKind(const Env* env)
{
    CMPIStatus rc = kGarbage;
    REQUIRE(env->mb->eft->getType(env->mb, NULL, &rc) == NULL && rc.rc == CMPI_RC_ERR_INVALID_HANDLE);
    return NULL;
}

/* Unsupported functions return an error status and a null result. */
static const char* unsupportedSlotsAnswer(const Env* env)
{
    const CMPIBroker* mb = env->mb;
    CMPIStatus rc = kGarbage;
    REQUIRE(mb->eft->newSelectExp(mb, "select * from X", "WQL", NULL, &rc) == NULL && rc.rc != CMPI_RC_OK);
    rc = kGarbage;
    REQUIRE(mb->bft->execQuery(mb, env->ctx, env->op, "q", "WQL", &rc) == NULL && rc.rc == CMPI_RC_ERR_NOT_SUPPORTED);
    rc = kGarbage;
    REQUIRE(mb->bft->associators(mb, env->ctx, env->op, NULL, NULL, NULL, NULL, NULL, &rc) == NULL);
    REQUIRE(rc.rc == CMPI_RC_ERR_NOT_SUPPORTED);
    REQUIRE(mb->bft->deliverIndication(mb, env->ctx, NS, newInst(env, "TST_Item")).rc == CMPI_RC_OK);
    rc = kGarbage;
    const CMPIData none = env->op->ft->getClassQualifier(env->op, "Version", &rc);
    REQUIRE(rc.rc == CMPI_RC_ERR_NOT_SUPPORTED && (none.state & CMPI_nullValue) != 0);
    rc = kGarbage;
    REQUIRE(env->result->ft->clone(env->result, &rc) == NULL && rc.rc == CMPI_RC_ERR_NOT_SUPPORTED);
    return NULL;
}

const CheckRow kTableChecks[] = {{"broker tables have no hole", brokerTables, kStandard},
                                 {"later slots are filled", laterSlotsAreFilled, kOursOnly},
                                 {"objects have the functions of CMPI 2.0", objectTablesOfEveryServer, kStandard},
                                 {"object tables have no hole", objectTables, kOursOnly},
                                 {"kinds of objects are named", kindsAreNamed, kOursOnly},
                                 {"null has no kind", nullHasNoKind, kOursOnly},
                                 {"unsupported slots answer", unsupportedSlotsAnswer, kOursOnly},
                                 {NULL, NULL, kOursOnly}};
