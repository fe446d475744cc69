// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

/// The names of parameters, all of them times in seconds from the time origin.
struct ParameterName {
    /// Of a project's locators.
    static constexpr const char* LeftTime = "leftTime";
    static constexpr const char* RightTime = "rightTime";
    /// Of the transport.
    static constexpr const char* CycleLeftTime = "cycleLeftTime";
    static constexpr const char* CycleRightTime = "cycleRightTime";
};

/// A value that the host shows and the user can change.
class IParameter : public FUnknown {
public:
    static constexpr InterfaceId<IParameter> iid{"938cfd5808664bebaa5809f39b4d4596"};

    /// The flags of setValue: whether those who show the value are told.
    struct Flag {
        static constexpr int32 Notify = 1;
    };

    /// Nonzero for a value that the parameter can't have.
    virtual int32 setValue(int32 flags, double value) = 0;
    virtual double getValue() = 0;
};

/// The locators of a project: "leftTime" and "rightTime". It has no identifier.
class ILocators : public FUnknown {
public:
    /// Borrowed; null for a name that isn't known.
    virtual IParameter* getParameter(const char* name) = 0;
};

/// The transport. It plays the active project.
class ITransportControl : public FUnknown {
public:
    static constexpr InterfaceId<ITransportControl> iid{"7e64890cfa5c4ecbb37ad80665a86c99"};

    /// "cycleLeftTime" and "cycleRightTime"; borrowed, and null for a name that isn't known.
    virtual IParameter* getParameter(const char* name) = 0;
    /// Seconds from the time origin.
    virtual double getPosition() = 0;
    virtual int32 setPosition(double seconds) = 0;
    virtual int32 stop() = 0;
};

} // namespace Velmark
