#include "host/table/Database.h"

#include "host/UException.h"

namespace quarvo::host {

void Transaction::commit() {
  if (done_) throw UException("transaction committed twice");
  db_.commit();
  done_ = true;
}

TransactionsGroupees::TransactionsGroupees(Database& db, int unites,
                                           std::chrono::milliseconds delai)
    : db_(db), unites_(unites), delai_(delai), debut_(Clock::now()) {
  groupe_.emplace(db_);
}

bool TransactionsGroupees::uniteTerminee() {
  if (!groupe_) throw UException("unit ended after its group was closed");
  if (++ouvertes_ < unites_ && Clock::now() - debut_ < delai_) return false;
  terminer();
  ouvertes_ = 0;
  debut_ = Clock::now();
  groupe_.emplace(db_);
  return true;
}

void TransactionsGroupees::terminer() {
  if (!groupe_) return;
  groupe_->commit();
  groupe_.reset();
}

}  // namespace quarvo::host
