// The phosphor terminal: the command stream and its parsing, the cursor rules, the trail colours,
// fading, rendering into the bitmap, the command buffer's limits, and the terminal thread (typing,
// idling without processor time, waking on appends, stopping).
//
// Everything but the thread tests drives the thread's steps directly on a terminal that is never
// shown, so no thread runs and nothing waits.
#include "info/HWTerminal.h"

#include "core/MessageCodes.h"
#include "render/SystemPalette.h"
#include "resources/ResourceData.h"

#include "ShownPixels.h"

#include <QTest>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <gtest/gtest.h>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

namespace {

uint8_t PaletteIndex(rgb_color color)
{
    return system_colors()->index_map[IndexOf15(color.red, color.green, color.blue)];
}

uint8_t PaletteIndex(int red, int green, int blue)
{
    return PaletteIndex(rgb_color { uint8_t(red), uint8_t(green), uint8_t(blue), 255 });
}

constexpr rgb_color kWhite { 255, 255, 255, 255 };
constexpr rgb_color kGreen { 0, 175, 0, 255 };

class HWTerminalTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SetUp() override { terminal = Make(40, 10); }

    std::unique_ptr<HWTerminal> Make(int32_t cols, int32_t rows)
    {
        // Room for the grid and its margin: 7 x 14 cells from (2, 2).
        const float width = float(2 + cols * kSystemFontCharWidth + 8);
        const float height = float(2 + rows * kSystemFontCharHeight + 6);
        auto made = std::make_unique<HWTerminal>(
            BRect(0, 0, width - 1, height - 1), "terminal", cols, rows);
        made->SetBMFont(&font);
        return made;
    }

    // Everything appended so far, executed as one batch.
    int32_t Run(HWTerminal& on) { return on.PrintToTerminal(1000000); }
    int32_t Run() { return Run(*terminal); }

    std::string Row(int32_t row, int32_t from = 0, int32_t to = -1) const
    {
        std::string text;
        for (int32_t col = from; col < (to < 0 ? terminal->Cols() : to); col++)
            text += terminal->CharAt(row, col) ? char(terminal->CharAt(row, col)) : '.';
        return text;
    }

    // A whole row as Row reads it: text from column 0, the rest empty.
    std::string RowWith(const std::string& text) const
    {
        return text + std::string(size_t(terminal->Cols()) - text.size(), '.');
    }

    uint8_t Pixel(int32_t x, int32_t y) const
    {
        const RBitmap8* bitmap = terminal->Bitmap();
        return bitmap->Bits()[y * bitmap->BytesPerRow() + x];
    }

    // Whether the glyph of c has ink at (i, j) of its cell.
    bool Ink(char c, int32_t i, int32_t j) const
    {
        return font.GlyphBits(c)[j * font.StripBytesPerRow() + i] == 255;
    }

    // Checks the cell at (row, col) pixel by pixel: ink of c in index, the rest background.
    void ExpectCell(int32_t row, int32_t col, char c, uint8_t index) const
    {
        const int32_t left = 2 + col * kSystemFontCharWidth;
        const int32_t top = 2 + row * kSystemFontCharHeight;
        for (int32_t j = 0; j < kSystemFontCharHeight; j++) {
            for (int32_t i = 0; i < kSystemFontCharWidth; i++) {
                const int32_t y = top + j;
                const uint8_t expected = Ink(c, i, j)
                    ? index
                    : (y % 2 ? terminal->LineIndex() : terminal->BackIndex());
                ASSERT_EQ(Pixel(left + i, y), expected)
                    << "cell (" << row << ", " << col << ") pixel (" << i << ", " << j << ")";
            }
        }
    }

    RBMFont8 font { int32_t(kFontType), kSystemFontId, kSystemFontStripWidth, kSystemFontCharHeight,
        kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar };
    std::unique_ptr<HWTerminal> terminal;
};

// Construction and settings

TEST_F(HWTerminalTest, DefaultsAreTwentyCharactersThirtyFramesAndAGreenPhosphor)
{
    EXPECT_EQ(terminal->CharDelay(), 50000);
    EXPECT_EQ(terminal->FrameDelay(), 33333);
    EXPECT_EQ(terminal->DecayDelay(), 33333);
    EXPECT_EQ(terminal->FollowLength(), 16);
    EXPECT_EQ(terminal->Cols(), 40);
    EXPECT_EQ(terminal->Rows(), 10);
    EXPECT_EQ(terminal->CursorRow(), 0);
    EXPECT_EQ(terminal->CursorCol(), 0);
    EXPECT_EQ(terminal->LineIndex(), PaletteIndex(0, 20, 0));
    EXPECT_EQ(terminal->BackIndex(), PaletteIndex(0, 0, 0));
    EXPECT_EQ(terminal->ColorIndex(0), PaletteIndex(kGreen));
    EXPECT_EQ(terminal->ColorIndex(15), PaletteIndex(kWhite));
    EXPECT_FALSE(terminal->IsRunning());
    EXPECT_FALSE(terminal->HWTIsDone());
    EXPECT_EQ(terminal->PendingBytes(), 0);
    EXPECT_EQ(terminal->Bitmap()->Width(), 2 + 40 * 7 + 8);
    EXPECT_EQ(terminal->objectName(), QString("terminal"));
    for (int32_t row = 0; row < 10; row++)
        EXPECT_EQ(Row(row), std::string(40, '.'));
}

