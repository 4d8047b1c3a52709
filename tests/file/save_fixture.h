// A scratch folder with its own parameter store for the option and saving
// tests, and helpers to see what a writer produced.
#pragma once

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <functional>
#include <string>

#include <carnet/carnet.h>

#include "host/params_internal.h"
#include "load_fixture.h"
#include "platform/store_fixture.h"

namespace save_test {

// What fn writes to a stream.
inline std::string Written(const std::function<void(std::FILE*)>& fn) {
    char* buffer = nullptr;
    size_t size = 0;
    std::FILE* f = open_memstream(&buffer, &size);
    EXPECT_NE(f, nullptr);
    if (!f) return {};
    fn(f);
    std::fclose(f);
    std::string out(buffer, size);
    std::free(buffer);
    return out;
}

// The text stored under a key, or "<none>".
inline std::string Stored(const std::string& location, const char* section, const char* key) {
    CString value;
    GetParamString(location.c_str(), section, key, "<none>", &value);
    return value.str();
}

// One option line as written: 8 blanks, the keyword in 16 columns, the
// blanks before the fields, the fields.
inline std::string OptionLine(const char* keyword, int blanks, const std::string& fields) {
    std::string line(8, ' ');
    line += keyword;
    line.append(16 - line.size() + 8, ' ');
    line.append(static_cast<size_t>(blanks), ' ');
    return line + fields + "\n";
}

class BookFileTest : public store_test::StoreTest {
protected:
    void SetUp() override {
        StoreTest::SetUp();
        carnet_params::ForgetLastLocation();
    }

    BoxCapture m_boxes;
};

}  // namespace save_test
