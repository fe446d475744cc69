// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/ChangeView.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"
#include "velmark/Events.h"
#include "velmark/FObject.h"
#include "velmark/IString.h"
#include "velmark/Media.h"
#include "velmark/Module.h"
#include "velmark/PlugView.h"
#include "velmark/PluginFactory.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"
#include "velmark/Tracks.h"
#include "velmark/Transport.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <vector>

using namespace Velmark;

namespace {

/// The place of a virtual operation in its table. A pointer to it holds the byte offset there, as the Itanium C++ ABI
/// says; some machines mark it with its lowest bit.
template <class Operation>
std::size_t slotOf(Operation operation)
{
    std::uintptr_t words[2];
    static_assert(sizeof operation == sizeof words);
    std::memcpy(words, &operation, sizeof words);
    return (words[0] & ~std::uintptr_t{1}) / sizeof(void*);
}

template <class... Operations>
std::vector<std::size_t> slotsOf(Operations... operations)
{
    return {slotOf(operations)...};
}

/// So many slots in a row, the first of them behind those of FUnknown unless told otherwise.
std::vector<std::size_t> inARow(std::size_t count, std::size_t first = 3)
{
    std::vector<std::size_t> slots;
    for (std::size_t index = 0; index < count; ++index)
        slots.push_back(first + index);
    return slots;
}

} // namespace

TEST(OperationOrder, OfTheRootAndOfFObject)
{
    EXPECT_EQ(slotsOf(&FUnknown::queryInterface, &FUnknown::addRef, &FUnknown::release), inARow(3, 0));
    EXPECT_EQ(slotsOf(&IDependent::update), inARow(1));
    // The two destructors have slots 4 and 5.
    EXPECT_EQ(slotsOf(&FObject::isTypeOf, &FObject::classNameOf, &FObject::isA, &FObject::changed,
                      &FObject::deferUpdate, &FObject::updateDone),
              inARow(6, 6));
    EXPECT_EQ(slotsOf(&IString::text16, &IString::text8), inARow(2));
    EXPECT_EQ(slotsOf(&IStringResult::setText16, &IStringResult::setText8), inARow(2));
}

TEST(OperationOrder, OfTheContextAndItsManagers)
{
    EXPECT_EQ(slotsOf(&IHostContext::getInterface), inARow(1));
    EXPECT_EQ(slotsOf(&IHostInfo::getName), inARow(1));
    EXPECT_EQ(slotsOf(&IProjectManager::projectCount, &IProjectManager::projectAt, &IProjectManager::activeProject,
                      &IProjectManager::addNotification, &IProjectManager::removeNotification),
              inARow(5));
    EXPECT_EQ(slotsOf(&IIdleManager::addIdleHandler, &IIdleManager::removeIdleHandler, &IIdleManager::setIdleBlocked),
              inARow(3));
    EXPECT_EQ(slotsOf(&IDependencyManager::addDependent, &IDependencyManager::removeDependent), inARow(2));
}

TEST(OperationOrder, OfAProjectAndItsNodes)
{
    EXPECT_EQ(slotsOf(&IProjectDocument::setProjectEnd, &IProjectDocument::getProjectFile,
                      &IProjectDocument::getDefaultMarkerTrack, &IProjectDocument::getLocators,
                      &IProjectDocument::getContainer, &IProjectDocument::createTrack,
                      &IProjectDocument::addStorageNotification, &IProjectDocument::removeStorageNotification,
                      &IProjectDocument::getMediaPool),
              inARow(9));
    EXPECT_EQ(slotsOf(&IProjectNode::isType, &IProjectNode::changeFlags, &IProjectNode::setAttribute,
                      &IProjectNode::getAttribute, &IProjectNode::hasAttribute, &IProjectNode::removeAttribute,
                      &IProjectNode::getName, &IProjectNode::setName, &IProjectNode::isSelected,
                      &IProjectNode::getStart, &IProjectNode::setStart, &IProjectNode::setLength, &IProjectNode::getEnd,
                      &IProjectNode::setEnd, &IProjectNode::getSourceOffset, &IProjectNode::newChildIterator,
                      &IProjectNode::getParent),
              inARow(17));
    EXPECT_EQ(slotsOf(&INodeIterator::isDone, &INodeIterator::next), inARow(2));
    EXPECT_EQ(slotsOf(&ITimeBase::getFrameRate, &ITimeBase::getTimeOrigin), inARow(2));
    EXPECT_EQ(slotsOf(&IAttributeData::setBinary, &IAttributeData::getBinary, &IAttributeData::getBinarySize),
              inARow(3));
}

TEST(OperationOrder, OfTracksEventsAndAutomation)
{
    EXPECT_EQ(slotsOf(&ITrackNode::setFlag, &ITrackNode::getFlag, &ITrackNode::getAutomation), inARow(3));
    EXPECT_EQ(slotsOf(&IEventNode::getOwner), inARow(1));
    EXPECT_EQ(slotsOf(&IClipEvent::getClip, &IClipEvent::setClip), inARow(2));
    EXPECT_EQ(slotsOf(&IEnvelopeTrack::curveNumber), inARow(1));
    EXPECT_EQ(slotsOf(&IAutomationPoint::getValue, &IAutomationPoint::setValue), inARow(2));
}

