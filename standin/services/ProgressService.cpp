// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/ProgressService.h"

#include <algorithm>

namespace standin {

using namespace Velmark;

namespace {

std::u16string textOf(const char16_t* text)
{
    return text ? text : u"";
}

std::u16string number(uint64 value)
{
    const std::string digits = std::to_string(value);
    return {digits.begin(), digits.end()};
}

} // namespace

ProgressService::~ProgressService()
{
    m_terminal.eraseProgress();
}

int32 ProgressService::begin(int32 mode, const char16_t* title, bool* cancelled)
{
    if (m_operation || mode != Modal)
        return ResultFalse;
    m_operation.emplace(title, cancelled);
    return ResultOk;
}

int32 ProgressService::setStatus(const char16_t* text)
{
    if (!m_operation)
        return ResultFalse;
    m_operation->status = textOf(text);
    report();
    return ResultOk;
}

int32 ProgressService::setRange(uint64 total)
{
    if (!m_operation)
        return ResultFalse;
    m_operation->beginStage(total);
    report();
    return ResultOk;
}

int32 ProgressService::setPosition(uint64 value)
{
    if (!m_operation)
        return ResultFalse;
    const int former = m_operation->percentage();
    m_operation->position = std::min(value, m_operation->total);
    // A long stage moves on by very many steps; not each of them is worth a new line.
    report(m_operation->percentage() != former);
    return ResultOk;
}

int32 ProgressService::setText(const char16_t* text)
{
    if (!m_operation)
        return ResultFalse;
    m_operation->text = textOf(text);
    report();
    return ResultOk;
}

int32 ProgressService::tick(uint64 steps)
{
    if (!m_operation)
        return ResultFalse;
    const uint64 rest = m_operation->total - m_operation->position;
    return setPosition(m_operation->position + std::min(steps, rest));
}

int32 ProgressService::show()
{
    if (!m_operation)
        return ResultFalse;
    m_operation->isVisible = true;
    report();
    return ResultOk;
}

int32 ProgressService::end()
{
    if (!m_operation)
        return ResultFalse;
    m_terminal.eraseProgress();
    if (m_boxes && m_operation->isVisible)
        m_boxes->endProgress();
    m_operation.reset();
    return ResultOk;
}

void ProgressService::report(bool looksDifferent)
{
    if (m_operation->cancelled && m_terminal.isInterrupted())
        *m_operation->cancelled = true;
    // The box is asked each time, because the user may cancel there at any.
    if (m_boxes && m_operation->isVisible) {
        const bool isCancelled = m_boxes->showProgress(m_operation->progress());
        if (isCancelled && m_operation->cancelled)
            *m_operation->cancelled = true;
    } else if (m_operation->isVisible && looksDifferent)
        m_terminal.drawProgress(m_operation->line());
}

ProgressService::Operation::Operation(const char16_t* operationTitle, bool* operationCancelled)
    : title(textOf(operationTitle)), cancelled(operationCancelled)
{
}

void ProgressService::Operation::beginStage(uint64 steps)
{
    stageStart = total > 0 ? percentage() : 0;
    total = steps;
    position = 0;
}

int ProgressService::Operation::percentage() const
{
    if (position == total && total > 0)
        return 100;
    const double part = total > 0 ? static_cast<double>(position) / static_cast<double>(total) : 0.0;
    return std::max(stageStart, std::min(99, stageStart + static_cast<int>((100 - stageStart) * part)));
}

UserBoxes::Progress ProgressService::Operation::progress() const
{
    return {title, text, status, percentage(), cancelled != nullptr};
}

std::u16string ProgressService::Operation::line() const
{
    std::u16string line = title;
    if (!title.empty())
        line += u": ";
    if (total > 0) {
        const std::u16string percent = number(static_cast<uint64>(percentage()));
        line += std::u16string(3 - percent.size(), u' ') + percent + u"% (" + number(position) + u" of " +
                number(total) + u") ";
    }
    line += text;
    if (!status.empty())
        line += u" (" + status + u")";
    return line;
}

} // namespace standin
