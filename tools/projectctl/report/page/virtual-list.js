// A list of any length, of which only the visible rows are in the document.

const rowHeight = 32;
const tallestList = 8000000; // px; browsers do not lay out much more
const spareRows = 8;

class VirtualList {
    /** @param columns {title, sort, isNumber}; @param createRow returns the cells' contents for an item.
        @param onSort called with the `sort` of a column; @param onOpen called with the index of a row. */
    constructor(place, label, columns, createRow, onSort, onOpen) {
        this.columns = columns;
        this.createRow = createRow;
        this.onOpen = onOpen;
        this.items = [];
        this.current = -1;
        this.rows = element('div', {class: 'rows', role: 'rowgroup'});
        this.heads = columns.map((column) => element('div', {role: 'columnheader', class: column.isNumber ? 'number' : null},
            element('button', {type: 'button', onclick: () => onSort(column.sort)}, column.title)));
        this.head = element('div', {class: 'row head', role: 'row', 'aria-rowindex': 1}, ...this.heads);
        this.grid = element('div', {
            class: 'grid', role: 'grid', tabindex: 0, 'aria-label': label, 'aria-colcount': columns.length,
        }, element('div', {role: 'rowgroup', class: 'headGroup'}, this.head), this.rows);
        const drawLater = oncePerFrame(() => this.draw());
        this.grid.addEventListener('scroll', drawLater);
        this.grid.addEventListener('keydown', (event) => this.press(event));
        this.rows.addEventListener('click', (event) => this.click(event));
        new ResizeObserver(drawLater).observe(this.grid);
        place.append(this.grid);
    }

    show(items) {
        this.items = items;
        this.current = -1;
        this.grid.scrollTop = 0;
        this.grid.setAttribute('aria-rowcount', items.length + 1);
        this.rows.style.height = `${Math.min(items.length * rowHeight, tallestList)}px`;
        this.draw();
    }

    showSort(sort) {
        this.columns.forEach((column, i) => {
            const order = sort === column.sort ? 'ascending' : sort === `-${column.sort}` ? 'descending' : 'none';
            this.heads[i].setAttribute('aria-sort', order);
        });
    }

    get room() {
        return Math.max(this.grid.clientHeight - this.head.offsetHeight, rowHeight);
    }

    /** The place in the list, in px, that is at the top. A list that is too tall is scrolled in proportion. */
    get offset() {
        const height = this.items.length * rowHeight;
        const factor = height > tallestList ? (height - this.room) / (tallestList - this.room) : 1;
        return this.grid.scrollTop * factor;
    }

    draw(count = Math.ceil(this.room / rowHeight)) {
        const {offset} = this;
        const first = Math.floor(offset / rowHeight);
        const from = Math.max(0, first - spareRows);
        const to = Math.min(this.items.length, first + count + spareRows);
        const shown = [];
        for (let row = from; row < to; ++row) {
            const place = this.rowElement(row);
            place.style.top = `${this.grid.scrollTop + row * rowHeight - offset}px`;
            shown.push(place);
        }
        this.rows.replaceChildren(...shown);
        this.grid.setAttribute('aria-activedescendant', this.current >= 0 ? `row${this.current}` : '');
    }

    rowElement(row) {
        const cells = this.createRow(this.items[row]).map((content, i) =>
            element('div', {role: 'gridcell', class: this.columns[i].isNumber ? 'number' : null}, content));
        return element('div', {
            class: row === this.current ? 'row current' : 'row', role: 'row', id: `row${row}`, 'data-row': row,
            'aria-rowindex': row + 2, 'aria-selected': row === this.current ? 'true' : 'false',
        }, ...cells);
    }

    press(event) {
        if (event.target !== this.grid) {
            return;
        }
        const page = Math.max(1, Math.floor(this.room / rowHeight) - 1);
        const last = this.items.length - 1;
        const steps = {
            ArrowDown: this.current + 1, ArrowUp: this.current - 1, PageDown: this.current + page,
            PageUp: this.current - page, Home: 0, End: last,
        };
        if (Object.hasOwn(steps, event.key)) {
            this.moveTo(Math.max(0, Math.min(last, steps[event.key])));
            event.preventDefault();
        } else if (event.key === 'Enter' && this.current >= 0) {
            this.onOpen(this.items[this.current]);
        }
    }

    click(event) {
        const row = event.target.closest('[data-row]');
        if (row !== null && event.target.closest('a') === null) {
            this.moveTo(Number(row.dataset.row));
        }
    }

    moveTo(row) {
        if (this.items.length === 0) {
            return;
        }
        this.current = row;
        const height = this.items.length * rowHeight;
        const factor = height > tallestList ? (tallestList - this.room) / (height - this.room) : 1;
        const top = row * rowHeight * factor;
        const bottom = ((row + 1) * rowHeight - this.room) * factor;
        if (this.grid.scrollTop > top) {
            this.grid.scrollTop = top;
        } else if (this.grid.scrollTop < bottom) {
            this.grid.scrollTop = Math.ceil(bottom);
        }
        this.draw();
    }

    /** For paper: the first rows, without scrolling. @return how many. */
    drawForPrint(most) {
        const count = Math.min(most, this.items.length);
        this.rows.replaceChildren(...Array.from({length: count}, (_, row) => this.rowElement(row)));
        this.rows.style.height = 'auto';
        return count;
    }
}
