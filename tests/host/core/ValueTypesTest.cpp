// SPDX-License-Identifier: MIT
// The small types beside the variant: datetime, char16, reference, status code and exception.
#include <host/TCIMReference.h>
#include <host/TCIMValue.h>
#include <host/TVRXException.h>

#include <gtest/gtest.h>

namespace NKOLVRX20 {
namespace {

struct TDateRow
{
    const char* fName;
    const char* fText;
    bool fInterval;
    const char* fForAPerson;
};

const TDateRow kDates[] = {
    {"time stamp", "20261121041500.123456+060", false, "2026-11-21 04:15:00 +01:00"},
    {"west of Greenwich", "20261121041500.000000-210", false, "2026-11-21 04:15:00 -03:30"},
    {"unknown zone", "20261121041500.******+***", false, "2026-11-21 04:15:00"},
    {"date alone", "20261121******.******+000", false, "2026-11-21 **:**:** +00:00"},
    {"milliseconds alone", "20261121041500.123***+000", false, "2026-11-21 04:15:00 +00:00"},
    {"interval", "00000003040506.000000:000", true, "3 days 04:05:06"},
    {"one day", "00000001000000.000000:000", true, "1 day 00:00:00"},
    {"hours", "00000000040506.000000:000", true, "04:05:06"},
    {"unknown days", "********040506.000000:000", true, "******** days 04:05:06"},
};

TEST(TCIMDateTime, KeepsItsTextAndReadsWellForAPerson)
{
    for (const TDateRow& row : kDates) {
        SCOPED_TRACE(row.fName);
        const TCIMDateTime date{std::string(row.fText)};
        EXPECT_EQ(date.ToString(), row.fText);
        EXPECT_EQ(date.IsInterval(), row.fInterval);
        EXPECT_EQ(date.ToUIString(), row.fForAPerson);
    }
}

TEST(TCIMDateTime, RefusesOtherShapes)
{
    for (const char* text : {"", "20261121041500.123456+06", "20261121041500.123456+0600", "2026112104150a.123456+060",
                             "20261121041500,123456+060", "20261121041500.123456 060", "2026112*041500.123456+060",
                             "20261121041500.12*456+060", "20261121041500.123456+0*0", "00000003040506.000000:001"})
    {
        EXPECT_THROW(TCIMDateTime{std::string(text)}, TVRXException) << text;
    }
}

TEST(TCIMDateTime, SetMakesAnIntervalWithinTheFields)
{
    TCIMDateTime date;
    date.Set(12, 3, 4, 5, 6);
    EXPECT_EQ(date.ToString(), "00000012030405.000006:000");
    EXPECT_THROW(date.Set(100000000, 0, 0, 0, 0), TVRXException);
    EXPECT_THROW(date.Set(0, 24, 0, 0, 0), TVRXException);
    EXPECT_THROW(date.Set(0, 0, 60, 0, 0), TVRXException);
    EXPECT_THROW(date.Set(0, 0, 0, 60, 0), TVRXException);
    EXPECT_THROW(date.Set(0, 0, 0, 0, 1000000), TVRXException);
    EXPECT_EQ(date.ToString(), "00000012030405.000006:000") << "a refused interval changed it";
}

TEST(TCIMChar16, ReadsADecimalCode)
{
    EXPECT_EQ(TCIMChar16("65").GetCode(), 65);
    EXPECT_EQ(TCIMChar16("65535").GetCode(), 65535);
    for (const char* text : {"", "A", "-1", "65536", "6 5", "0x41"}) {
        EXPECT_THROW(TCIMChar16{std::string(text)}, TVRXException) << text;
    }
}

struct TPathRow
{
    const char* fPath;
    const char* fClassName;
};

const TPathRow kPaths[] = {
    {"", ""},
    {"CIM_Fan", "CIM_Fan"},
    {"CIM_Fan.ID=\"1\"", "CIM_Fan"},
    {"root/cimv2:CIM_Fan", "CIM_Fan"},
    {"root/cimv2:CIM_Fan.ID=\"a:b.c\"", "CIM_Fan"},
    {"CIM_Fan.ID=\"a:b.c\"", "CIM_Fan"},
    {"//host/root/cimv2:CIM_Fan.ID=\"1\"", "CIM_Fan"},
    {"//host.example:5988/root/cimv2:CIM_Fan.ID=\"1\"", "CIM_Fan"},
    {"//host.example:5988/root/cimv2:CIM_Fan", "CIM_Fan"},
};

TEST(TCIMReference, FindsTheClassNameInItsPath)
{
    for (const TPathRow& row : kPaths) {
        TCIMReference reference;
        reference.SetPath(row.fPath);
        EXPECT_EQ(reference.GetClassName(), row.fClassName) << row.fPath;
        EXPECT_EQ(reference.GetPath(), row.fPath);
    }
}

TEST(TCIMReference, KeepsItsKeysAndItsNamespaceWeakly)
{
    int dummy = 0;
    boost::shared_ptr<int> owner(new int);
    boost::shared_ptr<ICIMNamespace> ns(owner, reinterpret_cast<ICIMNamespace*>(&dummy));
    TCIMReference reference(ns, TCIMContext{{"ID", TCIMValue("1")}});
    const TCIMReference copy = reference;
    EXPECT_EQ(copy.GetNamespace(), ns);
    EXPECT_EQ(copy.GetKeys().at("ID"), TCIMValue("1"));
    ns.reset();
    owner.reset();
    EXPECT_FALSE(copy.GetNamespace());
    EXPECT_TRUE(TCIMReference().GetKeys().empty());
}

TEST(TVRXException, CarriesItsCodeAndTheCodesText)
{
    try {
        throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
    } catch (const std::exception& e) {
        EXPECT_STREQ(e.what(), TVRXStatusCode(42).TranslateStatusCode());
    }
    EXPECT_STREQ(TVRXException(4711).what(), "Unknown status code");
}

} // namespace
} // namespace NKOLVRX20
