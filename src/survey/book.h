// What the survey library reads of a field book beyond its elements: the
// options stored at its parameter location, and its known points as a whole.
#pragma once

#include <optional>
#include <string>

#include "crs.h"

class CCarnet;

namespace carnet::survey {

// The projection name stored at the book's parameter location (m_ParamFile,
// which its option lines fill on loading); "Aucune" when none is stored.
std::string ProjectionName(const CCarnet& book);

// The book's system: Crs::FromBookName of its projection name.
Crs CrsOfBook(const CCarnet& book);

// The mean plan position of the book's points with known X and Y.
struct MeanPosition {
    double x = 0;
    double y = 0;
    int count = 0;  // points averaged, at least 1
};
// nullopt when no point has a known plan position.
std::optional<MeanPosition> MeanOfKnownPoints(const CCarnet& book);

}  // namespace carnet::survey
