// Functions that the library of each system computes: the same values on all of them, but for the last bit where two
// doubles are almost equally near.
#pragma once

namespace qrex::platform {

double Sine(double x);
double Cosine(double x);
double Tangent(double x);
double Exponential(double x);
double Logarithm(double x);
double Power(double base, double exponent);

}  // namespace qrex::platform
