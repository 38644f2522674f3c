// A screen's description: what a window shows, as data (db/screens/<SCREEN>.json).
//
// Fields (label, kind, tab, editability, the values a choice or a box may take, the labels a
// typed value raises), buttons, tabs, groups and lists with their columns, and the title. The
// runtime builds every window's screen state from its description; a handler that names a
// control the description does not declare is a runtime fault, never a silent new control.
// Descriptions are read once per file and shared read-only by every session of the process.
#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

namespace quarvo::host {

enum class GenreChamp { Texte, Entier, Nombre, Montant, Date, Case, Choix };

struct ValeurPermise {
  std::string valeur;
  std::string libelle;
};

struct DescChamp {
  std::string nom;
  std::string libelle;
  GenreChamp genre = GenreChamp::Texte;
  std::string onglet;  // empty: on no tab (always shown)
  std::string groupe;
  bool editable = true;
  bool visible = true;  // shown when the window opens
  bool actif = true;    // enabled when the window opens
  // A box: the unticked value, then the ticked one ("0", "1" unless given). A choice: every
  // value it may take.
  std::vector<ValeurPermise> valeurs;
  // The labels raised, in order, when a person changes the value; by default the field's name.
  std::vector<std::string> evenements;
};

struct DescBouton {
  std::string nom;  // also the label it raises
  std::string libelle;
  std::string onglet;
  bool visible = true;
  bool actif = true;
};

struct DescOnglet {
  std::string nom;  // its request label; "<nom>_ENTREE" is raised once it is entered
  std::string libelle;
};

struct DescColonne {
  std::string nom;  // also the label raised when a person changes a cell of the column
  std::string entete;
  std::string colonne;  // the table column a document's list shows in it; empty: none
  bool editable = false;
  GenreChamp genre = GenreChamp::Texte;
};

struct DescListe {
  std::string nom;
  std::string onglet;
  std::vector<DescColonne> colonnes;
};

struct DescGroupe {
  std::string nom;
  std::string libelle;
};

struct DescriptionEcran {
  std::string ecran;
  // The screen it extends ("extends"): that screen's controls come first, and a control
  // described again here replaces the base's in place.
  std::string base;
  std::string titre;
  std::string controleOnglets;  // the tab control's name ("GROUPE", "ONGLET"); empty without tabs
  std::vector<DescChamp> champs;
  std::vector<DescBouton> boutons;
  std::vector<DescOnglet> onglets;
  std::vector<DescListe> listes;
  std::vector<DescGroupe> groupes;

  const DescChamp* champ(const std::string& nom) const;
  const DescBouton* bouton(const std::string& nom) const;
  const DescOnglet* onglet(const std::string& nom) const;
  const DescListe* liste(const std::string& nom) const;
  // Any control of that name: field, button, tab, tab control, list, list column or group.
  bool declare(const std::string& nom) const;

  // The description of `screen` under `dir` (dir/screens/<screen>.json), read once and kept.
  // Throws UException when the file is missing or malformed, naming the file and the fault.
  static std::shared_ptr<const DescriptionEcran> de(const std::filesystem::path& dir,
                                                    const std::string& screen);
  // Parses one description (the text of a file), without its base. Throws UException naming
  // `source`.
  static DescriptionEcran lire(const std::string& text, const std::string& source);
  // This description over `base`'s controls. Throws UException when a name is then declared
  // twice in one screen.
  DescriptionEcran etendre(const DescriptionEcran& base) const;
  // Throws UException naming `source` when one name is given to two controls, or a field is on
  // a tab the screen does not have.
  void verifier(const std::string& source) const;
};

const char* nomGenre(GenreChamp genre);

}  // namespace quarvo::host
