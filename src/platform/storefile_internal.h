// Whole-file reading and crash-safe replacement for the small text stores
// (profile files and the registry emulation).
#pragma once

#include <cstdio>
#include <functional>
#include <string>

namespace carnet_storefile {

// Reads the whole file into out. Returns 0, or the errno of the failure
// (ENOENT for a missing file).
int ReadAll(const std::string& path, std::string& out);

// Replaces the file with data: the bytes go to a temporary file in the same
// folder, are flushed to disk, and the temporary file is then renamed over the
// target, so readers and a crash see either the old store or the new one,
// never a mix. A symbolic link is followed and its target replaced. An
// existing file keeps its permissions and owner; a new one gets newMode less
// the process umask. Returns 0, or the errno of the failure (the target is
// then untouched and no temporary file is left).
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
