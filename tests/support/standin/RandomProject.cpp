// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/RandomProject.h"

#include "standin/base/AttributeList.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Track.h"
#include "standin/stage/ProjectKeys.h"

#include <rapidcheck.h>

#include <limits>
#include <string>
#include <vector>

using Velmark::Counted;
using Velmark::FrameRateInfo;
using Velmark::makeCounted;

namespace standin::tests {

namespace {

class Composer {
public:
    Composer(Chance& chance, ChangeLog& log, const ProjectScale& scale)
        : m_chance(chance), m_scale(scale), m_project(makeCounted<Project>(log))
    {
    }

    Counted<Project> compose()
    {
        composeClock();
        composePool();
        addTracks(*m_project, m_scale.tracks);
        describe(*m_project);
        m_project->showChanges();
        m_project->clearChanges();
        return m_project;
    }

private:
    void composeClock()
    {
        static constexpr double Rates[] = {24.0, 23.976, 25.0, 30000.0 / 1001.0, 30.0};
        FrameRateInfo rate;
        rate.framesPerSecond = m_chance.oneOf(Rates);
        rate.flags = static_cast<Velmark::uint32>(m_chance.below(4));
        if (!hasDropFrame(rate.framesPerSecond))
            rate.flags &= ~FrameRateInfo::Flag::DropFrame;
        m_project->setFrameRate(rate);
        m_project->setTimeOrigin(3600.0 * static_cast<double>(m_chance.below(3)));
        m_project->setProjectEnd(time());
        for (Parameter* const parameter : {&m_project->locatorLeft(), &m_project->locatorRight(),
                                           &m_project->cycleLeft(), &m_project->cycleRight(), &m_project->position()})
            parameter->setValue(0, time());
    }

    void composePool()
    {
        const std::size_t count = upTo(m_scale.clips);
        int number = 0;
        for (std::size_t index = 0; index < count; ++index) {
            number += 1 + static_cast<int>(m_chance.below(3));
            const auto kind = m_chance.oneIn(4) ? MediaClip::Kind::Video : MediaClip::Kind::Audio;
            auto clip = makeCounted<MediaClip>(kind, u"/sound/" + name() + u".wav", time());
            if (m_chance.oneIn(3))
                clip->setFileRate(static_cast<double>(1 + m_chance.below(1000)));
            describe(*clip);
            m_project->pool().add(clip, number);
            m_clips.push_back(std::move(clip));
        }
    }

    /// Uses up the budget with the folders that it makes.
    void addTracks(Container& parent, std::size_t budget)
    {
        for (std::size_t count = upTo(budget); count > 0; --count) {
            static constexpr Track::Kind Kinds[] = {Track::Kind::Audio, Track::Kind::Folder, Track::Kind::Marker,
                                                    Track::Kind::Video, Track::Kind::Ruler};
            const auto track = Track::create(m_chance.oneOf(Kinds));
            track->insertInto(parent);
            track->setLocked(m_chance.oneIn(5));
            describe(*track);
            if (track->isFolder())
                addTracks(*track, count - 1);
            else
                fill(*track);
        }
    }

    void fill(Track& track)
    {
        addEvents(track, m_scale.events);
        if (!track.hasAutomation())
            return;
        for (Velmark::int32 number = 1; number <= 6; ++number) {
            if (m_chance.oneIn(3))
                addPoints(track.curve(number));
        }
    }

    void addEvents(Container& container, std::size_t most)
    {
        for (std::size_t count = upTo(most); count > 0; --count) {
            const auto event = newEvent(container);
            if (!event)
                continue;
            const double start = time();
            const auto* const marker = dynamic_cast<const Marker*>(event.get());
            const bool isInstant = marker && !marker->isRange();
            event->setSpan(start, isInstant ? start : start + time() / 8.0);
            describe(*event);
            event->insertInto(container);
            if (dynamic_cast<Part*>(event.get()))
                addEvents(*event, most / 3);
        }
    }

    /// Of a kind that the container takes; null for the others.
    Counted<Event> newEvent(const Container& container)
    {
        Counted<Event> event;
        switch (m_chance.below(6)) {
        case 0:
            event = makeCounted<Part>();
            break;
        case 1:
            event = makeCounted<Marker>(false);
            break;
        case 2:
            event = makeCounted<Marker>(true);
            break;
        default:
            event = newClipEvent();
        }
        return container.accepts(*event) ? event : nullptr;
    }

