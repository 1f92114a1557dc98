// Reading the octets of keys, lengths, tags and values, where a short read or
// a failed skip is a parse error of the stream.
#ifndef ZELTA_KLV_STREAM_INPUT_H
#define ZELTA_KLV_STREAM_INPUT_H

#include <cstdint>
#include <istream>

#include "klv.h"

namespace zelta::klv {

// The first four octets of every SMPTE key.
inline constexpr std::uint8_t smptePrefix[4] = {0x06, 0x0E, 0x2B, 0x34};

// Whether the stream's buffer can tell where it is: a zero relative seek that
// does not answer -1. A buffer that cannot is read as a pipe.
bool isSeekable(std::istream& stream);

// Exactly n octets ("unsuccessful read()"): from the stream's buffer when it
// holds them, else by one read of the stream.
void readOctets(std::istream& stream, std::uint8_t* octets, std::streamsize n);
// A big-endian number of 1 to 8 octets.
std::uint64_t readBigEndian(std::istream& stream, unsigned octets);
// A key of 16 octets.
KLVKey readKey(std::istream& stream);
// Whether no octet follows; asks the stream only when its buffer is empty.
bool atEnd(std::istream& stream);

// Delivers a value that the handler took: into its buffer with one read or
// copied from the stream's buffer, and one value event; else in chunks of at
// most 64 KiB, from where the stream's buffer holds them or from a buffer of
// our own.
void takeValue(std::istream& stream, KLVHandler& handler, std::uint64_t length, std::uint8_t* buffer);
// Passes over a declined value: inside the stream's buffer when it ends
// there, else by relative seek when the stream can seek, else by ignore().
void skipValue(std::istream& stream, std::uint64_t length, bool seekable);
// takeValue when taken, else skipValue.
void transferValue(std::istream& stream, KLVHandler& handler, bool taken, std::uint64_t length, std::uint8_t* buffer,
                   bool seekable);

}  // namespace zelta::klv

#endif
