// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/FUID.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <string>

using namespace Velmark;

namespace {

constexpr Identifier Sample{"7a6f999fbdbc4bccac403dabace8a171"};

} // namespace

TEST(FUID, WritesThePlainForm)
{
    EXPECT_EQ(FUID(Sample).toString(), "7A6F999FBDBC4BCCAC403DABACE8A171");
    EXPECT_EQ(FUID().toString(), "00000000000000000000000000000000");
}

TEST(FUID, WritesTheRegistryForm)
{
    EXPECT_EQ(FUID(Sample).toRegistryString(), "{7A6F999F-BDBC-4BCC-AC40-3DABACE8A171}");
}

TEST(FUID, WritesTheFormsOfSourceTexts)
{
    const FUID uid(Sample);

    EXPECT_EQ(uid.toCode(FUID::CodeForm::InlineUid), "INLINE_UID (0x7A6F999F, 0xBDBC4BCC, 0xAC403DAB, 0xACE8A171)");
    EXPECT_EQ(uid.toCode(FUID::CodeForm::DeclareUid), "DECLARE_UID (0x7A6F999F, 0xBDBC4BCC, 0xAC403DAB, 0xACE8A171)");
    EXPECT_EQ(uid.toCode(FUID::CodeForm::Fuid), "FUID (0x7A6F999F, 0xBDBC4BCC, 0xAC403DAB, 0xACE8A171)");
    EXPECT_EQ(uid.toCode(FUID::CodeForm::DeclareClassIid),
              "DECLARE_CLASS_IID (Interface, 0x7A6F999F, 0xBDBC4BCC, 0xAC403DAB, 0xACE8A171)");
    EXPECT_EQ(FUID().toCode(FUID::CodeForm::Fuid), "FUID (0x00000000, 0x00000000, 0x00000000, 0x00000000)");
}

TEST(FUID, ReadsBothFormsInSmallAndCapitalDigits)
{
    FUID uid;
    EXPECT_TRUE(uid.fromString("7a6f999FBDBC4BCCAC403DABACE8A171"));
    EXPECT_EQ(uid.identifier(), Sample);

    uid = FUID();
    EXPECT_TRUE(uid.fromRegistryString("{7a6f999f-BDBC-4BCC-AC40-3DABACE8A171}"));
    EXPECT_EQ(uid.identifier(), Sample);
}

TEST(FUID, RefusesAPlainTextOfTheWrongFormAndChangesNothing)
{
    for (const char* text : {"", "7A6F999FBDBC4BCCAC403DABACE8A17", "7A6F999FBDBC4BCCAC403DABACE8A1711",
                             "7A6F999FBDBC4BCCAC403DABACE8A17G", "7A6F999FBDBC4BCCAC403DABACE8A1 1",
                             "+A6F999FBDBC4BCCAC403DABACE8A171", "{7A6F999F-BDBC-4BCC-AC40-3DABACE8A171}"}) {
        FUID uid(Identifier{"000102030405060708090A0B0C0D0E0F"});
        EXPECT_FALSE(uid.fromString(text)) << text;
        EXPECT_EQ(uid.toString(), "000102030405060708090A0B0C0D0E0F") << text;
    }
}

TEST(FUID, RefusesARegistryTextOfTheWrongFormAndChangesNothing)
{
    for (const char* text : {"", "7A6F999FBDBC4BCCAC403DABACE8A171", "{7A6F999F-BDBC-4BCC-AC40-3DABACE8A17}",
                             "{7A6F999F-BDBC-4BCC-AC40-3DABACE8A1711}", "{7A6F999F-BDBC-4BCC-AC403-DABACE8A171}",
                             "(7A6F999F-BDBC-4BCC-AC40-3DABACE8A171)", "{7A6F999F-BDBC-4BCC-AC40-3DABACE8A17X}"}) {
        FUID uid(Identifier{"000102030405060708090A0B0C0D0E0F"});
        EXPECT_FALSE(uid.fromRegistryString(text)) << text;
        EXPECT_EQ(uid.toString(), "000102030405060708090A0B0C0D0E0F") << text;
    }
}

TEST(FUID, IsEqualWhenItsBytesAre)
{
    const FUID uid(Sample);

    EXPECT_EQ(uid, FUID(Sample));
    EXPECT_FALSE(uid == FUID(Identifier{"7a6f999fbdbc4bccac403dabace8a172"}));
    EXPECT_FALSE(uid == FUID(Identifier{"6a6f999fbdbc4bccac403dabace8a171"}));
}

RC_GTEST_PROP(FUID, ReadsBackEveryTextThatItWrites, ())
{
    Identifier identifier;
    for (uint8& byte : identifier.bytes)
        byte = *rc::gen::arbitrary<uint8>();
    const FUID uid(identifier);

    FUID plain;
    FUID registry;
    RC_ASSERT(plain.fromString(uid.toString()));
    RC_ASSERT(registry.fromRegistryString(uid.toRegistryString()));
    RC_ASSERT(plain == uid);
    RC_ASSERT(registry == uid);
}
