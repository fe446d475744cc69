// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/HandlerList.h"
#include "standin/base/Parameter.h"
#include "standin/changes/UndoList.h"
#include "standin/project/Container.h"
#include "standin/project/MediaPool.h"
#include "velmark/Project.h"

#include <memory>
#include <string>
#include <vector>

namespace standin {

class MarkerTrack;
class ProjectForm;
class Track;

/// A project: the root of the tracks, the media pool and the clock, and what the user sees of them.
class Project : public Velmark::Implements<Project, Container, Velmark::IProjectDocument, Velmark::ITimeBase> {
public:
    static constexpr const char* ClassName = "Project";

    /// How many containers lie in one another at the most, the project included.
    static constexpr int DeepestNesting = 100;

    /// An empty project of 24 frames per second. The log is the host's and outlives the project.
    explicit Project(ChangeLog& log);
    ~Project() override;

    // IProjectDocument
    Velmark::int32 setProjectEnd(double seconds) override;
    Velmark::IFilePath* getProjectFile(Velmark::IProjectDocument* project) override;
    Velmark::IMarkerTrack* getDefaultMarkerTrack() override;
    Velmark::ILocators* getLocators() override;
    Velmark::FUnknown* getContainer(Velmark::FUnknown* object) override;
    Velmark::FUnknown* createTrack(const char* typeWord) override;
    Velmark::int32 addStorageNotification(Velmark::IProjectStorageNotification* listener) override;
    Velmark::int32 removeStorageNotification(Velmark::IProjectStorageNotification* listener) override;
    Velmark::IMediaPool* getMediaPool() override;

    // ITimeBase
    Velmark::int32 getFrameRate(Velmark::FrameRateInfo& info) override;
    double getTimeOrigin() override;

    ProjectLink* link() const override { return m_link.get(); }
    /// The later of the set end and the end of the last event or marker.
    double lastEnd() const override;
    bool accepts(const Node& child) const override;

    /// Where it is stored; empty for a project that never was.
    const std::u16string& path() const { return m_path; }
    void setPath(std::u16string path);
    /// Null for the host's own form.
    ProjectForm* form() const { return m_form.get(); }
    void setForm(std::unique_ptr<ProjectForm> form);
    const Velmark::FrameRateInfo& frameRate() const { return m_frameRate; }
    void setFrameRate(const Velmark::FrameRateInfo& info);
    double timeOrigin() const { return m_timeOrigin; }
    void setTimeOrigin(double seconds);
    /// What was set, in seconds from the time origin.
    double setEndTime() const { return m_endTime; }

    MediaPool& pool() const { return *m_pool; }
    /// Of the project's cycle ("leftTime", "rightTime"), of the transport's, and the position.
    Parameter& locatorLeft() const { return *m_locatorLeft; }
    Parameter& locatorRight() const { return *m_locatorRight; }
    Parameter& cycleLeft() const { return *m_cycleLeft; }
    Parameter& cycleRight() const { return *m_cycleRight; }
    Parameter& position() const { return *m_position; }

    /// The track that the interface answers as default: the first marker track that isn't in a folder; null without one.
    MarkerTrack* defaultMarkerTrack() const;
    /// All tracks, folders before what they hold, from top to bottom.
    std::vector<Track*> allTracks() const;

    /// Whether it is open in the host; only then do its changes go to the log.
    bool isOpen() const { return m_link->isOpen(); }
    void setOpen(bool isOpen) { m_link->setOpen(isOpen); }
    ChangeLog& log() { return m_link->log(); }
    UndoList& undoList() { return m_undoList; }
    const UndoList& undoList() const { return m_undoList; }

    // What has changed and isn't told yet, as ChangeNotes says.

    bool hasChanges() const { return m_link->changes().hasChanges(); }
    void showChanges() { m_link->changes().show(); }
    void startTelling() { m_link->changes().startTelling(); }
    void endTelling() { m_link->changes().endTelling(); }
    bool tellsOfPool() const { return m_link->changes().tellsOfPool(); }
    void clearChanges() { m_link->changes().clear(); }

    /// Calls the storage listeners, for a save that is about to be made. False when one of them couldn't store what it has.
    bool announceStoring();

private:
    double exchangeEndTime(double seconds);

    Velmark::Counted<ProjectLink> m_link;
    UndoList m_undoList;
    std::u16string m_path;
    std::unique_ptr<ProjectForm> m_form;
    Velmark::FrameRateInfo m_frameRate;
    double m_timeOrigin = 0.0;
    double m_endTime = 0.0;
    Velmark::Counted<MediaPool> m_pool;
    Velmark::Counted<Parameter> m_locatorLeft;
    Velmark::Counted<Parameter> m_locatorRight;
    Velmark::Counted<Parameter> m_cycleLeft;
    Velmark::Counted<Parameter> m_cycleRight;
    Velmark::Counted<Parameter> m_position;
    Velmark::Counted<Velmark::ILocators> m_locators;
    HandlerList<Velmark::IProjectStorageNotification> m_storageListeners;
};

} // namespace standin
