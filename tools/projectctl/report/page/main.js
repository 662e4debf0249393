// Puts the page together.

function showSections() {
    const links = [...document.querySelectorAll('main > section')].filter((section) => !section.hidden)
        .map((section) => {
            const title = section.id === 'overview' ? text('Overview') : section.querySelector('h2').textContent;
            return element('a', {href: `#${section.id}`}, title);
        });
    byId('sections').append(...links);
}

function followLinks(model, files) {
    const follow = () => {
        if (location.hash.startsWith(linkBegin)) {
            files.form.set(conditionsOf(model, location.hash));
            byId('files').scrollIntoView();
        }
    };
    addEventListener('hashchange', follow);
    follow();
}

/** The tables that paper cannot unfold. */
function unfoldForPrint() {
    addEventListener('beforeprint', () => {
        document.querySelectorAll('details').forEach((details) => details.setAttribute('open', ''));
    });
}

function showPage() {
    const model = readModel();
    useTexts(model);
    const tree = new FolderTree(model);
    showOverview(model);
    showChanges(model);
    const map = new ProjectMap(model, tree, (zoomed) => {
        showLegend(zoomed);
        showShares(zoomed);
    });
    const files = new FileTable(model, (entry) => {
        map.zoomTo(model.isFolder[entry] ? entry + 1 : tree.parent(entry + 1));
        byId('map').scrollIntoView();
    });
    files.form.set(noConditions());
    showEntries(model);
    showReferences(model);
    showHistory(model);
    showSections();
    followLinks(model, files);
    unfoldForPrint();
    document.title = `${shownName(model.project.name) || text('NoName')} – ${text('ProjectReport')}`;
    document.documentElement.dataset.ready = 'true';
    return {model, map, files};
}

const shownPage = showPage();
