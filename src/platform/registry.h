// File-backed registry: named roots, each holding keys (paths of names
// separated by backslashes) that hold named string values. Each root is one
// text file in the registry folder; key and value names match without regard
// to case, and values come back exactly as stored, whatever bytes they hold.
#pragma once

#include <string>

// Sets the folder of the root files; a null or empty folder restores the
// default, $XDG_CONFIG_HOME/carnet/registry, else ~/.config/carnet/registry.
void SetRegistryFolder(const char* dir);
// The folder in use.
std::string RegistryFolder();

// Reads the value name of the key keyPath under root. Returns 0 with the
// value, or ENOENT (2) when the root, the key or the value does not exist, or
// the errno of a file that cannot be read. An empty key path is the root
// itself; a null text reads as empty.
int RegistryGetString(const char* root, const char* keyPath, const char* name, std::string& value);

// Stores the value, creating the key (and the folder of the roots) when
// needed. Returns 0, or the errno of the failure (EINVAL for a root name that
// is not a plain file name).
int RegistrySetString(const char* root, const char* keyPath, const char* name, const char* value);
