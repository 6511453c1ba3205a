#pragma once

#include <string_view>

// Reports a violated precondition of the drawing code through the host debug assertion.
// Toolkit-internal.
void ReportDrawingProblem(std::string_view message, std::string_view condition,
                          std::string_view file, int line, std::string_view function);

#define DRAWING_VERIFY(cond, message) \
  (static_cast<bool>(cond) ||         \
   (::ReportDrawingProblem((message), #cond, __FILE__, __LINE__, __PRETTY_FUNCTION__), false))
