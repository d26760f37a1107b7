// Putting runs of field rows together.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "sources/diagnostics/layouts/Layout.h"

namespace qel::diagnostics {

// The same fields, further on.
template <std::size_t N>
constexpr std::array<FieldRow, N> behind(std::uint16_t offset, std::array<FieldRow, N> rows) {
  for (FieldRow& row : rows) row.offset = static_cast<std::uint16_t>(row.offset + offset);
  return rows;
}

template <std::size_t N, std::size_t M>
constexpr std::array<FieldRow, N + M> operator+(const std::array<FieldRow, N>& first,
                                                const std::array<FieldRow, M>& second) {
  std::array<FieldRow, N + M> rows;
  for (std::size_t i = 0; i < N; ++i) rows[i] = first[i];
  for (std::size_t i = 0; i < M; ++i) rows[N + i] = second[i];
  return rows;
}

}  // namespace qel::diagnostics
