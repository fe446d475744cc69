// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TracksView.h"

#include "desktop/tracks/LaneBlocks.h"
#include "desktop/tracks/Stills.h"
#include "desktop/tracks/TimeRuler.h"
#include "desktop/tracks/TrackHeaders.h"
#include "desktop/tracks/TrackLanes.h"
#include "desktop/tracks/TracksPalette.h"
#include "gui/guard/Guard.h"
#include "gui/look/Text.h"
#include "standin/edit/EditService.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace desktop {

using cadrel::gui::getFont;
using cadrel::gui::guardSystem;
using cadrel::gui::guardUser;
using cadrel::gui::Palette;
using cadrel::gui::toColour;
using standin::Track;

namespace {

constexpr int BarThickness = 12;
constexpr int ReadoutFont = 9;
constexpr int PollsPerSecond = 30;
constexpr double ZoomOfKey = 1.5;
constexpr double ZoomOfWheel = 4.0;    ///< to the power of how far the wheel was turned
constexpr float RowsOfWheel = 240.0F;  ///< pixels for a whole turn
constexpr double ScrollOfKey = 0.1;    ///< of the view
constexpr double ScrollOfWheel = 0.75; ///< of the view for a whole turn

void setUp(juce::ScrollBar& bar, const char* name)
{
    bar.setName(name);
    bar.setTitle(name);
    bar.setAutoHide(false);
    bar.setColour(juce::ScrollBar::thumbColourId, toColour(Palette::frame));
    bar.setColour(juce::ScrollBar::trackColourId, toColour(TracksPalette::lowLane));
    bar.setColour(juce::ScrollBar::backgroundColourId, toColour(TracksPalette::ground));
}

} // namespace

/// What the view follows by itself.
struct TracksView::Times {
    double position;
    std::array<double, 4> edges; ///< of the locators and the cycle

    bool operator==(const Times&) const = default;
};

TracksView::TracksView(standin::Project& project, standin::EditService& edits, Stills* stills)
    : m_project(project), m_edits(edits), m_stills(stills), m_headers(std::make_unique<TrackHeaders>(*this)),
      m_ruler(std::make_unique<TimeRuler>(*this)), m_lanes(std::make_unique<TrackLanes>(*this))
{
    m_shownTimes = std::make_unique<Times>(times());
    setOpaque(true);
    setWantsKeyboardFocus(true);
    setTitle("Tracks");
    for (juce::Component* const child :
         {static_cast<juce::Component*>(m_headers.get()), static_cast<juce::Component*>(m_ruler.get()),
          static_cast<juce::Component*>(m_lanes.get())}) {
        child->setWantsKeyboardFocus(false);
        addAndMakeVisible(child);
    }
    setUp(m_timeBar, "Time");
    setUp(m_rowBar, "Rows");
    for (juce::ScrollBar* const bar : {&m_timeBar, &m_rowBar}) {
        bar->addListener(this);
        addAndMakeVisible(bar);
    }
}

TracksView::~TracksView()
{
    stopTimer();
}

void TracksView::projectChanged()
{
    m_isStale = true;
    repaint();
}

void TracksView::update()
{
    if (!m_isStale)
        return;
    m_isStale = false;
    m_index = TrackIndex(m_project);
    m_rows = RowLayout(m_index.rows(), m_rowSize);
    m_clock = ProjectClock(m_project.frameRate(), m_project.timeOrigin());
    m_ghosts.clear();
    m_ghosts.resize(m_index.rows().size());
    if (!m_isFitted && viewWidth() > 0) {
        m_isFitted = true;
        fitAll();
    }
    viewChanged();
}

const TrackIndex& TracksView::index()
{
    update();
    return m_index;
}

const RowLayout& TracksView::rows()
{
    update();
    return m_rows;
}

const ProjectClock& TracksView::clock()
{
    update();
    return m_clock;
}

int TracksView::viewWidth() const
{
    return m_lanes->getWidth();
}

void TracksView::fitAll()
{
    update();
    const auto programme = m_index.programme();
    m_scale.fit(programme ? programme->start : 0.0, programme ? programme->end : std::max(m_project.setEndTime(), 1.0),
                viewWidth());
    viewChanged();
}

void TracksView::zoomBy(double factor)
{
    update();
    const double playhead = m_scale.pixelAt(m_project.position().getValue());
    const bool isSeen = playhead >= 0.0 && playhead < viewWidth();
    m_scale.zoomBy(factor, isSeen ? playhead : viewWidth() / 2.0);
    viewChanged();
}

void TracksView::scrollTo(double seconds)
{
    update();
    m_scale.setLeft(seconds);
    viewChanged();
}

double TracksView::previewOffset()
{
    update();
    const double day = m_clock.secondsOfDay();
    if (const auto preview = m_index.preview())
        return std::max(std::floor((preview->start + m_clock.origin()) / day), 1.0) * day;
    const auto programme = m_index.programme();
    const double end = std::max(programme ? programme->end : 0.0, m_project.setEndTime());
    return std::max(std::floor((end + m_clock.origin()) / day) + 1.0, 1.0) * day;
}

