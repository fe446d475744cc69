// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/JsonSchema.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/SoundProject.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <functional>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <set>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

/// What a command writes to the file that is named last.
json writtenBy(std::vector<std::string> arguments)
{
    const TempFolder folder;
    const std::string path = folder / "written.json";
    arguments.push_back(path);
    const Outcome outcome = runCadrel(arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return json::parse(contentOf(path));
}

/// The shots of an old cut and those of a new one with all that a list can have: a transition, a speed, sound, a roll that can't
/// be read, a line that can't be read, and a shot that is doubled.
std::string flawedCut(const std::string& title)
{
    return "TITLE: " + title + "\n" + cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") +
           clipName("ONE") + "002  A001  V  C        10:00:10:00 10:00:10:00 01:00:10:00 01:00:10:00\n" +
           "002  A002  V  D    012 11:00:00:12 11:00:10:12 01:00:10:00 01:00:20:00\n" +
           cut("003", "A003", "12:00:00:00 12:00:20:00", "01:00:20:00 01:00:30:00") +
           "M2   A003       048.0       12:00:00:00\n" +
           "004  S001  A  C  10:00:00:00 10:00:01:00 01:00:00:00 01:00:01:00\n" +
           "005  A+B   V  C  12:00:00:00 x 1:0:0:0 1:0:0:1\n" +
           "006  A004  V  C  12:00:00:00 12:00:01:00 01:00:30:00\n";
}

std::string doublingCut()
{
    return oldCut() + cut("004", "A001", "10:00:02:00 10:00:05:00", "01:00:30:00 01:00:33:00") +
           cut("005", "A002", "11:00:04:00 11:00:06:00", "01:00:33:00 01:00:35:00");
}

/// Documents of every command, small ones.
class Documents {
public:
    json list() const { return writtenBy({"list", m_flawed, "--summary", "--json"}); }

    json generate() const
    {
        return writtenBy({"generate", "--old", m_old, "--new", m_flawed, "-o", m_folder / "change.edl", "--overwrite",
                          "--backup", "--json"});
    }

    std::vector<json> notes() const
    {
        return {writtenBy({"notes", "--old", m_old, "--new", m_flawed, "--feet", "-o"}),
                writtenBy({"notes", "--old", m_flawed, "--new", m_new, "-o"}),
                writtenBy({"notes", "--old", m_old, "--new", m_doubling, "--feet", "-o"})};
    }

    std::vector<json> apply() const
    {
        const json ofCuts =
            writtenBy({"apply", m_project, "--old", m_old, "--new", m_flawed, "--force", "--vfx", "VFX_,_comp", "-o",
                       m_folder / "new.stage", "--overwrite", "--backup", "--json"});
        const json ofNothing =
            writtenBy({"apply", m_project, "--old", m_old, "--new", m_new, "--keep", "cut", "--force", "--json"});
        generate();
        return {ofCuts, ofNothing,
                writtenBy({"apply", m_project, "--change", m_folder / "change.edl", "--force", "--json"})};
    }

    std::vector<json> show() const
    {
        apply();
        const std::string damaged = m_folder.write(
            "damaged.stage",
            projectWith(R"({"kind": "audio", "name": "FX", "events": [{"kind": "clip", "start": 0, "end": 1}]})",
                        R"("attributes": {"Other": {"Data": "AAECAw=="}, "Number": 5, "Word": "text"},)"));
        return {writtenBy({"show", m_project, "--json"}), writtenBy({"show", m_folder / "new.stage", "--json"}),
                writtenBy({"show", damaged, "--json"})};
    }

private:
    const TempFolder m_folder;
    const std::string m_old = m_folder.write("old.edl", oldCut());
    const std::string m_new = m_folder.write("new.edl", newCut());
    const std::string m_flawed = m_folder.write("flawed.edl", flawedCut("FLAWED"));
    const std::string m_doubling = m_folder.write("doubling.edl", doublingCut());
    const std::string m_project = m_folder.write("scene.stage", soundProject());
};

/// A schema, the documents that keep to it, and what of them may be otherwise.
struct Pattern {
    std::string schema;
    std::vector<json> documents;
    std::set<std::string> optional; ///< keys that may be missing
    std::set<std::string> words;    ///< keys whose texts are words of a list
};

std::vector<Pattern> patterns()
{
    const Documents documents;
    return {{"list", {documents.list()}, {"parts"}, {"kind", "transition", "flaws"}},
            {"generate", {documents.generate()}, {"parts"}, {"kind", "transition", "flaws", "from"}},
            {"notes",
             documents.notes(),
             {"insertFrom", "from", "moveFrames", "oldShot", "newShot", "old", "new", "sourceIn", "standsAt", "shots",
              "part", "feet"},
             {"kind", "transition", "flaws", "action", "row", "doubt", "match", "timecode"}},
            {"apply", documents.apply(), {"clip", "part"}, {"transition", "flaws", "from", "timecode"}},
            {"show", documents.show(), {"clip", "sourceOffset", "events"}, {"kind", "from", "timecode"}}};
}

/// Maps with the keys of others; the last two are attributes.
bool isFree(const std::string& key)
{
    return key == "attributes" || key == "settings" || key == "Other" || key == "CaDr";
}

using Visit = std::function<void(const json::json_pointer& place, const std::string& key)>;

/// Calls `visit` for the document and all in it; an element of an array has the key of the array.
void visitAll(const json& value, const json::json_pointer& place, const std::string& key, const Visit& visit)
{
    visit(place, key);
    if (value.is_object()) {
        for (const auto& [name, entry] : value.items())
            visitAll(entry, place / name, name, visit);
    }
    for (std::size_t index = 0; value.is_array() && index < value.size(); ++index)
        visitAll(value[index], place / index, key, visit);
}

TEST(Schemas, EveryCommandKeepsToItsOwn)
{
    for (const Pattern& pattern : patterns()) {
        const JsonSchema schema(pattern.schema);
        for (const json& document : pattern.documents)
            EXPECT_EQ(schema.faultOf(document), "") << pattern.schema;
    }
}

TEST(Schemas, TheExampleKeepsToThem)
{
    const std::string project = treePath("examples/reel3/reel3.stage");
    const std::vector<std::string> cuts{"--old", treePath("examples/reel3/reel3_v07.edl"),
                                        "--new", treePath("examples/reel3/reel3_v12.edl"),
                                        "--vfx", "VFX_****_v,_comp"};
    const auto faultOf = [&cuts](const std::string& name, std::vector<std::string> arguments, const char* output) {
        if (name != "show")
            arguments.insert(arguments.end(), cuts.begin(), cuts.end());
        arguments.emplace_back(output);
        return JsonSchema(name).faultOf(writtenBy(arguments));
    };

    EXPECT_EQ(faultOf("generate", {"generate"}, "--json"), "");
    EXPECT_EQ(faultOf("notes", {"notes", "--feet"}, "-o"), "");
    EXPECT_EQ(faultOf("apply", {"apply", project}, "--json"), "");
    EXPECT_EQ(faultOf("show", {"show", project}, "--json"), "");
}

TEST(Schemas, TheEventsOfTheRealFilesKeepToTheirs)
{
    const JsonSchema schema("list");
    int files = 0;
    for (const auto& entry : std::filesystem::directory_iterator(treePath("tests/data/edl"))) {
        const TempFolder folder;
        if (entry.path().extension() != ".edl" ||
            runCadrel({"list", entry.path(), "--summary", "--json", folder / "list.json"}).status != 0)
            continue;
        EXPECT_EQ(schema.faultOf(json::parse(contentOf(folder / "list.json"))), "") << entry.path();
        ++files;
    }
    EXPECT_GT(files, 25);
}

TEST(Schemas, AKeyMoreIsRefused)
{
    for (const Pattern& pattern : patterns()) {
        const JsonSchema schema(pattern.schema);
        for (const json& document : pattern.documents) {
            visitAll(document, json::json_pointer(), {}, [&](const json::json_pointer& place, const std::string&) {
                if (!document.at(place).is_object())
                    return;
                json wrong = document;
                wrong[place]["surplus"] = true;
                EXPECT_NE(schema.faultOf(wrong), "") << pattern.schema << " " << place;
            });
        }
    }
}

TEST(Schemas, AKeyLessIsRefused)
{
    for (const Pattern& pattern : patterns()) {
        const JsonSchema schema(pattern.schema);
        for (const json& document : pattern.documents) {
            visitAll(document, json::json_pointer(), {}, [&](const json::json_pointer& place, const std::string& key) {
                if (place.empty() || pattern.optional.contains(key))
                    return;
                const json::json_pointer parent = place.parent_pointer();
                const std::string around = parent.empty() ? "" : parent.back();
                if (document.at(parent).is_array() || isFree(around))
                    return;
                json wrong = document;
                wrong[parent].erase(key);
                EXPECT_NE(schema.faultOf(wrong), "") << pattern.schema << " " << place;
            });
        }
    }
}

TEST(Schemas, AValueOfAnotherTypeIsRefused)
{
    for (const Pattern& pattern : patterns()) {
        const JsonSchema schema(pattern.schema);
        for (const json& document : pattern.documents) {
            visitAll(document, json::json_pointer(), {}, [&](const json::json_pointer& place, const std::string& key) {
                if (key == "value") // of a setting
                    return;
                json wrong = document;
                wrong[place] = json::array({json::array()});
                EXPECT_NE(schema.faultOf(wrong), "") << pattern.schema << " " << place;
            });
        }
    }
}

TEST(Schemas, ATextThatIsNoneOfTheWordsIsRefused)
{
    for (const Pattern& pattern : patterns()) {
        const JsonSchema schema(pattern.schema);
        for (const json& document : pattern.documents) {
            visitAll(document, json::json_pointer(), {}, [&](const json::json_pointer& place, const std::string& key) {
                if (!pattern.words.contains(key) || !document.at(place).is_string())
                    return;
                for (const json& other : {json("no such word"), json(0)}) {
                    json wrong = document;
                    wrong[place] = other;
                    EXPECT_NE(schema.faultOf(wrong), "") << pattern.schema << " " << place;
                }
            });
        }
    }
}

/// Words that mean something in a schema; others would be passed over.
void expectKnownWords(const json& rules, const std::string& where)
{
    static const std::set<std::string> Known{"$schema", "$defs",    "$ref",    "title",
                                             "type",    "required", "items",   "description",
                                             "enum",    "pattern",  "minimum", "additionalProperties",
                                             "const",   "anyOf",    "allOf",   "properties"};
    if (!rules.is_object())
        return;
    for (const auto& [word, rule] : rules.items()) {
        const std::string place = where + "/" + word;
        EXPECT_TRUE(Known.contains(word)) << place;
        if (word == "properties" || word == "$defs") {
            for (const auto& [name, entry] : rule.items())
                expectKnownWords(entry, place + "/" + name);
        } else if (word == "anyOf" || word == "allOf") {
            for (const json& entry : rule)
                expectKnownWords(entry, place);
        } else if (word == "items" || word == "additionalProperties") {
            expectKnownWords(rule, place);
        }
    }
}

TEST(Schemas, HaveNoWordThatMeansNothing)
{
    for (const char* const name : {"common", "list", "generate", "notes", "apply", "show"}) {
        const std::string file = std::string(name) + ".schema.json";
        expectKnownWords(json::parse(contentOf(treePath("docs/" + file))), file);
    }
}

} // namespace
