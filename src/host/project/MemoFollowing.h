// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace Velmark {
class IEditTransaction;
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

class Track;
struct MemoNote;
struct PreviewedEvents;

/// Applies to the memos what the user has done to their copies since the note. A copy of which nothing was noted is compared
/// with what it is marked as and, where it isn't marked, with its memo. What the user has done to the memo itself since the
/// note counts more than what was done to such a copy.
/// Throws Result::HostObjectMissing and Result::HostCallFailed.
void followCopies(Velmark::IHostContext* context, const MemoNote& note, const Track& memos,
                  const PreviewedEvents& previewed, Velmark::IEditTransaction& transaction);

} // namespace cadrel::host
