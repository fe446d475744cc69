// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"

#include "core/edl/HealedEvent.h"
#include "core/serialize/ByteArchive.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <array>
#include <cmath>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

constexpr std::uint32_t PersistenceVersion = 2;
constexpr double SpeedTolerance = 0.01;

constexpr std::array<std::wstring_view, EventFlaw::Last + 1> FlawTexts{
    L"Detected uninitialized timecode.",
    L"",
    L"Event Number is not a number.",
    L"Roll name contains non-alphanumeric characters.",
    L"Not a video event.",
    L"Not a valid transition duration.",
    L"Found unsupported transition type.",
    L"SRC IN format cannot be read.",
    L"SRC OUT format cannot be read.",
    L"DST IN format cannot be read.",
    L"DST OUT format cannot be read.",
    L"Detected invalid timecode. Mismatch between timecode and project frame rate?",
    L"Detected invalid timecode range.",
};

} // namespace

std::wstring_view EventFlaw::text(std::int32_t flaw)
{
    return flaw >= 0 && flaw <= Last ? FlawTexts[static_cast<std::size_t>(flaw)] : std::wstring_view();
}

EventBase::EventBase() : EventBase(EventKind::Plain) {}

EventBase::EventBase(std::int32_t kind) : Serializable(PersistenceVersion), m_eventKind(kind)
{
    m_flaws.insert(EventFlaw::TimecodeUninitialized);
}

EventBase::EventBase(const EventBase& other) : Serializable(other), ChangeContextNotificationBase()
{
    *this = other;
}

EventBase& EventBase::operator=(const EventBase& other)
{
    if (this == &other)
        return *this;
    m_eventKind = other.m_eventKind;
    m_srcIn = other.m_srcIn;
    m_srcOut = other.m_srcOut;
    m_dstIn = other.m_dstIn;
    m_dstOut = other.m_dstOut;
    m_eventNumber = other.m_eventNumber;
    m_rollName = other.m_rollName;
    m_clipName = other.m_clipName;
    m_flaws = other.m_flaws;
    m_transitionType = other.m_transitionType;
    m_transitionDuration = other.m_transitionDuration;
    m_reservedText = other.m_reservedText;
    m_edlFileName = other.m_edlFileName;
    m_comment = other.m_comment;
    m_vfx = other.m_vfx;
    m_sourceLine = other.m_sourceLine;
    m_isReversed = other.m_isReversed;
    m_motionSpeed = other.m_motionSpeed;
    m_changeContext = other.m_changeContext;
    return *this;
}

std::shared_ptr<EventBase> EventBase::create(std::int32_t kind)
{
    switch (kind) {
    case EventKind::Plain:
        return std::make_shared<EventBase>();
    case EventKind::Healed:
        return std::make_shared<HealedEvent>();
    default:
        throw Result::InvalidArgument;
    }
}

bool EventBase::hasFormatFlaw() const
{
    return m_flaws.containsAny(EventFlaw::FreeText, EventFlaw::DstOutUnreadable);
}

std::string EventBase::flawsText() const
{
    std::string text;
    for (std::int32_t flaw = 0; flaw <= EventFlaw::Last; ++flaw) {
        if (flaw == EventFlaw::FreeText) {
            // The free text ends the line even when it is empty.
            text += m_flawText;
            if (!text.empty())
                text += '\n';
        } else if (hasFlaw(flaw)) {
            text += util::StringUtil::toUtf8(util::StringUtil::translate(std::wstring(EventFlaw::text(flaw))));
            text += '\n';
        }
    }
    return text;
}

bool EventBase::areSameSpeed(double a, double b)
{
    return std::fabs(a - b) < SpeedTolerance;
}

bool EventBase::hasSameTimecodes(const EventBase& other) const
{
    return m_srcIn == other.m_srcIn && m_srcOut == other.m_srcOut && m_dstIn == other.m_dstIn &&
           m_dstOut == other.m_dstOut;
}

