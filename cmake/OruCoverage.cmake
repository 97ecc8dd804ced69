# Counts which lines of the library run; tools/coverage reports them.
include_guard(GLOBAL)

option(ORU_COVERAGE "Count which lines of oru/ the tests run; by GCC only (tools/coverage)" OFF)
if(ORU_COVERAGE)
    add_link_options(--coverage)
endif()

# oru_count_lines(<target>): each program that ends adds its counts to .gcda files beside the objects of <target>,
# the library. A folder of tests that sets ORU_TESTS_HAVE_LINES has them count too, for templates that only they
# compile. The library compiles everything else that is in headers itself, for it exports whole classes.
function(oru_count_lines target)
    if(ORU_COVERAGE)
        # Atomic, for threads that count the same line; little optimisation keeps lines apart.
        target_compile_options(${target} PRIVATE --coverage -fprofile-update=atomic -O1)
    endif()
endfunction()
