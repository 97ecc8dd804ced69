// With which type each device property is read.
#include "oru/oru_ocl/deviceproperty.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/oru_ocl/internal/devicepropertytable.h"
#include "oru/oru_ocl/range.h"

#include <cstddef>
#include <cstdint>

namespace ORU::OCL {

namespace {

struct Slot {
    Enum::DeviceProperty property = Enum::DeviceProperty(0);
    std::string type;
};

constexpr std::size_t kFirstProperty = Enum::DEVICEPROPERTY_TYPE;
constexpr std::size_t kTableSize = Enum::DEVICEPROPERTY_OPENCL_C_VERSION - kFirstProperty + 1;

Slot gTable[kTableSize];

Slot &SlotOf(Enum::DeviceProperty property) {
    // A value below the first wraps to a large index.
    std::size_t const index = static_cast<std::size_t>(property) - kFirstProperty;
    ORU_ASSERT_TEXT("property_index < table_size", index < kTableSize);
    return gTable[index];
}

#define ORU_CL_DEVICE_PROPERTY(Property, Constant, Type)                                           \
    static_assert(Enum::Property == Constant, "a property is its constant of the headers");
#include "oru/oru_ocl/internal/deviceproperty_rows.inc"

} // namespace

void FillDevicePropertyTable() {
    struct Row {
        Enum::DeviceProperty property;
        std::string const &type;
    };
    Row const rows[] = {
#define ORU_CL_DEVICE_PROPERTY(Property, Constant, Type)                                           \
    {Enum::Property, Enum::GetTypeName<Type>()},
#include "oru/oru_ocl/internal/deviceproperty_rows.inc"
    };
    for (Row const &row : rows)
        SlotOf(row.property) = {row.property, row.type};
}

std::string const &Enum::GetPropertyTypeName(DeviceProperty property) {
    return SlotOf(property).type;
}

std::string Enum::DescribeTypes(DeviceProperty property, std::string const &read) {
    auto const readable = [](std::string const &type) -> std::string {
        return type == GetTypeName<char *>()          ? "std::string"
               : type == GetTypeName<unsigned int>()  ? "unsigned int"
               : type == GetTypeName<std::uint64_t>() ? "std::uint64_t"
               : type == GetTypeName<Range<3>>()      ? "Range<3>"
               : type.empty()                         ? "unknown"
                                                      : type;
    };
    return ComposeText("read as ", readable(read), ", but property ", property, " is ",
                       readable(GetPropertyTypeName(property)));
}

} // namespace ORU::OCL
