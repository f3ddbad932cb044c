// The check behind the importer's fuzz harnesses: what the importer writes, the program's
// catalogue reader reads back to exactly the stars written.
#pragma once

#include "tools/importer/Importer.h"

#include <cstddef>
#include <cstdint>
#include <vector>

// Reads data as a catalogue of format. When the importer accepts it, groups the stars, writes
// the catalogue text and reads it back through the program's reader. Aborts, saying what
// differs, when a written line is one the reader would misread (a class that is not one short
// word, a name it would cut or split, a number that is not finite) or when the stars read
// back are not the stars written, in order, with their systems. Input the importer refuses
// is fine.
void CheckImportRoundTrip(const uint8_t* data, size_t size, InputFormat format);

// The same check for stars a reader has read: grouped, written and read back.
void CheckStarsRoundTrip(const std::vector<ImportStar>& stars);

// Aborts with message when condition is false; for harnesses, which have no test framework.
void FuzzCheck(bool condition, const char* message);
