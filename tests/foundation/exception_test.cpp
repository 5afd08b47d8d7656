// The SDK exceptions: messages and fallback texts, copy semantics, and how handlers catch them.

#include "vynutil/exception.h"

#include <gtest/gtest.h>

#include <exception>
#include <functional>
#include <memory>
#include <string>
#include <type_traits>
#include <vector>

namespace {

using VynSDK::Util::Exception;
using VynSDK::Util::NullDereferenceException;
using VynSDK::Util::OutOfRangeException;
using VynSDK::Util::RunTimeException;

std::u16string Text(const MCHAR* text) { return text != nullptr ? text : u"(null)"; }

// The base's message-less form is protected; a derived test class reaches it.
struct BareException : Exception {
  BareException() = default;
};

// One vtable pointer and the message pointer, nothing else.
static_assert(sizeof(Exception) == 2 * sizeof(void*));
static_assert(sizeof(OutOfRangeException) == sizeof(Exception));
static_assert(std::has_virtual_destructor_v<Exception>);
static_assert(std::is_base_of_v<VynHeapOperators, Exception>);
static_assert(!std::is_base_of_v<std::exception, Exception>);
static_assert(std::is_base_of_v<Exception, NullDereferenceException> &&
              std::is_base_of_v<Exception, OutOfRangeException> &&
              std::is_base_of_v<Exception, RunTimeException>);

TEST(Exceptions, WhatGivesTheMessageOrTheClassFallback) {
  struct Row {
    const char* name;
    std::function<std::unique_ptr<Exception>(const MCHAR*)> make;
    const MCHAR* fallback;
  };
  const std::vector<Row> rows = {
      {"Exception", [](const MCHAR* m) { return std::make_unique<Exception>(m); },
       u"Unknown Exception"},
      {"NullDereferenceException",
       [](const MCHAR* m) { return std::make_unique<NullDereferenceException>(m); },
       u"VynSDK::Util::NullDereferenceException"},
      {"OutOfRangeException",
       [](const MCHAR* m) { return std::make_unique<OutOfRangeException>(m); },
       u"VynSDK::Util::OutOfRangeException"},
      {"RunTimeException", [](const MCHAR* m) { return std::make_unique<RunTimeException>(m); },
       u"VynSDK::Util::RunTimeException"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(Text(row.make(nullptr)->What()), row.fallback);
    // An empty message is a message: its text is returned, not the fallback.
    EXPECT_EQ(Text(row.make(u"")->What()), u"");
    EXPECT_EQ(Text(row.make(u"Größe ≠ 𝄞")->What()), u"Größe ≠ 𝄞");
  }
  EXPECT_EQ(Text(BareException().What()), u"Unknown Exception");
}

TEST(Exceptions, TheMessageIsACopyOwnedByEachObject) {
  MCHAR source[] = u"index 5";
  OutOfRangeException original(source);
  source[0] = u'X';
  EXPECT_EQ(Text(original.What()), u"index 5") << "the constructor copies the caller's text";

  auto* doomed = new OutOfRangeException(u"first");
  OutOfRangeException copy(*doomed);
  EXPECT_NE(copy.What(), doomed->What()) << "separate buffers";
  delete doomed;
  EXPECT_EQ(Text(copy.What()), u"first");

  RunTimeException source2(u"moved");
  RunTimeException target(std::move(source2));
  EXPECT_EQ(Text(source2.What()), u"moved") << "moving copies: the source keeps its message";
  EXPECT_EQ(Text(target.What()), u"moved");
  EXPECT_NE(source2.What(), target.What());

  Exception base(u"base");
  Exception baseCopy(base);
  EXPECT_EQ(Text(baseCopy.What()), u"base");
  EXPECT_NE(baseCopy.What(), base.What());
}

TEST(Exceptions, AssignmentKeepsTheMessageWhenTheOtherHasNone) {
  NullDereferenceException a(u"A");
  const NullDereferenceException none(nullptr);
  a = none;
  EXPECT_EQ(Text(a.What()), u"A");

  const MCHAR* before = a.What();
  a = a;
  EXPECT_EQ(a.What(), before) << "self-assignment changes nothing";

  NullDereferenceException b(u"B");
  a = b;
  EXPECT_EQ(Text(a.What()), u"B");
  EXPECT_NE(a.What(), b.What());

  a = NullDereferenceException(u"C");  // move assignment copies as well
  EXPECT_EQ(Text(a.What()), u"C");

  NullDereferenceException empty(nullptr);
  empty = b;
  EXPECT_EQ(Text(empty.What()), u"B");

  // Assignment through the base keeps the target's class and its fallback.
  RunTimeException runTime(nullptr);
  static_cast<Exception&>(runTime) = Exception(nullptr);
  EXPECT_EQ(Text(runTime.What()), u"VynSDK::Util::RunTimeException");
}

TEST(Exceptions, CaughtByTheirBasesButNotByStdException) {
  const auto throwAndCatch = [](const std::function<void()>& raise) -> std::u16string {
    try {
      try {
        raise();
      } catch (const std::exception&) {
        return u"caught as std::exception";
      }
    } catch (const Exception& e) {
      return e.What();
    }
    return u"not thrown";
  };
  EXPECT_EQ(throwAndCatch([] { throw OutOfRangeException(u"range"); }), u"range");
  EXPECT_EQ(throwAndCatch([] { throw NullDereferenceException(nullptr); }),
            u"VynSDK::Util::NullDereferenceException");
  EXPECT_EQ(throwAndCatch([] { throw RunTimeException(nullptr); }),
            u"VynSDK::Util::RunTimeException");

  try {
    throw OutOfRangeException(u"exact");
  } catch (const RunTimeException&) {
    ADD_FAILURE() << "caught by a sibling class";
  } catch (const OutOfRangeException& e) {
    EXPECT_EQ(Text(e.What()), u"exact");
  }

  // Thrown by pointer, as the string core does: the catcher owns and deletes the object.
  try {
    throw new RunTimeException(u"by pointer");
  } catch (Exception* e) {
    EXPECT_EQ(Text(e->What()), u"by pointer");
    delete e;
  }
}

}  // namespace
