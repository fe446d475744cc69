// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

namespace Velmark {
struct FrameRateInfo;
} // namespace Velmark

namespace cadrel::host {

/// The rate of a host's project. Its seconds are those of the host's timeline: the real rate is the host's number as it
/// stands, also where the rate was pulled down. Throws Result::NotSupported for what is no rate, and for drop-frame at a
/// nominal rate other than 30.
core::Framerate framerateOf(const Velmark::FrameRateInfo& info);

/// Whether timecodes mean the same under both.
bool areSame(const core::Framerate& one, const core::Framerate& other);

} // namespace cadrel::host
