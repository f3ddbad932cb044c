// HWTerminal on the terminal thread's side: executing the commands, moving the cursor, fading
// the trails, building the trail colours and rendering the grid.
#include "info/HWTerminal.h"

#include "render/SystemPalette.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

// Executing commands

bool HWTerminal::TGetParam(uint8_t& byte)
{
    std::lock_guard lock(fCommandLock);
    if (readPos >= writePos) {
        readPos = 0;
        writePos = 0;
        return true;
    }
    byte = cmdMemory[readPos++];
    return false;
}

int32_t HWTerminal::PrintToTerminal(int32_t count)
{
    int32_t executed = 0;
    if (count <= 0)
        return executed;
    // Running out of bytes rewinds the buffer (TGetParam); so does a missing parameter byte,
    // which loses the partial command and ends the batch.
    for (;;) {
        bigtime_t pause = -1;
        {
            // A command is taken whole, its first byte and its parameters, under the render
            // lock: a purge, which takes it too, cannot fall between them and leave the rest of
            // the command to be read from whatever is appended after the purge.
            std::lock_guard lock(fRenderLock);
            uint8_t byte;
            if (TGetParam(byte))
                return executed;
            if (byte == kCmdPause) {
                uint8_t seconds;
                if (TGetParam(seconds))
                    return executed;
                pause = bigtime_t(seconds) * 1000000;
            } else if (!Execute(byte)) {
                return executed;
            }
        }
        // Slept without the render lock, so that the settings stay free meanwhile.
        if (pause >= 0) {
            if (fPauseHook)
                fPauseHook(pause);
            else
                Nap(pause);
        }
        if (++executed == count)
            return executed;
    }
}

bool HWTerminal::Execute(uint8_t byte)
{
    switch (byte) {
    case kCmdNull:
    case kCmdNop:
        return true;
    case kCmdBackspace:
        TMoveTo(cursorRow, cursorCol - 1);
        return true;
    case kCmdTab:
        TMoveTo(cursorRow, (cursorCol / 4) * 4 + 4);
        return true;
    case kCmdNewLine:
    case kCmdReturn:
        TNextRow();
        return true;
    case kCmdVerticalTab:
        TMoveTo(cursorRow + 4, 0);
        return true;
    case kCmdMoveTo: {
        uint8_t col, row;
        if (TGetParam(col) || TGetParam(row))
            return false;
        TMoveTo(row, col);
        return true;
    }
    case kCmdClearTerminal:
        std::memset(chars, 0, size_t(cellCount));
        std::memset(intensity, 0, size_t(cellCount));
        cursorRow = 0;
        cursorCol = 0;
        return true;
    case kCmdClearRow: {
        uint8_t row, col;
        if (TGetParam(row) || TGetParam(col))
            return false;
        const int32_t end = std::min(row * cols + cols, cellCount);
        for (int32_t cell = row * cols + col; cell < end; cell++) {
            chars[cell] = 0;
            intensity[cell] = 0;
        }
        return true;
    }
    case kCmdCPS: {
        uint8_t cps;
        if (TGetParam(cps))
            return false;
        SetCPS(cps);
        return true;
    }
    case kCmdCharColor:
    case kCmdTermColor: {
        uint8_t c[6];
        for (uint8_t& component : c) {
            if (TGetParam(component))
                return false;
        }
        // The alpha channels stay as they were.
        if (byte == kCmdCharColor) {
            charColorNew.red = c[0], charColorNew.green = c[1], charColorNew.blue = c[2];
            charColorOld.red = c[3], charColorOld.green = c[4], charColorOld.blue = c[5];
            BuildColorTable();
            RenderBackground();
        } else {
            termColorLines.red = c[0], termColorLines.green = c[1], termColorLines.blue = c[2];
            termColorBack.red = c[3], termColorBack.green = c[4], termColorBack.blue = c[5];
            lineIndex = IndexOf(termColorLines);
            backIndex = IndexOf(termColorBack);
        }
        return true;
    }
    default:
        PrintCell(byte);
        return true;
    }
}

