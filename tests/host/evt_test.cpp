#include "host/event/Evt.h"

#include <gtest/gtest.h>

namespace quarvo::host {
namespace {

Field field(const char* name, Kind kind, Valeur initial) {
  return Field(name, "", "", 0, kind, std::move(initial), nullptr);
}

TEST(EvtTest, ValueParametersConvertAndStopAtTheCount) {
  Field n = field("N", Kind::Entier, Valeur::entier(7));
  Field s = field("S", Kind::Chaine, Valeur::chaine("init"));
  Field d = field("D", Kind::Date, Valeur::date(Date()));
  EvtParamVal evt{val("1"), val("abc")};
  EXPECT_EQ(evt.nbParams(), 2);
  evt.param(0, n, 0);
  evt.param(1, s, 0);
  evt.param(2, d, 0);  // past the count: unchanged
  EXPECT_EQ(n.entier(), 1);
  EXPECT_EQ(s.text(), "abc");
  EXPECT_TRUE(d.date().empty());
  EXPECT_TRUE(evt.refus().empty());

  Field m = field("M", Kind::Entier, Valeur::entier(5));
  evt.param(1, m, 0);  // "abc" is no integer: the field keeps its value and the refusal is noted
  EXPECT_EQ(m.entier(), 5);
  ASSERT_EQ(evt.refus().size(), 1u);
  EXPECT_EQ(evt.refus()[0], 1);
}

TEST(EvtTest, ReferenceParametersWriteBackConvertedToTheCallersKind) {
  Field callerCount = field("CALLER_N", Kind::Entier, Valeur::entier(3));
  Field callerText = field("CALLER_S", Kind::Chaine, Valeur::chaine("x"));
  EvtParamRef evt{ref(callerCount), ref(callerText), val("fixed")};
  Field calleeText = field("T", Kind::Chaine, Valeur::chaine(""));
  Field calleeCount = field("N", Kind::Entier, Valeur::entier(0));
  Field calleeValue = field("V", Kind::Chaine, Valeur::chaine(""));
  evt.param(0, calleeText, 1);
  evt.param(1, calleeCount, 0);  // value binding of a caller's field: a copy only
  evt.param(2, calleeValue, 1);  // reference binding of a plain value: nothing to write back
  EXPECT_EQ(calleeText.text(), "3");
  calleeText.set("42");
  EXPECT_EQ(callerCount.entier(), 42);
  calleeText.set("not a number");  // does not convert: the caller keeps its value
  EXPECT_EQ(callerCount.entier(), 42);
  calleeCount.set(int64_t{9});
  EXPECT_EQ(callerText.text(), "x");
  EXPECT_EQ(calleeValue.text(), "fixed");
}

TEST(EvtTest, ByValueCopyNoLongerReachesTheCaller) {
  Field caller = field("C", Kind::Chaine, Valeur::chaine("before"));
  EvtParamRef evt{ref(caller)};
  Evt copy = evt.byValue();
  caller.set("after");
  Field callee = field("X", Kind::Chaine, Valeur::chaine(""));
  copy.param(0, callee, 1);
  EXPECT_EQ(callee.text(), "before");
  callee.set("changed");
  EXPECT_EQ(caller.text(), "after");
}

}  // namespace
}  // namespace quarvo::host
