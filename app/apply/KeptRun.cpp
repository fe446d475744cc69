// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/KeptRun.h"

#include "app/apply/HostedProject.h"
#include "app/apply/RunMaterial.h"
#include "app/console/Failure.h"
#include "app/console/Wording.h"
#include "app/edl/ProjectClock.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/RunRecord.h"
#include "core/settings/Settings.h"
#include "core/time/Timecode.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <memory>
#include <utility>

namespace cadrel::app {

using core::DataModel;
using core::EventBase;
using core::EventList;
using core::FrameRange;
using core::FrameRanges;
using core::Framerate;
using core::KeepRefusal;
using core::Timecode;

namespace {

/// While it lives, a change list that holds nothing has one event that a run passes over. A run takes the old sound away
/// then, but doesn't begin without an event.
class NothingCarried {
public:
    explicit NothingCarried(EventList& list) : m_list(list), m_isNeeded(list.isEmpty())
    {
        if (!m_isNeeded)
            return;
        auto event = std::make_shared<EventBase>();
        const Timecode none(0, MinuteOfNoHour, 0, 0);
        event->setTimecodes(none, none, none, none);
        m_list.add(std::move(event));
    }
    NothingCarried(const NothingCarried&) = delete;
    NothingCarried& operator=(const NothingCarried&) = delete;
    ~NothingCarried()
    {
        if (m_isNeeded)
            m_list.clear();
    }

private:
    static constexpr std::int32_t MinuteOfNoHour = 99;

    EventList& m_list;
    bool m_isNeeded;
};

/// The texts of ranges of frames, in a message.
class RangeTexts {
public:
    RangeTexts(const ProjectClock& clock, double timeOrigin, const Framerate& framerate)
        : m_clock(clock), m_timeOrigin(timeOrigin), m_framerate(framerate)
    {
    }

    std::string length(std::int32_t frames) const { return m_clock.length(frames / m_framerate.rate); }
    std::string place(std::int32_t frame) const { return m_clock.timecode(frame / m_framerate.rate - m_timeOrigin); }
    /// "2 reels (01:00:00:00 - 01:18:00:00, 02:00:00:00 - 02:20:00:00)".
    std::string reels(const FrameRanges& reels) const
    {
        constexpr std::size_t Most = 6;
        std::vector<std::string> texts;
        for (std::size_t index = 0; index < std::min(reels.size(), Most); ++index)
            texts.push_back(place(reels[index].start) + " - " + place(reels[index].end));
        if (reels.size() > Most)
            texts.emplace_back("...");
        return counted(reels.size(), "reel") + (texts.empty() ? "" : " (" + joined(texts) + ")");
    }

private:
    const ProjectClock& m_clock;
    double m_timeOrigin;
    Framerate m_framerate;
};

Failure failureOf(const KeepRefusal& refusal, const RangeTexts& texts, const std::string& inputs)
{
    const std::string amount = texts.length(refusal.amount());
    const std::string first = refusal.material.empty() ? std::string() : texts.place(refusal.material.front().start);
    switch (refusal.reason) {
    case KeepRefusal::UnequalReels:
        return {inputs,
                "the old cut has " + texts.reels(refusal.oldReels) + ", and the new cut has " +
                    texts.reels(refusal.newReels),
                "give both cuts of the same reels; or does what stands around the reels stay in its place? then give "
                "--force"};
    case KeepRefusal::OutsideOfDay:
        return {inputs,
                amount + " of sound or markers, from " + first +
                    " on, would have to move, but no timecode of a day names their place",
                "move them into the day, or lock their tracks"};
    case KeepRefusal::MaterialInTheWay:
        break;
    }
    return {inputs,
            amount + " of sound or markers, from " + first + " on, stand where the change EDL puts its stretches",
            "make room for them, or give --force to let the cut win"};
}

} // namespace

KeptRun::KeptRun(DataModel& model, const standin::Project& project, const ProjectClock& clock, Source source,
                 const std::string& inputs, const Doubt& doubt)
    : m_run(model, RunMaterial(project, model.settings()).stretches(), source)
{
    const RangeTexts texts(clock, project.timeOrigin(), Timecode::framerate());
    for (const KeepRefusal& question : plan().questions)
        doubt(failureOf(question, texts, inputs));
    if (plan().refusal)
        throw failureOf(*plan().refusal, texts, inputs);
    m_carried.append(m_run.carried(model).release());
    m_outside.append(m_run.outside(model).release());
    m_run.putListInto(model);
    // Their numbers go on after those of the list.
    auto number = static_cast<std::uint32_t>(model.changeEdl().size());
    for (const auto& event : m_outside.events())
        event->setEventNumber(++number);
}

void KeptRun::apply(HostedProject& hosted) const
{
    DataModel& model = hosted.model();
    if (!needsRun()) {
        core::RunRecord::addRun(model, core::RunRecord::allowedBy(model.settings()));
        return;
    }
    const NothingCarried nothing(model.changeEdl());
    hosted.applyWithin(bounds());
}

const char* wordOf(core::CarriedFrom from)
{
    constexpr std::array Words{"cut", "unchanged", "hole", "black"};
    return Words.at(static_cast<std::size_t>(from));
}

} // namespace cadrel::app
