#include "host/ui/Description.h"

#include <algorithm>
#include <fstream>
#include <map>
#include <mutex>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>

#include "host/UException.h"

namespace quarvo::host {

using json = nlohmann::json;

namespace {

const std::map<std::string, GenreChamp>& genres() {
  static const std::map<std::string, GenreChamp> table = {
      {"text", GenreChamp::Texte},    {"integer", GenreChamp::Entier},
      {"number", GenreChamp::Nombre}, {"amount", GenreChamp::Montant},
      {"date", GenreChamp::Date},     {"check", GenreChamp::Case},
      {"choice", GenreChamp::Choix}};
  return table;
}

// Reads the members of one object, refusing a member it does not know: a misspelt key in a
// description would otherwise be ignored without a word.
class Objet {
 public:
  Objet(const json& j, std::string where, std::set<std::string> known)
      : j_(j), where_(std::move(where)) {
    if (!j.is_object()) throw UException(where_ + ": an object is expected");
    for (const auto& [key, value] : j.items()) {
      if (!known.count(key)) throw UException(where_ + ": unknown key \"" + key + "\"");
    }
  }
  std::string texte(const char* key, bool required = false) const {
    if (!j_.contains(key)) {
      if (required) throw UException(where_ + ": \"" + key + "\" is missing");
      return {};
    }
    if (!j_[key].is_string()) throw UException(where_ + ": \"" + key + "\" must be a text");
    return j_[key].get<std::string>();
  }
  bool booleen(const char* key, bool defaut) const {
    if (!j_.contains(key)) return defaut;
    if (!j_[key].is_boolean()) throw UException(where_ + ": \"" + key + "\" must be true or false");
    return j_[key].get<bool>();
  }
  const json* tableau(const char* key) const {
    if (!j_.contains(key)) return nullptr;
    if (!j_[key].is_array()) throw UException(where_ + ": \"" + key + "\" must be a list");
    return &j_[key];
  }
  GenreChamp genre() const {
    std::string kind = texte("kind");
    if (kind.empty()) return GenreChamp::Texte;
    auto it = genres().find(kind);
    if (it == genres().end()) throw UException(where_ + ": unknown kind \"" + kind + "\"");
    return it->second;
  }
  const std::string& where() const { return where_; }

