// Fuzzing the importer's plain CSV reader: whatever it accepts is written and read back unchanged.
#include "ImportRoundTrip.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    CheckImportRoundTrip(data, size, InputFormat::Csv);
    return 0;
}
