// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/conform/CadrelAlgorithm.h"

namespace cadrel::core {

/// Moves the ends of each cut event around slivers, so that a few frames of a clip are never left over. A short piece
/// outside the range comes along, and a short piece inside it stays out.
///
///     clip           |------------------------|
///     range     |------|                             the piece inside stays out
///     range                |----------------|        the piece after it comes along, and what follows gives way
///
/// When a range grows at its end, the following cuts give way. When it grows at its start, the preceding cut does not.
/// This is deliberate.
class SnippetAlgorithm : public CadrelAlgorithm {
public:
    /// Returns Result::Ok. Does nothing unless the settings include overhanging audio events. Only cuts that come after
    /// a grown range in the programme give way to it; in a list that isn't in DST order, earlier ones are skipped.
    /// Throws what CutEventBase::update throws.
    util::Result::Type process(CutList& cuts, const CadrelPreviewState& state) const override;
};

} // namespace cadrel::core