TEST_F(HWTerminalTest, RatesBecomeDelaysInMicroseconds)
{
    terminal->SetCPS(7);
    terminal->SetFPS(60);
    terminal->SetColorDecayRate(3);
    EXPECT_EQ(terminal->CharDelay(), 142857);
    EXPECT_EQ(terminal->FrameDelay(), 16666);
    EXPECT_EQ(terminal->DecayDelay(), 333333);
    // A zero would divide by zero: it is ignored.
    terminal->SetCPS(0);
    EXPECT_EQ(terminal->CharDelay(), 142857);
}

// Printing and the cursor

TEST_F(HWTerminalTest, PrintStringTakesTheGivenLengthOrTheWholeString)
{
    terminal->HWTPrintString("abc", 2);
    EXPECT_EQ(terminal->PendingBytes(), 2);
    EXPECT_EQ(Run(), 2);
    EXPECT_EQ(Row(0, 0, 4), "ab..");
    terminal->HWTPrintString("abc", -1);
    EXPECT_EQ(Run(), 3);
    EXPECT_EQ(Row(0, 0, 6), "ababc.");
    // A length beyond the string stops at its end.
    terminal->HWTPrintString("xy", 10);
    EXPECT_EQ(Run(), 2);
    EXPECT_EQ(Row(0, 0, 8), "ababcxy.");
    EXPECT_EQ(terminal->CursorCol(), 7);
}

TEST_F(HWTerminalTest, PrintToTerminalExecutesAtMostCountCommands)
{
    terminal->HWTPrintString("hello");
    EXPECT_EQ(terminal->PrintToTerminal(3), 3);
    EXPECT_EQ(Row(0, 0, 6), "hel...");
    EXPECT_EQ(terminal->PendingBytes(), 2);
    EXPECT_EQ(terminal->PrintToTerminal(3), 2);
    EXPECT_EQ(Row(0, 0, 6), "hello.");
    EXPECT_EQ(terminal->PrintToTerminal(3), 0);
}

TEST_F(HWTerminalTest, PrintingPastTheLastColumnWrapsAndTheLastRowScrollsByOne)
{
    terminal = Make(4, 3);
    terminal->HWTPrintString("abcde");
    Run();
    EXPECT_EQ(Row(0), "abcd");
    EXPECT_EQ(Row(1), "e...");
    EXPECT_EQ(terminal->CursorRow(), 1);
    EXPECT_EQ(terminal->CursorCol(), 1);

    terminal->HWTPrintString("fghijkl");
    Run();
    EXPECT_EQ(Row(2), "ijkl");
    // The last cell of the last row was written: the cursor wrapped and the grid scrolled.
    EXPECT_EQ(terminal->CursorRow(), 2);
    EXPECT_EQ(terminal->CursorCol(), 0);
    EXPECT_EQ(Row(0), "efgh");
    EXPECT_EQ(Row(1), "ijkl");
    // The new bottom row still shows the old bottom row until it is written over.
    EXPECT_EQ(Row(2), "ijkl");
    EXPECT_EQ(terminal->IntensityAt(2, 3), terminal->IntensityAt(1, 3));
    terminal->HWTPrintString("mn");
    Run();
    EXPECT_EQ(Row(2), "mnkl");
}

TEST_F(HWTerminalTest, TabGoesToTheNextMultipleOfFour)
{
    terminal->HWTMoveTo(0, 5);
    terminal->HWTPrintChar('\t');
    Run();
    EXPECT_EQ(terminal->CursorCol(), 8);
    terminal->HWTPrintChar('\t');
    Run();
    EXPECT_EQ(terminal->CursorCol(), 12);
    terminal->HWTMoveTo(0, 0);
    terminal->HWTPrintChar('\t');
    Run();
    EXPECT_EQ(terminal->CursorCol(), 4);
    // From the last stop the tab wraps to the next row.
    terminal->HWTMoveTo(2, 38);
    terminal->HWTPrintChar('\t');
    Run();
    EXPECT_EQ(terminal->CursorRow(), 3);
    EXPECT_EQ(terminal->CursorCol(), 0);
    EXPECT_EQ(Row(0), std::string(40, '.'));
}

TEST_F(HWTerminalTest, MoveToTakesTheColumnBeforeTheRowAndWrapsLongColumns)
{
    terminal->HWTMoveTo(3, 100);
    Run();
    EXPECT_EQ(terminal->CursorRow(), 5);
    EXPECT_EQ(terminal->CursorCol(), 20);

    const uint8_t move[] = { HWTerminal::kCmdMoveTo, 7, 2 }; // column 7, row 2
    terminal->AddCommand(move, sizeof move);
    terminal->HWTPrintChar('x');
    EXPECT_EQ(Run(), 2);
    EXPECT_EQ(terminal->CharAt(2, 7), 'x');
}

