// The vocabulary windows speak: command codes, drop-pad tags, query kinds, resource types
// and the names of message fields. Everything here is defined once; senders and receivers use
// these constants, never a second copy of a code or a field name.
#pragma once

#include "platform/FourCC.h"

#include <cstdint>

// Commands.
inline constexpr uint32_t kNewUniverseWindow = FourCC("NwSc"); // open a star-map window
inline constexpr uint32_t kNewStarInfoWindow = FourCC("sImg"); // open a star information window
inline constexpr uint32_t kNewHRDWindow = FourCC("sHRD"); // open an H-R diagram window
inline constexpr uint32_t kNewFindWindow = FourCC("fSmg"); // open a find window
inline constexpr uint32_t kNewListWindow = FourCC("LwmG"); // open a star list window
inline constexpr uint32_t kUniverseWindowActivated = FourCC("UwAc"); // "UWindowPtr"
inline constexpr uint32_t kUniverseWindowQuitting = FourCC("UwQm"); // "UWindowPtr"
inline constexpr uint32_t kUniversePointer = FourCC("UPtr"); // "Universe Pointer"
inline constexpr uint32_t kStarMessage = FourCC("StaR"); // one system: "Star Index"
inline constexpr uint32_t kStarArrayMessage = FourCC("SAry"); // a set: "System Array Pointer"
inline constexpr uint32_t kStarInfoBroadcast = FourCC("SIBc"); // target or selection changed
inline constexpr uint32_t kStarInfoSubscribe = FourCC("SISu");
inline constexpr uint32_t kStarInfoUnsubscribe = FourCC("SIUs");
inline constexpr uint32_t kClipToggle = FourCC("ClTg"); // toggle the clipping sphere
inline constexpr uint32_t kHRDClear = FourCC("HrCl"); // clear the H-R diagram
inline constexpr uint32_t kShowListChanged = FourCC("UlcB"); // the "Show List" check box
inline constexpr uint32_t kInfoMessage = FourCC("Info"); // show a help text: "InfoString"
inline constexpr uint32_t kClearInfoMessage = FourCC("CInf"); // clear the help text
inline constexpr uint32_t B_QUIT_REQUESTED = FourCC("_QRQ");

// Drop-pad tags: the set operation of the pad a set was dropped on, in "drop tag".
inline constexpr uint32_t kAddTag = FourCC("ADDt");
inline constexpr uint32_t kAndTag = FourCC("ANDt");
inline constexpr uint32_t kEqualsTag = FourCC("Eqlt");
inline constexpr uint32_t kNotTag = FourCC("NOTt");
inline constexpr uint32_t kOrTag = FourCC("ORt ");
inline constexpr uint32_t kXorTag = FourCC("XORt");
inline constexpr uint32_t kMinusTag = FourCC("mins");

// Flag bits of a star-information subscription ('SISu' "Flags").
enum : int32_t {
    kSITargetChanged = 0x01, // notify when the system under the mouse changes
    kSISelectionChanged = 0x04, // notify when the selection changes
    kSIWithTarget = 0x08, // include "Target Index"
    kSIWithSelection = 0x10, // include "Selection Index"
    kSIWithUniverse = 0x20, // include "Universe Pointer"
};

// Query kinds, as each query's QueryType() answers.
inline constexpr uint32_t kNameQueryType = FourCC("name");
inline constexpr uint32_t kSpectralClassQueryType = FourCC("SCqy");
inline constexpr uint32_t kMagnitudeQueryType = FourCC("MGqy");
inline constexpr uint32_t kDistanceQueryType = FourCC("Dist");
inline constexpr uint32_t kRightAscensionQueryType = FourCC("RAqy");
inline constexpr uint32_t kDeclinationQueryType = FourCC("DECy");

// A list window's pad hands on a drop of CSV (files or text) from another program; its field
// kCsvDataField points to the drop's QMimeData, good while the drop is handled.
inline constexpr uint32_t kCsvDropMessage = FourCC("CSVd");

// Resource types of the program's images and fonts.
inline constexpr uint32_t kRaw8Type = FourCC("Raw8"); // raw 8-bit bitmaps, 255 transparent
inline constexpr uint32_t kFontType = FourCC("FONT"); // bitmap font strips
inline constexpr uint32_t kMouseControlType = FourCC("McPc"); // mouse-control pictures
inline constexpr uint32_t kPictureButtonType = FourCC("IPCL"); // picture-button frames
inline constexpr uint32_t kToggleButtonType = FourCC("TGcL"); // toggle-button frames
inline constexpr uint32_t kDropPadType = FourCC("Dzon"); // drop-pad pictures

// Field names.
inline constexpr const char* kSystemIndexString = "Star Index"; // int32, -1 for none
inline constexpr const char* kSystemArrayPtrString = "System Array Pointer"; // StarSysMask*
inline constexpr const char* kUniversePtrString = "Universe Pointer"; // Universe*
inline constexpr const char* kUWPointerString = "UWindowPtr"; // UniverseWindow*
inline constexpr const char* kSITargetIndexString = "Target Index"; // int32
inline constexpr const char* kSISelectionIndexString = "Selection Index"; // int32, -1 for none
inline constexpr const char* kSIUniversePointerString = "Universe Pointer"; // Universe*
inline constexpr const char* kSIHandlerPtrString = "Handler Pointer"; // the handler to notify
inline constexpr const char* kSIFlagsString = "Flags"; // int32
inline constexpr const char* kInfoStringField = "InfoString"; // string: a help text
inline constexpr const char* kDropTagField = "drop tag"; // int32: a drop-pad tag
inline constexpr const char* kCsvDataField = "CSV Data"; // const QMimeData*
