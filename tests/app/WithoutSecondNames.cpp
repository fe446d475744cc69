// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/WithoutSecondNames.h"

#include "tests/support/TreePaths.h"

#include <cerrno>
#include <exception>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <stdexcept>
#include <sys/prctl.h>
#include <sys/syscall.h>
#include <thread>

namespace cadrel::tests {

namespace {

/// From now on the calls that give a file a second name fail in this thread and in the programs that it starts.
void refuseSecondNames()
{
    std::vector<unsigned int> calls{SYS_linkat};
#ifdef SYS_link
    calls.push_back(SYS_link);
#endif
    std::vector<sock_filter> filter{BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr))};
    for (const unsigned int call : calls) {
        filter.push_back(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, call, 0, 1));
        filter.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ERRNO | EPERM));
    }
    filter.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW));
    const sock_fprog program{static_cast<unsigned short>(filter.size()), filter.data()};
    if (prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) != 0 || prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &program) != 0)
        throw std::runtime_error("second names can't be refused");
}

} // namespace

Outcome runCadrelWithoutSecondNames(const std::vector<std::string>& arguments, std::size_t mostBytes)
{
    std::vector<std::string> words = arguments;
    std::string program = programPath("cadrel");
    if (mostBytes > 0) {
        words.insert(words.begin(), {"--fsize=" + std::to_string(mostBytes), program});
        program = "prlimit";
    }
    Outcome outcome;
    std::exception_ptr failure;
    // What a thread is refused stays refused, so this is for one of its own.
    std::thread thread([&] {
        try {
            refuseSecondNames();
            outcome = runProgram(program, words);
        } catch (...) {
            failure = std::current_exception();
        }
    });
    thread.join();
    if (failure)
        std::rethrow_exception(failure);
    return outcome;
}

} // namespace cadrel::tests
