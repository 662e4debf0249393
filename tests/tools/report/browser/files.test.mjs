import assert from 'node:assert/strict';
import {test} from 'node:test';
import {drawn, textOf, textsOf, useBrowser, withPage} from './browser.mjs';
import {createEngine, createHostile, report, tool} from './projects.mjs';

createEngine();
createHostile();
const pages = {engine: report('engine'), hostile: report('hostile')};
useBrowser();

const shownPaths = (page) => textsOf(page, '.rows .row .name');

/** What the tool lists, with names that are not valid UTF-8 as the page stores them. */
const listed = (project, args) => JSON.parse(tool(project, 'list', '--json', ...args)).files.map((file) => file.path);

const found = (page, link) => page.evaluate((hash) => {
    const conditions = conditionsOf(shownPage.model, hash);
    return {
        paths: findEntries(shownPage.model, conditions).map((entry) => shownPage.model.paths[entry]),
        unknown: conditions.unknown,
        command: commandOf(shownPage.model, conditions),
        link: linkOf(shownPage.model, conditions),
    };
}, link);

/** Conditions as options of the tool; the link has the same words. */
const questions = {
    engine: [
        [], ['--kind', 'file'], ['--kind', 'folder'], ['--label', 'Status'], ['--label', 'Status=Open'],
        ['--label', 'Status', '--label', 'Owner=Ada'], ['--no-label', 'Status=Open'], ['--no-label', 'Owner'],
        ['--entry-points'], ['--unlabelled', '--kind', 'file'], ['--glob', '*.cpp'], ['--glob', '**/*.cpp'],
        ['--glob', 'src/**'], ['--glob', '**/[a-m]*'], ['--glob', '**/[!a-m]*'], ['--glob', 'src/*/????.cpp'],
        ['--glob', '**'], ['--glob', '[src'], ['--glob', '**/io/**'], ['--glob', '\\s*/**'], ['src/io'],
        ['src', '--kind', 'file', '--no-label', 'Owner=Grace'], ['docs', 'tools'],
    ],
    hostile: [
        [], ['--label', '</option><script>'], ['--entry-points'], ['--glob', '**/<*>'], ['--glob', '*\n*'],
        ['--glob', '\\\\back'], ['--glob', 'bad???'], ['--glob', '?.md'], ['--glob', '[\u0600-\u06ff]*'], ['--glob', '%*'],
        ['<b>'], ['\u202efolder', '--unlabelled'],
    ],
};

const linkFor = (options) => {
    const parts = [];
    for (let i = 0; i < options.length; ++i) {
        const word = options[i].startsWith('--') ? options[i].slice(2) : 'path';
        const isFlag = ['entry-points', 'unlabelled'].includes(word);
        const value = isFlag ? '' : `=${encodeURIComponent(options[word === 'path' ? i : ++i])}`;
        parts.push(word + value);
    }
    return `#filter=${parts.join('&')}`;
};

for (const [project, cases] of Object.entries(questions)) {
    test(`the conditions find what list finds: ${project}`, () => withPage(pages[project], {}, async (page) => {
        let total = 0;
        for (const options of cases) {
            const answer = await found(page, linkFor(options));
            assert.deepEqual(answer.paths, listed(project, options), options.join(' '));
            assert.deepEqual(answer.unknown, []);
            total += answer.paths.length;
        }
        assert.ok(total > 50);
    }));
}

test('the shown command lists the same files', () => withPage(pages.engine, {}, async (page) => {
    for (const options of questions.engine) {
        const {command, paths, link} = await found(page, linkFor(options));
        const words = (await import('node:child_process')).execFileSync('bash',
            ['-c', `projectctl() { printf '%s\\0' "$@"; }; ${command}`]).toString().split('\0').slice(1, -1);
        assert.deepEqual(listed('engine', words), paths, command);
        assert.deepEqual((await found(page, link)).paths, paths, link);
    }
}));

test('a link carries the filter, the search and the order', () =>
    withPage(pages.engine, {hash: '#filter=kind=file&search=.cpp&sort=-size'}, async (page) => {
        assert.deepEqual(await shownPaths(page), ['src/main.cpp', 'src/io/pump.cpp', 'src/io/valve.cpp', 'src/new.cpp']);
        assert.equal(await page.$eval('#filterKind', (field) => field.value), 'file');
        assert.equal(await page.$eval('#filterLink', (link) => link.getAttribute('href')),
            '#filter=kind=file&search=.cpp&sort=-size');
        assert.equal(await textOf(page, '#filesCount'), '4 of 10 entries');
        await page.evaluate(() => { location.hash = '#filter=label=Status%3DOpen'; });
        await drawn(page);
        assert.deepEqual(await shownPaths(page), ['src/io/pump.cpp']);
        await page.click('#clearFilter');
        assert.equal(await textOf(page, '#filesCount'), '10 of 10 entries');
    }));

