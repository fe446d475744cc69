// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/reel3/CutReading.h"

#include "core/time/Framerate.h"
#include "core/time/FramerateProvider.h"
#include "core/time/Timecode.h"
#include "util/StringConverter.h"
#include "util/StringUtil.h"

namespace reel3 {

using cadrel::core::EventList;
using cadrel::core::Framerate;
using cadrel::core::Timecode;
using cadrel::util::StringUtil;

namespace {

class PlainConverter : public cadrel::util::StringConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return text; }
};

class PictureRate : public cadrel::core::FramerateProvider {
public:
    Framerate getFramerate() const override { return {24, 0}; }
};

const PlainConverter Converter;
const PictureRate Rate;

} // namespace

EdlSetting::EdlSetting()
{
    StringUtil::setConverter(&Converter);
    Timecode::setFramerateProvider(&Rate);
}

EdlSetting::~EdlSetting()
{
    Timecode::setFramerateProvider(nullptr);
    StringUtil::setConverter(nullptr);
}

EventList readCut(const std::string& edl)
{
    EventList picture;
    Framerate shown;
    picture.load(StringUtil::toWide(edl), false, shown, false, false);
    return picture;
}

} // namespace reel3
