#include <gtest/gtest.h>

#include "FailureText.h"

namespace {

std::string allOf(const zemException& e) { return fieldsOf(e, "kcmait"); }

template <class T>
void expectKind(const std::string& kind) {
    static_assert(!std::is_default_constructible_v<T> && sizeof(T) == sizeof(zemException));
    try {
        throw T("c", "m", "a", "i", "t");
    } catch (zemException& e) {
        EXPECT_EQ(allOf(e), kind + "/c/m/a/i/t");
    }
    EXPECT_EQ(allOf(T("t")), kind + "/////t");
    EXPECT_EQ(allOf(T("c", "m", "t")), kind + "/c/m///t");
    EXPECT_EQ(allOf(T("c", "m", "i", "t")), kind + "/c/m//i/t");
}

TEST(ExceptionTest, EachClassFixesItsKind) {
    expectKind<zemAccessDeniedException>("1");
    expectKind<zemObjectAlreadyExistsException>("2");
    expectKind<zemInvalidParameterException>("3");
    expectKind<zemNotSupportedException>("4");
    expectKind<zemObjectNotFoundException>("5");
    expectKind<zemOperationFailedException>("6");
    expectKind<zemPropertyNotFoundException>("7");
    expectKind<zemMethodNotFoundException>("8");
}

TEST(ExceptionTest, TypeCanChangeAndNullTextsReadAsEmpty) {
    const char* const none = nullptr;
    zemOperationFailedException e(none, none, "m", none, "t");
    e.setExceptionType(zemObjectNotFoundException::kind);
    e.setThrowingMethod(none);
    e.setExceptionId("i");
    EXPECT_EQ(allOf(zemException(e)), "5///m/i/t");
}

TEST(ExceptionTest, ToStringNamesTheFieldsThatAreThere) {
    EXPECT_STREQ(zemOperationFailedException("x").toString(), "\n\t\n\tExceptionString: x");
    EXPECT_STREQ(zemException(1, "c", "m", "a", "i", "t").toString(),
                 "\n\tThrowingClass: c ThrowingMethod: m AccessMethod: a ExceptionId: i "
                 "\n\tExceptionString: t");
}

}  // namespace
