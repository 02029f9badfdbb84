//===- tests/tools/ExpertFilterTest.cpp - Template filter -----------------===//
#include "tools/ExpertFilterClasses.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <unistd.h>
#include <utility>

using namespace formkit;
namespace fs = std::filesystem;

namespace {

using TItemValues = std::initializer_list<std::pair<const char*, TVariant>>;

IPtr<IPropertyValues> Item(TItemValues Values) {
  IPtr<IPropertyValues> Result = CoPropertyValues::Create();
  for (const auto& [Key, Value] : Values) Result->SetProperty(Key, Value);
  return Result;
}

IPtr<ICollectionProperty> Collection(std::initializer_list<IPtr<IPropertyValues>> Items) {
  IPtr<ICollectionProperty> Result = CoCollectionProperty::Create();
  for (const auto& I : Items) Result->AddItem(I);
  return Result;
}

/// Each test gets a directory of its own for its templates, and a fresh filter.
class ExpertFilterTest : public ::testing::Test {
protected:
  void SetUp() override {
    const auto* Info = ::testing::UnitTest::GetInstance()->current_test_info();
    Dir = fs::temp_directory_path() /
          ("fk_filter_" + std::to_string(::getpid()) + "_" + Info->test_suite_name() + "_" + Info->name());
    fs::create_directories(Dir);
    Filter = CoExpertFilter::Create();
  }
  void TearDown() override {
    std::error_code Ec;
    fs::remove_all(Dir, Ec);
    detail::SetLocaleLanguage("");
  }

  String DirName() const { return Dir.string() + "/"; }
  void Write(const String& Name, std::string_view Bytes) {
    fs::create_directories((Dir / Name).parent_path());
    std::ofstream(Dir / Name, std::ios::binary) << Bytes;
  }
  /// Filters `Text` as the file name.txt with the fixture's filter.
  String Run(std::string_view Text) {
    Write("name.txt", Text);
    return Filter->Filter("name.txt", DirName());
  }
  /// The message of the error that filtering `Text` raises.
  String ErrorOf(std::string_view Text) {
    try {
      Run(Text);
    } catch (const EExpertFilterError& E) {
      return E.Message();
    }
    return "(no error)";
  }
  /// The value `set(a, ...)` stores, read back through the property interface.
  TVariant SetValue(std::string_view Arguments) {
    Run("[!set(a" + String(Arguments) + ")]");
    return Filter->GetProperty("a");
  }

