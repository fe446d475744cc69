// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "tests/support/core/MemoryEngine.h"
#include "tests/support/core/TestPool.h"
#include "util/Result.h"

#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// The engine of a window under test. It writes down what the window asks for, and answers as a test says.
class RecordingEngine : public MemoryEngine {
public:
    explicit RecordingEngine(core::DataModel& model) : MemoryEngine(model), m_dataModel(model) {}

    util::Result::Type ready = util::Result::Ok;
    util::Result::Type answer = util::Result::Ok;
    util::Result::Type thrown = util::Result::Ok; ///< thrown by what is asked for, when it isn't Ok
    std::vector<std::string> calls;
    TestPool pool;
    std::vector<core::SecondsRange> material;
    double origin = 0.0;
    bool hasName = true;             ///< the host can tell the file of the project
    std::function<void()> onPreview; ///< called once, when the preview is switched

    util::Result::Type canStart() override { return ready; }
    util::Result::Type startCadrel() override { return note("run"); }
    /// "run 3600..3610", in whole seconds.
    util::Result::Type startCadrelWithin(const core::SecondsRange& bounds) override { return note(textOf(bounds)); }
    /// "run 3600..3610 of B002", with the rolls of the list.
    util::Result::Type startCadrelWithin(const core::SecondsRange& bounds, const core::EventList& changeList) override
    {
        std::string rolls;
        for (const auto& event : changeList.events())
            rolls.append(rolls.empty() ? "" : "+").append(event->rollName());
        return note(textOf(bounds).append(" of ").append(rolls));
    }
    std::vector<core::SecondsRange> getMaterial() override { return material; }
    /// "preview 1+2+3 1 1 0": the numbers of the events, the neighbours on both sides and the options.
    util::Result::Type startPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                    std::uint32_t options) override
    {
        return note("preview " + textOf(events, first, last, options));
    }
    util::Result::Type cycleToEvents(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                     std::uint32_t options) override
    {
        return note("cycle " + textOf(events, first, last, options));
    }
    util::Result::Type endPreview() override { return note("end"); }
    std::wstring getProjectName() override
    {
        if (!hasName)
            throw util::Result::HostCallFailed;
        return L"/films/film.stage";
    }
    double getTimeOrigin() override { return origin; }
    core::MediaPoolInterface* getMediaPool() override { return &pool; }
    void setPreviewActive(bool active) override
    {
        note(active ? "on" : "off");
        m_dataModel.setPreviewActive(active);
        m_dataModel.notifyPreviewState();
        if (const auto call = std::exchange(onPreview, nullptr))
            call();
    }

private:
    static std::string textOf(const core::SecondsRange& bounds)
    {
        return std::string("run ")
            .append(std::to_string(static_cast<long>(bounds.start)))
            .append("..")
            .append(std::to_string(static_cast<long>(bounds.end)));
    }
    static std::string textOf(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                              std::uint32_t options)
    {
        std::string text;
        for (const auto& event : events.events()) {
            if (!text.empty())
                text.append(1, '+');
            text.append(std::to_string(event->eventNumber()));
        }
        for (const std::uint64_t number : {first, last, std::uint64_t{options}})
            text.append(1, ' ').append(std::to_string(number));
        return text;
    }
    util::Result::Type note(const std::string& call)
    {
        calls.push_back(call);
        if (thrown != util::Result::Ok)
            throw thrown;
        return answer;
    }

    core::DataModel& m_dataModel;
};

} // namespace cadrel::tests
