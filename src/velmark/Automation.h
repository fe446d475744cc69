// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

/// An automation curve of a track. Answers to IProjectNode too: its points are its children, and they are inserted,
/// removed and walked over as events are. Between two points the value runs straight; before the first and after the last
/// it stays at theirs.
class IEnvelopeTrack : public FUnknown {
public:
    static constexpr InterfaceId<IEnvelopeTrack> iid{"3c4d78beb7f1425fb0ede9977b5e43fd"};

    /// What the curve automates (volume, pan, mute and so on) has the same number on every track and at any time.
    virtual int32 curveNumber() = 0;
};

/// A point of a curve. Its time is IProjectNode::getStart and setStart, to which it answers too.
class IAutomationPoint : public FUnknown {
public:
    static constexpr InterfaceId<IAutomationPoint> iid{"501b33ddb7174533b793e1408425375f"};

    /// From 0 to 1.
    virtual float getValue() = 0;
    /// Nonzero for a value outside.
    virtual int32 setValue(float value) = 0;
};

} // namespace Velmark