  fs::path Dir;
  IPtr<IExpertFilter> Filter;
};

//===----------------------------------------------------------------------===//
// Lines and expansion
//===----------------------------------------------------------------------===//

TEST_F(ExpertFilterTest, ExpandsTagsAndEndsEveryLineWithCrLf) {
  Filter->SetProperty("x", 1);
  Filter->SetProperty("Flag", true);
  Filter->SetProperty("Name", "Main");
  EXPECT_EQ(Run("a[!x]b\n[!Name]-[!  Flag\t] [!x]\nend"), "a1b\r\nMain-True 1\r\nend\r\n");
}

TEST_F(ExpertFilterTest, LineOfTagsThatYieldsNothingLeavesNoLineButBlankLineStays) {
  EXPECT_EQ(Run("a\n[!unset]\n\n[!set(b,c)]\n[!b]"), "a\r\n\r\nc\r\n");
}

TEST_F(ExpertFilterTest, PlainTextAndStrayBracketsAreCopiedUnchanged) {
  EXPECT_EQ(Run("x] [y] [ !z] ![\n  \t"), "x] [y] [ !z] ![\r\n  \t\r\n");
}

TEST_F(ExpertFilterTest, PropertyTagIsTheWholeKeyWithItsDots) {
  Filter->SetProperty("a.b", "dotted");
  Filter->SetCollectionProperty("a", Collection({Item({{"b", "item"}})}));
  // No loop runs over "a", so it has no current item: the whole key decides.
  EXPECT_EQ(Run("[!a.b]|[!A.B]|[!a]"), "dotted|dotted|\r\n");
}

TEST_F(ExpertFilterTest, KeywordsArePrefixesSoLongerWordsAreNoPropertyNames) {
  Filter->SetProperty("settings", "never read");
  EXPECT_EQ(ErrorOf("[!settings]"), "name.txt(1): Expecting open paren in tag 'settings'");
  Filter = CoExpertFilter::Create();
  EXPECT_EQ(Run("[!if=(a,)]\n[!elsewhere]\nshown[!endif and more]"), "shown\r\n");
}

//===----------------------------------------------------------------------===//
// Output: decided per line, after the whole line is expanded
//===----------------------------------------------------------------------===//

TEST_F(ExpertFilterTest, OutputSwitchesActOnTheLineTheyStandOn) {
  EXPECT_EQ(Run("before[!outputoff]\nhidden\nshown[!outputon]\nafter"), "shown\r\nafter\r\n");
}

TEST_F(ExpertFilterTest, TagsRunWhileOutputIsOff) {
  Filter->SetProperty("a", "0");
  EXPECT_EQ(Run("[!outputoff]\n[!set(x,1)]\n[!outputon]\n"
                "[!if=(a,1)]\n[!set(y,2)]\n[!endif]\n"
                "[!x][!y]"),
            "12\r\n");
}

TEST_F(ExpertFilterTest, ABranchWithinOneLineDoesNotSplitIt) {
  Filter->SetProperty("a", "0");
  EXPECT_EQ(Run("[!if=(a,1)]\nno\nyes[!endif]\n[!if=(a,0)]no[!else]\n[!endif]both[!if=(a,0)]one[!else]two[!endif]"),
            "yes\r\nbothonetwo\r\n");
}

TEST_F(ExpertFilterTest, NestedConditionsInABranchThatIsOffArePushedAndPopped) {
  Filter->SetProperty("a", "0");
  EXPECT_EQ(Run("[!if=(a,1)]\n[!if=(a,0)]\nx\n[!else]\ny\n[!endif]\n[!else]\nz\n[!endif]"), "z\r\n");
}

//===----------------------------------------------------------------------===//
// Conditions
//===----------------------------------------------------------------------===//

TEST_F(ExpertFilterTest, IfEqualsWithoutValueTestsForTrueInAnyCase) {
  for (TVariant Flag : {TVariant("true"), TVariant("TRUE"), TVariant(true)}) {
    Filter = CoExpertFilter::Create();
    Filter->SetProperty("Flag", Flag);
    EXPECT_EQ(Run("[!if=(Flag)]\non\n[!else]\noff\n[!endif]"), "on\r\n");
  }
  for (TVariant Flag : {TVariant("yes"), TVariant(false), TVariant(1)}) {
    Filter = CoExpertFilter::Create();
    Filter->SetProperty("Flag", Flag);
    EXPECT_EQ(Run("[!if=(Flag)]\non\n[!else]\noff\n[!endif]"), "off\r\n");
  }
}

TEST_F(ExpertFilterTest, IfNotEqualsWithoutValueTestsForText) {
  Filter->SetProperty("Name", "x");
  EXPECT_EQ(Run("[!if!=(Name)]\nnamed\n[!endif]\n[!if!=(Other)]\nother\n[!endif]"), "named\r\n");
}

TEST_F(ExpertFilterTest, ComparisonIgnoresCaseAndTakesQuotedValues) {
  Filter->SetProperty("a", "Hello World");
  EXPECT_EQ(Run("[!if=(a, 'hello world')]\n1\n[!endif]\n[!if!=(a \"HELLO WORLD\")]\n2\n[!endif]"),
            "1\r\n");
}

TEST_F(ExpertFilterTest, SecondElseInvertsAgain) {
  Filter->SetProperty("a", "1");
  EXPECT_EQ(Run("[!if=(a,1)]\n[!else]\n[!else]\nx\n[!endif]"), "x\r\n");
}

//===----------------------------------------------------------------------===//
// Arguments: separators, quotes, escapes
//===----------------------------------------------------------------------===//

TEST_F(ExpertFilterTest, BlanksTabsCommasAndLineBreaksSeparateTokens) {
  EXPECT_EQ(SetValue(" b").AsString(), "b");
  EXPECT_EQ(SetValue(",\tb").AsString(), "b");
  EXPECT_EQ(SetValue(" ,, b  c d").AsString(), "b"); // further tokens are ignored
}

TEST_F(ExpertFilterTest, QuotedTokensKeepSeparatorsAndTheOtherQuote) {
  EXPECT_EQ(SetValue(",\"x, y\"").AsString(), "x, y");
  EXPECT_EQ(SetValue(",'say \"hi\"'").AsString(), "say \"hi\"");
  EXPECT_EQ(SetValue(",\"b\"c").AsString(), "b"); // a closed quote ends its token
}

TEST_F(ExpertFilterTest, EscapesInQuotedTokens) {
  EXPECT_EQ(SetValue(R"(,"\"\\\a\b\n\r\t\q")").AsString(), "\"\\\n\b\r\n\r\t\\q");
  EXPECT_EQ(SetValue(R"(,"a\nb")").AsString(), "a\r\nb");
  // \' is no escape: the backslash stays, and the quote it takes does not close.
  EXPECT_EQ(SetValue(R"(,'it\'s')").AsString(), "it\\'s");
}

TEST_F(ExpertFilterTest, PlainTokensKeepQuotesAndBackslashes) {
  EXPECT_EQ(SetValue(R"(,x"y\n')").AsString(), "x\"y\\n'");
}

TEST_F(ExpertFilterTest, OpenTokenAtTheEndCountsUnlessEmpty) {
  EXPECT_EQ(SetValue(",\"abc").AsString(), "abc");
  TVariant Dropped = SetValue(",\"");
  EXPECT_EQ(Dropped.VarType(), varEmpty);
  TVariant EmptyText = SetValue(",\"\"");
  EXPECT_EQ(EmptyText.VarType(), varUString);
  EXPECT_EQ(EmptyText.AsString(), "");
}

TEST_F(ExpertFilterTest, CloseBracketEndsTheTagEvenInsideQuotes) {
  EXPECT_EQ(ErrorOf("[!set(a,\"x]y\")]"), "name.txt(1): Expecting close paren in tag 'set(a,\"x'");
}

//===----------------------------------------------------------------------===//
// Loops
//===----------------------------------------------------------------------===//

class ExpertFilterLoopTest : public ExpertFilterTest {
protected:
  void SetUp() override {
    ExpertFilterTest::SetUp();
    Items = Collection({Item({{"x", 1}}), Item({{"x", 2}}), Item({{"x", 3}})});
    Filter->SetCollectionProperty("items", Items);
  }
  IPtr<ICollectionProperty> Items;
};

TEST_F(ExpertFilterLoopTest, BodyRunsOncePerItemAndSeesEachItem) {
  EXPECT_EQ(Run("head\n[!foreach(item IN items)]\n<[!item.x]>\n\n[!endforeach]\ntail"),
            "head\r\n<1>\r\n\r\n<2>\r\n\r\n<3>\r\n\r\ntail\r\n");
  EXPECT_EQ(Items->GetCurrentItem(), nullptr);
}

TEST_F(ExpertFilterLoopTest, CollectionNameReadsTheCurrentItemWithoutAnItemName) {
  EXPECT_EQ(Run("[!foreach(items)]\n[!items.x]\n[!endforeach]"), "1\r\n2\r\n3\r\n");
}

TEST_F(ExpertFilterLoopTest, EmptyCollectionRunsTheTagsOnceAndWritesNothing) {
  Filter->SetCollectionProperty("none", CoCollectionProperty::Create());
  Filter->SetProperty("text", "no collection");
  EXPECT_EQ(Run("[!foreach(i in none)]\nbody[!set(ran,yes)]\n[!endforeach]\n"
                "[!foreach(i in text)]\nbody\n[!endforeach]\n"
                "after [!ran]"),
            "after yes\r\n");
}

TEST_F(ExpertFilterLoopTest, LoopInsideAnEmptyLoopWritesNothing) {
  Filter->SetCollectionProperty("none", CoCollectionProperty::Create());
  EXPECT_EQ(Run("[!foreach(n in none)]\n[!foreach(i in items)]\n[!i.x]\n[!endforeach]\n[!endforeach]\nend"),
            "end\r\n");
}

TEST_F(ExpertFilterLoopTest, NestedLoopReadsThroughTheItemAndItemNamesComeBack) {
  IPtr<ICollectionProperty> Forms = Collection({
      Item({{"name", "F1"}, {"item", "f1"}}),
      Item({{"name", "F2"}, {"item", "f2"}}),
  });
  Forms->GetItem(0)->SetCollectionProperty("children", Collection({Item({{"name", "a"}}), Item({{"name", "b"}})}));
  Forms->GetItem(1)->SetCollectionProperty("children", CoCollectionProperty::Create());
  Filter->SetCollectionProperty("forms", Forms);
  Filter->SetProperty("item", "outer");
  // The inner loop reuses the outer item name: it hides the form, which is back after it.
  EXPECT_EQ(Run("[!item]\n"
                "[!foreach(item in forms)]\n"
                "[!item.name]:\n"
                "[!foreach(item in item.children)]\n"
                "- [!item.name]\n"
                "[!endforeach]\n"
                "end [!item.name]\n"
                "[!endforeach]\n"
                "[!item]"),
            "outer\r\nF1:\r\n- a\r\n- b\r\nend F1\r\nF2:\r\nend F2\r\nouter\r\n");
}

TEST_F(ExpertFilterLoopTest, TextAfterEndforeachBelongsToTheNextIteration) {
  EXPECT_EQ(Run("[!foreach(i in items)]\n[!i.x][!endforeach]|[!i.x]"), "1|2\r\n2|3\r\n3|\r\n");
}

TEST_F(ExpertFilterLoopTest, StrayOrMissingEndforeachIsNoError) {
  EXPECT_EQ(Run("a[!endforeach]b\n[!foreach(i in items)]\n[!i.x]"), "ab\r\n1\r\n");
  EXPECT_EQ(Items->GetCurrentItem(), nullptr);
}

TEST_F(ExpertFilterLoopTest, ErrorInAReplayedLineGivesThatLinesNumber) {
  // The stack holds one entry: the first iteration pops it, the second finds it empty.
  EXPECT_EQ(ErrorOf("[!if=(a,)]\n[!foreach(i in items)]\nx\n[!endif]\n[!endforeach]"),
            "name.txt(4): Attempt to pop an empty stack");
}

TEST_F(ExpertFilterLoopTest, MalformedForeachTags) {
  EXPECT_EQ(ErrorOf("[!foreach(i items)]"), "name.txt(1): Invalid foreach tag encountered 'foreach(i items)'");
  EXPECT_EQ(ErrorOf("x\n[!foreach(i of items)]"),
            "name.txt(2): Invalid foreach tag encountered 'foreach(i of items)'");
  EXPECT_EQ(ErrorOf("[!foreach( )]"), "name.txt(1): Invalid foreach tag encountered 'foreach( )'");
  EXPECT_EQ(ErrorOf("[!foreach items]"), "name.txt(1): Expecting open paren in tag 'foreach items'");
}

TEST_F(ExpertFilterLoopTest, LoopsNestSixtyFourDeep) {
  Filter->SetCollectionProperty("one", Collection({Item({{"x", "deep"}})}));
  String Open, Close;
  for (int I = 0; I < TExpertFilter::MaxLoopDepth; ++I) {
    Open += "[!foreach(one)]\n";
    Close += "[!endforeach]\n";
  }
  EXPECT_EQ(Run(Open + "[!one.x]\n" + Close), "deep\r\n");
  Filter = CoExpertFilter::Create();
  Filter->SetCollectionProperty("one", Collection({Item({{"x", "deep"}})}));
  EXPECT_EQ(ErrorOf(Open + "[!foreach(one)]\n"), "name.txt(65): Too many nested foreach tags encountered 'foreach(one)'");
}

TEST_F(ExpertFilterLoopTest, LoopOpenedOnTheLineOfAnEndThatRestartsNestsUntilTheBound) {
  // The second loop opens inside the first loop's next iteration, whose replay
  // reaches this line again and opens another one. The loop that has just begun
  // an iteration stands at its head, line 1.
  EXPECT_EQ(ErrorOf("[!foreach(a in items)]\nx\n[!endforeach][!foreach(b in items)]\ny\n[!endforeach]"),
            "name.txt(1): Too many nested foreach tags encountered 'foreach(b in items)'");
}

TEST_F(ExpertFilterLoopTest, ErrorInsideALoopCleansUpTheLoop) {
  Filter->SetProperty("i", "before");
  EXPECT_EQ(ErrorOf("[!foreach(i in items)]\n[!i.x]\n[!else]"), "name.txt(3): Attempt to access empty stack");
  EXPECT_EQ(Filter->GetProperty("i").AsString(), "before");
  EXPECT_EQ(Items->GetCurrentItem(), nullptr);
}

//===----------------------------------------------------------------------===//
// The dump of all properties
//===----------------------------------------------------------------------===//

TEST_F(ExpertFilterTest, OutputPropertiesDumpsEveryValueWithNestedItems) {
  Filter->SetProperty("Name", "Main");
  Filter->SetProperty("Count", 2);
  IPtr<IPropertyValues> First = Item({{"x", 1}, {"y", "a"}});
  First->SetCollectionProperty("kids", Collection({Item({{"n", "k"}})}));
  Filter->SetCollectionProperty("Items", Collection({First, Item({}), Item({{"x", 2}})}));
  Filter->SetCollectionProperty("None", CoCollectionProperty::Create());
  EXPECT_EQ(Run("<[!outputproperties]>"),
            "<Name=Main\r\n"
            "Count=2\r\n"
            "Items=\r\n"
            "  <0>\r\n"
            "    x=1\r\n"
            "    y=a\r\n"
            "    kids=\r\n"
            "      <0>\r\n"
            "        n=k\r\n"
            "  <1>\r\n"
            "\r\n"
            "  <2>\r\n"
            "    x=2\r\n"
            "None=>\r\n");
}

//===----------------------------------------------------------------------===//
// Errors: the template's name, the line number, the message
//===----------------------------------------------------------------------===//

TEST_F(ExpertFilterTest, MissingCloseTagShowsTheTextAfterTheLastClosedTag) {
  EXPECT_EQ(ErrorOf("ok\n[!x"), "name.txt(2): Missing closing tag in line '[!x'");
  EXPECT_EQ(ErrorOf("a[!b]c[!d"), "name.txt(1): Missing closing tag in line 'c[!d'");
}

TEST_F(ExpertFilterTest, UnbalancedConditions) {
  EXPECT_EQ(ErrorOf("1\n2\n3\n4\n5\n6\n7\n8\n9\n10\n11\n[!endif]"), "name.txt(12): Attempt to pop an empty stack");
  EXPECT_EQ(ErrorOf("[!else]"), "name.txt(1): Attempt to access empty stack");
}

TEST_F(ExpertFilterTest, MalformedArguments) {
  EXPECT_EQ(ErrorOf("[!if=]"), "name.txt(1): Expecting open paren in tag 'if='");
  EXPECT_EQ(ErrorOf("[!if=(a]"), "name.txt(1): Expecting close paren in tag 'if=(a'");
  EXPECT_EQ(ErrorOf("[!set x)]"), "name.txt(1): Expecting open paren in tag 'set x)'");
  EXPECT_EQ(ErrorOf("[! set(  ) ]"), "name.txt(1): Invalid tag encountered 'set(  )'");
  EXPECT_EQ(ErrorOf("[!if!=(,)]"), "name.txt(1): Invalid tag encountered 'if!=(,)'");
}

TEST_F(ExpertFilterTest, MessagesNameTheTemplateWithoutItsDirectories) {
  Write("sub/deep.tpl", "[!endif]");
  try {
    Filter->Filter("sub/deep.tpl", DirName());
    FAIL() << "no error";
  } catch (const EExpertFilterError& E) {
    EXPECT_STREQ(E.what(), "deep.tpl(1): Attempt to pop an empty stack");
  }
}

TEST_F(ExpertFilterTest, MissingTemplateFile) {
  try {
    Filter->Filter("missing.txt", DirName());
    FAIL() << "no error";
  } catch (const EExpertFilterError& E) {
    EXPECT_EQ(E.Message(), "File not found: " + DirName() + "missing.txt");
  }
}

TEST_F(ExpertFilterTest, ProviderWithoutFileHasNoNameInMessages) {
  detail::RegisterTextResource(7, "PopTwice", "a\r\n[!endif]");
  try {
    Filter->Filter(CoResourceProvider::Create(7, "POPTWICE"));
    FAIL() << "no error";
  } catch (const EExpertFilterError& E) {
    EXPECT_EQ(E.Message(), "(2): Attempt to pop an empty stack");
  }
  detail::UnregisterTextResource(7, "PopTwice");
}

//===----------------------------------------------------------------------===//
// Template files and resources
//===----------------------------------------------------------------------===//

TEST_F(ExpertFilterTest, FilesMayStartWithAByteOrderMark) {
  Filter->SetProperty("x", "\xC3\xA9"); // é
  EXPECT_EQ(Run("\xEF\xBB\xBF" "a[!x]"), "a\xC3\xA9\r\n");
  // "é\nb" in UTF-16, little and big endian.
  Filter = CoExpertFilter::Create();
  EXPECT_EQ(Run(std::string_view("\xFF\xFE\xE9\x00\n\x00" "b\x00", 8)), "\xC3\xA9\r\nb\r\n");
  Filter = CoExpertFilter::Create();
  EXPECT_EQ(Run(std::string_view("\xFE\xFF\x00\xE9\x00\n\x00" "b", 8)), "\xC3\xA9\r\nb\r\n");
}

TEST_F(ExpertFilterTest, AnyLineBreakEndsALine) {
  EXPECT_EQ(Run("a\rb\nc\r\nd\r\n"), "a\r\nb\r\nc\r\nd\r\n");
  Filter = CoExpertFilter::Create();
  EXPECT_EQ(Run(""), "");
}

TEST_F(ExpertFilterTest, LanguageVariantOfATemplateIsPreferred) {
  Write("name.txt", "plain");
  Write("de/name.txt", "deutsch");
  Write("de/only.txt", "nur hier");
  detail::SetLocaleLanguage("de");
  EXPECT_EQ(Filter->Filter("name.txt", DirName()), "deutsch\r\n");
  EXPECT_EQ(CoExpertFilter::Create()->Filter("only.txt", DirName()), "nur hier\r\n");
  detail::SetLocaleLanguage("");
  EXPECT_EQ(CoExpertFilter::Create()->Filter("name.txt", DirName()), "plain\r\n");
}

TEST_F(ExpertFilterTest, ResourceLinesSplitAtCarriageReturns) {
  EXPECT_EQ(TResourceProvider::SplitResourceText("\xEF\xBB\xBF" "one\r\ntwo\r\n\r\n\n\nthree\rfour\r\n"),
            (std::vector<String>{"one", "two", "three", "four"}));
  EXPECT_EQ(TResourceProvider::SplitResourceText(std::string_view("a\r\nb\0c\rd", 8)),
            (std::vector<String>{"a", "b"}));
  EXPECT_EQ(TResourceProvider::SplitResourceText("a\nb"), (std::vector<String>{"a\nb"}));
}

TEST_F(ExpertFilterTest, ResourceTemplate) {
  detail::RegisterTextResource(1, "UnitTemplate", "unit [!Name];\r\n[!outputoff]\r\nhidden\r\n");
  Filter->SetProperty("Name", "Main");
  EXPECT_EQ(Filter->Filter(CoResourceProvider::Create(1, "unittemplate")), "unit Main;\r\n");
  try {
    CoResourceProvider::Create(2, "UnitTemplate");
    FAIL() << "no error";
  } catch (const detail::EResNotFound& E) {
    EXPECT_EQ(E.Message(), "Resource UnitTemplate not found");
  }
  EXPECT_TRUE(detail::UnregisterTextResource(1, "UNITTEMPLATE"));
}

//===----------------------------------------------------------------------===//
// The parts on their own
//===----------------------------------------------------------------------===//

TEST(ExpertFilterIdentityTest, FilterAnswersForItsChainAndItsReporter) {
  IPtr<IExpertFilter> Filter = CoExpertFilter::Create();
  EXPECT_EQ(IExpertFilter::IID.ToString(), "{9D2EBDCA-241A-46C2-820A-6425BD2BE786}");
  EXPECT_TRUE(QueryAs<IPropertyValues>(Filter));
  EXPECT_TRUE(QueryAs<IErrorReporter>(Filter));
  EXPECT_FALSE(QueryAs<ILineProvider>(Filter));
  EXPECT_EQ(Filter->Filter(nullptr), "");
}

TEST(PropertyValuesTest, KeysIgnoreCaseAndKeepTheirOrder) {
  IPtr<IPropertyValues> Values = CoPropertyValues::Create();
  for (int I = 0; I < 12; ++I) Values->SetProperty("k" + std::to_string(I), I);
  Values->SetProperty("K3", "replaced");
  ASSERT_EQ(Values->GetPropertyCount(), 12);
  EXPECT_EQ(Values->GetPropertyKey(3), "k3");
  EXPECT_EQ(Values->GetProperty(3).AsString(), "replaced");
  EXPECT_EQ(Values->GetProperty("K11").AsInteger(), 11);
  EXPECT_TRUE(Values->GetProperty("k12").IsEmpty());
  EXPECT_THROW(Values->GetProperty(12), EListError);
  EXPECT_THROW(Values->GetPropertyKey(-1), EListError);
  Values->ClearProperties();
  EXPECT_EQ(Values->GetPropertyCount(), 0);
}

TEST(PropertyValuesTest, DottedKeyReadsThroughTheCurrentItemOfARunningLoop) {
  IPtr<IPropertyValues> Values = CoPropertyValues::Create();
  IPtr<ICollectionProperty> Coll = Collection({Item({{"x", "first"}}), Item({{"x", "second"}})});
  Values->SetCollectionProperty("c", Coll);
  EXPECT_EQ(Values->GetProperty("c").VarType(), varUnknown);
  EXPECT_EQ(detail::VarToStr(Values->GetProperty("c")), "");
  EXPECT_TRUE(Values->GetProperty("c.x").IsEmpty());

  // A loop's first iteration points the collection at item 0.
  IPtr<TScopeLineProvider> Scope =
      TScopeLineProvider::Create(nullptr, QueryAs<IIterationCounterConsumer>(Coll), nullptr, "c");
  EXPECT_EQ(Values->GetProperty("C.X").AsString(), "first");
  Scope->Cleanup();
  EXPECT_TRUE(Values->GetProperty("c.x").IsEmpty());
}

TEST(BooleanStackTest, CurrentValueIsOnOnlyWhenAllEntriesAre) {
  IPtr<TBooleanStack> Stack = New<TBooleanStack>();
  EXPECT_TRUE(Stack->GetCurrentValue());
  Stack->Push(true);
  Stack->Push(false);
  EXPECT_FALSE(Stack->GetCurrentValue());
  Stack->ToggleTop();
  EXPECT_TRUE(Stack->GetCurrentValue());
  EXPECT_EQ(Stack->GetSize(), 2);
  EXPECT_TRUE(Stack->Pop());
  EXPECT_TRUE(Stack->GetTop());
  Stack->Cleanup();
  EXPECT_EQ(Stack->GetSize(), 0);
  // Without a reporter the bare message is raised.
  try {
    Stack->GetTop();
    FAIL() << "no error";
  } catch (const EExpertFilterError& E) {
    EXPECT_EQ(E.Message(), "Attempt to access empty stack");
  }
}

} // namespace
