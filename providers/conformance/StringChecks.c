// SPDX-License-Identifier: MIT
/* Strings, datetimes and messages. */
#include "Conformance.h"

#include <stdlib.h>
#include <string.h>
#include <time.h>

static const char* stringsKeepTheirText(const Env* env)
{
    char* big = malloc(65537);
    REQUIRE(big != NULL);
    memset(big, 'x', 65536);
    big[65536] = '\0';
    const char* texts[] = {"", "plain", "\xC3\xA9 \xE5\x90\x8D \xF0\x9F\x98\x80", big};
    for (size_t i = 0; i < sizeof texts / sizeof *texts; ++i) {
        CMPIStatus rc = kGarbage;
        CMPIString* string = env->mb->eft->newString(env->mb, texts[i], &rc);
        REQUIRE(string != NULL && rc.rc == CMPI_RC_OK && rc.msg == NULL);
        REQUIRE(strcmp((const char*)string->hdl, texts[i]) == 0);
        REQUIRE(strcmp(string->ft->getCharPtr(string, NULL), texts[i]) == 0);
        REQUIRE(string->hdl != (const void*)texts[i]);
    }
    free(big);
    return NULL;
}

static const char* nullTextIsRefused(const Env* env)
{
    CMPIStatus rc = kGarbage;
    REQUIRE(env->mb->eft->newString(env->mb, NULL, &rc) == NULL && rc.rc == CMPI_RC_ERR_INVALID_PARAMETER);
    REQUIRE(env->mb->eft->newString(env->mb, NULL, NULL) == NULL);
    return NULL;
}

static const char* badHandlesAreRefused(const Env* env)
{
    const CMPIString* string = env->mb->eft->newString(env->mb, "x", NULL);
    const CMPIString broken = {NULL, string->ft};
    CMPIStatus rc = kGarbage;
    REQUIRE(string->ft->getCharPtr(&broken, &rc) == NULL && rc.rc == CMPI_RC_ERR_INVALID_HANDLE);
    rc = kGarbage;
    REQUIRE(string->ft->getCharPtr(NULL, &rc) == NULL && rc.rc == CMPI_RC_ERR_INVALID_HANDLE);
    const CMPIInstance* instance = newInst(env, "TST_Everything");
    const CMPIInstance noInstance = {NULL, instance->ft};
    REQUIRE(instance->ft->setProperty(&noInstance, "S", NULL, CMPI_string).rc == CMPI_RC_ERR_INVALID_HANDLE);
    return NULL;
}

static const char* datetimesRoundTrip(const Env* env)
{
    const struct
    {
        CMPIUint64 binary;
        CMPIBoolean interval;
        const char* text;
    } rows[] = {
        {0, 0, "19700101000000.000000+000"},
        {1700000000123456ULL, 0, "20231114221320.123456+000"},
        {0, 1, "00000000000000.000000:000"},
        {90061000001ULL, 1, "00000001010101.000001:000"},
    };
    for (size_t i = 0; i < sizeof rows / sizeof *rows; ++i) {
        CMPIStatus rc = kGarbage;
        CMPIDateTime* made = env->mb->eft->newDateTimeFromBinary(env->mb, rows[i].binary, rows[i].interval, &rc);
        REQUIRE(made != NULL && rc.rc == CMPI_RC_OK && rc.msg == NULL);
        REQUIRE(strcmp(textOf(made->ft->getStringFormat(made, NULL)), rows[i].text) == 0);
        REQUIRE(made->ft->getBinaryFormat(made, NULL) == rows[i].binary);
        REQUIRE(made->ft->isInterval(made, NULL) == rows[i].interval);
        CMPIDateTime* again = env->mb->eft->newDateTimeFromChars(env->mb, rows[i].text, NULL);
        REQUIRE(again != NULL && again->ft->getBinaryFormat(again, NULL) == rows[i].binary);
    }
    CMPIDateTime* zoned = env->mb->eft->newDateTimeFromChars(env->mb, "20231114231320.123456+060", NULL);
    REQUIRE(zoned->ft->getBinaryFormat(zoned, NULL) == 1700000000123456ULL);
    return NULL;
}

static const char* badDatetimesAreRefused(const Env* env)
{
    const char* texts[] = {"", "now", "20231314221320.123456+000", "20231114221320.123456"};
    for (size_t i = 0; i < sizeof texts / sizeof *texts; ++i) {
        CMPIStatus rc = kGarbage;
        REQUIRE(env->mb->eft->newDateTimeFromChars(env->mb, texts[i], &rc) == NULL);
        REQUIRE(rc.rc == CMPI_RC_ERR_INVALID_PARAMETER);
    }
    return NULL;
}

static const char* nullDatetimeIsRefused(const Env* env)
{
    CMPIStatus rc = kGarbage;
    REQUIRE(env->mb->eft->newDateTimeFromChars(env->mb, NULL, &rc) == NULL);
    REQUIRE(rc.rc == CMPI_RC_ERR_INVALID_PARAMETER);
    return NULL;
}

static const char* newDatetimeIsNow(const Env* env)
{
    CMPIDateTime* made = env->mb->eft->newDateTime(env->mb, NULL);
    const CMPIUint64 seconds = made->ft->getBinaryFormat(made, NULL) / 1000000;
    const CMPIUint64 now = (CMPIUint64)time(NULL);
    REQUIRE(seconds <= now + 2 && seconds + 2 >= now);
    REQUIRE(!made->ft->isInterval(made, NULL));
    return NULL;
}

static const char* messagesTakeArguments(const Env* env)
{
    const CMPIString* text = env->mb->eft->newString(env->mb, "string", NULL);
    CMPIStatus rc = kGarbage;
    const CMPIString* made =
        env->mb->eft->getMessage(env->mb, "id", "$0, $1, $2, $3, $4, $9, 5$", &rc, 5, CMPI_sint16, -3, CMPI_uint64,
                                 (CMPIUint64)1 << 40, CMPI_chars, "chars", CMPI_string, text, CMPI_boolean, 1);
    REQUIRE(rc.rc == CMPI_RC_OK && strcmp(textOf(made), "-3, 1099511627776, chars, string, true, , 5") == 0);
    CMPIMsgFileHandle handle = &rc;
    REQUIRE(env->mb->eft->openMessageFile(env->mb, "file", &handle).rc == CMPI_RC_OK);
    made = env->mb->eft->getMessage2(env->mb, "id", handle, "$0", NULL, 1, CMPI_real64, 0.5);
    REQUIRE(strncmp(textOf(made), "0.5", 3) == 0);
    REQUIRE(env->mb->eft->closeMessageFile(env->mb, handle).rc == CMPI_RC_OK);
    return NULL;
}

const CheckRow kStringChecks[] = {{"strings keep their text", stringsKeepTheirText, kStandard},
                                  {"null text is refused", nullTextIsRefused, kStandard},
                                  {"bad handles are refused", badHandlesAreRefused, kOursOnly},
                                  {"datetimes round trip", datetimesRoundTrip, kStandard},
                                  {"bad datetimes are refused", badDatetimesAreRefused, kStandard},
                                  {"a null datetime text is refused", nullDatetimeIsRefused, kOursOnly},
                                  {"a new datetime is now", newDatetimeIsNow, kStandard},
                                  {"messages take arguments", messagesTakeArguments, kStandard},
                                  {NULL, NULL, kOursOnly}};
