#include "options.h"

#include <locale.h>

#include <cerrno>
#include <cstdlib>
#include <cwchar>
#include <limits>

namespace zelta_wrap {

const char* const usage =
    "usage: zelta-wrap --format D10|DV|MPEG|AVC|Raw [OPTIONS] -o OUT.mxf PICTURE\n"
    "                  [SOUND.wav ...]\n"
    "\n"
    "Wraps the picture elementary stream PICTURE and the WAV files SOUND.wav\n"
    "into the MXF file OUT.mxf through the Zelta driver. Every channel of every\n"
    "WAV file becomes one sound channel, in the order given. The picture decides\n"
    "the duration: sound that ends early is completed with silence, sound that\n"
    "runs longer is cut.\n"
    "\n"
    "  --format D10|DV|MPEG|AVC|Raw\n"
    "           the picture kind: D10 (MPEG-2 I-frames of a constant size,\n"
    "           .m2v), DV (.dv, frames of 144000 or 120000 octets), MPEG (MPEG-2\n"
    "           long GOP .m2v, or MPEG-4 Simple Studio Profile with\n"
    "           --simple-studio-profile), AVC (.h264), Raw (camera raw frames\n"
    "           of the size of --raw-code, one after the other)\n"
    "  --rate R the edit rate, as N or N/D: 24000/1001, 24, 25, 30000/1001, 30,\n"
    "           48000/1001, 48, 50, 60000/1001 or 60, as the format allows;\n"
    "           default: the input's frame rate, else 25\n"
    "  --bit-rate N\n"
    "           bits per second of the picture, in Mbit/s below 1000: D10 30, 40\n"
    "           or 50; for the other formats the descriptor's value, for MPEG\n"
    "           studio also the room of a frame (default: the input's, else\n"
    "           D10 50, MPEG 50, MPEG studio 440, AVC 35)\n"
    "  --interlaced, --progressive\n"
    "           the frame layout; default: the input's field order, else\n"
    "           interlaced at 25, 30000/1001 and 30 and progressive otherwise\n"
    "           (D10 and DV always interlaced, Raw progressive)\n"
    "  --size WxH\n"
    "           MPEG, AVC, Raw: the displayed size, the height of one field\n"
    "           when interlaced (default: the input's frame size; Raw\n"
    "           4096x2160)\n"
    "  --start-timecode HH:MM:SS:FF\n"
    "           timecode of the first frame (default 00:00:00:00)\n"
    "  --drop-frame\n"
    "           the timecode counts drop frame (30000/1001 and 60000/1001)\n"
    "  --package-name NAME\n"
    "           name of the source package (default: none)\n"
    "  --unknown-duration\n"
    "           write the header as if the duration were unknown: the header\n"
    "           partition is left open and the footer gives the count\n"
    "  --avc-wrapping constant|variable\n"
    "           AVC frames in elements of constant size (568832 octets at 25\n"
    "           and 50, 472576 otherwise) or as they come (default variable)\n"
    "  --max-gop N\n"
    "           the longest GOP, 1 for intra only (default: measured on the\n"
    "           input)\n"
    "  --closed-gop\n"
    "           the GOPs are closed\n"
    "  --profile-level N\n"
    "           MPEG: the profile-and-level byte (68, 70, 72, 130, 133; Simple\n"
    "           Studio 225 to 228, 235, 236); AVC: profile * 256 + level\n"
    "           (default: from the input)\n"
    "  --simple-studio-profile\n"
    "           MPEG: the picture is MPEG-4 Simple Studio Profile, each frame\n"
    "           padded to bit rate / rate / 8 octets\n"
    "  --raw-code N\n"
    "           Raw: the profile code, 785, 801, 802, 817, 1057 or 1073\n"
    "           (default 801); it sets the frame size\n"
    "  --quantization-bits 16|24\n"
    "           bits of a sound sample; every WAV file must have them\n"
    "           (default 24)\n"
    "  -o OUT.mxf\n"
    "           the file to write; it appears only when the whole file is\n"
    "           written\n"
    "  --help   print this text\n"
    "\n"
    "Every WAV file is sampled at 48 kHz. D10 carries its sound as one AES3\n"
    "element of eight channels (four or eight declared, at most eight); the\n"
    "other formats carry one PCM element per channel.\n"
    "\n"
    "Exit status: 0 when the file was written, 1 when an input or an option\n"
    "value was refused or the writing failed (no output file is left), 2 on a\n"
    "usage error.\n";

namespace {

bool isDigits(const std::string& text) {
  return !text.empty() && text.find_first_not_of("0123456789") == std::string::npos;
}

// A decimal number no larger than the limit; InputError naming the option.
std::uint64_t parseNumber(const std::string& text, std::uint64_t limit, const std::string& option) {
  errno = 0;
  const unsigned long long value = isDigits(text) ? std::strtoull(text.c_str(), nullptr, 10) : 0;
  if (!isDigits(text) || errno == ERANGE || value > limit)
    throw InputError("invalid value for " + option + ": " + text);
  return value;
}

ZeltaEssenceFormat parseFormat(const std::string& text) {
  if (text == "D10") return ZeltaEssenceFormat::D10;
  if (text == "DV") return ZeltaEssenceFormat::DV;
  if (text == "MPEG") return ZeltaEssenceFormat::MPEG;
  if (text == "AVC") return ZeltaEssenceFormat::AVC;
  if (text == "Raw") return ZeltaEssenceFormat::Raw;
  throw InputError("invalid value for --format: " + text);
}

// The D10 bit rates may be given in Mbit/s.
std::uint32_t parseBitRate(const std::string& text) {
  const auto value =
      static_cast<std::uint32_t>(parseNumber(text, std::numeric_limits<std::uint32_t>::max(), "--bit-rate"));
  if (value == 0) throw InputError("invalid value for --bit-rate: " + text);
  return value < 1000 ? value * 1000000 : value;
}

ZeltaSize parseSize(const std::string& text) {
  const std::string::size_type x = text.find('x');
  if (x == std::string::npos) throw InputError("invalid value for --size: " + text);
  const std::uint64_t largest = 65535;
  const auto width = static_cast<std::uint32_t>(parseNumber(text.substr(0, x), largest, "--size"));
  const auto height = static_cast<std::uint32_t>(parseNumber(text.substr(x + 1), largest, "--size"));
  if (width == 0 || height == 0) throw InputError("invalid value for --size: " + text);
  return {width, height};
}

Timecode parseTimecode(const std::string& text) {
  if (text.size() != 11 || text[2] != ':' || text[5] != ':' || (text[8] != ':' && text[8] != ';'))
    throw InputError("invalid value for --start-timecode: " + text);
  Timecode t;
  std::uint8_t* const fields[] = {&t.hours, &t.minutes, &t.seconds, &t.frames};
  for (int i = 0; i < 4; ++i)
    *fields[i] = static_cast<std::uint8_t>(parseNumber(text.substr(3 * i, 2), 99, "--start-timecode"));
  return t;
}

AVCWrapping parseWrapping(const std::string& text) {
  if (text == "constant") return AVCWrapping::constant;
  if (text == "variable") return AVCWrapping::variable;
  throw InputError("invalid value for --avc-wrapping: " + text);
}

std::uint32_t parseQuantizationBits(const std::string& text) {
  if (text == "16") return 16;
  if (text == "24") return 24;
  throw InputError("invalid value for --quantization-bits: " + text);
}

// Switches the calling thread to UTF-8 for as long as it lives.
class UTF8Locale {
 public:
  UTF8Locale() : locale_(newlocale(LC_CTYPE_MASK, "C.UTF-8", static_cast<locale_t>(0))) {
    if (locale_ != static_cast<locale_t>(0)) previous_ = uselocale(locale_);
  }
  ~UTF8Locale() {
    if (locale_ == static_cast<locale_t>(0)) return;
    uselocale(previous_);
    freelocale(locale_);
  }
  UTF8Locale(const UTF8Locale&) = delete;
  UTF8Locale& operator=(const UTF8Locale&) = delete;

