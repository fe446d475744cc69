// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Track.h"

#include "standin/base/ObjectList.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"

#include <algorithm>
#include <array>

using namespace Velmark;

namespace standin {

namespace {

struct KindWord {
    Track::Kind kind;
    const char* word;
};

constexpr std::array<KindWord, 5> KindWords{{{Track::Kind::Audio, TypeWord::Audio},
                                             {Track::Kind::Video, TypeWord::Video},
                                             {Track::Kind::Marker, TypeWord::Marker},
                                             {Track::Kind::Ruler, TypeWord::Ruler},
                                             {Track::Kind::Folder, TypeWord::Folder}}};

} // namespace

Counted<Track> Track::create(Kind kind)
{
    if (kind == Kind::Marker)
        return makeCounted<MarkerTrack>();
    auto track = Counted<Track>::adopt(new Track(kind));
    if (kind == Kind::Audio) {
        for (const int32 number : {Envelope::Curve::Volume, Envelope::Curve::Pan, Envelope::Curve::Mute})
            track->curve(number);
    }
    return track;
}

std::optional<Track::Kind> Track::kindOf(std::string_view word)
{
    const auto found =
        std::ranges::find(KindWords, word, [](const KindWord& entry) -> std::string_view { return entry.word; });
    return found != KindWords.end() ? std::optional(found->kind) : std::nullopt;
}

const char* Track::wordOf(Kind kind)
{
    return std::ranges::find(KindWords, kind, &KindWord::kind)->word;
}

Track::~Track()
{
    for (const auto& [number, curve] : m_curves)
        curve->m_track = nullptr;
}

bool Track::isType(const char* word)
{
    if (!word)
        return false;
    const std::string_view asked = word;
    return asked == TypeWord::Track || asked == wordOf(m_kind);
}

int32 Track::setFlag(const char* name, bool value)
{
    if (!name || std::string_view(name) != TrackFlag::Lock)
        return ResultFalse;
    setLocked(value);
    return ResultOk;
}

int32 Track::getFlag(const char* name)
{
    return name && std::string_view(name) == TrackFlag::Lock && m_isLocked ? ResultOk : ResultFalse;
}

IObjectList* Track::getAutomation()
{
    if (!hasAutomation())
        return nullptr;
    auto list = makeCounted<ObjectList>();
    for (const auto& [number, curve] : m_curves)
        list->add(static_cast<IEnvelopeTrack*>(curve.get()), 0);
    return list.detach();
}

bool Track::accepts(const Node& child) const
{
    switch (m_kind) {
    case Kind::Folder:
        for (const Container* around = this; around; around = around->parent()) {
            if (around == &child)
                return false;
        }
        return dynamic_cast<const Track*>(&child) != nullptr;
    case Kind::Marker:
    case Kind::Ruler:
        return dynamic_cast<const Marker*>(&child) != nullptr;
    case Kind::Audio:
    case Kind::Video:
        return dynamic_cast<const ClipEvent*>(&child) || dynamic_cast<const Part*>(&child);
    }
    return false;
}

double Track::lastEnd() const
{
    if (!isFolder())
        return contentEnd();
    double latest = 0.0;
    for (const Node* child = firstChild(); child; child = childBehind(*child))
        latest = std::max(latest, child->lastEnd());
    return latest;
}

void Track::setLocked(bool locked)
{
    if (locked != m_isLocked)
        change(*this, &Track::exchangeLocked, locked);
}

Envelope& Track::curve(int32 number)
{
    Counted<Envelope>& curve = m_curves[number];
    if (!curve)
        curve = makeCounted<Envelope>(*this, number);
    return *curve;
}

void Track::markRemoved(ChangeNotes& changes)
{
    Node::markRemoved(changes);
    if (!isFolder())
        return;
    for (Node* child = firstChild(); child; child = childBehind(*child))
        static_cast<Track&>(*child).markRemoved(changes);
}

bool Track::exchangeLocked(bool locked)
{
    std::swap(m_isLocked, locked);
    markContentChanged();
    return locked;
}

} // namespace standin
