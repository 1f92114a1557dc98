// zelta-wrap: wraps a picture elementary stream and WAV files into an MXF
// file through the kit's driver.

#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <memory>
#include <string>
#include <vector>

extern "C" {
#include <libavutil/log.h>
}

#include "clip.h"
#include "kit.h"
#include "options.h"
#include "sound_input.h"
#include "source.h"

namespace {

using namespace zelta_wrap;

// Whether a progress line stands open on stderr.
bool progressShown = false;

// The file being written, for a signal to remove.
volatile std::sig_atomic_t temporaryPathSet = 0;
std::string temporaryPath;

// A signal that ends the program removes the unfinished file first.
extern "C" void removeTemporary(int signal) {
  if (temporaryPathSet != 0) unlink(temporaryPath.c_str());
  std::signal(signal, SIG_DFL);
  std::raise(signal);
}

// A file beside the output that becomes it only when complete; removed
// otherwise.
class TemporaryOutput {
 public:
  explicit TemporaryOutput(const std::string& output) : output_(output), path_(output + ".XXXXXX") {
    const int descriptor = mkstemp(path_.data());
    if (descriptor < 0) throw InputError("cannot write beside " + output);
    // The file gets the permissions that a plain creation would give it.
    const mode_t mask = umask(0);
    umask(mask);
    fchmod(descriptor, 0666 & ~mask);
    close(descriptor);
    temporaryPath = path_;
    temporaryPathSet = 1;
    stream_ = std::make_shared<std::ofstream>(path_, std::ios::binary | std::ios::trunc);
    if (!*stream_) {
      std::remove(path_.c_str());
      throw InputError("cannot write beside " + output);
    }
  }
  ~TemporaryOutput() {
    temporaryPathSet = 0;
    if (!kept_) std::remove(path_.c_str());
  }
  TemporaryOutput(const TemporaryOutput&) = delete;
  TemporaryOutput& operator=(const TemporaryOutput&) = delete;

  const std::shared_ptr<std::ofstream>& getStream() const { return stream_; }

  void keep() {
    stream_->close();
    if (!*stream_) throw InputError("cannot write " + path_);
    if (std::rename(path_.c_str(), output_.c_str()) != 0) throw InputError("cannot write " + output_);
    kept_ = true;
  }

 private:
  std::string output_;
  std::string path_;
  std::shared_ptr<std::ofstream> stream_;
  bool kept_ = false;
};

// Every input is read and checked before anything is written.
void wrap(const Options& options) {
  checkOptions(options);
  PictureFacts facts;
  {
    PictureInput scan(options.picture, getChunkSize(options));
    facts = scanPicture(scan);
  }
  std::uint32_t soundChannels = 0;
  for (const std::string& path : options.sounds)
    soundChannels += SoundInput(path, options.quantizationBits).getChannelCount();
  const Clip clip = decideClip(options, facts, soundChannels);
  auto progress = std::make_shared<Progress>();
  std::shared_ptr<ZeltaMasterMetadata> master = createMaster(options, clip, facts, progress);
  // The model that the driver will build, built once ahead so that a clip
  // that the kit can't describe is refused before the output exists.
  try {
    createZeltaMetadataModel(master);
  } catch (const std::exception& e) {
    throw InputError(std::string("cannot describe the clip: ") + e.what());
  }
  const bool terminal = isatty(STDERR_FILENO) != 0;
  auto source = std::make_shared<WrapSource>(options, clip, master, progress, [terminal](std::uint64_t count) {
    if (!terminal || count % 25 != 1) return;
    std::cerr << "\rwrapped " << count << " frames" << std::flush;
    progressShown = true;
  });
  TemporaryOutput output(options.output);
  createZeltaDriver(source)->drive(createZeltaWriter(output.getStream()));
  output.keep();
  if (terminal) std::cerr << "\rwrapped " << progress->count << " frames\n";
  progressShown = false;
}

}  // namespace

int main(int argc, char** argv) {
  av_log_set_level(AV_LOG_QUIET);
  for (int signal : {SIGINT, SIGTERM, SIGHUP}) std::signal(signal, removeTemporary);
  Options options;
  try {
    options = parseOptions(std::vector<std::string>(argv + 1, argv + argc));
  } catch (const UsageError& e) {
    std::cerr << "zelta-wrap: " << e.what() << " (see zelta-wrap --help)\n";
    return 2;
  } catch (const InputError& e) {
    std::cerr << "zelta-wrap: " << e.what() << "\n";
    return 1;
  }
  if (options.help) {
    std::cout << usage;
    return 0;
  }
  try {
    wrap(options);
  } catch (const std::exception& e) {
    std::cerr << (progressShown ? "\n" : "") << "zelta-wrap: " << e.what() << "\n";
    return 1;
  }
  return 0;
}
