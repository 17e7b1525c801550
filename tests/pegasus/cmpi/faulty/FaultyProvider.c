// SPDX-License-Identifier: MIT
/* Libraries with one peculiarity each; FAULT_... says which. */
#include <cmpi/cmpi.h>

#include <string.h>
#include <sys/mman.h>
#include <unistd.h>

static const CMPIBroker* gBroker;
static const CMPIStatus kOk = {CMPI_RC_OK, NULL};

static CMPIStatus cleanup(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean terminating)
{
    (void)mi, (void)ctx, (void)terminating;
    return kOk;
}

/* One instance, whose key is the interface's handle: the name that a generic factory was given. */
static CMPIStatus enumerateInstances(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                                     const CMPIObjectPath* op, const char** properties)
{
    (void)ctx, (void)op, (void)properties;
    CMPIObjectPath* path = gBroker->eft->newObjectPath(gBroker, "root/cimv2", "TST_Item", NULL);
    path->ft->addKey(path, "Id", (const CMPIValue*)(mi->hdl == NULL ? "static" : mi->hdl), CMPI_chars);
    return result->ft->returnInstance(result, gBroker->eft->newInstance(gBroker, path, NULL));
}

/* The members of an interface of version 1.0; the memory after it is inaccessible. */
static const CMPIInstanceMIFT* oldTable(void)
{
    const size_t page = (size_t)sysconf(_SC_PAGESIZE);
    const size_t bytes = offsetof(CMPIInstanceMIFT, enumerateInstancesFiltered);
    char* pages = mmap(NULL, 2 * page, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    mprotect(pages + page, page, PROT_NONE);
    CMPIInstanceMIFT table;
    memset(&table, 0, sizeof table);
    table.ftVersion = table.miVersion = CMPIVersion100;
    table.miName = "old";
    table.cleanup = cleanup;
    table.enumerateInstances = enumerateInstances;
    return memcpy(pages + page - bytes, &table, bytes);
}

static CMPIInstanceMI* make(const CMPIBroker* broker, void* handle)
{
    static CMPIInstanceMI mi;
    gBroker = broker;
    mi.hdl = handle;
    mi.ft = oldTable();
    return &mi;
}

CMPIInstanceMI* Faulty_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc);
CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, const char* name,
                                           CMPIStatus* rc);

#if defined(FAULT_NULL_OK)
CMPIInstanceMI* Faulty_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    (void)ctx, (void)rc;
    make(broker, NULL);
    return NULL;
}
#elif defined(FAULT_FAILS_ONCE)
CMPIInstanceMI* Faulty_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    static int calls;
    (void)ctx;
    if (++calls > 1) {
        return make(broker, NULL);
    }
    rc->rc = CMPI_RC_ERR_FAILED;
    rc->msg = broker->eft->newString(broker, "no device yet", NULL);
    return make(broker, NULL); /* an interface together with an error status is an error */
}
#elif defined(FAULT_GENERIC)
CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, const char* name,
                                           CMPIStatus* rc)
{
    static char kept[64];
    (void)ctx, (void)rc;
    strncpy(kept, name, sizeof kept - 1);
    return make(broker, kept);
}
#elif defined(FAULT_BOTH_STYLES)
CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, const char* name,
                                           CMPIStatus* rc)
{
    (void)ctx, (void)name, (void)rc;
    return make(broker, NULL);
}
CMPIInstanceMI* Faulty_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    (void)ctx, (void)rc;
    return make(broker, NULL);
}
#elif defined(FAULT_MISSPELT)
CMPIInstanceMI* Faulty_Create_instanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc);
CMPIInstanceMI* Faulty_Create_instanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    (void)ctx, (void)rc;
    return make(broker, NULL);
}
#elif defined(FAULT_NO_TABLE)
CMPIInstanceMI* Faulty_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    (void)ctx, (void)rc;
    CMPIInstanceMI* mi = make(broker, NULL);
    mi->ft = NULL;
    return mi;
}
#else /* FAULT_OLD_TABLE */
CMPIInstanceMI* Faulty_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    (void)ctx, (void)rc;
    return make(broker, NULL);
}
#endif
