// Limits, open modes and node flavours that files and attributes share.
#pragma once

#include <SupportDefs.h>

#include <fcntl.h>
#include <sys/stat.h>

// Sizes of buffers, with the terminating zero.
inline constexpr size_t B_DEV_NAME_LENGTH = 128;
inline constexpr size_t B_FILE_NAME_LENGTH = 256;
// This host's limit.
inline constexpr size_t B_PATH_NAME_LENGTH = 4096;
// Without the terminating zero.
inline constexpr size_t B_ATTR_NAME_LENGTH = B_FILE_NAME_LENGTH - 1;
// With the terminating zero: a type must fit into an attribute's name beside a prefix.
inline constexpr size_t B_MIME_TYPE_LENGTH = B_ATTR_NAME_LENGTH - 15;
// How many symbolic links a path may lead through.
inline constexpr int32 B_MAX_SYMLINKS = 16;

// Open modes. One of the first three, with any of the others. These are the platform's values, not those of
// this host's O_... flags; <File.h> translates.
inline constexpr uint32 B_READ_ONLY = 0x0000;
inline constexpr uint32 B_WRITE_ONLY = 0x0001;
inline constexpr uint32 B_READ_WRITE = 0x0002;
inline constexpr uint32 B_FAIL_IF_EXISTS = 0x0100;
inline constexpr uint32 B_CREATE_FILE = 0x0200;
inline constexpr uint32 B_ERASE_FILE = 0x0400;
inline constexpr uint32 B_OPEN_AT_END = 0x0800;

enum node_flavor {
    B_FILE_NODE = 0x01,
    B_SYMLINK_NODE = 0x02,
    B_DIRECTORY_NODE = 0x04,
    B_ANY_NODE = 0x07,
};
