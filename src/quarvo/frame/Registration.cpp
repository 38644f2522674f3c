// The module's registration records, in the order the runtime receives them: the crash-flag
// global first, then per source unit a Global record, its automata and a Source record. Units
// group the automata by subsystem; the interface unit registers its globals under "QUARVO",
// every other unit under "COMMUN". Automata join their unit as they are built.
#include "host/automate/Automate.h"
#include "host/automate/Registry.h"
#include "quarvo/analysis/QUARVOAnalyser.h"
#include "quarvo/analysis/QUARVOAnnuler.h"
#include "quarvo/analysis/QUARVOAnnuler1.h"
#include "quarvo/import/QUARVOImport_controler.h"
#include "quarvo/import/QUARVOImport_generer.h"
#include "quarvo/import/QUARVOImporter.h"
#include "quarvo/import/QUARVOImporter_auto.h"
#include "quarvo/import/QUARVOSolder.h"
#include "quarvo/imputation/QUARVOImputer.h"
#include "quarvo/imputation/QUARVOImputer1.h"
#include "quarvo/imputation/QUARVOImputer_auto.h"
#include "quarvo/imputation/QUARVOImputer_pieces.h"
#include "quarvo/imputation/QUARVOPointer_pieces.h"
#include "quarvo/links/QUARVOExiste_chainage_aval.h"
#include "quarvo/links/QUARVOGestion.h"
#include "quarvo/links/QUARVOInterface.h"
#include "quarvo/report/QUARVOExpetat1.h"
#include "quarvo/report/QUARVOImpetat1.h"
#include "quarvo/report/QUARVOSeletat1.h"

namespace quarvo {
namespace {

using host::fabriquer;
using host::Global;
using host::Module;
using host::Source;
using host::VariableGlobale;

const VariableGlobale crashFlag("$$|VCODECRASHFLAG", "", "", 2, "CRASHFLAG");

// Unit A: accounting analysis.
const Global globalA("COMMUN", "QUARVO");
const Module analyser("", "QUARVO-ANALYSER", &fabriquer<QUARVOAnalyser>, false, "");
const Source sourceA("QUARVO", nullptr);

// Unit B: cancellation.
const Global globalB("COMMUN", "QUARVO");
const Module annuler1("", "QUARVO-ANNULER1", &fabriquer<QUARVOAnnuler1>, false, "");
const Module annuler("", "QUARVO-ANNULER", &fabriquer<QUARVOAnnuler>, false, "");
const Source sourceB("QUARVO", nullptr);

// Unit C: link document and downstream chaining lookup.
const Global globalC("COMMUN", "QUARVO");
const Module existeChainageAval("", "QUARVO-EXISTE_CHAINAGE_AVAL",
                                &fabriquer<QUARVOExiste_chainage_aval>, false, "");
const Module gestion("", "QUARVO-GESTION", &fabriquer<QUARVOGestion>, false, "");
const Source sourceC("QUARVO", nullptr);

// Unit D: follow-up report.
const Global globalD("COMMUN", "QUARVO");
const Module expetat1("", "QUARVO-EXPETAT1", &fabriquer<QUARVOExpetat1>, false, "");
const Module impetat1("", "QUARVO-IMPETAT1", &fabriquer<QUARVOImpetat1>, false, "");
const Module seletat1("", "QUARVO-SELETAT1", &fabriquer<QUARVOSeletat1>, false, "");
const Source sourceD("QUARVO", nullptr);

// Unit E: import and settling.
const Global globalE("COMMUN", "QUARVO");
const Module importer("", "QUARVO-IMPORTER", &fabriquer<QUARVOImporter>, false, "");
const Module importerAuto("", "QUARVO-IMPORTER_AUTO", &fabriquer<QUARVOImporter_auto>, false, "");
const Module importControlerBf("", "QUARVO-IMPORT_CONTROLER_BF",
                               &fabriquer<QUARVOImport_controler_bf>, false, "");
const Module importControlerCf("", "QUARVO-IMPORT_CONTROLER_CF",
                               &fabriquer<QUARVOImport_controler_cf>, false, "");
const Module importControlerDf("", "QUARVO-IMPORT_CONTROLER_DF",
                               &fabriquer<QUARVOImport_controler_df>, false, "");
const Module importControlerFf("", "QUARVO-IMPORT_CONTROLER_FF",
                               &fabriquer<QUARVOImport_controler_ff>, false, "");
const Module importGenererBf("", "QUARVO-IMPORT_GENERER_BF", &fabriquer<QUARVOImport_generer_bf>,
                             false, "");
const Module importGenererCf("", "QUARVO-IMPORT_GENERER_CF", &fabriquer<QUARVOImport_generer_cf>,
                             false, "");
const Module importGenererDf("", "QUARVO-IMPORT_GENERER_DF", &fabriquer<QUARVOImport_generer_df>,
                             false, "");
const Module importGenererFf("", "QUARVO-IMPORT_GENERER_FF", &fabriquer<QUARVOImport_generer_ff>,
                             false, "");
const Module solder("", "QUARVO-SOLDER", &fabriquer<QUARVOSolder>, false, "");
const Source sourceE("QUARVO", nullptr);

// Unit F: imputation and pointing.
const Global globalF("COMMUN", "QUARVO");
const Module imputer1("", "QUARVO-IMPUTER1", &fabriquer<QUARVOImputer1>, false, "");
const Module imputer("", "QUARVO-IMPUTER", &fabriquer<QUARVOImputer>, false, "");
const Module imputerAuto("", "QUARVO-IMPUTER_AUTO", &fabriquer<QUARVOImputer_auto>, false, "");
const Module imputerPieces("", "QUARVO-IMPUTER_PIECES", &fabriquer<QUARVOImputer_pieces>, false,
                           "");
const Module pointerPieces("", "QUARVO-POINTER_PIECES", &fabriquer<QUARVOPointer_pieces>, false,
                           "");
const Source sourceF("QUARVO", nullptr);

// Unit G: interface.
const Global globalG("QUARVO", "QUARVO");
const Module interface("", "QUARVO-INTERFACE", &fabriquer<QUARVOInterface>, false, "");
const Source sourceG("QUARVO", nullptr);

}  // namespace
}  // namespace quarvo
