// What became of the photos of a run.
#include "apps/develop/runreport.h"

#include "apps/develop/console.h"

#include "oru/version.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <cmath>

namespace Develop {

using Json = nlohmann::ordered_json;
using Status = PhotoRecord::Status;

namespace {

constexpr std::pair<Status, char const *> kStatusNames[] = {{Status::Developed, "developed"},
                                                            {Status::Failed, "failed"},
                                                            {Status::Skipped, "skipped"},
                                                            {Status::Cancelled, "cancelled"}};

char const *NameOf(Status status) {
    return std::find_if(std::begin(kStatusNames), std::end(kStatusNames),
                        [status](auto const &row) { return row.first == status; })
        ->second;
}

/// Tenths are enough.
double Rounded(double milliseconds) {
    return std::round(milliseconds * 10) / 10;
}

Json ToJson(PhotoRecord const &photo) {
    Json fields = {{"input", WithoutDrive(photo.input)}};
    if (!photo.output.empty())
        fields["output"] = WithoutDrive(photo.output);
    fields["status"] = NameOf(photo.status);
    if (!photo.reason.empty())
        fields["reason"] = WithoutDrive(photo.reason);
    fields["notes"] = photo.notes;
    if (photo.shape) {
        fields["width"] = photo.shape->width;
        fields["height"] = photo.shape->height;
        fields["channels"] = photo.shape->channels;
        fields["bitsPerChannel"] = photo.shape->bitsPerChannel;
    }
    if (!photo.colourSpace.empty())
        fields["colourSpace"] = photo.colourSpace;
    if (photo.status == Status::Developed)
        fields["milliseconds"] = Rounded(photo.milliseconds);
    return fields;
}

} // namespace

std::size_t RunReport::count(Status status) const {
    auto const isOfStatus = [status](PhotoRecord const &photo) { return photo.status == status; };
    return static_cast<std::size_t>(std::count_if(photos.begin(), photos.end(), isOfStatus));
}

std::string RunReport::json() const {
    Json whole = {{"develop", {{"schema", 1}, {"version", ORU::Version()}}}};
    if (!problem.empty())
        whole["problem"] = WithoutDrive(problem);
    Json &records = whole["photos"] = Json::array();
    for (PhotoRecord const &photo : photos)
        records.push_back(ToJson(photo));
    Json &totals = whole["totals"] = {{"photos", photos.size()}};
    for (auto const &[status, name] : kStatusNames)
        totals[name] = count(status);
    totals["milliseconds"] = Rounded(milliseconds);
    // Names from the command line may be of any encoding.
    return whole.dump(1, ' ', false, Json::error_handler_t::replace) + "\n";
}

} // namespace Develop
