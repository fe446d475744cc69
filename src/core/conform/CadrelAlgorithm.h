// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/Result.h"

namespace cadrel::core {

class CutList;
struct CadrelPreviewState;

/// An operation that changes the cuts of a run before anything in the project is moved.
class CadrelAlgorithm {
public:
    virtual ~CadrelAlgorithm() = default;

    /// Changes the times of the cut events in place. Throws what CutEventBase::update throws.
    virtual util::Result::Type process(CutList& cuts, const CadrelPreviewState& state) const = 0;
};

} // namespace cadrel::core
