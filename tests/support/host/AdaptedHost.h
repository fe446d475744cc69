// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModel.h"
#include "host/Host.h"
#include "host/undo/DataModelEditStep.h"
#include "standin/edit/EditService.h"
#include "standin/project/Project.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/NoMarkers.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/String.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <sstream>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cadrel::host::tests {

/// Alerts whose user reads them and goes on.
class ReadAlerts : public Velmark::Implements<ReadAlerts, Velmark::FObject, Velmark::IAlertService> {
public:
    static constexpr const char* ClassName = "ReadAlerts";

    std::vector<std::u16string> messages;

    Velmark::int32 show(const char16_t* message, const char16_t*, const char16_t*, const char16_t*) override
    {
        messages.emplace_back(message);
        return 1;
    }
};

/// A host with one project of 25 frames per second, which is active, and the system's adapter on it. The film of the project
/// begins at 01:00:00:00 of its clock, wherever that clock begins itself.
class AdaptedHost : public standin::tests::TestHost {
public:
    using Entries = std::vector<std::u16string>;

    /// The project's clock begins at `clockOrigin`, in seconds.
    explicit AdaptedHost(double clockOrigin) : origin(setClock(clockOrigin))
    {
        altered.replace(Velmark::IAlertService::iid, alerts);
        connect();
    }
    ~AdaptedHost() { disconnect(); }

    /// The adapter comes and goes.
    void connect(std::shared_ptr<ProjectVideo> video = nullptr) { connectTo(&altered, std::move(video)); }
    void connectTo(Velmark::IHostContext* hostContext, std::shared_ptr<ProjectVideo> video = nullptr)
    {
        m_adapter = Velmark::makeCounted<Host>(hostContext, std::move(video));
    }
    void disconnect() { m_adapter.reset(); }
    Host& adapter() { return *m_adapter; }
    core::DataModel& model() { return *m_adapter->getProjectModel(); }
    core::Settings& settings() { return model().settings(); }

    /// Seconds of the film, as the host counts them and as the clock shows them.
    double inHost(double filmSeconds) const { return onClock(filmSeconds) - origin; }
    static double onClock(double filmSeconds) { return 3600.0 + filmSeconds; }

    /// A clip of the film on a track.
    Node addSound(const Node& track, const char16_t* name, double start, double end)
    {
        return addClip(track, name, inHost(start), inHost(end));
    }

    /// Adds a change event, numbered from 1, in timecodes of the clock.
    core::EventBase& carryOver(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
    {
        const auto number = static_cast<std::uint32_t>(model().changeEdl().size() + 1);
        model().changeEdl().add(cadrel::tests::makeEvent("A001", srcIn, srcOut, dstIn, dstOut, number));
        return model().changeEdl().at(number - 1);
    }

    void switchMarkersOff() { cadrel::tests::switchMarkersOff(settings()); }

    void idle() { application.idle(); }
    /// Requests a run and lets it happen.
    void conform()
    {
        ASSERT_EQ(adapter().startCadrel(), util::Result::Ok);
        idle();
    }
    /// The same for a preview of events of the change list, with neighbours at either end.
    void preview(const core::EventList& events, std::uint64_t first = 0, std::uint64_t last = 0,
                 bool atDestination = true)
    {
        ASSERT_EQ(adapter().startPreview(events, first, last, atDestination), util::Result::Ok);
        idle();
    }

    /// All of the project and of the model.
    std::string bytes()
    {
        const auto snapshot = DataModelEditStep::snapshotOf(model());
        return dump() + std::string(snapshot.data(), snapshot.data() + snapshot.size());
    }

    /// The entries of the undo list that are done, the oldest first.
    Entries undoNames() const
    {
        Entries names;
        for (std::size_t index = 0; index < project.undoList().doneCount(); ++index)
            names.push_back(project.undoList().nameAt(index));
        return names;
    }
    bool isEditOpen() { return application.edits().isOpen(); }

    /// The track of that name; null without one.
    Node trackNamed(std::u16string_view name) { return trackNamed(*root(), name); }

    /// The events of a track as "name start-end", in seconds of the film.
    std::vector<std::string> contentOf(const Node& track)
    {
        std::vector<std::string> content;
        for (const Node& child : standin::tests::childrenOf(*track)) {
            content.push_back(std::string(Velmark::ConstString(child->getName()).text8()) + " " +
                              inFilm(child->getStart(nullptr)) + "-" + inFilm(child->getEnd(nullptr)));
        }
        return content;
    }

    const double origin;
    AlteredContext altered{context()};
    Velmark::Counted<ReadAlerts> alerts = Velmark::makeCounted<ReadAlerts>();

private:
    /// To the thousandth, without zeros behind the point.
    std::string inFilm(double hostSeconds) const
    {
        std::ostringstream text;
        text << std::round((hostSeconds + origin - 3600.0) * 1000.0) / 1000.0;
        return text.str();
    }

    static Node trackNamed(Velmark::IProjectNode& folder, std::u16string_view name)
    {
        for (const Node& child : standin::tests::childrenOf(folder)) {
            if (name == child->getName())
                return child;
            if (!child->isType(Velmark::TypeWord::Folder))
                continue;
            if (Node found = trackNamed(*child, name))
                return found;
        }
        return nullptr;
    }

    Velmark::Counted<Host> m_adapter;
};

/// A test that holds wherever the project's clock begins.
class AtEachOrigin : public testing::TestWithParam<double> {};

} // namespace cadrel::host::tests
