// Draws the laid-out map on its canvas.

class MapDrawing {
    constructor(canvas, tree) {
        this.canvas = canvas;
        this.tree = tree;
        this.shown = canvas.getContext('2d');
        this.picture = document.createElement('canvas');
        this.context = this.picture.getContext('2d');
        this.pictured = {};
        this.scale = 0;
    }

    /** Adapts the canvas to its size on the page. @return whether it has another size now. */
    resize(width, height) {
        const scale = window.devicePixelRatio || 1;
        const size = {width: Math.round(width * scale), height: Math.round(height * scale)};
        if (scale === this.scale && size.width === this.canvas.width && size.height === this.canvas.height) {
            return false;
        }
        this.scale = scale;
        Object.assign(this.canvas, size);
        Object.assign(this.picture, size);
        this.fills = new Fills(this.context, scale);
        this.pictured = {};
        return true;
    }

    /** Shows the map. Its picture is drawn once, and then copied before each outline. */
    draw(root, colouring, shares) {
        const [frame, ink, surface] = ['frame', 'ink', 'surface'].map(schemeColour);
        const wanted = {root, colouring, shares, frame, ink, surface};
        if (Object.keys(wanted).some((part) => wanted[part] !== this.pictured[part])) {
            Object.assign(this, {frame, ink});
            this.drawPicture(root, colouring, shares, surface);
            this.pictured = wanted;
        }
        this.shown.setTransform(1, 0, 0, 1, 0, 0);
        this.shown.drawImage(this.picture, 0, 0);
        this.shown.setTransform(this.scale, 0, 0, this.scale, 0, 0);
    }

    drawPicture(root, colouring, shares, surface) {
        const {context} = this;
        context.setTransform(this.scale, 0, 0, this.scale, 0, 0);
        context.fillStyle = surface;
        context.fillRect(0, 0, root.x1, root.y1);
        context.textBaseline = 'middle';
        context.direction = 'ltr';
        root.each((node) => {
            if (node.depth > 0) {
                node.children ? this.drawFolder(node) : this.drawTile(node, colouring, shares);
            }
        });
    }

    drawFolder(node) {
        const {context} = this;
        context.fillStyle = this.frame;
        context.fillRect(node.x0, node.y0, node.x1 - node.x0, node.y1 - node.y0);
        if (hasHeading(node)) {
            context.font = '600 11.5px system-ui, sans-serif';
            context.fillStyle = this.ink;
            this.drawName(node, node.x0 + 6, node.y0 + headingHeight / 2 + 0.5, node.x1 - node.x0 - 12);
        }
    }

    drawTile(node, colouring, shares) {
        const width = node.x1 - node.x0;
        const height = node.y1 - node.y0;
        if (width <= 0 || height <= 0) {
            return;
        }
        this.fillTile(node, colouring, shares);
        if (width > 40 && height > 15) {
            this.context.font = '11.5px system-ui, sans-serif';
            this.context.fillStyle = '#0d1117';
            this.drawName(node, node.x0 + 5, node.y0 + Math.min(height / 2, 11), width - 10);
        }
    }

    /** A tile shows the groups of its file, or the shares of the groups in its folder, beside each other. */
    fillTile(node, colouring, shares) {
        const {context} = this;
        const id = node.data.node;
        const isFolder = this.tree.isFolder(id);
        const weights = isFolder ? shares.weightsIn(id) : null;
        const groups = isFolder ? colouring.groups.map((_, i) => i).filter((i) => weights[i] > 0)
                                : colouring.groupsOf(id - 1);
        const total = isFolder ? groups.reduce((sum, group) => sum + weights[group], 0) : groups.length;
        const height = node.y1 - node.y0;
        let x = node.x0;
        for (const group of groups) {
            const width = ((node.x1 - node.x0) * (isFolder ? weights[group] : 1)) / total;
            context.fillStyle = this.fills.of(colouring.groups[group]);
            context.fillRect(x, node.y0, width, height);
            x += width;
        }
    }

    drawName(node, x, y, room) {
        const characters = Array.from(shownName(nameOfPath(this.tree.path(node.data.node))));
        let shown = characters.join('');
        const fits = (words) => this.context.measureText(words).width <= room;
        if (!fits(shown)) {
            let low = 0;
            let high = characters.length;
            while (low < high) {
                const middle = (low + high + 1) >> 1;
                fits(`${characters.slice(0, middle).join('')}…`) ? (low = middle) : (high = middle - 1);
            }
            shown = low < 3 ? '' : `${characters.slice(0, low).join('')}…`;
        }
        if (shown !== '') {
            this.context.fillText(isolated(shown), x, y);
        }
    }

    outline(node, colour, width) {
        const context = this.shown;
        context.strokeStyle = colour;
        context.lineWidth = width;
        context.strokeRect(node.x0 + width / 2, node.y0 + width / 2,
            node.x1 - node.x0 - width, node.y1 - node.y0 - width);
    }
}
