// Where the running program's executable lies, for files that ship beside it.
#pragma once

#include <filesystem>

// The directory holding the running executable; empty if the system cannot tell.
std::filesystem::path ExecutableDirectory();
