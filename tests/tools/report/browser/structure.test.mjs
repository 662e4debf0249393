import assert from 'node:assert/strict';
import {readFileSync} from 'node:fs';
import {test} from 'node:test';
import {drawn, openPage, textOf, textsOf, useBrowser, withPage} from './browser.mjs';
import {createEngine, createProject, createRenamed, report} from './projects.mjs';

createEngine();
createRenamed();
const engine = report('engine');
const compared = report('engine', ['--compare', 'HEAD']);
createProject('empty', '', {});
createProject('tiny', 'Tiny', {'a.txt': 'x\n'});
useBrowser();

test('the overview has the name, the description, the counts and the last change', () => withPage(engine, {}, async (page) => {
    assert.equal(await textOf(page, 'h1'), 'Engine controller');
    assert.equal(await page.title(), 'Engine controller – Project report');
    assert.equal(await textOf(page, '#description'), 'Controls the pumps');
    assert.deepEqual((await textsOf(page, '#overview .counts dd')).map((count) => count.replace(/\s/u, ' ')),
        ['6', '4', '858 B', '172', '66.7%', '1', '1']);
    assert.match(await textOf(page, '#lastChange'), /Apr 1, 2026, by Ada: Second/u);
}));

test('each finding has a link that leads to what it is about', () => withPage(engine, {}, async (page) => {
    const findings = await textsOf(page, '.findings li .name');
    const links = await page.$$eval('.findings a', (all) => all.map((link) => link.getAttribute('href')));
    assert.equal(links.length, findings.length);
    const place = findings.findIndex((finding) => finding.includes('unknown.txt'));
    assert.equal(findings[place], 'On disk but not in the project: unknown.txt');
    assert.equal(links[place], '#filter=path=unknown.txt');
    for (const link of links.filter((target) => !target.startsWith('#filter='))) {
        assert.notEqual(await page.$(link), null, link);
    }
}));

test('the sections are headings, and the navigation leads to each', () => withPage(compared, {}, async (page) => {
    const sections = ['overview', 'changes', 'map', 'files', 'entries', 'references', 'history'];
    assert.deepEqual(await page.$$eval('#sections a', (links) => links.map((link) => link.getAttribute('href').slice(1))),
        sections);
    assert.deepEqual(await page.$$eval('main > section', (all) => all.map((section) => section.id)), sections);
}));

test('entry points are listed by their groups', () => withPage(engine, {}, async (page) => {
    assert.deepEqual(await textsOf(page, '#entriesContent caption'), ['Nightly']);
    assert.deepEqual(await textsOf(page, '#entriesContent td'), ['tools/clean.py', 'clean', 'Batch_Job', '']);
}));

test('the graph of references has layers, and marks cycles and missing projects', () => withPage(engine, {}, async (page) => {
    const nodes = await page.$$eval('.graph .node', (all) => all.map((node) => ({
        name: node.querySelector('.nodeName').textContent.replace(/[\u2068\u2069]/gu, ''),
        x: node.getBoundingClientRect().x, isMissing: node.classList.contains('missing'),
    })));
    assert.deepEqual(nodes.map((node) => node.name).sort(), ['Engine controller', 'The pump', 'The valve', 'gone']);
    const x = Object.fromEntries(nodes.map((node) => [node.name, node.x]));
    assert.ok(x['Engine controller'] < x['The pump'] && x['The pump'] < x['The valve'] && x['The valve'] < x.gone);
    assert.deepEqual(nodes.filter((node) => node.isMissing).map((node) => node.name), ['gone']);
    assert.equal((await page.$$('.graph .edge')).length, 4);
    assert.equal((await page.$$('.graph .edge.cycle')).length, 1);
    assert.deepEqual(await textsOf(page, '#referencesContent tbody td:last-child'),
        ['Sound', 'Sound', 'Closes a cycle', 'Missing folder']);
}));

test('the history counts files and labels in each revision', () => withPage(engine, {}, async (page) => {
    const rows = await page.$$eval('#historyContent tbody tr', (all) =>
        all.map((row) => [...row.cells].map((cell) => cell.textContent)));
    assert.deepEqual(rows.map((row) => [row[3], row[4], row[5], row[6]]),
        [['Second', '6', '4', '6'], ['First', '6', '4', '2']]);
    assert.equal((await page.$$('#historyContent figure')).length, 2);
    assert.deepEqual((await textsOf(page, '#historyContent figure:last-of-type .key li'))
        .map((title) => title.replace(/[\u2068\u2069]/gu, '')).sort(),
        ['Owner: Ada', 'Owner: Grace', 'Status: Open', 'Status: Reviewed']);
}));

test('a comparison shows the changes since the revision, on the map too', () => withPage(compared, {}, async (page) => {
    assert.match(await textOf(page, '#changesContent p'), /Compared with HEAD/u);
    assert.deepEqual(await textsOf(page, '#changesContent .counts dd'), ['1', '1', '1', '1', '0']);
    assert.deepEqual((await textsOf(page, '#changesContent tbody td')).map((cell) => cell.replace(/[\u2068\u2069]/gu, '')),
        ['src/main.cpp', 'Status: Open', 'Status: Reviewed']);
    assert.equal(await textOf(page, '#legendTitle'), 'Changes');
    const found = await page.evaluate(() => Object.fromEntries(['added', 'removed', 'labels', 'content'].map((change) =>
        [change, findEntries(shownPage.model, {...noConditions(), change}).map((entry) => shownPage.model.paths[entry])])));
    assert.deepEqual(found, {
        added: ['src/new.cpp'], removed: ['docs/old.md'], labels: ['src/main.cpp'], content: ['docs/readme.md'],
    });
    const listed = await page.evaluate(() => findEntries(shownPage.model, noConditions())
        .map((entry) => shownPage.model.paths[entry]));
    assert.ok(!listed.includes('docs/old.md'));
}));

