#include "Host/Model/ProjectFile.h"

#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
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

bool ProjectFile::Save(const Project& project, const std::string& path, std::string* error) {
  auto fail = [&](const std::string& what) {
    if (error)
      *error = path + ": " + what;
    return false;
  };
  const std::string text = SaveToString(project);
  const std::string temporary = path + ".saving";
  {
    std::ofstream out(temporary, std::ios::binary | std::ios::trunc);
    if (!out)
      return fail("cannot write beside it (" + temporary + ")");
    out << text;
    out.flush();
    if (!out) {
      out.close();
      std::remove(temporary.c_str());
      return fail("writing failed");
    }
  }
  if (FILE* f = std::fopen(temporary.c_str(), "rb")) {
    ::fsync(fileno(f));
    std::fclose(f);
  }
  std::error_code ec;
  std::filesystem::rename(temporary, path, ec);
  if (ec) {
    std::remove(temporary.c_str());
    return fail("cannot replace the file: " + ec.message());
  }
  return true;
}