bool TracksView::showsPreviewPlace()
{
    return m_scale.secondsAt(viewWidth() / 2.0) >= previewOffset() - clock().origin();
}

void TracksView::showPreviewPlace()
{
    if (showsPreviewPlace())
        scrollTo(m_scale.left() - previewOffset());
    else if (index().preview())
        scrollTo(m_scale.left() + previewOffset());
}

void TracksView::setRowSize(RowLayout::Size size)
{
    m_rowSize = size;
    update();
    const std::size_t first = m_rows.firstBelow(m_rowOffset);
    m_rows = RowLayout(m_index.rows(), size);
    moveRows(m_rows.top(first));
}

void TracksView::changeRowSize(int steps)
{
    const int size = std::clamp(static_cast<int>(m_rowSize) + steps, static_cast<int>(RowLayout::Size::Small),
                                static_cast<int>(RowLayout::Size::Large));
    setRowSize(static_cast<RowLayout::Size>(size));
}

void TracksView::locate(double seconds)
{
    // On the beginning of a frame, but not before the project.
    const double place = std::max(clock().secondsOf(clock().frameAt(seconds)), 0.0);
    m_project.position().setValue(Velmark::IParameter::Flag::Notify, place);
    timerCallback();
    if (onLocate)
        onLocate(place);
}

void TracksView::clicked(std::size_t row, int column)
{
    const TrackRow& shown = index().rows()[row];
    const SpanIndex& spans = shown.lane.spans();
    const std::optional<std::size_t> hit = LaneBlocks::hit(spans, m_scale, column, viewWidth());
    if (!hit || !shown.track->hasAutomation()) {
        locate(m_scale.secondsAt(column));
        return;
    }
    if (const std::optional<std::size_t> event = eventOf(shown, spans[*hit])) {
        m_shownEvent = event;
        m_lanes->repaint();
        if (onClipClicked)
            onClipClicked(*event);
    }
}

void TracksView::toggleLock(std::size_t row)
{
    Track& track = *index().rows()[row].track;
    if (m_edits.begin(false) != Velmark::ResultOk)
        return;
    const bool isLocked = !track.isLocked();
    track.setLocked(isLocked);
    m_edits.commit(&m_project, isLocked ? u"Lock Track" : u"Unlock Track");
    m_ghosts[row].reset();
    repaint();
    if (onTrackChanged)
        onTrackChanged();
}

void TracksView::toggleSelection(std::size_t row, bool isAdded)
{
    Track& clicked = *index().rows()[row].track;
    // A selection isn't an edit: no host has it in its undo list.
    const bool isSelected = isAdded ? !clicked.selected() : true;
    if (!isAdded) {
        for (const TrackRow& other : m_index.rows())
            other.track->setSelected(false);
    }
    clicked.setSelected(isSelected);
    repaint();
    if (onTrackChanged)
        onTrackChanged();
}

void TracksView::moveRows(int offset)
{
    m_rowOffset = offset;
    viewChanged();
}

void TracksView::viewChanged()
{
    if (m_isStale)
        return;
    m_rowOffset = std::clamp(m_rowOffset, 0, std::max(0, m_rows.height() - m_lanes->getHeight()));
    m_isMovingBars = true;
    m_rowBar.setRangeLimits(0.0, std::max(m_rows.height(), m_lanes->getHeight()), juce::dontSendNotification);
    m_rowBar.setCurrentRange(m_rowOffset, m_lanes->getHeight(), juce::dontSendNotification);

    // The bar stands for the programme or for the preview of it, and for what is seen now.
    const double seen = m_scale.secondsAt(viewWidth()) - m_scale.left();
    const double offset = showsPreviewPlace() ? previewOffset() : 0.0;
    const auto programme = m_index.programme();
    const double start = (programme ? std::min(programme->start, 0.0) : 0.0) + offset;
    const double end = (programme ? programme->end : 0.0) + offset + 0.1 * seen;
    m_timeBar.setRangeLimits(std::min(start, m_scale.left()), std::max(end, m_scale.left() + seen),
                             juce::dontSendNotification);
    m_timeBar.setCurrentRange(m_scale.left(), seen, juce::dontSendNotification);
    m_isMovingBars = false;
    repaint();
}

void TracksView::scrollBarMoved(juce::ScrollBar* bar, double start)
{
    guardSystem([&] {
        if (m_isMovingBars)
            return;
        if (bar == &m_timeBar)
            scrollTo(start);
        else
            moveRows(static_cast<int>(std::lround(start)));
    });
}

TracksView::Times TracksView::times() const
{
    return {m_project.position().getValue(),
            {m_project.locatorLeft().getValue(), m_project.locatorRight().getValue(), m_project.cycleLeft().getValue(),
             m_project.cycleRight().getValue()}};
}

void TracksView::followWindow()
{
    if (!isVisible() || !getParentComponent())
        stopTimer();
    else if (!isTimerRunning())
        startTimerHz(PollsPerSecond);
}

