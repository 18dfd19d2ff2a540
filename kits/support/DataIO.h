// Byte streams: the abstract BDataIO and BPositionIO, and the two that live in memory.
#pragma once

#include <SupportDefs.h>

#include <stdio.h>

// Something that bytes are read from and written to, one after the other.
// Reading and writing answer the number of bytes moved, 0 at the end, or a negative status.
// The classes here are not synchronised: one thread at a time.
class BDataIO {
  public:
    BDataIO();
    virtual ~BDataIO();
    BDataIO(const BDataIO&) = delete;
    BDataIO& operator=(const BDataIO&) = delete;

    virtual ssize_t Read(void* buffer, size_t size);
    virtual ssize_t Write(const void* buffer, size_t size);
    virtual status_t Flush();

    // Move all `size` bytes or fail with B_PARTIAL_READ, B_PARTIAL_WRITE or the stream's own error.
    // `bytesMoved`, when given, receives the number of bytes moved in either case.
    [[nodiscard]] status_t ReadExactly(void* buffer, size_t size, size_t* bytesMoved = nullptr);
    [[nodiscard]] status_t WriteExactly(const void* buffer, size_t size, size_t* bytesMoved = nullptr);
};

// A stream with a position, counted in bytes from 0. Read() and Write() work at the position and move it;
// ReadAt() and WriteAt() leave it where it is.
class BPositionIO : public BDataIO {
  public:
    BPositionIO();
    ~BPositionIO() override;

    ssize_t Read(void* buffer, size_t size) override;
    ssize_t Write(const void* buffer, size_t size) override;

    virtual ssize_t ReadAt(off_t position, void* buffer, size_t size) = 0;
    virtual ssize_t WriteAt(off_t position, const void* buffer, size_t size) = 0;

    [[nodiscard]] status_t ReadAtExactly(off_t position, void* buffer, size_t size,
                                         size_t* bytesMoved = nullptr);
    [[nodiscard]] status_t WriteAtExactly(off_t position, const void* buffer, size_t size,
                                          size_t* bytesMoved = nullptr);

    // `seekMode` is SEEK_SET, SEEK_CUR or SEEK_END. Answers the new position, or B_BAD_VALUE when that would
    // be negative or the mode is none of these.
    virtual off_t Seek(off_t position, uint32 seekMode) = 0;
    virtual off_t Position() const = 0;

    // The base class cannot be resized and answers B_ERROR.
    virtual status_t SetSize(off_t size);
    virtual status_t GetSize(off_t* size) const;
};

// A stream in memory that grows as it is written. Bytes between the old end and a write beyond it are zero.
class BMallocIO : public BPositionIO {
  public:
    BMallocIO();
    ~BMallocIO() override;

    ssize_t ReadAt(off_t position, void* buffer, size_t size) override;
    ssize_t WriteAt(off_t position, const void* buffer, size_t size) override;

    off_t Seek(off_t position, uint32 seekMode) override;
    off_t Position() const override;
    // B_BAD_VALUE for a negative size, B_NO_MEMORY when there is not that much; the contents stay then.
    status_t SetSize(off_t size) override;

    // Memory grows in steps of this many bytes; 256 at first.
    void SetBlockSize(size_t blockSize);

    // The bytes, owned by the stream and valid until it is next written or resized; null while it is empty.
    const void* Buffer() const;
    size_t BufferLength() const;

  private:
    status_t Reserve(size_t size);

    size_t mBlockSize = 256;
    size_t mCapacity = 0;
    size_t mLength = 0;
    char* mData = nullptr;
    off_t mPosition = 0;
};

// A stream over memory that the caller owns and keeps alive. It does not grow: writing stops at the end of
// the memory. Made from const memory it is read-only: writing and resizing answer B_NOT_ALLOWED.
class BMemoryIO : public BPositionIO {
  public:
    BMemoryIO(void* buffer, size_t size);
    BMemoryIO(const void* buffer, size_t size);
    ~BMemoryIO() override;

    ssize_t ReadAt(off_t position, void* buffer, size_t size) override;
    ssize_t WriteAt(off_t position, const void* buffer, size_t size) override;

    off_t Seek(off_t position, uint32 seekMode) override;
    off_t Position() const override;
    // Up to the size of the memory; B_ERROR beyond it.
    status_t SetSize(off_t size) override;

  private:
    const char* mData;
    char* mWritable;
    size_t mLength;
    size_t mCapacity;
    off_t mPosition = 0;
};
