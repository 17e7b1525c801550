// SPDX-License-Identifier: MIT
/* Checks of a broker on its providers' side. Every check is a row: a name, a function and its scope. */
#pragma once

#include <cmpi/cmpi.h>

typedef struct Env
{
    const CMPIBroker* mb;
    const CMPIContext* ctx;
    const CMPIObjectPath* op;
    const CMPIResult* result;
    const CMPIArgs* in;
    CMPIArgs* out;
} Env;

/* Returns: the condition that failed, or NULL. */
typedef const char* (*Check)(const Env* env);

typedef enum Scope
{
    kOursOnly, /* OpenPegasus 2.14 answers in another way, or was not asked */
    kStandard  /* holds on OpenPegasus 2.14 too */
} Scope;

typedef struct CheckRow
{
    const char* name;
    Check check;
    Scope scope;
} CheckRow;

extern const CheckRow kTableChecks[];
extern const CheckRow kStringChecks[];
extern const CheckRow kValueChecks[];
extern const CheckRow kArrayChecks[];
extern const CheckRow kPathChecks[];
extern const CheckRow kInstanceChecks[];
extern const CheckRow kCloneChecks[];
extern const CheckRow kContextChecks[];
extern const CheckRow kUpcallChecks[];
extern const CheckRow kThreadChecks[];

#define CONFORMANCE_TEXT_(x) #x
#define CONFORMANCE_TEXT(x) CONFORMANCE_TEXT_(x)
#define REQUIRE(condition)                                                                                             \
    do {                                                                                                               \
        if (!(condition))                                                                                              \
            return __FILE__ ":" CONFORMANCE_TEXT(__LINE__) ": " #condition;                                            \
    } while (0)

#define NS "root/cimv2"

/* A status that the callee has to overwrite. */
extern const CMPIStatus kGarbage;

/* Short forms of the calls that every check makes. */
CMPIObjectPath* newPath(const Env* env, const char* className);
CMPIInstance* newInst(const Env* env, const char* className);
const char* textOf(const CMPIString* string);
/* Sets properties of all scalar types of an instance of TST_Everything, and one array. */
void setScalars(const CMPIBroker* broker, const CMPIInstance* instance);
