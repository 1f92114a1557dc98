// Zelta: the writer and the multiplexer of a file. Part of mxf.h, which
// includes it.
#ifndef ZELTA_INCLUDE_MXF_WRITER_H
#define ZELTA_INCLUDE_MXF_WRITER_H

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "mxf_index.h"

// ---------------------------------------------------------------------------
// Writer and multiplexer

// The four ports of a file being written, over one KLV handler: structure
// events reach the byte counter directly, the others pass a filter that hides
// their stream boundaries, metadata and index also a padder that keeps the
// byte counts that the partition pack promised.
class ZELTA_EXPORT MXFMuxer {
public:
  MXFMuxer();
  explicit MXFMuxer(KLVHandler* handler);
  virtual ~MXFMuxer();
  MXFMuxer(const MXFMuxer&) = delete;
  MXFMuxer& operator=(const MXFMuxer&) = delete;

  virtual void setHandler(KLVHandler* handler);  // not owned
  virtual KLVHandler* getHandler();
  virtual MXFStructureHandler* getStructureHandler();
  virtual KLVHandler* getMetadataHandler();
  virtual KLVHandler* getIndexHandler();
  virtual KLVHandler* getEssenceHandler();

private:
  std::unique_ptr<KLVMonitor> monitor_;
  std::unique_ptr<KLVStreamFilter> filter_;
  std::unique_ptr<KLVStreamPadder> metadataPadder_;
  std::unique_ptr<KLVStreamPadder> indexPadder_;
  std::unique_ptr<MXFStructureCoder> structureCoder_;
};

// A muxer bound to an output stream.
class ZELTA_EXPORT MXFWriter {
public:
  explicit MXFWriter(std::ostream& stream);
  virtual ~MXFWriter();
  MXFWriter(const MXFWriter&) = delete;
  MXFWriter& operator=(const MXFWriter&) = delete;

  virtual MXFStructureHandler* getStructureHandler();
  virtual KLVHandler* getMetadataHandler();
  virtual KLVHandler* getIndexHandler();
  virtual KLVHandler* getEssenceHandler();
  // Diverts the output, for instance to a verifying handler; not owned.
  virtual void setHandler(KLVHandler* handler);
  // Back to the writer on the stream.
  virtual void resetHandler();
  virtual KLVHandler* getHandler();

private:
  MXFMuxer muxer_;
  GenericKLVWriter writer_;
};

#endif
