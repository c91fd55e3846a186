// Sine and cosine of one angle together, by polynomials, for the set-up of a day's sums.
//
// The Windows C runtime's cosine costs about three times glibc's, and a day's set-up needs
// two angles per constituent; these need no library call and inline into the loops. They
// are not the C runtime's values: the sample loop allows for the difference (its error
// bound counts kSineCosineError per value).
#pragma once

#include <cstdint>

namespace br::tides {

// Angles up to this size (radians) reduce exactly enough; callers check before using.
inline constexpr double kSineCosineLimit = 1.0e5;

// Bound on the absolute error of either value for |x| <= kSineCosineLimit: 2^-51, about
// four units in the last place of numbers near 1 (measured: below two).
inline constexpr double kSineCosineError = 0x1p-51;

// sin x and cos x for finite |x| <= kSineCosineLimit.
inline void SineCosine(double x, double& sine, double& cosine) {
  // x = q pi/2 + r with |r| <= about pi/4: pi/2 in three parts, the first two of 33 bits, so
  // q times either is exact for |q| < 2^20 and r loses nothing to the subtraction.
  constexpr double kTwoOverPi = 0.6366197723675814;
  constexpr double kHalfPi1 = 0x1.921fb544p+0;
  constexpr double kHalfPi2 = 0x1.0b4611a6p-34;
  constexpr double kHalfPi3 = 0x1.3198a2e037073p-69;
  const double scaled = x * kTwoOverPi;
  // Rounded by truncation of +-0.5: no rounding-mode or magic-number tricks, which extended
  // precision (32-bit x87 builds) would defeat.
  const std::int32_t q = static_cast<std::int32_t>(scaled + (scaled < 0.0 ? -0.5 : 0.5));
  const double qd = static_cast<double>(q);
  const double r = ((x - qd * kHalfPi1) - qd * kHalfPi2) - qd * kHalfPi3;
  const double z = r * r;

  // Taylor series to r^17 and r^18: for |r| <= 0.8 the first term left out is below 1e-19.
  const double sinR =
      r + r * z *
              (-1.0 / 6.0 +
               z * (1.0 / 120.0 +
                    z * (-1.0 / 5040.0 +
                         z * (1.0 / 362880.0 +
                              z * (-1.0 / 39916800.0 +
                                   z * (1.0 / 6227020800.0 +
                                        z * (-1.0 / 1307674368000.0 + z * (1.0 / 355687428096000.0))))))));
  const double cosR =
      1.0 - 0.5 * z +
      z * z *
          (1.0 / 24.0 +
           z * (-1.0 / 720.0 +
                z * (1.0 / 40320.0 +
                     z * (-1.0 / 3628800.0 +
                          z * (1.0 / 479001600.0 +
                               z * (-1.0 / 87178291200.0 +
                                    z * (1.0 / 20922789888000.0 + z * (-1.0 / 6402373705728000.0))))))));

  // The quadrant by selects rather than a switch, so that loops over many angles vectorise.
  const bool odd = (q & 1) != 0;
  const double sineOfQuadrant = odd ? cosR : sinR;
  const double cosineOfQuadrant = odd ? sinR : cosR;
  sine = (q & 2) != 0 ? -sineOfQuadrant : sineOfQuadrant;
  cosine = ((q + 1) & 2) != 0 ? -cosineOfQuadrant : cosineOfQuadrant;
}

}  // namespace br::tides
