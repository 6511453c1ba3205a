#include "Host/Model/ModelTypes.h"

const char* ToString(EditStatus status) {
  switch (status) {
    case EditStatus::Done:
      return "Done";
    case EditStatus::NoChange:
      return "NoChange";
    case EditStatus::ReadOnly:
      return "ReadOnly";
    case EditStatus::Busy:
      return "Busy";
    case EditStatus::InvalidArgument:
      return "InvalidArgument";
    case EditStatus::NotFound:
      return "NotFound";
    case EditStatus::DuplicateTime:
      return "DuplicateTime";
    case EditStatus::TimeOutOfRange:
      return "TimeOutOfRange";
    case EditStatus::CannotVary:
      return "CannotVary";
  }
  return "?";
}

const char* UnitSymbol(ParamUnits units) {
  switch (units) {
    case ParamUnits::Percent:
      return "%";
    case ParamUnits::Degrees:
      return "\xC2\xB0";
    case ParamUnits::Decibels:
      return " dB";
    case ParamUnits::Seconds:
      return " s";
    case ParamUnits::None:
    case ParamUnits::Pixels:
      break;
  }
  return "";
}
