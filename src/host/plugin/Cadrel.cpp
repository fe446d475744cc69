// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/Cadrel.h"

#include "core/notify/ChangeContext.h"
#include "core/time/Timecode.h"
#include "gui/main/MainGui.h"
#include "host/Host.h"
#include "host/border/HostFailure.h"
#include "host/picture/VideoProvider.h"
#include "util/HostString.h"
#include "util/StringUtil.h"
#include "velmark/Context.h"
#include "velmark/ModuleState.h"

#include <cstring>
#include <memory>
#include <utility>

namespace cadrel::host {

using namespace Velmark;
using util::Result;

namespace {

constexpr const char* MenuName = "Project";
constexpr const char* ActionCategory = "Cadrel";
constexpr const char* ActionName = "ShowDialog";
constexpr const char* TranslationDomain = "Cadrel";
constexpr const char* TranslationFile = "translation.xml";
constexpr const char* SkinFile = "skin.xml";
constexpr const char* WindowName = "CadrelWindow";
constexpr const wchar_t* MenuTitle = L"Cadrel";

bool isEqual(const char* text, const char* expected)
{
    return text && std::strcmp(text, expected) == 0;
}

/// The answer of a call that may throw.
template <class Call>
int32 guarded(Call call)
{
    int32 answer = ResultOk;
    const Result::Type thrown = resultOf([&] { answer = call(); });
    return thrown == Result::Ok ? answer : thrown;
}

BundleHandle bundle()
{
    return ModuleState::get().moduleHandle();
}

} // namespace

Cadrel::Cadrel() = default;

Cadrel::~Cadrel()
{
    terminate();
}

int32 Cadrel::initialize(FUnknown* context)
{
    const auto hostContext = query<IHostContext>(context);
    const auto info = query<IHostInfo>(context);
    if (m_context || !hostContext || !info || !isEqual(info->getName(), HostName))
        return ResultFalse;
    const bool hadHost = m_host != nullptr;
    const Result::Type result = resultOf([&] { registerWithHost(*hostContext); });
    if (result == Result::Ok) {
        m_context = hostContext;
        return ResultOk;
    }
    m_registration.run();
    if (!hadHost) {
        m_host.reset();
        m_video.reset();
    }
    m_layer.reset();
    return result;
}

void Cadrel::registerWithHost(IHostContext& context)
{
    m_layer.emplace();
    if (!m_host) {
        const auto video = std::make_shared<VideoProvider>(&context);
        m_host = makeCounted<Host>(&context, video);
        m_video = video;
    }
    if (const auto menus = service<IMenuRegistry>(&context)) {
        const util::HostString title(util::StringUtil::translate(MenuTitle));
        requireOk(menus->addCommand(bundle(), MenuName, title.utf16(), IMenuRegistry::ModuleCommand, ActionCategory,
                                    ActionName));
        m_registration.add([menus] { menus->removeCommands(bundle()); });
    }
    if (const auto actions = service<IActionManager>(&context)) {
        requireOk(actions->addHandler(this));
        m_registration.add([this, actions] { actions->removeHandler(this); });
    }
    // Without the table the texts stay as they are.
    if (const auto translations = service<ITranslationService>(&context))
        translations->addTable(bundle(), TranslationFile, TranslationDomain);
    if (const auto factories = service<IWindowFactoryRegistry>(&context)) {
        requireOk(factories->addFactory(this));
        m_registration.add([this, factories] { factories->removeFactory(this); });
    }
}

int32 Cadrel::terminate()
{
    if (!m_context)
        return ResultOk;
    resultOf([&] { closeWindow(); });
    disposeView();
    m_layer.reset();
    m_registration.run();
    m_viewManager.reset();
    m_context.reset();
    return ResultOk;
}

int32 Cadrel::handleAction(const char* category, const char* action, bool show)
{
    if (!isEqual(category, ActionCategory) || !isEqual(action, ActionName))
        return ResultFalse;
    return guarded([&] { return showDialog(show); });
}

int32 Cadrel::showDialog(bool show)
{
    if (!show)
        return ResultOk;
    return m_window ? m_window->show(true) : openWindow();
}

int32 Cadrel::openWindow()
{
    if (!m_context)
        return Result::HostObjectMissing;
    if (!m_viewManager)
        m_viewManager = service<IViewManager>(m_context);
    if (!m_viewManager || m_viewManager->loadSkin(bundle(), SkinFile) != ResultOk)
        return ResultFalse;
    dropUnusedView();
    const bool hadView = m_view != nullptr;
    Counted<IHostWindow> window;
    if (m_viewManager->openWindow(WindowName, this, window.out()) != ResultOk || !window) {
        if (!hadView)
            disposeView();
        return Result::HostObjectMissing;
    }
    m_window = window.get();
    window->setCloseNotification(this);
    if (const int32 result = guarded([&] { return window->open(); }); result != ResultOk) {
        window->setCloseNotification(nullptr);
        m_window = nullptr;
        disposeView();
        return result;
    }
    return ResultOk;
}

void Cadrel::closeWindow()
{
    if (!m_window)
        return;
    // The host may end the window in this call.
    const auto held = Counted<IHostWindow>::share(m_window);
    resultOf([&] { held->show(false); });
    if (std::exchange(m_window, nullptr))
        held->setCloseNotification(nullptr);
}

void Cadrel::disposeView() noexcept
{
    if (m_view)
        m_view->dispose();
    m_view.reset();
}

void Cadrel::dropUnusedView()
{
    if (m_view && m_view->refCount() == 1)
        disposeView();
}

int32 Cadrel::createView(const char* name, FUnknown* /*parent*/, IPlugView** view)
{
    if (!view)
        return Result::HostObjectMissing;
    *view = nullptr;
    dropUnusedView();
    if (!m_context || m_view || !isEqual(name, WindowName))
        return Result::HostObjectMissing;
    return resultOf([&] {
        auto content = std::make_unique<gui::MainGui>();
        content->setEngine(m_host.get());
        content->setNotifier(m_host.get());
        content->setVideoSource(m_video);
        content->onChange(core::DataModelChangeContext(m_host->getProjectModel()));
        gui::MainGui& window = *content;
        m_view = makeCounted<JuceGuiAdapter>(std::move(content), m_context.get(), Counted<FObject>(m_host));
        m_view->setChangeSelector([&window, &host = *m_host](double source, double destination) {
            const auto clock = [&host](double time) {
                core::Timecode timecode;
                timecode.setSeconds(host.getTimeOrigin() + time);
                return timecode;
            };
            return window.selectChange(clock(source), clock(destination));
        });
        *view = Counted<JuceGuiAdapter>(m_view).detach();
    });
}

int32 Cadrel::windowClosed(IHostWindow* window)
{
    if (window && window == m_window) {
        m_window = nullptr;
        disposeView();
    }
    return ResultOk;
}

const char* Cadrel::getWindowName()
{
    return WindowName;
}

bool Cadrel::hasWindow(IHostWindow* window)
{
    return window && window == m_window;
}

IHostWindow* Cadrel::getWindow()
{
    if (!m_window)
        guarded([&] { return openWindow(); });
    return m_window;
}

} // namespace cadrel::host
