// Work that may take longer than the user should wait without a word: reading a large CSV drop,
// writing a large set out. It runs on a thread of its own while the window's thread goes on
// serving events; once half a second has passed a progress dialog over the window says what is
// going on and offers Cancel. Cancelled work runs to its end on its thread and its result is
// thrown away, so the work must own everything it touches (copies, shared pointers) except
// what outlives the window (the universe).
#pragma once

#include <QString>
#include <functional>
#include <thread>
#include <vector>

class QWidget;

class LongWork {
public:
    // The dialog's owner; not owned.
    explicit LongWork(QWidget* parent);
    // Waits for cancelled work still running.
    ~LongWork();
    LongWork(const LongWork&) = delete;
    LongWork& operator=(const LongWork&) = delete;

    // Runs work on a thread and returns once it is done (true) or the user cancelled it
    // (false). Meanwhile this thread runs its events; after showAfter milliseconds a progress
    // dialog labelled label stands over the parent, modal to it. Not reentrant: while it runs,
    // Busy() is true and the caller refuses new work.
    bool Run(const QString& label, std::function<void()> work);
    bool Busy() const { return fBusy; }

    // Milliseconds before the dialog shows; tests make it 0.
    static int showAfter;
    // Called on the work's thread before the work; tests hold the work there.
    static std::function<void()> beforeWork;

private:
    QWidget* fParent;
    bool fBusy = false;
    std::vector<std::thread> fCancelled; // threads of cancelled work, joined at the end
};
