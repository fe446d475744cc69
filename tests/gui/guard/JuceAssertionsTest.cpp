// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/Sanitizer.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

/// What JUCE logs while it lives.
class Log : public juce::Logger {
public:
    Log() { setCurrentLogger(this); }
    ~Log() override { setCurrentLogger(nullptr); }

    juce::String text;

private:
    void logMessage(const juce::String& message) override { text += message; }
};

} // namespace

// The words are those that fail a test of CTest.
TEST(JuceAssertions, AreLoggedUnderTheSanitizers)
{
    juce::ScopedJuceInitialiser_GUI juce;
    Log log;
    juce::Component opaque;
    opaque.setOpaque(true);
    opaque.setSize(10, 10);
    opaque.createComponentSnapshot({10, 10});

    EXPECT_EQ(log.text.startsWith("JUCE Assertion failure"), CADREL_ADDRESS_SANITIZER != 0);
}

} // namespace cadrel::tests
