// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/ProgramRun.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <array>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <fstream>
#include <functional>
#include <sched.h>
#include <spawn.h>
#include <stdexcept>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ; // NOLINT(readability-redundant-declaration): POSIX leaves it to the program

namespace cadrel::tests {

namespace {

/// The outputs of a process to start.
class Outputs {
public:
    Outputs()
    {
        posix_spawn_file_actions_init(&m_actions);
        posix_spawn_file_actions_addopen(&m_actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    }
    Outputs(const Outputs&) = delete;
    Outputs& operator=(const Outputs&) = delete;
    ~Outputs() { posix_spawn_file_actions_destroy(&m_actions); }

    void open(int descriptor, const std::string& path)
    {
        posix_spawn_file_actions_addopen(&m_actions, descriptor, path.c_str(), O_WRONLY | O_CREAT | O_NOCTTY, 0600);
    }
    const posix_spawn_file_actions_t* actions() const { return &m_actions; }

private:
    posix_spawn_file_actions_t m_actions{};
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

std::vector<std::string> commandLine(const std::string& program, const std::vector<std::string>& arguments)
{
    std::vector<std::string> words{program};
    words.insert(words.end(), arguments.begin(), arguments.end());
    return words;
}

pid_t start(std::vector<std::string> words, const Outputs& outputs, char** environment)
{
    pid_t child = 0;
    if (posix_spawnp(&child, words[0].c_str(), outputs.actions(), nullptr, pointersTo(words).data(), environment) != 0)
        throw std::runtime_error("can't run " + words[0]);
    return child;
}

int exitStatusOf(pid_t child)
{
    int state = 0;
    if (waitpid(child, &state, 0) != child)
        throw std::runtime_error("lost the program");
    return WIFEXITED(state) ? WEXITSTATUS(state) : -1;
}

Outcome run(const std::vector<std::string>& words, const std::string& outPath)
{
    const TempFolder folder;
    const std::string out = outPath.empty() ? (folder / "out").string() : outPath;
    const std::string err = folder / "err";
    Outputs outputs;
    outputs.open(STDOUT_FILENO, out);
    outputs.open(STDERR_FILENO, err);

    const int status = exitStatusOf(start(words, outputs, environ));

    return {status, outPath.empty() ? contentOf(out) : std::string(), contentOf(err)};
}

/// `whenShown` is called with all that the program has shown so far, whenever that has become more. 0 columns stand for a
/// terminal that doesn't tell how many it has.
Outcome runOnTerminal(const std::vector<std::string>& arguments, const std::string& environment,
                      const std::function<void(pid_t child, const std::string& shown)>& whenShown,
                      unsigned short columns = 0)
{
    const int terminal = posix_openpt(O_RDWR | O_NOCTTY);
    if (terminal < 0 || grantpt(terminal) != 0 || unlockpt(terminal) != 0)
        throw std::runtime_error("no terminal");
    winsize size{};
    size.ws_col = columns;
    if (ioctl(terminal, TIOCSWINSZ, &size) != 0)
        throw std::runtime_error("a terminal without a width");
    Outputs outputs;
    outputs.open(STDOUT_FILENO, ptsname(terminal));
    outputs.open(STDERR_FILENO, ptsname(terminal));
    std::vector<std::string> variables{"TERM=xterm", environment};

    const pid_t child = start(commandLine(programPath("cadrel"), arguments), outputs, pointersTo(variables).data());
    std::string shown;
    std::array<char, 4096> part{};
    // The reading fails once the program has closed its side.
    for (ssize_t count = 0; (count = read(terminal, part.data(), part.size())) > 0;) {
        shown.append(part.data(), static_cast<std::size_t>(count));
        whenShown(child, shown);
    }
    close(terminal);

    return {exitStatusOf(child), shown, {}};
}

/// `act` is called once, as soon as the text is shown.
Outcome runOnTerminalUntil(const std::string& text, const std::vector<std::string>& arguments,
                           const std::function<void(pid_t child)>& act)
{
    bool isDone = false;
    return runOnTerminal(arguments, {}, [&](pid_t child, const std::string& shown) {
        if (isDone || shown.find(text) == std::string::npos)
            return;
        act(child);
        isDone = true;
    });
}

constexpr uid_t Nobody = 65534;

bool isRoot()
{
    return geteuid() == 0;
}

} // namespace

Outcome runCadrel(const std::vector<std::string>& arguments, const std::string& outPath)
{
    return run(commandLine(programPath("cadrel"), arguments), outPath);
}

Outcome runProgram(const std::string& program, const std::vector<std::string>& arguments)
{
    return run(commandLine(program, arguments), {});
}

Outcome runCadrelUnprivileged(const std::vector<std::string>& arguments)
{
    if (!isRoot())
        return runCadrel(arguments);
    // The build may stand in a folder that only root may enter.
    const TempFolder folder;
    const std::string program = folder / "cadrel";
    std::filesystem::copy_file(programPath("cadrel"), program);
    giveToUnprivileged(folder.path());
    const std::string id = std::to_string(Nobody);
    std::vector<std::string> words{"setpriv", "--reuid=" + id, "--regid=" + id, "--clear-groups", program};
    words.insert(words.end(), arguments.begin(), arguments.end());
    return run(words, {});
}

Outcome runCadrelInterrupted(const std::vector<std::string>& arguments, const TempFolder& folder)
{
    const auto isWriting = [&folder] {
        const std::vector<std::string> names = folder.names();
        return std::any_of(names.begin(), names.end(),
                           [](const std::string& name) { return name.starts_with(".cadrel-"); });
    };
    Outputs outputs;
    outputs.open(STDOUT_FILENO, "/dev/null");
    outputs.open(STDERR_FILENO, "/dev/null");

    const pid_t child = start(commandLine(programPath("cadrel"), arguments), outputs, environ);
    const auto hasEnded = [child] {
        siginfo_t state{};
        return waitid(P_PID, static_cast<id_t>(child), &state, WEXITED | WNOHANG | WNOWAIT) == 0 && state.si_pid != 0;
    };
    while (!hasEnded() && !isWriting())
        sched_yield();
    kill(child, SIGINT);

    return {exitStatusOf(child), {}, {}};
}

void giveToUnprivileged(const std::filesystem::path& path)
{
    if (isRoot() && chown(path.c_str(), Nobody, Nobody) != 0)
        throw std::runtime_error("can't give " + path.string() + " away");
}

Outcome runCadrelOnTerminal(const std::vector<std::string>& arguments, const std::string& environment)
{
    return runOnTerminal(arguments, environment, [](pid_t, const std::string&) {});
}

Outcome runCadrelOnNarrowTerminal(const std::vector<std::string>& arguments, unsigned short columns)
{
    return runOnTerminal(
        arguments, {}, [](pid_t, const std::string&) {}, columns);
}

Outcome runCadrelInterruptedAt(const std::string& text, const std::vector<std::string>& arguments)
{
    return runOnTerminalUntil(text, arguments, [](pid_t child) { kill(child, SIGINT); });
}

Outcome runCadrelDisturbedAt(const std::string& text, const std::vector<std::string>& arguments,
                             const std::function<void()>& disturb)
{
    return runOnTerminalUntil(text, arguments, [&](pid_t) { disturb(); });
}

} // namespace cadrel::tests
