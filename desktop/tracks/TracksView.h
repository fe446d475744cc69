// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/ChangeMap.h"
#include "desktop/tracks/ProjectClock.h"
#include "desktop/tracks/RowLayout.h"
#include "desktop/tracks/TimeScale.h"
#include "desktop/tracks/TrackIndex.h"
#include "gui/look/LookAndFeel.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

namespace standin {
class EditService;
class Project;
} // namespace standin

namespace desktop {

class Stills;
class TimeRuler;
class TrackHeaders;
class TrackLanes;

/// The view of the tracks of one project: their names and buttons at the left, a ruler above, and what lies on them. It shows the
/// project as it was when projectChanged was called last; only the playhead, the locators and the cycle it follows by itself.
///
///     wheel                      up and down            Left, Right        a tenth of the view back and on
///     Shift + wheel              back and on            Page Up, Down      a view up and down
///     Ctrl + wheel, + and -      closer and further     Home, End          the start and the end of the programme
///     Alt + wheel                the height of tracks   F                  all of the programme
///     click on the ruler         the playhead           P                  the preview, and back
///     click on a clip            the event that moved it  G                where the clips stood before
///
/// All on the message thread. The project, the edits and the stills outlive it.
class TracksView : public juce::Component, private juce::ScrollBar::Listener, private juce::Timer {
public:
    /// Null for `stills` shows no pictures.
    TracksView(standin::Project& project, standin::EditService& edits, Stills* stills);
    ~TracksView() override;

    /// Something in the project has changed. Looking at it again is put off until it is shown.
    void projectChanged();

    // What is seen.

    /// All of the programme; what a preview has laid a day later isn't in it.
    void fitAll();
    /// Around the playhead where that is seen, otherwise around the middle. A factor above 1 shows less time.
    void zoomBy(double factor);
    /// The time at the left edge, in seconds of the project.
    void scrollTo(double seconds);
    /// From the programme to the same place of the preview stretch, a whole day later, and back.
    /// Stays where it is while there is no preview.
    void showPreviewPlace();
    bool showsPreviewPlace();
    const TimeScale& scale() const { return m_scale; }
    void setRowSize(RowLayout::Size size);
    RowLayout::Size rowSize() const { return m_rowSize; }

    // The change.

    /// What was recut, and whether the tracks fit it already: all but the locked ones, which no run touches. An empty map
    /// forgets it.
    void setChange(ChangeMap change);
    /// Whether outlines show where each clip stood before.
    void setGhosts(bool shown);
    bool showsGhosts() const { return m_showsGhosts; }
    /// Marks the clips that an event of the change EDL moves, and scrolls to its place if wanted; nothing unmarks them. While the
    /// preview stretch is shown and the transport cycles in it, the place is the one there.
    void showEvent(std::optional<std::size_t> event, bool scrolls = true);

    /// The user has clicked on a clip: the index of the event in the change EDL that moves it or has moved it.
    std::function<void(std::size_t event)> onClipClicked;
    /// The user has set the playhead, which has moved already. In seconds of the project.
    std::function<void(double seconds)> onLocate;
    /// The lock or the selection of a track was changed by its button.
    std::function<void()> onTrackChanged;
    /// The user has asked for ghosts, or for none, with a key.
    std::function<void(bool shown)> onGhosts;

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    void visibilityChanged() override { followWindow(); }
    void parentHierarchyChanged() override { followWindow(); }
    bool keyPressed(const juce::KeyPress& key) override;
    void mouseWheelMove(const juce::MouseEvent& event, const juce::MouseWheelDetails& wheel) override;

    // For the components that it consists of.

    standin::Project& project() const { return m_project; }
    Stills* stills() const { return m_stills; }
    /// As of the last change.
    const TrackIndex& index();
    const RowLayout& rows();
    const ProjectClock& clock();
    const ChangeMap& change() const { return m_change; }
    /// How far the first row is scrolled out at the top, in pixels.
    int rowOffset() const { return m_rowOffset; }
    /// How much later the preview stretch is, in seconds.
    double previewOffset();
    /// Whether the event that showEvent was given has moved a clip, or moves it.
    bool isShown(const TrackRow& row, const SpanIndex::Span& clip);
    /// Where the shots begin that a clip of picture has in sight: at the clip's start and at the cuts that are known. While none
    /// are known, every so many pixels.
    std::vector<double> shotsIn(const TrackRow& row, const SpanIndex::Span& clip, int spacing);
    /// Which programme a track fits.
    ChangeMap::State stateOf(const TrackRow& row) const;
    /// Where each clip of a row stood.
    const SpanIndex& ghostsOf(std::size_t row);
    void locate(double seconds);
    void clicked(std::size_t row, int column);
    void toggleLock(std::size_t row);
    /// Of that track alone or, with `isAdded`, beside the others.
    void toggleSelection(std::size_t row, bool isAdded);

private:
    struct Times;

    void update();
    /// The event that moves a clip, or has moved it there.
    std::optional<std::size_t> eventOf(const TrackRow& row, SpanIndex::Span clip);
    bool isPreviewPlayed();
    SpanIndex findGhosts(const TrackRow& row) const;
    void viewChanged();
    void moveRows(int offset);
    void changeRowSize(int steps);
    int viewWidth() const;
    void scrollBarMoved(juce::ScrollBar* bar, double start) override;
    void timerCallback() override;
    /// Nothing is polled for a view that isn't in the window, such as that of another tab.
    void followWindow();
    Times times() const;

    juce::SharedResourcePointer<cadrel::gui::LookAndFeel> m_look;
    standin::Project& m_project;
    standin::EditService& m_edits;
    Stills* m_stills;
    bool m_isStale = true;
    bool m_isFitted = false; ///< something was shown already
    TrackIndex m_index;
    RowLayout m_rows;
    ProjectClock m_clock;
    TimeScale m_scale;
    RowLayout::Size m_rowSize = RowLayout::Size::Medium;
    int m_rowOffset = 0;
    ChangeMap m_change;
    bool m_showsGhosts = false;
    std::vector<std::unique_ptr<SpanIndex>> m_ghosts; ///< by row; null until they are needed
    std::optional<std::size_t> m_shownEvent;
    std::unique_ptr<Times> m_shownTimes;
    std::unique_ptr<TrackHeaders> m_headers;
    std::unique_ptr<TimeRuler> m_ruler;
    std::unique_ptr<TrackLanes> m_lanes;
    juce::ScrollBar m_timeBar{false};
    juce::ScrollBar m_rowBar{true};
    bool m_isMovingBars = false;
};

} // namespace desktop