 private:
  locale_t locale_;
  locale_t previous_ = static_cast<locale_t>(0);
};

// The UTF-8 text as wide characters.
std::wstring wideText(const std::string& text, const std::string& option) {
  const UTF8Locale utf8;
  std::wstring wide;
  std::mbstate_t state{};
  const char* at = text.c_str();
  const char* const end = at + text.size();
  while (at < end) {
    wchar_t c = 0;
    const std::size_t n = std::mbrtowc(&c, at, static_cast<std::size_t>(end - at), &state);
    if (n == static_cast<std::size_t>(-1) || n == static_cast<std::size_t>(-2) || n == 0)
      throw InputError("invalid value for " + option + ": " + text);
    wide.push_back(c);
    at += n;
  }
  return wide;
}

}  // namespace

MXFRational parseRate(const std::string& text) {
  const std::string::size_type slash = text.find('/');
  const std::uint64_t largest = std::numeric_limits<std::int32_t>::max();
  MXFRational rate;
  rate.numerator = static_cast<std::int32_t>(parseNumber(text.substr(0, slash), largest, "--rate"));
  rate.denominator = slash == std::string::npos
                         ? 1
                         : static_cast<std::int32_t>(parseNumber(text.substr(slash + 1), largest, "--rate"));
  if (rate.numerator == 0 || rate.denominator == 0) throw InputError("invalid value for --rate: " + text);
  return rate;
}

Options parseOptions(const std::vector<std::string>& arguments) {
  Options options;
  bool formatGiven = false;
  std::vector<std::string> inputs;
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    const std::string& a = arguments[i];
    // The option's value, the next argument.
    auto value = [&]() -> const std::string& {
      if (i + 1 >= arguments.size()) throw UsageError("option " + a + " needs a value");
      return arguments[++i];
    };
    if (a == "--help" || a == "-h") {
      options.help = true;
    } else if (a == "--format") {
      options.format = parseFormat(value());
      formatGiven = true;
    } else if (a == "--rate") {
      options.rate = parseRate(value());
    } else if (a == "--bit-rate") {
      options.bitRate = parseBitRate(value());
    } else if (a == "--interlaced") {
      options.progressive = false;
    } else if (a == "--progressive") {
      options.progressive = true;
    } else if (a == "--size") {
      options.size = parseSize(value());
    } else if (a == "--start-timecode") {
      options.startTimecode = parseTimecode(value());
    } else if (a == "--drop-frame") {
      options.dropFrame = true;
    } else if (a == "--package-name") {
      options.packageName = wideText(value(), a);
    } else if (a == "--unknown-duration") {
      options.unknownDuration = true;
    } else if (a == "--avc-wrapping") {
      options.avcWrapping = parseWrapping(value());
    } else if (a == "--max-gop") {
      options.maxGOP = static_cast<std::uint16_t>(parseNumber(value(), 65535, a));
    } else if (a == "--closed-gop") {
      options.closedGOP = true;
    } else if (a == "--profile-level") {
      options.profileLevel = static_cast<std::uint16_t>(parseNumber(value(), 65535, a));
    } else if (a == "--simple-studio-profile") {
      options.simpleStudioProfile = true;
    } else if (a == "--raw-code") {
      options.rawCode = static_cast<std::uint16_t>(parseNumber(value(), 65535, a));
    } else if (a == "--quantization-bits") {
      options.quantizationBits = parseQuantizationBits(value());
    } else if (a == "-o") {
      options.output = value();
    } else if (a.size() > 1 && a[0] == '-') {
      throw UsageError("unknown option " + a);
    } else {
      inputs.push_back(a);
    }
  }
  if (options.help) return options;
  if (!formatGiven) throw UsageError("--format is required");
  if (options.output.empty()) throw UsageError("-o OUT.mxf is required");
  if (inputs.empty()) throw UsageError("a picture input is required");
  options.picture = inputs.front();
  options.sounds.assign(inputs.begin() + 1, inputs.end());
  return options;
}

}  // namespace zelta_wrap
