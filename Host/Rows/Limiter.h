#pragma once

// Keeps a value that the user sets in one row consistent with values shown elsewhere (the handles
// of a range control stay in order). A row asks its limiter before it writes a value to the
// model; the limiter answers the value to use. Limiters are owned by whoever made them (a group
// row); a row that was given one only refers to it.
class Limiter {
 public:
  Limiter() = default;
  Limiter(const Limiter&) = delete;
  Limiter& operator=(const Limiter&) = delete;
  virtual ~Limiter() = default;

  // The value to use instead of `value` for the handle `handleID`; `clamped` tells whether it
  // differs because a bound was hit. A handle the limiter does not know is left alone.
  virtual float Limit(int handleID, float value, bool& clamped) const = 0;
};
