// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/FramerateProvider.h"
#include "core/time/Timecode.h"
#include "tests/support/PlainConverter.h"
#include "util/StringUtil.h"

#include <utility>

namespace cadrel::tests {

/// Stands in for an open project while it lives: gives timecodes their frame rate and texts their converter. Where one is
/// open already, the new one counts until it goes; so the last that came goes first.
class TestProject : public core::FramerateProvider {
public:
    explicit TestProject(const core::Framerate& rate = core::Framerate(25, 0))
        : framerate(rate), m_before(std::exchange(s_open, this))
    {
        install(this);
    }
    TestProject(const TestProject&) = delete;
    TestProject& operator=(const TestProject&) = delete;
    ~TestProject()
    {
        s_open = m_before;
        install(s_open);
    }

    core::Framerate getFramerate() const override { return framerate; }

    core::Framerate framerate;
    PlainConverter converter;

private:
    friend class NoProject;

    static void install(const TestProject* project)
    {
        core::Timecode::setFramerateProvider(project);
        util::StringUtil::setConverter(project ? &project->converter : nullptr);
    }

    inline static const TestProject* s_open = nullptr;

    const TestProject* m_before;
};

/// No project is open while it lives, whichever was before.
class NoProject {
public:
    NoProject() : m_before(std::exchange(TestProject::s_open, nullptr)) { TestProject::install(nullptr); }
    NoProject(const NoProject&) = delete;
    NoProject& operator=(const NoProject&) = delete;
    ~NoProject()
    {
        TestProject::s_open = m_before;
        TestProject::install(m_before);
    }

private:
    const TestProject* m_before;
};

} // namespace cadrel::tests
