#include "Host/Messaging/Preferences.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iostream>
#include <iterator>
#include <system_error>

namespace {

namespace fs = std::filesystem;

std::unique_ptr<Preferences>& ApplicationSlot() {
  static std::unique_ptr<Preferences> application;
  return application;
}

// The first of "<file>.corrupt", "<file>.corrupt.1", ... that does not exist yet.
fs::path FreeCorruptSibling(const fs::path& file) {
  fs::path candidate = file;
  candidate += ".corrupt";
  std::error_code ec;
  for (int n = 1; fs::exists(candidate, ec) || ec; ++n) {
    if (ec) {
      return {};
    }
    candidate = file;
    candidate += ".corrupt." + std::to_string(n);
  }
  return candidate;
}

// Moves a file it could not parse out of the way without overwriting anything; empty on failure.
fs::path KeepAside(const fs::path& file) {
  const fs::path target = FreeCorruptSibling(file);
  if (target.empty()) {
    return {};
  }
  // link + unlink, unlike rename, fails instead of replacing a target that appeared meanwhile.
  if (::link(file.c_str(), target.c_str()) == 0) {
    if (::unlink(file.c_str()) == 0) {
      return target;
    }
    ::unlink(target.c_str());
    return {};
  }
  std::error_code ec;
  fs::rename(file, target, ec);  // file systems without hard links
  return ec ? fs::path() : target;
}

bool WriteFileDurably(const fs::path& path, const std::string& contents, std::string& error) {
  std::FILE* const out = std::fopen(path.c_str(), "wb");
  if (out == nullptr) {
    error = "cannot create " + path.string() + ": " + std::strerror(errno);
    return false;
  }
  const bool written = std::fwrite(contents.data(), 1, contents.size(), out) == contents.size() &&
                       std::fflush(out) == 0 && ::fsync(::fileno(out)) == 0;
  const int writeErrno = errno;
  const bool closed = std::fclose(out) == 0;
  if (!written || !closed) {
    error = "cannot write " + path.string() + ": " + std::strerror(written ? errno : writeErrno);
    return false;
  }
  return true;
}

// Makes a finished rename survive a power cut; failure only costs that guarantee.
void SyncDirectory(const fs::path& directory) {
  const int fd = ::open(directory.empty() ? "." : directory.c_str(), O_RDONLY | O_DIRECTORY);
  if (fd >= 0) {
    ::fsync(fd);
    ::close(fd);
  }
}

}  // namespace

Preferences::Preferences() {
  mProperties.SetStation(StationName(kStation));
}

Preferences::Preferences(std::filesystem::path file) : mFile(std::move(file)) {
  mProperties.SetStation(StationName(kStation));
}

std::filesystem::path Preferences::DefaultFilePath() {
  fs::path base;
  if (const char* xdg = std::getenv("XDG_CONFIG_HOME"); xdg != nullptr && *xdg == '/') {
    base = xdg;  // relative values are invalid and ignored
  } else if (const char* home = std::getenv("HOME"); home != nullptr && *home != '\0') {
    base = fs::path(home) / ".config";
  } else {
    base = fs::current_path() / ".config";
  }
  return base / "effectcontrols" / "preferences.json";
}

Preferences& Preferences::Application() {
  auto& slot = ApplicationSlot();
  if (slot == nullptr) {
    slot = std::make_unique<Preferences>(DefaultFilePath());
    slot->Load();
  }
  return *slot;
}

void Preferences::SetApplication(std::unique_ptr<Preferences> preferences) {
  ApplicationSlot() = std::move(preferences);
}

