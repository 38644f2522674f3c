#include "app/GenerateCommand.h"

#include <fmt/core.h>

#include <ostream>

#include "app/Workspace.h"
#include "host/table/Database.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

namespace {

// Identifier ranges of the generated rows, one per kind, far above the counters.
constexpr int64_t kServices = 900'000'000;
constexpr int64_t kCriteria = 910'000'000;
constexpr int64_t kArticles = 920'000'000;
constexpr int64_t kGrouping = 930'000'000;
constexpr int64_t kAccounts = 940'000'000;
constexpr int64_t kProjects = 950'000'000;
constexpr int64_t kBudgets = 960'000'000;
constexpr int64_t kBudgetLines = 970'000'000;
constexpr int64_t kPieces = 980'000'000;
constexpr int64_t kPieceLines = 990'000'000;

std::string id(int64_t base, int64_t n) {
  return fmt::format("{:010d}", base + n);
}

// Inserts one row given as column/value pairs.
class Writer {
 public:
  explicit Writer(const char* table) : cursor_(nullptr, "VOVOVA", table, "GENERATION") {}
  Writer& operator()(const char* column, Valeur v) {
    cursor_.ecrire(column, v);
    return *this;
  }
  void start() { cursor_.preparer(); }
  void insert() {
    if (cursor_.inserer() != 0)
      throw UsageError("generated row refused by " + cursor_.name() +
                       " (run gen on a fresh demo database)");
    ++rows_;
  }
  int64_t rows() const { return rows_; }

 private:
  Table cursor_;
  int64_t rows_ = 0;
};

Valeur t(std::string s) {
  return Valeur::chaine(std::move(s));
}

}  // namespace

