// A layered drawing of a graph: nodes in columns, so that references lead to the right, except those that close a cycle.

/** The layer of each node: the length of the longest way to it. References that close a cycle do not count. */
function layersOf(nodeCount, references) {
    const layers = new Array(nodeCount).fill(0);
    const forward = references.filter((reference) => !reference.closesCycle && reference.from !== reference.to);
    const open = new Array(nodeCount).fill(0);
    forward.forEach((reference) => ++open[reference.to]);
    const ready = open.flatMap((count, node) => (count === 0 ? [node] : []));
    while (ready.length > 0) {
        const node = ready.shift();
        for (const {to} of forward.filter((reference) => reference.from === node)) {
            layers[to] = Math.max(layers[to], layers[node] + 1);
            if (--open[to] === 0) {
                ready.push(to);
            }
        }
    }
    return layers;
}

/** Orders the nodes of each layer by the mean place of their neighbours in the layer before and after, a few times. */
function orderLayers(layers, references) {
    const columns = Array.from({length: Math.max(0, ...layers) + 1}, () => []);
    layers.forEach((layer, node) => columns[layer].push(node));
    const places = new Array(layers.length).fill(0);
    const note = () => columns.forEach((column) => column.forEach((node, i) => { places[node] = i - column.length / 2; }));
    const mean = (node, side, other) => {
        const near = references.filter((reference) => reference[side] === node).map((reference) => places[reference[other]]);
        return near.length === 0 ? places[node] : near.reduce((sum, place) => sum + place, 0) / near.length;
    };
    note();
    for (let round = 0; round < 4; ++round) {
        const [side, other] = round % 2 === 0 ? ['to', 'from'] : ['from', 'to'];
        for (const column of columns) {
            const keys = new Map(column.map((node) => [node, mean(node, side, other)]));
            column.sort((left, right) => keys.get(left) - keys.get(right) || left - right);
        }
        note();
    }
    return columns;
}
