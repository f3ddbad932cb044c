// ResourceData.h: brings the program's compiled-in images and font into the resource registry
// (platform/Resources.h).
#pragma once

// Registers every resource compiled into the executable; the application calls it once at
// start-up and each test program that reads resources calls it before the first read. Calling
// it again does nothing. Safe to call from several threads.
//
// The data are compiled with Qt's resource compiler into this static library, whose
// initialiser a linker would drop as unreferenced; InitResources calls Q_INIT_RESOURCE
// explicitly so the data are always linked in and registered.
void InitResources();
