// Report printing: an automaton that names a report layout ("IMPETAT1"), prepares its data in
// "INIT"/"DEBUT", and lets the report engine print the pages. The engine walks the layout's
// parts and raises the layout's "LST_..." labels on the automaton as it goes (see
// host/report/Etat.h), so handlers compute the texts of the bands about to print.
//
// Driven: "INIT", "DEBUT", the printing, then "FIN", each when bound; the automaton then ends.
// The pages go to a PDF file: the destination the session was given for this report
// (`Destination`), else `<database folder>/VOVOVA/<user>.$so/<report>.pdf`. An unknown layout
// or a file that cannot be written fails the outcome and tells the session's driver why.
#pragma once

#include <filesystem>
#include <string>

#include "host/automate/Traitmnt.h"

namespace quarvo::host {

class Edition_etat : public Traitmnt {
 public:
  explicit Edition_etat(Evt* creating);

  void nomEtat(std::string name) { report_ = std::move(name); }
  const std::string& nomEtat() const { return report_; }
  void executer(Evt* evt) override;
  int pagesImprimees() const { return pages_; }

  // Copies every row of memory table `from` into memory table `to` (emptied first).
  void dupliquer(const std::string& from, const std::string& to);

  // Where the session's prints of `report` go.
  static std::filesystem::path destination(Session& session, const std::string& report);
  // Sends the session's prints to `file` while it lives (the command line's --print).
  class Destination {
   public:
    Destination(Session& session, std::filesystem::path file);
    ~Destination();
    Destination(const Destination&) = delete;
    Destination& operator=(const Destination&) = delete;

   private:
    Session& session_;
  };

 private:
  std::string report_;
  int pages_ = 0;
};

}  // namespace quarvo::host
