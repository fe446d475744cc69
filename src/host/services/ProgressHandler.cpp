// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/ProgressHandler.h"

#include "host/border/HostFailure.h"
#include "util/HostString.h"
#include "velmark/Context.h"

#include <utility>

namespace cadrel::host {

using util::HostString;
using util::Result;
using Velmark::IProgressService;

ProgressHandler::~ProgressHandler()
{
    if (m_progress)
        m_progress->end();
}

void ProgressHandler::start(const std::wstring& title, std::uint64_t steps, bool canCancel)
{
    if (m_progress)
        throw Result::NotAvailable;
    auto progress = required(Velmark::service<IProgressService>(m_context));
    requireOk(progress->begin(IProgressService::Modal, u"Cadrel", canCancel ? &m_cancelled : nullptr));
    m_progress = std::move(progress);
    m_progress->setStatus(nullptr);
    m_progress->setRange(steps);
    m_title = title;
    m_progress->setText(HostString(m_title).utf16());
    m_cancelled = false;
    m_position = steps;
    m_progress->show();
}

void ProgressHandler::finish()
{
    window().end();
    m_progress.reset();
}

void ProgressHandler::setPosition(std::uint64_t value)
{
    window().setPosition(value);
}

void ProgressHandler::tick(std::uint64_t steps)
{
    window().tick(steps);
}

void ProgressHandler::setText(const std::wstring& text)
{
    window().setText(HostString(m_title + L" - " + text).utf16());
}

void ProgressHandler::beginStage(std::uint64_t steps)
{
    IProgressService& progress = window();
    m_position += steps;
    progress.setRange(steps);
}

IProgressService& ProgressHandler::window() const
{
    if (!m_progress)
        throw Result::NotAvailable;
    return *m_progress;
}

} // namespace cadrel::host
