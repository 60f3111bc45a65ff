// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/base/Worker.h"

#include <android-base/unique_fd.h>
#include <poll.h>
#include <signal.h>
#include <sys/eventfd.h>
#include <sys/signalfd.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::base::unique_fd;

constexpr std::chrono::nanoseconds kLongestPoll = std::chrono::hours(1);

/** While the object lives, the signals that would kill the process wait until it takes them. */
class HeldSignals {
  public:
    HeldSignals() {
        sigemptyset(&mSignals);
        for (const int signal : {SIGINT, SIGTERM}) {
            struct sigaction action = {};
            sigaction(signal, nullptr, &action);
            if (action.sa_handler == SIG_DFL) sigaddset(&mSignals, signal);
        }
        pthread_sigmask(SIG_BLOCK, &mSignals, &mBefore);
        mFd.reset(signalfd(-1, &mSignals, SFD_CLOEXEC));
    }
    ~HeldSignals() { pthread_sigmask(SIG_SETMASK, &mBefore, nullptr); }
    HeldSignals(const HeldSignals&) = delete;
    HeldSignals& operator=(const HeldSignals&) = delete;

    /** Readable when a signal waits; -1 when there are no descriptors. */
    int fd() const { return mFd.get(); }

    int take() const {
        signalfd_siginfo signal = {};
        if (TEMP_FAILURE_RETRY(read(mFd.get(), &signal, sizeof(signal))) != sizeof(signal))
            return 0;
        return static_cast<int>(signal.ssi_signo);
    }

  private:
    sigset_t mSignals;
    sigset_t mBefore;
    unique_fd mFd;
};

void pollUntil(Clock::time_point wake, pollfd (&fds)[2]) {
    using namespace std::chrono;
    const Clock::time_point now = Clock::now();
    const nanoseconds rest =
            wake <= now ? nanoseconds(0) : std::min(wake, now + kLongestPoll) - now;
    const timespec timeout = {static_cast<time_t>(duration_cast<seconds>(rest).count()),
                              static_cast<long>((rest % seconds(1)).count())};
    for (pollfd& fd : fds) fd.revents = 0;
    ppoll(fds, 2, &timeout, nullptr);
}

Waited watch(const Worker& worker, const HeldSignals& signals, Clock::time_point deadline,
             const Progress& progress) {
    using End = Waited::End;
    const Clock::time_point start = Clock::now();
    pollfd fds[] = {{worker.fd(), POLLIN, 0}, {signals.fd(), POLLIN, 0}};
    for (long tick = 1;;) {
        const Clock::time_point next = start + tick * progress.interval;
        pollUntil(std::min(deadline, next), fds);
        if (fds[0].revents != 0) return {End::done};
        if (fds[1].revents != 0) return {End::interrupted, signals.take()};
        if (Clock::now() >= deadline) return {End::late};
        if (Clock::now() < next) continue;
        if (progress.tick) progress.tick(tick);
        ++tick;
    }
}

} // namespace

struct Worker::Task {
    std::function<void()> work;
    unique_fd done;
};

void* Worker::run(void* task) {
    const std::unique_ptr<std::shared_ptr<Task>> shared(static_cast<std::shared_ptr<Task>*>(task));
    (*shared)->work();
    eventfd_write((*shared)->done.get(), 1);
    return nullptr;
}

Worker::Worker(std::function<void()> work)
      : mTask(std::make_shared<Task>(
                Task{std::move(work), unique_fd(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))})) {
    if (mTask->done.get() == -1) {
        mError = errno;
        return;
    }
    auto task = std::make_unique<std::shared_ptr<Task>>(mTask);
    mError = pthread_create(&mThread, nullptr, run, task.get());
    mRuns = mError == 0;
    if (mRuns) static_cast<void>(task.release()); // the thread's from here on
}

Worker::~Worker() {
    if (mRuns) pthread_detach(mThread);
}

bool Worker::done() const {
    pollfd fd = {mTask->done.get(), POLLIN, 0};
    return poll(&fd, 1, 0) == 1;
}

int Worker::fd() const {
    return mTask->done.get();
}

void Worker::join() {
    pthread_join(mThread, nullptr);
    mRuns = false;
}

Waited waitFor(std::function<void()> work, Clock::time_point deadline, const Progress& progress) {
    const HeldSignals signals; // before the thread, which must not be the one that they reach
    if (signals.fd() == -1) return {Waited::End::notStarted, errno};
    Worker worker(std::move(work));
    if (worker.error() != 0) return {Waited::End::notStarted, worker.error()};
    const Waited waited = watch(worker, signals, deadline, progress);
    if (waited.end == Waited::End::done) worker.join();
    return waited;
}

} // namespace vendor::korvan::bex::wifi::client
