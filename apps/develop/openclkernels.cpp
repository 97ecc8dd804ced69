// The OpenCL kernels of the unsharp mask.
#include "apps/develop/openclkernels.h"

namespace Develop {

// The sums are those of the GLSL passes, tap by tap.
char const *const kSharpenKernels = R"(
constant sampler_t kTexel = CLK_NORMALIZED_COORDS_FALSE | CLK_ADDRESS_CLAMP_TO_EDGE |
                            CLK_FILTER_NEAREST;

kernel void loadTexture(read_only image2d_t texture, global float4 *light, int2 size) {
    int2 p = (int2)(get_global_id(0), get_global_id(1));
    if (p.x < size.x && p.y < size.y)
        light[p.y * size.x + p.x] = read_imagef(texture, kTexel, p);
}

kernel void storeTexture(write_only image2d_t texture, global float4 const *light, int2 size) {
    int2 p = (int2)(get_global_id(0), get_global_id(1));
    if (p.x < size.x && p.y < size.y)
        write_imagef(texture, p, light[p.y * size.x + p.x]);
}

kernel void blurRows(global float4 const *light, global float4 *rows, int2 size,
                     global float const *weights, int taps) {
    int2 p = (int2)(get_global_id(0), get_global_id(1));
    if (p.x >= size.x || p.y >= size.y)
        return;
    global float4 const *row = light + p.y * size.x;
    float4 sum = weights[0] * row[p.x];
    for (int k = 1; k < taps; ++k)
        sum += weights[k] * (row[max(p.x - k, 0)] + row[min(p.x + k, size.x - 1)]);
    rows[p.y * size.x + p.x] = sum;
}

kernel void sharpenColumns(global float4 *light, global float4 const *rows, int2 size,
                           global float const *weights, int taps, float amount,
                           float4 colours) {
    int2 p = (int2)(get_global_id(0), get_global_id(1));
    if (p.x >= size.x || p.y >= size.y)
        return;
    global float4 const *column = rows + p.x;
    float4 sum = weights[0] * column[p.y * size.x];
    for (int k = 1; k < taps; ++k)
        sum += weights[k] * (column[max(p.y - k, 0) * size.x] +
                             column[min(p.y + k, size.y - 1) * size.x]);
    float4 v = light[p.y * size.x + p.x];
    light[p.y * size.x + p.x] = mix(v, max(v + amount * (v - sum), 0.0f), colours);
}
)";

} // namespace Develop
