.pragma library

/// How far away the eye is, in radii of what it looks at: near enough that depth shows.
const distance = 3.2

/// What is looked at: the middle and the radius of the markers, which the origin belongs to unless it is far away.
function bounds(markers) {
    let around = box(markers)
    const centre = around.centre
    if (Math.hypot(centre.x, centre.y, centre.z) < 2 * Math.max(around.radius, 10))
        around = box(markers.concat([{ x: 0, y: 0, z: 0 }]))
    return around
}

function box(points) {
    const low = { x: Infinity, y: Infinity, z: Infinity }
    const high = { x: -Infinity, y: -Infinity, z: -Infinity }
    for (const point of points) {
        for (const axis of ["x", "y", "z"]) {
            low[axis] = Math.min(low[axis], point[axis])
            high[axis] = Math.max(high[axis], point[axis])
        }
    }
    const none = points.length === 0
    const centre = {
        x: none ? 0 : (low.x + high.x) / 2,
        y: none ? 0 : (low.y + high.y) / 2,
        z: none ? 0 : (low.z + high.z) / 2
    }
    let radius = 10
    for (const point of points)
        radius = Math.max(radius, Math.hypot(point.x - centre.x, point.y - centre.y, point.z - centre.z))
    return { centre: centre, radius: radius, floor: none ? 0 : low.z }
}

/// A turntable: `turn` about the vertical axis z, seen from `elevation` above the horizon; both in radians.
function camera(around, turn, elevation, zoom, width, height) {
    return {
        centre: around.centre,
        radius: around.radius,
        sinTurn: Math.sin(turn),
        cosTurn: Math.cos(turn),
        sinElevation: Math.sin(elevation),
        cosElevation: Math.cos(elevation),
        /// Pixels for a mm in the plane through the middle.
        scale: 0.4 * Math.min(width, height) * zoom / around.radius,
        x: width / 2,
        y: height / 2
    }
}

/// Where a place shows. `depth` goes from -1, nearest, to 1 within the radius; `size` is 1 in the middle.
function project(eye, place) {
    const x = place.x - eye.centre.x
    const y = place.y - eye.centre.y
    const z = place.z - eye.centre.z
    const across = x * eye.cosTurn - y * eye.sinTurn
    const away = x * eye.sinTurn + y * eye.cosTurn
    const depth = (away * eye.cosElevation - z * eye.sinElevation) / eye.radius
    const up = z * eye.cosElevation + away * eye.sinElevation
    const size = distance / Math.max(0.2, distance + depth)
    return { x: eye.x + across * eye.scale * size, y: eye.y - up * eye.scale * size, depth: depth, size: size }
}

/// A length in mm, 1, 2 or 5 times a power of ten, that takes at most so many pixels.
function roundLength(pixels, scale) {
    const longest = pixels / scale
    const power = Math.pow(10, Math.floor(Math.log10(longest)))
    return power * (longest >= 5 * power ? 5 : longest >= 2 * power ? 2 : 1)
}

/// Moved so that its middle is that of the others.
function centredOn(points, others) {
    const from = box(points).centre
    const to = box(others).centre
    return points.map(point => ({ x: point.x - from.x + to.x, y: point.y - from.y + to.y, z: point.z - from.z + to.z }))
}
