#include <carnet/params.h>

#include <string>
#include <sys/stat.h>

#include <carnet/cp1252.h>
#include <carnet/cstring.h>
#include <carnet/messages.h>
#include <carnet/numconv.h>
#include <carnet/profile.h>
#include <carnet/registry.h>

#include "host/params_internal.h"

namespace {

// Tried in this order; the first that begins the location wins.
const char* const kRegistryRoots[] = {
    "HKEY_LOCAL_MACHINE", "HKEY_CURRENT_USER",   "HKEY_CLASSES_ROOT", "HKEY_USERS",
    "HKEY_PERFORMANCE_DATA", "HKEY_CURRENT_CONFIG", "HKEY_DYN_DATA",
};

// The four reports of a profile write that failed.
const char kNullName[] = "Pointeur nul pour le fichier de param\xE8tres !\n(Code d'erreur %d)";
const char kNoName[] = "Pas de nom pour le fichier de param\xE8tres !\n(Code d'erreur %d)";
const char kNoFile[] = "%s :\nFichier de param\xE8tres inexistant !\n(Code d'erreur %d)";
const char kNotSaved[] = "%s :\nSauvegarde des param\xE8tres imposssible !\n(Code d'erreur %d)";

// The location of the last profile write, successful or reported: a failure
// on it is not reported again, so that a store that cannot be written does
// not raise one box per value.
std::string& LastLocation() {
    static std::string location;
    return location;
}

// The registry root that begins the location, or null for a profile; keyPath
// receives the rest, without one leading backslash.
const char* RegistryRoot(const char* location, std::string& keyPath) {
    if (!location) return nullptr;
    const std::string text(location);
    for (const char* root : kRegistryRoots) {
        const std::string name(root);
        if (text.size() < name.size() || CString(text.substr(0, name.size())).CompareNoCase(root) != 0) continue;
        keyPath = text.substr(name.size());
        if (!keyPath.empty() && keyPath[0] == '\\') keyPath.erase(0, 1);
        return root;
    }
    return nullptr;
}

std::string KeyOf(const std::string& keyPath, const char* section) {
    std::string name(section ? section : "");
    if (keyPath.empty()) return name;
    if (name.empty()) return keyPath;
    return keyPath + "\\" + name;
}

// The stored text, or def when there is none. Returns false when the default
// was given for a registry location (a profile always counts as read).
bool ReadText(const char* location, const char* section, const char* key, const std::string& def,
              std::string& text) {
    std::string keyPath;
    if (const char* root = RegistryRoot(location, keyPath)) {
        if (RegistryGetString(root, KeyOf(keyPath, section).c_str(), key, text) == 0) return true;
        text = def;
        return false;
    }
    if (!ProfileReadString(location, section, key, text)) text = def;
    return true;
}

void ReportFailure(const char* location, int code) {
    const std::string name(location ? location : "");
    if (cp1252::CompareNoCase(name.c_str(), LastLocation().c_str()) == 0) return;
    struct stat st;
    if (!location)
        ShowWarning(nullptr, kNullName, code);
    else if (name.empty())
        ShowWarning(nullptr, kNoName, code);
    else if (::stat(location, &st) != 0)
        ShowWarning(nullptr, kNoFile, location, code);
    else
        ShowWarning(nullptr, kNotSaved, location, code);
    LastLocation() = name;
}

int WriteText(const char* location, const char* section, const char* key, const char* value) {
    std::string keyPath;
    if (const char* root = RegistryRoot(location, keyPath)) {
        if (keyPath.empty() && (!section || !*section)) return 0;
        return RegistrySetString(root, KeyOf(keyPath, section).c_str(), key, value) == 0 ? 1 : 0;
    }
    if (int err = ProfileWriteString(location, section, key, value)) {
        ReportFailure(location, err);
        return 0;
    }
    LastLocation() = location ? location : "";
    return 1;
}

template <typename T>
T Clamp(T v, T min, T max) {
    if (v < min) v = min;
    if (v > max) v = max;
    return v;
}

}  // namespace

namespace carnet_params {

void ForgetLastLocation() { LastLocation().clear(); }

}  // namespace carnet_params

int GetParamInt(const char* location, const char* section, const char* key, int def, int min, int max, int* value) {
    std::string text;
    ReadText(location, section, key, numconv::Format("%d", def), text);
    if (value) *value = Clamp(numconv::Atoi(text.c_str()), min, max);
    return text.empty() ? 0 : 1;
}

int GetParamDouble(const char* location, const char* section, const char* key, double def, double min, double max,
                   double* value) {
    std::string text;
    ReadText(location, section, key, numconv::Format("%f", def), text);
    if (value) *value = Clamp(numconv::Atof(text.c_str()), min, max);
    return text.empty() ? 0 : 1;
}

int GetParamString(const char* location, const char* section, const char* key, const char* def, CString* value) {
    std::string text;
    bool read = ReadText(location, section, key, def ? def : "", text);
    if (value) *value = text;
    return read ? 1 : 0;
}

int SetParamString(const char* location, const char* section, const char* key, const CString& value) {
    return WriteText(location, section, key, value);
}

int SetParamString(const char* location, const char* section, const char* key, const char* value) {
    return WriteText(location, section, key, value);
}

int SetParamDouble(const char* location, const char* section, const char* key, double value) {
    return WriteText(location, section, key, numconv::Format("%f", value).c_str());
}
