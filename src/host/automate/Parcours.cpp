#include "host/automate/Parcours.h"

#include <algorithm>
#include <optional>

namespace quarvo::host {

namespace {

// The open selection sorted on rows the store holds in memory, compared where they are instead
// of copying their sort values; nullopt when the store does not hold them.
std::optional<std::vector<RowId>> selectionTrieeEnPlace(Table& t,
                                                        const std::vector<std::string>& colonnes,
                                                        Comparaison comparer) {
  TableStore& store = t.store();
  const TableSchema& schema = store.schema();
  std::vector<std::pair<std::shared_ptr<const Row>, RowId>> lignes;
  lignes.reserve(t.tailleSelection());
  for (size_t i = 0; i < t.tailleSelection(); ++i) {
    RowId id = t.selectionnee(i);
    auto row = store.partagee(id);
    if (!row) {
      if (i == 0) return std::nullopt;
      continue;  // gone since the selection was made
    }
    lignes.emplace_back(std::move(row), id);
  }
  // A column the table does not have reads as an empty value for every row.
  static const Valeur aucune;
  std::vector<std::pair<std::optional<size_t>, const Valeur*>> cles;
  for (const auto& col : colonnes) {
    auto i = schema.index(col);
    cles.emplace_back(i, i ? &defautDe(schema.columns()[*i].kind) : &aucune);
  }
  auto cellule = [&](const Row& row, size_t k) -> const Valeur& {
    const auto& [i, defaut] = cles[k];
    return i && *i < row.values.size() ? row.values[*i] : *defaut;
  };
  std::stable_sort(lignes.begin(), lignes.end(), [&](const auto& a, const auto& b) {
    for (size_t k = 0; k < cles.size(); ++k) {
      int c = comparer(cellule(*a.first, k), cellule(*b.first, k));
      if (c != 0) return c < 0;
    }
    return false;
  });
  std::vector<RowId> order;
  order.reserve(lignes.size());
  for (const auto& l : lignes) order.push_back(l.second);
  return order;
}

}  // namespace

std::vector<RowId> selectionTriee(Table& t, const std::vector<std::string>& colonnes,
                                  Comparaison comparer) {
  std::vector<RowId> order;
  if (comparer == &Valeur::compare && t.ouvrirTrie(colonnes)) {
    order.reserve(t.tailleSelection());
    for (size_t i = 0; i < t.tailleSelection(); ++i) order.push_back(t.selectionnee(i));
    return order;
  }
  t.ouvrir();
  if (auto ordre = selectionTrieeEnPlace(t, colonnes, comparer)) return std::move(*ordre);
  std::vector<std::pair<std::vector<Valeur>, RowId>> keyed;
  keyed.reserve(t.tailleSelection());
  while (t.lire(1) == 0) {
    std::vector<Valeur> key;
    key.reserve(colonnes.size());
    for (const auto& col : colonnes) key.push_back(t.valeur(col));
    keyed.emplace_back(std::move(key), t.courantId());
  }
  std::stable_sort(keyed.begin(), keyed.end(), [comparer](const auto& a, const auto& b) {
    for (size_t i = 0; i < a.first.size(); ++i) {
      int c = comparer(a.first[i], b.first[i]);
      if (c != 0) return c < 0;
    }
    return false;
  });
  order.reserve(keyed.size());
  for (const auto& k : keyed) order.push_back(k.second);
  return order;
}

Parcours::Parcours(Evt* creating) : Automate(creating) {}
Parcours::~Parcours() = default;

void Parcours::plan(std::vector<std::string> sortColumns, std::string breakColumn) {
  sort_ = std::move(sortColumns);
  break_ = std::move(breakColumn);
}

void Parcours::critere(const std::string& column, char op, const Valeur& value) {
  criteria_.push_back({column, op, value});
}

Table& Parcours::courant() {
  if (!cursor_) cursor_ = std::make_unique<Table>(this, nomBase(), nomTable(), "PARCOURS");
  return *cursor_;
}

void Parcours::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "DEBUT"}) {
    if (termine()) break;
    raise(label, e);
  }
  if (!termine() && !nomTable().empty()) {
    Table& t = courant();
    t.effacerCriteres();
    for (const auto& c : criteria_) t.ajouterCritere(c.column, c.op, c.value);
    std::vector<RowId> order = selectionTriee(t, sort_);
    std::optional<Valeur> group;
    for (RowId id : order) {
      if (termine() || stop_) break;
      if (t.aller(id) != 0) continue;  // deleted since the selection was made
      Valeur breakValue = break_.empty() ? Valeur() : t.valeur(break_);
      if (!break_.empty() && (!group || Valeur::compare(*group, breakValue) != 0)) {
        if (group) raise("FIN1", e);
        group = breakValue;
        raise("DEBUT1", e);
      }
      raise("POUR_TOUT", e);
    }
    if (group && !termine()) raise("FIN1", e);
  }
  if (!termine()) raise("FIN", e);
  sortir();
  if (!sortieFaite_ && hasBranch("SORTIE")) {
    sortieFaite_ = true;
    raise("SORTIE", e);
  }
}

}  // namespace quarvo::host
