// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Context.h"
#include "velmark/Media.h"
#include "velmark/PluginFactory.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"
#include "velmark/Tracks.h"
#include "velmark/Transport.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>

using namespace Velmark;

TEST(ContractWords, OfTypesAndFlagsAreTheAgreedOnes)
{
    EXPECT_STREQ(TypeWord::Track, "track");
    EXPECT_STREQ(TypeWord::Audio, "audio");
    EXPECT_STREQ(TypeWord::Video, "video");
    EXPECT_STREQ(TypeWord::Marker, "marker");
    EXPECT_STREQ(TypeWord::Folder, "folder");
    EXPECT_STREQ(TypeWord::Ruler, "ruler");
    EXPECT_STREQ(TypeWord::Part, "part");
    EXPECT_STREQ(TypeWord::Range, "range");
    EXPECT_STREQ(TrackFlag::Lock, "lock");
}

TEST(ContractWords, OfParametersActionsAndClassesAreTheAgreedOnes)
{
    EXPECT_STREQ(ParameterName::LeftTime, "leftTime");
    EXPECT_STREQ(ParameterName::RightTime, "rightTime");
    EXPECT_STREQ(ParameterName::CycleLeftTime, "cycleLeftTime");
    EXPECT_STREQ(ParameterName::CycleRightTime, "cycleRightTime");
    EXPECT_STREQ(IActionManager::EditCategory, "Edit");
    EXPECT_STREQ(IActionManager::Undo, "Undo");
    EXPECT_STREQ(IActionManager::Redo, "Redo");
    EXPECT_STREQ(IObjectFactory::ThumbnailClass, "VideoThumbnailFactory");
    EXPECT_STREQ(IObjectFactory::ThumbnailType, "Video");
    EXPECT_STREQ(HostName, "Stagio");
}

TEST(ContractNumbers, AreTheAgreedOnes)
{
    EXPECT_EQ(ResultOk, 0);
    EXPECT_EQ(ResultNoInterface, -1);
    EXPECT_EQ(ChangeFlag::Removed, 2U);
    EXPECT_EQ(ChangeFlag::Children, 4U);
    EXPECT_EQ(ChangeFlag::Content, 8U);
    EXPECT_EQ(FrameRateInfo::Flag::DropFrame, 1U);
    EXPECT_EQ(FrameRateInfo::Flag::PulledDown, 2U);
    EXPECT_EQ(IParameter::Flag::Notify, 1);
    EXPECT_EQ(IFilePath::Capacity, 1025);
    EXPECT_EQ(IFileSelector::Open, 0);
    EXPECT_EQ(IFileSelector::Save, 4);
    EXPECT_EQ(IFileSelector::Cancelled, 1);
    EXPECT_EQ(IProgressService::Modal, 1);
    EXPECT_EQ(IMenuRegistry::ModuleCommand, 4);
    EXPECT_EQ(PFactoryInfo::Flag::Unicode, 16);
}
