// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace standin {

/// Writes JSON that is good to read and to compare: lists and larger objects spread over lines, one element or member a
/// line, and small objects on one line each.
///
///     {
///       "points": [
///         {"time": 0, "value": 0.5},
///         {"time": 2.5, "value": 1}
///       ]
///     }
class JsonWriter {
public:
    enum class Layout { Lines, OneLine };

    /// In an object on one line everything is.
    void beginObject(Layout layout);
    void endObject() { end('}'); }
    void beginList() { begin('[', Layout::Lines); }
    void endList() { end(']'); }
    /// Of the member whose value follows.
    void key(std::string_view key);
    void text(std::string_view text);
    void number(double number);
    void integer(std::int64_t integer);
    void boolean(bool boolean);
    /// A value that is JSON already.
    void json(std::string_view json);

    /// Of the value that was written last, or whose key was.
    std::string place() const;
    std::string takeText();

private:
    struct Level {
        Layout layout;
        std::size_t count = 0; ///< of elements or members so far
        std::string key;       ///< of the last member; empty in a list
        bool isObject;
    };

    void begin(char bracket, Layout layout);
    void end(char bracket);
    void beginEntry();
    void beginValue();
    void newLine();

    std::string m_text;
    std::vector<Level> m_levels;
};

} // namespace standin
