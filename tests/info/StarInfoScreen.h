// Reading a star information terminal's screen in tests: typing out what is queued without its
// thread, and rows of the grid as text.
#pragma once

#include "info/StarIView.h"

#include <cstdio>
#include <initializer_list>
#include <string>
#include <utility>

// Executes everything appended so far, as the terminal thread would, all at once. For views
// whose thread does not run (never shown, or stopped).
inline void TypeAll(StarIView& view)
{
    while (view.PrintToTerminal(100000) > 0) { }
}

// Row row of the screen, an empty cell read as a blank, trailing blanks dropped.
inline std::string ScreenRow(const StarIView& view, int32_t row)
{
    std::string text;
    for (int32_t col = 0; col < view.Cols(); col++) {
        const uint8_t c = view.CharAt(row, col);
        text += c ? char(c) : ' ';
    }
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

// Columns col of row: at most length characters from col, trailing blanks dropped.
inline std::string ScreenText(const StarIView& view, int32_t row, int32_t col, size_t length)
{
    const std::string line = ScreenRow(view, row);
    if (size_t(col) >= line.size())
        return "";
    std::string text = line.substr(size_t(col), length);
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

// A row of the given texts at the given columns, blanks between, trailing blanks dropped.
inline std::string RowOf(std::initializer_list<std::pair<size_t, std::string>> texts)
{
    std::string row;
    for (const auto& [col, text] : texts) {
        if (row.size() < col + text.size())
            row.resize(col + text.size(), ' ');
        row.replace(col, text.size(), text);
    }
    row.erase(row.find_last_not_of(' ') + 1);
    return row;
}

// printf into a string.
template <typename... Args> std::string Format(const char* format, Args... args)
{
    char text[256];
    std::snprintf(text, sizeof text, format, args...);
    return text;
}
