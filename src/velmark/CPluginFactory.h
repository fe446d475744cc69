// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/PluginFactory.h"

#include <atomic>
#include <vector>

namespace Velmark {

/// The factory of a module: a table of classes, each with the function that makes an object of it. It is born with one
/// reference. While it lives, gPluginFactory may point to it.
class CPluginFactory final : public IPluginFactory3 {
public:
    /// Makes an object with one reference, which belongs to the caller. Null or an exception when it can't be made.
    using CreateFunction = FUnknown* (*)(void* context);

    explicit CPluginFactory(const PFactoryInfo& info);
    CPluginFactory(const CPluginFactory&) = delete;
    CPluginFactory& operator=(const CPluginFactory&) = delete;

    /// Adds a class at the end of the table. False when there is no memory for it. `context` is handed to `create`.
    bool registerClass(const PClassInfo2& info, CreateFunction create, void* context) noexcept;

    int32 queryInterface(const Identifier& id, void** out) override;
    int32 addRef() override;
    int32 release() override;
    int32 getFactoryInfo(PFactoryInfo& info) override;
    int32 countClasses() override;
    int32 getClassInfo(int32 index, PClassInfo& info) override;
    int32 createInstance(const Identifier& classId, const Identifier& id, void** out) override;
    int32 getClassInfo2(int32 index, PClassInfo2& info) override;
    int32 getClassInfoUnicode(int32 index, PClassInfoUnicode& info) override;
    int32 setHostContext(FUnknown* context) override;

    /// Takes itself out of gPluginFactory.
    virtual ~CPluginFactory();

private:
    struct ClassEntry {
        PClassInfo2 info;
        CreateFunction create;
        void* context;
    };

    /// Null where there is no class.
    const ClassEntry* at(int32 index) const;
    const ClassEntry* find(const Identifier& classId) const;

    std::atomic<int32> m_refCount{1};
    PFactoryInfo m_info;
    std::vector<ClassEntry> m_classes;
    Counted<FUnknown> m_hostContext;
};

/// The factory of this module, or null. It isn't counted.
extern CPluginFactory* gPluginFactory;

} // namespace Velmark
