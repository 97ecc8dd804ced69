// The stages of developing a picture on the GPU.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/pass.h"

#include "oru/oru_ogl/ogl/texture2.h"

#include <memory>

namespace Develop {

/// What is done to a picture.
struct Recipe {
    double exposure = 0; ///< stops
};

/// Upload a picture, develop it, read it back:
///
///     developer.upload(photo);
///     developer.develop(recipe);
///     Image const result = developer.readBack();
///
/// Works on the context that was current when it was made.
class Developer {
public:
    Developer();

    /// Takes a picture to the GPU.
    void upload(App::Image const &photo);

    /// Computes the developed picture from the uploaded one. The GPU may still be at work
    /// afterwards.
    void develop(Recipe const &recipe);

    /// The developed picture, of the same kind as the uploaded one.
    App::Image readBack();

private:
    Pass pass_;
    App::Shape shape_;
    std::unique_ptr<ORU::OGL::Texture2D> photo_;
    std::unique_ptr<ORU::OGL::Texture2D> developed_;
};

} // namespace Develop
