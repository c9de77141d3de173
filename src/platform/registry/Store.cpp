#include "platform/registry/Store.h"

#include <fcntl.h>
#include <pwd.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <fmt/format.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <mutex>
#include <utility>

#include "platform/registry/RegText.h"

namespace registry {

namespace {

std::string ErrnoText(int error) { return std::strerror(error); }

[[noreturn]] void FailFile(const std::string& path, std::string_view action, int error) {
  throw StoreError(fmt::format("registry file {}: cannot {}: {}", path, action, ErrnoText(error)));
}

// Closes a descriptor when it goes out of scope, unless released.
class FileDescriptor {
 public:
  explicit FileDescriptor(int fd = -1) : fd_(fd) {}
  FileDescriptor(const FileDescriptor&) = delete;
  FileDescriptor& operator=(const FileDescriptor&) = delete;
  ~FileDescriptor() {
    if (fd_ >= 0) ::close(fd_);
  }
  int get() const { return fd_; }
  int release() { return std::exchange(fd_, -1); }

 private:
  int fd_;
};

std::string ReadAll(int fd, const std::string& path) {
  std::string content;
  char buffer[65536];
  while (true) {
    ssize_t n = ::read(fd, buffer, sizeof buffer);
    if (n < 0 && errno == EINTR) continue;
    if (n < 0) FailFile(path, "read", errno);
    if (n == 0) return content;
    content.append(buffer, static_cast<size_t>(n));
  }
}

void WriteAll(int fd, std::string_view text, const std::string& path) {
  while (!text.empty()) {
    ssize_t n = ::write(fd, text.data(), text.size());
    if (n < 0 && errno == EINTR) continue;
    if (n < 0) FailFile(path, "write", errno);
    text.remove_prefix(static_cast<size_t>(n));
  }
}

Hive ParseFile(const std::string& content, const std::string& path) {
  try {
    return ParseRegText(content);
  } catch (const StoreError& e) {
    throw StoreError(fmt::format("registry file {}: {}", path, e.what()));
  }
}

// Creates the missing folders of a path, private to the user.
void MakeFolders(const std::filesystem::path& folder) {
  if (folder.empty()) return;
  std::filesystem::path partial;
  for (const auto& part : folder) {
    partial /= part;
    if (::mkdir(partial.c_str(), 0700) != 0 && errno != EEXIST)
      FailFile(folder.string(), "create the folder", errno);
  }
}

// A symbolic link keeps pointing at the file it names: the file behind it is replaced.
std::string ResolveLink(const std::string& path) {
  std::error_code error;
  if (!std::filesystem::is_symlink(path, error)) return path;
  auto target = std::filesystem::weakly_canonical(path, error);
  return error ? path : target.string();
}

std::string HomeFolder() {
  if (const char* home = std::getenv("HOME"); home && *home) return home;
  if (const passwd* entry = ::getpwuid(::getuid()); entry && entry->pw_dir) return entry->pw_dir;
  return ".";
}

std::string& DefaultPathOverride() {
  static std::string path;
  return path;
}

std::mutex& DefaultMutex() {
  static std::mutex mutex;
  return mutex;
}

}  // namespace

// The parsed content and the identity of the file it came from. The descriptor of
// that file stays open: while it is, the file's inode cannot be freed and handed to a
// later version of the file, so equal identities really mean the same content.
struct Store::Cache {
  std::mutex mutex;
  int fd = -1;
  struct stat identity {};
  std::shared_ptr<const Hive> hive;

  ~Cache() { Forget(); }

  void Forget() {
    if (fd >= 0) ::close(fd);
    fd = -1;
    hive.reset();
  }

  bool Matches(const struct stat& st) const {
    return hive && fd >= 0 && st.st_dev == identity.st_dev && st.st_ino == identity.st_ino &&
           st.st_size == identity.st_size && st.st_mtim.tv_sec == identity.st_mtim.tv_sec &&
           st.st_mtim.tv_nsec == identity.st_mtim.tv_nsec &&
           st.st_ctim.tv_sec == identity.st_ctim.tv_sec &&
           st.st_ctim.tv_nsec == identity.st_ctim.tv_nsec;
  }

