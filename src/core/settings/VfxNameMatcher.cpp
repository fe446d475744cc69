// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/VfxNameMatcher.h"

#include "util/Result.h"

#include <algorithm>

namespace cadrel::core {

using util::Result;

namespace {

bool isDigit(char character)
{
    return character >= '0' && character <= '9';
}

bool isAllowed(const std::string& text)
{
    return text.find_first_not_of(VfxNameMatcher::AllowedCharacters) == std::string::npos;
}

std::string toExpression(const std::string& text)
{
    std::string expression;
    for (const char character : text) {
        if (character == '.')
            expression += "\\.";
        else
            expression += character == '*' ? '.' : character;
    }
    return expression;
}

/// How many characters the expression stands for.
std::size_t widthOf(std::string_view expression)
{
    return expression.size() - static_cast<std::size_t>(std::count(expression.begin(), expression.end(), '\\'));
}

/// `text` has the width of the expression.
bool fits(std::string_view text, std::string_view expression)
{
    auto wanted = expression.begin();
    for (const char character : text) {
        const bool isAny = *wanted == '.';
        if (*wanted == '\\')
            ++wanted;
        // "." of the ECMAScript grammar leaves out the ends of lines.
        if (isAny ? character == '\n' || character == '\r' : character != *wanted)
            return false;
        ++wanted;
    }
    return true;
}

/// Whether the whole name is prefix, any number of digits, and postfix. Their widths are fixed, so nothing has to be
/// tried twice, as a general regular expression would.
bool matches(std::string_view name, std::string_view prefix, std::string_view postfix)
{
    const std::size_t prefixWidth = widthOf(prefix);
    const std::size_t postfixWidth = widthOf(postfix);
    if (name.size() < prefixWidth + postfixWidth)
        return false;
    const std::string_view version = name.substr(prefixWidth, name.size() - prefixWidth - postfixWidth);
    return fits(name.substr(0, prefixWidth), prefix) && fits(name.substr(name.size() - postfixWidth), postfix) &&
           std::all_of(version.begin(), version.end(), isDigit);
}

void eraseDigitsAt(std::string& text, std::size_t position)
{
    if (position >= text.size())
        return;
    const auto first = text.begin() + static_cast<std::ptrdiff_t>(position);
    text.erase(first, std::find_if_not(first, text.end(), isDigit));
}

} // namespace

void VfxNameMatcher::compile(const std::vector<std::pair<std::string, std::string>>& rows)
{
    m_patterns.clear();
    for (const auto& [prefix, postfix] : rows) {
        if (prefix.empty() && postfix.empty())
            throw Result::InvalidArgument;
        if (!isAllowed(prefix) || !isAllowed(postfix))
            throw Result::InvalidArgument;
        m_patterns.emplace_back(toExpression(prefix), toExpression(postfix));
    }
}

void VfxNameMatcher::compileEnabled(const std::vector<VfxPatternEntry>& entries)
{
    std::vector<std::pair<std::string, std::string>> rows;
    for (const VfxPatternEntry& entry : entries) {
        const bool isEmpty = entry.prefix.empty() && entry.postfix.empty();
        if (entry.enabled && !isEmpty)
            rows.emplace_back(entry.prefix, entry.postfix);
    }
    compile(rows);
}

std::string VfxNameMatcher::stripVersion(const std::string& name) const
{
    std::string stripped = name;
    for (const auto& [prefix, postfix] : m_patterns) {
        if (matches(name, prefix, postfix))
            eraseDigitsAt(stripped, prefix.size());
    }
    return stripped;
}

bool VfxNameMatcher::hasVersion(const std::string& name) const
{
    return stripVersion(name) != name;
}

} // namespace cadrel::core
