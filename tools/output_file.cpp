#include "output_file.h"

#include <fcntl.h>
#include <stdio.h>
#include <string.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <system_error>

#include "errors.h"
#include "interrupt.h"

namespace dehaze {
namespace {

namespace fs = std::filesystem;

Error exists_error(const std::string& path) {
  return Error(path + ": exists already; use --force to overwrite it");
}

std::string resolve_links(const std::string& path) {
  std::error_code ignored;
  if (!fs::is_symlink(path, ignored)) return path;
  const fs::path resolved = fs::weakly_canonical(path, ignored);
  return resolved.empty() ? path : resolved.string();
}

// Leaves room for the additions in the 255 bytes that most file systems allow for a name.
constexpr size_t kLongestStem = 200;

std::string temporary_name(const fs::path& path) {
  const std::string name = "." + path.stem().string().substr(0, kLongestStem) + "." +
                           std::to_string(getpid()) + ".part" + path.extension().string();
  return (path.parent_path() / name).string();
}

// False with errno set if it fails; EEXIST if the name is taken and must not be overwritten, also
// when somebody took it during a long run.
bool rename_file(const std::string& from, const std::string& to, bool overwrite) {
  if (!overwrite) {
    if (renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0) return true;
    // File systems without that flag answer EINVAL, old kernels ENOSYS.
    if (errno != EINVAL && errno != ENOSYS) return false;
    if (access(to.c_str(), F_OK) == 0) {
      errno = EEXIST;
      return false;
    }
  }
  return rename(from.c_str(), to.c_str()) == 0;
}

}  // namespace

void check_output_path(const std::string& input, const std::string& output, bool overwrite) {
  std::error_code failure;
  const fs::file_status status = fs::status(output, failure);
  if (fs::is_directory(status)) {
    throw Error(output + ": is a folder; give the name of a file in it");
  }
  if (fs::exists(status)) {
    if (fs::equivalent(input, output, failure)) {
      throw Error(output + ": is the input file; give the output another name");
    }
    if (!fs::is_regular_file(status)) {
      throw Error(output + ": is not a regular file; use - to write Y4M to a pipe");
    }
    if (!overwrite) throw exists_error(output);
  }
  const fs::path folder = fs::path(output).parent_path();
  if (!folder.empty() && !fs::is_directory(folder, failure)) {
    throw Error(folder.string() + ": no such folder; create it first");
  }
}

OutputFile::OutputFile(const std::string& path, bool overwrite)
    : path_(resolve_links(path)), temporary_path_(temporary_name(path_)), overwrite_(overwrite) {
  // Before it is made, so that a signal at any time finds its name.
  set_unfinished_file(temporary_path_);
  // O_EXCL: never write through a file or link that somebody else put there.
  const int descriptor = open(temporary_path_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC,
                              S_IRUSR | S_IWUSR | S_IRGRP | S_IWGRP | S_IROTH | S_IWOTH);
  if (descriptor < 0) {
    const int failure = errno;
    set_unfinished_file("");
    throw Error(path + ": cannot create a file in that folder: " + strerror(failure));
  }
  close(descriptor);
}

OutputFile::~OutputFile() {
  if (!committed_) unlink(temporary_path_.c_str());
  set_unfinished_file("");
}

void OutputFile::commit() {
  // A full disk or quota may show up only when the data leaves the cache.
  const int descriptor = open(temporary_path_.c_str(), O_WRONLY | O_CLOEXEC);
  const bool synced = descriptor >= 0 && (fsync(descriptor) == 0 || errno == EINVAL);
  const int sync_error = errno;
  if (descriptor >= 0) close(descriptor);
  if (!synced) throw Error(path_ + ": cannot write: " + strerror(sync_error));

  if (!rename_file(temporary_path_, path_, overwrite_)) {
    if (errno == EEXIST) throw exists_error(path_);
    throw Error(path_ + ": cannot rename the finished file: " + strerror(errno));
  }
  committed_ = true;
}

}  // namespace dehaze
