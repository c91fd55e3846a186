#pragma once
// Reads a coordinate text back by the mask that formatted it (FormatCoord) and
// tells which places of such a text belong to which mask field.

#include <string>
#include <string_view>

namespace toolkit {

class CoordText {
public:
  // For each place of a text formatted by `mask`, the mask letter of the field
  // that covers it (D, M, S, d, m, s or $), or '\0' for a copied character. A run
  // of n letters covers n places, except '$', whose run is one letter wide.
  static std::string roles(std::string_view mask);

  // Signed decimal degrees: D + d + (M + m) / 60 + (S + s) / 3600, negative for
  // the hemisphere letters S (latitude) and W (longitude). Places the text does
  // not reach, and blanks, count as 0.
  static double parse(std::string_view mask, int kind, std::string_view text);

  // The hemisphere letters of a kind: "NS" for latitudes, "EW" for longitudes,
  // empty for anything else.
  static std::string_view hemispheres(int kind);

  static bool isFieldLetter(char c);
};

}  // namespace toolkit
