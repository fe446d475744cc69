// SPDX-License-Identifier: GPL-3.0-or-later

// The main function of the core's tests. A project of 25 frames a second is open in each of them. A test that needs another
// rate opens a TestProject of its own, and one that needs none says NoProject.

#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <optional>

namespace cadrel::tests {
namespace {

/// Opens a new project before each test is made, and closes it when the test is gone.
class ProjectForEachTest : public testing::EmptyTestEventListener {
public:
    void OnTestStart(const testing::TestInfo&) override { m_project.emplace(); }
    void OnTestEnd(const testing::TestInfo&) override { m_project.reset(); }

private:
    struct OpenProject {
        TestProject project;
    };

    std::optional<OpenProject> m_project;
};

} // namespace
} // namespace cadrel::tests

int main(int argc, char** argv)
{
    testing::InitGoogleTest(&argc, argv);
    // GoogleTest owns its listeners.
    testing::UnitTest::GetInstance()->listeners().Append(new cadrel::tests::ProjectForEachTest);
    return RUN_ALL_TESTS();
}
