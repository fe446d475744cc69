// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::core {

class ChangeContext;

/// Is told of changes. A listener removes itself from its notifiers before it dies.
class ChangeContextListenerInterface {
public:
    virtual ~ChangeContextListenerInterface() = default;

    /// Called synchronously on the thread that made the change. Must not add or remove listeners of the notifier that
    /// calls it.
    virtual void onChange(const ChangeContext& context) = 0;
};

} // namespace cadrel::core