    Counted<Event> newClipEvent()
    {
        auto event = makeCounted<ClipEvent>();
        if (!m_clips.empty() && !m_chance.oneIn(8))
            event->setClip(m_chance.oneOf(m_clips));
        event->setSourceOffset(time());
        return event;
    }

    void addPoints(Envelope& curve)
    {
        for (std::size_t count = upTo(m_scale.points); count > 0; --count) {
            const auto point = makeCounted<AutomationPoint>();
            const double at = time();
            point->setSpan(at, at);
            point->setValue(m_chance.oneIn(3) ? static_cast<double>(m_chance.below(2)) : fraction());
            point->insertInto(curve);
        }
    }

    void describe(Node& node)
    {
        if (!m_chance.oneIn(3))
            node.setName(name());
        node.setSelected(m_chance.oneIn(5));
        for (std::size_t count = upTo(2); count > 0; --count)
            node.setAttribute(key(), attribute());
    }

    Attribute attribute()
    {
        const bool isPersistent = !m_chance.oneIn(4);
        switch (m_chance.below(4)) {
        case 0:
            return {std::string(m_chance.oneOf(Texts)), isPersistent};
        case 1:
            return {Counted<Velmark::FUnknown>(Counted<Velmark::FObject>(attributeList())), isPersistent};
        case 2:
            return {m_chance.oneIn(2) ? std::numeric_limits<Velmark::int64>::min()
                                      : std::numeric_limits<Velmark::int64>::max(),
                    isPersistent};
        default:
            return {static_cast<Velmark::int64>(m_chance.below(2000)) - 1000, isPersistent};
        }
    }

    Counted<AttributeList> attributeList()
    {
        auto list = makeCounted<AttributeList>();
        for (std::size_t count = upTo(3); count > 0; --count) {
            Bytes bytes(upTo(5));
            for (Velmark::uint8& byte : bytes)
                byte = static_cast<Velmark::uint8>(m_chance.below(256));
            list->set(key(), std::move(bytes));
        }
        return list;
    }

    std::string key()
    {
        static constexpr const char* Keys[] = {
            "CaDr", "Cadrel:MarkerType", "User:STR_MAReel", "CadrEventUserId", "a\"b\\c", "", "T\xc3\xb6ne"};
        return m_chance.oneOf(Keys);
    }

    std::u16string name()
    {
        static constexpr const char16_t* Names[] = {u"DX 1",   u"FX \"door\"", u"Atmo\\Wind", u"M\u00fcsik",
                                                    u"\u58f0", u"\U0001f3ac",  u"tab\there",  u"\u007f\u0085"};
        return std::u16string(m_chance.oneOf(Names)) + static_cast<char16_t>(u'0' + m_chance.below(10));
    }

    /// Up to the scale's time: in whole seconds, in frames, or anywhere.
    double time()
    {
        switch (m_chance.below(3)) {
        case 0:
            return static_cast<double>(m_chance.below(static_cast<std::uint64_t>(m_scale.seconds) + 1));
        case 1:
            return static_cast<double>(m_chance.below(static_cast<std::uint64_t>(24.0 * m_scale.seconds) + 1)) / 24.0;
        default:
            return m_scale.seconds * fraction();
        }
    }

    /// Any double from 0 up to, and without, 1.
    double fraction() { return static_cast<double>(m_chance.below(1ULL << 53U)) / static_cast<double>(1ULL << 53U); }

    std::size_t upTo(std::size_t most) { return m_chance.below(most + 1); }

    static constexpr const char* Texts[] = {"A001", "", "line\nline", "\xe5\xa3\xb0\xe9\x9f\xb3", "\x01\x1f\x7f"};

    Chance& m_chance;
    const ProjectScale m_scale;
    Counted<Project> m_project;
    std::vector<Counted<MediaClip>> m_clips;
};

} // namespace

std::uint64_t CheckedChance::below(std::uint64_t limit)
{
    // The first cases of a property would else hardly ever choose but the first of several.
    return *rc::gen::resize(rc::kNominalSize, rc::gen::inRange<std::uint64_t>(0, limit));
}

Counted<Project> randomProject(Chance& chance, ChangeLog& log, const ProjectScale& scale)
{
    return Composer(chance, log, scale).compose();
}

} // namespace standin::tests
