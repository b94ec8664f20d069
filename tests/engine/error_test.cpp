#include "vexmap/error.h"

#include <cerrno>
#include <sstream>
#include <string>
#include <utility>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

CodeLocation const SetViewSite("src/dewarp", "SetView", 985);
std::string const UNKNOWN = "<UNKNOWN SYMBOL>";

std::string Number(int code) {
    return std::to_string(code);
}

TEST(Error, CodesOutsideTheTableAreUnknownSymbols) {
    Error const error;
    EXPECT_EQ(UNKNOWN, error.Symbol(0));
    EXPECT_EQ(UNKNOWN, error.Symbol(-1));
    EXPECT_EQ(UNKNOWN, error.Symbol(1000));
}

TEST(Error, CodesWhoseNameTheTableLacksAreUnknownSymbols) {
    Error const error;
    EXPECT_EQ(UNKNOWN, error.Symbol(EBFONT));  // here 59, a code the table does not name
    EXPECT_EQ(UNKNOWN, error.Symbol(ENOPKG));
}

TEST(Error, SymbolsNameTheCodesOfThisPlatform) {
    Error const error;
    EXPECT_EQ("EPERM", error.Symbol(EPERM));
    EXPECT_EQ("EINVAL", error.Symbol(EINVAL));
    EXPECT_EQ("EDEADLK", error.Symbol(EDEADLK));
    EXPECT_EQ("EOPNOTSUPP", error.Symbol(EOPNOTSUPP));
    EXPECT_EQ("ETIME", error.Symbol(ETIME));
}

TEST(Error, TwoNamesOfOneValueGiveTheNameTheCLibraryReports) {
    ASSERT_EQ(ENOTSUP, EOPNOTSUPP);
    EXPECT_EQ("EOPNOTSUPP", Error().Symbol(ENOTSUP));
}

TEST(Error, TheOneUnnamedRowGivesAnEmptySymbolAndEmptyBrackets) {
    Error const error;
    EXPECT_EQ("", error.Symbol(EHOSTUNREACH));
    EXPECT_EQ("", error.FormatError(EHOSTUNREACH));
    EXPECT_STREQ("[] - lost", Error(EHOSTUNREACH, "lost").what());
}

// Every named row of the table, by the name the C library has for its value.
class ErrorSymbolTest : public ::testing::TestWithParam<std::pair<int, char const*>> {};

TEST_P(ErrorSymbolTest, NamesItsCode) {
    EXPECT_EQ(GetParam().second, Error().Symbol(GetParam().first));
}

