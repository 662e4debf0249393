// The places of files and folders on the map.

const smallestShownArea = 14; // px² on average for the contents of a folder; below that, one tile stands for them
const headingHeight = 19;

function hasHeading(node) {
    return node.depth > 0 && node.x1 - node.x0 > 56 && node.y1 - node.y0 > 44;
}

/** The part of the tree that is large enough to be seen. @param area of the node in px². */
function visibleTree(tree, weights, node, area) {
    const children = tree.childrenOf(node).filter((child) => weights[child] > 0);
    const isTile = !tree.isFolder(node) && children.length === 0;
    if (isTile || children.length === 0 || area / children.length < smallestShownArea) {
        return {node, weight: weights[node], children: null};
    }
    const below = Array.from(children, (child) =>
        visibleTree(tree, weights, child, (area * weights[child]) / weights[node]));
    return {node, weight: 0, children: below};
}

/** Lays a folder out. @return the nodes of the hierarchy; `data.node` is the node of the tree. */
function layOutMap(tree, weights, focus, width, height) {
    const visible = visibleTree(tree, weights, focus, width * height);
    if (visible.children === null) { // the folder in focus is never a tile
        visible.children = Array.from(tree.childrenOf(focus).filter((child) => weights[child] > 0), (child) =>
            ({node: child, weight: weights[child], children: null}));
        visible.weight = 0;
    }
    const root = d3.hierarchy(visible)
        .sum((data) => data.weight)
        .sort((left, right) => right.value - left.value || left.data.node - right.data.node);
    return d3.treemap()
        .size([width, height])
        .round(true)
        .paddingInner((node) => (node.depth === 0 ? 3 : 1))
        .paddingOuter((node) => (hasHeading(node) ? 2 : 0))
        .paddingTop((node) => (hasHeading(node) ? headingHeight : 0))(root);
}

/** The innermost node at a point, or null. */
function nodeAt(root, x, y) {
    const isInside = (node) => node.x0 <= x && x < node.x1 && node.y0 <= y && y < node.y1;
    let found = null;
    let candidates = root.children ?? [];
    for (let next = candidates.find(isInside); next; next = candidates.find(isInside)) {
        found = next;
        candidates = next.children ?? [];
    }
    return found;
}

/** The sibling that is nearest in a direction, {x, y} of -1, 0 or 1; the node itself if there is none. */
function neighbour(siblings, from, direction) {
    const centre = (node) => [(node.x0 + node.x1) / 2, (node.y0 + node.y1) / 2];
    const [x, y] = centre(from);
    let best = from;
    let bestDistance = Infinity;
    for (const other of siblings) {
        const [otherX, otherY] = centre(other);
        const along = (otherX - x) * direction.x + (otherY - y) * direction.y;
        const across = Math.abs((otherX - x) * direction.y) + Math.abs((otherY - y) * direction.x);
        const distance = along + 2 * across;
        if (other !== from && along > 0.5 && distance < bestDistance) {
            best = other;
            bestDistance = distance;
        }
    }
    return best;
}
