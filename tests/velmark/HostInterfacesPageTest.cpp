// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <regex>
#include <sstream>
#include <string>

namespace {

/// What the page and the headers both say of an interface.
struct Interface {
    std::string identifier = "none";
    std::string operations;

    bool operator==(const Interface&) const = default;
};

using Interfaces = std::map<std::string, Interface>;

std::string contentOf(const std::filesystem::path& path)
{
    std::ostringstream content;
    content << std::ifstream(path, std::ios::binary).rdbuf();
    return content.str();
}

void forEachMatch(const std::string& text, const char* pattern, const auto& take)
{
    const std::regex expression(pattern);
    for (std::sregex_iterator match(text.begin(), text.end(), expression), end; match != end; ++match)
        take(*match);
}

void append(std::string& list, const std::string& item)
{
    list += list.empty() ? item : ", " + item;
}

/// Interfaces by the declarations of src/velmark: what begins with an I, and the root.
Interfaces declaredInterfaces()
{
    Interfaces interfaces;
    for (const auto& entry : std::filesystem::directory_iterator(cadrel::tests::treePath("src/velmark"))) {
        if (entry.path().extension() != ".h")
            continue;
        const std::string header = contentOf(entry.path());
        // A class ends at the first brace that isn't indented.
        forEachMatch(header, R"(\nclass (I[A-Z]\w+|FUnknown)[^;{]*\{([^]*?)\n\};)", [&](const std::smatch& found) {
            Interface& interface = interfaces[found[1]];
            forEachMatch(found[2], R"re(iid\{"(\w{32})"\})re",
                         [&](const std::smatch& id) { interface.identifier = id[1]; });
            forEachMatch(found[2], R"re(\n    virtual [\w*: ]+[ *](\w+)\()re",
                         [&](const std::smatch& operation) { append(interface.operations, operation[1]); });
        });
    }
    return interfaces;
}

/// Interfaces by the tables of the page.
Interfaces listedInterfaces()
{
    Interfaces interfaces;
    const std::string page = contentOf(cadrel::tests::treePath("docs/host-interfaces.md"));
    forEachMatch(page, R"(\n\| `(\w+)` \| (\w{32}|none) \| ([^|]*) \|)", [&](const std::smatch& row) {
        Interface interface {
            row[2], {}
        };
        forEachMatch(row[3], R"(`(\w+)`)",
                     [&](const std::smatch& operation) { append(interface.operations, operation[1]); });
        EXPECT_TRUE(interfaces.emplace(row[1], interface).second) << row[1] << " is listed twice";
    });
    return interfaces;
}

} // namespace

TEST(HostInterfacesPage, ListsEveryInterfaceAsItIsDeclared)
{
    const Interfaces declared = declaredInterfaces();
    const Interfaces listed = listedInterfaces();

    // 33 of the host, 18 of the module, and the seven without an identifier.
    EXPECT_EQ(declared.size(), 58U);
    for (const auto& [name, interface] : declared) {
        ASSERT_TRUE(listed.contains(name)) << name;
        EXPECT_EQ(listed.at(name).identifier, interface.identifier) << name;
        EXPECT_EQ(listed.at(name).operations, interface.operations) << name;
    }
    EXPECT_EQ(listed.size(), declared.size());
}
