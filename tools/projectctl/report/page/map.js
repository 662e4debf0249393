// The map: its controls, zoom by click and keyboard, and the path under the pointer.

class ProjectMap {
    /** @param onZoom called with the folder in focus after each change of the map. */
    constructor(model, tree, onZoom) {
        this.model = model;
        this.tree = tree;
        this.onZoom = onZoom;
        this.colourings = colouringsOf(model);
        this.focus = 0;
        this.selected = null;
        this.hovered = null;
        this.canvas = byId('mapCanvas');
        this.drawing = new MapDrawing(this.canvas, tree);
        this.redrawLater = oncePerFrame(() => this.redraw());
        this.fillControls();
        this.listen();
        this.choose(0);
    }

    fillControls() {
        const colour = byId('mapColour');
        colour.append(...this.colourings.map(({title}, i) => element('option', {value: i}, title)));
        colour.addEventListener('change', () => this.choose(Number(colour.value)));
        const measure = byId('mapMeasure');
        measure.append(...measures.map((word) => element('option', {value: word}, text(`Measure_${word}`))));
        measure.addEventListener('change', () => this.choose(Number(colour.value)));
    }

    choose(index) {
        this.colouring = this.colourings[index].create();
        this.measure = byId('mapMeasure').value;
        this.sums = this.tree.sumsOf(this.measure, this.colouring.showsRemoved);
        this.layouts = new Map(); // of the folders that were in focus
        this.shares = new GroupShares(this.tree, this.colouring, this.measure);
        this.zoomTo(this.focus);
    }

    zoomTo(node) {
        this.focus = node;
        this.hovered = null;
        this.layOut();
        this.select(null);
        this.showPath();
        this.onZoom(this);
    }

    /** The size that the map has on the page. */
    get size() {
        const frame = this.canvas.parentElement;
        return {width: Math.max(200, Math.round(frame.clientWidth)), height: Math.max(200, Math.round(frame.clientHeight))};
    }

    layOut() {
        const {width, height} = this.size;
        if (this.drawing.resize(width, height)) {
            this.layouts.clear();
        }
        if (!this.layouts.has(this.focus)) {
            this.layouts.set(this.focus, layOutMap(this.tree, this.sums.weights, this.focus, width, height));
        }
        this.root = this.layouts.get(this.focus);
    }

    /** Lays the map out for another size of its place. The selected node stays selected. */
    adaptSize() {
        const {width, height} = this.size;
        if (width === this.root.x1 && height === this.root.y1) {
            return;
        }
        const selected = this.selected?.data.node;
        this.hovered = null;
        this.layOut();
        this.select(this.root.children?.find((node) => node.data.node === selected) ?? null);
    }

    redraw() {
        this.drawing.draw(this.root, this.colouring, this.shares);
        if (this.hovered !== null) {
            this.drawing.outline(this.hovered, schemeColour('ink'), 1.5);
        }
        if (this.selected !== null) {
            this.drawing.outline(this.selected, schemeColour('accent'), 3);
        }
    }

    listen() {
        const {canvas} = this;
        canvas.addEventListener('pointermove', (event) => this.hover(event));
        canvas.addEventListener('pointerleave', () => this.leave());
        canvas.addEventListener('click', (event) => this.open(this.nodeUnder(event)));
        canvas.addEventListener('keydown', (event) => this.press(event));
        canvas.addEventListener('focus', () => this.select(this.selected ?? this.root.children?.[0] ?? null));
        new ResizeObserver(oncePerFrame(() => this.adaptSize())).observe(canvas.parentElement);
        matchMedia('(prefers-color-scheme: dark)').addEventListener('change', this.redrawLater);
        matchMedia('print').addEventListener('change', this.redrawLater);
    }

    nodeUnder(event) {
        const box = this.canvas.getBoundingClientRect();
        return nodeAt(this.root, event.clientX - box.left, event.clientY - box.top);
    }

    hover(event) {
        const node = this.nodeUnder(event);
        if (node !== this.hovered) {
            this.hovered = node;
            this.redrawLater();
        }
        this.showTip(node, event);
    }