TEST_F(HWTerminalTest, MovingBelowTheLastRowScrollsAndClampsToIt)
{
    terminal->HWTPrintString("top");
    terminal->HWTMoveTo(1, 0);
    terminal->HWTPrintString("second");
    terminal->HWTMoveTo(11, 3); // two rows below the last
    Run();
    EXPECT_EQ(terminal->CursorRow(), 9);
    EXPECT_EQ(terminal->CursorCol(), 3);
    // Scrolled by two: the second row went off the top.
    EXPECT_EQ(Row(0, 0, 6), "......");
    for (int32_t row = 0; row < 10; row++)
        EXPECT_EQ(Row(row).find("second"), std::string::npos) << row;

    // Direct moves: negative rows and columns stop at 0.
    terminal->TMoveTo(-3, -8);
    EXPECT_EQ(terminal->CursorRow(), 0);
    EXPECT_EQ(terminal->CursorCol(), 0);
}

TEST_F(HWTerminalTest, ScrollCopiesRowsUpAndLeavesTheBottomRows)
{
    terminal = Make(3, 4);
    terminal->HWTPrintString("aaabbbcccdd");
    Run();
    terminal->TScroll(2);
    EXPECT_EQ(Row(0), "ccc");
    EXPECT_EQ(Row(1), "dd.");
    EXPECT_EQ(Row(2), "ccc");
    EXPECT_EQ(Row(3), "dd.");
    // Scrolling the whole grid or more does nothing.
    terminal->TScroll(4);
    EXPECT_EQ(Row(0), "ccc");
    EXPECT_EQ(Row(1), "dd.");
    EXPECT_EQ(Row(3), "dd.");
}

TEST_F(HWTerminalTest, ClearRowClearsFromTheColumnToTheEndAndLeavesTheCursor)
{
    for (int32_t row = 0; row < 4; row++)
        terminal->HWTPrintString("0123456789012345678901234567890123456789");
    terminal->HWTMoveTo(6, 3);
    terminal->HWTClearRow(2, 10);
    Run();
    EXPECT_EQ(Row(2), "0123456789..............................");
    EXPECT_EQ(terminal->IntensityAt(2, 10), 0);
    EXPECT_EQ(terminal->IntensityAt(2, 9), 17);
    EXPECT_EQ(Row(1), "0123456789012345678901234567890123456789");
    EXPECT_EQ(Row(3), "0123456789012345678901234567890123456789");
    EXPECT_EQ(terminal->CursorRow(), 6);
    EXPECT_EQ(terminal->CursorCol(), 3);
}

TEST_F(HWTerminalTest, ClearRowNeverReachesPastTheGrid)
{
    terminal = Make(4, 2);
    terminal->HWTPrintString("abcdefg");
    terminal->HWTClearRow(1, 200); // a column beyond the row
    terminal->HWTClearRow(5, 0); // a row beyond the grid
    Run();
    EXPECT_EQ(Row(0), "abcd");
    EXPECT_EQ(Row(1), "efg.");
    terminal->HWTClearRow(1, 1);
    Run();
    EXPECT_EQ(Row(1), "e...");
    EXPECT_EQ(Row(0), "abcd");
}

// The rest of the command table

TEST_F(HWTerminalTest, NullTakesOneCommandAndDoesNothing)
{
    terminal->HWTPrintNullString(3);
    EXPECT_EQ(terminal->PendingBytes(), 3);
    terminal->HWTPrintChar('z');
    EXPECT_EQ(terminal->PrintToTerminal(3), 3);
    EXPECT_EQ(terminal->CharAt(0, 0), 0);
    EXPECT_EQ(terminal->CursorCol(), 0);
    EXPECT_EQ(terminal->PrintToTerminal(3), 1);
    EXPECT_EQ(terminal->CharAt(0, 0), 'z');
}

TEST_F(HWTerminalTest, BackspaceNewLinesAndVerticalTab)
{
    terminal->HWTPrintString("ab\bc");
    Run();
    EXPECT_EQ(Row(0, 0, 3), "ac.");
    // A backspace at column 0 stays there.
    terminal->HWTPrintString("\n\b\bq");
    Run();
    EXPECT_EQ(Row(1, 0, 2), "q.");
    terminal->HWTPrintString("xy\rz");
    Run();
    EXPECT_EQ(Row(1, 0, 3), "qxy");
    EXPECT_EQ(Row(2, 0, 2), "z.");
    terminal->HWTPrintString("\vw");
    Run();
    EXPECT_EQ(terminal->CharAt(6, 0), 'w');
    EXPECT_EQ(terminal->CursorRow(), 6);
    EXPECT_EQ(terminal->CursorCol(), 1);
}

TEST_F(HWTerminalTest, ClearTerminalEmptiesEveryCellAndHomesTheCursor)
{
    terminal->HWTPrintString("some text\nover two rows");
    terminal->HWTClearTerminal();
    Run();
    for (int32_t row = 0; row < 10; row++) {
        EXPECT_EQ(Row(row), std::string(40, '.'));
        for (int32_t col = 0; col < 40; col++)
            ASSERT_EQ(terminal->IntensityAt(row, col), 0);
    }
    EXPECT_EQ(terminal->CursorRow(), 0);
    EXPECT_EQ(terminal->CursorCol(), 0);
}

