// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/PictureLine.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/ProgrammePlace.h"
#include "core/picture/PictureNames.h"

#include <algorithm>
#include <optional>
#include <set>
#include <tuple>

namespace cadrel::core {

namespace {

/// Equal pictures stand side by side, the first event of the list in front.
struct LayerOrder {
    bool operator()(const PictureLayer& a, const PictureLayer& b) const
    {
        return std::tie(a.material, a.speed, a.origin, a.event) < std::tie(b.material, b.speed, b.origin, b.event);
    }
};

/// Where an event shows a picture, if it does.
std::optional<FrameRange> framesOf(const EventBase& event, const Framerate& framerate)
{
    if (!fillsProgramme(event, framerate) || isBlack(event))
        return std::nullopt;
    return FrameRange{event.dstIn().toFrameCount(framerate), event.dstOut().toFrameCount(framerate)};
}

} // namespace

FrameRanges litFrames(const EventList& events, const Framerate& framerate)
{
    std::vector<FrameRange> lit;
    for (const auto& event : events.events()) {
        if (const auto frames = framesOf(*event, framerate))
            lit.push_back(*frames);
    }
    return united(std::move(lit));
}

PictureLine::PictureLine(const EventList& events, PictureNames& names, const Framerate& framerate)
{
    addRuns(edgesOf(events, names, framerate));
    std::vector<FrameRange> frames;
    frames.reserve(m_runs.size());
    for (const PictureRun& run : m_runs)
        frames.push_back(run.frames);
    m_lit = united(std::move(frames));
}

std::uint32_t PictureLine::eventOf(const PictureRun& run) const
{
    const auto layers = layersOf(run);
    return std::min_element(layers.begin(), layers.end(),
                            [](const PictureLayer& a, const PictureLayer& b) { return a.event < b.event; })
        ->event;
}

std::vector<PictureLine::Edge> PictureLine::edgesOf(const EventList& events, PictureNames& names,
                                                    const Framerate& framerate)
{
    std::vector<Edge> edges;
    edges.reserve(2 * events.size());
    const auto add = [&edges](const FrameRange& frames, const PictureLayer& layer) {
        if (frames.isEmpty())
            return;
        edges.push_back({frames.start, true, layer});
        edges.push_back({frames.end, false, layer});
    };
    for (std::size_t index = 0; index < events.size(); ++index) {
        const EventBase& event = events.at(index);
        const std::optional<FrameRange> shown = framesOf(event, framerate);
        if (!shown)
            continue;
        const FrameRange frames = *shown;
        PictureLayer layer;
        layer.event = static_cast<std::uint32_t>(index);
        if (PictureNames::hasReadableSource(event, framerate)) {
            const std::int32_t first = event.firstSource().toFrameCount(framerate);
            layer.speed = static_cast<double>(event.lastSource().toFrameCount(framerate) - first) / frames.length();
            layer.origin = first - frames.start * layer.speed;
        }
        std::int32_t bodyStart = frames.start;
        if (event.isTransition() && event.transitionDuration() > 0) {
            bodyStart += std::min(event.transitionDuration(), frames.length());
            layer.material = names.numberOfTransition(event, outgoingOf(events, index), framerate);
            add({frames.start, bodyStart}, layer);
        }
        layer.material = names.numberOf(event, framerate);
        add({bodyStart, frames.end}, layer);
    }
    std::sort(edges.begin(), edges.end(), [](const Edge& a, const Edge& b) { return a.frame < b.frame; });
    return edges;
}

void PictureLine::addRuns(const std::vector<Edge>& edges)
{
    std::set<PictureLayer, LayerOrder> standing;
    for (auto edge = edges.begin(); edge != edges.end();) {
        const std::int32_t frame = edge->frame;
        for (; edge != edges.end() && edge->frame == frame; ++edge) {
            if (edge->isStart)
                standing.insert(edge->layer);
            else
                standing.erase(edge->layer);
        }
        if (!standing.empty())
            addRun({frame, edge->frame}, standing);
    }
}

template <class Layers>
void PictureLine::addRun(const FrameRange& frames, const Layers& layers)
{
    PictureRun run{frames, m_layers.size(), 0, layers.size(), true};
    for (const PictureLayer& layer : layers) {
        if (run.layerCount == MostLayers)
            break;
        --run.unseenLayers;
        if (run.layerCount > 0 && m_layers.back().isSamePicture(layer))
            continue;
        m_layers.push_back(layer);
        ++run.layerCount;
        run.isStill = run.isStill && layer.speed == 0.0;
    }
    if (!continuesLastRun(run)) {
        m_runs.push_back(run);
        return;
    }
    m_layers.resize(run.firstLayer);
    m_runs.back().frames.end = frames.end;
}

bool PictureLine::continuesLastRun(const PictureRun& run) const
{
    if (m_runs.empty() || m_runs.back().frames.end != run.frames.start ||
        m_runs.back().unseenLayers != run.unseenLayers)
        return false;
    const auto last = layersOf(m_runs.back());
    const auto layers = layersOf(run);
    return std::equal(last.begin(), last.end(), layers.begin(), layers.end(),
                      [](const PictureLayer& a, const PictureLayer& b) { return a.isSamePicture(b); });
}

} // namespace cadrel::core