    showTip(node, event) {
        const tip = byId('mapTip');
        tip.hidden = node === null;
        if (node !== null) {
            tip.replaceChildren(...this.description(node.data.node));
            const box = this.canvas.getBoundingClientRect();
            const x = event.clientX - box.left;
            const y = event.clientY - box.top;
            const isRight = x > box.width / 2;
            tip.style.left = isRight ? 'auto' : `${x + 14}px`;
            tip.style.right = isRight ? `${box.width - x + 14}px` : 'auto';
            tip.style.top = `${Math.min(y + 14, box.height - 60)}px`;
        }
    }

    leave() {
        this.hovered = null;
        byId('mapTip').hidden = true;
        this.redrawLater();
    }

    /** Zooms to a folder, or to the folder of a file. A file of the folder in focus is shown in the list. */
    open(node) {
        if (node === null) {
            return;
        }
        const id = node.data.node;
        const folder = this.tree.isFolder(id) ? id : this.tree.parent(id);
        if (folder !== this.focus) {
            this.zoomTo(folder);
        } else {
            location.hash = linkToPath(this.tree.path(id));
        }
    }

    press(event) {
        const directions = {
            ArrowLeft: {x: -1, y: 0}, ArrowRight: {x: 1, y: 0}, ArrowUp: {x: 0, y: -1}, ArrowDown: {x: 0, y: 1},
        };
        if (Object.hasOwn(directions, event.key) && this.selected !== null) {
            this.select(neighbour(this.root.children, this.selected, directions[event.key]));
        } else if (event.key === 'Enter' || event.key === ' ') {
            this.open(this.selected);
            this.select(this.root.children?.[0] ?? null);
        } else if ((event.key === 'Escape' || event.key === 'Backspace') && this.focus !== 0) {
            this.leaveFolder();
        } else if (event.key === 'Home') {
            this.zoomTo(0);
            this.select(this.root.children?.[0] ?? null);
        } else {
            return;
        }
        event.preventDefault();
    }

    /** Zooms to the folder above, and selects the one that was left. */
    leaveFolder() {
        const left = this.focus;
        this.zoomTo(this.tree.parent(left));
        this.select(this.root.children.find((node) => node.data.node === left) ?? null);
    }

    select(node) {
        this.selected = node;
        byId('mapHere').replaceChildren(...this.description(node === null ? this.focus : node.data.node));
        this.redraw();
    }

    /** The path of a node, its size, and its groups. */
    description(id) {
        const path = this.tree.path(id);
        const name = id === 0 ? element('bdi', {class: 'name'}, shownName(this.model.project.name) || text('WholeProject'))
                              : nameElement(path + (this.tree.isFolder(id) ? '/' : ''));
        return [name, element('span', {class: 'detail'}, ` · ${this.shownValue(id)} · ${this.shownGroups(id)}`)];
    }

    shownValue(id) {
        const value = this.sums.values[id];
        return this.measure === 'size' ? shownBytes(value) : text(`Value_${this.measure}`, value);
    }

    shownGroups(id) {
        const {groups} = this.colouring;
        if (!this.tree.isFolder(id)) {
            return this.colouring.groupsOf(id - 1).map((group) => isolated(groups[group].name)).join(', ');
        }
        const files = this.shares.filesIn(id);
        const counts = this.shares.countsIn(id);
        const shown = groups.map((group, i) => ({group, count: counts[i]})).filter(({count}) => count > 0)
            .sort((left, right) => right.count - left.count).slice(0, 3)
            .map(({group, count}) => `${isolated(group.name)} ${shownPercent(count / files)}`);
        return [text('FilesIn', files), ...shown].join(' · ');
    }

    showPath() {
        const steps = this.tree.ancestry(this.focus).map((node) => {
            const name = node === 0 ? text('WholeProject') : shownName(nameOfPath(this.tree.path(node)));
            return node === this.focus ? element('bdi', {'aria-current': 'location'}, name)
                : element('button', {type: 'button', onclick: () => this.zoomTo(node)}, element('bdi', {}, name));
        });
        byId('mapPath').replaceChildren(...steps);
    }
}
