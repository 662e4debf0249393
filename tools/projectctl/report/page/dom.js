// Elements are created here only, and their content is always text.

const svgNamespace = 'http://www.w3.org/2000/svg';

function setAttributes(made, attributes) {
    for (const [name, value] of Object.entries(attributes)) {
        if (name.startsWith('on')) {
            made.addEventListener(name.slice(2), value);
        } else if (value === true) {
            made.setAttribute(name, '');
        } else if (value !== false && value !== null && value !== undefined) {
            made.setAttribute(name, value);
        }
    }
}

function withChildren(made, attributes, children) {
    setAttributes(made, attributes);
    made.append(...children.filter((child) => child !== null));
    return made;
}

/** An element with attributes, listeners (onclick) and children: elements and texts. */
function element(tag, attributes = {}, ...children) {
    return withChildren(document.createElement(tag), attributes, children);
}

function svg(tag, attributes = {}, ...children) {
    return withChildren(document.createElementNS(svgNamespace, tag), attributes, children);
}

/** A name or a path: isolated, so that its direction does not affect the text around it. */
function nameElement(name, attributes = {}) {
    return element('bdi', {class: 'name', ...attributes}, shownName(name));
}

function byId(id) {
    return document.getElementById(id);
}

/** A table. @param columns {title, isNumber}; @param rows lists of texts and elements. */
function table(caption, columns, rows) {
    const cell = (content, column) => element('td', {class: column.isNumber ? 'number' : null}, content);
    return element('table', {},
        element('caption', {}, caption),
        element('thead', {}, element('tr', {}, ...columns.map((column) =>
            element('th', {scope: 'col', class: column.isNumber ? 'number' : null}, column.title)))),
        element('tbody', {}, ...rows.map((row) =>
            element('tr', {}, ...row.map((content, i) => cell(content, columns[i]))))));
}

/** Calls a function at most once for each frame. */
function oncePerFrame(work) {
    let isPlanned = false;
    return () => {
        if (!isPlanned) {
            isPlanned = true;
            requestAnimationFrame(() => {
                isPlanned = false;
                work();
            });
        }
    };
}
