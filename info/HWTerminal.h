// A character terminal with a phosphor look: text is typed onto a grid of cells at a set number of
// characters per second, each fresh character glows in a bright colour and fades over a few frames
// to the settled text colour, over a black background with dark scan lines on every odd pixel row.
//
// Clients never draw into it: the HWT... operations append characters and control codes to a
// command buffer and return at once; the "Terminal Thread" consumes the buffer at the set pace,
// keeps the grid, renders it into the terminal's 8-bit bitmap with the bitmap font, and hands the
// finished frame to the GUI thread, which paints it.
//
// Threads and locks.
// - fCommandLock guards the command buffer (cmdMemory, readPos, writePos). It is held only while
//   bytes are appended or taken out, never while the thread sleeps or renders, so appending never
//   waits on rendering. The terminal thread rewinds both positions to 0 under it when it finds the
//   buffer used up, and clears or sets `done` under it too, so that no append is ever missed.
// - fRenderLock (recursive) guards what the terminal thread owns while it runs: the grid, the
//   intensities, the cursor, the colours, colorTable, the palette indices, the font metrics and the
//   bitmap's pixels. The thread holds it while it takes and executes a command (from its first
//   byte to its last parameter, so that a purge, which takes it as well, falls between
//   commands), fades and renders (never while it sleeps); the setters take it, so
//   SetCharacterColors and friends may be called from the GUI thread while the thread runs. It is
//   recursive because a subclass's RenderBackground runs under it and may call the setters and
//   accessors itself. Order: fRenderLock before fCommandLock, never the other way.
// - fFrames hands finished frames to the GUI thread (giving up on a frame whose hand-over waits
//   for more than 0.1 s); the GUI thread paints the newest one.
// - The delays, followLength, `done` and `running` are relaxed atomics read without a lock.
#pragma once

#include "platform/BRect.h"
#include "platform/Kernel.h"
#include "platform/ThreadPark.h"
#include "platform/qt/FrameHandOver.h"
#include "render/ColorTypes.h"
#include "render/RBMFont8.h"
#include "render/RBitmap8.h"

#include <QImage>
#include <QWidget>
#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <mutex>
#include <thread>
#include <vector>

class HWTerminal : public QWidget {
public:
    // The bytes of the command stream that are not characters to print.
    enum : uint8_t {
        kCmdNull = 0,
        kCmdBackspace = 8,
        kCmdTab = 9,
        kCmdNewLine = 10,
        kCmdVerticalTab = 11,
        kCmdReturn = 13,
        kCmdMoveTo = 128, // column, row
        kCmdClearTerminal = 129,
        kCmdClearRow = 130, // row, column
        kCmdCPS = 131, // characters per second
        kCmdCharColor = 132, // new r, g, b, old r, g, b
        kCmdTermColor = 133, // lines r, g, b, back r, g, b
        kCmdPause = 134, // seconds
        kCmdNop = 135,
    };
    static constexpr int32_t kCommandBufferSize = 32000; // bytes
    static constexpr int32_t kLeftMargin = 2; // pixels

    // A grid of cols x rows cells; the bitmap covers frame, and so does the widget.
    HWTerminal(
        BRect frame, const char* name, int32_t cols, int32_t rows, QWidget* parent = nullptr);
    // Stops the terminal thread if it still runs. The font is not owned.
    ~HWTerminal() override;

    // Starts the "Terminal Thread"; the widget does it itself when it is first shown. Does
    // nothing while the thread runs.
    void AttachedToWindow();
    // Stops the thread and waits for it to end; the grid and the pending commands stay, and a new
    // AttachedToWindow starts a new thread. Does nothing when no thread runs. A subclass's
    // destructor calls it first, since the thread calls the subclass's RenderBackground.
    void DetachedFromWindow();

    // Settings. The font must be set before the thread runs and outlive the terminal.
    void SetBMFont(RBMFont8* font);
    // None of the three rates may be zero.
    void SetCPS(long cps);
    void SetFPS(long fps);
    void SetColorDecayRate(long rate);
    void SetFollowLength(uint8_t length);
    void SetCharacterColors(rgb_color newColor, rgb_color oldColor);
    void SetTerminalColors(rgb_color lines, rgb_color back);

    // Appending commands: each returns at once, clears `done` and wakes an idle thread. What does
    // not fit into the buffer's 32000 bytes is lost.
    void AddCommand(const uint8_t* bytes, int32_t length);
    void HWTPrintChar(char c);
    // The first min(strlen(text), length) bytes, or all of text when length is -1.
    void HWTPrintString(const char* text, int32_t length = -1);
    // count character times of nothing, each its own append.
    void HWTPrintNullString(int32_t count);
    void HWTMoveTo(uint8_t row, uint8_t col);
    void HWTClearTerminal();
    void HWTClearRow(uint8_t row, uint8_t col);
    void HWTCPS(uint8_t cps);
    void HWTSetCharColor(rgb_color newColor, rgb_color oldColor);
    void HWTSetTermColor(rgb_color lines, rgb_color back);
    // Drops everything not yet executed; what is shown stays. Waits for a command the thread is
    // in the middle of (and a frame it is rendering) to finish.
    void HWTPurgeBuffer();
    // Whether the thread found the buffer empty since the last append.
    bool HWTIsDone() const { return done.load(std::memory_order_relaxed); }

