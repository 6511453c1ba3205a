// Files a user or another program may hand us: members left out, damaged or hostile content. A
// load either gives a project that saves and opens again unchanged, or one line naming the place.

#include <gtest/gtest.h>

#include <functional>
#include <nlohmann/json.hpp>
#include <set>
#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ProjectFile.h"
#include "ModelTestFixture.h"

namespace {

using json = nlohmann::ordered_json;

// Loads `text`, saves it, loads and saves that again: the second save must equal the first.
void ExpectSavedFileOpensAgainUnchanged(const std::string& text, const std::string& what) {
  const auto loaded = ProjectFile::LoadFromString(text);
  ASSERT_TRUE(loaded) << what << ": " << loaded.error;
  const std::string saved = ProjectFile::SaveToString(*loaded.project);
  const auto reopened = ProjectFile::LoadFromString(saved);
  ASSERT_TRUE(reopened) << what << ": the saved file does not open: " << reopened.error;
  EXPECT_EQ(ProjectFile::SaveToString(*reopened.project), saved) << what;
}

// Every object of `value` that the format describes (not the one-member value objects) with its
// path as errors name it, its path with the indices left out and its JSON pointer.
struct ObjectPlace {
  std::string path;
  std::string kind;
  json::json_pointer pointer = json::json_pointer();
};
void CollectObjects(const json& value, const ObjectPlace& place, std::vector<ObjectPlace>& out) {
  if (value.is_object()) {
    const std::string last = place.pointer.empty() ? "" : place.pointer.back();
    if (last == "default" || last == "value" || last == "properties" || last == "expansion")
      return;
    out.push_back(place);
    for (const auto& [key, member] : value.items()) {
      CollectObjects(
          member,
          ObjectPlace{place.path.empty() ? key : place.path + "." + key,
                      place.kind.empty() ? key : place.kind + "." + key, place.pointer / key},
          out);
    }
  } else if (value.is_array()) {
    for (std::size_t i = 0; i < value.size(); ++i) {
      CollectObjects(value[i],
                     ObjectPlace{place.path + "[" + std::to_string(i) + "]", place.kind + "[]",
                                 place.pointer / i},
                     out);
    }
  }
}

class ProjectFileHostileInputTest : public ModelTest {
 protected:
  ProjectFileHostileInputTest() {
    // Give the fixture what the format has beyond it: an effect on the master clip, a mask,
    // presets, properties and markers on the master clip.
    blur->SetCanTakeMasks(true);
    auto mask = Catalogue().Create(kMatchName_Crop);
    blur->SetMasks({mask});
    masterClip->GetVideoChain()->Append(Catalogue().Create(kMatchName_GaussianBlur));
    masterClip->GetProperties().SetString("Reel", "A001");
    Markers markers;
    markers.Add({kSecond, kSecond, "Clap", "", 2});
    masterClip->SetMarkers(markers);
  }

  json Saved() const { return json::parse(ProjectFile::SaveToString(*project)); }

  // The first clip's component with `matchName` in the saved JSON, and its path.
  static std::pair<json*, std::string> FirstClipComponent(json& j, const std::string& matchName) {
    json& components = j["sequences"][0]["tracks"][0]["items"][0]["chain"]["components"];
    for (std::size_t i = 0; i < components.size(); ++i) {
      if (components[i]["matchName"] == matchName) {
        return {&components[i],
                "sequences[0].tracks[0].items[0].chain.components[" + std::to_string(i) + "]"};
      }
    }
    ADD_FAILURE() << matchName << " is not on the first clip";
    return {&j, ""};
  }

  // The error of loading the saved fixture with one edit applied to its JSON.
  std::string ErrorOfEdited(const std::function<void(json&)>& edit) const {
    json j = Saved();
    edit(j);
    const auto result = ProjectFile::LoadFromString(j.dump());
    EXPECT_FALSE(result);
    return result.error;
  }

