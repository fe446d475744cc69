// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/Host.h"
#include "host/project/Project.h"
#include "tests/support/host/AdaptedHost.h"
#include "velmark/Tracks.h"

#include <initializer_list>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {

using Texts = std::vector<std::string>;
using Entries = AdaptedHost::Entries;
using Node = AdaptedHost::Node;
using Span = std::pair<double, double>;

/// The first whole day behind the film, in seconds of the clock.
inline constexpr double Day = 86400.0;

/// A film of two clips of ten seconds that change places, previewed.
class PreviewedFilm : public AtEachOrigin {
protected:
    PreviewedFilm()
    {
        host.addSound(track, u"one", 0.0, 10.0);
        host.addSound(track, u"two", 10.0, 20.0);
        host.switchMarkersOff();
        host.carryOver("01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00");
        host.carryOver("01:00:10:00", "01:00:20:00", "01:00:00:00", "01:00:10:00");
        host.project.locatorLeft().setValue(0, 3.0);
        host.project.locatorRight().setValue(0, 8.0);
        host.project.cycleLeft().setValue(0, 4.0);
        host.project.cycleRight().setValue(0, 9.0);
        host.project.position().setValue(0, 5.0);
        entriesBefore = host.undoNames();
    }

    Host& adapter() { return host.adapter(); }
    core::EventList& changes() { return host.model().changeEdl(); }
    core::EventList firstChange()
    {
        core::EventList list;
        list.append(changes(), 0, 1);
        return list;
    }
    core::EventList secondChange()
    {
        core::EventList list;
        list.append(changes(), 1, 1);
        return list;
    }
    /// As the window does it.
    void previewAll()
    {
        adapter().setPreviewActive(true);
        host.preview(changes());
    }

    Entries entriesBeforeAnd(std::initializer_list<std::u16string> names) const
    {
        Entries entries = entriesBefore;
        entries.insert(entries.end(), names);
        return entries;
    }
    bool isLocked(const Node& node)
    {
        return Velmark::query<Velmark::ITrackNode>(node)->getFlag(Velmark::TrackFlag::Lock) == Velmark::ResultOk;
    }
    Span transportCycle() { return {host.project.cycleLeft().getValue(), host.project.cycleRight().getValue()}; }
    Span locators() { return {host.project.locatorLeft().getValue(), host.project.locatorRight().getValue()}; }
    bool hasOffset()
    {
        core::Variant offset(Project::NoPreviewOffset);
        host.model().getProperty(core::PropertyKey::PreviewOffset, offset);
        return offset.toDouble() > Project::NoPreviewOffset;
    }

    AdaptedHost host{GetParam()};
    Node track = host.addTrack(Velmark::TypeWord::Audio, u"DX");
    Entries entriesBefore;
};

} // namespace cadrel::host::tests
