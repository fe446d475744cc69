// SPDX-License-Identifier: GPL-3.0-or-later

// What the host tells the adapter: projects that come and go, are saved and edited.

#include "core/conform/CadrelerBase.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/model/MediaPoolInterface.h"
#include "core/time/Timecode.h"
#include "gui/services/AlertWindowBase.h"
#include "gui/services/FileBrowserDialogBase.h"
#include "host/Host.h"
#include "host/picture/VideoProvider.h"
#include "host/project/Project.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/host/AdaptedHost.h"
#include "tests/support/host/FakeProject.h"
#include "util/StringUtil.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::makeEvent;
using cadrel::tests::RecordingListener;
using cadrel::tests::thrownBy;
using core::ChangeContext;
using core::Timecode;
using core::serialize::ByteArchive;
using util::Result;

using Types = std::vector<std::int32_t>;
using Models = std::vector<core::DataModel*>;
using Messages = std::vector<std::u16string>;

constexpr const char16_t* SaveFailed = u"An error occurred while saving the Cadrel data.";
constexpr const char16_t* LoadFailed = u"An error occurred while loading the Cadrel data. The data will be ignored.";

/// The adapter, and who listens to it.
class HostNotificationsTest : public testing::Test {
protected:
    HostNotificationsTest() { host.adapter().addListener(&heard); }
    ~HostNotificationsTest() override { host.adapter().removeListener(&heard); }

    /// Stores a block with the project as a save would have done.
    void store(standin::Project& project, const ByteArchive& block, std::uint32_t checksum)
    {
        const auto list = create<IAttributeData>(host.context());
        list->setBinary(AttributeKey::StorageData, block.data(), static_cast<int32>(block.size()), true);
        project.setAttribute(AttributeKey::Storage, FVariant::object(list.get()), true);
        project.setAttribute(AttributeKey::StorageChecksum, FVariant::integer(checksum), true);
    }

    /// The project is opened as it stands, as if it had come from a file.
    void reopen(standin::Project& project)
    {
        host.adapter().projectClosing(&project, 0);
        host.adapter().projectOpened(&project);
        host.adapter().projectActivated(&project);
    }

    AdaptedHost host{0.0};
    RecordingListener heard;
};

/// A listener that isn't up to what it hears.
class ThrowingListener : public core::ChangeContextListenerInterface {
public:
    void onChange(const ChangeContext&) override { throw std::runtime_error("unforeseen"); }
};

/// Counts the pictures that come.
class PictureListener : public gui::VideoProviderBase::Listener {
public:
    int pictures = 0;

    void imageChanged(std::size_t) override { ++pictures; }
};

/// A list of binary values that takes no more.
class FullList : public Implements<FullList, FObject, IAttributeData> {
public:
    static constexpr const char* ClassName = "FullList";

    int32 setBinary(const char*, const void*, int32, bool) override { return ResultFalse; }
    int32 getBinary(const char*, void*, int32) override { return ResultFalse; }
    int32 getBinarySize(const char*) override { return 0; }
};

/// Looks at the frames of a second whenever the media change.
class RateListener : public core::MediaPoolInterface::Listener {
public:
    std::vector<std::int32_t> rates;

    void mediaPoolChanged() override { rates.push_back(Timecode::framerate().framesPerSecond); }
};

/// A manager of projects of which some indexes are empty.
class GappedManager : public Implements<GappedManager, FObject, IProjectManager> {
public:
    static constexpr const char* ClassName = "GappedManager";

    explicit GappedManager(std::vector<IProjectDocument*> projects) : m_projects(std::move(projects)) {}

    int32 projectCount() override { return static_cast<int32>(m_projects.size()); }
    IProjectDocument* projectAt(int32 index) override { return m_projects[static_cast<std::size_t>(index)]; }
    IProjectDocument* activeProject() override { return nullptr; }
    int32 addNotification(IProjectNotification*) override { return ResultOk; }
    int32 removeNotification(IProjectNotification*) override { return ResultOk; }

private:
    std::vector<IProjectDocument*> m_projects;
};

} // namespace

