#include "platform/automation/Dispatch.h"

#include <gtest/gtest.h>

#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace {

using automation::Args;
using vb::Variant;

// Describe(text, [suffix]); Increment(ByRef n); Caption read-write; Code read-only.
class Account : public automation::Dispatch<Account> {
 public:
  static const automation::MemberTable<Account>& Members() {
    static const auto table =
        automation::MemberTable<Account>()
            .Method("Describe", {1, 2},
                    [](Account&, Args& a) {
                      std::string text = vb::CStr(a[0]);
                      if (!a[1].IsMissing()) text += "/" + vb::CStr(a[1]);
                      return Variant(text);
                    })
            .Method("Increment", {1, 1},
                    [](Account&, Args& a) {
                      a[0] = Variant(vb::CLng(a[0]) + 1);
                      return Variant();
                    })
            .Method("IncrementThenFail", {1, 1},
                    [](Account&, Args& a) -> Variant {
                      a[0] = Variant(vb::CLng(a[0]) + 1);
                      throw vb::Error(vb::kErrTypeMismatch);
                    })
            .Property(
                "Caption", [](Account& self) { return Variant(self.caption); },
                [](Account& self, const Variant& v) { self.caption = vb::CStr(v); })
            .Property("Code", [](Account&) { return Variant("2111"); });
    return table;
  }
  std::string caption;
};

int32_t ErrorNumberOf(const std::function<void()>& action) {
  try {
    action();
  } catch (const vb::Error& e) {
    return e.Number();
  }
  return 0;
}

TEST(Dispatch, MembersAreFoundIgnoringLetterCase) {
  auto account = std::make_shared<Account>();
  vb::ObjectPtr object = account;
  EXPECT_EQ(object->Call("describe", {Variant("x")}), Variant("x"));
  EXPECT_EQ(object->Call("DESCRIBE", {Variant("x"), Variant("y")}), Variant("x/y"));
  object->Let("CAPTION", Variant("Caixa"));
  EXPECT_EQ(account->caption, "Caixa");
  EXPECT_EQ(object->Get("caption"), Variant("Caixa"));
  // A property read through a call, as Basic reads obj.Prop in an expression.
  Args none;
  EXPECT_EQ(object->Invoke("Code", none), Variant("2111"));
}

TEST(Dispatch, ByReferenceArgumentsComeBackAndOmittedOnesStayOmitted) {
  auto account = std::make_shared<Account>();
  Args args{Variant(41)};
  account->Invoke("Increment", args);
  ASSERT_EQ(args.size(), 1u);
  EXPECT_EQ(args[0], Variant(42));

  // The callee sees its optional parameter as Missing, the caller keeps its one argument.
  Args one{Variant("x")};
  EXPECT_EQ(account->Invoke("Describe", one), Variant("x"));
  EXPECT_EQ(one.size(), 1u);

  // What a failing method wrote before its error is what the caller finds, as in Basic.
  Args failing{Variant(1)};
  EXPECT_EQ(ErrorNumberOf([&] { account->Invoke("IncrementThenFail", failing); }),
            vb::kErrTypeMismatch);
  ASSERT_EQ(failing.size(), 1u);
  EXPECT_EQ(failing[0], Variant(2));
}

TEST(Dispatch, CallsThatDoNotFitRaiseBasicErrors) {
  auto account = std::make_shared<Account>();
  Args none;
  EXPECT_EQ(ErrorNumberOf([&] { account->Invoke("Withdraw", none); }), 438);
  EXPECT_EQ(ErrorNumberOf([&] { account->Get("Balance"); }), 438);
  EXPECT_EQ(ErrorNumberOf([&] { account->Let("Balance", Variant(1)); }), 438);
  EXPECT_EQ(ErrorNumberOf([&] { account->Let("Code", Variant("9")); }), 438);  // read-only
  EXPECT_EQ(ErrorNumberOf([&] { account->Invoke("Describe", none); }), 449);
  EXPECT_EQ(ErrorNumberOf([&] { account->Call("Describe", {Variant::Missing()}); }), 449);
  EXPECT_EQ(ErrorNumberOf([&] { account->Call("Describe", {Variant("a"), Variant("b"),
                                                            Variant("c")}); }),
            450);
  EXPECT_EQ(ErrorNumberOf([&] { account->Call("Caption", {Variant("a")}); }), 450);

  try {
    account->Invoke("Withdraw", none);
  } catch (const vb::Error& e) {
    EXPECT_NE(e.Description().find("Withdraw"), std::string::npos) << e.Description();
  }
}

TEST(Dispatch, TypedParametersConvertAsAutomationDoes) {
  EXPECT_EQ(automation::TextArg(Variant::Missing()), "");
  EXPECT_EQ(automation::LongArg(Variant::Missing(), 7), 7);
  EXPECT_EQ(automation::LongArg(Variant("12")), 12);
  EXPECT_EQ(automation::ObjectArg(Variant::Missing()), nullptr);
  EXPECT_EQ(automation::ObjectArg(vb::Nothing()), nullptr);
  EXPECT_EQ(ErrorNumberOf([] { automation::ObjectArg(Variant(3)); }), vb::kErrTypeMismatch);

  Variant text("old");
  Variant number(5);
  automation::WriteBackText(text, "new");
  automation::WriteBackText(number, "new");
  EXPECT_EQ(text, Variant("new"));
  EXPECT_EQ(number, Variant(5));  // went in as a converted copy
}

}  // namespace
