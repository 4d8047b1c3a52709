#include "file/line_reader_internal.h"

#include <sys/stat.h>

#include <cstdlib>

namespace carnet_file {

LineReader::LineReader(const char* path) {
    if (!path) return;
    m_f = std::fopen(path, "r");
    if (!m_f) return;
    struct stat st;
    if (fstat(fileno(m_f), &st) != 0 || S_ISDIR(st.st_mode)) {
        std::fclose(m_f);
        m_f = nullptr;
    }
}

LineReader::~LineReader() {
    std::free(m_buf);
    if (m_f) std::fclose(m_f);
}

bool LineReader::Next(std::string_view& line) {
    if (!m_f) return false;
    ssize_t n = getline(&m_buf, &m_cap, m_f);
    if (n <= 0) return false;
    size_t len = static_cast<size_t>(n);
    if (m_buf[len - 1] == '\n') {
        --len;
        if (len > 0 && m_buf[len - 1] == '\r') --len;
    }
    line = std::string_view(m_buf, len);
    return true;
}

}  // namespace carnet_file