void TracksView::timerCallback()
{
    guardSystem([&] {
        if (!isShowing())
            return;
        if (m_stills && m_stills->poll())
            m_lanes->repaint();
        const Times now = times();
        if (now == *m_shownTimes)
            return;
        // The line of the playhead is narrow, and nothing else moves as often.
        for (const double position : {m_shownTimes->position, now.position}) {
            const double pixel = std::clamp(m_scale.pixelAt(position), -10.0, viewWidth() + 10.0);
            m_lanes->repaint(static_cast<int>(pixel) - 2, 0, 5, m_lanes->getHeight());
        }
        *m_shownTimes = now;
        m_ruler->repaint();
        repaint(0, 0, TrackHeaders::Width, TimeRuler::Height);
    });
}

void TracksView::paint(juce::Graphics& graphics)
{
    guardSystem([&] {
        update();
        graphics.fillAll(toColour(TracksPalette::ground));
        juce::Rectangle<int> corner(0, 0, TrackHeaders::Width, TimeRuler::Height);
        graphics.setColour(toColour(Palette::panel));
        graphics.fillRect(corner.withTrimmedBottom(1).withTrimmedRight(1));
        graphics.setColour(toColour(Palette::light));
        graphics.setFont(getFont(ReadoutFont));
        const std::int64_t frame = m_clock.frameAt(m_project.position().getValue());
        graphics.drawText(m_clock.textOf(frame), corner.reduced(10, 0), juce::Justification::centredLeft, false);
        if (showsPreviewPlace()) {
            graphics.setColour(toColour(Palette::orange));
            graphics.setFont(getFont(2));
            graphics.drawText("PREVIEW", corner.reduced(10, 0), juce::Justification::centredRight, false);
        }
    });
}

void TracksView::resized()
{
    guardSystem([&] {
        juce::Rectangle<int> area = getLocalBounds();
        juce::Rectangle<int> bars = area.removeFromBottom(BarThickness);
        bars.removeFromLeft(TrackHeaders::Width);
        bars.removeFromRight(BarThickness);
        m_timeBar.setBounds(bars);
        juce::Rectangle<int> top = area.removeFromTop(TimeRuler::Height);
        top.removeFromLeft(TrackHeaders::Width);
        m_rowBar.setBounds(area.removeFromRight(BarThickness));
        top.removeFromRight(BarThickness);
        m_ruler->setBounds(top);
        m_headers->setBounds(area.removeFromLeft(TrackHeaders::Width));
        m_lanes->setBounds(area);
        viewChanged();
    });
}

bool TracksView::keyPressed(const juce::KeyPress& key)
{
    bool isUsed = true;
    guardUser([&] {
        const double seen = viewWidth() * m_scale.secondsPerPixel();
        const juce::juce_wchar character = juce::CharacterFunctions::toLowerCase(key.getTextCharacter());
        if (character == '+' || character == '=')
            zoomBy(ZoomOfKey);
        else if (character == '-')
            zoomBy(1.0 / ZoomOfKey);
        else if (key == juce::KeyPress::leftKey)
            scrollTo(m_scale.left() - seen * ScrollOfKey);
        else if (key == juce::KeyPress::rightKey)
            scrollTo(m_scale.left() + seen * ScrollOfKey);
        else if (key == juce::KeyPress::pageUpKey)
            moveRows(m_rowOffset - m_lanes->getHeight());
        else if (key == juce::KeyPress::pageDownKey)
            moveRows(m_rowOffset + m_lanes->getHeight());
        else if (key == juce::KeyPress::homeKey)
            scrollTo((index().programme() ? index().programme()->start : 0.0) - seen * 0.01);
        else if (key == juce::KeyPress::endKey)
            scrollTo((index().programme() ? index().programme()->end : 0.0) - seen * 0.99);
        else if (key.getModifiers().isAnyModifierKeyDown() && !key.getModifiers().isShiftDown())
            isUsed = false;
        else if (character == 'f')
            fitAll();
        else if (character == 'p')
            showPreviewPlace();
        else if (character == 'g') {
            setGhosts(!m_showsGhosts);
            if (onGhosts)
                onGhosts(m_showsGhosts);
        } else
            isUsed = false;
    });
    return isUsed;
}

void TracksView::mouseWheelMove(const juce::MouseEvent& event, const juce::MouseWheelDetails& wheel)
{
    guardUser([&] {
        const float turned = wheel.deltaY != 0.0F ? wheel.deltaY : wheel.deltaX;
        const double place = event.getEventRelativeTo(m_lanes.get()).position.x;
        if (event.mods.isCommandDown()) {
            m_scale.zoomBy(std::pow(ZoomOfWheel, turned), std::max(place, 0.0));
            viewChanged();
        } else if (event.mods.isAltDown()) {
            changeRowSize(turned > 0.0F ? 1 : -1);
        } else if (event.mods.isShiftDown() || wheel.deltaX != 0.0F) {
            const float back = wheel.deltaX != 0.0F ? wheel.deltaX : wheel.deltaY;
            scrollTo(m_scale.left() - back * ScrollOfWheel * viewWidth() * m_scale.secondsPerPixel());
        } else {
            moveRows(m_rowOffset - static_cast<int>(std::lround(wheel.deltaY * RowsOfWheel)));
        }
    });
}

} // namespace desktop
