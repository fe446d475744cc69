// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"
#include "velmark/Events.h"
#include "velmark/FObject.h"
#include "velmark/FUID.h"
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
#include <cstring>
#include <set>
#include <stdexcept>
#include <string>
#include <string_view>

using namespace Velmark;

namespace {

struct Entry {
    const char* name;
    const Identifier& identifier;
    const char* digits;
};

const Entry HostInterfaces[] = {
    {"FUnknown", FUnknown::iid, "0000000000000000C000000000000046"},
    {"IHostContext", IHostContext::iid, "eec8968380db43369177273e138a763b"},
    {"IProjectManager", IProjectManager::iid, "3d7c28138abf4aaea23a11bf37214c36"},
    {"IProjectDocument", IProjectDocument::iid, "5354d6acc0d44532b1bda33e229b9f3d"},
    {"IProjectNode", IProjectNode::iid, "7a6f999fbdbc4bccac403dabace8a171"},
    {"ITrackNode", ITrackNode::iid, "ae3a033c70e0456887150f35a8a446f2"},
    {"IMarkerTrack", IMarkerTrack::iid, "e9c743a16c484afa99bc24c081225239"},
    {"IEventNode", IEventNode::iid, "21ffe452d83240d6ae8b6db6ae400165"},
    {"IClipEvent", IClipEvent::iid, "ee190f09858b473bb1b4981bb7c9bd28"},
    {"IMediaClip", IMediaClip::iid, "803c3fed57a648e8b81fce638cc87ad3"},
    {"ITimeBase", ITimeBase::iid, "e797277c02604adeb8cbac383346b5cd"},
    {"IParameter", IParameter::iid, "938cfd5808664bebaa5809f39b4d4596"},
    {"IAttributeData", IAttributeData::iid, "fa1e32f9ca6d46f5a982f956b1191b58"},
    {"IEditTransaction", IEditTransaction::iid, "7199c83a68c940bf9f142dcdff1a1cb3"},
    {"IEditService", IEditService::iid, "287cb9de71e54e36bde1c43bc6ed78cc"},
    {"IObjectList", IObjectList::iid, "8e8562d867f54576817561cfc2b134e3"},
    {"IDependencyManager", IDependencyManager::iid, "f5246d5686544d60b026afb57b697b37"},
    {"IIdleManager", IIdleManager::iid, "9e871847f1ab4776a06c6f945d7fdd4d"},
    {"ITransportControl", ITransportControl::iid, "7e64890cfa5c4ecbb37ad80665a86c99"},
    {"IProgressService", IProgressService::iid, "197f1b0a1444477f9365d3c6f0b5aca2"},
    {"IAlertService", IAlertService::iid, "37bdb6a165fb4994988604549461a2bb"},
    {"IFileSelector", IFileSelector::iid, "3a494fd79df24690bc74e831275e357d"},
    {"IFilePath", IFilePath::iid, "0af38ea140f24b14965bf97ca4ff94d1"},
    {"ITranslationService", ITranslationService::iid, "4363441641c14c3b85593de8aa53e652"},
    {"IActionManager", IActionManager::iid, "762f3f6111d1411592f97ac6f239460f"},
    {"IMenuRegistry", IMenuRegistry::iid, "a42a9119161e454798a26fb769140e24"},
    {"IWindowFactoryRegistry", IWindowFactoryRegistry::iid, "23f569f36ebe44d69c0364ce6908c3e8"},
    {"IHostInfo", IHostInfo::iid, "cc0b7716362b4ee589ee5f415458463f"},
    {"IViewManager", IViewManager::iid, "83424c65efd34800bd108c370499f9d4"},
    {"IObjectFactory", IObjectFactory::iid, "7ea3dda10790497797a48588c1b71185"},
    {"IThumbnailFactory", IThumbnailFactory::iid, "03ad35cd681a4f14bca22c095b030b36"},
    {"IAutomationPoint", IAutomationPoint::iid, "501b33ddb7174533b793e1408425375f"},
    {"IEnvelopeTrack", IEnvelopeTrack::iid, "3c4d78beb7f1425fb0ede9977b5e43fd"},
};

const Entry ModuleInterfaces[] = {
    {"IDependent", IDependent::iid, "f52b7aaede72416d8af18ace9dd7bd5e"},
    {"IProjectNotification", IProjectNotification::iid, "98f69ac5578d4a22b8e02781c06cff25"},
    {"IProjectStorageNotification", IProjectStorageNotification::iid, "d361d332604a4df783b17b91a35184db"},
    {"IProjectEditHook", IProjectEditHook::iid, "edc5af8faabd46e8b86839cfe14cab1f"},
    {"IIdleHandler", IIdleHandler::iid, "d70bbb58c80545b8ab8264180b673a84"},
    {"IEditStep", IEditStep::iid, "ac4023c375754b3cbf8170138cbd8c05"},
    {"IPluginBase", IPluginBase::iid, "22888ddb156e45ae8358b34808190625"},
    {"IActionHandler", IActionHandler::iid, "9fc17beb3a514077a25a7726d3d3d711"},
    {"IViewBuilder", IViewBuilder::iid, "53d29fe8ed00400b9e6d4dd80444b116"},
    {"IPlugController", IPlugController::iid, "0466b781a08611d5becc00a0c9a636bc"},
    {"IPlugWindowFactory", IPlugWindowFactory::iid, "89e3fcd331a04bc2918e8982b9ef41e4"},
    {"IPlugView", IPlugView::iid, "5bc32507d06049eaa6151b522b755b29"},
    {"IString", IString::iid, "f99db7a30fc14821800b0cf98e348edf"},
    {"IStringResult", IStringResult::iid, "550798bc872049db84920a153b50b7a8"},
    {"IPluginFactory", IPluginFactory::iid, "7a4d811c52114a1faed9d2ee0b43bf9f"},
    {"IPluginFactory2", IPluginFactory2::iid, "0007b650f24b4c0ba464edb9f00b2abb"},
    {"IPluginFactory3", IPluginFactory3::iid, "4555a2abc1234e579b12291036878931"},
};

const Entry Classes[] = {
    {"point marker", ClassId::PointMarker, "0499ab464c5f463d9baf00e704b52d35"},
    {"range marker", ClassId::RangeMarker, "b52fc642aa6f4d32afa27ce272c1f81b"},
    {"automation point", ClassId::AutomationPoint, "a17080f99f904198a6ed641a168e119e"},
    {"attribute list", ClassId::AttributeList, "fa1e32f9ca6d46f5a982f956b1191b58"},
    {"clip event", ClassId::ClipEvent, "ee190f09858b473bb1b4981bb7c9bd28"},
    {"file path", ClassId::FilePath, "0af38ea140f24b14965bf97ca4ff94d1"},
    {"object list", ClassId::ObjectList, "8e8562d867f54576817561cfc2b134e3"},
};

/// Whether the raw bytes are what the digits say, two by two.
bool hasBytes(const Identifier& identifier, std::string_view digits)
{
    if (digits.size() != 32)
        return false;
    uint8 raw[16];
    std::memcpy(raw, &identifier, sizeof raw);
    for (std::size_t index = 0; index < 16; ++index)
        if (raw[index] != std::stoi(std::string(digits.substr(2 * index, 2)), nullptr, 16))
            return false;
    return true;
}

} // namespace

