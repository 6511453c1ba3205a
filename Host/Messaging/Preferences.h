#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <string_view>

#include "Host/Messaging/PropertyList.h"

// The application's preferences: a PropertyList kept in a JSON file, by default
// $XDG_CONFIG_HOME/effectcontrols/preferences.json (or ~/.config/effectcontrols/...).
//
// A missing file means defaults. A file that cannot be parsed is reported once on stderr and in
// the load result, renamed aside to a sibling ("preferences.json.corrupt", ".corrupt.1", ...,
// never replacing an existing file) and defaults are used. If it cannot be moved aside, or cannot
// be read at all, Save refuses to write over it. Saving writes a temporary sibling and renames it
// over the file, so a crash leaves either the old or the new file. UI thread only.
class Preferences {
 public:
  enum class LoadStatus {
    kLoaded,      // values read from the file
    kMissing,     // no file: defaults
    kCorrupt,     // unparsable: kept aside (see keptAside), defaults
    kUnreadable,  // exists but cannot be read: defaults, saving disabled
    kInMemory,    // no file path: nothing to read
  };
  struct LoadResult {
    LoadStatus status = LoadStatus::kInMemory;
    std::string error;                // why, for kCorrupt and kUnreadable
    std::filesystem::path keptAside;  // where a corrupt file went (empty if it could not move)
  };

  // In memory only; Load and Save do nothing and succeed.
  Preferences();
  // Kept in `file` (not read until Load).
  explicit Preferences(std::filesystem::path file);

  static std::filesystem::path DefaultFilePath();

  // The process-wide application preferences: on first use made for DefaultFilePath() and
  // loaded, unless one was installed.
  static Preferences& Application();
  // Replaces the application preferences (the shell's config option, tests). nullptr: the next
  // Application() call makes the default one again.
  static void SetApplication(std::unique_ptr<Preferences> preferences);

  // Replaces the values with the file's (defaults when it is missing or corrupt).
  LoadResult Load();
  // False (and *error set) when the file could not be written, or saving is disabled because the
  // file on disk could not be read or kept aside.
  bool Save(std::string* error = nullptr) const;
  const std::filesystem::path& GetFilePath() const { return mFile; }

  PropertyList& Properties() { return mProperties; }
  const PropertyList& Properties() const { return mProperties; }

  // Shorthands for Properties(); see PropertyList.
  bool GetBool(std::string_view key, bool defaultValue) const;
  int GetInt(std::string_view key, int defaultValue) const;
  float GetFloat(std::string_view key, float defaultValue) const;
  double GetDouble(std::string_view key, double defaultValue) const;
  std::string GetString(std::string_view key, std::string_view defaultValue) const;
  bool SetBool(std::string_view key, bool value);
  bool SetInt(std::string_view key, int value);
  bool SetFloat(std::string_view key, float value);
  bool SetDouble(std::string_view key, double value);
  bool SetString(std::string_view key, std::string_view value);
  bool Remove(std::string_view key);
  bool IsReadOnly(std::string_view key) const;

  // Station of the application preferences' OverrideReadOnlyPropertyWarningMessage.
  static constexpr std::string_view kStation = "Preferences";

 private:
  std::filesystem::path mFile;
  PropertyList mProperties;
  // Writes a load problem to stderr unless it is the one reported last.
  void ReportOnce(const std::string& problem);

  std::string mSaveBlockedReason;  // non-empty: the file on disk must not be overwritten
  std::string mLastReported;
};
