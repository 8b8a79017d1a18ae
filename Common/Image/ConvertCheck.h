#ifndef AVPOST_COMMON_IMAGE_CONVERTCHECK_H
#define AVPOST_COMMON_IMAGE_CONVERTCHECK_H

// Preconditions of the colour converters. Unlike assert() they stay active in every build:
// hosts rely on a converter stopping the process rather than writing through a bad pointer.

namespace avpost::detail {

// Prints "Common/Image/ImageConvert:<line>: failed assertion `<expression>'" on standard error,
// then aborts.
[[noreturn]] void FailConversionCheck(unsigned line, const char* expression);

}  // namespace avpost::detail

// Checks an expression and reports its own text.
#define AVPOST_CONVERT_CHECK(expression) \
    ((expression) ? void(0) : ::avpost::detail::FailConversionCheck(__LINE__, #expression))

// Checks a condition that is evaluated differently (wider or unsigned arithmetic) from the
// expression it reports.
#define AVPOST_CONVERT_CHECK_AS(condition, text) \
    ((condition) ? void(0) : ::avpost::detail::FailConversionCheck(__LINE__, text))

#endif
