// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/CPluginFactory.h"
#include "velmark/FieldText.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"

#include <cstdio>
#include <cstdlib>

// A module that refuses at one step, which its build names: entry, factory, class, object or initialisation. It writes
// what it is called for into the file that the environment names.

using namespace Velmark;

namespace {

void note(const char* call)
{
    if (FILE* const file = std::fopen(std::getenv("FAKE_MODULE_CALLS"), "a")) {
        std::fprintf(file, "%s\n", call);
        std::fclose(file);
    }
}

class Controller : public Implements<Controller, FObject, IPluginBase> {
public:
    static constexpr const char* ClassName = "Controller";

    ~Controller() override { note("object released"); }

    int32 initialize(FUnknown*) override
    {
        note("initialize");
        return FAKE_REFUSES == 5 ? ResultFalse : ResultOk;
    }
    int32 terminate() override
    {
        note("terminate");
        return ResultOk;
    }
};

FUnknown* makeController(void*)
{
    return FAKE_REFUSES == 4 ? nullptr : static_cast<FObject*>(new Controller);
}

} // namespace

#define EXPORT extern "C" __attribute__((visibility("default")))

EXPORT bool bundleEntry(void* bundle)
{
    note(static_cast<const char*>(bundle));
    return FAKE_REFUSES != 1;
}

EXPORT bool bundleExit()
{
    note("exit");
    return true;
}

EXPORT IPluginFactory* GetPluginFactory()
{
    if (FAKE_REFUSES == 2)
        return nullptr;
    auto factory = makeCounted<CPluginFactory>(PFactoryInfo());
    PClassInfo2 info;
    putText(std::string_view(FAKE_REFUSES == 3 ? "Effect" : "Service"), info.category);
    factory->registerClass(info, makeController, nullptr);
    return factory.detach();
}
