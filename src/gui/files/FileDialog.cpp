// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/FileDialog.h"

#include "core/model/DataModel.h"
#include "gui/files/EdlFolder.h"
#include "gui/files/EdlTaking.h"
#include "gui/files/FilePaths.h"
#include "gui/files/TakenFiles.h"
#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/Text.h"
#include "gui/services/FileBrowserDialogBase.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <optional>
#include <utility>

namespace cadrel::gui {

using core::ListKind;
using core::ListSide;
using core::Timecode;
using util::StringUtil;

namespace {

constexpr int TitleFont = 13;
constexpr int TextFont = 12;
constexpr int RowHeight = 24;
const juce::Colour HintColour(0xff2e352f);
constexpr const char* ZeroTimecode = "00:00:00:00";

EdlOffset offsetIn(const TcInput& input)
{
    return {input.getValue(), input.isPositive()};
}

std::wstring titleFor(std::int32_t listType)
{
    switch (listType) {
    case ListKind::Old:
        return L"Add EDL to Old List";
    case ListKind::New:
        return L"Add EDL to New List";
    default:
        return L"Add EDL to Change EDL List";
    }
}

} // namespace

FileDialog::Side::Side(ListSide listSide, const char* prefix, const std::wstring& offsetText)
    : side(listSide), inLabel(juce::String(prefix) + " In Label", L"IN", TextFont),
      outLabel(juce::String(prefix) + " Out Label", L"OUT", TextFont),
      offsetLabel(juce::String(prefix) + " Offset Label", offsetText, TextFont),
      in(juce::String(prefix) + " In TC", {}, TextFont), out(juce::String(prefix) + " Out TC", {}, TextFont)
{
    offset.setName(juce::String(prefix) + " Offset");
    offset.setTitle(offsetLabel.getText());
}

FileDialog::FileDialog()
    : Sheet("m_fileDialog"), m_destination(ListSide::Destination, "DST", L"DST Offset"),
      m_source(ListSide::Source, "SRC", L"SRC Offset"), m_title("Add Edls Label", L"Add EDLs", TitleFont),
      m_line("Horizontal Line"), m_edlLabel("EDL Label", L"EDLs", TextFont), m_cancelButton("Cancel Button"),
      m_okButton("Ok Button"), m_openFilesButton("Open Files Button", ButtonPicture::Symbol::Folder),
      m_fileList("EDL File List")
{
    addSide(m_destination);
    addSide(m_source);
    for (juce::Label* const label : {static_cast<juce::Label*>(&m_title), static_cast<juce::Label*>(&m_line),
                                     static_cast<juce::Label*>(&m_edlLabel)})
        addAndMakeVisible(label);
    m_cancelButton.setButtonText(translatedText(L"Cancel"));
    m_okButton.setButtonText(translatedText(L"OK"));
    m_openFilesButton.setTooltip(translatedText(L"Browse EDL Files"));
    for (juce::Button* const button :
         std::initializer_list<juce::Button*>{&m_cancelButton, &m_okButton, &m_openFilesButton}) {
        addAndMakeVisible(button);
        button->addListener(this);
    }
    m_fileList.setMultiLine(true, false);
    m_fileList.setReadOnly(true);
    m_fileList.setCaretVisible(false);
    m_fileList.setScrollbarsShown(true);
    m_fileList.setEscapeAndReturnKeysConsumed(false);
    m_fileList.setFont(getFont(TextFont));
    m_fileList.setTitle(m_edlLabel.getText());
    m_fileList.setColour(juce::TextEditor::textColourId, juce::Colours::black);
    m_fileList.setColour(juce::TextEditor::backgroundColourId, juce::Colours::transparentBlack);
    m_fileList.setColour(juce::TextEditor::outlineColourId, toColour(Palette::frame));
    m_fileList.setColour(juce::TextEditor::focusedOutlineColourId, toColour(Palette::lightBlue));
    m_fileList.setColour(juce::TextEditor::shadowColourId, juce::Colours::transparentBlack);
    m_fileList.setTextToShowWhenEmpty(translatedText(L"Browse for EDL files, or drop them here."), HintColour);
    addAndMakeVisible(m_fileList);
    reset();
}

FileDialog::~FileDialog() = default;

void FileDialog::addSide(Side& side)
{
    for (juce::Component* const component : std::initializer_list<juce::Component*>{
             &side.inLabel, &side.outLabel, &side.offsetLabel, &side.offset, &side.in, &side.out})
        addAndMakeVisible(component);
    side.offset.addListener(this);
}

void FileDialog::setVisible(Side& side, bool isVisible)
{
    for (juce::Component* const component : std::initializer_list<juce::Component*>{
             &side.inLabel, &side.outLabel, &side.offsetLabel, &side.offset, &side.in, &side.out})
        component->setVisible(isVisible);
}

// ---- Layout --------------------------------------------------------------------------------------------------------

juce::Rectangle<int> FileDialog::panel() const
{
    return {getWidth() / 2 - 366, getHeight() / 2 - 190, 732, 337};
}

void FileDialog::placeSide(Side& side, int top)
{
    const int middle = getWidth() / 2;
    side.offsetLabel.setBounds(middle - 350, top, 96, RowHeight);
    side.offset.setBounds(middle - 254, top, 100, RowHeight);
    side.inLabel.setBounds(middle - 122, top, 25, RowHeight);
    side.in.setBounds(middle - 98, top, 96, RowHeight);
    side.outLabel.setBounds(middle + 18, top, 40, RowHeight);
    side.out.setBounds(middle + 55, top, 96, RowHeight);
}

void FileDialog::resized()
{
    guardSystem([this] {
        const int middle = getWidth() / 2;
        const int centre = getHeight() / 2;
        m_title.setBounds(middle - 353, centre - 179, 472, RowHeight);
        m_line.setBounds(middle - 349, centre - 152, 699, 1);
        m_edlLabel.setBounds(middle - 350, centre - 129, 472, RowHeight);
        m_openFilesButton.setBounds(middle + 266, centre - 127, 80, RowHeight);
        m_fileList.setBounds(middle - 254, centre - 88, 600, 132);
        placeSide(m_destination, centre + 60);
        placeSide(m_source, centre + 101);
        m_okButton.setBounds(middle + 177, centre + 100, 80, RowHeight);
        m_cancelButton.setBounds(middle + 266, centre + 100, 80, RowHeight);
    });
}

void FileDialog::enablementChanged()
{
    guardSystem([this] {
        m_fileList.applyColourToAllText(juce::Colours::black.withAlpha(isEnabled() ? 1.0F : DisabledOpacity));
    });
}

void FileDialog::paintOverChildren(juce::Graphics& graphics)
{
    guardSystem([&] {
        if (!m_isDropTarget)
            return;
        graphics.setColour(juce::Colours::black);
        graphics.drawRect(m_fileList.getBounds().expanded(2), 2);
    });
}

// ---- Coming and going ----------------------------------------------------------------------------------------------

void FileDialog::setVisible(bool shouldBeVisible)
{
    setVisible(m_source, m_listType == ListKind::Change);
    Sheet::setVisible(shouldBeVisible);
}

void FileDialog::showFor(std::int32_t listType)
{
    m_listType = listType;
    m_taken = std::make_shared<TakenFiles>(listType);
    m_isOkWaiting = false;
    m_title.setText(translatedText(titleFor(listType)), juce::dontSendNotification);
    setTitle(m_title.getText());
    setVisible(true);
}

void FileDialog::setModel(core::DataModel* model, const std::wstring& projectPath)
{
    cancel();
    m_model = model;
    m_lastFolder = model ? edlFolderOf(*model, projectPath) : std::wstring();
}

void FileDialog::cancel()
{
    m_listType = NoList;
    m_taken.reset();
    const SafePointer<FileDialog> self(this);
    setVisible(false);
    // What was typed into an offset is taken when the focus leaves it. So this comes last.
    if (self)
        reset();
}

void FileDialog::reset()
{
    m_fileList.setText({}, false);
    for (Side* const side : {&m_destination, &m_source}) {
        side->offset.setValue(Timecode::minTimecode(), true, juce::dontSendNotification);
        showRange(*side, ZeroTimecode, ZeroTimecode);
    }
    setDropTarget(false);
}

void FileDialog::confirm()
{
    const std::shared_ptr<TakenFiles> taken = m_taken;
    if (!m_model) {
        cancel();
        return;
    }
    if (!taken)
        return;
    const SafePointer<FileDialog> self(this);
    if (!prepareChange() || !self || m_taken != taken)
        return;
    taken->appendTo(*m_model, offsetIn(m_destination.offset), offsetIn(m_source.offset), m_lastFolder);
    if (self)
        cancel();
}

bool FileDialog::prepareChange()
{
    const bool isAsked = m_beforeChange && m_listType == ListKind::Change && !m_taken->isEmpty();
    return !isAsked || m_beforeChange();
}

// ---- Files ---------------------------------------------------------------------------------------------------------

void FileDialog::buttonClicked(juce::Button* button)
{
    guardUser([&] {
        if (button == &m_okButton)
            confirm();
        else if (button == &m_cancelButton)
            cancel();
        else if (button == &m_openFilesButton)
            browse();
    });
}

void FileDialog::browse()
{
    const std::weak_ptr<TakenFiles> taken = m_taken;
    const SafePointer<FileDialog> self(this);
    std::vector<std::string> chosen;
    FileBrowserDialogBase::instance().browse(m_title.getText().toWideCharPointer(), m_lastFolder, L"edl",
                                             StringUtil::translate(L"Edit Decision List"), false, chosen);
    if (self && !taken.expired() && !chosen.empty())
        takeFiles(chosen);
}

void FileDialog::takeFiles(const std::vector<std::string>& paths)
{
    const std::weak_ptr<TakenFiles> taken = m_taken;
    if (taken.expired() || !m_model)
        return;
    const SafePointer<FileDialog> self(this);
    if (paths.empty())
        return;
    m_lastFolder = folderOfFile(StringUtil::toWide(paths.back()));
    takeEdls(taken, paths, m_model->settings().bRollRenaming());
    if (!self || taken.expired())
        return;
    refresh();
    if (m_taken->isEmpty() || !isShowing())
        return;
    m_okButton.grabKeyboardFocus();
    // The window may have no keyboard yet when the file box has just closed.
    m_isOkWaiting = !m_okButton.hasKeyboardFocus(false);
}

juce::Component* FileDialog::firstFocus()
{
    if (m_taken && !m_taken->isEmpty())
        return &m_okButton;
    return &m_openFilesButton;
}

/// A window that gets the keyboard back gives it to what had it before the file box.
void FileDialog::focusOfChildComponentChanged(FocusChangeType cause)
{
    guardSystem([&] {
        if (!hasKeyboardFocus(true) || !std::exchange(m_isOkWaiting, false))
            return;
        if (cause != focusChangedByMouseClick && m_taken)
            m_okButton.grabKeyboardFocus();
    });
}

void FileDialog::refresh()
{
    m_fileList.setText(m_taken->summary().c_str(), false);
    for (Side* const side : {&m_destination, &m_source}) {
        showRange(*side, {}, {});
        keepInBounds(*side);
    }
}

void FileDialog::timecodeChanged(TcInput& input)
{
    guardUser([&] {
        if (m_taken)
            keepInBounds(&input == &m_source.offset ? m_source : m_destination);
    });
}

/// Without a range an offset does nothing.
void FileDialog::keepInBounds(Side& side)
{
    const EdlOffset offset = m_taken->bounded(side.side, offsetIn(side.offset));
    side.offset.setValue(offset.amount, offset.isForward, juce::dontSendNotification);
    if (const std::optional<core::TimecodeRange> range = m_taken->shifted(side.side, offset))
        showRange(side, range->start.toString(), range->end.toString());
}

void FileDialog::showRange(Side& side, const juce::String& in, const juce::String& out)
{
    side.in.setText(in, juce::dontSendNotification);
    side.out.setText(out, juce::dontSendNotification);
}

// ---- Files from a file manager -------------------------------------------------------------------------------------

bool FileDialog::isInterestedInFileDrag(const juce::StringArray& files)
{
    return m_taken && isEnabled() && !files.isEmpty();
}

void FileDialog::fileDragEnter(const juce::StringArray&, int, int)
{
    guardSystem([this] { setDropTarget(true); });
}

void FileDialog::fileDragExit(const juce::StringArray&)
{
    guardSystem([this] { setDropTarget(false); });
}

void FileDialog::filesDropped(const juce::StringArray& files, int, int)
{
    guardUser([&] {
        setDropTarget(false);
        takeFiles(pathsOf(files));
    });
}

void FileDialog::setDropTarget(bool flag)
{
    m_isDropTarget = flag;
    repaint();
}

} // namespace cadrel::gui
