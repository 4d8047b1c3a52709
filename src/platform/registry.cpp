#include <carnet/registry.h>

#include <cerrno>
#include <cstdlib>
#include <pwd.h>
#include <unistd.h>
#include <utility>
#include <vector>

#include <carnet/cp1252.h>

#include "platform/storefile_internal.h"

namespace {

std::string& ChosenFolder() {
    static std::string folder;
    return folder;
}

std::string HomeFolder() {
    const char* home = std::getenv("HOME");
    if (home && *home) return home;
    const struct passwd* pw = ::getpwuid(::getuid());
    return pw && pw->pw_dir ? pw->pw_dir : "";
}

using Path = std::vector<std::string>;

struct Key {
    Path path;
    std::vector<std::pair<std::string, std::string>> values;
};

bool SameName(const std::string& a, const std::string& b) {
    return cp1252::CompareNoCase(a.c_str(), b.c_str()) == 0;
}

bool SamePath(const Path& a, const Path& b) {
    if (a.size() != b.size()) return false;
    for (size_t i = 0; i < a.size(); ++i)
        if (!SameName(a[i], b[i])) return false;
    return true;
}

// Key paths as the registry reads them: names between backslashes, where
// doubled, leading and trailing backslashes name nothing.
Path SplitPath(const std::string& text) {
    Path path;
    size_t pos = 0;
    while (pos <= text.size()) {
        size_t stop = text.find('\\', pos);
        if (stop == std::string::npos) stop = text.size();
        if (stop > pos) path.push_back(text.substr(pos, stop - pos));
        pos = stop + 1;
    }
    return path;
}

// The file holds only printable ASCII: every other byte, and the bytes that
// delimit names and values, are written %XX.
std::string Escape(const std::string& text) {
    static const char hex[] = "0123456789ABCDEF";
    std::string out;
    out.reserve(text.size());
    for (char ch : text) {
        unsigned char c = static_cast<unsigned char>(ch);
        if (c < 0x20 || c >= 0x7F || c == '%' || c == '"' || c == '\\' || c == '[' || c == ']' || c == '=') {
            out += '%';
            out += hex[c >> 4];
            out += hex[c & 0xF];
        } else {
            out += ch;
        }
    }
    return out;
}

int HexDigit(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    return -1;
}

std::string Unescape(const std::string& text) {
    std::string out;
    out.reserve(text.size());
    for (size_t i = 0; i < text.size(); ++i) {
        int hi = -1, lo = -1;
        if (text[i] == '%' && i + 2 < text.size() && (hi = HexDigit(text[i + 1])) >= 0 &&
            (lo = HexDigit(text[i + 2])) >= 0) {
            out += static_cast<char>(hi * 16 + lo);
            i += 2;
        } else {
            out += text[i];
        }
    }
    return out;
}

Key* FindKey(std::vector<Key>& keys, const Path& path) {
    for (Key& key : keys)
        if (SamePath(key.path, path)) return &key;
    return nullptr;
}

std::string* FindValue(Key& key, const std::string& name) {
    for (auto& value : key.values)
        if (SameName(value.first, name)) return &value.second;
    return nullptr;
}

// Lines are "[name\name]" for a key and "\"name\"=\"value\"" for a value of
// the key above; anything else is skipped. A name met twice keeps its first
// value, as for every other store of the library.
std::vector<Key> Parse(const std::string& text) {
    std::vector<Key> keys;
    Key* current = nullptr;
    size_t pos = 0;
    while (pos < text.size()) {
        size_t stop = text.find('\n', pos);
        if (stop == std::string::npos) stop = text.size();
        std::string line = text.substr(pos, stop - pos);
        pos = stop + 1;
        if (!line.empty() && line.back() == '\r') line.pop_back();
        if (line.size() >= 2 && line.front() == '[' && line.back() == ']') {
            Path path;
            for (const std::string& name : SplitPath(line.substr(1, line.size() - 2))) path.push_back(Unescape(name));
            current = FindKey(keys, path);
            if (!current) {
                keys.push_back(Key{path, {}});
                current = &keys.back();
            }
            continue;
        }
        // "name"="value": the name's closing quote, '=', the value's quotes.
        size_t nameEnd = line.find('"', 1);
        if (!current || line.front() != '"' || nameEnd == std::string::npos || line.size() <= nameEnd + 3 ||
            line.compare(nameEnd + 1, 2, "=\"") != 0 || line.back() != '"')
            continue;
        std::string name = Unescape(line.substr(1, nameEnd - 1));
        if (!FindValue(*current, name))
            current->values.emplace_back(name, Unescape(line.substr(nameEnd + 3, line.size() - nameEnd - 4)));
    }
    return keys;
}

std::string Serialize(const std::vector<Key>& keys) {
    std::string out;
    for (const Key& key : keys) {
        out += '[';
        for (size_t i = 0; i < key.path.size(); ++i) {
            if (i) out += '\\';
            out += Escape(key.path[i]);
        }
        out += "]\n";
        for (const auto& value : key.values) out += "\"" + Escape(value.first) + "\"=\"" + Escape(value.second) + "\"\n";
    }
    return out;
}

// The file of a root: its name in capitals, so that roots match without
// regard to case, and only letters, digits and '_' so that it cannot name
// a file outside the folder.
int RootFile(const char* root, std::string& file) {
    std::string name(root ? root : "");
    if (name.empty()) return EINVAL;
    for (char& c : name) {
        if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
        bool plain = (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_';
        if (!plain) return EINVAL;
    }
    file = RegistryFolder() + "/" + name + ".txt";
    return 0;
}

}  // namespace

void SetRegistryFolder(const char* dir) { ChosenFolder() = dir ? dir : ""; }

std::string RegistryFolder() {
    if (!ChosenFolder().empty()) return ChosenFolder();
    const char* xdg = std::getenv("XDG_CONFIG_HOME");
    // Relative values are to be ignored, as every program reading this
    // variable does.
    if (xdg && xdg[0] == '/') return std::string(xdg) + "/carnet/registry";
    return HomeFolder() + "/.config/carnet/registry";
}

int RegistryGetString(const char* root, const char* keyPath, const char* name, std::string& value) {
    value.clear();
    std::string file, text;
    if (int err = RootFile(root, file)) return err;
    if (int err = carnet_storefile::ReadAll(file, text)) return err;
    std::vector<Key> keys = Parse(text);
    Key* key = FindKey(keys, SplitPath(keyPath ? keyPath : ""));
    const std::string* found = key ? FindValue(*key, name ? name : "") : nullptr;
    if (!found) return ENOENT;
    value = *found;
    return 0;
}

int RegistrySetString(const char* root, const char* keyPath, const char* name, const char* value) {
    std::string file, text;
    if (int err = RootFile(root, file)) return err;
    int err = carnet_storefile::ReadAll(file, text);
    if (err && err != ENOENT) return err;
    std::vector<Key> keys = Parse(text);
    Path path = SplitPath(keyPath ? keyPath : "");
    Key* key = FindKey(keys, path);
    if (!key) {
        keys.push_back(Key{path, {}});
        key = &keys.back();
    }
    std::string valueName(name ? name : "");
    if (std::string* held = FindValue(*key, valueName))
        *held = value ? value : "";
    else
        key->values.emplace_back(valueName, value ? value : "");
    if (int made = carnet_storefile::MakeFolders(RegistryFolder(), 0700)) return made;
    return carnet_storefile::ReplaceAtomically(file, Serialize(keys), 0600);
}
