// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/serialize/ByteArchive.h"
#include "tests/gui/main/ShownWindow.h"
#include "tests/support/BestSeconds.h"
#include "tests/support/Sanitizer.h"

#include <functional>
#include <iostream>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {

/// How long the handlers of the window take, with the lists that a test gives it.
class TimedWindow : public ShownWindow {
protected:
    // In seconds.
    static constexpr double Limit = 0.2;         ///< with a hundred thousand events, which no one has by hand
    static constexpr double ExampleLimit = 0.05; ///< with the example reel

    static constexpr int Runs = CADREL_ADDRESS_SANITIZER ? 1 : 3;

    // As the host's undo list does.
    TimedWindow() { m_undo.model = &m_model; }

    static double boundOf(double limit) { return CADREL_ADDRESS_SANITIZER ? 20.0 * limit : limit; }
    static void expectBelow(double limit, double seconds, const std::string& step)
    {
        std::cout << step << ": " << seconds * 1000.0 << " ms\n";
        EXPECT_LT(seconds, boundOf(limit)) << step;
    }
    /// The best of some runs counts. What is prepared doesn't count.
    static void expectFast(
        const std::string& step, double limit, const std::function<void()>& action,
        const std::function<void()>& prepare = [] {})
    {
        const auto act = [&] {
            action();
            FocusedWindow::pump();
        };
        const auto getReady = [&] {
            prepare();
            FocusedWindow::pump();
        };
        expectBelow(limit, bestSecondsOf(Runs, boundOf(limit), act, getReady), step);
    }

    /// Two shots that take turns, 20 frames each, which touch.
    static std::vector<std::shared_ptr<core::EventBase>> alternatingShots(int count)
    {
        using core::Timecode;
        std::vector<std::shared_ptr<core::EventBase>> events;
        for (int index = 0; index < count; ++index) {
            auto event = std::make_shared<core::EventBase>();
            event->setRollName(index % 2 == 0 ? "A017C004_261122_R1AB" : "B021C011_261122_R1AB");
            event->setClipName("42A-" + std::to_string(index % 977));
            event->setEdlFileName("reel3_v07.edl");
            const int at = index * 20;
            event->setTimecodes(Timecode(at), Timecode(at + 20), Timecode(at), Timecode(at + 20));
            event->setEventNumber(static_cast<std::uint32_t>(index + 1));
            events.push_back(std::move(event));
        }
        return events;
    }

    /// What the model holds now comes back when this is called.
    std::function<void()> comingBack()
    {
        auto state = std::make_shared<core::serialize::ByteArchive>();
        *state << m_model;
        return [this, state] {
            state->rewind();
            m_model.restore(*state);
            activate();
        };
    }
};

} // namespace cadrel::tests
