#include "toolkit/table/logic/row_heights.h"

#include <algorithm>

namespace toolkit::table {

namespace {
int heightAt(const RowHeightOf& heightOf, int index) { return std::max(heightOf(index), 1); }
}  // namespace

int rowOffset(const RowHeightOf& heightOf, int from, int to) {
  int offset = 0;
  for (int index = std::min(from, to); index < std::max(from, to); ++index) offset += heightAt(heightOf, index);
  return to >= from ? offset : -offset;
}

int rowAtOffset(const RowHeightOf& heightOf, int count, int first, int offset) {
  if (offset < 0 || first < 0) return -1;
  for (int index = first, top = 0; index < count; ++index) {
    top += heightAt(heightOf, index);
    if (offset < top) return index;
  }
  return -1;
}

int rowsFitting(const RowHeightOf& heightOf, int count, int first, int space) {
  int fitting = 0;
  for (int index = std::max(first, 0), used = 0; index < count; ++index, ++fitting) {
    used += heightAt(heightOf, index);
    if (used > space) break;
  }
  return fitting;
}

int firstRowEndingAt(const RowHeightOf& heightOf, int index, int space) {
  int first = index;
  for (int used = heightAt(heightOf, index); first > 0; --first) {
    used += heightAt(heightOf, first - 1);
    if (used > space) break;
  }
  return std::max(first, 0);
}

}  // namespace toolkit::table
