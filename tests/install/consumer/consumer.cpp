// Reads the partitions of an MXF file through the installed headers.
#include <fstream>
#include <iostream>

#include <mxf.h>

namespace {

class Counter : public DullMXFStructureHandler {
public:
  void startPartition(const KLVKey&, const MXFPartitionPack&, std::uint64_t) override { ++partitions; }
  int partitions = 0;
};

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) return 2;
  std::ifstream in(argv[1], std::ios::binary);
  Counter counter;
  DullKLVHandler metadata, index, essence;
  MXFSplitter splitter(&counter, &metadata, &index, &essence, false);
  GenericKLVReader reader;
  reader.setHandler(&splitter);
  reader.read(in);
  std::cout << counter.partitions << "\n";
  return 0;
}
