#include <ostream>

#include "klv.h"

// Spelled out digit by digit: no flag, width, fill or locale of the client's
// stream may change a key's form, and none of them is changed either. Like
// any output that formats, it uses up the width.
std::ostream& operator<<(std::ostream& out, const KLVKey& key) {
  static const char digits[] = "0123456789ABCDEF";
  char text[KLVKey::size() * 3 - 1];
  char* at = text;
  for (std::size_t i = 0; i < KLVKey::size(); ++i) {
    if (i != 0) *at++ = '.';
    *at++ = digits[key[i] >> 4];
    *at++ = digits[key[i] & 0x0F];
  }
  out.write(text, sizeof text);
  out.width(0);
  return out;
}

bool MXFTimestamp::operator==(const MXFTimestamp& o) const {
  return year == o.year && month == o.month && day == o.day && hour == o.hour && minute == o.minute &&
         second == o.second && quarterMillisecond == o.quarterMillisecond;
}

bool MXFProductVersion::operator==(const MXFProductVersion& o) const {
  return major == o.major && minor == o.minor && tertiary == o.tertiary && patch == o.patch && release == o.release;
}

namespace {

void readOctets(std::istream& in, std::uint8_t* octets, std::streamsize n) {
  in.read(reinterpret_cast<char*>(octets), n);
  check(in.gcount() == n, "successful read()");
}

void writeOctets(std::ostream& out, const std::uint8_t* octets, std::streamsize n) {
  out.write(reinterpret_cast<const char*>(octets), n);
}

}  // namespace

void internalize(std::istream& in, MXFRational& v) {
  internalize(in, v.numerator);
  internalize(in, v.denominator);
}

void internalize(std::istream& in, MXFTimestamp& v) {
  internalize(in, v.year);
  internalize(in, v.month);
  internalize(in, v.day);
  internalize(in, v.hour);
  internalize(in, v.minute);
  internalize(in, v.second);
  internalize(in, v.quarterMillisecond);
}

void internalize(std::istream& in, MXFProductVersion& v) {
  internalize(in, v.major);
  internalize(in, v.minor);
  internalize(in, v.tertiary);
  internalize(in, v.patch);
  internalize(in, v.release);
}

void internalize(std::istream& in, KLVKey& v) { readOctets(in, v.data(), 16); }

void internalize(std::istream& in, MXFUID& v) { readOctets(in, v.data(), 16); }

void externalize(std::ostream& out, const MXFRational& v) {
  externalize(out, v.numerator);
  externalize(out, v.denominator);
}

void externalize(std::ostream& out, const MXFTimestamp& v) {
  externalize(out, v.year);
  externalize(out, v.month);
  externalize(out, v.day);
  externalize(out, v.hour);
  externalize(out, v.minute);
  externalize(out, v.second);
  externalize(out, v.quarterMillisecond);
}

void externalize(std::ostream& out, const MXFProductVersion& v) {
  externalize(out, v.major);
  externalize(out, v.minor);
  externalize(out, v.tertiary);
  externalize(out, v.patch);
  externalize(out, v.release);
}

void externalize(std::ostream& out, const KLVKey& v) { writeOctets(out, v.data(), 16); }

void externalize(std::ostream& out, const MXFUID& v) { writeOctets(out, v.data(), 16); }
