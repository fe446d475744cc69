// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/CPluginFactory.h"

#include "velmark/FieldText.h"
#include "velmark/String.h"

#include <algorithm>
#include <new>
#include <string>
#include <type_traits>

namespace Velmark {

CPluginFactory* gPluginFactory = nullptr;

namespace {

/// The table grows by so many classes at a time.
constexpr std::size_t Growth = 10;

/// Copies a text from one record to another, and makes UTF-16 of it where the other has that.
template <std::size_t Size, class Unit>
void copyText(const char (&from)[Size], Unit (&to)[Size])
{
    if constexpr (std::is_same_v<Unit, char>)
        putText(textOf(from), to);
    else
        putText(std::u16string_view(ConstString(std::string(textOf(from)).c_str()).text16()), to);
}

void copyFirstFields(const PClassInfo2& from, auto& to)
{
    to.cid = from.cid;
    to.cardinality = from.cardinality;
    copyText(from.category, to.category);
    copyText(from.name, to.name);
}

void copyAllFields(const PClassInfo2& from, auto& to)
{
    copyFirstFields(from, to);
    to.classFlags = from.classFlags;
    copyText(from.subCategories, to.subCategories);
    copyText(from.vendor, to.vendor);
    copyText(from.version, to.version);
    copyText(from.sdkVersion, to.sdkVersion);
}

PFactoryInfo withCutTexts(const PFactoryInfo& from)
{
    PFactoryInfo info;
    copyText(from.vendor, info.vendor);
    copyText(from.url, info.url);
    copyText(from.email, info.email);
    info.flags = from.flags;
    return info;
}

} // namespace

CPluginFactory::CPluginFactory(const PFactoryInfo& info) : m_info(withCutTexts(info)) {}

CPluginFactory::~CPluginFactory()
{
    if (gPluginFactory == this)
        gPluginFactory = nullptr;
}

bool CPluginFactory::registerClass(const PClassInfo2& info, CreateFunction create, void* context) noexcept
{
    try {
        if (m_classes.size() == m_classes.capacity())
            m_classes.reserve(m_classes.size() + Growth);
        ClassEntry& entry = m_classes.emplace_back();
        copyAllFields(info, entry.info);
        entry.create = create;
        entry.context = context;
        return true;
    } catch (const std::bad_alloc&) {
        return false;
    }
}

int32 CPluginFactory::queryInterface(const Identifier& id, void** out)
{
    if (!out)
        return ResultNoInterface;
    *out = nullptr;
    if (id != FUnknown::iid && id != IPluginFactory::iid && id != IPluginFactory2::iid && id != IPluginFactory3::iid)
        return ResultNoInterface;
    // The four are one line of descent, so that they have one address.
    *out = static_cast<IPluginFactory3*>(this);
    addRef();
    return ResultOk;
}

int32 CPluginFactory::addRef()
{
    return m_refCount.fetch_add(1, std::memory_order_relaxed) + 1;
}

int32 CPluginFactory::release()
{
    const int32 count = m_refCount.fetch_sub(1, std::memory_order_acq_rel) - 1;
    if (count == 0)
        delete this;
    return count;
}

int32 CPluginFactory::getFactoryInfo(PFactoryInfo& info)
{
    info = m_info;
    return ResultOk;
}

int32 CPluginFactory::countClasses()
{
    return static_cast<int32>(m_classes.size());
}

int32 CPluginFactory::getClassInfo(int32 index, PClassInfo& info)
{
    const ClassEntry* const entry = at(index);
    if (!entry)
        return ResultFalse;
    copyFirstFields(entry->info, info);
    return ResultOk;
}

int32 CPluginFactory::getClassInfo2(int32 index, PClassInfo2& info)
{
    const ClassEntry* const entry = at(index);
    if (!entry)
        return ResultFalse;
    info = entry->info;
    return ResultOk;
}

int32 CPluginFactory::getClassInfoUnicode(int32 index, PClassInfoUnicode& info)
{
    const ClassEntry* const entry = at(index);
    if (!entry)
        return ResultFalse;
    try {
        PClassInfoUnicode wide;
        copyAllFields(entry->info, wide);
        info = wide;
        return ResultOk;
    } catch (const std::bad_alloc&) {
        return ResultFalse;
    }
}

int32 CPluginFactory::createInstance(const Identifier& classId, const Identifier& id, void** out)
{
    if (!out)
        return ResultFalse;
    *out = nullptr;
    const ClassEntry* const entry = find(classId);
    if (!entry)
        return ResultFalse;
    try {
        const auto object = Counted<FUnknown>::adopt(entry->create(entry->context));
        return object ? object->queryInterface(id, out) : ResultFalse;
    } catch (...) {
        // Whatever a constructor throws must not reach the host.
        return ResultFalse;
    }
}

int32 CPluginFactory::setHostContext(FUnknown* context)
{
    m_hostContext = Counted<FUnknown>::share(context);
    return ResultOk;
}

const CPluginFactory::ClassEntry* CPluginFactory::at(int32 index) const
{
    return index >= 0 && index < static_cast<int32>(m_classes.size()) ? &m_classes[static_cast<std::size_t>(index)]
                                                                      : nullptr;
}

const CPluginFactory::ClassEntry* CPluginFactory::find(const Identifier& classId) const
{
    const auto entry = std::ranges::find(m_classes, classId, [](const ClassEntry& each) { return each.info.cid; });
    return entry == m_classes.end() ? nullptr : &*entry;
}

} // namespace Velmark
