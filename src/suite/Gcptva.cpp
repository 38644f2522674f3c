#include "suite/Gcptva.h"

#include <optional>

#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

namespace {

// How precisely a purchase-account row matches, or nullopt when it does not match at all.
std::optional<int> precision(Table& row, const std::string& criterion, const std::string& regime,
                             const std::string& vat, const Date& date) {
  int score = 0;
  const std::pair<const char*, const std::string*> keys[] = {
      {"CRITERE_IDENT", &criterion}, {"GCPREGM_IDENT", &regime}, {"GCPTVA_IDENT", &vat}};
  int weight = 8;
  for (const auto& [column, wanted] : keys) {
    std::string value = row.valeur(column).toChaine();
    if (!value.empty()) {
      if (value != *wanted) return std::nullopt;
      score += weight;
    }
    weight /= 2;
  }
  Date from = toDate(row.valeur("DATE_DEBUT"));
  Date to = toDate(row.valeur("DATE_FIN"));
  if (!from.empty() || !to.empty()) {
    if (date.empty()) return std::nullopt;
    if (!from.empty() && date < from) return std::nullopt;
    if (!to.empty() && to < date) return std::nullopt;
    score += 1;
  }
  return score;
}

}  // namespace

Gcptva::Gcptva(Evt* evt) : TableInterface(evt) {
  addBranch("INIT_TRANSFERT_ASCII", [this](Evt* e) { erreurMethode(0, e); });
  addBranch("COMPTE_ACHAT", [this](Evt* e) { compteAchat(e); });
}

void Gcptva::compteAchat(Evt* evt) {
  Field& account = chaine("P_COMPTE");
  evt->param(4, account, 1);
  account.set("");
  std::string criterion = evt->valeur(0).toChaine();
  std::string regime = evt->valeur(1).toChaine();
  std::string vat = evt->valeur(2).toChaine();
  Date date = toDate(evt->valeur(3));

  Table accounts(this, "GESCOM", "GCPCPTACH", "COMPTE_ACHAT");
  accounts.effacerCriteres();
  int best = -1;
  std::string found;
  // Rows come in "IDENT" order: on equal precision the first one stays.
  while (accounts.lire(1) == 0) {
    auto score = precision(accounts, criterion, regime, vat, date);
    if (score && *score > best) {
      best = *score;
      found = accounts.valeur("COMPTE").toChaine();
    }
  }
  account.set(found);
  erreurMethode(found.empty() ? 1 : 0, evt);
}

}  // namespace quarvo::suite
