#include "tools/tidefiles/constituent_names.h"

#include <cctype>
#include <string>
#include <vector>

#include "tides/engine/TideEngine.h"

namespace br::tidefiles {
namespace {

struct NamedRow {
  int row;
  std::string_view name;  // the first entry of a row is its usual name
};

constexpr NamedRow kNamedRows[] = {
    {0, "Z0"},       {0, "ZO"},       {1, "Sa"},       {2, "Ssa"},      {3, "Mm"},
    {4, "MSf"},      {5, "Mf"},       {6, "Q1"},       {7, "rho1"},     {7, "RHO"},
    {7, "\xCF\x81" "1"},              {8, "O1"},       {9, "tau1"},     {9, "\xCF\x84" "1"},
    {10, "M1"},      {11, "chi1"},    {11, "\xCF\x87" "1"},             {12, "pi1"},
    {12, "\xCF\x80" "1"},             {13, "P1"},      {14, "S1"},      {15, "K1"},
    {16, "psi1"},    {16, "\xCF\x88" "1"},             {17, "phi1"},    {17, "\xCF\x86" "1"},
    {18, "theta1"},  {18, "THE1"},    {18, "\xCE\xB8" "1"},             {19, "J1"},
    {21, "2N2"},     {22, "mu2"},     {22, "\xCE\xBC" "2"},             {25, "N2"},
    {26, "nu2"},     {26, "\xCE\xBD" "2"},             {29, "M2"},      {32, "lambda2"},
    {32, "LAM2"},    {32, "LDA2"},    {32, "LAMDA2"},  {32, "\xCE\xBB" "2"},
    {33, "L2"},      {35, "T2"},      {36, "S2"},      {37, "R2"},      {38, "K2"},
    {40, "MO3"},     {42, "M3"},      {45, "MK3"},     {49, "MN4"},     {52, "M4"},
    {56, "MS4"},     {57, "MK4"},     {61, "2MN6"},    {64, "M6"},      {67, "2MS6"},
    {68, "2MK6"},
};

// Named constituents that are not compounds of others but share a row's numbers.
struct NamedNumbers {
  std::string_view name;
  DoodsonNumbers numbers;
};
const NamedNumbers kListedConstituents[] = {
    {"MA2", {{2, 0, -1, 0, 0, 0}, 0}},
    {"MB2", {{2, 0, 1, 0, 0, 0}, 0}},
};

bool EqualIgnoringCase(std::string_view a, std::string_view b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (std::toupper(static_cast<unsigned char>(a[i])) != std::toupper(static_cast<unsigned char>(b[i])))
      return false;
  }
  return true;
}

int Modulo4(int x) { return ((x % 4) + 4) % 4; }

// Components of compound names and the row that defines each. K is K2 or K1: the sign
// search tries K2 first, as the naming convention does.
struct Component {
  char letter;
  int species;
  int row;
};
constexpr Component kComponents[] = {
    {'M', 2, br::tides::kM2}, {'S', 2, br::tides::kS2}, {'N', 2, 25},
    {'O', 1, br::tides::kO1}, {'P', 1, 13},             {'Q', 1, 6},
    {'L', 2, br::tides::kL2}, {'J', 1, br::tides::kJ1}, {'T', 2, 35},
    {'R', 2, 37},
};

struct Term {
  char letter;
  int multiplier;
};

std::optional<DoodsonNumbers> CombineTerms(const std::vector<Term>& terms, int species, int kRow,
                                           int kSpecies) {
  std::vector<int> rows, speciesOf;
  for (const Term& t : terms) {
    if (t.letter == 'K') {
      rows.push_back(kRow), speciesOf.push_back(kSpecies);
      continue;
    }
    bool found = false;
    for (const Component& c : kComponents) {
      if (c.letter == t.letter) rows.push_back(c.row), speciesOf.push_back(c.species), found = true;
    }
    if (!found) return std::nullopt;
  }
  // All components added, then signs turned to minus from the right until the species fits.
  std::vector<int> signs(terms.size(), 1);
  long total = 0;
  for (std::size_t j = 0; j < terms.size(); ++j) total += static_cast<long>(terms[j].multiplier) * speciesOf[j];
  for (std::size_t j = terms.size(); j-- > 0 && total != species;) {
    signs[j] = -1;
    total -= 2L * terms[j].multiplier * speciesOf[j];
  }
  if (total != species) return std::nullopt;
  DoodsonNumbers sum;
  for (std::size_t j = 0; j < terms.size(); ++j) {
    const DoodsonNumbers part = RowDoodsonNumbers(rows[j]);
    const int factor = signs[j] * terms[j].multiplier;
    for (int k = 0; k < 6; ++k) sum.multipliers[k] += factor * part.multipliers[k];
    sum.quarterTurns += factor * part.quarterTurns;
  }
  return sum;
}

std::optional<DoodsonNumbers> CompoundNumbers(std::string_view name) {
  // Trailing species digits.
  std::size_t end = name.size();
  while (end > 0 && std::isdigit(static_cast<unsigned char>(name[end - 1]))) --end;
  if (end == 0 || end == name.size() || name.size() - end > 2) return std::nullopt;
  const int species = std::stoi(std::string(name.substr(end)));
  if (species == 0) return std::nullopt;

  std::vector<Term> terms;
  std::size_t i = 0;
  while (i < end) {
    int multiplier = 0;
    std::size_t digits = 0;
    while (i < end && std::isdigit(static_cast<unsigned char>(name[i]))) {
      multiplier = multiplier * 10 + (name[i] - '0');
      ++i;
      if (++digits > 2) return std::nullopt;
    }
    if (digits == 0) multiplier = 1;
    if (i >= end || multiplier == 0) return std::nullopt;
    const char letter = static_cast<char>(std::toupper(static_cast<unsigned char>(name[i])));
    bool known = letter == 'K';
    for (const Component& c : kComponents) known = known || c.letter == letter;
    if (!known) return std::nullopt;
    terms.push_back({letter, multiplier});
    ++i;
  }
  if (terms.empty() || terms.size() > 8) return std::nullopt;

  // A single letter is an overtide: M4 is twice M2.
  if (terms.size() == 1 && terms[0].letter != 'K') {
    for (const Component& c : kComponents) {
      if (c.letter != terms[0].letter) continue;
      const int total = terms[0].multiplier * c.species;
      if (total > species || species % total != 0) return std::nullopt;
      return CombineTerms({{c.letter, species / c.species}}, species, 0, 0);
    }
  }
  bool hasK = false;
  for (const Term& t : terms) hasK = hasK || t.letter == 'K';
  if (!hasK) return CombineTerms(terms, species, 0, 0);
  if (auto k2 = CombineTerms(terms, species, br::tides::kK2, 2)) return k2;
  return CombineTerms(terms, species, br::tides::kK1, 1);
}

}  // namespace