INSTANTIATE_TEST_SUITE_P(
    NamedRows, ErrorSymbolTest,
    ::testing::Values(
        std::make_pair(EPERM, "EPERM"), std::make_pair(ENOENT, "ENOENT"),
        std::make_pair(ESRCH, "ESRCH"), std::make_pair(EINTR, "EINTR"), std::make_pair(EIO, "EIO"),
        std::make_pair(ENXIO, "ENXIO"), std::make_pair(E2BIG, "E2BIG"),
        std::make_pair(ENOEXEC, "ENOEXEC"), std::make_pair(EBADF, "EBADF"),
        std::make_pair(ECHILD, "ECHILD"), std::make_pair(EDEADLK, "EDEADLK"),
        std::make_pair(ENOMEM, "ENOMEM"), std::make_pair(EACCES, "EACCES"),
        std::make_pair(EFAULT, "EFAULT"), std::make_pair(ENOTBLK, "ENOTBLK"),
        std::make_pair(EBUSY, "EBUSY"), std::make_pair(EEXIST, "EEXIST"),
        std::make_pair(EXDEV, "EXDEV"), std::make_pair(ENODEV, "ENODEV"),
        std::make_pair(ENOTDIR, "ENOTDIR"), std::make_pair(EISDIR, "EISDIR"),
        std::make_pair(EINVAL, "EINVAL"), std::make_pair(ENFILE, "ENFILE"),
        std::make_pair(EMFILE, "EMFILE"), std::make_pair(ENOTTY, "ENOTTY"),
        std::make_pair(ETXTBSY, "ETXTBSY"), std::make_pair(EFBIG, "EFBIG"),
        std::make_pair(ENOSPC, "ENOSPC"), std::make_pair(ESPIPE, "ESPIPE"),
        std::make_pair(EROFS, "EROFS"), std::make_pair(EMLINK, "EMLINK"),
        std::make_pair(EPIPE, "EPIPE"), std::make_pair(EDOM, "EDOM"),
        std::make_pair(ERANGE, "ERANGE"), std::make_pair(EAGAIN, "EAGAIN"),
        std::make_pair(EINPROGRESS, "EINPROGRESS"), std::make_pair(EALREADY, "EALREADY"),
        std::make_pair(ENOTSOCK, "ENOTSOCK"), std::make_pair(EDESTADDRREQ, "EDESTADDRREQ"),
        std::make_pair(EMSGSIZE, "EMSGSIZE"), std::make_pair(EPROTOTYPE, "EPROTOTYPE"),
        std::make_pair(ENOPROTOOPT, "ENOPROTOOPT"),
        std::make_pair(EPROTONOSUPPORT, "EPROTONOSUPPORT"),
        std::make_pair(ESOCKTNOSUPPORT, "ESOCKTNOSUPPORT"),
        std::make_pair(EPFNOSUPPORT, "EPFNOSUPPORT"), std::make_pair(EAFNOSUPPORT, "EAFNOSUPPORT"),
        std::make_pair(EADDRINUSE, "EADDRINUSE"), std::make_pair(EADDRNOTAVAIL, "EADDRNOTAVAIL"),
        std::make_pair(ENETDOWN, "ENETDOWN"), std::make_pair(ENETUNREACH, "ENETUNREACH"),
        std::make_pair(ENETRESET, "ENETRESET"), std::make_pair(ECONNABORTED, "ECONNABORTED"),
        std::make_pair(ECONNRESET, "ECONNRESET"), std::make_pair(ENOBUFS, "ENOBUFS"),
        std::make_pair(EISCONN, "EISCONN"), std::make_pair(ENOTCONN, "ENOTCONN"),
        std::make_pair(ESHUTDOWN, "ESHUTDOWN"), std::make_pair(ETIMEDOUT, "ETIMEDOUT"),
        std::make_pair(ECONNREFUSED, "ECONNREFUSED"), std::make_pair(ELOOP, "ELOOP"),
        std::make_pair(ENAMETOOLONG, "ENAMETOOLONG"), std::make_pair(EHOSTDOWN, "EHOSTDOWN"),
        std::make_pair(ENOTEMPTY, "ENOTEMPTY"), std::make_pair(EUSERS, "EUSERS"),
        std::make_pair(EDQUOT, "EDQUOT"), std::make_pair(ESTALE, "ESTALE"),
        std::make_pair(EREMOTE, "EREMOTE"), std::make_pair(ENOLCK, "ENOLCK"),
        std::make_pair(ENOSYS, "ENOSYS"), std::make_pair(EOVERFLOW, "EOVERFLOW"),
        std::make_pair(ECANCELED, "ECANCELED"), std::make_pair(EIDRM, "EIDRM"),
        std::make_pair(ENOMSG, "ENOMSG"), std::make_pair(EILSEQ, "EILSEQ"),
        std::make_pair(EBADMSG, "EBADMSG"), std::make_pair(EMULTIHOP, "EMULTIHOP"),
        std::make_pair(ENODATA, "ENODATA"), std::make_pair(ENOLINK, "ENOLINK"),
        std::make_pair(ENOSR, "ENOSR"), std::make_pair(ENOSTR, "ENOSTR"),
        std::make_pair(EPROTO, "EPROTO"), std::make_pair(ETIME, "ETIME"),
        std::make_pair(EOPNOTSUPP, "EOPNOTSUPP")),
    [](auto const& row) { return std::string(row.param.second); });

TEST(Error, CodeTextIsErrorSymbolAndNumber) {
    EXPECT_EQ("Error EINVAL (" + Number(EINVAL) + ")", Error().FormatError(EINVAL));
    EXPECT_EQ("Error <UNKNOWN SYMBOL> (0)", Error().FormatError(0));
}

// An error with words for its codes, to show the forms of the code text that this class itself
// never reaches.
class DescribedError : public Error {
public:
    DescribedError(bool has_symbol, bool has_description)
        : hasSymbol(has_symbol), hasDescription(has_description) {}
    std::string Symbol(int) const override { return hasSymbol ? "ESOME" : ""; }
    std::string Description(int) const override { return hasDescription ? "some words" : ""; }

private:
    bool hasSymbol;
    bool hasDescription;
};

TEST(Error, CodeTextTakesOneOfFourFormsBySymbolAndDescription) {
    EXPECT_EQ("Error ESOME (5) some words", DescribedError(true, true).FormatError(5));
    EXPECT_EQ("Error ESOME (5)", DescribedError(true, false).FormatError(5));
    EXPECT_EQ("Error (5) some words", DescribedError(false, true).FormatError(5));
    EXPECT_EQ("", DescribedError(false, false).FormatError(5));
}

TEST(Error, DescriptionIsEmptyForEveryCode) {
    EXPECT_EQ("", Error().Description(EINVAL));
    EXPECT_EQ("", Error().Description(0));
}

TEST(Error, LocationAndCodeForm) {
    EXPECT_STREQ("(SetView@src/dewarp:985) [Error EINVAL (22)]", Error(SetViewSite, EINVAL).what());
}

