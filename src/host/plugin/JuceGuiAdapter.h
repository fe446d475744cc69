// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/plugin/JuceLayer.h"
#include "host/plugin/UnusedKeys.h"
#include "velmark/CPluginView.h"
#include "velmark/ChangeView.h"
#include "velmark/FObject.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <functional>
#include <memory>
#include <optional>
#include <utility>

namespace Velmark {
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

/// A view of the host that shows a JUCE component. The rectangles of the host are physical pixels; those of the content are
/// JUCE's, of which each is as many physical ones as the screen's scale says.
///
///     window of the host > our X window (JUCE's) > this component > the content
///
/// The content never gets less room than MinimumWidth x MinimumHeight; a smaller window shows it smaller.
class JuceGuiAdapter final : public Velmark::Implements<JuceGuiAdapter, Velmark::CPluginView, Velmark::IChangeView>,
                             private JuceLayer,
                             public juce::Component {
public:
    static constexpr const char* ClassName = "JuceGuiAdapter";
    static constexpr int MinimumWidth = 1300;
    static constexpr int MinimumHeight = 750;

    /// Of the minimum size. `engine` is what the content works on: it is kept until the content has gone, and may be null.
    /// The context is asked for the actions of the host, and outlives the content.
    JuceGuiAdapter(std::unique_ptr<juce::Component> content, Velmark::IHostContext* context,
                   Velmark::Counted<Velmark::FObject> engine);
    ~JuceGuiAdapter() override;

    /// What selectChange does with its times; without it, it does nothing. It goes with the content.
    using ChangeSelector = std::function<bool(double source, double destination)>;
    void setChangeSelector(ChangeSelector selector) { m_selectChange = std::move(selector); }

    /// Takes the content away for good, with its window; what the host calls afterwards does nothing.
    void dispose() noexcept;

    /// Takes a parent of the kind ParentType::X11Window, one at a time.
    Velmark::int32 attached(void* parent, const char* type) override;
    /// Does nothing when the view isn't attached.
    Velmark::int32 removed() override;
    /// Has to come about every 15 ms, also while a box of the host is open: nothing moves without it.
    Velmark::int32 idle() override;
    Velmark::int32 onWheel(float distance) override;
    Velmark::int32 onKeyDown(char16_t key, Velmark::int32 virtualKey, Velmark::int32 modifiers) override;
    Velmark::int32 onKeyUp(char16_t key, Velmark::int32 virtualKey, Velmark::int32 modifiers) override;
    Velmark::int32 onSize(const Velmark::ViewRect& rect) override;
    /// True takes the keyboard.
    Velmark::int32 onFocus(bool state) override;
    /// Makes it at least the minimum size, or the screen's where that is smaller.
    Velmark::int32 checkSizeConstraint(Velmark::ViewRect& rect) override;
    Velmark::int32 isPlatformTypeSupported(const char* type) override;
    Velmark::int32 selectChange(double source, double destination) override;

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    void childBoundsChanged(juce::Component* child) override;
    /// What no component has used: undo and redo are the host's actions, Tab moves the keyboard, and the rest goes on to the
    /// host's window.
    bool keyPressed(const juce::KeyPress& key) override;
    /// Of the content's components, too.
    void mouseDown(const juce::MouseEvent& event) override;
    void focusOfChildComponentChanged(FocusChangeType cause) override;

private:
    static double scale();
    Velmark::ViewRect rectOf(juce::Rectangle<int> size) const;
    /// The same, but not larger than the screen.
    Velmark::ViewRect rectOnScreen(juce::Rectangle<int> size) const;
    void attachTo(void* parent);
    void askForSize();
    void leaveDesktop() noexcept;
    void layOutContent();
    void endPassingOver();
    bool invokeEditAction(const char* action);

    std::unique_ptr<juce::Component> m_content; ///< null after its end
    ChangeSelector m_selectChange;
    Velmark::IHostContext* m_context;
    Velmark::Counted<Velmark::FObject> m_engine;
    std::optional<UnusedKeys> m_unusedKeys; ///< while it is attached
    bool m_isLayingOut = false;
    bool m_keyIsFromHost = false;                               ///< so it needn't be sent back
    bool m_hasLostKeyboard = false;                             ///< since the last click
    juce::Component::SafePointer<juce::Component> m_passedOver; ///< doesn't get the keyboard until JUCE has been served
};

} // namespace cadrel::host
