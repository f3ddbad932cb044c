// Resources.h: the program's typed, numbered resources (images and fonts), read by type code and
// number the way the raster layer expects.
//
// Design: this file is plain C++ so that the model libraries (render) can read resources without
// Qt. It holds a registry of byte blocks keyed by (type, id). Whoever owns the data registers it:
// the application and the tests call InitResources() (resources/ResourceData.h, library
// nd_resources), which brings in the Qt-rcc-compiled blocks generated at build time and
// registers them here; the resource generator registers the committed font strip itself.
#pragma once

#include "platform/FourCC.h"

#include <cstddef>
#include <cstdint>

// Makes size bytes at data the resource (type, id), replacing any earlier block of that key.
// The bytes are not copied: data must stay valid (unchanged) for the rest of the run.
void RegisterResource(uint32_t type, int32_t id, const void* data, size_t size);

// True once any resource has been registered: the stand-in for "the application's resources
// could be opened".
bool ResourcesAvailable();

// Copies up to length bytes of resource (type, id), starting offset bytes into it, to buffer.
// Returns the number of bytes copied (0 when offset lies at or past the end), or -1 when there is
// no such resource. Safe to call from any thread.
int64_t ReadResource(uint32_t type, int32_t id, void* buffer, size_t offset, size_t length);

// The size in bytes of resource (type, id), or -1 when there is none.
int64_t ResourceSize(uint32_t type, int32_t id);
