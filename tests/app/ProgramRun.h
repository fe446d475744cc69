#pragma once

#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::tests {

/// What a run of the program gave.
struct Outcome {
    int status = -1; ///< the exit status; -1 when a signal ended it
    std::string out;
    std::string err;
};

/// A folder of one test, gone with it.
class TempFolder {
public:
    TempFolder();
    TempFolder(const TempFolder&) = delete;
    TempFolder& operator=(const TempFolder&) = delete;
    ~TempFolder();

    /// The path of a file in it.
    std::string operator/(const std::string& name) const { return (path_ / name).string(); }
    /// Writes a file into it and returns its path.
    std::string write(const std::string& name, std::string_view content) const;
    /// The names of everything in it, sorted.
    std::vector<std::string> names() const;

private:
    std::filesystem::path path_;
};

std::string contentOf(const std::string& path);

/// Runs `cadrel` with the arguments and standard output caught, or going to `outPath` if given. Standard input is
/// empty, and neither output is a terminal.
Outcome runCadrel(const std::vector<std::string>& arguments, const std::string& outPath = {});

/// Runs `cadrel` with both outputs on a terminal; what it showed stands in `out`. `environment` is added to what is
/// set for the run, such as "NO_COLOR=1".
Outcome runCadrelOnTerminal(const std::vector<std::string>& arguments, const std::string& environment = {});

} // namespace cadrel::tests
