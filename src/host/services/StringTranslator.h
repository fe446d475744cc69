// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/StringConverter.h"

namespace Velmark {
class IHostContext;
}

namespace cadrel::host {

/// The process-wide string converter: texts come out in the language of the host's user. Without the host's translation
/// service they stay as they are.
class StringTranslator final : public util::StringConverter {
public:
    /// The context isn't owned.
    explicit StringTranslator(Velmark::IHostContext* context) : m_context(context) {}

    std::wstring translate(const std::wstring& text) const override;
    /// The same for the host's own calls, the names of undo entries for one. Lasts as long as the host's tables and `text`.
    const char16_t* translate(const char16_t* text) const;

private:
    Velmark::IHostContext* m_context;
};

} // namespace cadrel::host
