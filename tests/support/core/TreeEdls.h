// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/time/Framerate.h"
#include "tests/support/core/TestProject.h"

#include <string>
#include <vector>

namespace cadrel::tests {

/// Every EDL of the tree with picture in it, for laws that hold for all of them: the `.edl` files of tests/data/edl and of
/// the examples, as paths from the root of the tree, in alphabetical order.
std::vector<std::string> treeEdls();

/// An EDL of the tree, read under the rate that it shows, or at 24 frames a second if it shows none. A project of that rate is open as long as it lives.
///
///     for (const std::string& path : treeEdls()) {
///         SCOPED_TRACE(path);
///         const TreeEdl edl(path);
///         ...
///     }
class TreeEdl {
public:
    /// The path goes from the root of the tree. Throws std::runtime_error for a file that can't be read.
    explicit TreeEdl(const std::string& path, bool acceptAudio = false);

    const core::EventList& events() const { return m_events; }
    core::EventList& events() { return m_events; }
    /// Of the project: no drop-frame unless the EDL says so.
    const core::Framerate& framerate() const { return m_project.framerate; }

private:
    TestProject m_project;
    core::EventList m_events;
};

} // namespace cadrel::tests
