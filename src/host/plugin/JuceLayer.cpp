// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/JuceLayer.h"

#include "host/plugin/XConnection.h"
#include "host/plugin/XErrors.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <juce_events/native/juce_linux_EventLoopInternal.h>

#include <memory>

namespace cadrel::host {

namespace {

struct Layer {
    XErrors errors;
    juce::ScopedJuceInitialiser_GUI initialiser;
};

std::unique_ptr<Layer> layer;
int users = 0;
bool isServing = false;

} // namespace

JuceLayer::JuceLayer()
{
    if (users == 0) {
        // JUCE takes for granted that these names are known, as they are where there is a window manager. It would send none
        // in their place, which the server answers with an error.
        if (const XConnection connection; connection.isOpen())
            connection.introduceNames();
        layer = std::make_unique<Layer>();
        juce::Desktop::getInstance().setGlobalScaleFactor(static_cast<float>(screenScale()));
    }
    ++users;
}

JuceLayer::~JuceLayer()
{
    if (--users == 0)
        layer.reset();
}

bool JuceLayer::serve()
{
    if (isServing || users == 0)
        return false;
    const juce::ScopedValueSetter<bool> serving(isServing, true);
    // A component may end the layer in its call, with all descriptors.
    const JuceLayer held;
    for (const int descriptor : juce::LinuxEventLoopInternal::getRegisteredFds())
        juce::LinuxEventLoopInternal::invokeEventLoopCallbackForFd(descriptor);
    return true;
}

double JuceLayer::screenScale()
{
    const XConnection connection;
    return connection.isOpen() ? connection.screenScale() : 1.0;
}

} // namespace cadrel::host
