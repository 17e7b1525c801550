// SPDX-License-Identifier: MIT
// Which properties hold embedded objects.
#include "pegasus/common/EmbeddedKind.h"

#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

namespace Pegasus {
namespace {

struct Row
{
    const char* name;
    CIMType type;
    std::vector<CIMQualifier> qualifiers;
    EmbeddedKind kind;
};

const CIMQualifier kObject("EmbeddedObject", CIMValue(true));
const CIMQualifier kNoObject("EmbeddedObject", CIMValue(false));
const CIMQualifier kInstance("EmbeddedInstance", CIMValue(String("CIM_Part")));

const Row kRows[] = {
    {"plain string", CIMTYPE_STRING, {}, EmbeddedKind::kNone},
    {"string with another qualifier", CIMTYPE_STRING, {CIMQualifier("Key", CIMValue(true))}, EmbeddedKind::kNone},
    {"type object", CIMTYPE_OBJECT, {}, EmbeddedKind::kObject},
    {"type instance", CIMTYPE_INSTANCE, {}, EmbeddedKind::kInstance},
    {"EmbeddedObject", CIMTYPE_STRING, {kObject}, EmbeddedKind::kObject},
    {"in any case", CIMTYPE_STRING, {CIMQualifier("EMBEDDEDobject", CIMValue(true))}, EmbeddedKind::kObject},
    {"EmbeddedObject(false)", CIMTYPE_STRING, {kNoObject}, EmbeddedKind::kNone},
    {"null EmbeddedObject",
     CIMTYPE_STRING,
     {CIMQualifier("EmbeddedObject", CIMValue(CIMTYPE_BOOLEAN, false))},
     EmbeddedKind::kNone},
    {"EmbeddedInstance", CIMTYPE_STRING, {kInstance}, EmbeddedKind::kInstance},
    {"EmbeddedInstance of another type",
     CIMTYPE_STRING,
     {CIMQualifier("EmbeddedInstance", CIMValue(true))},
     EmbeddedKind::kNone},
    {"both", CIMTYPE_STRING, {kInstance, kObject}, EmbeddedKind::kObject},
    {"EmbeddedObject(false) and EmbeddedInstance", CIMTYPE_STRING, {kNoObject, kInstance}, EmbeddedKind::kInstance},
    {"number with the qualifier", CIMTYPE_UINT8, {kObject}, EmbeddedKind::kNone},
    {"type instance with EmbeddedObject", CIMTYPE_INSTANCE, {kObject}, EmbeddedKind::kInstance},
};

TEST(EmbeddedKindTest, TypeAndQualifiersDecide)
{
    for (const Row& row : kRows) {
        for (const bool isArray : {false, true}) {
            CIMProperty property("P", CIMValue(row.type, isArray));
            for (const CIMQualifier& qualifier : row.qualifiers) {
                property.addQualifier(qualifier);
            }
            EXPECT_EQ(embeddedKind(property), row.kind) << row.name << (isArray ? "[]" : "");
        }
    }
    EXPECT_THROW(embeddedKind(CIMConstProperty()), UninitializedObjectException);
}

} // namespace
} // namespace Pegasus
