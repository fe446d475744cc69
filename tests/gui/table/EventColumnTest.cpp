// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventColumn.h"

#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using cadrel::gui::EventColumn;

namespace {

struct Expected {
    std::wstring name;
    int width;
    int maximumWidth;
};

} // namespace

TEST(EventColumn, HasTenColumnsWithTheirNamesAndWidths)
{
    const cadrel::tests::TestProject project;
    const std::vector<Expected> expected = {
        {L"State", 50, 50}, {L"ID", 40, 40},     {L"Roll", 70, 400},   {L"Clip Name", 70, 800}, {L"EDL File", 80, 800},
        {L"TR", 30, 30},    {L"SRC IN", 65, 65}, {L"SRC OUT", 65, 65}, {L"DST IN", 65, 65},     {L"DST OUT", 65, 65},
    };

    ASSERT_EQ(EventColumn::all().size(), expected.size());
    for (std::size_t index = 0; index < expected.size(); ++index) {
        const EventColumn& column = EventColumn::all()[index];
        EXPECT_EQ(column.id, static_cast<int>(index) + 1);
        EXPECT_EQ(EventColumn::name(column.id), expected[index].name);
        EXPECT_EQ(column.width, expected[index].width);
        EXPECT_EQ(column.maximumWidth, expected[index].maximumWidth);
    }
}

TEST(EventColumn, NamesNoOtherNumber)
{
    const cadrel::tests::TestProject project;
    for (const int id : {-1, 0, 11}) {
        EXPECT_FALSE(EventColumn::exists(id));
        EXPECT_EQ(EventColumn::name(id), L"Unknown Column");
    }
    EXPECT_TRUE(EventColumn::exists(1));
    EXPECT_TRUE(EventColumn::exists(10));
}

TEST(EventColumn, HasItsNameAlsoWhereNothingTranslates)
{
    const cadrel::tests::NoProject none;
    EXPECT_EQ(EventColumn::name(EventColumn::Roll), L"Roll");
}
