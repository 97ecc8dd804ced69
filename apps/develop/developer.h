// The developing of a picture's tiles.
#pragma once

#include "apps/common/image.h"
#include "apps/develop/band.h"
#include "apps/develop/codetables.h"
#include "apps/develop/colourspace.h"
#include "apps/develop/sharpener.h"
#include "apps/develop/spots.h"

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace Develop {

/// What is done to a picture.
struct Recipe {
    double exposure = 0; ///< stops
    Sharpening sharpening;
    std::vector<Spot> spots;
    std::optional<ColourSpace> convertTo; ///< another colour space than the photo's own
    int quality = 90;                     ///< of JPEG files, 1 to 100

    /// How far a pixel depends on others to each side.
    std::size_t reach() const;
};

/// A picture and what is done to it.
struct Task {
    /// @param space of the picture
    Task(App::Shape const &picture, ColourSpace const &space, Recipe const &recipe);

    App::Shape shape;
    CodeTables tables;
    std::optional<ColourMatrix> matrix; ///< of light, to another colour space
    Recipe const &recipe;
};

/// One way to develop. Memory of the GPU is kept from tile to tile and from picture to picture.
class Developer {
public:
    virtual ~Developer() = default;
    Developer(Developer const &) = delete;
    Developer &operator=(Developer const &) = delete;

    /// Which way it is and on what it runs, for people.
    virtual std::string description() const = 0;

    /// The largest side of a tile with what it depends on.
    virtual std::size_t sizeLimit() const = 0;

    /// Begins a picture.
    /// @param task lives until the picture is done
    virtual void begin(Task const &task) = 0;

    /// Computes the target's pixels from the source's. The work is done when this returns.
    virtual void develop(Band const &photo, Tile const &tile, Band &developed) = 0;

protected:
    Developer() = default;
};

} // namespace Develop