TEST_F(HostNotificationsTest, AnswersForWhatTheHostCalls)
{
    FObject* const object = &host.adapter();

    EXPECT_TRUE(query<IProjectNotification>(object));
    EXPECT_TRUE(query<IProjectStorageNotification>(object));
    EXPECT_TRUE(query<IProjectEditHook>(object));
    EXPECT_TRUE(query<IIdleHandler>(object));
    EXPECT_TRUE(query<IDependent>(object));
    EXPECT_FALSE(query<IEditStep>(object));
}

TEST_F(HostNotificationsTest, IsOfItsClassAndOfItsBase)
{
    EXPECT_TRUE(host.adapter().isA("Host", false));
    EXPECT_FALSE(host.adapter().isA("FObject", false));
    EXPECT_TRUE(host.adapter().isA("FObject", true));
    EXPECT_FALSE(host.adapter().isA("Project", true));
}

TEST_F(HostNotificationsTest, InstallsTheServicesOfTheProcessAndTakesThemAway)
{
    EXPECT_NO_THROW(gui::AlertWindowBase::instance());
    EXPECT_NO_THROW(gui::FileBrowserDialogBase::instance());
    EXPECT_EQ(util::StringUtil::translate(L"Destination"), L"Destination");
    EXPECT_NE(core::createDataModelCommand(L"Edit"), nullptr);

    host.disconnect();

    EXPECT_EQ(thrownBy([] { gui::AlertWindowBase::instance(); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([] { gui::FileBrowserDialogBase::instance(); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([] { util::StringUtil::translate(L"Destination"); }), Result::NotAvailable);
    EXPECT_EQ(core::createDataModelCommand(L"Edit"), nullptr);
    EXPECT_EQ(thrownBy([] { Timecode::framerate(); }), Result::NotAvailable);
    host.connect();
}

TEST_F(HostNotificationsTest, NeedsAContext)
{
    host.disconnect();

    EXPECT_EQ(thrownBy([] { Host adapter(nullptr); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { Host adapter(host.document()); }), Result::HostObjectMissing);
    host.connect();
}

TEST_F(HostNotificationsTest, LeavesNothingBehindWhereItCannotBegin)
{
    host.disconnect();

    for (const Identifier& id : {Identifier(IProjectManager::iid), Identifier(IIdleManager::iid)}) {
        AlteredContext altered(host.context());
        altered.hide(id);
        EXPECT_EQ(thrownBy([&] { Host adapter(static_cast<IHostContext*>(&altered)); }), Result::HostObjectMissing);
        EXPECT_EQ(thrownBy([] { gui::AlertWindowBase::instance(); }), Result::NotAvailable);
        EXPECT_EQ(thrownBy([] { util::StringUtil::translate(L""); }), Result::NotAvailable);
    }
    // Whoever was still registered would be called here, and is gone.
    host.application.closeProject(host.application.createProject());
    host.idle();
    host.connect();
}

TEST_F(HostNotificationsTest, LeavesTheServicesOfAnotherAdapterAlone)
{
    EXPECT_EQ(thrownBy([&] { Host second(host.context()); }), Result::NotAvailable);

    EXPECT_NO_THROW(gui::AlertWindowBase::instance());
    EXPECT_NO_THROW(util::StringUtil::translate(L"Destination"));
}

TEST_F(HostNotificationsTest, CatchesUpWithTheProjectsThatAreOpen)
{
    host.disconnect();
    standin::Project& second = host.application.createProject();

    host.connect();

    ASSERT_NE(host.adapter().getProjectModel(), nullptr);
    core::DataModel* const first = host.adapter().getProjectModel();
    host.application.activateProject(&second);
    EXPECT_NE(host.adapter().getProjectModel(), nullptr);
    EXPECT_NE(host.adapter().getProjectModel(), first);
}

TEST_F(HostNotificationsTest, PassesOverProjectsThatAreNotThere)
{
    host.disconnect();
    host.altered.replace(IProjectManager::iid,
                         makeCounted<GappedManager>(std::vector<IProjectDocument*>{nullptr, host.document(), nullptr}));

    host.connect();

    EXPECT_TRUE(host.alerts->messages.empty());
    host.adapter().projectActivated(host.document());
    EXPECT_NE(host.adapter().getProjectModel(), nullptr);
}

TEST_F(HostNotificationsTest, TellsItsListenersOfTheModelOfAnActiveProject)
{
    standin::Project& second = host.application.createProject();
    heard.forget();

    host.adapter().projectActivated(&second);

    EXPECT_EQ(heard.types, (Types{ChangeContext::PreviewStateChanged, ChangeContext::DataModelChanged}));
    EXPECT_EQ(heard.dataModels, Models{host.adapter().getProjectModel()});
}

TEST_F(HostNotificationsTest, PassesTheChangesOfTheActiveModelAloneOn)
{
    core::DataModel& first = host.model();
    standin::Project& second = host.application.createProject();
    host.application.activateProject(&second);
    heard.forget();

    first.oldEdl().clear();
    EXPECT_TRUE(heard.types.empty());

    host.model().newEdl().clear();
    EXPECT_EQ(heard.types, Types{ChangeContext::EventListChanged});
}

TEST_F(HostNotificationsTest, CountsTimecodesAtTheRateOfTheActiveProject)
{
    standin::Project& second = host.application.createProject();
    second.setFrameRate({30.0, 0});
    EXPECT_EQ(Timecode::framerate().framesPerSecond, 25);

    host.application.activateProject(&second);
    EXPECT_EQ(Timecode::framerate().framesPerSecond, 30);

    host.application.activateProject(nullptr);
    EXPECT_EQ(thrownBy([] { Timecode::framerate(); }), Result::NotAvailable);
}

TEST_F(HostNotificationsTest, HasNoModelWhenNoProjectIsActive)
{
    core::DataModel& model = host.model();
    heard.forget();

    host.application.activateProject(nullptr);

    EXPECT_EQ(host.adapter().getProjectModel(), nullptr);
    EXPECT_EQ(heard.types, Types{ChangeContext::DataModelChanged});
    EXPECT_EQ(heard.dataModels, Models{nullptr});
    heard.forget();
    model.changeEdl().clear();
    EXPECT_TRUE(heard.types.empty());
}

TEST_F(HostNotificationsTest, HasNoModelForAProjectThatItDoesNotKnow)
{
    const auto stranger = makeCounted<standin::Project>(host.application.edits().log());

    host.adapter().projectActivated(stranger.get());

    EXPECT_EQ(host.adapter().getProjectModel(), nullptr);
    EXPECT_EQ(thrownBy([] { Timecode::framerate(); }), Result::NotAvailable);
    host.adapter().projectActivated(nullptr);
    EXPECT_EQ(host.adapter().getProjectModel(), nullptr);
}

TEST_F(HostNotificationsTest, LeavesAProjectThatCloses)
{
    heard.forget();

    host.adapter().projectClosing(host.document(), 0);

    EXPECT_EQ(host.adapter().getProjectModel(), nullptr);
    EXPECT_EQ(heard.dataModels, Models{nullptr});
    EXPECT_EQ(thrownBy([] { Timecode::framerate(); }), Result::NotAvailable);
    host.project.announceStoring();
    EXPECT_NE(host.project.hasAttribute(AttributeKey::Storage), ResultOk) << "It stores nothing any more.";
    host.edit(u"Edit", [&] { host.addTrack(TypeWord::Audio, u"DX"); });
}

TEST_F(HostNotificationsTest, KeepsTheActiveProjectWhenAnotherCloses)
{
    standin::Project& second = host.application.createProject();
    core::DataModel* const model = host.adapter().getProjectModel();
    heard.forget();

    host.application.closeProject(second);

    EXPECT_EQ(host.adapter().getProjectModel(), model);
    EXPECT_TRUE(heard.types.empty());
}

TEST_F(HostNotificationsTest, DropsTheEndOfAProjectThatItDoesNotKnow)
{
    const auto stranger = makeCounted<standin::Project>(host.application.edits().log());
    heard.forget();

    EXPECT_EQ(host.adapter().projectClosing(stranger.get(), 0), ResultOk);
    EXPECT_EQ(host.adapter().projectClosing(nullptr, 0), ResultOk);

    EXPECT_TRUE(heard.types.empty());
    EXPECT_TRUE(host.alerts->messages.empty());
}

TEST_F(HostNotificationsTest, TakesNoNoticeOfANewName)
{
    heard.forget();

    EXPECT_EQ(host.adapter().projectRenamed(host.document()), ResultOk);

    EXPECT_TRUE(heard.types.empty());
}

TEST_F(HostNotificationsTest, StoresTheModelInASave)
{
    host.carryOver("01:00:00:00", "01:00:10:00", "01:00:05:00", "01:00:15:00");

    host.project.announceStoring();
    reopen(host.project);

    EXPECT_EQ(host.model().changeEdl().size(), 1U);
    EXPECT_TRUE(host.alerts->messages.empty());
}

TEST_F(HostNotificationsTest, SaysThatASaveWentWrong)
{
    host.altered.hide(ClassId::AttributeList);

    EXPECT_NE(host.adapter().projectStoring(host.document()), ResultOk);

    EXPECT_EQ(host.alerts->messages, Messages{SaveFailed});
}

TEST_F(HostNotificationsTest, LeavesWhatWasStoredWhereTheHostTakesNoBlock)
{
    host.project.announceStoring();
    ASSERT_EQ(host.project.hasAttribute(AttributeKey::Storage), ResultOk);
    ASSERT_EQ(host.project.hasAttribute(AttributeKey::StorageChecksum), ResultOk);
    host.altered.replace(IAttributeData::iid, makeCounted<FullList>());

    const std::string before = host.dump();

    EXPECT_EQ(host.adapter().projectStoring(host.document()), Result::HostCallFailed);

    EXPECT_EQ(host.dump(), before);
    EXPECT_EQ(host.alerts->messages, Messages{SaveFailed});
}

TEST_F(HostNotificationsTest, StoresAProjectAtItsOwnRateWhileAnotherIsActive)
{
    // Frame 28 is one of 30 a second, and none of 25.
    standin::Project& second = host.application.createProject();
    second.setFrameRate({30.0, 0});
    host.application.activateProject(&second);
    host.carryOver("01:00:00:28", "01:00:10:28", "01:00:05:28", "01:00:15:28");
    const ByteArchive expected = DataModelEditStep::snapshotOf(host.model());
    host.application.activateProject(&host.project);

    second.announceStoring();
    EXPECT_NE(host.project.hasAttribute(AttributeKey::Storage), ResultOk) << "The active project isn't saved.";
    EXPECT_EQ(Timecode::framerate().framesPerSecond, 25);
    host.adapter().projectClosing(&second, 0);
    host.adapter().projectOpened(&second);
    EXPECT_EQ(Timecode::framerate().framesPerSecond, 25);
    host.application.activateProject(&second);
    host.adapter().projectActivated(&second);

    ASSERT_EQ(host.model().changeEdl().size(), 1U);
    EXPECT_TRUE(host.model().changeEdl().at(0).isValid());
    const ByteArchive found = DataModelEditStep::snapshotOf(host.model());
    EXPECT_EQ(std::vector(found.data(), found.data() + found.size()),
              std::vector(expected.data(), expected.data() + expected.size()));
    EXPECT_TRUE(host.alerts->messages.empty());
}

TEST_F(HostNotificationsTest, SaysThatAProjectThatItDoesNotKnowWasNotSaved)
{
    const auto stranger = makeCounted<standin::Project>(host.application.edits().log());

    EXPECT_EQ(host.adapter().projectStoring(stranger.get()), Result::HostObjectMissing);

    EXPECT_EQ(host.alerts->messages, Messages{SaveFailed});
}

TEST_F(HostNotificationsTest, SaysThatANewerVersionCannotBeLoaded)
{
    ByteArchive block;
    block << std::uint32_t{2};
    store(host.project, block, block.crc32());

    reopen(host.project);

    EXPECT_EQ(host.alerts->messages,
              Messages{u"The project was created with a newer Cadrel version. The data cannot be loaded."});
}

TEST_F(HostNotificationsTest, SaysThatAnOldVersionCannotBeLoaded)
{
    ByteArchive block;
    block << std::uint32_t{0};
    store(host.project, block, block.crc32());

    reopen(host.project);

    EXPECT_EQ(host.alerts->messages,
              Messages{u"The project was created with an unsupported Cadrel version. The data cannot be loaded."});
}

TEST_F(HostNotificationsTest, SaysThatBrokenDataAreIgnored)
{
    const ByteArchive block = DataModelEditStep::snapshotOf(host.model());
    store(host.project, block, block.crc32() + 1);

    reopen(host.project);

    EXPECT_EQ(host.alerts->messages, Messages{LoadFailed});
}

TEST_F(HostNotificationsTest, SaysThatDataAreIgnoredWhichTheHostDoesNotGive)
{
    host.project.setAttribute(AttributeKey::Storage, FVariant::integer(1), true);
    host.project.setAttribute(AttributeKey::StorageChecksum, FVariant::integer(0), true);
    reopen(host.project);

    const auto empty = create<IAttributeData>(host.context());
    host.project.setAttribute(AttributeKey::Storage, FVariant::object(empty.get()), true);
    reopen(host.project);

    EXPECT_EQ(host.alerts->messages, (Messages{LoadFailed, LoadFailed}));
    EXPECT_TRUE(host.model().changeEdl().isEmpty());
}

TEST_F(HostNotificationsTest, SaysThatNotAllTracksCanBeReadWhereTheDataHaveBeenLoaded)
{
    const auto project = FakeProject::withoutUsableTrack();

    EXPECT_EQ(host.adapter().projectOpened(project.get()), Result::HostObjectMissing);

    EXPECT_EQ(host.alerts->messages,
              Messages{u"Not all tracks of the project can be read. Those of a preview may still be locked."});
    host.adapter().projectClosing(project.get(), 0);
}

TEST_F(HostNotificationsTest, WorksOnWithAnEmptyModelWhenNothingCouldBeLoaded)
{
    host.carryOver("01:00:00:00", "01:00:10:00", "01:00:05:00", "01:00:15:00");
    ByteArchive block = DataModelEditStep::snapshotOf(host.model());
    store(host.project, block, block.crc32() + 1);

    reopen(host.project);

    ASSERT_NE(host.adapter().getProjectModel(), nullptr);
    EXPECT_TRUE(host.model().changeEdl().isEmpty());
    host.project.announceStoring();
    reopen(host.project);
    EXPECT_EQ(host.alerts->messages.size(), 1U) << "The save has put a sound block in the place of the broken one.";
}

TEST_F(HostNotificationsTest, SaysWhenAProjectCannotBeFollowed)
{
    standin::Project& second = host.application.createProject();
    host.adapter().projectClosing(&second, 0);
    host.altered.hide(IDependencyManager::iid);

    EXPECT_EQ(host.adapter().projectOpened(&second), Result::HostObjectMissing);
    EXPECT_EQ(host.adapter().projectOpened(nullptr), Result::HostObjectMissing);

    EXPECT_EQ(host.alerts->messages.size(), 2U);
    second.announceStoring();
    EXPECT_EQ(host.alerts->messages.size(), 2U) << "It isn't registered for the saves of that project.";
}

TEST_F(HostNotificationsTest, OpensAProjectOnce)
{
    core::DataModel* const model = host.adapter().getProjectModel();

    host.adapter().projectOpened(host.document());

    EXPECT_EQ(host.adapter().getProjectModel(), model);
    EXPECT_TRUE(host.alerts->messages.empty());
}

TEST_F(HostNotificationsTest, LetsTheModelFollowTheRateOfItsProject)
{
    // Frame 24 is one of 25 a second, and none of 24.
    core::EventBase& event = host.carryOver("01:00:00:24", "01:00:10:00", "01:00:05:00", "01:00:15:00");
    ASSERT_FALSE(event.hasFlaw(core::EventFlaw::TimecodeInvalid));
    heard.forget();

    host.project.setFrameRate({24.0, 0});
    host.idle();

    EXPECT_TRUE(event.hasFlaw(core::EventFlaw::TimecodeInvalid));
    EXPECT_EQ(heard.dataModels, Models{&host.model()});
}

TEST_F(HostNotificationsTest, LooksAtAnotherProjectAtThatOnesRate)
{
    core::DataModel& first = host.model();
    core::EventBase& event = host.carryOver("01:00:00:24", "01:00:10:00", "01:00:05:00", "01:00:15:00");
    standin::Project& second = host.application.createProject();
    second.setFrameRate({30.0, 0});
    host.application.activateProject(&second);

    host.project.setFrameRate({24.0, 0});
    host.idle();

    EXPECT_TRUE(event.hasFlaw(core::EventFlaw::TimecodeInvalid));
    EXPECT_EQ(first.changeEdl().countInvalidTimecodes(), 1U);
    EXPECT_EQ(Timecode::framerate().framesPerSecond, 30) << "The active project's rate counts again.";
}

TEST_F(HostNotificationsTest, LetsTheListenersOfAnotherProjectCountAtThatOnesRate)
{
    standin::Project& second = host.application.createProject();
    second.setFrameRate({30.0, 0});
    host.application.activateProject(&second);
    core::MediaPoolInterface& media = *host.adapter().getMediaPool();
    RateListener listener;
    media.addListener(&listener);
    host.application.activateProject(&host.project);

    host.adapter().update(static_cast<IProjectDocument*>(&second), 0);

    EXPECT_EQ(listener.rates, std::vector<std::int32_t>{30});
    EXPECT_EQ(Timecode::framerate().framesPerSecond, 25);
    media.removeListener(&listener);
}

TEST_F(HostNotificationsTest, TakesNoNoticeOfTheChangesOfOthers)
{
    heard.forget();

    EXPECT_EQ(host.adapter().update(host.context(), 0), ResultOk);
    EXPECT_EQ(host.adapter().update(nullptr, 0), ResultOk);

    EXPECT_TRUE(heard.types.empty());
}

TEST_F(HostNotificationsTest, AnswersOnlyForEditsOfTheActiveProject)
{
    standin::Project& second = host.application.createProject();

    EXPECT_EQ(host.adapter().projectEdited(&second, nullptr), ResultOk);
    EXPECT_EQ(host.adapter().projectEdited(host.document(), nullptr), Result::HostObjectMissing);

    host.application.activateProject(nullptr);
    EXPECT_EQ(host.adapter().projectEdited(host.document(), nullptr), ResultOk);
}

TEST_F(HostNotificationsTest, LetsNoExceptionReachTheHost)
{
    ThrowingListener listener;
    host.addTrack(TypeWord::Audio, u"DX");
    host.carryOver("01:00:00:00", "01:00:10:00", "01:00:05:00", "01:00:15:00");
    host.adapter().startCadrel();
    host.adapter().addListener(&listener);

    EXPECT_EQ(host.adapter().onIdle(), ResultOk);
    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
    EXPECT_EQ(host.adapter().projectDeactivated(host.document()), Result::NotAvailable);
    EXPECT_EQ(host.adapter().getProjectModel(), nullptr);
    EXPECT_EQ(host.adapter().projectActivated(host.document()), Result::NotAvailable);
    EXPECT_NE(host.adapter().getProjectModel(), nullptr) << "It is active whatever its listeners make of it.";

    host.adapter().removeListener(&listener);
    host.idle();
    EXPECT_EQ(std::ranges::count(host.undoNames(), u"Apply Cadrel"), 1) << "The request was lowered.";
}

TEST_F(HostNotificationsTest, BringsPicturesWithTheIdleCalls)
{
    const juce::ScopedJuceInitialiser_GUI fonts;
    PictureListener listener;
    host.adapter().removeListener(&heard);
    host.disconnect();
    const auto provider = std::make_shared<VideoProvider>(&host.altered);
    host.connect(provider);
    host.adapter().addListener(&heard);
    ASSERT_EQ(host.adapter().getVideoProvider(), provider);
    VideoProvider& pictures = *provider;
    pictures.addListener(&listener);
    pictures.setImageSize(64, 36);
    EXPECT_EQ(listener.pictures, 0);

    host.idle();

    // Without any video there is a message for either side.
    EXPECT_EQ(listener.pictures, 2);
    pictures.removeListener(&listener);
}

TEST_F(HostNotificationsTest, IsOutOfTheWayOnceItHasGone)
{
    host.application.createProject();

    host.adapter().removeListener(&heard);
    host.disconnect();

    host.addTrack(TypeWord::Audio, u"DX");
    host.idle();
    host.project.announceStoring();
    EXPECT_NE(host.project.hasAttribute(AttributeKey::Storage), ResultOk);
    host.application.activateProject(nullptr);
    host.connect();
    host.adapter().addListener(&heard);
}

} // namespace cadrel::host::tests