TEST_F(HWTerminalTest, CharactersPerSecondCommandSetsTheCharacterDelay)
{
    terminal->HWTCPS(8);
    EXPECT_EQ(terminal->PendingBytes(), 2);
    EXPECT_EQ(Run(), 1);
    EXPECT_EQ(terminal->CharDelay(), 125000);
    terminal->HWTCPS(3);
    Run();
    EXPECT_EQ(terminal->CharDelay(), 333333);
}

TEST_F(HWTerminalTest, CharacterColourCommandRebuildsTheTableAndTheBackground)
{
    terminal->HWTPrintString("W");
    Run();
    terminal->RenderTerminal();
    ExpectCell(0, 0, 'W', PaletteIndex(kWhite)); // the frame holds the glyph now
    const rgb_color red { 255, 0, 0, 255 };
    const rgb_color blue { 0, 0, 160, 255 };
    terminal->HWTSetCharColor(red, blue);
    EXPECT_EQ(terminal->PendingBytes(), 7);
    EXPECT_EQ(Run(), 1);
    EXPECT_EQ(terminal->ColorIndex(0), PaletteIndex(blue));
    EXPECT_EQ(terminal->ColorIndex(15), PaletteIndex(red));
    EXPECT_EQ(terminal->ColorIndex(17), PaletteIndex(red));
    // The background was drawn afresh: the glyph is gone from the bitmap.
    for (int32_t y = 0; y < terminal->Bitmap()->Height(); y++) {
        for (int32_t x = 0; x < terminal->Bitmap()->Width(); x++)
            ASSERT_EQ(Pixel(x, y), y % 2 ? terminal->LineIndex() : terminal->BackIndex());
    }
}

TEST_F(HWTerminalTest, TerminalColourCommandSetsTheLineAndBackgroundIndices)
{
    terminal->HWTSetTermColor(rgb_color { 40, 0, 80, 255 }, rgb_color { 200, 200, 0, 255 });
    EXPECT_EQ(terminal->PendingBytes(), 7);
    EXPECT_EQ(Run(), 1);
    EXPECT_EQ(terminal->LineIndex(), PaletteIndex(40, 0, 80));
    EXPECT_EQ(terminal->BackIndex(), PaletteIndex(200, 200, 0));
    terminal->RenderBackground();
    EXPECT_EQ(Pixel(5, 0), PaletteIndex(200, 200, 0));
    EXPECT_EQ(Pixel(5, 1), PaletteIndex(40, 0, 80));
}

TEST_F(HWTerminalTest, PauseTakesItsSecondsAndTheTypingGoesOn)
{
    std::vector<bigtime_t> pauses;
    terminal->SetPauseHook([&](bigtime_t pause) { pauses.push_back(pause); });
    const uint8_t commands[]
        = { HWTerminal::kCmdPause, 3, 'a', HWTerminal::kCmdPause, 0, HWTerminal::kCmdNop, 'b' };
    terminal->AddCommand(commands, sizeof commands);
    EXPECT_EQ(Run(), 5);
    EXPECT_EQ(pauses, (std::vector<bigtime_t> { 3000000, 0 }));
    EXPECT_EQ(Row(0, 0, 3), "ab.");
}

TEST_F(HWTerminalTest, PauseWithoutTheHookDoesNotWaitWhileNoThreadRuns)
{
    const uint8_t commands[] = { HWTerminal::kCmdPause, 200, 'a' };
    terminal->AddCommand(commands, sizeof commands);
    EXPECT_EQ(Run(), 2);
    EXPECT_EQ(terminal->CharAt(0, 0), 'a');
}

TEST_F(HWTerminalTest, EveryOtherBytePrintsAtTheCursor)
{
    std::vector<uint8_t> bytes;
    for (int value = 1; value < 256; value++) {
        if (value == 8 || value == 9 || value == 10 || value == 11 || value == 13
            || (value >= 128 && value <= 135))
            continue;
        bytes.push_back(uint8_t(value));
    }
    terminal->AddCommand(bytes.data(), int32_t(bytes.size()));
    EXPECT_EQ(Run(), int32_t(bytes.size()));
    for (size_t i = 0; i < bytes.size(); i++) {
        const int32_t cell = int32_t(i);
        ASSERT_EQ(terminal->CharAt(cell / 40, cell % 40), bytes[i]) << i;
        ASSERT_EQ(terminal->IntensityAt(cell / 40, cell % 40), 17) << i;
    }
    // 242 cells: the cursor ended on row 6, column 2.
    EXPECT_EQ(terminal->CursorRow(), int32_t(bytes.size()) / 40);
    EXPECT_EQ(terminal->CursorCol(), int32_t(bytes.size()) % 40);
}

// The command buffer

