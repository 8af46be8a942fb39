// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Tells the thread sanitizer how a task comes from the thread that starts it to the pool's thread that runs
// it. The toolkit's library is not instrumented: without this every task object looks like a race, and a
// suppression for it would hide what the task itself does. Linked into a test, this QThreadPool::start()
// stands before the library's.
#include <QRunnable>
#include <QThreadPool>

#include <dlfcn.h>
#include <sanitizer/tsan_interface.h>

namespace {

// Takes the task over on the pool's thread; the pool deletes this, and this the task where the pool would
// have.
class HandedOver : public QRunnable {
public:
    explicit HandedOver(QRunnable* started) : task(started) { __tsan_release(this); }
    void run() override {
        __tsan_acquire(this);
        const bool own = task->autoDelete();
        task->run();
        if (own)
            delete task;
    }

private:
    QRunnable* task;
};

}  // namespace

void QThreadPool::start(QRunnable* task, int priority) {
    using Start = void (*)(QThreadPool*, QRunnable*, int);
    static const auto library_start = reinterpret_cast<Start>(dlsym(RTLD_NEXT, "_ZN11QThreadPool5startEP9QRunnablei"));
    if (library_start == nullptr)
        qFatal("the toolkit's library has no QThreadPool::start(QRunnable*, int)");
    library_start(this, new HandedOver(task), priority);
}
