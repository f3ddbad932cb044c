// Fuzzing the importer's Southern Stars reader: whatever it accepts is written and read back
// unchanged.
#include "ImportRoundTrip.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    CheckImportRoundTrip(data, size, InputFormat::SouthernStars);
    return 0;
}
