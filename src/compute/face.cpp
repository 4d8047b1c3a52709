#include <cmath>

#include <carnet/ccarnet.h>
#include <carnet/undef.h>

// A zenithal vertical angle beyond the half turn was read in the second face.

double CCarnet::avCD(double av) { return av > 200.0 ? 400.0 - av : av; }

double CCarnet::ahCD(double ah, double av) { return av > 200.0 ? std::fmod(ah + 200.0, 400.0) : ah; }

int CCarnet::setCD(double& ah, double& av) {
    if (!(av >= 200.0 && av <= 400.0)) return 0;
    av = 400.0 - av;
    if (!IsUndef(ah)) ah = std::fmod(ah + 200.0, 400.0);
    return 1;
}
