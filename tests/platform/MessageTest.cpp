#include "platform/Message.h"
#include "core/MessageCodes.h"

#include <gtest/gtest.h>

#include <cstring>

TEST(MessageCodes, FourCharacterConstantsAreMostSignificantFirst)
{
    EXPECT_EQ(kNewUniverseWindow, 0x4e775363u);
    EXPECT_EQ(kNewStarInfoWindow, 0x73496d67u);
    EXPECT_EQ(kNewHRDWindow, 0x73485244u);
    EXPECT_EQ(kNewFindWindow, 0x66536d67u);
    EXPECT_EQ(kNewListWindow, 0x4c776d47u);
    EXPECT_EQ(kUniverseWindowActivated, 0x55774163u);
    EXPECT_EQ(kUniverseWindowQuitting, 0x5577516du);
    EXPECT_EQ(kUniversePointer, 0x55507472u);
    EXPECT_EQ(kStarMessage, 0x53746152u);
    EXPECT_EQ(kStarArrayMessage, 0x53417279u);
    EXPECT_EQ(kStarInfoBroadcast, 0x53494263u);
    EXPECT_EQ(kStarInfoSubscribe, 0x53495375u);
    EXPECT_EQ(kStarInfoUnsubscribe, 0x53495573u);
    EXPECT_EQ(kClipToggle, 0x436c5467u);
    EXPECT_EQ(kHRDClear, 0x4872436cu);
    EXPECT_EQ(kShowListChanged, 0x556c6342u);
    EXPECT_EQ(kInfoMessage, 0x496e666fu);
    EXPECT_EQ(kClearInfoMessage, 0x43496e66u);
    EXPECT_EQ(B_QUIT_REQUESTED, 0x5f515251u);

    EXPECT_EQ(kAddTag, 0x41444474u);
    EXPECT_EQ(kAndTag, 0x414e4474u);
    EXPECT_EQ(kEqualsTag, 0x45716c74u);
    EXPECT_EQ(kNotTag, 0x4e4f5474u);
    EXPECT_EQ(kOrTag, 0x4f527420u);
    EXPECT_EQ(kXorTag, 0x584f5274u);
    EXPECT_EQ(kMinusTag, 0x6d696e73u);

    EXPECT_EQ(kNameQueryType, 0x6e616d65u);
    EXPECT_EQ(kSpectralClassQueryType, 0x53437179u);
    EXPECT_EQ(kMagnitudeQueryType, 0x4d477179u);
    EXPECT_EQ(kDistanceQueryType, 0x44697374u);
    EXPECT_EQ(kRightAscensionQueryType, 0x52417179u);
    EXPECT_EQ(kDeclinationQueryType, 0x44454379u);

    EXPECT_EQ(kRaw8Type, 0x52617738u);
    EXPECT_EQ(kFontType, 0x464f4e54u);
    EXPECT_EQ(kMouseControlType, 0x4d635063u);
    EXPECT_EQ(kPictureButtonType, 0x4950434cu);
    EXPECT_EQ(kToggleButtonType, 0x5447634cu);
    EXPECT_EQ(kDropPadType, 0x447a6f6eu);
}

TEST(MessageCodes, FieldNames)
{
    EXPECT_STREQ(kSystemIndexString, "Star Index");
    EXPECT_STREQ(kSystemArrayPtrString, "System Array Pointer");
    EXPECT_STREQ(kUWPointerString, "UWindowPtr");
    EXPECT_STREQ(kSITargetIndexString, "Target Index");
    EXPECT_STREQ(kSISelectionIndexString, "Selection Index");
    EXPECT_STREQ(kSIHandlerPtrString, "Handler Pointer");
    EXPECT_STREQ(kSIFlagsString, "Flags");
    EXPECT_STREQ(kInfoStringField, "InfoString");
    EXPECT_STREQ(kDropTagField, "drop tag");
}

TEST(MessageCodes, BothUniversePointerNamesFindTheSameField)
{
    EXPECT_STREQ(kUniversePtrString, kSIUniversePointerString);
    int universe = 0;
    Message message(kStarInfoBroadcast);
    message.AddPointer(kSIUniversePointerString, &universe);
    EXPECT_EQ(message.FindPointer(kUniversePtrString), &universe);
}

TEST(Message, FieldsByNameAndType)
{
    Message message(kStarMessage);
    int mask = 0;
    EXPECT_EQ(message.AddInt32(kSystemIndexString, 42), B_OK);
    EXPECT_EQ(message.AddPointer(kSystemArrayPtrString, &mask), B_OK);
    EXPECT_EQ(message.AddString(kInfoStringField, "Zoom"), B_OK);
    EXPECT_EQ(message.what, kStarMessage);
    EXPECT_EQ(message.CountFields(), 3);

    int32_t index = 0;
    EXPECT_EQ(message.FindInt32(kSystemIndexString, &index), B_OK);
    EXPECT_EQ(index, 42);
    EXPECT_EQ(message.FindInt32(kSystemIndexString), 42);
    EXPECT_EQ(message.FindPointer(kSystemArrayPtrString), &mask);
    EXPECT_STREQ(message.FindString(kInfoStringField), "Zoom");
    EXPECT_TRUE(message.HasInt32(kSystemIndexString));
    EXPECT_FALSE(message.HasInt32(kSystemIndexString, 1));
    EXPECT_FALSE(message.HasInt32(kSystemArrayPtrString)); // a pointer, not an int32
    EXPECT_TRUE(message.HasPointer(kSystemArrayPtrString));
    EXPECT_TRUE(message.HasString(kInfoStringField));
}

TEST(Message, MissingFieldsReadAsZeroNullAndEmpty)
{
    const Message message(kStarArrayMessage);
    int32_t value = 7;
    EXPECT_EQ(message.FindInt32(kSystemIndexString, &value), B_NAME_NOT_FOUND);
    EXPECT_EQ(value, 7);
    EXPECT_EQ(message.FindInt32(kSystemIndexString), 0);
    EXPECT_EQ(message.FindPointer(kSystemArrayPtrString), nullptr);
    EXPECT_STREQ(message.FindString(kInfoStringField), "");
    EXPECT_FALSE(message.WasDropped());
}

TEST(Message, SeveralValuesUnderOneNameAndTypeClashes)
{
    Message message;
    message.AddInt32("n", 1);
    message.AddInt32("n", 2);
    EXPECT_EQ(message.AddString("n", "x"), B_BAD_TYPE);
    int32_t second = 0;
    EXPECT_EQ(message.FindInt32("n", 1, &second), B_OK);
    EXPECT_EQ(second, 2);
    EXPECT_EQ(message.FindInt32("n", 2, &second), B_BAD_INDEX);
    const char* text = nullptr;
    EXPECT_EQ(message.FindString("n", &text), B_BAD_TYPE);
    message.MakeEmpty();
    EXPECT_EQ(message.CountFields(), 0);
}

TEST(Message, CopiesCarryFieldsAndTheDropMark)
{
    Message message(kStarMessage);
    message.AddString(kInfoStringField, "text");
    message.SetDropped(BPoint(120, 340));
    const Message copy = message;
    EXPECT_TRUE(copy.WasDropped());
    EXPECT_EQ(copy.DropPoint().x, 120);
    EXPECT_EQ(copy.DropPoint().y, 340);
    EXPECT_STREQ(copy.FindString(kInfoStringField), "text");
    EXPECT_NE(copy.FindString(kInfoStringField), message.FindString(kInfoStringField));
}