void HWTerminal::PrintCell(uint8_t byte)
{
    const int32_t cell = cursorRow * cols + cursorCol;
    if (cell >= 0 && cell < cellCount) {
        chars[cell] = byte;
        intensity[cell] = uint8_t(followLength.load(std::memory_order_relaxed) + 1);
    }
    TNextCol();
}

// Cursor movement

void HWTerminal::TNextCol()
{
    std::lock_guard lock(fRenderLock);
    if (++cursorCol >= cols)
        TNextRow();
}

void HWTerminal::TNextRow()
{
    std::lock_guard lock(fRenderLock);
    cursorCol = 0;
    if (cursorRow >= rows - 1)
        TScroll(1);
    else
        cursorRow++;
}

void HWTerminal::TMoveTo(int32_t row, int32_t col)
{
    std::lock_guard lock(fRenderLock);
    if (col >= cols) {
        row += col / cols;
        col %= cols;
    } else if (col < 0) {
        col = 0;
    }
    if (row >= rows) {
        TScroll(row - rows + 1);
        row = rows - 1;
    } else if (row < 0) {
        row = 0;
    }
    cursorRow = row;
    cursorCol = col;
}

void HWTerminal::TScroll(int32_t lines)
{
    std::lock_guard lock(fRenderLock);
    // The bottom rows keep what they held until they are written over.
    if (lines <= 0 || lines >= rows)
        return;
    const size_t moved = size_t(rows - lines) * size_t(cols);
    std::memmove(chars, chars + lines * cols, moved);
    std::memmove(intensity, intensity + lines * cols, moved);
}

// Fading and the trail colours

bool HWTerminal::Fade(int32_t amount)
{
    std::lock_guard lock(fRenderLock);
    bool allFaded = true;
    for (int32_t cell = 0; cell < cellCount; cell++) {
        if (intensity[cell] > 0) {
            allFaded = false;
            intensity[cell] = uint8_t(std::max(int32_t(intensity[cell]) - amount, 0));
        }
    }
    return allFaded;
}

void HWTerminal::BuildColorTable()
{
    std::lock_guard lock(fRenderLock);
    const int32_t n = followLength.load(std::memory_order_relaxed);
    const rgb_color a = charColorNew;
    const rgb_color b = charColorOld;
    // A character just typed starts at n + 1: from n up it shows the new colour.
    std::fill(colorTable + std::max(n, 0), colorTable + 256, IndexOf(a));
    if (n > 0) {
        long double red = a.red, green = a.green, blue = a.blue;
        const long double stepRed = (long double)(a.red - b.red) / n;
        const long double stepGreen = (long double)(a.green - b.green) / n;
        const long double stepBlue = (long double)(a.blue - b.blue) / n;
        for (int32_t i = n - 1; i >= 1; i--) {
            colorTable[i] = system_colors()->index_map[IndexOf15(
                uint8_t(int32_t(red)), uint8_t(int32_t(green)), uint8_t(int32_t(blue)))];
            red -= stepRed;
            green -= stepGreen;
            blue -= stepBlue;
        }
    }
    colorTable[0] = IndexOf(b);
}

// Rendering

void HWTerminal::RenderTerminal()
{
    std::lock_guard lock(fRenderLock);
    RenderBackground();
    int32_t x = kLeftMargin;
    int32_t y = fontInfo.charHeight + 1;
    const uint8_t* cell = chars;
    const uint8_t* glow = intensity;
    for (int32_t row = 0; row < rows; row++) {
        for (int32_t col = 0; col < cols; col++, cell++, glow++) {
            if (*cell)
                bitmap->RenderChar(kLeftMargin, x, y, char(*cell), colorTable[*glow]);
            else
                x += fontInfo.charWidth;
        }
        x = kLeftMargin;
        y += fontInfo.charHeight;
    }
}

void HWTerminal::RenderBackground()
{
    std::lock_guard lock(fRenderLock);
    bitmap->EraseMap(backIndex);
    for (int32_t y = 1; y < bitmap->Height(); y += 2)
        bitmap->RenderHLine(0, y, bitmap->Width(), lineIndex);
}
