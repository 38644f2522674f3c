#include "host/table/SqliteMemoire.h"

namespace quarvo::host {

std::string MemoireTable::cleSelection(const std::vector<Criterion>& criteria) {
  std::string cle;
  for (const auto& c : criteria) {
    cle += c.column;
    cle += '\x1f';
    cle += c.op;
    cle += static_cast<char>('0' + static_cast<int>(c.value.kind()));
    cle += c.value.toChaine();
    cle += '\x1e';
  }
  return cle;
}

const std::vector<RowId>* MemoireTable::selection(const std::string& cle) const {
  auto it = selections_.find(cle);
  return it == selections_.end() ? nullptr : &it->second;
}

bool MemoireTable::pleine() const {
  return selections_.size() >= kRetenuesMax || lignes_.size() >= kRetenuesMax;
}

void MemoireTable::retenir(const TableSchema& schema, const std::vector<Criterion>& criteria,
                           const std::string& cle, const std::vector<RowId>& ids) {
  colonnesCritere_.resize(schema.columns().size(), false);
  for (const auto& c : criteria) {
    if (auto i = schema.index(c.column)) colonnesCritere_[*i] = true;
  }
  selections_.emplace(cle, ids);
  for (RowId id : ids) lignes_.try_emplace(id);
}

Row& MemoireTable::aChanger(std::shared_ptr<Row>& entree) {
  if (entree.use_count() > 1) entree = std::make_shared<Row>(*entree);
  return *entree;
}

std::shared_ptr<Row>* MemoireTable::ligne(RowId id) {
  auto it = lignes_.find(id);
  return it == lignes_.end() ? nullptr : &it->second;
}

bool MemoireTable::changeUnCritere(const TableSchema& schema, const Row& avant, const Row& apres,
                                   const std::vector<size_t>& ecrites) const {
  const auto& cols = schema.columns();
  for (size_t i : ecrites) {
    if (i >= colonnesCritere_.size() || !colonnesCritere_[i]) continue;
    if (i >= avant.values.size() || i >= apres.values.size()) return true;
    auto fitted = fitColumn(cols[i], apres.values[i]);
    if (!fitted || !(*fitted == avant.values[i])) return true;
  }
  return false;
}

void MemoireTable::vider() {
  selections_.clear();
  lignes_.clear();
}

void MemoireTable::tenir(RowId id, std::shared_ptr<Row>& entree, const std::vector<size_t>& ecrites,
                         std::vector<Valeur> valeurs) {
  Row& memoire = aChanger(entree);
  std::vector<bool>& colonnes = enAttente_[id];
  colonnes.resize(memoire.values.size(), false);
  for (size_t k = 0; k < ecrites.size(); ++k) {
    memoire.values[ecrites[k]] = std::move(valeurs[k]);
    memoire.remplie(ecrites[k]);
    colonnes[ecrites[k]] = true;
  }
}

MemoireTable::EnAttente MemoireTable::prendreEnAttente() {
  EnAttente lignes = std::move(enAttente_);
  enAttente_.clear();
  return lignes;
}

}  // namespace quarvo::host
