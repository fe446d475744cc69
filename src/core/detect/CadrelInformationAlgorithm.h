// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/MarkerEntry.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::core {

class Cut;
class CutList;
class EventBase;
class ProgressHandlerBase;
struct CadrelRunState;
struct Framerate;

/// Looks for one kind of spot in a conformed project. It changes nothing.
class CadrelInformationAlgorithm {
public:
    virtual ~CadrelInformationAlgorithm() = default;

    /// `progress` may be null. Throws what the timecode arithmetic, CutMap, CutList::orderedByStart and
    /// CutEventBase::update throw, Result::NotAvailable without a string converter, and Result::Cancelled if the user
    /// has cancelled and the algorithm checks for it. What was found so far is lost then.
    virtual std::vector<MarkerEntry> detect(const CutList& cuts, const CadrelRunState& state,
                                            ProgressHandlerBase* progress) const = 0;
    /// About how many progress steps `detect` will report.
    virtual std::uint64_t estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const = 0;

protected:
    /// Moves the progress on, if there is one.
    static void report(ProgressHandlerBase* progress, std::uint64_t steps);
    /// Throws Result::Cancelled when the user has cancelled.
    static void stopIfCancelled(ProgressHandlerBase* progress);
    /// The name by which events are matched: that of the clip or of the roll.
    static const std::string& nameOf(const EventBase& event, const CadrelRunState& state);
    /// The cuts of CutList::orderedByStart.
    static std::vector<std::shared_ptr<Cut>> inTimeOrder(const CutList& cuts);
};

} // namespace cadrel::core