bool DoodsonNumbers::SameConstituentAs(const DoodsonNumbers& other) const {
  return multipliers == other.multipliers && Modulo4(quarterTurns) == Modulo4(other.quarterTurns);
}

DoodsonNumbers RowDoodsonNumbers(int row) {
  const br::tides::DoodsonRow& d = br::tides::DoodsonTable.at(static_cast<std::size_t>(row));
  DoodsonNumbers n;
  for (int k = 0; k < 6; ++k) n.multipliers[k] = d[k];
  n.quarterTurns = d[6];
  return n;
}

std::string_view UsualConstituentName(int row) {
  for (const NamedRow& r : kNamedRows) {
    if (r.row == row) return r.name;
  }
  return {};
}

std::optional<DoodsonNumbers> DoodsonNumbersOfName(std::string_view name) {
  for (const NamedNumbers& c : kListedConstituents) {
    if (EqualIgnoringCase(c.name, name)) return c.numbers;
  }
  return CompoundNumbers(name);
}

std::optional<ConstituentMatch> MatchConstituentName(std::string_view name) {
  if (name.empty() || name.size() > 32) return std::nullopt;
  for (const NamedRow& r : kNamedRows) {
    if (EqualIgnoringCase(r.name, name)) return ConstituentMatch{r.row, ConstituentMatch::Via::UsualName};
  }
  const std::optional<DoodsonNumbers> numbers = DoodsonNumbersOfName(name);
  if (!numbers) return std::nullopt;
  for (int row = 1; row < br::tides::kConstituentCount; ++row) {
    if (numbers->SameConstituentAs(RowDoodsonNumbers(row)))
      return ConstituentMatch{row, ConstituentMatch::Via::DoodsonNumbers};
  }
  return std::nullopt;
}

}  // namespace br::tidefiles
