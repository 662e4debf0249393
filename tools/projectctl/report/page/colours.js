// The colours of the map. The text on them is dark in both colour schemes.

const groupColours = ['#5b8fd9', '#c97333', '#4f9d69', '#a179cf', '#3b9aa3', '#cf6a94', '#98902f', '#cb6d5d'];
const noLabelColour = '#868d97';
const changeColours = {
    unchanged: '#868d97', added: '#4f9d69', removed: '#cb6d5d', labels: '#c97333', content: '#5b8fd9',
    renamed: '#a179cf',
};

const patternNames = ['plain', 'hatched', 'dotted'];

/** When the colours are used up, they are used again with a pattern. */
function colourOfGroup(index) {
    const round = Math.floor(index / groupColours.length);
    return {colour: groupColours[index % groupColours.length], pattern: patternNames[round % patternNames.length]};
}

function schemeColour(name) {
    return getComputedStyle(document.documentElement).getPropertyValue(`--${name}`).trim();
}

/** Fills for the canvas; patterns are created once for each scale. */
class Fills {
    constructor(context, scale) {
        this.context = context;
        this.scale = scale;
        this.known = new Map();
    }

    of(group) {
        if (group.pattern === 'plain') {
            return group.colour;
        }
        const key = group.colour + group.pattern;
        if (!this.known.has(key)) {
            this.known.set(key, this.createPattern(group));
        }
        return this.known.get(key);
    }

    createPattern(group) {
        const tile = document.createElement('canvas');
        const size = Math.round(8 * this.scale);
        tile.width = size;
        tile.height = size;
        const drawing = tile.getContext('2d');
        drawing.fillStyle = group.colour;
        drawing.fillRect(0, 0, size, size);
        drawing.fillStyle = 'rgb(13 17 23 / 35%)';
        drawing.strokeStyle = drawing.fillStyle;
        drawing.lineWidth = this.scale * 1.5;
        if (group.pattern === 'dotted') {
            drawing.arc(size / 2, size / 2, size / 5, 0, 2 * Math.PI);
            drawing.fill();
        } else {
            for (const offset of [-size, 0, size]) {
                drawing.moveTo(offset, size);
                drawing.lineTo(offset + size, 0);
            }
            drawing.stroke();
        }
        const result = this.context.createPattern(tile, 'repeat');
        result.setTransform(new DOMMatrix().scale(1 / this.scale));
        return result;
    }
}

/** A small picture of a group's colour and pattern. */
function swatch(group) {
    const box = svg('svg', {class: 'swatch', width: 14, height: 14, viewBox: '0 0 14 14', 'aria-hidden': 'true'},
        svg('rect', {width: 14, height: 14, rx: 3, fill: group.colour}));
    if (group.pattern === 'hatched') {
        box.append(svg('path', {d: 'M-2 9L9 -2M3 16L16 3', stroke: '#0d1117', 'stroke-opacity': 0.4, 'stroke-width': 2}));
    } else if (group.pattern === 'dotted') {
        box.append(svg('circle', {cx: 7, cy: 7, r: 2.5, fill: '#0d1117', 'fill-opacity': 0.4}));
    }
    return box;
}
