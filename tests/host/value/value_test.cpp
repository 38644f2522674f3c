#include <gtest/gtest.h>

#include <cmath>
#include <stdexcept>

#include "host/value/Date.h"
#include "host/value/Monnaie.h"
#include "host/value/Valeur.h"

namespace quarvo::host {
namespace {

Monnaie M(const char* text) {
  return *Monnaie::parse(text);
}

TEST(MonnaieTest, ParsesDecimalTextAndRefusesGarbage) {
  EXPECT_EQ(M("12.5").micros(), 12'500'000);
  EXPECT_EQ(M(" -3,25 ").micros(), -3'250'000);
  EXPECT_EQ(M("+42").micros(), 42'000'000);
  EXPECT_EQ(M(".5").micros(), 500'000);
  EXPECT_EQ(M("1.2345675").micros(), 1'234'568);  // 7th decimal rounds half away from zero
  EXPECT_EQ(M("-1.2345675").micros(), -1'234'568);
  EXPECT_EQ(M("1.23456749999").micros(), 1'234'567);
  EXPECT_EQ(M("9223372036854.775807").micros(), INT64_MAX);
  for (const char* bad :
       {"", "   ", "12a", "1.2.3", "--1", ".", "+", "1 2", "1e3", "9223372036855"})
    EXPECT_FALSE(Monnaie::parse(bad).has_value()) << bad;
}

TEST(MonnaieTest, CanonicalText) {
  EXPECT_EQ(M("12.5").text(), "12.50");
  EXPECT_EQ(Monnaie(-3).text(), "-3.00");
  EXPECT_EQ(M("0.125").text(), "0.125");
  EXPECT_EQ(M("1234567.891234").text(), "1234567.891234");
  EXPECT_EQ(M("-0.05").text(), "-0.05");
  EXPECT_EQ(Monnaie().text(), "0.00");
  EXPECT_EQ(M("-0.0000001").text(), "0.00");  // rounds to zero: no "-0.00"
  EXPECT_EQ((Monnaie(1) - Monnaie(1)).text(), "0.00");
  EXPECT_EQ(Monnaie::fromDouble(0.1).micros(), 100'000);
  EXPECT_EQ(Monnaie::fromDouble(-2.0000005).micros(), -2'000'001);
  EXPECT_EQ(Monnaie::fromDouble(1e-7).micros(), 0);
  EXPECT_EQ(M("0.1").toDouble(), 0.1);
  EXPECT_EQ(M("-1234567.891234").toDouble(), -1234567.891234);
  EXPECT_THROW(Monnaie::fromDouble(NAN), std::domain_error);
  EXPECT_THROW(Monnaie::fromDouble(1e13), std::overflow_error);
}

TEST(MonnaieTest, ArithmeticIsExactAndRoundsHalfAwayFromZero) {
  EXPECT_EQ(M("0.1") + M("0.2"), M("0.3"));
  EXPECT_EQ(Monnaie::fromDouble(0.1) + Monnaie::fromDouble(0.2), Monnaie::fromDouble(0.3));
  EXPECT_EQ((Monnaie(10) / Monnaie(3)).text(), "3.333333");
  EXPECT_EQ((Monnaie(20) / 3).text(), "6.666667");
  EXPECT_EQ((Monnaie(-20) / 3).text(), "-6.666667");
  EXPECT_EQ(M("0.000001") * M("0.5"), M("0.000001"));
  EXPECT_EQ(M("-0.000001") * M("0.5"), M("-0.000001"));
  // The intermediate product needs more than 64 bits.
  EXPECT_EQ((M("1000000000.50") * M("1000")).text(), "1000000000500.00");
  EXPECT_EQ((M("123456789.123456") * M("1000.5")).text(), "123518517518.017728");
  EXPECT_EQ((M("4000000000000") / M("0.5")).text(), "8000000000000.00");
  EXPECT_EQ(M("19.99") * 3, M("59.97"));
  EXPECT_EQ(2 * M("19.99"), M("39.98"));
  EXPECT_EQ(M("100") * 1.196, M("119.6"));
  Monnaie total = M("10");
  total += M("2.5");
  total -= M("0.5");
  total *= 2;
  total /= M("4");
  EXPECT_EQ(total, M("6"));
  EXPECT_EQ(-total, M("-6"));
  EXPECT_EQ(M("-7.25").abs(), M("7.25"));
  EXPECT_LT(M("-1"), M("0.000001"));
  EXPECT_TRUE(M("0,000").isZero());
  EXPECT_THROW(Monnaie(1) / Monnaie(), std::domain_error);
  EXPECT_THROW(Monnaie(1) / 0, std::domain_error);
  EXPECT_THROW(Monnaie(9'000'000'000'000) + Monnaie(9'000'000'000'000), std::overflow_error);
  EXPECT_THROW(Monnaie(9'000'000'000'000) * 2, std::overflow_error);
}

TEST(MonnaieTest, ValeurArrondie) {
  EXPECT_EQ(valeurArrondie(M("2.345"), 2, '='), M("2.35"));
  EXPECT_EQ(valeurArrondie(M("-2.345"), 2, '='), M("-2.35"));
  EXPECT_EQ(valeurArrondie(M("2.3449"), 2, '='), M("2.34"));
  EXPECT_EQ(valeurArrondie(M("2.341"), 2, '+'), M("2.35"));
  EXPECT_EQ(valeurArrondie(M("-2.349"), 2, '+'), M("-2.34"));
  EXPECT_EQ(valeurArrondie(M("2.349"), 2, '-'), M("2.34"));
  EXPECT_EQ(valeurArrondie(M("-2.341"), 2, '-'), M("-2.35"));
  EXPECT_EQ(valeurArrondie(M("2.34"), 2, '+'), M("2.34"));
  EXPECT_EQ(valeurArrondie(M("-0.5"), 0, '='), M("-1"));
  EXPECT_EQ(valeurArrondie(M("0.0000005"), 6, '='), M("0.000001"));
  EXPECT_THROW(valeurArrondie(M("1"), 7, '='), std::invalid_argument);
  EXPECT_THROW(valeurArrondie(M("1"), 2, 'x'), std::invalid_argument);

  // 2.675 is 2.67499999... in binary; the rounding works on its decimal text.
  EXPECT_EQ(valeurArrondie(2.675, 2, '='), 2.68);
  EXPECT_EQ(valeurArrondie(-2.675, 2, '='), -2.68);
  EXPECT_EQ(valeurArrondie(1.005, 2, '='), 1.01);
  EXPECT_EQ(valeurArrondie(9.995, 2, '='), 10.0);
  EXPECT_EQ(valeurArrondie(2.671, 2, '+'), 2.68);
  EXPECT_EQ(valeurArrondie(-2.671, 2, '+'), -2.67);
  EXPECT_EQ(valeurArrondie(-2.671, 2, '-'), -2.68);
  EXPECT_EQ(valeurArrondie(2.5, 0, '='), 3.0);
  EXPECT_EQ(valeurArrondie(2.0000001, 2, '+'), 2.01);  // no detour through 6 decimals
  double zero = valeurArrondie(-0.001, 2, '=');
  EXPECT_EQ(zero, 0.0);
  EXPECT_FALSE(std::signbit(zero));
}

TEST(DateTest, CalendarRules) {
  EXPECT_TRUE(Date::isLeapYear(2024));
  EXPECT_FALSE(Date::isLeapYear(1900));
  EXPECT_TRUE(Date::isLeapYear(2000));
  EXPECT_FALSE(Date::isLeapYear(2025));
  EXPECT_EQ(Date::of(2024, 2, 10).lastOfMonth(), Date::of(2024, 2, 29));
  EXPECT_EQ(Date::of(2025, 2, 10).lastOfMonth(), Date::of(2025, 2, 28));
  EXPECT_EQ(Date::of(1900, 2, 1).lastOfMonth(), Date::of(1900, 2, 28));
  EXPECT_EQ(Date::of(2026, 4, 15).lastOfMonth(), Date::of(2026, 4, 30));
  EXPECT_EQ(Date::of(2026, 12, 15).firstOfMonth(), Date::of(2026, 12, 1));
  EXPECT_EQ(Date::of(2024, 1, 31).addMonths(1), Date::of(2024, 2, 29));
  EXPECT_EQ(Date::of(2025, 1, 31).addMonths(1), Date::of(2025, 2, 28));
  EXPECT_EQ(Date::of(2024, 3, 31).addMonths(-1), Date::of(2024, 2, 29));
  EXPECT_EQ(Date::of(2024, 11, 30).addMonths(3), Date::of(2025, 2, 28));
  EXPECT_EQ(Date::of(2026, 1, 15).addMonths(-13), Date::of(2024, 12, 15));
  EXPECT_EQ(Date::of(2024, 2, 28).addDays(1), Date::of(2024, 2, 29));
  EXPECT_EQ(Date::of(2025, 12, 31).addDays(1), Date::of(2026, 1, 1));
  EXPECT_EQ(Date::of(2024, 1, 1).daysUntil(Date::of(2025, 1, 1)), 366);
  EXPECT_EQ(Date::of(2025, 1, 1).daysUntil(Date::of(2024, 12, 25)), -7);
  EXPECT_TRUE(Date().addDays(3).empty());
  EXPECT_TRUE(Date::of(2025, 2, 29).empty());
  EXPECT_TRUE(Date::of(2026, 257, 1).empty());  // must not wrap to January
  EXPECT_LT(Date(), Date::of(1, 1, 1));
  EXPECT_LT(Date::of(2025, 12, 31), Date::of(2026, 1, 1));
  EXPECT_FALSE(Date::today().empty());
}

TEST(DateTest, ParseAndPrint) {
  Date d = *Date::parse("05/03/2026");
  EXPECT_EQ(d.year(), 2026);
  EXPECT_EQ(d.month(), 3u);
  EXPECT_EQ(d.day(), 5u);
  EXPECT_EQ(d.text(), "05/03/2026");
  EXPECT_EQ(d.iso(), "2026-03-05");
  EXPECT_EQ(Date::parse(d.text()), d);
  EXPECT_EQ(Date::parse(d.iso()), d);
  EXPECT_EQ(Date::parse(" 5/3/2026 "), d);
  EXPECT_EQ(Date::parse("29/02/2024"), Date::of(2024, 2, 29));
  ASSERT_TRUE(Date::parse("   ").has_value());
  EXPECT_TRUE(Date::parse("")->empty());
  EXPECT_EQ(Date().text(), "");
  EXPECT_EQ(Date().iso(), "");
  for (const char* bad : {"31/02/2026", "29/02/2025", "12/13/2026", "ab/cd/efgh", "05/03/26",
                          "05-03-2026", "2026-03-05-1", "2026/03/05", "0/3/2026", "5//2026"})
    EXPECT_FALSE(Date::parse(bad).has_value()) << bad;
}

TEST(ValeurTest, Conversions) {
  auto to = [](const Valeur& v, Kind k) { return v.convertTo(k); };
  EXPECT_EQ(to(Valeur::chaine("1"), Kind::Entier)->asEntier(), 1);
  EXPECT_EQ(to(Valeur::chaine(" -42 "), Kind::Entier)->asEntier(), -42);
  EXPECT_FALSE(to(Valeur::chaine("abc"), Kind::Entier));
  EXPECT_FALSE(to(Valeur::chaine("1.5"), Kind::Entier));
  EXPECT_FALSE(to(Valeur::chaine("99999999999999999999"), Kind::Entier));
  EXPECT_FALSE(to(Valeur::chaine("12abc"), Kind::Double));
  EXPECT_EQ(to(Valeur::chaine("12,5"), Kind::Double)->asDouble(), 12.5);
  EXPECT_EQ(to(Valeur::chaine("12,5"), Kind::Monnaie)->asMonnaie().text(), "12.50");
  EXPECT_EQ(Valeur::entier(-3).toChaine(), "-3");
  EXPECT_EQ(Valeur::dbl(1.5).toChaine(), "1.5");
  EXPECT_EQ(Valeur::dbl(2).toChaine(), "2");
  EXPECT_EQ(Valeur::dbl(0.1).toChaine(), "0.1");
  EXPECT_EQ(Valeur::dbl(-0.0).toChaine(), "0");
  EXPECT_EQ(Valeur::simple(0.1f).toChaine(), "0.1");
  Valeur huge = Valeur::dbl(1.5e300);
  EXPECT_EQ(to(Valeur::chaine(huge.toChaine()), Kind::Double)->asDouble(), 1.5e300);
  EXPECT_EQ(to(Valeur::dbl(2.5), Kind::Entier)->asEntier(), 3);
  EXPECT_EQ(to(Valeur::dbl(-2.5), Kind::Entier)->asEntier(), -3);
  EXPECT_EQ(to(Valeur::monnaie(M("-2.5")), Kind::Entier)->asEntier(), -3);
  EXPECT_EQ(to(Valeur::monnaie(M("2.4999")), Kind::Entier)->asEntier(), 2);
  EXPECT_FALSE(to(Valeur::dbl(1e30), Kind::Entier));
  EXPECT_EQ(to(Valeur::dbl(0.1), Kind::Monnaie)->asMonnaie(), M("0.1"));
  EXPECT_EQ(to(Valeur::simple(0.1f), Kind::Monnaie)->asMonnaie(), M("0.1"));
  EXPECT_EQ(to(Valeur::entier(7), Kind::Monnaie)->asMonnaie(), Monnaie(7));
  EXPECT_EQ(to(Valeur::monnaie(M("0.3")), Kind::Double)->asDouble(), 0.3);

  Date d = Date::of(2026, 3, 5);
  EXPECT_EQ(to(Valeur::chaine("05/03/2026"), Kind::Date)->asDate(), d);
  EXPECT_TRUE(to(Valeur::chaine(""), Kind::Date)->asDate().empty());
  EXPECT_FALSE(to(Valeur::chaine("31/02/2026"), Kind::Date));
  EXPECT_EQ(to(Valeur::date(d), Kind::Chaine)->asChaine(), "05/03/2026");
  EXPECT_FALSE(to(Valeur::date(d), Kind::Entier));
  EXPECT_FALSE(to(Valeur::date(d), Kind::Monnaie));
  EXPECT_FALSE(to(Valeur::entier(20260305), Kind::Date));

  // A blank value converts to every kind, as the start value of a fresh field.
  for (Kind k :
       {Kind::Chaine, Kind::Entier, Kind::Double, Kind::Simple, Kind::Date, Kind::Monnaie}) {
    auto v = Valeur().convertTo(k);
    ASSERT_TRUE(v) << kindName(k);
    EXPECT_EQ(v->kind(), k);
    EXPECT_TRUE(v->isEmptyOrZero()) << kindName(k);
    EXPECT_EQ(*v, Valeur::initial(k));
  }
  EXPECT_FALSE(Valeur::chaine(" ").isEmptyOrZero());
  EXPECT_STREQ(kindName(Kind::Simple), "Simple");
}

TEST(ValeurTest, CompareAcrossKinds) {
  auto cmp = [](const Valeur& a, const Valeur& b) { return Valeur::compare(a, b); };
  EXPECT_LT(cmp(Valeur::entier(2), Valeur::dbl(2.5)), 0);
  EXPECT_GT(cmp(Valeur::dbl(2.5), Valeur::entier(2)), 0);
  EXPECT_LT(cmp(Valeur::entier(-3), Valeur::dbl(-2.5)), 0);
  EXPECT_EQ(cmp(Valeur::entier(3), Valeur::monnaie(M("3.00"))), 0);
  EXPECT_LT(cmp(Valeur::entier(3), Valeur::monnaie(M("3.000001"))), 0);
  EXPECT_EQ(cmp(Valeur::dbl(0.1), Valeur::monnaie(M("0.1"))), 0);
  EXPECT_GT(cmp(Valeur::monnaie(M("0.1")), Valeur::dbl(0.0999)), 0);
  // 2^53 + 1 is not a double: still ordered exactly.
  EXPECT_GT(cmp(Valeur::entier(9007199254740993), Valeur::dbl(9007199254740992.0)), 0);
  EXPECT_LT(cmp(Valeur::dbl(NAN), Valeur::entier(-1000)), 0);

  Date d = Date::of(2026, 3, 5);
  EXPECT_LT(cmp(Valeur::date(Date()), Valeur::date(d)), 0);
  EXPECT_EQ(cmp(Valeur::date(d), Valeur::chaine("2026-03-05")), 0);
  EXPECT_GT(cmp(Valeur::chaine("06/03/2026"), Valeur::date(d)), 0);
  EXPECT_GT(cmp(Valeur::chaine("10/01/2026"), Valeur::chaine("09/12/2026")), 0);  // plain text
  EXPECT_LT(cmp(Valeur::date(d), Valeur::chaine("zzz")), 0);
  EXPECT_LT(cmp(Valeur::chaine("10"), Valeur::chaine("9")), 0);
  EXPECT_LT(cmp(Valeur::chaine("Z"), Valeur::chaine("\xC3\xA9")), 0);  // bytewise, not signed

  EXPECT_EQ(Valeur::entier(3), Valeur::monnaie(Monnaie(3)));
  EXPECT_EQ(Valeur::date(d), Valeur::date(Date::of(2026, 3, 5)));
  EXPECT_NE(Valeur::chaine("12"), Valeur::entier(12));
  EXPECT_NE(Valeur::chaine("05/03/2026"), Valeur::date(d));
}

}  // namespace
}  // namespace quarvo::host
