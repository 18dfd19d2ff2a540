#include <DataIO.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>

namespace {

// Repeats `move(offset)` until all bytes are moved. 0 means that the stream ends here.
template <typename Move>
status_t move_exactly(size_t size, size_t* bytesMoved, status_t partial, Move move) {
    size_t done = 0;
    status_t status = B_OK;
    while (done < size) {
        const ssize_t moved = move(done);
        if (moved <= 0) {
            status = moved < 0 ? static_cast<status_t>(moved) : partial;
            break;
        }
        done += static_cast<size_t>(moved);
    }
    if (bytesMoved != nullptr)
        *bytesMoved = done;
    return status;
}

// The position that a Seek() in a stream of this length leads to, or B_BAD_VALUE.
off_t seek_target(off_t current, off_t length, off_t position, uint32 seekMode) {
    off_t base = 0;
    if (seekMode == SEEK_CUR)
        base = current;
    else if (seekMode == SEEK_END)
        base = length;
    else if (seekMode != SEEK_SET)
        return B_BAD_VALUE;
    off_t target = 0;
    if (__builtin_add_overflow(base, position, &target) || target < 0)
        return B_BAD_VALUE;
    return target;
}

ssize_t read_from(const char* data, size_t length, off_t position, void* buffer, size_t size) {
    if (position < 0 || (buffer == nullptr && size > 0))
        return B_BAD_VALUE;
    const size_t start = static_cast<size_t>(position);
    if (start >= length || size == 0)
        return 0;
    const size_t count = std::min(size, length - start);
    std::memcpy(buffer, data + start, count);
    return static_cast<ssize_t>(count);
}

} // namespace

BDataIO::BDataIO() = default;

BDataIO::~BDataIO() = default;

ssize_t BDataIO::Read(void*, size_t) {
    return B_UNSUPPORTED;
}

ssize_t BDataIO::Write(const void*, size_t) {
    return B_UNSUPPORTED;
}

status_t BDataIO::Flush() {
    return B_OK;
}

status_t BDataIO::ReadExactly(void* buffer, size_t size, size_t* bytesMoved) {
    return move_exactly(size, bytesMoved, B_PARTIAL_READ,
                        [&](size_t done) { return Read(static_cast<char*>(buffer) + done, size - done); });
}

status_t BDataIO::WriteExactly(const void* buffer, size_t size, size_t* bytesMoved) {
    return move_exactly(size, bytesMoved, B_PARTIAL_WRITE, [&](size_t done) {
        return Write(static_cast<const char*>(buffer) + done, size - done);
    });
}

BPositionIO::BPositionIO() = default;

BPositionIO::~BPositionIO() = default;

ssize_t BPositionIO::Read(void* buffer, size_t size) {
    const off_t position = Position();
    const ssize_t count = ReadAt(position, buffer, size);
    if (count > 0)
        Seek(position + count, SEEK_SET);
    return count;
}

ssize_t BPositionIO::Write(const void* buffer, size_t size) {
    const off_t position = Position();
    const ssize_t count = WriteAt(position, buffer, size);
    if (count > 0)
        Seek(position + count, SEEK_SET);
    return count;
}

status_t BPositionIO::ReadAtExactly(off_t position, void* buffer, size_t size, size_t* bytesMoved) {
    return move_exactly(size, bytesMoved, B_PARTIAL_READ, [&](size_t done) {
        return ReadAt(position + static_cast<off_t>(done), static_cast<char*>(buffer) + done, size - done);
    });
}

status_t BPositionIO::WriteAtExactly(off_t position, const void* buffer, size_t size, size_t* bytesMoved) {
    return move_exactly(size, bytesMoved, B_PARTIAL_WRITE, [&](size_t done) {
        return WriteAt(position + static_cast<off_t>(done), static_cast<const char*>(buffer) + done,
                       size - done);
    });
}

status_t BPositionIO::SetSize(off_t) {
    return B_ERROR;
}

status_t BPositionIO::GetSize(off_t* size) const {
    if (size == nullptr)
        return B_BAD_VALUE;
    // Only the stream itself can move its position; it is put back before anybody can see.
    BPositionIO* const stream = const_cast<BPositionIO*>(this);
    const off_t position = Position();
    if (position < 0)
        return static_cast<status_t>(position);
    const off_t end = stream->Seek(0, SEEK_END);
    if (end < 0)
        return static_cast<status_t>(end);
    *size = end;
    const off_t back = stream->Seek(position, SEEK_SET);
    return back < 0 ? static_cast<status_t>(back) : B_OK;
}

BMallocIO::BMallocIO() = default;