TEST(OperationOrder, OfEditingAndTransport)
{
    EXPECT_EQ(slotsOf(&IObjectList::add, &IObjectList::count, &IObjectList::at), inARow(3));
    EXPECT_EQ(slotsOf(&IEditService::copyRange, &IEditService::closeRange), inARow(2));
    EXPECT_EQ(slotsOf(&IEditTransaction::begin, &IEditTransaction::commit, &IEditTransaction::insert,
                      &IEditTransaction::remove, &IEditTransaction::move, &IEditTransaction::copyAll,
                      &IEditTransaction::paste, &IEditTransaction::deleteRange, &IEditTransaction::addStep),
              inARow(9));
    EXPECT_EQ(slotsOf(&IParameter::setValue, &IParameter::getValue), inARow(2));
    EXPECT_EQ(slotsOf(&ILocators::getParameter), inARow(1));
    EXPECT_EQ(slotsOf(&ITransportControl::getParameter, &ITransportControl::getPosition,
                      &ITransportControl::setPosition, &ITransportControl::stop),
              inARow(4));
}

TEST(OperationOrder, OfMedia)
{
    EXPECT_EQ(slotsOf(&IMediaPool::count, &IMediaPool::itemAt, &IMediaPool::import), inARow(3));
    EXPECT_EQ(slotsOf(&IMediaClip::getFrameCount, &IMediaClip::getFile), inARow(2));
    EXPECT_EQ(slotsOf(&IFilePath::setPath, &IFilePath::getPath), inARow(2));
    EXPECT_EQ(slotsOf(&IObjectFactory::createObject, &IObjectFactory::releaseObject), inARow(2));
    EXPECT_EQ(slotsOf(&IThumbnailFactory::setSource, &IThumbnailFactory::getImage), inARow(2));
    EXPECT_EQ(slotsOf(&IThumbnailImage::getSize, &IThumbnailImage::read), inARow(2));
}

TEST(OperationOrder, OfTheUserInterface)
{
    EXPECT_EQ(slotsOf(&IAlertService::show), inARow(1));
    EXPECT_EQ(slotsOf(&IProgressService::begin, &IProgressService::setStatus, &IProgressService::setRange,
                      &IProgressService::setPosition, &IProgressService::setText, &IProgressService::tick,
                      &IProgressService::show, &IProgressService::end),
              inARow(8));
    EXPECT_EQ(slotsOf(&IFileSelector::select), inARow(1));
    EXPECT_EQ(slotsOf(&ITranslationService::addTable, &ITranslationService::translate), inARow(2));
    EXPECT_EQ(slotsOf(&IActionManager::addHandler, &IActionManager::removeHandler, &IActionManager::invoke), inARow(3));
    EXPECT_EQ(slotsOf(&IMenuRegistry::addCommand, &IMenuRegistry::removeCommands), inARow(2));
    EXPECT_EQ(slotsOf(&IWindowFactoryRegistry::addFactory, &IWindowFactoryRegistry::removeFactory), inARow(2));
    EXPECT_EQ(slotsOf(&IViewManager::loadSkin, &IViewManager::openWindow), inARow(2));
    EXPECT_EQ(slotsOf(&IHostWindow::open, &IHostWindow::setCloseNotification, &IHostWindow::show), inARow(3));
}

TEST(OperationOrder, OfWhatTheModuleImplements)
{
    EXPECT_EQ(slotsOf(&IProjectNotification::projectActivated, &IProjectNotification::projectDeactivated,
                      &IProjectNotification::projectOpened, &IProjectNotification::projectClosing,
                      &IProjectNotification::projectRenamed),
              inARow(5));
    EXPECT_EQ(slotsOf(&IProjectStorageNotification::projectStoring), inARow(1));
    EXPECT_EQ(slotsOf(&IProjectEditHook::projectEdited), inARow(1));
    EXPECT_EQ(slotsOf(&IIdleHandler::onIdle), inARow(1));
    EXPECT_EQ(slotsOf(&IEditStep::execute, &IEditStep::undo, &IEditStep::redo, &IEditStep::getDescription), inARow(4));
    EXPECT_EQ(slotsOf(&IPluginBase::initialize, &IPluginBase::terminate), inARow(2));
    EXPECT_EQ(slotsOf(&IActionHandler::handleAction), inARow(1));
    EXPECT_EQ(slotsOf(&IViewBuilder::createView), inARow(1));
    EXPECT_EQ(slotsOf(&ICloseWindowNotification::windowClosed), inARow(1));
    EXPECT_EQ(
        slotsOf(&IPlugWindowFactory::getWindowName, &IPlugWindowFactory::hasWindow, &IPlugWindowFactory::getWindow),
        inARow(3));
    EXPECT_EQ(slotsOf(&IPlugView::attached, &IPlugView::removed, &IPlugView::idle, &IPlugView::onWheel,
                      &IPlugView::onKeyDown, &IPlugView::onKeyUp, &IPlugView::getSize, &IPlugView::onSize,
                      &IPlugView::onFocus, &IPlugView::setFrame, &IPlugView::canResize, &IPlugView::checkSizeConstraint,
                      &IPlugView::isPlatformTypeSupported),
              inARow(13));
    EXPECT_EQ(slotsOf(&IPlugFrame::resizeView), inARow(1));
    EXPECT_EQ(slotsOf(&IChangeView::selectChange), inARow(1));
}

TEST(OperationOrder, OfTheFactory)
{
    EXPECT_EQ(slotsOf(&IPluginFactory::getFactoryInfo, &IPluginFactory::countClasses, &IPluginFactory::getClassInfo,
                      &IPluginFactory::createInstance, &IPluginFactory2::getClassInfo2,
                      &IPluginFactory3::getClassInfoUnicode, &IPluginFactory3::setHostContext),
              inARow(7));
}