  // Takes ownership of fd.
  void Keep(int newFd, const struct stat& st, std::shared_ptr<const Hive> content) {
    Forget();
    fd = newFd;
    identity = st;
    hive = std::move(content);
  }
};

Store::Store(std::string path) : path_(std::move(path)), cache_(std::make_shared<Cache>()) {}

std::string Store::DefaultPath() {
  {
    std::lock_guard lock(DefaultMutex());
    if (!DefaultPathOverride().empty()) return DefaultPathOverride();
  }
  if (const char* file = std::getenv("POC_REGISTRY_FILE"); file && *file) return file;
  std::filesystem::path config;
  if (const char* xdg = std::getenv("XDG_CONFIG_HOME"); xdg && *xdg == '/')
    config = xdg;
  else
    config = std::filesystem::path(HomeFolder()) / ".config";
  return (config / "poc-dorvantos" / "registry.reg").string();
}

void Store::SetDefaultPath(const std::string& path) {
  std::lock_guard lock(DefaultMutex());
  DefaultPathOverride() = path;
}

Store& Store::Default() {
  // One store object for the process, pointed at whichever file is the default now, so
  // references handed out stay valid. The component reaches it from its one thread.
  static Store store("");
  std::string path = DefaultPath();
  std::lock_guard lock(DefaultMutex());
  if (store.path_ != path) {
    store.path_ = path;
    store.cache_ = std::make_shared<Cache>();
  }
  return store;
}

std::shared_ptr<const Hive> Store::Snapshot() {
  static const auto kEmpty = std::make_shared<const Hive>();
  std::lock_guard lock(cache_->mutex);
  struct stat st {};
  if (::stat(path_.c_str(), &st) != 0) {
    if (errno != ENOENT) FailFile(path_, "read", errno);
    cache_->Forget();
    return kEmpty;
  }
  if (cache_->Matches(st)) return cache_->hive;

  FileDescriptor fd(::open(path_.c_str(), O_RDONLY | O_CLOEXEC));
  if (fd.get() < 0) {
    if (errno == ENOENT) return kEmpty;  // replaced and removed between stat and open
    FailFile(path_, "open", errno);
  }
  // The identity of what is read is the opened file's, whatever happened since the stat.
  if (::fstat(fd.get(), &st) != 0) FailFile(path_, "read", errno);
  if (!S_ISREG(st.st_mode)) throw StoreError(fmt::format("registry file {}: not a regular file", path_));
  auto hive = std::make_shared<const Hive>(ParseFile(ReadAll(fd.get(), path_), path_));
  cache_->Keep(fd.release(), st, hive);
  return hive;
}

void Store::Update(const std::function<void(Hive&)>& change) {
  const std::string target = ResolveLink(path_);
  const std::filesystem::path folder = std::filesystem::path(target).parent_path();
  MakeFolders(folder);

  // Writers take turns; readers never wait, since the file is only ever replaced whole.
  FileDescriptor lockFd(::open((target + ".lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
  if (lockFd.get() < 0) FailFile(target + ".lock", "open", errno);
  while (::flock(lockFd.get(), LOCK_EX) != 0)
    if (errno != EINTR) FailFile(target + ".lock", "lock", errno);

  // The freshest content, never the cache: another process may have written since.
  Hive hive;
  mode_t mode = 0600;
  FileDescriptor current(::open(target.c_str(), O_RDONLY | O_CLOEXEC));
  if (current.get() >= 0) {
    struct stat st {};
    if (::fstat(current.get(), &st) != 0) FailFile(target, "read", errno);
    mode = st.st_mode & 0777;
    hive = ParseFile(ReadAll(current.get(), target), target);
  } else if (errno != ENOENT) {
    FailFile(target, "open", errno);
  }

  change(hive);
  const std::string text = WriteRegText(hive);
  // What the next read will see; a text that would not read back never replaces the file.
  auto written = std::make_shared<const Hive>(ParseFile(text, target));

  std::string temporary = target + ".XXXXXX";
  FileDescriptor out(::mkostemp(temporary.data(), O_CLOEXEC));
  if (out.get() < 0) FailFile(temporary, "create", errno);
  try {
    if (::fchmod(out.get(), mode) != 0) FailFile(temporary, "set the mode of", errno);
    WriteAll(out.get(), text, temporary);
    if (::fsync(out.get()) != 0) FailFile(temporary, "flush", errno);
    if (::rename(temporary.c_str(), target.c_str()) != 0) FailFile(target, "replace", errno);
  } catch (...) {
    ::unlink(temporary.c_str());
    throw;
  }
  // The rename itself is only durable once the folder is.
  FileDescriptor dir(::open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (dir.get() >= 0) ::fsync(dir.get());

  struct stat st {};
  std::lock_guard lock(cache_->mutex);
  if (target == path_ && ::fstat(out.get(), &st) == 0)
    cache_->Keep(out.release(), st, std::move(written));
  else
    cache_->Forget();
}

std::string Store::Export(const std::string& path) {
  std::string canonical;
  if (!path.empty()) {
    canonical = regtext::CanonicalKeyPath(path);
    if (canonical.empty()) throw StoreError(fmt::format("\"{}\" is not a registry key path", path));
  }
  auto hive = Snapshot();
  if (!canonical.empty() && !hive->Exists(canonical))
    throw StoreError(fmt::format("the key \"{}\" does not exist", path));
  return WriteRegText(*hive, canonical);
}

void Store::Import(const std::string& text) {
  // Parsed whole first: a fault anywhere in the text changes nothing.
  auto changes = regtext::ParseChanges(text);
  Update([&](Hive& hive) { regtext::Apply(hive, changes); });
}

}  // namespace registry
