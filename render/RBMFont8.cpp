// RBMFont8.cpp: loading a glyph strip from the resources.
#include "render/RBMFont8.h"

#include "platform/Resources.h"

#include <algorithm>

RBMFont8::RBMFont8(int32_t type, int32_t id, int32_t stripWidth, int32_t charHeight,
    int32_t charWidth, char firstChar, char lastChar)
    : BBitmap(BRect(0.0f, 0.0f, float(stripWidth - 1), float(charHeight - 1)))
    , bits(Bits())
    , bitsLength(BitsLength())
    , bytesPerRow(BytesPerRow())
    , bounds(Bounds())
{
    const int64_t wanted = int64_t(stripWidth) * charHeight;
    if (wanted > 0)
        ReadResource(uint32_t(type), id, bits, 0, size_t(std::min<int64_t>(wanted, bitsLength)));
    this->stripWidth = stripWidth;
    this->charHeight = charHeight;
    this->charWidth = charWidth;
    this->firstChar = firstChar;
    this->lastChar = lastChar;
}

void RBMFont8::GetFontInfo(RBMFontInfo* info) const
{
    info->stripWidth = stripWidth;
    info->charHeight = charHeight;
    info->charWidth = charWidth;
    info->firstChar = firstChar;
    info->lastChar = lastChar;
}
