// Numbers in catalogue fields: the whole field (blanks around it aside) must be the number.
#pragma once

#include <cstdint>
#include <string>

// True when text, apart from blanks at either end, is one finite decimal number.
bool ParseNumber(const std::string& text, double* value);

// The number, or an ImportError naming the file, the line and the field.
double StrictNumber(
    const std::string& text, const std::string& file, int64_t line, const std::string& what);
