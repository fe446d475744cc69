// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

#include <cstddef>

namespace Velmark {

class IActionHandler;
class ICloseWindowNotification;
class IFilePath;
class IObjectList;
class IPlugWindowFactory;
class IViewBuilder;

/// Where the module's resources are: the handle that the host gave when it loaded the module. Opaque.
using BundleHandle = void*;

/// Alert boxes.
class IAlertService : public FUnknown {
public:
    static constexpr InterfaceId<IAlertService> iid{"37bdb6a165fb4994988604549461a2bb"};

    /// Waits for the user and answers which button was used, counted from 1. A null label leaves the button out; without
    /// any there is the host's default button. Return uses button1, and Escape the last button; where button1 is left out and
    /// another isn't, Return uses the last one, too. UTF-16.
    virtual int32 show(const char16_t* message, const char16_t* button1, const char16_t* button2,
                       const char16_t* button3) = 0;
};

/// The progress window of one operation.
class IProgressService : public FUnknown {
public:
    static constexpr InterfaceId<IProgressService> iid{"197f1b0a1444477f9365d3c6f0b5aca2"};

    /// The mode of begin: the user waits for the end.
    static constexpr int32 Modal = 1;

    /// `cancelled` is set once the user cancels; it has to outlive end(). Null leaves out the cancel button. Nothing is
    /// seen before show().
    virtual int32 begin(int32 mode, const char16_t* title, bool* cancelled) = 0;
    /// A second line below the text; null for none.
    virtual int32 setStatus(const char16_t* text) = 0;
    /// A stage of so many steps begins, at position 0.
    virtual int32 setRange(uint64 total) = 0;
    virtual int32 setPosition(uint64 value) = 0;
    virtual int32 setText(const char16_t* text) = 0;
    /// Moves on by so many steps.
    virtual int32 tick(uint64 steps) = 0;
    virtual int32 show() = 0;
    virtual int32 end() = 0;
};

/// One filter of a file box.
struct FileType {
    /// Without the dot. Both UTF-8, zero-ended, the rest of the field zero.
    char extension[8] = {};
    char description[64] = {};
};

static_assert(sizeof(FileType) == 72);
static_assert(offsetof(FileType, extension) == 0 && sizeof(FileType::extension) == 8);
static_assert(offsetof(FileType, description) == 8 && sizeof(FileType::description) == 64);

/// File boxes.
class IFileSelector : public FUnknown {
public:
    static constexpr InterfaceId<IFileSelector> iid{"3a494fd79df24690bc74e831275e357d"};

    /// The flags of select.
    static constexpr int32 Open = 0;
    static constexpr int32 Save = 4;
    /// What select answers when the user cancelled.
    static constexpr int32 Cancelled = 1;

    /// Waits for the user; the box opens in the folder `path`. The chosen files are added to `chosen` as IFilePath objects.
    /// The number of filters is passed twice, both times the same; without any, every file can be chosen. 0, Cancelled, or
    /// 2 or above for a failure.
    virtual int32 select(const char16_t* title, const FileType* filters, int32 filterCount, int32 sameCount,
                         IFilePath* path, int32 flags, IObjectList* chosen) = 0;
};

/// Texts in the user's language.
class ITranslationService : public FUnknown {
public:
    static constexpr InterfaceId<ITranslationService> iid{"4363441641c14c3b85593de8aa53e652"};

    /// Adds a table from the module's resources. The domain is a name for its texts.
    virtual int32 addTable(BundleHandle bundle, const char* file, const char* domain) = 0;
    /// The text of the tables, as long as they are there; `text` itself when they haven't got it. UTF-16.
    virtual const char16_t* translate(const char16_t* text) = 0;
};

/// Named actions, of the host and of modules.
class IActionManager : public FUnknown {
public:
    static constexpr InterfaceId<IActionManager> iid{"762f3f6111d1411592f97ac6f239460f"};

    /// The host's own actions on the undo list of the active project. They work while idle calls are blocked, and fail
    /// while a transaction is open.
    static constexpr const char* EditCategory = "Edit";
    static constexpr const char* Undo = "Undo";
    static constexpr const char* Redo = "Redo";

    /// The handler isn't counted: remove it before you delete it.
    virtual int32 addHandler(IActionHandler* handler) = 0;
    virtual int32 removeHandler(IActionHandler* handler) = 0;
    /// 0 when somebody carried the action out. `reserved` is 0.
    virtual int32 invoke(const char* category, const char* action, int32 reserved) = 0;
};

/// The host's menus.
class IMenuRegistry : public FUnknown {
public:
    static constexpr InterfaceId<IMenuRegistry> iid{"a42a9119161e454798a26fb769140e24"};

    /// The flags of a command that a module enters.
    static constexpr int32 ModuleCommand = 4;

    /// Enters an item that invokes the action. The title is UTF-16, all else UTF-8.
    virtual int32 addCommand(BundleHandle bundle, const char* menu, const char16_t* title, int32 flags,
                             const char* category, const char* action) = 0;
    /// Removes all that were entered with this handle.
    virtual int32 removeCommands(BundleHandle bundle) = 0;
};

/// The windows that modules can open, for whatever the host does with windows by name.
class IWindowFactoryRegistry : public FUnknown {
public:
    static constexpr InterfaceId<IWindowFactoryRegistry> iid{"23f569f36ebe44d69c0364ce6908c3e8"};

    /// The factory isn't counted: remove it before you delete it.
    virtual int32 addFactory(IPlugWindowFactory* factory) = 0;
    virtual int32 removeFactory(IPlugWindowFactory* factory) = 0;
};

/// A window of the host. It has no identifier. While it is open, until windowClosed has been called, the host holds a
/// reference of its own.
class IHostWindow : public FUnknown {
public:
    virtual int32 open() = 0;
    /// One listener, not counted; null takes it away.
    virtual int32 setCloseNotification(ICloseWindowNotification* listener) = 0;
    /// Brings the window to the front, or closes it.
    virtual int32 show(bool visible) = 0;
};

/// Makes windows.
class IViewManager : public FUnknown {
public:
    static constexpr InterfaceId<IViewManager> iid{"83424c65efd34800bd108c370499f9d4"};

    /// Reads a description of windows from the module's resources.
    virtual int32 loadSkin(BundleHandle bundle, const char* file) = 0;
    /// A window that the skin describes; the builder is asked for its view. Counted; null for an unknown name.
    virtual int32 openWindow(const char* name, IViewBuilder* builder, IHostWindow** window) = 0;
};

} // namespace Velmark
