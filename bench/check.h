// A check run before the measurements: the lookups that were made fast still
// give what a plain scan gives, on a book long enough for every path of
// their loops.
#pragma once

namespace bench {

// False (and a message on stderr) at the first difference.
bool CheckLookups();

}  // namespace bench
