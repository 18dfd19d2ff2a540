// BBitmapStream: a bitmap as a stream in the common form of pictures.
#pragma once

#include <DataIO.h>
#include <TranslatorFormats.h>

#include <memory>

class BBitmap;

// Reading gives the header and the pixels of the bitmap. Writing to a stream without a bitmap makes one, as
// soon as its header is there. One thread at a time.
class BBitmapStream : public BPositionIO {
  public:
    // Takes the bitmap over; null for an empty stream.
    explicit BBitmapStream(BBitmap* bitmap = nullptr);
    ~BBitmapStream() override;

    ssize_t ReadAt(off_t position, void* buffer, size_t size) override;
    // B_ILLEGAL_DATA for a header that makes no bitmap, B_NO_MEMORY; bytes beyond the bitmap's end are
    // refused with B_BAD_VALUE. The header of a bitmap that is there is not written over.
    ssize_t WriteAt(off_t position, const void* buffer, size_t size) override;
    off_t Seek(off_t position, uint32 seekMode) override;
    off_t Position() const override { return mPosition; }
    status_t GetSize(off_t* size) const override;
    // A stream grows by its header alone: B_OK up to its size, else B_BAD_VALUE.
    status_t SetSize(off_t size) override;

    // Hands the bitmap to the caller; the stream is empty afterwards. B_ERROR when there is none.
    [[nodiscard]] status_t DetachBitmap(BBitmap** bitmap);

  private:
    static constexpr size_t kHeaderSize = 32;

    void MakeHeader();
    status_t MakeBitmap();

    uint8 mHeader[kHeaderSize] = {};
    size_t mHeaderFilled = 0;
    off_t mPosition = 0;
    std::unique_ptr<BBitmap> mBitmap;
};
