// Realistic field books for the benchmarks, the files they are kept in, and
// the reference loops that the library's own reading and writing are
// measured against.
#pragma once

#include <cstdio>
#include <functional>
#include <memory>
#include <string>

#include <carnet/ccarnet.h>

namespace bench {

// Fills an empty book with exactly `elements` elements in the proportions of
// a survey: set-ups of stations with their references and measures (some
// with eccentrics and drawing commands), known points, levelling runs,
// traverse paths, instruments, comments and commands. The same count always
// gives the same book.
void GenerateBook(CCarnet& book, int elements);

// Writes the lines of a book as Write(f, 1) does (option lines first, then
// each element numbered from 1), but straight through fprintf with the same
// formats, element by element: the cost of merely printing those bytes.
void WriteWithFprintf(const CCarnet& book, const std::string& optionLines, std::FILE* f);

// The option lines that Write puts before the elements.
std::string OptionLines(CCarnet& book);

// A book of a given size, written to a file once and loaded back from it
// (so the elements in memory are those a host has after opening the file).
struct BookFile {
    int elements = 0;
    std::string path;
    long long bytes = 0;
    long long lines = 0;
    std::unique_ptr<CCarnet> book;
    std::string optionLines;
};

// The book of that size, made on first use and kept for the whole run. The
// files live in one temporary folder, removed at exit.
BookFile& Book(int elements);

// A fresh file path in the run's temporary folder.
std::string TempPath(const std::string& name);

// Writes the whole of `data` to a file, replacing it.
void WriteFile(const std::string& path, const std::string& data);

// Everything `write` puts on a memory stream.
std::string ToMemory(const std::function<void(std::FILE*)>& write);

}  // namespace bench
