// Whole-file reading and crash-safe replacement for the small text stores
// (profile files and the registry emulation).
#pragma once

#include <cstdio>
#include <functional>
#include <string>

namespace carnet_storefile {

// Reads the whole file into out. Returns 0, or the errno of the failure
// (ENOENT for a missing file, EISDIR or EINVAL for what is not a regular
// file: a pipe could block and a device never end).
int ReadAll(const std::string& path, std::string& out);

// Replaces the file with data, whole or not at all, as CarnetWriteFile does
// (a link followed unless another user planted it in a sticky folder; an
// existing file keeps its permissions and owner; a new one gets newMode
// less the process umask). Returns 0, or the errno of the failure (the
// target is then untouched and no temporary file is left).
int ReplaceAtomically(const std::string& path, const std::string& data, unsigned int newMode);

// Writes the new bytes of a file to a stream; returns 0, or an errno.
using Filler = std::function<int(std::FILE*)>;
// The same replacement with the bytes that `fill` writes, as they come, to
// a stream on the temporary file (so that a large file is never held whole
// in memory). A failure of the stream itself counts as a failure of fill.
int ReplaceAtomicallyWith(const std::string& path, unsigned int newMode, const Filler& fill);
// Writes data to the stream: 0, or the errno of the failure.
int WriteAllTo(std::FILE* f, const std::string& data);

// Creates a folder and its missing parents. Returns 0, or the errno.
int MakeFolders(const std::string& path, unsigned int mode);

}  // namespace carnet_storefile
