import { Camera } from "./camera.js";
import { draw, make, makeButton, part } from "./dom.js";
import { bundleWords, drawBundle, drawDots, drawGrid, drawItem, drawLabels, spotOf, spotWords } from "./mapmarks.js";
import { watchDrags } from "./drag.js";
import { MARKS } from "./words.js";

const CELL = 44;
const MOST_CELLS = 64;
const WAIT_FOR_MORE = 140;
const NEAR = 16;
/** By this part of what is in sight more is asked for on each side, so that little moves need nothing new. */
const BEYOND = 0.25;
const AXES_OF = { top: ["x", "z"], side: ["x", "y"] };

/** The view of the map: where things stand, from above or from the side. */
export class MapView {
    /**
     * @param {import("./state.js").PageState} page
     * @param {import("./notice.js").Notices} notices
     */
    constructor(page, notices) {
        Object.assign(this, { page, notices, view: "top", camera: new Camera() });
        Object.assign(this, { answer: null, dots: [], spots: [], at: -1, timer: 0 });
        this.svg = draw("svg", { id: "chart", role: "listbox", tabindex: "0", "aria-describedby": "map-keys" });
        this.tip = make("p", { class: "tip", "aria-hidden": "true", hidden: true });
        this.frame = make("div", { class: "map-frame" }, this.svg, this.tip, this.makeButtons());
        part("panel-map").append(this.makeBar(), this.frame, this.makeLegend());
        new ResizeObserver(() => this.resize()).observe(this.frame);
        this.listen();
        // A selection follows each step; what it shows is asked for first.
        page.addEventListener("session", () => (this.isStale = true));
        page.addEventListener("selection", () => this.follow());
        page.addEventListener("view", () => this.follow());
    }

    makeBar() {
        const select = make("select", { onchange: () => this.turn(select.value) },
            make("option", { value: "top" }, "from above"), make("option", { value: "side" }, "from the side"));
        return make("div", { class: "view-bar" }, make("label", {}, "Seen ", select),
            make("p", { id: "map-keys", class: "aside" },
                "Arrows or drag: move · + − or wheel: zoom · 0: all · , . : marks"));
    }

    makeButtons() {
        const button = (sign, name, act) => {
            const made = makeButton(sign, act, { title: name });
            made.setAttribute("aria-label", name);
            return made;
        };
        return make("div", { class: "map-buttons" }, button("+", "Zoom in", () => this.zoom(1.5)),
            button("−", "Zoom out", () => this.zoom(1 / 1.5)), button("⤢", "Show all", () => this.showAll()));
    }

    makeLegend() {
        const entry = (mark) => make("span", { class: `mark mark-${mark}` }, `${MARKS[mark].sign} ${MARKS[mark].word}`);
        const arrow = (side, words) => make("span", { class: `legend-arrow legend-${side}` }, `⟶ ${words}`);
        const arrows = make("span", {}, arrow("ours", "where ours has it"), arrow("theirs", "where theirs has it"));
        return make("p", { class: "legend" }, entry("added"), entry("removed"), entry("changed"),
            make("span", { class: "mark mark-moved" }, "■ moved"), this.page.session.total ? entry("open") : null,
            this.page.isComparison ? null : arrows, make("span", { class: "aside" }, "• unchanged"));
    }

    listen() {
        const { svg } = this;
        svg.addEventListener("wheel", (event) => {
            event.preventDefault();
            this.zoom(Math.exp(-event.deltaY / 400), [event.offsetX, event.offsetY]);
        }, { passive: false });
        watchDrags(svg, {
            begin: (event) => this.nearest(event),
            move: (right, down) => this.pan(right, down),
            click: (hit) => hit && this.choose(hit),
        });
        svg.addEventListener("pointermove", (event) => this.hover(event));
        svg.addEventListener("pointerleave", () => (this.tip.hidden = true));
        svg.addEventListener("keydown", (event) => this.press(event));
    }

