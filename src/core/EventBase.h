#pragma once

#include "core/ChangeContext.h"
#include "core/ChangeContextNotificationBase.h"
#include "core/FlawSet.h"
#include "core/Timecode.h"
#include "core/serialize/Serializable.h"

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
/// transition and a few names. It keeps track of its own flaws and of its motion speed, both of which follow from the
/// four timecodes under the provider's rate. Setters of timecodes therefore throw Result::NotAvailable without a
/// FramerateProvider.
///
/// The getters return references, which follow the changes of the event: copy what has to outlive a setter.
///
/// Every setter notifies with the event's own context after the change, except setEventNumber, setComment, addFlaw and
/// removeFlaw, which are called in bulk or before anyone listens.
class EventBase : public serialize::Serializable, public ChangeContextNotificationBase {
public:
    /// An event that has flaw 0 alone.
    EventBase();
    /// A copy as by assignment, without listeners.
    EventBase(const EventBase& other);
    /// Copies everything but the listeners and the text of flaw 1, without a notification and without looking at the
    /// flaws anew: the timecodes count as initialized from here on, while flaw 0 stays in a copied set until the next
    /// change of a timecode.
    EventBase& operator=(const EventBase& other);
    ~EventBase() override = default;

    /// A new event of an EventKind. Throws Result::InvalidArgument for any other number.
    static std::shared_ptr<EventBase> create(std::int32_t kind);

    std::int32_t eventKind() const { return eventKind_; }
    const Timecode& srcIn() const { return srcIn_; }
    const Timecode& srcOut() const { return srcOut_; }
    const Timecode& dstIn() const { return dstIn_; }
    const Timecode& dstOut() const { return dstOut_; }
    std::uint32_t eventNumber() const { return eventNumber_; }
    const std::string& rollName() const { return rollName_; }
    const std::string& clipName() const { return clipName_; }
    /// A set, in ascending order.
    std::vector<std::int32_t> flaws() const { return flaws_.values(); }
    std::int32_t transitionType() const { return transitionType_; }
    /// True for a dissolve and a wipe.
    bool isTransition() const { return TransitionType::takesTime(transitionType_); }
    /// In frames.
    std::int32_t transitionDuration() const { return transitionDuration_; }
    const std::string& reservedText() const { return reservedText_; }
    const std::string& edlFileName() const { return edlFileName_; }
    const std::string& comment() const { return comment_; }
    bool vfx() const { return vfx_; }
    /// Source duration over destination duration; 0 for a freeze frame.
    double motionSpeed() const { return motionSpeed_; }
    const std::string& flawText() const { return flawText_; }

    /// True without any flaw.
    bool isValid() const { return flaws_.isEmpty(); }
    bool hasFlaw(std::int32_t flaw) const { return flaws_.contains(flaw); }
    /// True with any of the flaws 1 to 10, which say that the event could not be read.
    bool hasFormatFlaw() const;
    /// The messages of all flaws, translated, a line each. Throws Result::NotAvailable without a string converter.
    std::string flawsText() const;
    /// Speeds that are closer than 0.01 count as one.
    static bool areSameSpeed(double a, double b);
    bool hasSpeed(double speed) const { return areSameSpeed(motionSpeed_, speed); }
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
    /// These take copies, so that an event's own timecodes may change places.
    void setSrc(Timecode in, Timecode out);
    void setDst(Timecode in, Timecode out);
    void setIn(Timecode srcIn, Timecode dstIn);
    void setOut(Timecode srcOut, Timecode dstOut);
    void setTimecodes(Timecode srcIn, Timecode srcOut, Timecode dstIn, Timecode dstOut);
    /// Looks at the flaws and the motion speed anew, for a changed frame rate, and notifies.
    void revalidate();

    void setEventNumber(std::uint32_t number) { eventNumber_ = number; }
    void setComment(const std::string& text);
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
    void markAsVfx() { vfx_ = true; }

    /// Reads the fields in the layout of a version; finishReading then updates and notifies.
    void readFields(serialize::ByteArchive& archive, std::uint32_t version);
    void finishReading();

private:
    void updateFlawsAndSpeed();
    void updateFlaws(bool timecodesValid);
    void updateMotionSpeed(const Framerate& framerate);
    void timecodesChanged();
    void readFlaws(serialize::ByteArchive& archive);
    void readFlawWord(serialize::ByteArchive& archive);

    std::int32_t eventKind_ = EventKind::Plain;
    Timecode srcIn_;
    Timecode srcOut_;
    Timecode dstIn_;
    Timecode dstOut_;
    std::uint32_t eventNumber_ = 0;
    std::string rollName_;
    std::string clipName_;
    FlawSet flaws_;
    std::int32_t transitionType_ = TransitionType::Cut;
    std::int32_t transitionDuration_ = 0;
    std::string reservedText_;
    std::string edlFileName_;
    std::string comment_;
    bool vfx_ = false;
    double motionSpeed_ = 1.0;
    EventChangeContext changeContext_;
    std::string flawText_;
};

} // namespace cadrel::core
