// Who deletes a GL name that was made elsewhere.
#pragma once

namespace ORU::OGL {

/// The last argument of the constructors that make an object over a GL name made elsewhere; one of
/// the two tags below.
///
/// ```cpp
/// Texture2D picture(name, borrow_name_tag());
/// ```
struct ownership_tag {
    constexpr explicit ownership_tag(bool owner) : isOwner(owner) {} ///< See `isOwner`.

    bool isOwner; ///< whether the object deletes the name
};

/// The object takes the name over, and deletes it as it would one of its own.
struct take_name_tag : ownership_tag {
    constexpr take_name_tag() : ownership_tag(true) {} ///< The object owns the name.
};

/// The name stays its owner's, who keeps it while the object is used.
struct borrow_name_tag : ownership_tag {
    constexpr borrow_name_tag() : ownership_tag(false) {} ///< It does not.
};

} // namespace ORU::OGL
