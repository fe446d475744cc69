#include "core/EventBase.h"

#include "core/HealedEvent.h"
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

EventBase::EventBase(std::int32_t kind) : Serializable(PersistenceVersion), eventKind_(kind)
{
    flaws_.insert(EventFlaw::TimecodeUninitialized);
}

EventBase::EventBase(const EventBase& other) : Serializable(other), ChangeContextNotificationBase()
{
    *this = other;
}

EventBase& EventBase::operator=(const EventBase& other)
{
    if (this == &other)
        return *this;
    eventKind_ = other.eventKind_;
    srcIn_ = other.srcIn_;
    srcOut_ = other.srcOut_;
    dstIn_ = other.dstIn_;
    dstOut_ = other.dstOut_;
    eventNumber_ = other.eventNumber_;
    rollName_ = other.rollName_;
    clipName_ = other.clipName_;
    flaws_ = other.flaws_;
    transitionType_ = other.transitionType_;
    transitionDuration_ = other.transitionDuration_;
    reservedText_ = other.reservedText_;
    edlFileName_ = other.edlFileName_;
    comment_ = other.comment_;
    vfx_ = other.vfx_;
    motionSpeed_ = other.motionSpeed_;
    changeContext_ = other.changeContext_;
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
    return flaws_.containsAny(EventFlaw::FreeText, EventFlaw::DstOutUnreadable);
}

