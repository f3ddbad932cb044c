// HWTerminal: construction, the settings, appending to the command buffer, and reading the
// grid's state.
#include "info/HWTerminal.h"

#include "render/SystemPalette.h"
#include "widgets/WidgetGeometry.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

HWTerminal::HWTerminal(BRect frame, const char* name, int32_t cols, int32_t rows, QWidget* parent)
    : QWidget(parent)
    , bitmap(new RBitmap8(frame))
    , cmdMemory(static_cast<uint8_t*>(std::calloc(kCommandBufferSize, 1)))
    , chars(static_cast<uint8_t*>(std::calloc(size_t(std::max(cols * rows, 1)), 1)))
    , intensity(static_cast<uint8_t*>(std::calloc(size_t(std::max(cols * rows, 1)), 1)))
    , cols(cols)
    , rows(rows)
    , cellCount(cols * rows)
{
    PlaceWidget(this, frame, name);
    SetCPS(20);
    SetFPS(30);
    followLength = 16;
    // White characters fading to green over black with dark-green scan lines.
    SetTerminalColors(rgb_color { 0, 20, 0, 255 }, rgb_color { 0, 0, 0, 255 });
    SetCharacterColors(rgb_color { 255, 255, 255, 255 }, rgb_color { 0, 175, 0, 255 });
    SetColorDecayRate(30);
}

HWTerminal::~HWTerminal()
{
    DetachedFromWindow();
    std::free(chars);
    std::free(intensity);
    std::free(cmdMemory);
    delete bitmap;
}

// Settings

void HWTerminal::SetBMFont(RBMFont8* font)
{
    std::lock_guard lock(fRenderLock);
    fFont = font;
    bitmap->SetBMFont(font);
    if (font)
        font->GetFontInfo(&fontInfo);
    else
        fontInfo = RBMFontInfo {};
}

// A zero rate would divide by zero; it leaves the delay as it was.
void HWTerminal::SetCPS(long cps)
{
    if (cps != 0)
        charDelay.store(1000000 / bigtime_t(cps), std::memory_order_relaxed);
}

void HWTerminal::SetFPS(long fps)
{
    if (fps != 0)
        frameDelay.store(1000000 / bigtime_t(fps), std::memory_order_relaxed);
}

void HWTerminal::SetColorDecayRate(long rate)
{
    if (rate != 0)
        decayDelay.store(1000000 / bigtime_t(rate), std::memory_order_relaxed);
}

void HWTerminal::SetFollowLength(uint8_t length)
{
    std::lock_guard lock(fRenderLock);
    followLength.store(length, std::memory_order_relaxed);
    BuildColorTable();
}

void HWTerminal::SetCharacterColors(rgb_color newColor, rgb_color oldColor)
{
    std::lock_guard lock(fRenderLock);
    charColorNew = newColor;
    charColorOld = oldColor;
    BuildColorTable();
    RenderBackground();
}

void HWTerminal::SetTerminalColors(rgb_color lines, rgb_color back)
{
    std::lock_guard lock(fRenderLock);
    termColorLines = lines;
    termColorBack = back;
    lineIndex = IndexOf(lines);
    backIndex = IndexOf(back);
}

uint8_t HWTerminal::IndexOf(rgb_color color) const
{
    return system_colors()->index_map[IndexOf15(color.red, color.green, color.blue)];
}

// Appending commands

void HWTerminal::Append(const uint8_t* bytes, int32_t length)
{
    {
        std::lock_guard lock(fCommandLock);
        // The buffer is of fixed size: what does not fit is lost.
        const int32_t written = std::clamp(length, 0, kCommandBufferSize - writePos);
        if (written > 0)
            std::memcpy(cmdMemory + writePos, bytes, size_t(written));
        writePos += written;
        done.store(false, std::memory_order_relaxed);
    }
    fPark.Resume();
}

void HWTerminal::AddCommand(const uint8_t* bytes, int32_t length)
{
    Append(bytes, bytes ? length : 0);
}

void HWTerminal::HWTPrintChar(char c)
{
    const auto byte = static_cast<uint8_t>(c);
    Append(&byte, 1);
}

void HWTerminal::HWTPrintString(const char* text, int32_t length)
{
    if (!text)
        return;
    size_t count = std::strlen(text);
    if (length != -1)
        count = std::min(count, size_t(std::max(length, 0)));
    count = std::min(count, size_t(kCommandBufferSize));
    Append(reinterpret_cast<const uint8_t*>(text), int32_t(count));
}

void HWTerminal::HWTPrintNullString(int32_t count)
{
    const uint8_t null = kCmdNull;
    for (int32_t i = 0; i < count; i++)
        Append(&null, 1);
}

void HWTerminal::HWTMoveTo(uint8_t row, uint8_t col)
{
    // The column comes first in the stream.
    const uint8_t bytes[] = { kCmdMoveTo, col, row };
    Append(bytes, sizeof bytes);
}

void HWTerminal::HWTClearTerminal()
{
    const uint8_t byte = kCmdClearTerminal;
    Append(&byte, 1);
}

void HWTerminal::HWTClearRow(uint8_t row, uint8_t col)
{
    const uint8_t bytes[] = { kCmdClearRow, row, col };
    Append(bytes, sizeof bytes);
}

void HWTerminal::HWTCPS(uint8_t cps)
{
    const uint8_t bytes[] = { kCmdCPS, cps };
    Append(bytes, sizeof bytes);
}

void HWTerminal::HWTSetCharColor(rgb_color newColor, rgb_color oldColor)
{
    const uint8_t bytes[] = { kCmdCharColor, newColor.red, newColor.green, newColor.blue,
        oldColor.red, oldColor.green, oldColor.blue };
    Append(bytes, sizeof bytes);
}

void HWTerminal::HWTSetTermColor(rgb_color lines, rgb_color back)
{
    const uint8_t bytes[]
        = { kCmdTermColor, lines.red, lines.green, lines.blue, back.red, back.green, back.blue };
    Append(bytes, sizeof bytes);
}

void HWTerminal::HWTPurgeBuffer()
{
    // Between commands only: the thread holds the render lock from a command's first byte to
    // its last parameter. In the lock order, render before command.
    std::lock_guard render(fRenderLock);
    std::lock_guard lock(fCommandLock);
    readPos = 0;
    writePos = 0;
}

int32_t HWTerminal::PendingBytes() const
{
    std::lock_guard lock(fCommandLock);
    return writePos - readPos;
}

// Reading the state

uint8_t HWTerminal::CharAt(int32_t row, int32_t col) const
{
    std::lock_guard lock(fRenderLock);
    if (row < 0 || row >= rows || col < 0 || col >= cols)
        return 0;
    return chars[row * cols + col];
}

uint8_t HWTerminal::IntensityAt(int32_t row, int32_t col) const
{
    std::lock_guard lock(fRenderLock);
    if (row < 0 || row >= rows || col < 0 || col >= cols)
        return 0;
    return intensity[row * cols + col];
}

int32_t HWTerminal::CursorRow() const
{
    std::lock_guard lock(fRenderLock);
    return cursorRow;
}

int32_t HWTerminal::CursorCol() const
{
    std::lock_guard lock(fRenderLock);
    return cursorCol;
}

uint8_t HWTerminal::ColorIndex(int32_t level) const
{
    std::lock_guard lock(fRenderLock);
    return colorTable[std::clamp(level, 0, 255)];
}

uint8_t HWTerminal::LineIndex() const
{
    std::lock_guard lock(fRenderLock);
    return lineIndex;
}

uint8_t HWTerminal::BackIndex() const
{
    std::lock_guard lock(fRenderLock);
    return backIndex;
}
