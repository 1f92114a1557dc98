// zelta-wrap: the command line, read into options and checked value by
// value before any input is opened.
#ifndef ZELTA_WRAP_OPTIONS_H
#define ZELTA_WRAP_OPTIONS_H

#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include "kit.h"

namespace zelta_wrap {

// A command line that can't be read: exit status 2.
struct UsageError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// An option value or an input that the program refuses: exit status 1.
struct InputError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

struct Timecode {
  std::uint8_t hours = 0;
  std::uint8_t minutes = 0;
  std::uint8_t seconds = 0;
  std::uint8_t frames = 0;
};

enum class AVCWrapping { constant, variable };

struct Options {
  bool help = false;
  ZeltaEssenceFormat format = ZeltaEssenceFormat::MPEG;
  // Unset values come from the input or the format's defaults.
  std::optional<MXFRational> rate;
  std::optional<std::uint32_t> bitRate;
  std::optional<bool> progressive;
  std::optional<ZeltaSize> size;
  Timecode startTimecode;
  bool dropFrame = false;
  std::wstring packageName;
  bool unknownDuration = false;
  AVCWrapping avcWrapping = AVCWrapping::variable;
  std::optional<std::uint16_t> maxGOP;
  bool closedGOP = false;
  std::optional<std::uint16_t> profileLevel;
  bool simpleStudioProfile = false;
  std::uint16_t rawCode = 801;
  std::uint32_t quantizationBits = 24;
  std::string output;
  std::string picture;
  std::vector<std::string> sounds;
};

// UsageError for an unknown option, a missing value or input; InputError for
// a value that is not one of the option's.
Options parseOptions(const std::vector<std::string>& arguments);

// "30000/1001" or "25"; InputError for another form or a non-positive value.
MXFRational parseRate(const std::string& text);

extern const char* const usage;

}  // namespace zelta_wrap

#endif
