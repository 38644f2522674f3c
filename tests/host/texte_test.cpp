// Texts as the runtime counts them, and the exchange format's tab-separated text: what one rule
// writes, the same rule reads back, and what a spreadsheet writes is read as it meant.
#include "host/Texte.h"

#include <gtest/gtest.h>

#include <sstream>

#include "host/TexteTabule.h"

namespace quarvo::host {
namespace {

TEST(TexteTest, CharactersAreCountedAsCharactersNotBytes) {
  EXPECT_EQ(nombreCaracteres("Été à Noël"), 10u);
  EXPECT_EQ(caracteres("122026", 3, 6), "2026");
  EXPECT_EQ(caracteres("Éléphant", 1, 2), "Él");
  EXPECT_EQ(caracteres("abc", 2, 9), "bc");
  EXPECT_EQ(derniersCaracteres("CF-Été-0042", 4), "0042");
  EXPECT_EQ(derniersCaracteres("Été", 9), "Été");
  EXPECT_EQ(apercu("Désignation très longue", 5), "Désig…");
  EXPECT_EQ(sansBlancs(" \t x y \t"), "x y");
  // Columns aligned by characters: the accented cell does not shift the next column.
  EXPECT_EQ(tableauAligne({{"A", "B"}, {"Été", "x"}, {"Ab", ""}}),
            "A    B\n"
            "Été  x\n"
            "Ab\n");
}

TEST(TexteTabuleTest, WhatIsWrittenIsReadBackWhateverTheValueHolds) {
  const std::vector<std::string> cells{
      "simple", "", "avec\ttabulation", "deux\nlignes", "dit \"oui\"", " entouré ", "Été"};
  std::string record = enregistrementTsv(cells);
  EXPECT_EQ(record,
            "simple\t\t\"avec\ttabulation\"\t\"deux\nlignes\"\t\"dit \"\"oui\"\"\"\t\" entouré \"\t"
            "Été");
  EXPECT_EQ(cellulesTsv(record), cells);

  // Records run over the lines a quoted cell spans; the "\r" of Windows line ends is dropped.
  std::istringstream in(record + "\r\nsuivante\tligne\r\n\"jamais\tfermée\n");
  std::string read;
  size_t lines = 0;
  ASSERT_TRUE(lireEnregistrementTsv(in, read, lines));
  EXPECT_EQ(lines, 2u);
  EXPECT_EQ(cellulesTsv(read), cells);
  ASSERT_TRUE(lireEnregistrementTsv(in, read, lines));
  EXPECT_EQ(cellulesTsv(read), (std::vector<std::string>{"suivante", "ligne"}));
  // A quote never closed takes the rest of the file, not more.
  ASSERT_TRUE(lireEnregistrementTsv(in, read, lines));
  EXPECT_EQ(cellulesTsv(read), (std::vector<std::string>{"jamais\tfermée"}));
  EXPECT_FALSE(lireEnregistrementTsv(in, read, lines));
}

TEST(TexteTabuleTest, SpreadsheetTextIsReadAsItWasMeant) {
  // Blanks around cells are not part of them; quotes inside an unquoted cell are plain text.
  EXPECT_EQ(cellulesTsv("  A1 \t\"B \"\"2\"\"\" \tTube 3/4\"\t"),
            (std::vector<std::string>{"A1", "B \"2\"", "Tube 3/4\"", ""}));
  std::vector<std::string> cells;
  EXPECT_FALSE(decouperTsv("x\t\"ouverte\tsur", cells));
  // Another separator quotes its own character, and tabs are then plain text.
  EXPECT_EQ(celluleTsv("a;b", ';'), "\"a;b\"");
  EXPECT_EQ(cellulesTsv("\"a;b\";c\td", ';'), (std::vector<std::string>{"a;b", "c\td"}));
}

}  // namespace
}  // namespace quarvo::host
