// Draws the laid-out map on its canvas.

class MapDrawing {
    constructor(canvas, tree) {
        this.canvas = canvas;
        this.tree = tree;
        this.context = canvas.getContext('2d');
        this.scale = 0;
    }

    /** Adapts the canvas to its size on the page. */
    resize(width, height) {
        this.scale = window.devicePixelRatio || 1;
        this.canvas.width = Math.round(width * this.scale);
        this.canvas.height = Math.round(height * this.scale);
        this.fills = new Fills(this.context, this.scale);
    }

    draw(root, colouring, shares) {
        const {context} = this;
        context.setTransform(this.scale, 0, 0, this.scale, 0, 0);
        this.frame = schemeColour('frame');
        this.ink = schemeColour('ink');
        context.fillStyle = schemeColour('surface');
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
        const {context} = this;
        context.strokeStyle = colour;
        context.lineWidth = width;
        context.strokeRect(node.x0 + width / 2, node.y0 + width / 2,
            node.x1 - node.x0 - width, node.y1 - node.y0 - width);
    }
}
