// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/FramerateProvider.h"
#include "core/time/Timecode.h"
#include "tests/util/PlainConverter.h"
#include "util/StringUtil.h"

namespace cadrel::tests {

/// Stands in for an open project while it lives: gives timecodes their frame rate and texts their converter.
class TestProject : public core::FramerateProvider {
public:
    explicit TestProject(const core::Framerate& rate = core::Framerate(25, 0)) : framerate(rate)
    {
        core::Timecode::setFramerateProvider(this);
        util::StringUtil::setConverter(&converter);
    }
    TestProject(const TestProject&) = delete;
    TestProject& operator=(const TestProject&) = delete;
    ~TestProject()
    {
        core::Timecode::setFramerateProvider(nullptr);
        util::StringUtil::setConverter(nullptr);
    }

    core::Framerate getFramerate() const override { return framerate; }

    core::Framerate framerate;
    PlainConverter converter;
};

} // namespace cadrel::tests