void EventBase::setRollName(const std::string& text)
{
    m_rollName = text;
    notify(m_changeContext);
}

void EventBase::setClipName(const std::string& text)
{
    m_clipName = text;
    notify(m_changeContext);
}

void EventBase::setEdlFileName(const std::string& text)
{
    m_edlFileName = text;
    notify(m_changeContext);
}

void EventBase::setTransitionType(std::int32_t type)
{
    m_transitionType = type;
    notify(m_changeContext);
}

void EventBase::setTransitionDuration(std::int32_t frames)
{
    m_transitionDuration = frames;
    notify(m_changeContext);
}

void EventBase::setVfx(bool flag)
{
    m_vfx = flag;
    notify(m_changeContext);
}

void EventBase::setSrcIn(const Timecode& srcIn)
{
    m_srcIn = srcIn;
    timecodesChanged();
}

void EventBase::setSrcOut(const Timecode& srcOut)
{
    m_srcOut = srcOut;
    timecodesChanged();
}

void EventBase::setDstIn(const Timecode& dstIn)
{
    m_dstIn = dstIn;
    timecodesChanged();
}

void EventBase::setDstOut(const Timecode& dstOut)
{
    m_dstOut = dstOut;
    timecodesChanged();
}

void EventBase::setSrc(Timecode in, Timecode out)
{
    m_srcIn = in;
    m_srcOut = out;
    timecodesChanged();
}

void EventBase::setDst(Timecode in, Timecode out)
{
    m_dstIn = in;
    m_dstOut = out;
    timecodesChanged();
}

void EventBase::setIn(Timecode srcIn, Timecode dstIn)
{
    m_srcIn = srcIn;
    m_dstIn = dstIn;
    timecodesChanged();
}

void EventBase::setOut(Timecode srcOut, Timecode dstOut)
{
    m_srcOut = srcOut;
    m_dstOut = dstOut;
    timecodesChanged();
}

void EventBase::setTimecodes(Timecode srcIn, Timecode srcOut, Timecode dstIn, Timecode dstOut)
{
    m_srcIn = srcIn;
    m_srcOut = srcOut;
    m_dstIn = dstIn;
    m_dstOut = dstOut;
    timecodesChanged();
}

void EventBase::revalidate()
{
    timecodesChanged();
}

void EventBase::setComment(const std::string& text)
{
    m_comment = text;
}

void EventBase::addFlaw(std::int32_t flaw)
{
    m_flaws.insert(flaw);
}

void EventBase::removeFlaw(std::int32_t flaw)
{
    m_flaws.erase(flaw);
}

void EventBase::timecodesChanged()
{
    updateFlawsAndSpeed();
    notify(m_changeContext);
}

void EventBase::updateFlawsAndSpeed()
{
    const Framerate framerate = Timecode::framerate();
    const bool timecodesValid = m_srcIn.isValid(framerate) && m_srcOut.isValid(framerate) &&
                                m_dstIn.isValid(framerate) && m_dstOut.isValid(framerate);
    updateFlaws(timecodesValid);
    if (timecodesValid)
        updateMotionSpeed(framerate);
}

void EventBase::updateFlaws(bool timecodesValid)
{
    if (timecodesValid) {
        if (m_srcIn > m_srcOut || m_dstIn > m_dstOut)
            addFlaw(EventFlaw::TimecodeRangeInvalid);
        else
            removeFlaw(EventFlaw::TimecodeRangeInvalid);
        removeFlaw(EventFlaw::TimecodeInvalid);
    } else {
        addFlaw(EventFlaw::TimecodeInvalid);
    }
    const bool allInitialized =
        m_srcIn.isInitialized() && m_srcOut.isInitialized() && m_dstIn.isInitialized() && m_dstOut.isInitialized();
    if (allInitialized)
        removeFlaw(EventFlaw::TimecodeUninitialized);
    else
        addFlaw(EventFlaw::TimecodeUninitialized);
}

