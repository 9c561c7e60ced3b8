// The library's functions of doubles are off by a bit in up to every fourth value: those of a wider type, rounded, are
// not. Powers of its widest type still are, in one of some hundreds.

#include "platform/arithmetic.h"

#include <boost/multiprecision/cpp_bin_float.hpp>
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

// What is not finite, or not far from that, is the library's.
double Power(double base, double exponent) {
  using boost::multiprecision::cpp_bin_float_quad;
  const double near = std::pow(base, exponent);
  if (!std::isnormal(near) || !std::isnormal(base) || !std::isnormal(exponent)) return near;
  const double magnitude = static_cast<double>(pow(cpp_bin_float_quad(std::abs(base)), cpp_bin_float_quad(exponent)));
  return std::copysign(magnitude, near);
}

}  // namespace qrex::platform