TEST_F(HWTerminalTest, AMissingParameterLosesTheCommandAndRewindsTheBuffer)
{
    terminal->HWTPrintString("ab");
    const uint8_t partial[] = { HWTerminal::kCmdMoveTo, 30 }; // no row byte
    terminal->AddCommand(partial, sizeof partial);
    EXPECT_EQ(terminal->PendingBytes(), 4);
    EXPECT_EQ(Run(), 2);
    EXPECT_EQ(terminal->PendingBytes(), 0);
    EXPECT_EQ(terminal->CursorCol(), 2);
    // The lost command does not take the next append as its parameter.
    terminal->HWTPrintChar('c');
    EXPECT_EQ(Run(), 1);
    EXPECT_EQ(Row(0, 0, 4), "abc.");

    const uint8_t colours[] = { HWTerminal::kCmdCharColor, 10, 20, 30, 40 };
    terminal->AddCommand(colours, sizeof colours);
    EXPECT_EQ(Run(), 0);
    EXPECT_EQ(terminal->ColorIndex(0), PaletteIndex(kGreen));
    const uint8_t clear[] = { HWTerminal::kCmdClearRow, 0 };
    terminal->AddCommand(clear, sizeof clear);
    EXPECT_EQ(Run(), 0);
    EXPECT_EQ(Row(0, 0, 4), "abc.");
}

TEST_F(HWTerminalTest, AppendsBeyondTheBufferWriteOnlyWhatFits)
{
    const std::vector<uint8_t> nulls(HWTerminal::kCommandBufferSize - 10, 0);
    terminal->AddCommand(nulls.data(), int32_t(nulls.size()));
    terminal->HWTPrintString("0123456789ABCDEF");
    EXPECT_EQ(terminal->PendingBytes(), HWTerminal::kCommandBufferSize);
    terminal->HWTPrintString("more");
    EXPECT_EQ(terminal->PendingBytes(), HWTerminal::kCommandBufferSize);
    EXPECT_EQ(Run(), HWTerminal::kCommandBufferSize);
    EXPECT_EQ(Row(0, 0, 12), "0123456789..");
    // Once consumed, the buffer is free again from its start.
    terminal->HWTPrintString("ABCDEF");
    EXPECT_EQ(terminal->PendingBytes(), 6);
    EXPECT_EQ(Run(), 6);
    EXPECT_EQ(Row(0, 0, 17), "0123456789ABCDEF.");
}

TEST_F(HWTerminalTest, AFullBufferStaysFullUntilEverythingIsConsumed)
{
    const std::vector<uint8_t> text(HWTerminal::kCommandBufferSize, 'x');
    terminal->AddCommand(text.data(), int32_t(text.size()));
    EXPECT_EQ(terminal->PrintToTerminal(100), 100);
    // Space freed at the front is not reused before the buffer has been rewound.
    terminal->HWTPrintChar('y');
    EXPECT_EQ(terminal->PendingBytes(), HWTerminal::kCommandBufferSize - 100);
}

TEST_F(HWTerminalTest, PurgeStopsTypingAndKeepsWhatWasTyped)
{
    terminal->HWTPrintString("a long line that is typed slowly");
    EXPECT_EQ(terminal->PrintToTerminal(6), 6);
    terminal->HWTPurgeBuffer();
    EXPECT_EQ(terminal->PendingBytes(), 0);
    EXPECT_EQ(Run(), 0);
    EXPECT_EQ(Row(0, 0, 8), "a long..");
    EXPECT_EQ(terminal->IntensityAt(0, 5), 17);
    terminal->HWTPrintString("!");
    Run();
    EXPECT_EQ(Row(0, 0, 8), "a long!.");
}

// Trail colours and fading

TEST_F(HWTerminalTest, ColorTableStepsFromTheNewColourToTheOldOne)
{
    struct Case {
        uint8_t length;
        rgb_color newColor, oldColor;
    };
    const Case cases[] = {
        { 16, kWhite, kGreen },
        { 5, { 250, 100, 7, 255 }, { 10, 200, 90, 255 } },
        { 9, { 0, 0, 0, 255 }, { 255, 128, 64, 255 } },
        { 2, { 200, 30, 30, 255 }, { 30, 30, 200, 255 } },
        { 1, kWhite, kGreen },
        { 255, { 255, 255, 0, 255 }, { 0, 0, 255, 255 } },
    };
    for (const Case& c : cases) {
        terminal->SetFollowLength(c.length);
        terminal->SetCharacterColors(c.newColor, c.oldColor);
        const int32_t n = c.length;
        // Entry i lies n - 1 - i steps of (new - old) / n from the new colour, truncated; computed
        // here in exact integers.
        auto channel
            = [&](int from, int to, int i) { return (from * n - (n - 1 - i) * (from - to)) / n; };
        for (int32_t i = 1; i < n; i++) {
            const uint8_t expected = PaletteIndex(channel(c.newColor.red, c.oldColor.red, i),
                channel(c.newColor.green, c.oldColor.green, i),
                channel(c.newColor.blue, c.oldColor.blue, i));
            ASSERT_EQ(terminal->ColorIndex(i), expected) << "length " << n << " entry " << i;
        }
        EXPECT_EQ(terminal->ColorIndex(0), PaletteIndex(c.oldColor)) << n;
        // A character just typed shows the new colour.
        EXPECT_EQ(terminal->ColorIndex(n), PaletteIndex(c.newColor)) << n;
        if (n < 255) {
            EXPECT_EQ(terminal->ColorIndex(n + 1), PaletteIndex(c.newColor)) << n;
        }
    }
}

