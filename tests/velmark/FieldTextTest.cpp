// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/FieldText.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>

using namespace Velmark;

namespace {

/// A field of four that held something else before.
struct Field {
    char text[4] = {'x', 'x', 'x', 'x'};

    std::string bytes() const { return {std::begin(text), std::end(text)}; }
};

std::string put(std::string_view text)
{
    Field field;
    putText(text, field.text);
    return field.bytes();
}

} // namespace

TEST(FieldText, FillsTheRestOfTheFieldWithZeros)
{
    EXPECT_EQ(put(""), std::string("\0\0\0\0", 4));
    EXPECT_EQ(put("ab"), std::string("ab\0\0", 4));
}

TEST(FieldText, IsCutWhereTheFieldIsFull)
{
    EXPECT_EQ(put("abc"), std::string("abc\0", 4));
    EXPECT_EQ(put("abcd"), std::string("abc\0", 4));
    EXPECT_EQ(put("abcde"), std::string("abc\0", 4));
}

TEST(FieldText, EndsAtTheFirstZeroOfTheText)
{
    EXPECT_EQ(put(std::string_view("a\0b", 3)), std::string("a\0\0\0", 4));
}

TEST(FieldText, OfTwoBytesAUnitIsPutInTheSameWay)
{
    char16_t field[3] = {u'x', u'x', u'x'};
    putText(std::u16string_view(u"äöü"), field);

    EXPECT_EQ(std::u16string(std::begin(field), std::end(field)), std::u16string(u"äö\0", 3));
}

TEST(FieldText, IsReadToItsZeroOrToTheEndOfTheField)
{
    const char ended[4] = {'a', 'b', '\0', 'c'};
    const char full[4] = {'a', 'b', 'c', 'd'};

    EXPECT_EQ(textOf(ended), "ab");
    EXPECT_EQ(textOf(full), "abcd");
}
