// How good a number is, as a word and as steps of a bar beside its colour.
#pragma once

#include <cstdint>
#include <string_view>

#include "history/Quantity.h"
#include "messages/catalogue/FieldFacts.h"

namespace qel {

enum class Grade : std::uint8_t { unknown, poor, fair, good };

inline constexpr int kGradeSteps = 5;

Grade gradeOf(Quantity quantity, float value);
Grade gradeOf(const QualityScale& scale, float value);
// "good", "fair", "poor"; empty while unknown.
std::string_view nameOf(Grade grade);
// 1 to 5: poor has the first two, fair the third, good the last two.
int stepOf(Quantity quantity, float value);

}  // namespace qel
