// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModel.h"
#include "host/undo/DataModelEditStep.h"
#include "standin/edit/EditService.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/TestHost.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::host::tests {

/// An event that can't be stored.
class UnwritableEvent : public core::EventBase {
public:
    void write(core::serialize::ByteArchive&) const override { throw util::Result::OutOfRange; }
};

/// A model of a project in a host, with something in each of its members, and those who are told of its changes.
class HostedModel : public testing::Test {
protected:
    using Bytes = std::vector<std::uint8_t>;

    HostedModel()
    {
        model.oldEdl().add(event("A", 1));
        model.newEdl().add(event("A", 1));
        model.changeEdl().add(event("A", 1));
        model.setProperty(core::PropertyKey::LastEdlFolder, core::Variant("/edl"));
        model.settings().setHealMode(core::HealMode::GapsWithInserts);
        model.videoList().add(
            core::VideoList::Entry("/video/reel.mov", core::Timecode("01:00:00:00"), core::Timecode("00:20:00:00")),
            false);
        model.setNotifier(&notifier);
    }

    static std::shared_ptr<core::EventBase> event(const std::string& roll, std::uint32_t number)
    {
        return cadrel::tests::makeEvent(roll, "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00", number);
    }

    /// A change in each of the model's members but its settings, which no undo touches.
    void change(const std::string& roll)
    {
        model.oldEdl().clear();
        model.newEdl().add(event(roll, 2));
        model.changeEdl().add(event(roll, 2));
        model.setProperty(core::PropertyKey::LastEdlFolder, core::Variant("/edl/" + roll));
        model.videoList().clear();
    }

    /// The whole model.
    Bytes bytes() const { return cadrel::tests::bytesOf(DataModelEditStep::snapshotOf(model)); }

    bool isEditOpen() { return host.application.edits().isOpen(); }
    /// The entries of the host's undo list, the oldest first.
    std::vector<std::u16string> undoNames() const
    {
        std::vector<std::u16string> names;
        for (std::size_t index = 0; index < host.project.undoList().size(); ++index)
            names.push_back(host.project.undoList().nameAt(index));
        return names;
    }

    cadrel::tests::TestProject timecodes;
    standin::tests::TestHost host;
    cadrel::tests::RecordingNotifier notifier;
    std::shared_ptr<core::DataModel> shared = std::make_shared<core::DataModel>();
    core::DataModel& model = *shared;
};

} // namespace cadrel::host::tests
