// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

// What the module implements and the host calls, always on the main thread. Objects that come in as arguments are
// borrowed for the call. No exception may leave an operation.

namespace Velmark {

class IEditTransaction;
class IHostWindow;
class IPlugView;
class IProjectDocument;

/// Is told when projects are opened, activated and closed: IProjectManager::addNotification. The results don't count.
class IProjectNotification : public FUnknown {
public:
    static constexpr InterfaceId<IProjectNotification> iid{"98f69ac5578d4a22b8e02781c06cff25"};

    virtual int32 projectActivated(IProjectDocument* project) = 0;
    /// No project is active any more: this one is about to close, or another to be activated.
    virtual int32 projectDeactivated(IProjectDocument* project) = 0;
    /// It was created or loaded, and isn't active yet.
    virtual int32 projectOpened(IProjectDocument* project) = 0;
    /// The last call in which it can be used. Nothing is saved from here. `reserved` is 0.
    virtual int32 projectClosing(IProjectDocument* project, int32 reserved) = 0;
    virtual int32 projectRenamed(IProjectDocument* project) = 0;
};

/// Told of saves: IProjectDocument::addStorageNotification.
class IProjectStorageNotification : public FUnknown {
public:
    static constexpr InterfaceId<IProjectStorageNotification> iid{"d361d332604a4df783b17b91a35184db"};

    /// The project is about to be written: what is to be stored with it becomes its attributes now. The save goes on
    /// whatever the result.
    virtual int32 projectStoring(IProjectDocument* project) = 0;
};

/// Is called at the end of a transaction and can add edits to it. Added with IProjectManager::addNotification.
class IProjectEditHook : public FUnknown {
public:
    static constexpr InterfaceId<IProjectEditHook> iid{"edc5af8faabd46e8b86839cfe14cab1f"};

    /// A transaction is about to become an entry of the undo list. Edits made through it here belong to that entry; it is
    /// neither begun nor committed here. Change flags can be read.
    virtual int32 projectEdited(IProjectDocument* project, IEditTransaction* transaction) = 0;
};

/// Called while the user does nothing: IIdleManager::addIdleHandler.
class IIdleHandler : public FUnknown {
public:
    static constexpr InterfaceId<IIdleHandler> iid{"d70bbb58c80545b8ab8264180b673a84"};

    virtual int32 onIdle() = 0;
};

/// A step of the module's own in the host's undo list: IEditTransaction::addStep. undo() and redo() are called by turns,
/// beginning with undo().
class IEditStep : public FUnknown {
public:
    static constexpr InterfaceId<IEditStep> iid{"ac4023c375754b3cbf8170138cbd8c05"};

    virtual int32 execute() = 0;
    virtual int32 undo() = 0;
    virtual int32 redo() = 0;
    /// UTF-16; null for a step that is only seen as part of its entry.
    virtual const char16_t* getDescription() = 0;
};

/// The life of a module's object: it is created through the factory, initialised, terminated and released.
class IPluginBase : public FUnknown {
public:
    static constexpr InterfaceId<IPluginBase> iid{"22888ddb156e45ae8358b34808190625"};

    /// `context` is an IHostContext. Nonzero when the module can't work in this host; it is then
    /// released without terminate().
    virtual int32 initialize(FUnknown* context) = 0;
    virtual int32 terminate() = 0;
};

/// Carries out named actions: IActionManager::addHandler.
class IActionHandler : public FUnknown {
public:
    static constexpr InterfaceId<IActionHandler> iid{"9fc17beb3a514077a25a7726d3d3d711"};

    /// Nonzero for an action that isn't the handler's. With `show` false nothing is carried out: the host only asks
    /// whether it could be.
    virtual int32 handleAction(const char* category, const char* action, bool show) = 0;
};

/// Fills a window of the host: IViewManager::openWindow.
class IViewBuilder : public FUnknown {
public:
    static constexpr InterfaceId<IViewBuilder> iid{"53d29fe8ed00400b9e6d4dd80444b116"};

    /// The view of the window of that name; counted. `parent` is what the view will lie in, or null.
    virtual int32 createView(const char* name, FUnknown* parent, IPlugView** view) = 0;
};

/// Says that an object is the controller of a module. It has no operations of its own.
class IPlugController : public FUnknown {
public:
    static constexpr InterfaceId<IPlugController> iid{"0466b781a08611d5becc00a0c9a636bc"};
};

/// Told that a window has gone: IHostWindow::setCloseNotification. It has no identifier.
class ICloseWindowNotification : public FUnknown {
public:
    virtual int32 windowClosed(IHostWindow* window) = 0;
};

/// A module's window, for the host's lists: IWindowFactoryRegistry::addFactory.
class IPlugWindowFactory : public FUnknown {
public:
    static constexpr InterfaceId<IPlugWindowFactory> iid{"89e3fcd331a04bc2918e8982b9ef41e4"};

    virtual const char* getWindowName() = 0;
    /// Whether this is the factory's window.
    virtual bool hasWindow(IHostWindow* window) = 0;
    /// Opens the window if it isn't; borrowed, and null when it can't be opened.
    virtual IHostWindow* getWindow() = 0;
};

} // namespace Velmark
