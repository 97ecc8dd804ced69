// What an OpenCL runtime answers, when it announces other sizes than it gives.
#include "fuzz/harness.h"

#include "oru/oru_ocl/internal/infoquery.h"
#include "oru/oru_ocl/internal/profiletext.h"

#include <algorithm>

#include <fuzzer/FuzzedDataProvider.h>

namespace {

/// The two calls of a query: the first tells how many bytes there are, the second gives as many as
/// it has and as there is room for.
class Runtime {
public:
    Runtime(std::size_t announced, std::string const &content)
        : announced_(announced), content_(content) {}

    void operator()(std::size_t room, void *value, std::size_t *bytes) const {
        if (bytes)
            *bytes = announced_;
        if (value)
            std::copy_n(content_.data(), std::min(room, content_.size()),
                        static_cast<char *>(value));
    }

private:
    std::size_t announced_;
    std::string content_;
};

} // namespace

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    using namespace ORU::OCL;
    FuzzedDataProvider input(data, size);
    std::size_t const announced = input.ConsumeIntegralInRange<std::size_t>(0, 300);
    std::string const content = input.ConsumeRemainingBytesAsString();
    Runtime const runtime(announced, content);

    std::string const characters = QueryCharacters(runtime);
    std::string expected = content.substr(0, announced);
    expected.resize(announced);
    HOLDS(characters == expected);
    std::string const text = QueryText(runtime);
    HOLDS(text == expected.substr(0, expected.find('\0')));
    ProfileOf(text);
    HOLDS(QueryList<std::uint64_t>(runtime).size() == announced / sizeof(std::uint64_t));
    auto const devices = [&](cl_uint room, cl_device_id *handles, cl_uint *count) {
        runtime(room * sizeof *handles, handles, nullptr);
        if (count)
            *count = static_cast<cl_uint>(announced);
    };
    HOLDS(QueryHandles<cl_device_id>(devices).size() == announced);
    return 0;
}
