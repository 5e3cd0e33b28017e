#include "support/Child.h"

#include <csignal>
#include <cstdio>
#include <sys/wait.h>
#include <unistd.h>

namespace {

constexpr unsigned kSecondsToLive = 20;

bool sIsChild = false;

// Whether or not the mask of the thread that forked lets it through.
void DieOfAlarm() {
    std::signal(SIGALRM, SIG_DFL);
    sigset_t alarms;
    sigemptyset(&alarms);
    sigaddset(&alarms, SIGALRM);
    pthread_sigmask(SIG_UNBLOCK, &alarms, nullptr);
    alarm(kSecondsToLive);
}

} // namespace

// Asked by the leak sanitizer as a process ends. What only the lost threads of the parent knew of is no leak of the child.
extern "C" int __lsan_is_turned_off() {
    return sIsChild;
}

namespace PKTest {

pid_t ForkChild() {
    std::fflush(stdout); // or the child might write what is in there once more
    const pid_t child = fork();
    if (child == 0) {
        sIsChild = true;
        DieOfAlarm();
    }
    return child;
}

int EndOf(pid_t child) {
    constexpr int kNoChild = 1000;
    int status = 0;
    if (child <= 0 || waitpid(child, &status, 0) != child) return kNoChild;
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

int EndOfChild(const std::function<int()>& work) {
    const pid_t child = ForkChild();
    if (child == 0) _exit(work());
    return EndOf(child);
}

} // namespace PKTest