TEST_F(HWTerminalTest, DefaultTrailHalfwayColour)
{
    // Seven steps of (255, 80, 255) / 16 below white: (143.4375, 220, 143.4375).
    EXPECT_EQ(terminal->ColorIndex(8), PaletteIndex(143, 220, 143));
    EXPECT_EQ(terminal->ColorIndex(1), PaletteIndex(31, 185, 31));
}

TEST_F(HWTerminalTest, FadeLowersIntensitiesToZeroAndReportsWhenAllAreZero)
{
    EXPECT_TRUE(terminal->Fade(1));
    terminal->HWTPrintString("ab");
    Run();
    EXPECT_FALSE(terminal->Fade(5));
    EXPECT_EQ(terminal->IntensityAt(0, 0), 12);
    EXPECT_FALSE(terminal->Fade(100));
    EXPECT_EQ(terminal->IntensityAt(0, 0), 0);
    EXPECT_EQ(terminal->IntensityAt(0, 1), 0);
    EXPECT_TRUE(terminal->Fade(1));
}

TEST_F(HWTerminalTest, AFreshCharacterFadesOneStepAtATimeToTheSettledColour)
{
    terminal->HWTPrintChar('W');
    Run();
    ASSERT_EQ(terminal->IntensityAt(0, 0), terminal->FollowLength() + 1);
    for (int32_t level = terminal->FollowLength() + 1; level >= 0; level--) {
        ASSERT_EQ(terminal->IntensityAt(0, 0), level);
        terminal->RenderTerminal();
        ExpectCell(0, 0, 'W', terminal->ColorIndex(level));
        if (level >= terminal->FollowLength()) {
            EXPECT_EQ(terminal->ColorIndex(level), PaletteIndex(kWhite));
        }
        if (level == 0) {
            ExpectCell(0, 0, 'W', PaletteIndex(kGreen));
        }
        // Fade reports all settled only once nothing had any intensity left.
        EXPECT_EQ(terminal->Fade(1), level == 0);
    }
    EXPECT_EQ(terminal->IntensityAt(0, 0), 0);
}

// Rendering

TEST_F(HWTerminalTest, BackgroundIsEraseThenScanLinesOnOddRows)
{
    terminal->RenderBackground();
    const RBitmap8* bitmap = terminal->Bitmap();
    ASSERT_NE(terminal->LineIndex(), terminal->BackIndex());
    for (int32_t y = 0; y < bitmap->Height(); y++) {
        for (int32_t x = 0; x < bitmap->Width(); x++)
            ASSERT_EQ(Pixel(x, y), y % 2 ? terminal->LineIndex() : terminal->BackIndex())
                << x << ", " << y;
    }
}

TEST_F(HWTerminalTest, CellsLieInAGridWithATwoPixelMargin)
{
    // The glyphs are there to be checked against.
    bool anyInk = false;
    for (int32_t j = 0; j < kSystemFontCharHeight; j++)
        for (int32_t i = 0; i < kSystemFontCharWidth; i++)
            anyInk |= Ink('A', i, j);
    ASSERT_TRUE(anyInk) << "the font resource is missing";

    terminal->HWTPrintString("A");
    terminal->HWTMoveTo(1, 2);
    terminal->HWTPrintString("Bq");
    // The last cell but one: typing into the last cell would scroll the grid.
    terminal->HWTMoveTo(9, 38);
    terminal->HWTPrintString("}");
    Run();
    terminal->TMoveTo(0, 0);
    terminal->Fade(3);
    terminal->RenderTerminal();
    ExpectCell(0, 0, 'A', terminal->ColorIndex(14));
    ExpectCell(1, 2, 'B', terminal->ColorIndex(14));
    ExpectCell(1, 3, 'q', terminal->ColorIndex(14));
    ExpectCell(9, 38, '}', terminal->ColorIndex(14));
    ExpectCell(9, 39, ' ', 0);
    ExpectCell(0, 1, ' ', 0); // empty: background only
    ExpectCell(1, 1, ' ', 0);
    // The margin is background.
    for (int32_t y = 0; y < terminal->Bitmap()->Height(); y++) {
        ASSERT_EQ(Pixel(0, y), y % 2 ? terminal->LineIndex() : terminal->BackIndex());
        ASSERT_EQ(Pixel(1, y), y % 2 ? terminal->LineIndex() : terminal->BackIndex());
    }
    for (int32_t x = 0; x < terminal->Bitmap()->Width(); x++)
        ASSERT_EQ(Pixel(x, 0), terminal->BackIndex());
}

// The terminal thread

template <typename Predicate> bool WaitFor(Predicate predicate)
{
    return QTest::qWaitFor(predicate, 20000);
}

class HWTerminalThreadTest : public HWTerminalTest {
protected:
    void SetUp() override
    {
        HWTerminalTest::SetUp();
        // Fast enough that a short text is typed and settled within a few frames.
        terminal->SetCPS(1000);
        terminal->SetFPS(100);
        terminal->SetColorDecayRate(1000);
        terminal->SetFollowLength(3);
    }
};

