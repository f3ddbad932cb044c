// Numeric constants shared by the whole program.
#pragma once

// The closest double to pi, and the only source of it: a full turn is always kPI + kPI.
inline constexpr double kPI = 3.141592653589793;

// Light-years in a parsec, as the program shows them side by side.
inline constexpr double kLightYearsPerParsec = 3.26;
