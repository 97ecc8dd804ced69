// The OpenCL kernels of develop.
#include "apps/develop/openclkernels.h"

namespace Develop {

// The sums are those of the GLSL passes, tap by tap.
char const *const kSharedKernels = R"(
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

// A work item does SPAN pixels of a row in loops over its values, one after the other, which the
// compilers of processors turn into vector code.
char const *const kDevelopKernels = R"(
typedef struct {
    int width, height;             // of the source
    int channels, colours;         // all of a pixel; those that are not alpha
    int reach;                     // of the blur
    int left, top;                 // of the target in the source
    int targetWidth, targetHeight;
    int x, y;                      // of the target in the picture
    int tables;                    // curves: 1 for all channels, or one each
    int levels, indices, steps;    // values of a curve; entries of its index; steps from there
    int isLinear, becomesLinear;    // floats that are light itself
    int hasMatrix;
    int spots;                     // how many there are
    float amount, exposure, gain;
} Tile;

typedef struct {
    int x, y;                      // whole pixels of the centre, and the rest
    float restX, restY;
    float radius, stops;
} Spot;

// Linear light of rows that are continued at both ends.
#define DECODE(NAME, CODE, LIGHT)                                                                  \
    kernel void NAME(constant Tile *tile, global CODE const *restrict codes,                       \
                     global float const *restrict lights, global float *restrict light) {          \
        int const width = tile->width, channels = tile->channels, reach = tile->reach;             \
        int const tables = tile->tables, levels = tile->levels, isLinear = tile->isLinear;         \
        int const first = (int)get_global_id(0) * SPAN;                                            \
        int const end = min(first + SPAN, width + 2 * reach);                                      \
        global CODE const *restrict row = codes + (int)get_global_id(1) * width * channels;        \
        global float *restrict target =                                                            \
            light + (int)get_global_id(1) * (width + 2 * reach) * channels;                        \
        for (int p = first; p < end; ++p) {                                                        \
            int const from = clamp(p - reach, 0, width - 1) * channels;                            \
            for (int c = 0; c < channels; ++c) {                                                   \
                global float const *curve = lights + min(c, tables - 1) * levels;                  \
                target[p * channels + c] = LIGHT(row[from + c]);                                   \
            }                                                                                      \
        }                                                                                          \
    }

#define LIGHT_OF_CODE(code) curve[code]
#define LIGHT_OF_FLOAT(code) (isLinear ? code : Interpolated(curve, levels, code))

// A curve is continued beyond 1 by its last line.
float Interpolated(global float const *curve, int levels, float code) {
    float const place = max(code, 0.0f) * (levels - 1);
    int const below = (int)min(place, levels - 2.0f);
    return curve[below] + (place - below) * (curve[below + 1] - curve[below]);
}

float Inverted(global float const *curve, int levels, float light) {
    int below = 0;
    for (int step = levels / 2; step > 0; step /= 2)
        if (below + step < levels - 1 && curve[below + step] <= light)
            below += step;
    float const rise = curve[below + 1] - curve[below];
    return (below + (rise > 0.0f ? (light - curve[below]) / rise : 0.0f)) / (levels - 1);
}

#if BITS == 8
DECODE(decode8, uchar, LIGHT_OF_CODE)
#elif BITS == 16
DECODE(decode16, ushort, LIGHT_OF_CODE)
#else
DECODE(decode32, float, LIGHT_OF_FLOAT)
#endif

kernel void blurRows(constant Tile *tile, global float const *restrict light,
                     constant float *restrict weights, global float *restrict rows) {
    int const channels = tile->channels, reach = tile->reach;
    int const first = (int)get_global_id(0) * SPAN;
    int const count = min(SPAN, tile->width - first) * channels;
    int const y = get_global_id(1);
    global float const *restrict centre =
        light + (y * (tile->width + 2 * reach) + first + reach) * channels;
    global float *restrict target = rows + (y * tile->width + first) * channels;
    float sum[SPAN * 4];
    for (int i = 0; i < count; ++i)
        sum[i] = weights[0] * centre[i];
    for (int k = 1; k <= reach; ++k) {
        float const weight = weights[k];
        global float const *restrict before = centre - k * channels;
        global float const *restrict after = centre + k * channels;
        for (int i = 0; i < count; ++i)
            sum[i] += weight * (before[i] + after[i]);
    }
    for (int i = 0; i < count; ++i)
        target[i] = sum[i];
}

// The exposure that spots add to each pixel of the target.
kernel void paintSpots(constant Tile *tile, global Spot const *restrict spots,
                       global float *restrict stops) {
    int const first = (int)get_global_id(0) * SPAN;
    int const end = min(first + SPAN, tile->targetWidth);
    int const y = get_global_id(1);
    global float *restrict row = stops + y * tile->targetWidth;
    for (int p = first; p < end; ++p)
        row[p] = 0.0f;
    for (int s = 0; s < tile->spots; ++s) {
        Spot const spot = spots[s];
        float const down = (float)(tile->y + y - spot.y) + 0.5f - spot.restY;
        if (fabs(down) >= spot.radius)
            continue;
        int const margin = (int)spot.radius + 2;
        int const begin = max(first, spot.x - tile->x - margin);
        int const stop = min(end, spot.x - tile->x + margin + 1);
        for (int p = begin; p < stop; ++p) {
            float const across = (float)(tile->x + p - spot.x) + 0.5f - spot.restX;
            float const inside =
                1.0f - min(sqrt(across * across + down * down) / spot.radius, 1.0f);
            row[p] += spot.stops * inside * inside * (3.0f - 2.0f * inside);
        }
    }
}

// Blurs the columns, sharpens, brightens and encodes. The nearest code of a light is the number of
// thresholds that it reaches; an index by its root tells nearly how many those are.
#define ENCODE(NAME, CODE, CODE_OF)                                                                \
    kernel void NAME(constant Tile *tile, global CODE const *restrict codes,                       \
                     global float const *restrict light, global float const *restrict rows,        \
                     constant float *restrict weights, global float const *restrict stops,         \
                     constant float *restrict matrix, global ushort const *restrict index,         \
                     global float const *restrict thresholds, global CODE *restrict developed) {   \
        float v[SPAN * 4];                                                                         \
        Brightened(tile, light, rows, weights, stops, matrix, v);                                  \
        int const channels = tile->channels, colours = tile->colours;                              \
        int const tables = tile->tables, levels = tile->levels, isLinear = tile->becomesLinear;    \
        int const indices = tile->indices, steps = tile->steps;                                    \
        int const first = (int)get_global_id(0) * SPAN;                                            \
        int const count = min(SPAN, tile->targetWidth - first);                                    \
        int const y = get_global_id(1);                                                            \
        global CODE const *restrict source =                                                       \
            codes + ((y + tile->top) * tile->width + tile->left + first) * channels;               \
        global CODE *restrict target = developed + (y * tile->targetWidth + first) * channels;     \
        CODE_OF                                                                                    \
    }

#define EACH_VALUE(CODE)                                                                           \
    for (int p = 0; p < count; ++p)                                                                \
        for (int c = 0; c < channels; ++c) {                                                       \
            int const i = p * channels + c, table = min(c, tables - 1);                            \
            target[i] = c < colours ? CODE : source[i];                                            \
        }

#define CODE_OF_LIGHT                                                                              \
    int place[SPAN * 4];                                                                           \
    for (int i = 0; i < count * channels; ++i) {                                                   \
        v[i] = min(v[i], 1.0f);                                                                    \
        place[i] = (int)(sqrt(v[i]) * (indices - 1));                                              \
    }                                                                                              \
    EACH_VALUE(Reached(index[table * indices + place[i]], steps, thresholds + table * levels, v[i]))

#define FLOAT_OF_LIGHT                                                                             \
    EACH_VALUE(isLinear ? v[i] : Inverted(thresholds + table * levels, levels, v[i]))

int Reached(int code, int steps, global float const *thresholds, float light) {
    for (int s = 0; s < steps; ++s)
        code += light >= thresholds[code] ? 1 : 0;
    return code;
}

void Brightened(constant Tile *tile, global float const *restrict light,
                global float const *restrict rows, constant float *restrict weights,
                global float const *restrict stops, constant float *restrict matrix,
                float *restrict v) {
    int const channels = tile->channels, reach = tile->reach;
    int const first = (int)get_global_id(0) * SPAN;
    int const pixels = min(SPAN, tile->targetWidth - first), count = pixels * channels;
    int const y = get_global_id(1), sourceY = y + tile->top;
    int const lightPitch = (tile->width + 2 * reach) * channels;
    int const rowsPitch = tile->width * channels;
    global float const *restrict original =
        light + sourceY * lightPitch + (tile->left + first + reach) * channels;
    float const gain = tile->gain, amount = tile->amount;
    if (amount == 0.0f) {
        for (int i = 0; i < count; ++i)
            v[i] = original[i];
    } else {
        global float const *restrict column = rows + (tile->left + first) * channels;
        global float const *restrict centre = column + sourceY * rowsPitch;
        for (int i = 0; i < count; ++i)
            v[i] = weights[0] * centre[i];
        for (int k = 1; k <= reach; ++k) {
            float const weight = weights[k];
            global float const *restrict above = column + max(sourceY - k, 0) * rowsPitch;
            global float const *restrict below =
                column + min(sourceY + k, tile->height - 1) * rowsPitch;
            for (int i = 0; i < count; ++i)
                v[i] += weight * (above[i] + below[i]);
        }
        for (int i = 0; i < count; ++i)
            v[i] = max(original[i] + amount * (original[i] - v[i]), 0.0f);
    }
    if (tile->spots == 0) {
        for (int i = 0; i < count; ++i)
            v[i] *= gain;
    } else {
        // Where no spot adds anything the result must be that of a picture without spots.
        for (int p = 0; p < pixels; ++p) {
            float const added = stops[y * tile->targetWidth + first + p];
            float const pixelGain =
                added == 0.0f ? gain : exp2(clamp(tile->exposure + added, -100.0f, 100.0f));
            for (int c = 0; c < channels; ++c)
                v[p * channels + c] *= pixelGain;
        }
    }
    if (tile->hasMatrix) {
        for (int p = 0; p < pixels; ++p) {
            float *restrict pixel = v + p * channels;
            float const r = pixel[0], g = pixel[1], b = pixel[2];
            for (int c = 0; c < 3; ++c)
                pixel[c] = matrix[3 * c] * r + matrix[3 * c + 1] * g + matrix[3 * c + 2] * b;
        }
    }
    for (int i = 0; i < count; ++i)
        v[i] = max(v[i], 0.0f);
}

#if BITS == 8
ENCODE(encode8, uchar, CODE_OF_LIGHT)
#elif BITS == 16
ENCODE(encode16, ushort, CODE_OF_LIGHT)
#else
ENCODE(encode32, float, FLOAT_OF_LIGHT)
#endif
)";

} // namespace Develop
