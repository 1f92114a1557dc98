// The kit writer's gathering stream: small writes reach the client's
// stream buffer together, large ones straight and in order, failures show
// on the stream.
#include "kit/write_gatherer.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "klv.h"

namespace {

// Keeps every piece that it is given, and fails when told to.
class PieceBuffer : public std::streambuf {
 public:
  std::vector<std::string> pieces;
  bool failing = false;

 protected:
  std::streamsize xsputn(const char* data, std::streamsize size) override {
    if (failing) return 0;
    pieces.emplace_back(data, static_cast<std::size_t>(size));
    return size;
  }
  int_type overflow(int_type octet) override {
    if (failing || traits_type::eq_int_type(octet, traits_type::eof())) return traits_type::eof();
    pieces.emplace_back(1, traits_type::to_char_type(octet));
    return octet;
  }
};

std::string joined(const std::vector<std::string>& pieces) {
  std::string all;
  for (const std::string& piece : pieces) all += piece;
  return all;
}

}  // namespace

TEST(WriteGatherer, SmallWritesReachTheClientInOnePieceWhenFlushed) {
  PieceBuffer client;
  std::ostream target(&client);
  std::string expected;
  {
    zelta::GatheringStream stream(target);
    for (int i = 0; i < 1000; ++i) {
      const std::string small(100, static_cast<char>('a' + i % 26));
      stream.write(small.data(), static_cast<std::streamsize>(small.size()));
      expected += small;
    }
    stream.put('!');
    expected += '!';
    EXPECT_TRUE(client.pieces.empty());
    stream.flush();
    EXPECT_TRUE(stream.good());
  }
  EXPECT_EQ(client.pieces.size(), 1U);
  EXPECT_EQ(joined(client.pieces), expected);
}

TEST(WriteGatherer, LargeWriteGoesStraightAfterWhatWasGathered) {
  PieceBuffer client;
  std::ostream target(&client);
  zelta::GatheringStream stream(target);
  const std::string small(10, 's');
  const std::string large(std::size_t(1) << 16, 'L');
  stream.write(small.data(), 10);
  stream.write(large.data(), static_cast<std::streamsize>(large.size()));
  ASSERT_EQ(client.pieces.size(), 2U);
  EXPECT_EQ(client.pieces[0], small);
  EXPECT_EQ(client.pieces[1], large);
}

TEST(WriteGatherer, GatheredOctetsReachTheClientWhenTheStreamIsDestroyed) {
  PieceBuffer client;
  std::ostream target(&client);
  {
    zelta::GatheringStream stream(target);
    stream.write("tail", 4);
  }
  EXPECT_EQ(joined(client.pieces), "tail");
}

TEST(WriteGatherer, FailingClientBufferFailsTheStream) {
  PieceBuffer client;
  client.failing = true;
  std::ostream target(&client);
  zelta::GatheringStream stream(target);
  stream.write("gathered", 8);
  EXPECT_TRUE(stream.good());
  stream.flush();
  EXPECT_TRUE(stream.bad());
  zelta::GatheringStream direct(target);
  const std::string large(std::size_t(1) << 16, 'L');
  direct.write(large.data(), static_cast<std::streamsize>(large.size()));
  EXPECT_TRUE(direct.bad());
}

TEST(WriteGatherer, TakesTheFillItemKeyVersionOfTheClientsStream) {
  PieceBuffer client;
  std::ostream target(&client);
  setFillItemKeyVersion(target, 2);
  zelta::GatheringStream stream(target);
  EXPECT_EQ(getFillItemKeyVersion(stream), 2);
}
