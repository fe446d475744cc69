// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cerrno>
#include <csignal>
#include <cstddef>
#include <cstdint>
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

    /// How far a process came.
    struct Progress {
        std::optional<int> status; ///< nothing when it was killed
        bool hasRenamed = false;   ///< a file, with success
    };

    /// Kills it, as a failing machine would, at its `step`-th crossing of the border to the system: at the
    /// odd ones a call is about to be made, at the even ones it has just been made.
    template <class Action>
    static Progress runUnlessKilledAt(int step, Action action)
    {
        Progress progress;
        ChildProcess child(action, true);
        child.wait();
        // Or the system doesn't tell a call from a signal.
        ptrace(PTRACE_SETOPTIONS, child.m_id, nullptr, PTRACE_O_TRACESYSGOOD);
        bool isRenaming = false;
        for (int crossing = 1; child.isRunning(); ++crossing) {
            ptrace(PTRACE_SYSCALL, child.m_id, nullptr, nullptr);
            child.wait();
            if (!child.isRunning())
                break;
            const __ptrace_syscall_info call = child.currentCall();
            if (call.op == PTRACE_SYSCALL_INFO_ENTRY)
                isRenaming = isRenameCall(call.entry.nr);
            else if (call.op == PTRACE_SYSCALL_INFO_EXIT)
                progress.hasRenamed = progress.hasRenamed || (isRenaming && !call.exit.is_error);
            if (crossing == step) {
                kill(child.m_id, SIGKILL);
                child.wait();
                return progress;
            }
        }
        progress.status = child.status();
        return progress;
    }

private:
    template <class Action>
    ChildProcess(Action action, bool isTraced) : m_id(fork())
    {
        if (m_id < 0)
            throw std::runtime_error("can't make a process");
        if (m_id > 0)
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

    static bool isRenameCall(std::uint64_t number)
    {
#ifdef SYS_rename
        if (number == SYS_rename) // newer kinds of machine have it no more
            return true;
#endif
        return number == SYS_renameat || number == SYS_renameat2;
    }

    /// The one at whose border it stands.
    __ptrace_syscall_info currentCall() const
    {
        __ptrace_syscall_info call{};
        if (ptrace(PTRACE_GET_SYSCALL_INFO, m_id, sizeof call, &call) <= 0)
            throw std::runtime_error("the system doesn't tell what a process calls");
        return call;
    }

    void wait()
    {
        if (waitpid(m_id, &m_state, 0) != m_id)
            throw std::runtime_error("a process has gone astray");
    }
    bool isRunning() const
    {
        return WIFSTOPPED(m_state);
    }
    int status() const
    {
        return WIFEXITED(m_state) ? WEXITSTATUS(m_state) : -1;
    }

    pid_t m_id;
    int m_state = 0x7f; // stopped, as far as is known
};

} // namespace cadrel::tests