    // The terminal thread's steps; public so that tests drive them without the thread (while it
    // does not run). PrintToTerminal executes up to count commands and returns how many it did.
    int32_t PrintToTerminal(int32_t count);
    // Takes the next command byte; true (and both positions rewound to 0) when there is none.
    bool TGetParam(uint8_t& byte);
    // Lowers every intensity by amount, stopping at 0; true when all were 0 already.
    bool Fade(int32_t amount);
    void TNextCol();
    void TNextRow();
    void TMoveTo(int32_t row, int32_t col);
    void TScroll(int32_t lines);
    void BuildColorTable();
    void RenderTerminal();
    // Erases the bitmap to the background and draws the scan lines; runs under the render lock.
    virtual void RenderBackground();

    // For tests and subclasses (they take the render lock where they read what the thread owns).
    uint8_t CharAt(int32_t row, int32_t col) const;
    uint8_t IntensityAt(int32_t row, int32_t col) const;
    int32_t CursorRow() const;
    int32_t CursorCol() const;
    int32_t Cols() const { return cols; }
    int32_t Rows() const { return rows; }
    // The terminal's own bitmap; its pixels belong to the terminal thread while it runs.
    const RBitmap8* Bitmap() const { return bitmap; }
    // The palette index a cell of this intensity is drawn in.
    uint8_t ColorIndex(int32_t intensity) const;
    uint8_t LineIndex() const;
    uint8_t BackIndex() const;
    bool IsRunning() const { return running.load(std::memory_order_relaxed); }
    // True while the thread is idle, parked until the next append or the stop.
    bool IsSuspended() const { return fSuspended.load(); }
    int32_t FollowLength() const { return followLength.load(std::memory_order_relaxed); }
    bigtime_t CharDelay() const { return charDelay.load(std::memory_order_relaxed); }
    bigtime_t FrameDelay() const { return frameDelay.load(std::memory_order_relaxed); }
    bigtime_t DecayDelay() const { return decayDelay.load(std::memory_order_relaxed); }
    // Bytes appended and not yet executed.
    int32_t PendingBytes() const;
    // Processor time the terminal thread has used so far (microseconds), or -1 when none runs.
    bigtime_t ThreadCPUTime() const;
    // Frames the thread has handed to the GUI thread since it started.
    int64_t FramesShown() const { return fFrames.FramesHandedOver(); }
    // The last frame handed over, as painted (a copy); null before the first.
    QImage FrontImage() const { return fFrames.FrontImage(); }
    // Where finished frames are handed to the GUI thread; tests hold its lock.
    FrameHandOver& Frames() { return fFrames; }
    // The lock the terminal thread renders under, for subclasses whose RenderBackground reads
    // state of their own that the GUI thread changes.
    std::recursive_mutex& RenderLock() const { return fRenderLock; }
    // Replaces the sleep of the pause command (microseconds); for tests.
    void SetPauseHook(std::function<void(bigtime_t)> hook) { fPauseHook = std::move(hook); }

    static int32_t TermTEntryPoint(void* terminal);

protected:
    void paintEvent(QPaintEvent* event) override;
    void showEvent(QShowEvent* event) override;

private:
    int32_t TerminalLoop();
    // Appends bytes at writePos, as much as fits, then wakes the thread.
    void Append(const uint8_t* bytes, int32_t length);
    // Executes one command whose first byte is byte; false when a parameter byte was missing.
    bool Execute(uint8_t byte);
    void PrintCell(uint8_t byte);
    uint8_t IndexOf(rgb_color color) const;
    // Sleeps for up to microseconds, ending early when the thread is told to stop.
    void Nap(bigtime_t microseconds);

    // The terminal's state, fields in their long-standing order. Owned unless said otherwise.
    RBitmap8* bitmap; // over the frame
    std::atomic<bigtime_t> charDelay { 0 }; // microseconds, 1000000 / characters per second
    std::atomic<bigtime_t> frameDelay { 0 }; // microseconds, 1000000 / frames per second
    std::atomic<bigtime_t> decayDelay { 0 }; // microseconds, 1000000 / fade steps per second
    std::atomic<int32_t> followLength { 16 }; // fade steps of the trail
    rgb_color charColorNew {};
    rgb_color charColorOld {};
    rgb_color termColorLines {};
    rgb_color termColorBack {};
    uint8_t colorTable[256] {}; // palette index per trail intensity
    uint8_t lineIndex = 0;
    uint8_t backIndex = 0;
    RBMFontInfo fontInfo {};
    uint8_t* cmdMemory; // kCommandBufferSize bytes
    int32_t readPos = 0; // next byte to execute
    int32_t writePos = 0; // where the next command is appended
    uint8_t* chars; // cols x rows, row-major, 0 = empty
    uint8_t* intensity; // cols x rows
    int32_t cols;
    int32_t rows;
    int32_t cellCount;
    int32_t cursorRow = 0;
    int32_t cursorCol = 0;
    std::thread thread;
    std::atomic<bool> done { false };
    std::atomic<bool> running { false };

    RBMFont8* fFont = nullptr; // not owned
    mutable std::mutex fCommandLock;
    mutable std::recursive_mutex fRenderLock;
    ThreadPark fPark; // where the idle thread waits
    std::atomic<bool> fSuspended { false };
    std::mutex fNapLock; // with fNapEnd: lets a stop cut a sleep short
    std::condition_variable fNapEnd;
    std::function<void(bigtime_t)> fPauseHook;
    bool fShownOnce = false;

    FrameHandOver fFrames { this }; // finished frames on their way to the GUI thread
};
