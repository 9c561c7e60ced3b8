#include "platform/arithmetic.h"

#include <cmath>

namespace qrex::platform {

double Sine(double x) { return std::sin(x); }
double Cosine(double x) { return std::cos(x); }
double Tangent(double x) { return std::tan(x); }
double Exponential(double x) { return std::exp(x); }
double Logarithm(double x) { return std::log(x); }
double Power(double base, double exponent) { return std::pow(base, exponent); }

}  // namespace qrex::platform
