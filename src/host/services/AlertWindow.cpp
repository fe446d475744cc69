// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/AlertWindow.h"

#include "host/services/StringTranslator.h"
#include "util/HostString.h"
#include "velmark/Context.h"
#include "velmark/UserInterface.h"

#include <memory>

namespace cadrel::host {

namespace {

/// Null leaves the button out, and the host's default button stands in where there is none at all.
const char16_t* labelOf(const util::HostString& text)
{
    return text.length() == 0 ? nullptr : text.utf16();
}

} // namespace

void AlertWindow::install(Velmark::IHostContext* context)
{
    AlertWindowBase::install(std::make_unique<AlertWindow>(context));
}

std::int32_t AlertWindow::show(const std::wstring& message, const std::wstring& button1, const std::wstring& button2,
                               const std::wstring& button3)
{
    const auto alerts = Velmark::service<Velmark::IAlertService>(m_context);
    if (!alerts)
        return 0;
    const auto translated = [translator = StringTranslator(m_context)](const std::wstring& text) {
        return util::HostString(text.empty() ? text : translator.translate(text));
    };
    return alerts->show(translated(message).utf16(), labelOf(translated(button1)), labelOf(translated(button2)),
                        labelOf(translated(button3)));
}

} // namespace cadrel::host
