// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/ProgressHandlerBase.h"
#include "velmark/Counted.h"
#include "velmark/UserInterface.h"

namespace Velmark {
class IHostContext;
}

namespace cadrel::host {

/// The host's progress window of one operation. Its text is the title and what is being done:
///
///     Processing Project - Generate Markers
///
/// All texts come in the user's language already. Every operation but `isCancelled` throws Result::NotAvailable when
/// there is no window. A failure of the host while the window is open is ignored: a run doesn't stop because its
/// progress can't be shown.
class ProgressHandler : public core::ProgressHandlerBase {
public:
    /// The context isn't owned.
    explicit ProgressHandler(Velmark::IHostContext* context) : m_context(context) {}
    ProgressHandler(const ProgressHandler&) = delete;
    ProgressHandler& operator=(const ProgressHandler&) = delete;
    /// The host mustn't write into a handler that is gone: a window that is there is closed.
    ~ProgressHandler() override;

    /// Throws Result::NotAvailable when there is a window already, which stays; Result::HostObjectMissing when the host has
    /// none, and Result::HostCallFailed when it can't show one now.
    void start(const std::wstring& title, std::uint64_t steps, bool canCancel) override;
    void finish() override;
    void setPosition(std::uint64_t value) override;
    void tick(std::uint64_t steps) override;
    bool isCancelled() override { return m_cancelled; }
    void setText(const std::wstring& text) override;
    void beginStage(std::uint64_t steps) override;

    /// Of all stages that were announced.
    std::uint64_t steps() const { return m_position; }

private:
    Velmark::IProgressService& window() const;

    bool m_cancelled = false; ///< written by the host
    Velmark::Counted<Velmark::IProgressService> m_progress;
    Velmark::IHostContext* m_context;
    std::wstring m_title;
    std::uint64_t m_position = 0;
};

} // namespace cadrel::host
