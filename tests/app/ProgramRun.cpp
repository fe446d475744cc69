#include "tests/app/ProgramRun.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <fcntl.h>
#include <fstream>
#include <iterator>
#include <spawn.h>
#include <stdexcept>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ; // NOLINT(readability-redundant-declaration): POSIX leaves it to the program

namespace cadrel::tests {

namespace fs = std::filesystem;

TempFolder::TempFolder()
{
    std::string pattern = (fs::temp_directory_path() / "cadrel-test-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr)
        throw std::runtime_error("no temporary folder");
    path_ = pattern;
}

TempFolder::~TempFolder()
{
    std::error_code error;
    fs::remove_all(path_, error);
}

std::string TempFolder::write(const std::string& name, std::string_view content) const
{
    std::ofstream file(path_ / name, std::ios::binary);
    file << content;
    if (!file.flush())
        throw std::runtime_error("can't write " + name);
    return *this / name;
}

std::vector<std::string> TempFolder::names() const
{
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(path_))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

std::string contentOf(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

namespace {

/// The outputs of a process to start.
class Outputs {
public:
    Outputs()
    {
        posix_spawn_file_actions_init(&actions_);
        posix_spawn_file_actions_addopen(&actions_, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    }
    Outputs(const Outputs&) = delete;
    Outputs& operator=(const Outputs&) = delete;
    ~Outputs() { posix_spawn_file_actions_destroy(&actions_); }

    void open(int descriptor, const std::string& path)
    {
        posix_spawn_file_actions_addopen(&actions_, descriptor, path.c_str(), O_WRONLY | O_CREAT | O_NOCTTY, 0600);
    }
    const posix_spawn_file_actions_t* actions() const { return &actions_; }

private:
    posix_spawn_file_actions_t actions_{};
};

std::vector<char*> pointersTo(std::vector<std::string>& words)
{
    std::vector<char*> pointers;
    pointers.reserve(words.size() + 1);
    for (std::string& word : words)
        pointers.push_back(word.data());
    pointers.push_back(nullptr);
    return pointers;
}

pid_t start(const std::vector<std::string>& arguments, const Outputs& outputs, char** environment)
{
    std::vector<std::string> words{CADREL_PROGRAM};
    words.insert(words.end(), arguments.begin(), arguments.end());
    pid_t child = 0;
    if (posix_spawn(&child, CADREL_PROGRAM, outputs.actions(), nullptr, pointersTo(words).data(), environment) != 0)
        throw std::runtime_error("can't run " CADREL_PROGRAM);
    return child;
}

int exitStatusOf(pid_t child)
{
    int state = 0;
    if (waitpid(child, &state, 0) != child)
        throw std::runtime_error("lost " CADREL_PROGRAM);
    return WIFEXITED(state) ? WEXITSTATUS(state) : -1;
}

} // namespace

Outcome runCadrel(const std::vector<std::string>& arguments, const std::string& outPath)
{
    const TempFolder folder;
    const std::string out = outPath.empty() ? folder / "out" : outPath;
    const std::string err = folder / "err";
    Outputs outputs;
    outputs.open(STDOUT_FILENO, out);
    outputs.open(STDERR_FILENO, err);

    const int status = exitStatusOf(start(arguments, outputs, environ));

    return {status, outPath.empty() ? contentOf(out) : std::string(), contentOf(err)};
}

Outcome runCadrelOnTerminal(const std::vector<std::string>& arguments, const std::string& environment)
{
    const int terminal = posix_openpt(O_RDWR | O_NOCTTY);
    if (terminal < 0 || grantpt(terminal) != 0 || unlockpt(terminal) != 0)
        throw std::runtime_error("no terminal");
    Outputs outputs;
    outputs.open(STDOUT_FILENO, ptsname(terminal));
    outputs.open(STDERR_FILENO, ptsname(terminal));
    std::vector<std::string> variables{"TERM=xterm", environment};

    const pid_t child = start(arguments, outputs, pointersTo(variables).data());
    std::string shown;
    std::array<char, 4096> part{};
    // The reading fails once the program has closed its side.
    for (ssize_t count = 0; (count = read(terminal, part.data(), part.size())) > 0;)
        shown.append(part.data(), static_cast<std::size_t>(count));
    close(terminal);

    return {exitStatusOf(child), shown, {}};
}

} // namespace cadrel::tests