test('a link with a label that the project does not have says so', () =>
    withPage(pages.engine, {hash: '#filter=label=Nothing%3DHere'}, async (page) => {
        assert.match(await textOf(page, '.chips .fault'), /no label “Nothing=Here”/u);
    }));

test('the form searches, and sets each condition', () => withPage(pages.engine, {}, async (page) => {
    await page.type('#filterSearch', 'PUMP');
    assert.deepEqual(await shownPaths(page), ['src/io/pump.cpp']);
    await page.click('#clearFilter');
    await page.type('#filterGlob', '**/*.md');
    assert.deepEqual(await shownPaths(page), ['docs/readme.md']);
    await page.click('#clearFilter');
    await page.evaluate(() => {
        const select = document.getElementById('filterWithLabel');
        select.value = [...select.options].find((option) => option.textContent.includes('Open')).value;
        select.dispatchEvent(new Event('change'));
    });
    assert.deepEqual(await shownPaths(page), ['src/io/pump.cpp']);
    assert.equal(await textOf(page, '#filterCommand'), 'projectctl list --label Status=Open');
    await page.click('.chips button');
    await page.type('#filterBelowPath', 'src/io/\n');
    assert.deepEqual(await shownPaths(page), ['src/io/', 'src/io/pump.cpp', 'src/io/valve.cpp']);
    await page.click('#filterOnlyUnlabelled');
    assert.deepEqual(await shownPaths(page), ['src/io/']);
    await page.click('#clearFilter');
    await page.click('#filterOnlyEntryPoints');
    assert.deepEqual(await shownPaths(page), ['tools/clean.py']);
}));

test('a click on a heading sorts, and another one reverses the order', () => withPage(pages.engine, {}, async (page) => {
    await page.select('#filterKind', 'file');
    const heading = (title) => page.evaluate((wanted) => [...document.querySelectorAll('[role=columnheader] button')]
        .find((button) => button.textContent === wanted).click(), title);
    await heading('Lines');
    assert.deepEqual(await shownPaths(page),
        ['docs/readme.md', 'src/new.cpp', 'tools/clean.py', 'src/io/valve.cpp', 'src/io/pump.cpp', 'src/main.cpp']);
    assert.equal(await page.$eval('[role=columnheader]:nth-child(4)', (head) => head.getAttribute('aria-sort')), 'ascending');
    await heading('Lines');
    assert.equal((await shownPaths(page))[0], 'src/main.cpp');
    await heading('Labels');
    assert.deepEqual((await shownPaths(page)).slice(0, 3), ['src/new.cpp', 'tools/clean.py', 'docs/readme.md']);
}));

test('a short list is as high as its rows, and a long one scrolls', () => withPage(pages.hostile, {}, async (page) => {
    const heights = () => page.$eval('.grid', (grid) => ({shown: grid.clientHeight, all: grid.scrollHeight}));
    const long = await heights();
    assert.ok(long.shown < long.all && long.shown <= 640);
    await page.evaluate(() => shownPage.files.form.set({...noConditions(), search: 'מ'}));
    await drawn(page);
    const short = await heights();
    assert.equal(short.shown, short.all);
    assert.equal((await page.$$('.rows .row')).length, Math.round((short.shown - 38) / 32));
}));

test('the keyboard moves through the list, and shows a row on the map', () => withPage(pages.engine, {}, async (page) => {
    await page.focus('.grid');
    const current = () => textOf(page, '.row.current .name');
    await page.keyboard.press('ArrowDown');
    assert.equal(await current(), 'docs/');
    await page.keyboard.press('End');
    assert.equal(await current(), 'tools/clean.py');
    assert.equal(await page.$eval('.grid', (grid) => document.getElementById(grid.getAttribute('aria-activedescendant'))
        .getAttribute('aria-selected')), 'true');
    await page.keyboard.press('Home');
    await page.keyboard.press('PageDown');
    await page.keyboard.press('PageUp');
    assert.equal(await current(), 'docs/');
    await page.keyboard.press('Enter');
    assert.deepEqual(await textsOf(page, '#mapPath > *'), ['Whole project', 'docs']);
}));
