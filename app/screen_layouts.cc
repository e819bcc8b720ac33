#include "app/screen_layouts.h"

#include <nlohmann/json.hpp>

extern const char* const screen_layouts;

namespace app {

namespace {

using nlohmann::json;

const json& layouts() {
  static const json parsed = json::parse(screen_layouts);
  return parsed;
}

// The six kinds' screens are one model each; "$name" in the model stands for the
// kind's own piece of that name, or the one the kinds share.
const json* piece(const json& kind, const std::string& name) {
  if (kind.contains(name)) return &kind[name];
  const json& shared = layouts()["communs"];
  return shared.contains(name) ? &shared[name] : nullptr;
}

bool isPlaceholder(const json& value) {
  return value.is_string() && value.get_ref<const std::string&>().rfind("$", 0) == 0;
}

json expand(const json& model, const json& kind, const std::string& digit) {
  if (model.is_array()) {
    json out = json::array();
    for (const json& element : model) {
      if (!isPlaceholder(element)) {
        out.push_back(expand(element, kind, digit));
        continue;
      }
      const json* found = piece(kind, element.get<std::string>().substr(1));
      if (!found) continue;
      if (found->is_array()) {
        for (const json& e : *found) out.push_back(e);
      } else {
        out.push_back(*found);
      }
    }
    return out;
  }
  if (model.is_object()) {
    json out = json::object();
    for (const auto& [key, value] : model.items()) out[key] = expand(value, kind, digit);
    return out;
  }
  if (model.is_string()) {
    std::string text = model.get<std::string>();
    if (isPlaceholder(model)) {
      const json* found = piece(kind, text.substr(1));
      return found ? *found : json("");
    }
    if (auto at = text.find("$n"); at != std::string::npos) text.replace(at, 2, digit);
    return text;
  }
  return model;
}

}  // namespace

std::optional<std::string> dispositionEcran(const std::string& code) {
  const json& all = layouts();
  if (all["ecrans"].contains(code)) {
    json layout = all["ecrans"][code];
    layout["code"] = code;
    return layout.dump();
  }
  for (const auto& [digit, kind] : all["sortes"].items()) {
    for (const char* model : {"acces", "gestion"}) {
      const json& m = all[model];
      std::string named = m["code"].get<std::string>();
      named.replace(named.find("$n"), 2, digit);
      if (named == code) return expand(m, kind, digit).dump();
    }
  }
  return std::nullopt;
}

}  // namespace app
