// develop: photos developed on the GPU.
#include "apps/common/unicode.h"
#include "apps/develop/job.h"
#include "apps/develop/options.h"

#include <cstdio>
#include <exception>

int main() {
    try {
        int exitCode = 0;
        auto const options = Develop::ParseOptions(App::CommandLineArguments(), exitCode);
        return options ? Develop::RunJob(*options) : exitCode;
    } catch (std::exception const &failure) {
        std::fprintf(stderr, "develop: %s\n", failure.what());
        return 1;
    }
}
