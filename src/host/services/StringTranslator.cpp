// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/StringTranslator.h"

#include "util/HostString.h"
#include "velmark/Context.h"
#include "velmark/UserInterface.h"

namespace cadrel::host {

using util::HostString;
using Velmark::ITranslationService;

namespace {

const char16_t* translated(ITranslationService& translations, const char16_t* text)
{
    const char16_t* const found = translations.translate(text);
    return found ? found : text;
}

} // namespace

std::wstring StringTranslator::translate(const std::wstring& text) const
{
    const auto translations = Velmark::service<ITranslationService>(m_context);
    if (!translations)
        return text;
    const HostString own(text);
    return HostString(translated(*translations, own.utf16())).wide();
}

const char16_t* StringTranslator::translate(const char16_t* text) const
{
    const auto translations = Velmark::service<ITranslationService>(m_context);
    return translations ? translated(*translations, text) : text;
}

} // namespace cadrel::host