BMallocIO::~BMallocIO() {
    std::free(mData);
}

ssize_t BMallocIO::ReadAt(off_t position, void* buffer, size_t size) {
    return read_from(mData, mLength, position, buffer, size);
}

ssize_t BMallocIO::WriteAt(off_t position, const void* buffer, size_t size) {
    if (position < 0 || (buffer == nullptr && size > 0))
        return B_BAD_VALUE;
    if (size == 0)
        return 0;
    const size_t start = static_cast<size_t>(position);
    size_t end = 0;
    if (__builtin_add_overflow(start, size, &end))
        return B_NO_MEMORY;
    if (end > mLength) {
        const status_t status = SetSize(static_cast<off_t>(end));
        if (status != B_OK)
            return status;
    }
    std::memcpy(mData + start, buffer, size);
    return static_cast<ssize_t>(size);
}

off_t BMallocIO::Seek(off_t position, uint32 seekMode) {
    const off_t target = seek_target(mPosition, static_cast<off_t>(mLength), position, seekMode);
    if (target >= 0)
        mPosition = target;
    return target;
}

off_t BMallocIO::Position() const {
    return mPosition;
}

status_t BMallocIO::SetSize(off_t size) {
    if (size < 0)
        return B_BAD_VALUE;
    const size_t length = static_cast<size_t>(size);
    if (length > mLength) {
        const status_t status = Reserve(length);
        if (status != B_OK)
            return status;
        std::memset(mData + mLength, 0, length - mLength);
    }
    mLength = length;
    return B_OK;
}

void BMallocIO::SetBlockSize(size_t blockSize) {
    mBlockSize = std::max<size_t>(blockSize, 1);
}

const void* BMallocIO::Buffer() const {
    return mLength > 0 ? mData : nullptr;
}

size_t BMallocIO::BufferLength() const {
    return mLength;
}

status_t BMallocIO::Reserve(size_t size) {
    if (size <= mCapacity)
        return B_OK;
    // Half as much again, so that many small writes do not copy the whole each time; then up to a whole
    // block.
    const size_t wanted = std::max(size, mCapacity + mCapacity / 2);
    const size_t spare = (mBlockSize - wanted % mBlockSize) % mBlockSize;
    size_t capacity = 0;
    if (__builtin_add_overflow(wanted, spare, &capacity) || capacity > PTRDIFF_MAX)
        return B_NO_MEMORY;
    void* const grown = std::realloc(mData, capacity);
    if (grown == nullptr)
        return B_NO_MEMORY;
    mData = static_cast<char*>(grown);
    mCapacity = capacity;
    return B_OK;
}

BMemoryIO::BMemoryIO(void* buffer, size_t size)
    : mData(static_cast<const char*>(buffer)), mWritable(static_cast<char*>(buffer)), mLength(size),
      mCapacity(size) {}

BMemoryIO::BMemoryIO(const void* buffer, size_t size)
    : mData(static_cast<const char*>(buffer)), mWritable(nullptr), mLength(size), mCapacity(size) {}

BMemoryIO::~BMemoryIO() = default;

ssize_t BMemoryIO::ReadAt(off_t position, void* buffer, size_t size) {
    return read_from(mData, mLength, position, buffer, size);
}

ssize_t BMemoryIO::WriteAt(off_t position, const void* buffer, size_t size) {
    if (mWritable == nullptr)
        return B_NOT_ALLOWED;
    if (position < 0 || (buffer == nullptr && size > 0))
        return B_BAD_VALUE;
    const size_t start = static_cast<size_t>(position);
    if (start >= mCapacity || size == 0)
        return 0;
    const size_t count = std::min(size, mCapacity - start);
    if (start > mLength)
        std::memset(mWritable + mLength, 0, start - mLength);
    std::memcpy(mWritable + start, buffer, count);
    mLength = std::max(mLength, start + count);
    return static_cast<ssize_t>(count);
}

off_t BMemoryIO::Seek(off_t position, uint32 seekMode) {
    const off_t target = seek_target(mPosition, static_cast<off_t>(mLength), position, seekMode);
    if (target >= 0)
        mPosition = target;
    return target;
}

off_t BMemoryIO::Position() const {
    return mPosition;
}

status_t BMemoryIO::SetSize(off_t size) {
    if (mWritable == nullptr)
        return B_NOT_ALLOWED;
    if (size < 0)
        return B_BAD_VALUE;
    const size_t length = static_cast<size_t>(size);
    if (length > mCapacity)
        return B_ERROR;
    if (length > mLength)
        std::memset(mWritable + mLength, 0, length - mLength);
    mLength = length;
    return B_OK;
}
