// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/border/NodeReading.h"

#include "host/border/HostFailure.h"
#include "util/HostString.h"
#include "velmark/Editing.h"
#include "velmark/Tracks.h"

#include <string_view>

using namespace Velmark;

namespace cadrel::host {

std::vector<Counted<IProjectNode>> childrenOf(IProjectNode& node)
{
    std::vector<Counted<IProjectNode>> children;
    const auto iterator = required(Counted<INodeIterator>::adopt(node.newChildIterator()));
    while (!iterator->isDone())
        children.push_back(Counted<IProjectNode>::share(required(iterator->next())));
    return children;
}

std::vector<Counted<IProjectNode>> curvesOf(ITrackNode& track)
{
    std::vector<Counted<IProjectNode>> curves;
    const auto list = Counted<IObjectList>::adopt(track.getAutomation());
    const int32 count = list ? list->count() : 0;
    for (int32 index = 0; index < count; ++index)
        curves.push_back(required(query<IProjectNode>(required(list->at(index)))));
    return curves;
}

std::wstring nameOf(IProjectNode& node)
{
    return util::HostString(std::u16string_view(required(node.getName()))).wide();
}

} // namespace cadrel::host