 private:
  const json& j_;
  std::string where_;
};

DescChamp lireChamp(const json& j, const std::string& source, size_t index) {
  Objet o(j, source + ": field " + std::to_string(index + 1),
          {"name", "label", "kind", "tab", "group", "editable", "visible", "enabled", "values",
           "events"});
  DescChamp c;
  c.nom = o.texte("name", true);
  c.libelle = o.texte("label");
  c.genre = o.genre();
  c.onglet = o.texte("tab");
  c.groupe = o.texte("group");
  c.editable = o.booleen("editable", true);
  c.visible = o.booleen("visible", true);
  c.actif = o.booleen("enabled", true);
  if (const json* values = o.tableau("values")) {
    for (const auto& v : *values) {
      Objet ov(v, o.where() + " (" + c.nom + ") value", {"value", "label"});
      c.valeurs.push_back({ov.texte("value", true), ov.texte("label")});
    }
  }
  if (c.genre == GenreChamp::Case && c.valeurs.empty()) c.valeurs = {{"0", ""}, {"1", ""}};
  if (c.genre == GenreChamp::Case && c.valeurs.size() != 2) {
    throw UException(o.where() + " (" + c.nom + "): a box takes exactly two values");
  }
  if (c.genre == GenreChamp::Choix && c.valeurs.empty()) {
    throw UException(o.where() + " (" + c.nom + "): a choice lists its values");
  }
  if (const json* events = o.tableau("events")) {
    for (const auto& e : *events) {
      if (!e.is_string()) throw UException(o.where() + " (" + c.nom + "): events are labels");
      c.evenements.push_back(e.get<std::string>());
    }
  } else {
    c.evenements.push_back(c.nom);
  }
  return c;
}

std::string lireFichier(const std::filesystem::path& file) {
  std::ifstream in(file, std::ios::binary);
  if (!in) throw UException("screen description " + file.string() + " cannot be read");
  std::ostringstream text;
  text << in.rdbuf();
  return text.str();
}

}  // namespace

const char* nomGenre(GenreChamp genre) {
  for (const auto& [name, g] : genres()) {
    if (g == genre) return name.c_str();
  }
  return "text";
}

DescriptionEcran DescriptionEcran::lire(const std::string& text, const std::string& source) {
  json j;
  try {
    j = json::parse(text);
  } catch (const json::parse_error& e) {
    throw UException(source + ": " + e.what());
  }
  Objet o(j, source,
          {"screen", "extends", "title", "tab_control", "fields", "buttons", "tabs", "lists",
           "groups"});
  DescriptionEcran d;
  d.ecran = o.texte("screen", true);
  d.base = o.texte("extends");
  d.titre = o.texte("title");
  d.controleOnglets = o.texte("tab_control");
  if (const json* fields = o.tableau("fields")) {
    for (size_t i = 0; i < fields->size(); ++i)
      d.champs.push_back(lireChamp((*fields)[i], source, i));
  }
  if (const json* buttons = o.tableau("buttons")) {
    for (size_t i = 0; i < buttons->size(); ++i) {
      Objet b((*buttons)[i], source + ": button " + std::to_string(i + 1),
              {"name", "label", "tab", "visible", "enabled"});
      d.boutons.push_back({b.texte("name", true), b.texte("label"), b.texte("tab"),
                           b.booleen("visible", true), b.booleen("enabled", true)});
    }
  }
  if (const json* tabs = o.tableau("tabs")) {
    for (size_t i = 0; i < tabs->size(); ++i) {
      Objet t((*tabs)[i], source + ": tab " + std::to_string(i + 1), {"name", "label"});
      d.onglets.push_back({t.texte("name", true), t.texte("label")});
    }
  }
  if (const json* groups = o.tableau("groups")) {
    for (size_t i = 0; i < groups->size(); ++i) {
      Objet g((*groups)[i], source + ": group " + std::to_string(i + 1), {"name", "label"});
      d.groupes.push_back({g.texte("name", true), g.texte("label")});
    }
  }
  if (const json* lists = o.tableau("lists")) {
    for (size_t i = 0; i < lists->size(); ++i) {
      Objet l((*lists)[i], source + ": list " + std::to_string(i + 1), {"name", "tab", "columns"});
      DescListe liste{l.texte("name", true), l.texte("tab"), {}};
      if (const json* columns = l.tableau("columns")) {
        for (size_t k = 0; k < columns->size(); ++k) {
          Objet c((*columns)[k], l.where() + " column " + std::to_string(k + 1),
                  {"name", "header", "column", "editable", "kind"});
          liste.colonnes.push_back({c.texte("name", true), c.texte("header"), c.texte("column"),
                                    c.booleen("editable", false), c.genre()});
        }
      }
      d.listes.push_back(std::move(liste));
    }
  }
  return d;
}

namespace {

// `items` of the base, each replaced in place by the derived one of the same name, then the
// derived ones the base does not have.
template <typename T>
std::vector<T> fusionner(const std::vector<T>& base, const std::vector<T>& derived) {
  std::vector<T> out = base;
  for (const T& item : derived) {
    auto same = std::find_if(out.begin(), out.end(), [&](const T& b) { return b.nom == item.nom; });
    if (same != out.end()) {
      *same = item;
    } else {
      out.push_back(item);
    }
  }
  return out;
}

}  // namespace

DescriptionEcran DescriptionEcran::etendre(const DescriptionEcran& b) const {
  DescriptionEcran d;
  d.ecran = ecran;
  d.base = base;
  d.titre = titre.empty() ? b.titre : titre;
  d.controleOnglets = controleOnglets.empty() ? b.controleOnglets : controleOnglets;
  d.champs = fusionner(b.champs, champs);
  d.boutons = fusionner(b.boutons, boutons);
  d.onglets = fusionner(b.onglets, onglets);
  d.listes = fusionner(b.listes, listes);
  d.groupes = fusionner(b.groupes, groupes);
  return d;
}

void DescriptionEcran::verifier(const std::string& source) const {
  if (!onglets.empty() && controleOnglets.empty()) {
    throw UException(source + ": tabs need their \"tab_control\"");
  }
  // One name, one control: a field and a button of one name could not be told apart.
  std::set<std::string> noms;
  auto unique = [&](const std::string& nom) {
    if (!noms.insert(nom).second) throw UException(source + ": \"" + nom + "\" is declared twice");
  };
  for (const auto& c : champs) unique(c.nom);
  for (const auto& b : boutons) unique(b.nom);
  for (const auto& t : onglets) unique(t.nom);
  for (const auto& g : groupes) unique(g.nom);
  for (const auto& l : listes) {
    unique(l.nom);
    for (const auto& c : l.colonnes) unique(c.nom);
  }
  for (const auto& c : champs) {
    if (!c.onglet.empty() && !onglet(c.onglet)) {
      throw UException(source + ": field " + c.nom + " is on tab " + c.onglet + ", not declared");
    }
    if (!c.groupe.empty() && std::none_of(groupes.begin(), groupes.end(),
                                          [&](const DescGroupe& g) { return g.nom == c.groupe; })) {
      throw UException(source + ": field " + c.nom + " is in group " + c.groupe + ", not declared");
    }
  }
}

const DescChamp* DescriptionEcran::champ(const std::string& nom) const {
  for (const auto& c : champs) {
    if (c.nom == nom) return &c;
  }
  return nullptr;
}
const DescBouton* DescriptionEcran::bouton(const std::string& nom) const {
  for (const auto& b : boutons) {
    if (b.nom == nom) return &b;
  }
  return nullptr;
}
const DescOnglet* DescriptionEcran::onglet(const std::string& nom) const {
  for (const auto& t : onglets) {
    if (t.nom == nom) return &t;
  }
  return nullptr;
}
const DescListe* DescriptionEcran::liste(const std::string& nom) const {
  for (const auto& l : listes) {
    if (l.nom == nom) return &l;
  }
  return nullptr;
}

bool DescriptionEcran::declare(const std::string& nom) const {
  if (champ(nom) || bouton(nom) || onglet(nom) || liste(nom)) return true;
  if (!controleOnglets.empty() && nom == controleOnglets) return true;
  for (const auto& g : groupes) {
    if (g.nom == nom) return true;
  }
  for (const auto& l : listes) {
    for (const auto& c : l.colonnes) {
      if (c.nom == nom) return true;
    }
  }
  return false;
}

namespace {

// Screens extend one another a few levels deep at most: a cycle is a fault of the files.
constexpr int kNiveauxMax = 8;

std::shared_ptr<const DescriptionEcran> charger(const std::filesystem::path& dir,
                                                const std::string& screen, int niveau) {
  static std::mutex m;
  static std::map<std::filesystem::path, std::shared_ptr<const DescriptionEcran>> lues;
  std::filesystem::path file = dir / "screens" / (screen + ".json");
  {
    std::lock_guard lock(m);
    auto it = lues.find(file);
    if (it != lues.end()) return it->second;
  }
  if (niveau > kNiveauxMax) {
    throw UException(file.string() + ": screens extend one another in a circle");
  }
  DescriptionEcran d = DescriptionEcran::lire(lireFichier(file), file.string());
  if (d.ecran != screen) {
    throw UException(file.string() + ": describes screen " + d.ecran + ", not " + screen);
  }
  if (!d.base.empty()) {
    d = d.etendre(*charger(dir, d.base, niveau + 1));
  }
  d.verifier(file.string());
  auto shared = std::make_shared<const DescriptionEcran>(std::move(d));
  std::lock_guard lock(m);
  return lues.emplace(file, shared).first->second;
}

}  // namespace

std::shared_ptr<const DescriptionEcran> DescriptionEcran::de(const std::filesystem::path& dir,
                                                             const std::string& screen) {
  return charger(dir, screen, 0);
}

}  // namespace quarvo::host
