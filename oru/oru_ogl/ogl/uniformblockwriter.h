// Puts the values of a uniform block where the implementation wants them.
#pragma once

#include "oru/oru_ogl/ogl/uniformblock.h"

#include <cstdint>
#include <initializer_list>
#include <type_traits>

namespace ORU::OGL {

class Buffer;

/// The values of one uniform block, in memory, on their way to a buffer.
///
/// Values are set by the member's name, or by UniformBlock::Member, which saves the search. Each
/// setter throws InternalException for a member of another type (a float for an int, say), for
/// values that are not whole elements, and for elements that the member does not have. What was
/// never set is 0. No GL call is made but by `upload()`.
class ORU_API UniformBlockWriter {
public:
    /// Zeros. @param block is copied
    explicit UniformBlockWriter(UniformBlock const &block);

    /// The layout.
    UniformBlock const &block() const { return block_; }

    /// @name One number
    /// @{

    /// Sets a float.
    template<class Key>
    void set(Key const &member, float value) {
        put(find(member), FLOAT, &value, 1, 0);
    }
    /// Sets a double.
    template<class Key>
    void set(Key const &member, double value) {
        put(find(member), DOUBLE, &value, 1, 0);
    }
    /// Sets an int, or a bool, for which 0 is false.
    template<class Key>
    void set(Key const &member, int value) {
        put(find(member), INT, &value, 1, 0);
    }
    /// Sets a uint, or a bool, for which 0 is false.
    template<class Key>
    void set(Key const &member, unsigned int value) {
        put(find(member), UNSIGNED, &value, 1, 0);
    }
    /// Sets a bool, or an int.
    template<class Key>
    void set(Key const &member, bool value) {
        set(member, value ? 1 : 0);
    }
    /// @}

    /// @name Vectors, matrices, arrays
    /// Of floats, doubles, ints and unsigned ints; several bools are given as ints. Vectors lie one
    /// after the other without gaps, and so do the columns of a matrix, however the
    /// block has them.
    /// @{

    /// All numbers at once: `set("colour", {1.f, 0.f, 0.f, 1.f})`.
    /// @param first the array's element that the first of them belongs to
    template<class Key, class Number>
    void set(Key const &member, std::initializer_list<Number> numbers, unsigned int first = 0) {
        UniformBlock::Member const &found = find(member);
        putNumbers(found, KindOf(Number()), numbers.begin(), numbers.size(), first);
    }

    /// Elements of an array, or the one of a vector or matrix.
    /// @param values numbers of one element after those of the other
    /// @param count how many elements
    /// @param first the array's element that the first of them is
    template<class Key, class Number>
    void set(Key const &member, Number const *values, unsigned int count, unsigned int first = 0) {
        put(find(member), KindOf(Number()), values, count, first);
    }
    /// @}

    /// The block as a buffer is to have it: `block().size()` bytes.
    std::vector<unsigned char> const &bytes() const { return bytes_; }

    /// Writes the whole block into a buffer; what was bound to its target stays bound.
    /// @param offset bytes before it; see UniformBlock::OffsetAlignment
    /// @throws InternalException while the buffer is mapped, or when the block does not fit
    /// @note glGetIntegerv, glBindBuffer, glBufferSubData
    void upload(Buffer &buffer, std::int64_t offset = 0) const;

private:
    enum Kind : unsigned char { FLOAT, DOUBLE, INT, UNSIGNED };

    static constexpr Kind KindOf(float) { return FLOAT; }
    static constexpr Kind KindOf(double) { return DOUBLE; }
    static constexpr Kind KindOf(int) { return INT; }
    static constexpr Kind KindOf(unsigned int) { return UNSIGNED; }
    template<class Number>
    static constexpr Kind KindOf(Number) {
        // Smaller numbers would be promoted, and read as ints from memory.
        static_assert(!std::is_same_v<Number, Number>,
                      "Give floats, doubles, ints or unsigned ints; several bools as ints.");
        return INT;
    }

    UniformBlock::Member const &find(std::string_view name) const { return block_.member(name); }
    static UniformBlock::Member const &find(UniformBlock::Member const &member) { return member; }

    void put(UniformBlock::Member const &member, Kind kind, void const *values, unsigned int count,
             unsigned int first);
    void putNumbers(UniformBlock::Member const &member, Kind kind, void const *numbers,
                    std::size_t amount, unsigned int first);

    UniformBlock block_;
    std::vector<unsigned char> bytes_;
};

} // namespace ORU::OGL
