// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/DependencyManager.h"

#include "velmark/IDependent.h"

using namespace Velmark;

namespace standin {

namespace {

const FUnknown* identityOf(FUnknown* object)
{
    return query<FUnknown>(object).get();
}

} // namespace

int32 DependencyManager::addDependent(FUnknown* object, FObject* dependent)
{
    return object ? m_dependents[identityOf(object)].add(dependent) : ResultFalse;
}

int32 DependencyManager::removeDependent(FUnknown* object, FObject* dependent)
{
    const auto found = object ? m_dependents.find(identityOf(object)) : m_dependents.end();
    return found != m_dependents.end() ? found->second.remove(dependent) : ResultFalse;
}

void DependencyManager::tell(FUnknown& object)
{
    const auto keptAlive = Counted<FUnknown>::share(&object);
    const auto found = m_dependents.find(identityOf(&object));
    if (found == m_dependents.end())
        return;
    found->second.anyOf([&](FObject& dependent) {
        dependent.update(&object, UpdateMessage::Changed);
        return false;
    });
}

} // namespace standin
