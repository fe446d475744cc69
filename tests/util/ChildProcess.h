#pragma once

#include <cerrno>
#include <csignal>
#include <cstddef>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <optional>
#include <stdexcept>
#include <sys/prctl.h>
#include <sys/ptrace.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

namespace cadrel::tests {

/// From now on, and for good, these calls of the system fail in this process. For a child process, that is. A `write` of
/// less than 64 bytes still succeeds: by such ones to a pipe of their own, the sanitizers find out what memory there is.
inline void refuseCalls(const std::vector<long>& calls, int error)
{
    std::vector<sock_filter> filter{BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr))};
    const sock_filter refuse = BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ERRNO | static_cast<unsigned>(error));
    for (const long call : calls) {
        if (call == SYS_write) {
            filter.push_back(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, static_cast<unsigned>(call), 0, 3));
            filter.push_back(BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, args[2])));
            filter.push_back(BPF_JUMP(BPF_JMP | BPF_JGE | BPF_K, 64, 0, 1));
            filter.push_back(refuse);
            filter.push_back(BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)));
        } else {
            filter.push_back(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, static_cast<unsigned>(call), 0, 1));
            filter.push_back(refuse);
        }
    }
    filter.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW));
    const sock_fprog program{static_cast<unsigned short>(filter.size()), filter.data()};
    if (prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) != 0 || prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &program) != 0)
        throw std::runtime_error("the system can't refuse calls");
}

/// A process that does one thing, `action`, and ends with the status that this gives.
class ChildProcess {
public:
    /// Lets it run to its end.
    template <class Action>
    static int statusOf(Action action)
    {
        ChildProcess child(action, false);
        while (child.isRunning())
            child.wait();
        return child.status();
    }

    /// Kills it, as a failing machine would, at its `step`-th crossing of the border to the system: at the
    /// odd ones a call is about to be made, at the even ones it has just been made. Nothing when it was killed.
    template <class Action>
    static std::optional<int> statusUnlessKilledAt(int step, Action action)
    {
        ChildProcess child(action, true);
        child.wait();
        for (int crossing = 1; child.isRunning(); ++crossing) {
            ptrace(PTRACE_SYSCALL, child.id_, nullptr, nullptr);
            child.wait();
            if (child.isRunning() && crossing == step) {
                kill(child.id_, SIGKILL);
                child.wait();
                return std::nullopt;
            }
        }
        return child.status();
    }

private:
    template <class Action>
    ChildProcess(Action action, bool isTraced) : id_(fork())
    {
        if (id_ < 0)
            throw std::runtime_error("can't make a process");
        if (id_ > 0)
            return;
        constexpr int Failed = 99;
        try {
            if (isTraced && (ptrace(PTRACE_TRACEME, 0, nullptr, nullptr) != 0 || raise(SIGSTOP) != 0))
                _exit(Failed);
            _exit(action());
        } catch (...) {
            _exit(Failed);
        }
    }

    void wait()
    {
        if (waitpid(id_, &state_, 0) != id_)
            throw std::runtime_error("a process has gone astray");
    }
    bool isRunning() const { return WIFSTOPPED(state_); }
    int status() const { return WIFEXITED(state_) ? WEXITSTATUS(state_) : -1; }

    pid_t id_;
    int state_ = 0x7f; // stopped, as far as is known
};

} // namespace cadrel::tests
