#include "host/ui/Action.h"

#include <array>
#include <charconv>
#include <utility>

namespace quarvo::host {

namespace {

struct Mot {
  const char* mot;
  Action::Genre genre;
  const char* usage;
};

constexpr std::array<Mot, 9> kMots{{
    {"set", Action::Genre::Saisir, "set FIELD VALUE"},
    {"cell", Action::Genre::Cellule, "cell LIST ROW COLUMN VALUE"},
    {"select", Action::Genre::Selectionner, "select LIST ROW"},
    {"tab", Action::Genre::Onglet, "tab NAME"},
    {"press", Action::Genre::Presser, "press BUTTON"},
    {"new", Action::Genre::Nouvelle, "new LIST"},
    {"delete", Action::Genre::Supprimer, "delete LIST ROW"},
    {"answer", Action::Genre::Repondre, "answer N|TEXT|PATH"},
    {"close", Action::Genre::Fermer, "close"},
}};

// Splits off the next word (up to a space) from `rest`; the rest then starts after one space.
std::string mot(std::string_view& rest) {
  size_t end = rest.find(' ');
  std::string w(rest.substr(0, end));
  rest = end == std::string_view::npos ? std::string_view() : rest.substr(end + 1);
  return w;
}

std::optional<size_t> numero(const std::string& text) {
  size_t n = 0;
  auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), n);
  if (ec != std::errc() || end != text.data() + text.size() || n == 0) return std::nullopt;
  return n;
}

}  // namespace

std::optional<Action> lireAction(const std::string& line, std::string* erreur) {
  std::string_view rest(line);
  if (!rest.empty() && rest.back() == '\r') rest.remove_suffix(1);
  size_t first = rest.find_first_not_of(' ');
  if (first == std::string_view::npos || rest[first] == '#') return std::nullopt;
  rest.remove_prefix(first);
  auto fail = [erreur](std::string why) -> std::optional<Action> {
    if (erreur != nullptr) *erreur = std::move(why);
    return std::nullopt;
  };
  std::string word = mot(rest);
  const Mot* found = nullptr;
  for (const auto& m : kMots) {
    if (word == m.mot) found = &m;
  }
  if (found == nullptr) {
    return fail("'" + word +
                "' is not an action (set, cell, select, tab, press, new, delete, answer, close)");
  }
  Action a;
  a.genre = found->genre;
  auto usage = [&]() { return fail(std::string("expected: ") + found->usage); };
  switch (a.genre) {
    case Action::Genre::Saisir:
      a.cible = mot(rest);
      a.valeur = std::string(rest);
      if (a.cible.empty()) return usage();
      break;
    case Action::Genre::Cellule: {
      a.cible = mot(rest);
      auto row = numero(mot(rest));
      a.colonne = mot(rest);
      a.valeur = std::string(rest);
      if (a.cible.empty() || !row || a.colonne.empty()) return usage();
      a.ligne = *row;
      break;
    }
    case Action::Genre::Selectionner:
    case Action::Genre::Supprimer: {
      a.cible = mot(rest);
      auto row = numero(mot(rest));
      if (a.cible.empty() || !row || !rest.empty()) return usage();
      a.ligne = *row;
      break;
    }
    case Action::Genre::Onglet:
    case Action::Genre::Presser:
    case Action::Genre::Nouvelle:
      a.cible = mot(rest);
      if (a.cible.empty() || !rest.empty()) return usage();
      break;
    case Action::Genre::Repondre:
      a.valeur = std::string(rest);
      break;
    case Action::Genre::Fermer:
      if (!rest.empty()) return usage();
      break;
  }
  return a;
}

std::string enLigne(const Action& a) {
  std::string word;
  for (const auto& m : kMots) {
    if (m.genre == a.genre) word = m.mot;
  }
  switch (a.genre) {
    case Action::Genre::Saisir:
      return word + " " + a.cible + " " + a.valeur;
    case Action::Genre::Cellule:
      return word + " " + a.cible + " " + std::to_string(a.ligne) + " " + a.colonne + " " +
             a.valeur;
    case Action::Genre::Selectionner:
    case Action::Genre::Supprimer:
      return word + " " + a.cible + " " + std::to_string(a.ligne);
    case Action::Genre::Onglet:
    case Action::Genre::Presser:
    case Action::Genre::Nouvelle:
      return word + " " + a.cible;
    case Action::Genre::Repondre:
      return word + " " + a.valeur;
    case Action::Genre::Fermer:
      break;
  }
  return word;
}

}  // namespace quarvo::host