int64_t generate(Session& s, const GenerateOptions& o) {
  if (o.projects < 1 || o.pieces < 0 || o.lines < 1 || o.services < 1) {
    throw UsageError("gen needs at least one project, one line per piece and one service");
  }
  Transaction tx(s.db());
  Writer services("AFPRES"), criteria("GCPCRIT1"), articles("GCPARTIC"), grouping("AFREGACH"),
      accounts("GCPCPTACH"), projects("AFAFFA"), budgets("AFEBUD"), budgetLines("AFLBUD"),
      orders("GAPECOM"), orderLines("GAPLCOM");
  for (int64_t i = 0; i < o.services; ++i) {
    std::string code = fmt::format("GEN-S{:03d}", i + 1);
    services.start();
    services("IDENT", t(id(kServices, i)))("CODE", t(code))(
        "DESIG", t("Prestation générée " + code))("NATURE", t("M"))("POSTE_ACHAT", t("ACH-MAT"))(
        "UNITE", t("U"));
    services.insert();
    criteria.start();
    criteria("IDENT", t(id(kCriteria, i)))("CODE", t(code))("DESIG", t("Famille " + code));
    criteria.insert();
    articles.start();
    articles("IDENT", t(id(kArticles, i)))("CODE", t("ART-" + code))("DESIG", t("Article " + code))(
        "UNITE", t("U"))("PUHT", t("10.00"))("GCPCRIT1_IDENT", t(id(kCriteria, i)))(
        "GCPTVA_IDENT", t("0000000093"));
    articles.insert();
    grouping.start();
    grouping("IDENT", t(id(kGrouping, i)))("CRITERE", Valeur::entier(1))(
        "CLE_IDENT", t(id(kCriteria, i)))("AFPRES_IDENT", t(id(kServices, i)));
    grouping.insert();
    accounts.start();
    accounts("IDENT", t(id(kAccounts, i)))("CRITERE_IDENT", t(id(kCriteria, i)))(
        "GCPREGM_IDENT", t("0000000091"))("COMPTE", t("60210000"));
    accounts.insert();
  }
  for (int64_t p = 0; p < o.projects; ++p) {
    std::string code = fmt::format("GEN{:06d}", p + 1);
    projects.start();
    projects("IDENT", t(id(kProjects, p)))("CODE", t(code))("DESIG", t("Affaire générée " + code));
    projects.insert();
    budgets.start();
    budgets("IDENT", t(id(kBudgets, p)))("AFAFFA_IDENT", t(id(kProjects, p)))(
        "AFAFFA_CODE", t(code))("PIECE", t("BU-" + code))("DESIG", t("Budget " + code))(
        "CODE_ETAT", t("E"))("DATE_DEBUT", t("2026-01-01"))("DATE_FIN", t("2026-12-31"));
    budgets.insert();
    for (int64_t i = 0; i < o.services; ++i) {
      budgetLines.start();
      budgetLines("IDENT", t(id(kBudgetLines, p * o.services + i)))(
          "NUMERO", t(id(kBudgets, p) + "|" + std::to_string(i + 1)))(
          "AFEBUD_IDENT", t(id(kBudgets, p)))("DESIG", t(fmt::format("Ligne {}", i + 1)))(
          "AFAFFA_IDENT", t(id(kProjects, p)))("AFAFFA_CODE", t(code))(
          "AFEBUD_PIECE", t("BU-" + code))("AFPRES_IDENT", t(id(kServices, i)))(
          "AFPRES_CODE", t(fmt::format("GEN-S{:03d}", i + 1)))("VBUD_D", t("100000.00"))(
          "DATE_DEBUT", t("2026-01-01"))("DATE_FIN", t("2026-12-31"));
      budgetLines.insert();
    }
  }
  for (int64_t n = 0; n < o.pieces; ++n) {
    int64_t project = n % o.projects;
    std::string code = fmt::format("GEN{:06d}", project + 1);
    Monnaie total = Monnaie(20) * o.lines;
    orders.start();
    orders("IDENT", t(id(kPieces, n)))("NUMERO_DOC", t(fmt::format("GC{:08d}", n + 1)))(
        "DESIG", t("Commande générée"))("TYPE", t("C"))("DATE_CREATION", t("2026-06-15"))(
        "DATE_MAJ", t("2026-06-15"))("HEURE_MAJ", t("10:00:00"))("VALIDEE", Valeur::entier(1))(
        "SECAN_CODE", t(code))("GCPFOUR_IDENT", t("0000000121"))("GCPREGM_IDENT", t("0000000091"))(
        "HT", Valeur::monnaie(total))("BRUT", Valeur::monnaie(total))("NET_A_PAYER",
                                                                      Valeur::monnaie(total));
    orders.insert();
    for (int64_t l = 0; l < o.lines; ++l) {
      int64_t service = (n + l) % o.services;
      orderLines.start();
      orderLines("IDENT", t(id(kPieceLines, n * o.lines + l)))(
          "NUMERO", t(id(kPieces, n) + "|" + std::to_string(l + 1)))("GCPARTIC_IDENT",
                                                                     t(id(kArticles, service)))(
          "GCPARTIC_CODE", t(fmt::format("ART-GEN-S{:03d}", service + 1)))("DESIG", t("Article"))(
          "GCPTVA_IDENT", t("0000000093"))("QTE", Valeur::dbl(2))("PUHT", t("10.00"))(
          "BRUT", t("20.00"))("HT", t("20.00"));
      orderLines.insert();
    }
  }
  tx.commit();
  return services.rows() + criteria.rows() + articles.rows() + grouping.rows() + accounts.rows() +
         projects.rows() + budgets.rows() + budgetLines.rows() + orders.rows() + orderLines.rows();
}

int runGenerate(Session& s, const GenerateOptions& o, std::ostream& out) {
  Session::Scope scope(s);
  int64_t rows = generate(s, o);
  out << "Generated " << o.projects << " projects (" << o.services << " budget lines each), "
      << o.pieces << " orders of " << o.lines << " lines: " << rows << " rows.\n";
  return 0;
}

}  // namespace quarvo::app