Preferences::LoadResult Preferences::Load() {
  LoadResult result;
  if (mFile.empty()) {
    return result;
  }
  const auto station = mProperties.GetStation();
  mProperties = PropertyList();
  mProperties.SetStation(station);
  mSaveBlockedReason.clear();

  std::error_code ec;
  const auto status = fs::status(mFile, ec);
  if (status.type() == fs::file_type::not_found) {
    result.status = LoadStatus::kMissing;
    return result;
  }
  std::string text;
  std::string unreadable;
  if (ec) {
    unreadable = ec.message();
  } else if (!fs::is_regular_file(status)) {
    unreadable = "not a regular file";
  } else {
    std::ifstream in(mFile, std::ios::binary);
    if (!in.is_open()) {
      unreadable = std::strerror(errno);
    } else {
      text.assign(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
      if (in.bad()) {
        unreadable = "read error";
      }
    }
  }
  if (!unreadable.empty()) {
    result.status = LoadStatus::kUnreadable;
    result.error = "cannot read " + mFile.string() + ": " + unreadable;
    mSaveBlockedReason = result.error;
    ReportOnce(result.error + "; using defaults and not saving over it");
    return result;
  }

  std::string why;
  if (auto list = PropertyList::FromJSON(text, &why)) {
    mProperties = std::move(*list);
    mProperties.SetStation(station);
    result.status = LoadStatus::kLoaded;
    return result;
  }

  result.status = LoadStatus::kCorrupt;
  result.error = mFile.string() + " is corrupt (" + why + ")";
  result.keptAside = KeepAside(mFile);
  if (result.keptAside.empty()) {
    mSaveBlockedReason = result.error + " and could not be moved aside";
    ReportOnce(mSaveBlockedReason + "; using defaults and not saving over it");
  } else {
    ReportOnce(result.error + "; kept as " + result.keptAside.string() + ", using defaults");
  }
  return result;
}

void Preferences::ReportOnce(const std::string& problem) {
  if (problem != mLastReported) {
    mLastReported = problem;
    std::cerr << "Preferences: " << problem << std::endl;
  }
}

bool Preferences::Save(std::string* error) const {
  const auto fail = [error](std::string why) {
    std::cerr << "Preferences: " << why << std::endl;
    if (error != nullptr) {
      *error = std::move(why);
    }
    return false;
  };
  if (mFile.empty()) {
    return true;
  }
  if (!mSaveBlockedReason.empty()) {
    return fail("not saved: " + mSaveBlockedReason);
  }
  std::error_code ec;
  // A symbolic link (dotfiles kept elsewhere) stays a link: the file it points to is replaced.
  fs::path target = mFile;
  if (fs::is_symlink(mFile, ec)) {
    const fs::path resolved = fs::weakly_canonical(mFile, ec);
    if (ec) {
      return fail("cannot resolve " + mFile.string() + ": " + ec.message());
    }
    target = resolved;
  }
  if (target.has_parent_path()) {
    fs::create_directories(target.parent_path(), ec);
    if (ec) {
      return fail("cannot create " + target.parent_path().string() + ": " + ec.message());
    }
  }
  fs::path temporary = target;
  temporary += ".tmp." + std::to_string(::getpid());
  std::string why;
  if (!WriteFileDurably(temporary, mProperties.ToJSON() + "\n", why)) {
    fs::remove(temporary, ec);
    return fail(why);
  }
  fs::rename(temporary, target, ec);
  if (ec) {
    const std::string message = ec.message();
    fs::remove(temporary, ec);
    return fail("cannot replace " + target.string() + ": " + message);
  }
  SyncDirectory(target.parent_path());
  return true;
}

bool Preferences::GetBool(std::string_view key, bool defaultValue) const {
  return mProperties.GetBool(key, defaultValue);
}
int Preferences::GetInt(std::string_view key, int defaultValue) const {
  return mProperties.GetInt(key, defaultValue);
}
float Preferences::GetFloat(std::string_view key, float defaultValue) const {
  return mProperties.GetFloat(key, defaultValue);
}
double Preferences::GetDouble(std::string_view key, double defaultValue) const {
  return mProperties.GetDouble(key, defaultValue);
}
std::string Preferences::GetString(std::string_view key, std::string_view defaultValue) const {
  return mProperties.GetString(key, defaultValue);
}
bool Preferences::SetBool(std::string_view key, bool value) {
  return mProperties.SetBool(key, value);
}
bool Preferences::SetInt(std::string_view key, int value) {
  return mProperties.SetInt(key, value);
}
bool Preferences::SetFloat(std::string_view key, float value) {
  return mProperties.SetFloat(key, value);
}
bool Preferences::SetDouble(std::string_view key, double value) {
  return mProperties.SetDouble(key, value);
}
bool Preferences::SetString(std::string_view key, std::string_view value) {
  return mProperties.SetString(key, value);
}
bool Preferences::Remove(std::string_view key) {
  return mProperties.Remove(key);
}
bool Preferences::IsReadOnly(std::string_view key) const {
  return mProperties.IsReadOnly(key);
}