TEST(Error, LocationAndMessageForm) {
    EXPECT_STREQ("(SetView@src/dewarp:985) - Invalid pointer to image",
                 Error(SetViewSite, "Invalid pointer to %s", "image").what());
}

TEST(Error, LocationCodeAndMessageForm) {
    EXPECT_STREQ("(SetView@src/dewarp:985) [Error EINVAL (22)] - Invalid view",
                 Error(SetViewSite, EINVAL, "Invalid view").what());
    EXPECT_STREQ(
        "(Channel::GetViewObject@src/channel:567) [Error ENOMEM (12)] - Invalid view",
        Error(CodeLocation("src/channel", "Channel", "GetViewObject", 567), ENOMEM, "Invalid view")
            .what());
}

TEST(Error, CodeAndMessageForm) {
    EXPECT_STREQ("[Error EFAULT (14)] - Invalid pointer to settings",
                 Error(EFAULT, "Invalid pointer to %s", "settings").what());
}

TEST(Error, MessageForm) {
    EXPECT_STREQ("Invalid zoom, must be 0.500000 or greater",
                 Error("Invalid %s, must be %f or greater", "zoom", 0.5).what());
}

// Each form with arguments has a twin that takes them as a va_list.
Error FromList(char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    Error error(format, arguments);
    va_end(arguments);
    return error;
}

Error FromListWithCode(int code, char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    Error error(code, format, arguments);
    va_end(arguments);
    return error;
}

Error FromListAt(CodeLocation const& location, char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    Error error(location, format, arguments);
    va_end(arguments);
    return error;
}

Error FromListAtWithCode(CodeLocation const& location, int code, char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    Error error(location, code, format, arguments);
    va_end(arguments);
    return error;
}

TEST(Error, ListTwinsGiveTheSameTexts) {
    EXPECT_STREQ(Error("a %d", 1).what(), FromList("a %d", 1).what());
    EXPECT_STREQ(Error(EDOM, "b %d", 2).what(), FromListWithCode(EDOM, "b %d", 2).what());
    EXPECT_STREQ(Error(SetViewSite, "c %d", 3).what(), FromListAt(SetViewSite, "c %d", 3).what());
    EXPECT_STREQ(Error(SetViewSite, EDOM, "d %d", 4).what(),
                 FromListAtWithCode(SetViewSite, EDOM, "d %d", 4).what());
}

TEST(Error, AMessageOfThreeHundredCharactersIsKeptWhole) {
    char const message[] =
        "012345678901234567890123456789012345678901234567890123456789"
        "012345678901234567890123456789012345678901234567890123456789"
        "012345678901234567890123456789012345678901234567890123456789"
        "012345678901234567890123456789012345678901234567890123456789"
        "012345678901234567890123456789012345678901234567890123456789";
    static_assert(sizeof message == 301);
    EXPECT_EQ(std::string(message), Error(message).what());
}

TEST(Error, ALongExpansionWithArgumentsIsKeptWhole) {
    std::string const part(400, 'y');
    EXPECT_EQ(part + "-7-" + part, Error("%s-%d-%s", part.c_str(), 7, part.c_str()).what());
}

TEST(Error, TheTextNeverEndsInANewline) {
    for (std::string const& text : {std::string(Error(SetViewSite, EINVAL).what()),
                                    std::string(Error(SetViewSite, EINVAL, "Invalid view").what()),
                                    std::string(Error(EINVAL, "Invalid view").what())}) {
        ASSERT_FALSE(text.empty());
        EXPECT_NE('\n', text.back()) << text;
    }
}

TEST(Error, DefaultHasAnEmptyText) {
    EXPECT_STREQ("", Error().what());
}

TEST(Error, SetLastErrorStoresTheCodeInErrno) {
    errno = 0;
    Error::SetLastError(EFAULT);
    EXPECT_EQ(EFAULT, errno);
}

TEST(Error, IsThrownByValueAndCaughtAsAStandardException) {
    EXPECT_THAT([] { throw Error(SetViewSite, EINVAL, "Invalid view"); },
                ThrowsMessage<std::exception>(HasSubstr("[Error EINVAL (22)] - Invalid view")));
}

TEST(Error, StreamsAsItsText) {
    std::ostringstream stream;
    stream << Error(EINVAL, "Invalid view");
    EXPECT_EQ("[Error EINVAL (22)] - Invalid view", stream.str());
}

TEST(Error, CopiesKeepTheText) {
    Error const original(SetViewSite, EINVAL, "Invalid view");
    Error const copy(original);
    Error assigned;
    assigned = original;
    EXPECT_STREQ(original.what(), copy.what());
    EXPECT_STREQ(original.what(), assigned.what());
}

TEST(Error, AssignmentToItselfWarnsAndKeepsTheText) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Error error(EINVAL, "Invalid view");
    Error& same = error;
    error = same;
    EXPECT_STREQ("[Error EINVAL (22)] - Invalid view", error.what());
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Error object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
