// Elements of a book shown one a row: position, keyword, point number, code
// and display text, as aligned columns or as JSON.
#pragma once

#include <string>
#include <vector>

#include <carnet/ccarnet.h>

namespace carnet_tool {

// The type code named on the command line by its number (one of the type
// table) or by one of its keywords; false, with a message, for anything else.
bool TypeNamed(const std::string& arg, unsigned int& code);

// Rows of the elements at the positions added, printed on standard output.
class ElementRows {
public:
    explicit ElementRows(CCarnet& book) : m_book(book) {}

    void Add(int i) { m_rows.push_back(i); }
    bool Empty() const { return m_rows.empty(); }
    long Count() const { return static_cast<long>(m_rows.size()); }
    // Columns padded to their widest entry; trailing blanks dropped.
    void PrintColumns();
    // A JSON array of objects, one a line.
    void PrintJson();

private:
    CCarnet& m_book;
    std::vector<int> m_rows;
};

// A text as a JSON string (quoted, escaped, UTF-8) from code page 1252.
std::string JsonString(const std::string& cp1252);

}  // namespace carnet_tool
