// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Types.h"

#include <string>

namespace Velmark {

/// A text that doesn't change, in either of two widths: UTF-8 or UTF-16. It keeps a copy of what it was made from and
/// has the other width ready beside it. A text that can't be converted shows so: its other width reads "<StrErr_2>" when
/// it was UTF-8, "<StrErr_4>" when it was UTF-16, and "<StrErr_1>" or "<StrErr_3>" when it was a byte order mark alone.
class ConstString {
public:
    ConstString() = default;
    /// Null gives an empty text.
    ConstString(const char* text);
    ConstString(const char16_t* text);

    bool is16() const { return m_is16; }
    bool isEmpty() const { return length() == 0; }
    /// The units of the text's own width, without the zero.
    int32 length() const { return static_cast<int32>(m_is16 ? m_text16.size() : m_text8.size()); }
    /// Zero-ended, never null; until the text is destroyed or changed.
    const char* text8() const { return m_text8.c_str(); }
    const char16_t* text16() const { return m_text16.c_str(); }

    /// Below, equal to or above 0, by the characters, whatever the widths.
    int32 compare(const ConstString& other) const;
    friend bool operator==(const ConstString& a, const ConstString& b) { return a.compare(b) == 0; }

    /// The whole text as a decimal number; false, and `value` as it was, when it is none.
    bool readInteger(int64& value) const;
    bool readNumber(double& value) const;

protected:
    void set(std::string text);
    void set(std::u16string text);

private:
    std::string m_text8;
    std::u16string m_text16;
    bool m_is16 = false;
};

/// A text that can change. Assignment takes over the width of what is assigned.
class String : public ConstString {
public:
    using ConstString::ConstString;
    String() = default;
    String(const ConstString& text) : ConstString(text) {}

    /// Keeps the own width, whatever that of `text`.
    String& append(const ConstString& text);
    /// Changes the own width.
    void to8();
    void to16();
};

} // namespace Velmark
