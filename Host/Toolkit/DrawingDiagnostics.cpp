#include "Host/Toolkit/DrawingDiagnostics.h"

#include <iostream>
#include <mutex>
#include <set>
#include <string>

void ReportDrawingProblem(std::string_view message, std::string_view condition,
                          std::string_view file, int line, std::string_view function) {
  static std::mutex mutex;
  static std::set<std::string> shown;
  std::lock_guard lock(mutex);
  std::string key(message);
  key += '@';
  key.append(file);
  key += std::to_string(line);
  if (shown.insert(key).second) {
    std::cerr << "Debug assertion: " << message << " (" << condition << ") at " << file << ':'
              << line << " in " << function << '\n';
  }
}
