// SPDX-License-Identifier: GPL-3.0-or-later

// Whatever the user does: the mark tells whether the bytes differ, the place of the playhead aside, and what was stored opens again
// with the same bytes.

#include "tests/desktop/document/DocumentHost.h"
#include "tests/support/standin/RandomProject.h"

#include <rapidcheck/gtest.h>

#include <regex>
#include <string>

namespace desktop::tests {

namespace fs = std::filesystem;

using standin::tests::Chance;
using standin::tests::CheckedChance;

namespace {

constexpr const char16_t* Names[] = {u"A", u"B", u"C"};

std::string withoutPlayhead(const std::string& bytes)
{
    static const std::regex playhead(R"("position": [^,]*,\s*)");
    return std::regex_replace(bytes, playhead, "", std::regex_constants::format_first_only);
}

} // namespace

/// A user who does at random what can be done to a document.
struct RandomUser : DocumentHost {
    OpenDocument& open(Chance& chance)
    {
        standin::ChangeLog log;
        const auto project = standin::tests::randomProject(chance, log);
        standin::ProjectFile::write(*project, folder / "reel3.stage");
        return documents.open(folder / "reel3.stage");
    }

    /// One in which something may have been done.
    OpenDocument& openAndAct(Chance& chance)
    {
        OpenDocument& document = open(chance);
        const std::uint64_t steps = chance.below(20);
        for (std::uint64_t step = 0; step < steps; ++step)
            act(document, chance);
        return document;
    }

    void act(OpenDocument& document, Chance& chance)
    {
        Project& project = document.project();
        const std::vector<Track*> tracks = project.allTracks();
        switch (chance.below(12)) {
        case 0:
        case 1:
            if (!tracks.empty())
                edit(project, u"Rename", [&] { tracks[chance.below(tracks.size())]->setName(chance.oneOf(Names)); });
            break;
        case 2:
            edit(project, u"Rename and back", [&] {
                const std::u16string name = project.name();
                project.setName(u"other");
                project.setName(name);
            });
            break;
        case 3:
            edit(project, u"End", [&] { project.setProjectEnd(static_cast<double>(chance.below(3)) * 500.0); });
            break;
        case 4:
            if (!tracks.empty())
                edit(project, u"Remove", [&] { tracks[chance.below(tracks.size())]->remove(); });
            break;
        case 5:
            if (!tracks.empty())
                tracks[chance.below(tracks.size())]->setSelected(chance.oneIn(2));
            break;
        case 6:
            if (!tracks.empty())
                tracks[chance.below(tracks.size())]->setLocked(chance.oneIn(2));
            break;
        case 7:
            module->models[&project] = chance.oneIn(2) ? "settings" : "";
            break;
        case 8:
            project.position().setValue(0, static_cast<double>(chance.below(2)));
            break;
        case 9:
            document.goToUndoPosition(chance.below(document.undoNames().size() + 1));
            break;
        case 10:
            idle(std::chrono::seconds(chance.below(60)));
            break;
        default:
            stored = saved(document);
            break;
        }
    }

    std::string saved(OpenDocument& document)
    {
        RC_ASSERT(documents.save(document).isSaved());
        return contentOf(document.path());
    }

    std::string stored;
};

RC_GTEST_PROP(DocumentLaw, TheMarkIsSetExactlyWhereTheBytesDifferFromThoseStored, ())
{
    CheckedChance chance;
    RandomUser user;
    OpenDocument& document = user.open(chance);
    user.stored = user.bytesOf(document);
    const std::uint64_t steps = 1 + chance.below(30);
    for (std::uint64_t step = 0; step < steps; ++step) {
        user.act(document, chance);
        const bool differs = withoutPlayhead(user.bytesOf(document)) != withoutPlayhead(user.stored);
        RC_ASSERT(document.settleUnsaved() == differs);
        RC_ASSERT(document.isUnsaved() == differs);
    }
}

RC_GTEST_PROP(DocumentLaw, WhatIsSavedOpensAgainWithTheSameBytesAndIsSaved, ())
{
    CheckedChance chance;
    RandomUser user;
    OpenDocument& document = user.openAndAct(chance);
    const std::string stored = user.saved(document);
    const fs::path path = document.path();
    user.documents.close(document);

    OpenDocument& again = user.documents.open(path);

    RC_ASSERT(user.bytesOf(again) == stored);
    RC_ASSERT(!again.settleUnsaved());
    RC_ASSERT(contentOf(path) == stored);
}

RC_GTEST_PROP(DocumentLaw, TheAutosaveOpensWithTheBytesOfTheProjectWhereThoseDifferAndIsGoneWhereNot, ())
{
    CheckedChance chance;
    RandomUser user;
    OpenDocument& document = user.openAndAct(chance);
    user.idle();
    user.idle();
    const fs::path path = document.path();
    const std::string bytes = withoutPlayhead(user.bytesOf(document));
    const auto autosave = Autosave::read(path);
    RC_ASSERT(autosave.has_value() == document.settleUnsaved());
    if (!autosave)
        return;
    RC_ASSERT(withoutPlayhead(autosave->content) == bytes);
    const std::string left = contentOf(Autosave::pathFor(path));
    user.documents.close(document);
    writeFile(Autosave::pathFor(path), left);

    OpenDocument& recovered = user.documents.open(path, OpenDocuments::Work::Recover);

    RC_ASSERT(withoutPlayhead(user.bytesOf(recovered)) == bytes);
    RC_ASSERT(recovered.isUnsaved());
    RC_ASSERT(withoutPlayhead(user.saved(recovered)) == bytes);
}

} // namespace desktop::tests
