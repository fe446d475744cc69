// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/FileBox.h"

#include "desktop/boxes/BoxText.h"
#include "gui/look/Text.h"

namespace desktop {

namespace {

constexpr int Width = 760;
constexpr int Height = 540;

int flagsOf(bool isSave)
{
    using Browser = juce::FileBrowserComponent;
    return Browser::canSelectFiles | (isSave ? Browser::saveMode | Browser::doNotClearFileNameOnRootChange
                                             : Browser::openMode | Browser::canSelectMultipleItems);
}

juce::String describe(const FileFilters& filters)
{
    juce::StringArray texts;
    for (const auto& filter : filters)
        texts.add(juce::String::fromUTF8(filter.description.c_str()) + " (*." +
                  juce::String::fromUTF8(filter.extension.c_str()) + ")");
    return texts.joinIntoString(", ");
}

std::filesystem::path pathOf(const juce::File& file)
{
    return file.getFullPathName().toStdString();
}

juce::File fileOf(const std::filesystem::path& path)
{
    return juce::File(juce::String::fromUTF8(path.string().c_str()));
}

} // namespace

FileBox::FileBox(const standin::UserBoxes::FileQuestion& question, const std::filesystem::path& folder, AskBack askBack,
                 Tell tell)
    : Box("File Box", toJuce(question.title)), FileFilter(describe(question.filters)), m_filters(question.filters),
      m_isSave(question.isSave), m_askBack(std::move(askBack)), m_tell(std::move(tell)),
      m_browser(flagsOf(question.isSave), fileOf(folder), this, nullptr), m_accept(question.isSave ? "Save" : "Open")
{
    m_browser.addListener(this);
    m_browser.setFilenameBoxLabel("Name");
    findParts();
    setColours();
    m_accept.onClick = [this] { accept(); };
    m_cancel.onClick = [this] { cancel(); };
    addAndMakeVisible(m_browser);
    addAndMakeVisible(m_accept);
    addAndMakeVisible(m_cancel);
    setPanelSize(Width, Height);
    propose(toJuce(question.name));
    selectionChanged();
}

/// The part that the user will change is selected.
void FileBox::propose(const juce::String& name)
{
    const int dot = name.lastIndexOfChar('.');
    m_name->setText(name, false);
    m_name->setHighlightedRegion({0, dot > 0 ? dot : name.length()});
}

void FileBox::setColours()
{
    using Browser = juce::FileBrowserComponent;
    using List = juce::DirectoryContentsDisplayComponent;
    using cadrel::gui::Palette;
    using cadrel::gui::toColour;
    for (const int background : {Browser::currentPathBoxBackgroundColourId, Browser::filenameBoxBackgroundColourId})
        m_browser.setColour(background, juce::Colours::black);
    for (const int text : {Browser::currentPathBoxTextColourId, Browser::filenameBoxTextColourId})
        m_browser.setColour(text, juce::Colours::white);
    m_browser.setColour(Browser::currentPathBoxArrowColourId, juce::Colours::black);
    // The list looks for its own ones alone.
    for (juce::Component* const child : m_browser.getChildren()) {
        child->setColour(List::textColourId, toColour(Palette::text));
        child->setColour(List::highlightedTextColourId, juce::Colours::black);
        child->setColour(List::highlightColourId, toColour(Palette::selection));
    }
    m_browser.lookAndFeelChanged();
}

FileBox::~FileBox()
{
    m_browser.removeListener(this);
}

void FileBox::cancel()
{
    m_files.clear();
    setDone();
}

/// The browser has no name for them. The only editor that isn't in the box of folders is that of the name.
void FileBox::findParts()
{
    for (juce::Component* const child : m_browser.getChildren()) {
        if (auto* const editor = dynamic_cast<juce::TextEditor*>(child))
            m_name = editor;
        if (auto* const list = dynamic_cast<juce::DirectoryContentsDisplayComponent*>(child))
            m_list = list;
    }
    // A browser of several files shows their names, but lets none be typed.
    m_name->setReadOnly(false);
    m_name->onTextChange = [this] { selectionChanged(); };
    // The box takes Return and Escape, as in its other controls.
    m_name->onReturnKey = nullptr;
    m_name->setEscapeAndReturnKeysConsumed(false);
}

juce::File FileBox::named() const
{
    const juce::String name = m_name->getText();
    return name.isEmpty() ? juce::File() : m_browser.getRoot().getChildFile(name);
}

void FileBox::layOut()
{
    juce::Rectangle<int> area = content();
    layOutButtons(area.removeFromBottom(ButtonHeight), {&m_accept, &m_cancel});
    m_browser.setBounds(area.withTrimmedBottom(Margin));
}

bool FileBox::isFileSuitable(const juce::File& file) const
{
    return fits(pathOf(file), m_filters);
}

bool FileBox::isDirectorySuitable(const juce::File& /*file*/) const
{
    return true;
}

void FileBox::selectionChanged()
{
    m_accept.setEnabled(m_isSave || named().exists() || m_list->getNumSelectedFiles() > 0);
}

void FileBox::fileDoubleClicked(const juce::File& file)
{
    // A folder is opened by the list itself.
    if (!file.isDirectory())
        accept();
}

void FileBox::accept()
{
    if (isDone())
        return;
    m_isSave ? save() : open();
}

void FileBox::open()
{
    m_files.clear();
    const juce::File typed = named();
    if (typed.isDirectory()) {
        m_browser.setRoot(typed);
        return;
    }
    if (typed.existsAsFile()) {
        m_files.push_back(pathOf(typed));
    } else {
        for (int index = 0; index < m_list->getNumSelectedFiles(); ++index) {
            if (const juce::File file = m_list->getSelectedFile(index); file.existsAsFile())
                m_files.push_back(pathOf(file));
        }
    }
    if (!m_files.empty())
        setDone();
    else if (typed != juce::File())
        m_tell("There is no file " + typed.getFullPathName() + ".");
}

void FileBox::save()
{
    const juce::File typed = named();
    if (typed == juce::File())
        return;
    if (typed.isDirectory()) {
        m_browser.setRoot(typed);
        return;
    }
    const std::filesystem::path file = withExtension(pathOf(typed), m_filters);
    const juce::File target = fileOf(file);
    if (target.isDirectory())
        return m_tell("\"" + target.getFileName() + "\" is a folder. Choose another name.");
    if (!target.getParentDirectory().isDirectory())
        return m_tell("There is no folder " + target.getParentDirectory().getFullPathName() + ".");
    if (target.existsAsFile() &&
        !m_askBack("\"" + target.getFileName() + "\" exists already. Overwrite it?", "Overwrite"))
        return;
    m_files = {file};
    setDone();
}

} // namespace desktop
