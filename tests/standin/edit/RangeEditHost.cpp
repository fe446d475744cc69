// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/standin/edit/RangeEditHost.h"

#include "standin/project/ClipEvent.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"

#include <sstream>
#include <stdexcept>

using namespace Velmark;

namespace standin::tests {

namespace {

void require(int32 result)
{
    if (result != ResultOk)
        throw std::runtime_error("the host has refused");
}

std::string join(const std::vector<std::string>& texts, const char* separator)
{
    std::string joined;
    for (const std::string& each : texts)
        joined += joined.empty() ? each : separator + each;
    return joined;
}

std::string textOf(IProjectNode& event)
{
    std::ostringstream text;
    for (const char16_t* unit = event.getName(); *unit; ++unit)
        text << static_cast<char>(*unit);
    text << ' ' << event.getStart(nullptr);
    if (event.isType(TypeWord::Marker) && !event.isType(TypeWord::Range))
        return text.str();
    text << '-' << event.getEnd(nullptr);
    if (query<IClipEvent>(&event))
        text << " +" << event.getSourceOffset(nullptr);
    if (event.isType(TypeWord::Part))
        text << " (" << RangeEditHost::eventsOf(TestHost::Node::share(&event)) << ')';
    return text.str();
}

} // namespace

void RangeEditHost::copyRange(std::initializer_list<Node> tracks, double start, double end, double destination)
{
    edit(u"Copy",
         [&] { require(editService()->copyRange(document(), listOf(tracks).get(), 0, start, end, destination)); });
}

void RangeEditHost::deleteRange(double start, double end)
{
    edit(u"Delete", [&] { require(transaction()->deleteRange(document(), 0, start, end)); });
}

void RangeEditHost::copyAllAndPaste(double start, double end, double destination)
{
    edit(u"Paste", [&] {
        Counted<FUnknown> clipboard;
        require(transaction()->copyAll(document(), clipboard.out(), start, end, 0));
        require(transaction()->paste(document(), clipboard.get(), 0, destination));
    });
}

bool RangeEditHost::closeRange(std::initializer_list<Node> tracks, double start, double end)
{
    int32 result = ResultOk;
    edit(u"Close", [&] { result = editService()->closeRange(document(), listOf(tracks).get(), start, end, 0.0); });
    if (result != ResultFalse)
        require(result);
    return result == ResultOk;
}

TestHost::Node RangeEditHost::addClipFrom(const Node& parent, const char16_t* name, double start, double end,
                                          double offset)
{
    const Node clip = addClip(parent, name, start, end);
    dynamic_cast<ClipEvent&>(*clip).setSourceOffset(offset);
    return clip;
}

void RangeEditHost::addVolume(const Node& track, std::initializer_list<std::pair<double, float>> points)
{
    for (const auto& [time, value] : points)
        addPoint(track, Envelope::Curve::Volume, time, value);
}

std::string RangeEditHost::eventsOf(const Node& parent)
{
    std::vector<std::string> texts;
    for (const Node& event : childrenOf(*parent))
        texts.push_back(textOf(*event));
    return join(texts, ", ");
}

std::string RangeEditHost::volumeOf(const Node& track)
{
    return curveTextOf(track, Envelope::Curve::Volume);
}

std::string RangeEditHost::curveTextOf(const Node& track, int32 number)
{
    std::vector<std::string> texts;
    for (const Node& point : childrenOf(*curveOf(track, number))) {
        std::ostringstream text;
        text << point->getStart(nullptr) << '=' << query<IAutomationPoint>(point)->getValue();
        texts.push_back(text.str());
    }
    return join(texts, " ");
}

Counted<IObjectList> RangeEditHost::listOf(std::initializer_list<Node> tracks)
{
    auto list = create<IObjectList>(context());
    for (const Node& track : tracks)
        require(list->add(track.get(), 0));
    return list;
}

} // namespace standin::tests
