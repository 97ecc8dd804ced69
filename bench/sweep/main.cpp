// Runs one scenario again and again, each time with another call or allocation failing, and tells
// what came of it.
//
// Usage: sweep SCENARIO calls|allocations
//
// A line for each failure that nobody noticed, that is reported by the wrong exception, that leaks,
// or after which the scenario does not run any more; a line of figures at the end. Ends with 1 when
// there was one. Without arguments it prints the names of the scenarios.
#include "bench/sweep/faults.h"
#include "bench/sweep/scenarios.h"

#include "oru/core/exceptions/logicalexception.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/platformgl.h"
#include "tests/support/testruntime.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <new>
#include <optional>
#include <sstream>

namespace {

using namespace sweep;
namespace fs = std::filesystem;

constexpr char kErrors[] = "errors.txt";

std::string Contents(fs::path const &path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

/// What one run of the scenario led to.
struct Outcome {
    enum How { Nothing, OutOfMemory, OfTheLibrary, OfTheProgram, Strange } how = Nothing;
    char text[300] = ""; // no string: its memory would count
};

class Sweep {
public:
    Sweep(Scenario const &scenario, Kind kind) : scenario_(scenario), kind_(kind) {
        std::freopen(kErrors, "w", stderr);
        if (kind == Kind::Call)
            runtime_.emplace("ocl_runtime");
        if (scenario.needs == Needs::OpenCL &&
            !ORU::OCL::Library::IsOpenCLAvailable(runtime_ ? runtime_->folder() : ""))
            throw std::runtime_error("no OpenCL runtime");
        InstallHooks();
        if (scenario.needs == Needs::OpenGL || scenario.needs == Needs::Context)
            openGL_.emplace();
        if (scenario.needs == Needs::OpenCL)
            openCL_.emplace();
        if (scenario.needs == Needs::Context)
            context_.emplace().makeCurrent();
        for (int warmUp = 0; warmUp < 3; ++warmUp)
            if (Outcome const outcome = run(0); outcome.how != Outcome::Nothing)
                throw std::runtime_error(std::string("does not run at all: ") + outcome.text);
        picture_ = Contents(fs::path(kOutput) / kPhoto);
    }

    /// @return the number of findings
    unsigned all() {
        unsigned count = 1;
        for (unsigned failing = 1; failing <= count; ++failing) {
            run(0);
            count = Count();
            if (failing <= count)
                one(failing);
        }
        std::printf("%s: %u %s failed once each: %u reported, %u may go unnoticed, %u findings\n",
                    scenario_.name, count, kind_ == Kind::Call ? "calls" : "allocations", reported_,
                    unnoticed_, findings_);
        return findings_;
    }

private:
    void one(unsigned failing) {
        std::printf("%u\r", failing); // the last one, for who sees a crash
        std::fflush(stdout);
        long const handles = this->handles();
        Holdings const before = CurrentHoldings();
        Outcome const outcome = run(failing);
        Holdings const after = CurrentHoldings();
        std::string const name = FailedName();
        auto const finding = [&](std::string const &what) {
            ++findings_;
            std::printf("%s %u (%s): %s; %s\n", scenario_.name, failing, name.c_str(), what.c_str(),
                        outcome.text);
        };
        judge(outcome, name, finding);
        // A program's names go with its context; a context that the system does not let go of
        // stays.
        bool const isKept = name == "wglMakeCurrent" && outcome.how == Outcome::Nothing;
        if (after.names != before.names && picture_.empty())
            finding(std::to_string(after.names - before.names) + " names are left");
        if (after.contexts != before.contexts && !isKept)
            finding(std::to_string(after.contexts - before.contexts) + " contexts are left");
        if (after.memory > before.memory && grows(failing))
            finding(std::to_string(after.memory - before.memory) + " blocks of memory are left");
        if (this->handles() != handles)
            finding(std::to_string(this->handles() - handles) + " OpenCL handles are left");
        if (Outcome const again = run(0); again.how != Outcome::Nothing)
            finding(std::string("it does not run afterwards: ") + again.text);
    }

    /// Whether a failure takes memory each time, and not only the first one of its kind.
    bool grows(unsigned failing) {
        long const before = CurrentHoldings().memory;
        run(failing);
        run(failing);
        return CurrentHoldings().memory > before + 1;
    }

    bool mayGoUnnoticed(std::string const &name) const {
        // What destructors call is in every list.
        std::istringstream beginnings(std::string("glDelete wglDelete ") + scenario_.unnoticed);
        for (std::string beginning; beginnings >> beginning;)
            if (name.rfind(beginning, 0) == 0)
                return true;
        return FailedAtEnd() || kind_ == Kind::Allocation;
    }

    template<class Finding>
    void judge(Outcome const &outcome, std::string const &name, Finding const &finding) {
        std::string const errors = Contents(kErrors).substr(errorsBefore_);
        bool const isProgram = !picture_.empty();
        std::string const made = isProgram ? Contents(fs::path(kOutput) / kPhoto) : "";
        if (outcome.how == Outcome::Nothing) {
            if (isProgram ? made == picture_ : mayGoUnnoticed(name))
                ++unnoticed_;
            else
                finding("nobody notices");
            return;
        }
        ++reported_;
        if (isProgram) {
            if (outcome.how != Outcome::OfTheProgram)
                finding("the program did not catch it");
            if (std::count(errors.begin(), errors.end(), '\n') != 1)
                finding("the program says \"" + errors + '"');
            // What fails after the picture got its name leaves it, whole.
            if (!fs::is_empty(kOutput) && made != picture_)
                finding("the program leaves a file behind");
            return;
        }
        if (outcome.how != (kind_ == Kind::Call ? Outcome::OfTheLibrary : Outcome::OutOfMemory))
            finding("another exception");
        else if (name.rfind("gl", 0) == 0 && !mayGoUnnoticed(name) &&
                 !std::strstr(outcome.text, "GL_OUT_OF_MEMORY"))
            finding("the exception does not tell the error");
    }

    Outcome run(unsigned failing) {
        if (fs::exists(kOutput))
            for (fs::directory_entry const &file : fs::directory_iterator(kOutput))
                fs::remove(file.path());
        std::fflush(stderr);
        errorsBefore_ = fs::file_size(kErrors);
        Outcome outcome;
        Arm(kind_, failing);
        try {
            scenario_.run();
        } catch (ProgramFailed const &failure) {
            note(outcome, Outcome::OfTheProgram, failure.what());
        } catch (ORU::LogicalException const &failure) {
            note(outcome, Outcome::OfTheLibrary, failure.what(), failure.message());
        } catch (std::bad_alloc const &failure) {
            note(outcome, Outcome::OutOfMemory, failure.what());
        } catch (std::exception const &failure) {
            note(outcome, Outcome::Strange, failure.what());
        }
        Disarm();
        std::fflush(stderr);
        if (failing > 0 && context_)
            putRight();
        return outcome;
    }

    /// Ends what a call that failed was to end; where nothing is left, these are errors.
    static void putRight() {
        using ORU::DropExceptions;
        DropExceptions([] { ORU_GL0(PopClientAttrib); }); // where a transfer left pixel storage
        DropExceptions([] { ORU_GL0(EndConditionalRender); });
        DropExceptions([] { ORU_GL0(EndTransformFeedback); });
        // What was bound inside a transfer is part of the storage.
        DropExceptions([] { ORU_GL(BindBuffer, GL_PIXEL_PACK_BUFFER, 0); });
        DropExceptions([] { ORU_GL(BindBuffer, GL_PIXEL_UNPACK_BUFFER, 0); });
    }

    static void note(Outcome &outcome, Outcome::How how, char const *what, char const *more = "") {
        outcome.how = how;
        std::snprintf(outcome.text, sizeof outcome.text, "%s: %s", what, more);
    }

    long handles() {
        long sum = 0;
        if (runtime_)
            for (auto const &[handle, references] : (*runtime_)->references())
                sum += references;
        return sum;
    }

    Scenario const &scenario_;
    Kind kind_;
    std::optional<oru_test::TestRuntime> runtime_;
    std::optional<ORU::OGL::AutoInitializer> openGL_;
    std::optional<ORU::OCL::AutoInitializer> openCL_;
    std::optional<ORU::OGL::ContextOffscreen> context_;
    std::string picture_; ///< what develop makes when nothing fails
    std::uintmax_t errorsBefore_ = 0;
    unsigned reported_ = 0, unnoticed_ = 0, findings_ = 0;
};

} // namespace

int main(int count, char **arguments) {
    if (count != 3) {
        for (Scenario const &scenario : Scenarios())
            std::puts(scenario.name);
        return 0;
    }
    std::string const kind = arguments[2];
    for (Scenario const &scenario : Scenarios())
        if (scenario.name == std::string(arguments[1]))
            try {
                return Sweep(scenario, kind == "calls" ? Kind::Call : Kind::Allocation).all() ? 1
                                                                                              : 0;
            } catch (std::exception const &failure) {
                std::printf("%s: %s\n", scenario.name, failure.what());
                return 1;
            }
    std::printf("sweep: there is no scenario %s\n", arguments[1]);
    return 2;
}
