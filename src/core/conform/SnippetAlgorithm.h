// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/conform/CadrelAlgorithm.h"

namespace cadrel::core {

/// Shifts the ends of each cut event so that a few frames of an audio clip are not left behind as a sliver: a short
/// piece outside the range comes along, a short piece inside it stays out.
///
///     clip           |------------------------|
///     range     |------|                             the piece inside stays out
///     range                |----------------|        the piece behind comes along, and what follows gives way
///
/// Growth at the start of a range doesn't make the preceding cut give way; only growth at the end does, in this one
/// direction.
class SnippetAlgorithm : public CadrelAlgorithm {
public:
    /// Returns Result::Ok; does nothing unless the settings include overhanging audio events. Only what stands behind a
    /// grown range in the programme gives way to it: in a list that isn't in DST order each growth looks past all
    /// earlier ones. Throws what CutEventBase::update throws.
    util::Result::Type process(CutList& cuts, const CadrelPreviewState& state) const override;
};

} // namespace cadrel::core
