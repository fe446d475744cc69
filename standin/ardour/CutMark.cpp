// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/CutMark.h"

#include <pugixml.hpp>

#include <sstream>
#include <string>

namespace standin {

namespace {

constexpr const char* Element = "Cadrel";

pugi::xml_node childOf(pugi::xml_node parent, const char* name)
{
    const pugi::xml_node child = parent.child(name);
    return child ? child : parent.append_child(name);
}

std::string wordOf(RegionEdge edge)
{
    return edge == RegionEdge::Seam ? "seam" : "new";
}

} // namespace

std::optional<CutMark> CutMark::read(const pugi::xml_node& region, const char* end, std::int64_t place,
                                     std::int64_t fadeLength)
{
    const pugi::xml_attribute text = region.child("Extra").child(Element).attribute(end);
    if (!text)
        return std::nullopt;
    std::istringstream words(text.value());
    std::string word;
    std::int64_t formerPlace = 0;
    std::int32_t fade = 0;
    std::int64_t formerLength = 0;
    words >> word >> formerPlace >> fade >> formerLength;
    for (const RegionEdge kind : {RegionEdge::New, RegionEdge::Seam}) {
        if (words && word == wordOf(kind) && formerPlace == place && formerLength == fadeLength && fade >= 0 &&
            fade <= fadeLength)
            return CutMark{kind, fade};
    }
    return std::nullopt;
}

void CutMark::write(pugi::xml_node& region, const char* end, std::int64_t place, std::int64_t fadeLength) const
{
    pugi::xml_node element = childOf(childOf(region, "Extra"), Element);
    pugi::xml_attribute attribute = element.attribute(end);
    if (!attribute)
        attribute = element.append_attribute(end);
    std::ostringstream words;
    words << wordOf(edge) << ' ' << place << ' ' << fade << ' ' << fadeLength;
    attribute.set_value(words.str().c_str());
}

void CutMark::remove(pugi::xml_node& region, const char* end)
{
    pugi::xml_node extra = region.child("Extra");
    pugi::xml_node element = extra.child(Element);
    element.remove_attribute(end);
    if (element && !element.first_attribute())
        extra.remove_child(element);
    if (extra && !extra.first_child())
        region.remove_child(extra);
}

} // namespace standin
