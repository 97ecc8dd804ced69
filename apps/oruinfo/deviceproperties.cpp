// What an OpenCL device tells of itself.
#include "apps/oruinfo/deviceproperties.h"

#include "apps/oruinfo/failuretext.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/extensionmanagerocl.h"
#include "oru/oru_ocl/platform.h"
#include "oru/oru_ocl/range.h"

#include <algorithm>
#include <cctype>

namespace OruInfo {

namespace OCL = ORU::OCL;

namespace {

/// The name of a value, or of a bit.
struct Named {
    std::uint64_t value;
    char const *name;
};
using NamedList = std::vector<Named>;

/// How a property's number is to be read.
struct Meaning {
    enum Kind { COUNT, BOOLEAN, ENUMERATION, FLAGS } kind = COUNT;
    char const *unit = "";
    NamedList names = {};
};

Meaning Unit(char const *unit) {
    return {Meaning::COUNT, unit, {}};
}

#define ORU_NAMED(Constant)                                                                        \
    { Constant, #Constant }
Meaning const kCount, kBoolean{Meaning::BOOLEAN};
Meaning const kTypes{Meaning::FLAGS,
                     "",
                     {ORU_NAMED(CL_DEVICE_TYPE_DEFAULT), ORU_NAMED(CL_DEVICE_TYPE_CPU),
                      ORU_NAMED(CL_DEVICE_TYPE_GPU), ORU_NAMED(CL_DEVICE_TYPE_ACCELERATOR),
                      ORU_NAMED(CL_DEVICE_TYPE_CUSTOM)}};
Meaning const kFloatConfig{
    Meaning::FLAGS,
    "",
    {ORU_NAMED(CL_FP_DENORM), ORU_NAMED(CL_FP_INF_NAN), ORU_NAMED(CL_FP_ROUND_TO_NEAREST),
     ORU_NAMED(CL_FP_ROUND_TO_ZERO), ORU_NAMED(CL_FP_ROUND_TO_INF), ORU_NAMED(CL_FP_FMA),
     ORU_NAMED(CL_FP_SOFT_FLOAT), ORU_NAMED(CL_FP_CORRECTLY_ROUNDED_DIVIDE_SQRT)}};
Meaning const kExecution{
    Meaning::FLAGS, "", {ORU_NAMED(CL_EXEC_KERNEL), ORU_NAMED(CL_EXEC_NATIVE_KERNEL)}};
Meaning const kQueue{
    Meaning::FLAGS,
    "",
    {ORU_NAMED(CL_QUEUE_OUT_OF_ORDER_EXEC_MODE_ENABLE), ORU_NAMED(CL_QUEUE_PROFILING_ENABLE)}};
Meaning const kCacheType{
    Meaning::ENUMERATION,
    "",
    {ORU_NAMED(CL_NONE), ORU_NAMED(CL_READ_ONLY_CACHE), ORU_NAMED(CL_READ_WRITE_CACHE)}};
Meaning const kLocalMemory{
    Meaning::ENUMERATION, "", {ORU_NAMED(CL_NONE), ORU_NAMED(CL_LOCAL), ORU_NAMED(CL_GLOBAL)}};
#undef ORU_NAMED

struct Row {
    OCL::Enum::DeviceProperty property;
    char const *constant;
    Meaning meaning;
};

#define ORU_ROW(Name, Meaning)                                                                     \
    { OCL::Enum::DEVICEPROPERTY_##Name, "CL_DEVICE_" #Name, Meaning }
Row const kRows[] = {
    ORU_ROW(NAME, kCount),
    ORU_ROW(VENDOR, kCount),
    ORU_ROW(VENDOR_ID, kCount),
    ORU_ROW(TYPE, kTypes),
    ORU_ROW(VERSION, kCount),
    {OCL::Enum::DEVICEPROPERTY_DRIVER_VERSION, "CL_DRIVER_VERSION", kCount},
    ORU_ROW(OPENCL_C_VERSION, kCount),
    ORU_ROW(PROFILE, kCount),
    ORU_ROW(PLATFORM, kCount),
    ORU_ROW(AVAILABLE, kBoolean),
    ORU_ROW(COMPILER_AVAILABLE, kBoolean),
    ORU_ROW(MAX_COMPUTE_UNITS, kCount),
    ORU_ROW(MAX_CLOCK_FREQUENCY, Unit("MHz")),
    ORU_ROW(ADDRESS_BITS, Unit("bits")),
    ORU_ROW(ENDIAN_LITTLE, kBoolean),
    ORU_ROW(GLOBAL_MEM_SIZE, Unit("bytes")),
    ORU_ROW(GLOBAL_MEM_CACHE_TYPE, kCacheType),
    ORU_ROW(GLOBAL_MEM_CACHE_SIZE, Unit("bytes")),
    ORU_ROW(GLOBAL_MEM_CACHELINE_SIZE, Unit("bytes")),
    ORU_ROW(MAX_MEM_ALLOC_SIZE, Unit("bytes")),
    ORU_ROW(LOCAL_MEM_TYPE, kLocalMemory),
    ORU_ROW(LOCAL_MEM_SIZE, Unit("bytes")),
    ORU_ROW(MAX_CONSTANT_BUFFER_SIZE, Unit("bytes")),
    ORU_ROW(MAX_CONSTANT_ARGS, kCount),
    ORU_ROW(MAX_PARAMETER_SIZE, Unit("bytes")),
    ORU_ROW(MEM_BASE_ADDR_ALIGN, Unit("bits")),
    ORU_ROW(MIN_DATA_TYPE_ALIGN_SIZE, Unit("bytes")),
    ORU_ROW(HOST_UNIFIED_MEMORY, kBoolean),
    ORU_ROW(ERROR_CORRECTION_SUPPORT, kBoolean),
    ORU_ROW(MAX_WORK_ITEM_DIMENSIONS, kCount),
    ORU_ROW(MAX_WORK_ITEM_SIZES, Unit("work items")),
    ORU_ROW(MAX_WORK_GROUP_SIZE, Unit("work items")),
    ORU_ROW(IMAGE_SUPPORT, kBoolean),
    ORU_ROW(IMAGE2D_MAX_WIDTH, Unit("pixels")),
    ORU_ROW(IMAGE2D_MAX_HEIGHT, Unit("pixels")),
    ORU_ROW(IMAGE3D_MAX_WIDTH, Unit("pixels")),
    ORU_ROW(IMAGE3D_MAX_HEIGHT, Unit("pixels")),
    ORU_ROW(IMAGE3D_MAX_DEPTH, Unit("pixels")),
    ORU_ROW(MAX_READ_IMAGE_ARGS, kCount),
    ORU_ROW(MAX_WRITE_IMAGE_ARGS, kCount),
    ORU_ROW(MAX_SAMPLERS, kCount),
    ORU_ROW(SINGLE_FP_CONFIG, kFloatConfig),
    ORU_ROW(DOUBLE_FP_CONFIG, kFloatConfig),
    ORU_ROW(HALF_FP_CONFIG, kFloatConfig),
    ORU_ROW(EXECUTION_CAPABILITIES, kExecution),
    ORU_ROW(QUEUE_PROPERTIES, kQueue),
    ORU_ROW(PROFILING_TIMER_RESOLUTION, Unit("nanoseconds")),
    ORU_ROW(PREFERRED_VECTOR_WIDTH_CHAR, kCount),
    ORU_ROW(PREFERRED_VECTOR_WIDTH_SHORT, kCount),
    ORU_ROW(PREFERRED_VECTOR_WIDTH_INT, kCount),
    ORU_ROW(PREFERRED_VECTOR_WIDTH_LONG, kCount),
    ORU_ROW(PREFERRED_VECTOR_WIDTH_HALF, kCount),
    ORU_ROW(PREFERRED_VECTOR_WIDTH_FLOAT, kCount),
    ORU_ROW(PREFERRED_VECTOR_WIDTH_DOUBLE, kCount),
    ORU_ROW(NATIVE_VECTOR_WIDTH_CHAR, kCount),
    ORU_ROW(NATIVE_VECTOR_WIDTH_SHORT, kCount),
    ORU_ROW(NATIVE_VECTOR_WIDTH_INT, kCount),
    ORU_ROW(NATIVE_VECTOR_WIDTH_LONG, kCount),
    ORU_ROW(NATIVE_VECTOR_WIDTH_HALF, kCount),
    ORU_ROW(NATIVE_VECTOR_WIDTH_FLOAT, kCount),
    ORU_ROW(NATIVE_VECTOR_WIDTH_DOUBLE, kCount),
};
#undef ORU_ROW

Value FlagNames(std::uint64_t flags, NamedList const &known) {
    Names names;
    for (Named const &bit : known) {
        if (flags & bit.value)
            names.emplace_back(bit.name);
        flags &= ~bit.value;
    }
    if (flags != 0)
        names.push_back(std::to_string(flags)); // younger than the names here
    return names;
}

Value Interpreted(std::uint64_t number, Meaning const &meaning) {
    switch (meaning.kind) {
    case Meaning::BOOLEAN:
        return number != 0;
    case Meaning::FLAGS:
        return FlagNames(number, meaning.names);
    case Meaning::ENUMERATION:
        for (Named const &known : meaning.names)
            if (known.value == number)
                return std::string(known.name);
        return std::to_string(number);
    default:
        return {number, meaning.unit};
    }
}

/// A property that typed queries refuse: flags or a count.
std::uint64_t RawNumber(OCL::Device const &device, OCL::Enum::DeviceProperty property) {
    std::uint64_t number = 0; // the shorter ones fill its lower half
    ORU_CL(GetDeviceInfo, device.id(), cl_device_info(property), sizeof number, &number, nullptr);
    return number;
}

/// A text up to its zero: some runtimes shorten one and tell its former length.
std::string WithoutRest(std::string const &text) {
    return text.substr(0, text.find('\0'));
}

Value Ask(OCL::Device const &device, Row const &row) {
    std::string const &type = OCL::Enum::GetPropertyTypeName(row.property);
    if (type == OCL::Enum::GetTypeName<char *>())
        return WithoutRest(device.getInfo<std::string>(row.property));
    if (type == OCL::Enum::GetTypeName<cl_platform_id>())
        return OCL::Platform(device.getInfo<cl_platform_id>(row.property)).name();
    if (type == OCL::Enum::GetTypeName<OCL::Range<3>>()) {
        auto const sizes = device.getInfo<OCL::Range<3>>(row.property);
        return {Numbers(sizes.begin(), sizes.end()), row.meaning.unit};
    }
    std::uint64_t const number = type == OCL::Enum::GetTypeName<unsigned int>()
                                     ? device.getInfo<unsigned int>(row.property)
                                 : type == OCL::Enum::GetTypeName<std::uint64_t>()
                                     ? device.getInfo<std::uint64_t>(row.property)
                                     : RawNumber(device, row.property);
    return Interpreted(number, row.meaning);
}

/// "max_samplers" of CL_DEVICE_MAX_SAMPLERS, "driver_version" of CL_DRIVER_VERSION.
std::string IdOf(std::string const &constant) {
    std::size_t const device = std::string("CL_DEVICE_").size();
    std::string id = constant.substr(constant.rfind("CL_DEVICE_", 0) == 0 ? device : 3);
    std::transform(id.begin(), id.end(), id.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return id;
}

} // namespace

Names Words(std::string const &text) {
    Names words;
    OCL::TokenizeExtensionString(text, words);
    return words;
}

void AddDeviceProperties(OCL::Device const &device, Group &group) {
    for (Row const &row : kRows)
        group.add(IdOf(row.constant), row.constant, Told([&] { return Ask(device, row); }));
    group.add("extensions", "CL_DEVICE_EXTENSIONS",
              Told([&] { return Value(Words(WithoutRest(device.extensions()))); }));
}

} // namespace OruInfo