test('a comparison shows renamed files and categories with their earlier names', () =>
    withPage(report('renamed', ['--compare', 'HEAD']), {}, async (page) => {
        const withoutMarks = (texts) => texts.map((cell) => cell.replace(/[\u2068\u2069]/gu, ''));
        assert.deepEqual(withoutMarks(await textsOf(page, '#changesContent caption')),
            ['Renamed files: 1 of 1', 'Other changes of the definition']);
        assert.deepEqual(withoutMarks(await textsOf(page, '#changesContent tbody td')),
            ['src/old.cpp', 'src/new.cpp', 'Category', 'Renamed', 'State, before: Status']);
        const found = await page.evaluate(() => findEntries(shownPage.model, {...noConditions(), change: 'renamed'})
            .map((entry) => shownPage.model.paths[entry]));
        assert.deepEqual(found, ['src/new.cpp']);
        assert.deepEqual(await page.evaluate(() => shownPage.model.paths),
            ['gone', 'gone/x.txt', 'src', 'src/main.cpp', 'src/new.cpp']);
        const folders = () => textsOf(page, '#sharesTable td:first-child');
        assert.deepEqual(await folders(), ['Whole project', 'gone', 'src']);
        await page.select('#mapColour', '1');
        assert.deepEqual(await folders(), ['Whole project', 'src']);
    }));

test('a project without a name, files and labels has a page too', () => withPage(report('empty'), {}, async (page) => {
    assert.equal(await textOf(page, 'h1'), '(without a name)');
    assert.equal(await textOf(page, '#filesCount'), '0 of 0 entries');
    assert.match(await textOf(page, '#referencesContent'), /no references/u);
}));

test('a project of one file has a page too', () => withPage(report('tiny'), {}, async (page) => {
    assert.equal(await textOf(page, '#filesCount'), '1 of 1 entries');
    assert.deepEqual(await page.evaluate(() => shownPage.map.root.leaves().length), 1);
}));

test('the page speaks the language of the tool, with a text for each place', async () => {
    const german = report('tiny', [], {LC_ALL: 'de_DE.UTF-8'});
    await withPage(german, {}, async (page) => {
        assert.equal(await page.$eval('html', (html) => html.lang), 'de');
        assert.deepEqual(await textsOf(page, '#sections a'),
            ['Überblick', 'Karte', 'Dateien', 'Einstiegspunkte und Gruppen', 'Verweise', 'Verlauf']);
    });
    for (const file of [german, compared]) {
        await withPage(file, {}, async (page) => {
            const unknown = await page.evaluate(() => {
                const known = new Set(Object.keys(pageTexts.texts));
                const places = [...document.querySelectorAll('[data-text],[data-label]')]
                    .map((place) => place.dataset.text ?? place.dataset.label);
                const called = [...document.scripts[2].textContent.matchAll(/\btext\('(\w+)'/gu)].map((match) => match[1]);
                return [...places, ...called].filter((key) => !known.has(key));
            });
            assert.deepEqual(unknown, []);
        });
    }
});

test('the policy of the page permits nothing but its own scripts and style', async () => {
    const page = await openPage(engine);
    const ran = await page.evaluate(async () => {
        const inline = document.createElement('script');
        inline.textContent = 'window.wasRun = true';
        document.body.append(inline);
        const handler = document.createElement('button');
        handler.setAttribute('onclick', 'window.wasRun = true');
        document.body.append(handler);
        handler.click();
        const loaded = await fetch('data:text/plain,x').then(() => true, () => false);
        return {wasRun: window.wasRun ?? false, loaded};
    });
    assert.deepEqual(ran, {wasRun: false, loaded: false});
    assert.ok(page.noises.every((noise) => noise.includes('Content Security Policy') || noise.includes('data:text/plain')));
    assert.doesNotMatch(readFileSync(engine, 'utf8'), /unsafe-(inline|eval)/u);
    await page.close();
});

test('paper gets all sections, the rows of the list, and light colours', () => withPage(engine, {scheme: 'dark'}, async (page) => {
    await page.emulateMediaType('print');
    await page.evaluate(() => dispatchEvent(new Event('beforeprint')));
    await drawn(page);
    const state = await page.evaluate(() => ({
        rows: document.querySelectorAll('.rows .row').length,
        background: getComputedStyle(document.body).backgroundColor,
        isFormShown: getComputedStyle(document.getElementById('filter')).display !== 'none',
        isTableOpen: [...document.querySelectorAll('details')].every((details) => details.open),
    }));
    assert.deepEqual(state, {rows: 10, background: 'rgb(255, 255, 255)', isFormShown: false, isTableOpen: true});
    assert.ok((await page.pdf()).length > 10000);
}));
