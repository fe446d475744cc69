// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

#include <cstddef>

// The texts of these records are zero-ended; one that fills its field is cut, and the rest of a field is zero.

namespace Velmark {

/// Who made a module.
struct PFactoryInfo {
    struct Flag {
        /// Texts can be had in UTF-16.
        static constexpr int32 Unicode = 16;
    };

    char vendor[64] = {};
    char url[256] = {};
    char email[128] = {};
    int32 flags = 0;
};

static_assert(sizeof(PFactoryInfo) == 452);
static_assert(offsetof(PFactoryInfo, vendor) == 0 && sizeof(PFactoryInfo::vendor) == 64);
static_assert(offsetof(PFactoryInfo, url) == 64 && sizeof(PFactoryInfo::url) == 256);
static_assert(offsetof(PFactoryInfo, email) == 320 && sizeof(PFactoryInfo::email) == 128);
static_assert(offsetof(PFactoryInfo, flags) == 448 && sizeof(PFactoryInfo::flags) == 4);

/// A class of a module: the first fields of PClassInfo2.
struct PClassInfo {
    Identifier cid;
    int32 cardinality = 0;
    char category[32] = {};
    char name[64] = {};
};

static_assert(sizeof(PClassInfo) == 116);
static_assert(offsetof(PClassInfo, cid) == 0 && sizeof(PClassInfo::cid) == 16);
static_assert(offsetof(PClassInfo, cardinality) == 16 && sizeof(PClassInfo::cardinality) == 4);
static_assert(offsetof(PClassInfo, category) == 20 && sizeof(PClassInfo::category) == 32);
static_assert(offsetof(PClassInfo, name) == 52 && sizeof(PClassInfo::name) == 64);

/// A class of a module, in UTF-8.
struct PClassInfo2 {
    Identifier cid;
    /// 1: the host needs one object of it at most.
    int32 cardinality = 0;
    char category[32] = {};
    char name[64] = {};
    uint32 classFlags = 0;
    char subCategories[128] = {};
    /// Empty when the factory's counts.
    char vendor[64] = {};
    char version[64] = {};
    char sdkVersion[64] = {};
};

static_assert(sizeof(PClassInfo2) == 440);
static_assert(offsetof(PClassInfo2, cid) == 0 && sizeof(PClassInfo2::cid) == 16);
static_assert(offsetof(PClassInfo2, cardinality) == 16 && sizeof(PClassInfo2::cardinality) == 4);
static_assert(offsetof(PClassInfo2, category) == 20 && sizeof(PClassInfo2::category) == 32);
static_assert(offsetof(PClassInfo2, name) == 52 && sizeof(PClassInfo2::name) == 64);
static_assert(offsetof(PClassInfo2, classFlags) == 116 && sizeof(PClassInfo2::classFlags) == 4);
static_assert(offsetof(PClassInfo2, subCategories) == 120 && sizeof(PClassInfo2::subCategories) == 128);
static_assert(offsetof(PClassInfo2, vendor) == 248 && sizeof(PClassInfo2::vendor) == 64);
static_assert(offsetof(PClassInfo2, version) == 312 && sizeof(PClassInfo2::version) == 64);
static_assert(offsetof(PClassInfo2, sdkVersion) == 376 && sizeof(PClassInfo2::sdkVersion) == 64);

/// The same with its texts in UTF-16.
struct PClassInfoUnicode {
    Identifier cid;
    int32 cardinality = 0;
    char16_t category[32] = {};
    char16_t name[64] = {};
    uint32 classFlags = 0;
    char16_t subCategories[128] = {};
    char16_t vendor[64] = {};
    char16_t version[64] = {};
    char16_t sdkVersion[64] = {};
};

static_assert(sizeof(PClassInfoUnicode) == 856);
static_assert(offsetof(PClassInfoUnicode, cid) == 0 && sizeof(PClassInfoUnicode::cid) == 16);
static_assert(offsetof(PClassInfoUnicode, cardinality) == 16 && sizeof(PClassInfoUnicode::cardinality) == 4);
static_assert(offsetof(PClassInfoUnicode, category) == 20 && sizeof(PClassInfoUnicode::category) == 64);
static_assert(offsetof(PClassInfoUnicode, name) == 84 && sizeof(PClassInfoUnicode::name) == 128);
static_assert(offsetof(PClassInfoUnicode, classFlags) == 212 && sizeof(PClassInfoUnicode::classFlags) == 4);
static_assert(offsetof(PClassInfoUnicode, subCategories) == 216 && sizeof(PClassInfoUnicode::subCategories) == 256);
static_assert(offsetof(PClassInfoUnicode, vendor) == 472 && sizeof(PClassInfoUnicode::vendor) == 128);
static_assert(offsetof(PClassInfoUnicode, version) == 600 && sizeof(PClassInfoUnicode::version) == 128);
static_assert(offsetof(PClassInfoUnicode, sdkVersion) == 728 && sizeof(PClassInfoUnicode::sdkVersion) == 128);

/// What a module gives the host first: who made it, and its classes.
class IPluginFactory : public FUnknown {
public:
    static constexpr InterfaceId<IPluginFactory> iid{"7a4d811c52114a1faed9d2ee0b43bf9f"};

    virtual int32 getFactoryInfo(PFactoryInfo& info) = 0;
    virtual int32 countClasses() = 0;
    /// Nonzero at an index that isn't there.
    virtual int32 getClassInfo(int32 index, PClassInfo& info) = 0;
    /// The interface `id` of a new object of the class; counted. Nonzero, and null in `out`, for a class that isn't there
    /// or an interface that it hasn't got.
    virtual int32 createInstance(const Identifier& classId, const Identifier& id, void** out) = 0;
};

class IPluginFactory2 : public IPluginFactory {
public:
    static constexpr InterfaceId<IPluginFactory2> iid{"0007b650f24b4c0ba464edb9f00b2abb"};

    virtual int32 getClassInfo2(int32 index, PClassInfo2& info) = 0;
};

class IPluginFactory3 : public IPluginFactory2 {
public:
    static constexpr InterfaceId<IPluginFactory3> iid{"4555a2abc1234e579b12291036878931"};

    virtual int32 getClassInfoUnicode(int32 index, PClassInfoUnicode& info) = 0;
    /// The factory keeps a reference; null takes the context away.
    virtual int32 setHostContext(FUnknown* context) = 0;
};

} // namespace Velmark
