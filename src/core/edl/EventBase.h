// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/FlawSet.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextNotificationBase.h"
#include "core/serialize/Serializable.h"
#include "core/time/Timecode.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::core {

/// What can be wrong with an event. A flawed event is kept and shown, never rejected.
struct EventFlaw {
    enum Type : std::int32_t {
        TimecodeUninitialized = 0,
        FreeText = 1,
        EventNumberNotNumeric = 2,
        RollNameInvalid = 3,
        NotVideoEvent = 4,
        TransitionDurationInvalid = 5,
        TransitionTypeUnsupported = 6,
        SrcInUnreadable = 7,
        SrcOutUnreadable = 8,
        DstInUnreadable = 9,
        DstOutUnreadable = 10,
        TimecodeInvalid = 11,
        TimecodeRangeInvalid = 12,
    };
    static constexpr std::int32_t Last = TimecodeRangeInvalid;

    /// The message shown for a flaw, not translated; empty for FreeText and for numbers outside the table.
    static std::wstring_view text(std::int32_t flaw);
};

struct EventKind {
    enum Type : std::int32_t { Plain = 0, Healed = 1 };
};

struct TransitionType {
    enum Type : std::int32_t { Cut = 0, Dissolve = 1, Wipe = 2 };

    /// True for a dissolve and a wipe.
    static constexpr bool takesTime(std::int32_t type) { return type == Dissolve || type == Wipe; }
};

/// One event of an edit decision list: a stretch of source material, the place in the programme where it plays, a
/// transition and a few names. It works out its own flaws and its motion speed from the four timecodes and the
/// provider's rate. Setters of timecodes therefore throw Result::NotAvailable without a FramerateProvider.
///
/// The getters return references, which change with the event. Copy a value that you need after a setter.
///
/// Every setter notifies with the event's own context after the change, except setEventNumber, setComment,
/// setSourceLine, setReversed, addFlaw and removeFlaw, which are called in bulk or before anyone listens.
class EventBase : public serialize::Serializable, public ChangeContextNotificationBase {
public:
    /// An event that has only flaw 0.
    EventBase();
    /// A copy as by assignment, without listeners.
    EventBase(const EventBase& other);
    /// Copies everything but the listeners and the text of flaw 1, without a notification and without working out the
    /// flaws again. The timecodes then count as initialized, but flaw 0 stays in a copied set until the next change of
    /// a timecode. This is deliberate: a copy has the flaws of its source until someone edits it.
    EventBase& operator=(const EventBase& other);
    ~EventBase() override = default;

    /// A new event of an EventKind. Throws Result::InvalidArgument for any other number.
    static std::shared_ptr<EventBase> create(std::int32_t kind);

    std::int32_t eventKind() const { return m_eventKind; }
    const Timecode& srcIn() const { return m_srcIn; }
    const Timecode& srcOut() const { return m_srcOut; }
    const Timecode& dstIn() const { return m_dstIn; }
    const Timecode& dstOut() const { return m_dstOut; }
    std::uint32_t eventNumber() const { return m_eventNumber; }
    const std::string& rollName() const { return m_rollName; }
    const std::string& clipName() const { return m_clipName; }
    /// A set, in ascending order.
    std::vector<std::int32_t> flaws() const { return m_flaws.values(); }
    std::int32_t transitionType() const { return m_transitionType; }
    /// True for a dissolve and a wipe.
    bool isTransition() const { return TransitionType::takesTime(m_transitionType); }
    /// In frames.
    std::int32_t transitionDuration() const { return m_transitionDuration; }
    const std::string& reservedText() const { return m_reservedText; }
    const std::string& edlFileName() const { return m_edlFileName; }
    const std::string& comment() const { return m_comment; }
    /// The number of the line of the file edlFileName() that the event was read from, counted from 1; 0 for an event that
    /// was read from no list. Copied like the other fields, not stored, and 0 after the event is read from an archive.
    std::uint32_t sourceLine() const { return m_sourceLine; }
    bool vfx() const { return m_vfx; }
    /// Whether the shot plays from SRC OUT to SRC IN. Copied like the other fields, not stored, and false after the event
    /// is read from an archive.
    bool isReversed() const { return m_isReversed; }
    /// Where in the source the shot begins and ends to play: SRC IN and SRC OUT, for a reversed shot the later one first.
    const Timecode& firstSource() const { return beginsAtSrcOut() ? m_srcOut : m_srcIn; }
    const Timecode& lastSource() const { return beginsAtSrcOut() ? m_srcIn : m_srcOut; }
    /// Source duration over destination duration; 0 for a freeze frame.
    double motionSpeed() const { return m_motionSpeed; }
    /// The motion speed, below 0 for a reversed shot.
    double signedSpeed() const { return m_isReversed ? -m_motionSpeed : m_motionSpeed; }
    const std::string& flawText() const { return m_flawText; }

