// The developing of a picture's tiles.
#include "apps/develop/developer.h"

#include "apps/develop/gaussian.h"

namespace Develop {

std::size_t Recipe::reach() const {
    return sharpening.isOn() ? GaussianReach(sharpening.sigma) : 0;
}

Task::Task(App::Shape const &picture, ColourSpace const &space, Recipe const &howToDevelop)
    : shape(picture), tables(space, howToDevelop.convertTo.value_or(space), picture),
      recipe(howToDevelop) {
    if (recipe.convertTo && picture.channels >= 3)
        matrix = space.matrixTo(*recipe.convertTo);
}

} // namespace Develop
