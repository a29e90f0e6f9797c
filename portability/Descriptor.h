#pragma once

#include <cstddef>

/// The system's calls on open files. Each sets `error` to the system's error number at the first failure
/// and leaves it alone otherwise.
namespace Descriptor {

/// A file descriptor, or -1. A directory counts as a failure.
int openForReading(const char* path);
/// Whether a file can be opened for reading; never waits, also not for the writer of a pipe.
bool isReadable(const char* path);
/// Empties the file or makes it. `append` keeps what is there and writes behind it.
int openForWriting(const char* path, bool append = false);
/// The number of bytes read: 0 at the end of the file, -1 on failure.
long read(int descriptor, char* buffer, std::size_t size, int& error);
/// Writes all of it; false on failure.
bool write(int descriptor, const char* data, std::size_t size, int& error);
void close(int descriptor, int& error);

}  // namespace Descriptor