TEST(Identifier, HasItsBytesInTheOrderOfTheText)
{
    constexpr Identifier identifier{"000102030405060708090A0b0c0D0e0F"};

    for (std::size_t index = 0; index < 16; ++index)
        EXPECT_EQ(identifier.bytes[index], index);
    EXPECT_EQ(Identifier{"ff00000000000000000000000000009A"}.bytes[0], 0xFF);
    EXPECT_EQ(Identifier{"ff00000000000000000000000000009A"}.bytes[15], 0x9A);
}

TEST(Identifier, IsNotMadeOfOtherTexts)
{
    char digits[] = "000102030405060708090A0B0C0D0E0F";
    EXPECT_NO_THROW(Identifier{digits});

    for (const std::size_t place : {0U, 15U, 31U}) {
        for (const char wrong : {'g', 'G', '/', ':', '@', '`', ' ', '\0'}) {
            char text[33];
            std::memcpy(text, digits, sizeof text);
            text[place] = wrong;
            EXPECT_THROW(Identifier{text}, std::invalid_argument) << place << wrong;
        }
    }
}

TEST(Identifier, DiffersInAnyByte)
{
    constexpr Identifier identifier{"000102030405060708090A0b0c0D0e0F"};

    for (std::size_t index = 0; index < Identifier::Size; ++index) {
        Identifier other = identifier;
        EXPECT_TRUE(other == identifier);
        other.bytes[index] = 0x80;
        EXPECT_FALSE(other == identifier) << index;
    }
}

TEST(Identifier, OfEachInterfaceOfTheHostIsTheAgreedOne)
{
    for (const Entry& entry : HostInterfaces)
        EXPECT_TRUE(hasBytes(entry.identifier, entry.digits)) << entry.name;
}

TEST(Identifier, OfEachInterfaceOfTheModuleIsTheAgreedOne)
{
    for (const Entry& entry : ModuleInterfaces)
        EXPECT_TRUE(hasBytes(entry.identifier, entry.digits)) << entry.name;
}

TEST(Identifier, OfEachCreatedClassIsTheAgreedOne)
{
    for (const Entry& entry : Classes)
        EXPECT_TRUE(hasBytes(entry.identifier, entry.digits)) << entry.name;
}

TEST(Identifier, NamesOneInterfaceOnly)
{
    std::set<std::string> texts{FUID(FObject::iid).toString()};

    for (const Entry& entry : HostInterfaces)
        EXPECT_TRUE(texts.insert(FUID(entry.identifier).toString()).second) << entry.name;
    for (const Entry& entry : ModuleInterfaces)
        EXPECT_TRUE(texts.insert(FUID(entry.identifier).toString()).second) << entry.name;
}

TEST(Identifier, OfWhatAnInterfaceExtendsIsNotTakenForItsOwn)
{
    EXPECT_TRUE(Identified<IProjectNode>);
    EXPECT_TRUE(Identified<IPluginFactory3>);
    EXPECT_FALSE(Identified<INodeIterator>);
    EXPECT_FALSE(Identified<ILocators>);
    EXPECT_FALSE(Identified<IMediaPool>);
    EXPECT_FALSE(Identified<IThumbnailImage>);
    EXPECT_FALSE(Identified<IHostWindow>);
    EXPECT_FALSE(Identified<IPlugFrame>);
    EXPECT_FALSE(Identified<ICloseWindowNotification>);
}
