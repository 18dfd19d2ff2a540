#include <BitmapStream.h>

#include <Bitmap.h>
#include <TranslationErrors.h>

#include <algorithm>
#include <bit>
#include <new>
#include <string.h>

namespace {

void PutNumber(uint8* at, uint32 value) {
    for (int i = 0; i < 4; ++i) {
        at[i] = static_cast<uint8>(value >> (24 - 8 * i));
    }
}

uint32 GetNumber(const uint8* at) {
    return (static_cast<uint32>(at[0]) << 24) | (static_cast<uint32>(at[1]) << 16) |
           (static_cast<uint32>(at[2]) << 8) | at[3];
}

void PutFloat(uint8* at, float value) {
    PutNumber(at, std::bit_cast<uint32>(value));
}

float GetFloat(const uint8* at) {
    return std::bit_cast<float>(GetNumber(at));
}

// Where the header's fields lie.
enum HeaderOffset {
    kMagicAt = 0,
    kLeftAt = 4,
    kTopAt = 8,
    kRightAt = 12,
    kBottomAt = 16,
    kRowBytesAt = 20,
    kColorsAt = 24,
    kDataSizeAt = 28
};

} // namespace

BBitmapStream::BBitmapStream(BBitmap* bitmap) : mBitmap(bitmap) {
    if (mBitmap != nullptr && mBitmap->IsValid()) {
        MakeHeader();
    }
}

BBitmapStream::~BBitmapStream() = default;

void BBitmapStream::MakeHeader() {
    const BRect bounds = mBitmap->Bounds();
    PutNumber(mHeader + kMagicAt, B_TRANSLATOR_BITMAP);
    PutFloat(mHeader + kLeftAt, bounds.left);
    PutFloat(mHeader + kTopAt, bounds.top);
    PutFloat(mHeader + kRightAt, bounds.right);
    PutFloat(mHeader + kBottomAt, bounds.bottom);
    PutNumber(mHeader + kRowBytesAt, static_cast<uint32>(mBitmap->BytesPerRow()));
    PutNumber(mHeader + kColorsAt, static_cast<uint32>(mBitmap->ColorSpace()));
    PutNumber(mHeader + kDataSizeAt, static_cast<uint32>(mBitmap->BitsLength()));
    mHeaderFilled = kHeaderSize;
}

status_t BBitmapStream::MakeBitmap() {
    const BRect bounds(GetFloat(mHeader + kLeftAt), GetFloat(mHeader + kTopAt), GetFloat(mHeader + kRightAt),
                       GetFloat(mHeader + kBottomAt));
    auto bitmap = std::unique_ptr<BBitmap>(
        new (std::nothrow) BBitmap(bounds, 0, static_cast<color_space>(GetNumber(mHeader + kColorsAt)),
                                   static_cast<int32>(GetNumber(mHeader + kRowBytesAt))));
    if (bitmap == nullptr || bitmap->InitCheck() == B_NO_MEMORY) {
        return B_NO_MEMORY;
    }
    if (GetNumber(mHeader + kMagicAt) != B_TRANSLATOR_BITMAP || !bitmap->IsValid() ||
        GetNumber(mHeader + kDataSizeAt) != static_cast<uint32>(bitmap->BitsLength())) {
        return B_ILLEGAL_DATA;
    }
    mBitmap = std::move(bitmap);
    return B_OK;
}

ssize_t BBitmapStream::ReadAt(off_t position, void* buffer, size_t size) {
    off_t end = 0;
    GetSize(&end);
    if (position < 0 || buffer == nullptr) {
        return B_BAD_VALUE;
    }
    auto* out = static_cast<uint8*>(buffer);
    size_t done = 0;
    while (done < size && position < end) {
        const auto at = static_cast<size_t>(position);
        const bool inHeader = at < kHeaderSize;
        const size_t available = (inHeader ? kHeaderSize : static_cast<size_t>(end)) - at;
        const size_t count = std::min(size - done, available);
        const uint8* const from =
            inHeader ? mHeader + at : static_cast<const uint8*>(mBitmap->Bits()) + (at - kHeaderSize);
        memcpy(out + done, from, count);
        done += count;
        position += static_cast<off_t>(count);
    }
    return static_cast<ssize_t>(done);
}

ssize_t BBitmapStream::WriteAt(off_t position, const void* buffer, size_t size) {
    if (position < 0 || buffer == nullptr) {
        return B_BAD_VALUE;
    }
    const auto* in = static_cast<const uint8*>(buffer);
    size_t done = 0;
    while (done < size) {
        const size_t at = static_cast<size_t>(position) + done;
        if (at < kHeaderSize) {
            const size_t count = std::min(size - done, kHeaderSize - at);
            if (mBitmap == nullptr) {
                // The header arrives from its beginning on, in one piece or several.
                if (at > mHeaderFilled) {
                    return B_BAD_VALUE;
                }
                memcpy(mHeader + at, in + done, count);
                mHeaderFilled = std::max(mHeaderFilled, at + count);
            }
            done += count;
            if (mBitmap == nullptr && mHeaderFilled == kHeaderSize) {
                if (const status_t status = MakeBitmap(); status != B_OK) {
                    mHeaderFilled = 0;
                    return status;
                }
            }
            continue;
        }
        if (mBitmap == nullptr) {
            return B_BAD_VALUE;
        }
        const size_t offset = at - kHeaderSize;
        const auto length = static_cast<size_t>(mBitmap->BitsLength());
        if (offset >= length) {
            return done > 0 ? static_cast<ssize_t>(done) : B_BAD_VALUE;
        }
        const size_t count = std::min(size - done, length - offset);
        memcpy(static_cast<uint8*>(mBitmap->Bits()) + offset, in + done, count);
        done += count;
    }
    return static_cast<ssize_t>(done);
}

off_t BBitmapStream::Seek(off_t position, uint32 seekMode) {
    off_t base = 0;
    if (seekMode == SEEK_CUR) {
        base = mPosition;
    } else if (seekMode == SEEK_END) {
        GetSize(&base);
    } else if (seekMode != SEEK_SET) {
        return B_BAD_VALUE;
    }
    off_t target = 0;
    if (__builtin_add_overflow(base, position, &target) || target < 0) {
        return B_BAD_VALUE;
    }
    mPosition = target;
    return mPosition;
}

status_t BBitmapStream::GetSize(off_t* size) const {
    const bool whole = mBitmap != nullptr && mBitmap->IsValid();
    *size = whole ? static_cast<off_t>(kHeaderSize) + mBitmap->BitsLength() : 0;
    return B_OK;
}

status_t BBitmapStream::SetSize(off_t size) {
    off_t present = 0;
    GetSize(&present);
    // An empty stream may be told its size beforehand; it has it once the header is written.
    return size >= 0 && (present == 0 || size <= present) ? B_OK : B_BAD_VALUE;
}

status_t BBitmapStream::DetachBitmap(BBitmap** bitmap) {
    if (bitmap == nullptr) {
        return B_BAD_VALUE;
    }
    *bitmap = nullptr;
    if (mBitmap == nullptr) {
        return B_ERROR;
    }
    *bitmap = mBitmap.release();
    mHeaderFilled = 0;
    mPosition = 0;
    return B_OK;
}
