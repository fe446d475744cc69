// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/TrackRole.h"

#include "tests/support/PlainConverter.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>

namespace cadrel::host {

namespace {

class BracketingConverter : public cadrel::tests::PlainConverter {
public:
    BracketingConverter() { util::StringUtil::setConverter(this); }
    ~BracketingConverter() { util::StringUtil::setConverter(nullptr); }

    std::wstring translate(const std::wstring& text) const override { return L"<" + text + L">"; }
};

} // namespace

TEST(TrackRole, NamesEveryRoleInTheUsersLanguage)
{
    const BracketingConverter converter;

    EXPECT_EQ(TrackRole::nameOf(1), L"<Destination>");
    EXPECT_EQ(TrackRole::nameOf(2), L"<Dissolve/Wipe>");
    EXPECT_EQ(TrackRole::nameOf(3), L"<Insert>");
    EXPECT_EQ(TrackRole::nameOf(4), L"<Automation Warning>");
    EXPECT_EQ(TrackRole::nameOf(5), L"<Audio Snippet>");
    EXPECT_EQ(TrackRole::nameOf(6), L"<Overlap>");
    EXPECT_EQ(TrackRole::nameOf(7), L"<Memos>");
    EXPECT_EQ(TrackRole::nameOf(8), L"<New Video>");
    EXPECT_EQ(TrackRole::nameOf(9), L"<Cadrel Markers>");
    EXPECT_EQ(TrackRole::nameOf(10), L"<Old Video>");
}

TEST(TrackRole, AnyOtherNumberIsInvalid)
{
    const BracketingConverter converter;

    for (const std::int32_t role : {-1, 0, 11, 264, 266})
        EXPECT_EQ(TrackRole::nameOf(role), L"<INVALID!>") << role;
}

} // namespace cadrel::host
