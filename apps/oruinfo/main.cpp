// oruinfo: what this machine offers.
#include "apps/common/unicode.h"
#include "apps/oruinfo/job.h"
#include "apps/oruinfo/options.h"

#include <cstdio>
#include <exception>

int main() {
    try {
        int exitCode = 0;
        auto const options = OruInfo::ParseOptions(App::CommandLineArguments(), exitCode);
        return options ? OruInfo::RunJob(*options) : exitCode;
    } catch (std::exception const &failure) {
        std::fprintf(stderr, "oruinfo: %s\n", failure.what());
        return 1;
    }
}