void EventBase::updateMotionSpeed(const Framerate& framerate)
{
    // Frames can only be counted at a rate that is known to be non-drop, or at 30 frames.
    if (framerate.dropFrame != 0 && framerate.framesPerSecond != 30)
        return;
    if (m_srcOut == m_srcIn) {
        m_motionSpeed = m_dstOut == m_dstIn ? 1.0 : 0.0;
        return;
    }
    const std::int32_t sourceFrames = m_srcOut.toFrameCount(framerate) - m_srcIn.toFrameCount(framerate);
    const std::int32_t destinationFrames = m_dstOut.toFrameCount(framerate) - m_dstIn.toFrameCount(framerate);
    const double oneFrame = 1 / framerate.rate;
    const double destinationDuration = destinationFrames == 0 ? oneFrame : destinationFrames / framerate.rate;
    m_motionSpeed = sourceFrames / framerate.rate / destinationDuration;
}

void EventBase::adoptTimecodes(const EventBase& other)
{
    m_srcIn = other.m_srcIn;
    m_srcOut = other.m_srcOut;
    m_dstIn = other.m_dstIn;
    m_dstOut = other.m_dstOut;
    updateFlawsAndSpeed();
}

void EventBase::widenTo(const EventBase& other)
{
    if (other.m_srcIn < m_srcIn)
        m_srcIn = other.m_srcIn;
    if (other.m_srcOut > m_srcOut)
        m_srcOut = other.m_srcOut;
    if (other.m_dstIn < m_dstIn)
        m_dstIn = other.m_dstIn;
    if (other.m_dstOut > m_dstOut)
        m_dstOut = other.m_dstOut;
    updateFlawsAndSpeed();
}

void EventBase::readCurrent(ByteArchive& archive)
{
    readFields(archive, PersistenceVersion);
    finishReading();
}

void EventBase::readOlder(ByteArchive& archive, std::uint32_t version)
{
    if (version >= PersistenceVersion)
        throw Result::UnknownVersion;
    readFields(archive, version);
    finishReading();
}

void EventBase::readFields(ByteArchive& archive, std::uint32_t version)
{
    archive >> m_srcIn >> m_srcOut >> m_dstIn >> m_dstOut >> m_eventNumber >> m_rollName >> m_clipName;
    if (version == 0)
        readFlawWord(archive);
    else
        readFlaws(archive);
    archive >> m_transitionType >> m_transitionDuration >> m_reservedText >> m_edlFileName;
    if (version <= 1)
        archive >> m_comment;
    if (version == 0)
        archive >> m_flawText;
    archive >> m_vfx;
    m_sourceLine = 0;
    m_isReversed = false;
}

void EventBase::finishReading()
{
    updateFlawsAndSpeed();
    notify(m_changeContext);
}

void EventBase::readFlaws(ByteArchive& archive)
{
    m_flaws.assign({});
    const std::size_t count = archive.readCount();
    archive.ensureBytes(count * sizeof(std::int32_t));
    std::vector<std::int32_t> flaws(count);
    for (std::int32_t& flaw : flaws)
        archive >> flaw;
    m_flaws.assign(flaws);
}

void EventBase::readFlawWord(ByteArchive& archive)
{
    std::int32_t word = 0;
    archive >> word;
    if (word == 1)
        addFlaw(EventFlaw::FreeText);
    else if (word != 0)
        throw Result::CorruptData;
}

void EventBase::write(ByteArchive& archive) const
{
    archive << m_srcIn << m_srcOut << m_dstIn << m_dstOut << m_eventNumber << m_rollName << m_clipName;
    const std::vector<std::int32_t> flaws = m_flaws.values();
    archive.writeCount(flaws.size());
    for (const std::int32_t flaw : flaws)
        archive << flaw;
    archive << m_transitionType << m_transitionDuration << m_reservedText << m_edlFileName << m_vfx;
}

} // namespace cadrel::core
