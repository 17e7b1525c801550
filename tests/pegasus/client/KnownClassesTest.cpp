// SPDX-License-Identifier: MIT
// Classes whose text is known: which texts are taken, and that what is taken is the program's own.
#include "pegasus/client/KnownClasses.h"

#include "pegasus/wire/ElementDecoder.h"

#include <gtest/gtest.h>

using namespace Pegasus;
using client::KnownClasses;
using Result = wire::XmlOffer::Result;

namespace {

std::string classText(const std::string& name, const std::string& value = "a")
{
    return "<CLASS NAME=\"" + name + "\">\n<QUALIFIER NAME=\"Q\" TYPE=\"string\"><VALUE>" + value +
           "</VALUE></QUALIFIER><METHOD NAME=\"M\" TYPE=\"uint8\"></METHOD></CLASS>";
}

CIMClass decoded(const std::string& text, KnownClasses* known = nullptr)
{
    wire::XmlDocument document;
    const wire::XmlElement root = document.parseFragment(text);
    wire::ElementDecoder decoder;
    const CIMClass cimClass = decoder.decodeClass(root);
    if (known != nullptr) {
        known->learn(root, cimClass, decoder.decodedBytes());
    }
    return cimClass;
}

Result offered(KnownClasses& known, const std::string& text)
{
    CIMClass cimClass;
    return known.take(text, cimClass).result;
}

} // namespace

TEST(KnownClasses, AreTakenByTheirWholeTextOnce)
{
    const std::string text = classText("T_Fan");
    KnownClasses known;
    CIMClass first = decoded(text, &known);
    first.addQualifier(CIMQualifier("Added", CIMValue(true)));
    first.getQualifier(0).setValue(CIMValue(String("changed")));
    for (std::size_t i = 0; i < text.size(); ++i) {
        std::string changed = text;
        changed[i] = static_cast<char>(changed[i] ^ 1);
        ASSERT_EQ(offered(known, changed), Result::kRefused) << changed;
        ASSERT_EQ(offered(known, text.substr(0, i)), Result::kCut) << i;
    }
    CIMClass taken;
    const wire::XmlOffer offer = known.take(text + "</IRETURNVALUE>", taken);
    ASSERT_EQ(offer.result, Result::kTaken);
    EXPECT_EQ(offer.size, text.size());
    EXPECT_GT(known.bytes(), 0u);
    EXPECT_TRUE(taken.identical(decoded(text)));
    EXPECT_EQ(offered(known, text), Result::kRefused);
}

TEST(KnownClasses, AreTheLastOnesUpToASize)
{
    KnownClasses known;
    for (int i = 0; i < 9; ++i) {
        decoded(classText("T" + std::to_string(i)), &known);
    }
    EXPECT_EQ(offered(known, classText("T0")), Result::kRefused);
    for (int i = 8; i > 0; --i) {
        EXPECT_EQ(offered(known, classText("T" + std::to_string(i))), Result::kTaken) << i;
    }
    for (const std::string& text : {classText("T", std::string(512UL * 1024, 'x')), std::string("<CLASS NAME=\"T\"/>")})
    {
        decoded(text, &known);
        EXPECT_EQ(offered(known, text), Result::kRefused) << text.size();
    }
}