std::string EventBase::flawsText() const
{
    std::string text;
    for (std::int32_t flaw = 0; flaw <= EventFlaw::Last; ++flaw) {
        if (flaw == EventFlaw::FreeText) {
            // The free text ends the line even when it is empty.
            text += flawText_;
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
    return srcIn_ == other.srcIn_ && srcOut_ == other.srcOut_ && dstIn_ == other.dstIn_ && dstOut_ == other.dstOut_;
}

void EventBase::setRollName(const std::string& text)
{
    rollName_ = text;
    notify(changeContext_);
}

void EventBase::setClipName(const std::string& text)
{
    clipName_ = text;
    notify(changeContext_);
}

void EventBase::setEdlFileName(const std::string& text)
{
    edlFileName_ = text;
    notify(changeContext_);
}

void EventBase::setTransitionType(std::int32_t type)
{
    transitionType_ = type;
    notify(changeContext_);
}

void EventBase::setTransitionDuration(std::int32_t frames)
{
    transitionDuration_ = frames;
    notify(changeContext_);
}

void EventBase::setVfx(bool flag)
{
    vfx_ = flag;
    notify(changeContext_);
}

void EventBase::setSrcIn(const Timecode& srcIn)
{
    srcIn_ = srcIn;
    timecodesChanged();
}

void EventBase::setSrcOut(const Timecode& srcOut)
{
    srcOut_ = srcOut;
    timecodesChanged();
}

void EventBase::setDstIn(const Timecode& dstIn)
{
    dstIn_ = dstIn;
    timecodesChanged();
}

void EventBase::setDstOut(const Timecode& dstOut)
{
    dstOut_ = dstOut;
    timecodesChanged();
}

void EventBase::setSrc(Timecode in, Timecode out)
{
    srcIn_ = in;
    srcOut_ = out;
    timecodesChanged();
}

void EventBase::setDst(Timecode in, Timecode out)
{
    dstIn_ = in;
    dstOut_ = out;
    timecodesChanged();
}

void EventBase::setIn(Timecode srcIn, Timecode dstIn)
{
    srcIn_ = srcIn;
    dstIn_ = dstIn;
    timecodesChanged();
}

void EventBase::setOut(Timecode srcOut, Timecode dstOut)
{
    srcOut_ = srcOut;
    dstOut_ = dstOut;
    timecodesChanged();
}

void EventBase::setTimecodes(Timecode srcIn, Timecode srcOut, Timecode dstIn, Timecode dstOut)
{
    srcIn_ = srcIn;
    srcOut_ = srcOut;
    dstIn_ = dstIn;
    dstOut_ = dstOut;
    timecodesChanged();
}

void EventBase::revalidate()
{
    timecodesChanged();
}

void EventBase::setComment(const std::string& text)
{
    comment_ = text;
}

void EventBase::addFlaw(std::int32_t flaw)
{
    flaws_.insert(flaw);
}

void EventBase::removeFlaw(std::int32_t flaw)
{
    flaws_.erase(flaw);
}

void EventBase::timecodesChanged()
{
    updateFlawsAndSpeed();
    notify(changeContext_);
}

void EventBase::updateFlawsAndSpeed()
{
    const Framerate framerate = Timecode::framerate();
    const bool timecodesValid = srcIn_.isValid(framerate) && srcOut_.isValid(framerate) && dstIn_.isValid(framerate) &&
                                dstOut_.isValid(framerate);
    updateFlaws(timecodesValid);
    if (timecodesValid)
        updateMotionSpeed(framerate);
}

void EventBase::updateFlaws(bool timecodesValid)
{
    if (timecodesValid) {
        if (srcIn_ > srcOut_ || dstIn_ > dstOut_)
            addFlaw(EventFlaw::TimecodeRangeInvalid);
        else
            removeFlaw(EventFlaw::TimecodeRangeInvalid);
        removeFlaw(EventFlaw::TimecodeInvalid);
    } else {
        addFlaw(EventFlaw::TimecodeInvalid);
    }
    const bool allInitialized =
        srcIn_.isInitialized() && srcOut_.isInitialized() && dstIn_.isInitialized() && dstOut_.isInitialized();
    if (allInitialized)
        removeFlaw(EventFlaw::TimecodeUninitialized);
    else
        addFlaw(EventFlaw::TimecodeUninitialized);
}

void EventBase::updateMotionSpeed(const Framerate& framerate)
{
    // Frames can't be counted at a rate that isn't known to be non-drop, except at 30 frames.
    if (framerate.dropFrame != 0 && framerate.framesPerSecond != 30)
        return;
    if (srcOut_ == srcIn_) {
        motionSpeed_ = dstOut_ == dstIn_ ? 1.0 : 0.0;
        return;
    }
    const std::int32_t sourceFrames = srcOut_.toFrameCount(framerate) - srcIn_.toFrameCount(framerate);
    const std::int32_t destinationFrames = dstOut_.toFrameCount(framerate) - dstIn_.toFrameCount(framerate);
    const double oneFrame = 1 / framerate.rate;
    const double destinationDuration = destinationFrames == 0 ? oneFrame : destinationFrames / framerate.rate;
    motionSpeed_ = sourceFrames / framerate.rate / destinationDuration;
}

void EventBase::adoptTimecodes(const EventBase& other)
{
    srcIn_ = other.srcIn_;
    srcOut_ = other.srcOut_;
    dstIn_ = other.dstIn_;
    dstOut_ = other.dstOut_;
    updateFlawsAndSpeed();
}

void EventBase::widenTo(const EventBase& other)
{
    if (other.srcIn_ < srcIn_)
        srcIn_ = other.srcIn_;
    if (other.srcOut_ > srcOut_)
        srcOut_ = other.srcOut_;
    if (other.dstIn_ < dstIn_)
        dstIn_ = other.dstIn_;
    if (other.dstOut_ > dstOut_)
        dstOut_ = other.dstOut_;
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
    archive >> srcIn_ >> srcOut_ >> dstIn_ >> dstOut_ >> eventNumber_ >> rollName_ >> clipName_;
    if (version == 0)
        readFlawWord(archive);
    else
        readFlaws(archive);
    archive >> transitionType_ >> transitionDuration_ >> reservedText_ >> edlFileName_;
    if (version <= 1)
        archive >> comment_;
    if (version == 0)
        archive >> flawText_;
    archive >> vfx_;
}

void EventBase::finishReading()
{
    updateFlawsAndSpeed();
    notify(changeContext_);
}

void EventBase::readFlaws(ByteArchive& archive)
{
    flaws_.assign({});
    const std::size_t count = archive.readCount();
    archive.ensureBytes(count * sizeof(std::int32_t));
    std::vector<std::int32_t> flaws(count);
    for (std::int32_t& flaw : flaws)
        archive >> flaw;
    flaws_.assign(flaws);
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
    archive << srcIn_ << srcOut_ << dstIn_ << dstOut_ << eventNumber_ << rollName_ << clipName_;
    const std::vector<std::int32_t> flaws = flaws_.values();
    archive.writeCount(flaws.size());
    for (const std::int32_t flaw : flaws)
        archive << flaw;
    archive << transitionType_ << transitionDuration_ << reservedText_ << edlFileName_ << vfx_;
}

} // namespace cadrel::core
