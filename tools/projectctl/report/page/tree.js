// The folders of the project with the sums of their contents. Node 0 is the root, node i + 1 the entry i.

const measures = ['size', 'count', 'lines'];

class FolderTree {
    constructor(model) {
        this.model = model;
        this.nodeCount = model.count + 1;
        this.linkChildren();
        this.sums = new Map();
    }

    /** The children of all nodes, one after the other, in the order of `list`. */
    linkChildren() {
        const {parents, count} = this.model;
        this.begins = new Uint32Array(this.nodeCount + 1);
        for (let i = 0; i < count; ++i) {
            ++this.begins[parents[i] + 2];
        }
        for (let node = 1; node <= this.nodeCount; ++node) {
            this.begins[node] += this.begins[node - 1];
        }
        this.children = new Uint32Array(count);
        const next = this.begins.slice();
        for (let i = 0; i < count; ++i) {
            this.children[next[parents[i] + 1]++] = i + 1;
        }
    }

    childrenOf(node) {
        return this.children.subarray(this.begins[node], this.begins[node + 1]);
    }

    isFolder(node) {
        return node === 0 || this.model.isFolder[node - 1] === 1;
    }

    path(node) {
        return node === 0 ? '' : this.model.paths[node - 1];
    }

    parent(node) {
        return node === 0 ? -1 : this.model.parents[node - 1] + 1;
    }

    /** The nodes from the root to this one. */
    ancestry(node) {
        const result = [];
        for (let at = node; at >= 0; at = this.parent(at)) {
            result.unshift(at);
        }
        return result;
    }

    valueOf(measure, entry) {
        return measure === 'count' ? 1 : measure === 'lines' ? this.model.lines[entry] : this.model.sizes[entry];
    }

    /** The sums of a measure for all nodes, and the weights by which the map shows them: an empty file has a small
        place too. */
    sumsOf(measure, showsRemoved) {
        const key = `${measure} ${showsRemoved}`;
        if (!this.sums.has(key)) {
            this.sums.set(key, this.computeSums(measure, showsRemoved));
        }
        return this.sums.get(key);
    }

    computeSums(measure, showsRemoved) {
        const {model} = this;
        const values = new Float64Array(this.nodeCount);
        const weights = new Float64Array(this.nodeCount);
        for (let entry = model.count - 1; entry >= 0; --entry) {
            const isCounted = !model.isFolder[entry] && (showsRemoved || !model.isRemoved(entry));
            if (isCounted) {
                const value = this.valueOf(measure, entry);
                values[entry + 1] += value;
                weights[entry + 1] += Math.max(1, value);
            }
            values[model.parents[entry] + 1] += values[entry + 1];
            weights[model.parents[entry] + 1] += weights[entry + 1];
        }
        return {values, weights};
    }
}

/** How much each group of a colouring has in each folder: by number of files, and by weight on the map. A file in
    several groups counts in each, and its weight is divided between them. */
class GroupShares {
    constructor(tree, colouring, measure) {
        const {model} = tree;
        this.width = colouring.groups.length;
        this.rows = new Map([[0, 0]]);
        for (let entry = 0; entry < model.count; ++entry) {
            if (model.isFolder[entry]) {
                this.rows.set(entry + 1, this.rows.size);
            }
        }
        this.files = new Uint32Array(this.rows.size);
        this.counts = new Uint32Array(this.rows.size * this.width);
        this.weights = new Float64Array(this.rows.size * this.width);
        this.addFiles(tree, colouring, tree.sumsOf(measure, colouring.showsRemoved).weights);
    }

    addFiles(tree, colouring, weights) {
        const {model} = tree;
        for (let entry = model.count - 1; entry >= 0; --entry) {
            const parentRow = this.rows.get(model.parents[entry] + 1);
            if (parentRow === undefined) { // an entry below a file, which only a damaged project has
                continue;
            }
            if (model.isFolder[entry]) {
                this.addRow(this.rows.get(entry + 1), parentRow);
            } else if (colouring.showsRemoved || !model.isRemoved(entry)) {
                const groups = colouring.groupsOf(entry);
                ++this.files[parentRow];
                for (const group of groups) {
                    ++this.counts[parentRow * this.width + group];
                    this.weights[parentRow * this.width + group] += weights[entry + 1] / groups.length;
                }
            }
        }
    }

    addRow(from, to) {
        this.files[to] += this.files[from];
        for (let group = 0; group < this.width; ++group) {
            this.counts[to * this.width + group] += this.counts[from * this.width + group];
            this.weights[to * this.width + group] += this.weights[from * this.width + group];
        }
    }

    filesIn(node) {
        return this.files[this.rows.get(node)];
    }

    countsIn(node) {
        const row = this.rows.get(node) * this.width;
        return this.counts.subarray(row, row + this.width);
    }

    weightsIn(node) {
        const row = this.rows.get(node) * this.width;
        return this.weights.subarray(row, row + this.width);
    }
}
