// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/ShowCommand.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Output.h"
#include "app/console/Paths.h"
#include "app/console/Printable.h"
#include "app/console/Replacing.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/ProjectClock.h"
#include "app/project/MediaProgram.h"
#include "app/project/ProjectAccess.h"
#include "app/project/ProjectContent.h"
#include "app/project/ProjectJson.h"
#include "app/project/ProjectListing.h"
#include "app/project/StoredModel.h"
#include "standin/base/Utf16.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <cstddef>
#include <iostream>
#include <iterator>
#include <optional>
#include <string_view>
#include <vector>

namespace cadrel::app {

using standin::Project;
using standin::toUtf8;
using standin::Track;

namespace {

/// A longer list of names doesn't help to find the right one.
constexpr std::size_t MostNamesInAMessage = 40;
constexpr std::size_t MostCharactersOfAName = 40;

bool isNamed(const Track& track, const std::string& name)
{
    return toUtf8(track.name()) == name;
}

/// The tracks of that name; a folder stands for all that is in it, too.
Tracks tracksNamed(Project& project, const ShowOptions& options)
{
    Tracks tracks = tracksOf(project);
    const std::string& name = options.trackName;
    if (name.empty())
        return tracks;
    Tracks found;
    std::copy_if(tracks.begin(), tracks.end(), std::back_inserter(found), [&name](const Track* track) {
        const Tracks folders = foldersAround(*track);
        return isNamed(*track, name) || std::any_of(folders.begin(), folders.end(),
                                                    [&name](const Track* folder) { return isNamed(*folder, name); });
    });
    if (!found.empty())
        return found;
    std::vector<std::string> names;
    for (const Track* track : tracks) {
        if (names.size() == MostNamesInAMessage) {
            names.push_back(std::string("and ") + std::to_string(tracks.size() - names.size()) + " more");
            break;
        }
        names.push_back(quoted(toPrintable(toUtf8(track->name()), MostCharactersOfAName).text));
    }
    throw Failure{options.projectFile, "has no track " + quoted(name),
                  names.empty() ? "it has no tracks at all" : "give one of " + joined(names)};
}

void writeJson(Project& project, const ProjectClock& clock, const StoredModel& stored, const Tracks& tracks,
               const ShowOptions& options)
{
    std::optional<Interruption> interruption;
    if (!Output::isStandardOutput(options.jsonFile))
        interruption.emplace();
    Output json(options.jsonFile, options.isReplacing);
    ProjectJson(project, clock, stored, [&json](std::string_view text) {
        json.write(text);
    }).write(fileNameOf(options.projectFile), tracks);
    json.place();
}

void print(Project& project, const ProjectClock& clock, const StoredModel& stored, const Tracks& tracks,
           const ShowOptions& options)
{
    const ProjectListing listing(project, clock, stored, Terminal::wantsColour());
    if (!options.trackName.empty()) {
        listing.printContent(std::cout, tracks);
        return;
    }
    listing.printFacts(std::cout, fileNameOf(options.projectFile));
    if (!tracks.empty()) {
        std::cout << '\n';
        listing.printTree(std::cout);
        std::cout << '\n';
        listing.printContent(std::cout, tracks);
    }
    if (!project.pool().clips().empty()) {
        std::cout << '\n';
        listing.printPool(std::cout);
    }
}

} // namespace

void runShow(const ShowOptions& options, Terminal& terminal)
{
    const bool jsonOnly = Output::isStandardOutput(options.jsonFile);
    if (Output::isFile(options.jsonFile)) {
        refuseToOverwrite({options.projectFile}, options.jsonFile);
        requireReplaceable({options.jsonFile}, {.isAllowed = options.isReplacing});
    }
    if (options.isMedia)
        startMediaProgram(options.projectFile);
    Project& project = readProject(options.projectFile, terminal);
    const ProjectClock clock = clockOf(project, options.projectFile);
    const StoredModel stored(project, clock);
    const Tracks tracks = tracksNamed(project, options);

    terminal.clearProgress();
    if (!options.jsonFile.empty())
        writeJson(project, clock, stored, tracks, options);
    if (jsonOnly)
        return;
    print(project, clock, stored, tracks, options);
    flushStandardOutput();
}

} // namespace cadrel::app
