// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/String.h"
#include "velmark/UserInterface.h"

#include <cstddef>
#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {

/// A progress window whose user watches every call, and may cancel in it.
class WatchedProgress : public Velmark::Implements<WatchedProgress, Velmark::FObject, Velmark::IProgressService> {
public:
    static constexpr const char* ClassName = "WatchedProgress";

    std::vector<std::string> calls;
    /// What is done in each call, which has been written down.
    std::function<void()> whenCalled;

    bool canCancel() const { return m_cancelled != nullptr; }
    void cancel() { *m_cancelled = true; }

    Velmark::int32 begin(Velmark::int32, const char16_t*, bool* cancelled) override
    {
        m_cancelled = cancelled;
        return note("begin");
    }
    Velmark::int32 setStatus(const char16_t*) override { return note("setStatus"); }
    Velmark::int32 setRange(Velmark::uint64 total) override { return note("setRange " + std::to_string(total)); }
    Velmark::int32 setPosition(Velmark::uint64) override { return note("setPosition"); }
    Velmark::int32 setText(const char16_t* text) override { return note(Velmark::ConstString(text).text8()); }
    Velmark::int32 tick(Velmark::uint64 steps) override { return note("tick " + std::to_string(steps)); }
    Velmark::int32 show() override { return note("show"); }
    Velmark::int32 end() override { return note("end"); }

private:
    Velmark::int32 note(std::string call)
    {
        calls.push_back(std::move(call));
        if (whenCalled)
            whenCalled();
        return Velmark::ResultOk;
    }

    bool* m_cancelled = nullptr;
};

} // namespace cadrel::host::tests
