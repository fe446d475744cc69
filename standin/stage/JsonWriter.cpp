// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/JsonWriter.h"

#include "standin/project/FileFault.h"
#include "standin/stage/JsonDocument.h"
#include "util/JsonText.h"

#include <algorithm>
#include <utility>

using cadrel::util::appendJsonNumber;
using cadrel::util::appendJsonText;

namespace standin {

void JsonWriter::beginObject(Layout layout)
{
    begin('{', layout);
}

void JsonWriter::key(std::string_view key)
{
    beginEntry();
    m_levels.back().key = key;
    appendJsonText(m_text, key);
    m_text += ": ";
}

void JsonWriter::text(std::string_view text)
{
    beginValue();
    appendJsonText(m_text, text);
}

void JsonWriter::number(double number)
{
    beginValue();
    appendJsonNumber(m_text, number);
}

void JsonWriter::integer(std::int64_t integer)
{
    beginValue();
    m_text += std::to_string(integer);
}

void JsonWriter::boolean(bool boolean)
{
    beginValue();
    m_text += boolean ? "true" : "false";
}

void JsonWriter::json(std::string_view json)
{
    beginValue();
    m_text += json;
}

std::string JsonWriter::place() const
{
    std::string place;
    for (const Level& level : m_levels) {
        if (level.count == 0)
            break;
        if (level.isObject)
            appendMember(place, level.key);
        else
            appendElement(place, level.count - 1);
    }
    return place;
}

std::string JsonWriter::takeText()
{
    return std::exchange(m_text, {}) + '\n';
}

void JsonWriter::begin(char bracket, Layout layout)
{
    beginValue();
    m_text += bracket;
    if (!m_levels.empty() && m_levels.back().layout == Layout::OneLine)
        layout = Layout::OneLine;
    m_levels.push_back({layout, 0, {}, bracket == '{'});
}

void JsonWriter::end(char bracket)
{
    const Level level = std::move(m_levels.back());
    m_levels.pop_back();
    if (level.layout == Layout::Lines && level.count > 0)
        newLine();
    m_text += bracket;
}

void JsonWriter::beginEntry()
{
    Level& level = m_levels.back();
    if (level.count++ > 0)
        m_text += level.layout == Layout::Lines ? "," : ", ";
    if (level.layout == Layout::Lines)
        newLine();
}

void JsonWriter::beginValue()
{
    // The entry of an object began with its key.
    if (!m_levels.empty() && !m_levels.back().isObject)
        beginEntry();
}

void JsonWriter::newLine()
{
    // Nobody counts more levels than these, but their blanks would soon outweigh the text.
    constexpr std::size_t DeepestIndented = 20;
    m_text += '\n';
    m_text.append(2 * std::min(m_levels.size(), DeepestIndented), ' ');
}

} // namespace standin