  static std::string Nested(const std::string& open, const std::string& inner,
                            const std::string& close, int depth) {
    std::string text;
    text.reserve((open.size() + close.size()) * depth + inner.size());
    for (int i = 0; i < depth; ++i)
      text += open;
    text += inner;
    for (int i = 0; i < depth; ++i)
      text += close;
    return text;
  }
};

// A master clip written without its chain got a chain with a fresh id at once, which a later
// object of the file could also have; the saved file then held that id twice and did not open.
TEST_F(ProjectFileHostileInputTest, AMasterClipWithoutItsChainSavesAFileThatOpensAgain) {
  const ObjectID next = ModelObject::AllocateObjectID() + 1;
  // Ids the loader's first made objects would get, given to objects later in the file.
  std::string items;
  for (int i = 0; i < 8; ++i) {
    items += (i ? "," : "") + std::string(R"({"kind": "clip", "id": )") + std::to_string(next + i) +
             R"(, "start": )" + std::to_string(i * 100) + R"(, "end": )" +
             std::to_string(i * 100 + 100) + R"(, "masterClip": 1})";
  }
  const std::string text = R"({"masterClips": [{"id": 1, "name": "M"}],
      "sequences": [{"name": "S", "tracks": [{"mediaType": "video", "items": [)" +
                           items + "]}]}]}";
  ExpectSavedFileOpensAgainUnchanged(text, "master clip without videoChain");
}

TEST_F(ProjectFileHostileInputTest, AFileWithOnlyTheRequiredMembersSavesAndOpensAgain) {
  ExpectSavedFileOpensAgainUnchanged(R"({
    "media": [{"duration": null}],
    "masterClips": [{"name": "M", "media": null}],
    "sequences": [{"name": "S", "tracks": [
      {"mediaType": "video", "items": [
        {"kind": "clip", "start": 0, "end": 100},
        {"kind": "transition", "start": 50, "end": 150, "transition": {}},
        {"kind": "clip", "start": 100, "end": 200, "chain": {"components": [
          {"matchName": "X", "mediaType": "video", "params": [
            {"name": "P", "type": 2, "default": {"double": 1},
             "keyframes": [{"time": 0, "value": {"double": 2}}]}],
           "presets": [{"name": "Q", "values": []}]}]}}]},
      {"mediaType": "audio", "items": []}],
      "markers": [{"time": 5}]}]
  })",
                                     "only required members");
}

// Each member of every object of a full file is left out in turn: the load either says which
// member is missing, or it gives a project whose saved file opens again and saves the same.
TEST_F(ProjectFileHostileInputTest, LeavingOutAnyMemberLoadsOrNamesWhatIsMissing) {
  const json full = Saved();
  // Each member of each kind of object once: its first place in the file.
  std::vector<ObjectPlace> objects;
  CollectObjects(full, ObjectPlace{}, objects);
  std::vector<std::pair<const ObjectPlace*, std::string>> members;
  std::set<std::string> kinds;
  for (const auto& object : objects) {
    for (const auto& [key, value] : full[object.pointer].items()) {
      // An object's kind is the member that holds it: "params[]" wherever a parameter is.
      const std::string kind = object.kind.substr(object.kind.rfind('.') + 1);
      if (kinds.insert(kind + "." + key).second)
        members.emplace_back(&object, key);
    }
  }
  ASSERT_GT(members.size(), 120u);
  int loaded = 0;
  for (const auto& [object, key] : members) {
    json edited = full;
    edited[object->pointer].erase(key);
    const std::string place = object->path.empty() ? key : object->path + "." + key;
    const auto result = ProjectFile::LoadFromString(edited.dump());
    if (!result) {
      // Some members come in pairs or are referred to elsewhere in the file.
      EXPECT_TRUE(result.error == place + ": is missing" || key == "sampleRate" ||
                  (key == "presets" && result.error.ends_with("currentPreset: no such preset")) ||
                  (key == "id" && result.error.ends_with("has this id")) ||
                  (key == "media" && result.error.ends_with("no media has this id")) ||
                  (key == "masterClips" && result.error.ends_with("no master clip has this id")))
          << place << ": " << result.error;
      continue;
    }
    ++loaded;
    ExpectSavedFileOpensAgainUnchanged(edited.dump(), "without " + place);
  }
  EXPECT_GT(loaded, static_cast<int>(members.size()) * 3 / 4);
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

// The effect could not take the mask: setting it raised an assertion and freed the mask, and the
// id registry then wrote the mask's fresh id into freed memory.
TEST_F(ProjectFileHostileInputTest, AMaskOnAnEffectThatTakesNoMasksIsRefusedByName) {
  json probe = Saved();
  const std::string cropPath = FirstClipComponent(probe, crop->GetMatchName()).second;
  const std::string error = ErrorOfEdited([&](json& j) {
    json& saved = *FirstClipComponent(j, crop->GetMatchName()).first;
    saved["canTakeMasks"] = false;
    saved["masks"] = json::array({{{"matchName", "Mask"}, {"mediaType", "video"}, {"params", {}}}});
  });
  EXPECT_EQ(error, cropPath + ".masks: effect \"" + crop->GetMatchName() +
                       "\" cannot take masks (canTakeMasks is false)");
  EXPECT_TRUE(RecordedDebugAssertions().empty());
  const std::string inChain = ErrorOfEdited(
      [&](json& j) { (*FirstClipComponent(j, crop->GetMatchName()).first)["role"] = 2; });
  EXPECT_EQ(inChain, cropPath + ".role: a mask belongs in its effect's masks, not in a chain");
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

TEST_F(ProjectFileHostileInputTest, DeepNestingIsRefusedWhereItIsBeforeAnythingRecurses) {
  const std::string deepValue = Nested("[", "1", "]", 200'000);
  const std::string inProperties =
      R"({"properties": {"values": {"a": )" + deepValue + R"(}}, "sequences": []})";
  const std::string error = ProjectFile::LoadFromString(inProperties).error;
  EXPECT_TRUE(error.starts_with("properties.values.a[0][0][0]")) << error;
  EXPECT_TRUE(error.ends_with("[0]: nested deeper than 64 levels")) << error;

  const std::string inExpansion = ErrorOfEdited([&](json& j) {
    j["sequences"][0]["tracks"][0]["items"][0]["chain"]["components"][0]["expansion"] =
        json::parse(Nested("{\"k\": ", "1", "}", 80));
  });
  EXPECT_TRUE(inExpansion.starts_with(
      "sequences[0].tracks[0].items[0].chain.components[0].expansion.k.k.k"))
      << inExpansion;

  const std::string mask = R"({"matchName": "M", "mediaType": "video", "params": [],
                               "canTakeMasks": true, "masks": [)";
  const std::string deepMasks =
      R"({"sequences": [{"name": "S", "tracks": [{"mediaType": "video", "items": [
        {"kind": "clip", "start": 0, "end": 1, "chain": {"components": [)" +
      Nested(mask, "", "]}", 20'000) + "]}}]}]}]}";
  const std::string masksError = ProjectFile::LoadFromString(deepMasks).error;
  EXPECT_TRUE(masksError.starts_with(
      "sequences[0].tracks[0].items[0].chain.components[0].masks[0].masks[0]"))
      << masksError;
  EXPECT_TRUE(masksError.ends_with(": nested deeper than 64 levels")) << masksError;
}

TEST_F(ProjectFileHostileInputTest, WhatTheJsonLibraryRefusesStillNamesThePlace) {
  json j = Saved();
  j["sequences"][0]["tracks"][0]["items"][0]["speed"] = 12345.5;
  std::string text = j.dump();
  text.replace(text.find("12345.5"), 7, "1e999");
  EXPECT_EQ(ProjectFile::LoadFromString(text).error,
            "sequences[0].tracks[0].items[0].speed: not valid JSON: number overflow parsing "
            "'1e999'");
  EXPECT_EQ(ProjectFile::LoadFromString(R"({"sequences": [{"name": "S", "tracks": [}]})").error,
            "sequences[0].tracks[0]: not valid JSON: parse error at line 1, column 41: syntax "
            "error while parsing value - unexpected '}'; expected '[', '{', or a literal");
  EXPECT_TRUE(ProjectFile::LoadFromString("").error.starts_with("not valid JSON: "));
}

TEST_F(ProjectFileHostileInputTest, AnErrorIsOneShortLineWhateverTheFileQuotes) {
  const std::string longKey(100'000, 'k');
  const std::string error = ErrorOfEdited([&](json& j) {
    j["sequences"][0]["tracks"][0]["items"][0]["chain"]["components"][0]["params"][0]["value"] = {
        {"line\nbreak" + longKey, 1}};
  });
  EXPECT_EQ(error.find('\n'), std::string::npos);
  EXPECT_LE(error.size(), 403u);
  EXPECT_NE(error.find("unknown value kind 'line?break"), std::string::npos) << error;
}

}  // namespace
