#include "Host/Model/ProjectFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <optional>
#include <sstream>

#include "Host/Model/ProjectFileReader.h"
#include "Host/Model/ProjectFileWriter.h"

ProjectLoadResult ProjectFile::LoadFromString(std::string_view text) {
  return ProjectFileReader::Read(text);
}

ProjectLoadResult ProjectFile::Load(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in)
    return {nullptr, path + ": cannot open"};
  std::ostringstream content;
  content << in.rdbuf();
  if (in.bad())
    return {nullptr, path + ": cannot read"};
  auto result = LoadFromString(content.str());
  if (!result)
    result.error = path + ": " + result.error;
  return result;
}

std::string ProjectFile::SaveToString(const Project& project) {
  return ProjectFileWriter::Write(project);
}

namespace {

std::string Reason() {
  return std::strerror(errno);
}

// Writes `text` as a new file at `path` and forces it to disk. The reason when it failed (the
// file is then removed), else nothing.
std::optional<std::string> WriteDurably(const std::string& path, const std::string& text) {
  const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
  if (fd < 0) {
    return "cannot write beside it (" + path + "): " + Reason();
  }
  std::optional<std::string> failure;
  for (std::size_t written = 0; written < text.size() && !failure;) {
    const ssize_t n = ::write(fd, text.data() + written, text.size() - written);
    if (n > 0) {
      written += static_cast<std::size_t>(n);
    } else if (n < 0 && errno != EINTR) {
      failure = "writing failed: " + Reason();
    }
  }
  if (!failure && ::fsync(fd) != 0) {
    failure = "writing failed: " + Reason();
  }
  // Some file systems report a failed write only when the file is closed.
  if (::close(fd) != 0 && !failure) {
    failure = "writing failed: " + Reason();
  }
  if (failure) {
    ::unlink(path.c_str());
  }
  return failure;
}

// Makes a rename in `folder` survive a crash; a file system that cannot say so is not an error.
void SyncFolder(const std::filesystem::path& folder) {
  const int fd = ::open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (fd >= 0) {
    ::fsync(fd);
    ::close(fd);
  }
}

}  // namespace

bool ProjectFile::Save(const Project& project, const std::string& path, std::string* error) {
  auto fail = [&](const std::string& what) {
    if (error)
      *error = path + ": " + what;
    return false;
  };
  // The old file stays whole until the new one is complete on disk, then the new one replaces
  // it in one step: a failure or a crash at any point leaves one or the other, never a mix.
  const std::string temporary = path + ".saving";
  if (const std::optional<std::string> failure = WriteDurably(temporary, SaveToString(project)))
    return fail(*failure);
  std::error_code ec;
  std::filesystem::rename(temporary, path, ec);
  if (ec) {
    ::unlink(temporary.c_str());
    return fail("cannot replace the file: " + ec.message());
  }
  SyncFolder(std::filesystem::path(path).parent_path());
  return true;
}
