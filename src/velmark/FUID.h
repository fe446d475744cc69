// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Identifier.h"

#include <string>

namespace Velmark {

/// An identifier as a value with text forms:
///
///     plain      7A6F999FBDBC4BCCAC403DABACE8A171
///     registry   {7A6F999F-BDBC-4BCC-AC40-3DABACE8A171}
///     code       FUID (0x7A6F999F, 0xBDBC4BCC, 0xAC403DAB, 0xACE8A171), and others like it
class FUID {
public:
    /// In which words of a source text the four numbers of an identifier are written.
    enum class CodeForm { InlineUid, DeclareUid, Fuid, DeclareClassIid };

    FUID() = default;
    explicit FUID(const Identifier& identifier) : m_data(identifier) {}
    FUID(const FUID&) = default;
    FUID& operator=(const FUID&) = default;
    virtual ~FUID() = default;

    const Identifier& identifier() const { return m_data; }
    friend bool operator==(const FUID& a, const FUID& b) { return a.m_data == b.m_data; }

    std::string toString() const;
    std::string toRegistryString() const;
    std::string toCode(CodeForm form) const;

    /// Both read small and capital digits, and change nothing and are false for any text that isn't exactly of the form.
    bool fromString(const std::string& text);
    bool fromRegistryString(const std::string& text);

private:
    Identifier m_data;
};

} // namespace Velmark
