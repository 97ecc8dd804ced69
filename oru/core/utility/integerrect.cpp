// A rectangle of whole pixels.
#include "oru/core/utility/integerrect.h"

#include "oru/core/utility/composetext.h"

#include <ostream>

namespace ORU {

void IntegerRect::translate(ambra::lumo::TVec2<int> const &d) {
    offset_.x += d.x;
    offset_.y += d.y;
}

std::string IntegerRect::toString() const {
    if (isEmpty())
        return "Empty";
    return ComposeText("[o=", "(", offset_.x, " ", offset_.y, ")", ", s=", size_, "]");
}

bool operator==(IntegerRect const &a, IntegerRect const &b) {
    return a.offset().x == b.offset().x && a.offset().y == b.offset().y && a.size() == b.size();
}

bool operator!=(IntegerRect const &a, IntegerRect const &b) {
    return !(a == b);
}

std::ostream &operator<<(std::ostream &os, IntegerRect const &rect) {
    return os << rect.toString();
}

} // namespace ORU