TEST_F(HWTerminalThreadTest, TypesTextIntoTheGridAndEndsWhenDetached)
{
    terminal->HWTPrintString("typed by the thread");
    terminal->AttachedToWindow();
    EXPECT_TRUE(terminal->IsRunning());
    terminal->AttachedToWindow(); // a second start does nothing
    ASSERT_TRUE(WaitFor([&] { return Row(0, 0, 19) == "typed by the thread"; }));
    ASSERT_TRUE(WaitFor([&] { return terminal->FramesShown() > 0; }));
    // The frame was handed over; its painting was asked for.
    const QImage front = terminal->FrontImage();
    ASSERT_FALSE(front.isNull());
    EXPECT_EQ(front.width(), terminal->Bitmap()->Width());

    terminal->DetachedFromWindow();
    EXPECT_FALSE(terminal->IsRunning());
    EXPECT_EQ(terminal->ThreadCPUTime(), -1);
    terminal->DetachedFromWindow(); // a second stop does nothing
    // The grid and later appends survive the stop; a new start types them.
    terminal->HWTPrintString(" again");
    EXPECT_EQ(terminal->PendingBytes(), 6);
    terminal->AttachedToWindow();
    ASSERT_TRUE(WaitFor([&] { return Row(0, 0, 25) == "typed by the thread again"; }));
}

TEST_F(HWTerminalThreadTest, AnIdleTerminalIsPaintedThoughItsPaintFoundTheHandOverBusy)
{
    terminal->HWTPrintString("idle now");
    terminal->show(); // starts the thread
    ASSERT_TRUE(QTest::qWaitForWindowExposed(terminal.get()));
    ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended() && terminal->HWTIsDone(); }));
    const QImage frame = terminal->FrontImage().convertToFormat(QImage::Format_RGB32);
    ASSERT_TRUE(WaitFor([&] { return ShownPixels(terminal.get()) == frame; }));
    const int64_t frames = terminal->FramesShown();

    {
        // The window is uncovered while the hand-over lock is held (by a reader of the front
        // image, say).
        std::lock_guard hold(terminal->Frames().Lock());
        terminal->repaint();
    }
    // The idle terminal hands over nothing more, and shows its text all the same.
    EXPECT_TRUE(WaitFor([&] { return ShownPixels(terminal.get()) == frame; }));
    EXPECT_EQ(terminal->FramesShown(), frames);
    EXPECT_TRUE(terminal->IsSuspended());
}

TEST_F(HWTerminalThreadTest, IdleThreadIsSuspendedDoneAndWokenByEveryAppend)
{
    terminal->HWTPrintString("abc");
    terminal->AttachedToWindow();
    ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended(); }));
    EXPECT_TRUE(terminal->HWTIsDone());
    EXPECT_EQ(Row(0, 0, 4), "abc.");
    EXPECT_EQ(terminal->IntensityAt(0, 2), 0);

    {
        // Held, the render lock keeps the thread from typing the append before it is looked at.
        std::lock_guard hold(terminal->RenderLock());
        terminal->HWTPrintChar('d');
        EXPECT_FALSE(terminal->HWTIsDone());
    }
    ASSERT_TRUE(WaitFor([&] { return terminal->CharAt(0, 3) == 'd'; }));
    ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended() && terminal->HWTIsDone(); }));
    EXPECT_EQ(terminal->IntensityAt(0, 3), 0);

    // Many appends in a row, each waking the thread: none is missed.
    for (char c = 'e'; c <= 'z'; c++)
        terminal->HWTPrintChar(c);
    ASSERT_TRUE(WaitFor([&] { return Row(0, 0, 27) == "abcdefghijklmnopqrstuvwxyz."; }));
    terminal->DetachedFromWindow();
}

TEST_F(HWTerminalThreadTest, APurgeFallsBetweenCommandsNeverInsideOne)
{
    terminal->AttachedToWindow();
    ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended(); }));
    for (int round = 0; round < 3; round++) {
        {
            // The thread is kept from rendering and executing while a move is appended: it may
            // at most take the move's first byte before it waits for the lock.
            std::unique_lock hold(terminal->RenderLock());
            terminal->HWTMoveTo(5, 30);
            // A thread that takes commands outside the lock takes the first byte now; one that
            // takes them under it cannot, and this wait ends at its time-out.
            (void)QTest::qWaitFor([&] { return terminal->PendingBytes() < 3; }, 200);
            // The move is dropped whole, and a new screen is written.
            terminal->HWTPurgeBuffer();
            terminal->HWTClearTerminal();
            terminal->HWTMoveTo(1, 2);
            terminal->HWTPrintString("OK");
        }
        ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended() && terminal->HWTIsDone(); }));
        for (int32_t row = 0; row < terminal->Rows(); row++)
            EXPECT_EQ(Row(row), RowWith(row == 1 ? "..OK" : ""))
                << "round " << round << ", row " << row;
    }
    terminal->DetachedFromWindow();
}

