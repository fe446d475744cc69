// SPDX-License-Identifier: GPL-3.0-or-later

// Two EDLs into a change EDL.
//
// An input is readable text: a line of five digits, which choose the names to match by, the heal mode, the VFX pattern,
// the frame rate and the heal mode of a second healing; the old EDL; a line "===="; the new EDL.

#include "core/edl/EventBase.h"
#include "core/edl/HealedEvent.h"
#include "core/model/DataModel.h"
#include "core/serialize/ByteArchive.h"
#include "fuzz/Check.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace {

using namespace cadrel;
using fuzz::check;

struct Input {
    std::array<std::uint8_t, 5> choices{};
    std::string_view oldEdl;
    std::string_view newEdl;

    std::int32_t choice(std::size_t index, std::int32_t count) const { return choices[index] % count; }
};

Input split(std::string_view text)
{
    constexpr std::string_view Separator = "====";
    Input input;
    for (std::size_t i = 0; i < input.choices.size() && i < text.size(); ++i)
        input.choices[i] = static_cast<std::uint8_t>(text[i] - '0');
    text.remove_prefix(std::min(input.choices.size(), text.size()));
    const std::size_t end = text.find(Separator);
    input.oldEdl = text.substr(0, end);
    if (end != std::string_view::npos)
        input.newEdl = text.substr(end + Separator.size());
    return input;
}

core::Framerate framerateOf(const Input& input)
{
    constexpr std::array<const char*, 5> Labels{"24 fps", "25 fps", "29.97 dfps", "23.98 fps", "60 fps"};
    return core::Framerate::fromLabel(Labels[static_cast<std::size_t>(input.choice(3, Labels.size()))]);
}

core::VfxPatternEntry patternOf(const Input& input)
{
    switch (input.choice(2, 3)) {
    case 0:
        return {};
    case 1:
        return {"VFX_****_v", "_comp", true};
    default:
        return {"A", "", true};
    }
}

std::vector<std::uint8_t> bytesOf(const core::EventList& events)
{
    core::serialize::ByteArchive archive;
    archive << events;
    return std::vector<std::uint8_t>(archive.data(), archive.data() + archive.size());
}

std::int32_t lengthOf(const core::Timecode& in, const core::Timecode& out)
{
    return out.toFrameCount() - in.toFrameCount();
}

void checkChangeEvent(const core::EventBase& event)
{
    check(event.isValid(), "a change event has no flaw");
    check(event.transitionType() == core::TransitionType::Cut, "a change event is a cut");
    check(lengthOf(event.srcIn(), event.srcOut()) == lengthOf(event.dstIn(), event.dstOut()),
          "a change event is as long in the old programme as in the new one");
}

void checkHealedEvent(const core::HealedEvent& healed)
{
    const core::EventList& members = healed.healedEvents();
    check(members.size() >= 2, "a healed event has members to join");
    for (std::size_t i = 0; i < members.size(); ++i) {
        checkChangeEvent(members.at(i));
        if (i > 0)
            check(members.at(i).srcIn() >= members.at(i - 1).srcOut() &&
                      members.at(i).dstIn() >= members.at(i - 1).dstOut(),
                  "the members of a healed event follow each other on both sides");
    }
    const core::EventBase& first = members.at(0);
    const core::EventBase& last = members.at(members.size() - 1);
    check(healed.srcIn() == first.srcIn() && healed.srcOut() == last.srcOut() && healed.dstIn() == first.dstIn() &&
              healed.dstOut() == last.dstOut(),
          "a healed event covers its members");
}

void checkEvents(const core::EventList& changes)
{
    for (const auto& event : changes.events()) {
        checkChangeEvent(*event);
        if (event->eventKind() == core::EventKind::Healed)
            checkHealedEvent(dynamic_cast<const core::HealedEvent&>(*event));
    }
}

void checkOrder(const core::EventList& changes)
{
    for (std::size_t i = 0; i < changes.size(); ++i) {
        check(changes.at(i).eventNumber() == i + 1, "a healed list is numbered from 1");
        check(i == 0 || changes.at(i).dstIn() >= changes.at(i - 1).dstIn(), "a healed list is sorted by DST IN");
    }
}

void checkUnhealed(const core::EventList& changes)
{
    for (std::size_t i = 0; i < changes.size(); ++i) {
        check(changes.at(i).eventKind() == core::EventKind::Plain, "without healing nothing is joined");
        check(i == 0 || changes.at(i).eventNumber() > changes.at(i - 1).eventNumber(),
              "the numbers of a generated list ascend");
    }
}

/// Everything that survives lies within what there was.
void checkRanges(const core::DataModel& model)
{
    if (model.changeEdl().isEmpty())
        return;
    check(model.changeEdl().sourceRange().start >= model.oldEdl().destinationRange().start,
          "nothing survives from before the old programme");
    check(model.changeEdl().destinationRange().start >= model.newEdl().destinationRange().start,
          "nothing survives to before the new programme");
}

void checkHealingAnew(core::DataModel& model, std::int32_t mode)
{
    core::EventList& changes = model.changeEdl();
    const core::EventList selection(changes);

    const bool canHeal = changes.canHeal(selection, model.newEdl(), mode);
    changes.heal(selection, model.newEdl(), mode);

    check(canHeal == (changes.size() != selection.size()), "canHeal foretells whether the number of events changes");
    checkEvents(changes);
    checkOrder(changes);
    if (mode == core::HealMode::None)
        checkUnhealed(changes);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static tests::TestProject project;
    static const tests::TempFolder folder;
    const Input input = split(std::string_view(reinterpret_cast<const char*>(data), size));
    project.framerate = framerateOf(input);

    core::DataModel model;
    core::Framerate shown;
    model.oldEdl().load(tests::widePath(folder.write("old.edl", input.oldEdl)), false, shown, true, false);
    model.newEdl().load(tests::widePath(folder.write("new.edl", input.newEdl)), false, shown, true, false);
    const std::int32_t healMode = input.choice(1, 4);
    model.settings().setMatchBy(input.choice(0, 2));
    model.settings().setHealMode(healMode);
    model.settings().setVfxPattern(patternOf(input), 0);
    const auto oldBytes = bytesOf(model.oldEdl());
    const auto newBytes = bytesOf(model.newEdl());

    const util::Result::Type result = model.generateChangeEdl();

    check(bytesOf(model.oldEdl()) == oldBytes && bytesOf(model.newEdl()) == newBytes,
          "the generation leaves the old and the new EDL as they are");
    if (result != util::Result::Ok) {
        check(model.changeEdl().isEmpty(), "a failed generation leaves nothing behind");
        return 0;
    }
    checkEvents(model.changeEdl());
    checkRanges(model);
    if (healMode == core::HealMode::None)
        checkUnhealed(model.changeEdl());
    else if (model.changeEdl().size() > 1)
        checkOrder(model.changeEdl());

    const auto changeBytes = bytesOf(model.changeEdl());
    check(model.generateChangeEdl() == util::Result::Ok && bytesOf(model.changeEdl()) == changeBytes,
          "generating again gives the same list");
    checkHealingAnew(model, input.choice(4, 4));
    return 0;
}
