// The list of files: it shows the entries that meet the conditions of the form, sorted by a column.

const mostPrintedRows = 500;

class FileTable {
    /** @param onOpen called with an entry that the user opens. */
    constructor(model, onOpen) {
        this.model = model;
        this.form = new FilterForm(model, (conditions) => this.show(conditions));
        const columns = [{title: text('Path'), sort: 'path'}, {title: text('Labels'), sort: 'labels'},
            {title: text('Size'), sort: 'size', isNumber: true}, {title: text('Lines'), sort: 'lines', isNumber: true}];
        if (model.changeOf !== null) {
            columns.push({title: text('Change'), sort: 'change'});
        }
        byId('fileList').classList.toggle('hasChanges', model.changeOf !== null);
        this.list = new VirtualList(byId('fileList'), text('Files'), columns, (entry) => this.cells(entry),
            (sort) => this.sortBy(sort), onOpen);
        addEventListener('beforeprint', () => this.prepareForPrint());
        addEventListener('afterprint', () => this.show(this.form.conditions));
    }

    show(conditions) {
        const found = findEntries(this.model, conditions);
        this.sort(found, conditions.sort);
        this.list.show(found);
        this.list.showSort(conditions.sort);
        this.showCount(found.length);
    }

    showCount(count) {
        byId('filesCount').textContent = text('EntriesFound', count, this.total);
    }

    get total() {
        this.knownTotal ??= findEntries(this.model, noConditions()).length;
        return this.knownTotal;
    }

    sortBy(sort) {
        this.form.update({sort: this.form.conditions.sort === sort ? `-${sort}` : sort});
    }

    /** By a column; equal entries stay in the order of `list`, which is that of the paths. */
    sort(entries, sort) {
        const {model} = this;
        const column = sort.replace(/^-/u, '');
        const sign = sort.startsWith('-') ? -1 : 1;
        const keys = {
            path: (entry) => entry,
            size: (entry) => model.sizes[entry],
            lines: (entry) => model.lines[entry],
            change: (entry) => model.changeOf?.[entry] ?? 0,
            labels: (entry) => this.labelRank(entry),
        };
        if (sort !== 'path' && Object.hasOwn(keys, column)) {
            entries.sort((left, right) => sign * (keys[column](left) - keys[column](right)) || left - right);
        }
    }

    /** The place of an entry's labels among all sets of labels, by their shown texts. */
    labelRank(entry) {
        if (this.ranks === undefined) {
            const texts = this.model.labelSets.map((set) =>
                set.map((label) => shownLabel(this.model, label)).join(', '));
            const sorted = texts.map((_, i) => i).sort((left, right) => texts[left].localeCompare(texts[right]));
            this.ranks = new Map(sorted.map((set, rank) => [set, rank]));
        }
        return this.ranks.get(this.model.labelSetOf[entry]);
    }

    cells(entry) {
        const {model} = this;
        const isFolder = model.isFolder[entry] === 1;
        const path = nameElement(model.paths[entry] + (isFolder ? '/' : ''),
            {class: isFolder ? 'name folder' : 'name', title: shownName(model.paths[entry])});
        const marks = model.isEntryPoint[entry] ? [element('span', {class: 'mark'}, text('EntryPoint'))] : [];
        const labels = element('span', {class: 'labels'}, ...model.labelsOf(entry).map((label) =>
            element('bdi', {class: 'label', title: shownLabel(model, label)}, shownName(labelName(model, label)))));
        const result = [element('span', {class: 'path'}, path, ...marks), labels,
            isFolder ? '' : shownBytes(model.sizes[entry]), isFolder ? '' : shownNumber(model.lines[entry])];
        if (model.changeOf !== null) {
            result.push(model.changeOf[entry] === 0 ? '' : text(`Change_${changeWords[model.changeOf[entry]]}`));
        }
        return result;
    }

    prepareForPrint() {
        const count = this.list.drawForPrint(mostPrintedRows);
        if (count < this.list.items.length) {
            byId('filesCount').textContent = text('FirstOf', count, this.list.items.length);
        }
    }
}