    /// True without any flaw.
    bool isValid() const { return m_flaws.isEmpty(); }
    bool hasFlaw(std::int32_t flaw) const { return m_flaws.contains(flaw); }
    /// True with any of the flaws 1 to 10, which say that the event could not be read.
    bool hasFormatFlaw() const;
    /// The messages of all flaws, translated, a line each. Throws Result::NotAvailable without a string converter.
    std::string flawsText() const;
    /// Speeds that differ by less than 0.01 count as equal.
    static bool areSameSpeed(double a, double b);
    bool hasSpeed(double speed) const { return areSameSpeed(m_motionSpeed, speed); }
    bool isNormalSpeed() const { return hasSpeed(1.0); }
    bool hasSameTimecodes(const EventBase& other) const;

    void setRollName(const std::string& text);
    void setClipName(const std::string& text);
    void setEdlFileName(const std::string& text);
    void setTransitionType(std::int32_t type);
    void setTransitionDuration(std::int32_t frames);
    void setVfx(bool flag);

    void setSrcIn(const Timecode& srcIn);
    void setSrcOut(const Timecode& srcOut);
    void setDstIn(const Timecode& dstIn);
    void setDstOut(const Timecode& dstOut);
    /// These take copies, so that the arguments may be the event's own timecodes.
    void setSrc(Timecode in, Timecode out);
    void setDst(Timecode in, Timecode out);
    void setIn(Timecode srcIn, Timecode dstIn);
    void setOut(Timecode srcOut, Timecode dstOut);
    void setTimecodes(Timecode srcIn, Timecode srcOut, Timecode dstIn, Timecode dstOut);
    /// Works out the flaws and the motion speed again, after a change of the frame rate, and notifies.
    void revalidate();

    void setEventNumber(std::uint32_t number) { m_eventNumber = number; }
    void setComment(const std::string& text);
    void setSourceLine(std::uint32_t number) { m_sourceLine = number; }
    void setReversed(bool flag) { m_isReversed = flag; }
    void addFlaw(std::int32_t flaw);
    void removeFlaw(std::int32_t flaw);

    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

protected:
    explicit EventBase(std::int32_t kind);

    /// Takes the four timecodes of another event, or widens them to span it too, without a notification.
    void adoptTimecodes(const EventBase& other);
    void widenTo(const EventBase& other);
    /// Sets the mark without a notification.
    void markAsVfx() { m_vfx = true; }

    /// Reads the fields in the layout of a version; finishReading then updates and notifies.
    void readFields(serialize::ByteArchive& archive, std::uint32_t version);
    void finishReading();

private:
    bool beginsAtSrcOut() const { return m_isReversed && m_srcIn < m_srcOut; }
    void updateFlawsAndSpeed();
    void updateFlaws(bool timecodesValid);
    void updateMotionSpeed(const Framerate& framerate);
    void timecodesChanged();
    void readFlaws(serialize::ByteArchive& archive);
    void readFlawWord(serialize::ByteArchive& archive);

    std::int32_t m_eventKind = EventKind::Plain;
    Timecode m_srcIn;
    Timecode m_srcOut;
    Timecode m_dstIn;
    Timecode m_dstOut;
    std::uint32_t m_eventNumber = 0;
    std::string m_rollName;
    std::string m_clipName;
    FlawSet m_flaws;
    std::int32_t m_transitionType = TransitionType::Cut;
    std::int32_t m_transitionDuration = 0;
    std::string m_reservedText;
    std::string m_edlFileName;
    std::string m_comment;
    bool m_vfx = false;
    std::uint32_t m_sourceLine = 0;
    bool m_isReversed = false;
    double m_motionSpeed = 1.0;
    EventChangeContext m_changeContext;
    std::string m_flawText;
};

} // namespace cadrel::core
