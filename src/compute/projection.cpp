#include <carnet/ccarnet.h>
#include <carnet/fileio.h>
#include <carnet/messages.h>
#include <carnet/numconv.h>

#include "file/file_texts_internal.h"
#include "file/line_reader_internal.h"
#include "file/reader_internal.h"

void CCarnet::Projection(const CString& fileName, CString& name) {
    name.Empty();
    const CString given = fileName;  // may be m_FileName itself
    if (given.IsEmpty() && !FileOpen(m_FileName, nullptr)) return;
    const CString path = given.IsEmpty() ? m_FileName : given;
    CarnetFileBytes bytes;
    if (bytes.Read(path.GetString()) != 0) {
        ShowWarning(nullptr, carnet_texts::kCannotOpen, path.GetString());
        return;
    }
    ProjectionOfBytes(bytes.View(), name);
}

void CCarnet::ProjectionOfBytes(std::string_view bytes, CString& name) {
    name.Empty();
    // Lines are cut exactly as the loader cuts them; only the two projection
    // keywords are looked at, and nothing is stored. The first that names
    // one ends the search.
    carnet_reader::LineCut cut;
    carnet_file::ForEachLine(bytes, [&](std::string_view line, size_t) {
        if (line.empty() || !carnet_reader::CutLine(line, cut)) return true;
        if (cut.keyword == "Option_Projec") {
            if (!cut.rest.empty()) name = std::string(cut.rest);
        } else if (cut.keyword == "Cal_Cor" && cut.Words().size() == 5) {
            const int zone = numconv::Atoi(std::string(cut.Words()[0]).c_str());
            if (zone >= 0 && zone <= 3) name = carnet_texts::kLambertZones[zone];
        }
        return name.IsEmpty();
    });
}