    resize() {
        const { clientWidth, clientHeight } = this.svg;
        if (!clientWidth || (clientWidth === this.camera.width && clientHeight === this.camera.height)) return;
        const isFirst = this.camera.width === 1;
        Object.assign(this.camera, { width: clientWidth, height: clientHeight });
        if (isFirst && this.answer) this.showAll();
        else this.changed();
    }

    /** Brings the map up to date, and the selected object into sight. */
    async follow() {
        const { page } = this;
        if (page.view !== "map") return;
        this.resize();
        if (!this.answer || this.scene !== page.scene) await this.loadAll();
        else if (this.isStale) await this.load();
        this.isStale = false;
        await this.findSelected();
        this.render();
    }

    async turn(view) {
        this.view = view;
        await this.loadAll();
        await this.findSelected();
        this.render();
    }

    async loadAll() {
        this.scene = this.page.scene;
        await this.ask({});
        this.fitAll();
        this.render();
    }

    load() {
        const [x0, y0, x1, y1] = this.camera.box(BEYOND);
        return this.ask({ x0, y0, x1, y1 });
    }

    /** As many as there is room for bundles beside each other. */
    countCells() {
        return Math.min(MOST_CELLS, Math.max(8, Math.round((this.camera.width * (1 + 2 * BEYOND)) / CELL)));
    }

    async ask(box) {
        const query = { scene: this.page.scene, view: this.view, cells: this.countCells(), ...box };
        const asked = (this.asked = this.page.source.get("map", query));
        const answer = await asked.catch((failure) => {
            this.notices.alert(`The map can't be shown: ${failure.message}`);
            return null;
        });
        if (answer && asked === this.asked) this.answer = answer;
    }

    /** The selected object, or the place whose component it is. */
    async findSelected() {
        const { page } = this;
        const object = page.object ? await page.objectAt(page.scene, page.object).catch(() => null) : null;
        const ids = object ? [object.id, ...object.way.map(({ id }) => id).reverse()] : [];
        const items = this.answer?.items ?? [];
        this.selected = ids.map((id) => items.find((item) => item.id === id)).find(Boolean)?.id ?? null;
        const item = items.find(({ id }) => id === this.selected);
        if (!item || this.camera.sees(spotOf(item))) return;
        [this.camera.x, this.camera.y] = spotOf(item);
        this.changed();
    }

    fitAll() {
        if (this.answer?.bounds) this.camera.fit(this.answer.bounds);
    }

    showAll() {
        this.fitAll();
        this.changed();
    }

    zoom(factor, at) {
        this.camera.zoom(factor, at);
        this.changed();
    }

    /** Draws what is known of the new view, and asks for the rest when it has come to rest. */
    changed() {
        if (!this.frameAsked) this.frameAsked = requestAnimationFrame(() => this.render());
        clearTimeout(this.timer);
        this.timer = setTimeout(() => this.load().then(() => this.render()), WAIT_FOR_MORE);
    }

    render() {
        cancelAnimationFrame(this.frameAsked);
        this.frameAsked = 0;
        if (!this.answer || this.page.view !== "map") return;
        const { camera, answer, page } = this;
        const items = answer.items.filter(spotOf);
        const isDot = (item) => item.mark === "same" && !item.open && item.id !== this.selected;
        const touched = items.filter((item) => !isDot(item));
        this.dots = items.filter(isDot);
        this.spots = [...answer.bundles.map((bundle) => ({ bundle, place: [bundle.x, bundle.y] })),
            ...touched.map((item) => ({ item, place: spotOf(item) }))];
        const marks = this.spots.map(({ item, bundle }, at) => bundle ? drawBundle(bundle, camera, `spot-${at}`)
            : drawItem(item, camera, `spot-${at}`, spotWords(item, page.isComparison)));
        const labels = drawLabels(touched, this.spots, camera);
        this.moving = draw("g", {}, drawDots(this.dots, camera), ...marks, ...labels);
        this.svg.replaceChildren(drawGrid(camera, AXES_OF[this.view]), this.moving);
        this.svg.setAttribute("aria-label", `Map seen ${this.view === "top" ? "from above" : "from the side"}`);
        this.markSelected();
    }