TEST_F(HWTerminalThreadTest, PurgesRacingTheThreadLeaveACleanScreen)
{
    // Purges at every moment of the thread's work, one after the other, each followed by the
    // same screen: whatever was cut off, the screen ends as that screen.
    terminal->SetCPS(100000);
    terminal->SetFPS(1000);
    terminal->AttachedToWindow();
    for (int round = 0; round < 200; round++) {
        for (uint8_t row = 0; row < 10; row++) {
            terminal->HWTMoveTo(row, uint8_t(row * 3));
            terminal->HWTClearRow(row, 0);
            terminal->HWTPrintString("noise");
        }
        terminal->HWTPurgeBuffer();
        terminal->HWTClearTerminal();
        terminal->HWTMoveTo(2, 4);
        terminal->HWTPrintString("clean");
    }
    ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended() && terminal->HWTIsDone(); }));
    for (int32_t row = 0; row < terminal->Rows(); row++)
        EXPECT_EQ(Row(row), RowWith(row == 2 ? "....clean" : "")) << "row " << row;
    terminal->DetachedFromWindow();
}

TEST_F(HWTerminalThreadTest, StoppingCutsAPauseShort)
{
    const uint8_t pause[] = { HWTerminal::kCmdPause, 250, 'x' };
    terminal->AddCommand(pause, sizeof pause);
    terminal->AttachedToWindow();
    // The pause has begun once its bytes are taken; the stop does not wait for its end.
    ASSERT_TRUE(WaitFor([&] { return terminal->PendingBytes() < 3; }));
    terminal->DetachedFromWindow();
    EXPECT_FALSE(terminal->IsRunning());
    // The batch the pause was part of went on: the character after it was typed.
    EXPECT_EQ(terminal->CharAt(0, 0), 'x');
}

TEST_F(HWTerminalThreadTest, SettingsMayChangeWhileTheThreadRuns)
{
    terminal->AttachedToWindow();
    for (int i = 0; i < 50; i++) {
        terminal->HWTPrintString("colours ");
        terminal->SetCharacterColors(rgb_color { uint8_t(i * 5), 255, 0, 255 }, kGreen);
        terminal->SetTerminalColors(rgb_color { 0, uint8_t(i), 0, 255 }, rgb_color {});
        terminal->SetFollowLength(uint8_t(2 + i % 3));
        terminal->SetCPS(500 + i);
    }
    ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended(); }));
    EXPECT_EQ(terminal->ColorIndex(0), PaletteIndex(kGreen));
    EXPECT_EQ(terminal->CharAt(9, 0), 'c'); // 400 characters: the grid scrolled
    terminal->DetachedFromWindow();
}

TEST_F(HWTerminalThreadTest, AnIdleThreadUsesNoProcessorTime)
{
    terminal->HWTPrintString("a short text");
    terminal->AttachedToWindow();
    ASSERT_TRUE(WaitFor([&] { return terminal->IsSuspended(); }));
    const bigtime_t before = terminal->ThreadCPUTime();
    ASSERT_GE(before, 0);
    // Half a second of idleness, measured: the sleep is the measurement's span, not a wait for
    // the thread.
    std::this_thread::sleep_for(std::chrono::milliseconds(500));
    const bigtime_t used = terminal->ThreadCPUTime() - before;
    std::printf("the idle terminal thread used %lld us of processor time in 0.5 s\n",
        static_cast<long long>(used));
    EXPECT_TRUE(terminal->IsSuspended());
    EXPECT_LT(used, 2000) << "microseconds of processor time while idle";
    terminal->DetachedFromWindow();
}

// A terminal whose background the thread draws through the subclass, as derived views do.
class StripedTerminal : public HWTerminal {
public:
    StripedTerminal(BRect frame, std::atomic<int>& backgrounds, bool& stoppedFirst)
        : HWTerminal(frame, "striped", 10, 3)
        , backgrounds(backgrounds)
        , stoppedFirst(stoppedFirst)
    {
    }
    ~StripedTerminal() override
    {
        DetachedFromWindow();
        stoppedFirst = !IsRunning() && ThreadCPUTime() == -1;
    }
    void RenderBackground() override
    {
        HWTerminal::RenderBackground();
        backgrounds++;
    }

private:
    std::atomic<int>& backgrounds;
    bool& stoppedFirst;
};

TEST_F(HWTerminalThreadTest, ASubclassDrawsTheBackgroundAndStopsTheThreadBeforeItGoes)
{
    std::atomic<int> backgrounds { 0 };
    bool stoppedFirst = false;
    auto striped
        = std::make_unique<StripedTerminal>(BRect(0, 0, 99, 59), backgrounds, stoppedFirst);
    striped->SetBMFont(&font);
    striped->SetCPS(5);
    striped->HWTPrintString("going away while typing");
    const int before = backgrounds.load();
    striped->AttachedToWindow();
    ASSERT_TRUE(WaitFor([&] { return striped->CharAt(0, 0) == 'g'; }));
    ASSERT_TRUE(WaitFor([&] { return backgrounds.load() > before; }));
    QPointer<HWTerminal> guard(striped.get());
    striped.reset();
    EXPECT_TRUE(stoppedFirst);
    EXPECT_TRUE(guard.isNull());
    // Paint requests the thread left behind find the terminal gone and do nothing.
    QCoreApplication::processEvents();
}

} // namespace
