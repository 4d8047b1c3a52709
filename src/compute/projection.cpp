#include <carnet/ccarnet.h>
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
    carnet_file::LineReader in(path.GetString());
    if (!in.IsOpen()) {
        ShowWarning(nullptr, carnet_texts::kCannotOpen, path.GetString());
        return;
    }
    // Lines are cut exactly as the loader cuts them; only the two projection
    // keywords are looked at, and nothing is stored.
    carnet_reader::LineCut cut;
    for (std::string_view line; in.Next(line);) {
        if (line.empty() || !carnet_reader::CutLine(line, cut)) continue;
        if (cut.keyword == "Option_Projec") {
            if (!cut.rest.empty()) {
                name = std::string(cut.rest);
                return;
            }
        } else if (cut.keyword == "Cal_Cor" && cut.Words().size() == 5) {
            const int zone = numconv::Atoi(std::string(cut.Words()[0]).c_str());
            if (zone >= 0 && zone <= 3) {
                name = carnet_texts::kLambertZones[zone];
                return;
            }
        }
    }
}