    markSelected() {
        const at = this.spots.findIndex(({ item }) => item && item.id === this.selected);
        if (at >= 0) this.ring(at, "selected");
        if (at >= 0) this.svg.querySelector(`#spot-${at}`).setAttribute("aria-selected", "true");
        if (this.at >= 0 && this.at < this.spots.length) this.reach(this.at);
    }

    ring(at, name) {
        const [left, top] = this.camera.toScreen(this.spots[at].place);
        this.svg.querySelector(`.ring-${name}`)?.remove();
        const r = name === "selected" ? 17 : 21;
        this.moving.append(draw("circle", { class: `ring ring-${name}`, cx: left, cy: top, r }));
    }

    /** Brings the keyboard to a mark. */
    reach(at) {
        this.at = at;
        this.ring(at, "reached");
        this.svg.setAttribute("aria-activedescendant", `spot-${at}`);
    }

    step(direction) {
        const seen = this.spots.map((spot, at) => ({ ...spot, at })).filter(({ place }) => this.camera.sees(place));
        if (!seen.length) return;
        const now = seen.findIndex(({ at }) => at === this.at);
        const next = seen[(now + direction + seen.length) % seen.length] ?? seen[0];
        this.reach(next.at);
        this.notices.happened(next.bundle ? bundleWords(next.bundle) : spotWords(next.item, this.page.isComparison));
    }

    /** Selects an object, or opens a bundle. */
    choose({ item, bundle }) {
        if (item) return this.page.selectObject(this.page.scene, item.id);
        const [west, south, east, north] = bundle.box;
        if (west === east && south === north) this.camera.zoom(4, this.camera.toScreen([west, south]));
        else this.camera.fit(bundle.box);
        return this.changed();
    }

    press(event) {
        if (event.ctrlKey || event.altKey || event.metaKey) return;
        const far = event.shiftKey ? 240 : 60;
        const acts = {
            ArrowLeft: () => this.pan(far, 0), ArrowRight: () => this.pan(-far, 0), ArrowUp: () => this.pan(0, far),
            ArrowDown: () => this.pan(0, -far), "+": () => this.zoom(1.5), "=": () => this.zoom(1.5),
            "-": () => this.zoom(1 / 1.5), 0: () => this.showAll(), ",": () => this.step(-1), ".": () => this.step(1),
            Enter: () => this.spots[this.at] && this.choose(this.spots[this.at]),
        };
        if (!acts[event.key]) return;
        event.preventDefault();
        acts[event.key]();
    }

    pan(right, down) {
        this.camera.pan(right, down);
        this.changed();
    }

    nearest(event) {
        const away = ({ place }) => {
            const [left, top] = this.camera.toScreen(place);
            return Math.hypot(left - event.offsetX, top - event.offsetY);
        };
        const closest = (spots) => spots.reduce((best, spot) => {
            const distance = away(spot);
            return distance < (best?.distance ?? NEAR) ? { ...spot, distance } : best;
        }, null);
        return closest(this.spots) ?? closest(this.dots.map((item) => ({ item, place: spotOf(item) })));
    }

    hover(event) {
        const spot = event.buttons ? null : this.nearest(event);
        this.tip.hidden = !spot;
        if (!spot) return;
        this.tip.textContent = spot.bundle ? bundleWords(spot.bundle) : spotWords(spot.item, this.page.isComparison);
        this.tip.style.left = `${Math.min(event.offsetX + 14, this.camera.width - 200)}px`;
        this.tip.style.top = `${event.offsetY + 14}px`;
    }
}
