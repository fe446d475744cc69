// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CutEventSpans.h"
#include "core/time/SecondsRange.h"

#include <string>

namespace cadrel::core {

/// A piece of audio material on a host track that the engine cuts and moves. All times are seconds.
class CutEventBase {
public:
    virtual ~CutEventBase() = default;

    /// Answers what lies across an instant of this event's track, before it and after it, and the automation there. It
    /// changes nothing.
    virtual CutEventSpans update(double time) = 0;
    virtual std::wstring getTrackName() = 0;
    virtual bool isAudio() = 0;

    /// What of the new programme is written: as much as there is material, at normal speed.
    SecondsRange written() const { return {m_dstIn, m_dstIn + (m_srcOut - m_srcIn)}; }

    double& srcIn() { return m_srcIn; }
    double& srcOut() { return m_srcOut; }
    double& dstIn() { return m_dstIn; }
    double& dstOut() { return m_dstOut; }
    double srcIn() const { return m_srcIn; }
    double srcOut() const { return m_srcOut; }
    double dstIn() const { return m_dstIn; }
    double dstOut() const { return m_dstOut; }
    void setSrcIn(double seconds) { m_srcIn = seconds; }
    void setSrcOut(double seconds) { m_srcOut = seconds; }
    void setDstIn(double seconds) { m_dstIn = seconds; }
    void setDstOut(double seconds) { m_dstOut = seconds; }

private:
    double m_srcIn = 0.0;
    double m_srcOut = 0.0;
    double m_dstIn = 0.0;
    double m_dstOut = 0.0;
};

} // namespace cadrel::core
