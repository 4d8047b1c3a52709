// The subcommands of the tool. Each returns the exit status.
#pragma once

#include <string>
#include <vector>

#include <carnet/element_types.h>

namespace carnet_tool {

constexpr unsigned int kAnyType = CARNET_ANY_TYPE;  // the library's "every type"

// browse.cpp
int Check(const std::vector<std::string>& files);
int List(const std::string& path, bool numbers);
int Show(const std::string& path, const std::string& type, bool json);
int Find(const std::string& path, const std::string& name);
int Next(const std::string& path, const std::string& type);
int Select(const std::string& path, const std::string& selection);
int Options(const std::string& location);

// convert.cpp
int Format(const std::string& path, const std::string& output, bool backup, const std::string& params);
int Codes(const std::string& table, int version, const std::string& output);
int Interpret(const std::string& keyword, const std::string& text, const std::string& sep, int decimals);
int ListDrawingKeywords();

// export.cpp
int Export(const std::string& path, const std::string& format, const std::string& output,
           const std::string& crs);

// compute.cpp
int Compute(const std::string& path, bool json, const std::string& pointsCsv, const std::string& shotsCsv);

// projection.cpp
int ShowProjection(const std::string& path, const std::string& crs);

}  // namespace carnet_tool
