// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/ModulePlaces.h"

#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

namespace desktop::tests {
namespace {

TEST(ModulePlaces, TellsThatTheResourcesAreMissing)
{
    const cadrel::tests::TempFolder folder;
    const ModulePlaces places = ModulePlaces::besideProgram(folder / "bin/cadrel-desktop");
    EXPECT_EQ(places.module, folder / "lib/Cadrel.so");
    EXPECT_NE(places.resourcesFault().find((folder / "resources").string()), std::string::npos);
    cadrel::tests::writeFile(folder / "resources", "no folder");
    EXPECT_FALSE(places.resourcesFault().empty());
    std::filesystem::remove(folder / "resources");
    std::filesystem::create_directory(folder / "resources");
    EXPECT_EQ(places.resourcesFault(), "");
}

} // namespace
} // namespace desktop::tests
