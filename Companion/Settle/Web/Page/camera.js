const MARGIN = 44;
const LEAST_SPAN = 1e-3;

/** What part of the scene the map shows. Units of the scene are `scale` pixels wide, and y grows to the north. */
export class Camera {
    constructor() {
        Object.assign(this, { width: 1, height: 1, x: 0, y: 0, scale: 1 });
    }

    /** @param {number[]} box west, south, east and north ends of what is to be in sight */
    fit([west, south, east, north]) {
        this.x = (west + east) / 2;
        this.y = (south + north) / 2;
        const across = Math.max(1, this.width - 2 * MARGIN) / Math.max(LEAST_SPAN, east - west);
        const upright = Math.max(1, this.height - 2 * MARGIN) / Math.max(LEAST_SPAN, north - south);
        const fitting = Math.min(across, upright);
        this.scale = east - west + north - south > 0 ? fitting : Math.min(fitting, this.width / 20);
    }

    /** Pixels from the top left corner. */
    toScreen([x, y]) {
        return [this.width / 2 + (x - this.x) * this.scale, this.height / 2 - (y - this.y) * this.scale];
    }

    toScene([left, top]) {
        return [this.x + (left - this.width / 2) / this.scale, this.y - (top - this.height / 2) / this.scale];
    }

    /** Shifts what is in sight by pixels. */
    pan(right, down) {
        this.x -= right / this.scale;
        this.y += down / this.scale;
    }

    /** Zooms by a factor; what is at that pixel stays there. */
    zoom(factor, [left, top] = [this.width / 2, this.height / 2]) {
        const [x, y] = this.toScene([left, top]);
        this.scale = Math.min(1e6, Math.max(1e-6, this.scale * factor));
        this.x = x - (left - this.width / 2) / this.scale;
        this.y = y + (top - this.height / 2) / this.scale;
    }

    /** The box that is in sight, wider by a part of it on all sides. */
    box(wider = 0) {
        const across = (this.width / 2 / this.scale) * (1 + 2 * wider);
        const upright = (this.height / 2 / this.scale) * (1 + 2 * wider);
        return [this.x - across, this.y - upright, this.x + across, this.y + upright];
    }

    /** Whether a point is in sight and not at the very edge. */
    sees(point) {
        const [left, top] = this.toScreen(point);
        return left > 30 && top > 30 && left < this.width - 30 && top < this.height - 30;
    }
}

/** The step between lines of a grid that stand some `pixels` apart: 1, 2 or 5 times a power of ten. */
export function gridStep(camera, pixels) {
    const wanted = pixels / camera.scale;
    const power = 10 ** Math.floor(Math.log10(wanted));
    return power * ([1, 2, 5].find((times) => times * power >= wanted) ?? 10);
}
