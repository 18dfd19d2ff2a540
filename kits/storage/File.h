// BFile: an open file with its contents.
#pragma once

#include <DataIO.h>
#include <Node.h>

// Opening a symbolic link opens the file that it names. Copies share the open file and its position, as
// copies of a file descriptor do: one thread at a time for all of them.
//
// Read and write answer the number of bytes moved, or B_NO_INIT, B_NOT_ALLOWED (opened for the other only),
// B_BAD_VALUE (null buffer, negative position), B_DEVICE_FULL, ... Opening answers B_BAD_VALUE for a mode
// that is none, B_ENTRY_NOT_FOUND, B_FILE_EXISTS (with B_FAIL_IF_EXISTS), B_IS_A_DIRECTORY where writing was
// asked for, B_PERMISSION_DENIED, B_READ_ONLY_DEVICE.
class BFile : public BNode, public BPositionIO {
  public:
    BFile();
    BFile(const entry_ref* ref, uint32 openMode);
    BFile(const BEntry* entry, uint32 openMode);
    BFile(const char* path, uint32 openMode);
    BFile(const BDirectory* directory, const char* path, uint32 openMode);
    BFile(const BFile& other);
    BFile& operator=(const BFile& other);
    ~BFile() override;

    status_t SetTo(const entry_ref* ref, uint32 openMode);
    status_t SetTo(const BEntry* entry, uint32 openMode);
    status_t SetTo(const char* path, uint32 openMode);
    status_t SetTo(const BDirectory* directory, const char* path, uint32 openMode);
    void Unset();

    bool IsReadable() const;
    bool IsWritable() const;

    // With B_OPEN_AT_END every Write() appends.
    ssize_t Read(void* buffer, size_t size) override;
    ssize_t ReadAt(off_t position, void* buffer, size_t size) override;
    ssize_t Write(const void* buffer, size_t size) override;
    ssize_t WriteAt(off_t position, const void* buffer, size_t size) override;

    off_t Seek(off_t position, uint32 seekMode) override;
    off_t Position() const override;
    // The position stays; bytes that come into being are zero.
    status_t SetSize(off_t size) override;
    status_t GetSize(off_t* size) const override;

  private:
    // Position and mode, one for a file and its copies.
    struct OpenFile;

    std::shared_ptr<OpenFile> mFile;
};
