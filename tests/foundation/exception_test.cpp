// The SDK exceptions: messages and fallback texts, copy semantics, and how handlers catch them.

#include "vynutil/exception.h"

#include <gtest/gtest.h>

#include <exception>
#include <functional>
#include <memory>
#include <string>
#include <tuple>
#include <type_traits>
#include <vector>

namespace {

using VynSDK::Util::Exception;
using VynSDK::Util::NullDereferenceException;
using VynSDK::Util::OutOfRangeException;
using VynSDK::Util::RunTimeException;

std::u16string Text(const MCHAR* text) { return text != nullptr ? text : u"(null)"; }

// The base's message-less form is protected; a derived test class reaches it.
struct BareException : Exception {};

// Binary layout: one vtable pointer and the message pointer, nothing else.
static_assert(sizeof(Exception) == 2 * sizeof(void*) &&
              sizeof(OutOfRangeException) == sizeof(Exception));
static_assert(std::has_virtual_destructor_v<Exception> &&
              std::is_base_of_v<VynHeapOperators, Exception>);

template <class T>
std::unique_ptr<Exception> Make(const MCHAR* message) {
  return std::make_unique<T>(message);
}

TEST(Exceptions, WhatGivesTheMessageOrTheClassFallback) {
  const std::vector<std::tuple<decltype(&Make<Exception>), const MCHAR*>> rows = {
      {Make<Exception>, u"Unknown Exception"},
      {Make<NullDereferenceException>, u"VynSDK::Util::NullDereferenceException"},
      {Make<OutOfRangeException>, u"VynSDK::Util::OutOfRangeException"},
      {Make<RunTimeException>, u"VynSDK::Util::RunTimeException"},
  };
  for (const auto& [make, fallback] : rows) {
    SCOPED_TRACE(std::string(fallback, fallback + std::char_traits<MCHAR>::length(fallback)));
    EXPECT_EQ(Text(make(nullptr)->What()), fallback);
    // An empty message is a message: its text is returned, not the fallback.
    EXPECT_EQ(Text(make(u"")->What()), u"");
    EXPECT_EQ(Text(make(u"Größe ≠ 𝄞")->What()), u"Größe ≠ 𝄞");
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

  RunTimeException moved(u"moved");
  RunTimeException target(std::move(moved));
  EXPECT_EQ(Text(moved.What()), u"moved") << "moving copies: the source keeps its message";
  EXPECT_EQ(Text(target.What()), u"moved");
  EXPECT_NE(moved.What(), target.What());
}

TEST(Exceptions, AssignmentKeepsTheMessageWhenTheOtherHasNone) {
  NullDereferenceException a(u"A");
  a = NullDereferenceException(nullptr);
  EXPECT_EQ(Text(a.What()), u"A");
  const MCHAR* before = a.What();
  a = a;
  EXPECT_EQ(a.What(), before) << "self-assignment changes nothing";

  NullDereferenceException b(u"B");
  a = b;
  EXPECT_EQ(Text(a.What()), u"B");
  EXPECT_NE(a.What(), b.What());
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
