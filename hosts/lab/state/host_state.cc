#include "hosts/lab/state/host_state.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstring>
#include <mutex>

#include "hosts/lab/state/files.h"
#include "hosts/lab/state/lock.h"

namespace Lab {

namespace {

const std::string& StatePath() {
  static const std::string path = std::string(LAB_DIRECTORY) + "/state.json";
  return path;
}

bool IsSameFile(const struct stat& left, const struct stat& right) {
  return left.st_dev == right.st_dev && left.st_ino == right.st_ino &&
         left.st_size == right.st_size && left.st_mtim.tv_sec == right.st_mtim.tv_sec &&
         left.st_mtim.tv_nsec == right.st_mtim.tv_nsec;
}

// The document as it was last parsed. Its file stays open: as long as it does, no other file can
// get its inode number, and a replaced document is always noticed, however coarse the clock of
// the file system is.
class ParsedDocument {
 public:
  std::shared_ptr<const Json> Current() {
    const std::lock_guard<std::mutex> guard(_mutex);
    struct stat now {};
    if (_json == nullptr || stat(StatePath().c_str(), &now) != 0 || !IsSameFile(now, _status)) {
      Parse();
    }
    return _json;
  }

 private:
  void Parse() {
    Descriptor file(StatePath(), O_RDONLY);
    struct stat status {};
    if (file.Get() < 0 || fstat(file.Get(), &status) != 0) {
      throw StateError(StatePath() + ": " + strerror(errno));
    }
    _json = std::make_shared<const Json>(ParseDocument(ReadFile(file, StatePath()), StatePath()));
    _file = std::move(file);
    _status = status;
  }

  std::mutex _mutex;
  Descriptor _file;
  struct stat _status {};
  std::shared_ptr<const Json> _json;
};

}  // namespace

std::shared_ptr<const Json> ReadState() {
  // Never destroyed: a thread may still ask while the process exits.
  static auto* const document = new ParsedDocument;
  return document->Current();
}

void ChangeState(const std::function<void(Json&)>& change) {
  const Lock lock;
  Json state = *ReadState();
  change(state);
  ReplaceFile(StatePath(), state.dump());
}

}  // namespace Lab
