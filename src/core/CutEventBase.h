#pragma once

#include "core/CutEventSpans.h"

#include <string>

namespace cadrel::core {

/// A piece of audio material on a host track that the engine cuts and moves. All times are seconds.
class CutEventBase {
public:
    virtual ~CutEventBase() = default;

    /// The host events and the automation around a time on this event's track.
    virtual CutEventSpans update(double time) = 0;
    virtual std::wstring getTrackName() = 0;
    virtual bool isAudio() = 0;

    double& srcIn() { return srcIn_; }
    double& srcOut() { return srcOut_; }
    double& dstIn() { return dstIn_; }
    double& dstOut() { return dstOut_; }
    double srcIn() const { return srcIn_; }
    double srcOut() const { return srcOut_; }
    double dstIn() const { return dstIn_; }
    double dstOut() const { return dstOut_; }
    void setSrcIn(double seconds) { srcIn_ = seconds; }
    void setSrcOut(double seconds) { srcOut_ = seconds; }
    void setDstIn(double seconds) { dstIn_ = seconds; }
    void setDstOut(double seconds) { dstOut_ = seconds; }

private:
    double srcIn_ = 0.0;
    double srcOut_ = 0.0;
    double dstIn_ = 0.0;
    double dstOut_ = 0.0;
};

} // namespace cadrel::core
