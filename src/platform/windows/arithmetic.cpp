// The library's functions of doubles are off by a bit in up to every fourth value: those of a wider type, rounded, are
// not.

#include "platform/arithmetic.h"

#include <cmath>

namespace qrex::platform {

namespace {

using Wider = long double;

}  // namespace

double Sine(double x) { return static_cast<double>(std::sin(Wider{x})); }
double Cosine(double x) { return static_cast<double>(std::cos(Wider{x})); }
double Tangent(double x) { return static_cast<double>(std::tan(Wider{x})); }
double Exponential(double x) { return static_cast<double>(std::exp(Wider{x})); }
double Logarithm(double x) { return static_cast<double>(std::log(Wider{x})); }
double Power(double base, double exponent) { return static_cast<double>(std::pow(Wider{base}, Wider{exponent})); }

}  // namespace qrex::platform
